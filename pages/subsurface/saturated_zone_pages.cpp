// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/saturated_zone_pages.h"

#include "pages/parts/ground_views.h"
#include "simspec/conditions.h"
#include "subsurface/ground_properties.h"
#include "subsurface/pages.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

Control& DescribeVerticalDiscretization(PageForm& form, CSatZoneKvf& zone) {
  // The page may be that of another node.
  form.Keys().Add(zone);
  Control& choice = form.Group("Vertical Discretization").Radio("", zone.TypeOfVerDiscr);
  choice.Hint(kTreeRebuilt | kDataChanged).Revalidates();
  form.Group("Bottom Elevation Correction").Number("Minimum layer thickness", zone.MimimumLayerThickness);
  return choice;
}

namespace {

void DescribeSaturatedZone(PageForm& form, CSatZoneKvf& n) {
  const Condition quality = OwnEngine() && Component(&CModelCompKvf::WQ);
  const Condition qualityHere = WaterQualityComponent(&CModelCompWQKvf::SZ);
  constexpr int kChangesTree = kTreeRebuilt | kDataChanged;

  form.Check("Include subsurface drainage", n.Drainage).Hint(kChangesTree).Revalidates();
  form.Check("Include pumping wells", n.Wells).Hint(kChangesTree).Revalidates();
  form.Check("Mass transfer to immobile water", n.MassTransferToImmobileWater)
      .ShownWhen(quality && Method(&CModelCompKvf::ADPTRadio, kAdvectionDispersion) && Component(&CModelCompKvf::SZ) &&
                 qualityHere)
      .Hint(kChangesTree)
      .Revalidates();
  form.Check("Threhold for Rewetting", n.Threshold).ShownWhen(RewettingModelled()).Hint(kChangesTree).Revalidates();
  form.Group("Geological Parameters").Radio("", n.ParameterDistribution).Hint(kChangesTree).Revalidates();
  DescribeVerticalDiscretization(form, n);
  form.Group("Dispersion", quality && (qualityHere || Method(&CModelCompKvf::ADPTRadio, kParticleTracking)))
      .Radio("", n.DispersionOption)
      .Hint(kChangesTree)
      .Revalidates();
  form.Group("Ambient Water Head Input", AirFlowModelled())
      .Radio("", n.TypeAmbientWaterHeadInput)
      .Hint(kChangesTree)
      .Revalidates();
  form.Group("Type of Relative Permeability", VariablySaturated())
      .Radio("", n.TypeOfRelPerm)
      .Hint(kChangesTree)
      .Revalidates();
}

}  // namespace

std::span<const PageRow> SaturatedZonePages() {
  static constexpr PageRow kRows[] = {DescribedWithGround<DescribeSaturatedZone>(kSaturatedZonePage)};
  return kRows;
}

}  // namespace tervane
