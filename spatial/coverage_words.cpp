// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <cmath>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "data/datafile_request.h"
#include "platform/dates.h"
#include "platform/text.h"
#include "spatial/coverage.h"

namespace tervane {

namespace {

/// A length of time for people: "12.5 days", "6 hours".
std::string TimeLengthText(std::int64_t seconds) {
  constexpr std::int64_t kHour = 3600, kDay = 86400;
  const auto text = [&](std::int64_t unit, const char* name) {
    const double count = std::round(static_cast<double>(seconds) / static_cast<double>(unit) * 10) / 10;
    return fmt::format("{} {}{}", ShortestNumber(count), name, count == 1 ? "" : "s");
  };
  return seconds >= kDay ? text(kDay, "day") : seconds >= kHour ? text(kHour, "hour") : text(60, "minute");
}

}  // namespace

std::string_view NameOf(CoverageState state) {
  constexpr std::string_view kNames[] = {"ok", "note", "warning", "error"};
  return kNames[static_cast<std::size_t>(state)];
}

std::string ForcingTotals::Heading() const {
  return fmt::format("{}, {} [{}]", forcing.forcing.title, form.isTotal ? "total" : "mean", form.unit);
}

std::string ForcingTotals::ColumnText(std::size_t column) const {
  const Column& c = columns[column];
  return c.share ? fmt::format("{} ({:.0f}%)", c.name, *c.share * 100) : c.name;
}

int ForcingTotals::Decimals() const {
  constexpr int kDigits = 5;
  double largest = 0;
  int needed = 0;
  for (const Column& column : columns) {
    for (const PeriodSum& sum : column.sums) {
      const double value = std::abs(form.Of(sum));
      if (!std::isfinite(value) || value <= 0) continue;
      largest = std::max(largest, value);
      const std::string text = FormatNumber(value, "%.5g");
      if (const std::size_t point = text.find('.'); point != std::string::npos && text.find('e') == std::string::npos)
        needed = std::max(needed, static_cast<int>(text.size() - point) - 1);
    }
  }
  if (largest <= 0) return 0;
  return std::clamp(kDigits - 1 - static_cast<int>(std::floor(std::log10(largest))), 0, needed);
}

std::string ForcingTotals::ValueText(std::size_t column, std::size_t period, const TimeSpan& span, int decimals) const {
  const Column& c = columns[column];
  if (period >= c.sums.size() || c.sums[period].covered == 0) return {};
  std::string text = fmt::format("{:.{}f}", form.Of(c.sums[period]), decimals);
  const double share = static_cast<double>(c.sums[period].covered) / static_cast<double>(span.Seconds());
  if (share < 1) text += fmt::format(" ({:.{}f}%)", share * 100, share > 0.995 ? 2 : 0);
  return text;
}

std::string MissingCellsText(const CoverageRow& row) {
  if (row.missing == 0 || (row.file.mayLeaveCells && row.missing < row.cells)) return {};
  return fmt::format("{} of the domain {} no {}", row.missing == 1 ? "1 cell" : fmt::format("{} cells", row.missing),
                     row.missing == 1 ? "has" : "have", LowerCase(row.file.quantity));
}

std::string CoverageRow::PeriodText() const {
  if (period)
    return fmt::format("{} to {}", DateInWords(CYbDateTime::FromSecondsSinceEpoch(period->start)),
                       DateInWords(CYbDateTime::FromSecondsSinceEpoch(period->end)));
  return file.use.isOverTime && problem.empty() ? "at all times" : "";
}

std::string CoverageRow::TimeText() const {
  if (!file.use.isOverTime || !problem.empty()) return {};
  std::vector<std::string> parts;
  if (late > 0) parts.push_back(fmt::format("starts {} late", TimeLengthText(late)));
  if (early > 0) parts.push_back(fmt::format("ends {} early", TimeLengthText(early)));
  if (!gaps.empty()) {
    std::int64_t all = 0;
    for (const TimeSpan& gap : gaps) all += gap.Seconds();
    parts.push_back(gaps.size() == 1 ? fmt::format("a gap of {}", TimeLengthText(all))
                                     : fmt::format("{} gaps, {}", gaps.size(), TimeLengthText(all)));
  }
  return parts.empty() ? "covers the simulation" : fmt::format("{}", fmt::join(parts, "; "));
}

std::string CoverageRow::AreaText() const {
  if (!file.use.isOverArea || !problem.empty()) return {};
  if (isInDegrees) return "in degrees";
  if (cells == 0) return {};
  if (missing == cells) return "covers no cell of the domain";
  if (missing == 0) return "covers the domain";
  return file.mayLeaveCells ? fmt::format("covers {} of {} cells", cells - missing, cells)
                            : fmt::format("{} of {} cells have no value", missing, cells);
}

}  // namespace tervane
