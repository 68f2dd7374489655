// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/editor_exchange.h"

#include <gmock/gmock.h>

#include "core/kvf_writer.h"
#include "data/datafile_writer.h"
#include "document/flow_model_document.h"
#include "overlays/overlays.h"
#include "platform/item_types.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "subsurface/geology.h"
#include "subsurface/ground_properties.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::editor_exchange_test {
namespace {

using testing::ElementsAre;

/// A window that keeps what it gets.
struct Window : MessageReceiver {
  bool Receive(const Message& message) override {
    EXPECT_EQ(message.name, "TervaneSwitchBoardSevice");
    EXPECT_EQ(message.wParam, 4);
    AppendKvfNodes(std::get<const KvfFile*>(message.lParam)->top, 0, text);
    return true;
  }
  std::string text;
};

class EditorExchange : public testing::Test {
 protected:
  EditorExchange() {
    if (!document.OnOpenDocument(folder.Write("karup.tvd", test::SetupText(14, ""))))
      throw std::runtime_error(document.Error());
  }
  bool Ask(int kind, CTvnFlowModelData& data) { return AnswerEditor(document, {kFrameMessage, kind, &data}, host); }
  template <class Layer>
  Layer& AddOverlay(const ImportantName<COverlayListKvf>& list, int type, const char* file) {
    COverlayItemKvf& item = *document.Root().Important(list)->AddItem();
    item.Type = type;
    auto& layer = *item.Child<Layer>();
    const FileName name(file, folder.Path());
    if constexpr (std::is_same_v<Layer, COverlayGridKvf>)
      layer.GridFile().Choose(name);
    else
      layer.Filename = name;
    return layer;
  }

