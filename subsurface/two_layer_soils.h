// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Soils for the method of two layers: a few values for the whole depth of each.
#pragma once

#include "subsurface/soil_profiles.h"

namespace tervane {

/// A soil.
class CUZWetlandSoilPropKvf : public CodedZoneProp, public BypassConstants {
 public:
  explicit CUZWetlandSoilPropKvf(CYbSEKvfBase* parent);

  float ThetaS = 0.3f;        ///< Water content at saturation,
  float ThetaFC = 0.1f;       ///< at field capacity,
  float ThetaWP = 0.05f;      ///< at the wilting point.
  float Kint = 1e-5f;         ///< Saturated hydraulic conductivity.
  float SoilSuction = -0.2f;  ///< At the wetting front.

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// The soils of the model area.
class CUZWetlandSoilProfileKvf : public CodedZonesKvf {
 public:
  explicit CUZWetlandSoilProfileKvf(CYbSEKvfBase* parent);
};

}  // namespace tervane
