// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/report/report_dates.h"

#include <array>

#include <fmt/format.h>

#include "platform/dates.h"
#include "platform/text.h"

namespace tervane {

namespace {

using Months = std::array<std::string_view, 12>;
constexpr Months kEnglish{"January", "February", "March",     "April",   "May",      "June",
                          "July",    "August",   "September", "October", "November", "December"};
constexpr Months kGerman{"Januar", "Februar", "März",      "April",   "Mai",      "Juni",
                         "Juli",   "August",  "September", "Oktober", "November", "Dezember"};
constexpr Months kFrench{"janvier", "février", "mars",      "avril",   "mai",      "juin",
                         "juillet", "août",    "septembre", "octobre", "novembre", "décembre"};

std::string DayInWords(ReportDates::Style style, const CYbDateTime& date) {
  const auto month = static_cast<std::size_t>(date.Month() - 1);
  switch (style) {
    case ReportDates::Style::English:
      return fmt::format("{} {} {}", date.Day(), kEnglish[month], date.Year());
    case ReportDates::Style::German:
      return fmt::format("{}. {} {}", date.Day(), kGerman[month], date.Year());
    case ReportDates::Style::French:
      return fmt::format("{} {} {}", date.Day() == 1 ? "1er" : std::to_string(date.Day()), kFrench[month], date.Year());
    case ReportDates::Style::Iso:
      break;
  }
  return date.Format("%Y-%m-%d");
}

/// A date at the begin of a text: its numbers, and how long it is; 0 for none.
std::size_t ReadDay(std::string_view text, CYbDateTime& date) {
  constexpr std::size_t kLength = 10;
  if (text.size() < kLength || (text[4] != '-' && text[4] != '/') || text[7] != text[4]) return 0;
  for (const std::size_t place : {0, 1, 2, 3, 5, 6, 8, 9})
    if (!IsDigit(text[place])) return 0;
  const auto number = [&](std::size_t from, std::size_t count) {
    int value = 0;
    for (std::size_t place = from; place < from + count; ++place) value = value * 10 + (text[place] - '0');
    return value;
  };
  date = CYbDateTime(number(0, 4), number(5, 2), number(8, 2));
  return date.IsValid() ? kLength : 0;
}

/// Blanks, and an hour with minutes and perhaps seconds behind them: where they begin and end; 0 for none.
std::pair<std::size_t, std::size_t> FindTime(std::string_view text) {
  std::size_t begin = 0;
  while (begin < text.size() && text[begin] == ' ') ++begin;
  std::size_t end = begin;
  while (end < text.size() && (IsDigit(text[end]) || text[end] == ':')) ++end;
  const bool isTime = begin > 0 && (end - begin == 5 || end - begin == 8) && text[begin + 2] == ':';
  return isTime ? std::pair(begin, end) : std::pair(std::size_t{0}, std::size_t{0});
}

/// What a date does not touch: it would be a part of a name.
bool IsOfName(char c) {
  return IsDigit(c) || (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '_' || c == '-' || c == '/' ||
         c == '\\';
}

}  // namespace

std::string ReportDates::In(std::string_view text) const {
  std::string told;
  for (std::size_t place = 0; place < text.size();) {
    CYbDateTime date;
    const bool mayBegin = place == 0 || !IsOfName(text[place - 1]);
    const std::size_t length = mayBegin ? ReadDay(text.substr(place), date) : 0;
    const std::string_view rest = text.substr(place + length);
    const bool mayEnd = rest.empty() || (!IsOfName(rest[0]) && (rest[0] != '.' || rest.size() == 1 || rest[1] == ' '));
    if (length == 0 || !mayEnd) {
      told += text[place++];
      continue;
    }
    told += DayInWords(style, date);
    place += length;
    const auto [begin, end] = FindTime(rest);
    if (end == 0) continue;
    const std::string_view time = rest.substr(begin, end - begin);
    // Midnight is the day.
    if (time != "00:00" && time != "00:00:00") told += fmt::format("{}{}", style == Style::Iso ? " " : ", ", time);
    place += end;
  }
  return told;
}

}  // namespace tervane
