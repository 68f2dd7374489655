// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "edits/grid_edit.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <new>

#include <fmt/format.h>

#include "data/csv_reader.h"
#include "edits/cell_figures.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// Beyond, neighbouring whole numbers are the same in single precision.
constexpr double kMostCode = 1 << 24;

/// The smallest window that holds both.
CellWindow Around(const CellWindow& a, const CellWindow& b) {
  const int left = std::min(a.i, b.i), low = std::min(a.j, b.j);
  return {left, low, std::max(a.i + a.nx, b.i + b.nx) - left, std::max(a.j + a.ny, b.j + b.ny) - low};
}

/// Adds a part of a row.
void Include(std::vector<CellWindow>& windows, int i, int j, int count) {
  constexpr std::size_t kMostWindows = 20'000;
  if (!windows.empty()) {
    // Rows of one shape are one window.
    CellWindow& last = windows.back();
    if (last.i == i && last.nx == count && last.j + last.ny == j) {
      ++last.ny;
      return;
    }
    if (last.j == j && last.ny == 1 && i >= last.i && i <= last.i + last.nx) {
      last.nx = std::max(last.nx, i + count - last.i);
      return;
    }
  }
  windows.push_back({i, j, count, 1});
  if (windows.size() <= kMostWindows) return;
  CellWindow all = windows.front();
  for (const CellWindow& window : windows) all = Around(all, window);
  windows = {all};
}

}  // namespace

/// Cells with the values that they had, or will have again.
class GridEdit::Step : public EditStep {
 public:
  Step(GridEdit& edit, CellRuns values) : edit_(edit), page_(edit.ShownPage()), values_(std::move(values)) {}

  /// What is taken back is seen.
  std::string Prepare() override {
    const auto& [item, step, layer] = page_;
    return page_ == edit_.ShownPage() ? std::string() : edit_.Show(item, {step, layer});
  }
  void Swap() override {
    float* const cells = edit_.grid_->GetData();
    values_.ForEach([&](std::size_t cell, std::span<float> values) {
      std::swap_ranges(values.begin(), values.end(), cells + cell);
      edit_.Touch(cell, values.size());
    });
  }
  std::size_t Bytes() const override { return values_.Bytes() + sizeof(*this); }

 private:
  GridEdit& edit_;
  Page page_;
  CellRuns values_;
};

GridEdit::GridEdit(std::string path) : EditedFile(std::move(path)) { Begin(); }

std::string GridEdit::Read() {
  std::error_code error;
  os::File original = os::File::OpenForReading(Path(), error);
  DataFile file;
  if (std::string problem = file.Open(Path()); !problem.empty()) return problem;
  if (error) return fmt::format("cannot read {}: {}", Path(), error.message());
  FileUpdateFacts updates = UpdateFactsOf(Path());
  const auto refused = [&](const std::string& why) { return fmt::format("cannot edit {}: {}", Path(), why); };
  if (!updates.whyNot.empty()) return refused(updates.whyNot);
  const auto isGrid = [&](int item) {
    return item >= 1 && item <= static_cast<int>(file.Items().size()) &&
           file.Items()[static_cast<std::size_t>(item - 1)].dimensions >= 2;
  };
  int item = isGrid(item_) ? item_ : 1;
  while (item <= static_cast<int>(file.Items().size()) && !isGrid(item)) ++item;
  if (!isGrid(item)) return refused("it holds no grid");
  std::swap(original_, original);
  std::swap(file_, file);
  std::swap(updates_, updates);
  isStroke_ = false;
  painted_.clear();
  auto unsaved = std::exchange(unsaved_, {});
  auto grid = std::exchange(grid_, nullptr);
  if (std::string problem = Show(item, slice_); !problem.empty()) {
    // What cannot be read takes nothing away.
    std::swap(original_, original);
    std::swap(file_, file);
    std::swap(updates_, updates);
    unsaved_ = std::move(unsaved);
    grid_ = std::move(grid);
    return problem;
  }
  return {};
}

