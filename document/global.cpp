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
#include "results/geo_scene.h"
#include "results/result_nodes.h"
#include "results/storing.h"
#include "simspec/basic_parameters.h"
#include "simspec/extra_params.h"
#include "simspec/introduction.h"
#include "simspec/model_components.h"
#include "simspec/modflow_output.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "spatial/zones.h"
#include "subsurface/reservoirs.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/unsaturated_zone.h"
#include "surface/climate.h"
#include "surface/land_use.h"
#include "surface/overland.h"
#include "surface/rivers.h"
#include "wqpt/kinetra_specification.h"
#include "wqpt/processes.h"
#include "wqpt/sources.h"

namespace tervane {

namespace {

/// A child of the root: the order of the rows is the order of the sections in the file.
struct ChildRow {
  void (*make)(CGlobal& root, std::string_view name);
  std::string_view name;  ///< Under which others find it; empty where nobody looks it up.
};

template <class Node>
void Make(CGlobal& root, std::string_view name) {
  CYbSEKvfBase* child = root.NewChild<Node>();
  if (!name.empty()) root.RegisterImportantNode(child, name);
}

template <auto make>
void MakeBy(CGlobal& root, std::string_view name) {
  CYbSEKvfBase* child = make(root);
  if (!name.empty()) root.RegisterImportantNode(child, name);
}

template <class Node>
constexpr ChildRow Child() {
  return {Make<Node>, {}};
}
template <class Node, class FoundAs>
constexpr ChildRow Child(ImportantName<FoundAs> name) {
  static_assert(std::is_base_of_v<FoundAs, Node>);
  return {Make<Node>, name.text};
}

CYbSEKvfBase* NewGeoScene(CGlobal& root) { return root.NewChild<CGeoScene3DKvf>(CGeoScene3DKvf::kOfModel); }

constexpr std::array kChildren{
    Child<CFlowModelDocVersionKvf>(kDocVersion),
    Child<CViewSettingsKvf>(kViewSettings),
    Child<CIntroductionKvf>(),
    Child<COverlaysKvf>(kOverlays),
    Child<CBasicParaKvf>(kBasicParameters),
    Child<CModelCompWQKvf>(kWaterQualityComponents),
    Child<CModelCompPTKvf>(kParticleTrackingComponents),
    Child<CKinetraSpecKvf>(kKinetraSpecification),
    Child<CSpeciesListKvf>(kSpecies),
    Child<CProcessesWQKvf>(kProcesses),
    Child<CCatchmentKvf>(kDomain),
    Child<CSubcatchmentKvf>(kSubcatchments),
    ChildRow{MakeBy<NewTopography>, kTopography.text},
    Child<CPrecipitationRelatedKvf>(kClimate),
    Child<CLandUseKvf>(kLandUse),
    Child<CEvapotransKvf>(kOldEvapotranspiration),
    Child<CRiverKvf>(kRiver),
    Child<CRiverMFKvf>(kModflowRiver),
    Child<COverlandKvf>(kOverland),
    Child<CTopographicalRoutingKvf>(kOverlandZones),
    Child<CUnsatzoneKvf>(kUnsaturatedZone),
    Child<CSatZoneKvf>(kSaturatedZone),
    Child<CSatZoneSubCatchmentKvf>(kReservoirZone),
    ChildRow{MakeBy<NewGroundwaterTable>, {}},
    Child<CSourcesWQListKvf>(kSources),
    Child<CStoringResultsKvf>(kStoringResults),
    Child<COutputModKvf>(),
    Child<CExtraParamsKvf>(),
    Child<CExecuteEngineFlagsKvf>(kExecuteFlags),
    Child<CProcDataKvf>(kProcessedData),
    Child<CResultKvf>(kResult),
    Child<CResultsPostProcessingKvf>(kPostProcessing),
    Child<COverviewKvf>(kOverview),
    ChildRow{MakeBy<NewGeoScene>, {}},
    Child<CCoverageKvf>(kCoverage),
};

// The reading order, in important names; a name that no node bears is passed over. Behind these the unsaturated zone is
// read. The saturated zone is read at its place, which sizes its lists of layers, and once more at the end, when
// species and processes are known.

/// Read behind all others, in this order: species must stand before everything that keeps a list per species.
constexpr std::array<std::string_view, 3> kReadBehind{kSpecies.text, kProcesses.text, kOverland.text};
/// Setups of older versions keep the paved areas here, which now belong to overland flow.
constexpr std::string_view kLandUseSection = "LandUse";
constexpr int kFirstVersionOfPondedDrainage = 14;
/// Read from old files and never written.
constexpr std::string_view kRetired = kOldEvapotranspiration.text;

}  // namespace

CGlobal::CGlobal() : CTvnKvfGlobalBase("TERVANE_FLOWMODEL") {
  for (const ChildRow& row : kChildren) row.make(*this, row.name);
}

int CGlobal::ReadDocVersion() const {
  const auto* version = Important(kDocVersion);
  return version ? version->ReadVersion : -1;
}

void CGlobal::Load(KvfNode* parentSection) {
  KvfNode* target = kvfSectionByNameNum(parentSection, GetTargetName(), 1);

  for (CYbSEKvfBase* child = GetFirstChild(); child; child = GetNextChild(child)) {
    const bool isReadBehind = std::any_of(kReadBehind.begin(), kReadBehind.end(),
                                          [&](std::string_view name) { return child == GetImportantNode(name); }) ||
                              child == GetImportantNode(kUnsaturatedZone.text);
    // From the second child on the version of the file is known. In one of version 1 the basic parameters have read the
    // storing of results, inside their section.
    const bool wasReadBefore = child == GetImportantNode(kStoringResults.text) && ReadDocVersion() == 1;
    if (!isReadBehind && !wasReadBefore) child->Load(target);
  }
  for (const std::string_view name : kReadBehind)
    if (CYbSEKvfBase* node = GetImportantNode(name)) node->Load(target);
  if (ReadDocVersion() < kFirstVersionOfPondedDrainage)
    if (auto* overland = Important(kOverland))
      overland->LoadPavedAreas(kvfSectionByNameNum(target, kLandUseSection, 1));
  if (CYbSEKvfBase* node = GetImportantNode(kUnsaturatedZone.text)) node->Load(target);
  if (CYbSEKvfBase* node = GetImportantNode(kSaturatedZone.text)) ReloadSaturatedZone(*node, target);

  if (auto retired = RemoveChild(GetImportantNode(kRetired))) retired_.push_back(std::move(retired));
}

}  // namespace tervane
