// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/shapes.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <functional>
#include <memory>
#include <new>
#include <string_view>

#include <fmt/format.h>
#include <shapefil.h>

#include "geometry/ring_faults.h"
#include "geometry/shapelib_memory.h"
#include "platform/file_cache.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "platform/text_fields.h"

namespace tervane {
namespace {

using namespace shapelib;

using Reason = std::string;

std::uint32_t BigEndian(std::string_view bytes, std::size_t at) {
  std::uint32_t number = 0;
  for (std::size_t i = at; i < at + 4; ++i) number = number << 8 | static_cast<unsigned char>(bytes[i]);
  return number;
}

constexpr std::size_t kHeaderSize = 100;

/// Why the bytes are no whole .shp, before anybody trusts a count in them.
Reason WhyNoShapes(std::string_view shp) {
  constexpr std::uint32_t kMark = 9994;
  if (shp.size() < kHeaderSize) return fmt::format("it has {} bytes, and its heading alone takes 100", shp.size());
  if (BigEndian(shp, 0) != kMark) return "it is no shape file";
  const std::uint64_t told = std::uint64_t{2} * BigEndian(shp, 24);
  if (told > shp.size()) return fmt::format("it is cut: it has {} of {} bytes", shp.size(), told);
  return {};
}

/// Why no index can be made from the shapes: their lengths do not lead from one to the next.
Reason WhyNoIndex(std::string_view shp) {
  const std::size_t end = std::size_t{2} * BigEndian(shp, 24);
  std::size_t at = kHeaderSize;
  for (int number = 1; at < end; ++number) {
    const std::size_t length = end - at < 8 ? end : std::size_t{2} * BigEndian(shp, at + 4);
    if (length > end - at - 8) return fmt::format("shape {} is longer than the rest of the file", number);
    at += 8 + length;
  }
  return {};
}

/// Texts of old tables are in some code page of one byte for each character.
std::string AsUtf8(std::string_view text, bool& isOther) {
  if (!FirstInvalidUtf8(text)) return std::string(text);
  isOther = true;
  std::string utf8;
  for (const char c : text) {
    const auto byte = static_cast<unsigned char>(c);
    if (byte < 0x80) {
      utf8 += c;
    } else {
      utf8 += static_cast<char>(0xC0u | byte >> 6);
      utf8 += static_cast<char>(0x80u | (byte & 0x3Fu));
    }
  }
  return utf8;
}

Reason WhyNoAttribute(const std::string& path, const std::vector<ShapeField>& fields, const std::string& attribute) {
  std::string names;
  for (const ShapeField& field : fields) names += (names.empty() ? "" : ", ") + field.name;
  return fmt::format("{} has no attribute {}; it has: {}", path, attribute, names);
}

class ShapeFileReader {
 public:
  ShapeKind kind = ShapeKind::Polygon;
  std::vector<ShapeField> fields, columns;
  std::vector<Shape> shapes;
  std::string projection;
  std::string note;
  Reason tableProblem;  ///< Why there are no fields.

  explicit ShapeFileReader(ProgressPart progress = {}) : progress_(progress) {}

  /// Reads the files into memory and opens them; with `isTableNeeded` the table must be there.
  Reason Open(const std::string& path, bool isTableNeeded) {
    path_ = path;
    if (!EqualIgnoringCase(ExtensionOf(path), ".shp"))
      return fmt::format("{} is no shape file: its name does not end in .shp", path);
    if (const FileResult result = ReadWholeFile(path, shp_, progress_.Part(0, kReading)); !result.Ok())
      return result.error;
    if (Reason reason = WhyNoShapes(shp_.Text()); !reason.empty()) return At(reason);
    files_.shp = {shp_.Text(), {}, false, true};
    FileContent prj;
    bool isThere = false;
    for (const auto& [extension, content] : {std::pair{".shx", &shx_}, {".dbf", &dbf_}, {".prj", &prj}}) {
      if (Reason reason = ReadBeside(extension, *content, isThere); !reason.empty()) return reason;
      MemoryFile* const file = files_.Find(extension);
      if (file && isThere) *file = {content->Text(), {}, false, true};
    }
    projection = Trimmed(prj.Text());
    if (!files_.dbf.exists)
      tableProblem = fmt::format("{} has no attributes: {} does not exist beside it", path, WithExtension(".dbf"));
    if (isTableNeeded && !tableProblem.empty()) return tableProblem;
    const MemoryFilesScope scope(files_);
    if (Reason reason = OpenShapes(); !reason.empty()) return reason;
    return files_.dbf.exists ? OpenTable(isTableNeeded) : Reason();
  }

