// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/sampled_grid.h"

#include <algorithm>
#include <array>
#include <string_view>
#include <utility>
#include <vector>

#include "data/datafile.h"
#include "platform/os.h"

namespace tervane {

namespace {

FileResult NotSampled(std::string error) { return {std::move(error), {}}; }

/// Of other files pieces are unpacked as a whole, so that single rows would take longer than all.
bool HasPlainRows(const std::string& path) {
  std::error_code error;
  os::File file = os::File::OpenForReading(path, error);
  std::array<char, 3> begin{};
  return !error && file.Read(begin.data(), begin.size(), error) == begin.size() &&
         std::string_view(begin.data(), begin.size()) == "CDF";
}

/// The middle one of every so many places.
std::size_t PlaceOf(int number, int every, int count) {
  return static_cast<std::size_t>(std::min(number * every + every / 2, count - 1));
}

/// Takes the cells of a whole grid.
FileResult Sample(const CTvn2DOrthoRotatedGridData& whole, const GridGeometry& geometry, int every,
                  CTvn2DOrthoRotatedGridData& grid) {
  std::vector<float> values;
  values.reserve(geometry.CellCount());
  for (int j = 0; j < geometry.ny; ++j)
    for (int i = 0; i < geometry.nx; ++i)
      values.push_back(whole.Value(static_cast<int>(PlaceOf(i, every, whole.Geometry().nx)),
                                   static_cast<int>(PlaceOf(j, every, whole.Geometry().ny))));
  FileResult taken =
      NotSampled(grid.TakeValues(geometry, std::move(values), whole.DeleteValue(), whole.ItemUnit(), whole.ItemType()));
  grid.SetItemName(whole.ItemName());
  return taken;
}

}  // namespace

FileResult ReadSampledGrid(const std::string& path, int number, const GridSlice& slice, int every,
                           CTvn2DOrthoRotatedGridData& grid, ProgressPart progress) {
  if (every <= 1) return ReadGridData(path, number, grid, progress, slice);
  GridGeometry geometry;
  if (FileResult read = ReadGeoInfoFromNdsFile(path, number, geometry); !read.Ok()) return read;
  const int nx = geometry.nx, ny = geometry.ny;
  geometry.nx = (nx + every - 1) / every;
  geometry.ny = (ny + every - 1) / every;
  geometry.cellSize *= every;
  if (!HasPlainRows(path)) {
    CTvn2DOrthoRotatedGridData whole;
    FileResult read = ReadGridData(path, number, whole, progress, slice);
    return read.Ok() ? Sample(whole, geometry, every, grid) : read;
  }
  DataFile file;
  if (std::string error = file.Open(path); !error.empty()) return NotSampled(std::move(error));
  // The file may have become another one since its place was read.
  if (static_cast<std::size_t>(number) > file.Items().size() ||
      file.Items()[static_cast<std::size_t>(number - 1)].geometry.nx != nx)
    return NotSampled(path + ": it changed while it was read");
  const DataItem& item = file.Items()[static_cast<std::size_t>(number - 1)];
  std::vector<float> row(static_cast<std::size_t>(nx)), values;
  values.reserve(geometry.CellCount());
  ValueSelection selection{number, slice.step, 1, item.dimensions == 3 ? std::optional(slice.layer) : std::nullopt};
  for (int j = 0; j < geometry.ny; ++j) {
    if (progress.IsCancelled()) return NotSampled(kCancelled);
    progress.Report(static_cast<double>(j) / geometry.ny);
    selection.cells = CellWindow{0, static_cast<int>(PlaceOf(j, every, ny)), nx, 1};
    if (std::string error = file.Read(selection, row, item.itemType); !error.empty())
      return NotSampled(std::move(error));
    for (int i = 0; i < geometry.nx; ++i) {
      const float value = row[PlaceOf(i, every, nx)];
      values.push_back(value == kDeleteValue ? kUsualDeleteValue : value);
    }
  }
  const ItemType* type = FindItemType(item.itemType);
  const int unit = type && type->code != quantity::kUndefined ? BaseUnit(*type).key : item.unitKey;
  FileResult taken = NotSampled(grid.TakeValues(geometry, std::move(values), kUsualDeleteValue, unit, item.itemType));
  grid.SetItemName(item.name);
  return taken;
}

}  // namespace tervane
