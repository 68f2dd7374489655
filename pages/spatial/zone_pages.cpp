// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/zone_pages.h"

#include "forms/table_of.h"
#include "pages/parts/zone_controls.h"
#include "platform/item_types.h"
#include "spatial/pages.h"
#include "spatial/zones.h"

namespace tervane {

namespace {

constexpr ZoneSourceWords kSubcatchmentWords{.gridFilter =
                                                 "UZ soil profile distr.files (*.nds2) |*.nds2|All Files (*.*) |*.*||"};

void DescribeSubcatchment(PageForm& form, CSubcatchmentPropKvf& n) {
  ZoneName(form, "Name:", n);
  ZoneIdentity(form, "zones", n, ZonesOf(n));
  // A bool in the file.
  Control& links = form.Check("Use default river links", n.DefaultRiverLinks);
  links.Hint(kTreeRebuilt | kDataChanged);
  PlaceOfZone(form, n);
}

void DescribeRiverLinks(PageForm& form, CSubcatchmentRiverlinksListKvf& n) {
  using Item = CSubcatchmentRiverlinkItemKvf;
  auto table = std::make_shared<TableOf<Item>>(n);
  table->ItemName("River Link");
  table->Value("Branch name", &Item::Branchname).Width(220);
  table->Value("Upstream", &Item::Upstream).Width(120).Format("%.6g");
  table->Value("Downstream", &Item::Downstream).Width(120).Format("%.6g");
  form.Table(std::move(table));
}

constexpr PageRow kPages[] = {
    PageIs<ZonesPage<kSubcatchmentWords>, CodedZonesKvf>(kSubcatchmentPage),
    DescribedBy<DescribeSubcatchment>(kSubcatchmentPropPage),
    DescribedBy<DescribeRiverLinks>(kRiverLinksPage),
};

}  // namespace

std::span<const PageRow> ZonePages() { return kPages; }

}  // namespace tervane
