// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/setup_accessor.h"

#include <gmock/gmock.h>

#include "document/setup_lock.h"
#include "simspec/periods.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::setup_accessor_test {
namespace {

using testing::HasSubstr;

TEST(SetupAccessor, ChangesTimesAndStepsOfAFile) {
  const test::TempFolder folder;
  CTVNKvfAccessor setup;
  ASSERT_EQ(setup.OpenFile(folder.Write("a.tvd", test::SetupText(14, ""))), 1) << setup.Error();
  double start = 0, end = 0, rate = 0, rain = 0, infiltration = 0, threshold = 0;
  float initial = 0, overland = 0, unsaturated = 0, saturated = 0;
  EXPECT_EQ(setup.GetSimPeriod(start, end), 1);
  EXPECT_EQ(start, 36526);
  EXPECT_EQ(setup.SetSimPeriod(40000.5, 40010), 1);
  EXPECT_EQ(setup.SetSimPeriod(std::nan(""), 40010), 0);
  EXPECT_EQ(setup.SetTimeStepInfo(1, 2, 3, 4), 1);
  EXPECT_EQ(setup.SetTSIncrementRate(0.25), 1);
  EXPECT_EQ(setup.SetPrecipitationDependentTS(7, 8, 9), 1);
  EXPECT_EQ(setup.SaveFile(folder.File("b.tvd")), 1);
  EXPECT_EQ(setup.Error(), "");

  CTVNKvfAccessor again;
  ASSERT_EQ(again.OpenFile(folder.File("b.tvd")), 1);
  again.GetSimPeriod(start, end);
  EXPECT_EQ(start, 40000.5);
  EXPECT_EQ(end, 40010);
  again.GetTimeStepInfo(initial, overland, unsaturated, saturated);
  EXPECT_EQ(std::tuple(initial, overland, unsaturated, saturated), std::tuple(1.0F, 2.0F, 3.0F, 4.0F));
  again.GetTSIncrementRate(rate);
  again.GetPrecipitationDependentTS(rain, infiltration, threshold);
  EXPECT_EQ(std::tuple(rate, rain, infiltration, threshold), std::tuple(0.25, 7.0, 8.0, 9.0));
}

TEST(SetupAccessor, GridFilesAnswerWhereTheyAreTheSource) {
  const test::TempFolder folder;
  CTVNKvfAccessor setup;
  ASSERT_EQ(setup.OpenFile(folder.Write("a.tvd", test::SetupText(14, ""))), 1);
  using Setup = CTVNKvfAccessor;
  const struct {
    const char* owner;
    const char* section;  ///< Of the quantity below its owner; empty for the owner itself.
    int (Setup::*get)(std::string&, int&) const;
    int (Setup::*set)(const std::string&);
  } cases[] = {
      {"Overland", "DetentionStorage", &Setup::GetDetentionStorageNds2, &Setup::SetDetentionStorageNds2},
      {"Overland", "Manning", &Setup::GetManningNumNds2, &Setup::SetManningNumNds2},
      {"Overland", "LeakageCoeff", &Setup::GetOLLeakageCoeffNds2, &Setup::SetOLLeakageCoeffNds2},
      {"DRRUNOFFCOEFFICIENT", "", &Setup::GetPavedRunoffCoeffNds2, &Setup::SetPavedRunoffCoeffNds2},
  };
  for (const auto& row : cases) {
    CData2DKvf* quantity = *row.section ? setup.GetNds2Kvf(row.owner, row.section)
                                        : dynamic_cast<CData2DKvf*>(setup.Root().GetImportantNode(row.owner));
    ASSERT_TRUE(quantity) << row.owner;
    std::string file;
    int item = 0;
    quantity->Type = CData2DKvf::kUniform;
    EXPECT_EQ((setup.*row.set)(folder.File("grid.nds2")), 1);
    EXPECT_EQ((setup.*row.get)(file, item), 0) << row.section;
    quantity->Type = CData2DKvf::kGridFile;
    quantity->GridFile().Items = {4};
    EXPECT_EQ((setup.*row.get)(file, item), 1);
    EXPECT_EQ(file, folder.File("grid.nds2"));
    EXPECT_EQ(item, 4);
    EXPECT_EQ((setup.*row.set)(folder.File("other.nds2")), 1);
    (setup.*row.get)(file, item);
    EXPECT_EQ(item, 1);
  }
  std::string file;
  int item = 0;
  EXPECT_EQ(setup.SetUZSoilDistributionNds2(folder.File("soils.nds2")), 1);
  EXPECT_EQ(setup.GetUZSoilDistributionNds2(file, item), 1);  // grid codes are its source in a new setup
  EXPECT_EQ(file, folder.File("soils.nds2"));
  EXPECT_EQ(setup.GetNds2Kvf("Overland", "None"), nullptr);
  EXPECT_EQ(setup.GetNds2Kvf("None", "Manning"), nullptr);
}

TEST(SetupAccessor, TellsWhatCannotBeReadOrWrittenAndLosesNothing) {
  const test::TempFolder folder;
  const std::string bad = folder.Write("bad.tvd", "target TERVANE_FLOWMODEL {\n  a = \n");
  test::ScriptedHost host;
  host.Expect("bad.tvd", Host::Answer::Ok);
  CTVNKvfAccessor setup(&host);
  EXPECT_EQ(setup.OpenFile(bad), 0);
  EXPECT_THAT(setup.Error(), HasSubstr("bad.tvd"));
  double start = 0, end = 0;
  EXPECT_EQ(setup.GetSimPeriod(start, end), 1);  // of a new setup

  // A setup that somebody edits is left alone.
  const std::string held = folder.Write("held.tvd", test::SetupText(14, ""));
  SetupLock lock;
  ASSERT_EQ(lock.Take(held), SetupLock::Outcome::Taken);
  host.Expect("held.tvd", Host::Answer::Ok);
  EXPECT_EQ(setup.SaveFile(held), 1);
  EXPECT_THAT(setup.Error(), HasSubstr("open"));
  EXPECT_EQ(test::ReadFile(held), test::SetupText(14, ""));

  // So is one that another program has written since.
  const std::string shared = folder.Write("shared.tvd", test::SetupText(14, ""));
  ASSERT_EQ(setup.OpenFile(shared), 1);
  setup.SaveFile(shared);
  EXPECT_EQ(setup.Error(), "");
  const std::string theirs = test::SetupText(14, "section SimSpec {\nModelType = 1\n}");
  folder.Write("shared.tvd", theirs);
  host.Expect("another program has changed it", Host::Answer::Ok);
  setup.SaveFile(shared);
  EXPECT_EQ(test::ReadFile(shared), theirs);

  // The tree of somebody else is written as it is.
  CFlowModelDoc other;
  other.Root().Important(kSimulationPeriod)->SIMEND = {2031, 1, 1};
  setup.HookKvf(&other.Global());
  EXPECT_EQ(setup.SaveFile(folder.File("other.tvd")), 1);
  EXPECT_EQ(setup.Error(), "");
  EXPECT_THAT(test::ReadFile(folder.File("other.tvd")), HasSubstr("SIMEND = 2031, 1, 1"));
}

}  // namespace
}  // namespace tervane::setup_accessor_test
