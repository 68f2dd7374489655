// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/unsaturated_zone_pages.h"

#include "simspec/conditions.h"
#include "subsurface/pages.h"
#include "subsurface/unsaturated_zone.h"

namespace tervane {

namespace {

void DescribeUnsaturatedZone(PageForm& form, CUnsatzoneKvf& n) {
  form.Radio("Macropore flow", n.Bypass).Revalidates();
  form.Radio("Classification", n.ClassificationType)
      .EnabledWhen(!Method(&CModelCompKvf::UZ_ModelType, kTwoLayer))
      .Revalidates();
}

}  // namespace

std::span<const PageRow> UnsaturatedZonePages() {
  static constexpr PageRow kRows[] = {DescribedBy<DescribeUnsaturatedZone>(kUnsaturatedZonePage)};
  return kRows;
}

}  // namespace tervane
