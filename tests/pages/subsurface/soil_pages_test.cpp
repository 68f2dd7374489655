// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/soil_pages.h"

#include <gmock/gmock.h>

#include "forms/plots.h"
#include "forms/table_form.h"
#include "simspec/model_components.h"
#include "subsurface/two_layer_soils.h"
#include "subsurface/unsaturated_zone.h"
#include "tests/support/page_driver.h"

namespace tervane::soil_pages_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

class SoilPages : public testing::Test {
 protected:
  const std::string path_ = "Unsatzone/UZSoilProfiles/UZSoilProfileProp";
  CFlowModelDoc document_;
  CModelCompKvf& components_ = *document_.Root().Important(kModelComponents);
  CUnsatzoneKvf& zone_ = *document_.Root().Important(kUnsaturatedZone);
  CUZSoilProfilePropKvf& profile_ =
      dynamic_cast<CUZSoilProfilePropKvf&>(*FindNode(document_.Root(), ParseSetupPath(path_).steps));

  /// The text of all columns of a row.
  static std::vector<std::string> Row(test::PageDriver& page, int table, int row) {
    const TableForm* found = nullptr;
    page.Page().Form().ForEach([&](Control& control) {
      if (control.table && table-- == 1) found = control.table.get();
    });
    std::vector<std::string> cells;
    for (int column = 1; column <= found->ColumnCount(); ++column) cells.push_back(found->ShownCell(row, column));
    return cells;
  }
};

TEST_F(SoilPages, DepthsFollowFromTheRowsAbove) {
  profile_.Soils().SetItemCount(2, 1);
  profile_.Soils().GetItem(1)->Depth = 0.4f;
  profile_.Soils().GetItem(2)->Depth = 2;
  profile_.Soils().GetItem(2)->SoilID = "Clay";
  auto& cells = profile_.Cells();
  cells.SetItemCount(3, 1);
  cells.GetItem(2)->NoCells = 10;
  cells.GetItem(2)->CellHeight = 0.5f;
  cells.GetItem(3)->NoCells = 1;
  cells.GetItem(3)->CellHeight = 2;
  test::PageDriver page(document_, path_);
  EXPECT_THAT(Row(page, 1, 2), ElementsAre("0.4", "2", "Clay", "", "...", "Edit"));
  EXPECT_THAT(Row(page, 2, 3), ElementsAre("6", "8", "2", "1"));
  EXPECT_THAT(FormText(page.Page().Form()),
              HasSubstr("Soils: no soil to 0.4 m, Clay to 2 m; Cells: 5 x 0.2 to 1 m, 10 x 0.5 to 6 m, 1 x 2 to 8 m"));
  EXPECT_THAT(FormText(page.Page().Form()), HasSubstr("the soils end 2 m and the cells 8 m below ground"));
}

TEST_F(SoilPages, DispersivitiesStandThereWithTransportAlone) {
  test::PageDriver page(document_, path_);
  EXPECT_EQ(Row(page, 2, 1).size(), 4u);
  document_.Root().Important(kWaterQualityComponents)->UZ = 1;
  page.Page().Form().Follow();
  EXPECT_THAT(Row(page, 2, 1), ElementsAre("0", "1", "0.2", "5", "0"));
}

TEST_F(SoilPages, ASoilIsChosenInALibrary) {
  test::PageDriver page(document_, path_);
  page.Outside().Expect("soil", std::optional(Host::LibraryChoice{"/data/soils.uzs", "Loam"}));
  page.Page().Form().ForEach([&](Control& control) {
    if (control.table && control.table->ColumnCount() == 6) control.table->Press(1, 5);
  });
  EXPECT_TRUE(page.Outside().IsDone());
  const auto& layer = *profile_.Soils().GetItem(1);
  EXPECT_EQ(layer.SoilID, "Loam");
  EXPECT_EQ(layer.DataBase.Text(), "/data/soils.uzs");
}

TEST_F(SoilPages, MethodsDecideWhatCanBeChanged) {
  components_.UZ_ModelType = kTwoLayer;
  zone_.Bypass = CUnsatzoneKvf::kNoMacropores;
  test::PageDriver zone(document_, "Unsatzone"), soil(document_, "Unsatzone/TwoLayerUZSoilProperties/UZSoilProp");
  EXPECT_FALSE(soil.IsEnabled("Maximum bypass fraction"));
  EXPECT_FALSE(soil.IsEnabled("Soil Suction at wetting front"));
  EXPECT_FALSE(zone.IsEnabled("Max MP Infiltration per time step"));
  Control* bypass = nullptr;
  zone.Page().Form().ForEach([&](Control& control) {
    if (control.key == "Bypass") bypass = &control;
  });
  ASSERT_TRUE(bypass);
  EXPECT_TRUE(bypass->IsOptionEnabled(1));
  EXPECT_FALSE(bypass->IsOptionEnabled(2));
  EXPECT_EQ(zone.Page().Enter(*bypass, "2"), "this option cannot be chosen here");
  EXPECT_EQ(zone.Page().Enter(*bypass, "1"), "");
  EXPECT_TRUE(soil.IsEnabled("Maximum bypass fraction"));
  zone_.USE_Green_And_Ampt = 1;
  EXPECT_TRUE(soil.IsEnabled("Soil Suction at wetting front"));
  components_.UZ_ModelType = kRichardsEquation;
  EXPECT_EQ(zone.Page().Enter(*bypass, "2"), "");
  EXPECT_TRUE(zone.IsEnabled("Max MP Infiltration per time step"));
  EXPECT_FALSE(zone.IsEnabled("Use Green and Ampt model for infiltration"));
}

}  // namespace
}  // namespace tervane::soil_pages_test