  test::TempFolder folder;
  CFlowModelDoc document;
  test::ScriptedHost host;
};

TEST_F(EditorExchange, TheDomainIsGivenOnceForEachOpening) {
  auto& domain = *document.Root().Important(kDomain);
  domain.Type = CCatchmentKvf::kShapeFile;
  domain.nxShp = 30;
  domain.nyShp = 20;
  domain.sizeShp = 250;
  domain.x0Shp = 1000;
  domain.rotationShp = 12;
  AddOverlay<COverlayBMPKvf>(kForegroundOverlays, COverlayItemKvf::kImage, "map.png").BMP_X0 = 12.6;
  AddOverlay<COverlayGridKvf>(kBackgroundOverlays, COverlayItemKvf::kGrid, "dem.nds2").Transparency = 0.25F;
  AddOverlay<COverlayShapeKvf>(kBackgroundOverlays, COverlayItemKvf::kShape, "lakes.shp").LineColor = {1, 2, 3};
  AddOverlay<COverlayShapeKvf>(kBackgroundOverlays, COverlayItemKvf::kShape, "hidden.shp").Display = 0;
  document.Root().Important(kBackgroundOverlays)->AddItem()->Type = COverlayItemKvf::kWell;

  CTvnFlowModelData data;
  EXPECT_TRUE(Ask(kAskDomain, data));
  EXPECT_EQ(data.nx, 0);  // nobody has handed a file over
  document.Global().Requests.domain = true;
  EXPECT_TRUE(Ask(kAskLayers, data));  // another request
  EXPECT_EQ(data.nx, 0);
  EXPECT_TRUE(Ask(kAskDomain, data));
  EXPECT_EQ(std::tuple(data.nx, data.ny, data.CellSize, data.x0, data.Rotation),
            std::tuple(30, 20, 250.0, 1000.0, 12.0));
  ASSERT_EQ(data.ForegroundOverlays.size(), 1U);
  EXPECT_EQ(data.ForegroundOverlays[0].BMPX0, 13);
  ASSERT_EQ(data.BackgroundOverlays.size(), 2U);
  EXPECT_EQ(data.BackgroundOverlays[0].GridTransparency, 0.25F);
  EXPECT_EQ(data.BackgroundOverlays[1].ShapeLineColor, 0x030201U);
  ASSERT_EQ(host.Sent().size(), 1U);
  EXPECT_EQ(host.Sent()[0].wParam, kDomainData);
  EXPECT_EQ(std::get<CTvnFlowModelData*>(host.Sent()[0].lParam), &data);

  Ask(kAskDomain, data);
  EXPECT_EQ(host.Sent().size(), 1U);
  EXPECT_FALSE(AnswerEditor(document, {kFrameMessage, 99}, host));
  EXPECT_FALSE(AnswerEditor(document, {"Other", kAskDomain, &data}, host));
}

TEST_F(EditorExchange, LayersComeFromTheSetupAndFromTheReport) {
  auto& topography = *document.Root().Important(kTopography);
  topography.FixedValue = 40;
  auto& layers = *document.Root().Important(kGeologicalLayers);
  layers.SetItemCount(2, 1);
  CData2DKvf& level = *PropertyOf(*layers.GetItem(1), "LowerLevel");
  level.FixedValue = -12;
  level.RelativeToGround = 1;
  auto& lenses = *document.Root().Important(kGeologicalLenses);
  lenses.SetItemCount(2, 1);
  PropertyOf(*lenses.GetItem(2), "HorBoundary")->FixedValue = 7;

  // Of each layer of the file its number from the bottom.
  NewDataFile content;
  content.dimensions = 3;
  content.geometry = FileGeometryOf(GridGeometry{2, 1, 100, 0, 0, 0, {}});
  content.geometry.nz = 3;
  content.items = {{"levels", quantity::kElevation, 1000}};
  content.hasTime = false;
  DataFileWriter writer;
  test::Require(writer.Create(folder.File("karup_results_levels.nds3"), content));
  test::Require(writer.Put(1, std::vector<float>{0, 0, 1, 1, 2, 2}));
  test::Require(writer.Finish().error);
  test::WriteGrid(folder.File("ground.nds2"), {2, 1, 100, 0, 0, 0, {}}, {50, 51}, quantity::kElevation);
  const std::string topographySection = "section Topography {\nFilename = file \"../ground.nds2\"\nItemNo = 1\n}\n";
  const auto report = [&](const std::string& levels) {
    folder.Write("karup_results/karup_PreProcessed.kvf", "target Extra_Data {\n" + topographySection + levels + "}\n");
  };
  const std::string levels =
      "section LowerLevel {\nSZ_Included = 1\nFilename = file \"../karup_results_levels.nds3\"\nItemNo = 1\n"
      "NumberOfLayers = 3\n}\n";

  const auto ask = [&] {
    CTvnFlowModelData data;
    document.Global().Requests.layers = true;
    Ask(kAskLayers, data);
    return data;
  };
  report(levels);
  const CTvnFlowModelData data = ask();
  EXPECT_EQ(data.Topography.at(0).FixedValue, 40);
  ASSERT_EQ(data.GeoLayers.size(), 2U);
  EXPECT_EQ(data.GeoLayers[0].FixedValue, -12);
  EXPECT_EQ(data.GeoLayers[0].RelativeToGround, 1);
  EXPECT_EQ(data.GeoLayers[0].Name, layers.GetItem(1)->GetTitle());
  ASSERT_EQ(data.LenseLayers.size(), 6U);
  EXPECT_EQ(data.LenseLayers[3].FixedValue, 7);
  EXPECT_EQ(data.CalculatedTopography.at(0).GridData->Value(1, 0), 51);
  std::vector<float> bottoms;
  for (const auto& layer : data.CalculatedGeoLayers) bottoms.push_back(layer.GridData->Value(0, 0));
  EXPECT_THAT(bottoms, ElementsAre(2, 1, 0));
  EXPECT_EQ(host.Sent().back().wParam, kLayers);

  // What is missing ends the calculated layers, and nothing else.
  const struct {
    std::string levels;
    std::size_t layers;
  } cases[] = {{"", 0},
               {"section LowerLevel {\nSZ_Included = 0\n}\n", 0},
               {levels.substr(0, levels.find("../")) + "gone.nds3\"\nItemNo = 1\nNumberOfLayers = 3\n}\n", 0}};
  for (const auto& row : cases) {
    report(row.levels);
    const CTvnFlowModelData rest = ask();
    EXPECT_EQ(rest.CalculatedTopography.size(), 1U);
    EXPECT_EQ(rest.CalculatedGeoLayers.size(), row.layers);
    EXPECT_EQ(rest.GeoLayers.size(), 2U);
  }
  report("section {\n");
  host.Expect("karup_PreProcessed.kvf", Host::Answer::Ok);
  host.Expect("Syntax error in file :\n" + folder.File("karup_results/karup_PreProcessed.kvf"), Host::Answer::Ok);
  EXPECT_EQ(ask().CalculatedTopography.size(), 0U);
  EXPECT_TRUE(host.IsDone());
}

TEST_F(EditorExchange, TheListOfLayersHoldsHiddenOnesAndCountsOverBothLists) {
  auto& image = AddOverlay<COverlayBMPKvf>(kForegroundOverlays, COverlayItemKvf::kImage, "map.png");
  image.Display = 0;
  image.BMP_TransparentColor = 0x030201;
  AddOverlay<COverlayGridKvf>(kBackgroundOverlays, COverlayItemKvf::kGrid, "dem.nds2");
  auto& shape = AddOverlay<COverlayShapeKvf>(kBackgroundOverlays, COverlayItemKvf::kShape, "lakes.shp");
  shape.ItemDescr = "NAME";
  shape.ShowPointText = 1;
  shape.LineTextColor = {7, 8, 9};
  Window window;
  EXPECT_TRUE(AnswerEditor(document, {kFrameMessage, kAskOverlayList, static_cast<MessageReceiver*>(&window)}, host));
  const std::string path = folder.Path();
  EXPECT_EQ(window.text,
            "target FLUVANE_Network_Editor {\n"
            "  section LAYER_FILES {\n"
            "    DataFileName = 1, file \"" +
                path +
                "/lakes.shp\"\n"
                "    AxisUnit = 1000\n"
                "    section PROPERTIES {\n"
                "      section Quarzel_Shape_Polygon_Object {\n"
                "        Base_Title = \"Shape overlay\"\n"
                "        Base_Reg_Key = \"\"\n"
                "        Base_Col_Red = 0\n"
                "        Base_Col_Green = 0\n"
                "        Base_Col_Blue = 0\n"
                "        Base_Display_On = true\n"
                "        Line_Thickness = 0.3f\n"
                "        Line_Style = 0\n"
                "        Line_Polygon_Style = 0\n"
                "        Draw_Text = true\n"
                "        Text_Color_Style = 0\n"
                "        Text_Color = 7, 8, 9\n"
                "        Text_Bk_Mode = 1\n"
                "      }\n"
                "      OverlayDrawingOrder = 0\n"
                "    }\n"
                "    DataFileName = 0, file \"" +
                path +
                "/map.png\"\n"
                "    AxisUnit = 0\n"
                "    section PROPERTIES {\n"
                "      x0 = 0.0\n"
                "      y0 = 0.0\n"
                "      x1 = 10000.0\n"
                "      y1 = 10000.0\n"
                "      DisplayStyle = 0\n"
                "      TransparentColor = 1, 2, 3\n"
                "      OverlayDrawingOrder = 1\n"
                "    }\n"
                "  }\n"
                "}\n");
}

}  // namespace
}  // namespace tervane::editor_exchange_test
