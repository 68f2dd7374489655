// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "core/node.h"
#include "platform/dates.h"
#include "simspec/pages.h"

namespace tervane {

/// The dates over which a simulation runs, and the stored state that it may start from.
class CSimPeriodKvf : public CTvnKvfBase {
 public:
  explicit CSimPeriodKvf(CYbSEKvfBase* parent) : CTvnKvfBase("Simulation period", "SimulationPeriod", parent) {
    SetPage(kSimPeriodPage);
  }

  int HotStart = 0;
  FileName HotStartResultFile;  ///< A `.tvdres` catalogue.
  std::string HotStartDate;     ///< The chosen date as text; the text is what counts.
  int HotStartDateIndex = 0;    ///< Its place in the list of hot start dates, from 0.
  int SimStartFromHotStartDate = 0;
  CYbDateTime SIMSTART{2000, 1, 1};
  CYbDateTime SIMEND{2000, 2, 1};

  /// Dates of the hot start file as texts; not stored.
  std::vector<std::string> HotStartDates;

  /// The effective start: the hot start date where it is to be used and can be read, else the own start date.
  CYbDateTime GetSimStartDate() const;
  /// Fills the list of hot start dates from a result catalogue; 1 when the list was built.
  int LoadHotStartDates(const std::string& path);

  /// A simulation that ends before it begins is none.
  int ValidateData() override;

  /// How the text of the hot start date begins.
  static constexpr std::string_view kHotStartFormat = "%Y/%m/%d %H:%M";

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
  void ExchangeState(KeyExchange& keys) override;
};
inline constexpr ImportantName<CSimPeriodKvf> kSimulationPeriod{"SIMPERIOD"};

/// The dates of a simulation that runs on flow results: water quality or particle tracking.
class CSimPeriodOnFlowBase : public CTvnKvfBase {
 public:
  /// The dates begin as those of the simulation period, which stands earlier in the tree.
  CSimPeriodOnFlowBase(std::string title, std::string abbreviatedTitle, std::string section, CYbSEKvfBase* parent);

  CYbDateTime SimStart;
  CYbDateTime SimEnd;
  enum Recycling : int { kNoRecycling = 0, kRecycling = 1, kConstantFlowField = 2 };
  int RecyclingType = kNoRecycling;
  CYbDateTime CycleRestartDate;
  CYbDateTime CycleEndDate;
  CYbDateTime FlowFieldSolutionDate;

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};

class CSimPeriodWQKvf : public CSimPeriodOnFlowBase {
 public:
  explicit CSimPeriodWQKvf(CYbSEKvfBase* parent)
      : CSimPeriodOnFlowBase("Water Quality Simulation Period", "WQ Simulation Period", "SimulationPeriodWQ", parent) {
    SetPage(kSimPeriodWQPage);
  }
};

class CSimPeriodPTKvf : public CSimPeriodOnFlowBase {
 public:
  explicit CSimPeriodPTKvf(CYbSEKvfBase* parent)
      : CSimPeriodOnFlowBase("Particle Tracking Simulation Period", "PT Simulation Period", "SimulationPeriodPT",
                             parent) {
    SetPage(kSimPeriodPTPage);
  }
};
inline constexpr ImportantName<CSimPeriodPTKvf> kParticleTrackingPeriod{"PT_SIM_PERIOD"};

}  // namespace tervane
