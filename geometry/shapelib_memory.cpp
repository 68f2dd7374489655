// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/shapelib_memory.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cstdio>
#include <cstring>
#include <iterator>

#include "platform/text.h"

namespace tervane::shapelib {
namespace {

// The hooks carry no context, so that they find their files by the thread.
thread_local MemoryFiles* currentFiles = nullptr;

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
  if (size == 0 || count == 0 || open.position >= content.size()) return 0;
  const SAOffset whole = std::min<SAOffset>(count, (content.size() - open.position) / size);
  std::memcpy(target, content.data() + open.position, whole * size);
  open.position += whole * size;
  return whole;
}

SAOffset WriteHook(void* source, SAOffset size, SAOffset count, SAFile handle) {
  OpenMemoryFile& open = Opened(handle);
  if (!open.file->isWritable) return 0;
  if (size == 0 || count == 0) return count;
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

constexpr std::array<const char*, 4> kKindNames = {"points", "lines", "polygons", "points"};
constexpr std::array<const char*, 3> kAttributeNames = {"text", "a whole number", "a real number"};

}  // namespace

MemoryFilesScope::MemoryFilesScope(MemoryFiles& files) : before_(currentFiles) { currentFiles = &files; }
MemoryFilesScope::~MemoryFilesScope() { currentFiles = before_; }

SAHooks* Hooks() {
  static SAHooks hooks{OpenHook,  ReadHook,  WriteHook,  SeekHook,  TellHook,
                       FlushHook, CloseHook, RemoveHook, ErrorHook, NumberHook};
  return &hooks;
}

const KindRow* FindKind(int type) {
  const auto* const found =
      std::find_if(std::begin(kKinds), std::end(kKinds), [=](const KindRow& row) { return row.type == type; });
  return found == std::end(kKinds) ? nullptr : found;
}

int FileType(ShapeKind kind, bool hasZ, bool hasM) {
  for (const KindRow& row : kKinds) {
    if (row.kind == kind && row.hasZ == hasZ && row.hasM == (hasM || hasZ)) return row.type;
  }
  return SHPT_NULL;
}

const char* NameOf(ShapeKind kind) { return kKindNames[static_cast<std::size_t>(kind)]; }
const char* NameOf(AttributeKind kind) { return kAttributeNames[static_cast<std::size_t>(kind)]; }

void AddNote(std::string& note, std::string_view text) {
  if (!note.empty()) note += "; ";
  note += text;
}

const Unit* FindLengthUnit(int key) {
  const Unit* const unit = FindUnit(key);
  return unit && unit->scale.dimension == Dimension::Length ? unit : nullptr;
}

}  // namespace tervane::shapelib
