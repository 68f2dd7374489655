// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/boundary_picture.h"

#include <utility>

#include "pages/parts/plot_content.h"

namespace tervane {

namespace {

/// Conditions in the order of their types, and what has none.
std::vector<CellClass> ClassesOfTypes() {
  constexpr unsigned kColors[] = {0x59a14f, 0x2f6db5, 0xe8862a, 0x8e5ba6};
  std::vector<CellClass> classes;
  for (const KeyChoice& type : CGeoDataBoundCondItemKvf::kBoundaryTypes)
    classes.push_back({static_cast<float>(type.value), std::string(type.text), kColors[classes.size()]});
  classes.push_back({CGeoDataBoundCondCatchmentData::kUnpaintedBoundary, "No condition", 0xc0392b});
  classes.push_back({CGeoDataBoundCondCatchmentData::kInside, "Inside", 0xdde3e8});
  return classes;
}

}  // namespace

MapContent BoundaryPicture::Map() {
  auto trace = boundary_.Trace();
  if (!trace) return {};
  std::vector<BoundaryItem> segments = boundary_.Segments();
  if (!painted_ || trace_ != trace || segments_ != segments) {
    painted_ = std::make_shared<ComputedGrid>(
        "Painting the boundary of the model domain", [trace, segments, by = by_, title = boundary_.GetTitle()](
                                                         CTvn2DOrthoRotatedGridData& grid, ProgressPart progress) {
          trace->Run(progress);
          if (!trace->Result()) return FileResult{trace->IsDone() ? trace->Problem() : "cancelled", {}};
          if (!trace->Result()->fault.empty()) return FileResult{trace->Result()->fault, {}};
          CGeoDataBoundCondCatchmentData painted = trace->Result()->grid;
          by == By::Type ? painted.PaintBoundaryTypes(segments) : painted.PaintBoundaryNumbers(segments);
          grid = std::move(static_cast<CTvn2DOrthoRotatedGridData&>(painted));
          grid.SetItemName(title);
          return FileResult();
        });
    trace_ = std::move(trace);
    segments_ = std::move(segments);
    lengths_.clear();
  }
  MapContent map = GridMap(boundary_, painted_);
  if (map.grids.empty()) return map;
  // Neither codes nor amounts, whatever the file of the domain says of its values.
  map.grids.front().isCodes = false;
  // The boundary is one cell wide: the line around the domain would hide it, and pale colours are lost on it.
  map.grids.front().transparency = 0;
  map.domain = nullptr;
  if (by_ == By::Type) map.grids.front().classes = ClassesOfTypes();
  PointLayer starts;
  starts.isNumbered = true;
  for (const BoundaryItem& segment : segments_) {
    if (!segment.point) break;  // as far as segments are painted
    starts.points.push_back(*segment.point);
  }
  if (!starts.points.empty()) map.points.insert(map.points.begin(), std::move(starts));
  return map;
}

std::optional<BoundaryPicture::Extent> BoundaryPicture::ExtentOf(const CGeoDataBoundCondItemKvf& segment) {
  const auto number = static_cast<std::size_t>(boundary_.GetNumberWhatIs(&segment) - 1);
  const auto* traced = boundary_.GetCatchmentData();
  if (!traced || number >= segments_.size()) return std::nullopt;
  if (lengths_.empty()) lengths_ = LengthsAlong(*traced, segments_);
  const double whole = LengthsAlong(*traced, {BoundaryItem{}}).front();
  if (!(lengths_[number] > 0) || !(whole > 0)) return std::nullopt;
  return Extent{lengths_[number], lengths_[number] / whole};
}

}  // namespace tervane
