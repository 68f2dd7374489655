// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/result_view.h"

#include <algorithm>
#include <array>
#include <bit>
#include <cmath>
#include <utility>

#include <fmt/format.h>

#include "data/datafile_facts.h"
#include "geometry/grid_section.h"
#include "platform/paths.h"

namespace tervane {

namespace {

/// Colours to choose from: their name, and that in the settings.
struct NamedPalette {
  const char *name, *setting;
  Ramp ramp;
};
constexpr std::array<NamedPalette, 5> kNamedPalettes = {{{"Usual colours", "", Ramp::OfQuantity},
                                                         {"Violet to yellow", "VioletToYellow", Ramp::VioletToYellow},
                                                         {"Blue to yellow", "BlueToYellow", Ramp::BlueToYellow},
                                                         {"Violet to orange", "VioletToOrange", Ramp::VioletToOrange},
                                                         {"Result viewer", "ResultViewer", Ramp::OfQuantity}}};
constexpr std::size_t kViewerPalette = 4, kFilePalette = 5;

unsigned PackedColor(const PaletteColor& color) {
  return static_cast<unsigned>(color.red << 16 | color.green << 8 | color.blue);
}

/// The scales of a quantity's base unit and of the user's unit, or of that which a title names.
struct UnitPair {
  UnitConversion toShown, toBase;
};
UnitPair UnitsOf(int itemType, const DisplayUnits* units, const std::string& title = {}) {
  const ItemType* type = itemType == quantity::kUndefined ? nullptr : FindItemType(itemType);
  if (!type) return {};
  const Unit& base = BaseUnit(*type);
  const Unit* wanted = units ? &units->UnitOf(*type) : &base;
  for (const int key : type->unitKeys) {
    const Unit* unit = FindUnit(key);
    if (unit && !title.empty() && title.ends_with(fmt::format("[{}]", unit->text))) wanted = unit;
  }
  return {ConversionBetween(base.scale, wanted->scale).value_or(UnitConversion()),
          ConversionBetween(wanted->scale, base.scale).value_or(UnitConversion())};
}

}  // namespace

ResultView::ResultView(DataFileView& file, const DisplayUnits* units, Host& host)
    : file_(file), units_(units), host_(host) {}

void ResultView::TakeSetup(const ViewedSetup& setup) {
  setup_ = setup;
  usesFileScale_ = setup.result.palette.size() > 1;
  flows_.clear();
  flow_.reset();
  if (const auto& flow = setup.flow) {
    flows_.push_back({flow->path, flow->xItem, flow->yItem, flow->layer});
    if (flow->isShown) flow_ = 0;
  }
  overlays_.clear();
  for (const ViewedOverlay& overlay : setup.overlays) {
    const bool isDrawn = overlay.kind == ViewedOverlay::Kind::Shape && overlay.isShown;
    overlays_.push_back(!isDrawn
                            ? nullptr
                            : std::make_shared<Computed<CTvnShapeData>>(
                                  "Reading " + overlay.path, [overlay](CTvnShapeData& shapes, ProgressPart progress) {
                                    shapes.SetAxisLengthUnit(overlay.axisUnit);
                                    return shapes.ReadShapeFile(overlay.path, progress);
                                  }));
  }
  Forget();
}

void ResultView::Forget() {
  frames_.clear();
  range_.reset();
  strongest_.reset();
  for (Cell& cell : cells_) cell.series.reset();
  const bool isForeign = setup_ && setup_->flow;
  if (!isForeign) {
    flows_ = file_.Problem().empty() ? FlowItemsOf(file_.Path(), file_.Items()) : std::vector<FlowItems>();
    if (flow_ && *flow_ >= flows_.size()) flow_.reset();
  }
}

FrameRecipe ResultView::Recipe() const {
  FrameRecipe recipe{file_.Path(), file_.Chosen().front(), file_.Slice().layer, subtracted_, {}};
  if (recipe.subtracted) recipe.subtracted->layer = recipe.layer;
  if (flow_) {
    recipe.flow = flows_[*flow_];
    const auto facts = DataFileFactsOf(recipe.flow->path);
    const DataItem* item = facts->Item(recipe.flow->x);
    // Flow follows the layer that is shown, where it has as many.
    if (item && item->geometry.nz == file_.Layers())
      recipe.flow->layer = recipe.layer;
    else if (item)
      recipe.flow->layer = std::clamp(recipe.flow->layer, 0, item->geometry.nz - 1);
  }
  return recipe;
}

void ResultView::Follow() {
  FrameRecipe recipe = Recipe();
  if (recipe == recipe_) return;
  const bool isOtherItem = recipe.path != recipe_.path || recipe.item != recipe_.item;
  if (isOtherItem && recipe_.item != 0) {
    // What was subtracted belongs to the item that was shown.
    subtracted_.reset();
    recipe = Recipe();
    usesFileScale_ = false;
  }
  if (!(recipe.subtracted == recipe_.subtracted) || isOtherItem) range_.reset();
  if (!(recipe.flow == recipe_.flow)) strongest_.reset();
  frames_.clear();
  for (Cell& cell : cells_) cell.series.reset();
  recipe_ = std::move(recipe);
  for (Cell& cell : cells_) cell.series = SeriesOf(cell.i, cell.j);
}

// ---- Colours

std::vector<std::string> ResultView::Palettes() const {
  std::vector<std::string> names;
  for (const NamedPalette& palette : kNamedPalettes) names.emplace_back(palette.name);
  if (setup_ && setup_->result.palette.size() > 1) names.emplace_back("As the setup file tells");
  return names;
}

std::string ResultView::PaletteSetting() const { return fmt::format("Maps/Palette/{}", file_.Item().itemType); }

std::size_t ResultView::Palette() const {
  if (usesFileScale_) return kFilePalette;
  const auto found = std::ranges::find(kNamedPalettes, host_.Setting(PaletteSetting()),
                                       [](const NamedPalette& palette) { return std::string(palette.setting); });
  return found == kNamedPalettes.end() ? 0 : static_cast<std::size_t>(found - kNamedPalettes.begin());
}

void ResultView::ChoosePalette(std::size_t number) {
  usesFileScale_ = number == kFilePalette;
  if (number < kNamedPalettes.size()) host_.SetSetting(PaletteSetting(), kNamedPalettes[number].setting);
}

std::vector<ScaleClass> ResultView::ViewerScale() const {
  const FrameRange range = range_ && range_->Result() ? *range_->Result() : std::nullopt;
  if (!range) return {};
  const int itemType = file_.Item().itemType;
  const auto [toShown, toBase] = UnitsOf(itemType, units_);
  const auto upTo =
      ClassesOf(ScaledRange(toShown(static_cast<double>(range->first)), toShown(static_cast<double>(range->second))));
  std::vector<ScaleClass> scale;
  for (std::size_t i = 0; i < upTo.size(); ++i)
    scale.push_back({toBase(static_cast<double>(upTo[i])), PackedColor(kResultColors[i])});
  return scale;
}

std::vector<ScaleClass> ResultView::FileScale() const {
  const UnitConversion toBase = UnitsOf(file_.Item().itemType, units_, setup_->result.paletteTitle).toBase;
  std::vector<ScaleClass> scale;
  for (const ViewedClass& one : setup_->result.palette) scale.push_back({toBase(one.upTo), PackedColor(one.color)});
  return scale;
}

bool ResultView::NeedsRange() const {
  if (subtracted_ || Palette() == kViewerPalette) return true;
  if (file_.Steps() == 1 && file_.Layers() == 1) return false;
  // To look through a very large file would keep the user waiting; then each step has colours of its own.
  constexpr double kMostValues = 5e8;
  const double values = static_cast<double>(file_.Item().Cells()) * static_cast<double>(file_.Steps());
  return file_.HasStoredRange() || values <= kMostValues;
}

std::optional<GridLayer> ResultView::Colors() const {
  if (NeedsRange() && (!range_ || !range_->IsDone())) return std::nullopt;
  GridLayer layer;
  layer.isCodes = !subtracted_ && file_.Item().itemType == quantity::kCode;
  if (setup_) layer.transparency = setup_->result.transparency;
  if (NeedsRange() && range_->Result()) layer.range = *range_->Result();
  const std::size_t palette = Palette();
  if (subtracted_) {
    layer.ramp = Ramp::Difference;
  } else if (palette == kFilePalette) {
    layer.scale = FileScale();
  } else if (palette == kViewerPalette) {
    layer.scale = ViewerScale();
  } else {
    layer.ramp = kNamedPalettes[palette].ramp;
  }
  return layer;
}

// ---- Differences

void ResultView::SubtractStep(std::size_t step) {
  subtracted_ = Subtracted{file_.Path(), file_.Chosen().front(), 0, step};
}

std::string ResultView::SubtractFile(const std::string& path) {
  const auto facts = DataFileFactsOf(path);
  if (!facts->error.empty()) return facts->error;
  const auto found = std::ranges::find(facts->items, file_.Item().name, &DataItem::name);
  const int number =
      found == facts->items.end() ? file_.Chosen().front() : static_cast<int>(found - facts->items.begin()) + 1;
  FrameRecipe recipe = Recipe();
  recipe.subtracted = Subtracted{path, number, 0, {}};
  if (std::string reason = WhyNoDifference(recipe); !reason.empty()) return reason;
  subtracted_ = recipe.subtracted;
  return {};
}

void ResultView::SubtractNothing() { subtracted_.reset(); }

std::string ResultView::DifferenceText() const {
  if (!subtracted_) return {};
  return fmt::format(
      "Minus {}", subtracted_->step ? file_.StepText(*subtracted_->step) : std::string(FileNameOf(subtracted_->path)));
}

// ---- Flow

std::vector<std::string> ResultView::Flows() const {
  std::vector<std::string> names;
  for (const FlowItems& flow : flows_) {
    const auto facts = DataFileFactsOf(flow.path);
    const DataItem* item = facts->Item(flow.x);
    names.push_back(item ? item->name : std::string(FileNameOf(flow.path)));
  }
  return names;
}

void ResultView::ShowFlow(std::optional<std::size_t> number) {
  flow_ = number && *number < flows_.size() ? number : std::nullopt;
}

std::optional<ArrowLayer> ResultView::ArrowsOf(const GridFrame& frame) const {
  if (!frame.flowX || !strongest_ || !strongest_->Result()) return std::nullopt;
  return ArrowLayer{frame.flowX, frame.flowY, *strongest_->Result()};
}

// ---- Steps

std::shared_ptr<ComputedFrame> ResultView::Frame(std::size_t step, int every) {
  Follow();
  const auto found =
      std::ranges::find_if(frames_, [&](const Kept& kept) { return kept.step == step && kept.every == every; });
  if (found != frames_.end()) {
    Kept kept = std::move(*found);
    frames_.erase(found);
    frames_.push_front(std::move(kept));
  } else {
    frames_.push_front(
        {step, every,
         std::make_shared<ComputedFrame>("Reading " + recipe_.path,
                                         [recipe = recipe_, step, every](GridFrame& frame, ProgressPart progress) {
                                           return ReadFrame(recipe, step, every, frame, progress);
                                         })});
    // Also what a map waits for while others are read ahead.
    constexpr std::size_t kBesides = 2;
    if (frames_.size() > KeptFrames() + kBesides) frames_.pop_back();
  }
  if (!range_)
    range_ = std::make_shared<Computed<FrameRange>>("Looking for the range of all steps",
                                                    [recipe = recipe_](FrameRange& range, ProgressPart progress) {
                                                      return ReadFrameRange(recipe, range, progress);
                                                    });
  if (recipe_.flow && !strongest_)
    strongest_ = std::make_shared<Computed<double>>(
        "Looking for the strongest flow", [flow = *recipe_.flow](double& strongest, ProgressPart /*progress*/) {
          strongest = 0;
          return ReadStrongestFlow(flow, strongest);
        });
  return frames_.front().frame;
}

int ResultView::EveryFor(double cellsPerPixel) const {
  // Smaller grids are read whole as quickly; a single cell of a code must not be missed.
  constexpr std::size_t kFewCells = 1'500'000;
  if (file_.Item().itemType == quantity::kCode || file_.Item().CellsOfLayer() <= kFewCells) return 1;
  if (!(cellsPerPixel >= 2)) return 1;
  return static_cast<int>(std::bit_floor(static_cast<unsigned>(std::min(cellsPerPixel, 1024.0))));
}

std::size_t ResultView::KeptFrames() const {
  constexpr double kMemory = 300e6;
  const double bytes = static_cast<double>(file_.Item().CellsOfLayer()) * sizeof(float) * (flow_ ? 3 : 1);
  return static_cast<std::size_t>(std::clamp(kMemory / bytes, 3.0, 40.0));
}

void ResultView::AddOverlays(MapContent& map) {
  if (!setup_ || setup_->overlays.empty()) return;
  // The file tells the whole backdrop.
  map.below.clear();
  map.above.clear();
  for (std::size_t i = 0; i < overlays_.size(); ++i) {
    const ViewedOverlay& overlay = setup_->overlays[i];
    if (!overlay.isShown) continue;
    BackdropLayer layer{.title = std::string(FileNameOf(overlay.path)), .drawn = {}};
    if (overlay.kind == ViewedOverlay::Kind::Image) {
      const DataArea& place = overlay.corners;
      const ImageLayer image{overlay.path, StampOf(overlay.path), place.x0, place.x1, place.y0, place.y1};
      if (!image.stamp.exists) continue;
      layer.drawn = image;
    } else if (auto shapes = overlays_[i] ? NowOrAwaited(overlays_[i], map.awaited) : nullptr) {
      ShapeLayer drawn{.shapes = std::move(shapes)};
      drawn.lineColor = overlay.lineColor;
      layer.drawn = std::move(drawn);
    } else {
      continue;
    }
    (overlay.isForeground ? map.above : map.below).push_back(std::move(layer));
  }
}

MapContent ResultView::Map() {
  MapContent map;
  if (!file_.Problem().empty() || !file_.IsGrid()) {
    map.message = file_.Problem().empty() ? "It is no grid: its values stand in the table." : file_.Problem();
    return map;
  }
  const auto computed = Frame(file_.Slice().step);
  const auto frame = NowOrAwaited(computed, map.awaited);
  if (!frame && computed->IsDone()) map.message = computed->Problem();
  if (NeedsRange() && !range_->IsDone()) map.awaited.push_back(range_);
  if (recipe_.flow && !strongest_->IsDone()) map.awaited.push_back(strongest_);
  if (!frame || !map.awaited.empty()) return map;
  map.grids.push_back(*Colors());
  map.grids.back().grid = frame->grid;
  map.arrows = ArrowsOf(*frame);
  if (putOver_) putOver_(map);
  AddOverlays(map);
  if (line_.size() > 1)
    map.lines.push_back({std::make_shared<const std::vector<MapLine>>(1, MapLine{.points = line_}), {.place = 0}});
  if (!cells_.empty()) {
    PointLayer points;
    for (const Cell& cell : cells_) points.points.push_back(cell.place);
    points.isNumbered = cells_.size() > 1;
    map.points.push_back(std::move(points));
  }
  file_.ShowGrid(frame->grid);
  return map;
}

// ---- Cells and lines

std::shared_ptr<Computed<FileSeries>> ResultView::SeriesOf(int i, int j) const {
  return std::make_shared<Computed<FileSeries>>(fmt::format("Reading cell {}, {}", i, j),
                                                [recipe = recipe_, i, j](FileSeries& series, ProgressPart progress) {
                                                  return ReadCellSeries(recipe, i, j, series, progress);
                                                });
}

void ResultView::PickCell(int i, int j) {
  Follow();
  GridGeometry geometry;
  if (!ToModelGrid(file_.Item().geometry, geometry).empty()) return;
  const MapPoint centre = GridTransform(geometry).ToWorld({i + 0.5, j + 0.5});
  if (!keepsCells_) cells_.clear();
  if (std::ranges::any_of(cells_, [&](const Cell& cell) { return cell.i == i && cell.j == j; })) return;
  cells_.push_back({i, j, centre, SeriesOf(i, j)});
}

SeriesContent ResultView::CellSeries() const {
  SeriesContent chart;
  if (cells_.empty()) {
    chart.message = "Click a cell on the map.";
    return chart;
  }
  for (const Cell& cell : cells_) {
    if (!cell.series) continue;
    if (const auto series = NowOrAwaited(cell.series, chart.awaited))
      chart.series.push_back(InUserUnit(*series, units_));
    else if (cell.series->IsDone())
      chart.message = cell.series->Problem();
  }
  if (file_.Problem().empty() && !chart.series.empty() && file_.HasDates())
    chart.markers.push_back({{}, file_.StampOfStep(file_.Slice().step), {}, true});
  return chart;
}

SeriesContent ResultView::Profile(const GridFrame& frame) const {
  SeriesContent chart;
  if (line_.size() < 2) {
    chart.message = "Draw a line on the map.";
    return chart;
  }
  const GridFrame::Grid& grid = *frame.grid;
  const auto points = PointsAlong(line_, grid.Geometry().cellSize / 2);
  const UnitConversion toShown = UnitsOf(grid.ItemType(), units_).toShown;
  Series series;
  series.name = grid.ItemName();
  const ItemType* type = grid.ItemType() == quantity::kUndefined ? nullptr : FindItemType(grid.ItemType());
  const Unit* unit = type ? (units_ ? &units_->UnitOf(*type) : &BaseUnit(*type)) : FindUnit(grid.ItemUnit());
  if (unit) series.unit = unit->abbreviation;
  for (const double value : ValuesAlong(grid, points, GridSampling::Nearest)) series.values.push_back(toShown(value));
  for (const SectionPoint& point : points) series.positions.push_back(point.distance);
  chart.numbers = NumberAxis{"Distance", "m"};
  chart.series.push_back(std::move(series));
  return chart;
}

SeriesContent ResultView::Profile() {
  SeriesContent chart;
  const auto computed = Frame(file_.Slice().step);
  if (const auto frame = NowOrAwaited(computed, chart.awaited)) return Profile(*frame);
  if (computed->IsDone()) chart.message = computed->Problem();
  return chart;
}

}  // namespace tervane
