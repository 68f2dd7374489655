// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Layers: where they are, what they are made of, and the heads in them.
#include <algorithm>
#include <unordered_map>

#include <fmt/format.h>

#include "modelcells/model_grids.h"
#include "modflow6/building.h"
#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "simspec/modflow_solvers.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "subsurface/computational_layers.h"
#include "subsurface/geology.h"
#include "subsurface/ground_layers.h"
#include "subsurface/ground_properties.h"
#include "subsurface/internal_boundary.h"
#include "subsurface/saturated_zone.h"

namespace tervane::modflow6 {

bool BuildDiscretization(Building& building) {
  const std::vector<GroundBody> bodies = ComputationalLayersOf(building.zone);
  std::size_t passed = 0;
  for (int number = 0; number < building.levels.Count(); ++number) {
    const auto place = static_cast<std::size_t>(number);
    Layer layer;
    layer.name = bodies[place].name;
    layer.top = building.levels.Tops(number);
    layer.bottom = building.levels.Bottoms(number);
    layer.state.assign(building.CellCount(), kInactive);
    for (std::size_t cell = 0; cell < layer.state.size(); ++cell) {
      if (layer.top[cell] == kDeleteValue || layer.bottom[cell] == kDeleteValue) continue;
      layer.state[cell] = building.levels.Thickness(number, cell) > 0 ? kActive : kPassedThrough;
      passed += layer.state[cell] == kPassedThrough;
    }
    const auto& node = dynamic_cast<const CSZVerDiscrLayerKvf&>(*bodies[place].node);
    if (auto* inner = node.Child<CSZVerDiscrInternalBoundaryKvf>(); inner && inner->IsDataUsedInSetup()) {
      BoundaryZones zones;
      if (const FileResult read = ZonesOnCells(*inner, building.domain, zones); !read.Ok())
        return building.Fail(*inner, read.error);
      for (std::size_t cell = 0; cell < layer.state.size(); ++cell)
        if (const auto* zone = zones.At(cell);
            zone && zone->BoundaryType == CSZVerDiscrInternalBoundaryPropKvf::kInactive)
          layer.state[cell] = kInactive;
      for (const auto* zone : zones.zones)
        if (zone->BoundaryType == CSZVerDiscrInternalBoundaryPropKvf::kInactive)
          building.Tell(Fate::Carried, *zone, "inactive in IDOMAIN");
    }
    building.model.layers.push_back(std::move(layer));
  }
  if (const auto* domain = building.root.Important(kDomain))
    building.Tell(Fate::Carried, *domain, "the grid of DIS, turned as it is; cells outside are inactive");
  if (const auto* ground = building.root.Important(kTopography))
    building.Tell(Fate::Carried, *ground, "the top of the uppermost layer");
  building.Tell(Fate::Carried, building.zone, fmt::format("{} layers in DIS", building.levels.Count()),
                "TypeOfVerDiscr");
  if (passed > 0)
    building.Tell(Fate::Changed, building.zone, fmt::format("{} cells that are too thin are passed through", passed),
                  "MimimumLayerThickness");
  return true;
}

namespace {

/// A body of the ground with its values on the cells.
struct Body {
  std::vector<float> top, bottom;  ///< Empty for a layer that is the computational layer itself.
  LayerValues extent;              ///< Of a lens.
  LayerValues along, upright, storage, yield, ratio;
};

/// Gives units their values, in the place of maps of each.
bool TakeUnits(const Building& building, const CYbSEKvfBase& owner, Body& body) {
  const CData2DKvf* map = PropertyOf(owner, "GeoUnit");
  LayerValues codes;
  if (!map || !building.Take(*map, codes)) return false;
  std::unordered_map<int, const CGeoUnitsSZItemKvf*> units;
  const CGeoUnitsSZListKvf& list = building.zone.Units();
  for (int number = 1; number <= list.GetItemCount(); ++number)
    units.try_emplace(list.GetItem(number)->SoilCode, list.GetItem(number));
  const auto factor = static_cast<float>(SiFactorOf(quantity::kHydraulicConductivity));
  const auto storage = static_cast<float>(SiFactorOf(quantity::kSpecificStorage));
  const std::size_t count = codes.IsUniform() ? 1 : building.CellCount();
  std::vector<float> along(count, kDeleteValue), upright = along, specific = along, yield = along;
  for (std::size_t cell = 0; cell < count; ++cell) {
    const float code = codes.At(cell);
    const auto unit = code == kDeleteValue ? units.end() : units.find(static_cast<int>(std::lround(code)));
    if (unit == units.end()) continue;
    along[cell] = unit->second->HorConduc * factor;
    upright[cell] = unit->second->VerConduc * factor;
    specific[cell] = unit->second->StorageCoef * storage;
    yield[cell] = unit->second->SpecYield;
  }
  body.along = LayerValues(std::move(along));
  body.upright = LayerValues(std::move(upright));
  body.storage = LayerValues(std::move(specific));
  body.yield = LayerValues(std::move(yield));
  building.Tell(Fate::Carried, *map, "the values of its units, in NPF and STO");
  return true;
}

bool TakeProperties(const Building& building, const CYbSEKvfBase& owner, Body& body) {
  if (building.zone.ParameterDistribution == CSatZoneKvf::kByUnits) {
    if (!TakeUnits(building, owner, body)) return false;
  } else {
    struct Row {
      const char* section;
      LayerValues* values;
      const char* becomes;
    };
    for (const Row& row :
         {Row{"HorHydrCon", &body.along, "K of NPF"}, Row{"VerHydrCon", &body.upright, "K33 of NPF"},
          Row{"StorageCoef", &body.storage, "SS of STO"}, Row{"SpecificYield", &body.yield, "SY of STO"}}) {
      const CData2DKvf* property = PropertyOf(owner, row.section);
      if (!property || !building.Take(*property, *row.values)) return false;
      building.Tell(Fate::Carried, *property, row.becomes);
    }
  }
  const CData2DKvf* ratio = PropertyOf(owner, "HorizontalAnisotropyRatio");
  if (!ratio || !building.Take(*ratio, body.ratio)) return false;
  const bool isNone = body.ratio.IsUniform() && body.ratio.At(0) == 0;
  building.Tell(isNone ? Fate::Changed : Fate::Carried, *ratio, isNone ? "0 is taken for 1" : "K22 of NPF");
  if (isNone) body.ratio = LayerValues(1.0F);
  return true;
}

/// What the parts of a cell come to: along the layer by the sum of flows, upright by the sum of resistances.
class Mixture {
 public:
  void Add(const Body& body, std::size_t cell, double thickness) {
    const float along = body.along.At(cell), upright = body.upright.At(cell);
    if (thickness <= 0) return;
    if (along == kDeleteValue || upright == kDeleteValue || body.storage.At(cell) == kDeleteValue ||
        body.yield.At(cell) == kDeleteValue || body.ratio.At(cell) == kDeleteValue) {
      isKnown_ = false;
      return;
    }
    thickness_ += thickness;
    flow_ += thickness * static_cast<double>(along);
    across_ += thickness * static_cast<double>(along * body.ratio.At(cell));
    resistance_ += upright > 0 ? thickness / static_cast<double>(upright) : 1e30;
    storage_ += thickness * static_cast<double>(body.storage.At(cell));
    yield_ += thickness * static_cast<double>(body.yield.At(cell));
  }
  bool IsKnown() const { return isKnown_ && thickness_ > 0; }
  float Along() const { return static_cast<float>(flow_ / thickness_); }
  float AcrossToAlong() const { return flow_ > 0 ? static_cast<float>(across_ / flow_) : 1; }
  float Upright() const { return static_cast<float>(thickness_ / resistance_); }
  float Storage() const { return static_cast<float>(storage_ / thickness_); }
  float Yield() const { return static_cast<float>(yield_ / thickness_); }

