// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/viewed_setup.h"

#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "platform/item_types.h"
#include "results/viewer_setup.h"
#include "tests/support/data_files.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::viewed_setup_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

struct ViewedSetups : testing::Test {
  test::TempFolder folder;
  std::string path = folder.File("shown.REV");

  std::string Problem(const std::string& text) {
    folder.Write("shown.REV", text);
    ViewedSetup setup;
    return ReadViewedSetup(path, setup).error;
  }
};

TEST_F(ViewedSetups, WhatWasWrittenIsRead) {
  const std::string flow = folder.File("flow.nds2");
  test::WriteGrid(flow, {2, 1, 100, 0, 0, 0, "NON-UTM"}, {0, 16}, quantity::kDischarge);
  CFlowModelDoc document;
  COverlaysKvf& overlays = *document.Root().Important(kOverlays);
  const auto add = [](COverlayListKvf& list, int type) -> COverlayItemKvf& {
    COverlayItemKvf& item = *list.AddItem();
    item.Type = type;
    return item;
  };
  auto& lakes = *add(overlays.Background(), COverlayItemKvf::kShape).Child<COverlayShapeKvf>();
  lakes.Filename = FileName("lakes.shp", folder.Path());
  lakes.ItemDescr = "NAME";
  lakes.ShapeAxisUnit = 1003;
  lakes.LineColor = {1, 2, 3};
  auto& map = *add(overlays.Background(), COverlayItemKvf::kImage).Child<COverlayBMPKvf>();
  map.Filename = FileName("map.png", folder.Path());
  map.BMP_X1 = 50;
  auto& roads = *add(overlays.Foreground(), COverlayItemKvf::kShape).Child<COverlayShapeKvf>();
  roads.Filename = FileName("roads.shp", folder.Path());
  roads.Display = 0;
  StoredItems stored;
  stored.items = {{"flow in x-direction", flow, 1, StoredItems::kFlowInX, true}};
  stored.area = {1, 2, 30, 40};
  ASSERT_EQ(WriteViewerSetup(path, {stored, stored.items[0], true, 1, overlays, DisplayUnits()}), "");

  ViewedSetup setup;
  ASSERT_EQ(ReadViewedSetup(path, setup).error, "");
  EXPECT_EQ(setup.area.x1, 30);
  EXPECT_EQ(setup.result.path, flow);
  EXPECT_EQ(setup.result.item, 1);
  EXPECT_EQ(setup.result.layer, 0);
  EXPECT_FLOAT_EQ(static_cast<float>(setup.result.transparency), overlays.CurrentTransparency());
  ASSERT_EQ(setup.result.palette.size(), 16U);
  EXPECT_EQ(setup.result.palette.front(), (ViewedClass{{128, 0, 128}, 1}));
  EXPECT_EQ(setup.result.palette.back(), (ViewedClass{{255, 0, 0}, 16}));
  ASSERT_TRUE(setup.flow);
  EXPECT_EQ(setup.flow->path, flow);
  EXPECT_EQ(setup.flow->xItem, 1);
  EXPECT_EQ(setup.flow->yItem, 2);
  EXPECT_TRUE(setup.flow->isShown);
  // From the bottom up, and what lies over the result.
  ASSERT_EQ(setup.overlays.size(), 3U);
  EXPECT_EQ(setup.overlays[0].kind, ViewedOverlay::Kind::Image);
  EXPECT_EQ(setup.overlays[0].corners.x1, 50);
  EXPECT_EQ(setup.overlays[1].path, folder.File("lakes.shp"));
  EXPECT_EQ(setup.overlays[1].attribute, "NAME");
  EXPECT_EQ(setup.overlays[1].axisUnit, 1003);
  EXPECT_EQ(setup.overlays[1].lineColor, 0x010203U);
  EXPECT_TRUE(setup.overlays[1].isShown);
  EXPECT_FALSE(setup.overlays[1].isForeground);
  EXPECT_FALSE(setup.overlays[2].isShown);
  EXPECT_TRUE(setup.overlays[2].isForeground);
  EXPECT_THAT(setup.notes, testing::IsEmpty());
}

TEST_F(ViewedSetups, MissingKeysHaveTheirDefaultsAndUnknownLayersAreTold) {
  folder.Write(
      "shown.REV",
      "target QUARZEL_RESULT_VIEWER {\n  section RESULT_FILES {\n    DataFileName = 2, file \"\"\n"
      "    DataFileName = 6, file \"a.nds2\"\n    section PROPERTIES {\n      section Quarzel_Palette_Definition {\n"
      "        RGB_Color_Value = 300, 0, -4, 2.0\n        RGB_Color_Value = 1, 2, 3, 1.0f\n"
      "        RGB_Color_Value = 1, 2, 3, nan\n      }\n    }\n"
      "    DataFileName = 6, file \"b.nds2\"\n    DataFileName = 77, file \"c.xyz\"\n  }\n}\n");
  ViewedSetup setup;
  ASSERT_EQ(ReadViewedSetup(path, setup).error, "");
  EXPECT_EQ(setup.result.path, folder.File("a.nds2"));
  EXPECT_EQ(setup.result.item, 1);
  EXPECT_EQ(setup.currentStep, 0);
  EXPECT_THAT(setup.result.palette, ElementsAre(ViewedClass{{1, 2, 3}, 1}, ViewedClass{{255, 0, 0}, 2}));
  EXPECT_THAT(setup.notes, ElementsAre(HasSubstr("without a file"), HasSubstr("b.nds2 is left out"),
                                       HasSubstr("c.xyz is left out: layers of kind 77")));
}

TEST_F(ViewedSetups, WhatShowsNoResultIsRefusedWithItsReason) {
  struct Row {
    const char *text, *expected;
  };
  for (const Row& row :
       {Row{"", "the file is empty"}, Row{"target OTHER {\n}\n", "no target QUARZEL_RESULT_VIEWER"},
        Row{"target QUARZEL_RESULT_VIEWER {\n}\n", "no section RESULT_FILES"},
        Row{"target QUARZEL_RESULT_VIEWER {\n  section RESULT_FILES {\n  }\n}\n", "names no result"},
        Row{"target QUARZEL_RESULT_VIEWER {\n  section RESULT_FILES {\n    DataFileName = 6, file \"a", "shown.REV:3"},
        Row{"\x01\x02\x03", "shown.REV:1"}})
    EXPECT_THAT(Problem(row.text), HasSubstr(row.expected)) << row.text;
  ViewedSetup setup;
  EXPECT_THAT(ReadViewedSetup(folder.File("gone.REV"), setup).error, HasSubstr("gone.REV"));
}

}  // namespace
}  // namespace tervane::viewed_setup_test
