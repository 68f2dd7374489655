// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/library_kinds.h"

#include <algorithm>

#include "libraries/soils.h"
#include "libraries/vegetations.h"
#include "libraries/wells.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr const LibraryKind* kKinds[] = {&kVegetationLibrary, &kSoilLibrary, &kWellLibrary};

}  // namespace

std::span<const LibraryKind* const> LibraryKinds() { return kKinds; }

const LibraryKind* LibraryKindOf(std::string_view path) {
  const std::size_t dot = path.find_last_of("./\\");
  if (dot == std::string_view::npos || path[dot] != '.') return nullptr;
  const auto found = std::ranges::find_if(
      kKinds, [&](const LibraryKind* kind) { return EqualIgnoringCase(kind->extension, path.substr(dot + 1)); });
  return found == std::end(kKinds) ? nullptr : *found;
}

}  // namespace tervane
