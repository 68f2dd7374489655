// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/projection_copy.h"

#include <algorithm>
#include <cmath>
#include <memory>
#include <vector>

#include <fmt/format.h>

#include "data/datafile.h"
#include "data/datafile_writer.h"
#include "data/grid_resampling.h"
#include "geometry/cart.h"
#include "geometry/shapes.h"
#include "platform/item_types.h"

namespace tervane {

namespace {

/// The grids of one file on their way to another.
class GridCopy {
 public:
  GridCopy(const GridGeometry& grid, const std::string& from) : grid_(grid), from_(from) {}

  /// "" or why not.
  std::string Run(const std::string& to, ProgressPart progress);
  const std::string& Note() const { return note_; }

 private:
  std::string Open();
  NewDataFile Described() const;
  std::string CopyLayer(const DataItem& item, int number, std::size_t step, int layer);

  const GridGeometry& grid_;
  const std::string& from_;
  DataFile file_;
  std::unique_ptr<CYbProjectionChange> change_;
  DataFileWriter writer_;
  std::vector<float> values_;
  std::size_t given_ = 0;  ///< Cells that got a value.
  std::string note_;
};

std::string GridCopy::Open() {
  if (std::string error = file_.Open(from_); !error.empty()) return error;
  const DataItem* first = nullptr;
  for (const DataItem& item : file_.Items()) {
    if (item.dimensions < 2 || !item.geometry.IsPlaced())
      return fmt::format("{}: {} is no grid with a place", from_, item.name);
    if (item.unitKey == 0) return fmt::format("{}: the unit {} of {} is not known", from_, item.unitText, item.name);
    if (!first) first = &item;
    if (!(item.geometry == first->geometry)) return fmt::format("{}: its items stand on several grids", from_);
  }
  if (!first) return from_ + ": it has no items";
  if (!file_.Time().hasDates && file_.Time().steps > 1) return from_ + ": its steps have no dates";
  change_ = std::make_unique<CYbProjectionChange>(first->geometry.projection, grid_.projection);
  return change_->Problem().empty() ? std::string() : fmt::format("{}: {}", from_, change_->Problem());
}

NewDataFile GridCopy::Described() const {
  NewDataFile content;
  const DataItem& first = file_.Items().front();
  content.dimensions = first.dimensions;
  content.geometry = FileGeometryOf(grid_);
  content.geometry.nz = first.geometry.nz;
  content.hasTime = file_.Time().hasDates;
  content.begin = file_.Time().begin;
  for (const DataItem& item : file_.Items())
    content.items.push_back({item.name, item.itemType, item.unitKey, item.valueType});
  return content;
}

std::string GridCopy::CopyLayer(const DataItem& item, int number, std::size_t step, int layer) {
  ResamplingTask task;
  task.raster = item.geometry;
  task.raster.nz = 1;
  task.grid = grid_;
  task.change = change_.get();
  task.read = [&](const CellWindow& window, std::span<float> values) {
    return file_.Read({.item = number, .step = item.hasTime ? step : 0, .layer = layer, .cells = window}, values);
  };
  const Resampling method = SuitableResampling(task, item.itemType == quantity::kCode);
  if (std::string error = Resample(task, method, values_); !error.empty()) return error;
  given_ += static_cast<std::size_t>(
      std::ranges::count_if(values_, [](float value) { return value != kDeleteValue && std::isfinite(value); }));
  return writer_.PutLayer(number, layer, values_);
}

std::string GridCopy::Run(const std::string& to, ProgressPart progress) {
  if (std::string error = Open(); !error.empty()) return error;
  if (std::string error = writer_.Create(to, Described()); !error.empty()) return error;
  const std::size_t steps = file_.Time().steps;
  const int layers = file_.Items().front().geometry.nz;
  for (std::size_t step = 0; step < steps; ++step) {
    if (file_.Time().hasDates)
      if (std::string error = writer_.AddStep(file_.Time().Stamp(step)); !error.empty()) return error;
    for (std::size_t i = 0; i < file_.Items().size(); ++i)
      for (int layer = 0; layer < layers; ++layer) {
        progress.ThrowIfCancelled();
        const DataItem& item = file_.Items()[i];
        if (std::string error = CopyLayer(item, static_cast<int>(i) + 1, step, layer); !error.empty()) return error;
      }
    progress.Report(static_cast<double>(step + 1) / static_cast<double>(steps + 1));
  }
  if (given_ == 0) return from_ + ": it has no value within the model grid";
  const FileResult written = writer_.Finish(progress.Part(0.99, 1));
  note_ = written.note;
  return written.error;
}

}  // namespace

FileResult CopyGridsOnto(const GridGeometry& grid, const std::string& from, const std::string& to,
                         ProgressPart progress) {
  try {
    if (const std::string problem = grid.Problem(); !problem.empty()) return {"the model grid: " + problem, {}};
    GridCopy copy(grid, from);
    std::string error = copy.Run(to, progress);
    return {std::move(error), copy.Note()};
  } catch (const Cancelled&) {
    return {"cancelled", {}};
  }
}

FileResult CopyShapesInto(const std::string& projection, int axisUnit, const std::string& from, const std::string& to,
                          ProgressPart progress) {
  CYbShapeData shapes;
  // In the numbers of the file, as its own system means them.
  FileResult read = shapes.ReadShapeAndDbfFile(from, "", progress.Part(0, 0.4));
  if (!read.Ok()) return read;
  const CYbProjectionChange change(shapes.Projection(), projection);
  if (!change.Problem().empty()) return {fmt::format("{}: {}", from, change.Problem()), {}};
  CTvnShapeData copy;
  copy.SetAxisLengthUnit(axisUnit);
  copy.Create(shapes.Kind(), shapes.Columns(), projection);
  std::size_t number = 0;
  for (const Shape& shape : shapes.GetData()) {
    if (progress.IsCancelled()) return {"cancelled", {}};
    ++number;
    Shape moved = shape;
    for (MapPoint& point : moved.points)
      if (!change.Forward(point.x, point.y))
        return {
            fmt::format("{}: shape {} has a point outside the other system: {}, {}", from, number, point.x, point.y),
            {}};
    copy.AddShape(std::move(moved));
    progress.Report(0.4 + 0.5 * static_cast<double>(number) / static_cast<double>(shapes.GetData().size()));
  }
  FileResult saved = copy.SaveShapeFile(to);
  if (saved.note.empty()) saved.note = read.note;
  return saved;
}

}  // namespace tervane
