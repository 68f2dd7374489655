// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/three_way_merge.h"

#include <gmock/gmock.h>

#include "core/kvf_writer.h"
#include "core/list.h"
#include "core/open_kvf.h"
#include "simspec/periods.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::three_way_merge_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

class Merge : public testing::Test {
 protected:
  /// Merges setups of these sections; what comes out, without the target and the version.
  std::string Of(const std::string& base, const std::string& mine, const std::string& theirs,
                 const MergeChoices& choices = {}) {
    const auto open = [this](const char* name, const std::string& sections) {
      return OpenKvf(kvfLoadFile(folder.Write(name, test::SetupText(14, sections)), 0));
    };
    const OpenKvf a = open("base.tvd", base), b = open("mine.tvd", mine), c = open("theirs.tvd", theirs);
    const OpenKvf merged(kvfCreate());
    result = MergeSetups(*a, *b, *c, *merged, choices);
    conflicts.clear();
    for (const MergeConflict& conflict : result.conflicts) conflicts.push_back(conflict.Sentence());
    std::string text;
    AppendKvfNodes(*AsSection(merged->top.firstChild), 0, text);
    return text.substr(text.find("section S "));
  }
  static std::string Section(const std::string& content) { return "section S {\n" + content + "}\n"; }
  /// A list with items of these names and values, "a1 b2".
  static std::string List(const std::string& items) {
    std::string text;
    int count = 0;
    for (std::size_t at = 0; at < items.size(); at += 3) {
      ++count;
      text += "  section Item_" + std::to_string(count) + " {\n    Name = \"" + items[at] +
              "\"\n    Value = " + items[at + 1] + "\n  }\n";
    }
    return Section("  YbSEKvfListItemCount = " + std::to_string(count) + "\n" + text);
  }

  test::TempFolder folder;
  MergeResult result;
  std::vector<std::string> conflicts;
};

TEST_F(Merge, KeysOfBothSidesComeTogether) {
  const struct {
    const char *base, *mine, *theirs, *merged;
    int conflicts;
  } cases[] = {
      {"  a = 1\n  b = 2\n", "  a = 3\n  b = 2\n", "  a = 1\n  b = 4\n", "  a = 3\n  b = 4\n", 0},
      {"  a = 1\n", "  a = 3\n", "  a = 3\n", "  a = 3\n", 0},
      {"  a = 1\n", "  a = 3\n", "  a = 4\n", "  a = 3\n", 1},
      {"  a = 1\n", "", "  a = 1\n", "", 0},
      {"  a = 1\n", "", "  a = 2\n", "", 1},
      {"", "  a = 1\n", "  b = \"unread\"\n", "  a = 1\n  b = \"unread\"\n", 0},
      {"  Touched = 0\n", "  Touched = 1\n", "  Touched = 0\n", "  Touched = 1\n", 0},
      // A key of several lines is one value.
      {"  s = 1\n  s = 2\n", "  s = 1\n  s = 2\n", "  s = 1\n  s = 2\n  s = 3\n", "  s = 1\n  s = 2\n  s = 3\n", 0},
      {"  s = 1\n", "  s = 1\n  s = 2\n", "  s = 0\n", "  s = 1\n  s = 2\n", 1},
  };
  for (const auto& row : cases) {
    EXPECT_EQ(Of(Section(row.base), Section(row.mine), Section(row.theirs)), Section(row.merged));
    EXPECT_EQ(result.conflicts.size(), static_cast<std::size_t>(row.conflicts)) << row.theirs;
  }
  Of(Section("  a = 1\n"), Section("  a = 3\n"), Section("  a = 4\n"));
  EXPECT_THAT(conflicts, ElementsAre("S:a: it was 1, mine is 3, theirs is 4; mine stays"));
}

TEST_F(Merge, ItemsAreFollowedByTheirNames) {
  const struct {
    const char *base, *mine, *theirs, *merged;
    std::vector<std::string> conflicts;
  } cases[] = {
      {"a1 b2", "a1 b2 c3", "d4 a1 b2", "d4 a1 b2 c3", {}},
      {"a1 b2", "a1 b2 c3", "a1 b2 c3", "a1 b2 c3", {}},
      {"a1 b2", "b2", "a1 b5", "b5", {}},
      {"a1 b2 c3", "c3 a1 b2", "a1 b7 c3", "c3 a1 b7", {}},
      {"a1 b2 c3", "a1 b8 c3", "c3 b2 a1", "c3 b8 a1", {}},
      {"a1 b2 c3", "a1 b2 c3 d4", "c3 b2 a1", "c3 d4 b2 a1", {}},
      // One side renames, the other changes the value.
      {"a1 b2", "a1 x2", "a1 b6", "a1 x6", {}},
      {"a1 b2", "a1", "a1 b9", "a1", {"S/Item_2: deleted by me, changed by them; it stays deleted"}},
      {"a1 b2", "a1 b9", "a1", "a1 b9", {"S/Item_2: deleted by them, changed by me; it stays"}},
      {"a1 b2 c3", "b2 a1 c3", "a1 c3 b2", "b2 a1 c3", {"S: both have moved its items Item_%d; my order stays"}},
      {"", "a1", "a2", "a1", {"S/Item_1:Value: it was nothing, mine is 1, theirs is 2; mine stays"}},
      {"a1", "", "", "", {}},
  };
  for (const auto& row : cases) {
    EXPECT_EQ(Of(List(row.base), List(row.mine), List(row.theirs)), List(row.merged))
        << row.mine << " | " << row.theirs;
    EXPECT_EQ(conflicts, row.conflicts) << row.mine << " | " << row.theirs;
  }
}

