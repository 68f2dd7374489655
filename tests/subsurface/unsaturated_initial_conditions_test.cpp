// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/unsaturated_initial_conditions.h"

#include <gmock/gmock.h>

#include "subsurface/unsaturated_zone.h"
#include "tests/simspec/test_setup.h"

namespace tervane::unsaturated_initial_conditions_test {
namespace {

using test::TestSetup;
using List = CUnSatInitConditionLayerListKvf;

const std::string kGroup = "Unsatzone/Initial_Conditions";
const std::string kPotential = kGroup + "/Initial_Matrix_Potential";

TEST(UnsaturatedInitialConditions, TheChosenQuantityTakesPart) {
  TestSetup setup;
  int& initial = setup.At<CUnsatzoneKvf>("Unsatzone").InitialCondition;
  for (const auto& [value, used] : {std::pair{0, "00"}, std::pair{1, "10"}, std::pair{2, "01"}}) {
    initial = value;
    std::string answers;
    for (const char* section : {"/Initial_Matrix_Potential", "/Initial_Water_Content"})
      answers += setup.IsUsed(kGroup + section) ? '1' : '0';
    EXPECT_EQ(answers, used);
  }
  EXPECT_FALSE(setup.IsUsed(kGroup + "/Initial_Soil_Temperature"));
}

TEST(UnsaturatedInitialConditions, LayersBearTheTitleAndQuantityOfTheirList) {
  TestSetup setup(
      "section Unsatzone {\nsection Initial_Conditions {\nsection Initial_Matrix_Potential {\n"
      "DistributionType = 1\nNumberOfLayers = 2\nsection Layer_2 {\nName = \"Peat\"\n"
      "section LayerData2DWQ {\nFixedValue = -3f\n}\n}\n}\n}\n}");
  auto& list = setup.At<List>(kPotential);
  EXPECT_EQ(setup.WrittenKeys(kPotential),
            "YbSEKvfListItemCount=2 DistributionType=1 Distribution_UniformValue=0.0 NumberOfLayers=2");
  EXPECT_EQ(setup.Written(kPotential + "/Layer_1:Name"), "\"Layer\"");
  auto& values = setup.At<CUnSatInitConLayerSubKvf>(kPotential + "/Layer_2/LayerData2DWQ");
  EXPECT_EQ(values.GetTitle(), "Initial Matrix Potential, Peat");
  list.GetItem(2)->Name = "Clay";
  EXPECT_EQ(values.GetTitle(), "Initial Matrix Potential, Clay");
  EXPECT_EQ(values.GetItemType(), quantity::kPressureHead);
  EXPECT_EQ(setup.Written(kPotential + "/Layer_2/LayerData2DWQ:FixedValue"), "-3f");
  EXPECT_TRUE(setup.IsUsed(kPotential + "/Layer_2"));
  list.DistributionType = List::kUniform;
  EXPECT_FALSE(setup.IsUsed(kPotential + "/Layer_2"));
}

TEST(UnsaturatedInitialConditions, AGridOfThreeDimensionsIsAskedForWhileItIsInUse) {
  TestSetup setup;
  auto& temperature = setup.At<List>(kGroup + "/Initial_Soil_Temperature");
  CUZData3DNdsFile& file = temperature.GridFile();
  EXPECT_EQ(file.ValidateData(), 1);
  temperature.DistributionType = List::kFullyDistributed;
  EXPECT_EQ(file.ValidateData(), 0);
  ASSERT_EQ(file.Findings().size(), 1u);
  EXPECT_EQ(file.Findings()[0].text, "File is not valid");
  const DataFileRequest request = file.SetUpNdsValidation();
  EXPECT_EQ(request.dimensions, 3);
  EXPECT_THAT(request.itemTypes, testing::ElementsAre(quantity::kTemperature));
  EXPECT_TRUE(temperature.MayBeFullyDistributed());
  for (const char* section : {"/Initial_Matrix_Potential", "/Initial_Water_Content"})
    EXPECT_FALSE(setup.At<List>(kGroup + section).MayBeFullyDistributed());
}

}  // namespace
}  // namespace tervane::unsaturated_initial_conditions_test
