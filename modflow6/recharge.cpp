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

/// A forcing on the cells, period by period.
struct CellForcing {
  std::vector<std::vector<double>> means;  ///< Of each series over the periods.
  std::vector<int> seriesOfCell;           ///< Empty where one series serves all; below 0 where none does.
  std::optional<ForcingSeries> grids;

  bool IsSameAsBefore(std::size_t period) const {
    return !grids && period > 0 && std::ranges::all_of(means, [period](const std::vector<double>& mean) {
      return mean[period] == mean[period - 1];
    });
  }
};

bool TakeForcing(Building& building, const C2DStationBasedDataKvf& node, CellForcing& taken) {
  const Forcing forcing = node.CurrentForcings().front();
  taken.grids = forcing.overGrid;
  if (taken.grids) return taken.grids->problem.empty() || building.Fail(node, taken.grids->problem);
  std::map<std::string, int> placeOfId;
  for (const ForcingSeries& series : forcing.series) {
    std::vector<double> means;
    const FileResult made = building.series.Means(series, forcing.itemType, means);
    if (!made.Ok()) return building.Fail(node, made.error);
    if (!made.note.empty()) building.Tell(Fate::Changed, node, made.note, "TYPE");
    placeOfId[series.id] = static_cast<int>(taken.means.size());
    taken.means.push_back(std::move(means));
  }
  if (!forcing.areas) return true;
  AreaCodes areas;
  if (const FileResult read = ReadAreaCodes(*forcing.areas, {}, areas); !read.Ok())
    return building.Fail(node, read.error);
  taken.seriesOfCell.assign(building.CellCount(), -1);
  const std::vector<std::optional<float>> found = ValuesIn(building.domain, areas.grid);
  std::size_t inDomain = 0, without = 0;
  for (std::size_t cell = 0; cell < taken.seriesOfCell.size(); ++cell) {
    if (building.domain.IsEmptyValue(building.domain.Values()[cell])) continue;
    const std::optional<float>& code = found[inDomain++];
    const auto place = code ? placeOfId.find(areas.IdOf(*code)) : placeOfId.end();
    if (place != placeOfId.end())
      taken.seriesOfCell[cell] = place->second;
    else
      ++without;
  }
  if (without > 0)
    building.Tell(Fate::Changed, node, fmt::format("{} cells belong to no station: they get nothing", without), "TYPE");
  return true;
}

/// The child that gives values for spans of periods; null where there is none.
const CRechargeAndPondingModListKvf* SpansIn(const CYbSEKvfBase& owner, const StressPeriodGridsKind& kind) {
  for (CYbSEKvfBase* child = owner.GetFirstChild(); child; child = owner.GetNextChild(child))
    if (child->GetSectionName() == kind.section) return dynamic_cast<const CRechargeAndPondingModListKvf*>(child);
  return nullptr;
}

bool TakeSpans(Building& building, const CRechargeAndPondingModListKvf& list, std::string_view becomes,
               AreaStress::Spans& spans) {
  const auto lowest = static_cast<float>(building.model.layers.size());
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    const CRechargeAndPondingModItemKvf& item = *list.GetItem(number);
    std::vector<float> whole(building.CellCount(), item.IsCode() ? 1.0F : 0.0F);
    LayerValues values;
    if (item.HasRelativeToGround()) {
      std::vector<float> elevations;
      if (const std::string problem = ElevationsOn(building.domain, item, building.levels.Tops(0), elevations);
          !problem.empty())
        return building.Fail(item, problem);
      values = LayerValues(std::move(elevations));
    } else if (!building.Take(item, values)) {
      return false;
    }
    for (std::size_t cell = 0; cell < whole.size(); ++cell)
      if (const float value = values.At(cell); value != kDeleteValue)
        whole[cell] = item.IsCode() ? std::clamp(std::round(value), 1.0F, lowest) : value;
    spans[static_cast<std::size_t>(std::max(1, item.StressPeriodFrom())) - 1] = std::move(whole);
    building.Tell(Fate::Carried, item, std::string(becomes));
  }
  return true;
}

