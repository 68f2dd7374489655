// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/internal_boundary.h"

#include "simspec/basic_parameters.h"
#include "simspec/conditions.h"
#include "subsurface/pages.h"

namespace tervane {

namespace {

using BoundaryZone = CSZVerDiscrInternalBoundaryPropKvf;

constexpr const char* kValueLabels[] = {
    "", "Head elevation", "Head elevation", "Controlling head", "Drain elevation", "River stage", ""};
static_assert(std::size(kValueLabels) == std::size(BoundaryZone::kBoundaryTypes));
constexpr KeyChoice kLeakages[] = {{BoundaryZone::kConductance, "Total conductance"},
                                   {BoundaryZone::kLeakageCoefficient, "Leakage coefficient"}};

constexpr KeyChoice kBoundarySources[] = {{ZoneSource::kNone, "None"},
                                          {ZoneSource::kGridCodes, "Grid codes (.nds2)"},
                                          {ZoneSource::kPolygons, "Polygons (.shp)"}};
constexpr ZoneKey kBoundaryKeys[] = {
    {ZonePart::Number, "InternalBoundarySecNumber"}, {ZonePart::Name, "ID"}, {ZonePart::Id, "GridCode"}};
constexpr CodedZonesKind kBoundaryZones{.className = "CSZVerDiscrInternalBoundaryKvf",
                                        .title = "Internal Boundary Conditions",
                                        .section = "InternalBoundary",
                                        .source = {.types = kBoundarySources,
                                                   .type = ZoneSource::kNone,
                                                   .hasGapFill = false,
                                                   .countKey = "NoInternalBoundaries",
                                                   .mayLeaveCells = true,
                                                   .hasGlobalZone = false},
                                        .distribution = std::nullopt,
                                        .makeZone = MakeZone<BoundaryZone>,
                                        .page = &kInternalBoundariesPage};

const Data2DKind kLeakageCoefficientKind{.className = "CSZVerDiscrInternalBoundaryPropLeakCoefKvf",
                                         .section = "LeakCoef",
                                         .title = "Leakage Coefficient",
                                         .itemType = quantity::kLeakageCoefficient,
                                         .mayLeaveCells = true};
const Data2DKind kConductanceKind{.className = "CSZVerDiscrInternalBoundaryPropConducKvf",
                                  .section = "Conductance",
                                  .title = "Total Conductance",
                                  .itemType = quantity::kConductance,
                                  .mayLeaveCells = true};
const Data2DKind kRiverBottomKind{.className = "CSZVerDiscrInternalBoundaryPropRiverBotKvf",
                                  .section = "RiverBottomElevation",
                                  .title = "River Bottom Elevation",
                                  .itemType = quantity::kElevation,
                                  .relativeToGround = Data2DKind::RelativeToGround::Off,
                                  .mayLeaveCells = true};

}  // namespace

int CSZVerDiscrInternalBoundaryPropConducKvf::ValidateData() {
  const int isValid = CData2DKvf::ValidateData();
  if (Type == kUniform) return isValid;
  AddError("Only fixed value allowed", "Type");
  return 0;
}

CSZVerDiscrInternalBoundaryPropKvf::CSZVerDiscrInternalBoundaryPropKvf(CYbSEKvfBase* parent)
    : CodedZoneProp(kBoundaryKeys, "Boundary Properties", "InternalBoundaryProp", parent) {
  SetPage(kInternalBoundaryPage);
  const Condition hasValue = !Is(BoundaryType, {kNone, kInactive});
  const Condition isLeaky = Is(BoundaryType, {kHeadControlledFlux, kDrain, kRiver});
  MakeFiles(
      *this, [this] { return GetBoundaryItemType(); }, hasValue, hasValue);
  NewChild<CData2DKvf>(kLeakageCoefficientKind, isLeaky && Is(HeadControlLeakage, kLeakageCoefficient));
  NewChild<CSZVerDiscrInternalBoundaryPropConducKvf>(kConductanceKind, isLeaky && Is(HeadControlLeakage, kConductance));
  NewChild<CData2DKvf>(kRiverBottomKind, Is(BoundaryType, kRiver));
}

void CSZVerDiscrInternalBoundaryPropKvf::ExchangeKeys(KeyExchange& keys) {
  CodedZoneProp::ExchangeKeys(keys);
  keys("FixedValue", FixedValue).Quantity([this] { return GetBoundaryItemType(); });
  keys("BoundaryType", BoundaryType).OneOf(kBoundaryTypes);
  keys("Type", Type);
  keys("HeadControlLeakage", HeadControlLeakage).OneOf(kLeakages);
}

void CSZVerDiscrInternalBoundaryPropKvf::SetBoundaryType(int type) {
  BoundaryType = type;
  if ((type == kFixedHeadDrain || type == kHeadControlledFlux) && Type > kSeries) Type = kInitialValue;
  if ((type == kHeadControlledFlux || type == kDrain) && Type < kConstant) Type = kConstant;
}

int CSZVerDiscrInternalBoundaryPropKvf::GetBoundaryItemType() const {
  return BoundaryType >= kFixedHead && BoundaryType <= kRiver ? quantity::kElevation : quantity::kUndefined;
}

std::string CSZVerDiscrInternalBoundaryPropKvf::GetValueLabel() const {
  const bool isKnown = BoundaryType >= 0 && BoundaryType < static_cast<int>(std::size(kValueLabels));
  return isKnown ? kValueLabels[BoundaryType] : "";
}

int CSZVerDiscrInternalBoundaryPropKvf::ValidateData() {
  const int isValid = CodedZoneProp::ValidateData();
  const auto* basics = Important(kBasicParameters);
  if (BoundaryType != kFixedHeadDrain || !basics || basics->ModelType == kEngineTervane) return isValid;
  AddError("Fixed head drain is only allow for Tervane", "BoundaryType");
  return 0;
}

CSZVerDiscrInternalBoundaryKvf::CSZVerDiscrInternalBoundaryKvf(CYbSEKvfBase* parent)
    : CodedZonesKvf(kBoundaryZones, parent) {}

}  // namespace tervane
