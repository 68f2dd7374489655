// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/data_file_view.h"

#include <algorithm>
#include <iterator>

#include <fmt/format.h>

#include "pages/parts/plot_content.h"
#include "platform/item_types.h"
#include "platform/units.h"

namespace tervane {

namespace {

constexpr std::size_t kBlock = 1024;      ///< Steps that are read at once.
constexpr std::size_t kMostBlocks = 512;  ///< Some megabytes.

}  // namespace

DataFileView::DataFileView(std::string path, const DisplayUnits* units) : path_(std::move(path)), units_(units) {
  Reopen(true);
}

bool DataFileView::Reopen(bool always) {
  const FileStamp stamp = StampOf(path_);
  if (!always && stamp == stamp_) return false;
  stamp_ = stamp;
  file_ = DataFile();
  blocks_.clear();
  grid_ = nullptr;
  series_.clear();
  problem_ = stamp.exists ? file_.Open(path_) : fmt::format("{} is not there any more.", path_);
  if (problem_.empty() && Items().empty()) problem_ = fmt::format("{} holds nothing that can be shown.", path_);
  if (!problem_.empty()) return true;
  for (std::size_t i = 0; i < Items().size(); ++i)
    if (Items()[i].dimensions == 0) series_.push_back(static_cast<int>(i) + 1);
  if (firstRow_ >= file_.Time().steps) firstRow_ = 0;
  Choose(chosen_);
  return true;
}

void DataFileView::OpenOther(const std::string& path) {
  path_ = path;
  Reopen(true);
}

std::string DataFileView::ItemDetail(int number) const {
  const DataItem& item = Items()[static_cast<std::size_t>(number - 1)];
  const FileGeometry& g = item.geometry;
  std::string text = ShortUnitOf(item);
  if (!text.empty()) text += ", ";
  switch (item.dimensions) {
    case 0:
      text += fmt::format("{} values", file_.Time().steps);
      break;
    case 1:
      text += fmt::format("{} points", g.nx);
      break;
    default:
      text += fmt::format("{} × {} cells", g.nx, g.ny);
  }
  if (item.dimensions == 3) text += fmt::format(" in {} layers", g.nz);
  if (item.dimensions > 0 && item.hasTime) text += fmt::format(", {} steps", file_.Time().steps);
  return text;
}

void DataFileView::Choose(std::vector<int> numbers) {
  const int count = static_cast<int>(Items().size());
  std::erase_if(numbers, [count](int number) { return number < 1 || number > count; });
  if (numbers.empty()) numbers = {1};
  if (Items()[static_cast<std::size_t>(numbers.front() - 1)].dimensions != 0) numbers.resize(1);
  std::erase_if(numbers, [&](int number) {
    return numbers.size() > 1 && Items()[static_cast<std::size_t>(number - 1)].dimensions != 0;
  });
  chosen_ = std::move(numbers);
  // A series keeps its colour while others come and go.
  std::erase_if(colors_,
                [this](const auto& color) { return std::ranges::find(chosen_, color.first) == chosen_.end(); });
  for (const int number : chosen_) {
    std::size_t color = 0;
    while (std::ranges::any_of(colors_, [color](const auto& taken) { return taken.second == color; })) ++color;
    colors_.emplace(number, color);
  }
  ChooseSlice(slice_);
}

void DataFileView::ChooseSlice(const GridSlice& slice) {
  slice_ = {std::min(slice.step, Steps() - 1), std::clamp(slice.layer, 0, Layers() - 1)};
  grid_ = nullptr;
  line_.clear();
  if (Item().dimensions != 1) return;
  line_.resize(Item().Cells());
  if (!file_.Read({chosen_.front(), slice_.step, 1, {}}, line_).empty()) line_.clear();
}

std::string DataFileView::StepText(std::size_t step) const {
  if (!file_.Time().hasDates || step >= file_.Time().stamps.size()) return fmt::format("{}", step + 1);
  const CYbDateTime stamp = file_.Time().Stamp(step);
  return stamp.Format(stamp.SecondsSinceEpoch() % 60 == 0 ? "%Y-%m-%d %H:%M" : "%Y-%m-%d %H:%M:%S");
}

std::string DataFileView::FindDate(const std::string& typed, std::size_t& step) const {
  CYbDateTime date;
  if (std::string expected = EnterValue(date, typed); !expected.empty()) return expected;
  const std::vector<std::int64_t>& stamps = file_.Time().stamps;
  if (stamps.empty()) return "a file with dates was expected";
  const std::int64_t wanted = date.SecondsSinceEpoch();
  auto found = std::ranges::lower_bound(stamps, wanted);
  if (found == stamps.end() || (found != stamps.begin() && wanted - *(found - 1) < *found - wanted)) --found;
  step = static_cast<std::size_t>(found - stamps.begin());
  return {};
}

SeriesContent DataFileView::Chart() const {
  SeriesContent chart;
  chart.message = problem_;
  if (!problem_.empty() || !IsSeries()) return chart;
  for (const int number : chosen_) {
    CTvnData0DFile file({}, nullptr);
    file.File = FileName(path_, {});
    file.Items = {number};
    SeriesContent one = FileChart(file);
    for (Series& series : one.series) series.color = colors_.at(number);
    std::ranges::move(one.series, std::back_inserter(chart.series));
    std::ranges::move(one.awaited, std::back_inserter(chart.awaited));
    if (!one.message.empty()) chart.message = one.message;
  }
  return chart;
}

// ---- The table

std::size_t DataFileView::RowCount() const {
  if (!problem_.empty()) return 0;
  if (IsSeries()) return std::min(file_.Time().steps - firstRow_, kMostRows);
  return IsGrid() ? static_cast<std::size_t>(Item().geometry.ny) : line_.size();
}

std::size_t DataFileView::ColumnCount() const {
  if (!problem_.empty()) return 0;
  if (IsSeries()) return series_.size();
  return IsGrid() ? static_cast<std::size_t>(Item().geometry.nx) : 1;
}

FieldUnit DataFileView::UnitOf(const DataItem& item) const {
  // A difference of degrees is of no quantity.
  if (IsGrid() && grid_ && grid_->ItemType() != item.itemType) {
    const Unit* unit = FindUnit(grid_->ItemUnit());
    return {unit ? std::string(unit->abbreviation) : std::string(), 0, nullptr};
  }
  // Grids are read in the base unit of their quantity; series and lines stay as they are.
  const bool isConverted = item.dimensions >= 2 && item.itemType != quantity::kUndefined && FindItemType(item.itemType);
  return isConverted ? FieldUnit{{}, item.itemType, units_} : FieldUnit{ShortUnitOf(item), 0, nullptr};
}

std::string DataFileView::RowHead(std::size_t row) const {
  // A table that is still shown asks on when its file has gone.
  if (row >= RowCount()) return {};
  if (IsSeries()) return StepText(firstRow_ + row);
  return fmt::format("{}", IsGrid() ? RowCount() - 1 - row : row + 1);
}

std::string DataFileView::ColumnHead(std::size_t column) const {
  if (column >= ColumnCount()) return {};
  if (IsGrid()) return fmt::format("{}", column);
  const DataItem& item = IsSeries() ? Items()[static_cast<std::size_t>(series_[column] - 1)] : Item();
  const std::string unit = UnitOf(item).Text();
  return unit.empty() ? item.name : fmt::format("{} [{}]", item.name, unit);
}

std::string DataFileView::Shown(float value, const FieldUnit& unit) const {
  return value == kDeleteValue || value != value ? std::string() : ShownNumber(value, unit);
}

float DataFileView::ValueAt(int item, std::size_t step) {
  const std::size_t first = step / kBlock * kBlock;
  auto found =
      std::ranges::find_if(blocks_, [&](const Block& block) { return block.item == item && block.first == first; });
  if (found == blocks_.end()) {
    const std::size_t count = std::min(kBlock, file_.Time().steps - first);
    Block block{item, first, std::vector<float>(count, kDeleteValue)};
    // What was written over is opened anew before it is read again.
    if (StampOf(path_) == stamp_ && !file_.Read({item, first, count, {}}, block.values).empty())
      block.values.assign(count, kDeleteValue);
    blocks_.push_front(std::move(block));
    if (blocks_.size() > kMostBlocks) blocks_.pop_back();
    found = blocks_.begin();
  }
  return found->values[step - first];
}

std::string DataFileView::Cell(std::size_t row, std::size_t column) {
  if (row >= RowCount() || column >= ColumnCount()) return {};
  if (IsSeries()) {
    const int number = series_[column];
    return Shown(ValueAt(number, firstRow_ + row), UnitOf(Items()[static_cast<std::size_t>(number - 1)]));
  }
  if (!IsGrid()) return Shown(line_[row], UnitOf(Item()));
  if (!grid_) return {};
  const float value = grid_->Value(static_cast<int>(column), static_cast<int>(RowCount() - 1 - row));
  return grid_->IsEmptyValue(value) ? std::string() : ShownNumber(value, UnitOf(Item()));
}

std::size_t DataFileView::ColumnOf(int number) const {
  const auto found = std::ranges::find(series_, number);
  return found == series_.end() ? 0 : static_cast<std::size_t>(found - series_.begin());
}

std::pair<std::size_t, std::size_t> DataFileView::TableCellOf(int i, int j) const {
  return {RowCount() - 1 - static_cast<std::size_t>(j), static_cast<std::size_t>(i)};
}

std::size_t DataFileView::ShowRowOf(std::size_t step, bool& isMoved) {
  isMoved = step < firstRow_ || step - firstRow_ >= RowCount();
  if (isMoved) {
    const std::size_t steps = file_.Time().steps;
    firstRow_ = std::min(step - std::min(step, kMostRows / 2), steps - std::min(steps, kMostRows));
  }
  return step - firstRow_;
}

std::string DataFileView::TableText() const {
  if (!problem_.empty()) return {};
  const std::size_t rows = RowCount();
  if (IsSeries() && rows < file_.Time().steps)
    return fmt::format("Rows {} to {} of {}: go to a date to see others.", firstRow_ + 1, firstRow_ + rows,
                       file_.Time().steps);
  if (!IsGrid()) return {};
  const std::string unit = UnitOf(Item()).Text();
  return unit.empty() ? Item().name : fmt::format("{} [{}]", Item().name, unit);
}

std::string DataFileView::CellsAsText(std::size_t firstRow, std::size_t lastRow, std::size_t firstColumn,
                                      std::size_t lastColumn, bool withHeads) {
  std::string text;
  if (withHeads) {
    text += IsSeries() ? "Time" : "";
    for (std::size_t column = firstColumn; column <= lastColumn; ++column) text += "\t" + ColumnHead(column);
    text += "\n";
  }
  for (std::size_t row = firstRow; row <= lastRow; ++row) {
    if (withHeads) text += RowHead(row) + "\t";
    for (std::size_t column = firstColumn; column <= lastColumn; ++column) {
      if (column > firstColumn) text += "\t";
      text += Cell(row, column);
    }
    text += "\n";
  }
  return text;
}

}  // namespace tervane
