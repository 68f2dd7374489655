// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/climate_pages.h"

#include "platform/item_types.h"
#include "simspec/conditions.h"
#include "surface/climate.h"
#include "surface/pages.h"

namespace tervane {

namespace {

/// The switches that all engines know.
void DescribeSwitches(PageForm& form, CPrecipitationRelatedKvf& n) {
  const Condition hasTemperature = Sentence("the air temperature takes part", [&n] {
    auto* temperature = n.Important(kAirTemperature);
    return temperature && temperature->IsDlgUsedInSetup();
  });
  form.Check("Correct precipitation for elevation", n.CorrectPrecipitation).Revalidates();
  form.Check("Correct air temperature for elevation", n.CorrectAirTemperature)
      .EnabledWhen(hasTemperature)
      .Revalidates()
      .Then([&n] {
        if (!n.CorrectAirTemperature) n.UseWetDryLapseRate = 0;
        return 0;
      });
  form.Check("Use both wet and dry lapse rates for temperature correction", n.UseWetDryLapseRate)
      .EnabledWhen(On(n.CorrectAirTemperature) && hasTemperature)
      .Revalidates();
  form.Check("Include melting due to short wave solar radiation", n.IncludeSolarRadiation)
      .EnabledWhen(On(n.SM))
      .Revalidates();
}

void DescribeClimate(PageForm& form, CPrecipitationRelatedKvf& n) {
  auto own = form.NewSubForm(n), modflow = form.NewSubForm(n);
  PageForm& group = own->Group("Climate");
  group.Check("Include snow melt", n.SM).Revalidates().Then([&n] {
    if (!n.SM) n.IncludeSolarRadiation = 0;
    return 0;
  });
  DescribeSwitches(group, n);
  DescribeSwitches(*modflow, n);
  form.SubForms({own, modflow}, [&n] { return EngineOf(n) == kEngineTervane ? 0 : 1; });

  form.Group("Recharge options", AnyModflow()).Radio("", n.RechargeOption).Revalidates();
  form.Group("Ponding water", !WithEngine({kEngineModflow96, kEngineModflow2000}) &&
                                  ModflowMethod(&CModModelCompKvf::Recharge_ModelType, kRechargeSeepageFace))
      .Radio("", n.PondingOption)
      .Revalidates();
}

void DescribeSnowMelt(PageForm& form, CSnowmeltConstKvf& n) {
  form.Check("Include thermal melting", n.ThermalMelt);
  form.Number("Melting coefficient for thermal energy in rain", n.MeltCoefficient).EnabledWhen(On(n.ThermalMelt));
  form.Number("Factor for reducing the sublimation rate from dry snow ", n.SublimationRate);
}

}  // namespace

std::span<const PageRow> ClimatePages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeClimate>(kClimatePage),
      DescribedBy<DescribeSnowMelt>(kSnowMeltPage),
  };
  return kRows;
}

}  // namespace tervane
