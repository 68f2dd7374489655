// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/zone_pages.h"

#include "forms/table_of.h"
#include "pages/parts/create_dialogs.h"
#include "pages/parts/plot_content.h"
#include "platform/item_types.h"
#include "platform/units.h"
#include "spatial/pages.h"
#include "spatial/zones.h"

namespace tervane {

namespace {

/// The map of the zones of a parent, one of them standing out.
MapContent ZoneMap(const CodedZonesKvf& zones, const CFMSEKvfGroupBase* highlighted) {
  if (zones.UsesPolygons()) {
    MapContent map = ShapeFileMap(zones.ShapeFile(), zones.ShapeAxisUnit);
    if (highlighted) LetStandOut(map, {.name = highlighted->GetStationId()});
    return map;
  }
  MapContent map = FileMap(zones.GridFile());
  if (!map.grids.empty()) map.grids.front().isCodes = true;
  if (highlighted) LetStandOut(map, {.code = static_cast<float>(highlighted->StationCode())});
  return map;
}

/// Where the zones come from, for all nodes with zones of their own.
class CSubcatchmentDlg : public PageOf<CodedZonesKvf> {
 public:
  using PageOf::PageOf;

  /// Looks at the files again.
  void OnRefresh() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  int Sync();
};

int CSubcatchmentDlg::Sync() {
  CodedZonesKvf& n = Node();
  const FoundZones found = FindWatched(Outside(), n.Finder());
  const int hint = SyncOrAsk(Outside(), found, n.PlanZones(found), [&] { return n.SyncZones(found); });
  KeepGapFill(n.ShapeGapFillName, n);
  return hint;
}

void CSubcatchmentDlg::OnRefresh() {
  if (Node().DistributionType == CodedZonesKvf::kDistributed) UpdateDoc(Sync() | kRefreshPlots, "Refresh Zones");
}

void CSubcatchmentDlg::Describe(PageForm& form) {
  CodedZonesKvf& n = Node();
  const Condition isDistributed = Is(n.DistributionType, CodedZonesKvf::kDistributed);
  const Condition byCodes = isDistributed && Is(n.Type, CodedZonesKvf::kGridCodes);
  const Condition byPolygons = isDistributed && Is(n.Type, CodedZonesKvf::kPolygons);
  const auto sync = [this] { return Sync(); };
  form.Choice("Spatial Distribution:", n.DistributionType).Then(sync);
  form.Choice("Data Type:", n.Type).ShownWhen(isDistributed).Then(sync);
  form.DataFile("Grid Distribution File:", n.GridFile())
      .Filter("UZ soil profile distr.files (*.nds2) |*.nds2|All Files (*.*) |*.*||")
      .DefaultExtension("nds2")
      .ShownWhen(byCodes)
      .Then(sync);
  form.Button("Edit...", [this] { EditDataFile(Context(), Node(), Node().GridFile().File); })
      .Beside()
      .ShownWhen(byCodes);
  form.Button("Create...",
              [this] {
                CData2DNdsCreateDlg dialog(Context(), 1.0F, Node(), quantity::kCode);
                if (const auto file = dialog.Run()) {
                  Node().GridFile().Choose(*file);
                  UpdateDoc(Sync(), "Create Grid File");
                }
              })
      .Beside()
      .ShownWhen(byCodes);
  form.ShapeFile("Shape Distribution File:", n.ShapeFile())
      .Filter(kShapeFileFilter)
      .DefaultExtension("shp")
      .ShownWhen(byPolygons)
      .Then(sync);
  form.Shown("Item Name:", [&n] { return n.ShapeFile().Attribute(); }).ShownWhen(byPolygons);
  UnitKeyChoice(form, "Units of X- and Y-axises:", "ShapeAxisUnit", n.ShapeAxisUnit, quantity::kMapCoordinate)
      .ShownWhen(byPolygons);
  GapFillChoice(form, n.ShapeGapFillName, n).ShownWhen(byPolygons);
  form.Map([this] {
        MapContent map = ZoneMap(Node(), nullptr);
        map.picked = [this](const MapPick& pick) {
          const CYbSEKvfBase* zone = nullptr;
          if (Node().UsesPolygons() && pick.shape) {
            zone = Node().SelectZoneByName(pick.shapeValue);
          } else if (pick.value) {
            zone = Node().SelectZoneByCode(static_cast<int>(*pick.value));
          }
          if (zone && Context().selectNode) Context().selectNode(*zone);
        };
        return map;
      })
      .ShownWhen(isDistributed);
}

void DescribeSubcatchment(PageForm& form, CSubcatchmentPropKvf& n) {
  const auto* zones = dynamic_cast<const CodedZonesKvf*>(n.GetParent());
  form.Text("Name:", n.Name).Hint(kTreeRebuilt | kDataChanged).Then([&n] { return n.SetAbbreviatedTitle(n.Name), 0; });
  form.Shown("Grid code value:", [&n] { return n.GRIDCODEID; }).ShownWhen("the zones are grid codes", [zones] {
    return zones && zones->UsesGridCodes();
  });
  form.Shown("Polygon:", [&n] { return n.GRIDCODEID; }).ShownWhen("the zones are polygons", [zones] {
    return zones && zones->UsesPolygons();
  });
  // A bool in the file.
  Control& links = form.Check("Use default river links", n.DefaultRiverLinks);
  links.Hint(kTreeRebuilt | kDataChanged);
  form.Map([&n, zones] { return ZoneMap(*zones, &n); }).ShownWhen("the zones are distributed", [zones] {
    return zones && zones->DistributionType == CodedZonesKvf::kDistributed;
  });
}

void DescribeRiverLinks(PageForm& form, CSubcatchmentRiverlinksListKvf& n) {
  using Item = CSubcatchmentRiverlinkItemKvf;
  auto table = std::make_shared<TableOf<Item>>(n);
  table->ItemName("River Link");
  table->Value("Branch name", &Item::Branchname).Width(220);
  table->Value("Upstream", &Item::Upstream).Width(120).Quantity(quantity::kChainage).Format("%.6g");
  table->Value("Downstream", &Item::Downstream).Width(120).Quantity(quantity::kChainage).Format("%.6g");
  form.Table(std::move(table));
}

constexpr PageRow kPages[] = {
    PageIs<CSubcatchmentDlg, CodedZonesKvf>(kSubcatchmentPage),
    DescribedBy<DescribeSubcatchment>(kSubcatchmentPropPage),
    DescribedBy<DescribeRiverLinks>(kRiverLinksPage),
};

}  // namespace

std::span<const PageRow> ZonePages() { return kPages; }

}  // namespace tervane
