// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/soil_profiles.h"

#include <cmath>

#include <fmt/format.h>

#include "libraries/soils.h"
#include "platform/item_types.h"
#include "platform/text.h"
#include "simspec/conditions.h"
#include "subsurface/pages.h"
#include "subsurface/unsaturated_zone.h"

namespace tervane {

namespace {

constexpr ZoneKey kSoilProfileKeys[] = {
    {ZonePart::Number, "ProfileSecNumber"}, {ZonePart::Id, "GridCode"}, {ZonePart::Name, "SoilProfile_ID"}};

constexpr CodedZonesKind kSoilProfileZones{
    .className = "CUZSoilProfileKvf",
    .title = "Soil Profile Definitions",
    .section = "UZSoilProfiles",
    .source = {.countKey = "NO_SOIL_PROFILES", .noValues = "Could not find any values in grid file."},
    .distribution = CodedZonesKvf::kUniform,
    .makeZone = MakeZone<CUZSoilProfilePropKvf>,
    .page = &kSoilProfilesPage};

/// Heights are kept as floats, so that sums of them differ in their last digits.
constexpr double kSameDepth = 1e-4;

}  // namespace

// ---- Soils

void CUZSoilProfilePropLayerItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("Depth", Depth).Quantity(quantity::kDepthBelowGround).Above(0);
  keys("SoilID", SoilID);
  keys("DataBase", DataBase);
}

int CUZSoilProfilePropLayerItemKvf::ValidateData() {
  if (DataBase.IsEmpty() || SoilID.empty()) {
    AddError("No filename and/or layername selected", DataBase.IsEmpty() ? "DataBase" : "SoilID");
    return 0;
  }
  const std::string path = DataBase.Absolute();
  if (const std::string reason = WhySoilNotValid(path, SoilID); !reason.empty()) {
    AddError("Filename and/or layername not found", "SoilID", reason);
    return 0;
  }
  if (const std::string fault = FaultOfSoil(path, SoilID); !fault.empty())
    AddWarning("The soil cannot be used as its library has it", "SoilID", fault);
  return 1;
}

CUZSoilProfilePropLayerListKvf::CUZSoilProfilePropLayerListKvf(CYbSEKvfBase* parent)
    : CYbSEKvfListBase("CUZSoilProfilePropLayerListKvf", "CUZSoilProfilePropLayerListKvf", parent) {
  AddItemNode();
}

double CUZSoilProfilePropLayerListKvf::Bottom() const {
  const auto* last = GetItem(GetItemCount());
  return last ? static_cast<double>(last->Depth) : 0;
}

// ---- Cells

void CUZSoilProfilePropDiscrItemKvf::ExchangeKeys(KeyExchange& keys) {
  keys("CellHeight", CellHeight).Quantity(quantity::kLayerThickness).Above(0);
  keys("NoCells", NoCells).AtLeast(1);
  keys("Dispersivity", Dispersivity).Quantity(quantity::kDispersivity);
}

int CUZSoilProfilePropDiscrItemKvf::ValidateData() {
  if (!(Dispersivity < 0)) return 1;
  AddError("Dispersivity must be greater than 0.", "Dispersivity");
  return 0;
}

CUZSoilProfilePropDiscrListKvf::CUZSoilProfilePropDiscrListKvf(CYbSEKvfBase* parent)
    : CYbSEKvfListBase("CUZSoilProfilePropDiscrListKvf", "CUZSoilProfilePropDiscrListKvf", parent) {
  AddItemNode();
}

double CUZSoilProfilePropDiscrListKvf::Bottom() const {
  double bottom = 0;
  for (int number = 1; number <= GetItemCount(); ++number) bottom += GetItem(number)->Height();
  return bottom;
}

// ---- A profile

void BypassConstants::Exchange(KeyExchange& keys) {
  keys("BYP", BYP).Quantity(quantity::kFraction).Range(0, 1);
  keys("THR1", THR1).Quantity(quantity::kSoilWaterContent).Range(0, 1);
  keys("THR2", THR2).Quantity(quantity::kSoilWaterContent).Range(0, 1);
}

CUZSoilProfilePropKvf::CUZSoilProfilePropKvf(CYbSEKvfBase* parent)
    : CodedZoneProp(kSoilProfileKeys, "UZ Soil Profile Definition", "UZSoilProfileProp", parent),
      BypassConstants{.BYP = 0.25f, .THR1 = 0.15f, .THR2 = 0.05f},
      soils_(NewChild<CUZSoilProfilePropLayerListKvf>()),
      cells_(NewChild<CUZSoilProfilePropDiscrListKvf>()) {
  SetPage(kSoilProfilePage);
}

void CUZSoilProfilePropKvf::ExchangeKeys(KeyExchange& keys) {
  CodedZoneProp::ExchangeKeys(keys);
  BypassConstants::Exchange(keys);
}

std::string CUZSoilProfilePropKvf::WhyEndsDiffer() const {
  const double soils = soils_->Bottom(), cells = cells_->Bottom();
  if (std::abs(soils - cells) <= kSameDepth * std::max(1.0, std::abs(soils))) return {};
  return fmt::format("the soils end {} m and the cells {} m below ground", FormatNumber(soils, "%.6g"),
                     FormatNumber(cells, "%.6g"));
}

int CUZSoilProfilePropKvf::ValidateData() {
  const int isValid = CodedZoneProp::ValidateData();
  if (const std::string differing = WhyEndsDiffer(); !differing.empty())
    AddFinding({Severity::Note, "Soils and cells end at different depths", {}, differing});
  return isValid;
}

CUZSoilProfileKvf::CUZSoilProfileKvf(CYbSEKvfBase* parent) : CodedZonesKvf(kSoilProfileZones, parent) {
  TakesPartWhen(Component(&CModelCompKvf::UZ) && SoilColumnsComputed());
  BeginWithZones();
}

}  // namespace tervane
