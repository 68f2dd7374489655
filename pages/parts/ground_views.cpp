// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/ground_views.h"

#include <cmath>

#include <fmt/format.h>

#include "pages/parts/domain_map.h"
#include "pages/parts/ground_level.h"
#include "pages/parts/ground_section.h"
#include "pages/parts/plot_content.h"
#include "pages/parts/well_map.h"
#include "platform/item_types.h"
#include "spatial/domain.h"
#include "subsurface/ground_layers.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

/// The thickness of a layer on a map: made again when a level has changed.
struct GroundViews::Thickness {
  Level ground;
  std::vector<Level> bottoms;  ///< Down to that of the layer.
  std::shared_ptr<ComputedGrid> grid;
};

namespace {

/// The zone that a node is, or that it stands below; none for a quantity of it that is no level.
const CSatZoneKvf* ZoneOf(const CYbSEKvfBase& node) {
  const auto* quantity = dynamic_cast<const CData2DKvf*>(&node);
  if (quantity && quantity->Kind().itemType != quantity::kElevation) return nullptr;
  for (const CYbSEKvfBase* above = &node; above; above = above->GetParent())
    if (const auto* zone = dynamic_cast<const CSatZoneKvf*>(above)) return zone;
  return nullptr;
}

}  // namespace

GroundViews::GroundViews(CYbSEDlgBase& page)
    : page_(page),
      zone_(ZoneOf(page.Node())),
      soils_(page.Node()),
      section_(page.Context().syncSoon),
      question_(page.Context().syncSoon) {}

void GroundViews::Describe(PageForm& form) {
  if (!zone_) return;
  const Condition hasMap = Sentence("the model domain or the ground has a file", [this] { return HasMap(); });
  form.Choice(
          "Map:", [this] { return map_; }, [this](int map) { map_ = map; }, [this] { return MapNames(); })
      .Hint(kViewOnly)
      .ShownWhen(hasMap);
  DescribeButtons(form, hasMap);
  form.Map([this] { return Map(); }).ShownWhen(hasMap);
  DescribeSection(form, hasMap);
}

void GroundViews::DescribeButtons(PageForm& form, const Condition& isOffered) {
  if (!zone_) return;
  section_.DescribeButtons(form, isOffered);
  form.Button("Show Column",
              [this] {
                question_.AskPoint("Click the place of the column. Esc gives up.", [this](MapPoint at) { Probe(at); });
              })
      .Beside()
      .ToolTip("Click a place on the map and see all layers below it as a table")
      .ShownWhen(isOffered);
  const Condition isProbed = Sentence("a column is shown", [this] { return place_.has_value(); });
  form.Notice([this] { return probeText_; }).ShownWhen(isProbed && isOffered);
  form.Table(ColumnTable()).ShownWhen(isProbed && isOffered);
}

void GroundViews::DescribeSection(PageForm& form, const Condition& isOffered) {
  if (!zone_) return;
  section_.DescribeSection(
      form, [this] { return SectionOf(*zone_, soils_); }, isOffered);
}

void GroundViews::PutOn(MapContent& map) const {
  if (!zone_) return;
  section_.PutOn(map);
  question_.PutOn(map);
  if (map.IsEmpty()) return;
  AddWells(map, WellsOf(*zone_).Wells());
  if (place_) map.points.push_back({.points = {*place_}});
}

std::shared_ptr<TableOf<ColumnPart>> GroundViews::ColumnTable() {
  auto table = std::make_shared<TableOf<ColumnPart>>(column_);
  table->ItemName("Part");
  table->ShowOnly();
  table->Value("Kind", &ColumnPart::kind).Width(90);
  table->Value("Name", &ColumnPart::name).Width(130);
  const auto number = [&table](const char* head, double ColumnPart::*value, int itemType) {
    table->Value(head, value).Quantity(itemType).Format("%.6g").Width(90);
  };
  number("Top", &ColumnPart::top, quantity::kElevation);
  number("Bottom", &ColumnPart::bottom, quantity::kElevation);
  number("Thickness", &ColumnPart::thickness, quantity::kLayerThickness);
  number("Horizontal\nconductivity", &ColumnPart::horizontalConductivity, quantity::kHydraulicConductivity);
  number("Vertical\nconductivity", &ColumnPart::verticalConductivity, quantity::kHydraulicConductivity);
  number("Specific\nyield", &ColumnPart::specificYield, quantity::kSpecificYield);
  number("Specific\nstorage", &ColumnPart::specificStorage, quantity::kSpecificStorage);
  table->Value("Unit\nor zone", &ColumnPart::zone).Width(100);
  table->Value("Remark", &ColumnPart::remark).Width(220);
  return table;
}

