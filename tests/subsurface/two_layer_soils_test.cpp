// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/two_layer_soils.h"

#include <gmock/gmock.h>

#include "tests/simspec/test_setup.h"

namespace tervane::two_layer_soils_test {
namespace {

TEST(TwoLayerSoils, AreWrittenWithTheirValuesAndReadAgain) {
  const std::string zones = "Unsatzone/TwoLayerUZSoilProperties";
  test::TestSetup setup(
      "section Unsatzone {\nsection TwoLayerUZSoilProperties {\nDistributionType = 1\nType = 2\nNO_SOIL_TYPES = 1\n"
      "section UZSoilProp {\nSoilSecNumber = 4\nGridCode = \"clay\"\nSoil_ID = \"Clay\"\nKint = 1e-7f\n}\n}\n}");
  EXPECT_EQ(setup.WrittenKeys(zones),
            "DistributionType=1 Type=2 ShapeAxisUnit=1000 ShapeGapFillName=\"\" NO_SOIL_TYPES=1");
  EXPECT_EQ(setup.WrittenKeys(zones + "/UZSoilProp"),
            "SoilSecNumber=1 GridCode=\"clay\" Soil_ID=\"Clay\" ThetaS=0.3f ThetaFC=0.1f ThetaWP=0.05f Kint=1e-7f "
            "BYP=0.3f THR1=0.1f THR2=0.05f SoilSuction=-0.2f");
  EXPECT_EQ(setup.At<CUZWetlandSoilPropKvf>(zones + "/UZSoilProp").GetAbbreviatedTitle(), "Clay");
}

TEST(TwoLayerSoils, ValuesThatContradictAreTold) {
  test::TestSetup setup;
  auto& soil = setup.At<CUZWetlandSoilPropKvf>("Unsatzone/TwoLayerUZSoilProperties/UZSoilProp");
  EXPECT_EQ(soil.Validate(), 1);
  EXPECT_THAT(soil.Findings(), testing::IsEmpty());
  soil.SoilSuction = 0.1f;
  soil.ThetaFC = 0.4f;
  EXPECT_EQ(soil.Validate(), 0);
  ASSERT_EQ(soil.Findings().size(), 2u);
  EXPECT_EQ(soil.Findings()[0].severity, Severity::Warning);
  EXPECT_EQ(soil.Findings()[1].text, "Soil suction at wetting front must be less than or equal 0.");
  soil.SoilSuction = 0;
  EXPECT_EQ(soil.Validate(), 1);
}

}  // namespace
}  // namespace tervane::two_layer_soils_test
