// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/series_csv.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <cstddef>
#include <limits>
#include <map>
#include <new>
#include <optional>

#include <fmt/format.h>

#include "data/csv_reader.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// Nothing when the text is no ISO date, or names a day that the calendar does not have.
std::optional<CYbDateTime> ParseIsoDate(std::string_view text) {
  std::array<int, 6> fields{};
  constexpr std::array<std::size_t, 6> kDigits{4, 2, 2, 2, 2, 2};
  std::size_t count = 0;
  for (; count < fields.size() && !text.empty(); ++count) {
    if (count > 0) {
      const std::string_view separators = count < 3 ? "-/" : count == 3 ? " T" : ":";
      if (separators.find(text.front()) == std::string_view::npos) break;
      text.remove_prefix(1);
    }
    const std::size_t digits = kDigits[count];
    if (text.size() < digits) return std::nullopt;
    const auto [end, error] = std::from_chars(text.data(), text.data() + digits, fields[count]);
    if (error != std::errc() || end != text.data() + digits || text.front() == '-') return std::nullopt;
    text.remove_prefix(digits);
  }
  // A zone other than that of UTC would have to be asked for: setups have none.
  if (text == "Z" && count > 3) text = {};
  if (!text.empty() || count < 3 || count == 4) return std::nullopt;
  const bool isMidnightAtEnd = fields[3] == 24 && fields[4] == 0 && fields[5] == 0;
  if (isMidnightAtEnd) fields[3] = 0;
  CYbDateTime date(fields[0], fields[1], fields[2], fields[3], fields[4], fields[5]);
  if (isMidnightAtEnd) date = date + CYbDateTimeSpan::Days(1);
  return date.IsValid() ? std::optional(date) : std::nullopt;
}

bool SaysMissing(std::string_view cell) {
  for (const std::string_view word : {"", "NA", "N/A", "NaN", "null", "none", "-", "--"})
    if (EqualIgnoringCase(cell, word)) return true;
  return false;
}

/// Nothing when the cell is no number that single precision holds.
std::optional<float> ParseValue(std::string_view cell, bool mayHaveComma) {
  const auto value = ParseCsvNumber(cell, mayHaveComma);
  if (!value || !(std::abs(*value) <= static_cast<double>(std::numeric_limits<float>::max()))) return std::nullopt;
  const auto single = static_cast<float>(*value);
  return single == kDeleteValue ? std::nullopt : std::optional(single);
}

/// "line 5" or "lines 5, 7, 9 and 12 more".
std::string InLines(const std::vector<std::size_t>& lines) {
  constexpr std::size_t kMost = 5;
  std::string text = lines.size() == 1 ? "line " : "lines ";
  for (std::size_t i = 0; i < std::min(kMost, lines.size()); ++i)
    text += (i == 0 ? "" : ", ") + std::to_string(lines[i]);
  return lines.size() <= kMost ? text : fmt::format("{} and {} more", text, lines.size() - kMost);
}

constexpr const char* kFormat = "%Y-%m-%d %H:%M:%S";

/// Notes where steps are longer than the usual one.
void NoteGaps(CsvSeries& series, const std::vector<std::size_t>& lines) {
  std::map<std::int64_t, std::size_t> steps;
  for (std::size_t i = 1; i < series.stamps.size(); ++i) ++steps[(series.stamps[i] - series.stamps[i - 1]).seconds];
  const auto usual = std::ranges::max_element(steps, {}, [](const auto& step) { return step.second; });
  // Steps of many lengths, as of months or events, have no gaps.
  if (usual == steps.end() || usual->second * 10 < (series.stamps.size() - 1) * 9) return;
  std::vector<std::size_t> gaps;
  for (std::size_t i = 1; i < series.stamps.size(); ++i)
    if ((series.stamps[i] - series.stamps[i - 1]).seconds > usual->first) gaps.push_back(lines[i]);
  if (gaps.empty()) return;
  series.notes.push_back(fmt::format("{} gap{} before {}: the step is otherwise {} s", gaps.size(),
                                     gaps.size() == 1 ? "" : "s", InLines(gaps), usual->first));
}

