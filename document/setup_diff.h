// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "core/kvf_tree.h"
#include "document/key_reference.h"

namespace tervane {

class CFlowModelDoc;

/// One difference between two setups.
struct SetupDifference {
  enum class Kind { Changed, Added, Removed, Moved };
  Kind kind;
  std::string path;  ///< Of the section, in the new setup; of a removed one in the old.
  std::string key;   ///< Empty when a whole section is meant.
  std::string from;  ///< As the file holds it; of a moved item its old section name.
  std::string to;
  bool fromDefault = false;  ///< The value is the key's default.
  bool toDefault = false;
  std::string fromMeaning = {};  ///< The text of the choice, or the unit of the number; empty when neither is known.
  std::string toMeaning = {};
};

/// What the kinds of differences are called.
inline constexpr std::string_view kDifferenceKinds[] = {"changed", "added", "removed", "moved"};
inline std::string_view NameOf(SetupDifference::Kind kind) { return kDifferenceKinds[static_cast<std::size_t>(kind)]; }

/// The values of a key as two files are compared: numbers behind the name of a file are made at each save.
std::string ComparedText(const KvfNode& keyword);

/// The differences between two sections as they are written, in the order of the new one. Items of a list are followed
/// to their new places: first by equal content, then by equal `Name`, then by place. What every save computes anew
/// (`IsDataUsedInSetup`, item counts) and whether a page was visited (`Touched`) is left out.
std::vector<SetupDifference> CompareSetups(KvfSection& from, KvfSection& to, const KeyReference& reference);
/// The differences in all that the files of two setups hold, whose target has that name.
std::vector<SetupDifference> CompareFiles(KvfFile& before, KvfFile& after, std::string_view setup);
/// The same of two documents, which may lie in different folders.
std::vector<SetupDifference> CompareDocuments(const CFlowModelDoc& before, const CFlowModelDoc& after);

}  // namespace tervane
