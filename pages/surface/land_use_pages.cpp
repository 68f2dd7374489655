// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/land_use_pages.h"

#include "surface/land_use.h"
#include "surface/pages.h"

namespace tervane {

namespace {

void DescribeLandUse(PageForm& form, CLandUseKvf& n) {
  form.Check("Irrigation  (Requires ET and UZ)", n.Irrigation).EnabledWhen(IrrigationPossible()).RevalidatesLater();
  form.Choice("Priority scheme:", n.Priorities)
      .EnabledWhen(IrrigationPossible() && On(n.Irrigation))
      .RevalidatesLater();
}

}  // namespace

std::span<const PageRow> LandUsePages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeLandUse>(kLandUsePage),
  };
  return kRows;
}

}  // namespace tervane
