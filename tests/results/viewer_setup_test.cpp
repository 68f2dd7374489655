// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/viewer_setup.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "platform/item_types.h"
#include "tests/support/data_files.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::viewer_setup_test {
namespace {

using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

/// Two steps of a day on 2 x 1 cells of that many layers; an item for each list of values, which hold for both steps.
void WriteResults(const std::string& path, int itemType, int layers, const std::vector<std::vector<float>>& items) {
  NewDataFile content;
  content.dimensions = layers > 1 ? 3 : 2;
  content.geometry = FileGeometryOf({2, 1, 100, 0, 0, 0, "NON-UTM"});
  content.geometry.nz = layers;
  for (std::size_t i = 0; i < items.size(); ++i)
    content.items.push_back({fmt::format("Item {}", i + 1), itemType, BaseUnit(*FindItemType(itemType)).key});
  DataFileWriter writer;
  test::Require(writer.Create(path, content));
  for (int day = 1; day <= 2; ++day) {
    test::Require(writer.AddStep(CYbDateTime(2001, 1, day)));
    for (std::size_t i = 0; i < items.size(); ++i) test::Require(writer.Put(static_cast<int>(i) + 1, items[i]));
  }
  test::Require(writer.Finish().error);
}

struct ViewerSetupFiles : testing::Test {
  test::TempFolder folder;
  CFlowModelDoc document;
  COverlaysKvf& overlays = *document.Root().Important(kOverlays);
  DisplayUnits units;
  StoredItems stored;

