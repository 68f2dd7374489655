// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/data2d_pages.h"

#include <gmock/gmock.h>

#include "platform/item_types.h"
#include "spatial/data2d.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::data2d_pages_test {
namespace {

TEST(Data2DPages, TheUnitOfTheValueFollowsWhetherItIsRelativeToTheGround) {
  CFlowModelDoc document;
  test::PageDriver page(document, "GroundwaterTable");
  EXPECT_EQ(page.Find("Value").NumberUnit().itemType, quantity::kHeightAboveGround);
  page.Enter("Values relative to ground", "0");
  EXPECT_EQ(page.Find("Value").NumberUnit().itemType, quantity::kElevation);
  page.Enter("Values relative to ground", "1");
  EXPECT_EQ(page.Find("Value").NumberUnit().itemType, quantity::kHeightAboveGround);
}

TEST(Data2DPages, AFileThatIsNotValidIsNotDrawnAndTheReasonStandsInItsPlace) {
  const test::TempFolder folder;
  test::WriteGrid(folder.File("rain.nds2"), {2, 1, 5, 0, 0, 0, {}}, {8, 9}, 100431);
  test::WriteGrid(folder.File("dem.nds2"), {2, 1, 5, 0, 0, 0, {}}, {8, 9}, quantity::kElevation);
  CFlowModelDoc document;
  auto& ground = *document.Root().Important(kTopography);
  ground.Type = CData2DKvf::kGridFile;
  test::PageDriver page(document, "Topography");
  const auto shown = [&](const char* file) {
    ground.GridFile().Choose(FileName(file, folder.Path()));
    return page.Text();
  };
  EXPECT_THAT(shown("dem.nds2"), testing::HasSubstr("map \"\" = grid 2x1"));
  EXPECT_THAT(shown("rain.nds2"),
              testing::HasSubstr("map \"\" = item 1 is Precipitation Rate, Elevation was expected"));
}

}  // namespace
}  // namespace tervane::data2d_pages_test
