// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/station_pages.h"

#include <fmt/format.h>

#include "pages/parts/further_series.h"
#include "pages/parts/plot_content.h"
#include "pages/parts/series_controls.h"
#include "pages/parts/table_of_zones.h"
#include "pages/parts/zone_controls.h"
#include "spatial/pages.h"
#include "spatial/stations.h"
#include "surface/pages.h"
#include "wqpt/pages.h"

namespace tervane {

namespace {

/// A value or a series, as a uniform forcing, a station and a time constant have it.
struct ValueOrSeries {
  int& type;  ///< 0 constant, 1 series.
  float& value;
  CFMData0DFile& file;
  std::vector<int> itemTypes, valueTypes;
};

/// The controls of a value or a series; `isShown` says whether this form of the data is in force. `others` tells what
/// else may be laid over its chart.
void DescribeValueOrSeries(PageForm& form, CYbSEDlgBase& page, ValueOrSeries data, const Condition& isShown = {},
                           std::function<std::vector<NamedFile>()> others = {}) {
  const Condition isConstant = isShown && Is(data.type, 0), isSeries = isShown && Is(data.type, 1);
  form.Number("Value:", data.value).ShownWhen(isConstant);
  DescribeSeriesFile(form, page, "Time Series File:", data.file, {data.value, data.itemTypes, data.valueTypes},
                     isSeries);
  const auto offers = [&file = data.file, others = std::move(others)] {
    return OffersBeside(file, "Other stations", others ? others() : std::vector<NamedFile>());
  };
  form.Chart(WithFurtherSeries([&file = data.file] { return FileChart(file); }, offers)).ShownWhen(isSeries);
}

/// The series of all stations beside one.
std::vector<NamedFile> FilesOfOthers(const C2DStationBasedDataTimeSeriesKvf& station) {
  std::vector<NamedFile> files;
  const CYbSEKvfBase* owner = station.GetParent();
  for (const CYbSEKvfBase* child = owner->GetFirstChild(); child; child = owner->GetNextChild(child)) {
    const auto* other = dynamic_cast<const C2DStationBasedDataTimeSeriesKvf*>(child);
    if (other && other != &station && other->TYPE == C2DStationBasedDataTimeSeriesKvf::kTimeVarying)
      files.push_back({other->GetStationName(), &other->SeriesFile()});
  }
  return files;
}

constexpr ZoneSourceWords kStationWords{.grid = "Station Based Distribution File:",
                                        .gridFilter = "Station distr.files (*.nds2) |*.nds2|All Files (*.*) |*.*||",
                                        .shape = "Shape File:",
                                        .units = "Unit of X- and Y-axes",
                                        .isEditBeside = false};

/// The map of a forcing: its grids, or the areas of its stations, one of them standing out.
MapContent ForcingMap(const C2DStationBasedDataKvf& data, const CFMSEKvfGroupBase* highlighted) {
  return data.DistributionType == C2DStationBasedDataKvf::kFullyDistributed
             ? FileMap(data.FullyDistributed().GridFile())
             : ZoneMap(data.Stations(), highlighted);
}

/// What the stations of a forcing have in the table of all.
StationColumns ColumnsOf(const C2DStationBasedDataKvf& data) {
  using Station = C2DStationBasedDataTimeSeriesKvf;
  StationColumns columns;
  columns.series = [](CodedZoneProp& zone) {
    auto& station = static_cast<Station&>(zone);
    return station.TYPE == Station::kTimeVarying ? &station.SeriesFile() : nullptr;
  };
  columns.itemType = data.GetItemType();
  if (!data.HasElevation()) return columns;
  columns.elevation = [](CodedZoneProp& zone) { return &static_cast<Station&>(zone).Elevation; };
  columns.hasElevation = [&data] { return data.Kind().correctedWhen.Holds(data); };
  return columns;
}

/// A forcing: uniform, by stations, or fully distributed.
class C2DStationBasedDataDlg : public PageOf<C2DStationBasedDataKvf> {
 public:
  using PageOf::PageOf;

  void OnRefresh() override { RefreshZones(*this, Node().Stations(), "Refresh Stations"); }

 protected:
  void Describe(PageForm& form) override;

