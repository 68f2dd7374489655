// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "overlays/grid_state.h"

#include <gmock/gmock.h>

#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::grid_state_test {
namespace {

using testing::HasSubstr;
using testing::Not;

class GridState : public testing::Test {
 protected:
  COverlayItemKvf& Add(COverlayListKvf& list, int type) {
    list.AddItem();
    COverlayItemKvf& item = *list.GetItem(list.GetItemCount());
    item.Type = type;
    return item;
  }

  test::TempFolder folder;
  CFlowModelDoc document;
  COverlaysKvf& maps = *document.Root().Important(kOverlays);
  test::ScriptedHost host;
};

TEST_F(GridState, HoldsTheBackdropInDrawingOrder) {
  Add(maps.Background(), 3).Child<COverlayShapeKvf>()->Filename = FileName("lakes.shp", folder.Path());
  Add(maps.Background(), 2);  // has no place in the file, and counts
  auto& image = *Add(maps.Foreground(), 1).Child<COverlayBMPKvf>();
  image.Filename = FileName("map.png", folder.Path());
  image.BMP_TransparentColor = 0x030201;
  Add(maps.Foreground(), 4);  // without a file

  const std::string path = PrepareGridState(maps, FileName("dem.nds2", folder.Path()), 2, host);
  EXPECT_EQ(path, folder.File("dem.gsf"));
  const std::string text = test::ReadFile(path);
  EXPECT_THAT(text, HasSubstr("itemNo = 2"));
  for (const char* expected : {"ImageFileName = 1, file \"", "ImageFileName = 0, file \"", "TransparentColor = 1, 2, 3",
                               "Base_Title = \"Shape Polylines\"", "View_Shading_Type = 1\n    View_Box_Divider = 0",
                               "View_Overlay_Drawing_Order = 2, 5, 5, 5, 5", "SelfDestruct = true"})
    EXPECT_THAT(text, HasSubstr(expected));
  EXPECT_LT(text.find("OverlayDrawingOrder = 0"), text.find("OverlayDrawingOrder = 3"));
  EXPECT_THAT(text, Not(HasSubstr("OverlayDrawingOrder = 1")));
}

TEST_F(GridState, AsksBeforeItReplacesAnother) {
  const FileName grid("dem.nds2", folder.Path());
  folder.Write("dem.gsf", "mine");
  host.Expect("Grid State File .gsf excist.", Host::Answer::No);
  EXPECT_EQ(PrepareGridState(maps, grid, {}, host), "");
  EXPECT_EQ(test::ReadFile(folder.File("dem.gsf")), "mine");
  host.Expect("Grid State File .gsf excist.", Host::Answer::Yes);
  EXPECT_NE(PrepareGridState(maps, grid, {}, host), "");
  EXPECT_THAT(test::ReadFile(folder.File("dem.gsf")), Not(HasSubstr("itemNo")));
  host.Expect("Grid File Name is empty.", Host::Answer::Ok);
  EXPECT_EQ(PrepareGridState(maps, {}, {}, host), "");
  EXPECT_TRUE(host.IsDone());
}

}  // namespace
}  // namespace tervane::grid_state_test
