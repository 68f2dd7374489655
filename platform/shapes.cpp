// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/shapes.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <limits>
#include <memory>
#include <new>
#include <string_view>

#include <fmt/format.h>
#include <shapefil.h>

#include "platform/paths.h"
#include "platform/text.h"
#include "platform/text_fields.h"

namespace tervane {
namespace {

// ---- Shapelib works on memory: so a file is read as every other one (no waiting for a FIFO, errors in words), nothing
// is half written, and an index can be made without touching the user's folder.

struct MemoryFile {
  std::string_view read;  ///< Of a file that is only read.
  std::string written;
  bool isWritable = false;
  bool exists = false;

  std::string_view Content() const { return isWritable ? std::string_view(written) : read; }
};

/// The files of one shape file. Shapelib's hooks carry no context, so that they find it by the thread.
struct MemoryFiles {
  MemoryFile shp, shx, dbf, cpg;
  std::string firstMessage;  ///< Of Shapelib, since it was last emptied.

  MemoryFile* Find(std::string_view name) {
    if (name.ends_with(".shp")) return &shp;
    if (name.ends_with(".shx")) return &shx;
    if (name.ends_with(".dbf")) return &dbf;
    return name.ends_with(".cpg") ? &cpg : nullptr;
  }
};

thread_local MemoryFiles* currentFiles = nullptr;

class MemoryFilesScope {
 public:
  explicit MemoryFilesScope(MemoryFiles& files) : before_(currentFiles) { currentFiles = &files; }
  ~MemoryFilesScope() { currentFiles = before_; }
  MemoryFilesScope(const MemoryFilesScope&) = delete;
  MemoryFilesScope& operator=(const MemoryFilesScope&) = delete;

 private:
  MemoryFiles* before_;
};

struct OpenMemoryFile {
  MemoryFile* file;
  std::size_t position = 0;
};

OpenMemoryFile& Opened(SAFile file) { return *static_cast<OpenMemoryFile*>(static_cast<void*>(file)); }

SAFile OpenHook(const char* name, const char* access) {
  MemoryFile* const file = currentFiles->Find(name);
  if (!file) return nullptr;
  if (access[0] == 'w') *file = {{}, {}, true, true};
  if (!file->exists) return nullptr;
  return static_cast<SAFile>(static_cast<void*>(new OpenMemoryFile{file}));
}

SAOffset ReadHook(void* target, SAOffset size, SAOffset count, SAFile handle) {
  OpenMemoryFile& open = Opened(handle);
  const std::string_view content = open.file->Content();
  if (size == 0 || open.position >= content.size()) return 0;
  const SAOffset whole = std::min<SAOffset>(count, (content.size() - open.position) / size);
  std::memcpy(target, content.data() + open.position, whole * size);
  open.position += whole * size;
  return whole;
}

SAOffset WriteHook(void* source, SAOffset size, SAOffset count, SAFile handle) {
  OpenMemoryFile& open = Opened(handle);
  if (!open.file->isWritable) return 0;
  std::string& content = open.file->written;
  content.resize(std::max(content.size(), open.position + size * count));
  std::memcpy(content.data() + open.position, source, size * count);
  open.position += size * count;
  return count;
}

SAOffset SeekHook(SAFile handle, SAOffset offset, int whence) {
  OpenMemoryFile& open = Opened(handle);
  // Unsigned arithmetic also goes back: a negative offset wraps around.
  open.position = offset + (whence == SEEK_CUR ? open.position : whence == SEEK_END ? open.file->Content().size() : 0);
  return 0;
}

SAOffset TellHook(SAFile handle) { return Opened(handle).position; }
int FlushHook(SAFile) { return 0; }
int CloseHook(SAFile handle) {
  delete &Opened(handle);
  return 0;
}
int RemoveHook(const char* name) {
  if (MemoryFile* const file = currentFiles->Find(name)) *file = {};
  return 0;
}
void ErrorHook(const char* message) {
  if (currentFiles->firstMessage.empty()) currentFiles->firstMessage = Trimmed(message);
}
double NumberHook(const char* text) {
  double number = 0;
  const std::string_view trimmed = Trimmed(text);
  std::from_chars(trimmed.data(), trimmed.data() + trimmed.size(), number);
  return number;
}

SAHooks* Hooks() {
  static SAHooks hooks{OpenHook,  ReadHook,  WriteHook,  SeekHook,  TellHook,
                       FlushHook, CloseHook, RemoveHook, ErrorHook, NumberHook};
  return &hooks;
}

struct Closer {
  void operator()(SHPInfo* file) const { SHPClose(file); }
  void operator()(DBFInfo* file) const { DBFClose(file); }
  void operator()(SHPObject* object) const { SHPDestroyObject(object); }
};
using ShapeHandle = std::unique_ptr<SHPInfo, Closer>;
using TableHandle = std::unique_ptr<DBFInfo, Closer>;
using ObjectHandle = std::unique_ptr<SHPObject, Closer>;

// ---- Kinds

struct KindRow {
  int type;
  ShapeKind kind;
  bool hasZ, hasM;
};
constexpr KindRow kKinds[] = {
    {SHPT_POINT, ShapeKind::Point, false, false},
    {SHPT_POINTZ, ShapeKind::Point, true, true},
    {SHPT_POINTM, ShapeKind::Point, false, true},
    {SHPT_ARC, ShapeKind::Line, false, false},
    {SHPT_ARCZ, ShapeKind::Line, true, true},
    {SHPT_ARCM, ShapeKind::Line, false, true},
    {SHPT_POLYGON, ShapeKind::Polygon, false, false},
    {SHPT_POLYGONZ, ShapeKind::Polygon, true, true},
    {SHPT_POLYGONM, ShapeKind::Polygon, false, true},
    {SHPT_MULTIPOINT, ShapeKind::MultiPoint, false, false},
    {SHPT_MULTIPOINTZ, ShapeKind::MultiPoint, true, true},
    {SHPT_MULTIPOINTM, ShapeKind::MultiPoint, false, true},
};

const KindRow* FindKind(int type) {
  const auto* const found =
      std::find_if(std::begin(kKinds), std::end(kKinds), [=](const KindRow& row) { return row.type == type; });
  return found == std::end(kKinds) ? nullptr : found;
}

constexpr std::array<const char*, 4> kKindNames = {"points", "lines", "polygons", "points"};
constexpr std::array<const char*, 3> kAttributeNames = {"text", "a whole number", "a real number"};

const char* NameOf(ShapeKind kind) { return kKindNames[static_cast<std::size_t>(kind)]; }
const char* NameOf(AttributeKind kind) { return kAttributeNames[static_cast<std::size_t>(kind)]; }

// ---- Reading

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

void AddNote(std::string& note, std::string_view text) {
  if (!note.empty()) note += "; ";
  note += text;
}

class ShapeFileReader {
 public:
  ShapeKind kind = ShapeKind::Polygon;
  std::vector<ShapeField> fields, columns;
  std::vector<Shape> shapes;
  std::string projection;
  std::string note;

