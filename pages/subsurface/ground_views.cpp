// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/ground_views.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <limits>

#include <fmt/format.h>

#include "pages/parts/domain_map.h"
#include "pages/parts/plot_content.h"
#include "pages/parts/well_map.h"
#include "spatial/domain.h"
#include "subsurface/geology.h"
#include "subsurface/ground_layers.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"

namespace tervane {

namespace {

constexpr double kNone = std::numeric_limits<double>::quiet_NaN();

/// What stands at one place, where all that it asks is computed.
class ColumnReader {
 public:
  ColumnReader(const CSatZoneKvf& zone, MapPoint place) : zone_(zone), points_{{0, place}} {
    auto* topography = zone.Important(kTopography);
    if (topography) ground_ = At(*topography, kNone);
  }

  double Ground() const { return ground_; }
  /// What is not there yet; while there is something, the rest is not to be used.
  Awaited& WaitsFor() { return awaited_; }

  /// A level in metres.
  double At(CData2DKvf& quantity, double ground) {
    std::string problem;
    const auto level = LevelOf(quantity, awaited_, problem);
    return level ? ElevationsAlong(*level, points_, {ground}, GridSampling::Nearest).front() : kNone;
  }
  /// The value of a quantity of an item, in its base unit; none where the item has none that takes part.
  double Value(const CYbSEKvfBase& item, std::string_view section) {
    CData2DKvf* quantity = PropertyOf(item, section);
    if (!quantity || !quantity->IsDlgUsedInSetup()) return kNone;
    std::string problem;
    const auto level = LevelOf(*quantity, awaited_, problem);
    if (!level) return kNone;
    return level->grid ? ValuesAlong(*level->grid, points_, GridSampling::Nearest).front() : double{level->value};
  }

  std::vector<ColumnPart> Parts() {
    std::vector<ColumnPart> parts;
    double above = ground_;
    for (const GroundBody& layer : GeologicalLayersOf(zone_)) {
      ColumnPart& part = parts.emplace_back(PartOf("Layer", layer, above, BottomOf(layer)));
      if (part.bottom > above) part.remark += "Its level lies above the one above it. ";
      if (!std::isnan(part.bottom)) above = std::min(part.bottom, std::isnan(above) ? part.bottom : above);
    }
    for (const GroundBody& lense : GeologicalLensesOf(zone_)) {
      const double extent = lense.extent ? Value(*lense.node, "HorBoundary") : kNone;
      if (std::isnan(extent) || extent == 0) continue;
      parts.push_back(PartOf("Lens", lense, lense.top ? At(*lense.top, ground_) : kNone, BottomOf(lense)));
    }
    above = ground_;
    const std::vector<GroundBody> geology = GeologicalLayersOf(zone_);
    std::size_t number = 0;
    for (const GroundBody& layer : ComputationalLayersOf(zone_)) {
      // One that has no level of its own has that of the geological layer beside it.
      const GroundBody* levels = layer.bottom ? &layer : number < geology.size() ? &geology[number] : nullptr;
      ++number;
      ColumnPart part{.kind = "Computed", .name = layer.name, .top = above};
      part.bottom = levels ? BottomOf(*levels) : kNone;
      part.thickness = part.top - part.bottom;
      part.horizontalConductivity = part.verticalConductivity = part.specificYield = part.specificStorage = kNone;
      const double head = layer.head ? At(*layer.head, ground_) : kNone;
      if (!std::isnan(head)) part.remark = fmt::format("Initial head {:.6g} m", head);
      if (head > ground_) part.remark += ", above ground";
      if (part.thickness < static_cast<double>(zone_.MimimumLayerThickness))
        part.remark += part.remark.empty() ? "Thinner than the minimum" : ", thinner than the minimum";
      if (!std::isnan(part.bottom)) above = part.bottom;
      parts.push_back(std::move(part));
    }
    return parts;
  }

 private:
  double BottomOf(const GroundBody& body) { return body.bottom ? At(*body.bottom, ground_) : kNone; }

  ColumnPart PartOf(const char* kind, const GroundBody& body, double top, double bottom) {
    ColumnPart part{.kind = kind, .name = body.name, .top = top, .bottom = bottom, .thickness = top - bottom};
    part.horizontalConductivity = Value(*body.node, "HorHydrCon");
    part.verticalConductivity = Value(*body.node, "VerHydrCon");
    part.specificYield = Value(*body.node, "SpecificYield");
    part.specificStorage = Value(*body.node, "StorageCoef");
    if (const double code = Value(*body.node, "GeoUnit"); !std::isnan(code)) TakeUnit(static_cast<int>(code), part);
    return part;
  }

