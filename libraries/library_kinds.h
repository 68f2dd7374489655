// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>
#include <string_view>

#include "libraries/library_kind.h"

namespace tervane {

std::span<const LibraryKind* const> LibraryKinds();
/// The kind of the libraries with the extension of that path, in any case of letters; null where there is none.
const LibraryKind* LibraryKindOf(std::string_view path);

}  // namespace tervane
