// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/result_nodes.h"

#include "results/geo_scene.h"
#include "wqpt/extractions.h"

namespace tervane {

namespace {

constexpr DetailedResultKvf::Kind kDetailedResult{"CResultDetailedTSKvf", "Tervane Detailed Time Series",
                                                  "ResultDetailedTS", kDetailedResultPage};
constexpr DetailedResultKvf::Kind kDetailedRiverResult{"CResultFvrDetailedTSKvf", "Detailed River Time Series",
                                                       "ResultFvrDetailedTS", kDetailedRiverResultPage};

}  // namespace

DetailedResultKvf::DetailedResultKvf(const Kind& kind, CYbSEKvfBase* parent)
    : ResultPageKvf(kind.title, kind.section, kind.page, parent) {
  SetClassName(kind.className);
}

CResultViewerKvf::CResultViewerKvf(CYbSEKvfBase* parent)
    : ResultPageKvf("Gridded Data Results Viewer", "ResultViewer", kResultViewerPage, parent) {}

void CResultViewerKvf::ExchangeKeys(KeyExchange& keys) { keys("LayerNo", LayerNo); }

CResultKvf::CResultKvf(CYbSEKvfBase* parent) : CYbSEKvfGroupBase("Simulation Results", "Result", parent) {
  NewChild<DetailedResultKvf>(kDetailedResult);
  NewChild<CResultViewerKvf>();
  NewChild<DetailedResultKvf>(kDetailedRiverResult);
  NewChild<CGeoScene3DKvf>(CGeoScene3DKvf::kOfResults);
}

CRunStatisticsKvf::CRunStatisticsKvf(CYbSEKvfBase* parent)
    : ResultPageKvf("Simulation Statistics", "RunStatistics", kRunStatisticsPage, parent) {}

void CRunStatisticsKvf::ExchangeKeys(KeyExchange& keys) {
  keys("HtmlFilename", HtmlFilename);
  keys("ShapeFilename", ShapeFilename);
}

CResultsPostProcessingKvf::CResultsPostProcessingKvf(CYbSEKvfBase* parent)
    : CYbSEKvfGroupBase("Post-Processing", "Results_Post_Processing", parent) {
  NewChild<CRunStatisticsKvf>();
  NewChild<CResultsPTRegExtractionKvf>();
  NewChild<CResultsPTPathlineExtractionKvf>();
}

}  // namespace tervane
