// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The steps of a grid, one after the other: as they are or as differences, with flow beside them.
#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "data/datafile.h"
#include "geometry/grid.h"
#include "pages/parts/plot_content.h"
#include "platform/computation.h"

namespace tervane {

/// Two items of one file: flow along the axes of its grid.
struct FlowItems {
  std::string path;
  int x = 0, y = 0;
  int layer = 0;  ///< From the bottom.

  bool operator==(const FlowItems&) const = default;
};
/// The pairs of a file's items whose names differ in "x" and "y" alone.
std::vector<FlowItems> FlowItemsOf(const std::string& path, const std::vector<DataItem>& items);

/// What is subtracted from each step.
struct Subtracted {
  std::string path;
  int item = 0, layer = 0;
  std::optional<std::size_t> step = {};  ///< Nothing for the step of the same time.

  bool operator==(const Subtracted&) const = default;
};

/// How each step is made.
struct FrameRecipe {
  std::string path;
  int item = 0, layer = 0;  ///< Layers from the bottom.
  std::optional<Subtracted> subtracted = {};
  std::optional<FlowItems> flow = {};

  bool operator==(const FrameRecipe&) const = default;
};

/// One step.
struct GridFrame {
  using Grid = CTvn2DOrthoRotatedGridData;

  std::shared_ptr<const Grid> grid;
  std::shared_ptr<const Grid> flowX, flowY;  ///< Null without flow.
};
using ComputedFrame = Computed<GridFrame>;

/// Reads a step, and of it every so many rows and columns. A difference whose unit converts to others with an offset,
/// as degrees do, is of no quantity, since it would be converted wrongly.
FileResult ReadFrame(const FrameRecipe& recipe, std::size_t step, int every, GridFrame& frame, ProgressPart progress);
/// Why a difference cannot be made: "..., where cells of ... were expected"; empty when it can.
std::string WhyNoDifference(const FrameRecipe& recipe);

/// From the smallest to the largest value of all steps, in the base unit; of differences as far below 0 as above. Not
/// there when all values are missing.
using FrameRange = std::optional<std::pair<float, float>>;
FileResult ReadFrameRange(const FrameRecipe& recipe, FrameRange& range, ProgressPart progress);
/// The greatest flow along one axis at any time.
FileResult ReadStrongestFlow(const FlowItems& flow, double& strongest);

/// The values of one cell at all times.
FileResult ReadCellSeries(const FrameRecipe& recipe, int i, int j, FileSeries& series, ProgressPart progress);

}  // namespace tervane
