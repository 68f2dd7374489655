// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Points, lines and polygons of the map with their table of attributes: shape files (.shp, .shx, .dbf, .prj, .cpg).
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <variant>
#include <vector>

#include "geometry/grid.h"
#include "platform/files.h"
#include "platform/units.h"

namespace tervane {

enum class ShapeKind { Point, Line, Polygon, MultiPoint };

enum class AttributeKind { Text = 0, Whole = 1, Real = 2 };

/// A column of the table of attributes.
struct ShapeField {
  std::string name;
  AttributeKind kind = AttributeKind::Text;
  // Of a table that is written.
  int width = 0;      ///< In characters; as wide as its values need when nothing is said.
  int decimals = 15;  ///< Of real numbers.

  bool operator==(const ShapeField& other) const { return name == other.name && kind == other.kind; }
};

/// The value of an attribute, nothing where the table has none.
using ShapeValue = std::variant<std::monostate, std::string, std::int64_t, double>;

/// The value as a person reads it: a text without the blanks behind it, a whole number by its digits, a real number
/// with six decimals; empty for no value.
std::string TextOf(const ShapeValue& value);

/// One shape. Without points it is a null shape, which keeps its place in the table.
struct Shape {
  std::vector<MapPoint> points;    ///< In metres.
  std::vector<double> z, m;        ///< As many as points, or none. In the unit of the file.
  std::vector<std::size_t> parts;  ///< The first point of each part (line or ring), ascending from 0.
  std::vector<ShapeValue> values;  ///< One for each of the data's `Columns`.

  std::size_t PartEnd(std::size_t part) const { return part + 1 < parts.size() ? parts[part + 1] : points.size(); }
  bool HasValue() const { return !values.empty() && !std::holds_alternative<std::monostate>(values.front()); }
  /// The value of the attribute with which the file was read.
  const ShapeValue& Value() const { return values.front(); }
};

/// What a file must be to be of use.
struct ShapeRequest {
  bool points = false, lines = false, polygons = false;  ///< None set: any kind.
  bool needsAttribute = false;                           ///< One of the table's must be selected.
  /// Of the selected attribute: any, whole numbers, or numbers (a whole number is a real one too). It is then needed.
  std::optional<AttributeKind> attribute;
};

/// The shapes of a file.
class CYbShapeData {
 public:
  virtual ~CYbShapeData() = default;

  /// The unit of the coordinates in the file, one of item 100187; metres unless set.
  void SetAxisLengthUnit(int unitKey) { axisUnit_ = unitKey; }

  /// Reads the shapes and the projection. A missing index (.shx) is made anew from the shapes, and a note says so; a
  /// missing projection (.prj) is an empty text. Errors name file and shape (from 1) and say what is wrong; then the
  /// data are as they were.
  FileResult ReadShapeFile(const std::string& path, ProgressPart progress = {});
  /// The same with the values of one attribute (its name in any case), or of all with an empty name. The table must
  /// have a record for each shape. Shapes whose record is marked as deleted are left out, and a note counts them.
  FileResult ReadShapeAndDbfFile(const std::string& path, const std::string& attribute, ProgressPart progress = {});

  ShapeKind Kind() const { return kind_; }
  /// The attributes of the file, and those whose values the shapes hold.
  const std::vector<ShapeField>& Fields() const { return fields_; }
  const std::vector<ShapeField>& Columns() const { return columns_; }
  const std::vector<Shape>& GetData() const { return shapes_; }
  /// The text of the .prj, empty when there is none.
  const std::string& Projection() const { return projection_; }

 protected:
  FileResult Read(const std::string& path, const std::string* attribute, ProgressPart progress);

  int axisUnit_ = 1000;
  ShapeKind kind_ = ShapeKind::Polygon;
  std::vector<ShapeField> fields_, columns_;
  std::vector<Shape> shapes_;
  std::string projection_;
};

/// Shapes that can be made and written.
class CTvnShapeData : public CYbShapeData {
 public:
  /// The smallest axis-parallel rectangle around all points; false when there are none.
  bool GetTranscribingRect(Envelope& rectangle) const;

  /// Begins anew, without shapes.
  void Create(ShapeKind kind, std::vector<ShapeField> columns, std::string projection);
  /// `shape.values` has a value or nothing for each column.
  void AddShape(Shape shape) { shapes_.push_back(std::move(shape)); }

  /// Writes .shp, .shx, .dbf (with a running number ID where there are no columns), .cpg and, with a projection, .prj,
  /// the coordinates in the axis unit. All are written beside their targets before the first takes its place, the .shp
  /// last. What cannot be stored (a text of more than 254 bytes, a value that does not fit its column, a number that is
  /// none) is an error that names the shape, and nothing is written.
  FileResult SaveShapeFile(const std::string& path) const;
};

/// What a shape file is, apart from the shapes themselves.
struct ShapeFacts {
  std::string error;         ///< Why its shapes cannot be read, with the shape's number; then the rest is empty.
  std::string tableProblem;  ///< Why there are no attributes: no table, a damaged one, or one of other shapes.
  std::string note;
  ShapeKind kind = ShapeKind::Polygon;
  std::vector<ShapeField> fields;
  std::string projection;  ///< The text of the .prj, empty when there is none.
  std::size_t shapes = 0, withoutPoints = 0, points = 0;
  std::optional<Envelope> extent;  ///< In the unit of the file; nothing where no shape has points.
};
/// Reads all shapes once, and keeps the facts while the files stay as they are. Never null.
std::shared_ptr<const ShapeFacts> ShapeFactsOf(const std::string& path);
/// The stamps of a shape's files: .shp, .shx, .dbf and .prj.
std::vector<FileStamp> StampsOfShape(const std::string& path);

/// Tells in words why a file is not as requested ("polygons were expected, the file holds points", "attribute CODE is
/// text, a whole number was expected"), or that it cannot be read. `attribute` is the selected one; empty when none is.
FileResult CheckShapeFile(const std::string& path, const ShapeRequest& request, const std::string& attribute);

}  // namespace tervane
