// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The stress periods of a Modflow engine. Each ends at a date, where the next one begins; the first begins with the
// simulation and the last ends with it.
#pragma once

#include <string>
#include <vector>

#include "core/list.h"
#include "platform/dates.h"

namespace tervane {

/// How an engine steps through a period; each engine reads some of the values.
struct StressPeriodSteps {
  double DELT = 1;     ///< First time step size, days.
  double TMIN = 0;     ///< Min step size.
  double TMAX = 1000;  ///< Max step size.
  double TSMULT = 10;  ///< Time step multiplier.
  double TSDIV = 10;   ///< Reduction factor.
  double NSTP = 1;     ///< Number of time steps: a whole number, which files hold as a fraction.
  double SSTR = 0;     ///< Whether the period is one step in steady state, 1 or 0.
};

/// The first and the last of the time steps of a period of that length, each of which is the multiplier times the one
/// before it; NaN where these make no steps. In the unit of the length.
struct TimeStepRange {
  double first, last;
};
TimeStepRange TimeStepsOf(double length, const StressPeriodSteps& steps);

class CStressPeriodsKvf;

/// A period.
class CStressPeriodsItemKvf : public CTvnKvfBase, public StressPeriodSteps {
 public:
  /// It ends with the simulation, with the defaults of its list.
  explicit CStressPeriodsItemKvf(CYbSEKvfBase* list);

  const CYbDateTime& EndDate() const { return endDate_; }
  /// Takes a date of a user, within the simulation and to the minute.
  void SetEndDate(const CYbDateTime& date);

  int ValidateData() override;

 protected:
  void ExchangeKeys(KeyExchange& keys) override;

 private:
  CYbDateTime endDate_;
};

/// The node that the page of the time steps belongs to.
class CStressPeriodsPropListKvf : public CTvnKvfBase {
 public:
  explicit CStressPeriodsPropListKvf(CYbSEKvfBase* list);
};

class CStressPeriodsKvf : public CYbSEKvfListBase<CStressPeriodsItemKvf> {
 public:
  explicit CStressPeriodsKvf(CYbSEKvfBase* parent);

  enum Plots : int { kNoPlots = 0, kSeparatePlots = 1, kPlotForEachType = 2 };

  int MfSteadyState = 0;
  int StressPeriodRadio = kNoPlots;
  /// What new periods begin with.
  StressPeriodSteps Defaults;

  /// The dates at which the periods end.
  std::vector<CYbDateTime> GetDateMarkers() const;
  /// When a period ends, and with 0 when the first begins; "ERROR" for a period that is none.
  std::string GetDateText(int number) const;
  /// From the end of the period before, or the start of the simulation.
  CYbDateTimeSpan LengthOf(int number) const;
  /// The last period ends with the simulation.
  void FixLastPeriod();
  /// Makes that many periods of one length in the place of those that there are. They step by `steps`, but for the
  /// number of time steps and the steady state, which begin as in any new period.
  void MakeEqualPeriods(int count, const StressPeriodSteps& steps);
  /// The same with periods that end at these dates, and a last one that ends with the simulation.
  void MakePeriods(const std::vector<CYbDateTime>& ends, const StressPeriodSteps& steps);

  // Spans of periods depend on the number and order of the periods, so that all is to be validated.
  void SetItemCount(int count, int level) override;
  void DeleteItem(int number, int level) override;
  void InsertItem(int number, int level) override;
  bool MoveItemUp(int number, int level) override;
  bool MoveItemDown(int number, int level) override;

  /// Ends the last period with the simulation, as its user expects when he moves that end.
  int ValidateData() override;

  static constexpr std::string_view kDateFormat = "%Y-%m-%d %H:%M";

 protected:
  void ExchangeKeys(KeyExchange& keys) override;
};
inline constexpr ImportantName<CStressPeriodsKvf> kStressPeriods{"STRESSPERIODS"};

}  // namespace tervane
