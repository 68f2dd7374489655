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

class CSZVerDiscrLayerKvf;
class CSatZoneKvf;

/// The computational layers from the top down.
class ModelLayers {
 public:
  /// Puts ground and levels on the cells of the domain. A layer that is thinner than the setup allows, or whose level
  /// lies above the one over it, ends lower; a warning tells in how many cells. False, with an error in the log, where
  /// a level cannot be had. A uniform discretization has no layers.
  bool Make(const CSatZoneKvf& zone, const CTvn2DOrthoRotatedGridData& domain, WorkLog& log);
  /// Writes the levels as items of one file, whose layer 0 is the bottom: `kLowerLevels` and `kUpperLevels`.
  FileResult Write(const std::string& path, const CTvn2DOrthoRotatedGridData& domain) const;
  static constexpr int kLowerLevels = 1, kUpperLevels = 2;

  int Count() const { return static_cast<int>(bottoms_.size()); }
  bool IsEmpty() const { return bottoms_.empty(); }
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

/// Where the wells of a file stand: a line for each filter, with the cell and the layers that it meets. Wells outside
/// the model, and filters outside all layers, are warnings of `place`.
std::string WellsOnModel(const std::string& path, const CTvn2DOrthoRotatedGridData& domain, const ModelLayers& layers,
                         const std::string& place, WorkLog& log);

}  // namespace tervane
