// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What grows on the land, and whether and in which order it is irrigated.
#pragma once

#include "core/condition.h"
#include "core/node.h"

namespace tervane {

/// How water is shared out among irrigated areas when there is too little.
inline constexpr KeyChoice kPrioritySchemes[] = {{0, "None"}, {1, "Equal shortage"}, {2, "Equal volume"}};

/// What setups written before version 14 say of paved areas here, and later ones at ponded drainage. Flags are 0 or 1.
struct OldPavedAreas {
  int Paved = 0;
  int PavedGradientCheck = 0;
  int SpecifyMaxPavedStorageChangeRate = 0;
};

/// The use of the land. Flags are 0 or 1.
class CLandUseKvf : public CYbSEKvfBase {
 public:
  explicit CLandUseKvf(CYbSEKvfBase* parent);

  int Irrigation = 0;  ///< Kept while irrigation is not possible.
  enum PriorityScheme : int { kNoPriorities = 0, kEqualShortage = 1, kEqualVolume = 2 };
  int Priorities = kNoPriorities;

  bool IsIrrigationPossible() const;
  /// As the setup that was read has them.
  const OldPavedAreas& PavedAreas() const { return pavedAreas_; }

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  OldPavedAreas pavedAreas_;
};
inline constexpr ImportantName<CLandUseKvf> kLandUse{"LANDUSE"};

/// The setup could irrigate: what it is taken from and what it is wanted for is modelled.
Condition IrrigationPossible();

}  // namespace tervane