 private:
  bool isKnown_ = true;
  double thickness_ = 0, flow_ = 0, across_ = 0, resistance_ = 0, storage_ = 0, yield_ = 0;
};

struct Stretch {
  double top, bottom;

  double Common(const Stretch& other) const { return std::min(top, other.top) - std::max(bottom, other.bottom); }
};

/// All bodies of the ground.
class Ground {
 public:
  bool Read(const Building& building) {
    const std::vector<GroundBody> layers = GeologicalLayersOf(building.zone);
    isLayerItself_ = building.zone.TypeOfVerDiscr == CSatZoneKvf::kAsGeology;
    const std::vector<float>& ground = building.levels.Tops(0);
    const std::vector<float>* above = &ground;
    for (const GroundBody& found : layers) {
      Body body;
      if (!TakeProperties(building, *found.node, body)) return false;
      if (!isLayerItself_) {
        body.top = *above;
        if (!TakeLevel(building, *found.bottom, ground, body.bottom)) return false;
      }
      building.Tell(Fate::Carried, *found.bottom, "a level between the materials of NPF");
      layers_.push_back(std::move(body));
      above = &layers_.back().bottom;
    }
    for (const GroundBody& found : GeologicalLensesOf(building.zone)) {
      Body body;
      if (!TakeProperties(building, *found.node, body) || !building.Take(*found.extent, body.extent) ||
          !TakeLevel(building, *found.top, ground, body.top) ||
          !TakeLevel(building, *found.bottom, ground, body.bottom))
        return false;
      building.Tell(Fate::Carried, *found.node, "mixed into the cells in which it lies");
      lenses_.push_back(std::move(body));
    }
    return true;
  }