  std::string Written(const StoredItem& shown, bool withVectors = false, int layer = 1) {
    const std::string path = folder.File("shown.REV");
    EXPECT_EQ(WriteViewerSetup(path, {stored, shown, withVectors, layer, overlays, units}), "");
    return test::ReadFile(path);
  }
};

TEST_F(ViewerSetupFiles, NamesLoseWhatNoFileCanBeCalled) {
  EXPECT_EQ(ViewerSetupFile(" /a/b ", "flow <x>: a/b\\c|d?e*f^g"), "\\a\\b\\flow x abcdefg.REV");
  EXPECT_EQ(ViewerSetupFile("C:\\a\\", "head"), "C:\\a\\head.REV");
}

TEST_F(ViewerSetupFiles, AResultWithItsPalette) {
  WriteResults(folder.File("head.nds3"), quantity::kElevation, 3, {{0, 16, 1, 2, 3, 4}});
  stored.items = {{"head", folder.File("head.nds3"), 1, 0, false}};
  stored.area = {1, 2, 30, 40};
  const std::string text = Written(stored.items[0], false, 1);
  EXPECT_THAT(text, StartsWith("target QUARZEL_RESULT_VIEWER {"));
  EXPECT_THAT(text, HasSubstr("Verno = 100\n"));
  EXPECT_THAT(text, HasSubstr("x0 = 1.0\n    y0 = 2.0\n    x1 = 30.0\n    y1 = 40.0\n    UTMZone = "));
  EXPECT_THAT(text, HasSubstr("TimeStep = 86400.0\n    TimeUnit = 1400\n    CurrentTimeStep = 0\n"));
  EXPECT_THAT(text, HasSubstr("DataFileName = 6, file \""));
  EXPECT_THAT(text,
              HasSubstr("AxisUnit = 0\n    section PROPERTIES {\n      LayerNo = 2\n      ItemNo = 1\n"
                        "      ShadingType = 1\n      ColorMergingType = 2\n      TransparencyIntensityVal = 0.5f\n"
                        "      section Quarzel_Palette_Definition {\n        Palette_Title = \"head [meter]\"\n"
                        "        Palette_Type = 1\n        Locked = false\n        Topmost_Value = true\n"
                        "        Nice_Value = true\n        RGB_Delete_Color = 255, 255, 255\n"
                        "        RGB_Color_Value = 128, 0, 128, 1f\n"));
  EXPECT_THAT(text, HasSubstr("RGB_Color_Value = 255, 0, 0, 16f\n      }\n      VectorDisplay = false\n"
                              "      VectorDraw = false\n      OverlayDrawingOrder = 0, 2, 1\n"));
  // In the user's unit; and a layer that is not there is written as it is.
  ASSERT_TRUE(units.Choose(quantity::kElevation, 1002));
  const std::string others = Written(stored.items[0], false, 5);
  EXPECT_THAT(others, HasSubstr("Palette_Title = \"head [millimeter]\""));
  EXPECT_THAT(others, HasSubstr("RGB_Color_Value = 255, 0, 0, 16000f"));
  EXPECT_THAT(others, HasSubstr("LayerNo = -2\n"));
}

TEST_F(ViewerSetupFiles, TheBackdropLiesAroundTheResult) {
  WriteResults(folder.File("depth.nds2"), quantity::kWaterDepth, 1, {{1, 2}});
  stored.items = {{"depth", folder.File("depth.nds2"), 1, 0, false}};
  const auto add = [](COverlayListKvf& list, int type) -> COverlayItemKvf& {
    COverlayItemKvf& item = *list.AddItem();
    item.Type = type;
    return item;
  };
  auto& lakes = *add(overlays.Background(), COverlayItemKvf::kShape).Child<COverlayShapeKvf>();
  lakes.Filename = FileName("lakes.shp", folder.Path());
  lakes.ItemDescr = "NAME";
  lakes.Display = 0;
  lakes.LineTextBackground = 0;
  add(overlays.Background(), COverlayItemKvf::kGrid);  // has no place, and does not count
  auto& map = *add(overlays.Background(), COverlayItemKvf::kImage).Child<COverlayBMPKvf>();
  map.Filename = FileName("map.png", folder.Path());
  map.BMP_TransparentColor = 0x030201;
  add(overlays.Foreground(), COverlayItemKvf::kShape);

  const std::string text = Written(stored.items[0]);
  // From the last to the first: the image, the shape, the result, and above it the foreground.
  const auto image = text.find("DataFileName = 2, file \""), shape = text.find("DataFileName = 3, file \""),
             result = text.find("DataFileName = 6, file \""), above = text.rfind("DataFileName = 3, file \"");
  EXPECT_LT(image, shape);
  EXPECT_LT(shape, result);
  EXPECT_LT(result, above);
  for (const char* expected :
       {"TransparentColor = 1, 2, 3\n      OverlayDrawingOrder = 0\n    }",
        "lakes.shp\", \"NAME\"\n    AxisUnit = 1000",
        "section Quarzel_Shape_Polygon_Object {\n        Base_Title = \"Shape overlay\"\n        Base_Reg_Key = \"\"",
        "Base_Display_On = false\n        Line_Thickness = 0.3f",
        "Text_Bk_Mode = 2\n      }\n"
        "      section Quarzel_Shape_Point_Object {",
        "Text_Bk_Mode = 1\n      }\n      OverlayDrawingOrder = 1\n    }", "ShadingType = 4", "LayerNo = 0\n",
        "OverlayDrawingOrder = 2, 4, 3", "OverlayDrawingOrder = 5\n    }"})
    EXPECT_THAT(text, HasSubstr(expected));
  EXPECT_THAT(text, Not(HasSubstr("wc_x0")));
}

TEST_F(ViewerSetupFiles, FlowVectorsComeFromTheFirstItemOfTheirType) {
  WriteResults(folder.File("flow.nds3"), quantity::kDischarge, 2, {{0, 0, 0, 0}, {0.1F, -4, 1, 0}, {0, 2, 0, 0}});
  const std::string flow = folder.File("flow.nds3");
  stored.items = {{"flow in x-direction", flow, 2, 102, true}, {"other", flow, 1, 102, true}};
  stored.area = {0, 0, 1000, 400};
  const std::string text = Written(stored.items[1], true, 1);
  EXPECT_THAT(text, HasSubstr("Display = false\n      ShadingType = 1\n      ColorMergingType = 2\n"
                              "      TransparencyIntensity = 0\n      Isoline = false\n"));
  EXPECT_THAT(text, HasSubstr("Palette_Title = \"Flow in xy-direction\""));
  EXPECT_THAT(text, HasSubstr("RGB_Color_Value = 128, 0, 128, -0.4\n"));
  // 0.15 of the width for the strongest flow, which is 4.
  EXPECT_THAT(text, HasSubstr("VectorDisplay = true\n      VectorDraw = true\n      Scale = 37.5f\n"));
  EXPECT_THAT(text, HasSubstr("VectorLayerNo = 1\n      XItem = 2\n      YItem = 3\n"
                              "      OverlayDrawingOrder = 3, 5, 4\n    }\n  }\n}\n"));
  stored.items[0].dataType = stored.items[1].dataType = 1;
  EXPECT_THAT(Written(stored.items[1], true), Not(HasSubstr("VectorLayerNo")));
}

TEST_F(ViewerSetupFiles, WhatCannotBeReadHasARangeOfItsOwn) {
  stored.items = {{"gone", folder.File("gone.nds2"), 1, 102, false}};
  const std::string text = Written(stored.items[0], true);
  EXPECT_THAT(text, HasSubstr("TimeStep = 0.0\n"));
  EXPECT_THAT(text, HasSubstr("RGB_Color_Value = 255, 0, 0, 1.04f"));
  EXPECT_THAT(text, HasSubstr("Scale = 15.000001f"));
  EXPECT_THAT(WriteViewerSetup(folder.File("none/a.REV"), {stored, stored.items[0], false, 1, overlays, units}),
              StartsWith("Error while writing kvf input file"));
}

}  // namespace
}  // namespace tervane::viewer_setup_test