  /// Reads the files into memory and opens them; with `isTableNeeded` the table must be there.
  Reason Open(const std::string& path, bool isTableNeeded) {
    path_ = path;
    if (!EqualIgnoringCase(ExtensionOf(path), ".shp"))
      return fmt::format("{} is no shape file: its name does not end in .shp", path);
    if (const FileResult result = ReadWholeFile(path, shp_); !result.Ok()) return result.error;
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
    if (isTableNeeded && !files_.dbf.exists) {
      return fmt::format("{} has no attributes: {} does not exist beside it", path, WithExtension(".dbf"));
    }
    const MemoryFilesScope scope(files_);
    if (Reason reason = OpenShapes(); !reason.empty()) return reason;
    return files_.dbf.exists ? OpenTable(isTableNeeded) : Reason();
  }

  Reason SelectColumns(const std::string& attribute) {
    for (std::size_t i = 0; i < fields.size(); ++i) {
      if (!attribute.empty() && !EqualIgnoringCase(fields[i].name, attribute)) continue;
      columns.push_back(fields[i]);
      columnNumbers_.push_back(static_cast<int>(i));
      if (!attribute.empty()) return {};
    }
    if (attribute.empty()) return {};
    std::string names;
    for (const ShapeField& field : fields) names += (names.empty() ? "" : ", ") + field.name;
    return fmt::format("{} has no attribute {}; it has: {}", path_, attribute, names);
  }

