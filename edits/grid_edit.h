// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A file of grids while its cells are changed. Values are in the unit of the file, so that what is typed is what is
// stored.
#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include "data/datafile.h"
#include "data/datafile_update.h"
#include "data/grid_files.h"
#include "edits/cell_runs.h"
#include "edits/edited_file.h"
#include "geometry/grid.h"

namespace tervane {

/// What is done to each cell of a selection with one number.
enum class CellOperation { Set, Add, Subtract, Multiply, Divide, AtLeast, AtMost };

/// How a new selection meets the one before.
enum class SelectionMode { Replace, Add, Remove, Keep };

struct SelectionStatistics {
  std::uint64_t count = 0, missing = 0;
  double smallest = 0, largest = 0, sum = 0, mean = 0, deviation = 0;  ///< Not numbers without a value.
  std::optional<double> area;  ///< In m² of the cells with a value; nothing where cells have no size in metres.
};

/// A shape file that is put on the cells.
struct ShapesToBurn {
  std::string path;
  std::string attribute;  ///< The value of each shape; with an empty name all have `value`.
  float value = 0;
};

/// One layer of one step is held in memory; of others, only what was changed and not saved yet. What changes cells is
/// one step of undo, which remembers those cells alone. Each operation gives "" or why not, and then has changed
/// nothing.
class GridEdit : public EditedFile {
 public:
  explicit GridEdit(std::string path);

  const std::vector<DataItem>& Items() const { return file_.Items(); }
  const TimeAxis& Time() const { return file_.Time(); }
  const std::vector<std::string>& Notes() const { return file_.Notes(); }
  /// The number of the item that is shown, from 1.
  int Item() const { return item_; }
  const DataItem& ItemFacts() const { return Items()[static_cast<std::size_t>(item_ - 1)]; }
  const GridSlice& Slice() const { return slice_; }
  std::size_t Steps() const { return ItemFacts().hasTime ? Time().steps : 1; }
  std::string Show(int item, const GridSlice& slice);
  /// Why cells of the item cannot be changed; empty when they can.
  const std::string& WhyNotChanged() const { return updates_.items[static_cast<std::size_t>(item_ - 1)].whyNot; }
  /// Its cells hold whole numbers that stand for something.
  bool IsCodes() const;
  /// What is shown. It is another object after another slice was shown; changes are made in place.
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> Grid() const { return grid_; }
  float ValueOf(int i, int j) const { return grid_->Value(i, j); }
  /// Why the item cannot take a value; kDeleteValue it always can.
  std::string WhyNotValue(double value) const;
  /// The cells that were changed since this was last asked; of very many scattered ones, what lies around them.
  std::vector<CellWindow> TakeChanged() { return std::exchange(changed_, {}); }

  // ---- Painting: all up to `EndStroke` is one step

  std::string BeginStroke(std::string name, float value);
  bool IsStroke() const { return isStroke_; }
  /// Places of the map; the width in cells.
  void StrokeTo(MapPoint from, MapPoint to, double width);
  void EndStroke();

  std::string PaintLine(const std::vector<MapPoint>& line, double width, float value);
  std::string PaintPolygon(const std::vector<MapPoint>& corners, float value);
  /// The cells that hang together with this one over their sides and have its value.
  std::string Fill(int i, int j, float value);
  /// Cells of a table, row by row from the south.
  std::string PutCells(const std::string& name, const std::vector<std::tuple<int, int, float>>& cells);
  /// `note` tells of shapes that gave nothing.
  std::string Burn(const ShapesToBurn& shapes, std::string& note, ProgressPart progress = {});

  // ---- The selection, and what is done to it; without one, to all cells

  const CellSet& Selection() const { return selection_; }
  bool HasSelection() const { return hasSelection_; }
  void SelectNothing();
  void SelectPolygon(const std::vector<MapPoint>& corners, SelectionMode mode);
  /// The cells between two places of the map, along the grid's own axes.
  void SelectRectangle(MapPoint one, MapPoint other, SelectionMode mode);
  /// Both ends are selected too.
  void SelectRange(double from, double to, SelectionMode mode);
  void SelectMissing(SelectionMode mode);
  /// The window around the selection; nothing without one.
  std::optional<CellWindow> SelectedWindow() const;

  /// Missing cells stay missing but for `Set`.
  std::string Apply(CellOperation operation, double operand);
  /// Either may be kDeleteValue.
  std::string Replace(float value, float by);
  std::string DeleteValues();
  SelectionStatistics Statistics() const;

 protected:
  std::string Read() override;
  FileResult Write(const std::string& path, ProgressPart progress) override;
  void Saved() override;

 private:
  /// An item with its slice.
  using Page = std::tuple<int, std::size_t, int>;
  class Step;
  struct RowRange {
    int begin = 0, end = 0;
  };

  Page ShownPage() const { return {item_, slice_.step, slice_.layer}; }
  std::string ReadPage(const Page& page, std::vector<float>& values) const;
  /// What was changed on the shown page and not saved yet.
  CellRuns Unsaved() const;
  void Touch(std::size_t cell, std::size_t count);
  /// Gives cells their new values, as one step.
  void Change(const std::string& name, CellRuns values);
  void Select(const CellSet& cells, SelectionMode mode);
  template <class NewValue>
  std::string ChangeSelection(const std::string& name, const NewValue& newValue);
  std::string WhyNot(float value) const;
  CellSet Cells() const { return CellSet(grid_->Geometry().CellCount()); }

  os::File original_;  ///< Held open: it may be replaced or removed while it is edited.
  DataFile file_;
  FileUpdateFacts updates_;
  int item_ = 1;
  GridSlice slice_;
  std::shared_ptr<CTvn2DOrthoRotatedGridData> grid_;
  std::vector<RowRange> touched_;     ///< Of each row of the shown page, what differs from the file.
  std::map<Page, CellRuns> unsaved_;  ///< Of other pages.
  std::vector<CellWindow> changed_;
  CellSet selection_;
  bool hasSelection_ = false;

  bool isStroke_ = false;
  std::string strokeName_;
  float strokeValue_ = 0;
  CellSet stroke_;                                      ///< The cells of the stroke so far.
  std::vector<std::pair<std::size_t, float>> painted_;  ///< The same with the values that they had.
};

}  // namespace tervane
