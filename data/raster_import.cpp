// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/raster_import.h"

#include <algorithm>
#include <cmath>
#include <memory>
#include <new>
#include <set>
#include <utility>

#include <fmt/format.h>

#include "data/datafile.h"
#include "data/import_unit.h"
#include "geometry/cart.h"
#include "platform/item_types.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// One import, step by step; `report` gets what the user should know.
class Import {
 public:
  Import(const std::string& path, const RasterImport& wanted, RasterImportReport& report)
      : path_(path), wanted_(wanted), report_(report) {}

  std::string Run(CTvn2DOrthoRotatedGridData& grid);

 private:
  std::string FindBand();
  /// Puts the values on the cells of the raster itself; why that will not do, or nothing.
  std::string TakeOwnGeometry();
  std::string TakeOwnCells();
  std::string PutOnGrid();
  std::string CompareProjections(std::unique_ptr<CYbProjectionChange>& change);
  bool AreCodes() const;
  std::string TakeUnitOfBand(const ItemType& type, NewItem& item);
  std::string CountValues(const ItemType& type);

  const std::string& path_;
  const RasterImport& wanted_;
  RasterImportReport& report_;
  RasterFile file_;
  const RasterBand* band_ = nullptr;
  GridGeometry geometry_;
  std::vector<float> values_;
};

std::string Import::FindBand() {
  const std::vector<RasterBand>& bands = file_.Facts().bands;
  if (wanted_.band == 0 && bands.size() == 1) {
    band_ = &bands.front();
    return {};
  }
  std::string names;
  for (const RasterBand& band : bands) {
    if (band.number == wanted_.band) band_ = &band;
    names += fmt::format("{}{} \"{}\"", names.empty() ? "" : ", ", band.number, band.name);
  }
  if (band_ != nullptr) return {};
  return wanted_.band == 0 ? fmt::format("{}: it has the bands {}: tell which", path_, names)
                           : fmt::format("{}: there is no band {}, but {}", path_, wanted_.band, names);
}

std::string Import::TakeOwnGeometry() {
  const FileGeometry& geometry = file_.Facts().geometry;
  if (!geometry.IsPlaced()) return "it has no place on the map; give it one by a world file beside it";
  if (geometry.isGeographical) return "its cells are in degrees, those of a model in meters; put it on a model grid";
  if (const std::string reason = ToModelGrid(geometry, geometry_); !reason.empty())
    return fmt::format("it has {}; put it on a model grid", reason);
  return geometry_.Problem();
}

std::string Import::TakeOwnCells() {
  const FileGeometry& g = file_.Facts().geometry;
  if (const std::string reason = TakeOwnGeometry(); !reason.empty()) return fmt::format("{}: {}", path_, reason);
  values_.resize(geometry_.CellCount());
  return file_.Read(band_->number, {0, 0, g.nx, g.ny}, values_);
}

/// Sets how the raster's projection is changed to the grid's, where both are known and differ.
std::string Import::CompareProjections(std::unique_ptr<CYbProjectionChange>& change) {
  const CYbMapProjection own(file_.Facts().geometry.projection), other(geometry_.projection);
  const auto isKnown = [](const CYbMapProjection& projection) {
    return !projection.IsLocal() && projection.Problem().empty();
  };
  if (isKnown(own) && isKnown(other)) {
    if (own.IsSameAs(other)) return {};
    change = std::make_unique<CYbProjectionChange>(own.Text(), other.Text());
    if (!change->Problem().empty()) return fmt::format("{}: {}", path_, change->Problem());
    report_.notes.push_back(fmt::format("changed from {} to {}", own.Name(), other.Name()));
    return {};
  }
  if (isKnown(own) || isKnown(other)) {
    report_.warnings.push_back(fmt::format("{} has no known projection, so that its coordinates are taken as {}",
                                           isKnown(own) ? "the model grid" : "the raster",
                                           isKnown(own) ? own.Name() : other.Name()));
  }
  return {};
}