  /// Empty when the table has a record for each shape.
  Reason WhyTableDiffers() const {
    const int shapeCount = handle_->nRecords;
    const int recordCount = table_ ? DBFGetRecordCount(table_.get()) : shapeCount;
    if (recordCount == shapeCount) return {};
    return fmt::format("{} has {} shapes, but {} has {} records", path_, shapeCount, WithExtension(".dbf"),
                       recordCount);
  }

  Reason SelectColumns(const std::string& attribute) {
    for (std::size_t i = 0; i < fields.size(); ++i) {
      if (!attribute.empty() && !EqualIgnoringCase(fields[i].name, attribute)) continue;
      columns.push_back(fields[i]);
      columnNumbers_.push_back(static_cast<int>(i));
      if (!attribute.empty()) return {};
    }
    return attribute.empty() ? Reason() : WhyNoAttribute(path_, fields, attribute);
  }

  Reason ReadShapes(const UnitConversion& toMetres) {
    const MemoryFilesScope scope(files_);
    const int count = handle_->nRecords;
    if (Reason reason = WhyTableDiffers(); !columns.empty() && !reason.empty()) return reason;
    int deleted = 0;
    const ProgressPart taking = progress_.Part(kReading, 1);
    for (int i = 0; i < count; ++i) {
      if (taking.IsCancelled()) return At(kCancelled);
      taking.Report(static_cast<double>(i) / count);
      if (!columns.empty() && DBFIsRecordDeleted(table_.get(), i)) {
        ++deleted;
        continue;
      }
      Shape& shape = shapes.emplace_back();
      Reason reason = ReadShape(i, toMetres, shape);
      for (std::size_t c = 0; reason.empty() && c < columns.size(); ++c) reason = ReadValue(i, c, shape);
      if (!reason.empty()) return At(fmt::format("shape {}: {}", i + 1, reason));
    }
    if (deleted > 0) AddNote(note, fmt::format("{} shapes are marked as deleted and are left out", deleted));
    if (isOtherText_) AddNote(note, "texts that are no UTF-8 were read as Latin-1");
    return {};
  }

 private:
  Reason At(std::string_view reason) const { return fmt::format("cannot read {}: {}", path_, reason); }

  std::string WithExtension(std::string_view extension) const {
    return path_.substr(0, path_.size() - ExtensionOf(path_).size()) + std::string(extension);
  }

  /// A missing file is none of the errors.
  Reason ReadBeside(std::string_view extension, FileContent& content, bool& isThere) const {
    std::string upper(extension);
    for (char& c : upper) c = static_cast<char>(c >= 'a' && c <= 'z' ? c - 'a' + 'A' : c);
    for (const std::string& name : {WithExtension(extension), WithExtension(upper)}) {
      isThere = FileExists(name);
      if (isThere) return ReadWholeFile(name, content, progress_.Part(0, kReading)).error;
    }
    return {};
  }

  Reason OpenShapes() {
    const bool isIndexMissing = !files_.shx.exists;
    if (isIndexMissing) {
      if (Reason reason = WhyNoIndex(files_.shp.read); !reason.empty()) return At(reason);
    }
    handle_.reset(SHPOpenLLEx("memory.shp", "rb", Hooks(), isIndexMissing));
    if (!handle_ && !isIndexMissing) {
      return fmt::format("cannot read {}: {}; without this file the index is made anew", WithExtension(".shx"),
                         Message("it is damaged"));
    }
    if (!handle_) return At(Message("it is damaged"));
    if (isIndexMissing)
      AddNote(note, fmt::format("{} is missing; the index was made anew from the shapes", WithExtension(".shx")));
    const KindRow* const row = FindKind(handle_->nShapeType);
    if (!row)
      return At(fmt::format("it holds shapes of the type {} ({}), which is not supported", handle_->nShapeType,
                            SHPTypeName(handle_->nShapeType)));
    kind = row->kind;
    return {};
  }

