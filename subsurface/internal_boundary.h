// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Zones inside a computational layer that behave as a boundary: a fixed head, a flux that a head controls, a drain, or
// cells that take no part.
#pragma once

#include <string>

#include "spatial/geo_data.h"
#include "spatial/zones.h"
#include "subsurface/valued_boundary.h"

namespace tervane {

/// A leakage coefficient or conductance that must be uniform.
class CSZVerDiscrInternalBoundaryPropConducKvf : public CData2DKvf {
 public:
  using CData2DKvf::CData2DKvf;
  int ValidateData() override;
};

/// A boundary: a zone with its type, and how its value is given.
class CSZVerDiscrInternalBoundaryPropKvf : public CodedZoneProp, public ValuedBoundary {
 public:
  explicit CSZVerDiscrInternalBoundaryPropKvf(CYbSEKvfBase* parent);

  enum Boundary : int {
    kNone = 0,
    kFixedHead = 1,
    kFixedHeadDrain = 2,
    kHeadControlledFlux = 3,
    kDrain = 4,
    kRiver = 5,
    kInactive = 6
  };
  static constexpr KeyChoice kBoundaryTypes[] = {{kNone, "None"},
                                                 {kFixedHead, "Fixed Head"},
                                                 {kFixedHeadDrain, "Fixed Head Drain"},
                                                 {kHeadControlledFlux, "Head-Controlled Flux (GHB)"},
                                                 {kDrain, "(Reserved for future use)"},
                                                 {kRiver, "(Reserved for future use)"},
                                                 {kInactive, "Inactive Cells"}};
  enum Leakage : int { kConductance = 0, kLeakageCoefficient = 1 };

  int HeadControlLeakage = kConductance;

  /// Takes another type and corrects `Type`, so that it stands among those that go with it.
  void SetBoundaryType(int type);
  /// The quantity of the value.
  int GetBoundaryItemType() const;
  /// What the value is called; empty where there is none.
  std::string GetValueLabel() const;

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// The boundaries inside a computational layer.
class CSZVerDiscrInternalBoundaryKvf : public CodedZonesKvf {
 public:
  explicit CSZVerDiscrInternalBoundaryKvf(CYbSEKvfBase* parent);
};

}  // namespace tervane
