// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Points with values out of files.
#include <variant>

#include <fmt/format.h>

#include "geometry/grid_interpolation.h"
#include "geometry/shapes.h"
#include "platform/item_types.h"

namespace tervane {

FileResult ReadScatteredFile(const ScatteredFile& file, std::vector<ScatteredPoint>& points, ProgressPart progress) {
  points.clear();
  const auto refused = [&](std::string_view reason) {
    points.clear();
    return FileResult{fmt::format("cannot use {}: {}", file.path, reason), {}};
  };
  const Unit* const axisUnit = FindUnit(file.axisUnit);
  if (!axisUnit || axisUnit->scale.dimension != Dimension::Length) {
    return refused(fmt::format("the unit {} of its coordinates is no length", file.axisUnit));
  }
  UnitConversion toBase;
  if (const ItemType* const itemType = FindItemType(file.itemType); itemType && file.itemType != quantity::kUndefined) {
    if (!AllowsUnit(*itemType, file.itemUnit)) {
      return refused(fmt::format("the unit {} of its values is none of {}", file.itemUnit, itemType->name));
    }
    toBase = *ConversionBetween(FindUnit(file.itemUnit)->scale, BaseUnit(*itemType).scale);
  }
  FileResult result;
  if (file.isXyz) {
    result = ReadXyzFile(file.path, points, progress);
    const UnitConversion toMetres = *ConversionBetween(axisUnit->scale, UnitScale{Dimension::Length});
    for (ScatteredPoint& point : points) point = {toMetres(point.x), toMetres(point.y), toBase(point.z)};
    return result;
  }
  CYbShapeData shapes;
  shapes.SetAxisLengthUnit(file.axisUnit);
  const bool isHeight = file.attribute.empty();
  result = isHeight ? shapes.ReadShapeFile(file.path, progress)
                    : shapes.ReadShapeAndDbfFile(file.path, file.attribute, progress);
  if (!result.Ok()) return result;
  if (shapes.Kind() == ShapeKind::Polygon) return refused("points or lines were expected, the file holds polygons");
  if (!isHeight && shapes.Columns().front().kind == AttributeKind::Text) {
    return refused(fmt::format("attribute {} is text, a number was expected", shapes.Columns().front().name));
  }
  std::size_t left = 0;
  for (const Shape& shape : shapes.GetData()) {
    if (isHeight ? shape.z.empty() : !shape.HasValue()) {
      left += !shape.points.empty();
      continue;
    }
    double value = 0;
    if (!isHeight) {
      const auto* const whole = std::get_if<std::int64_t>(&shape.Value());
      value = whole ? static_cast<double>(*whole) : std::get<double>(shape.Value());
    }
    for (std::size_t i = 0; i < shape.points.size(); ++i) {
      points.push_back({shape.points[i].x, shape.points[i].y, toBase(isHeight ? shape.z[i] : value)});
    }
  }
  if (points.empty()) return refused("no shape has both points and a value");
  if (left > 0) {
    result.note += fmt::format("{}{} shapes without a value are left out", result.note.empty() ? "" : "; ", left);
  }
  return result;
}

FileResult CTvn2DOrthoRotatedGridData::CreateGridData_GIS(GridGeometry geometry, float deleteValue,
                                                          const ScatteredFile& file,
                                                          const InterpolationOptions& options) {
  constexpr double kReading = 0.1;
  std::vector<ScatteredPoint> points;
  FileResult read = ReadScatteredFile(file, points, options.progress.Part(0, kReading));
  if (!read.Ok()) return read;
  std::vector<float> values;
  InterpolationOptions rest = options;
  rest.progress = options.progress.Part(kReading, 1);
  FileResult result = Interpolate(std::move(points), geometry, deleteValue, rest, values);
  const auto* const itemType = FindItemType(file.itemType);
  const int unit = itemType ? BaseUnit(*itemType).key : file.itemUnit;
  if (result.Ok()) result.error = TakeValues(std::move(geometry), std::move(values), deleteValue, unit, file.itemType);
  if (!result.Ok()) {
    return {fmt::format("cannot use {}: {}", file.path, result.error), {}};
  }
  if (!read.note.empty()) result.note = read.note + (result.note.empty() ? "" : "; ") + result.note;
  return result;
}

}  // namespace tervane