std::string GridEdit::ReadPage(const Page& page, std::vector<float>& values) const {
  const auto& [item, step, layer] = page;
  ValueSelection selection{item, step, 1, layer};
  try {
    values.resize(file_.SizeOf(selection));
  } catch (const std::bad_alloc&) {
    return fmt::format("cannot read {}: it needs more than the free memory", Path());
  }
  return file_.Read(selection, values);
}

std::string GridEdit::Show(int item, const GridSlice& slice) {
  if (item < 1 || item > static_cast<int>(Items().size())) return fmt::format("there is no item {}", item);
  const DataItem& facts = Items()[static_cast<std::size_t>(item - 1)];
  if (facts.dimensions < 2) return fmt::format("{} is no grid", facts.name);
  const std::size_t steps = facts.hasTime ? Time().steps : 1;
  if (steps == 0) return fmt::format("cannot edit {}: it has no time steps", Path());
  const Page page{item, std::min(slice.step, steps - 1), std::clamp(slice.layer, 0, facts.geometry.nz - 1)};
  if (grid_ && page == ShownPage()) return {};
  GridGeometry geometry;
  if (std::string why = ToModelGrid(facts.geometry, geometry); !why.empty())
    return fmt::format("cannot edit {}: it has {}", Path(), why);
  std::vector<float> values;
  if (std::string problem = ReadPage(page, values); !problem.empty()) return problem;
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  // A unit that is none of the table's cannot be converted: the type would promise that.
  const int type = facts.unitKey != 0 ? facts.itemType : quantity::kUndefined;
  if (std::string why = grid->TakeValues(geometry, std::move(values), kDeleteValue, facts.unitKey, type); !why.empty())
    return fmt::format("cannot edit {}: {}", Path(), why);
  grid->SetItemName(facts.name);

  if (grid_) {
    EndStroke();
    if (CellRuns unsaved = Unsaved(); !unsaved.IsEmpty()) unsaved_[ShownPage()] = std::move(unsaved);
  }
  const bool isOtherGrid = !grid_ || !(grid_->Geometry() == grid->Geometry());
  grid_ = std::move(grid);
  item_ = item;
  slice_ = {std::get<1>(page), std::get<2>(page)};
  touched_.assign(static_cast<std::size_t>(geometry.ny), {});
  if (const auto found = unsaved_.find(page); found != unsaved_.end()) {
    found->second.ForEach([&](std::size_t cell, std::span<float> changed) {
      std::ranges::copy(changed, grid_->GetData() + cell);
      Touch(cell, changed.size());
    });
    unsaved_.erase(found);
  }
  changed_.clear();
  if (isOtherGrid) {
    SelectNothing();
    stroke_ = Cells();
  }
  return {};
}

bool GridEdit::IsCodes() const {
  return ItemFacts().itemType == quantity::kCode || ItemFacts().unitKey == kWholeNumberUnit;
}

std::string GridEdit::WhyNotValue(double value) const {
  if (!std::isfinite(value)) return "a number was expected";
  if (IsCodes() && (value != std::trunc(value) || std::abs(value) > kMostCode))
    return "a whole number was expected, since the cells hold codes";
  if (std::abs(value) > static_cast<double>(std::numeric_limits<float>::max()))
    return "the number is too large for single precision";
  const ItemUpdateFacts& facts = updates_.items[static_cast<std::size_t>(item_ - 1)];
  if (value < facts.from || value > facts.to)
    return fmt::format("the file takes values from {} to {}", ShortestNumber(facts.from), ShortestNumber(facts.to));
  return {};
}

std::string GridEdit::WhyNot(float value) const {
  if (!WhyNotChanged().empty()) return fmt::format("{} cannot be changed: {}", ItemFacts().name, WhyNotChanged());
  return value == kDeleteValue ? std::string() : WhyNotValue(static_cast<double>(value));
}

// ---- What was changed

