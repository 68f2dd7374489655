// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "forms/page.h"
#include "simspec/extra_params.h"
#include "simspec/periods.h"
#include "simspec/titles.h"

namespace tervane {

/// Title and description, of any of the three kinds of simulation.
class CSimTitleDlg : public PageOf<CSimTitleBase> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

/// The simulation period and its hot start.
class CSimPeriodDlg : public PageOf<CSimPeriodKvf> {
 public:
  using PageOf::PageOf;
  void Initialize() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  void LoadHotStartDates();
  void ChooseHotStartDate(int index);
  /// The start comes from the hot start.
  bool StartsHot() const;
};

/// The period of a simulation on flow results: water quality or particle tracking.
class CSimPeriodOnFlowDlg : public PageOf<CSimPeriodOnFlowBase> {
 public:
  using PageOf::PageOf;
  void Initialize() override;

 protected:
  void Describe(PageForm& form) override;
};

class CExtraParamsDlg : public PageOf<CExtraParamsKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

}  // namespace tervane
