// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/reservoirs.h"

#include <gmock/gmock.h>

#include "simspec/model_components.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"
#include "tests/simspec/test_setup.h"

namespace tervane::reservoirs_test {
namespace {

using test::TestSetup;

TEST(Reservoirs, StandInThePlaceOfTheGridAndKeepTheirOwnWells) {
  TestSetup setup;
  auto& components = setup.At<CModelCompKvf>("SimSpec/ModelComp");
  const auto used = [&] {
    std::string names;
    for (const char* path : {"SaturatedZone", "SaturatedZone/Well", "SaturatedZoneSubCatchment",
                             "SaturatedZoneSubCatchment/SZShallowGWRoutingZones",
                             "SaturatedZoneSubCatchment/SZDeepGWRoutingZones", "SaturatedZoneSubCatchment/Well"})
      names += setup.At<CYbSEKvfBase>(path).IsDataUsedInSetup() ? '1' : '0';
    return names;
  };
  EXPECT_EQ(used(), "100000");
  setup.At<CSatZoneKvf>("SaturatedZone").Wells = 1;
  setup.At<CSatZoneKvf>("SaturatedZone").FractureWells = 1;
  EXPECT_EQ(used(), "110000");
  EXPECT_EQ(FractureWellsInUse(setup.Root()), 1);
  components.SZ_ModelType = kLinearReservoir;
  EXPECT_EQ(used(), "001110");
  EXPECT_EQ(FractureWellsInUse(setup.Root()), 0);
  setup.At<CSatZoneSubCatchmentKvf>("SaturatedZoneSubCatchment").Wells = 1;
  EXPECT_EQ(used(), "001111");
  EXPECT_EQ(FractureWellsInUse(setup.Root()), 1);
}

TEST(Reservoirs, ZonesAreReadAndWrittenWithTheirTwoReservoirsAndLinks) {
  TestSetup setup(
      "section SaturatedZoneSubCatchment {\nWells = 1\nsection SZShallowGWRoutingZones {\nNO_ZONES = 1\n"
      "section SZShallowGWRouting {\nProfileSecNumber = 8\nGRIDCODEID = \"7\"\nGRIDCODE = 3\nName = \"hill\"\n"
      "DepthReservoir = 9f\n}\n}\nsection SZDeepGWRoutingZones {\nNO_ZONES = 2\nsection SZDeepGWRouting {\n"
      "GRIDCODEID = \"forest\"\nDefaultRiverLinks = false\nsection Reservoir2 {\nThresholdPumping = 3f\n}\n"
      "section Riverlinks {\nNoofreaches = 1\nsection Riverlink_1 {\nBranchname = \"Rhone\"\n}\n}\n}\n}\n}");
  EXPECT_EQ(setup.WrittenKeys("SaturatedZoneSubCatchment"), "Wells=1");
  EXPECT_EQ(setup.WrittenKeys("SaturatedZoneSubCatchment/SZShallowGWRoutingZones/SZShallowGWRouting"),
            "ProfileSecNumber=1 GRIDCODEID=\"7\" GRIDCODE=7 Name=\"hill\" SpecificYield=0.3f InitialDepth=5f "
            "DepthReservoir=9f TimeConstantPercolation=14f ThresholdDepthInterflow=5f TimeConstantInterflow=14f");
  const std::string zone = "SaturatedZoneSubCatchment/SZDeepGWRoutingZones/SZDeepGWRouting";
  EXPECT_EQ(setup.WrittenKeys(zone),
            "ProfileSecNumber=1 GRIDCODEID=\"forest\" GRIDCODE=0 Name=\"\" FracPerc1=0.5f FracPump1=0.5f "
            "DefaultRiverLinks=false");
  EXPECT_EQ(setup.WrittenKeys(zone + "/Reservoir1"),
            "SpecificYield=0.3f TimeConstHFlow=365f GWDeadStorageFrac=0f UZFeedbackFrac=0.1f InitialDepth=20f "
            "ThresholdDepth=20f ThresholdPumping=20f DepthReservoir=20f");
  EXPECT_EQ(setup.WrittenKeys(zone + "/Reservoir2"),
            "SpecificYield=0.3f TimeConstHFlow=3650f GWDeadStorageFrac=0f UZFeedbackFrac=0.1f InitialDepth=50f "
            "ThresholdDepth=50f ThresholdPumping=3f DepthReservoir=50f");
  EXPECT_EQ(setup.Written(zone + "/Riverlinks/Riverlink_1:Branchname"), "\"Rhone\"");
  EXPECT_TRUE(setup.IsUsed(zone + "/Riverlinks"));
  setup.At<CSZDeepGWRoutingPropKvf>(zone).DefaultRiverLinks = true;
  EXPECT_FALSE(setup.IsUsed(zone + "/Riverlinks"));
}

}  // namespace
}  // namespace tervane::reservoirs_test
