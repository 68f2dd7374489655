// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "overlays/dropped_layer.h"

#include <gmock/gmock.h>

#include "document/flow_model_document.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::dropped_layer_test {
namespace {

TEST(DroppedLayer, AFileBecomesALayerOfItsKind) {
  CFlowModelDoc document;
  test::ScriptedHost host;
  const test::TempFolder folder;
  const COverlayListKvf &above = *document.Root().Important(kForegroundOverlays),
                        &below = *document.Root().Important(kBackgroundOverlays);
  const struct {
    const char* name;
    int kind;
    bool isBelow;
  } cases[] = {{"Map.BMP", COverlayItemKvf::kImage, true},
               {"soil.nds2", COverlayItemKvf::kGrid, true},
               {"lakes.shp", COverlayItemKvf::kShape, false},
               {"skjern.fvnwk", COverlayItemKvf::kRiver, false},
               {"wells.WEL", COverlayItemKvf::kWell, false}};
  for (const auto& row : cases) {
    const std::string path = folder.File(row.name);
    const COverlayListKvf& list = row.isBelow ? below : above;
    const int before = list.GetItemCount();
    EXPECT_TRUE(IsLayerFile(path)) << row.name;
    // From any node of the setup.
    const COverlayItemKvf* item = AddLayerOf(*document.Root().GetFirstChild(), path, host);
    ASSERT_TRUE(item) << row.name;
    EXPECT_EQ(list.GetItemCount(), before + 1) << row.name;
    EXPECT_EQ(item->Type, row.kind) << row.name;
    EXPECT_EQ(item->Layer()->ShownFile().Absolute(), path) << row.name;
  }
  EXPECT_FALSE(IsLayerFile(folder.File("report.docx")));
  EXPECT_EQ(AddLayerOf(document.Root(), folder.File("report.docx"), host), nullptr);
}

TEST(DroppedLayer, AnImageLiesWhereTheFileBesideItTells) {
  CFlowModelDoc document;
  test::ScriptedHost host;
  const test::TempFolder folder;
  folder.Write("map.pngw",
               "target QUARZEL_Graphical_Images {\n  section World_Coordinates {\n    x0 = 1.0\n    y0 = 2.0\n    x1 = "
               "3.0\n    y1 = 4.0\n  }\n}\n");
  const auto corners = [&](const char* name) {
    const auto* image =
        dynamic_cast<const COverlayBMPKvf*>(AddLayerOf(document.Root(), folder.File(name), host)->Layer());
    return std::array{image->BMP_X0, image->BMP_Y0, image->BMP_X1, image->BMP_Y1};
  };
  EXPECT_EQ(corners("map.png"), (std::array{1.0, 2.0, 3.0, 4.0}));
  // As other programs call it. The size of the image is needed: here 4 x 2 pixels, of a kind that its bytes tell.
  folder.Write("photo.pgw", "10\n0\n0\n-10\n5\n45\n");
  std::string image("BM\x4e\0\0\0\0\0\0\0\x36\0\0\0\x28\0\0\0\x04\0\0\0\x02\0\0\0\x01\0\x18\0\0\0\0\0\x18\0\0\0", 38);
  image.resize(54, '\0');
  image.resize(78, '\x7f');
  folder.Write("photo.png", image);
  EXPECT_EQ(corners("photo.png")[0], 0);
  const Envelope domain = document.Root().Important(kDomain)->GetEnvelope();
  EXPECT_EQ(corners("other.png"), (std::array{domain.xMin, domain.yMin, domain.xMax, domain.yMax}));
}

}  // namespace
}  // namespace tervane::dropped_layer_test