// ---- The map

bool GroundViews::HasMap() const {
  const auto* topography = zone_->Important(kTopography);
  if (topography && topography->Type != CData2DKvf::kUniform) return true;
  const auto* domain = zone_->Important(kDomain);
  if (!domain) return false;
  return domain->Type == CCatchmentKvf::kShapeFile ? !domain->ShapeFile().File.IsEmpty()
                                                   : !domain->GridFile().File.IsEmpty();
}

std::vector<std::string> GroundViews::MapNames() const {
  std::vector<std::string> names{"Ground"};
  for (const GroundBody& layer : GeologicalLayersOf(*zone_)) names.push_back("Thickness of " + layer.name);
  return names;
}

MapContent GroundViews::Map() {
  MapContent map;
  const std::size_t layers = GeologicalLayersOf(*zone_).size();
  if (map_ > 0 && static_cast<std::size_t>(map_) <= layers) {
    map = ThicknessMap(static_cast<std::size_t>(map_));
  } else {
    auto* topography = zone_->Important(kTopography);
    const bool isGrid = topography && topography->Type != CData2DKvf::kUniform && topography->WhyFileNotValid().empty();
    map = isGrid ? GridMap(*zone_, topography->GridComputation()) : DomainMap(*zone_);
    if (isGrid && !map.grids.empty()) map.grids.front().isHillshaded = true;
  }
  PutOn(map);
  return map;
}

MapContent GroundViews::ThicknessMap(std::size_t layer) {
  MapContent map;
  auto now = std::make_shared<Thickness>();
  auto* topography = zone_->Important(kTopography);
  std::string problem;
  const auto take = [&](CData2DKvf* quantity) -> std::optional<Level> {
    return quantity ? LevelOf(*quantity, map.awaited, problem) : std::nullopt;
  };
  const auto ground = take(topography);
  const std::vector<GroundBody> layers = GeologicalLayersOf(*zone_);
  bool areThere = ground.has_value();
  if (ground) now->ground = *ground;
  for (std::size_t i = 0; i < layer; ++i) {
    const auto bottom = take(layers[i].bottom);
    areThere = areThere && bottom;
    if (bottom) now->bottoms.push_back(*bottom);
  }
  if (!map.awaited.empty()) return map;
  if (!areThere) return GridMap(*zone_, nullptr, problem.empty() ? "A level is not known." : problem);
  if (thickness_ && thickness_->ground == now->ground && thickness_->bottoms == now->bottoms)
    return GridMap(*zone_, thickness_->grid);
  now->grid = std::make_shared<ComputedGrid>(
      fmt::format("Thickness of {}", layers[layer - 1].name),
      [ground = now->ground, bottoms = now->bottoms](CTvn2DOrthoRotatedGridData& grid, ProgressPart) {
        return FileResult{ThicknessOf(ground, bottoms, grid), {}};
      });
  thickness_ = now;
  return GridMap(*zone_, thickness_->grid);
}

// ---- The column

void GroundViews::Probe(MapPoint place) {
  for (;;) {
    Awaited awaited;
    const GroundColumn column = ColumnAt(*zone_, soils_, place, awaited);
    if (awaited.empty()) {
      column_ = column.parts;
      probeText_ = fmt::format("At {:.10g}, {:.10g}: ground {}{}{}", place.x, place.y,
                               std::isnan(column.ground) ? "not known" : fmt::format("{:.6g} m", column.ground),
                               column.soil.empty() ? "" : ", soil ", column.soil);
      break;
    }
    for (const auto& computation : awaited)
      if (!page_.Outside().Compute(computation)) return;
  }
  place_ = place;
}

}  // namespace tervane
