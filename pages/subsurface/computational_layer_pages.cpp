// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/computational_layer_pages.h"

#include "forms/table_of.h"
#include "pages/parts/ground_views.h"
#include "pages/subsurface/saturated_zone_pages.h"
#include "subsurface/computational_layers.h"
#include "subsurface/pages.h"
#include "subsurface/saturated_zone.h"

namespace tervane {

namespace {

/// The options, which lead to the list that then counts, or to the zone's page where none does.
void DescribeOptions(PageForm& form, CSatZoneKvf& zone, const CYbSEDlgBase& page) {
  DescribeVerticalDiscretization(form, zone).Then([&zone, &page] {
    const CYbSEKvfBase* next = &zone;
    if (zone.TypeOfVerDiscr == CSatZoneKvf::kAsGeology) next = &zone.LayersOfGeology();
    if (zone.TypeOfVerDiscr == CSatZoneKvf::kExplicitLevels) next = &zone.OwnLayers();
    if (next != &page.Node() && page.Context().selectNode) page.Context().selectNode(*next);
    return 0;
  });
}

void DescribeLayersOfGeology(PageForm& form, CSZVerDiscrLayerGeoListKvf& n, CYbSEDlgBase& page) {
  if (auto* zone = n.Important(kSaturatedZone)) DescribeOptions(form, *zone, page);
  auto table = std::make_shared<TableOf<CSZVerDiscrLayerGeoItemKvf>>(n);
  table->ShowOnly();
  table->Value("Name", &CSZVerDiscrLayerGeoItemKvf::Name).Width(180);
  form.Group("Computational Layers").Table(table);
}

void DescribeOwnLayers(PageForm& form, CSZVerDiscrLayerListKvf& n, CYbSEDlgBase& page) {
  if (auto* zone = n.Important(kSaturatedZone)) DescribeOptions(form, *zone, page);
  auto table = std::make_shared<TableOf<CSZVerDiscrLayerItemKvf>>(n);
  table->ItemName("Layer");
  table->Value("Name", &CSZVerDiscrLayerItemKvf::Name).Width(180).Hint(kTreeRebuilt | kDataChanged);
  form.Group("Computational Layers").Table(table);
}

}  // namespace

std::span<const PageRow> ComputationalLayerPages() {
  static constexpr PageRow kRows[] = {
      DescribedWithGround<DescribeLayersOfGeology>(kComputationalLayersOfGeologyPage),
      DescribedWithGround<DescribeOwnLayers>(kComputationalLayersPage),
  };
  return kRows;
}

}  // namespace tervane
