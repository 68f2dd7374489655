// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Two setups that were made from one are put together. Files are merged as they stand, so that what no node reads is
// merged and kept like everything else.
#pragma once

#include <map>
#include <string>
#include <vector>

#include "core/kvf_tree.h"

namespace tervane {

enum class MergeSide { Mine, Theirs, Base };

/// What both sides have changed in different ways; the merged file holds mine, unless another side was chosen.
struct MergeConflict {
  enum class Kind {
    Value,          ///< A key has another value on each side.
    DeletedByMe,    ///< A section that I have deleted and they have changed.
    DeletedByThem,  ///< A section that they have deleted and I have changed.
    Order,          ///< Both have moved items of a list.
  };
  Kind kind = Kind::Value;
  std::string path;                ///< Of the section, in my file or, where that has none, in theirs.
  std::string key;                 ///< Empty when a whole section is meant.
  std::string base, mine, theirs;  ///< As the files hold it; empty where a file has none.
  MergeSide taken = MergeSide::Mine;

  /// The same for the same conflict of another merge of these files.
  std::string Identity() const;
  /// Only a value has something in the base that can be taken.
  bool HasBase() const { return kind == Kind::Value; }
  /// In plain words, with all three values.
  std::string Sentence() const;
};

/// Which side is taken, by the identity of the conflict.
using MergeChoices = std::map<std::string, MergeSide>;

struct MergeResult {
  std::vector<MergeConflict> conflicts;
  int takenFromThem = 0;  ///< Changes of keys, sections and orders.
  std::string problem;    ///< Why nothing could be merged; empty when it was.
};

/// Writes into `merged`, which is empty, what comes of the changes of both sides. A change that both have made alike is
/// none. Items of a list are followed by their name, else their code, else their place; so are those that one side has
/// moved or renamed. Files of different document versions are refused.
MergeResult MergeSetups(KvfFile& base, KvfFile& mine, KvfFile& theirs, KvfFile& merged,
                        const MergeChoices& choices = {});

}  // namespace tervane
