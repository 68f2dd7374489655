// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/grid_frames.h"

#include <algorithm>
#include <cmath>
#include <limits>

#include <fmt/format.h>

#include "data/datafile_facts.h"
#include "data/sampled_grid.h"
#include "platform/paths.h"

namespace tervane {

namespace {

FileResult NoFrame(std::string error) { return {std::move(error), {}}; }

/// The step of another file at the time of a step; by its number where one of both has no dates.
std::optional<std::size_t> StepAtSameTime(const TimeAxis& time, std::size_t step, const TimeAxis& other) {
  if (!time.hasDates || !other.hasDates || step >= time.stamps.size())
    return step < other.steps ? std::optional(step) : std::nullopt;
  const auto found = std::ranges::lower_bound(other.stamps, time.stamps[step]);
  if (found == other.stamps.end() || *found != time.stamps[step]) return std::nullopt;
  return static_cast<std::size_t>(found - other.stamps.begin());
}

/// Which step of a file goes with a step of the recipe's, or why there is none.
FileResult OtherStep(const FrameRecipe& recipe, std::size_t step, const std::string& path, int number,
                     std::size_t& other) {
  const auto facts = DataFileFactsOf(path);
  if (!facts->error.empty()) return NoFrame(facts->error);
  const DataItem* item = facts->Item(number);
  if (!item) return NoFrame(fmt::format("{}: {}", path, facts->WhyNoItem(number)));
  other = 0;
  if (!item->hasTime) return {};
  const auto own = DataFileFactsOf(recipe.path);
  const auto found = StepAtSameTime(own->time, step, facts->time);
  if (!found && step < own->time.stamps.size())
    return NoFrame(fmt::format("{} has no values at {}", path, own->time.Stamp(step).Format("%Y-%m-%d %H:%M")));
  if (!found) return NoFrame(fmt::format("{} has no step {}", path, step + 1));
  other = *found;
  return {};
}

FileResult ReadSubtracted(const FrameRecipe& recipe, std::size_t step, int every, GridFrame::Grid& grid,
                          ProgressPart progress) {
  const Subtracted& subtracted = *recipe.subtracted;
  std::size_t other = subtracted.step.value_or(0);
  if (!subtracted.step)
    if (FileResult found = OtherStep(recipe, step, subtracted.path, subtracted.item, other); !found.Ok()) return found;
  return ReadSampledGrid(subtracted.path, subtracted.item, {other, subtracted.layer}, every, grid, progress);
}

/// False where the unit may be shown as another one that starts elsewhere.
bool ConvertsWithoutOffset(int itemType) {
  const ItemType* type = FindItemType(itemType);
  if (!type) return true;
  return std::ranges::all_of(type->unitKeys, [&](int key) {
    const Unit* unit = FindUnit(key);
    const auto conversion = unit ? ConversionBetween(BaseUnit(*type).scale, unit->scale) : std::nullopt;
    return !conversion || (*conversion)(0) == 0;
  });
}

float DifferenceOf(float a, float b) {
  const double difference = static_cast<double>(a) - static_cast<double>(b);
  constexpr auto kMost = static_cast<double>(std::numeric_limits<float>::max());
  return std::abs(difference) <= kMost ? static_cast<float>(difference) : kUsualDeleteValue;
}

FileResult Subtract(const GridFrame::Grid& from, const GridFrame::Grid& other, GridFrame::Grid& difference) {
  if (!(from.Geometry() == other.Geometry())) return NoFrame("the grids do not lie on the same cells");
  std::vector<float> values = from.Values();
  for (std::size_t i = 0; i < values.size(); ++i)
    values[i] = from.IsEmptyValue(values[i]) || other.IsEmptyValue(other.Values()[i])
                    ? kUsualDeleteValue
                    : DifferenceOf(values[i], other.Values()[i]);
  const int itemType = ConvertsWithoutOffset(from.ItemType()) ? from.ItemType() : quantity::kUndefined;
  FileResult taken =
      NoFrame(difference.TakeValues(from.Geometry(), std::move(values), kUsualDeleteValue, from.ItemUnit(), itemType));
  difference.SetItemName(from.ItemName());
  return taken;
}

/// In the base unit of the item; nothing where all values are missing.
FileResult ReadItemRange(const std::string& path, int number, FrameRange& range) {
  const auto facts = DataFileFactsOf(path);
  const DataItem* item = facts->Item(number);
  if (!item) return NoFrame(facts->error.empty() ? facts->WhyNoItem(number) : facts->error);
  const auto read = ItemRangeOf(path, number);
  if (!read->error.empty()) return NoFrame(read->error);
  const ItemStatistics& statistics = read->statistics;
  if (!(statistics.smallest <= statistics.largest)) return {};
  UnitConversion toBase;
  if (const ItemType* type = FindItemType(item->itemType); type && type->code != quantity::kUndefined && item->scale)
    if (const auto conversion = ConversionBetween(*item->scale, BaseUnit(*type).scale)) toBase = *conversion;
  constexpr auto kMost = static_cast<double>(std::numeric_limits<float>::max());
  const auto cut = [kMost](double value) { return static_cast<float>(std::clamp(value, -kMost, kMost)); };
  range = std::pair(cut(toBase(statistics.smallest)), cut(toBase(statistics.largest)));
  return {};
}

}  // namespace

std::vector<FlowItems> FlowItemsOf(const std::string& path, const std::vector<DataItem>& items) {
  const auto isPair = [](const DataItem& x, const DataItem& y) {
    if (x.dimensions < 2 || x.dimensions != y.dimensions || !(x.geometry == y.geometry) ||
        x.name.size() != y.name.size())
      return false;
    int differences = 0;
    for (std::size_t i = 0; i < x.name.size(); ++i) {
      if (x.name[i] == y.name[i]) continue;
      const bool isAxis = (x.name[i] == 'x' && y.name[i] == 'y') || (x.name[i] == 'X' && y.name[i] == 'Y');
      differences += isAxis ? 1 : 2;
    }
    return differences == 1;
  };
  std::vector<FlowItems> pairs;
  for (std::size_t x = 0; x < items.size(); ++x)
    for (std::size_t y = 0; y < items.size(); ++y)
      if (isPair(items[x], items[y])) pairs.push_back({path, static_cast<int>(x) + 1, static_cast<int>(y) + 1, 0});
  return pairs;
}

FileResult ReadFrame(const FrameRecipe& recipe, std::size_t step, int every, GridFrame& frame, ProgressPart progress) {
  auto grid = std::make_shared<GridFrame::Grid>();
  if (FileResult read =
          ReadSampledGrid(recipe.path, recipe.item, {step, recipe.layer}, every, *grid, progress.Part(0, 0.4));
      !read.Ok())
    return read;
  frame.grid = grid;
  if (recipe.subtracted) {
    GridFrame::Grid other;
    auto difference = std::make_shared<GridFrame::Grid>();
    if (FileResult read = ReadSubtracted(recipe, step, every, other, progress.Part(0.4, 0.7)); !read.Ok()) return read;
    if (FileResult made = Subtract(*grid, other, *difference); !made.Ok()) return made;
    frame.grid = difference;
  }
  if (!recipe.flow) return {};
  std::size_t flowStep = 0;
  if (FileResult found = OtherStep(recipe, step, recipe.flow->path, recipe.flow->x, flowStep); !found.Ok())
    return found;
  auto x = std::make_shared<GridFrame::Grid>(), y = std::make_shared<GridFrame::Grid>();
  const GridSlice slice{flowStep, recipe.flow->layer};
  for (const auto& [number, part] : {std::pair(recipe.flow->x, x), std::pair(recipe.flow->y, y)})
    if (FileResult read = ReadSampledGrid(recipe.flow->path, number, slice, every, *part, progress.Part(0.7, 1));
        !read.Ok())
      return read;
  frame.flowX = x;
  frame.flowY = y;
  return {};
}

std::string WhyNoDifference(const FrameRecipe& recipe) {
  const Subtracted& subtracted = *recipe.subtracted;
  const auto own = DataFileFactsOf(recipe.path), other = DataFileFactsOf(subtracted.path);
  if (!other->error.empty()) return other->error;
  const DataItem *from = own->Item(recipe.item), *item = other->Item(subtracted.item);
  if (!from || !item) return fmt::format("{}: {}", subtracted.path, other->WhyNoItem(subtracted.item));
  if (item->itemType != from->itemType)
    return fmt::format("{}: {} is another quantity than {}.", subtracted.path, item->name, from->name);
  const FileGeometry &a = from->geometry, &b = item->geometry;
  if (a.nx != b.nx || a.ny != b.ny || a.nz != b.nz || !(a.cellSize == b.cellSize) || !(a.x0 == b.x0) ||
      !(a.y0 == b.y0) || !(a.rotation == b.rotation))
    return fmt::format("{} has {} × {} cells of {:g} m at {:g}, {:g}: {} × {} of {:g} m at {:g}, {:g} were expected.",
                       subtracted.path, b.nx, b.ny, b.cellSize, b.x0, b.y0, a.nx, a.ny, a.cellSize, a.x0, a.y0);
  if (subtracted.step || !item->hasTime) return {};
  const std::size_t steps = from->hasTime ? own->time.steps : 1;
  for (std::size_t step = 0; step < steps; ++step)
    if (StepAtSameTime(own->time, step, other->time)) return {};
  return fmt::format("{} has no step at the time of one of {}.", subtracted.path, FileNameOf(recipe.path));
}

FileResult ReadFrameRange(const FrameRecipe& recipe, FrameRange& range, ProgressPart progress) {
  if (!recipe.subtracted) return ReadItemRange(recipe.path, recipe.item, range);
  const auto facts = DataFileFactsOf(recipe.path);
  const DataItem* item = facts->Item(recipe.item);
  const std::size_t steps = item && item->hasTime ? facts->time.steps : 1;
  FrameRecipe differences = recipe;
  differences.flow = {};
  float most = -1;
  for (std::size_t step = 0; step < steps; ++step) {
    if (progress.IsCancelled()) return NoFrame(kCancelled);
    progress.Report(static_cast<double>(step) / static_cast<double>(steps));
    GridFrame frame;
    // A step without its counterpart has no difference.
    if (!ReadFrame(differences, step, 1, frame, {}).Ok()) continue;
    float largest = 0, smallest = 0;
    if (frame.grid->GetMaxMin(largest, smallest)) most = std::max({most, std::abs(largest), std::abs(smallest)});
  }
  if (most >= 0) range = std::pair(-most, most);
  return {};
}

FileResult ReadStrongestFlow(const FlowItems& flow, double& strongest) {
  for (const int number : {flow.x, flow.y}) {
    FrameRange range;
    if (FileResult read = ReadItemRange(flow.path, number, range); !read.Ok()) return read;
    if (!range) continue;
    for (const float end : {range->first, range->second})
      strongest = std::max(strongest, std::abs(static_cast<double>(end)));
  }
  return {};
}

namespace {

/// The values of a cell, in the base unit.
FileResult ReadCell(const std::string& path, int number, int layer, int i, int j, std::vector<float>& values,
                    ProgressPart progress) {
  DataFile file;
  if (std::string error = file.Open(path); !error.empty()) return NoFrame(std::move(error));
  if (number < 1 || static_cast<std::size_t>(number) > file.Items().size())
    return NoFrame(fmt::format("{}: there is no item {}: the file has {}", path, number, file.Items().size()));
  const DataItem& item = file.Items()[static_cast<std::size_t>(number - 1)];
  ValueSelection selection{number, 0, item.hasTime ? file.Time().steps : 1,
                           item.dimensions == 3 ? std::optional(layer) : std::nullopt};
  selection.cells = CellWindow{i, j, 1, 1};
  values.resize(selection.steps);
  return NoFrame(file.Read(selection, values, item.itemType, progress));
}

}  // namespace

FileResult ReadCellSeries(const FrameRecipe& recipe, int i, int j, FileSeries& series, ProgressPart progress) {
  const auto facts = DataFileFactsOf(recipe.path);
  const DataItem* item = facts->Item(recipe.item);
  if (!item) return NoFrame(facts->error.empty() ? facts->WhyNoItem(recipe.item) : facts->error);
  if (!facts->time.hasDates) return NoFrame("The file has no dates.");
  std::vector<float> values, other;
  if (FileResult read = ReadCell(recipe.path, recipe.item, recipe.layer, i, j, values, progress.Part(0, 0.5));
      !read.Ok())
    return read;
  const auto& subtracted = recipe.subtracted;
  if (subtracted)
    if (FileResult read =
            ReadCell(subtracted->path, subtracted->item, subtracted->layer, i, j, other, progress.Part(0.5, 1));
        !read.Ok())
      return read;
  const ItemType* type = FindItemType(item->itemType);
  const bool hasBase = type && type->code != quantity::kUndefined;
  series.name = fmt::format("Cell {}, {}", i, j);
  series.unit = hasBase ? std::string(BaseUnit(*type).abbreviation) : ShortUnitOf(*item);
  if (hasBase) series.scale = BaseUnit(*type).scale;
  series.itemType = subtracted && !ConvertsWithoutOffset(item->itemType) ? quantity::kUndefined : item->itemType;
  series.isStepped = item->valueType == ValueType::StepAccumulated || item->valueType == ValueType::MeanStep;
  constexpr double kGap = std::numeric_limits<double>::quiet_NaN();
  for (std::size_t step = 0; step < std::min(values.size(), facts->time.stamps.size()); ++step) {
    series.times.push_back(facts->time.Stamp(step));
    double value = values[step] == kDeleteValue ? kGap : static_cast<double>(values[step]);
    if (subtracted) {
      std::size_t at = subtracted->step.value_or(0);
      const bool isThere = subtracted->step || OtherStep(recipe, step, subtracted->path, subtracted->item, at).Ok();
      const bool hasValue = isThere && at < other.size() && other[at] != kDeleteValue;
      value = hasValue ? value - static_cast<double>(other[at]) : kGap;
    }
    series.values.push_back(value);
  }
  return {};
}

}  // namespace tervane
