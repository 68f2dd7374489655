// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/library_views.h"

#include <algorithm>

#include <fmt/format.h>

#include "libraries/wells.h"
#include "pages/parts/well_map.h"

namespace tervane {

namespace {

constexpr LibraryView kViews[] = {
    {&kWellLibrary, WellChart, WellMap},
};

}  // namespace

const LibraryView* ViewOf(const LibraryKind& kind) {
  const auto found = std::ranges::find(kViews, &kind, &LibraryView::kind);
  return found == std::end(kViews) ? nullptr : &*found;
}

}  // namespace tervane
