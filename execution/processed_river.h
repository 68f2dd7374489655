// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The river network as the preprocessor placed it on the grid: a binary file beside its report, and what maps draw of
// it. docs/preprocessor-report.md tells the form of the file.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "geometry/grid.h"
#include "geometry/shapes.h"
#include "platform/files.h"

namespace tervane {

/// What a river file holds.
struct ProcessedRiver {
  /// Cells whose value is not zero have a link at their edge: in the first grid at the one towards the next column, in
  /// the second at the one towards the next row. Null in a file without cells.
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> firstLinks, secondLinks;
  // One of each for every point.
  std::vector<int> flags;
  std::vector<double> x, y;
};

/// Outcome of reading a river file.
struct RiverFileResult {
  /// What the user is told; empty when all was read. It names the file.
  std::string message;

  bool Ok() const { return message.empty(); }
};

/// Reads a river file whole; on failure `river` is as it was. A count that the file's size does not bear out is told
/// before any memory is taken for it.
RiverFileResult ReadProcessedRiver(const std::string& path, ProcessedRiver& river);

/// The links as lines along the edges of cells, in dark blue.
class CProcDataRiverLinkOverlay {
 public:
  /// The grids need not outlive the overlay.
  CProcDataRiverLinkOverlay(const CTvn2DOrthoRotatedGridData& firstLinks,
                            const CTvn2DOrthoRotatedGridData& secondLinks);

  const std::shared_ptr<const CYbShapeData>& Lines() const { return lines_; }
  static constexpr unsigned kColor = 0x00009a;  ///< Red, green, blue.
  static constexpr double kPenWidth = 2;

 private:
  std::shared_ptr<const CYbShapeData> lines_;
};

/// The network's branches as lines from point to point; a point of flag 3 begins a branch.
class CProcDataRiverPointOverlay {
 public:
  CProcDataRiverPointOverlay(const std::vector<int>& flags, const std::vector<double>& x, const std::vector<double>& y);

  const std::shared_ptr<const CYbShapeData>& Lines() const { return lines_; }

 private:
  std::shared_ptr<const CYbShapeData> lines_;
};

}  // namespace tervane
