// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/feature_rules.h"

#include <gtest/gtest.h>

namespace tervane::feature_rules_test {
namespace {

using namespace feature;
// Methods of components bear these names, too.
using feature::kLinearReservoir;
using feature::kTwoLayer;

TEST(FeatureRules, TheFirstBrokenRuleIsTold) {
  const RequirementMask soil = kUnsaturated | kEvapotranspiration;
  struct Case {
    RequirementMask logicals;
    const char* error;
  };
  const Case cases[] = {
      {kSnowMelt, "Snowmelt requires ET"},
      {kSnowMelt | soil | kCanopyEnergy, "SVAT does not yet support snowmelt."},
      {kSnowMelt | kEvapotranspiration | kTwoLayer, ""},
      {kEvapotranspiration, "ET requires UZ"},
      {kCanopyEnergy | kTwoLayer, "SVAT requires multi-layer UZ"},
      {kCanopyEnergy | kUnsaturated, ""},
      {kIrrigation | kUnsaturated, "Irrigation requires UZ and ET"},
      {kIrrigation | kEvapotranspiration | kTwoLayer, ""},
      {kOverland | kSimpleOverland, "Can not store OC if storing simple overland"},
      {kMultiCell, "Multi-Cell requires OC"},
      {kLinearReservoir | kSaturated, "Can not store Linear reservoir if storing distributed SZ"},
      {kCropGrowth | kEvapotranspiration | kTwoLayer, "Cropgrowth requires ET and multi-layer UZ"},
      {kCropGrowth | soil, ""},
      {kErosion, "Erosion requires OC"},
      {kClogging | kTwoLayer, "Clogging requires SZ or multi-layer UZ"},
      {kClogging | kUnsaturated, ""},
      {kSaturatedDrainage, "SZ-Drainage requires SZ"},
      {kOverlandDrainage, "OL-Drainage requires OL"},
      {kExtraction, "Extraction requires SZ"},
      {kExtraction | kLinearReservoir, ""},
      {kGeneralHeadBoundary | kLinearReservoir, "GHB requires SZ"},
      {kBypass, "Bypass requires UZ"},
      {kBypass | kTwoLayer, ""},
      {kInundation, "Inundation requires River included"},
      {kRechargeByLayers, "Storing of 3D recharge requires SZ"},
      {kRechargeByLayers | kSaturated | kTwoLayer, "Storing of 3D recharge not possible when UZ is included"},
      {kRechargeByLayers | kSaturated | kUnsaturated, "Storing of 3D recharge not possible when UZ is included"},
      {kRechargeByLayers | kSaturated, ""},
      {kSaturatedToUrban, "Storing of SZ flow to PIPRA requires SZ"},
      {kOverlandToUrban, "Storing of OL flow to PIPRA requires OL"},
      {kErosion | kInundation | kMultiCell, "Multi-Cell requires OC"},  // the first of three
  };
  for (const Case& one : cases)
    EXPECT_EQ(MaskOfLogicals(kWaterMovement, one.logicals).error, one.error) << one.logicals.Text();
}

TEST(FeatureRules, DrainageBringsItsRoute) {
  const auto withRoute = [](RequirementMask logicals) {
    const auto mask = MaskOfLogicals(kWaterMovement | kSeriesOnly, logicals);
    EXPECT_TRUE(mask.value.Contains(logicals | kWaterMovement | kSeriesOnly)) << mask.error;
    return mask.value.Contains(kDrainageRoute);
  };
  EXPECT_TRUE(withRoute(kOverland | kOverlandDrainage));
  EXPECT_TRUE(withRoute(kSaturated | kSaturatedDrainage | kPaved));
  EXPECT_FALSE(withRoute(kSaturated | kSaturatedDrainage));
  EXPECT_EQ((kSaturated | kSnowMelt | kDrainageRoute).Text(), "SM+SZ+DrainageRoute");
}

}  // namespace
}  // namespace tervane::feature_rules_test
