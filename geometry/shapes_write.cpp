// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Writing shape files.
#include <algorithm>
#include <cmath>
#include <fstream>
#include <new>
#include <string_view>

#include <fmt/format.h>
#include <shapefil.h>

#include "geometry/shapelib_memory.h"
#include "geometry/shapes.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {
namespace {

using namespace shapelib;

using Reason = std::string;

constexpr std::size_t kMostTextBytes = 254;

/// The text of a value in its column, or why it cannot stand there.
Reason StoredText(const ShapeField& field, const ShapeValue& value, std::string& text) {
  text.clear();
  if (std::holds_alternative<std::monostate>(value)) return {};
  const auto* const asText = std::get_if<std::string>(&value);
  const auto* const asWhole = std::get_if<std::int64_t>(&value);
  const auto* const asReal = std::get_if<double>(&value);
  if (field.kind == AttributeKind::Text && asText) {
    text = *asText;
    if (text.size() > kMostTextBytes)
      return fmt::format("the text of {} has {} bytes; a table holds {}", field.name, text.size(), kMostTextBytes);
    if (text.find('\0') != std::string::npos)
      return fmt::format("the text of {} contains a zero character", field.name);
    return {};
  }
  if (field.kind == AttributeKind::Whole && asWhole) {
    text = fmt::format("{}", *asWhole);
    return text.size() > 18 ? fmt::format("{} is {}; a table holds 18 digits", field.name, *asWhole) : Reason();
  }
  if (field.kind == AttributeKind::Real && (asReal || asWhole)) {
    const double real = asReal ? *asReal : static_cast<double>(*asWhole);
    if (!std::isfinite(real)) return fmt::format("{} is {}, which is no number", field.name, real);
    text = field.width > 0 ? fmt::format("{:.{}f}", real, field.decimals) : ShortestNumber(real);
    return {};
  }
  return fmt::format("the value of {} is not {}", field.name, NameOf(field.kind));
}

/// Makes the bytes of the table.
Reason MakeTable(const std::vector<ShapeField>& columns, const std::vector<Shape>& shapes) {
  // The texts first: how wide a column must be is known only then.
  std::vector<std::vector<std::string>> texts(columns.size(), std::vector<std::string>(shapes.size()));
  const TableHandle table(DBFCreateLL("memory.dbf", "UTF-8", Hooks()));
  if (!table) return "no table can be made";
  for (std::size_t c = 0; c < columns.size(); ++c) {
    const ShapeField& field = columns[c];
    if (field.name.empty() || field.name.size() > XBASE_FLDNAME_LEN_WRITE) {
      return fmt::format("the name of the attribute \"{}\" has {} bytes; 1 to 10 can be stored", field.name,
                         field.name.size());
    }
    const bool isFixed = field.width > 0;
    std::size_t width = isFixed                              ? static_cast<std::size_t>(field.width)
                        : field.kind == AttributeKind::Text  ? 1
                        : field.kind == AttributeKind::Whole ? 9
                                                             : 24;
    for (std::size_t i = 0; i < shapes.size(); ++i) {
      if (shapes[i].values.size() != columns.size()) {
        return fmt::format("shape {} has {} values for {} attributes", i + 1, shapes[i].values.size(), columns.size());
      }
      if (const Reason reason = StoredText(field, shapes[i].values[c], texts[c][i]); !reason.empty())
        return fmt::format("shape {}: {}", i + 1, reason);
      if (isFixed && texts[c][i].size() > width)
        return fmt::format("shape {}: {} is {}; its column holds {} characters", i + 1, field.name, texts[c][i], width);
      width = std::max(width, texts[c][i].size());
    }
    const bool isReal = field.kind == AttributeKind::Real;
    if (DBFAddNativeFieldType(table.get(), field.name.c_str(), field.kind == AttributeKind::Text ? 'C' : 'N',
                              static_cast<int>(width), isReal ? field.decimals : 0) < 0) {
      return fmt::format("the attribute {} does not fit into the table", field.name);
    }
  }
  for (std::size_t i = 0; i < shapes.size(); ++i) {
    for (std::size_t c = 0; c < columns.size(); ++c) {
      const int row = static_cast<int>(i), column = static_cast<int>(c);
      std::string& text = texts[c][i];
      const bool isStored = text.empty() ? DBFWriteNULLAttribute(table.get(), row, column)
                                         : DBFWriteAttributeDirectly(table.get(), row, column, text.data());
      if (!isStored) return fmt::format("shape {}: its attributes cannot be stored", i + 1);
    }
  }
  return {};
}

/// Makes the bytes of shapes and index.
Reason MakeShapes(ShapeKind kind, const std::vector<Shape>& shapes, const UnitConversion& fromMetres) {
  const bool hasZ = std::any_of(shapes.begin(), shapes.end(), [](const Shape& shape) { return !shape.z.empty(); });
  const bool hasM = std::any_of(shapes.begin(), shapes.end(), [](const Shape& shape) { return !shape.m.empty(); });
  const int type = FileType(kind, hasZ, hasM);
  const ShapeHandle file(SHPCreateLL("memory.shp", type, Hooks()));
  if (!file) return "no shape file can be made";
  std::vector<double> x, y;
  std::vector<int> parts;
  for (std::size_t i = 0; i < shapes.size(); ++i) {
    const Shape& shape = shapes[i];
    const auto isFit = [&](const std::vector<double>& more) {
      return more.empty() || more.size() == shape.points.size();
    };
    if (!isFit(shape.z) || !isFit(shape.m)) return fmt::format("shape {} has not one z and m for each point", i + 1);
    if (kind == ShapeKind::Point && shape.points.size() > 1)
      return fmt::format("shape {} has {} points in a file of single ones", i + 1, shape.points.size());
    x.clear();
    y.clear();
    for (const MapPoint point : shape.points) {
      x.push_back(fromMetres(point.x));
      y.push_back(fromMetres(point.y));
      if (!std::isfinite(x.back()) || !std::isfinite(y.back()))
        return fmt::format("shape {} has a point that is no number", i + 1);
    }
    parts.assign(shape.parts.begin(), shape.parts.end());
    const bool hasParts = kind == ShapeKind::Line || kind == ShapeKind::Polygon;
    if (hasParts && parts.empty()) parts = {0};
    const ObjectHandle object(
        shape.points.empty()
            ? SHPCreateObject(SHPT_NULL, -1, 0, nullptr, nullptr, 0, nullptr, nullptr, nullptr, nullptr)
            : SHPCreateObject(type, -1, hasParts ? static_cast<int>(parts.size()) : 0, parts.data(), nullptr,
                              static_cast<int>(x.size()), x.data(), y.data(),
                              shape.z.empty() ? nullptr : shape.z.data(), shape.m.empty() ? nullptr : shape.m.data()));
    if (!object || SHPWriteObject(file.get(), -1, object.get()) < 0)
      return fmt::format("shape {} cannot be stored", i + 1);
  }
  return {};
}

struct NamedBytes {
  std::string path;
  std::string_view bytes;
};

/// Writes all files beside their targets before the first takes its place, so that a full disk leaves all as they were.
FileResult WriteSet(const std::vector<NamedBytes>& set) {
  std::vector<FileReplacement> replacements(set.size());
  for (std::size_t i = 0; i < set.size(); ++i) {
    if (FileResult begun = replacements[i].Begin(set[i].path); !begun.Ok()) return begun;
    std::ofstream stream(NativePath(replacements[i].TemporaryPath()), std::ios::binary);
    stream.write(set[i].bytes.data(), static_cast<std::streamsize>(set[i].bytes.size()));
    stream.close();
    if (!stream) return {fmt::format("cannot write {}: the disk may be full; nothing was written", set[i].path), {}};
  }
  FileResult result;
  for (FileReplacement& replacement : replacements) {
    const FileResult written = replacement.Commit();
    if (!written.Ok()) return written;
    if (!written.note.empty()) AddNote(result.note, written.note);
  }
  return result;
}

}  // namespace

