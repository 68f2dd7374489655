// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a kind of library is: a parameter file with named entries, each of a few texts and a table of numbers. The
// declaration alone serves reading, writing, checking, choosing and editing.
#pragma once

#include <cstddef>
#include <limits>
#include <span>
#include <string_view>

namespace tervane {

/// A text of an entry.
struct LibraryField {
  std::string_view key;    ///< In the file.
  std::string_view label;  ///< On the page.
  std::string_view toolTip = {};
};

/// A number of each row.
struct LibraryColumn {
  std::string_view head;
  std::string_view unit;  ///< Empty for a number without a dimension.
  std::string_view toolTip;
  bool isWhole = false;
  double least = 0;
  double most = std::numeric_limits<double>::max();
};

struct LibraryKind {
  std::string_view name;  ///< Of a file: "vegetation property file".
  std::string_view entryName, entryNames;
  std::string_view rowName, rowNames;
  std::string_view extension;  ///< Without its dot.
  std::string_view filter;     ///< Of file dialogs.
  std::string_view target;
  std::string_view sectionPattern;         ///< Of an entry, with %d at its end.
  std::span<const LibraryField> fields;    ///< The first is the entry's name.
  std::string_view rowKey;                 ///< A keyword of that name for each row.
  std::span<const LibraryColumn> columns;  ///< Rows stand in the order of the first, which is drawn to the right.
  /// What lies between two rows: "Values are linear between stages."
  std::string_view between;
};

/// The most columns that a kind may have.
inline constexpr std::size_t kMostLibraryColumns = 8;

}  // namespace tervane
