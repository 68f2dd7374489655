// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "modelcells/model_layers.h"

#include <cmath>
#include <map>
#include <optional>

#include <fmt/format.h>

#include "data/datafile_writer.h"
#include "data/grid_files.h"
#include "libraries/wells.h"
#include "modelcells/model_grids.h"
#include "platform/item_types.h"
#include "spatial/domain_cells.h"
#include "subsurface/computational_layers.h"
#include "subsurface/ground_layers.h"
#include "subsurface/internal_boundary.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

namespace {

constexpr int kMetre = 1000;

void EmptyOutside(const CTvn2DOrthoRotatedGridData& domain, std::vector<float>& values) {
  for (std::size_t cell = 0; cell < values.size(); ++cell)
    if (domain.IsEmptyValue(domain.Values()[cell])) values[cell] = kDeleteValue;
}

}  // namespace

std::string ElevationsOn(const CTvn2DOrthoRotatedGridData& domain, const CData2DKvf& quantity,
                         const std::vector<float>& ground, std::vector<float>& elevations) {
  CTvn2DOrthoRotatedGridData grid;
  if (const FileResult made = MakeQuantity(quantity, domain.Geometry())(grid); !made.Ok()) return made.error;
  if (std::string problem = PutOnModel(grid, domain.Geometry(), false, elevations); !problem.empty()) return problem;
  if (quantity.HasRelativeToGround() && quantity.RelativeToGround != 0)
    for (std::size_t cell = 0; cell < elevations.size(); ++cell)
      if (elevations[cell] != kDeleteValue)
        elevations[cell] = ground[cell] == kDeleteValue ? kDeleteValue : ground[cell] + elevations[cell];
  EmptyOutside(domain, elevations);
  return {};
}

bool ModelLayers::Make(const CSatZoneKvf& zone, const CTvn2DOrthoRotatedGridData& domain, WorkLog& log,
                       ThinCells thin) {
  *this = {};
  const std::vector<GroundBody> layers = ComputationalLayersOf(zone), geology = GeologicalLayersOf(zone);
  const auto* topography = zone.Important(kTopography);
  if (layers.empty() || !topography) return true;
  const auto take = [&](const CData2DKvf& quantity, std::vector<float>& levels) {
    const std::string problem = ElevationsOn(domain, quantity, ground_, levels);
    if (!problem.empty()) log.Error(PathOf(quantity), problem);
    return problem.empty();
  };
  if (!take(*topography, ground_)) return false;
  std::size_t corrected = 0;
  for (std::size_t number = 0; number < layers.size(); ++number) {
    const CData2DKvf* bottom = layers[number].bottom;
    // One that follows the geology has its level.
    if (!bottom && number < geology.size()) bottom = geology[number].bottom;
    // More layers than the geology has: the setup says so in a warning.
    if (!bottom) break;
    std::vector<float> levels;
    if (!take(*bottom, levels)) return false;
    const std::vector<float>& above = bottoms_.empty() ? ground_ : bottoms_.back();
    for (std::size_t cell = 0; cell < levels.size(); ++cell) {
      if (levels[cell] == kDeleteValue || above[cell] == kDeleteValue) continue;
      const float lowest = above[cell] - zone.MimimumLayerThickness;
      if (levels[cell] <= lowest) continue;
      levels[cell] = thin == ThinCells::EndLower ? lowest : above[cell];
      ++corrected;
    }
    bottoms_.push_back(std::move(levels));
  }
  if (corrected > 0)
    log.Warning(PathOf(zone) + ":MimimumLayerThickness",
                fmt::format("{} cells of computational layers were thinner than {} m and {} now", corrected,
                            zone.MimimumLayerThickness, thin == ThinCells::EndLower ? "end lower" : "are passed over"));
  return true;
}

double ModelLayers::Thickness(int layer, std::size_t cell) const {
  const float top = Tops(layer)[cell], bottom = Bottoms(layer)[cell];
  return top == kDeleteValue || bottom == kDeleteValue ? 0 : static_cast<double>(top - bottom);
}

