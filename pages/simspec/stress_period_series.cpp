// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/simspec/stress_period_series.h"

#include <fmt/format.h>

#include "libraries/wells.h"
#include "pages/parts/plot_content.h"
#include "simspec/periods.h"
#include "spatial/zone_sync.h"
#include "subsurface/wells.h"
#include "surface/climate.h"

namespace tervane {

namespace {

void AddForcing(C2DStationBasedDataKvf* forcing, const char* source, std::vector<DrivingSeries>& all) {
  if (!forcing || !forcing->IsDataUsedInSetup()) return;
  const auto add = [&](const DataFileNode& file, std::string title) {
    if (!file.File.IsEmpty() && file.WhyNotValid().empty())
      all.push_back({source, std::move(title), file.File.Absolute(), file.SelectedItem()});
  };
  if (forcing->DistributionType == StationOwnerKvf::kUniform && forcing->Global().TYPE == CGlobalKvf::kTimeVarying)
    add(forcing->Global().SeriesFile(), source);
  if (forcing->DistributionType != StationOwnerKvf::kStationBased) return;
  for (const CFMSEKvfGroupBase* item : ZoneItems(*forcing))
    if (const auto* station = dynamic_cast<const C2DStationBasedDataTimeSeriesKvf*>(item);
        station && station->TYPE == C2DStationBasedDataTimeSeriesKvf::kTimeVarying)
      add(station->SeriesFile(), fmt::format("{} - {}", source, station->NAME));
}

}  // namespace

std::vector<DrivingSeries> DrivingSeriesOf(const CYbSEKvfBase& node) {
  std::vector<DrivingSeries> all;
  AddForcing(node.Important(kPrecipitation), "Precipitation", all);
  AddForcing(node.Important(kReferenceEvapotranspiration), "Reference Evapotr.", all);
  auto* wells = node.Important(kWells);
  if (!wells || !wells->IsDataUsedInSetup() || wells->GetFilename().IsEmpty()) return all;
  for (const CTvnAbstraction& pumped : TvnGetAbstractionFileList(wells->GetFilename().Absolute()))
    all.push_back({"Pumping well", fmt::format("Pumping well - {}, {}", pumped.well, pumped.filter),
                   pumped.timeSeriesFile, pumped.item});
  return all;
}

SeriesContent DrivingSeriesChart(const CYbSEKvfBase& node, bool isLumped, const DisplayUnits* units) {
  SeriesContent chart;
  if (const auto* period = node.Important(kSimulationPeriod))
    chart.period = {period->GetSimStartDate(), period->SIMEND};
  std::string problem;
  for (const DrivingSeries& driving : DrivingSeriesOf(node)) {
    const auto computed = RecentSeries(driving.path, driving.item);
    const auto data = NowOrAwaited(computed, chart.awaited);
    if (!data && computed->IsDone() && problem.empty()) problem = computed->Problem();
    if (!data) continue;
    const std::string& title = isLumped ? driving.source : driving.title;
    if (!isLumped || chart.panelTitles.empty() || chart.panelTitles.back() != title) chart.panelTitles.push_back(title);
    Series& series = chart.series.emplace_back(InUserUnit(*data, units));
    series.name = driving.title;
    series.panel = static_cast<int>(chart.panelTitles.size()) - 1;
  }
  if (chart.IsEmpty())
    chart.message = problem.empty() ? "There are no series of precipitation, evapotranspiration or pumping wells."
                                    : fmt::format("A series cannot be read: {}.", problem);
  return chart;
}

}  // namespace tervane
