// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/saturated_zone.h"

#include <fmt/format.h>

#include "core/kvf.h"
#include "simspec/basic_parameters.h"
#include "simspec/conditions.h"
#include "spatial/domain.h"
#include "subsurface/computational_layers.h"
#include "subsurface/drainage.h"
#include "subsurface/geology.h"
#include "subsurface/ground_layers.h"
#include "subsurface/initial_totals.h"
#include "subsurface/pages.h"
#include "subsurface/wells.h"
#include "wqpt/registration_lenses.h"
#include "wqpt/water_quality_layers.h"

namespace tervane {

namespace {

using Zone = CSatZoneKvf;

constexpr KeyChoice kDispersions[] = {
    {Zone::kNoDispersion, "No Dispersion"}, {Zone::kIsotropy, "Isotropy"}, {Zone::kAnisotropy, "Anisotropy"}};
constexpr KeyChoice kParameters[] = {{Zone::kByLayers, "Assign parameters via geological layers"},
                                     {Zone::kByUnits, "Assign parameters via geological units within layers"}};
constexpr KeyChoice kDiscretizations[] = {{Zone::kAsGeology, "Defined by geological layers"},
                                          {Zone::kUniform, "Uniform vertical discretization"},
                                          {Zone::kExplicitLevels, "Explicit definition of lower levels"}};
constexpr KeyChoice kAmbientHeads[] = {{Zone::kHydrostatic, "Assume hydrostatic equilibrium"},
                                       {Zone::kDistributedHead, "Assign distributed values"}};
constexpr KeyChoice kRelativePermeabilities[] = {{Zone::kVanGenuchten, "Van Genuchten"},
                                                 {Zone::kBrooksCorey, "Brooks-Corey"}};

const Data2DKind kAirFlowHead{.className = "CGeoDataMod2DZWTKvf",
                              .section = "HeadElevationUsedForAirFlow",
                              .title = "Head elevation used as ref. for air flow simulation",
                              .itemType = quantity::kElevation};

/// A boundary list with segments that takes part; null where there is none.
template <class List>
CGeoDataBoundCondListKvf* BoundaryInUse(const List& layers) {
  for (int number = 1; number <= layers.GetItemCount(); ++number) {
    CGeoDataBoundCondListKvf& boundary = layers.GetItem(number)->OuterBoundary();
    if (boundary.GetItemCount() > 0 && boundary.IsDataUsedInSetup()) return &boundary;
  }
  return nullptr;
}

}  // namespace

CSatZoneKvf::CSatZoneKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("Saturated Zone", "SaturatedZone", parent) {
  SetPage(kSaturatedZonePage);
  TakesPartWhen(
      (OwnEngine() && Component(&CModelCompKvf::SZ) && !Method(&CModelCompKvf::SZ_ModelType, kLinearReservoir)) ||
      (AnyModflow() && ModflowComponent(&CModModelCompKvf::Subsurface)));
  units_ = NewChild<CGeoUnitsSZListKvf>();
  layers_ = NewImportantChild<CGeoLayerSZKvf>(kGeologicalLayers, id);
  NewImportantChild<CGeoLenseSZKvf>(kGeologicalLenses);
  NewImportantChild<CWQLayerListKvf>(kWaterQualityLayers);
  ownLayers_ = NewChild<CSZVerDiscrLayerListKvf>();
  layersOfGeology_ = NewImportantChild<CSZVerDiscrLayerGeoListKvf>(kComputationalLayersOfGeology);
  NewImportantChild<CRegLensePTListKvf>(kRegistrationLenses);
  NewImportantChild<CDrainageSZKvf>(kDrainage);
  NewImportantChild<CDrainageMFSZKvf>(kModflowDrains);
  NewImportantChild<CSZWellKvf>(kWells, Wells);
  NewChild<CData2DKvf>(kAirFlowHead, AirFlowModelled() && Is(TypeAmbientWaterHeadInput, kHydrostatic));
}

bool CSatZoneKvf::AddWellOverlaySection(KvfFile* file, std::string& error) const {
  error.clear();
  if (!Wells) return true;
  const auto* domain = Important(kDomain);
  const auto* wells = Important(kWells);
  const Envelope area = domain ? domain->GetEnvelope() : Envelope();
  kvfAddSection(file, "Wells");
  kvfPutParam(file, "DisplayName", "Wells");
  kvfPutParam(file, "MinX", area.xMin);
  kvfPutParam(file, "MaxX", area.xMax);
  kvfPutParam(file, "MinY", area.yMin);
  kvfPutParam(file, "MaxY", area.yMax);
  if (!wells || wells->Filename.IsEmpty()) {
    error = "Missing data for saturated zone. Well file is not specified";
  } else {
    kvfPutParamFilename(file, "WellFileName", wells->Filename.Absolute());
    kvfPutParam(file, "LabelVisible", 1);
    kvfPutParam(file, "FilterStartAngle", 0);
    kvfPutParam(file, "FilterStopAngle", 360);
  }
  kvfEndSection(file);
  return error.empty();
}

std::vector<CellCheck> CSatZoneKvf::CurrentChecks() const { return GroundChecksOf(*this); }

std::optional<CellTotals> CSatZoneKvf::TotalsOf(CData2DKvf& quantity) const { return InitialTotalsOf(*this, quantity); }

const std::string& CSatZoneKvf::GetTitle() const {
  static const std::string withModflow = "Subsurface";
  const auto* basics = Important(kBasicParameters);
  return basics && basics->ModelType != kEngineTervane ? withModflow : CYbSEKvfBase::GetTitle();
}

int CSatZoneKvf::ValidateData() {
  if (TypeOfVerDiscr == kAsGeology && layers_->GetItemCount() != layersOfGeology_->GetItemCount())
    AddWarning("Computational layers do not follow the geological layers", "TypeOfVerDiscr",
               fmt::format("computational layers: {}, geological layers: {}; the page of the geological layers brings "
                           "them in step",
                           layersOfGeology_->GetItemCount(), layers_->GetItemCount()));
  CGeoDataBoundCondListKvf* boundary = BoundaryInUse(*layersOfGeology_);
  if (!boundary) boundary = BoundaryInUse(*ownLayers_);
  if (boundary && !boundary->LoadDomain() && !boundary->GetTraceFault().empty())
    AddWarning("Outer boundary conditions have no place on the model domain", {}, boundary->GetTraceFault());
  return 1;
}

void CSatZoneKvf::ExchangeKeys(KeyExchange& keys) {
  keys("DispersionOption", DispersionOption).OneOf(kDispersions);
  constexpr int kLastVersionWithOption = 7;
  keys.Since(kLastVersionWithOption + 1)("Drainage", Drainage);
  keys("TypeOfGeoParaDistribution", ParameterDistribution).OneOf(kParameters);
  keys("TypeOfVerDiscr", TypeOfVerDiscr).OneOf(kDiscretizations);
  keys("Wells", Wells);
  keys("FractureWells", FractureWells);
  keys("MimimumLayerThickness", MimimumLayerThickness).Quantity(quantity::kLayerThickness);
  keys("id", id);
  keys("TypeAmbientWaterHeadInput", TypeAmbientWaterHeadInput).OneOf(kAmbientHeads);
  keys("TypeOfRelPerm", TypeOfRelPerm).OneOf(kRelativePermeabilities);
  keys("Threshold", Threshold);
  keys("MassTransferToImmobileWater", MassTransferToImmobileWater);
  int option = CDrainageSZKvf::kNoDrainage;
  keys.Until(kLastVersionWithOption, "DrainageOption", option);
  if (!keys.IsReading() || keys.DocVersion() > kLastVersionWithOption) return;
  Drainage = option > CDrainageSZKvf::kNoDrainage ? 1 : 0;
  if (auto* drainage = Important(kDrainage))
    drainage->SetOption(option == CDrainageSZKvf::kNoDrainage ? CDrainageSZKvf::kDownhill : option);
}

}  // namespace tervane
