// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the editor of a kind of library shows beside the values of an entry.
#pragma once

#include <functional>

#include "forms/page.h"
#include "forms/plots.h"
#include "libraries/library.h"

namespace tervane {

/// What is left out of a view is not shown; without a chart the rows of an entry are drawn.
struct LibraryView {
  const LibraryKind* kind;
  SeriesContent (*chart)(const Library& library, const LibraryEntry& entry) = nullptr;
  MapContent (*map)(const Library& library, std::size_t current) = nullptr;
  /// Further controls below the texts. `current` gives the entry that is shown, null for none.
  void (*describe)(PageForm& form, CYbSEDlgBase& page, std::function<LibraryEntry*()> current) = nullptr;
};

/// The view of a kind; null for one that has none of its own.
const LibraryView* ViewOf(const LibraryKind& kind);
/// The chart of an entry, by the view of its kind or over its rows.
SeriesContent ChartOf(const Library& library, const LibraryEntry& entry);

}  // namespace tervane
