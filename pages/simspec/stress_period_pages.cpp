// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/stress_period_pages.h"

#include <cmath>

#include <fmt/format.h>

#include "forms/date_question.h"
#include "forms/table_of.h"
#include "pages/simspec/stress_period_series.h"
#include "pages/simspec/stress_period_wizard.h"
#include "platform/text.h"
#include "simspec/conditions.h"
#include "simspec/pages.h"

namespace tervane {

namespace {

using Item = CStressPeriodsItemKvf;

constexpr const char* kTableDates = "%Y-%m-%d %H:%M";

bool IsLast(const Item& period) {
  return &period ==
         static_cast<const CStressPeriodsKvf*>(period.GetParent())->GetItemNode(period.GetParent()->GetChildCount());
}

// ---- Where they end

class CStressPeriodsDlg : public PageOf<CStressPeriodsKvf> {
 public:
  CStressPeriodsDlg(CYbSEKvfBase& node, const PageContext& context)
      : PageOf(node, context), question_(context.syncSoon) {}

 protected:
  void Describe(PageForm& form) override;

 private:
  std::shared_ptr<TableOf<Item>> CStressPeriodsGrid();
  void MoveEnd(Item& period, const CYbDateTime& date) const;
  void AskEnd(Item& period);
  SeriesContent Chart() const;

