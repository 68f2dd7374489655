// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/grid_files.h"

#include <fmt/format.h>

#include "platform/datafile.h"
#include "platform/datafile_writer.h"
#include "platform/grid_interpolation.h"

namespace tervane {

namespace {

FileResult Failed(std::string error) { return {std::move(error), {}}; }

/// Opens a file and finds an item with a grid of square cells.
FileResult OpenGrid(const std::string& path, int number, DataFile& file, const DataItem*& item) {
  if (path.empty()) return Failed("no file is chosen");
  if (std::string error = file.Open(path); !error.empty()) return Failed(std::move(error));
  if (number < 1 || number > static_cast<int>(file.Items().size()))
    return Failed(fmt::format("{}: there is no item {}: the file has {}", path, number, file.Items().size()));
  item = &file.Items()[static_cast<std::size_t>(number - 1)];
  if (item->dimensions < 2) return Failed(fmt::format("{}: item {} is no grid", path, number));
  return {};
}

GridGeometry GeometryOf(const DataItem& item) {
  const FileGeometry& g = item.geometry;
  return {g.nx, g.ny, g.IsPlaced() ? g.cellSize : 1.0, g.x0, g.y0, g.rotation, g.projection};
}

}  // namespace

FileResult ReadGridData(const std::string& path, int number, CTvn2DOrthoRotatedGridData& grid, ProgressPart progress,
                        const GridSlice& slice) {
  DataFile file;
  const DataItem* item = nullptr;
  if (FileResult result = OpenGrid(path, number, file, item); !result.Ok()) return result;
  GridGeometry geometry = GeometryOf(*item);
  if (std::string problem = geometry.Problem(); !problem.empty()) return Failed(fmt::format("{}: {}", path, problem));
  std::vector<float> values(item->CellsOfLayer());
  const ValueSelection selection{number, slice.step, 1,
                                 item->dimensions == 3 ? std::optional(slice.layer) : std::nullopt};
  if (std::string error = file.Read(selection, values, item->itemType, progress); !error.empty())
    return Failed(std::move(error));
  for (float& value : values)
    if (value == kDeleteValue) value = kUsualDeleteValue;
  const ItemType* type = FindItemType(item->itemType);
  const int unit = type && type->code != kUndefinedItemType ? BaseUnit(*type).key : item->unitKey;
  if (std::string problem =
          grid.TakeValues(std::move(geometry), std::move(values), kUsualDeleteValue, unit, item->itemType);
      !problem.empty())
    return Failed(fmt::format("{}: {}", path, problem));
  grid.SetItemName(item->name);
  return {};
}

FileGeometry FileGeometryOf(const GridGeometry& geometry) {
  FileGeometry place;
  place.nx = geometry.nx;
  place.ny = geometry.ny;
  place.cellSize = place.cellHeight = geometry.cellSize;
  place.x0 = geometry.x0;
  place.y0 = geometry.y0;
  place.rotation = geometry.rotation;
  place.projection = geometry.projection;
  return place;
}

FileResult WriteGridData(const std::string& path, const CTvn2DOrthoRotatedGridData& grid, ProgressPart progress) {
  NewDataFile content;
  content.geometry = FileGeometryOf(grid.Geometry());
  const ItemType* type = FindItemType(grid.ItemType());
  const int baseUnit = type ? BaseUnit(*type).key : kDimensionlessUnit;
  content.items.push_back({grid.ItemName().empty() ? "Grid" : grid.ItemName(), grid.ItemType(),
                           grid.ItemUnit() ? grid.ItemUnit() : baseUnit, ValueType::Instantaneous});
  content.hasTime = false;
  DataFileWriter writer;
  if (std::string error = writer.Create(path, content); !error.empty()) return Failed(std::move(error));
  std::vector<float> values = grid.Values();
  for (float& value : values)
    if (grid.IsEmptyValue(value)) value = kDeleteValue;
  if (std::string error = writer.Put(1, values, progress); !error.empty()) return Failed(std::move(error));
  return writer.Finish(progress);
}

FileResult ReadGeoInfoFromNdsFile(const std::string& path, int number, GridGeometry& geometry) {
  DataFile file;
  const DataItem* item = nullptr;
  FileResult result = OpenGrid(path, number, file, item);
  if (result.Ok()) geometry = GeometryOf(*item);
  return result;
}

std::string ItemNameOf(const std::string& path, int number) {
  DataFile file;
  const bool isOpen = !path.empty() && file.Open(path).empty();
  const bool isThere = isOpen && number >= 1 && number <= static_cast<int>(file.Items().size());
  return isThere ? file.Items()[static_cast<std::size_t>(number - 1)].name : std::string();
}

DomainFileState ReadDomainFacts(const std::string& path, DomainFileFacts& facts) {
  DataFile file;
  if (path.empty() || !file.Open(path).empty()) return DomainFileState::Unreadable;
  if (file.Items().empty()) return DomainFileState::NoItem;
  ItemStatistics statistics;
  if (!file.Statistics(1, statistics).empty()) return DomainFileState::NoStatistics;
  facts = {statistics.smallest, statistics.largest};
  return DomainFileState::Read;
}

FileResult ReadXyzShapes(const std::string& path, int axisUnit, CTvnShapeData& shapes, ProgressPart progress) {
  ScatteredFile file;
  file.path = path;
  file.isXyz = true;
  file.axisUnit = axisUnit;
  std::vector<ScatteredPoint> points;
  FileResult result = ReadScatteredFile(file, points, progress);
  if (!result.Ok()) return result;
  shapes.Create(ShapeKind::Point, {{"Z", AttributeKind::Real}}, {});
  for (const ScatteredPoint& point : points) {
    Shape shape;
    shape.points = {{point.x, point.y}};
    shape.parts = {0};
    shape.values = {point.z};
    shapes.AddShape(std::move(shape));
  }
  return result;
}

}  // namespace tervane
