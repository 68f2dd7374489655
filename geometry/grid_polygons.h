// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Polygons turned into cells of a grid: codes of zones, and the domain of a model. A cell takes part in a polygon when
// its centre lies inside by the even-odd rule over all rings, so that holes are outside. A centre just on an edge
// belongs to the polygon on the side to which x, then y, grows.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "geometry/grid.h"
#include "geometry/shapes.h"
#include "platform/files.h"
#include "platform/progress.h"

namespace tervane {

/// A file of polygons with a value for each.
struct PolygonFile {
  std::string path;
  std::string attribute;
  std::string gapFill;  ///< The value (as text) whose code the cells outside all polygons get; empty leaves them empty.
  int axisUnit = 1000;  ///< One of item 100187.
};

/// The values of the polygons, distinct, in the order of the file.
struct ZoneTable {
  struct Zone {
    int code = 0;      ///< In the cells: the value itself if it is a whole number, else the place in the table from 1.
    std::string text;  ///< `TextOf` the value.

    bool operator==(const Zone&) const = default;
  };
  std::vector<Zone> zones;
};

/// Polygons that were put on a grid, shape by shape.
class PolygonRaster {
 public:
  explicit PolygonRaster(const GridGeometry& geometry, ProgressPart progress = {});

  /// A part of a row: cells [begin, end) of row j.
  struct Span {
    int j, begin, end;
  };
  /// The cells whose centre lies inside by the even-odd rule over the given rings of the shape, [first, last) of its
  /// parts. A ring need not be closed, may cross itself and lie anywhere. Valid until the next call. Throws
  /// `Cancelled`; how far the work is, the caller tells.
  const std::vector<Span>& Spans(const Shape& shape, std::size_t first, std::size_t last);

 private:
  struct Row {
    std::ptrdiff_t moreEdges = 0;     ///< Edges that cross its centres, beyond those of the row below.
    std::ptrdiff_t crossingsEnd = 0;  ///< Behind its crossings that were found.
  };
  /// Calls `found(low, high, rowBegin, rowEnd)` for each edge that crosses centres of rows, from its lower end.
  template <class Found>
  void ForEdges(const Shape& shape, std::size_t first, std::size_t last, const Found& found) const;
  /// Adds the spans of rows [begin, end); `edges` are those that cross the row below, then the last row.
  void AddSpans(const Shape& shape, std::size_t first, std::size_t last, int begin, int end, std::ptrdiff_t& edges);

  int nx_, ny_;
  GridTransform transform_;
  ProgressPart progress_;
  std::vector<double> crossings_;  ///< Along x, row by row.
  std::vector<Row> rows_;
  std::vector<Span> spans_;
};

/// Codes for the cells of a grid; `codes` has one for each shape, and where polygons overlap the later one counts.
/// Shapes with the code `deleteValue` are left out. Cells in no polygon keep the value that they have in `values`.
/// Throws `Cancelled`.
void PutPolygons(const std::vector<Shape>& shapes, const std::vector<float>& codes, const GridGeometry& geometry,
                 float deleteValue, std::vector<float>& values, ProgressPart progress = {});

/// The domain of a model: 1 in the cells of any of the polygons, 2 where one of the four neighbours lies outside the
/// outer rings or off the grid (so that the edges of holes stay 1), `kUsualDeleteValue` elsewhere. Throws `Cancelled`.
std::vector<float> DomainOfPolygons(const std::vector<Shape>& shapes, const GridGeometry& geometry,
                                    ProgressPart progress = {});

}  // namespace tervane
