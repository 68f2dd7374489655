// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/kvf_tree.h"

namespace tervane {

/// Deepest nesting of targets and sections that a file may have.
inline constexpr int kKvfDeepestNesting = 200;

/// Largest text that is read; places in it are kept in 32 bits.
inline constexpr std::size_t kKvfLargestText = 0xFFFF'FFF0;

/// Parses `file.text` into `file.top`. False when the text is no parameter file: `file.syntaxError` then says where and
/// what was expected, and the tree is not to be used.
bool ParseKvf(KvfFile& file);

}  // namespace tervane
