// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "overlays/overlays.h"

#include <gmock/gmock.h>

#include "tests/support/setup.h"

namespace tervane::overlays_test {
namespace {

using test::SetupText;
using test::ValueOf;

TEST(Overlays, AnItemIsCalledByItsKindItsFileAndWhetherItIsShown) {
  CFlowModelDoc document;
  COverlayItemKvf item(&document.Root());
  const FileName file("maps/soil.nds2", "/data");
  item.Child<COverlayBMPKvf>()->Filename = file;
  item.Child<COverlayGridKvf>()->GridFile().Choose(file);
  const struct {
    int type, display;
    const char* title;
  } cases[] = {{1, 1, "Image: soil.nds2"}, {1, 0, "Disabled Image: soil.nds2"}, {2, 1, "Grid: soil.nds2"},
               {3, 1, "Shape: Unknown"},   {4, 0, "Disabled River: Unknown"},   {5, 1, "Well: Unknown"}};
  for (const auto& c : cases) {
    item.Type = c.type;
    item.Layer()->Display = c.display;
    EXPECT_EQ(item.GetAbbreviatedTitle(), c.title);
  }
  item.Type = 6;
  EXPECT_EQ(item.Layer(), nullptr);
}

TEST(Overlays, ReadsWhatOldFilesHold) {
  const struct {
    const char *keys, *transparency;
  } cases[] = {{"Transparency = 0", "0.19"}, {"Transparency = 1", "0.25"},
               {"Transparency = 2", "0.38"}, {"Transparency = 4", "0.62"},
               {"Transparency = 7", "0.5"},  {"Transparency = 2\nTransparencyVal = 0.7f", "0.7"}};
  for (const auto& c : cases) {
    SCOPED_TRACE(c.keys);
    CFlowModelDoc document;
    const std::string grid = std::string("section Grid {\n") + c.keys + "\n}\n";
    const std::string text = SetupText(9, "section Overlays {\nsection Current_Layer {\n" + grid + "}\n}");
    ASSERT_TRUE(document.OpenText(text, "a.tvd"));
    EXPECT_EQ(ValueOf(document, "Overlays/Current_Layer/Grid:TransparencyVal"), c.transparency);
  }
}

TEST(Overlays, TheShownAreaFollowsTheDomainOrStays) {
  CFlowModelDoc document;
  auto& maps = *document.Root().Important(kOverlays);
  auto& domain = *document.Root().Important(kDomain);
  domain.Type = CCatchmentKvf::kShapeFile;
  domain.nxShp = 10;
  domain.nyShp = 20;
  domain.sizeShp = 5;
  domain.x0Shp = 100;
  domain.y0Shp = 200;
  document.Root().Validate();
  EXPECT_EQ((DataArea{maps.x0, maps.y0, maps.x1, maps.y1}), (DataArea{100, 200, 150, 300}));
  EXPECT_EQ(document.Global().GetMaxDataArea(), (DataArea{100, 200, 150, 300}));

  maps.UseModelDomain = 0;
  maps.SetArea({0, 0, 1000, 2000});
  domain.x0Shp = 0;
  document.Root().Validate();
  EXPECT_EQ(document.Global().GetMaxDataArea(), (DataArea{0, 0, 1000, 2000}));
  EXPECT_EQ(maps.x1, 1000);
}

}  // namespace
}  // namespace tervane::overlays_test