  Reason OpenTable(bool isTableNeeded) {
    const std::string name = WithExtension(".dbf");
    const std::size_t size = files_.dbf.read.size();
    table_.reset(DBFOpenLL("memory.dbf", "rb", Hooks()));
    Reason reason;
    if (!table_) {
      reason = Message("it is no table of attributes, or damaged");
    } else {
      const std::uint64_t told = static_cast<std::uint64_t>(table_->nHeaderLength) +
                                 static_cast<std::uint64_t>(std::max(0, table_->nRecords)) *
                                     static_cast<std::uint64_t>(std::max(0, table_->nRecordLength));
      if (table_->nRecords < 0 || told > size) reason = fmt::format("it is cut: it has {} of {} bytes", size, told);
    }
    if (!reason.empty()) {
      table_.reset();
      tableProblem = fmt::format("cannot read {}: {}", name, reason);
      if (isTableNeeded) return tableProblem;
      AddNote(note, tableProblem);
      return {};
    }
    for (int i = 0; i < DBFGetFieldCount(table_.get()); ++i) {
      char fieldName[XBASE_FLDNAME_LEN_READ + 1] = "";
      int width = 0, decimals = 0;
      DBFGetFieldInfo(table_.get(), i, fieldName, &width, &decimals);
      // A number of 19 digits may not fit into 64 bits.
      const char native = DBFGetNativeFieldType(table_.get(), i);
      const bool isNumber = native == 'N' || native == 'F';
      const bool isWhole = native == 'N' && decimals == 0 && width < 19;
      fields.push_back({AsUtf8(fieldName, isOtherText_), isWhole    ? AttributeKind::Whole
                                                         : isNumber ? AttributeKind::Real
                                                                    : AttributeKind::Text});
    }
    return {};
  }

  Reason Message(const char* otherwise) {
    const Reason message = files_.firstMessage.empty() ? otherwise : Shown(files_.firstMessage);
    files_.firstMessage.clear();
    return message;
  }

  Reason ReadShape(int number, const UnitConversion& toMetres, Shape& shape) {
    const ObjectHandle object(SHPReadObject(handle_.get(), number));
    if (!object || !files_.firstMessage.empty()) {
      Reason reason = Message("it is damaged");
      // The library counts shapes from 0 and cuts its sentence.
      const bool isCount = reason.starts_with("Corrupted .shp file");
      return isCount ? "it is damaged: its numbers of parts and points do not fit its length" : reason;
    }
    if (object->nSHPType == SHPT_NULL) return {};
    if (object->nSHPType != handle_->nShapeType) {
      return fmt::format("it is of the type {}, the file of the type {}", SHPTypeName(object->nSHPType),
                         SHPTypeName(handle_->nShapeType));
    }
    const auto count = static_cast<std::size_t>(std::max(0, object->nVertices));
    const KindRow& row = *FindKind(object->nSHPType);
    shape.points.resize(count);
    for (std::size_t i = 0; i < count; ++i) {
      shape.points[i] = {toMetres(object->padfX[i]), toMetres(object->padfY[i])};
      if (!std::isfinite(shape.points[i].x) || !std::isfinite(shape.points[i].y)) {
        return fmt::format("point {} has the coordinates {}, {}", i + 1, object->padfX[i], object->padfY[i]);
      }
    }
    if (row.hasZ) shape.z.assign(object->padfZ, object->padfZ + count);
    if (row.hasM && object->bMeasureIsUsed) shape.m.assign(object->padfM, object->padfM + count);
    if (object->nParts > 0)
      shape.parts.assign(object->panPartStart, object->panPartStart + object->nParts);
    else if (count > 0)
      shape.parts = {0};
    const bool isAscending =
        std::adjacent_find(shape.parts.begin(), shape.parts.end(), std::greater_equal<>()) == shape.parts.end();
    if (!shape.parts.empty() && (shape.parts.front() != 0 || !isAscending || shape.parts.back() >= count)) {
      return "its parts do not lie one behind the other";
    }
    return {};
  }

