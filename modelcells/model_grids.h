// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The quantities of a setup on the cells of its model, in one data file.
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include "data/datafile.h"
#include "geometry/grid.h"
#include "modelcells/work_log.h"
#include "platform/item_types.h"

namespace tervane {

class CData2DKvf;

/// Makes values, in the item type's base unit, on any grid in the model's plane.
using GridMaker = std::function<FileResult(CTvn2DOrthoRotatedGridData&)>;
/// That of a quantity; a uniform one is made on the model's cells.
GridMaker MakeQuantity(const CData2DKvf& quantity, const GridGeometry& model);
/// The values of a grid on the model's cells, in one plane with it; kDeleteValue where it has none. "" or why not.
std::string PutOnModel(const CTvn2DOrthoRotatedGridData& source, const GridGeometry& model, bool areCodes,
                       std::vector<float>& values);

/// The mean of an item of grids over the time from `start` to `end` (seconds since 1970-01-01), by cell, in the base
/// unit of its item type; of amounts over steps their rate per second. A value holds over the step that its stamp ends;
/// a file without dates holds always. A cell without a value then is empty.
FileResult MeanOfGrids(const std::string& path, int item, std::int64_t start, std::int64_t end,
                       CTvn2DOrthoRotatedGridData& mean);

/// A quantity that is to be put on the model's cells.
struct ModelGrid {
  std::string title;
  std::string place;  ///< Path of the node, for messages.
  int itemType = quantity::kUndefined;
  GridMaker make;
  std::function<std::string(int code)> nameOfCode;  ///< Of the zones of a quantity of codes.
  bool mayLeaveCells = false;                       ///< Cells without a value are worth no warning.

  // Known when the values were written.
  ValueSummary values;
  std::map<int, std::size_t> cellsOfCode;  ///< Of a quantity of codes.
};

/// Collects quantities, and writes them as the items of one file.
class ModelGridFile {
 public:
  explicit ModelGridFile(std::string path) : path_(std::move(path)) {}

  const std::string& Path() const { return path_; }
  const std::vector<ModelGrid>& Grids() const { return grids_; }
  /// The number that the quantity's item will have.
  int Add(ModelGrid grid);
  /// Makes one quantity after the other, puts it on the cells of the domain, and writes it. Outside the domain all is
  /// empty. False when one could not be made, which the log tells; then an old file stands.
  bool Write(const CTvn2DOrthoRotatedGridData& domain, WorkLog& log);

 private:
  std::string path_;
  std::vector<ModelGrid> grids_;
};

}  // namespace tervane