 private:
  TableOfZones stations_{Node().Stations(), ColumnsOf(Node())};
};

void C2DStationBasedDataDlg::Describe(PageForm& form) {
  using Node_ = C2DStationBasedDataKvf;
  Node_& n = Node();
  const auto is = [&n](int distribution) { return Is(n.DistributionType, distribution); };
  form.Choice("Spatial Distribution:", n.DistributionType).RevalidatesLater().Then([this] {
    if (Node().DistributionType == Node_::kFullyDistributed && Node().IsCorrectedForElevation())
      Outside().ShowMessage(
          fmt::format("Warning: Fully distributed {} cannot be corrected for elevation.", Node().Kind().correctable),
          Host::Icon::Warning);
    return 0;
  });
  form.Choice("Temporal Distribution:", n.Global().TYPE).ShownWhen(is(Node_::kUniform));
  form.Choice("Data Type:", n.Stations().TYPE).ShownWhen(is(Node_::kStationBased)).Then([this] {
    return SyncWithSource(Outside(), Node().Stations());
  });
  DescribeValueOrSeries(
      form, *this,
      {n.Global().TYPE, n.Global().FIXED_VALUE, n.Global().SeriesFile(), n.Kind().itemTypes, n.Kind().valueTypes},
      is(Node_::kUniform));
  if (n.HasElevation()) form.Number("Elevation:", n.Elevation).ShownWhen(is(Node_::kUniform) && n.Kind().correctedWhen);

  DescribeZoneSource(form, *this, n.Stations(), kStationWords);
  form.DataFile("Fully Distribution File:", n.FullyDistributed().GridFile())
      .Filter(kGridFileFilter)
      .DefaultExtension("nds2")
      .ShownWhen(is(Node_::kFullyDistributed));
  form.Button("Edit...", [this] { EditDataFile(Context(), Node(), Node().FullyDistributed().GridFile().File); })
      .ShownWhen(is(Node_::kFullyDistributed));
  stations_.Describe(form, *this);
  form.Map([this] {
        MapContent map = ForcingMap(Node(), nullptr);
        GoToPickedZone(map, *this, Node().Stations());
        if (stations_.Follow(map.awaited) && Context().syncSoon) Context().syncSoon();
        return map;
      })
      .ShownWhen(!is(Node_::kUniform));
}

void DescribeStation(PageForm& form, C2DStationBasedDataTimeSeriesKvf& n, CYbSEDlgBase& page) {
  const auto* data = dynamic_cast<const C2DStationBasedDataKvf*>(n.GetParent());
  ZoneName(form, "Station ID:", n);
  form.Choice("Temporal Distribution:", n.TYPE);
  ZoneIdentity(form, "areas", n, data ? &data->Stations() : nullptr);
  if (!data) return;
  DescribeValueOrSeries(form, page,
                        {n.TYPE, n.FIXED_VALUE, n.SeriesFile(), data->Kind().itemTypes, data->Kind().valueTypes}, {},
                        [&n] { return FilesOfOthers(n); });
  if (data->HasElevation()) form.Number("Elevation:", n.Elevation).ShownWhen(data->Kind().correctedWhen);
  form.Map([&n, data] { return ForcingMap(*data, &n); });
}

void DescribeTimeConstant(PageForm& form, CTimeseriesConstKvf& n, CYbSEDlgBase& page) {
  form.Choice("Temporal Distribution:", n.Global().TYPE);
  DescribeValueOrSeries(form, page,
                        {n.Global().TYPE, n.Global().FIXED_VALUE, n.Global().SeriesFile(), {n.GetItemType()}, {3}});
}

}  // namespace

std::span<const PageRow> StationPages() {
  static constexpr PageRow kRows[] = {
      PageIs<C2DStationBasedDataDlg, C2DStationBasedDataKvf>(kStationBasedDataPage),
      PageIs<C2DStationBasedDataDlg, C2DStationBasedDataKvf>(kPrecipitationPage),
      PageIs<C2DStationBasedDataDlg, C2DStationBasedDataKvf>(kPotEvapTransPage),
      PageIs<C2DStationBasedDataDlg, C2DStationBasedDataKvf>(kAirTemperaturePage),
      PageIs<C2DStationBasedDataDlg, C2DStationBasedDataKvf>(kStrengthPage),
      DescribedBy<DescribeStation>(kStationPage),
      DescribedBy<DescribeStation>(kStrengthStationPage),
      DescribedBy<DescribeStation>(kPrecipitationStationPage),
      DescribedBy<DescribeStation>(kPotEvapTransStationPage),
      DescribedBy<DescribeStation>(kAirTemperatureStationPage),
      DescribedBy<DescribeTimeConstant>(kTimeseriesConstPage),
  };
  return kRows;
}

}  // namespace tervane
