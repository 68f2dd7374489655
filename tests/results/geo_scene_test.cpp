// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/geo_scene.h"

#include <gmock/gmock.h>

#include "core/open_kvf.h"
#include "document/flow_model_document.h"
#include "overlays/overlays.h"
#include "platform/item_types.h"
#include "results/scene_xml.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"
#include "tests/support/data_files.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::geo_scene_test {
namespace {

using testing::HasSubstr;
using testing::Not;

TEST(SceneXml, HasFirstValuesInTheWordsOfTheViewer) {
  const OpenKvf file(kvfCreate());
  kvfAddTarget(file.get(), "T");
  kvfAddSection(file.get(), "S");
  kvfPutParam(file.get(), "i", -3);
  kvfPutParam(file.get(), "f", 0.5F);
  kvfPutParam(file.get(), "d", 1.0 / 3);
  kvfPutParam(file.get(), "b", true);
  kvfPutParam(file.get(), "t", "Jütland & <Fjord> € Ł");
  kvfPutListParam(file.get(), "l", "ii", 1, 2);
  kvfEndSection(file.get());
  kvfEndSection(file.get());
  EXPECT_EQ(SceneXml(*file),
            "<?xml version=\"1.0\" encoding=\"Windows-1252\"?>\n"
            "<T>\n"
            "    <S>\n"
            "        <i>-3</i>\n"
            "        <f>0.5</f>\n"
            "        <d>0.333333333333333</d>\n"
            "        <b>True</b>\n"
            "        <t>J\xFCtland &amp; <Fjord> \x80 &#321;</t>\n"
            "        <l>1</l>\n"
            "    </S>\n"
            "</T>\n");
}

class GeoScene : public testing::Test {
 protected:
  GeoScene() {
    const GridGeometry grid{2, 1, 100, 0, 0, 0, {}};
    test::WriteGrid(folder.File("karup_CompLayers.nds2"), grid, {10, 20}, quantity::kElevation);
    test::WriteGrid(folder.File("karup_GeoLayers.nds2"), grid, {-30, -20}, quantity::kElevation);
    test::WriteGrid(folder.File("karup_GeoLenses.nds2"), grid, {-25, 5}, quantity::kElevation);
  }
  /// The scene of a node, or why there is none.
  std::string Scene(const CGeoScene3DKvf& node) {
    const std::string path = folder.File("GeoScene3DSetup.xml");
    const std::string problem = node.WriteScene(folder.File("karup"), path);
    return problem.empty() ? test::ReadFile(path) : problem;
  }

  test::TempFolder folder;
  CFlowModelDoc document;
  CGeoScene3DKvf model{CGeoScene3DKvf::kOfModel, &document.Root()};
  CGeoScene3DKvf results{CGeoScene3DKvf::kOfResults, &document.Root()};
};

TEST_F(GeoScene, ShowsSurfacesBetweenTheirExtremes) {
  model.Transparency = 0.25;
  const std::string scene = Scene(model);
  for (const char* part :
       {"<Alpha>0.75</Alpha>", "<ItemIndex>1</ItemIndex>", "<CameraElevation>15</CameraElevation>", "<Value>10</Value>",
        "<Value>20</Value>", "<VerticalScale>30</VerticalScale>", "<Maps>\n        </Maps>", "<MaxX>50000</MaxX>"})
    EXPECT_THAT(scene, HasSubstr(part));
  EXPECT_THAT(scene, Not(HasSubstr("SurfaceTSs")));
  EXPECT_THAT(scene, Not(HasSubstr("<Wells>")));

  // A single layer has no head of its own.
  const std::string heads = Scene(results);
  EXPECT_THAT(heads, HasSubstr("<SurfaceTSs>\n    </SurfaceTSs>"));
  EXPECT_THAT(heads, HasSubstr("<ShowEvery>1</ShowEvery>"));
  results.UseAllTimeSteps = 0;
  results.ShowEveryTimeStep = 5;
  EXPECT_THAT(Scene(results), HasSubstr("<ShowEvery>5</ShowEvery>"));

  model.LayerType = CGeoScene3DKvf::kGeological;
  // All below 0: the largest stays the smallest number above it, which is lost in the sum.
  EXPECT_THAT(Scene(model), HasSubstr("<Value>0</Value>"));
  model.ShowLenses = 1;
  EXPECT_THAT(Scene(model), HasSubstr("<Value>5</Value>"));
  EXPECT_LT(Scene(model).find("GeoLenses"), Scene(model).find("GeoLayers"));  // the last surface first
  std::filesystem::remove(folder.File("karup_GeoLenses.nds2"));
  EXPECT_THAT(Scene(model), Not(HasSubstr("GeoLenses")));
}

TEST_F(GeoScene, DrapesTheFirstImageAndListsTheShownOnes) {
  const auto add = [&](const ImportantName<COverlayListKvf>& list, const char* file, int display) {
    COverlayItemKvf& item = *document.Root().Important(list)->AddItem();
    item.Type = COverlayItemKvf::kImage;
    item.Child<COverlayBMPKvf>()->Filename = FileName(file, folder.Path());
    item.Child<COverlayBMPKvf>()->Display = display;
  };
  add(kBackgroundOverlays, "b.png", 1);
  add(kForegroundOverlays, "a.png", 0);
  const std::string scene = Scene(model);
  EXPECT_THAT(scene, HasSubstr("<BitmapMode>0</BitmapMode>"));
  EXPECT_THAT(scene, HasSubstr("a.png</BitmapFileName>\n            </Bitmap>"));
  EXPECT_THAT(scene, HasSubstr("<Map1>"));
  EXPECT_THAT(scene, HasSubstr("b.png</BitmapFileName>\n            </Map1>"));
  EXPECT_THAT(scene, Not(HasSubstr("<Map2>")));
}

TEST_F(GeoScene, SaysWhatIsMissing) {
  document.Root().Important(kSaturatedZone)->Wells = 1;
  EXPECT_EQ(Scene(model), "Missing data for saturated zone. Well file is not specified");
  document.Root().Important(kWells)->Filename = FileName("all.WEL", folder.Path());
  EXPECT_THAT(Scene(model), HasSubstr("all.WEL</WellFileName>\n        <LabelVisible>1</LabelVisible>"));
  std::filesystem::remove(folder.File("karup_CompLayers.nds2"));
  EXPECT_EQ(Scene(model), "Could not open file for reading:\n" + folder.File("karup_CompLayers.nds2"));
  EXPECT_EQ(model.IsDlgUsedInSetup(), GeoSceneProgram().empty() ? 0 : 1);
}

}  // namespace
}  // namespace tervane::geo_scene_test
