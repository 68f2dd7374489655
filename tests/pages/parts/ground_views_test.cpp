// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/ground_views.h"

#include <stdexcept>

#include <gmock/gmock.h>

#include "forms/plots.h"
#include "forms/section_profile.h"
#include "forms/table_form.h"
#include "platform/item_types.h"
#include "simspec/model_components.h"
#include "spatial/domain.h"
#include "subsurface/geology.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/two_layer_soils.h"
#include "subsurface/unsaturated_zone.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::ground_views_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

/// Two layers and a lens below a level ground of 100 m, without soils.
class GroundViewsTest : public testing::Test {
 public:
  CFlowModelDoc document;
  CSatZoneKvf& zone = *document.Root().Important(kSaturatedZone);
  CGeoLayerSZKvf& layers = *document.Root().Important(kGeologicalLayers);

  GroundViewsTest() {
    document.Root().Important(kDomain)->GridFile().Choose(FileName("domain.nds2", "/setups"));
    document.Root().Important(kTopography)->FixedValue = 100;
    document.Root().Important(kModelComponents)->UZ = 0;
    layers.SetItemCount(2, 1);
    Put(*layers.GetItem(1), "Sand", "LowerLevel", -20, true);
    Put(*layers.GetItem(2), "Clay", "LowerLevel", 50, false);
    CGeoLenseSZItemKvf& lense = *document.Root().Important(kGeologicalLenses)->AddItem();
    Put(lense, "Peat", "UpperLevel", 95, false);
    Put(lense, "Peat", "LowerLevel", 90, false);
    PropertyOf(lense, "HorBoundary")->FixedValue = 1;
  }
  static void Put(NamedItemKvf& item, const char* name, const char* level, float value, bool isRelative) {
    item.Name = name;
    CData2DKvf& quantity = *PropertyOf(item, level);
    quantity.FixedValue = value;
    quantity.RelativeToGround = isRelative ? 1 : 0;
  }
};

/// What a page shows of that kind.
Control& The(test::PageDriver& page, ControlKind kind) {
  Control* found = nullptr;
  page.Page().Form().ForEach([&](Control& control) {
    if (control.kind == kind && control.label.empty()) found = &control;
  });
  if (!found) throw std::runtime_error("there is no such control");
  return *found;
}

TEST_F(GroundViewsTest, AColumnHasAllThatLiesBelowAPlace) {
  Put(*layers.GetItem(2), "Clay", "LowerLevel", 90, false);
  test::PageDriver page(document, "SaturatedZone");
  TableForm& table = *The(page, ControlKind::Table).table;
  page.Find("Show Column").press();
  The(page, ControlKind::Map).map().request->taken({{5, 5}});
  table.Follow();
  EXPECT_THAT(page.Text(), HasSubstr("At 5, 5: ground 100 m"));
  const auto row = [&](int number) {
    std::string cells;
    for (int column = 1; column <= 7; ++column) cells += (column > 1 ? " " : "") + table.ShownCell(number, column);
    return cells + " " + table.ShownCell(number, table.ColumnCount());
  };
  EXPECT_EQ(row(1), "Layer Sand 100 80 20 0.0001 0.0001 ");
  EXPECT_EQ(row(2), "Layer Clay 80 90 -10 0.0001 0.0001 Its level lies above the one above it.");
  EXPECT_EQ(row(3), "Lens Peat 95 90 5 0.0001 0.0001 ");

  // With units the parameters are theirs.
  zone.ParameterDistribution = CSatZoneKvf::kByUnits;
  PropertyOf(*layers.GetItem(1), "GeoUnit")->FixedValue = 7;
  auto* unit = zone.Child<CGeoUnitsSZListKvf>()->AddItem();
  unit->SoilCode = 7;
  unit->HorConduc = 0.5f;
  page.Find("Show Column").press();
  The(page, ControlKind::Map).map().request->taken({{5, 5}});
  table.Follow();
  EXPECT_EQ(table.ShownCell(1, 6), "0.5");
  EXPECT_EQ(table.ShownCell(2, table.ColumnCount()), "No unit has this code. Its level lies above the one above it.");
}

