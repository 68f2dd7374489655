// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/irrigation_pages.h"

#include <gmock/gmock.h>

#include "data/series_file.h"
#include "forms/plots.h"
#include "platform/item_types.h"
#include "simspec/model_components.h"
#include "surface/irrigation.h"
#include "surface/rivers.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::irrigation_pages_test {
namespace {

using testing::HasSubstr;
using Source = CIrrCommandAreasPropSourceItemKvf;

constexpr const char* kAreas = R"(section LandUse {
  Irrigation = 1
  section CommandAreas {
    NO_AREAS = 1
    section NDS_2D_DATA_FILE {
      FILE_NAME = file "areas.nds2"
      ITEM_COUNT = 1
      ITEM_NUMBERS = 1
    }
    section CommandArea {
      AreaName = "Farms"
      AreaCodeID = "1"
      section Sources {
        NumberOfSources = 2
        section Source2 {
          SourceTypeCode = 2
        }
      }
    }
  }
  section Demands {
    NO_DEMANDS = 1
    section Demand {
    }
  }
})";

class IrrigationPages : public testing::Test {
 protected:
  IrrigationPages() {
    test::WriteGrid(folder.File("areas.nds2"), {2, 2, 100, 0, 0, 0, {}}, {1, 1, 2, 2}, quantity::kCode);
    EXPECT_TRUE(document.OpenText(test::SetupText(14, kAreas), folder.File("a.tvd")));
  }
  /// The first control of a kind.
  static Control& First(test::PageDriver& page, ControlKind kind) {
    Control* first = nullptr;
    page.Page().Form().ForEach([&](Control& control) {
      if (!first && control.kind == kind) first = &control;
    });
    return *first;
  }
  static TableForm& Sources(test::PageDriver& page) { return *First(page, ControlKind::Table).table; }
  /// The shown groups of fields, as the current source decides.
  static std::string ShownGroups(test::PageDriver& page) {
    std::string shown;
    for (const char* group : {"River source", "Single well source", "Shallow well source", "External source"})
      if (page.Find(group).IsShown()) shown += group;
    return shown;
  }

  test::TempFolder folder;
  CFlowModelDoc document;
};

TEST_F(IrrigationPages, TheCurrentSourceDecidesWhichFieldsAreShown) {
  test::PageDriver page(document, "LandUse/CommandAreas/CommandArea");
  TableForm& table = Sources(page);
  EXPECT_EQ(ShownGroups(page), "River source");
  table.Choose(2);
  EXPECT_EQ(ShownGroups(page), "Single well source");
  for (const auto& [type, group] : {std::pair{"3", "Shallow well source"}, {"4", "External source"}}) {
    EXPECT_EQ(table.Enter(2, 1, type), "");
    EXPECT_EQ(ShownGroups(page), group);
  }
  table.ChangeRows(RowAction::Insert, 1, 1);
  EXPECT_EQ(ShownGroups(page), "External source");
  table.Choose(1);
  EXPECT_EQ(ShownGroups(page), "River source");
  while (table.RowCount() > 0) table.ChangeRows(RowAction::Delete, 1, 1);
  EXPECT_EQ(ShownGroups(page), "");
}

TEST_F(IrrigationPages, ThresholdsAreTypedWhereTheyAreUsed) {
  test::PageDriver page(document, "LandUse/CommandAreas/CommandArea");
  auto& source = *dynamic_cast<CIrrCommandAreasPropKvf&>(
                      *FindNode(document.Root(), ParseSetupPath("LandUse/CommandAreas/CommandArea").steps))
                      .Sources()
                      .GetItem(1);
  const auto enabled = [&] {
    std::string text;
    page.Page().Form().ForEach([&](const Control& control) {
      if (control.label == "Stop" || control.label == "Restart") text += control.IsEnabled() ? '1' : '0';
    });
    return text;
  };
  EXPECT_EQ(enabled(), "1100");
  page.Enter("Use threshold river stage", "1");
  page.Enter("Use threshold river discharge", "0");
  EXPECT_EQ(enabled(), "0011");
  EXPECT_EQ(source.UseThresholdStageRS, 1);
}

TEST_F(IrrigationPages, AWellIsPlacedByAClickOnTheMap) {
  test::PageDriver page(document, "LandUse/CommandAreas/CommandArea");
  Sources(page).Choose(2);
  const Control& map = First(page, ControlKind::Map);
  ASSERT_TRUE(map.IsShown());
  page.Find("Pick Well on Map").press();
  const MapContent asking = Finished(map.map);
  ASSERT_TRUE(asking.request);
  asking.request->taken({{150, 25}});
  EXPECT_EQ(test::ValueOf(document, "LandUse/CommandAreas/CommandArea/Sources/Source2:WellXposSIWS"), "150");
  EXPECT_EQ(test::ValueOf(document, "LandUse/CommandAreas/CommandArea/Sources/Source2:WellYposSIWS"), "25");
  const MapContent shown = Finished(map.map);
  EXPECT_FALSE(shown.request);
  ASSERT_EQ(shown.points.size(), 1U);
  EXPECT_EQ(shown.points[0].labels[0], "Source 2");
}

