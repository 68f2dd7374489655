// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/unsaturated_zone.h"

#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "tests/simspec/test_setup.h"

namespace tervane::unsaturated_zone_test {
namespace {

using test::TestSetup;

class UnsaturatedZone : public testing::Test {
 protected:
  TestSetup setup_;
  CUnsatzoneKvf& zone_ = setup_.At<CUnsatzoneKvf>("Unsatzone");
  CModelCompKvf& components_ = setup_.At<CModelCompKvf>("SimSpec/ModelComp");
  int& engine_ = setup_.At<CBasicParaKvf>("SimSpec").ModelType;

  std::string Used() {
    std::string names;
    for (CYbSEKvfBase* child = zone_.GetFirstChild(); child; child = zone_.GetNextChild(child))
      if (child->IsDataUsedInSetup()) names += (names.empty() ? "" : " ") + child->GetSectionName();
    return names;
  }
};

TEST_F(UnsaturatedZone, EngineMethodAndOptionsDecideWhatTakesPart) {
  const struct {
    int engine, isOn, method, classification, initial;
    const char* used;
  } cases[] = {
      {kEngineTervane, 1, kTwoLayer, 0, 1, "TwoLayerUZSoilProperties ETSurfaceDepth"},
      {kEngineTervane, 0, kRichardsEquation, 0, 1, ""},
      {kEngineModflow96, 1, kRichardsEquation, 0, 1, ""},
      {kEngineTervane, 1, kRichardsEquation, 2, 0, "UZSoilProfiles"},
      {kEngineTervane, 1, kGravityFlow, 0, 1, "UZSoilProfiles UZGroundWaterDepthList Initial_Conditions"},
      {kEngineTervane, 1, kRichardsEquation, 1, 2, "UZSoilProfiles Initial_Conditions SpecifiedClassification"},
      {kEngineTervane, 1, kGravityFlow, 3, 0, "UZSoilProfiles UZGroundWaterDepthList PartialAutomatic"},
  };
  for (const auto& c : cases) {
    engine_ = c.engine;
    components_.UZ = c.isOn;
    components_.UZ_ModelType = c.method;
    zone_.ClassificationType = c.classification;
    zone_.InitialCondition = c.initial;
    EXPECT_EQ(Used(), c.used);
  }
}

TEST_F(UnsaturatedZone, FullMacroporeFlowNeedsColumns) {
  components_.UZ_ModelType = kRichardsEquation;
  zone_.Bypass = CUnsatzoneKvf::kFullMacroporeFlow;
  EXPECT_EQ(zone_.ValidateData(), 1);
  components_.UZ_ModelType = kTwoLayer;
  EXPECT_EQ(zone_.ValidateData(), 0);
  ASSERT_EQ(zone_.Findings().size(), 1u);
  EXPECT_EQ(zone_.Findings()[0].text, "Full Macropore Flow is only available with Richards- or Gravity UZ methods");
  EXPECT_EQ(setup_.Written("Unsatzone:Bypass"), "2");
}

TEST_F(UnsaturatedZone, ClassifiesForDepthsOfTheGroundwater) {
  const std::string list = "Unsatzone/UZGroundWaterDepthList";
  EXPECT_EQ(setup_.Written(list + "/UZGroundWaterDepth1:Depth"), "1f");
  EXPECT_FALSE(setup_.IsUsed(list + "/UZGroundWaterTable"));
  TestSetup read(
      "section Unsatzone {\nsection UZGroundWaterDepthList {\nNumberOfLayers = 2\n"
      "GroundWaterTableOption = 1\nsection UZGroundWaterDepth2 {\nDepth = 3f\n}\n"
      "section UZGroundWaterTable {\nRelativeToGround = 1\nFixedValue = -2f\n}\n}\n}");
  EXPECT_EQ(read.WrittenKeys(list), "YbSEKvfListItemCount=2 NumberOfLayers=2 GroundWaterTableOption=1");
  EXPECT_EQ(read.Written(list + "/UZGroundWaterDepth2:Depth"), "3f");
  EXPECT_EQ(read.Written(list + "/UZGroundWaterTable:RelativeToGround"), "1");
  EXPECT_TRUE(read.IsUsed(list + "/UZGroundWaterTable"));
}

}  // namespace
}  // namespace tervane::unsaturated_zone_test