/// The same with soils of a library in two profiles, by codes on cells of 100 m: 1 in the west, 2 in the east.
class GroundViewsWithSoils : public GroundViewsTest {
 public:
  test::TempFolder folder;
  CUnsatzoneKvf& unsaturated = *document.Root().Important(kUnsaturatedZone);
  CodedZonesKvf& profiles = *unsaturated.Child<CUZSoilProfileKvf>();

  GroundViewsWithSoils() {
    folder.Write("a.uzs",
                 "target TERVANE_SOILS {\nsection Soil_1 {\nName = \"Loam\"\n"
                 "Retention = \"van Genuchten\", 0.43, 0.078, 3.6, 1.56\nConductivity = \"Mualem\", 2e-6, 0.5\n"
                 "BulkDensity = 1500.0\n}\n}\n");
    test::WriteGrid(folder.File("codes.nds2"), {4, 1, 100, 0, 0, 0, "NON-UTM"}, {1, 1, 2, kUsualDeleteValue},
                    quantity::kCode);
    document.Root().Important(kModelComponents)->UZ = 1;
    document.Root().Important(kModelComponents)->UZ_ModelType = kRichardsEquation;
    profiles.DistributionType = CodedZonesKvf::kDistributed;
    profiles.Type = CodedZonesKvf::kGridCodes;
    profiles.GridFile().Choose(FileName("codes.nds2", folder.Path()));
    profiles.SyncZones();
    Profile(1).SetStationName("Meadow");
    AddSoil(Profile(1), 1, "Loam", 2);
    AddSoil(Profile(2), 1, "Gravel", 5);
  }
  CUZSoilProfilePropKvf& Profile(int code) {
    return dynamic_cast<CUZSoilProfilePropKvf&>(*profiles.SelectZoneByCode(code));
  }
  void AddSoil(CUZSoilProfilePropKvf& profile, int number, const char* name, float depth) {
    profile.Soils().SetItemCount(number, 1);
    CUZSoilProfilePropLayerItemKvf& soil = *profile.Soils().GetItem(number);
    soil.DataBase = FileName("a.uzs", folder.Path());
    soil.SoilID = name;
    soil.Depth = depth;
  }
};

TEST_F(GroundViewsWithSoils, AColumnBeginsWithTheSoilsOfItsPlace) {
  test::PageDriver page(document, "SaturatedZone");
  TableForm& table = *The(page, ControlKind::Table).table;
  const auto probe = [&](double x) {
    page.Find("Show Column").press();
    The(page, ControlKind::Map).map().request->taken({{x, 50}});
    table.Follow();
    std::string text;
    for (int row = 1; row <= table.RowCount() && table.ShownCell(row, 1) == "Soil"; ++row)
      for (const int column : {2, 3, 4, 7, 10, 11}) text += table.ShownCell(row, column) + "|";
    return text;
  };
  AddSoil(Profile(1), 2, "Silt", 3);
  EXPECT_EQ(probe(150), "Loam|100|98|2e-06|Meadow||Silt|98|97||Meadow|No library has the soil.|");
  EXPECT_THAT(page.Text(), HasSubstr("At 150, 50: ground 100 m, soil Meadow"));
  EXPECT_EQ(probe(250), "Gravel|100|95||Grid code = 2|No library has the soil.|");
  EXPECT_EQ(probe(350), "");  // no code
  EXPECT_EQ(probe(-50), "");  // off the grid

  document.Root().Important(kModelComponents)->UZ_ModelType = kTwoLayer;
  EXPECT_EQ(probe(150), "Global|100||1e-05|Global||");
  document.Root().Important(kModelComponents)->UZ = 0;
  EXPECT_EQ(probe(150), "");
}