TEST_F(IrrigationPages, AReachIsDrawnAndTakenFromTheMap) {
  folder.Write("net.fvnwk",
               "target FLUVANE_Network_editor {\n  section POINTS {\n    Point = 1, 0, 0, 100\n    Point = 2, 200, 0, "
               "300\n  }\n  section BRANCHES {\n    section Branch_1 {\n      Name = \"Rhone\"\n      Points = 1, 2\n"
               "    }\n  }\n}\n");
  const std::string run =
      folder.Write("run.fvsim", "target FvRun {\n  section input {\n    nwk = file \"net.fvnwk\"\n  }\n}\n");
  test::PageDriver page(document, "LandUse/CommandAreas/CommandArea");
  EXPECT_FALSE(page.IsEnabled("Pick Reach on Map"));
  document.Root().Important(kModelComponents)->River = 1;
  dynamic_cast<CRiverKvf&>(*FindNode(document.Root(), ParseSetupPath("River").steps)).SetRiverFile(FileName(run, ""));
  EXPECT_TRUE(page.IsEnabled("Pick Reach on Map"));
  EXPECT_THAT(page.Find("River Name:").offers(), testing::ElementsAre("Rhone"));

  // What the network lacks is told, and is no error.
  auto& source = dynamic_cast<Source&>(
      *FindNode(document.Root(), ParseSetupPath("LandUse/CommandAreas/CommandArea/Sources/Source1").steps));
  const auto finding = [&] {
    EXPECT_TRUE(source.Validate());
    return source.Findings().empty() ? std::string() : source.Findings().back().text + source.Findings().back().key;
  };
  EXPECT_EQ(finding(), "The river source leads to no branchRiverNameRS");
  source.RiverNameRS = "Rhone";
  source.UpstreamChainageRS = 120;
  source.DownstreamChainageRS = 900;
  EXPECT_EQ(finding(), "The river source leaves its branchDownstreamChainageRS");

  const Control& map = First(page, ControlKind::Map);
  page.Find("Pick Reach on Map").press();
  MapContent shown = Finished(map.map);
  ASSERT_TRUE(shown.request);
  shown.request->taken({{20, 10}, {70, 40}, {150, -5}});
  EXPECT_EQ(source.UpstreamChainageRS, 120);
  EXPECT_EQ(source.DownstreamChainageRS, 250);
  EXPECT_EQ(finding(), "");
  shown = Finished(map.map);
  ASSERT_EQ(shown.lines.size(), 2U);  // the network, and the reach above it
  EXPECT_EQ(shown.lines[1].lines->front().points, (std::vector<MapPoint>{{20, 0}, {150, 0}}));
  EXPECT_EQ(Finished(map.map).lines[1].lines, shown.lines[1].lines);  // so that a view knows that it is the same
}

TEST_F(IrrigationPages, ALicenseIsChosenForTheCurrentSourceAlone) {
  const std::string series = folder.File("license.nds0");
  NewSeries license;
  license.name = "License";
  license.itemType = quantity::kWaterVolume;
  license.times = {CYbDateTime(2000, 1, 1), CYbDateTime(2000, 1, 2)};
  license.values = {1, 2};
  ASSERT_EQ(WriteSeriesFile(series, license).error, "");
  test::PageDriver page(document, "LandUse/CommandAreas/CommandArea");
  Control& file = page.Find("Time Series File:");
  EXPECT_FALSE(file.IsEnabled());
  Sources(page).Choose(2);
  page.Enter("Include License Limited Irrigation", "1");
  EXPECT_TRUE(file.IsEnabled());
  page.Outside().Expect("", std::optional<std::string>(series));
  page.Outside().Expect("Choose an item", std::optional<int>(0));
  page.Page().Browse(file);
  EXPECT_EQ(file.Text(), "license.nds0");
  const std::string sources = "LandUse/CommandAreas/CommandArea/Sources/";
  EXPECT_EQ(test::ValueOf(document, sources + "Source2/TIME_SERIES_FILE:FILE_NAME"), "license.nds0");
  EXPECT_EQ(test::ValueOf(document, sources + "Source1/TIME_SERIES_FILE:FILE_NAME"), "");
  Sources(page).Choose(1);
  EXPECT_EQ(file.Text(), "");
}

TEST_F(IrrigationPages, ADemandShowsWhatItsKindAsksFor) {
  test::PageDriver page(document, "LandUse/Demands/Demand");
  const auto shown = [&] {
    std::string text;
    page.Page().Form().ForEach([&](const Control& control) {
      const bool isAsked = control.kind == ControlKind::Number || control.kind == ControlKind::File ||
                           control.kind == ControlKind::Chart || control.label == "Ref. moisture content:";
      if (isAsked && control.IsShown()) text += control.label + "|";
    });
    return text;
  };
  const struct {
    const char *type, *temporal, *expected;
  } cases[] = {
      {"0", "0", "Demand constant value:|"},
      {"0", "1", "Demand time series file:||"},
      {"1", "0", "Ref. moisture content:|Moisture deficit start:|Moisture deficit end:|"},
      {"1", "1", "Ref. moisture content:|Moisture deficit start:|Moisture deficit end:||"},
      {"2", "0", "Crop stress factor constant value:|"},
      {"2", "1", "Crop stress factor file:||"},
      {"3", "0", "Ponding depth constant value:|"},
      {"3", "1", "Ponding depth file:||"},
      {"3", "2", ""},
  };
  for (const auto& c : cases) {
    Control &type = page.Find("Demand type:"), &temporal = page.Find("Temporal Distribution:");
    page.Page().Enter(type, type.OptionValue(std::stoi(c.type)));
    page.Page().Enter(temporal, temporal.OptionValue(std::stoi(c.temporal)));
    EXPECT_EQ(shown(), c.expected);
  }
}

}  // namespace
}  // namespace tervane::irrigation_pages_test