FileResult ModelLayers::Write(const std::string& path, const CTvn2DOrthoRotatedGridData& domain) const {
  NewDataFile content;
  content.dimensions = 3;
  content.geometry = FileGeometryOf(domain.Geometry());
  content.geometry.nz = Count();
  content.hasTime = false;
  content.items = {{"Lower level of computational layers", quantity::kElevation, kMetre},
                   {"Upper level of computational layers", quantity::kElevation, kMetre}};
  DataFileWriter writer;
  std::string error = writer.Create(path, content);
  for (int number = 0; number < Count() && error.empty(); ++number) {
    const auto place = static_cast<std::size_t>(number);
    const int layer = Count() - 1 - number;
    error = writer.PutLayer(kLowerLevels, layer, bottoms_[place]);
    if (error.empty()) error = writer.PutLayer(kUpperLevels, layer, number == 0 ? ground_ : bottoms_[place - 1]);
  }
  return error.empty() ? writer.Finish() : FileResult{error, {}};
}

std::pair<int, int> ModelLayers::LayersBetween(std::size_t cell, double top, double bottom) const {
  std::pair<int, int> met{0, 0};
  for (std::size_t number = 0; number < bottoms_.size(); ++number) {
    const float upper = number == 0 ? ground_[cell] : bottoms_[number - 1][cell], lower = bottoms_[number][cell];
    if (upper == kDeleteValue || lower == kDeleteValue) continue;
    if (top <= static_cast<double>(lower) || bottom >= static_cast<double>(upper)) continue;
    if (met.first == 0) met.first = static_cast<int>(number) + 1;
    met.second = static_cast<int>(number) + 1;
  }
  return met;
}

// ---- Boundaries

std::string boundary_code::NameOf(int code) {
  if (code == kInside) return "inside";
  if (code == kUnconditioned) return "outer boundary without a condition";
  for (const KeyChoice& type : CGeoDataBoundCondItemKvf::kBoundaryTypes)
    if (code == kOuter + type.value) return fmt::format("outer boundary: {}", type.text);
  for (const KeyChoice& type : CSZVerDiscrInternalBoundaryPropKvf::kBoundaryTypes)
    if (code == kInner + type.value) return fmt::format("internal boundary: {}", type.text);
  return std::to_string(code);
}

namespace {

/// The boundary as `paint` shows it, on the cells of the domain. A domain that cannot be traced has none; the setup
/// says so.
template <class Paint>
std::vector<float> PaintedBoundary(const CGeoDataBoundCondListKvf& boundary, std::size_t cells, const Paint& paint) {
  const auto trace = boundary.Trace();
  if (boundary.GetItemCount() == 0 || !trace) return {};
  trace->Run();
  const auto* traced = boundary.GetCatchmentData();
  if (!traced || traced->Values().size() != cells) return {};
  CGeoDataBoundCondCatchmentData painted = *traced;
  paint(painted, boundary.Segments());
  return painted.Values();
}

}  // namespace

std::vector<int> SegmentsOnCells(const CGeoDataBoundCondListKvf& boundary, const CTvn2DOrthoRotatedGridData& domain) {
  std::vector<int> segments(domain.Geometry().CellCount(), kNoSegment);
  const std::vector<float> painted = PaintedBoundary(
      boundary, segments.size(), [](auto& grid, const auto& items) { grid.PaintBoundaryNumbers(items); });
  // They are painted from 1.
  for (std::size_t cell = 0; cell < painted.size(); ++cell)
    if (painted[cell] >= 1) segments[cell] = static_cast<int>(std::lround(painted[cell])) - 1;
  return segments;
}

FileResult ZonesOnCells(const CSZVerDiscrInternalBoundaryKvf& boundary, const CTvn2DOrthoRotatedGridData& domain,
                        BoundaryZones& zones) {
  zones.zoneOfCell.assign(domain.Geometry().CellCount(), BoundaryZones::kNone);
  zones.zones.clear();
  const GridSource source = boundary.CurrentSource();
  if (!boundary.IsInForce() || source.file.empty()) return {};
  AreaCodes areas;
  if (FileResult read = ReadAreaCodes(source, {}, areas); !read.Ok()) return read;
  std::map<std::string, int> placeOfId;
  for (const CFMSEKvfGroupBase* item : ZoneItems(boundary))
    if (const auto* zone = dynamic_cast<const CSZVerDiscrInternalBoundaryPropKvf*>(item)) {
      placeOfId[areas.arePolygons ? zone->GetStationId() : std::to_string(zone->StationCode())] =
          static_cast<int>(zones.zones.size());
      zones.zones.push_back(zone);
    }
  const std::vector<std::optional<float>> found = ValuesIn(domain, areas.grid);
  std::size_t inDomain = 0;
  for (std::size_t cell = 0; cell < zones.zoneOfCell.size(); ++cell) {
    if (domain.IsEmptyValue(domain.Values()[cell])) continue;
    const std::optional<float>& code = found[inDomain++];
    const auto place = code ? placeOfId.find(areas.IdOf(*code)) : placeOfId.end();
    if (place != placeOfId.end()) zones.zoneOfCell[cell] = place->second;
  }
  return {};
}

