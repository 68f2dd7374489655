// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/well_pages.h"

#include <gmock/gmock.h>

#include "forms/plots.h"
#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::well_pages_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using Path = std::optional<std::string>;

class WellPage : public testing::Test {
 public:
  test::TempFolder folder;
  CFlowModelDoc document;
  CSatZoneKvf& zone = *document.Root().Important(kSaturatedZone);
  CSZWellKvf& wells = *document.Root().Important(kWells);

  WellPage() { zone.Wells = 1; }
  const EditorRequests& Requests() { return document.Global().Requests; }
};

TEST_F(WellPage, CreateMakesAFileThatIsChosenAtOnce) {
  test::PageDriver page(document, "SaturatedZone/Well");
  page.Outside().Expect("Create Well File", Path());
  page.Find("Create...").press();
  EXPECT_TRUE(wells.GetFilename().IsEmpty());
  page.Outside().Expect("Create Well File", Path(folder.File("new.WEL")));
  page.Find("Create...").press();
  EXPECT_TRUE(page.Outside().IsDone());
  EXPECT_EQ(wells.GetFilename().Absolute(), folder.File("new.WEL"));
  EXPECT_THAT(page.Changes(), ElementsAre("1 Create Well File"));
  // Without wells there is nothing to show, which is told and no error.
  EXPECT_THAT(page.Text(), HasSubstr("the library has no wells"));
  page.Outside().Expect("Create Well File", Path(folder.File("away/new.WEL")));
  page.Outside().Expect("away", Host::Answer::Ok);
  page.Find("Create...").press();
  EXPECT_EQ(wells.GetFilename().Absolute(), folder.File("new.WEL"));
}

TEST_F(WellPage, EditTellsOfAFileThatIsAwayAndAllowsOneRequest) {
  test::PageDriver page(document, "SaturatedZone/Well");
  page.Find("Edit...").press();
  EXPECT_FALSE(Requests().layers);
  wells.SetFilename(FileName(folder.File("away.WEL"), {}));
  page.Outside().Expect("The pumping-well file is missing", Host::Answer::Ok);
  page.Find("Edit...").press();
  EXPECT_TRUE(page.Outside().IsDone());
  EXPECT_TRUE(Requests().layers);
  EXPECT_FALSE(Requests().domain);
}

TEST_F(WellPage, TheFractureOptionIsThatOfTheZoneAndShowsWithSurfact) {
  auto& basics = *document.Root().Important(kBasicParameters);
  test::PageDriver page(document, "SaturatedZone/Well");
  Control& option = page.Find("Use Fracture well option");
  for (const auto& [engine, areIncluded, isShown, isEnabled] : {std::tuple{kEngineTervane, 1, false, true},
                                                                {kEngineModflowSurfact, 1, true, true},
                                                                {kEngineModflowSurfact, 0, true, false},
                                                                {kEngineModflow96, 1, false, true}}) {
    basics.ModelType = engine;
    zone.Wells = areIncluded;
    EXPECT_EQ(option.IsShown(), isShown) << engine;
    if (isShown) {
      EXPECT_EQ(option.IsEnabled(), isEnabled) << engine;
    }
  }
  zone.Wells = 1;
  basics.ModelType = kEngineModflowSurfact;
  EXPECT_EQ(page.Enter("Use Fracture well option", "1"), "");
  EXPECT_EQ(zone.FractureWells, 1);
}

TEST_F(WellPage, TheMapHasTheWellsWithTheirNames) {
  wells.SetFilename(FileName(folder.Write("a.WEL",
                                          "target WEL_CFG {\n  section WELLDATA {\n    section Well_1 {\n"
                                          "      Name = \"North\"\n      X = 5.0\n      Y = 6.0\n      Level = 9.0\n"
                                          "      Depth = 3.0\n    }\n  }\n}\n"),
                             {}));
  test::PageDriver page(document, "SaturatedZone/Well");
  Control& map = page.Find("Pumping Wells");
  EXPECT_FALSE(map.IsShown());
  EXPECT_EQ(page.Enter("Show well location map", "1"), "");
  ASSERT_TRUE(map.IsShown());
  const MapContent content = map.map();
  ASSERT_EQ(content.points.size(), 1U);
  EXPECT_THAT(content.points[0].labels, ElementsAre("North"));
  EXPECT_EQ(content.points[0].points[0], (MapPoint{5, 6}));
}

}  // namespace
}  // namespace tervane::well_pages_test
