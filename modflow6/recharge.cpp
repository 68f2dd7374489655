// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <cmath>
#include <map>

#include <fmt/format.h>

#include "modelcells/model_grids.h"
#include "modflow6/building.h"
#include "simspec/model_components.h"
#include "spatial/domain_cells.h"
#include "spatial/stations.h"
#include "subsurface/ground_properties.h"
#include "surface/climate.h"
#include "surface/stress_period_grids.h"

namespace tervane::modflow6 {

namespace {

/// Precipitation on the cells, period by period, in metres a day.
struct Rain {
  std::vector<std::vector<double>> means;  ///< Of each series over the periods.
  std::vector<int> seriesOfCell;           ///< Empty where one series serves all; below 0 where none does.
  std::optional<ForcingSeries> grids;

  bool IsSameAsBefore(std::size_t period) const {
    return !grids && period > 0 && std::ranges::all_of(means, [period](const std::vector<double>& mean) {
      return mean[period] == mean[period - 1];
    });
  }
};

bool TakeRain(Building& building, const C2DStationBasedDataKvf& node, Rain& rain) {
  const Forcing forcing = node.CurrentForcings().front();
  rain.grids = forcing.overGrid;
  if (rain.grids) return rain.grids->problem.empty() || building.Fail(node, rain.grids->problem);
  std::map<std::string, int> placeOfId;
  for (const ForcingSeries& series : forcing.series) {
    std::vector<double> means;
    const FileResult made = building.series.Means(series, forcing.itemType, means);
    if (!made.Ok()) return building.Fail(node, made.error);
    if (!made.note.empty()) building.Tell(Fate::Changed, node, made.note, "TYPE");
    placeOfId[series.id] = static_cast<int>(rain.means.size());
    rain.means.push_back(std::move(means));
  }
  if (!forcing.areas) return true;
  AreaCodes areas;
  if (const FileResult read = ReadAreaCodes(*forcing.areas, {}, areas); !read.Ok())
    return building.Fail(node, read.error);
  rain.seriesOfCell.assign(building.CellCount(), -1);
  const std::vector<std::optional<float>> found = ValuesIn(building.domain, areas.grid);
  std::size_t inDomain = 0, without = 0;
  for (std::size_t cell = 0; cell < rain.seriesOfCell.size(); ++cell) {
    if (building.domain.IsEmptyValue(building.domain.Values()[cell])) continue;
    const std::optional<float>& code = found[inDomain++];
    const auto place = code ? placeOfId.find(areas.IdOf(*code)) : placeOfId.end();
    if (place != placeOfId.end())
      rain.seriesOfCell[cell] = place->second;
    else
      ++without;
  }
  if (without > 0)
    building.Tell(Fate::Changed, node, fmt::format("{} cells belong to no station: they get no recharge", without),
                  "TYPE");
  return true;
}

/// The layers to which recharge goes, where spans of periods tell them.
bool TakeLayers(Building& building, const CPrecipitationRelatedKvf& climate, AreaStress& recharge) {
  const CRechargeAndPondingModListKvf* list = nullptr;
  for (CYbSEKvfBase* child = climate.GetFirstChild(); child; child = climate.GetNextChild(child))
    if (child->GetSectionName() == kRechargeLayer.section)
      list = dynamic_cast<const CRechargeAndPondingModListKvf*>(child);
  if (!list) return true;
  if (list->GetItemCount() == 0)
    return building.Fail(*list, "recharge is to go to given layers, but there is no span of periods that gives them");
  const auto lowest = static_cast<float>(building.model.layers.size());
  for (int number = 1; number <= list->GetItemCount(); ++number) {
    const CRechargeAndPondingModItemKvf& item = *list->GetItem(number);
    LayerValues layers;
    if (!building.Take(item, layers)) return false;
    std::vector<float> whole(building.CellCount(), 1.0F);
    for (std::size_t cell = 0; cell < whole.size(); ++cell)
      if (layers.At(cell) != kDeleteValue) whole[cell] = std::clamp(std::round(layers.At(cell)), 1.0F, lowest);
    recharge.layers[static_cast<std::size_t>(std::max(1, item.StressPeriodFrom())) - 1] = std::move(whole);
    building.Tell(Fate::Carried, item, "IRCH of RCH");
  }
  building.Tell(Fate::Carried, climate, "recharge goes to given layers", "RechargeOption");
  return true;
}

}  // namespace

bool BuildRecharge(Building& building) {
  const auto& components = *building.root.Important(kModflowComponents);
  if (components.ET != 0)
    building.Tell(Fate::LeftOut, components,
                  "the setup holds no surface and depth of evapotranspiration: there is no EVT", "ET");
  const auto* climate = building.root.Important(kClimate);
  const auto* precipitation = building.root.Important(kPrecipitation);
  if (components.Recharge == 0 || !climate || !precipitation) return true;
  Rain rain;
  if (!TakeRain(building, *precipitation, rain)) return false;
  const CData2DKvf* fraction = PropertyOf(*climate, "RechargeFraction");
  LayerValues fractions(1.0F);
  if (fraction) {
    if (!building.Take(*fraction, fractions)) return false;
    building.Tell(Fate::Carried, *fraction, "a factor on the rates of RCH");
  }
  AreaStress recharge;
  recharge.isFixedToCell = climate->RechargeOption != CPrecipitationRelatedKvf::kHighestActiveCell;
  if (climate->RechargeOption == CPrecipitationRelatedKvf::kGivenLayer) {
    if (!TakeLayers(building, *climate, recharge)) return false;
  } else {
    building.Tell(
        Fate::Carried, *climate,
        recharge.isFixedToCell ? "recharge goes to the top layer alone" : "recharge goes to the highest active cell",
        "RechargeOption");
  }
  recharge.rates = [&building, rain = std::move(rain), fractions](std::size_t period, std::vector<float>& rates,
                                                                  bool& isNew) -> FileResult {
    isNew = !rain.IsSameAsBefore(period);
    if (!isNew) return {};
    rates.assign(building.CellCount(), 0.0F);
    std::vector<float> grid;
    if (rain.grids) {
      CTvn2DOrthoRotatedGridData mean;
      if (FileResult made = building.series.MeanGrid(rain.grids->path, rain.grids->item, period, mean); !made.Ok())
        return made;
      if (std::string problem = PutOnModel(mean, building.domain.Geometry(), false, grid); !problem.empty())
        return {problem, {}};
    }
    for (std::size_t cell = 0; cell < rates.size(); ++cell) {
      const int place = rain.seriesOfCell.empty() ? 0 : rain.seriesOfCell[cell];
      if (place < 0 || fractions.At(cell) == kDeleteValue || (rain.grids && grid[cell] == kDeleteValue)) continue;
      const double rate =
          rain.grids ? static_cast<double>(grid[cell]) : rain.means[static_cast<std::size_t>(place)][period];
      rates[cell] = static_cast<float>(rate * kSecondsOfDay * static_cast<double>(fractions.At(cell)));
    }
    return {};
  };
  building.model.recharge = std::move(recharge);
  building.Tell(Fate::Carried, *precipitation, "rates of RCH: the mean of each period");
  if (components.Recharge_ModelType == kRechargeSeepageFace)
    building.Tell(Fate::LeftOut, components, "a seepage face has no counterpart", "Recharge_ModelType");
  if (climate->PondingOption == CPrecipitationRelatedKvf::kUpToPondingElevation)
    building.Tell(Fate::LeftOut, *climate, "ponding up to an elevation has no counterpart", "PondingOption");
  return true;
}

}  // namespace tervane::modflow6
