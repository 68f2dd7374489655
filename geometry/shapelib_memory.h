// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Shapelib on memory: so a shape file is read and replaced as every other file (no waiting for a FIFO, errors in words,
// nothing half written), and an index can be made without touching the user's folder. For shapes*.cpp alone.
#pragma once

#include <memory>
#include <string>
#include <string_view>

#include <shapefil.h>

#include "geometry/shapes.h"

namespace tervane::shapelib {

/// The bytes of one file.
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

/// While it lives, Shapelib's calls of this thread work on these files, under any name with the right extension.
class MemoryFilesScope {
 public:
  explicit MemoryFilesScope(MemoryFiles& files);
  ~MemoryFilesScope();
  MemoryFilesScope(const MemoryFilesScope&) = delete;
  MemoryFilesScope& operator=(const MemoryFilesScope&) = delete;

 private:
  MemoryFiles* before_;
};

/// What to hand to Shapelib's `...LL` functions.
SAHooks* Hooks();

struct Closer {
  void operator()(SHPInfo* file) const { SHPClose(file); }
  void operator()(DBFInfo* file) const { DBFClose(file); }
  void operator()(SHPObject* object) const { SHPDestroyObject(object); }
};
using ShapeHandle = std::unique_ptr<SHPInfo, Closer>;
using TableHandle = std::unique_ptr<DBFInfo, Closer>;
using ObjectHandle = std::unique_ptr<SHPObject, Closer>;

/// A type of shape of the format.
struct KindRow {
  int type;
  ShapeKind kind;
  bool hasZ, hasM;
};
/// Null for a type that is not supported.
const KindRow* FindKind(int type);
/// The type for shapes of a kind; those with z have m too.
int FileType(ShapeKind kind, bool hasZ, bool hasM);

/// "points", "a whole number".
const char* NameOf(ShapeKind kind);
const char* NameOf(AttributeKind kind);

/// Puts a text behind the others of a note.
void AddNote(std::string& note, std::string_view text);
/// The unit of that key if it is a length, else null.
const Unit* FindLengthUnit(int key);

}  // namespace tervane::shapelib
