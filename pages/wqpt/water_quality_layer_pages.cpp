// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/wqpt/water_quality_layer_pages.h"

#include "forms/table_of.h"
#include "wqpt/pages.h"
#include "wqpt/water_quality_layers.h"

namespace tervane {

namespace {

void DescribeLayers(PageForm& form, CWQLayerListKvf& n) {
  auto table = std::make_shared<TableOf<CWQLayerItemKvf>>(n);
  table->ItemName("Layer");
  table->Value("Layer Name", &CWQLayerItemKvf::Name).Width(180).Hint(kTreeRebuilt | kDataChanged);
  form.Table(table);
}

}  // namespace

std::span<const PageRow> WaterQualityLayerPages() {
  static constexpr PageRow kRows[] = {DescribedBy<DescribeLayers>(kWaterQualityLayersPage)};
  return kRows;
}

}  // namespace tervane
