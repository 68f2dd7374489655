// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Water on the ground: how it flows off, what it exchanges with the ground below, and ponded drainage, which takes it
// out. By the cells of the model, or by zones.
#pragma once

#include <string>
#include <string_view>

#include "spatial/geo_data.h"
#include "spatial/zones.h"

namespace tervane {

/// Whether water on the ground can exchange with what is below it.
Condition OverlandExchangesWithGround();

/// A quantity of paved areas, which setups written before version 14 keep in the section of the land use under another
/// name.
class PavedAreaData2DKvf : public CData2DKvf {
 public:
  /// `oldSection` must outlive the node: a constant.
  PavedAreaData2DKvf(Data2DKind kind, std::string_view oldSection, Condition takesPart, CYbSEKvfBase* parent);

  int UseOldSection = 0;  ///< Not stored: the next load, and no other, looks for the old name.

  void Load(KvfNode* parentSection) override;

 private:
  std::string_view oldSection_;
};
inline constexpr ImportantName<PavedAreaData2DKvf> kMaxStorageChangeRate{"MAXSTORAGECHANGERATE"};
inline constexpr ImportantName<PavedAreaData2DKvf> kRunoffCoefficient{"DRRUNOFFCOEFFICIENT"};

/// Drains that take water out of the surface layer, down to their level. Flags are 0 or 1.
class CPondedDrainageKvf : public CYbSEKvfBase {
 public:
  explicit CPondedDrainageKvf(CYbSEKvfBase* parent);

  enum Option : int { kDownhill = 1, kByCodes = 2, kDistributed = 3, kRemoved = 4 };

  int GradientCheck = 1;  ///< Water levels are compared before water is drained.
  int SpecifyMaxStorageChangeRate = 0;
  int DrainageOption = kDownhill;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<CPondedDrainageKvf> kPondedDrainage{"PONDEDDRAINAGE"};

/// Where the exchange of ponded water with the ground is reduced: a map of zones without properties.
class CPondedWaterExchangeKvf : public CodedZonesKvf {
 public:
  explicit CPondedWaterExchangeKvf(CYbSEKvfBase* parent);
};

/// Overland flow. Flags are 0 or 1.
class COverlandKvf : public CYbSEKvfBase {
 public:
  explicit COverlandKvf(CYbSEKvfBase* parent);

  int SeparatedFlowAreas = 0;
  int OverlandGroundWaterExchangeOption = 0;  ///< The exchange is reduced in given areas.
  int SpecifyOnlyReducedContactInPonded = 0;  ///< There only where water is ponded.
  int ReducedPavedLeakage = 0;                ///< The exchange is reduced by the paved fraction of the area.
  int Drainage = 0;                           ///< Ponded drainage.

  /// Takes what setups written before version 14 keep in the section of the land use, which may be null. What is absent
  /// there is 0.
  void LoadPavedAreas(KvfNode* landUse);

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<COverlandKvf> kOverland{"Overland"};

/// A zone of overland flow, with the subcatchment based method.
class CTopographicalRoutingPropKvf : public CodedZoneProp {
 public:
  explicit CTopographicalRoutingPropKvf(CYbSEKvfBase* parent);

  float Slope = 0.01F;
  float ManningNb = 10;
  float InitialDepth = 0;
  float DetentionStorage = 0;
  float SlopeLength = 100;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

/// The zones of overland flow.
class CTopographicalRoutingKvf : public CodedZonesKvf {
 public:
  explicit CTopographicalRoutingKvf(CYbSEKvfBase* parent);
};
inline constexpr ImportantName<CTopographicalRoutingKvf> kOverlandZones{"TopographicalRouting"};

}  // namespace tervane
