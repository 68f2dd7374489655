// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>

#include "core/path.h"
#include "forms/plots.h"
#include "forms/table_form.h"
#include "overlays/overlays.h"
#include "pages/parts/backdrop.h"
#include "platform/item_types.h"
#include "simspec/model_components.h"
#include "subsurface/wells.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::overlay_pages_test {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

class Overlays : public testing::Test {
 protected:
  Overlays() {
    for (int type = COverlayItemKvf::kImage; type <= COverlayItemKvf::kWell; ++type) list.AddItem()->Type = type;
  }
  template <class Layer>
  Layer& At(int number) {
    return *list.GetItem(number)->Child<Layer>();
  }
  /// What a map shows of the list.
  std::vector<BackdropLayer> Drawn() {
    return Finished<MapContent>([this] {
             MapContent map;
             map.below = BuildPlotOverlays(list, map.awaited);
             return map;
           })
        .below;
  }

  test::TempFolder folder;
  CFlowModelDoc document;
  COverlayListKvf& list = *document.Root().Important(kForegroundOverlays);
};

TEST_F(Overlays, TheTableChangesKindAndDisplayOfLayers) {
  test::PageDriver page(document, "Overlays/Foreground");
  TableForm& table = *page.Find("").table;
  EXPECT_EQ(table.RowCount(), 5);
  EXPECT_EQ(table.ShownCell(3, 1), "Shape");
  EXPECT_EQ(table.Enter(1, 1, "3"), "");
  EXPECT_EQ(list.GetItem(1)->Type, COverlayItemKvf::kShape);
  EXPECT_EQ(table.Enter(1, 2, "0"), "");
  EXPECT_EQ(At<COverlayShapeKvf>(1).Display, 0);
  EXPECT_EQ(At<COverlayBMPKvf>(1).Display, 1);  // another kind has a mark of its own
  EXPECT_TRUE(table.IsReadOnly(1, 3));
  At<COverlayShapeKvf>(1).Filename = FileName("maps/lakes.shp", folder.Path());
  EXPECT_EQ(table.ShownCell(1, 3), "maps/lakes.shp");
  EXPECT_EQ(list.GetItem(1)->GetAbbreviatedTitle(), "Disabled Shape: lakes.shp");
}

TEST_F(Overlays, EachKindHasItsPage) {
  const struct {
    int number;
    const char *control, *typed;
  } cases[] = {{1, "Image:", "a.png"},
               {2, "Transparency:", "37.5"},
               {3, "Attribute of texts:", "NAME"},
               {4, "River network file:", "a.fvnwk"},
               {5, "Well file:", "a.WEL"}};
  At<COverlayWellKvf>(5).SourceWellType = COverlayWellKvf::kOwnFile;
  for (const auto& row : cases) {
    test::PageDriver page(document, "Overlays/Foreground/OverlayItem_" + std::to_string(row.number));
    EXPECT_EQ(page.Enter(row.control, row.typed), "") << row.control;
    EXPECT_TRUE(page.Find("Display").IsEnabled());
  }
  EXPECT_EQ(At<COverlayGridKvf>(2).Transparency, 0.375F);
  test::PageDriver image(document, "Overlays/Foreground/OverlayItem_1");
  EXPECT_FALSE(image.IsEnabled("Transparent colour:"));
  At<COverlayBMPKvf>(1).BMP_DisplayStyle = kKeyedImage;
  EXPECT_TRUE(image.IsEnabled("Transparent colour:"));
  EXPECT_EQ(image.Enter("Transparent colour:", "#1f5fa8"), "");
  EXPECT_EQ(At<COverlayBMPKvf>(1).BMP_TransparentColor, 0xa85f1f);
  for (const char* none : {"red", "#12345", "#12345g", "#1234567", ""})
    EXPECT_THAT(image.Enter("Transparent colour:", none), HasSubstr("#1f5fa8")) << none;
  folder.Write("a.pngw",
               "target QUARZEL_Graphical_Images {\nsection World_Coordinates {\nx0 = 1.0\ny0 = 2.0\nx1 = 3.0\ny1 = "
               "4.0\n}\n}\n");
  image.Outside().Expect("", std::optional(folder.File("a.pngw")));
  image.Page().Press(image.Find("Import..."));
  EXPECT_EQ(At<COverlayBMPKvf>(1).BMP_Y1, 4);
  EXPECT_THAT(image.Changes(), Contains("1 Import Place of Image"));
}

TEST_F(Overlays, MapsDrawWhatIsShownAndCanBeRead) {
  EXPECT_THAT(Drawn(), IsEmpty());  // nothing has a file
  At<COverlayBMPKvf>(1).Filename = FileName(folder.Write("map.png", "pixels"), "");
  test::WriteGrid(folder.File("dem.nds2"), {2, 1, 100, 0, 0, 0, {}}, {1, 2}, quantity::kElevation);
  At<COverlayGridKvf>(2).GridFile().Choose(FileName(folder.File("dem.nds2"), ""));
  test::WriteShapes(folder.File("lakes.shp"), ShapeKind::Polygon, AttributeKind::Text, {std::string("Loch")});
  auto& lakes = At<COverlayShapeKvf>(3);
  lakes.Filename = FileName(folder.File("lakes.shp"), "");
  lakes.ItemDescr = "CODE";
  lakes.ShowLineText = 1;
  lakes.LineColor = {1, 2, 3};
  lakes.LineTextColorOption = kColorOfShape;
  lakes.LineTextBackground = 2;
  std::vector<BackdropLayer> layers = Drawn();
  std::vector<std::string> titles;
  for (const BackdropLayer& layer : layers) titles.push_back(layer.title);
  EXPECT_THAT(titles, Contains("Image: map.png"));
  EXPECT_THAT(titles, Contains("Grid: dem.nds2"));
  // What is beyond whole transparency has none.
  EXPECT_EQ(std::get<GridLayer>(layers.at(1).drawn).transparency, 0);
  const ShapeStyle style = *std::get<ShapeLayer>(layers.at(2).drawn).style;
  EXPECT_EQ(style.lineText, (TextStyle{true, 0x010203, false}));
  EXPECT_EQ(style.marker, kFilledCircleMarker);

  At<COverlayGridKvf>(2).Transparency = 0.25F;
  lakes.Display = 0;
  At<COverlayBMPKvf>(1).Filename = FileName(folder.File("gone.png"), "");
  layers = Drawn();
  EXPECT_THAT(layers.front().title, StartsWith("Grid"));
  EXPECT_EQ(std::get<GridLayer>(layers.front().drawn).transparency, 0.25);
}

TEST_F(Overlays, LayersOfTheSetupFollowIt) {
  auto& wells = At<COverlayWellKvf>(5);
  document.Root().Important(kWells)->Filename = FileName("/grid.WEL", "");
  document.Root().Important(kReservoirWells)->Filename = FileName("/reservoirs.WEL", "");
  int& method = document.Root().Important(kModelComponents)->SZ_ModelType;
  method = 0;
  EXPECT_EQ(wells.ShownFile().Text(), "/grid.WEL");
  method = 1;
  EXPECT_EQ(list.GetItem(5)->GetAbbreviatedTitle(), "Well: reservoirs.WEL");
  wells.SourceWellType = COverlayWellKvf::kOwnFile;
  EXPECT_EQ(list.GetItem(5)->GetAbbreviatedTitle(), "Well: Unknown");
}

}  // namespace
}  // namespace tervane::overlay_pages_test
