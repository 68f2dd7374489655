// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/stress_periods.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include <fmt/format.h>

#include "simspec/conditions.h"
#include "simspec/pages.h"
#include "simspec/periods.h"

namespace tervane {

namespace {

constexpr KeyChoice kStates[] = {{1, "Steady-state simulation"}, {0, "Transient simulation"}};
constexpr KeyChoice kPlotKinds[] = {{CStressPeriodsKvf::kNoPlots, "Hide plots"},
                                    {CStressPeriodsKvf::kSeparatePlots, "Show all timeseries as seperate plots"},
                                    {CStressPeriodsKvf::kPlotForEachType, "Lump timeseries of same type to one plot"}};

struct Simulation {
  CYbDateTime start, end;
};
/// Dates that are none in a tree without a simulation period.
Simulation SimulationOf(const CYbSEKvfBase& node) {
  const auto* period = node.Important(kSimulationPeriod);
  return period ? Simulation{period->GetSimStartDate(), period->SIMEND} : Simulation{};
}

CYbDateTime ToTheMinute(const CYbDateTime& date) {
  return {date.Year(), date.Month(), date.Day(), date.Hour(), date.Minute()};
}

std::string EndText(const CYbDateTime& date) { return date.Format(CStressPeriodsKvf::kDateFormat); }

}  // namespace

TimeStepRange TimeStepsOf(double length, const StressPeriodSteps& steps) {
  const double factor = steps.TSMULT, count = steps.NSTP;
  if (!(count >= 1) || !(factor > 0)) return {std::nan(""), std::nan("")};
  if (factor == 1) return {length / count, length / count};
  // The power is small or large, and never too large for a number.
  const double first = factor < 1 ? length * (factor - 1) / (std::pow(factor, count) - 1)
                                  : length * (factor - 1) * std::pow(factor, -count) / (1 - std::pow(factor, -count));
  const double last = factor < 1 ? first * std::pow(factor, count - 1)
                                 : length * (factor - 1) / (factor * (1 - std::pow(factor, -count)));
  return {first, last};
}

// ---- A period

CStressPeriodsItemKvf::CStressPeriodsItemKvf(CYbSEKvfBase* list)
    : CTvnKvfBase("StressPeriodsItem", "Item_%d", list), endDate_(SimulationOf(*this).end) {
  if (const auto* periods = dynamic_cast<const CStressPeriodsKvf*>(list))
    static_cast<StressPeriodSteps&>(*this) = periods->Defaults;
}

void CStressPeriodsItemKvf::SetEndDate(const CYbDateTime& date) {
  const auto [start, end] = SimulationOf(*this);
  endDate_ = ToTheMinute(date);
  // A simulation without dates holds no date of a period.
  if (start.IsValid()) endDate_ = std::max(endDate_, start);
  if (end.IsValid()) endDate_ = std::min(endDate_, end);
}

int CStressPeriodsItemKvf::ValidateData() {
  if (NSTP != std::floor(NSTP))
    AddWarning(fmt::format("The number of time steps is {:g}, which is no whole number.", NSTP), "NSTP");
  return 1;
}

void CStressPeriodsItemKvf::ExchangeKeys(KeyExchange& keys) {
  // As the file has it; what lies outside the simulation is told by the list.
  keys("Dates", endDate_);
  keys("DELT", DELT).Label("First time step size").Above(0);
  keys("TMIN", TMIN).Label("Min step size").AtLeast(0);
  keys("TMAX", TMAX).Label("Max step size").Above(0);
  keys("TSMULT", TSMULT).Label("Time step multiplier").Above(0);
  keys("TSDIV", TSDIV).Label("Reduction factor").Above(1);
  keys("NSTP", NSTP).Label("Number of time steps").AtLeast(1);
  keys("SSTR", SSTR).Label("Steady state time step");
}

CStressPeriodsPropListKvf::CStressPeriodsPropListKvf(CYbSEKvfBase* list)
    : CTvnKvfBase("Stress Period Properties", "STRESSPERIOD_PROPPAGE", list) {
  SetPage(kStressPeriodPropertiesPage);
  TakesPartWhen(IsInParent(&CStressPeriodsKvf::MfSteadyState, {0}));
}

// ---- The list

CStressPeriodsKvf::CStressPeriodsKvf(CYbSEKvfBase* parent)
    : CYbSEKvfListBase("Stress Periods", "STRESSPERIODS", parent) {
  SetPage(kStressPeriodsPage);
  TakesPartWhen(!OwnEngine());
  NewChild<CStressPeriodsPropListKvf>();
  CYbSEKvfListBase::SetItemCount(1, 1);
}

void CStressPeriodsKvf::ExchangeKeys(KeyExchange& keys) {
  keys("MfSteadyState", MfSteadyState).OneOf(kStates);
  keys("StressPeriodRadio", StressPeriodRadio).OneOf(kPlotKinds);
}

std::vector<CYbDateTime> CStressPeriodsKvf::GetDateMarkers() const {
  std::vector<CYbDateTime> markers;
  markers.reserve(static_cast<std::size_t>(GetItemCount()));
  for (int number = 1; number <= GetItemCount(); ++number) markers.push_back(GetItem(number)->EndDate());
  return markers;
}

std::string CStressPeriodsKvf::GetDateText(int number) const {
  if (number == 0) return EndText(SimulationOf(*this).start);
  const CStressPeriodsItemKvf* item = GetItem(number);
  return item ? EndText(item->EndDate()) : "ERROR";
}

CYbDateTimeSpan CStressPeriodsKvf::LengthOf(int number) const {
  const CStressPeriodsItemKvf *item = GetItem(number), *before = GetItem(number - 1);
  if (!item) return {};
  return item->EndDate() - (before ? before->EndDate() : SimulationOf(*this).start);
}

void CStressPeriodsKvf::FixLastPeriod() {
  const CYbDateTime end = SimulationOf(*this).end;
  if (CStressPeriodsItemKvf* last = GetItem(GetItemCount()); last && end.IsValid()) last->SetEndDate(end);
}

void CStressPeriodsKvf::MakeEqualPeriods(int count, const StressPeriodSteps& steps) {
  const auto [start, end] = SimulationOf(*this);
  const double days = (end - start).InDays() / std::max(count, 1);
  std::vector<CYbDateTime> ends;
  ends.reserve(static_cast<std::size_t>(std::max(count, 1)));
  for (int number = 1; number < count; ++number) ends.push_back(start + CYbDateTimeSpan::Days(number * days));
  MakePeriods(ends, steps);
}

void CStressPeriodsKvf::MakePeriods(const std::vector<CYbDateTime>& ends, const StressPeriodSteps& steps) {
  const StressPeriodSteps kept = Defaults;
  Defaults = steps;
  Defaults.NSTP = kept.NSTP;
  Defaults.SSTR = kept.SSTR;
  SetItemCount(0, 1);
  SetItemCount(static_cast<int>(ends.size()) + 1, 1);
  Defaults = kept;
  for (int number = 1; number < GetItemCount(); ++number)
    GetItem(number)->SetEndDate(ends[static_cast<std::size_t>(number - 1)]);
  FixLastPeriod();
}

void CStressPeriodsKvf::SetItemCount(int count, int level) {
  CYbSEKvfListBase::SetItemCount(count, level);
  SetRevalidateAll();
}

void CStressPeriodsKvf::DeleteItem(int number, int level) {
  CYbSEKvfListBase::DeleteItem(number, level);
  SetRevalidateAll();
}

void CStressPeriodsKvf::InsertItem(int number, int level) {
  CYbSEKvfListBase::InsertItem(number, level);
  SetRevalidateAll();
}

bool CStressPeriodsKvf::MoveItemUp(int number, int level) {
  SetRevalidateAll();
  return CYbSEKvfListBase::MoveItemUp(number, level);
}

bool CStressPeriodsKvf::MoveItemDown(int number, int level) {
  SetRevalidateAll();
  return CYbSEKvfListBase::MoveItemDown(number, level);
}

int CStressPeriodsKvf::ValidateData() {
  const auto [start, end] = SimulationOf(*this);
  std::string error, detail;
  CYbDateTime before = start;
  for (int number = 1; number <= GetItemCount() && error.empty(); ++number) {
    const CYbDateTime& date = GetItem(number)->EndDate();
    const std::string period = fmt::format("period {} ends at {}", number, EndText(date));
    if (date <= before && number == 1) {
      error = "The End Date of the first Stress Period date must be after Simulation Start Date.";
      detail = fmt::format("{}, the simulation starts at {}", period, EndText(start));
    } else if (date <= before) {
      error = "All Stress Period Dates must be increasing.";
      detail = fmt::format("{}, the one before it at {}", period, EndText(before));
    } else if (number > 1 && date > end) {
      error = "All Dates must be before Simulation End Date.";
      detail = fmt::format("{}, the simulation at {}", period, EndText(end));
    }
    before = date;
  }
  const CStressPeriodsItemKvf* last = GetItem(GetItemCount());
  const CYbDateTime lastBefore = last ? last->EndDate() : CYbDateTime();
  FixLastPeriod();
  if (error.empty()) return 1;
  // The next validation finds the moved end in order.
  if (last->EndDate() != lastBefore)
    detail += fmt::format("; the end of the last period was moved to {}", EndText(last->EndDate()));
  AddError(std::move(error), {}, std::move(detail));
  return 0;
}

}  // namespace tervane
