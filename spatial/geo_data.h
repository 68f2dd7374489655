// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Quantities of the ground and of its surface that water movement needs.
#pragma once

#include <string>

#include "spatial/data2d.h"

namespace tervane {

/// What quantities of the ground ask of the saturated zone, "SATZONE". Where the tree has no such node, the answer is
/// 0.
class GroundParameterDistribution {
 public:
  virtual ~GroundParameterDistribution() = default;
  /// How parameters of the ground are told: the key of the node.
  virtual const int& TypeOfGeoParaDistribution() const = 0;
};
inline constexpr ImportantName<GroundParameterDistribution> kGroundParameters{"SATZONE"};

/// A quantity that its parent judges together with others, in the parent's `ValidateData`.
class CTvn2DKvfValidationAbstract {
 public:
  virtual ~CTvn2DKvfValidationAbstract() = default;
  /// What the parent finds wrong; empty where nothing is.
  virtual void SetErrorText(std::string text) { errorText_ = std::move(text); }
  virtual bool HasErrorText() const { return !errorText_.empty(); }

 protected:
  std::string errorText_;
};

/// A quantity of water movement.
class CGeoDataWM2DKvf : public CData2DKvf, public CTvn2DKvfValidationAbstract {
 public:
  static constexpr int kAnyDistribution = -1;
  /// It takes part while `TypeOfGeoParaDistribution` has that value.
  CGeoDataWM2DKvf(Data2DKind kind, int distribution, CYbSEKvfBase* parent);

  int ValidateData() override;
};

}  // namespace tervane