bool Import::AreCodes() const {
  constexpr std::size_t kMostClasses = 100;
  constexpr int kPiece = 1 << 20;
  if (wanted_.itemType == quantity::kCode) return true;
  if (wanted_.itemType != quantity::kUndefined || !band_->isWhole) return false;
  const FileGeometry& geometry = file_.Facts().geometry;
  const int rows = std::clamp(kPiece / geometry.nx, 1, geometry.ny);
  std::set<float> classes;
  std::vector<float> values;
  for (int j = 0; j < geometry.ny; j += rows) {
    const CellWindow window{0, j, geometry.nx, std::min(rows, geometry.ny - j)};
    values.resize(window.CellCount());
    // What cannot be read here is told where it is read for its values.
    if (!file_.Read(band_->number, window, values).empty()) return false;
    float last = kDeleteValue;
    for (const float value : values) {
      if (value == last || value == kDeleteValue) continue;
      classes.insert(last = value);
      if (classes.size() > kMostClasses) return false;
    }
  }
  return true;
}

std::string Import::PutOnGrid() {
  geometry_ = *wanted_.grid;
  if (const std::string problem = geometry_.Problem(); !problem.empty()) return "the model grid: " + problem;
  if (!file_.Facts().geometry.IsPlaced()) {
    return fmt::format("{}: it has no place on the map; give it one by a world file beside it", path_);
  }
  std::unique_ptr<CYbProjectionChange> change;
  if (std::string error = CompareProjections(change); !error.empty()) return error;
  ResamplingTask task;
  task.raster = file_.Facts().geometry;
  task.read = [this](const CellWindow& window, std::span<float> values) {
    return file_.Read(band_->number, window, values);
  };
  task.grid = geometry_;
  task.change = change.get();
  report_.resampling = wanted_.resampling ? *wanted_.resampling : SuitableResampling(task, AreCodes());
  return Resample(task, report_.resampling, values_);
}

std::string Import::TakeUnitOfBand(const ItemType& type, NewItem& item) {
  if (!wanted_.unit.empty()) return TakeUnit(wanted_.unit, type, item, values_);
  // A code has no unit, whatever a raster says.
  const std::string reason =
      TakeUnit(type.code == quantity::kCode ? std::string() : band_->unitText, type, item, values_);
  if (!reason.empty()) return fmt::format("{}: its unit: {}; name the right one", path_, reason);
  if (band_->unitText.empty() && type.code != quantity::kUndefined && type.code != quantity::kCode) {
    report_.notes.push_back(fmt::format("it names no unit: its values are taken as {}", BaseUnit(type).text));
  }
  return {};
}

std::string Import::CountValues(const ItemType& type) {
  for (const float value : values_) {
    if (value == kDeleteValue) {
      ++report_.empty;
      continue;
    }
    ++report_.values;
    if (type.code == quantity::kCode && value != std::trunc(value)) {
      return fmt::format("{}: {} is no code: whole numbers were expected", path_, ShortestNumber(value));
    }
  }
  if (report_.values > 0) return {};
  return wanted_.grid ? fmt::format("{}: it has no value within the model grid", path_)
                      : fmt::format("{}: it has no values", path_);
}

std::string Import::Run(CTvn2DOrthoRotatedGridData& grid) {
  const ItemType* type = FindItemType(wanted_.itemType);
  if (type == nullptr) return fmt::format("there is no item type {}", wanted_.itemType);
  if (std::string error = file_.Open(path_); !error.empty()) return error;
  for (const std::string& note : file_.Facts().notes) report_.notes.push_back(note);
  if (std::string error = FindBand(); !error.empty()) return error;
  if (std::string error = wanted_.grid ? PutOnGrid() : TakeOwnCells(); !error.empty()) return error;
  NewItem item{band_->name, type->code, 0, ValueType::Instantaneous};
  if (std::string error = TakeUnitOfBand(*type, item); !error.empty()) return error;
  if (std::string error = CountValues(*type); !error.empty()) return error;
  std::string problem =
      grid.TakeValues(std::move(geometry_), std::move(values_), kDeleteValue, item.unitKey, item.itemType);
  if (problem.empty()) grid.SetItemName(item.name);
  return problem;
}

}  // namespace

RasterImportReport ImportRaster(const std::string& path, const RasterImport& import, CTvn2DOrthoRotatedGridData& grid) {
  RasterImportReport report;
  try {
    report.error = Import(path, import, report).Run(grid);
  } catch (const std::bad_alloc&) {
    report.error = fmt::format("cannot read {}: it needs more than the free memory", path);
  }
  return report;
}

}  // namespace tervane
