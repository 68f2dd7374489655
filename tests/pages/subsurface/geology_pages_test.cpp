// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/geology_pages.h"

#include <gmock/gmock.h>

#include "simspec/model_components.h"
#include "subsurface/computational_layers.h"
#include "subsurface/geology.h"
#include "subsurface/saturated_zone.h"
#include "tests/support/page_driver.h"

namespace tervane::geology_pages_test {
namespace {

class GeologyPages : public testing::Test {
 public:
  CFlowModelDoc document;
  CSatZoneKvf& zone = *document.Root().Important(kSaturatedZone);
  CGeoLayerSZKvf& layers = zone.Layers();
  CSZVerDiscrLayerGeoListKvf& computed = zone.LayersOfGeology();

  static std::string Names(const CYbSEItemNameSource& list, int count) {
    std::string names;
    for (int number = 1; number <= count; ++number) names += (number > 1 ? " " : "") + list.GetItemName(number);
    return names;
  }
  std::string Geology() const { return Names(layers, layers.GetItemCount()); }
  std::string Computed() const { return Names(computed, computed.GetItemCount()); }
};

TEST_F(GeologyPages, RowsOfLayersDriveTheComputationalLayersByNumber) {
  test::PageDriver page(document, "SaturatedZone/GeoLayersSZ");
  Control& table = page.Find("");
  page.Page().ChangeRows(table, RowAction::Insert, 0, 0);
  EXPECT_EQ(page.Page().EnterCell(table, 2, 1, "Clay"), "");
  page.Page().ChangeRows(table, RowAction::Insert, 1, 2);
  EXPECT_EQ(Geology(), "Layer Layer Aquifer Clay");
  EXPECT_EQ(Computed(), Geology());
  EXPECT_EQ(page.Page().EnterCell(table, 1, 1, "Sand"), "");
  computed.GetItem(4)->OuterBoundary().AddItem();
  page.Page().ChangeRows(table, RowAction::MoveUp, 3, 4);
  EXPECT_EQ(Geology(), "Sand Aquifer Clay Layer");
  EXPECT_EQ(Computed(), Geology());
  EXPECT_EQ(computed.GetItem(3)->OuterBoundary().GetItemCount(), 1);
  EXPECT_FALSE(page.Page().ChangeRows(table, RowAction::MoveUp, 1, 2));
  EXPECT_FALSE(page.Page().ChangeRows(table, RowAction::MoveDown, 3, 4));
  page.Page().ChangeRows(table, RowAction::Delete, 2, 3);
  EXPECT_EQ(Geology(), "Sand Layer");
  EXPECT_EQ(Computed(), Geology());
  EXPECT_EQ(zone.id, 5);  // none is given twice
}

TEST_F(GeologyPages, ListsThatDifferAreBroughtInStep) {
  layers.SetItemCount(3, 1);
  layers.GetItem(3)->Name = "Rock";
  test::PageDriver page(document, "SaturatedZone/GeoLayersSZ");
  page.Page().Press(page.Find("Bring in Step"));
  EXPECT_EQ(Computed(), "Aquifer Layer Rock");
  EXPECT_FALSE(page.Find("Bring in Step").IsShown());
  EXPECT_THAT(page.Changes(), testing::ElementsAre(testing::HasSubstr("Bring Layers in Step")));
}

TEST_F(GeologyPages, UnitsHaveColumnsForWhatTransportNeeds) {
  zone.ParameterDistribution = CSatZoneKvf::kByUnits;
  const auto columns = [&] {
    test::PageDriver page(document, "SaturatedZone/GeoUnitsSZProperties");
    return page.Find("").table->ColumnCount();
  };
  EXPECT_EQ(columns(), 6);
  document.Root().Important(kModelComponents)->WQ = 1;
  document.Root().Important(kModelComponents)->ADPTRadio = kParticleTracking;
  EXPECT_EQ(columns(), 7);
  zone.DispersionOption = CSatZoneKvf::kIsotropy;
  EXPECT_EQ(columns(), 9);
  zone.DispersionOption = CSatZoneKvf::kAnisotropy;
  EXPECT_EQ(columns(), 12);
}

}  // namespace
}  // namespace tervane::geology_pages_test
