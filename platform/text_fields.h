// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Walking through a large text of numbers line by line and field by field, without copies.
#pragma once

#include <charconv>
#include <cmath>
#include <cstddef>
#include <string>
#include <string_view>

#include "platform/progress.h"

namespace tervane {

/// The lines of a text, which end in "\n" or "\r\n", or in "\r" where there is no "\n" at all; a byte order mark of
/// UTF-8 is skipped.
class LineReader {
 public:
  explicit LineReader(std::string_view text) : rest_(text) {
    if (rest_.starts_with("\xEF\xBB\xBF")) rest_.remove_prefix(3);
    if (rest_.find('\n') == std::string_view::npos) end_ = '\r';
  }

  bool Next(std::string_view& line) {
    if (rest_.empty()) return false;
    const std::size_t end = rest_.find(end_);
    line = rest_.substr(0, end);
    rest_.remove_prefix(end == std::string_view::npos ? rest_.size() : end + 1);
    if (line.ends_with('\r')) line.remove_suffix(1);
    ++number_;
    return true;
  }
  /// Of the line that `Next` gave last, from 1.
  std::size_t Number() const { return number_; }
  /// How many bytes are still to come.
  std::size_t Left() const { return rest_.size(); }

 private:
  std::string_view rest_;
  char end_ = '\n';
  std::size_t number_ = 0;
};

/// Tells after every so many lines how far a text was read, and stops there when that is asked for.
class LineProgress {
 public:
  LineProgress(std::string_view text, ProgressPart progress) : size_(text.size() + 1), progress_(progress) {}

  void After(const LineReader& lines) const {
    constexpr std::size_t kLines = 4096;
    if (lines.Number() % kLines != 0) return;
    progress_.ThrowIfCancelled();
    progress_.Report(1 - static_cast<double>(lines.Left()) / static_cast<double>(size_));
  }

 private:
  std::size_t size_;
  ProgressPart progress_;
};

/// How the fields of a line of numbers are told apart.
struct FieldRules {
  bool isCommaDecimal = false;  ///< Then only blanks, tabs and semicolons separate.

  bool IsSeparator(char c) const { return c == ' ' || c == '\t' || c == ';' || (c == ',' && !isCommaDecimal); }
};

/// Takes the next field off the line; empty at its end. Any number of separators stands between two fields.
inline std::string_view NextField(std::string_view& line, FieldRules rules) {
  std::size_t begin = 0;
  while (begin < line.size() && rules.IsSeparator(line[begin])) ++begin;
  std::size_t end = begin;
  while (end < line.size() && !rules.IsSeparator(line[end])) ++end;
  const std::string_view field = line.substr(begin, end - begin);
  line.remove_prefix(end);
  return field;
}

/// Reads a whole field as a finite number, whatever the process's locale.
inline bool ReadNumber(std::string_view field, FieldRules rules, double& value) {
  std::string changed;
  if (rules.isCommaDecimal && field.find(',') != std::string_view::npos) {
    changed = field;
    changed[changed.find(',')] = '.';
    field = changed;
  }
  if (field.starts_with('+') && field.size() > 1 && field[1] != '-') field.remove_prefix(1);
  const char* const end = field.data() + field.size();
  const std::from_chars_result read = std::from_chars(field.data(), end, value);
  return read.ec == std::errc() && read.ptr == end && std::isfinite(value);
}

/// A field as it may stand in a message: cut, and without what no terminal should get.
std::string Shown(std::string_view field);

/// Why a text cannot be read as lines of numbers at all (UTF-16, a file that is no text), or empty.
std::string WhyNoText(std::string_view text);

}  // namespace tervane