  Reason ReadShapes(const UnitConversion& toMetres) {
    const MemoryFilesScope scope(files_);
    const int count = handle_->nRecords;
    if (!columns.empty() && DBFGetRecordCount(table_.get()) != count) {
      return fmt::format("{} has {} shapes, but {} has {} records", path_, count, WithExtension(".dbf"),
                         DBFGetRecordCount(table_.get()));
    }
    int deleted = 0;
    for (int i = 0; i < count; ++i) {
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
      if (isThere) return ReadWholeFile(name, content).error;
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
      reason = fmt::format("cannot read {}: {}", name, reason);
      if (isTableNeeded) return reason;
      AddNote(note, reason);
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
    if (!object || !files_.firstMessage.empty()) return Message("it is damaged");
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

  std::string path_;
  FileContent shp_, shx_, dbf_;
  MemoryFiles files_;
  ShapeHandle handle_;
  TableHandle table_;
  std::vector<int> columnNumbers_;
  bool isOtherText_ = false;
};

const Unit* FindLengthUnit(int key) {
  const Unit* const unit = FindUnit(key);
  return unit && unit->scale.dimension == Dimension::Length ? unit : nullptr;
}

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

FileResult CYbShapeData::ReadShapeFile(const std::string& path) { return Read(path, nullptr); }

FileResult CYbShapeData::ReadShapeAndDbfFile(const std::string& path, const std::string& attribute) {
  return Read(path, &attribute);
}

FileResult CYbShapeData::Read(const std::string& path, const std::string* attribute) {
  const Unit* const unit = FindLengthUnit(axisUnit_);
  if (!unit) return {fmt::format("cannot read {}: the unit {} of its coordinates is no length", path, axisUnit_), {}};
  const UnitConversion toMetres = *ConversionBetween(unit->scale, UnitScale{Dimension::Length});
  ShapeFileReader reader;
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

FileResult CheckShapeFile(const std::string& path, const ShapeRequest& request, const std::string& attribute) {
  ShapeFileReader reader;
  const bool isAttributeAsked = request.attribute.has_value();
  if (Reason reason = reader.Open(path, isAttributeAsked); !reason.empty()) return {reason, {}};
  const struct {
    bool isWanted;
    const char* name;
    bool isHeld;
  } kinds[] = {
      {request.polygons, "polygons", reader.kind == ShapeKind::Polygon},
      {request.lines, "lines", reader.kind == ShapeKind::Line},
      {request.points, "points", reader.kind == ShapeKind::Point || reader.kind == ShapeKind::MultiPoint},
  };
  std::string wanted;
  bool isHeld = false;
  for (const auto& kind : kinds) {
    if (!kind.isWanted) continue;
    wanted += (wanted.empty() ? "" : " or ") + std::string(kind.name);
    isHeld = isHeld || kind.isHeld;
  }
  if (!wanted.empty() && !isHeld) {
    return {fmt::format("{}: {} were expected, the file holds {}", path, wanted, NameOf(reader.kind)), {}};
  }
  if (!isAttributeAsked) return {{}, reader.note};
  if (attribute.empty()) return {fmt::format("{}: no attribute is selected", path), {}};
  if (Reason reason = reader.SelectColumns(attribute); !reason.empty()) return {reason, {}};
  const AttributeKind kind = reader.columns.front().kind;
  const bool isReal = *request.attribute == AttributeKind::Real && kind == AttributeKind::Whole;
  if (kind != *request.attribute && !isReal) {
    return {fmt::format("{}: attribute {} is {}, {} was expected", path, reader.columns.front().name, NameOf(kind),
                        NameOf(*request.attribute)),
            {}};
  }
  return {{}, reader.note};
}

// ---- Writing

namespace {

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
    text = ShortestNumber(real);
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
    std::size_t width = field.kind == AttributeKind::Text ? 1 : field.kind == AttributeKind::Whole ? 9 : 24;
    for (std::size_t i = 0; i < shapes.size(); ++i) {
      if (shapes[i].values.size() != columns.size()) {
        return fmt::format("shape {} has {} values for {} attributes", i + 1, shapes[i].values.size(), columns.size());
      }
      if (const Reason reason = StoredText(field, shapes[i].values[c], texts[c][i]); !reason.empty())
        return fmt::format("shape {}: {}", i + 1, reason);
      width = std::max(width, texts[c][i].size());
    }
    const bool isReal = field.kind == AttributeKind::Real;
    if (DBFAddNativeFieldType(table.get(), field.name.c_str(), field.kind == AttributeKind::Text ? 'C' : 'N',
                              static_cast<int>(width), isReal ? 15 : 0) < 0) {
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

int FileType(ShapeKind kind, bool hasZ, bool hasM) {
  for (const KindRow& row : kKinds) {
    if (row.kind == kind && row.hasZ == hasZ && row.hasM == (hasM || hasZ)) return row.type;
  }
  return SHPT_NULL;
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
