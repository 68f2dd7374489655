// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/kinetra_parameters.h"

#include <algorithm>
#include <span>

#include "platform/item_types.h"

namespace tervane {

namespace {

constexpr std::uint64_t kOC = kNeedsOverland, kUZ = kNeedsUnsaturated, kSZ = kNeedsSaturated;
constexpr int kMetre = 1000, kCubicMetre = 1600, kFractionUnit = 99000, kDensity = 2203, kHour = 1402, kRate = 2000,
              kCelsius = 2800, kRadiation = 6600;

std::span<const KinetraParameter> Constants() {
  using namespace quantity;
  static const KinetraParameter rows[] = {
      {1010, "Cell size", kHorizontalLength, kMetre, {kOC, kUZ, kSZ}},
      {1020, "Cell volume", kCellVolume, kCubicMetre, {kUZ, kSZ}},
      {1030, "Topography", kElevation, kMetre, {kOC, kUZ, kSZ}},
      {1040, "Detention storage", kStorageDepth, kMetre, {kOC}},
      {1050, "Depth to cell top", kDepthBelowGround, kMetre, {kSZ, kUZ}},
      {1060, "Depth to cell bottom", kDepthBelowGround, kMetre, {kSZ, kUZ}},
      {1070, "Saturated water content", kWaterContent, kFractionUnit, {kUZ}},
      {1080, "Macropore porosity", kPorosityOfPhase, kFractionUnit, {kUZ | kNeedsMacropores}},
      {1090, "Primary porosity", kPorosityOfPhase, kFractionUnit, {kSZ}},
      {1100, "Secondary porosity", kPorosityOfPhase, kFractionUnit, {kSZ | kNeedsSecondaryPorosity}},
      {1110, "Primary bulk density", kBulkDensity, kDensity, {kSZ, kUZ}},
      {1120,
       "Secondary bulk density",
       kBulkDensity,
       kDensity,
       {kSZ | kNeedsSecondaryPorosity, kUZ | kNeedsMacropores}}};
  return rows;
}

std::span<const KinetraParameter> Forcings() {
  using namespace quantity;
  static const KinetraParameter rows[] = {
      {2000, "Time step length", kTimeStepLength, kHour, {kOC, kUZ, kSZ}},
      {2010, "Precipitation rate", kPrecipitationRate, kRate, {kOC, kUZ, kSZ}},
      {2020, "Air temperature", kTemperature, kCelsius, {kOC, kUZ, kSZ}},
      {2030, "SW Solar radiation", kRadiationAndHeatFlux, kRadiation, {kOC, kUZ, kSZ}},
      {2040, "Depth of overland water", kWaterDepth, kMetre, {kOC}},
      {2050, "UZ water content", kWaterContent, kFractionUnit, {kUZ}},
      {2060, "Macropore water content", kWaterContent, kFractionUnit, {kUZ | kNeedsMacropores}},
      {2070, "Depth to phreatic surface (positive)", kDepthBelowGround, kMetre, {kOC, kUZ, kSZ}},
      {2080, "SZ Potential head", kElevation, kMetre, {kOC, kUZ, kSZ}},
      {2081, "SZ Saturated thickness", kSaturatedThickness, kMetre, {kSZ}},
      {2090, "Soil temperature", kTemperature, kCelsius, {kUZ, kSZ}}};
  return rows;
}

std::vector<KinetraParameter> Existing(std::span<const KinetraParameter> rows, std::uint64_t mask) {
  std::vector<KinetraParameter> existing;
  std::ranges::copy_if(rows, std::back_inserter(existing), [mask](const KinetraParameter& row) {
    return std::ranges::any_of(row.alternatives, [mask](std::uint64_t needs) { return (needs & ~mask) == 0; });
  });
  return existing;
}

KinetraParameter RowAt(const std::vector<KinetraParameter>& rows, int index) {
  return index >= 1 && index <= static_cast<int>(rows.size()) ? rows[static_cast<std::size_t>(index) - 1]
                                                              : KinetraParameter();
}

}  // namespace

std::vector<KinetraParameter> KinetraConstantsFor(std::uint64_t mask) { return Existing(Constants(), mask); }
std::vector<KinetraParameter> KinetraForcingsFor(std::uint64_t mask) { return Existing(Forcings(), mask); }

int GetNoKinetraConstants(std::uint64_t mask) { return static_cast<int>(KinetraConstantsFor(mask).size()); }
int GetNoKinetraForcings(std::uint64_t mask) { return static_cast<int>(KinetraForcingsFor(mask).size()); }
KinetraParameter GetKinetraConstant(std::uint64_t mask, int index) { return RowAt(KinetraConstantsFor(mask), index); }
KinetraParameter GetKinetraForcing(std::uint64_t mask, int index) { return RowAt(KinetraForcingsFor(mask), index); }

const KinetraParameter* FindKinetraParameter(int idCode) {
  for (const auto rows : {Constants(), Forcings()})
    if (const auto found = std::ranges::find(rows, idCode, &KinetraParameter::idCode); found != rows.end())
      return &*found;
  return nullptr;
}

}  // namespace tervane
