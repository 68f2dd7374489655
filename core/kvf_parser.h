// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/kvf_tree.h"
#include "platform/files.h"

namespace tervane {

/// Deepest nesting of targets and sections that a file may have.
inline constexpr int kKvfDeepestNesting = 200;

/// Largest text that is read; the lengths of its parts are kept in 32 bits.
inline constexpr std::size_t kKvfLargestText = 0xFFFF'FFF0;

/// Parses a text into `file.top`; the text is not needed afterwards. False when it is no parameter file:
/// `file.syntaxError` then says where and what was expected, and the tree is not to be used.
bool ParseKvf(const FileContent& text, KvfFile& file);

}  // namespace tervane
