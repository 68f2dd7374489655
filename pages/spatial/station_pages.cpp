// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/station_pages.h"

#include <fmt/format.h>

#include "pages/parts/create_dialogs.h"
#include "pages/parts/plot_content.h"
#include "platform/item_types.h"
#include "platform/units.h"
#include "spatial/pages.h"
#include "spatial/stations.h"
#include "surface/pages.h"

namespace tervane {

namespace {

/// A value or a series, as a uniform forcing, a station and a time constant have it.
struct ValueOrSeries {
  int& type;  ///< 0 constant, 1 series.
  float& value;
  CFMData0DFile& file;
  std::vector<int> itemTypes, valueTypes;
};

/// The controls of a value or a series; `isShown` says whether this form of the data is in force.
void DescribeValueOrSeries(PageForm& form, CYbSEDlgBase& page, ValueOrSeries data, const Condition& isShown = {}) {
  const Condition isConstant = isShown && Is(data.type, 0), isSeries = isShown && Is(data.type, 1);
  form.Number("Value:", data.value).ShownWhen(isConstant);
  CFMData0DFile& file = data.file;
  form.DataFile("Time Series File:", file).Filter(kSeriesFileFilter).DefaultExtension("nds0").ShownWhen(isSeries);
  form.Button("Edit...",
              [&file, &page] {
                if (page.Context().openDataFile) page.Context().openDataFile(file.File.Absolute());
              })
      .ShownWhen(isSeries);
  form.Button("Create...",
              [&page, &file, &value = data.value, items = data.itemTypes, kinds = data.valueTypes] {
                if (!MayCreateFile(page.Context())) return;
                CTvnCreate0DNdsDlg dialog(page.Context(), page.Node(), value, items, kinds);
                if (const auto made = dialog.Run()) {
                  file.Choose(*made);
                  page.UpdateDoc(kDataChanged, "Create Time Series File");
                }
              })
      .Beside()
      .ShownWhen(isSeries);
  form.Chart([&file] { return FileChart(file); }).ShownWhen(isSeries);
}

/// The map of the areas of a forcing's stations, one of them standing out.
MapContent StationMap(const C2DStationBasedDataKvf& data, const CFMSEKvfGroupBase* highlighted) {
  if (data.UsesPolygons()) {
    MapContent map = ShapeFileMap(data.Stations().ShapeFile(), data.Stations().ShapeAxisUnit);
    if (highlighted) LetStandOut(map, {.name = highlighted->GetStationId()});
    return map;
  }
  const bool isDistributed = data.DistributionType == C2DStationBasedDataKvf::kFullyDistributed;
  MapContent map = isDistributed ? FileMap(data.FullyDistributed().GridFile()) : FileMap(data.Stations().GridFile());
  if (!map.grids.empty() && !isDistributed) {
    map.grids.front().isCodes = true;
    if (highlighted) LetStandOut(map, {.code = static_cast<float>(highlighted->StationCode())});
  }
  return map;
}

/// A forcing: uniform, by stations, or fully distributed.
class C2DStationBasedDataDlg : public PageOf<C2DStationBasedDataKvf> {
 public:
  using PageOf::PageOf;