FileResult BoundaryCodes(const CSZVerDiscrLayerKvf& layer, const CTvn2DOrthoRotatedGridData& domain,
                         CTvn2DOrthoRotatedGridData& codes) {
  std::vector<float> values = domain.Values();
  for (float& value : values) value = domain.IsEmptyValue(value) ? kDeleteValue : std::floor(value + 0.5F);
  if (layer.OuterBoundary().IsDataUsedInSetup()) {
    const std::vector<float> painted = PaintedBoundary(
        layer.OuterBoundary(), values.size(), [](auto& grid, const auto& items) { grid.PaintBoundaryTypes(items); });
    for (std::size_t cell = 0; cell < painted.size(); ++cell)
      if (painted[cell] >= 0) values[cell] = static_cast<float>(boundary_code::kOuter) + painted[cell];
  }
  auto* inner = layer.Child<CSZVerDiscrInternalBoundaryKvf>();
  BoundaryZones zones;
  if (inner && inner->IsDataUsedInSetup())
    if (FileResult read = ZonesOnCells(*inner, domain, zones); !read.Ok()) return read;
  for (std::size_t cell = 0; cell < zones.zoneOfCell.size(); ++cell) {
    const auto* zone = zones.At(cell);
    if (zone && zone->BoundaryType != CSZVerDiscrInternalBoundaryPropKvf::kNone)
      values[cell] = static_cast<float>(boundary_code::kInner + zone->BoundaryType);
  }
  return {codes.TakeValues(domain.Geometry(), std::move(values), kDeleteValue, kDimensionlessUnit, quantity::kCode),
          {}};
}

// ---- Wells

std::string WellsOnModel(const std::string& path, const CTvn2DOrthoRotatedGridData& domain, const ModelLayers& layers,
                         const std::string& place, WorkLog& log) {
  CTvnWellDataList list;
  if (!list.LoadWellDataFile(path)) {
    log.Warning(place, list.Problem());
    return list.Problem();
  }
  constexpr std::size_t kMostLines = 1000;
  const GridGeometry& geometry = domain.Geometry();
  const GridTransform transform(geometry);
  std::string text;
  std::size_t lines = 0, outside = 0, withoutLayer = 0;
  std::string firstOutside, firstWithoutLayer;
  for (const CTvnWellData& well : list.Wells()) {
    const MapPoint at = transform.ToCells(well.place);
    const bool isOnGrid = at.x >= 0 && at.y >= 0 && at.x < geometry.nx && at.y < geometry.ny;
    const int i = isOnGrid ? static_cast<int>(at.x) : 0, j = isOnGrid ? static_cast<int>(at.y) : 0;
    if (!isOnGrid || domain.IsEmptyValue(domain.Value(i, j))) {
      if (outside++ == 0) firstOutside = well.name;
      continue;
    }
    const auto cell = static_cast<std::size_t>(j) * static_cast<std::size_t>(geometry.nx) + static_cast<std::size_t>(i);
    int number = 0;
    for (const CTvnWellFilter& filter : well.filters) {
      ++number;
      const auto [first, last] = layers.LayersBetween(cell, filter.top, filter.bottom);
      if (first == 0 && !layers.IsEmpty() && withoutLayer++ == 0)
        firstWithoutLayer = fmt::format("filter {} of {}", number, well.name);
      if (++lines > kMostLines) continue;
      text += fmt::format("{}, filter {}: column {}, row {} from the south, {}\n", well.name, number, i + 1, j + 1,
                          first == 0      ? "no layer"
                          : first == last ? fmt::format("layer {}", first)
                                          : fmt::format("layers {} to {}", first, last));
    }
  }
  if (lines > kMostLines) text += fmt::format("and {} filters more\n", lines - kMostLines);
  if (outside > 0)
    log.Warning(place, fmt::format("{} wells lie outside the model, the first is {}: they pump nothing", outside,
                                   firstOutside));
  if (withoutLayer > 0)
    log.Warning(place, fmt::format("{} filters of wells lie in no computational layer, the first is {}", withoutLayer,
                                   firstWithoutLayer));
  return text.empty() ? "No well has a filter in the model." : text;
}

}  // namespace tervane
