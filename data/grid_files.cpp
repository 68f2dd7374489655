// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/grid_files.h"

#include <cmath>

#include <fmt/format.h>

#include "data/datafile_facts.h"
#include "data/datafile_writer.h"
#include "geometry/grid_interpolation.h"
#include "platform/item_types.h"
#include "platform/text.h"

namespace tervane {

namespace {

FileResult Failed(std::string error) { return {std::move(error), {}}; }

/// Where an item's cells stand in a model; why it cannot be read as a grid of square cells, or nothing.
std::string GeometryOfItem(const std::string& path, const std::vector<DataItem>& items, int number,
                           GridGeometry& geometry) {
  if (number < 1 || static_cast<std::size_t>(number) > items.size())
    return fmt::format("{}: there is no item {}: the file has {}", path, number, items.size());
  const DataItem& item = items[static_cast<std::size_t>(number - 1)];
  if (item.dimensions < 2) return fmt::format("{}: item {} is no grid", path, number);
  const std::string reason = ToModelGrid(item.geometry, geometry);
  return reason.empty() ? "" : fmt::format("{}: item {} has {}; resample the grid", path, number, reason);
}

}  // namespace

FileResult ReadGridData(const std::string& path, int number, CTvn2DOrthoRotatedGridData& grid, ProgressPart progress,
                        const GridSlice& slice) {
  if (path.empty()) return Failed("no file is chosen");
  DataFile file;
  if (std::string error = file.Open(path); !error.empty()) return Failed(std::move(error));
  GridGeometry geometry;
  if (std::string reason = GeometryOfItem(path, file.Items(), number, geometry); !reason.empty())
    return Failed(std::move(reason));
  const DataItem* item = &file.Items()[static_cast<std::size_t>(number - 1)];
  if (std::string problem = geometry.Problem(); !problem.empty()) return Failed(fmt::format("{}: {}", path, problem));
  std::vector<float> values(item->CellsOfLayer());
  const ValueSelection selection{number, slice.step, 1,
                                 item->dimensions == 3 ? std::optional(slice.layer) : std::nullopt};
  if (std::string error = file.Read(selection, values, item->itemType, progress); !error.empty())
    return Failed(std::move(error));
  for (float& value : values)
    if (value == kDeleteValue) value = kUsualDeleteValue;
  const ItemType* type = FindItemType(item->itemType);
  const int unit = type && type->code != quantity::kUndefined ? BaseUnit(*type).key : item->unitKey;
  if (std::string problem =
          grid.TakeValues(std::move(geometry), std::move(values), kUsualDeleteValue, unit, item->itemType);
      !problem.empty())
    return Failed(fmt::format("{}: {}", path, problem));
  grid.SetItemName(item->name);
  return {};
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
  const auto file = DataFileFactsOf(path);
  return Failed(file->error.empty() ? GeometryOfItem(path, file->items, number, geometry) : file->error);
}

std::string ItemNameOf(const std::string& path, int number) {
  const auto file = DataFileFactsOf(path);
  const DataItem* item = file->Item(number);
  return item ? item->name : std::string();
}

DomainFileState ReadDomainFacts(const std::string& path, DomainFileFacts& facts) {
  const auto file = DataFileFactsOf(path);
  if (!file->error.empty()) return DomainFileState::Unreadable;
  if (file->items.empty()) return DomainFileState::NoItem;
  const auto range = ItemRangeOf(path, 1);
  if (!range->error.empty()) return DomainFileState::NoStatistics;
  facts = {range->statistics.smallest, range->statistics.largest};
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