TEST_F(GroundViewsWithSoils, ASectionShowsWhereSoilsEnd) {
  test::PageDriver page(document, "SaturatedZone/GeoLayersSZ");
  const Control& section = The(page, ControlKind::Section);
  page.Find("Draw Section").press();
  The(page, ControlKind::Map).map().request->taken({{50, 50}, {350, 50}});
  const auto bottoms = [&] {
    const SectionProfile profile = ProfileOf(Finished(section.section), 100);
    for (const auto& curve : profile.curves)
      if (curve.name == "Bottom of soils" || curve.name == "ET Surface Depth") return curve.heights;
    return std::vector<double>();
  };
  // Whole cells have the depth of their profile.
  EXPECT_THAT(bottoms(), ElementsAre(98, 98, 95, testing::IsNan()));
  Profile(2).Soils().GetItem(1)->Depth = 10;
  EXPECT_THAT(bottoms(), ElementsAre(98, 98, 90, testing::IsNan()));
  profiles.DistributionType = CodedZonesKvf::kUniform;
  EXPECT_THAT(bottoms(), testing::Each(98));
  // Soils of two layers have no depth: what plants reach stands for it.
  document.Root().Important(kModelComponents)->UZ_ModelType = kTwoLayer;
  unsaturated.EtSurfaceDepth().FixedValue = 0.5f;
  EXPECT_THAT(bottoms(), testing::Each(99.5));
  document.Root().Important(kModelComponents)->UZ = 0;
  EXPECT_THAT(bottoms(), testing::IsEmpty());
}

TEST_F(GroundViewsTest, WithoutAnythingForAMapThereIsNone) {
  document.Root().Important(kDomain)->GridFile().Choose(FileName());
  test::PageDriver page(document, "SaturatedZone/GeoLensesSZ");
  EXPECT_FALSE(page.Find("Draw Section").IsShown());
  document.Root().Important(kTopography)->Type = CData2DKvf::kXyzFile;
  EXPECT_TRUE(page.Find("Draw Section").IsShown());
}

TEST_F(GroundViewsTest, LevelsOfferBothOnTheirOwnMap) {
  const test::TempFolder folder;
  test::WriteGrid(folder.File("level.nds2"), {4, 1, 100, 0, 0, 0, "NON-UTM"}, {90, 80, 70, 60}, quantity::kElevation);
  CData2DKvf& level = *PropertyOf(*layers.GetItem(1), "LowerLevel");
  EXPECT_FALSE(
      test::PageDriver(document, "SaturatedZone/GeoLayersSZ/Layer_1/LowerLevel").Find("Show Column").IsShown());
  level.Type = CData2DKvf::kGridFile;
  level.RelativeToGround = 0;
  level.GridFile().Choose(FileName("level.nds2", folder.Path()));
  test::PageDriver page(document, "SaturatedZone/GeoLayersSZ/Layer_1/LowerLevel");
  page.Find("Draw Section").press();
  The(page, ControlKind::Map).map().request->taken({{50, 50}, {350, 50}});
  const SectionProfile profile = ProfileOf(Finished(The(page, ControlKind::Section).section), 100);
  EXPECT_THAT(profile.bands.at(0).bottom, ElementsAre(90, 80, 70, 60));
  for (const char* other : {"SaturatedZone/GeoLayersSZ/Layer_1/HorHydrCon", "Topography"})
    EXPECT_THROW(test::PageDriver(document, other).Find("Draw Section"), std::runtime_error) << other;
}

TEST_F(GroundViewsTest, ASectionShowsLayersLensesAndWhereLevelsCross) {
  test::PageDriver page(document, "SaturatedZone");
  const Control& section = The(page, ControlKind::Section);
  EXPECT_FALSE(section.IsShown());
  page.Find("Draw Section").press();
  The(page, ControlKind::Map).map().request->taken({{0, 0}, {1000, 0}});
  ASSERT_TRUE(section.IsShown());
  const auto profile = [&] { return ProfileOf(Finished(section.section), 500); };
  const SectionProfile whole = profile();
  EXPECT_THAT(whole.ground, ElementsAre(100, 100, 100));
  EXPECT_THAT(whole.bands[0].bottom, ElementsAre(80, 80, 80));
  EXPECT_THAT(whole.bands[1].bottom, ElementsAre(50, 50, 50));
  EXPECT_THAT(whole.lenses.at(0).top, ElementsAre(95, 95, 95));
  EXPECT_THAT(whole.bands[1].crossing, testing::Each(testing::IsNan()));
  Put(*layers.GetItem(2), "Clay", "LowerLevel", 90, false);
  EXPECT_THAT(profile().bands[1].crossing, ElementsAre(80, 80, 80));
  Put(*layers.GetItem(2), "Clay", "LowerLevel", 79.9f, false);
  EXPECT_THAT(profile().bands[1].thin, testing::Each(testing::DoubleNear(79.9, 0.001)));
}

}  // namespace
}  // namespace tervane::ground_views_test
