// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "engine/modflow_report.h"

#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "simspec/periods.h"
#include "surface/climate.h"
#include "tests/support/setup.h"

namespace tervane::modflow_report_test {
namespace {

using testing::HasSubstr;

struct Setup96 {
  Setup96() {
    document.Root().Important(kBasicParameters)->ModelType = kEngineModflow96;
    periods.MakeEqualPeriods(2, {.TSMULT = 3});
    periods.GetItem(1)->NSTP = 3;
  }
  CFlowModelDoc document;
  CStressPeriodsKvf& periods = *document.Root().Important(kStressPeriods);
  CBasicParaKvf& basics = *document.Root().Important(kBasicParameters);
};

TEST(ModflowReport, PeriodsTellTheirTimeSteps) {
  Setup96 setup;
  EXPECT_EQ(StressPeriodsText(setup.periods),
            "2 stress periods from 2000-01-01 00:00 on.\n"
            "1 to 2000-01-16 12:00: 15.5 days, 3 time steps of 1.192 to 10.73 days\n"
            "2 to 2000-02-01 00:00: 15.5 days, 1 time steps of 15.5 to 15.5 days\n");
  setup.basics.ModelType = kEngineModflow2000;
  setup.periods.GetItem(1)->SSTR = 1;
  EXPECT_THAT(StressPeriodsText(setup.periods), HasSubstr("1 to 2000-01-16 12:00: 15.5 days, steady state\n"));
  setup.basics.ModelType = kEngineModflowSurfact;
  EXPECT_THAT(StressPeriodsText(setup.periods), HasSubstr("15.5 days, steps from 1 days on\n"));
  setup.periods.MfSteadyState = 1;
  EXPECT_EQ(StressPeriodsText(setup.periods), "A steady-state simulation.");
}

TEST(ModflowReport, PackagesTellWhatTheyWrite) {
  Setup96 setup;
  auto& output = *setup.document.Root().Child<COutputModKvf>();
  output.OutputControlOption = COutputModKvf::kEveryNthTimeStep;
  output.Packages().GetItem(1)->ASCII = output.Packages().GetItem(1)->Binary = 1;
  output.Packages().GetItem(3)->ASCII = 1;
  // Without wells nothing of them is written.
  output.Packages().GetItem(8)->Binary = 1;
  EXPECT_EQ(PackagesText(output), "Output every 10 time steps.\nHEAD as text and binary\nBUDGET as text\n");
}

TEST(ModflowReport, SpansTellWhereTheirValuesComeFrom) {
  Setup96 setup;
  auto& spans = *setup.document.Root().Important(kClimate)->Child<CRechargeAndPondingModListKvf>();
  EXPECT_EQ(SpansText(spans), "No span of stress periods has values.");
  spans.SetItemCount(2, 1);
  spans.GetItem(1)->StressPeriodTo = 1;
  spans.GetItem(1)->FixedValue = 2;
  spans.GetItem(2)->Type = CData2DKvf::kGridFile;
  spans.GetItem(2)->GridFile().Choose(FileName("maps/layers.nds2", "/data"));
  EXPECT_EQ(SpansText(spans),
            "Stress periods 1 to 1, From 2000-01-01 00:00 to 2000-01-16 12:00: 2 everywhere\n"
            "Stress periods 2 to 2, From 2000-01-16 12:00 to 2000-02-01 00:00: layers.nds2\n");
}

}  // namespace
}  // namespace tervane::modflow_report_test
