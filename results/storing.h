// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a simulation stores, and how often.
#pragma once

#include <string>
#include <vector>

#include "core/mends.h"
#include "core/node.h"
#include "results/detailed_series.h"
#include "results/grid_series.h"

namespace tervane {

/// What is stored; its children are the lists of what is stored where. Intervals are in hours.
class CStoringResultsKvf : public CTvnKvfBase, public OffersMends {
 public:
  explicit CStoringResultsKvf(CYbSEKvfBase* parent);

  enum ResultUnits : int { kInternalUnits = 0, kUserUnits = 1 };
  enum FlowForWaterQuality : int { kSaturatedFlow = 0, kAllFlow = 1 };

  int ResultUnitRadio = kInternalUnits;
  int ADInputData = 0;
  int WaterBalance = 1;
  int AdRadio = kSaturatedFlow;
  int HotStartData = 0;
  int OnlyStoreHotDataAtEndOfSimulation = 0;
  float HotstartStoringTimestep_Hrs = 24;
  float WM_OverlandFrequency = 24;
  float WM_PrecFrequency = 24;
  float WM_FHeadsFrequency = 24;
  float WM_FluxesFrequency = 24;
  float WQ_OverlandFrequency = 24;
  float WQ_UnsaturatedZoneFrequency = 24;
  float WQ_SaturatedZoneFrequency = 24;
  float WQ_TimeSeriesFrequency = 24;
  float WQ_SummaryFrequency = 24;
  int PTLocationFile = 1;
  int PTHistoryShapeFile = 0;
  float MinPTLocationFrequency = 24;

  CDetailedTSOutputListKvf& DetailedSeries() const { return *detailed_; }
  CDetailedFvrTSOutputListKvf& DetailedRiverSeries() const { return *detailedRiver_; }
  COutputGridSeriesListKvf& GridSeries() const { return *gridSeries_; }

  /// What the interval of precipitation serves, "Prec, SM, ET, UZ" by the components; empty with another engine.
  std::string GetWaterMovementLabel() const;

  int ValidateData() override;
  /// The next multiple, or the same interval, by the rule that the finding tells.
  std::vector<Mend> MendsOf(const Finding& finding) const override;
  void TakeMend(const Mend& mend) override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CDetailedTSOutputListKvf* detailed_;
  CDetailedFvrTSOutputListKvf* detailedRiver_;
  COutputGridSeriesListKvf* gridSeries_;
};
inline constexpr ImportantName<CStoringResultsKvf> kStoringResults{"STORINGRESULTS"};

// The tests of intervals, in single precision. A zero is no multiple, has none, and equals nothing.

bool IsMultiple(float interval, float of);
bool IsEqual(float interval, float other);

}  // namespace tervane
