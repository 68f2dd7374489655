// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/overland.h"

#include "platform/item_types.h"
#include "simspec/conditions.h"
#include "simspec/control_parameters.h"
#include "surface/land_use.h"
#include "surface/pages.h"
#include "wqpt/decay_entries.h"
#include "wqpt/kinetra_values.h"
#include "wqpt/species_entries.h"

namespace tervane {

namespace {

Condition BySubcatchments() { return Method(&CModelCompKvf::OL_ModelType, kSubcatchmentOverland); }

// ---- Over the model area

const Data2DKind kSurface[] = {{.className = "CGeoDataWM2DKvf",
                                .section = "Manning",
                                .title = "Manning Number",
                                .itemType = quantity::kManningNumber,
                                .fixedValue = 10},
                               {.className = "CGeoDataWM2DKvf",
                                .section = "DetentionStorage",
                                .title = "Detention Storage",
                                .itemType = quantity::kStorageDepth},
                               {.className = "CGeoDataWM2DKvf",
                                .section = "InitialWaterDepth",
                                .title = "Initial Water Depth",
                                .itemType = quantity::kWaterDepth}};
const Data2DKind kLeakage{.className = "COverlandGroundWaterExchangeKvf",
                          .section = "LeakageCoeff",
                          .title = "Surface - Subsurface Leakage Coefficient",
                          .itemType = quantity::kLeakageCoefficient};
const Data2DKind kSeparatedAreas{.className = "COverlandSepAreasKvf",
                                 .section = "SeparatedFlowAreas",
                                 .title = "Separated Flow Areas",
                                 .itemType = quantity::kCode,
                                 .mayBeScattered = false};
const Data2DKind kDispersion[] = {{.className = "CData2DWQKvf",
                                   .section = "DispersionCoeff_X",
                                   .title = "Dispersion Coefficient along Columns",
                                   .itemType = quantity::kDispersionCoefficient,
                                   .shortTitle = "Disp Coeff along Columns"},
                                  {.className = "CData2DWQKvf",
                                   .section = "DispersionCoeff_Y",
                                   .title = "Dispersion Coefficient along Rows",
                                   .itemType = quantity::kDispersionCoefficient,
                                   .shortTitle = "Disp Coeff along Rows"}};
const Data2DKind kPavedFraction{.className = "CPavedAreaFractionKvf",
                                .section = "PavedAreaFraction",
                                .title = "Paved Area Fraction",
                                .itemType = quantity::kFraction};

// ---- Of ponded drainage

const Data2DKind kMaxRate{.className = "CMaxStorageKvf",
                          .section = "MaxStorageChangeRate",
                          .title = "Max Storage Change Rate",
                          .itemType = quantity::kDischarge,
                          .fixedValue = 10};
const Data2DKind kRunoff{.className = "CUZPavedKvf",
                         .section = "DrRunoffCoefficient",
                         .title = "Runoff Coefficient",
                         .itemType = quantity::kFraction,
                         .fixedValue = 1};
const Data2DKind kDrains[] = {{.className = "CData2DKvf",
                               .section = "TimeConstant",
                               .title = "Inflow Time Constant",
                               .itemType = quantity::kLeakageCoefficient,
                               .fixedValue = 0.001F},
                              {.className = "CData2DKvf",
                               .section = "TimeConstantOut",
                               .title = "Outflow Time Constant",
                               .itemType = quantity::kLeakageCoefficient,
                               .fixedValue = 0.001F},
                              {.className = "CData2DKvf",
                               .section = "Level",
                               .title = "Drain Level",
                               .itemType = quantity::kElevation,
                               .relativeToGround = Data2DKind::RelativeToGround::On}};
const Data2DKind kDrainCodes{.className = "CPondedDrainCodeKvf",
                             .section = "DrainCode",
                             .title = "Drain Codes",
                             .itemType = quantity::kCode,
                             .mayBeScattered = false};
const Data2DKind kOptionCodes{.className = "CDistributionOfPondedKvf",
                              .section = "DistributedOptionCode",
                              .title = "Drainage Option Distribution",
                              .itemType = quantity::kCode,
                              .mayBeScattered = false};

constexpr KeyChoice kDrainageOptions[] = {
    {CPondedDrainageKvf::kDownhill, "Drainage routed downhill based on adjacent drain levels"},
    {CPondedDrainageKvf::kByCodes, "Drainage routed based on grid codes"},
    {CPondedDrainageKvf::kDistributed, "Distributed drainage options"},
    {CPondedDrainageKvf::kRemoved, "Drainage not routed, but removed from model"}};

// ---- Zones

constexpr CodedZonesKind kPondedAreas{.className = "CPondedWaterExchangeKvf",
                                      .title = "Sub-areas for reduced ponded exchange",
                                      .section = "OnlyReducedContactInPonded",
                                      .source = {.hasGapFill = false, .mayLeaveCells = true},
                                      .makeZone = nullptr,
                                      .page = &kPondedWaterExchangePage};

constexpr CodedZonesKind kFlowZones{.className = "CTopographicalRoutingKvf",
                                    .title = "Overland Flow Zones",
                                    .section = "OverlandSubcatchment",
                                    .source = {.countKey = "NO_ZONES"},
                                    .makeZone = MakeZone<CTopographicalRoutingPropKvf>,
                                    .page = &kOverlandZonesPage};

}  // namespace

Condition OverlandExchangesWithGround() {
  return Component(&CModelCompKvf::OL) && Method(&CModelCompKvf::OL_ModelType, kFiniteDifferenceOverland) &&
         (Component(&CModelCompKvf::UZ) ||
          (Component(&CModelCompKvf::SZ) && Method(&CModelCompKvf::SZ_ModelType, kFiniteDifferenceSaturated)));
}

// ---- Paved areas of old setups

PavedAreaData2DKvf::PavedAreaData2DKvf(Data2DKind kind, std::string_view oldSection, Condition takesPart,
                                       CYbSEKvfBase* parent)
    : CData2DKvf(std::move(kind), std::move(takesPart), parent), oldSection_(oldSection) {}

void PavedAreaData2DKvf::Load(KvfNode* parentSection) {
  const std::string name = GetSectionName();
  if (UseOldSection) SetSectionName(std::string(oldSection_));
  CData2DKvf::Load(parentSection);
  SetSectionName(name);
  UseOldSection = 0;
}

// ---- Ponded drainage

CPondedDrainageKvf::CPondedDrainageKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("Ponded Drainage", "Drainage", parent) {
  SetPage(kPondedDrainagePage);
  NewImportantChild<PavedAreaData2DKvf>(kMaxStorageChangeRate, kMaxRate, "MaxPavedStorageChangeRate",
                                        OnInParent(&CPondedDrainageKvf::SpecifyMaxStorageChangeRate));
  NewImportantChild<PavedAreaData2DKvf>(kRunoffCoefficient, kRunoff, "PavedRunoffCoefficient", Condition());
  for (const Data2DKind& kind : kDrains) NewChild<CData2DKvf>(kind);
  NewChild<CData2DKvf>(kDrainCodes, IsInParent(&CPondedDrainageKvf::DrainageOption, {kByCodes, kDistributed}));
  NewChild<CData2DKvf>(kOptionCodes, IsInParent(&CPondedDrainageKvf::DrainageOption, {kDistributed}));
}

void CPondedDrainageKvf::ExchangeKeys(KeyExchange& keys) {
  keys("GradientCheck", GradientCheck);
  keys("SpecifyMaxStorageChangeRate", SpecifyMaxStorageChangeRate);
  keys("DrainageOption", DrainageOption).OneOf(kDrainageOptions);
}

// ---- Overland flow

CPondedWaterExchangeKvf::CPondedWaterExchangeKvf(CYbSEKvfBase* parent) : CodedZonesKvf(kPondedAreas, parent) {
  const auto control = [](const CYbSEKvfBase& node) { return node.Important(kOverlandControl); };
  TakesPartWhen(
      OverlandExchangesWithGround() && OnInParent(&COverlandKvf::OverlandGroundWaterExchangeOption) &&
      Is<CCompControlParaOLKvf>(control, &CCompControlParaOLKvf::SolverOption, {CCompControlParaOLKvf::kExplicit}) &&
      On<CCompControlParaOLKvf>(control, &CCompControlParaOLKvf::Multicell) &&
      OnInParent(&COverlandKvf::SpecifyOnlyReducedContactInPonded));
}

COverlandKvf::COverlandKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("Overland Flow", "Overland", parent) {
  SetPage(kOverlandPage);
  TakesPartWhen((OwnEngine() && Component(&CModelCompKvf::OL) && !BySubcatchments()) ||
                (!OwnEngine() && ModflowComponent(&CModModelCompKvf::OL)));
  for (const Data2DKind& kind : kSurface) NewChild<CGeoDataWM2DKvf>(kind, CGeoDataWM2DKvf::kAnyDistribution);
  NewChild<CData2DKvf>(kLeakage,
                       OverlandExchangesWithGround() && OnInParent(&COverlandKvf::OverlandGroundWaterExchangeOption));
  NewChild<CPondedWaterExchangeKvf>();
  NewChild<CData2DKvf>(kSeparatedAreas, Component(&CModelCompKvf::OL) && OnInParent(&COverlandKvf::SeparatedFlowAreas));
  NewChild<COverlandSpeciesKvf>();
  for (const Data2DKind& kind : kDispersion)
    NewChild<CData2DKvf>(kind, Component(&CModelCompKvf::WQ) && WaterQualityComponent(&CModelCompWQKvf::OL));
  NewChild<CDecayProcessesKvf>();
  NewImportantChild<CKinetraConstantsOLKvf>(kKinetraConstantsOverland);
  NewImportantChild<CKinetraForcingsOLKvf>(kKinetraForcingsOverland);
  NewChild<CData2DKvf>(kPavedFraction, OnInParent(&COverlandKvf::ReducedPavedLeakage) &&
                                           OnInParent(&COverlandKvf::OverlandGroundWaterExchangeOption));
  NewImportantChild<CPondedDrainageKvf>(kPondedDrainage)->TakesPartWhen(OnInParent(&COverlandKvf::Drainage));
}

void COverlandKvf::LoadPavedAreas(KvfNode* landUse) {
  for (PavedAreaData2DKvf* moved : {Important(kMaxStorageChangeRate), Important(kRunoffCoefficient)}) {
    if (!moved) continue;
    moved->UseOldSection = 1;
    moved->Load(landUse);
  }
  const auto* old = Important(kLandUse);
  const OldPavedAreas flags = old ? old->PavedAreas() : OldPavedAreas{};
  Drainage = flags.Paved;
  if (auto* drainage = Important(kPondedDrainage)) {
    drainage->GradientCheck = flags.PavedGradientCheck;
    drainage->SpecifyMaxStorageChangeRate = flags.SpecifyMaxPavedStorageChangeRate;
  }
}

void COverlandKvf::ExchangeKeys(KeyExchange& keys) {
  keys("SeparatedFlowAreas", SeparatedFlowAreas);
  keys("OverlandGroundWaterExchangeOption", OverlandGroundWaterExchangeOption);
  keys("SpecifyOnlyReducedContactInPonded", SpecifyOnlyReducedContactInPonded);
  keys("ReducedPavedLeakage", ReducedPavedLeakage);
  keys("Drainage", Drainage);
}

// ---- By zones

CTopographicalRoutingPropKvf::CTopographicalRoutingPropKvf(CYbSEKvfBase* parent)
    : CodedZoneProp(kZoneKeys, "Overland Flow Zone", "TopographicalRouting", parent) {
  SetPage(kOverlandZonePage);
}

void CTopographicalRoutingPropKvf::ExchangeKeys(KeyExchange& keys) {
  CodedZoneProp::ExchangeKeys(keys);
  keys("Slope", Slope).Quantity(quantity::kSlope);
  keys("ManningNb", ManningNb).Quantity(quantity::kManningNumber);
  keys("InitialDepth", InitialDepth).Quantity(quantity::kWaterDepth);
  keys("DetentionStorage", DetentionStorage).Quantity(quantity::kStorageDepth);
  keys("SlopeLength", SlopeLength).Quantity(quantity::kSlopeLength);
}

CTopographicalRoutingKvf::CTopographicalRoutingKvf(CYbSEKvfBase* parent) : CodedZonesKvf(kFlowZones, parent) {
  TakesPartWhen(OwnEngine() && Component(&CModelCompKvf::OL) && BySubcatchments());
}

}  // namespace tervane
