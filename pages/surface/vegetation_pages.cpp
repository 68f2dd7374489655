// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/vegetation_pages.h"

#include <algorithm>
#include <iterator>

#include "pages/parts/plot_content.h"
#include "pages/parts/series_controls.h"
#include "pages/parts/zone_controls.h"
#include "pages/surface/crop_table.h"
#include "platform/item_types.h"
#include "surface/pages.h"
#include "surface/vegetation.h"

namespace tervane {

namespace {

/// Both series in one chart.
SeriesContent SeriesChart(const VegetationCourse& course) {
  SeriesContent chart = FileChart(course.LaiFile());
  SeriesContent rootDepth = FileChart(course.RootDepthFile());
  std::ranges::move(rootDepth.series, std::back_inserter(chart.series));
  std::ranges::move(rootDepth.awaited, std::back_inserter(chart.awaited));
  if (chart.message.empty()) chart.message = std::move(rootDepth.message);
  if (!chart.period) chart.period = rootDepth.period;
  return chart;
}

void DescribeCourse(PageForm& form, const CYbSEDlgBase& page, VegetationCourse& course) {
  const Condition isConstant = course.IsOfForm(VegetationCourse::kConstant),
                  isTimeVarying = course.IsOfForm(VegetationCourse::kTimeVarying),
                  isCrops = course.IsOfForm(VegetationCourse::kCrops);
  form.Number("LAI Constant Value:", course.FIXED_VALUE_LAI).ShownWhen(isConstant);
  form.Number("RD Constant Value:", course.FIXED_VALUE_RD).ShownWhen(isConstant);
  DescribeSeriesFile(form, page, "LAI Timeseries File:", course.LaiFile(),
                     {course.FIXED_VALUE_LAI, {quantity::kLeafAreaIndex}}, isTimeVarying);
  DescribeSeriesFile(form, page, "RD Timeseries File:", course.RootDepthFile(),
                     {course.FIXED_VALUE_RD, {quantity::kRootDepth}}, isTimeVarying);
  form.Chart([&course] { return SeriesChart(course); }).ShownWhen(isTimeVarying);
  form.Table(CVegetationGrid(course.Crops(), page)).ShownWhen(isCrops);
  form.Choice("Recycling Mode:", course.Crops().RecycleMode).ShownWhen(isCrops);
}

constexpr ZoneSourceWords kStationWords{.grid = "Station Based Distribution File:",
                                        .gridFilter = "Station distr.files (*.nds2) |*.nds2|All Files (*.*) |*.*||",
                                        .shape = "Shape File:",
                                        .units = "X- and Y-axis Units:",
                                        .isEditBeside = false};

/// The vegetation: uniform, by stations, or for each cell.
class CVegetationDlg : public PageOf<CVegetationKvf> {
 public:
  using PageOf::PageOf;

  void OnRefresh() override { RefreshZones(*this, Node().Stations(), "Refresh Stations"); }

 protected:
  void Describe(PageForm& form) override;
};

void CVegetationDlg::Describe(PageForm& form) {
  CVegetationKvf& n = Node();
  const auto is = [&n](int distribution) { return Is(n.DistributionType, distribution); };
  const Condition isUniform = is(CVegetationKvf::kUniform), isByStations = is(CVegetationKvf::kStationBased),
                  isByCells = is(CVegetationKvf::kFullyDistributed);
  form.Choice("Spatial Distribution:", n.DistributionType).RevalidatesLater();
  form.Choice("Temporal Distribution:", n.Global().TYPE).ShownWhen(isUniform);
  form.Choice("Data Type:", n.Stations().TYPE).ShownWhen(isByStations).Then([this] {
    return SyncWithSource(Outside(), Node().Stations());
  });
  form.Choice("Temporal Distribution:", n.FullyDistributed().TYPE).ShownWhen(isByCells);
  DescribeCourse(form, *this, n.Global());
  DescribeZoneSource(form, *this, n.Stations(), kStationWords);
  form.Map([this] {
        MapContent map = ZoneMap(Node().Stations(), nullptr);
        GoToPickedZone(map, *this, Node().Stations());
        return map;
      })
      .ShownWhen(isByStations);
  const std::pair<const char*, CFMData2DNdsFile*> grids[] = {
      {"LAI Grid Distribution File:", &n.FullyDistributed().LaiFile()},
      {"RD Grid distribution file:", &n.FullyDistributed().RootDepthFile()}};
  for (const auto& [label, file] : grids) {
    form.DataFile(label, *file).Filter(kGridFileFilter).DefaultExtension("nds2").ShownWhen(isByCells);
    form.Map([file] { return FileMap(*file); }).ShownWhen(isByCells);
  }
}

void DescribeStation(PageForm& form, CVegetationTimeSeriesKvf& n, CYbSEDlgBase& page) {
  const auto* owner = dynamic_cast<const CVegetationKvf*>(n.GetParent());
  ZoneName(form, "Station ID:", n);
  form.Choice("Temporal Distribution:", n.TYPE);
  ZoneIdentity(form, "areas", n, owner ? &owner->Stations() : nullptr);
  DescribeCourse(form, page, n);
  if (owner) form.Map([&n, owner] { return ZoneMap(owner->Stations(), &n); });
}

constexpr PageRow kPages[] = {
    PageIs<CVegetationDlg, CVegetationKvf>(kVegetationPage),
    DescribedBy<DescribeStation>(kVegetationStationPage),
};

}  // namespace

std::span<const PageRow> VegetationPages() { return kPages; }

}  // namespace tervane
