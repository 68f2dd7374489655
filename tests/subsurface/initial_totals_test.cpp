// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/initial_totals.h"

#include <gmock/gmock.h>

#include "platform/item_types.h"
#include "spatial/domain.h"
#include "subsurface/computational_layers.h"
#include "subsurface/geology.h"
#include "subsurface/saturated_zone.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"
#include "tests/wqpt/quality_setup.h"
#include "wqpt/species.h"
#include "wqpt/species_entries.h"

namespace tervane::initial_totals_test {
namespace {

using test::QualitySetup;
using testing::DoubleNear;
using testing::HasSubstr;

constexpr float kEmpty = kUsualDeleteValue;

/// Two cells of 100 m in the domain, the ground at 0 m; sand down to -10 m, clay down to -30 m; one dissolved, one
/// sorbed species, and one without a phase.
class InitialTotals : public testing::Test {
 protected:
  InitialTotals() {
    test::WriteGrid(folder_.File("domain.nds2"), {3, 1, 100, 0, 0, 0, {}}, {1, 1, kEmpty}, quantity::kCode);
    auto& domain = *setup_.Root().Important(kDomain);
    domain.GridFile().Choose(FileName("domain.nds2", folder_.Path()));
    domain.Type = CCatchmentKvf::kGridFile;
    setup_.Root().Important(kTopography)->FixedValue = 0;
    At("SaturatedZone/GeoLayersSZ/Layer_1/LowerLevel").FixedValue = -10;
    At("SaturatedZone/GeoLayersSZ/Layer_2/LowerLevel").FixedValue = -30;
    At("SaturatedZone/GeoLayersSZ/Layer_1/Porosity").FixedValue = 0.5F;
    At("SaturatedZone/GeoLayersSZ/Layer_2/Porosity").FixedValue = 0.25F;
  }
  CData2DKvf& At(const std::string& path) { return setup_.At<CData2DKvf>(path); }
  CSatZoneKvf& Zone() { return setup_.At<CSatZoneKvf>("SaturatedZone"); }
  CData2DKvf& Of(int species, int layer = 1, const std::string& list = "CompLayersGeoSZ") {
    return At("SaturatedZone/" + list + "/Layer_" + std::to_string(layer) + "/Initial_Concentration/Species_" +
              std::to_string(species));
  }
  CellTotalsResult Added(CData2DKvf& quantity) {
    const auto totals = Zone().TotalsOf(quantity);
    EXPECT_TRUE(totals);
    CellTotalsResult result;
    EXPECT_EQ(AddUpCells(*totals, {}, result).error, "");
    text_ = TotalsText(*totals, result);
    return result;
  }

