// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/setup_merge.h"

#include <gmock/gmock.h>

#include "tests/support/setup.h"

namespace tervane::setup_merge_test {
namespace {

using test::SetupText;
using test::ValueOf;

const SetupDifference* Find(const std::vector<SetupDifference>& differences, std::string_view path,
                            std::string_view key) {
  for (const SetupDifference& difference : differences)
    if (difference.path == path && difference.key == key) return &difference;
  return nullptr;
}

TEST(SetupMerge, AValueIsTakenAndAllElseStays) {
  CFlowModelDoc mine, theirs;
  ASSERT_TRUE(mine.OpenText(
      SetupText(14, "section SimSpec {\nsection SimTitle {\nTitle = \"mine\"\nDescription = \"kept\"\n}\n}"),
      "/a/mine.tvd"));
  ASSERT_TRUE(theirs.OpenText(
      SetupText(14,
                "section SimSpec {\nsection SimTitle {\nTitle = \"theirs\"\n}\n}\n"
                "section Catchment {\nnxShp = 7\nsection NDS_2D_DATA_FILE {\nFILE_NAME = file \"grids/d.nds2\"\n}\n}"),
      "/b/theirs.tvd"));
  const std::vector<SetupDifference> differences = DifferencesBetween(mine, theirs);
  const struct {
    const char *path, *key, *value;
  } taken[] = {
      {"SimSpec/SimTitle", "Title", "theirs"},
      {"Catchment", "nxShp", "7"},
      {"Catchment/NDS_2D_DATA_FILE", "FILE_NAME", "../b/grids/d.nds2"},  // the same file from the other folder
  };
  for (const auto& c : taken) {
    SCOPED_TRACE(c.key);
    const SetupDifference* difference = Find(differences, c.path, c.key);
    ASSERT_TRUE(difference);
    std::string problem;
    EXPECT_TRUE(TakeValue(mine, theirs, *difference, problem)) << problem;
    EXPECT_EQ(ValueOf(mine, std::string(c.path) + ":" + c.key), c.value);
    // Taken once, it is no difference any more.
    EXPECT_FALSE(TakeValue(mine, theirs, *difference, problem));
    EXPECT_EQ(problem, "the setups are others than when they were compared");
  }
  EXPECT_EQ(ValueOf(mine, "SimSpec/SimTitle:Description"), "kept");
  EXPECT_FALSE(Find(DifferencesBetween(mine, theirs), "SimSpec/SimTitle", "Title"));
}

TEST(SetupMerge, AnItemIsAddedOrRemovedAsTheOtherSetupHasIt) {
  const std::string zones =
      "section Subcatchments {\nDistributionType = 1\nNO_ZONES = 2\n"
      "section Subcatchment {\nName = \"upper\"\nGRIDCODEID = \"1\"\nsection RIVERLINKS {\nNO_LINKS = 1\n}\n}\n"
      "section Subcatchment {\nName = \"lower\"\nGRIDCODEID = \"2\"\nDefaultRiverLinks = 0\n}\n}";
  const std::string parameters =
      "section ExtraParams {\nNoOfParams = 2\nsection ExtraParam_1 {\nName = \"a\"\nType = 1\n}\n"
      "section ExtraParam_2 {\nName = \"b\"\nType = 2\n}\n}";
  CFlowModelDoc empty, full;
  ASSERT_TRUE(empty.OpenText(SetupText(14, "section Subcatchments {\nDistributionType = 1\nNO_ZONES = 0\n}"), "a.tvd"));
  ASSERT_TRUE(full.OpenText(SetupText(14, zones + parameters), "b.tvd"));
  const std::string before = test::SavedText(empty);
  const auto takeAll = [](CFlowModelDoc& mine, const CFlowModelDoc& theirs) {
    int taken = 0;
    for (bool again = true; again;) {
      again = false;
      for (const SetupDifference& difference : DifferencesBetween(mine, theirs)) {
        std::string problem;
        if (!IsOfItem(difference) || !TakeItem(mine, theirs, difference, problem)) continue;
        again = ++taken < 20;
        break;
      }
    }
    return taken;
  };
  CFlowModelDoc other;
  ASSERT_TRUE(other.OpenText(before, "a.tvd"));
  EXPECT_EQ(takeAll(other, full), 4);
  EXPECT_THAT(DifferencesBetween(other, full), testing::IsEmpty());
  EXPECT_EQ(takeAll(other, empty), 4);
  EXPECT_EQ(test::SavedText(other), before);
}

TEST(SetupMerge, WhatIsNoValueOfBothIsNotTaken) {
  CFlowModelDoc mine, theirs;
  ASSERT_TRUE(mine.OpenText(SetupText(14, ""), "a.tvd"));
  ASSERT_TRUE(theirs.OpenText(
      SetupText(14, "section ExtraParams {\nNoOfParams = 1\nsection ExtraParam_1 {\nName = \"x\"\nType = 1\n}\n}"),
      "b.tvd"));
  const std::string before = test::SavedText(mine);
  std::vector<SetupDifference> differences = DifferencesBetween(mine, theirs);
  ASSERT_FALSE(differences.empty());
  for (const SetupDifference& difference : differences) {
    std::string problem;
    EXPECT_FALSE(TakeValue(mine, theirs, difference, problem)) << difference.path << ":" << difference.key;
    EXPECT_NE(problem, "");
  }
  EXPECT_EQ(test::SavedText(mine), before);
}

}  // namespace
}  // namespace tervane::setup_merge_test
