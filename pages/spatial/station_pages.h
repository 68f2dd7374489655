// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "forms/page.h"
#include "spatial/stations.h"

namespace tervane {

/// A forcing: uniform, by stations, or fully distributed.
class C2DStationBasedDataDlg : public PageOf<C2DStationBasedDataKvf> {
 public:
  using PageOf::PageOf;

  /// Looks at the files again.
  void OnRefresh() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  int Sync();
};

/// One station.
class C2DStationBaseDataTimeSeriesDlg : public PageOf<C2DStationBasedDataTimeSeriesKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

/// A constant or a time series.
class CTimeseriesConstDlg : public PageOf<CTimeseriesConstKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

}  // namespace tervane
