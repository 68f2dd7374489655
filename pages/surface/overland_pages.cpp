// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/overland_pages.h"

#include "pages/parts/zone_controls.h"
#include "simspec/conditions.h"
#include "simspec/control_parameters.h"
#include "surface/overland.h"
#include "surface/pages.h"

namespace tervane {

namespace {

void DescribeOverland(PageForm& form, COverlandKvf& n) {
  const auto control = [](const CYbSEKvfBase& node) { return node.Important(kOverlandControl); };
  const Condition mayReduce = OverlandExchangesWithGround();
  const Condition isReduced = On(n.OverlandGroundWaterExchangeOption);
  const Condition isMulticell =
      Is<CCompControlParaOLKvf>(control, &CCompControlParaOLKvf::SolverOption, {CCompControlParaOLKvf::kExplicit}) &&
      On<CCompControlParaOLKvf>(control, &CCompControlParaOLKvf::Multicell);

  form.Check("Separated overland flow areas", n.SeparatedFlowAreas).Revalidates();
  PageForm& exchange = form.Group("Surface-subsurface exchange");
  exchange.Check("Reduced vertical exchange in specified areas", n.OverlandGroundWaterExchangeOption)
      .EnabledWhen(mayReduce)
      .Revalidates();
  exchange.Check("In specified areas, reduce exchange only for ponded areas", n.SpecifyOnlyReducedContactInPonded)
      .EnabledWhen(mayReduce && isReduced && isMulticell)
      .Revalidates();
  exchange.Check("Reduce vertical exchange by paved area fraction", n.ReducedPavedLeakage)
      .EnabledWhen(isReduced)
      .Revalidates();
  form.Check("Include ponded drainage", n.Drainage).Revalidates();
}

void DescribePondedDrainage(PageForm& form, CPondedDrainageKvf& n) {
  form.Check("Check water levels", n.GradientCheck);
  form.Check("Limit ponded drainage inflow rate", n.SpecifyMaxStorageChangeRate).Revalidates();
  form.Radio("", n.DrainageOption).Revalidates();
}

constexpr ZoneSourceWords kPondedAreaWords{.shapeTitle = "Select shape file", .isTypeAlwaysShown = true};
constexpr ZoneSourceWords kFlowZoneWords{.gridFilter =
                                             "Overland flow zones files (*.nds2) |*.nds2|All Files (*.*) |*.*||"};

void DescribeFlowZone(PageForm& form, CTopographicalRoutingPropKvf& n) {
  ZoneName(form, "Name:", n);
  ZoneIdentity(form, "zones", n, ZonesOf(n));
  form.Number("Slope:", n.Slope);
  form.Number("Manning Number:", n.ManningNb);
  form.Number("Initial Depth:", n.InitialDepth);
  form.Number("Detention storage:", n.DetentionStorage);
  form.Number("Slope length:", n.SlopeLength);
  PlaceOfZone(form, n);
}

}  // namespace

std::span<const PageRow> OverlandPages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeOverland>(kOverlandPage),
      DescribedBy<DescribePondedDrainage>(kPondedDrainagePage),
      PageIs<ZonesPage<kPondedAreaWords>, CodedZonesKvf>(kPondedWaterExchangePage),
      PageIs<ZonesPage<kFlowZoneWords>, CodedZonesKvf>(kOverlandZonesPage),
      DescribedBy<DescribeFlowZone>(kOverlandZonePage),
  };
  return kRows;
}

}  // namespace tervane
