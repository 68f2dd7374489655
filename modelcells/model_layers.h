// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The saturated zone on the cells of the model: where its computational layers begin and end, and what holds at their
// boundaries.
#pragma once

#include <cstddef>
#include <string>
#include <utility>
#include <vector>

#include "geometry/grid.h"
#include "modelcells/work_log.h"
#include "platform/files.h"

namespace tervane {

class CData2DKvf;
class CGeoDataBoundCondListKvf;
class CSZVerDiscrInternalBoundaryKvf;
class CSZVerDiscrInternalBoundaryPropKvf;
class CSZVerDiscrLayerKvf;
class CSatZoneKvf;

/// Elevations of a quantity on the cells of the domain, in metres; `kDeleteValue` outside it and where nothing is
/// known. Heights above ground need the ground. "" or why not.
std::string ElevationsOn(const CTvn2DOrthoRotatedGridData& domain, const CData2DKvf& quantity,
                         const std::vector<float>& ground, std::vector<float>& elevations);

/// The computational layers from the top down.
class ModelLayers {
 public:
  /// What becomes of a layer where it is thinner than the setup allows, or its level lies above the one over it.
  enum class ThinCells {
    EndLower,  ///< It gets that thickness, at the cost of those below.
    Vanish     ///< It ends where the one above does.
  };

  /// Puts ground and levels on the cells of the domain. A warning tells in how many cells layers are thin. False, with
  /// an error in the log, where a level cannot be had. A uniform discretization has no layers.
  bool Make(const CSatZoneKvf& zone, const CTvn2DOrthoRotatedGridData& domain, WorkLog& log,
            ThinCells thin = ThinCells::EndLower);
  /// Writes the levels as items of one file, whose layer 0 is the bottom: `kLowerLevels` and `kUpperLevels`.
  FileResult Write(const std::string& path, const CTvn2DOrthoRotatedGridData& domain) const;
  static constexpr int kLowerLevels = 1, kUpperLevels = 2;

  int Count() const { return static_cast<int>(bottoms_.size()); }
  bool IsEmpty() const { return bottoms_.empty(); }
  /// The levels at which a layer begins and ends, in metres, by cell; layers from 0 at the top.
  const std::vector<float>& Tops(int layer) const {
    return layer == 0 ? ground_ : bottoms_[static_cast<std::size_t>(layer) - 1];
  }
  const std::vector<float>& Bottoms(int layer) const { return bottoms_[static_cast<std::size_t>(layer)]; }
  /// How thick a layer is in a cell; 0 where it has vanished, and where nothing is known.
  double Thickness(int layer, std::size_t cell) const;
  /// The first and last layer, from 1 at the top, that a stretch meets in a cell; 0 where it meets none.
  std::pair<int, int> LayersBetween(std::size_t cell, double top, double bottom) const;

 private:
  std::vector<float> ground_;                ///< In metres, `kDeleteValue` where nothing is known.
  std::vector<std::vector<float>> bottoms_;  ///< The same of each layer.
};

/// What a cell of a computational layer is, as a grid of codes has it.
namespace boundary_code {
inline constexpr int kInside = 1, kUnconditioned = 2;
/// Behind these the kinds of boundary, in the numbers of the setup.
inline constexpr int kOuter = 10, kInner = 20;
std::string NameOf(int code);
}  // namespace boundary_code

/// The codes of a layer on the cells of the domain. Where a zone inside the layer is a boundary, it counts in the place
/// of what holds at the outer boundary there.
FileResult BoundaryCodes(const CSZVerDiscrLayerKvf& layer, const CTvn2DOrthoRotatedGridData& domain,
                         CTvn2DOrthoRotatedGridData& codes);

/// The segment of an outer boundary in which each cell lies, from 0; `kNoSegment` off the boundary and where it has
/// none.
std::vector<int> SegmentsOnCells(const CGeoDataBoundCondListKvf& boundary, const CTvn2DOrthoRotatedGridData& domain);
inline constexpr int kNoSegment = -1;

/// The zones of an internal boundary on the cells of the domain.
struct BoundaryZones {
  static constexpr int kNone = -1;
  std::vector<const CSZVerDiscrInternalBoundaryPropKvf*> zones;
  std::vector<int> zoneOfCell;  ///< Places in `zones`, or `kNone`.

  /// Null outside all zones.
  const CSZVerDiscrInternalBoundaryPropKvf* At(std::size_t cell) const {
    return zoneOfCell[cell] == kNone ? nullptr : zones[static_cast<std::size_t>(zoneOfCell[cell])];
  }
};
FileResult ZonesOnCells(const CSZVerDiscrInternalBoundaryKvf& boundary, const CTvn2DOrthoRotatedGridData& domain,
                        BoundaryZones& zones);

/// Where the wells of a file stand: a line for each filter, with the cell and the layers that it meets. Wells outside
/// the model, and filters outside all layers, are warnings of `place`.
std::string WellsOnModel(const std::string& path, const CTvn2DOrthoRotatedGridData& domain, const ModelLayers& layers,
                         const std::string& place, WorkLog& log);

}  // namespace tervane