void GridEdit::Touch(std::size_t cell, std::size_t count) {
  const auto nx = static_cast<std::size_t>(grid_->Geometry().nx);
  while (count > 0) {
    const std::size_t j = cell / nx, i = cell % nx, here = std::min(count, nx - i);
    RowRange& row = touched_[j];
    const int begin = static_cast<int>(i), end = static_cast<int>(i + here);
    row = row.begin == row.end ? RowRange{begin, end} : RowRange{std::min(row.begin, begin), std::max(row.end, end)};
    Include(changed_, begin, static_cast<int>(j), static_cast<int>(here));
    cell += here;
    count -= here;
  }
}

CellRuns GridEdit::Unsaved() const {
  CellRuns runs;
  const auto nx = static_cast<std::size_t>(grid_->Geometry().nx);
  for (std::size_t j = 0; j < touched_.size(); ++j)
    for (int i = touched_[j].begin; i < touched_[j].end; ++i) {
      const std::size_t cell = j * nx + static_cast<std::size_t>(i);
      runs.Add(cell, grid_->Values()[cell]);
    }
  return runs;
}

void GridEdit::Change(const std::string& name, CellRuns values) {
  EndStroke();
  if (values.IsEmpty()) return;
  auto step = std::make_unique<Step>(*this, std::move(values));
  step->Swap();
  Take(name, std::move(step));
}

FileResult GridEdit::Write(const std::string& path, ProgressPart progress) {
  EndStroke();
  DataFileUpdate update;
  if (std::string error = update.Begin(original_, path, progress.Part(0, 0.4)); !error.empty()) return {error, {}};
  const auto put = [&](const Page& page, std::span<const float> values, const std::vector<RowRange>& rows) {
    const auto& [item, step, layer] = page;
    return update.PutLayer(item, {step, layer}, values, [&](int row) {
      return rows[static_cast<std::size_t>(row)].begin < rows[static_cast<std::size_t>(row)].end;
    });
  };
  if (std::ranges::any_of(touched_, [](const RowRange& row) { return row.begin < row.end; }))
    if (std::string error = put(ShownPage(), grid_->Values(), touched_); !error.empty()) return {error, {}};
  double done = 0;
  for (auto& [page, runs] : unsaved_) {
    progress.Part(0.4, 0.7).Report(done++ / static_cast<double>(unsaved_.size()));
    if (progress.IsCancelled()) return {fmt::format("cannot write {}: {}", path, kCancelled), {}};
    std::vector<float> values;
    if (std::string error = ReadPage(page, values); !error.empty()) return {error, {}};
    const FileGeometry& geometry = Items()[static_cast<std::size_t>(std::get<0>(page) - 1)].geometry;
    std::vector<RowRange> rows(static_cast<std::size_t>(geometry.ny));
    runs.ForEach([&](std::size_t cell, std::span<float> changed) {
      std::ranges::copy(changed, values.begin() + static_cast<std::ptrdiff_t>(cell));
      const auto nx = static_cast<std::size_t>(geometry.nx);
      for (std::size_t j = cell / nx; j <= (cell + changed.size() - 1) / nx; ++j) rows[j] = {0, geometry.nx};
    });
    if (std::string error = put(page, values, rows); !error.empty()) return {error, {}};
  }
  return update.Finish(progress.Part(0.7, 1));
}

void GridEdit::Saved() {
  // What stands in the file now is what others are read from.
  std::error_code error;
  os::File original = os::File::OpenForReading(Path(), error);
  DataFile file;
  if (error || !file.Open(Path()).empty()) return;
  original_ = std::move(original);
  file_ = std::move(file);
  unsaved_.clear();
  std::ranges::fill(touched_, RowRange());
}

// ---- Painting

std::string GridEdit::BeginStroke(std::string name, float value) {
  EndStroke();
  if (std::string why = WhyNot(value); !why.empty()) return why;
  isStroke_ = true;
  strokeName_ = std::move(name);
  strokeValue_ = value;
  return {};
}

