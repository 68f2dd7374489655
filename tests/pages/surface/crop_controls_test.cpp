// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/crop_controls.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "pages/page_table.h"
#include "simspec/periods.h"
#include "surface/pages.h"
#include "surface/vegetation.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::crop_controls_test {
namespace {

using testing::HasSubstr;

/// The page of a vegetation with the crops maize and rye, 60 and 20 days long, in a simulation of 100 days.
class CropPage : public testing::Test {
 protected:
  CropPage() {
    folder.Write("crops.etv",
                 "target TERVANE_VEGETATION {\n"
                 "section Vegetation_1 {\nName = \"Maize\"\nStage = 0, 0.0, 0.2, 0.3\nStage = 60, 3.0, 1.2, 1.2\n}\n"
                 "section Vegetation_2 {\nName = \"Rye\"\nStage = 0, 1.0, 0.2, 0.3\nStage = 20, 2.0, 1.0, 1.0\n}\n}\n");
    auto& period = *document.Root().Important(kSimulationPeriod);
    period.SIMSTART = {2001, 1, 1};
    period.SIMEND = {2001, 4, 11};
    vegetation.Global().TYPE = VegetationCourse::kCrops;
    AddCrop("Maize", {2001, 1, 11});
    AddCrop("Rye", {2001, 3, 1});
    PageContext context{document, host, [this](int hint, const std::string& action, const void*) {
                          changes.push_back(fmt::format("{} {}", hint, action));
                        }};
    page = MakePage(kVegetationPage, vegetation, context);
  }
  void AddCrop(const char* name, const CYbDateTime& start) {
    CVegetationItemKvf& crop = *crops.AddItem();
    crop.VegPropFile().Choose(FileName(folder.File("crops.etv"), ""), name);
    crop.StartDate = start;
  }
  Control& Find(std::string_view label, ControlKind kind) {
    Control* found = nullptr;
    page->Form().ForEach([&](Control& control) {
      if (control.kind == kind && control.label == label && control.IsShown()) found = &control;
    });
    if (!found) throw std::runtime_error("no " + std::string(label));
    return *found;
  }
  Control& Table() { return Find("", ControlKind::Table); }
  SeriesContent Chart() { return Find("", ControlKind::Chart).chart(); }
  std::string ChartText() { return Summary(Chart()); }

