// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstddef>
#include <string>

#include "document/three_way_merge.h"

namespace tervane {

/// What comes of two setups that were made from one.
struct FileMerge {
  MergeResult result;    ///< Its problem tells also of a file that cannot be read, and of what would not open again.
  std::string text;      ///< The merged setup, which opens.
  std::size_t comments;  ///< How many comments inside of the setups are left out.
};
/// Merges files; `path` is where the text will stand.
FileMerge MergeSetupFiles(const std::string& base, const std::string& mine, const std::string& theirs,
                          const std::string& path, const MergeChoices& choices = {});

}  // namespace tervane
