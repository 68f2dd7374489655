// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <vector>

#include "forms/page.h"
#include "pages/simspec/stress_period_series.h"
#include "simspec/stress_periods.h"

namespace tervane {

/// Makes the stress periods of a setup: so many of one length, one for each month or year, or with an end at each
/// change of a series.
class CStressPeriodsDefaultDlg : public CYbSEDlgBase {
 public:
  CStressPeriodsDefaultDlg(const PageContext& context, CStressPeriodsKvf& periods);

  /// False when the user gave up, and then nothing was changed.
  bool Run();

 protected:
  void Describe(PageForm& form) override;

 private:
  enum Layout : int { kEqual = 0, kMonths = 1, kYears = 2, kSeries = 3 };

  /// Where the periods end, but for the last one; gives why they cannot be made.
  std::string FindEnds(std::vector<CYbDateTime>& ends) const;
  std::string FindChanges(std::vector<CYbDateTime>& ends) const;
  std::string Make();

  CStressPeriodsKvf& periods_;
  StressPeriodSteps steps_;
  int layout_ = kEqual;
  int count_;
  int series_ = 0;  ///< Place in the list.
  std::vector<DrivingSeries> offered_;
};

/// The ends of months or of years within a time.
std::vector<CYbDateTime> MonthEnds(const CYbDateTime& start, const CYbDateTime& end, int months);
/// The times within a time at which a series comes to have another value.
std::vector<CYbDateTime> ChangesOf(const Series& series, const CYbDateTime& start, const CYbDateTime& end);

}  // namespace tervane