  test::TempFolder folder;
  test::ScriptedHost host;
  std::vector<std::string> changes;
  CFlowModelDoc document;
  CVegetationKvf& vegetation = *document.Root().Important(kVegetation);
  CVegetationListKvf& crops = vegetation.Global().Crops();
  std::unique_ptr<CYbSEDlgBase> page;
};

enum Column { kName = 1, kStart, kEnd, kFile, kSelect, kEdit };

TEST_F(CropPage, CellsShowAndTakeNamesDatesAndFiles) {
  TableForm& table = *Table().table;
  EXPECT_EQ(table.ShownCell(1, kStart), "2001-01-11 00:00:00");
  EXPECT_EQ(table.ShownCell(1, kEnd), "2001-03-12 00:00:00");
  EXPECT_TRUE(table.IsGrey(1, kEnd));
  const struct {
    int column;
    const char *typed, *shown, *end, *change;
  } cases[] = {
      {kStart, "2001/02/01 13:30", "2001-02-01 00:00:00", "2001-04-02 00:00:00", "8 Change Start date"},
      {kName, "Rye", "Rye", "2001-02-21 00:00:00", "1 Change Name"},
      // Without stages a crop ends where it begins.
      {kName, "Rice", "Rice", "2001-02-01 00:00:00", "1 Change Name"},
      {kFile, "none.etv", "none.etv", "2001-02-01 00:00:00", "1 Change Vegetation property file"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(page->EnterCell(Table(), 1, c.column, c.typed), "");
    EXPECT_EQ(table.ShownCell(1, c.column), c.shown);
    EXPECT_EQ(table.ShownCell(1, kEnd), c.end) << c.shown;
    EXPECT_EQ(changes.back(), c.change);
  }
  EXPECT_EQ(table.ToolTip(1, kFile), "none.etv");
  EXPECT_NE(page->EnterCell(Table(), 1, kStart, "soon"), "");
  crops.GetItem(1)->StartDate = {2001, 13, 1};
  EXPECT_EQ(table.ShownCell(1, kStart), "Invalid");
  EXPECT_EQ(table.ShownCell(1, kEnd), "");
}

TEST_F(CropPage, ButtonsChooseAVegetationAndEditTheLibrary) {
  TableForm& table = *Table().table;
  const std::string path = folder.File("crops.etv");
  host.Expect("vegetation", std::optional<Host::LibraryChoice>());
  EXPECT_TRUE(table.Press(2, kSelect));
  EXPECT_TRUE(changes.empty());
  host.Expect("vegetation", std::optional(Host::LibraryChoice{path, "Maize"}));
  EXPECT_TRUE(table.Press(2, kSelect));
  EXPECT_EQ(crops.GetItem(2)->VegPropFile().VegetationName(), "Maize");
  EXPECT_EQ(changes.back(), "1 Choose Vegetation");
  EXPECT_TRUE(table.Press(2, kEdit));
  EXPECT_EQ(host.Opened(), std::vector{path});
  crops.GetItem(2)->VegPropFile().Choose({}, "");
  EXPECT_FALSE(table.Press(2, kEdit));
}

TEST_F(CropPage, TheChartShowsTheCropsOverTheSimulationWithGapsAndOverlaps) {
  // Maize from 10 to 59, where rye begins, which ends at 79; maize would have gone on to 70.
  EXPECT_EQ(ChartText(),
            "2 series, 10 values, 2 bars, 2 gaps, 1 overlaps, 1 at 2001-01-11 00:00, 2 at 2001-03-01 00:00");
  const SeriesContent chart = Chart();
  ASSERT_EQ(chart.bars.size(), 5U);
  EXPECT_EQ(chart.bars[1], (TimeBar{"Maize", {2001, 1, 11}, {2001, 3, 1}}));
  EXPECT_EQ(chart.bars[3], (TimeBar{"Maize is not finished", {2001, 3, 1}, {2001, 3, 12}, TimeBar::Kind::Overlap}));
  EXPECT_EQ(Find("Crop development:", ControlKind::Shown).Text(),
            "2 crops, 31 days without a crop, 1 overlap. Values are linear between stages.");
  // Recycled, the gap at the end is closed.
  page->Enter(Find("Recycling Mode:", ControlKind::Choice), "1");
  EXPECT_THAT(ChartText(), HasSubstr("4 bars, 1 gaps, 1 overlaps"));
  crops.SetItemCount(0, 1);
  EXPECT_EQ(ChartText(), "No crop grows during the simulation.");
  document.Root().Important(kSimulationPeriod)->SIMEND = {2000, 1, 1};
  EXPECT_THAT(ChartText(), HasSubstr("the dates of the simulation are none, or in no order"));
}

TEST_F(CropPage, AStartIsPickedOrDraggedOnTheChart) {
  Control& pick = Find("Start Date from Chart", ControlKind::Button);
  page->ChooseRow(Table(), 2);
  EXPECT_TRUE(pick.IsEnabled());
  page->Press(pick);
  EXPECT_THAT(ChartText(), HasSubstr("asks \"Click the start of Rye.\""));
  Chart().request->taken({2001, 3, 20, 17, 30});
  EXPECT_EQ(crops.GetItem(2)->StartDate, CYbDateTime(2001, 3, 20));
  EXPECT_EQ(changes.back(), "8 Change Start date");
  EXPECT_FALSE(Chart().request.has_value());

  Chart().markers[0].moved({2001, 1, 2, 5});
  EXPECT_EQ(crops.GetItem(1)->StartDate, CYbDateTime(2001, 1, 2));

  // A crop that goes while its date is asked for takes none.
  page->Press(pick);
  const auto taken = Chart().request->taken;
  crops.SetItemCount(0, 1);
  changes.clear();
  taken({2001, 2, 2});
  EXPECT_TRUE(changes.empty());
  page->Form().Follow();
  EXPECT_FALSE(pick.IsEnabled());
}

}  // namespace
}  // namespace tervane::crop_controls_test
