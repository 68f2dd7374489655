// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/global.h"

#include <algorithm>
#include <array>
#include <string_view>

#include "core/doc_version.h"
#include "document/coverage_board.h"
#include "document/overview.h"
#include "document/saturated_zone_reload.h"
#include "document/view_settings.h"
#include "execution/execute_flags.h"
#include "execution/processed_data.h"
#include "overlays/overlays.h"
#include "simspec/basic_parameters.h"
#include "simspec/extra_params.h"
#include "simspec/introduction.h"
#include "simspec/model_components.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "spatial/zones.h"
#include "surface/climate.h"

namespace tervane {

namespace {

/// A child of the root: the order of the rows is the order of the sections in the file.
struct ChildRow {
  CYbSEKvfBase* (*make)(CGlobal& root);
  std::string_view importantName;  ///< Empty: nobody looks the node up.
};

template <class Node>
CYbSEKvfBase* Make(CGlobal& root) {
  return root.NewChild<Node>();
}

constexpr std::array kChildren{
    ChildRow{Make<CFlowModelDocVersionKvf>, "DOCVERSION"},
    ChildRow{Make<CViewSettingsKvf>, "VIEWSETTINGS"},
    ChildRow{Make<CIntroductionKvf>, ""},
    ChildRow{Make<COverlaysKvf>, "OVERLAY_DATA"},
    ChildRow{Make<CBasicParaKvf>, "BASICPARAMETERS"},
    ChildRow{Make<CModelCompWQKvf>, "MODEL_COMP_WQ"},
    ChildRow{Make<CModelCompPTKvf>, "MODEL_COMP_PT"},
    ChildRow{Make<CCatchmentKvf>, "CATCHMENT"},
    ChildRow{Make<CSubcatchmentKvf>, "SUBCATCHMENT"},
    ChildRow{Make<CTopographyKvf>, "TOPOGRAPHY"},
    ChildRow{Make<CPrecipitationRelatedKvf>, "PRECIPITATIONRELATED"},
    ChildRow{Make<CEvapotransKvf>, "Evapotrans"},
    ChildRow{Make<CDummySatZoneKvf>, ""},
    ChildRow{Make<CExtraParamsKvf>, ""},
    ChildRow{Make<CExecuteEngineFlagsKvf>, "EXECUTE_ENGINE_FLAGS"},
    ChildRow{Make<CProcDataKvf>, "PROCESSED_DATA"},
    ChildRow{Make<COverviewKvf>, "OVERVIEW"},
    ChildRow{Make<CCoverageKvf>, "COVERAGE"},
};

// The reading order, in important names; a name that no node bears is passed over.

/// Read behind all others, in this order: species must stand before everything that keeps a list per species.
constexpr std::array<std::string_view, 3> kReadBehind{"SPECIES_LIST", "PROCESSESWQ", "Overland"};
/// Read behind those.
constexpr std::string_view kUnsaturatedZone = "Unsatzone";
/// Read at its place, which sizes its lists of layers, and once more when species and processes are known.
constexpr std::string_view kSaturatedZone = "SATZONE";
/// In files of version 1 read by the basic parameters, inside their section.
constexpr std::string_view kStoringResults = "STORINGRESULTS";
/// Read from old files and never written.
constexpr std::string_view kRetired = "Evapotrans";

}  // namespace

CGlobal::CGlobal() : CTvnKvfGlobalBase("TERVANE_FLOWMODEL") {
  for (const ChildRow& row : kChildren) {
    CYbSEKvfBase* child = row.make(*this);
    if (!row.importantName.empty()) RegisterImportantNode(child, row.importantName);
  }
}

int CGlobal::ReadDocVersion() const {
  const auto* version = Important<CFlowModelDocVersionKvf>("DOCVERSION");
  return version ? version->ReadVersion : -1;
}

void CGlobal::Load(KvfNode* parentSection) {
  KvfNode* target = kvfSectionByNameNum(parentSection, GetTargetName(), 1);

  for (CYbSEKvfBase* child = GetFirstChild(); child; child = GetNextChild(child)) {
    const bool isReadBehind = std::any_of(kReadBehind.begin(), kReadBehind.end(),
                                          [&](std::string_view name) { return child == GetImportantNode(name); }) ||
                              child == GetImportantNode(kUnsaturatedZone);
    // From the second child on the version of the file is known.
    const bool wasReadBefore = child == GetImportantNode(kStoringResults) && ReadDocVersion() == 1;
    if (!isReadBehind && !wasReadBefore) child->Load(target);
  }
  for (const std::string_view name : kReadBehind)
    if (CYbSEKvfBase* node = GetImportantNode(name)) node->Load(target);
  if (CYbSEKvfBase* node = GetImportantNode(kUnsaturatedZone)) node->Load(target);
  if (CYbSEKvfBase* node = GetImportantNode(kSaturatedZone)) ReloadSaturatedZone(*node, target);

  if (auto retired = RemoveChild(GetImportantNode(kRetired))) retired_.push_back(std::move(retired));
}

}  // namespace tervane
