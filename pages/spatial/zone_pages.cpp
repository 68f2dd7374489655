// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/zone_pages.h"

#include "forms/table_form.h"
#include "pages/parts/create_dialogs.h"
#include "pages/parts/plot_content.h"
#include "platform/units.h"

namespace tervane {

namespace {

constexpr int kChainage = 100143;

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

}  // namespace

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
  const auto isDistributed = [&n] { return n.DistributionType == CodedZonesKvf::kDistributed; };
  const auto byCodes = [&n] { return n.UsesGridCodes(); };
  const auto byPolygons = [&n] { return n.UsesPolygons(); };
  const auto sync = [this] { return Sync(); };
  form.Choice("Spatial Distribution:", n.DistributionType, {"Uniform", "Distributed"}).Then(sync);
  form.Choice("Data Type:", n.Type, {"Grid codes (.nds2)", "Polygons (.shp)"}).ShownWhen(isDistributed).Then(sync);
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
                CData2DNdsCreateDlg dialog(Context(), 1.0F, Node(), kCodeItemType);
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
  UnitKeyChoice(form, "Units of X- and Y-axises:", "ShapeAxisUnit", n.ShapeAxisUnit, kCoordinateItemType)
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

void CSubcatchmentPropDlg::Describe(PageForm& form) {
  CSubcatchmentPropKvf& n = Node();
  const auto* zones = dynamic_cast<const CodedZonesKvf*>(n.GetParent());
  form.Text("Name:", n.Name).Hint(kTreeRebuilt | kDataChanged).Then([&n] { return n.SetAbbreviatedTitle(n.Name), 0; });
  form.Shown("Grid code value:", [&n] { return n.GRIDCODEID; }).ShownWhen([zones] {
    return zones && zones->UsesGridCodes();
  });
  form.Shown("Polygon:", [&n] { return n.GRIDCODEID; }).ShownWhen([zones] { return zones && zones->UsesPolygons(); });
  // A bool in the file.
  Control& links = form.Check("Use default river links", n.DefaultRiverLinks);
  links.Hint(kTreeRebuilt | kDataChanged);
  form.Map([&n, zones] { return ZoneMap(*zones, &n); }).ShownWhen([zones] {
    return zones && zones->DistributionType == CodedZonesKvf::kDistributed;
  });
}

void CSubcatchmentRiverLinksDlg::Describe(PageForm& form) {
  using Item = CSubcatchmentRiverlinkItemKvf;
  auto table = std::make_shared<TableForm>(Node());
  table->ItemName("River Link");
  table->Column<Item>("Branch name", 220, CellKind::Text, [](Item& item) -> std::string& { return item.Branchname; });
  table->Column<Item>("Upstream", 120, CellKind::Number, [](Item& item) -> float& { return item.Upstream; }).itemType =
      kChainage;
  table->Column<Item>("Downstream", 120, CellKind::Number, [](Item& item) -> float& { return item.Downstream; })
      .itemType = kChainage;
  form.Table(std::move(table));
}

}  // namespace tervane