/// The place of the wanted column, or none with an error.
std::size_t FindColumn(const std::vector<std::string>& names, std::string_view wanted, CsvSeries& series) {
  std::string known;
  std::vector<std::size_t> found;
  for (std::size_t i = 1; i < names.size(); ++i) {
    const std::string_view name = Trimmed(names[i]);
    known += fmt::format("{}\"{}\"", known.empty() ? "" : ", ", name);
    if (wanted.empty() ? names.size() == 2 : EqualIgnoringCase(name, Trimmed(wanted))) found.push_back(i);
  }
  if (found.size() == 1) {
    series.column = Trimmed(names[found[0]]);
    return found[0];
  }
  if (names.size() < 2) {
    series.error = "line 1: names of columns were expected, separated by commas, semicolons or tabs; dates come first";
  } else if (found.size() > 1) {
    series.error = fmt::format("line 1: several columns are named \"{}\"; give them names that differ", wanted);
  } else if (wanted.empty()) {
    series.error = fmt::format("line 1: name the column to read: {}", known);
  } else {
    series.error = fmt::format("line 1: there is no column \"{}\", but {}", wanted, known);
  }
  return 0;
}

/// `mayLackNames`: the first line may hold values already.
CsvSeries ReadSeries(std::string_view text, std::string_view column, bool mayLackNames) {
  CsvSeries series;
  if (text.find('\0') != std::string_view::npos) {
    series.error = "it contains zero characters; save it as plain text in UTF-8";
    return series;
  }
  CsvReader reader(text, mayLackNames);
  std::vector<std::string> cells;
  if (!reader.Next(cells)) {
    series.error = reader.IsQuoteOpen() ? "line 1: a quote is not closed" : "it is empty";
    return series;
  }
  const std::size_t columns = cells.size();
  // The row of names is read, or it is the first of the values.
  bool isRowRead = mayLackNames && columns == 2 && ParseIsoDate(Trimmed(cells[0]));
  const std::size_t place = isRowRead ? 1 : FindColumn(cells, column, series);
  if (!series.error.empty()) return series;

  std::vector<std::size_t> lines, missing;
  const auto refuse = [&](const std::string& reason) {
    series.error = fmt::format("line {}: {}", reader.Line(), reason);
    return series;
  };
  for (; isRowRead || reader.Next(cells); isRowRead = false) {
    // A separator behind the last cell does no harm.
    if (cells.size() == columns + 1 && Trimmed(cells.back()).empty()) cells.pop_back();
    if (cells.size() != columns) {
      const bool isDecimal = reader.SeparatesByComma() && cells.size() > columns;
      return refuse(fmt::format("it has {} cells, {} were expected{}", cells.size(), columns,
                                isDecimal ? "; decimals stand behind a point" : ""));
    }
    const std::optional<CYbDateTime> stamp = ParseIsoDate(Trimmed(cells[0]));
    if (!stamp) {
      return refuse(fmt::format("\"{}\" is no date; one such as 2000-01-31 12:00 was expected", Trimmed(cells[0])));
    }
    if (!series.stamps.empty() && *stamp <= series.stamps.back()) {
      return refuse(
          *stamp == series.stamps.back()
              ? fmt::format("{} stands already in line {}; remove one of the two", stamp->Format(kFormat), lines.back())
              : fmt::format("{} is earlier than {} in line {}; sort the lines by date", stamp->Format(kFormat),
                            series.stamps.back().Format(kFormat), lines.back()));
    }
    const std::string_view cell = Trimmed(cells[place]);
    const bool isMissing = SaysMissing(cell);
    const std::optional<float> value = isMissing ? kDeleteValue : ParseValue(cell, !reader.SeparatesByComma());
    if (!value) {
      return refuse(
          fmt::format("\"{}\" is no number that can be stored; leave the cell empty where there is no value", cell));
    }
    if (isMissing) missing.push_back(reader.Line());
    lines.push_back(reader.Line());
    series.stamps.push_back(*stamp);
    series.values.push_back(*value);
  }
  if (reader.IsQuoteOpen()) return refuse("a quote is not closed");
  if (series.stamps.empty()) {
    series.error = "it has no line behind the names of its columns";
    return series;
  }
  if (!missing.empty()) {
    series.notes.push_back(
        fmt::format("{} missing value{} in {}", missing.size(), missing.size() == 1 ? "" : "s", InLines(missing)));
  }
  NoteGaps(series, lines);
  return series;
}

}  // namespace