  Reason ReadValue(int number, std::size_t column, Shape& shape) {
    const ShapeField& field = columns[column];
    const char* const read = DBFReadStringAttribute(table_.get(), number, columnNumbers_[column]);
    if (!read) return fmt::format("its attribute {} cannot be read", field.name);
    ShapeValue& value = shape.values.emplace_back();
    const std::string_view text = Trimmed(read);
    if (field.kind == AttributeKind::Text) {
      value = AsUtf8(read, isOtherText_);
      return {};
    }
    // Stars stand where a program had no value, or no room for it.
    if (text.empty() || text.find_first_not_of('*') == std::string_view::npos) return {};
    double real = 0;
    std::int64_t whole = 0;
    const char* const end = text.data() + text.size();
    if (field.kind == AttributeKind::Whole && std::from_chars(text.data(), end, whole).ptr == end) {
      value = whole;
    } else if (!ReadNumber(text, {}, real) || (field.kind == AttributeKind::Whole && real != std::floor(real))) {
      return fmt::format("its attribute {} is \"{}\", not {}", field.name, Shown(text), NameOf(field.kind));
    } else if (field.kind == AttributeKind::Whole) {
      value = static_cast<std::int64_t>(real);  // at most 18 characters, but perhaps an exponent
      if (std::abs(real) > 1e18)
        return fmt::format("its attribute {} is \"{}\", which is too large", field.name, Shown(text));
    } else {
      value = real;
    }
    return {};
  }

  static constexpr double kReading = 0.3;  ///< What the files' bytes take of the whole time.

