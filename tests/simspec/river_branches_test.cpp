// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/river_branches.h"

#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "surface/rivers.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::river_branches_test {
namespace {

using test::TempFolder;
using test::TestSetup;
using testing::ElementsAre;
using testing::IsEmpty;

constexpr const char* kNetwork =
    "target FLUVANE_Network_editor {\n  section POINTS {\n    Point = 1, 0, 0, 100\n    Point = 2, 900, 0, 1000\n  }\n"
    "  section BRANCHES {\n    section Branch_1 {\n      Name = \"Rhone\"\n      Points = 1, 2\n    }\n  }\n}\n";

TEST(RiverBranches, AreThoseOfTheFileThatTheEngineUses) {
  const TempFolder folder;
  const std::string network = folder.Write("net.fvnwk", kNetwork);
  const std::string simulation =
      folder.Write("run.fvsim", "target FvRun {\n  section input {\n    nwk = file \"net.fvnwk\"\n  }\n}\n");
  TestSetup setup;
  const auto names = [&] { return RiverBranches::Of(setup.Root()).Names(); };
  EXPECT_THAT(names(), IsEmpty());
  auto& own = setup.At<CRiverKvf>("River");
  own.SetRiverFile(FileName(simulation, ""));
  EXPECT_THAT(names(), ElementsAre("Rhone"));
  own.SetRiverFile(FileName(folder.File("missing.fvsim"), ""));
  EXPECT_THAT(names(), IsEmpty());
  setup.At<CBasicParaKvf>("SimSpec").ModelType = kEngineModflow96;
  setup.At<CRiverMFKvf>("RiverMF").SetFilename(FileName(network, ""));
  EXPECT_THAT(names(), ElementsAre("Rhone"));
}

TEST(RiverBranches, TellWhatIsOddAboutAReach) {
  const TempFolder folder;
  TestSetup setup;
  EXPECT_EQ(RiverBranches::Of(setup.Root()).WhyNoBranch("Rhone"), "");
  setup.At<CBasicParaKvf>("SimSpec").ModelType = kEngineModflow96;
  setup.At<CRiverMFKvf>("RiverMF").SetFilename(FileName(folder.Write("net.fvnwk", kNetwork), ""));
  const RiverBranches branches = RiverBranches::Of(setup.Root());
  const std::pair<const char*, const char*> names[] = {
      {"Rhone", ""},
      {"rhone", "the river network net.fvnwk has no branch rhone; Rhone is one"},
      {"Rhoen", "the river network net.fvnwk has no branch Rhoen; Rhone is one"},
      {"Danube", "the river network net.fvnwk has no branch Danube"},
      {"", "no branch of the river network is named"}};
  for (const auto& [name, expected] : names) EXPECT_EQ(branches.WhyNoBranch(name), expected);
  const std::pair<double, const char*> chainages[] = {
      {100, ""},
      {1000, ""},
      {99.5, "the chainage 99.5 m lies outside the branch Rhone, which goes from 100 to 1000 m"}};
  for (const auto& [chainage, expected] : chainages) EXPECT_EQ(branches.WhyOutside("Rhone", chainage), expected);
  EXPECT_EQ(branches.WhyOutside("Danube", -1), "");
}

}  // namespace
}  // namespace tervane::river_branches_test
