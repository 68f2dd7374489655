// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/climate_pages.h"

#include "simspec/model_components.h"

namespace tervane {

namespace {

/// The switches that all engines know.
void DescribeSwitches(PageForm& form, CPrecipitationRelatedKvf& n) {
  const auto hasTemperature = [&n] {
    auto* temperature = n.Important<CSnowmeltKvf>("AIR TEMPERATURE");
    return temperature && temperature->IsDlgUsedInSetup();
  };
  form.Check("Correct precipitation for elevation", n.CorrectPrecipitation).Revalidates();
  form.Check("Correct air temperature for elevation", n.CorrectAirTemperature)
      .EnabledWhen(hasTemperature)
      .Revalidates()
      .Then([&n] {
        if (!n.CorrectAirTemperature) n.UseWetDryLapseRate = 0;
        return 0;
      });
  form.Check("Use both wet and dry lapse rates for temperature correction", n.UseWetDryLapseRate)
      .EnabledWhen([&n, hasTemperature] { return n.CorrectAirTemperature && hasTemperature(); })
      .Revalidates();
  form.Check("Include melting due to short wave solar radiation", n.IncludeSolarRadiation)
      .EnabledWhen([&n] { return n.SM != 0; })
      .Revalidates();
}

}  // namespace

void CPrecipitationRelatedDlg::Describe(PageForm& form) {
  CPrecipitationRelatedKvf& n = Node();
  auto own = std::make_shared<PageForm>(n), modflow = std::make_shared<PageForm>(n);
  PageForm& group = own->Group("Climate");
  group.Check("Include snow melt", n.SM).Revalidates().Then([&n] {
    if (!n.SM) n.IncludeSolarRadiation = 0;
    return 0;
  });
  DescribeSwitches(group, n);
  DescribeSwitches(*modflow, n);
  form.SubForms({own, modflow}, [&n] { return EngineOf(n) == kEngineTervane ? 0 : 1; });

  form.Group("Recharge options")
      .Radio("", n.RechargeOption,
             {"Apply recharge to the highest active cell in each vertical profile",
              "Apply recharge to the top layer only", "Apply recharge to a specific layer"})
      .Revalidates();
  form.Controls().back()->ShownWhen([&n] { return UsesModflow(n); });
  form.Group("Ponding water")
      .Radio("", n.PondingOption,
             {"Apply recharge as in the confined case", "Apply recharge untill ponding elevation is reached"})
      .Revalidates();
  form.Controls().back()->ShownWhen([&n] {
    const int engine = EngineOf(n);
    return engine != kEngineModflow96 && engine != kEngineModflow2000 && ModModelCompOf(n).Recharge_ModelType == 1;
  });
}

void CSnowmeltConstDlg::Describe(PageForm& form) {
  CSnowmeltConstKvf& n = Node();
  form.Check("Include thermal melting", n.ThermalMelt);
  form.Number("Melting coefficient for thermal energy in rain", n.MeltCoefficient).Quantity(110051).EnabledWhen([&n] {
    return n.ThermalMelt != 0;
  });
  form.Number("Factor for reducing the sublimation rate from dry snow ", n.SublimationRate).Quantity(100144);
}

}  // namespace tervane
