// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/internal_boundary_pages.h"

#include "pages/parts/zone_controls.h"
#include "pages/subsurface/boundary_value.h"
#include "subsurface/internal_boundary.h"
#include "subsurface/pages.h"

namespace tervane {

namespace {

constexpr ZoneSourceWords kInternalBoundaryWords{.type = "Boundary Condition Distribution Type:",
                                                 .gridFilter =
                                                     "Inner boundary conditions files (*.nds2) |*.nds2|All Files (*.*) "
                                                     "|*.*||",
                                                 .isDomainWanted = true};

void DescribeBoundary(PageForm& form, CSZVerDiscrInternalBoundaryPropKvf& n, CYbSEDlgBase& page) {
  using Zone = CSZVerDiscrInternalBoundaryPropKvf;
  const auto words = [](std::vector<int> boundaries, int first, int last, std::string label) {
    return BoundaryValue::Words{std::move(boundaries), first, last, label, label + " Time Series File"};
  };
  const BoundaryValue value{
      .boundary = n,
      .itemType = [&n] { return n.GetBoundaryItemType(); },
      .typeLabel = "Data Type",
      .gridFilter = "Time varying (*.nds2) |*.nds2|All Files (*.*) |*.*||",
      .words = {
          words({Zone::kFixedHead, Zone::kFixedHeadDrain}, Zone::kInitialValue, Zone::kGridSeries, "Head elevation"),
          words({Zone::kHeadControlledFlux}, Zone::kConstant, Zone::kGridSeries, "Controlling head"),
          words({Zone::kDrain}, Zone::kConstant, Zone::kSeries, "Drain elevation"),
          words({Zone::kRiver}, Zone::kConstant, Zone::kSeries, "River stage")}};
  ZoneName(form, "Boundary Name:", n);
  ZoneIdentity(form, "zones", n, ZonesOf(n), "Grid Code Value:");
  Control& type = form.Choice("Boundary Type:", n.BoundaryType).Revalidates();
  type.Then([&n] { return n.SetBoundaryType(n.BoundaryType), static_cast<int>(kTreeRebuilt); });
  DescribeBoundaryValue(form, page, value);
  form.Choice("Leakage Controlled by:", n.HeadControlLeakage)
      .ShownWhen(Is(n.BoundaryType, {Zone::kHeadControlledFlux, Zone::kDrain, Zone::kRiver}))
      .Hint(kTreeRebuilt | kDataChanged)
      .Revalidates();
  ChartOfBoundary(form, value);
  PlaceOfZone(form, n);
}

}  // namespace

std::span<const PageRow> InternalBoundaryPages() {
  static constexpr PageRow kRows[] = {
      PageIs<ZonesPage<kInternalBoundaryWords>, CodedZonesKvf>(kInternalBoundariesPage),
      DescribedBy<DescribeBoundary>(kInternalBoundaryPage),
  };
  return kRows;
}

}  // namespace tervane