  void TakeUnit(int code, ColumnPart& part) const {
    part.unit = std::to_string(code);
    const auto* units = zone_.Child<CGeoUnitsSZListKvf>();
    for (int number = 1; units && number <= units->GetItemCount(); ++number) {
      const CGeoUnitsSZItemKvf& unit = *units->GetItem(number);
      if (unit.SoilCode != code) continue;
      part.unit = fmt::format("{} ({})", unit.SoilName, code);
      part.horizontalConductivity = static_cast<double>(unit.HorConduc);
      part.verticalConductivity = static_cast<double>(unit.VerConduc);
      part.specificYield = static_cast<double>(unit.SpecYield);
      part.specificStorage = static_cast<double>(unit.StorageCoef);
      return;
    }
    part.remark += "No unit has this code. ";
  }

  const CSatZoneKvf& zone_;
  std::vector<SectionPoint> points_;
  double ground_ = kNone;
  Awaited awaited_;
};

}  // namespace

std::optional<Level> LevelOf(CData2DKvf& quantity, Awaited& awaited, std::string& problem) {
  Level level;
  level.isAboveGround = quantity.HasRelativeToGround() && quantity.RelativeToGround != 0;
  if (quantity.Type == CData2DKvf::kUniform) {
    level.value = static_cast<double>(quantity.FixedValue);
    return level;
  }
  problem = quantity.WhyFileNotValid();
  const std::shared_ptr<ComputedGrid> grid = problem.empty() ? quantity.GridComputation() : nullptr;
  if (!grid) return std::nullopt;
  level.grid = NowOrAwaited(grid, awaited);
  if (level.grid) return level;
  if (grid->IsDone()) problem = grid->Problem();
  return std::nullopt;
}

/// The thickness of a layer on a map: made again when a level has changed.
struct GroundViews::Thickness {
  Level ground;
  std::vector<Level> bottoms;  ///< Down to that of the layer.
  std::shared_ptr<ComputedGrid> grid;
};

GroundViews::GroundViews(CYbSEDlgBase& page, const CSatZoneKvf& zone)
    : page_(page), zone_(zone), section_(page.Context().syncSoon), question_(page.Context().syncSoon) {}

void GroundViews::Describe(PageForm& form) {
  form.Choice(
          "Map:", [this] { return map_; }, [this](int map) { map_ = map; }, [this] { return MapNames(); })
      .Hint(kViewOnly);
  section_.DescribeButtons(form, {});
  form.Button("Show Column",
              [this] {
                question_.AskPoint("Click the place of the column. Esc gives up.", [this](MapPoint at) { Probe(at); });
              })
      .Beside()
      .ToolTip("Click a place on the map and see all layers below it as a table");
  const Condition isProbed = Sentence("a column is shown", [this] { return place_.has_value(); });
  form.Notice([this] { return probeText_; }).ShownWhen(isProbed);
  table_ = std::make_shared<TableOf<ColumnPart>>(column_);
  table_->ItemName("Part");
  table_->ShowOnly();
  table_->Value("Kind", &ColumnPart::kind).Width(130);
  table_->Value("Name", &ColumnPart::name).Width(130);
  const auto number = [this](const char* head, double ColumnPart::*value, int itemType) {
    table_->Value(head, value).Quantity(itemType).Format("%.6g").Width(90);
  };
  number("Top", &ColumnPart::top, quantity::kElevation);
  number("Bottom", &ColumnPart::bottom, quantity::kElevation);
  number("Thickness", &ColumnPart::thickness, quantity::kLayerThickness);
  number("Horizontal\nconductivity", &ColumnPart::horizontalConductivity, quantity::kHydraulicConductivity);
  number("Vertical\nconductivity", &ColumnPart::verticalConductivity, quantity::kHydraulicConductivity);
  number("Specific\nyield", &ColumnPart::specificYield, quantity::kSpecificYield);
  number("Specific\nstorage", &ColumnPart::specificStorage, quantity::kSpecificStorage);
  table_->Value("Unit", &ColumnPart::unit).Width(100);
  table_->Value("Remark", &ColumnPart::remark).Width(220);
  form.Table(table_).ShownWhen(isProbed);
  form.Map([this] { return Map(); });
  section_.DescribeSection(form, [this] { return Section(); }, {});
}

// ---- The map

std::vector<std::string> GroundViews::MapNames() const {
  std::vector<std::string> names{"Ground"};
  for (const GroundBody& layer : GeologicalLayersOf(zone_)) names.push_back("Thickness of " + layer.name);
  return names;
}

MapContent GroundViews::Map() {
  MapContent map;
  const std::size_t layers = GeologicalLayersOf(zone_).size();
  if (map_ > 0 && static_cast<std::size_t>(map_) <= layers) {
    map = ThicknessMap(static_cast<std::size_t>(map_));
  } else {
    auto* topography = zone_.Important(kTopography);
    const bool isGrid = topography && topography->Type != CData2DKvf::kUniform && topography->WhyFileNotValid().empty();
    map = isGrid ? GridMap(zone_, topography->GridComputation()) : DomainMap(zone_);
    if (isGrid && !map.grids.empty()) map.grids.front().isHillshaded = true;
  }
  section_.PutOn(map);
  question_.PutOn(map);
  if (!map.IsEmpty()) AddWells(map, Wells());
  if (place_ && !map.IsEmpty()) map.points.push_back({.points = {*place_}});
  return map;
}

MapContent GroundViews::ThicknessMap(std::size_t layer) {
  MapContent map;
  auto now = std::make_shared<Thickness>();
  auto* topography = zone_.Important(kTopography);
  std::string problem;
  const auto take = [&](CData2DKvf* quantity) -> std::optional<Level> {
    return quantity ? LevelOf(*quantity, map.awaited, problem) : std::nullopt;
  };
  const auto ground = take(topography);
  const std::vector<GroundBody> layers = GeologicalLayersOf(zone_);
  bool areThere = ground.has_value();
  if (ground) now->ground = *ground;
  for (std::size_t i = 0; i < layer; ++i) {
    const auto bottom = take(layers[i].bottom);
    areThere = areThere && bottom;
    if (bottom) now->bottoms.push_back(*bottom);
  }
  if (!map.awaited.empty()) return map;
  if (!areThere) return GridMap(zone_, nullptr, problem.empty() ? "A level is not known." : problem);
  if (thickness_ && thickness_->ground == now->ground && thickness_->bottoms == now->bottoms)
    return GridMap(zone_, thickness_->grid);
  now->grid = std::make_shared<ComputedGrid>(
      fmt::format("Thickness of {}", layers[layer - 1].name),
      [ground = now->ground, bottoms = now->bottoms](CTvn2DOrthoRotatedGridData& grid, ProgressPart) {
        return FileResult{ThicknessOf(ground, bottoms, grid), {}};
      });
  thickness_ = now;
  return GridMap(zone_, thickness_->grid);
}

// ---- The section

std::vector<CTvnWellData> GroundViews::Wells() const {
  const auto* wells = zone_.Important(kWells);
  CTvnWellDataList list;
  if (zone_.Wells && wells && !wells->Filename.IsEmpty()) list.LoadWellDataFile(wells->Filename.Absolute());
  return list.Wells();
}

SectionContent GroundViews::Section() {
  SectionContent section;
  std::string problem;
  const auto take = [&](CData2DKvf* quantity) -> std::optional<Level> {
    return quantity ? LevelOf(*quantity, section.awaited, problem) : std::nullopt;
  };
  section.ground = take(zone_.Important(kTopography));
  for (const GroundBody& layer : GeologicalLayersOf(zone_))
    if (const auto bottom = take(layer.bottom)) section.surfaces.push_back({layer.name, *bottom});
  for (const GroundBody& lense : GeologicalLensesOf(zone_)) {
    const auto top = take(lense.top), bottom = take(lense.bottom), extent = take(lense.extent);
    const bool isEverywhere = extent && !extent->grid && double{extent->value} != 0;
    if (top && bottom && extent && (extent->grid || isEverywhere))
      section.lenses.push_back({lense.name, *top, *bottom, extent->grid});
  }
  for (const GroundBody& layer : ComputationalLayersOf(zone_)) {
    if (const auto bottom = take(layer.bottom))
      section.curves.push_back({fmt::format("Bottom of {}", layer.name), *bottom, true});
    if (const auto head = take(layer.head)) {
      // Heads that are the same in all layers are one line.
      const bool isNew = std::ranges::none_of(section.curves, [&](const auto& curve) { return curve.level == *head; });
      if (isNew) section.curves.push_back({fmt::format("Initial head in {}", layer.name), *head});
    }
  }
  for (const CTvnWellData& well : Wells())
    for (const CTvnWellFilter& filter : well.filters)
      section.screens.push_back({well.name, well.place, filter.top, filter.bottom});
  if (const auto* domain = zone_.Important(kDomain)) section.screenReach = domain->GetModelGeometry().cellSize;
  section.minimumThickness = static_cast<double>(zone_.MimimumLayerThickness);
  if (section.IsEmpty() && section.awaited.empty() && section.message.empty())
    section.message = problem.empty() ? "The ground or the levels of the layers are not known." : problem;
  return section;
}

// ---- The column

void GroundViews::Probe(MapPoint place) {
  for (;;) {
    ColumnReader reader(zone_, place);
    column_ = reader.Parts();
    if (reader.WaitsFor().empty()) {
      probeText_ = fmt::format("At {:.10g}, {:.10g}: ground {}", place.x, place.y,
                               std::isnan(reader.Ground()) ? "not known" : fmt::format("{:.6g} m", reader.Ground()));
      break;
    }
    for (const auto& computation : reader.WaitsFor())
      if (!page_.Outside().Compute(computation)) return;
  }
  place_ = place;
}

}  // namespace tervane
