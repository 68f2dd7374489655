// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/soils.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <utility>
#include <vector>

#include <fmt/format.h>

#include "platform/text.h"

namespace tervane {

namespace {

constexpr LibraryColumn NumberFrom(std::string_view head, std::string_view unit, double least, double most,
                                   double initial, std::string_view toolTip) {
  return {head, unit, toolTip, false, least, most, initial};
}
constexpr LibraryColumn NumberAbove(std::string_view head, std::string_view unit, double least, double most,
                                    double initial, std::string_view toolTip) {
  return {head, unit, toolTip, false, least, most, initial, {}, true};
}

constexpr LibraryColumn kThetaS =
    NumberAbove("Saturated water content", "", 0, 1, 0.43, "Volume of water in a volume of soil at saturation");
constexpr LibraryColumn kThetaR = NumberFrom("Residual water content", "", 0, 1, 0.078,
                                             "Volume of water in a volume of soil that no suction takes out");
constexpr LibraryColumn kAirEntry =
    NumberAbove("Air entry suction", "m", 0, 100, 0.1, "The suction at which air begins to enter");
constexpr LibraryColumn kKs =
    NumberAbove("Saturated conductivity", "m/s", 0, 1, 2.889e-6, "Hydraulic conductivity at saturation");

// In the order of the file.
constexpr LibraryColumn kVanGenuchten[] = {
    kThetaS, kThetaR, NumberAbove("Alpha", "1/m", 0, 1000, 3.6, "One over the suction at which larger pores empty"),
    NumberAbove("n", "", 1, 20, 1.56, "The larger, the more alike are the pores")};
constexpr LibraryColumn kBrooksCorey[] = {
    kThetaS, kThetaR, kAirEntry,
    NumberAbove("Pore size index", "", 0, 20, 0.3, "Lambda: the larger, the more alike are the pores")};
constexpr LibraryColumn kCampbell[] = {
    kThetaS, kAirEntry, NumberAbove("b", "", 0, 50, 5, "The slope of the logarithms of suction and water content")};
constexpr LibraryColumn kMualem[] = {kKs, NumberFrom("Pore connectivity", "", -10, 10, 0.5, "0.5 for most soils")};
constexpr LibraryColumn kPowerLaw[] = {kKs, NumberAbove("Exponent", "", 0, 100, 11, "Of the effective saturation")};
constexpr LibraryColumn kDensity[] = {
    NumberAbove("Bulk density", "kg/m^3", 0, 3000, 1511, "Mass of dry soil in a volume of soil")};

enum RetentionModel : std::size_t { kVanGenuchtenModel, kBrooksCoreyModel, kCampbellModel };
constexpr LibraryModel kRetentions[] = {
    {"van Genuchten", kVanGenuchten}, {"Brooks-Corey", kBrooksCorey}, {"Campbell", kCampbell}};
enum ConductivityModel : std::size_t { kMualemModel, kPowerLawModel };
constexpr LibraryModel kConductivities[] = {{"Mualem", kMualem}, {"Power law", kPowerLaw}};
constexpr LibraryModel kDensities[] = {{"", kDensity}};

enum SoilField { kSoilName, kSoilSource, kRetentionField, kConductivityField, kBulkDensityField };
constexpr LibraryField kSoilFields[] = {
    {"Name", "Name:", "The name by which setups know the soil"},
    {"Source", "Source:", "Where the values come from"},
    {"Retention", "Retention:", "The model of how much water the soil holds at a suction", kRetentions},
    {"Conductivity", "Conductivity:", "The model of how well the soil conducts water when it is not saturated",
     kConductivities},
    {"BulkDensity", "Bulk density:", "Mass of dry soil in a volume of soil", kDensities},
};

std::string WhyWrongContents(const LibraryEntry& entry) {
  if (entry.fields[kRetentionField].text == kRetentions[kCampbellModel].name) return {};
  const double thetaS = entry.Number(kRetentionField, 0), thetaR = entry.Number(kRetentionField, 1);
  if (thetaR < thetaS) return {};
  return fmt::format("{} is {}, less than the saturated {} was expected", kThetaR.head, ShortestNumber(thetaR),
                     ShortestNumber(thetaS));
}

constexpr SoilTexture kSoilTextures[] = {
    {"Sand", 0.045, 0.43, 0.145, 2.68, 29.70},
    {"Loamy sand", 0.057, 0.41, 0.124, 2.28, 14.59},
    {"Sandy loam", 0.065, 0.41, 0.075, 1.89, 4.42},
    {"Loam", 0.078, 0.43, 0.036, 1.56, 1.04},
    {"Silt", 0.034, 0.46, 0.016, 1.37, 0.25},
    {"Silt loam", 0.067, 0.45, 0.020, 1.41, 0.45},
    {"Sandy clay loam", 0.100, 0.39, 0.059, 1.48, 1.31},
    {"Clay loam", 0.095, 0.41, 0.019, 1.31, 0.26},
    {"Silty clay loam", 0.089, 0.43, 0.010, 1.23, 0.07},
    {"Sandy clay", 0.100, 0.38, 0.027, 1.23, 0.12},
    {"Silty clay", 0.070, 0.36, 0.005, 1.09, 0.02},
    {"Clay", 0.068, 0.38, 0.008, 1.09, 0.20},
};

/// As people write it: four digits.
double RoundedToFour(double value) { return std::strtod(fmt::format("{:.4g}", value).c_str(), nullptr); }

}  // namespace

constexpr LibraryKind kSoilLibrary{
    .name = "soil property file",
    .entryName = "soil",
    .entryNames = "soils",
    .rowName = {},
    .rowNames = {},
    .extension = "uzs",
    .filter = "UZ Soil property file (*.uzs)|*.uzs||",
    .target = "TERVANE_SOILS",
    .sectionPattern = "Soil_%d",
    .fields = kSoilFields,
    .whyWrongFields = WhyWrongContents,
};

std::optional<Soil> SoilOf(const LibraryEntry& entry) {
  if (!FirstFault(kSoilLibrary, entry).empty()) return std::nullopt;
  Soil soil;
  const auto retention = [&](std::size_t parameter) { return entry.Number(kRetentionField, parameter); };
  soil.thetaS = retention(0);
  const std::string& model = entry.fields[kRetentionField].text;
  if (model == kRetentions[kVanGenuchtenModel].name) {
    soil.thetaR = retention(1);
    soil.alpha = retention(2);
    soil.n = retention(3);
  } else if (model == kRetentions[kBrooksCoreyModel].name) {
    soil.retention = Soil::Retention::BrooksCorey;
    soil.thetaR = retention(1);
    soil.airEntry = retention(2);
    soil.lambda = retention(3);
  } else {
    soil.retention = Soil::Retention::Campbell;
    soil.airEntry = retention(1);
    soil.lambda = 1 / retention(2);
  }
  soil.ks = entry.Number(kConductivityField, 0);
  const double second = entry.Number(kConductivityField, 1);
  if (entry.fields[kConductivityField].text == kConductivities[kMualemModel].name) {
    soil.poreConnectivity = second;
  } else {
    soil.conductivity = Soil::Conductivity::PowerLaw;
    soil.exponent = second;
  }
  return soil;
}

// ---- Curves

double EffectiveSaturation(const Soil& soil, double suction) {
  if (!(suction > 0)) return 1;
  // van Genuchten (1980): A closed-form equation for predicting the hydraulic conductivity of unsaturated soils. Soil
  // Science Society of America Journal 44, with m = 1 - 1/n.
  if (soil.retention == Soil::Retention::VanGenuchten)
    return std::pow(1 + std::pow(soil.alpha * suction, soil.n), 1 / soil.n - 1);
  // Brooks and Corey (1964): Hydraulic properties of porous media. Hydrology Papers 3, Colorado State University; and
  // Campbell (1974): A simple method for determining unsaturated conductivity from moisture retention data. Soil
  // Science 117, the same without a residual water content.
  return suction <= soil.airEntry ? 1 : std::pow(suction / soil.airEntry, -soil.lambda);
}

double WaterContent(const Soil& soil, double suction) {
  return soil.thetaR + (soil.thetaS - soil.thetaR) * EffectiveSaturation(soil, suction);
}

double ConductivityAt(const Soil& soil, double suction) {
  const double saturation = EffectiveSaturation(soil, suction);
  // Averjanov (1950), as in Kutilek and Nielsen (1994): Soil Hydrology.
  if (soil.conductivity == Soil::Conductivity::PowerLaw) return soil.ks * std::pow(saturation, soil.exponent);
  // Mualem (1976): A new model for predicting the hydraulic conductivity of unsaturated porous media. Water Resources
  // Research 12. Its integral is closed for both kinds of retention.
  if (soil.retention != Soil::Retention::VanGenuchten)
    return soil.ks * std::pow(saturation, soil.poreConnectivity + 2 + 2 / soil.lambda);
  const double m = 1 - 1 / soil.n;
  // 1 - (1 - x)^m for small x, where the difference would lose all digits.
  const double opened = -std::expm1(m * std::log1p(-std::pow(saturation, 1 / m)));
  return soil.ks * std::pow(saturation, soil.poreConnectivity) * opened * opened;
}

// ---- Files

std::optional<Soil> FindSoil(const std::string& path, std::string_view soil) {
  const auto reading = ReadLibraryOnce(kSoilLibrary, path);
  const auto place = reading->library.Find(soil);
  return place ? SoilOf(reading->library.entries[*place]) : std::nullopt;
}

bool IsSoilDBFileValid(const std::string& path, std::string_view soil) { return WhySoilNotValid(path, soil).empty(); }

std::string WhySoilNotValid(const std::string& path, std::string_view soil) {
  const auto reading = ReadLibraryOnce(kSoilLibrary, path);
  if (!reading->problem.empty()) return reading->problem;
  return reading->library.Find(soil) ? std::string() : WhyNoEntry(path, reading->library, soil);
}

std::string FaultOfSoil(const std::string& path, std::string_view soil) {
  const auto reading = ReadLibraryOnce(kSoilLibrary, path);
  return reading->library.Find(soil) ? WhyNoEntry(path, reading->library, soil) : std::string();
}

// ---- Texture classes

std::span<const SoilTexture> SoilTextures() { return kSoilTextures; }

void SetFromTexture(LibraryEntry& soil, const SoilTexture& texture) {
  constexpr double kPerCentimetre = 100;              // in 1/m
  constexpr double kCentimetrePerHour = 0.01 / 3600;  // in m/s
  constexpr double kDensityOfQuartz = 2650;           // in kg/m^3
  soil.fields[kSoilSource].text = fmt::format("Carsel and Parrish (1988), {}", LowerCase(texture.name));
  const auto set = [&soil](SoilField field, std::string_view model, std::vector<KeyNumber<double>> numbers) {
    soil.fields[field].text = model;
    soil.fields[field].isThere = true;
    soil.fields[field].numbers = std::move(numbers);
    // What stood behind the numbers of another model says nothing here.
    soil.fields[field].more.clear();
  };
  set(kRetentionField, kRetentions[kVanGenuchtenModel].name,
      {texture.thetaS, texture.thetaR, RoundedToFour(texture.alpha * kPerCentimetre), texture.n});
  set(kConductivityField, kConductivities[kMualemModel].name, {RoundedToFour(texture.ks * kCentimetrePerHour), 0.5});
  set(kBulkDensityField, {}, {RoundedToFour((1 - texture.thetaS) * kDensityOfQuartz)});
}

}  // namespace tervane
