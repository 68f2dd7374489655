// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The features of a model, as a set of bits with names: those that a setup has, or those that a result needs.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace tervane {

class RequirementMask {
 public:
  constexpr RequirementMask() = default;
  constexpr explicit RequirementMask(std::uint64_t bits) : bits_(bits) {}

  constexpr std::uint64_t Bits() const { return bits_; }
  constexpr bool IsEmpty() const { return bits_ == 0; }
  /// Every feature of the other one is in this one.
  constexpr bool Contains(RequirementMask other) const { return (other.bits_ & ~bits_) == 0; }
  constexpr RequirementMask Without(RequirementMask other) const { return RequirementMask(bits_ & ~other.bits_); }
  constexpr RequirementMask& operator|=(RequirementMask other) { return bits_ |= other.bits_, *this; }
  friend constexpr RequirementMask operator|(RequirementMask a, RequirementMask b) { return a |= b; }
  friend constexpr bool operator==(RequirementMask, RequirementMask) = default;

  /// The names of the features in the order of their bits, "UZ+SM".
  std::string Text() const;

 private:
  std::uint64_t bits_ = 0;
};

namespace feature {

inline constexpr RequirementMask kSnowMelt{0x1};
inline constexpr RequirementMask kEvapotranspiration{0x2};
inline constexpr RequirementMask kIrrigation{0x4};
inline constexpr RequirementMask kOverland{0x8};
inline constexpr RequirementMask kRiver{0x10};
inline constexpr RequirementMask kUnsaturated{0x20};
inline constexpr RequirementMask kSaturated{0x40};
inline constexpr RequirementMask kCropGrowth{0x80};
inline constexpr RequirementMask kErosion{0x100};
inline constexpr RequirementMask kClogging{0x200};
inline constexpr RequirementMask kMacropores{0x400};
inline constexpr RequirementMask kSaturatedDrainage{0x800};
inline constexpr RequirementMask kExtraction{0x1000};
inline constexpr RequirementMask kBypass{0x2000};
inline constexpr RequirementMask kPaved{0x4000};
inline constexpr RequirementMask kTwoLayer{0x8000};
inline constexpr RequirementMask kLinearReservoir{0x10000};
/// Recharge is stored layer by layer, since nothing models the soil.
inline constexpr RequirementMask kRechargeByLayers{0x20000};
inline constexpr RequirementMask kInundation{0x40000};
inline constexpr RequirementMask kGeneralHeadBoundary{0x80000};
/// Series at points are meant, which know more types than grids do.
inline constexpr RequirementMask kSeriesOnly{0x100000};
inline constexpr RequirementMask kSaturatedBoundary{0x200000};
inline constexpr RequirementMask kSaturatedToUrban{0x400000};
inline constexpr RequirementMask kOverlandToUrban{0x800000};
inline constexpr RequirementMask kSimpleOverland{0x1000000};
inline constexpr RequirementMask kCanopyEnergy{0x2000000};
inline constexpr RequirementMask kWaterMovement{0x4000000};
inline constexpr RequirementMask kWaterQuality{0x8000000};
inline constexpr RequirementMask kParticles{0x10000000};
inline constexpr RequirementMask kExchange{0x20000000};
inline constexpr RequirementMask kExchangeInWaterQuality{0x40000000};
inline constexpr RequirementMask kKinetraSaturated{0x80000000};
inline constexpr RequirementMask kKinetraUnsaturated{0x100000000};
inline constexpr RequirementMask kKinetraOverland{0x200000000};
inline constexpr RequirementMask kDualPorosity{0x400000000};
inline constexpr RequirementMask kSoilTemperature{0x800000000};
inline constexpr RequirementMask kMultiCell{0x1000000000};
inline constexpr RequirementMask kOverlandDrainage{0x2000000000};
/// Set with either drainage; no type needs it.
inline constexpr RequirementMask kDrainageRoute{0x4000000000};

}  // namespace feature

/// A feature with its name.
struct ModelFeature {
  RequirementMask bit;
  std::string_view name;
};
/// All features, in the order of their bits.
inline constexpr ModelFeature kModelFeatures[] = {
    {feature::kSnowMelt, "SM"},
    {feature::kEvapotranspiration, "ET"},
    {feature::kIrrigation, "Irrigation"},
    {feature::kOverland, "OC"},
    {feature::kRiver, "River"},
    {feature::kUnsaturated, "UZ"},
    {feature::kSaturated, "SZ"},
    {feature::kCropGrowth, "Cropgrowth"},
    {feature::kErosion, "Erosion"},
    {feature::kClogging, "Clogging"},
    {feature::kMacropores, "Macropores"},
    {feature::kSaturatedDrainage, "SZ-Drainage"},
    {feature::kExtraction, "Extraction"},
    {feature::kBypass, "Bypass"},
    {feature::kPaved, "Paved"},
    {feature::kTwoLayer, "2-Layer UZ"},
    {feature::kLinearReservoir, "LR"},
    {feature::kRechargeByLayers, "NegPrec"},
    {feature::kInundation, "Inundation"},
    {feature::kGeneralHeadBoundary, "GHB"},
    {feature::kSeriesOnly, "TSOnly"},
    {feature::kSaturatedBoundary, "SZBnd"},
    {feature::kSaturatedToUrban, "SZPipraCoup"},
    {feature::kOverlandToUrban, "OLPipraCoup"},
    {feature::kSimpleOverland, "SimpleOL"},
    {feature::kCanopyEnergy, "ET_SVAT"},
    {feature::kWaterMovement, "WM simulation"},
    {feature::kWaterQuality, "WQ simulation"},
    {feature::kParticles, "PT simulation"},
    {feature::kExchange, "OpenMI"},
    {feature::kExchangeInWaterQuality, "OpenMI-WQ"},
    {feature::kKinetraSaturated, "Kinetra-SZ"},
    {feature::kKinetraUnsaturated, "Kinetra-UZ"},
    {feature::kKinetraOverland, "Kinetra-OC"},
    {feature::kDualPorosity, "SZ-DP"},
    {feature::kSoilTemperature, "Soil Temp"},
    {feature::kMultiCell, "Multi-Cell"},
    {feature::kOverlandDrainage, "OL-Drainage"},
    {feature::kDrainageRoute, "DrainageRoute"},
};

}  // namespace tervane
