// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/computational_layers.h"

#include <gmock/gmock.h>

#include "simspec/model_components.h"
#include "spatial/data2d.h"
#include "spatial/zones.h"
#include "subsurface/saturated_zone.h"
#include "tests/simspec/test_setup.h"

namespace tervane::computational_layers_test {
namespace {

std::string Children(const CYbSEKvfBase& node) {
  std::string sections;
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
    sections += (sections.empty() ? "" : " ") + child->GetSectionName();
  return sections;
}

TEST(ComputationalLayers, OneListCountsAtMost) {
  test::TestSetup setup;
  auto& zone = setup.At<CSatZoneKvf>("SaturatedZone");
  auto& components = setup.At<CModelCompKvf>("SimSpec/ModelComp");
  const struct {
    int discretization, water;
    bool geology, own;
  } cases[] = {
      {0, 1, true, false}, {1, 1, false, false}, {2, 1, false, true}, {0, 0, false, false}, {2, 0, false, false}};
  for (const auto& c : cases) {
    zone.TypeOfVerDiscr = c.discretization;
    components.WM = c.water;
    EXPECT_EQ(zone.LayersOfGeology().IsDlgUsedInSetup() != 0, c.geology) << c.discretization;
    EXPECT_EQ(zone.OwnLayers().IsDlgUsedInSetup() != 0, c.own) << c.discretization;
    EXPECT_EQ(zone.OwnLayers().GetItem(1)->OuterBoundary().IsDlgUsedInSetup() != 0, c.water == 1);
  }
}

TEST(ComputationalLayers, HoldTheirConditionsInTheOrderOfTheFile) {
  test::TestSetup setup;
  const std::string conditions =
      "InitPotHead InitialSoilTemperature OuterBoundary HydrHeadUsedForAirFlow WettingThreshold InternalBoundary "
      "Initial_Concentration "
      "Initial_Immobile_Concentration Initial_NumberOfParticles PTRegistrationCodes";
  EXPECT_EQ(Children(setup.At<CYbSEKvfBase>("SaturatedZone/CompLayersGeoSZ/Layer_1")), conditions);
  EXPECT_EQ(Children(setup.At<CYbSEKvfBase>("SaturatedZone/CompLayersSZ/Layer_1")), "LowerLevel " + conditions);
  const auto& head = setup.At<CData2DKvf>("SaturatedZone/CompLayersSZ/Layer_1/InitPotHead");
  EXPECT_TRUE(head.HasRelativeToGround());
  EXPECT_EQ(head.RelativeToGround, 1);
  EXPECT_EQ(setup.WrittenKeys("SaturatedZone/CompLayersGeoSZ/Layer_1"),
            "Name=\"Aquifer\" ModLayAvg=0 ModLayCon=0 id=-1");
  EXPECT_EQ(setup.WrittenKeys("SaturatedZone/CompLayersSZ/Layer_1"), "Name=\"Aquifer\" id=-1");
}

constexpr const char* kLayers = R"(section SaturatedZone {
  section CompLayersGeoSZ {
    NumberOfLayers = 2
    section Layer_1 {
      Name = "Sand"
      ModLayAvg = 3
      id = 5
      section InternalBoundary {
        Type = 1
        NoInternalBoundaries = 2
        section InternalBoundaryProp {
          GridCode = "1"
        }
        section InternalBoundaryProp {
          GridCode = "2"
        }
      }
      section OuterBoundary {
        NumberOfBoundaryConditions = 2
        section OuterBoundaryProp_1 {
          Name = "North"
        }
        section OuterBoundaryProp_2 {
          Name = "South"
        }
      }
    }
    section Layer_2 {
      Name = "Clay"
    }
  }
})";

TEST(ComputationalLayers, AreReadOnceThoughTheZoneIsReadTwice) {
  test::TestSetup setup(kLayers);
  auto& layers = setup.At<CSatZoneKvf>("SaturatedZone").LayersOfGeology();
  ASSERT_EQ(layers.GetItemCount(), 2);
  EXPECT_EQ(layers.GetItemName(2), "Clay");
  EXPECT_EQ(layers.GetItem(1)->OuterBoundary().GetItemCount(), 2);
  EXPECT_EQ(ZoneItems(*layers.GetItem(1)->Child<CodedZonesKvf>()).size(), 2U);
  EXPECT_EQ(setup.WrittenKeys("SaturatedZone/CompLayersGeoSZ/Layer_1"), "Name=\"Sand\" ModLayAvg=3 ModLayCon=0 id=5");
}

TEST(ComputationalLayers, AnotherCountThanThatOfTheGeologyIsAWarningWhileTheyFollowIt) {
  test::TestSetup setup(kLayers);
  auto& zone = setup.At<CSatZoneKvf>("SaturatedZone");
  EXPECT_EQ(zone.ValidateData(), 1);
  ASSERT_EQ(zone.Findings().size(), 1U);
  EXPECT_EQ(zone.Findings()[0].severity, Severity::Warning);
  zone.TypeOfVerDiscr = CSatZoneKvf::kExplicitLevels;
  zone.Validate();
  EXPECT_THAT(zone.Findings(), testing::IsEmpty());
}

}  // namespace
}  // namespace tervane::computational_layers_test