std::vector<std::string> CsvColumns(std::string_view text) {
  CsvReader reader(text, false);
  std::vector<std::string> names;
  if (!reader.Next(names)) return {};
  names.erase(names.begin());
  for (std::string& name : names) name = Trimmed(name);
  return names;
}

CsvSeries ReadCsvSeries(std::string_view text, std::string_view column) { return ReadSeries(text, column, false); }
CsvSeries ReadPastedSeries(std::string_view text) { return ReadSeries(text, {}, true); }

namespace {

/// The begins of the intervals of a file's values. "" or why they are not known.
std::string BeginsOf(const DataFile& file, std::vector<std::int64_t>& begins) {
  const TimeAxis& time = file.Time();
  for (const DataItem& item : file.Items())
    if (item.valueType == ValueType::Instantaneous)
      return fmt::format("the values of {} hold at their dates, which are no ends of intervals", item.name);
  begins = time.stamps;
  if (begins.empty()) return {};
  if (!time.begin && begins.size() < 2) return "the file does not tell when the interval of its only value begins";
  begins.pop_back();
  // An interval without a begin of its own is as long as the next one.
  begins.insert(begins.begin(), time.begin ? time.begin->SecondsSinceEpoch() : 2 * time.stamps[0] - time.stamps[1]);
  return {};
}

}  // namespace

std::string WriteCsvSeries(const DataFile& file, CsvStamps stamps, std::string& text) {
  const std::vector<DataItem>& items = file.Items();
  const std::size_t steps = file.Time().steps;
  if (!file.Time().hasDates) return fmt::format("cannot export {}: it has no dates", file.Path());
  std::vector<std::int64_t> dates = file.Time().stamps;
  if (stamps == CsvStamps::Begins)
    if (const std::string reason = BeginsOf(file, dates); !reason.empty())
      return fmt::format("cannot export {} with begins: {}", file.Path(), reason);
  std::vector<std::vector<float>> values(items.size());
  text = "time";
  for (std::size_t i = 0; i < items.size(); ++i) {
    if (items[i].dimensions != 0 || !items[i].hasTime) {
      return fmt::format("cannot export {}: the item {} is no time series", file.Path(), items[i].name);
    }
    try {
      values[i].resize(steps);
    } catch (const std::bad_alloc&) {
      return fmt::format("cannot export {}: it needs more than the free memory", file.Path());
    }
    const ValueSelection all{static_cast<int>(i + 1), 0, steps, {}};
    if (std::string error = file.Read(all, values[i]); !error.empty()) return error;
    const std::string name = items[i].unitKey == kDimensionlessUnit
                                 ? items[i].name
                                 : fmt::format("{} [{}]", items[i].name, items[i].unitText);
    text += fmt::format(",\"{}\"", Replaced(name, "\"", "\"\""));
  }
  text += '\n';
  for (std::size_t step = 0; step < steps; ++step) {
    text += CYbDateTime::FromSecondsSinceEpoch(dates[step]).Format(kFormat);
    for (const std::vector<float>& series : values) {
      text += ',';
      if (series[step] != kDeleteValue) text += ShortestNumber(series[step]);
    }
    text += '\n';
  }
  return {};
}

}  // namespace tervane
