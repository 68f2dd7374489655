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
  virtual void SetValidationMessage(std::string message) { message_ = std::move(message); }
  virtual bool HasValidationMessage() const { return !message_.empty(); }
  /// The value that the parent looks at: the uniform one.
  virtual float GetValidationValue() const = 0;

 protected:
  std::string message_;
};

/// Such a quantity over the model area.
class JudgedData2DKvf : public CData2DKvf, public CTvn2DKvfValidationAbstract {
 public:
  using CData2DKvf::CData2DKvf;

  float GetValidationValue() const override { return FixedValue; }
  int ValidateData() override;
};

/// `TypeOfGeoParaDistribution` has that value; as in a new setup where there is no saturated zone.
Condition GroundParametersBy(int distribution);

/// A quantity of water movement.
class CGeoDataWM2DKvf : public JudgedData2DKvf {
 public:
  static constexpr int kAnyDistribution = -1;
  /// It takes part while `TypeOfGeoParaDistribution` has that value.
  CGeoDataWM2DKvf(Data2DKind kind, int distribution, CYbSEKvfBase* parent);
};

}  // namespace tervane
