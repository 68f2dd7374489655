// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/feature_rules.h"

#include <algorithm>
#include <array>

namespace tervane {

namespace {

/// Features that together need others: one of the ways must be there. Without a way they never go together.
struct FeatureRule {
  RequirementMask features;
  std::array<RequirementMask, 2> ways;  ///< An empty mask is no way.
  std::string_view text;
};

constexpr RequirementMask kNoWay;

/// In the order in which they are asked.
constexpr FeatureRule kFeatureRules[] = {
    {feature::kSnowMelt, {feature::kEvapotranspiration, kNoWay}, "Snowmelt requires ET"},
    {feature::kSnowMelt | feature::kCanopyEnergy, {kNoWay, kNoWay}, "SVAT does not yet support snowmelt."},
    {feature::kEvapotranspiration, {feature::kUnsaturated, feature::kTwoLayer}, "ET requires UZ"},
    {feature::kCanopyEnergy, {feature::kUnsaturated, kNoWay}, "SVAT requires multi-layer UZ"},
    {feature::kIrrigation,
     {feature::kEvapotranspiration | feature::kUnsaturated, feature::kEvapotranspiration | feature::kTwoLayer},
     "Irrigation requires UZ and ET"},
    {feature::kOverland | feature::kSimpleOverland, {kNoWay, kNoWay}, "Can not store OC if storing simple overland"},
    {feature::kMultiCell, {feature::kOverland, kNoWay}, "Multi-Cell requires OC"},
    {feature::kLinearReservoir | feature::kSaturated,
     {kNoWay, kNoWay},
     "Can not store Linear reservoir if storing distributed SZ"},
    {feature::kCropGrowth,
     {feature::kEvapotranspiration | feature::kUnsaturated, kNoWay},
     "Cropgrowth requires ET and multi-layer UZ"},
    {feature::kErosion, {feature::kOverland, kNoWay}, "Erosion requires OC"},
    {feature::kClogging, {feature::kSaturated, feature::kUnsaturated}, "Clogging requires SZ or multi-layer UZ"},
    {feature::kSaturatedDrainage, {feature::kSaturated, kNoWay}, "SZ-Drainage requires SZ"},
    {feature::kOverlandDrainage, {feature::kOverland, kNoWay}, "OL-Drainage requires OL"},
    {feature::kExtraction, {feature::kSaturated, feature::kLinearReservoir}, "Extraction requires SZ"},
    {feature::kGeneralHeadBoundary, {feature::kSaturated, kNoWay}, "GHB requires SZ"},
    {feature::kBypass, {feature::kUnsaturated, feature::kTwoLayer}, "Bypass requires UZ"},
    {feature::kInundation, {feature::kRiver, kNoWay}, "Inundation requires River included"},
    {feature::kRechargeByLayers, {feature::kSaturated, kNoWay}, "Storing of 3D recharge requires SZ"},
    {feature::kRechargeByLayers | feature::kUnsaturated,
     {kNoWay, kNoWay},
     "Storing of 3D recharge not possible when UZ is included"},
    {feature::kRechargeByLayers | feature::kTwoLayer,
     {kNoWay, kNoWay},
     "Storing of 3D recharge not possible when UZ is included"},
    {feature::kSaturatedToUrban, {feature::kSaturated, kNoWay}, "Storing of SZ flow to PIPRA requires SZ"},
    {feature::kOverlandToUrban, {feature::kOverland, kNoWay}, "Storing of OL flow to PIPRA requires OL"},
};

bool IsBroken(const FeatureRule& rule, RequirementMask features) {
  return features.Contains(rule.features) && std::ranges::none_of(rule.ways, [features](RequirementMask way) {
           return !way.IsEmpty() && features.Contains(way);
         });
}

}  // namespace

CatalogueAnswer<RequirementMask> MaskOfLogicals(RequirementMask start, RequirementMask logicals) {
  for (const FeatureRule& rule : kFeatureRules)
    if (IsBroken(rule, logicals)) return {{}, std::string(rule.text)};
  RequirementMask mask = start | logicals;
  if (logicals.Contains(feature::kOverlandDrainage) || logicals.Contains(feature::kSaturatedDrainage | feature::kPaved))
    mask |= feature::kDrainageRoute;
  return {mask};
}

}  // namespace tervane