  /// What a stretch of a computational layer is made of. Where lenses overlap the first counts; below all layers the
  /// lowest goes on.
  Mixture At(std::size_t layer, std::size_t cell, const Stretch& whole) {
    Mixture mixture;
    rest_.assign(1, whole);
    for (const Body& lens : lenses_) {
      const float extent = lens.extent.At(cell);
      if (extent == kDeleteValue || extent == 0) continue;
      if (lens.top[cell] == kDeleteValue || lens.bottom[cell] == kDeleteValue) continue;
      const Stretch body{static_cast<double>(lens.top[cell]), static_cast<double>(lens.bottom[cell])};
      next_.clear();
      for (const Stretch& part : rest_) {
        const double common = part.Common(body);
        if (common <= 0) {
          next_.push_back(part);
          continue;
        }
        mixture.Add(lens, cell, common);
        if (part.top > body.top) next_.push_back({part.top, body.top});
        if (part.bottom < body.bottom) next_.push_back({body.bottom, part.bottom});
      }
      rest_.swap(next_);
    }
    for (const Stretch& part : rest_) AddLayers(mixture, layer, cell, part);
    return mixture;
  }

 private:
  static bool TakeLevel(const Building& building, const CData2DKvf& quantity, const std::vector<float>& ground,
                        std::vector<float>& level) {
    const std::string problem = ElevationsOn(building.domain, quantity, ground, level);
    return problem.empty() || building.Fail(quantity, problem);
  }

  void AddLayers(Mixture& mixture, std::size_t layer, std::size_t cell, const Stretch& part) const {
    if (isLayerItself_) return mixture.Add(layers_[std::min(layer, layers_.size() - 1)], cell, part.top - part.bottom);
    double left = part.top - part.bottom;
    for (const Body& body : layers_) {
      if (body.top[cell] == kDeleteValue || body.bottom[cell] == kDeleteValue) continue;
      const double common = part.Common({static_cast<double>(body.top[cell]), static_cast<double>(body.bottom[cell])});
      mixture.Add(body, cell, common);
      left -= std::max(0.0, common);
    }
    constexpr double kRounding = 1e-6;
    if (left > kRounding) mixture.Add(layers_.back(), cell, left);
  }

