// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Setups with very many stress periods, and with a span of grids for each of them: made, shown, checked and saved.
#include <memory>
#include <string>
#include <vector>

#include <fmt/format.h>

#include "bench/median_table.h"
#include "document/edit_session.h"
#include "forms/page.h"
#include "pages/page_table.h"
#include "simspec/basic_parameters.h"
#include "simspec/pages.h"
#include "simspec/periods.h"
#include "simspec/stress_periods.h"
#include "surface/climate.h"
#include "surface/pages.h"
#include "surface/stress_period_grids.h"

namespace tervane::bench {

namespace {

constexpr int kFew = 1000, kMany = 10'000;

/// Every cell of the table of a page, as it is shown.
std::size_t ShowTable(CYbSEDlgBase& page) {
  std::size_t shown = 0;
  page.Form().ForEach([&](Control& control) {
    if (!control.table) return;
    TableForm& table = *control.table;
    table.Follow();
    for (int row = 1; row <= table.RowCount(); ++row)
      for (int column = 1; column <= table.ColumnCount(); ++column) shown += table.ShownCell(row, column).size();
  });
  if (shown == 0) fmt::print("WRONG: the table shows nothing\n");
  return shown;
}

struct DividedSetup {
  std::string label;
  std::unique_ptr<EditSession> session = EditSession::New({});
  CFlowModelDoc& setup = session->Document();
  CStressPeriodsKvf& periods = *setup.Root().Important(kStressPeriods);
  CRechargeAndPondingModListKvf& spans = *setup.Root().Important(kClimate)->Child<CRechargeAndPondingModListKvf>();
  NobodyToAsk nobody;
  std::unique_ptr<CYbSEDlgBase> ends, properties, grids;

  DividedSetup(int count, MedianTable& table) : label(fmt::format("{} periods", count)) {
    setup.Root().Important(kBasicParameters)->ModelType = kEngineModflow2000;
    setup.Root().Important(kModflowComponents)->Recharge = 1;
    setup.Root().Important(kClimate)->RechargeOption = CPrecipitationRelatedKvf::kGivenLayer;
    setup.Root().Important(kSimulationPeriod)->SIMEND = CYbDateTime(2030, 1, 1);
    periods.MakeEqualPeriods(count, {});
    spans.SetItemCount(count, 1);
    for (int number = 1; number <= count; ++number) spans.GetItem(number)->StressPeriodTo = number;
    session->UpdateDoc(periods, 1, "Make Stress Periods");
    if (!periods.Valid() || !spans.Valid()) fmt::print("WRONG: the periods are not valid\n");
    const PageContext context{setup, nobody, {}};
    ends = MakePage(kStressPeriodsPage, periods, context);
    properties = MakePage(kStressPeriodPropertiesPage, *periods.Child<CStressPeriodsPropListKvf>(), context);
    grids = MakePage(kStressPeriodGridsPage, spans, context);

    table.Add("wizard, " + label, [this, count] {
      periods.MakeEqualPeriods(count, {});
      return periods.GetItemCount();
    });
    table.Add("table of ends, " + label, [this] { return ShowTable(*ends); });
    table.Add("table of time steps, " + label, [this] { return ShowTable(*properties); });
    table.Add("markers, " + label, [this] { return periods.GetDateMarkers(); });
    table.Add("check periods, " + label, [this] { return periods.Validate(); });
    table.Add("check spans, " + label, [this] { return spans.ValidateData(); });
    table.Add("table of spans, " + label, [this] { return ShowTable(*grids); });
    table.Add("save periods, " + label, [this] {
      KvfFile file;
      kvfAddTarget(&file, "Periods");
      periods.Save(&file);
      return file.Cursor().firstChild != nullptr;
    });
  }
};

int Run(int argc, char** argv) {
  MedianTable table(11);
  const DividedSetup few(kFew, table), many(kMany, table);
  for (const char* what : {"wizard, ", "table of ends, ", "table of time steps, ", "markers, ", "check periods, ",
                           "check spans, ", "table of spans, ", "save periods, "}) {
    table.LimitTime(what + many.label, 50);
    // Ten times the size; the rest is for what no longer fits the processor's caches.
    table.Limit(what + many.label, what + few.label, 11);
  }
  table.Run(argc, argv);
  return 0;
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) { return tervane::bench::Run(argc, argv); }
