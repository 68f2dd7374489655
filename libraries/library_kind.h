// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a kind of library is: a parameter file with named entries, each of a few texts and a table of numbers. The
// declaration alone serves reading, writing, checking, choosing and editing.
#pragma once

#include <cstddef>
#include <limits>
#include <span>
#include <string>
#include <string_view>

namespace tervane {

struct LibraryEntry;
struct LibraryRow;

/// A number: of each row, or of a field.
struct LibraryColumn {
  std::string_view head;
  std::string_view unit;  ///< Empty for a number without a dimension.
  std::string_view toolTip;
  bool isWhole = false;
  double least = 0;
  double most = std::numeric_limits<double>::max();
  double initial = 0;           ///< Of a new entry.
  std::string_view key = {};    ///< In the file, of rows that stand in sections.
  bool isLeastOutside = false;  ///< Numbers are above `least`, which is none of them.
};

/// What a field's numbers are: the parameters of a model, which the file names in front of them, or numbers alone.
struct LibraryModel {
  std::string_view name;  ///< Empty for numbers alone.
  std::span<const LibraryColumn> parameters;
};

/// A text of an entry, or numbers.
struct LibraryField {
  std::string_view key;    ///< In the file.
  std::string_view label;  ///< On the page.
  std::string_view toolTip = {};
  std::span<const LibraryModel> models = {};  ///< Of numbers: what they may be; the first is that of a new entry.
};

struct LibraryKind {
  std::string_view name;  ///< Of a file: "vegetation property file".
  std::string_view entryName, entryNames;
  std::string_view rowName, rowNames;
  std::string_view extension;  ///< Without its dot.
  std::string_view filter;     ///< Of file dialogs.
  std::string_view target;
  std::string_view sectionPattern;       ///< Of an entry, with %d at its end.
  std::span<const LibraryField> fields;  ///< The first is the entry's name.
  std::string_view rowKey = {};          ///< A keyword of that name for each row; or a section, with %d at its end.
  std::span<const LibraryColumn> columns = {};  ///< Where rows are keywords they stand in the order of the first.
  /// What lies between two rows: "Values are linear between stages."
  std::string_view between = {};
  std::string_view section = {};      ///< In which the entries stand, of the target; empty where they are its own.
  std::string_view countKey = {};     ///< Of the number of entries there; empty where none is told.
  std::string_view rowCountKey = {};  ///< Of the number of rows of an entry.
  LibraryField rowFile = {};          ///< A data file and an item of it, of rows that stand in sections.
  /// What is wrong with fields whose numbers are sound one by one; null where nothing more can be.
  std::string (*whyWrongFields)(const LibraryEntry& entry) = nullptr;
  /// What is wrong with a row beside its own numbers; null where nothing more can be.
  std::string (*whyWrongRow)(const LibraryEntry& entry, const LibraryRow& row) = nullptr;

  bool HasRows() const { return !rowKey.empty(); }
  bool HasRowSections() const { return rowKey.ends_with("%d"); }
};

/// The most columns that a kind may have.
inline constexpr std::size_t kMostLibraryColumns = 8;

}  // namespace tervane