  std::vector<Body> layers_, lenses_;
  bool isLayerItself_ = true;
  std::vector<Stretch> rest_, next_;
};

/// Fills the values of a layer cell by cell. The number of cells without values, which become inactive.
std::size_t FillLayer(Ground& ground, std::size_t number, Layer& layer) {
  const std::size_t cells = layer.state.size();
  std::vector<float> along(cells, 0.0F), upright = along, storage = along, yield = along, ratio(cells, 1.0F);
  std::size_t unknown = 0;
  for (std::size_t cell = 0; cell < cells; ++cell) {
    if (!layer.IsActive(cell)) continue;
    const Mixture mixture =
        ground.At(number, cell, {static_cast<double>(layer.top[cell]), static_cast<double>(layer.bottom[cell])});
    if (!mixture.IsKnown()) {
      layer.state[cell] = kInactive;
      ++unknown;
      continue;
    }
    along[cell] = mixture.Along() * static_cast<float>(kSecondsOfDay);
    upright[cell] = mixture.Upright() * static_cast<float>(kSecondsOfDay);
    storage[cell] = mixture.Storage();
    yield[cell] = mixture.Yield();
    ratio[cell] = mixture.AcrossToAlong();
  }
  if (std::ranges::any_of(ratio, [](float each) { return each != 1; }))
    layer.acrossRows = LayerValues(std::move(ratio));
  layer.conductivity = LayerValues(std::move(along));
  layer.vertical = LayerValues(std::move(upright));
  layer.specificStorage = LayerValues(std::move(storage));
  layer.specificYield = LayerValues(std::move(yield));
  return unknown;
}

bool TakeHeads(const Building& building, const GroundBody& body, Layer& layer) {
  std::vector<float> heads;
  if (const std::string problem = ElevationsOn(building.domain, *body.head, building.levels.Tops(0), heads);
      !problem.empty())
    return building.Fail(*body.head, problem);
  for (std::size_t cell = 0; cell < heads.size(); ++cell)
    if (heads[cell] == kDeleteValue) heads[cell] = layer.top[cell] == kDeleteValue ? 0 : layer.top[cell];
  layer.initialHead = LayerValues(std::move(heads));
  building.Tell(Fate::Carried, *body.head, "STRT of IC");
  return true;
}

/// How the engine treats cells that fall dry.
bool TakeRewetting(const Building& building, const std::vector<GroundBody>& bodies) {
  const auto& components = *building.root.Important(kModflowComponents);
  const int method = components.SubsurfaceModelType();
  if (method == kVariablySaturated || method == kVariablySaturatedWithAir) {
    building.model.solver.isNewton = true;
    building.Tell(Fate::LeftOut, components,
                  "variably saturated flow has no counterpart: layers are convertible, with Newton-Raphson",
                  "Subsurface_ModelType");
    return true;
  }
  const auto* packages = building.root.Important(kBasicParameters)->Child<CCompControlParaModPackageKvf>();
  if (method != kWithRewetting || building.zone.Threshold == 0 || !packages) {
    building.Tell(method == kWithRewetting ? Fate::Changed : Fate::Carried, components,
                  method == kWithRewetting ? "without a threshold for it, NPF rewets no cell" : "NPF rewets no cell",
                  "Subsurface_ModelType");
    return true;
  }
  building.model.rewetting = Rewetting{static_cast<double>(packages->HDRY2)};
  for (std::size_t number = 0; number < building.model.layers.size(); ++number) {
    const CData2DKvf* threshold = PropertyOf(*bodies[number].node, "WettingThreshold");
    if (!threshold || !building.Take(*threshold, building.model.layers[number].wetting)) return false;
    building.Tell(Fate::Carried, *threshold, "WETDRY of NPF");
  }
  building.Tell(Fate::Carried, components, "NPF rewets cells", "Subsurface_ModelType");
  return true;
}

}  // namespace

bool BuildGround(Building& building) {
  Ground ground;
  if (!ground.Read(building)) return false;
  const std::vector<GroundBody> bodies = ComputationalLayersOf(building.zone);
  for (std::size_t number = 0; number < building.model.layers.size(); ++number) {
    if (building.log.IsCancelled()) return false;
    Layer& layer = building.model.layers[number];
    if (const std::size_t unknown = FillLayer(ground, number, layer); unknown > 0)
      building.Tell(Fate::Changed, *bodies[number].node,
                    fmt::format("{} cells without values of the ground are inactive", unknown), "Name");
    if (!TakeHeads(building, bodies[number], layer)) return false;
    if (bodies[number].bottom) building.Tell(Fate::Carried, *bodies[number].bottom, "the bottom of a layer of DIS");
  }
  if (building.zone.ParameterDistribution == CSatZoneKvf::kByUnits)
    building.Tell(Fate::Carried, building.zone.Units(), "K, K33, SS and SY of NPF and STO");
  building.Tell(Fate::Changed, building.zone,
                "layers are convertible: flow along a layer follows the part that is under water", "Layers");
  return TakeRewetting(building, bodies);
}

}  // namespace tervane::modflow6
