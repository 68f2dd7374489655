// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/zone_pages.h"

#include "forms/table_of.h"
#include "pages/parts/zone_controls.h"
#include "platform/item_types.h"
#include "simspec/river_branches.h"
#include "spatial/pages.h"
#include "spatial/river_reaches.h"
#include "spatial/zones.h"

namespace tervane {

namespace {

constexpr ZoneSourceWords kSubcatchmentWords{.gridFilter = kZoneGridFilter};

void DescribeSubcatchment(PageForm& form, CSubcatchmentPropKvf& n) {
  ZoneName(form, "Name:", n);
  ZoneIdentity(form, "zones", n, ZonesOf(n));
  // A bool in the file.
  Control& links = form.Check("Use default river links", n.DefaultRiverLinks);
  links.Hint(kTreeRebuilt | kDataChanged);
  PlaceOfZone(form, n);
}

/// The reaches that a zone drains to, where the default ones are not used.
class CSubcatchmentRiverLinksDlg : public PageOf<CSubcatchmentRiverlinksListKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override {
    using Item = CSubcatchmentRiverlinkItemKvf;
    CSubcatchmentRiverlinksListKvf& n = Node();
    auto table = std::make_shared<TableOf<Item>>(n);
    table->ItemName("River Link");
    table->Value("Branch name", &Item::Branchname).Width(220).Offers([&n](Item&) {
      return RiverBranches::Of(n).Names();
    });
    table->Value("Upstream", &Item::Upstream).Width(120).Format("%.6g");
    table->Value("Downstream", &Item::Downstream).Width(120).Format("%.6g");
    form.Table(std::move(table));
    form.Button("Links from Network", [this] { TakeLinks(); })
        .ToolTip("Takes the reaches of the river network that lie in the zone")
        .EnabledWhen("the setup has a river network", [&n] { return RiverBranches::Of(n).AreKnown(); });
  }

 private:
  void TakeLinks() {
    CSubcatchmentRiverlinksListKvf& n = Node();
    const auto* zone = dynamic_cast<const CFMSEKvfGroupBase*>(n.GetParent());
    const auto* source = zone ? dynamic_cast<const ZoneSource*>(zone->GetParent()) : nullptr;
    if (!source) return;
    ZoneCells cells;
    if (const FileResult found = CellsOfZone(*source, *zone, cells); !found.Ok()) {
      Outside().ShowMessage("The cells of the zone are not known: " + found.error, Host::Icon::Error);
      return;
    }
    const std::vector<RiverReach> reaches = ReachesWithin(RiverBranches::Of(n).Reading().network, cells);
    if (reaches.empty()) {
      Outside().ShowMessage("No branch of the river network crosses the zone.", Host::Icon::Information);
      return;
    }
    n.SetItemCount(static_cast<int>(reaches.size()), 1);
    int number = 0;
    for (const RiverReach& reach : reaches) {
      auto* item = n.GetItem(++number);
      item->Branchname = reach.branch;
      item->Upstream = static_cast<float>(reach.upstream);
      item->Downstream = static_cast<float>(reach.downstream);
    }
    n.Touch();
    UpdateDoc(kDataChanged | kItemAdded | kItemDeleted | kTreeRebuilt, "Links from Network");
  }
};

}  // namespace

std::span<const PageRow> ZonePages() {
  static constexpr PageRow kRows[] = {
      PageIs<ZonesPage<kSubcatchmentWords>, CodedZonesKvf>(kSubcatchmentPage),
      DescribedBy<DescribeSubcatchment>(kSubcatchmentPropPage),
      PageIs<CSubcatchmentRiverLinksDlg, CSubcatchmentRiverlinksListKvf>(kRiverLinksPage),
  };
  return kRows;
}

}  // namespace tervane
