// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/detailed_series.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "results/storing.h"
#include "simspec/model_components.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::detailed_series_test {
namespace {

using test::TempFolder;
using test::TestSetup;
using testing::HasSubstr;
using testing::StartsWith;

struct Lists {
  TestSetup setup;
  CStoringResultsKvf& storing = setup.At<CStoringResultsKvf>("StoringOfResults");
  CDetailedTSOutputListKvf& points = storing.DetailedSeries();
  CDetailedFvrTSOutputListKvf& rivers = storing.DetailedRiverSeries();
};

TEST(DetailedSeries, AnImportTakesLinesUntilOneIsWrong) {
  struct Case {
    const char* what;
    std::string text;
    int result, added;
    const char* message;  ///< A part of it.
  };
  const std::string good = "P1\t61\t1\t100.5\t200\t2.5\t1\tobs/p1\t3\n";
  const Case cases[] = {
      {"nothing", "", 1, 0, ""},
      {"one line", good, 1, 1, ""},
      {"without an end of line", good.substr(0, good.size() - 1), 1, 1, ""},
      {"ends of another system", "P1\t61\t1\t1\t2\t3\t0\tf\t1\r\nP2\t61\t0\t1\t2\t3\t0\tf\t1\r\n", 1, 2, ""},
      {"further fields", "P1\t61\t1\t1\t2\t3\t0\tf\t1\tmore\tand more\n", 1, 1, ""},
      {"too short", good + "P2\t61\t1\t1\t2\t3\t0\tf\n" + good, 0, 1, "line 2: 8 columns"},
      {"an empty field", "P2\t\t1\t1\t2\t3\t0\tf\t1\n", 0, 0, "line 1: 8 columns"},
      {"an empty line", good + "\n" + good, 0, 1, "line 2: 0 columns"},
      {"no number", good + "P2\tdepth\t1\t1\t2\t3\t0\tf\t1\n", 0, 1, "line 2: depth is no number: HydrComp"},
      {"half a number", "P2\t61\t1\t1,5\t2\t3\t0\tf\t1\n", 0, 0, "1,5 is no number: X"},
      {"a number that is too large", "P2\t99999999999\t1\t1\t2\t3\t0\tf\t1\n", 0, 0, "HydrComp"},
      {"no item", "P2\t61\t1\t1\t2\t3\t0\tf\tfirst\n", 0, 0, "the item of the file"},
      {"another text", std::string("\xFF\xFEP\0002\t\0", 8), 0, 0, "save it as UTF-8"},
  };
  for (const Case& one : cases) {
    TempFolder folder;
    Lists lists;
    lists.points.AddItem()->Name = "before";
    const DetailedImport done = lists.points.ImportFile(folder.Write("points.txt", one.text), "/setups");
    EXPECT_EQ(done.result, one.result) << one.what;
    EXPECT_EQ(done.added, one.added) << one.what;
    EXPECT_EQ(lists.points.GetItemCount(), 1 + one.added) << one.what;
    EXPECT_THAT(done.message, HasSubstr(one.message)) << one.what;
    const bool hasFormat = done.message.starts_with(
        "Import file must be a tab delimited text file with 9 columns:\nName<TAB>Datatypenumber<TAB>Group<TAB>");
    EXPECT_EQ(hasFormat, one.result == 0) << one.what;
  }
  TempFolder folder;
  Lists latin;
  const DetailedImport noUtf8 =
      latin.points.ImportFile(folder.Write("latin.txt", "M\xFChle\t61\t1\t1\t2\t3\t0\tp\t1\n"), "/setups");
  EXPECT_EQ(noUtf8.added, 0) << "a setup could not be saved with its name";
  EXPECT_THAT(noUtf8.message, HasSubstr("line 1: it is no text in UTF-8"));
  Lists lists;
  const DetailedImport missing = lists.points.ImportFile("/no/such.txt", "/setups");
  EXPECT_EQ(missing.result, 0);
  EXPECT_THAT(missing.message, HasSubstr("/no/such.txt"));
}

TEST(DetailedSeries, AnImportedPointHasTheFieldsOfItsLine) {
  TempFolder folder;
  Lists lists;
  ASSERT_EQ(lists.points
                .ImportFile(folder.Write("a.txt",
                                         "\xEF\xBB\xBFP1\t61\t0\t100.5\t200\t2.5\t1\tobs/p1\t3\n"
                                         "P2\t61\t1\t1\t2\t3\t2\tp2\t1\n"),
                            "/setups")
                .result,
            1);
  const CDetailedTSOutputItemKvf& first = *lists.points.GetItem(1);
  EXPECT_EQ(first.Name, "P1");
  EXPECT_EQ(first.HydrComp, 61);
  EXPECT_EQ(first.Group, 0);
  EXPECT_EQ(first.X, 100.5);
  EXPECT_EQ(first.Y, 200);
  EXPECT_EQ(first.Z, 2.5);
  EXPECT_EQ(first.InclObserved, 1);
  EXPECT_EQ(first.Observed().File.Text(), "obs/p1.nds0");
  EXPECT_EQ(first.Observed().File.Absolute(), "/setups/obs/p1.nds0");
  EXPECT_EQ(first.Observed().Items, std::vector{3});
  EXPECT_EQ(lists.points.GetItem(2)->InclObserved, 0) << "2 is not 1";

  ASSERT_EQ(lists.rivers.ImportFile(folder.Write("r.txt", "Mill\t1\tOdense\t1200.25\t1\tmill\t2\n"), "/setups").result,
            1);
  const CDetailedFvrTSOutputItemKvf& mill = *lists.rivers.GetItem(1);
  EXPECT_EQ(mill.DataType, CDetailedFvrTSOutputItemKvf::kDischarge);
  EXPECT_EQ(mill.BranchName, "Odense");
  EXPECT_EQ(mill.Chainage, 1200.25f);
  EXPECT_EQ(mill.Observed().Items, std::vector{2});
  EXPECT_THAT(lists.rivers.ImportFile(folder.Write("s.txt", "Mill\t1\n"), "/setups").message,
              StartsWith("Import file must be a tab delimited text file with 7 columns:\nName<TAB>"));
}

TEST(DetailedSeries, ThousandsOfPointsAreImportedAndCheckedAtOnce) {
  constexpr int kPoints = 10'000;
  std::string text;
  for (int number = 1; number <= kPoints; ++number)
    text += fmt::format("P{}\t61\t1\t{}\t200\t0\t0\tnone\t1\n", number, number);
  TempFolder folder;
  Lists lists;
  EXPECT_EQ(lists.points.ImportFile(folder.Write("many.txt", text), "/setups").added, kPoints);
  EXPECT_TRUE(lists.storing.Validate());
  EXPECT_EQ(lists.points.GetItem(kPoints)->X, kPoints);
}

TEST(DetailedSeries, APointNeedsATypeAndItsFileOnlyInUse) {
  Lists lists;
  CDetailedTSOutputItemKvf& point = *lists.points.AddItem();
  point.Observed().File = FileName("none.nds0", "/setups");
  EXPECT_FALSE(lists.storing.Validate());
  ASSERT_EQ(point.Findings().size(), 1u);
  EXPECT_EQ(point.Findings().front().text, "Select a hydraulic component i combobox");
  EXPECT_TRUE(point.Observed().Findings().empty());
  point.HydrComp = 61;
  EXPECT_TRUE(lists.storing.Validate());
  point.InclObserved = 1;
  EXPECT_FALSE(lists.storing.Validate());
  EXPECT_FALSE(point.Observed().Findings().empty());
}

TEST(DetailedSeries, OnlyLayeredTypesHaveADepthWhichIsKept) {
  Lists lists;
  CDetailedTSOutputItemKvf& point = *lists.points.AddItem();
  point.Z = 3;
  for (const auto& [type, hasDepth] : {std::pair(117, true), {61, false}, {0, false}, {999, false}}) {
    point.HydrComp = type;
    EXPECT_EQ(point.IsDepthActive(), hasDepth) << type;
    EXPECT_EQ(lists.setup.Written("StoringOfResults/DetailedTimeseriesOutput/Item_1:Z"), "3.0");
  }
}

TEST(DetailedSeries, TheFirstPointStartsAPlotWhenItIsSeen) {
  Lists lists;
  EXPECT_FALSE(lists.points.StartFirstPlot());
  lists.points.SetItemCount(2, 1);
  lists.points.GetItem(1)->Group = lists.points.GetItem(2)->Group = 0;
  EXPECT_EQ(lists.setup.Written("StoringOfResults/DetailedTimeseriesOutput/Item_1:Group"), "0");
  EXPECT_TRUE(lists.points.StartFirstPlot());
  EXPECT_FALSE(lists.points.StartFirstPlot());
  EXPECT_EQ(lists.points.GetItem(1)->Group, 1);
  EXPECT_EQ(lists.points.GetItem(2)->Group, 0);
}

}  // namespace
}  // namespace tervane::detailed_series_test
