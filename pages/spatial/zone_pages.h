// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "forms/page.h"
#include "spatial/zones.h"

namespace tervane {

/// Where the zones come from, for all nodes with zones of their own.
class CSubcatchmentDlg : public PageOf<CodedZonesKvf> {
 public:
  using PageOf::PageOf;

  /// Looks at the files again.
  void OnRefresh() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  int Sync();
};

/// One subcatchment.
class CSubcatchmentPropDlg : public PageOf<CSubcatchmentPropKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

/// The reaches that a zone drains to.
class CSubcatchmentRiverLinksDlg : public PageOf<CSubcatchmentRiverlinksListKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

}  // namespace tervane
