// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/reservoir_pages.h"

#include "pages/parts/zone_controls.h"
#include "subsurface/pages.h"
#include "subsurface/reservoirs.h"

namespace tervane {

namespace {

constexpr ZoneSourceWords kReservoirWords{.gridFilter = kZoneGridFilter};

void DescribeReservoirZone(PageForm& form, CSatZoneSubCatchmentKvf& n) {
  form.Check("Include pumping wells", n.Wells).Revalidates();
}

void DescribeInterflow(PageForm& form, CSZShallowGWRoutingPropKvf& n) {
  ZoneName(form, "Name:", n);
  ZoneIdentity(form, "zones", n, ZonesOf(n));
  form.Number("Specific Yield:", n.SpecificYield);
  form.Number("Initial Depth:", n.InitialDepth);
  form.Number("Bottom Depth:", n.DepthReservoir);
  form.Group("Percolation").Number("Time Constant:", n.TimeConstantPercolation);
  PageForm& interflow = form.Group("Interflow");
  interflow.Number("Threshold Depth:", n.ThresholdDepthInterflow);
  interflow.Number("Time Constant:", n.TimeConstantInterflow);
  PlaceOfZone(form, n);
}

void DescribeBaseflow(PageForm& form, CSZDeepGWRoutingPropKvf& n) {
  ZoneName(form, "Name:", n);
  ZoneIdentity(form, "zones", n, ZonesOf(n));
  form.Number("Fraction of percolation to reservoir 1:", n.FracPerc1);
  form.Number("Fraction of pumping from reservoir 1:", n.FracPump1);
  form.Check("Use default river links", n.DefaultRiverLinks).Hint(kTreeRebuilt | kDataChanged);
  PlaceOfZone(form, n);
}

void DescribeReservoir(PageForm& form, CSZDeepGWRoutingReservoirKvf& n) {
  form.Number("Specific yield:", n.SpecificYield);
  form.Number("Time constant for base flow:", n.TimeConstHFlow);
  form.Number("Dead storage fraction:", n.GWDeadStorageFrac);
  form.Number("UZ feedback fraction:", n.UZFeedbackFrac);
  form.Number("Initial depth:", n.InitialDepth);
  form.Number("Threshold depth for base flow:", n.ThresholdDepth);
  form.Number("Threshold depth for pumping:", n.ThresholdPumping);
  form.Number("Depth to the bottom of the reservoir:", n.DepthReservoir);
}

}  // namespace

std::span<const PageRow> ReservoirPages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeReservoirZone>(kReservoirZonePage),
      PageIs<ZonesPage<kReservoirWords>, CodedZonesKvf>(kInterflowZonesPage),
      DescribedBy<DescribeInterflow>(kInterflowZonePage),
      PageIs<ZonesPage<kReservoirWords>, CodedZonesKvf>(kBaseflowZonesPage),
      DescribedBy<DescribeBaseflow>(kBaseflowZonePage),
      DescribedBy<DescribeReservoir>(kBaseflowReservoirPage),
  };
  return kRows;
}

}  // namespace tervane
