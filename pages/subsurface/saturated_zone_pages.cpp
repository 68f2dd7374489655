// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/saturated_zone_pages.h"

#include "subsurface/pages.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

namespace {

void DescribeSaturatedZone(PageForm& form, CSatZoneKvf& n) {
  form.Check("Include subsurface drainage", n.Drainage).Revalidates();
  form.Check("Include pumping wells", n.Wells).Revalidates();
}

}  // namespace

std::span<const PageRow> SaturatedZonePages() {
  static constexpr PageRow kRows[] = {DescribedBy<DescribeSaturatedZone>(kSaturatedZonePage)};
  return kRows;
}

}  // namespace tervane