void GridEdit::StrokeTo(MapPoint from, MapPoint to, double width) {
  if (!isStroke_) return;
  float* const cells = grid_->GetData();
  const auto nx = static_cast<std::size_t>(grid_->Geometry().nx);
  CellsAlong(grid_->Geometry(), from, to, width, [&](int j, int begin, int end) {
    const std::size_t row = static_cast<std::size_t>(j) * nx;
    for (std::size_t cell = row + static_cast<std::size_t>(begin); cell < row + static_cast<std::size_t>(end); ++cell) {
      if (cells[cell] == strokeValue_) continue;
      // Whatever it was painted over with meanwhile, it had one value before the stroke.
      if (!stroke_.Has(cell)) painted_.emplace_back(cell, cells[cell]);
      stroke_.Add(cell);
      cells[cell] = strokeValue_;
    }
    Touch(row + static_cast<std::size_t>(begin), static_cast<std::size_t>(end - begin));
  });
}

void GridEdit::EndStroke() {
  if (!std::exchange(isStroke_, false)) return;
  std::ranges::sort(painted_, {}, &std::pair<std::size_t, float>::first);
  CellRuns before;
  for (const auto& [cell, value] : painted_) {
    before.Add(cell, value);
    stroke_.Remove(cell);
  }
  painted_.clear();
  if (!before.IsEmpty()) Take(strokeName_, std::make_unique<Step>(*this, std::move(before)));
}

std::string GridEdit::PaintLine(const std::vector<MapPoint>& line, double width, float value) {
  if (std::string why = BeginStroke("Paint Line", value); !why.empty()) return why;
  for (std::size_t i = 1; i < line.size(); ++i) StrokeTo(line[i - 1], line[i], width);
  EndStroke();
  return {};
}

std::string GridEdit::PaintPolygon(const std::vector<MapPoint>& corners, float value) {
  if (std::string why = WhyNot(value); !why.empty()) return why;
  CellRuns runs;
  const auto nx = static_cast<std::size_t>(grid_->Geometry().nx);
  CellsWithin(grid_->Geometry(), corners, [&](int j, int begin, int end) {
    for (int i = begin; i < end; ++i)
      if (ValueOf(i, j) != value) runs.Add(static_cast<std::size_t>(j) * nx + static_cast<std::size_t>(i), value);
  });
  Change("Paint Polygon", std::move(runs));
  return {};
}

std::string GridEdit::Fill(int i, int j, float value) {
  if (std::string why = WhyNot(value); !why.empty()) return why;
  const GridGeometry& geometry = grid_->Geometry();
  if (i < 0 || j < 0 || i >= geometry.nx || j >= geometry.ny) return {};
  const float old = ValueOf(i, j);
  if (old == value) return {};
  EndStroke();
  const auto nx = static_cast<std::size_t>(geometry.nx);
  const std::vector<float>& cells = grid_->Values();
  CellSet found = Cells();
  std::vector<std::size_t> open{static_cast<std::size_t>(j) * nx + static_cast<std::size_t>(i)};
  const auto isOld = [&](std::size_t cell) { return cells[cell] == old && !found.Has(cell); };
  while (!open.empty()) {
    std::size_t first = open.back();
    open.pop_back();
    if (!isOld(first)) continue;
    const std::size_t row = first / nx * nx;
    std::size_t last = first;
    while (first > row && isOld(first - 1)) --first;
    while (last + 1 < row + nx && isOld(last + 1)) ++last;
    for (std::size_t cell = first; cell <= last; ++cell) found.Add(cell);
    // One cell stands for its whole run in the rows beside.
    const auto look = [&](std::size_t from, std::size_t to) {
      for (std::size_t cell = from; cell <= to; ++cell)
        if (isOld(cell) && (cell == to || !isOld(cell + 1))) open.push_back(cell);
    };
    if (row > 0) look(first - nx, last - nx);
    if (row + nx < cells.size()) look(first + nx, last + nx);
  }
  CellRuns runs;
  found.ForEach([&](std::size_t cell) { runs.Add(cell, value); });
  Change("Fill", std::move(runs));
  return {};
}