TEST_F(Merge, OfAConflictTheChosenSideIsTaken) {
  const struct {
    std::string base, mine, theirs, ofTheirs, ofBase;
    const char* told;
  } cases[] = {
      {Section("  a = 1\n"), Section("  a = 3\n"), Section("  a = 4\n"), Section("  a = 4\n"), Section("  a = 1\n"),
       "S:a: it was 1, mine is 3, theirs is 4; theirs is taken"},
      {Section("  a = 1\n"), Section(""), Section("  a = 4\n"), Section("  a = 4\n"), Section("  a = 1\n"),
       "S:a: it was 1, mine is nothing, theirs is 4; theirs is taken"},
      {List("a1 b2"), List("a1"), List("a1 b3"), List("a1 b3"), {}, "deleted by me, changed by them; it comes back"},
      {List("a1 b2"), List("a1 b3"), List("a1"), List("a1"), {}, "deleted by them, changed by me; it goes"},
      {List("a1 b2 c3"), List("b2 a1 c3"), List("c3 a1 b2"), List("c3 a1 b2"), {}, "their order stays"},
  };
  for (const auto& row : cases) {
    const std::string ofMine = Of(row.base, row.mine, row.theirs);
    ASSERT_EQ(result.conflicts.size(), 1U) << row.told;
    EXPECT_EQ(ofMine, row.mine) << row.told;
    const MergeConflict conflict = result.conflicts.front();
    EXPECT_EQ(Of(row.base, row.mine, row.theirs, {{conflict.Identity(), MergeSide::Theirs}}), row.ofTheirs);
    EXPECT_THAT(conflicts, ElementsAre(HasSubstr(row.told)));
    EXPECT_EQ(conflict.HasBase(), !row.ofBase.empty());
    if (conflict.HasBase()) {
      EXPECT_EQ(Of(row.base, row.mine, row.theirs, {{conflict.Identity(), MergeSide::Base}}), row.ofBase);
    }
  }
}

TEST_F(Merge, CountsInSectionsBesideTheirItemsFollow) {
  const auto stations = [](int count) {
    std::string text = "  section BASED {\n    NO_TIMESERIES = " + std::to_string(count) + "\n  }\n";
    for (int number = 1; number <= count; ++number)
      text += "  section TIME_" + std::to_string(number) + " {\n    NAME = \"station " + std::to_string(number) +
              "\"\n  }\n";
    return Section(text);
  };
  std::string theirs = stations(3);
  theirs.replace(theirs.find("station 3"), 9, "station 9");
  std::string expected = stations(4);
  expected.replace(expected.find("station 3"), 9, "station 9");
  expected.replace(expected.find("station 4"), 9, "station 3");
  const std::string merged = Of(stations(2), stations(3), theirs);
  EXPECT_THAT(merged, HasSubstr("NO_TIMESERIES = 4"));
  EXPECT_THAT(merged, HasSubstr("section TIME_4"));
  EXPECT_THAT(conflicts, IsEmpty());
}

TEST_F(Merge, WholeSetupsMergeAndOpenAgain) {
  CFlowModelDoc base, mine, theirs;
  const std::string paths[] = {folder.File("base.tvd"), folder.File("mine.tvd"), folder.File("theirs.tvd")};
  ASSERT_TRUE(base.OnSaveDocument(paths[0]));
  for (CFlowModelDoc* side : {&mine, &theirs}) {
    auto& species = *dynamic_cast<CYbSEKvfListBaseInterface*>(side->Root().GetImportantNode("SPECIES_LIST"));
    species.AddItemNode();
  }
  mine.Root().Important(kSimulationPeriod)->SIMEND = {2011, 1, 1};
  ASSERT_TRUE(mine.OnSaveDocument(paths[1]));
  ASSERT_TRUE(theirs.OnSaveDocument(paths[2]));
  const OpenKvf a(kvfLoadFile(paths[0], 0)), b(kvfLoadFile(paths[1], 0)), c(kvfLoadFile(paths[2], 0));
  const OpenKvf merged(kvfCreate());
  EXPECT_THAT(MergeSetups(*a, *b, *c, *merged).conflicts, IsEmpty());
  std::string text, error, mineText;
  ASSERT_TRUE(WriteKvfText(*merged, text, error)) << error;
  ASSERT_TRUE(WriteKvfText(*b, mineText, error));
  EXPECT_EQ(text, mineText);
}

TEST_F(Merge, OtherVersionsAreRefused) {
  const OpenKvf old(kvfLoadFile(folder.Write("old.tvd", test::SetupText(10, "")), 0)),
      now(kvfLoadFile(folder.Write("now.tvd", test::SetupText(14, "")), 0)), merged(kvfCreate());
  EXPECT_THAT(MergeSetups(*old, *now, *now, *merged).problem, HasSubstr("(10, 14 and 14): bring them to one with"));
}

}  // namespace
}  // namespace tervane::three_way_merge_test
