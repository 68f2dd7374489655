// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/geo_data.h"

#include <gmock/gmock.h>

#include "simspec/model_components.h"
#include "tests/support/setup.h"

namespace tervane::geo_data_test {
namespace {

const Data2DKind kConductivity{.className = "CGeoDataWM2DKvf",
                               .section = "HorHydrCon",
                               .title = "Horizontal Hydraulic Conductivity",
                               .itemType = quantity::kHydraulicConductivity};

/// A layer of the ground, which judges its two quantities together.
class Layer : public CTvnKvfBase, public GroundParameterDistribution {
 public:
  explicit Layer(CYbSEKvfBase* parent) : CTvnKvfBase("Layer", "Layer", parent) {}

  int type = 2;
  CGeoDataWM2DKvf* always = NewChild<CGeoDataWM2DKvf>(kConductivity, CGeoDataWM2DKvf::kAnyDistribution);
  CGeoDataWM2DKvf* byUnits = NewChild<CGeoDataWM2DKvf>(kConductivity, 0);

  const int& TypeOfGeoParaDistribution() const override { return type; }
  int ValidateData() override {
    const bool isWrong = always->FixedValue > 1;
    always->SetValidationMessage(isWrong ? "Too much" : "");
    if (isWrong) AddError("A quantity is too much");
    return !isWrong;
  }
};

TEST(GeoData, TakesPartByTheComponentsAndTheDistributionOfParameters) {
  CFlowModelDoc document;
  auto& layer = *document.Root().NewChild<Layer>();
  EXPECT_TRUE(layer.byUnits->IsDlgUsedInSetup());  // without a saturated zone parameters are as in a new setup
  document.Root().RegisterImportantNode(&layer, "SATZONE");
  for (const auto& [water, type, always, byUnits] :
       {std::tuple{1, 0, true, true}, {1, 2, true, false}, {0, 0, false, false}}) {
    document.Root().Important(kModelComponents)->WM = water;
    layer.type = type;
    EXPECT_EQ(layer.always->IsDlgUsedInSetup() != 0, always);
    EXPECT_EQ(layer.byUnits->IsDlgUsedInSetup() != 0, byUnits);
  }
}

TEST(GeoData, WhatItsParentFindsWrongIsAnErrorOfItsOwnAndToldOnce) {
  CFlowModelDoc document;
  auto& layer = *document.Root().NewChild<Layer>();
  EXPECT_TRUE(layer.Validate());
  layer.always->FixedValue = 3;
  EXPECT_FALSE(layer.Validate());
  ASSERT_EQ(layer.always->Findings().size(), 1U);
  EXPECT_EQ(layer.always->Findings()[0].text, "Too much");
  EXPECT_EQ(layer.Findings().size(), 1U);
  layer.always->FixedValue = 0;
  // Also where the quantity alone is validated.
  EXPECT_TRUE(layer.always->Validate());
}

}  // namespace
}  // namespace tervane::geo_data_test
