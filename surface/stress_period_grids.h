// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Quantities over the model area that a Modflow engine reads anew for spans of stress periods.
#pragma once

#include <string>
#include <vector>

#include "core/list.h"
#include "spatial/data2d.h"

namespace tervane {

/// What makes one list of grids differ from the next.
struct StressPeriodGridsKind {
  std::string_view title, section;
  int itemType;
  Data2DKind::RelativeToGround relativeToGround = Data2DKind::RelativeToGround::Never;
};
inline constexpr StressPeriodGridsKind kRechargeLayer{"Recharge Layer", "RechargeLayer", quantity::kCode};
inline constexpr StressPeriodGridsKind kPondingElevation{"Ponding Elevation", "PondingElevation", quantity::kWaterLevel,
                                                         Data2DKind::RelativeToGround::Off};
inline constexpr StressPeriodGridsKind kETSurfaceElevation{"ET Surface Elevation", "ETSurfaceElevation",
                                                           quantity::kElevation, Data2DKind::RelativeToGround::Off};
inline constexpr StressPeriodGridsKind kETExtinctionDepth{"ET Extinction Depth", "ETExtinctionDepth",
                                                          quantity::kDepthBelowGround};
inline constexpr StressPeriodGridsKind kETLayer{"ET Layer", "ETLayer", quantity::kCode};

class CRechargeAndPondingModListKvf;

/// The values of a span of stress periods, which begins behind that of the item before.
class CRechargeAndPondingModItemKvf : public CData2DKvf {
 public:
  CRechargeAndPondingModItemKvf(const StressPeriodGridsKind& kind, CRechargeAndPondingModListKvf* list);

  int StressPeriodTo;

  int StressPeriodFrom() const;
  /// When the span begins and ends, as people read it.
  std::string DatesText() const;
  /// Names the item by its span.
  void TakeTitles();

  void ReadData(KvfNode* section) override;
  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  const CRechargeAndPondingModListKvf& list_;
};

/// The spans in the order of the stress periods; the last one reaches the last period. A list without spans passes.
class CRechargeAndPondingModListKvf : public CYbSEKvfAbstractListBase<CRechargeAndPondingModItemKvf>,
                                      public StressPeriodSpans {
 public:
  /// The kind is a constant.
  CRechargeAndPondingModListKvf(const StressPeriodGridsKind& kind, Condition takesPart, CYbSEKvfBase* parent);

  std::unique_ptr<CRechargeAndPondingModItemKvf> NewItem() override;
  /// How many stress periods there are.
  int StressPeriodCount() const;
  std::vector<int> SpanEnds() const override;

  /// Ends the last span with the last stress period.
  int ValidateData() override;

 private:
  const StressPeriodGridsKind& kind_;
};

}  // namespace tervane
