// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The boundaries of layers: heads, heads behind a conductance, drains, and rates.
#include <fmt/format.h>

#include "modelcells/model_grids.h"
#include "modflow6/stress_sources.h"
#include "platform/item_types.h"
#include "spatial/data2d.h"
#include "subsurface/boundary.h"
#include "subsurface/computational_layers.h"
#include "subsurface/ground_layers.h"
#include "subsurface/ground_properties.h"
#include "subsurface/internal_boundary.h"
#include "subsurface/saturated_zone.h"

namespace tervane::modflow6 {

namespace {

using Zone = CSZVerDiscrInternalBoundaryPropKvf;

/// A package in the making.
struct Making {
  StressPackage package;
  std::vector<StressSource> sources = {};
};

class BoundaryBuilder {
 public:
  explicit BoundaryBuilder(Building& building) : building_(building) {}

  bool AddLayer(std::size_t number, const CSZVerDiscrLayerKvf& node) {
    layer_ = number;
    // A cell has one head: a zone inside the layer counts in the place of what holds at the outer boundary there.
    hasHead_.assign(building_.CellCount(), false);
    if (auto* inner = node.Child<CSZVerDiscrInternalBoundaryKvf>(); inner && inner->IsDataUsedInSetup())
      if (!AddZones(*inner)) return false;
    return !node.OuterBoundary().IsDataUsedInSetup() || AddSegments(node.OuterBoundary());
  }

  bool Finish() {
    for (Making* making : {&heads_, &general_, &drains_, &rates_}) {
      if (const FileResult made = Collect(making->sources, building_.model, making->package); !made.Ok()) {
        building_.log.Error(PathOf(building_.zone), made.error);
        return false;
      }
      if (!making->package.IsEmpty()) building_.model.stresses.push_back(std::move(making->package));
    }
    return true;
  }

 private:
  Layer& layer() const { return building_.model.layers[layer_]; }

  std::vector<StressEntry> EntriesOf(StressPackage& package, const std::string& name, const std::vector<int>& places,
                                     int place) const {
    const std::uint16_t number = AddName(package, name);
    std::vector<StressEntry> entries;
    for (std::size_t cell = 0; cell < places.size(); ++cell)
      if (places[cell] == place && layer().IsActive(cell))
        entries.push_back({static_cast<std::uint32_t>(cell), static_cast<std::uint16_t>(layer_), number, 0, 0});
    return entries;
  }

  // ---- Values over time

  /// Gives the entries the boundary's value in each period.
  bool Follow(const CYbSEKvfBase& node, const ValuedBoundary& boundary, int itemType, std::vector<StressEntry> entries,
              std::vector<double> shares, std::vector<StressSource>& sources) {
    switch (boundary.Type) {
      case ValuedBoundary::kInitialValue: {
        for (StressEntry& entry : entries) entry.value = static_cast<double>(layer().initialHead.At(entry.cell));
        sources.push_back({false, [entries = std::move(entries)](std::size_t, std::vector<StressEntry>& all) {
                             all.insert(all.end(), entries.begin(), entries.end());
                             return FileResult{};
                           }});
        return true;
      }
      case ValuedBoundary::kGridSeries:
        sources.push_back(FollowingGrids(boundary.GridFile(), std::move(entries)));
        return true;
      default: {
        const bool isSeries = boundary.Type == ValuedBoundary::kSeries;
        std::vector<double> means(building_.model.periods.size(),
                                  static_cast<double>(boundary.FixedValue) * SiFactorOf(itemType));
        if (isSeries) {
          const CFMData0DFile& file = boundary.SeriesFile();
          const FileResult made = building_.series.Means(file.File.Absolute(), file.SelectedItem(), means);
          if (!made.Ok()) return building_.Fail(node, made.error);
          if (!made.note.empty()) building_.Tell(Fate::Changed, node, made.note, "Type");
        }
        sources.push_back(FollowingCells(std::move(entries), std::move(means), std::move(shares)));
        return true;
      }
    }
  }

