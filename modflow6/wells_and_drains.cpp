// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>

#include <fmt/format.h>

#include "libraries/wells.h"
#include "modflow6/stress_sources.h"
#include "platform/item_types.h"
#include "spatial/data2d.h"
#include "spatial/stations.h"
#include "subsurface/drainage.h"
#include "subsurface/ground_properties.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"
#include "surface/rivers.h"

namespace tervane::modflow6 {

namespace {

/// The cells that a filter meets, each with its share by what it lets through.
struct ScreenedCells {
  std::vector<StressEntry> entries;
  std::vector<double> shares;
};

ScreenedCells CellsOf(const FlowModel& model, std::uint32_t cell, const CTvnWellFilter& filter, std::uint16_t name) {
  ScreenedCells screened;
  double whole = 0;
  for (std::size_t number = 0; number < model.layers.size(); ++number) {
    const Layer& layer = model.layers[number];
    if (!layer.IsActive(cell)) continue;
    const double common = std::min(filter.top, static_cast<double>(layer.top[cell])) -
                          std::max(filter.bottom, static_cast<double>(layer.bottom[cell]));
    if (common <= 0) continue;
    screened.entries.push_back({cell, static_cast<std::uint16_t>(number), name, 0, 0});
    screened.shares.push_back(common * static_cast<double>(layer.conductivity.At(cell)));
    whole += screened.shares.back();
  }
  for (double& share : screened.shares)
    share = whole > 0 ? share / whole : 1 / static_cast<double>(screened.shares.size());
  return screened;
}

}  // namespace

bool BuildWells(Building& building) {
  auto* node = building.root.Important(kWells);
  if (!node || !node->IsDataUsedInSetup()) return true;
  CTvnWellDataList list;
  if (!list.LoadWellDataFile(node->Filename.IsEmpty() ? std::string() : node->Filename.Absolute()))
    return building.Fail(*node, list.Problem());
  const GridGeometry& geometry = building.domain.Geometry();
  const GridTransform transform(geometry);
  StressPackage package{.kind = "WEL", .name = "wel", .names = {}};
  std::vector<StressSource> sources;
  std::size_t taken = 0, outside = 0, without = 0;
  for (const CTvnWellData& well : list.Wells()) {
    const MapPoint at = transform.ToCells(well.place);
    if (at.x < 0 || at.y < 0 || at.x >= geometry.nx || at.y >= geometry.ny) {
      outside += well.filters.size();
      continue;
    }
    const auto cell = static_cast<std::uint32_t>(
        static_cast<std::size_t>(at.y) * static_cast<std::size_t>(geometry.nx) + static_cast<std::size_t>(at.x));
    for (const CTvnWellFilter& filter : well.filters) {
      ScreenedCells screened = CellsOf(building.model, cell, filter, AddName(package, well.name));
      if (screened.entries.empty()) {
        ++outside;
        continue;
      }
      if (filter.timeSeries.IsEmpty()) {
        ++without;
        continue;
      }
      std::vector<double> means;
      const FileResult made = building.series.Means(filter.timeSeries.Absolute(), filter.item, means);
      if (!made.Ok()) return building.Fail(*node, fmt::format("{}: {}", well.name, made.error));
      if (!made.note.empty()) building.Tell(Fate::Changed, *node, made.note, "Filename");
      for (double& mean : means) mean *= -kSecondsOfDay;
      sources.push_back(FollowingCells(std::move(screened.entries), std::move(means), std::move(screened.shares)));
      ++taken;
    }
  }
  if (const FileResult collected = Collect(sources, building.model, package); !collected.Ok())
    return building.Fail(*node, collected.error);
  if (!package.IsEmpty()) building.model.stresses.push_back(std::move(package));
  building.Tell(
      Fate::Carried, *node,
      fmt::format("{} filters as rates of WEL: the mean of each period, shared by what layers let through", taken));
  if (outside > 0)
    building.Tell(Fate::LeftOut, *node, fmt::format("filters that lie in no active cell: {}", outside), "Filename");
  if (without > 0)
    building.Tell(Fate::LeftOut, *node, fmt::format("filters without a series: {}", without), "Filename");
  if (building.zone.FractureWells != 0)
    building.Tell(Fate::LeftOut, building.zone, "wells in fractures have no counterpart", "FractureWells");
  return true;
}

namespace {

/// The uppermost active layer in which a level lies, else the lowest active one; no layer where none is active.
std::optional<std::uint16_t> LayerAt(const FlowModel& model, std::size_t cell, double level) {
  std::optional<std::uint16_t> lowest;
  for (std::size_t number = 0; number < model.layers.size(); ++number) {
    if (!model.layers[number].IsActive(cell)) continue;
    lowest = static_cast<std::uint16_t>(number);
    if (level >= static_cast<double>(model.layers[number].bottom[cell])) break;
  }
  return lowest;
}

}  // namespace

bool BuildDrains(Building& building) {
  const auto* drains = building.root.Important(kModflowDrains);
  if (!drains || building.zone.Drainage == 0) return true;
  StressPackage package{.kind = "DRN", .name = "drn", .names = {}};
  std::vector<StressSource> sources;
  std::size_t raised = 0;
  for (int number = 1; number <= drains->GetItemCount(); ++number) {
    const CDrainageMFSZItemKvf& drain = *drains->GetItem(number);
    const CData2DKvf* where = PropertyOf(drain, "Distribution");
    const CData2DKvf* level = PropertyOf(drain, "Level");
    LayerValues codes;
    std::vector<float> levels;
    if (!where || !level || !building.Take(*where, codes)) return false;
    if (const std::string problem = ElevationsOn(building.domain, *level, building.levels.Tops(0), levels);
        !problem.empty())
      return building.Fail(*level, problem);
    const std::vector<Forcing> forcings = drain.TimeConstant().CurrentForcings();
    std::vector<double> rates;
    const FileResult made = building.series.Means(forcings.front().series.front(), forcings.front().itemType, rates);
    if (!made.Ok()) return building.Fail(drain.TimeConstant(), made.error);
    const std::uint16_t name = AddName(package, drain.Name);
    std::vector<StressEntry> entries;
    for (std::size_t cell = 0; cell < levels.size(); ++cell) {
      if (levels[cell] == kDeleteValue || codes.At(cell) == kDeleteValue || codes.At(cell) <= 0) continue;
      const auto layer = LayerAt(building.model, cell, static_cast<double>(levels[cell]));
      if (!layer) continue;
      const auto bottom = static_cast<double>(building.model.layers[*layer].bottom[cell]);
      raised += static_cast<double>(levels[cell]) < bottom;
      entries.push_back(
          {static_cast<std::uint32_t>(cell), *layer, name, std::max(bottom, static_cast<double>(levels[cell])), 0});
    }
    const double area = building.model.CellArea();
    const bool varies = std::ranges::adjacent_find(rates, std::not_equal_to<>()) != rates.end();
    sources.push_back({varies, [entries = std::move(entries), rates = std::move(rates), area](
                                   std::size_t period, std::vector<StressEntry>& all) {
                         for (StressEntry entry : entries) {
                           entry.conductance = rates[period] * area * kSecondsOfDay;
                           all.push_back(entry);
                         }
                         return FileResult{};
                       }});
    building.Tell(Fate::Carried, drain, "drains of DRN, whose conductance is the time constant times the cell's area");
  }
  if (raised > 0)
    building.Tell(Fate::Changed, *drains, fmt::format("{} levels below all layers lie at the lowest bottom", raised),
                  "NumberOfLayers");
  if (const FileResult collected = Collect(sources, building.model, package); !collected.Ok())
    return building.Fail(*drains, collected.error);
  if (!package.IsEmpty()) building.model.stresses.push_back(std::move(package));
  return true;
}

bool BuildRivers(Building& building) {
  auto* rivers = dynamic_cast<CRiverMFKvf*>(building.root.Important(kModflowRiver));
  if (rivers && rivers->IsDataUsedInSetup())
    building.Tell(Fate::LeftOut, *rivers,
                  "its network tells where rivers run, and RIV asks for their levels and what their beds let through: "
                  "add it by hand");
  return true;
}

}  // namespace tervane::modflow6