  /// Looks at the files again.
  void OnRefresh() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  int Sync();
};

int C2DStationBasedDataDlg::Sync() {
  C2DStationBasedDataKvf& n = Node();
  const FoundZones found = FindWatched(Outside(), n.Finder());
  const int hint = SyncOrAsk(Outside(), found, n.PlanStations(found), [&] { return n.SyncStations(found); });
  KeepGapFill(n.Stations().ShapeGapFillName, n);
  return hint;
}

void C2DStationBasedDataDlg::OnRefresh() {
  if (Node().DistributionType == C2DStationBasedDataKvf::kStationBased)
    UpdateDoc(Sync() | kRefreshPlots, "Refresh Stations");
}

void C2DStationBasedDataDlg::Describe(PageForm& form) {
  using Node_ = C2DStationBasedDataKvf;
  Node_& n = Node();
  const auto is = [&n](int distribution) { return Is(n.DistributionType, distribution); };
  const Condition byCodes = is(Node_::kStationBased) && Is(n.Stations().TYPE, CStationBasedKvf::kGridCodes);
  const Condition byPolygons = is(Node_::kStationBased) && Is(n.Stations().TYPE, CStationBasedKvf::kPolygons);
  const auto sync = [this] { return Sync(); };
  form.Choice("Spatial Distribution:", n.DistributionType).RevalidatesLater().Then([this] {
    if (Node().DistributionType == Node_::kFullyDistributed && Node().IsCorrectedForElevation())
      Outside().Tell(
          fmt::format("Warning: Fully distributed {} cannot be corrected for elevation.", Node().Kind().correctable),
          Host::Icon::Warning);
    return 0;
  });
  form.Choice("Temporal Distribution:", n.Global().TYPE).ShownWhen(is(Node_::kUniform));
  form.Choice("Data Type:", n.Stations().TYPE).ShownWhen(is(Node_::kStationBased)).Then(sync);
  DescribeValueOrSeries(
      form, *this,
      {n.Global().TYPE, n.Global().FIXED_VALUE, n.Global().SeriesFile(), n.Kind().itemTypes, n.Kind().valueTypes},
      is(Node_::kUniform));
  if (n.HasElevation()) form.Number("Elevation:", n.Elevation).ShownWhen(is(Node_::kUniform) && n.Kind().correctedWhen);

  form.DataFile("Station Based Distribution File:", n.Stations().GridFile())
      .Filter("Station distr.files (*.nds2) |*.nds2|All Files (*.*) |*.*||")
      .DefaultExtension("nds2")
      .ShownWhen(byCodes)
      .Then(sync);
  form.Button("Edit...", [this] { EditDataFile(Context(), Node(), Node().Stations().GridFile().File); })
      .ShownWhen(byCodes);
  form.Button("Create...",
              [this] {
                if (!MayCreateFile(Context())) return;
                CData2DNdsCreateDlg dialog(Context(), 1.0F, Node(), quantity::kCode);
                if (const auto file = dialog.Run()) {
                  Node().Stations().GridFile().Choose(*file);
                  UpdateDoc(Sync(), "Create Grid File");
                }
              })
      .Beside()
      .ShownWhen(byCodes);
  form.ShapeFile("Shape File:", n.Stations().ShapeFile())
      .Filter(kShapeFileFilter)
      .DefaultExtension("shp")
      .ShownWhen(byPolygons)
      .Then(sync);
  form.Shown("Item Name:", [&n] { return n.Stations().ShapeFile().Attribute(); }).ShownWhen(byPolygons);
  UnitKeyChoice(form, "Unit of X- and Y-axes", "ShapeAxisUnit", n.Stations().ShapeAxisUnit, quantity::kMapCoordinate)
      .ShownWhen(byPolygons);
  GapFillChoice(form, n.Stations().ShapeGapFillName, n).ShownWhen(byPolygons);
  form.DataFile("Fully Distribution File:", n.FullyDistributed().GridFile())
      .Filter(kGridFileFilter)
      .DefaultExtension("nds2")
      .ShownWhen(is(Node_::kFullyDistributed));
  form.Button("Edit...", [this] { EditDataFile(Context(), Node(), Node().FullyDistributed().GridFile().File); })
      .ShownWhen(is(Node_::kFullyDistributed));
  form.Map([this] {
        MapContent map = StationMap(Node(), nullptr);
        map.picked = [this](const MapPick& pick) {
          const CYbSEKvfBase* station = nullptr;
          if (Node().UsesGridCodes() && pick.value) station = Node().SelectStationByCode(static_cast<int>(*pick.value));
          if (Node().UsesPolygons() && pick.shape) station = Node().SelectStationByName(pick.shapeValue);
          if (station && Context().selectNode) Context().selectNode(*station);
        };
        return map;
      })
      .ShownWhen(!is(Node_::kUniform));
}

void DescribeStation(PageForm& form, C2DStationBasedDataTimeSeriesKvf& n, CYbSEDlgBase& page) {
  const auto* data = dynamic_cast<const C2DStationBasedDataKvf*>(n.GetParent());
  form.Text("Station ID:", n.NAME).Hint(kTreeRebuilt | kDataChanged).Then([&n] {
    return n.SetAbbreviatedTitle(n.NAME), 0;
  });
  form.Choice("Temporal Distribution:", n.TYPE);
  form.Shown("Grid code value:", [&n] { return n.GRIDCODEID; }).ShownWhen("the areas are grid codes", [data] {
    return data && data->UsesGridCodes();
  });
  form.Shown("Polygon:", [&n] { return n.GRIDCODEID; }).ShownWhen("the areas are polygons", [data] {
    return data && data->UsesPolygons();
  });
  if (!data) return;
  DescribeValueOrSeries(form, page,
                        {n.TYPE, n.FIXED_VALUE, n.SeriesFile(), data->Kind().itemTypes, data->Kind().valueTypes});
  if (data->HasElevation()) form.Number("Elevation:", n.Elevation).ShownWhen(data->Kind().correctedWhen);
  form.Map([&n, data] { return StationMap(*data, &n); });
}

void DescribeTimeConstant(PageForm& form, CTimeseriesConstKvf& n, CYbSEDlgBase& page) {
  form.Choice("Temporal Distribution:", n.Global().TYPE);
  DescribeValueOrSeries(form, page,
                        {n.Global().TYPE, n.Global().FIXED_VALUE, n.Global().SeriesFile(), {n.GetItemType()}, {3}});
}

constexpr PageRow kPages[] = {
    PageIs<C2DStationBasedDataDlg, C2DStationBasedDataKvf>(kStationBasedDataPage),
    PageIs<C2DStationBasedDataDlg, C2DStationBasedDataKvf>(kPrecipitationPage),
    PageIs<C2DStationBasedDataDlg, C2DStationBasedDataKvf>(kPotEvapTransPage),
    PageIs<C2DStationBasedDataDlg, C2DStationBasedDataKvf>(kAirTemperaturePage),
    DescribedBy<DescribeStation>(kStationPage),
    DescribedBy<DescribeStation>(kPrecipitationStationPage),
    DescribedBy<DescribeStation>(kPotEvapTransStationPage),
    DescribedBy<DescribeStation>(kAirTemperatureStationPage),
    DescribedBy<DescribeTimeConstant>(kTimeseriesConstPage),
};

}  // namespace

std::span<const PageRow> StationPages() { return kPages; }

}  // namespace tervane