/// The rates of a forcing times a factor by cell, in metres a day.
auto RatesOf(const Building& building, CellForcing forcing, LayerValues factors) {
  return [&building, forcing = std::move(forcing), factors = std::move(factors)](
             std::size_t period, std::vector<float>& rates, bool& isNew) -> FileResult {
    isNew = !forcing.IsSameAsBefore(period);
    if (!isNew) return {};
    rates.assign(building.CellCount(), 0.0F);
    std::vector<float> grid;
    if (forcing.grids) {
      CTvn2DOrthoRotatedGridData mean;
      if (FileResult made = building.series.MeanGrid(forcing.grids->path, forcing.grids->item, period, mean);
          !made.Ok())
        return made;
      if (std::string problem = PutOnModel(mean, building.domain.Geometry(), false, grid); !problem.empty())
        return {problem, {}};
    }
    for (std::size_t cell = 0; cell < rates.size(); ++cell) {
      const int place = forcing.seriesOfCell.empty() ? 0 : forcing.seriesOfCell[cell];
      if (place < 0 || factors.At(cell) == kDeleteValue || (forcing.grids && grid[cell] == kDeleteValue)) continue;
      const double rate =
          forcing.grids ? static_cast<double>(grid[cell]) : forcing.means[static_cast<std::size_t>(place)][period];
      rates[cell] = static_cast<float>(rate * kSecondsOfDay * static_cast<double>(factors.At(cell)));
    }
    return {};
  };
}

}  // namespace

bool BuildRecharge(Building& building) {
  const auto& components = *building.root.Important(kModflowComponents);
  const auto* climate = building.root.Important(kClimate);
  const auto* precipitation = building.root.Important(kPrecipitation);
  if (components.Recharge == 0 || !climate || !precipitation) return true;
  CellForcing rain;
  if (!TakeForcing(building, *precipitation, rain)) return false;
  LayerValues fractions(1.0F);
  if (const CData2DKvf* fraction = PropertyOf(*climate, "RechargeFraction")) {
    if (!building.Take(*fraction, fractions)) return false;
    building.Tell(Fate::Carried, *fraction, "a factor on the rates of RCH");
  }
  AreaStress recharge;
  recharge.isFixedToCell = climate->RechargeOption != CPrecipitationRelatedKvf::kHighestActiveCell;
  std::string where =
      recharge.isFixedToCell ? "recharge goes to the top layer alone" : "recharge goes to the highest active cell";
  if (const auto* layers = SpansIn(*climate, kRechargeLayer);
      layers && climate->RechargeOption == CPrecipitationRelatedKvf::kGivenLayer) {
    if (layers->GetItemCount() == 0)
      return building.Fail(*layers, "recharge is to go to given layers, but no span of periods gives them: add one");
    if (!TakeSpans(building, *layers, "IRCH of RCH", recharge.layers)) return false;
    where = "recharge goes to given layers";
  }
  building.Tell(Fate::Carried, *climate, where, "RechargeOption");
  recharge.rates = RatesOf(building, std::move(rain), std::move(fractions));
  building.model.recharge = std::move(recharge);
  building.Tell(Fate::Carried, *precipitation, "rates of RCH: the mean of each period");
  if (components.Recharge_ModelType == kRechargeSeepageFace)
    building.Tell(Fate::LeftOut, components, "a seepage face has no counterpart", "Recharge_ModelType");
  if (climate->PondingOption == CPrecipitationRelatedKvf::kUpToPondingElevation)
    building.Tell(Fate::LeftOut, *climate, "ponding up to an elevation has no counterpart", "PondingOption");
  return true;
}

bool BuildEvapotranspiration(Building& building) {
  const auto& components = *building.root.Important(kModflowComponents);
  if (components.ET == 0) return true;
  // What old files bring stands beside the tree.
  const auto* old = building.root.Important(kOldEvapotranspiration);
  const auto* reference = building.root.Important(kReferenceEvapotranspiration);
  const auto* surfaces = old ? SpansIn(*old, kETSurfaceElevation) : nullptr;
  const auto* depths = old ? SpansIn(*old, kETExtinctionDepth) : nullptr;
  const auto* layers = old ? SpansIn(*old, kETLayer) : nullptr;
  if (!surfaces || !depths || !reference || surfaces->GetItemCount() == 0 || depths->GetItemCount() == 0) {
    building.Tell(Fate::LeftOut, components,
                  "there is no EVT: the setup holds no surface and depth of evapotranspiration", "ET");
    return true;
  }
  AreaStress evapotranspiration;
  CellForcing demand;
  if (!TakeForcing(building, *reference, demand) ||
      !TakeSpans(building, *surfaces, "SURFACE of EVT", evapotranspiration.surfaces) ||
      !TakeSpans(building, *depths, "DEPTH of EVT", evapotranspiration.depths))
    return false;
  evapotranspiration.isFixedToCell = old->ETLayer != 0;
  if (layers && old->ETLayer != 0 && !TakeSpans(building, *layers, "IEVT of EVT", evapotranspiration.layers))
    return false;
  evapotranspiration.rates = RatesOf(building, std::move(demand), LayerValues(1.0F));
  building.model.evapotranspiration = std::move(evapotranspiration);
  building.Tell(Fate::Carried, *reference, "rates of EVT: the mean of each period");
  return true;
}

}  // namespace tervane::modflow6