  ProgressPart progress_;
  std::string path_;
  FileContent shp_, shx_, dbf_;
  MemoryFiles files_;
  ShapeHandle handle_;
  TableHandle table_;
  std::vector<int> columnNumbers_;
  bool isOtherText_ = false;
};

}  // namespace

std::string TextOf(const ShapeValue& value) {
  if (const auto* const text = std::get_if<std::string>(&value)) {
    const std::size_t last = text->find_last_not_of(' ');
    return text->substr(0, last == std::string::npos ? 0 : last + 1);
  }
  if (const auto* const whole = std::get_if<std::int64_t>(&value)) return fmt::format("{}", *whole);
  if (const auto* const real = std::get_if<double>(&value)) return fmt::format("{:.6f}", *real);
  return {};
}

FileResult CYbShapeData::ReadShapeFile(const std::string& path, ProgressPart progress) {
  return Read(path, nullptr, progress);
}

FileResult CYbShapeData::ReadShapeAndDbfFile(const std::string& path, const std::string& attribute,
                                             ProgressPart progress) {
  return Read(path, &attribute, progress);
}

FileResult CYbShapeData::Read(const std::string& path, const std::string* attribute, ProgressPart progress) {
  const Unit* const unit = FindLengthUnit(axisUnit_);
  if (!unit) return {fmt::format("cannot read {}: the unit {} of its coordinates is no length", path, axisUnit_), {}};
  const UnitConversion toMetres = *ConversionBetween(unit->scale, UnitScale{Dimension::Length});
  ShapeFileReader reader(progress);
  Reason reason;
  try {
    reason = reader.Open(path, attribute != nullptr);
    if (reason.empty() && attribute) reason = reader.SelectColumns(*attribute);
    if (reason.empty()) reason = reader.ReadShapes(toMetres);
  } catch (const std::bad_alloc&) {
    reason = fmt::format("cannot read {}: there is no memory for its shapes", path);
  }
  if (!reason.empty()) return {reason, {}};
  kind_ = reader.kind;
  fields_ = std::move(reader.fields);
  columns_ = std::move(reader.columns);
  shapes_ = std::move(reader.shapes);
  projection_ = std::move(reader.projection);
  return {{}, reader.note};
}

std::vector<FileStamp> StampsOfShape(const std::string& path) {
  const std::string base = path.substr(0, path.size() - ExtensionOf(path).size());
  std::vector<FileStamp> stamps = StampsOf(path);
  for (const char* extension : {".shx", ".dbf", ".prj", ".SHX", ".DBF", ".PRJ"})
    stamps.push_back(StampOf(base + extension));
  return stamps;
}

namespace {

ShapeFacts ReadFacts(const std::string& path) {
  ShapeFacts facts;
  ShapeFileReader reader;
  try {
    facts.error = reader.Open(path, false);
    if (facts.error.empty()) facts.error = reader.ReadShapes({});
  } catch (const std::bad_alloc&) {
    facts.error = fmt::format("cannot read {}: there is no memory for its shapes", path);
  }
  if (!facts.error.empty()) return facts;
  facts.tableProblem = reader.tableProblem.empty() ? reader.WhyTableDiffers() : reader.tableProblem;
  facts.note = std::move(reader.note);
  facts.kind = reader.kind;
  if (facts.kind == ShapeKind::Polygon)
    if (const std::string fault = FirstRingFault(reader.shapes); !fault.empty()) AddNote(facts.note, fault);
  facts.fields = std::move(reader.fields);
  facts.projection = std::move(reader.projection);
  facts.shapes = reader.shapes.size();
  for (const Shape& shape : reader.shapes) {
    facts.withoutPoints += shape.points.empty();
    facts.points += shape.points.size();
    for (const MapPoint& point : shape.points) {
      if (!facts.extent) facts.extent = Envelope{point.x, point.y, point.x, point.y};
      Envelope& box = *facts.extent;
      box = {std::min(box.xMin, point.x), std::min(box.yMin, point.y), std::max(box.xMax, point.x),
             std::max(box.yMax, point.y)};
    }
  }
  return facts;
}

}  // namespace

std::shared_ptr<const ShapeFacts> ShapeFactsOf(const std::string& path) {
  static FileCache<ShapeFacts> cache(kMostFacts);
  return cache.Get(path, "shapes", StampsOfShape(path), [&] { return ReadFacts(path); });
}

FileResult CheckShapeFile(const std::string& path, const ShapeRequest& request, const std::string& attribute) {
  const auto facts = ShapeFactsOf(path);
  if (!facts->error.empty()) return {facts->error, {}};
  const bool isAttributeAsked = request.needsAttribute || request.attribute.has_value();
  if (isAttributeAsked && !facts->tableProblem.empty()) return {facts->tableProblem, {}};
  const struct {
    bool isWanted;
    const char* name;
    bool isHeld;
  } kinds[] = {
      {request.polygons, "polygons", facts->kind == ShapeKind::Polygon},
      {request.lines, "lines", facts->kind == ShapeKind::Line},
      {request.points, "points", facts->kind == ShapeKind::Point || facts->kind == ShapeKind::MultiPoint},
  };
  std::string wanted;
  bool isHeld = false;
  for (const auto& kind : kinds) {
    if (!kind.isWanted) continue;
    wanted += (wanted.empty() ? "" : " or ") + std::string(kind.name);
    isHeld = isHeld || kind.isHeld;
  }
  if (!wanted.empty() && !isHeld) {
    return {fmt::format("{}: {} were expected, the file holds {}", path, wanted, NameOf(facts->kind)), {}};
  }
  if (!facts->extent) {
    return {fmt::format("{} holds no shape with points", path), {}};
  }
  if (!isAttributeAsked) return {{}, facts->note};
  if (attribute.empty()) return {fmt::format("{}: no attribute is selected", path), {}};
  const auto field = std::ranges::find_if(
      facts->fields, [&](const ShapeField& each) { return EqualIgnoringCase(each.name, attribute); });
  if (field == facts->fields.end()) return {WhyNoAttribute(path, facts->fields, attribute), {}};
  if (!request.attribute) return {{}, facts->note};
  const bool isReal = *request.attribute == AttributeKind::Real && field->kind == AttributeKind::Whole;
  if (field->kind != *request.attribute && !isReal) {
    return {fmt::format("{}: attribute {} is {}, {} was expected", path, field->name, NameOf(field->kind),
                        NameOf(*request.attribute)),
            {}};
  }
  return {{}, facts->note};
}

}  // namespace tervane
