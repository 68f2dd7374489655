// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/station_pages.h"

#include <gmock/gmock.h>

#include "surface/climate.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane {
namespace {

using testing::ElementsAre;

TEST(StationPage, AFileOfAreasMakesTheStationsAndTheNameThatFillsGapsIsOneOfThem) {
  test::TempFolder folder;
  test::WriteShapes(folder.File("areas.shp"), ShapeKind::Polygon, AttributeKind::Text, {"Sion", "Brig"});
  test::WriteCodes(folder.File("codes.nds2"), {4, 2});
  CFlowModelDoc document;
  auto& forcing = *document.Root().Important(kPrecipitation);
  test::PageDriver page(document, "Climate/PrecipitationRate");
  page.Enter("Spatial Distribution:", "1");
  page.Enter("Data Type:", "1");
  page.Enter("Shape File:", folder.File("areas.shp"));
  EXPECT_EQ(forcing.Stations().ShapeFile().Attribute(), "CODE");  // the only one that there is
  EXPECT_THAT(forcing.GetStationNames(), ElementsAre("Brig", "Sion"));
  EXPECT_THAT(page.Find("Fill Gaps with:").Options(), ElementsAre("Brig", "Sion"));
  EXPECT_EQ(page.Find("Fill Gaps with:").Text(), "0");
  EXPECT_EQ(page.Changes().back(), "19 Change Shape File");

  // A name that no station bears any more stays to be seen until another is chosen.
  forcing.Stations().ShapeGapFillName = "Visp";
  EXPECT_THAT(page.Find("Fill Gaps with:").Options(), ElementsAre("Brig", "Sion", "Visp (not in the list)"));
  page.Enter("Fill Gaps with:", "1");
  EXPECT_EQ(forcing.Stations().ShapeGapFillName, "Sion");

  // Other codes: the stations go without a question, since nobody worked on them.
  page.Enter("Data Type:", "0");
  page.Enter("Station Based Distribution File:", folder.File("codes.nds2"));
  EXPECT_THAT(forcing.GetStationNames(), ElementsAre("Grid code = 2", "Grid code = 4"));
}

}  // namespace
}  // namespace tervane
