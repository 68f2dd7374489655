// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What water quality asks of the zones below ground. Where the tree has no such zone, the answer is no.
#pragma once

#include "core/node.h"

namespace tervane {

/// The unsaturated zone, "Unsatzone".
class MacroporeChoice {
 public:
  virtual ~MacroporeChoice() = default;
  /// How flow in macropores is modelled: the key of the node. 2 is full macropore flow.
  virtual const int& GetBypass() const = 0;
};
inline constexpr ImportantName<MacroporeChoice> kMacropores{"Unsatzone"};

/// The saturated zone, "SATZONE".
class ImmobileWaterChoice {
 public:
  virtual ~ImmobileWaterChoice() = default;
  /// Whether mass goes over to immobile water: the key of the node.
  virtual const int& GetMassTransferToImmobileWater() const = 0;
};
inline constexpr ImportantName<ImmobileWaterChoice> kImmobileWater{"SATZONE"};

/// Macropores are modelled in full.
Condition FullMacroporeFlow();
/// Mass goes over to immobile water.
Condition ImmobileWaterModelled();

}  // namespace tervane
