// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/stress_period_wizard.h"

#include <cmath>

#include <fmt/format.h>

#include "pages/parts/create_dialogs.h"
#include "pages/parts/plot_content.h"
#include "simspec/periods.h"

namespace tervane {

namespace {

constexpr int kMostPeriods = 1'000'000;

/// A number that is refused below a limit, with a text of its own.
void RefuseWhen(Control& control, double& value, std::function<bool(double)> isRefused, const char* refusal) {
  control.enter = [enter = control.enter, &value, isRefused = std::move(isRefused), refusal](const std::string& typed) {
    const double before = value;
    std::string expected = enter(typed);
    if (!expected.empty() || !isRefused(value)) return expected;
    value = before;
    return std::string(refusal);
  };
}

std::string DateText(const CSimPeriodKvf* period, bool isEnd) {
  if (!period) return isEnd ? "No End Date" : "No Start Date";
  return (isEnd ? period->SIMEND : period->GetSimStartDate()).Format(CStressPeriodsKvf::kDateFormat);
}

}  // namespace

std::vector<CYbDateTime> MonthEnds(const CYbDateTime& start, const CYbDateTime& end, int months) {
  std::vector<CYbDateTime> ends;
  // Counted from the begin of the year 0, so that whole years are the years of the calendar.
  for (int month = (start.Year() * 12 + start.Month() - 1) / months * months + months;; month += months) {
    const CYbDateTime date(month / 12, month % 12 + 1, 1);
    if (!date.IsValid() || date >= end) return ends;
    if (date > start) ends.push_back(date);
  }
}

std::vector<CYbDateTime> ChangesOf(const Series& series, const CYbDateTime& start, const CYbDateTime& end) {
  std::vector<CYbDateTime> changes;
  const auto isSame = [](double a, double b) { return a == b || (std::isnan(a) && std::isnan(b)); };
  for (std::size_t i = 1; i < series.times.size(); ++i) {
    // A value over an interval ends with it, and so does a period.
    const CYbDateTime& date = series.times[series.isStepped ? i - 1 : i];
    if (isSame(series.values[i - 1], series.values[i]) || date <= start || date >= end) continue;
    const CYbDateTime minute(date.Year(), date.Month(), date.Day(), date.Hour(), date.Minute());
    if (minute > start && (changes.empty() || minute > changes.back())) changes.push_back(minute);
  }
  return changes;
}

CStressPeriodsDefaultDlg::CStressPeriodsDefaultDlg(const PageContext& context, CStressPeriodsKvf& periods)
    : CYbSEDlgBase(periods, WithoutDocument(context)),
      periods_(periods),
      steps_(periods.Defaults),
      count_(periods.GetItemCount()),
      offered_(DrivingSeriesOf(periods)) {}

void CStressPeriodsDefaultDlg::Describe(PageForm& form) {
  const auto* period = periods_.Important(kSimulationPeriod);
  form.Shown("Simulation Start:", [period] { return DateText(period, false); });
  form.Shown("Simulation End:", [period] { return DateText(period, true); });
  form.Choice("Periods:", layout_,
              {"Of one length", "One for each month", "One for each year", "Until each change of a series"});
  form.Integer("Number of Stress Periods:", count_).EnabledWhen(Is(layout_, kEqual));
  std::vector<std::string> titles;
  for (const DrivingSeries& series : offered_) titles.push_back(series.title);
  form.Choice("Series:", series_, std::move(titles)).ShownWhen(Is(layout_, kSeries));
  form.Notice([this] {
    if (layout_ == kEqual) return std::string();
    std::vector<CYbDateTime> ends;
    const std::string problem = FindEnds(ends);
    return problem.empty() ? fmt::format("{} stress periods", ends.size() + 1) : problem;
  });
  form.Number("First time step size", steps_.DELT);
  form.Number("Min step size", steps_.TMIN);
  form.Number("Max step size", steps_.TMAX);
  RefuseWhen(
      form.Number("Time step multiplier", steps_.TSMULT), steps_.TSMULT, [](double value) { return value < 1; },
      "Must be grater than or equal to 1");
  RefuseWhen(
      form.Number("Reduction factor", steps_.TSDIV), steps_.TSDIV, [](double value) { return value <= 1; },
      "Must be grater than 1");
}

std::string CStressPeriodsDefaultDlg::FindChanges(std::vector<CYbDateTime>& ends) const {
  if (series_ < 0 || series_ >= static_cast<int>(offered_.size()))
    return "There is no series of precipitation, evapotranspiration or pumping wells to follow.";
  const DrivingSeries& driving = offered_[static_cast<std::size_t>(series_)];
  const auto computed = RecentSeries(driving.path, driving.item);
  computed->Run();
  if (!computed->Result()) return fmt::format("The series cannot be read: {}.", computed->Problem());
  const auto* period = periods_.Important(kSimulationPeriod);
  ends = ChangesOf(*computed->Result(), period->GetSimStartDate(), period->SIMEND);
  return {};
}

std::string CStressPeriodsDefaultDlg::FindEnds(std::vector<CYbDateTime>& ends) const {
  const auto* period = periods_.Important(kSimulationPeriod);
  if (!period || !period->GetSimStartDate().IsValid() || !period->SIMEND.IsValid() ||
      period->SIMEND <= period->GetSimStartDate())
    return "The simulation needs a start and an end behind it first.";
  if (layout_ == kMonths) ends = MonthEnds(period->GetSimStartDate(), period->SIMEND, 1);
  if (layout_ == kYears) ends = MonthEnds(period->GetSimStartDate(), period->SIMEND, 12);
  if (layout_ == kSeries)
    if (std::string problem = FindChanges(ends); !problem.empty()) return problem;
  const std::size_t count = layout_ == kEqual ? static_cast<std::size_t>(std::max(count_, 0)) : ends.size() + 1;
  if (count < 1) return "There must be at least 1 stress period.";
  if (count > kMostPeriods) return fmt::format("There can be at most {} stress periods.", kMostPeriods);
  return {};
}

std::string CStressPeriodsDefaultDlg::Make() {
  std::vector<CYbDateTime> ends;
  if (std::string problem = FindEnds(ends); !problem.empty()) return problem;
  if (layout_ == kEqual)
    periods_.MakeEqualPeriods(count_, steps_);
  else
    periods_.MakePeriods(ends, steps_);
  return {};
}

bool CStressPeriodsDefaultDlg::Run() {
  if (!Context().runDialog) return false;
  Initialize();
  return Context().runDialog("Make Stress Periods Wizard", *this, [this] { return Make(); });
}

}  // namespace tervane