bool CTvnShapeData::GetTranscribingRect(Envelope& rectangle) const {
  bool isAny = false;
  for (const Shape& shape : shapes_) {
    for (const MapPoint point : shape.points) {
      if (!isAny) rectangle = {point.x, point.y, point.x, point.y};
      isAny = true;
      rectangle.xMin = std::min(rectangle.xMin, point.x);
      rectangle.yMin = std::min(rectangle.yMin, point.y);
      rectangle.xMax = std::max(rectangle.xMax, point.x);
      rectangle.yMax = std::max(rectangle.yMax, point.y);
    }
  }
  return isAny;
}

void CTvnShapeData::Create(ShapeKind kind, std::vector<ShapeField> columns, std::string projection) {
  kind_ = kind;
  fields_ = columns;
  columns_ = std::move(columns);
  projection_ = std::move(projection);
  shapes_.clear();
}

FileResult CTvnShapeData::SaveShapeFile(const std::string& path) const {
  const Unit* const unit = FindLengthUnit(axisUnit_);
  const auto refused = [&path](std::string_view reason) {
    return FileResult{fmt::format("cannot write {}: {}", path, reason), {}};
  };
  if (!unit) return refused(fmt::format("the unit {} of its coordinates is no length", axisUnit_));
  if (!EqualIgnoringCase(ExtensionOf(path), ".shp")) return refused("its name does not end in .shp");
  MemoryFiles files;
  Reason reason;
  try {
    const MemoryFilesScope scope(files);
    reason = MakeShapes(kind_, shapes_, *ConversionBetween(UnitScale{Dimension::Length}, unit->scale));
    if (reason.empty() && columns_.empty()) {
      std::vector<Shape> numbered(shapes_.size());
      for (std::size_t i = 0; i < numbered.size(); ++i) numbered[i].values = {static_cast<std::int64_t>(i + 1)};
      reason = MakeTable({{"ID", AttributeKind::Whole}}, numbered);
    } else if (reason.empty()) {
      reason = MakeTable(columns_, shapes_);
    }
  } catch (const std::bad_alloc&) {
    reason = "there is no memory for its bytes";
  }
  if (reason.empty()) reason = files.firstMessage;
  if (!reason.empty()) return refused(reason);

  const std::string base = path.substr(0, path.size() - 4);
  std::vector<NamedBytes> set = {{base + ".dbf", files.dbf.written}, {base + ".cpg", files.cpg.written}};
  if (!projection_.empty()) set.push_back({base + ".prj", projection_});
  set.push_back({base + ".shx", files.shx.written});
  set.push_back({path, files.shp.written});
  FileResult result = WriteSet(set);
  if (result.Ok() && projection_.empty() && FileExists(base + ".prj")) {
    AddNote(result.note, fmt::format("{}.prj was there and still tells the projection", base));
  }
  return result;
}

}  // namespace tervane
