// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <algorithm>
#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "platform/text.h"

namespace tervane {

/// Reads a table of comma separated values row by row and counts its lines. Tabs and semicolons separate as well.
class CsvReader {
 public:
  /// With `mayBeBlank` the last blank of a line separates where no sign does.
  CsvReader(std::string_view text, bool mayBeBlank) : rest_(text) {
    constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";
    if (rest_.starts_with(kByteOrderMark)) rest_.remove_prefix(kByteOrderMark.size());
    const std::string_view first = rest_.substr(0, rest_.find('\n'));
    // A comma may stand in the names of a table that other signs separate.
    for (const char sign : {'\t', ';', ','}) {
      separator_ = sign;
      if (first.find(sign) != std::string_view::npos) return;
    }
    isBlankSeparated_ = mayBeBlank;
  }

  /// Whether commas separate cells, so that none is a decimal mark.
  bool SeparatesByComma() const { return separator_ == ',' && !isBlankSeparated_; }
  /// Where the present row begins, counted from 1.
  std::size_t Line() const { return line_; }

  /// The cells of the next row that is not empty; false at the end, and where a quote is not closed.
  bool Next(std::vector<std::string>& cells) {
    do {
      if (rest_.empty()) return false;
      line_ = nextLine_;
      isBlankSeparated_ ? ReadWords(cells) : ReadRow(cells);
      if (isQuoteOpen_) return false;
    } while (cells.size() == 1 && Trimmed(cells[0]).empty());
    return true;
  }
  bool IsQuoteOpen() const { return isQuoteOpen_; }

 private:
  void ReadWords(std::vector<std::string>& cells) {
    const std::size_t end = std::min(rest_.find('\n'), rest_.size());
    const std::string_view line = Trimmed(rest_.substr(0, end));
    rest_.remove_prefix(std::min(end + 1, rest_.size()));
    ++nextLine_;
    const std::size_t blank = line.find_last_of(' ');
    cells = {std::string(line.substr(0, blank))};
    if (blank != std::string_view::npos) cells.emplace_back(line.substr(blank + 1));
  }

  void ReadRow(std::vector<std::string>& cells) {
    cells.assign(1, {});
    bool isQuoted = false;
    while (!rest_.empty()) {
      const char c = rest_.front();
      rest_.remove_prefix(1);
      if (c == '\n') ++nextLine_;
      if (isQuoted) {
        if (c != '"') {
          cells.back() += c;
        } else if (rest_.starts_with('"')) {
          cells.back() += '"';
          rest_.remove_prefix(1);
        } else {
          isQuoted = false;
        }
      } else if (c == '"' && Trimmed(cells.back()).empty()) {
        cells.back().clear();
        isQuoted = true;
      } else if (c == separator_) {
        cells.emplace_back();
      } else if (c == '\n') {
        return;
      } else {
        cells.back() += c;
      }
    }
    isQuoteOpen_ = isQuoted;
  }

  std::string_view rest_;
  char separator_ = ',';
  bool isBlankSeparated_ = false;
  std::size_t line_ = 0, nextLine_ = 1;
  bool isQuoteOpen_ = false;
};

/// A number in a cell; with `mayHaveComma` its decimal mark may be one. Nothing for anything else.
std::optional<double> ParseCsvNumber(std::string_view cell, bool mayHaveComma);

}  // namespace tervane
