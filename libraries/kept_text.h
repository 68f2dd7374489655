// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Parts of a parameter file as lines that are written again: comments, and what means nothing to a file's reader.
#pragma once

#include <limits>
#include <string>
#include <string_view>
#include <utility>

#include "core/kvf_tree.h"
#include "geometry/grid.h"

namespace tervane {

/// Steps of indentation, of the files that hold entries or branches in sections of a target.
enum TextLevel { kTop, kInTarget, kInSection, kInBranch };

/// A line that stands so many steps deep.
std::string IndentedLine(int level, std::string_view text);
/// The same for each line of a text.
std::string IndentedLines(int level, std::string_view lines);
/// A section or keyword as it is written.
std::string KvfNodeText(const KvfNode& node, int level);
/// Whether a value is a number of any form.
bool IsKvfNumber(const KvfParam& param);
/// Whether a name is a pattern with a number in the place of its %d, which stands at its end.
bool IsNumberedName(std::string_view name, std::string_view pattern);
/// The name of that number.
std::string NumberedName(std::string_view pattern, std::size_t number);
/// A text in quotes.
std::string KvfTextValue(std::string_view text);
/// A number in any of its forms, with the digits that stand in the file; NaN for none.
double KvfNumber(const KvfParam& param);

/// Adds the corners of an area, `x0`, `y0`, `x1`, `y1`, as whole numbers: without their fractions.
void AddCorners(KvfFile& file, KvfSection& section, const Envelope& area);

/// Gathers, on a walk over a file in its order, what the reader does not take.
class KeptText {
 public:
  explicit KeptText(const KvfFile& file) : file_(file) {}

  /// Keeps a node that means nothing, with the comments in front of it and inside.
  void Keep(const KvfNode& node, int level);
  /// Keeps the comments above a line.
  void KeepCommentsUntil(int line, int level) { kept_ += IndentedLines(level, CommentsUntil(line)); }
  /// What was kept since this was last asked.
  std::string Take() { return std::exchange(kept_, {}); }

  /// The comments above a line that were not taken yet, a line each.
  std::string CommentsUntil(int line);
  /// The comment on that line, when it is the next one; empty for none.
  std::string CommentOn(int line);

  /// The last line on which a node, or what it holds, begins.
  static int LastLineOf(const KvfNode& node);
  static constexpr int kEndOfFile = std::numeric_limits<int>::max();

 private:
  const KvfFile& file_;
  std::size_t next_ = 0;  ///< The first comment that is not taken.
  std::string kept_;
};

}  // namespace tervane
