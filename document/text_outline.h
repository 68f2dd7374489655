// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "core/path.h"

namespace tervane {

/// A setup's text as it is saved, with its sections by their lines. Lines count from 0. Nothing is parsed: each section
/// begins in a line of its own, which ends in a brace, and ends in one that holds the closing brace alone.
class TextOutline {
 public:
  static constexpr int kNone = -1;

  struct Section {
    int begin;   ///< The line of its name.
    int end;     ///< The line of its closing brace.
    int parent;  ///< Its number; `kNone` for a target.
  };

  TextOutline() : TextOutline(std::string()) {}
  explicit TextOutline(std::string text);

  const std::string& Text() const { return text_; }
  int LineCount() const { return static_cast<int>(starts_.size()); }
  std::string_view Line(int line) const;
  /// These lines and their ends, the last included.
  std::string_view Lines(int first, int last) const;

  /// In the order of the text.
  const std::vector<Section>& Sections() const { return sections_; }
  /// The smallest section that holds these lines between its first and its last; `kNone` outside of all.
  int SectionAround(int first, int last) const;
  /// The steps to a section below its target, none for the target itself.
  std::vector<PathStep> StepsTo(int section) const;
  /// The section at the end of the steps, or `kNone`.
  int Find(const std::vector<PathStep>& steps) const;
  /// The line of a key of that section itself; the section's first line where it has no such key.
  int LineOf(int section, std::string_view key) const;

 private:
  std::string text_;
  std::vector<std::uint32_t> starts_;
  std::vector<Section> sections_;
};

/// Whether a line begins or ends a section, as of `TextOutline`.
bool BeginsSection(std::string_view line);
bool EndsSection(std::string_view line);

}  // namespace tervane
