// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Libraries of named entries: reading with messages, checking, and writing so that nothing is lost. Comments and what
// the kind does not declare are kept as text at their places.
#pragma once

#include <array>
#include <limits>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "core/node.h"
#include "libraries/library_kind.h"
#include "platform/files.h"
#include "platform/key_number.h"

namespace tervane {

/// What stands around a part of a library and means nothing to it: lines as they are written again.
struct LibraryContext {
  std::string others;   ///< Unknown sections and keywords in front.
  std::string comment;  ///< Comments on lines of their own, right in front.
  std::string behind;   ///< A comment on the same line.

  bool operator==(const LibraryContext&) const = default;
};

/// A text of an entry, or the name of a model with its parameters; one that is not in the file is written when it is
/// given.
struct LibraryText {
  std::string text;
  bool isThere = false;
  LibraryContext context = {};
  std::vector<KeyNumber<double>> numbers = {};
  std::string more = {};  ///< Values behind those that the kind knows: ", 1, 2".

  bool operator==(const LibraryText&) const = default;
};

/// A row of numbers, as many as the kind has columns.
struct LibraryRow {
  std::array<double, kMostLibraryColumns> values{};
  std::string more = {};  ///< Values behind those that the kind knows: ", 1, 2"; of a section what is unknown in it.
  LibraryContext context = {};
  int line = 0;           ///< Where it was read; 0 for a new one.
  std::string file = {};  ///< A data file, relative to the library's folder.
  int item = 1;           ///< The item that is chosen in it.

  /// Missing numbers are equal.
  bool operator==(const LibraryRow& other) const;
};

/// What should have been a text or row of an entry; it is kept as it stands.
struct LibraryRefusal {
  int line = 0;
  std::string text;
  std::size_t field = 0;  ///< The field that has nothing because of it, where `kept` is given.
  std::string kept = {};  ///< Its line as it is written again.

  bool operator==(const LibraryRefusal&) const = default;
};

struct LibraryEntry {
  std::vector<LibraryText> fields;  ///< As many as the kind has.
  std::vector<LibraryRow> rows;
  LibraryContext context = {};
  std::string atEnd = {};  ///< Unknown sections and keywords behind all rows.
  std::vector<LibraryRefusal> refused = {};
  int line = 0;  ///< Where it was read; 0 for a new one.

  const std::string& Name() const { return fields.front().text; }
  /// A number of a field; missing where the field has none.
  double Number(std::size_t field, std::size_t parameter = 0) const {
    const auto& numbers = fields[field].numbers;
    return parameter < numbers.size() ? double{numbers[parameter]} : std::numeric_limits<double>::quiet_NaN();
  }
  /// Takes a row out; what stands in front of it and is no part of it stays.
  void DeleteRow(std::size_t row);
  /// Makes comments of refused lines whose fields were given something since: a later reading takes what was given, and
  /// nothing of the old line is lost.
  void SetRefusedAside();

  bool operator==(const LibraryEntry&) const = default;
};

/// What is wrong with a library, and where.
struct LibraryFinding {
  Severity severity = Severity::Error;
  int line = 0;  ///< In the file that was read; 0 where that says nothing.
  std::optional<std::size_t> entry = {};
  std::optional<std::size_t> row = {};
  std::string text;
};

struct Library {
  explicit Library(const LibraryKind& kind_) : kind(&kind_) {}

  const LibraryKind* kind;
  std::vector<LibraryEntry> entries;
  std::string header;         ///< Comments in front of all.
  std::string beforeTarget;   ///< Other targets.
  std::string beforeSection;  ///< Other parts of the target, where the entries stand in a section of it.
  std::string behindSection;
  std::string atEnd;  ///< Behind the last entry.
  std::string behindTarget;
  std::string folder;  ///< Of the file that was read: names of data files are relative to it.

  /// An entry without rows.
  LibraryEntry NewEntry(std::string name) const;
  /// The place of an entry from 0 on.
  std::optional<std::size_t> Find(std::string_view name) const;
  /// A name that no entry has: the given one, or with a number behind it.
  std::string FreeName(const std::string& wanted) const;
  /// Takes an entry out; what stands in front of it and is no part of it stays.
  void DeleteEntry(std::size_t entry);
};

// ---- Files

/// Reads a library. Gives why it is none: "crops.etv:12:3: ...", "crops.etv is no vegetation property file: ...".
std::string ReadLibrary(const std::string& path, Library& library);
/// The same of a text; `path` stands for its place in messages.
std::string ParseLibrary(const FileContent& text, const std::string& path, Library& library);
/// The library as a file holds it; `error` says why it cannot be written.
std::string LibraryFileText(const Library& library, std::string& error);
/// Writes it in one step; on any failure the old file stands.
FileResult WriteLibrary(const std::string& path, const Library& library);

/// What is at a path.
struct LibraryReading {
  Library library;
  std::string problem;                   ///< Why there is none; empty when there is.
  std::vector<LibraryFinding> findings;  ///< All that is wrong with it, in the order of the file.
};
/// The same, read again only when the file has changed. Any thread may ask.
std::shared_ptr<const LibraryReading> ReadLibraryOnce(const LibraryKind& kind, const std::string& path);

// ---- Checking

/// The model of a field's numbers by its name; null for another name, and for a text.
const LibraryModel* ModelOf(const LibraryField& field, std::string_view name);
/// Takes another model, with the parameters that a new entry has of it.
void ChooseModel(const LibraryModel& model, LibraryText& text);

/// What is wrong with a number of a row: "LAI is 21, a number from 0 to 20 was expected". Empty when nothing is.
std::string WhyWrong(const LibraryColumn& column, double value);
/// The first thing that is wrong with an entry, of whatever name; empty when nothing is.
std::string FirstFault(const LibraryKind& kind, const LibraryEntry& entry);
/// All that is wrong, in the order of the file.
std::vector<LibraryFinding> FindingsOf(const Library& library);
/// "crops.etv:12: Vegetation \"Maize\", stage 3: LAI is 25, ...", for the command line and logs.
std::string FindingText(const std::string& path, const Library& library, const LibraryFinding& finding);
/// Why an entry of that name cannot be used: there is none, or what is wrong with it. Empty when it can.
std::string WhyNoEntry(const std::string& path, const Library& library, std::string_view name);

}  // namespace tervane
