// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The properties of the ground that layers, lenses and computational layers have as quantities over the model area, and
// the rules by which each takes part: they depend on engine, components, water quality and particle tracking.
#pragma once

#include <span>

#include "spatial/geo_data.h"

namespace tervane {

/// What transport in the saturated zone may need of the ground.
enum class TransportProperty {
  Porosity,
  MatrixPorosity,
  BulkDensity,
  HorizontalDispersivity,  ///< Along and across a horizontal flow.
  VerticalDispersivity     ///< The three that anisotropy adds.
};
/// Transport needs it, wherever it is given: with the layers or with the geological units.
Condition TransportNeeds(TransportProperty property);

// Of the Modflow engines.

/// Flow is modelled with air in the ground.
Condition AirFlowModelled();
/// Flow is variably saturated.
Condition VariablySaturated();
/// Cells may be wetted again.
Condition RewettingModelled();

/// A quantity that transport needs; its layer or lens judges it.
class CGeoDataAD2DKvf : public JudgedData2DKvf {
 public:
  using JudgedData2DKvf::JudgedData2DKvf;
};

/// A property: a row of what an owner has.
struct GroundProperty {
  /// Its class, and so its rule.
  enum class Rule {
    Always,    ///< With water movement.
    ByUnits,   ///< The same while parameters stand with geological units.
    ByLayers,  ///< The same while they stand with layers.
    Porosity,  ///< The following five where transport needs them and parameters stand with layers.
    MatrixPorosity,
    BulkDensity,
    HorizontalDispersivity,
    VerticalDispersivity,
    AirFlowOfLayers,       ///< The head behind a flow of air, while geological layers are computed.
    AirFlowOfComputation,  ///< The same while other layers are.
    Anisotropy,
    VanGenuchten,
    BrooksCorey,
    Rewetting
  };
  /// What its owner judges it by.
  enum class Range { None, Fraction, AboveZero };

  const char* section;
  const char* title;
  Rule rule;
  int itemType;
  float fixedValue = 0;
  bool mayBeRelative = false;  ///< Offers heights above ground.
  const char* shortTitle = "";
  Range range = Range::None;
};

/// Makes the quantities of the rows as children of an owner, in their order. `mayLeaveCells`: the owner is a part of
/// the model.
void MakeProperties(CYbSEKvfBase& owner, std::span<const GroundProperty> rows, bool mayLeaveCells);
/// Holds those of the rows' quantities that take part against their ranges, and tells each what is wrong with it. False
/// when something is.
bool JudgeProperties(const CYbSEKvfBase& owner, std::span<const GroundProperty> rows);
/// The quantity of a section; null where the owner has none.
CData2DKvf* PropertyOf(const CYbSEKvfBase& owner, std::string_view section);

}  // namespace tervane
