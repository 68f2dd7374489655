// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/storing_cost.h"

#include <algorithm>
#include <cmath>
#include <filesystem>

#include <fmt/format.h>

#include "platform/paths.h"
#include "results/storing.h"
#include "simspec/control_parameters.h"
#include "simspec/periods.h"
#include "spatial/domain.h"
#include "subsurface/ground_layers.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/soil_profiles.h"
#include "subsurface/unsaturated_zone.h"

namespace tervane {

namespace {

constexpr double kBytesOfValue = 4;
constexpr double kSecondsOfHour = 3600;

/// The interval that governs a class of files, in hours; null for files that none does.
const float* IntervalOf(const CStoringResultsKvf& storing, StoringClass storingClass) {
  switch (storingClass) {
    case StoringClass::kPrecipitation:
      return &storing.WM_PrecFrequency;
    case StoringClass::kOverland:
      return &storing.WM_OverlandFrequency;
    case StoringClass::kHeads:
      return &storing.WM_FHeadsFrequency;
    case StoringClass::kFluxes:
      return &storing.WM_FluxesFrequency;
    case StoringClass::kHotStart:
      return &storing.HotstartStoringTimestep_Hrs;
    case StoringClass::kWaterQualityUnsaturated:
      return &storing.WQ_UnsaturatedZoneFrequency;
    case StoringClass::kWaterQualityOverland:
      return &storing.WQ_OverlandFrequency;
    case StoringClass::kWaterQualitySaturated:
      return &storing.WQ_SaturatedZoneFrequency;
    case StoringClass::kRiverExchange:
    case StoringClass::kOldResults:
      break;
  }
  return nullptr;
}

/// What has no number in the setup.
const char* UncountedPlaces(ResultGridKind kind) {
  switch (kind) {
    case ResultGridKind::kRiverLinks:
    case ResultGridKind::kRiverLevelPoints:
    case ResultGridKind::kRiverDischargePoints:
      return "river points";
    case ResultGridKind::kSaturatedBoundaryCells:
      return "boundary cells";
    case ResultGridKind::kReservoirSubcatchments:
      return "subcatchments";
    case ResultGridKind::kSimpleOverlandAreas:
      return "overland areas";
    case ResultGridKind::kWaterQualityUnsaturatedNodes:
      return "nodes of water quality";
    default:
      return "values";
  }
}

double DeepestProfile(const CYbSEKvfBase& node) {
  const auto* zone = node.Important(kUnsaturatedZone);
  const auto* profiles = zone ? zone->Child<CUZSoilProfileKvf>() : nullptr;
  double most = 0;
  for (CYbSEKvfBase* child = profiles ? profiles->GetFirstChild() : nullptr; child;
       child = profiles->GetNextChild(child)) {
    const auto* profile = dynamic_cast<const CUZSoilProfilePropKvf*>(child);
    double nodes = 0;
    for (int number = 1; profile && number <= profile->Cells().GetItemCount(); ++number)
      nodes += std::max(profile->Cells().GetItem(number)->NoCells, 0);
    most = std::max(most, nodes);
  }
  return most;
}

}  // namespace

std::optional<double> TypeCost::Bytes() const {
  if (!valuesOfStep || !steps) return std::nullopt;
  return *valuesOfStep * *steps * kBytesOfValue;
}

CostOfTypes::CostOfTypes(const CStoringResultsKvf& storing) : storing_(storing), nodes_(DeepestProfile(storing)) {
  if (const auto* domain = storing.Important(kDomain); domain && domain->HasGeometry())
    cells_ = static_cast<double>(domain->GetModelGeometry().CellCount());
  if (const auto* zone = storing.Important(kSaturatedZone))
    layers_ = static_cast<double>(ComputationalLayersOf(*zone).size());
  if (const auto* control = storing.Important(kOverlandControl); control && control->Multicell)
    cellsOfCoarse_ = static_cast<double>(control->MulticellFactor) * static_cast<double>(control->MulticellFactor);
  if (const auto* period = storing.Important(kSimulationPeriod)) {
    const CYbDateTime start = period->GetSimStartDate();
    if (start.IsValid() && period->SIMEND.IsValid() && start < period->SIMEND)
      hours_ = static_cast<double>((period->SIMEND - start).seconds) / kSecondsOfHour;
  }
}

std::optional<double> CostOfTypes::ValuesOf(const ResultDataType& type, std::string& unknown) const {
  const auto product = [&](double perCell, const char* of) -> std::optional<double> {
    if (cells_ > 0 && perCell > 0) return cells_ * perCell;
    unknown = fmt::format("the number of {} is not known", cells_ > 0 ? of : "cells");
    return std::nullopt;
  };
  switch (type.gridKind) {
    case ResultGridKind::kCells:
    case ResultGridKind::kUnsaturatedColumns:
      return product(1, "cells");
    case ResultGridKind::kSaturatedLayers:
      return product(layers_, "layers");
    case ResultGridKind::kUnsaturatedNodes:
      return product(nodes_, "nodes in the soil");
    case ResultGridKind::kMultiCellGrid:
      return product(cellsOfCoarse_, "cells");
    default:
      unknown = fmt::format("the number of {} is not known", UncountedPlaces(type.gridKind));
      return std::nullopt;
  }
}

TypeCost CostOfTypes::Of(const ResultDataType& type) const {
  TypeCost cost{&type, {}, {}};
  cost.valuesOfStep = ValuesOf(type, cost.unknown);
  const ResultFile* file = ResultCatalogue::Own().FileOf(type);
  const float* interval = file ? IntervalOf(storing_, file->storingClass) : nullptr;
  // A step that the simulation does not finish is not stored.
  if (interval && *interval > 0 && hours_ > 0)
    cost.steps = std::floor(hours_ / static_cast<double>(*interval) * (1 + 1e-9));
  else if (cost.unknown.empty())
    cost.unknown = interval ? "the period or the storing interval is none" : "no storing interval governs it";
  return cost;
}

StoringCost ForecastCost(const CStoringResultsKvf& storing, const std::vector<GridSeriesRow>& rows) {
  const CostOfTypes costs(storing);
  const ResultCatalogue& catalogue = ResultCatalogue::Own();
  StoringCost cost;
  std::vector<FileCost> files(AllResultFiles().size());
  for (const GridSeriesRow& row : rows) {
    const ResultFile* file = catalogue.FileOf(*row.type);
    if (!row.IsStored() || !file) continue;
    const TypeCost& type = cost.types.emplace_back(costs.Of(*row.type));
    FileCost& ofFile = files[static_cast<std::size_t>(file->code) - 1];
    ofFile.file = file;
    ++ofFile.types;
    const std::optional<double> bytes = type.Bytes();
    if (!bytes) ++ofFile.unknownTypes, ++cost.unknownTypes;
    ofFile.bytes += bytes.value_or(0);
    cost.bytes += bytes.value_or(0);
  }
  std::ranges::copy_if(files, std::back_inserter(cost.files), [](const FileCost& file) { return file.types > 0; });
  return cost;
}

std::string StoringCost::Text() const {
  if (types.empty()) return "Nothing is stored.";
  std::string text = fmt::format("{} in {} file{}", SizeInWords(bytes), files.size(), files.size() == 1 ? "" : "s");
  if (unknownTypes > 0)
    text += fmt::format(", and {} type{} whose size is not known", unknownTypes, unknownTypes == 1 ? "" : "s");
  return text;
}

std::optional<double> FreeBytesAt(const std::string& folder) {
  std::error_code error;
  std::filesystem::path place = NativePath(folder);
  // The folder of the results may still have to be made.
  while (!place.empty() && !std::filesystem::exists(place, error)) {
    const std::filesystem::path above = place.parent_path();
    if (above == place) break;
    place = above;
  }
  if (place.empty()) return std::nullopt;
  const std::filesystem::space_info space = std::filesystem::space(place, error);
  if (error) return std::nullopt;
  return static_cast<double>(space.available);
}

std::string SizeInWords(double bytes) {
  constexpr const char* kUnits[] = {"KB", "MB", "GB", "TB", "PB"};
  constexpr double kStep = 1024;
  if (bytes < kStep) return fmt::format("{:.0f} bytes", bytes);
  std::size_t unit = 0;
  for (bytes /= kStep; bytes >= kStep && unit + 1 < std::size(kUnits); ++unit) bytes /= kStep;
  return fmt::format("{:.{}f} {}", bytes, bytes < 10 ? 1 : 0, kUnits[unit]);
}

}  // namespace tervane