  StressSource FollowingGrids(const CFMData2DNdsFile& file, std::vector<StressEntry> entries) const {
    return {true,
            [&building = building_, path = file.File.Absolute(), item = file.SelectedItem(),
             entries = std::move(entries)](std::size_t period, std::vector<StressEntry>& all) -> FileResult {
              CTvn2DOrthoRotatedGridData mean;
              if (FileResult made = building.series.MeanGrid(path, item, period, mean); !made.Ok()) return made;
              std::vector<float> values;
              if (std::string problem = PutOnModel(mean, building.domain.Geometry(), false, values); !problem.empty())
                return {problem, {}};
              for (const StressEntry& entry : entries) {
                if (values[entry.cell] == kDeleteValue) continue;
                all.push_back(entry);
                all.back().value = static_cast<double>(values[entry.cell]);
              }
              return {};
            }};
  }

  /// Heads of cells that have none yet, and lie above the cells' bottoms.
  bool AddHeads(const CYbSEKvfBase& node, const ValuedBoundary& boundary, std::vector<StressEntry> entries) {
    std::erase_if(entries, [this](const StressEntry& entry) { return hasHead_[entry.cell]; });
    for (const StressEntry& entry : entries) hasHead_[entry.cell] = true;
    std::vector<StressSource> sources;
    if (!Follow(node, boundary, quantity::kElevation, std::move(entries), {}, sources)) return false;
    for (StressSource& source : sources)
      source.add = [add = std::move(source.add), &building = building_, place = PathOf(node)](
                       std::size_t period, std::vector<StressEntry>& all) {
        const auto before = static_cast<std::ptrdiff_t>(all.size());
        FileResult added = add(period, all);
        const auto below = std::remove_if(all.begin() + before, all.end(), [&](const StressEntry& entry) {
          return entry.value < static_cast<double>(building.model.layers[entry.layer].bottom[entry.cell]);
        });
        if (below != all.end())
          building.log.Warning(place, fmt::format("{} cells of stress period {} have a fixed head below their bottom: "
                                                  "they have none there",
                                                  all.end() - below, period + 1));
        all.erase(below, all.end());
        return added;
      };
    heads_.sources.insert(heads_.sources.end(), sources.begin(), sources.end());
    building_.Tell(Fate::Carried, node, "heads of CHD");
    return true;
  }

  // ---- The outer boundary

  bool AddSegments(const CGeoDataBoundCondListKvf& list) {
    const std::vector<int> segments = SegmentsOnCells(list, building_.domain);
    // All lists of boundaries share the domain's trace.
    if (const auto* traced = list.GetCatchmentData(); traced && widths_.empty()) widths_ = LengthsInCells(*traced);
    for (int number = 1; number <= list.GetItemCount(); ++number) {
      const CGeoDataBoundCondItemKvf& segment = *list.GetItem(number);
      const std::string name = fmt::format("{}_{}", segment.GetTitle(), layer_ + 1);
      if (segment.BoundaryType == CGeoDataBoundCondItemKvf::kZeroFlux) {
        building_.Tell(Fate::Carried, segment, "nothing flows where nothing is told");
        continue;
      }
      StressPackage& package =
          segment.BoundaryType == CGeoDataBoundCondItemKvf::kFixedHead ? heads_.package : rates_.package;
      std::vector<StressEntry> entries = EntriesOf(package, name, segments, number - 1);
      if (entries.empty()) {
        const bool isTraced = list.GetTraceFault().empty();
        building_.Tell(Fate::LeftOut, segment,
                       isTraced ? "it has no active cell on the outer boundary"
                                : "the boundary of the domain cannot be followed: see the warning of the setup");
        continue;
      }
      if (segment.BoundaryType == CGeoDataBoundCondItemKvf::kFixedHead) {
        if (!AddHeads(segment, segment, std::move(entries))) return false;
        continue;
      }
      if (!AddRates(segment, std::move(entries))) return false;
    }
    return true;
  }