  std::shared_ptr<TableOf<Item>> table_;
  DateQuestion question_;
};

void CStressPeriodsDlg::Describe(PageForm& form) {
  CStressPeriodsKvf& n = Node();
  const Condition isTransient = Is(n.MfSteadyState, 0);
  const Condition hasPlots =
      Is(n.StressPeriodRadio, {CStressPeriodsKvf::kSeparatePlots, CStressPeriodsKvf::kPlotForEachType});
  form.Radio("", n.MfSteadyState).Hint(kTreeRebuilt);
  form.Group("Input timeseries", isTransient).Radio("", n.StressPeriodRadio);
  form.Button("Make Stress Periods...",
              [this] {
                if (CStressPeriodsDefaultDlg(Context(), Node()).Run())
                  UpdateDoc(kDataChanged | kItemAdded | kItemDeleted, "Make Stress Periods");
              })
      .ToolTip("Makes periods of one length, for months or years, or by a series")
      .ShownWhen(isTransient);
  table_ = CStressPeriodsGrid();
  form.Table(table_).ShownWhen(isTransient);
  form.Chart([this] { return Chart(); }).ShownWhen(isTransient && hasPlots);
  form.MendWhenShown("End Last Stress Period with Simulation", [&n] {
    Item* last = n.GetItem(n.GetItemCount());
    const CYbDateTime before = last ? last->EndDate() : CYbDateTime();
    n.FixLastPeriod();
    return last && last->EndDate() != before;
  });
}

std::shared_ptr<TableOf<Item>> CStressPeriodsDlg::CStressPeriodsGrid() {
  auto table = std::make_shared<TableOf<Item>>(Node());
  table->ItemName("Stress Period");
  table->ReportCurrentRow();
  table
      ->Value(
          "End Date", [](Item& period) { return period.EndDate(); },
          [](Item& period, const CYbDateTime& date) { period.SetEndDate(date); })
      .Key("Dates")
      .Format(kTableDates)
      .GreyWhen(IsLast)
      .Width(121);
  table->Button("", "", [this](Item& period) { AskEnd(period); })
      .Icon("target")
      .ToolTip("Select point in the plot")
      .EnabledWhen(
          [&n = Node()](Item& period) { return n.StressPeriodRadio > CStressPeriodsKvf::kNoPlots && !IsLast(period); })
      .Width(28);
  return table;
}

void CStressPeriodsDlg::MoveEnd(Item& period, const CYbDateTime& date) const {
  period.SetEndDate(date);
  UpdateDoc(kDataChanged, "Change End Date");
}

void CStressPeriodsDlg::AskEnd(Item& period) {
  CStressPeriodsKvf& n = Node();
  question_.AskDate(fmt::format("Click the end of stress period {}.", n.GetNumberWhatIs(&period)),
                    [this, &n, serial = period.Serial()](const CYbDateTime& date) {
                      // It may have been deleted meanwhile.
                      for (int number = 1; number <= n.GetItemCount(); ++number)
                        if (Item& asked = *n.GetItem(number); asked.Serial() == serial) return MoveEnd(asked, date);
                    });
}

SeriesContent CStressPeriodsDlg::Chart() const {
  CStressPeriodsKvf& n = Node();
  SeriesContent chart =
      DrivingSeriesChart(n, n.StressPeriodRadio == CStressPeriodsKvf::kPlotForEachType, Context().displayUnits);
  chart.markers.reserve(static_cast<std::size_t>(n.GetItemCount()));
  for (int number = 1; number <= n.GetItemCount(); ++number) {
    Item& period = *n.GetItem(number);
    DateMarker& marker = chart.markers.emplace_back();
    marker.name = std::to_string(number);
    marker.time = period.EndDate();
    marker.standsOut = table_->Current() == &period;
    if (number < n.GetItemCount()) marker.moved = [this, &period](const CYbDateTime& date) { MoveEnd(period, date); };
  }
  question_.PutOn(chart);
  return chart;
}

// ---- How an engine steps through them

/// A number of time steps is whole; a fraction that a file brought stays until it is edited.
std::string EnterTimeSteps(Item& period, double count) {
  if (count != std::floor(count) || count < 0) return "a whole number was expected";
  period.NSTP = count;
  return {};
}

double LengthOf(const Item& period) {
  const auto& list = *static_cast<const CStressPeriodsKvf*>(period.GetParent());
  return list.LengthOf(list.GetNumberWhatIs(&period)).InDays();
}

/// The columns of all three engines, of which each has some.
std::shared_ptr<TableForm> PropertiesGrid(CStressPeriodsKvf& periods) {
  auto table = std::make_shared<TableOf<Item>>(periods);
  table->KeepRows();
  table->OfferToAllRows("Apply to All Periods");
  const auto with = [&periods](std::vector<int> engines) {
    return [&periods, engines = std::move(engines)] {
      return std::ranges::find(engines, EngineOf(periods)) != engines.end();
    };
  };
  const auto isSurfact = with({kEngineModflowSurfact});
  const auto isOriginal = with({kEngineModflow96, kEngineModflow2000});
  table->Value("End Date", [](Item& period) { return period.EndDate(); })
      .Format(kTableDates)
      .GreyWhen([](Item&) { return true; })
      .Width(115);
  table
      ->Value(
          "Steady state time step", [](Item& period) { return period.SSTR != 0; },
          [](Item& period, bool isSteady) { period.SSTR = isSteady; })
      .Key("SSTR")
      .ShownWhen(with({kEngineModflow2000}))
      .Width(80);
  table->Value("First time step size", &Item::DELT).ShownWhen(isSurfact).Width(70);
  table->Value("Min step size", &Item::TMIN).ShownWhen(isSurfact).Width(70);
  table->Value("Max step size", &Item::TMAX).ShownWhen(isSurfact).Width(70);
  table
      ->Value(
          "Number of time steps", [](Item& period) { return period.NSTP; }, EnterTimeSteps)
      .Key("NSTP")
      .ShownWhen(isOriginal)
      .Width(70);
  table->Value("Time step multiplier", &Item::TSMULT).Width(70);
  table->Value("Reduction factor", &Item::TSDIV).ShownWhen(isSurfact).Width(70);
  // What follows from these.
  const auto isGrey = [](Item&) { return true; };
  table->Value("Length", LengthOf).Unit("days").Format("%.6g").GreyWhen(isGrey).Width(75);
  table->Value("First time step", [](Item& period) { return TimeStepsOf(LengthOf(period), period).first; })
      .Unit("days")
      .Format("%.4g")
      .GreyWhen(isGrey)
      .ShownWhen(isOriginal)
      .Width(75);
  table->Value("Last time step", [](Item& period) { return TimeStepsOf(LengthOf(period), period).last; })
      .Unit("days")
      .Format("%.4g")
      .GreyWhen(isGrey)
      .ShownWhen(isOriginal)
      .Width(75);
  return table;
}

/// "31 days in 4 periods with 40 time steps"
std::string TotalText(const CStressPeriodsKvf& periods) {
  double days = 0, steps = 0;
  for (int number = 1; number <= periods.GetItemCount(); ++number) {
    days += periods.LengthOf(number).InDays();
    steps += periods.GetItem(number)->NSTP;
  }
  std::string text = fmt::format("{} days in {} {}", FormatNumber(days, "%.8g"), periods.GetItemCount(),
                                 periods.GetItemCount() == 1 ? "period" : "periods");
  if (EngineOf(periods) != kEngineModflowSurfact)
    text += fmt::format(" with {} time steps", FormatNumber(steps, "%.8g"));
  return text;
}

void DescribeProperties(PageForm& form, CStressPeriodsPropListKvf& n) {
  auto& periods = static_cast<CStressPeriodsKvf&>(*n.GetParent());
  form.Shown("Simulation start date:", [&periods] { return periods.GetDateText(0); });
  form.Table(PropertiesGrid(periods));
  form.Shown("Total:", [&periods] { return TotalText(periods); });
}

}  // namespace

std::span<const PageRow> StressPeriodPages() {
  static constexpr PageRow kRows[] = {
      PageIs<CStressPeriodsDlg, CStressPeriodsKvf>(kStressPeriodsPage),
      DescribedBy<DescribeProperties>(kStressPeriodPropertiesPage),
  };
  return kRows;
}

}  // namespace tervane
