// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Kinds of fixes for any key, by what its declaration tells.
#pragma once

#include "access/setup_keys.h"
#include "core/fixes.h"

namespace tervane {

/// Of a file that is not where its key says: the only one of its name in the folder that was searched.
FixKind MovedFiles(SetupKeys& keys);
/// Of a number outside the range that its key declares: the nearest within it.
FixKind NumberInRange(SetupKeys& keys);
/// Of a finding for which its node offers one value and no other: that value.
FixKind OnlyOffer();

/// The path that a finding's key names; empty where the key names no file, or the file is there.
std::string MissedFile(const FoundAt& found);

inline constexpr std::string_view kMovedFile = "moved-file", kSoleOffer = "offer";

}  // namespace tervane