  /// A flux is shared by the cells of its segment by the length of the boundary in each; a gradient drives what the
  /// ground lets through there.
  bool AddRates(const CGeoDataBoundCondItemKvf& segment, std::vector<StressEntry> entries) {
    const bool isFlux = segment.BoundaryType == CGeoDataBoundCondItemKvf::kFlux;
    double whole = 0;
    for (const StressEntry& entry : entries) whole += widths_[entry.cell];
    std::vector<double> shares;
    for (const StressEntry& entry : entries) {
      const double width = widths_[entry.cell];
      const double through = static_cast<double>(layer().conductivity.At(entry.cell)) *
                             static_cast<double>(layer().top[entry.cell] - layer().bottom[entry.cell]) * width;
      // One cell that is all of a domain has no line along it.
      const double part = whole > 0 ? width / whole : 1 / static_cast<double>(entries.size());
      shares.push_back(isFlux ? kSecondsOfDay * part : through);
    }
    if (!Follow(segment, segment, segment.GetBoundaryQuantity(), std::move(entries), std::move(shares), rates_.sources))
      return false;
    building_.Tell(isFlux ? Fate::Carried : Fate::Changed, segment,
                   isFlux ? "rates of WEL, by the length of the boundary in each cell; what is above 0 comes in"
                          : "rates of WEL: the gradient times what the layer lets through in each cell");
    return true;
  }

  // ---- Zones inside a layer

  bool AddZones(const CSZVerDiscrInternalBoundaryKvf& boundary) {
    BoundaryZones cells;
    if (const FileResult read = ZonesOnCells(boundary, building_.domain, cells); !read.Ok())
      return building_.Fail(boundary, read.error);
    for (std::size_t place = 0; place < cells.zones.size(); ++place) {
      const Zone& zone = *cells.zones[place];
      const std::string name = fmt::format("{}_{}", zone.GetStationName(), layer_ + 1);
      if (zone.BoundaryType == Zone::kFixedHead) {
        if (!AddHeads(zone, zone, EntriesOf(heads_.package, name, cells.zoneOfCell, static_cast<int>(place))))
          return false;
      } else if (zone.BoundaryType == Zone::kHeadControlledFlux || zone.BoundaryType == Zone::kDrain) {
        Making& making = zone.BoundaryType == Zone::kDrain ? drains_ : general_;
        std::vector<StressEntry> entries = EntriesOf(making.package, name, cells.zoneOfCell, static_cast<int>(place));
        if (!TakeConductance(zone, entries) ||
            !Follow(zone, zone, quantity::kElevation, std::move(entries), {}, making.sources))
          return false;
        building_.Tell(Fate::Carried, zone, fmt::format("boundaries of {}", making.package.kind));
      } else if (zone.BoundaryType != Zone::kInactive && zone.BoundaryType != Zone::kNone) {
        building_.Tell(Fate::LeftOut, zone, "a boundary of this kind has no counterpart");
      }
    }
    building_.Tell(Fate::Carried, boundary, "its zones are told one by one", "Type");
    return true;
  }

  /// A total conductance is shared by the cells of its zone; a leakage coefficient acts on each square metre.
  bool TakeConductance(const Zone& zone, std::vector<StressEntry>& entries) const {
    const bool isTotal = zone.HeadControlLeakage == Zone::kConductance;
    const CData2DKvf* given = PropertyOf(zone, isTotal ? "Conductance" : "LeakCoef");
    LayerValues values;
    if (!given || !building_.Take(*given, values)) return false;
    const double factor = kSecondsOfDay * (isTotal ? 1 / static_cast<double>(std::max<std::size_t>(1, entries.size()))
                                                   : building_.model.CellArea());
    std::erase_if(entries, [&](const StressEntry& entry) { return values.At(entry.cell) == kDeleteValue; });
    for (StressEntry& entry : entries) entry.conductance = static_cast<double>(values.At(entry.cell)) * factor;
    return true;
  }

  Building& building_;
  std::size_t layer_ = 0;
  std::vector<bool> hasHead_;
  std::vector<double> widths_;  ///< Of the outer boundary in each cell.
  Making heads_{{.kind = "CHD", .name = "chd", .names = {}}};
  Making general_{{.kind = "GHB", .name = "ghb", .names = {}}};
  Making drains_{{.kind = "DRN", .name = "inner_drn", .names = {}}};
  Making rates_{{.kind = "WEL", .name = "flux", .names = {}}};
};

}  // namespace

bool BuildBoundaries(Building& building) {
  BoundaryBuilder builder(building);
  const std::vector<GroundBody> bodies = ComputationalLayersOf(building.zone);
  for (std::size_t number = 0; number < building.model.layers.size(); ++number)
    if (!builder.AddLayer(number, dynamic_cast<const CSZVerDiscrLayerKvf&>(*bodies[number].node))) return false;
  return builder.Finish();
}

}  // namespace tervane::modflow6
