// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A data file as a viewer shows it, without any toolkit.
#pragma once

#include <cstddef>
#include <deque>
#include <map>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "data/datafile.h"
#include "data/grid_files.h"
#include "forms/entry.h"
#include "forms/plots.h"

namespace tervane {

/// The items of a file, of which one grid, or several series, are chosen; what is chosen as a map or chart; and the
/// values as a table. Only what is asked for is read: a file may be larger than the memory.
///
/// The table of series has a row for each time and a column for each series of the file; that of a grid has the cells
/// of one step and layer, the northern row first; that of a line a row for each of its points.
class DataFileView {
 public:
  /// The user's units must outlive the view; null for base units.
  DataFileView(std::string path, const DisplayUnits* units);

  const std::string& Path() const { return path_; }
  /// Why there is nothing to show; empty when there is.
  const std::string& Problem() const { return problem_; }
  /// Opens the file anew if it is another one on the disk than it was, or always. What was chosen stays chosen where it
  /// is still there. True when all must be shown anew.
  bool Reopen(bool always = false);
  /// Opens another file in the place of this one.
  void OpenOther(const std::string& path);

  const std::vector<DataItem>& Items() const { return file_.Items(); }
  /// "mm/day, 365 values"
  std::string ItemDetail(int number) const;
  /// What a user should know of a file of another program.
  const std::vector<std::string>& Notes() const { return file_.Notes(); }

  /// Numbers count from 1. Series may be chosen together; of other items only the first counts.
  void Choose(std::vector<int> numbers);
  const std::vector<int>& Chosen() const { return chosen_; }
  /// The first of those that are chosen; to be asked only without a problem.
  const DataItem& Item() const { return Items()[static_cast<std::size_t>(chosen_.front() - 1)]; }
  bool IsSeries() const { return Item().dimensions == 0; }
  bool IsGrid() const { return Item().dimensions >= 2; }

  /// Of a grid or line; 1 without times.
  std::size_t Steps() const { return Item().hasTime ? file_.Time().steps : 1; }
  int Layers() const { return IsGrid() ? Item().geometry.nz : 1; }
  const GridSlice& Slice() const { return slice_; }
  void ChooseSlice(const GridSlice& slice);
  /// "2000-01-31 12:00"; the number from 1 without dates.
  std::string StepText(std::size_t step) const;
  /// The step whose stamp is nearest to a date that a user typed, or what was expected.
  std::string FindDate(const std::string& typed, std::size_t& step) const;

  bool HasDates() const { return file_.Time().hasDates; }
  CYbDateTime StampOfStep(std::size_t step) const { return file_.Time().Stamp(step); }
  /// The file tells the smallest and the largest value of the chosen item.
  bool HasStoredRange() const { return file_.StoredStatistics(chosen_.front()).has_value(); }
  /// The values that the table of a grid has, those of the chosen step and layer or a difference; null for none yet.
  void ShowGrid(std::shared_ptr<const CTvn2DOrthoRotatedGridData> grid) { grid_ = std::move(grid); }
  SeriesContent Chart() const;

  // ---- The table

  /// Views of millions of rows take their memory: of longer series the table has a part, which `ShowRowOf` moves.
  static constexpr std::size_t kMostRows = 1'000'000;

  std::size_t RowCount() const;
  std::size_t ColumnCount() const;
  std::string RowHead(std::size_t row) const;
  /// With the unit: "Rain [mm/day]".
  std::string ColumnHead(std::size_t column) const;
  /// Empty where a value is missing, and while a grid is not read yet.
  std::string Cell(std::size_t row, std::size_t column);
  /// The column of a series; the first one of other items.
  std::size_t ColumnOf(int number) const;
  /// Where a cell of the grid stands.
  std::pair<std::size_t, std::size_t> TableCellOf(int i, int j) const;
  /// The row of a step of series; the table has it afterwards. True in `isMoved` when it has other rows than before.
  std::size_t ShowRowOf(std::size_t step, bool& isMoved);
  /// What stands above the table: the unit of a grid, and which part of long series is shown.
  std::string TableText() const;
  /// Cells as a spreadsheet takes them, with tabs and line ends; with heads if asked for.
  std::string CellsAsText(std::size_t firstRow, std::size_t lastRow, std::size_t firstColumn, std::size_t lastColumn,
                          bool withHeads);

 private:
  /// Values of one series that stand one behind the other.
  struct Block {
    int item = 0;
    std::size_t first = 0;
    std::vector<float> values;
  };

  FieldUnit UnitOf(const DataItem& item) const;
  float ValueAt(int item, std::size_t step);
  std::string Shown(float value, const FieldUnit& unit) const;

  std::string path_;
  const DisplayUnits* units_;
  FileStamp stamp_;
  DataFile file_;
  std::string problem_;
  std::vector<int> chosen_;
  std::vector<int> series_;            ///< The numbers of all series.
  std::map<int, std::size_t> colors_;  ///< Of the series that are chosen, by their numbers.
  GridSlice slice_;
  std::size_t firstRow_ = 0;
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> grid_;  ///< The one that is shown; null until it is read.
  std::vector<float> line_;
  std::deque<Block> blocks_;  ///< What was read lately of series, the latest first.
};

}  // namespace tervane