  test::TempFolder folder_;
  QualitySetup setup_{
      "section SimSpec { section ModelComp { WQ = 1; SZ = 1; } } section ModelCompWQ { SZ = 1; } section Species { "
      "NumberOfSpecies = 3; section Species_1 { Name = \"Salt\"; } section Species_2 { Name = \"Bound\"; Type = 1; } "
      "section Species_3 { Name = \"Any\"; Type = 3; } } section SaturatedZone { section GeoLayersSZ { NumberOfLayers "
      "= 2; } section CompLayersGeoSZ { NumberOfLayers = 2; } section CompLayersSZ { NumberOfLayers = 1; } }"};
  std::string text_;
};

TEST_F(InitialTotals, MassCountsWithThicknessAndPorosity) {
  // In grams per cubic metre; the second layer by cells, one of which is not known.
  Of(1).FixedValue = 2;
  test::WriteGrid(folder_.File("salt.nds2"), {2, 1, 100, 0, 0, 0, {}}, {4, kEmpty}, quantity::kConcentration);
  Of(1, 2).Type = CData2DKvf::kGridFile;
  Of(1, 2).GridFile().Choose(FileName("salt.nds2", folder_.Path()));
  const CellTotalsResult added = Added(Of(1));
  ASSERT_EQ(added.layers.size(), 2U);
  EXPECT_EQ(added.cells, 2U);
  EXPECT_THAT(added.layers[0].sum, DoubleNear(2e-3 * 0.5 * 10 * 2e4, 1e-6));
  EXPECT_THAT(added.layers[1].sum, DoubleNear(4e-3 * 0.25 * 20 * 1e4, 1e-6));
  EXPECT_EQ(added.layers[1].unknown, 1U);
  EXPECT_THAT(text_, HasSubstr("Initial mass of Salt: 200 kg in "));
  EXPECT_THAT(text_, HasSubstr(", 400 kg in all 2 layers. 1 cells are left out"));
  EXPECT_THAT(text_, HasSubstr("all pores full of water"));
}

TEST_F(InitialTotals, ALayerOfItsOwnTakesTheSharesOfTheGeologyThatItLiesIn) {
  Zone().TypeOfVerDiscr = CSatZoneKvf::kExplicitLevels;
  At("SaturatedZone/CompLayersSZ/Layer_1/LowerLevel").FixedValue = -20;
  Of(1, 1, "CompLayersSZ").FixedValue = 1;
  EXPECT_THAT(Added(Of(1, 1, "CompLayersSZ")).layers[0].sum, DoubleNear(1e-3 * (0.5 * 10 + 0.25 * 10) * 2e4, 1e-6));
  // The other list does not count.
  EXPECT_FALSE(Zone().TotalsOf(Of(1)));
  // Below the geology nothing is known.
  At("SaturatedZone/CompLayersSZ/Layer_1/LowerLevel").FixedValue = -40;
  EXPECT_EQ(Added(Of(1, 1, "CompLayersSZ")).layers[0].unknown, 2U);
}

TEST_F(InitialTotals, WhatIsSorbedCountsWithTheBulkDensityOfTheUnits) {
  Zone().ParameterDistribution = CSatZoneKvf::kByUnits;
  EXPECT_THAT(Zone().TotalsOf(Of(2))->layers[0].problem, HasSubstr("bulk density is not known"));
  auto& unit = *Zone().Units().AddItem();
  unit.SoilCode = 7;
  unit.BulkDensity = 2000;
  for (const char* layer : {"1", "2"})
    At(std::string("SaturatedZone/GeoLayersSZ/Layer_") + layer + "/GeoUnit").FixedValue = 7;
  Of(2).FixedValue = 1e-6F;
  EXPECT_THAT(Added(Of(2)).layers[0].sum, DoubleNear(1e-6 * 2000 * 10 * 2e4, 1e-3));
}

TEST_F(InitialTotals, MassOnTheGroundCountsWithTheAreaOfTheCells) {
  auto& masses = setup_.At<COverlandSpeciesKvf>("Overland/InitialMass");
  At("Overland/InitialMass/Species_1").FixedValue = 2;
  const auto text = [&](int species) {
    const auto totals = masses.TotalsOf(At("Overland/InitialMass/Species_" + std::to_string(species)));
    CellTotalsResult result;
    EXPECT_EQ(AddUpCells(*totals, {}, result).error, "");
    return TotalsText(*totals, result);
  };
  EXPECT_EQ(text(1), "Initial mass of Salt: 40 kg in the model area.");
  EXPECT_THAT(text(3), HasSubstr("not known in the model area, since its mass has no unit"));
}

TEST_F(InitialTotals, WhatHasNoTotalSaysWhy) {
  Added(Of(3));
  EXPECT_THAT(text_, HasSubstr("Initial mass of Any: not known in "));
  EXPECT_THAT(text_, HasSubstr("its concentration has no unit"));
  EXPECT_FALSE(Zone().TotalsOf(At("SaturatedZone/CompLayersGeoSZ/Layer_1/InitPotHead")));
}

TEST_F(InitialTotals, ParticlesAreCountedOverTheCellsOfTheDomain) {
  auto& particles = At("SaturatedZone/CompLayersGeoSZ/Layer_2/Initial_NumberOfParticles");
  test::WriteGrid(folder_.File("particles.nds2"), {3, 1, 100, 0, 0, 0, {}}, {10, 15, 100}, quantity::kCode);
  particles.Type = CData2DKvf::kGridFile;
  particles.GridFile().Choose(FileName("particles.nds2", folder_.Path()));
  At("SaturatedZone/CompLayersGeoSZ/Layer_1/Initial_NumberOfParticles").FixedValue = 3;
  const CellTotalsResult added = Added(particles);
  EXPECT_EQ(added.layers[0].sum, 6);
  EXPECT_EQ(added.layers[1].sum, 25);
  EXPECT_THAT(text_, HasSubstr("Initial number of particles: 25 in "));
  EXPECT_THAT(text_, HasSubstr(", 31 in all 2 layers."));
}

}  // namespace
}  // namespace tervane::initial_totals_test
