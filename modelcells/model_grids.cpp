// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "modelcells/model_grids.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "data/datafile_writer.h"
#include "data/grid_files.h"
#include "data/grid_resampling.h"
#include "platform/item_types.h"
#include "platform/units.h"
#include "spatial/data2d.h"

namespace tervane {

namespace {

/// The share of a run that the making of grids takes, in percent.
constexpr int kBegin = 10, kEnd = 90;

}  // namespace

GridMaker MakeQuantity(const CData2DKvf& quantity, const GridGeometry& model) {
  return [source = quantity.CurrentSource(), itemType = quantity.GetItemType(), value = quantity.FixedValue,
          model](CTvn2DOrthoRotatedGridData& grid) -> FileResult {
    if (source.type != CData2DKvf::kUniform) return BuildGrid(source, {}, grid);
    const ItemType* type = FindItemType(itemType);
    const int unit = type ? BaseUnit(*type).key : kDimensionlessUnit;
    return {grid.SetGridData(model, value, kUsualDeleteValue, unit, itemType), {}};
  };
}

std::string PutOnModel(const CTvn2DOrthoRotatedGridData& source, const GridGeometry& model, bool areCodes,
                       std::vector<float>& values) {
  ResamplingTask task;
  task.raster = FileGeometryOf(source.Geometry());
  task.grid = model;
  task.read = [&source](const CellWindow& window, std::span<float> part) {
    auto value = part.begin();
    for (int j = window.j; j < window.j + window.ny; ++j)
      for (int i = window.i; i < window.i + window.nx; ++i)
        *value++ = source.IsEmptyValue(source.Value(i, j)) ? kDeleteValue : source.Value(i, j);
    return std::string();
  };
  return Resample(task, SuitableResampling(task, areCodes), values);
}

FileResult MeanOfGrids(const std::string& path, int item, std::int64_t start, std::int64_t end,
                       CTvn2DOrthoRotatedGridData& mean) {
  // The first step brings geometry and unit.
  if (FileResult read = ReadGridData(path, item, mean); !read.Ok()) return read;
  DataFile file;
  if (const std::string error = file.Open(path); !error.empty()) return {error, {}};
  const TimeAxis& time = file.Time();
  if (!time.hasDates) return {};
  const bool isAmount = file.Items()[static_cast<std::size_t>(item) - 1].valueType == ValueType::StepAccumulated;
  const std::size_t cells = mean.Geometry().CellCount();
  std::vector<double> sums(cells, 0.0), seconds(cells, 0.0);
  std::vector<float> values(cells);
  for (std::size_t step = 0; step < time.steps; ++step) {
    const std::int64_t begin = step > 0     ? time.stamps[step - 1]
                               : time.begin ? time.begin->SecondsSinceEpoch()
                                            : time.stamps[0] - time.stepSeconds;
    const auto shared = static_cast<double>(std::min(end, time.stamps[step]) - std::max(start, begin));
    if (shared <= 0) continue;
    if (const std::string error = file.Read({item, step, 1, {}}, values, mean.ItemType()); !error.empty())
      return {error, {}};
    const double weight = isAmount ? shared / static_cast<double>(time.stamps[step] - begin) : shared;
    for (std::size_t cell = 0; cell < cells; ++cell) {
      if (values[cell] == kDeleteValue) continue;
      sums[cell] += static_cast<double>(values[cell]) * weight;
      seconds[cell] += shared;
    }
  }
  float* means = mean.GetData();
  for (std::size_t cell = 0; cell < cells; ++cell)
    means[cell] = seconds[cell] > 0 ? static_cast<float>(sums[cell] / seconds[cell]) : mean.DeleteValue();
  return {};
}

int ModelGridFile::Add(ModelGrid grid) {
  grids_.push_back(std::move(grid));
  return static_cast<int>(grids_.size());
}

bool ModelGridFile::Write(const CTvn2DOrthoRotatedGridData& domain, WorkLog& log) {
  NewDataFile content;
  content.geometry = FileGeometryOf(domain.Geometry());
  content.hasTime = false;
  for (const ModelGrid& grid : grids_) {
    const ItemType* type = FindItemType(grid.itemType);
    content.items.push_back({grid.title, grid.itemType, type ? BaseUnit(*type).key : kDimensionlessUnit});
  }
  DataFileWriter writer;
  if (const std::string error = writer.Create(path_, content); !error.empty()) {
    log.Error({}, error);
    return false;
  }
  for (std::size_t n = 0; n < grids_.size(); ++n) {
    ModelGrid& grid = grids_[n];
    log.Progress(kBegin + static_cast<int>((kEnd - kBegin) * n / grids_.size()), grid.title);
    CTvn2DOrthoRotatedGridData source;
    if (const FileResult made = grid.make(source); !made.Ok()) {
      log.Error(grid.place, made.error);
      return false;
    }
    const bool isCode = grid.itemType == quantity::kCode;
    std::vector<float> values;
    if (const std::string problem = PutOnModel(source, domain.Geometry(), isCode, values); !problem.empty()) {
      log.Error(grid.place, problem);
      return false;
    }
    std::size_t missing = 0;
    for (std::size_t cell = 0; cell < values.size(); ++cell) {
      const bool isInside = !domain.IsEmptyValue(domain.Values()[cell]);
      if (!isInside || values[cell] == kDeleteValue) {
        values[cell] = kDeleteValue;
        missing += isInside;
      }
    }
    grid.values.Add(values);
    if (isCode)
      for (const float value : values)
        if (value != kDeleteValue) ++grid.cellsOfCode[static_cast<int>(std::lround(value))];
    if (grid.mayLeaveCells && grid.values.count == 0)
      log.Warning(grid.place, fmt::format("{} has no value in any cell of the domain", grid.title));
    if (missing > 0 && !grid.mayLeaveCells)
      log.Warning(grid.place, fmt::format("{} cells of the domain have no {}", missing, grid.title));
    if (const std::string error = writer.Put(static_cast<int>(n) + 1, values); !error.empty()) {
      log.Error(grid.place, error);
      return false;
    }
  }
  const FileResult finished = writer.Finish();
  if (!finished.Ok()) log.Error({}, finished.error);
  return finished.Ok();
}

}  // namespace tervane
