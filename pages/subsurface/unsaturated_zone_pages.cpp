// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/unsaturated_zone_pages.h"

#include "forms/table_of.h"
#include "pages/parts/decay_rate.h"
#include "simspec/conditions.h"
#include "spatial/pages.h"
#include "subsurface/pages.h"
#include "subsurface/unsaturated_initial_conditions.h"
#include "subsurface/unsaturated_zone.h"

namespace tervane {

namespace {

void DescribeUnsaturatedZone(PageForm& form, CUnsatzoneKvf& n) {
  const Condition withColumns = OwnEngine() && Component(&CModelCompKvf::UZ) && !TwoLayerMethod();
  form.Group("Macropore Flow")
      .Radio("", n.Bypass)
      .OptionEnabledWhen(CUnsatzoneKvf::kFullMacroporeFlow, withColumns)
      .Revalidates();
  const Condition isFull = Is(n.Bypass, CUnsatzoneKvf::kFullMacroporeFlow);
  PageForm& limits = form.Group("Time Step Control");
  limits.Number("Max MP Infiltration per time step", n.Max_MP_Infiltration_Per_TimeStep).EnabledWhen(isFull);
  limits.Number("Max MP-Matrix Node exchange per time step", n.Max_MP_Node_Exchange_Per_TimeStep).EnabledWhen(isFull);
  limits.Number("Max MP-Matrix Column exchange per time step", n.Max_MP_Column_Exchange_Per_TimeStep)
      .EnabledWhen(isFull);
  form.Check("Use Green and Ampt model for infiltration", n.USE_Green_And_Ampt)
      .EnabledWhen(!Method(&CModelCompKvf::UZ_ModelType, kRichardsEquation));
  form.Group("UZ Classification")
      .Radio("", n.ClassificationType)
      .EnabledWhen(!TwoLayerMethod())
      .Hint(kTreeRebuilt | kDataChanged)
      .Revalidates();
  form.Group("Initial Conditions")
      .Radio("", n.InitialCondition)
      .EnabledWhen(withColumns)
      .Hint(kTreeRebuilt | kDataChanged)
      .Revalidates();
}

void DescribeGroundwaterDepths(PageForm& form, CUZGroundWaterDepthListKvf& n) {
  form.Radio("Groundwater table", n.GroundWaterTableOption).Hint(kTreeRebuilt | kDataChanged).Revalidates();
  auto table = std::make_shared<TableOf<CUZGroundWaterDepthItemKvf>>(n);
  table->ItemName("Depth");
  table->Value("Depth", &CUZGroundWaterDepthItemKvf::Depth).Width(110).Format("%.6g");
  form.Group("Groundwater depths").Table(table);
}

void DescribeInitialCondition(PageForm& form, CUnSatInitConditionLayerListKvf& n) {
  using List = CUnSatInitConditionLayerListKvf;
  using Item = CUnSatInitConditionLayerItemKvf;
  form.Choice("Spatial Distribution:", n.DistributionType).Hint(kTreeRebuilt | kDataChanged).Revalidates();
  form.Number("Static", n.Distribution_UniformValue).ShownWhen(Is(n.DistributionType, List::kUniform));
  if (n.GetItemType() == quantity::kHalfLife)
    form.Shown("Rate (ln 2 / half life)", [&n] { return DecayRateText(n.Distribution_UniformValue); })
        .ShownWhen(Is(n.DistributionType, List::kUniform));
  auto table = std::make_shared<TableOf<Item>>(n);
  table->ItemName("Layer");
  table->Value("Name", &Item::Name).Width(180).Hint(kTreeRebuilt | kDataChanged);
  form.Group("Layers", Is(n.DistributionType, List::kByLayers)).Table(table);
  form.DataFile("File Name:", n.GridFile())
      .Filter("Three Dim Files (*.nds3)|*.nds3|All Files (*.*) |*.*||")
      .DefaultExtension("nds3")
      .ShownWhen(Is(n.DistributionType, List::kFullyDistributed));
}

}  // namespace

std::span<const PageRow> UnsaturatedZonePages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeUnsaturatedZone>(kUnsaturatedZonePage),
      DescribedBy<DescribeGroundwaterDepths>(kGroundwaterDepthsPage),
      DescribedBy<DescribeInitialCondition>(kSoilLayersPage),
  };
  return kRows;
}

}  // namespace tervane