std::string GridEdit::PutCells(const std::string& name, const std::vector<std::tuple<int, int, float>>& cells) {
  CellRuns runs;
  const GridGeometry& geometry = grid_->Geometry();
  for (const auto& [i, j, value] : cells) {
    if (std::string why = WhyNot(value); !why.empty()) return why;
    if (i < 0 || j < 0 || i >= geometry.nx || j >= geometry.ny || ValueOf(i, j) == value) continue;
    runs.Add(static_cast<std::size_t>(j) * static_cast<std::size_t>(geometry.nx) + static_cast<std::size_t>(i), value);
  }
  Change(name, std::move(runs));
  return {};
}

std::string GridEdit::Burn(const ShapesToBurn& shapes, std::string& note, ProgressPart progress) {
  note.clear();
  if (std::string why = WhyNot(shapes.attribute.empty() ? shapes.value : kDeleteValue); !why.empty()) return why;
  CYbShapeData data;
  const FileResult read = shapes.attribute.empty()
                              ? data.ReadShapeFile(shapes.path, progress.Part(0, 0.5))
                              : data.ReadShapeAndDbfFile(shapes.path, shapes.attribute, progress.Part(0, 0.5));
  if (!read.Ok()) return read.error;
  std::vector<float> values;
  CellSet burnt;
  std::size_t withoutCells = 0, withoutValue = 0, number = 0;
  const auto nx = static_cast<std::size_t>(grid_->Geometry().nx);
  try {
    values = grid_->Values();
    burnt = Cells();
    for (const Shape& shape : data.GetData()) {
      progress.ThrowIfCancelled();
      progress.Part(0.5, 1).Report(static_cast<double>(number++) / static_cast<double>(data.GetData().size()));
      double value = static_cast<double>(shapes.value);
      if (!shapes.attribute.empty()) {
        const ShapeValue* own = shape.values.empty() ? nullptr : &shape.Value();
        if (const auto* real = own ? std::get_if<double>(own) : nullptr)
          value = *real;
        else if (const auto* whole = own ? std::get_if<std::int64_t>(own) : nullptr)
          value = static_cast<double>(*whole);
        else {
          const std::optional<double> typed = own ? ParseCsvNumber(TextOf(*own), false) : std::nullopt;
          if (!typed) {
            ++withoutValue;
            continue;
          }
          value = *typed;
        }
        if (const std::string why = WhyNotValue(value); !why.empty())
          return fmt::format("{}: shape {} has the value {}: {}", shapes.path, number, ShortestNumber(value), why);
      }
      bool isOnGrid = false;
      CellsOf(grid_->Geometry(), shape, data.Kind(), [&](int j, int begin, int end) {
        isOnGrid = isOnGrid || begin < end;
        for (int i = begin; i < end; ++i) {
          const std::size_t cell = static_cast<std::size_t>(j) * nx + static_cast<std::size_t>(i);
          values[cell] = static_cast<float>(value);
          burnt.Add(cell);
        }
      });
      if (!isOnGrid) ++withoutCells;
    }
  } catch (const Cancelled&) {
    return kCancelled;
  } catch (const std::bad_alloc&) {
    return "it needs more than the free memory";
  }
  CellRuns runs;
  burnt.ForEach([&](std::size_t cell) {
    if (grid_->Values()[cell] != values[cell]) runs.Add(cell, values[cell]);
  });
  note = fmt::format("{} shapes gave {} cells their value.", number - withoutCells - withoutValue, burnt.Count());
  if (withoutCells > 0) note += fmt::format(" {} shapes have no cell.", withoutCells);
  if (withoutValue > 0) note += fmt::format(" {} shapes have no number as {}.", withoutValue, shapes.attribute);
  Change("Burn Shapes", std::move(runs));
  return {};
}

}  // namespace tervane
