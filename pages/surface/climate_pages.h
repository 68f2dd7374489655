// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "forms/page.h"
#include "surface/climate.h"

namespace tervane {

/// The switches of the climate. The forcings themselves have the pages of `pages/spatial/station_pages.h`.
class CPrecipitationRelatedDlg : public PageOf<CPrecipitationRelatedKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

/// The constants of snow melt.
class CSnowmeltConstDlg : public PageOf<CSnowmeltConstKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

}  // namespace tervane
