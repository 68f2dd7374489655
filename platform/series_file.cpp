// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/series_file.h"

#include <charconv>

#include <fmt/format.h>

#include "platform/datafile_writer.h"
#include "platform/text.h"
#include "platform/units.h"

namespace tervane {

FileResult WriteSeriesFile(const std::string& path, const NewSeries& series, ProgressPart progress) {
  const ItemType* type = FindItemType(series.itemType);
  NewDataFile content;
  content.dimensions = 0;
  content.items.push_back({series.name, series.itemType, type ? BaseUnit(*type).key : kDimensionlessUnit,
                           static_cast<ValueType>(series.valueType)});
  DataFileWriter writer;
  std::string error = writer.Create(path, content);
  for (std::size_t step = 0; step < series.times.size() && error.empty(); ++step) {
    error = writer.AddStep(series.times[step]);
    if (error.empty()) error = writer.Put(1, {&series.values[step], 1}, {});
    if (error.empty() && progress.IsCancelled()) error = fmt::format("cannot write {}: {}", path, kCancelled);
    progress.Tell(static_cast<double>(step) / static_cast<double>(series.times.size()));
  }
  if (!error.empty()) return {std::move(error), {}};
  return writer.Finish(progress);
}

std::string ParseSeriesText(const std::string& text, NewSeries& series) {
  series.times.clear();
  series.values.clear();
  int line = 0;
  for (std::string_view rest = text; !rest.empty();) {
    ++line;
    const std::size_t end = std::min(rest.find('\n'), rest.size());
    const std::string_view row = Trimmed(rest.substr(0, end));
    rest.remove_prefix(std::min(end + 1, rest.size()));
    if (row.empty()) continue;
    const std::size_t gap = row.find_last_of("\t;, ");
    const std::string_view number = gap == std::string_view::npos ? row : row.substr(gap + 1);
    std::string date(Trimmed(row.substr(0, gap == std::string_view::npos ? 0 : gap)));
    float value = 0;
    const auto [stop, error] = std::from_chars(number.data(), number.data() + number.size(), value);
    const bool isNumber = error == std::errc() && stop == number.data() + number.size();
    // A line of heads.
    if (!isNumber && series.times.empty()) continue;
    while (!date.empty() && (date.back() == ',' || date.back() == ';')) date.pop_back();
    date = Replaced(Replaced(date, "-", "/"), "T", " ");
    if (date.find(':') == std::string::npos) date += " 00:00";
    const CYbDateTime time = CYbDateTime::Parse(date, "%Y/%m/%d %H:%M");
    if (!isNumber || !time.IsValid())
      return fmt::format("line {}: \"{}\": a date as 2000-01-31 12:00 and a number were expected", line, row);
    if (!series.times.empty() && time <= series.times.back())
      return fmt::format("line {}: {} does not lie behind the line before", line, date);
    series.times.push_back(time);
    series.values.push_back(value);
  }
  return series.times.size() < 2 ? "at least two rows with a date and a number were expected" : std::string();
}

}  // namespace tervane
