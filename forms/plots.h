// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What maps and charts of pages show, without any toolkit.
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "geometry/grid.h"
#include "geometry/shapes.h"
#include "platform/computation.h"
#include "platform/dates.h"

namespace tervane {

/// A grid on a map.
struct GridLayer {
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> grid;
  bool isCodes = false;  ///< Whole-number codes: one colour each, the classes of the legend are the codes.
  std::optional<float> highlighted = {};  ///< Two colours: cells of this value, and the others.
  bool withLegend = true;
  double transparency = 0;  ///< 0 opaque, 1 invisible.
  /// Smallest and largest value of all grids that are shown in turn, so that a colour means the same in each.
  std::optional<std::pair<float, float>> range = {};

  bool operator==(const GridLayer&) const = default;
};

/// Shapes over a grid.
struct ShapeLayer {
  std::shared_ptr<const CYbShapeData> shapes;
  std::string highlighted = {};            ///< Shapes whose value reads so stand out; empty for none.
  std::optional<unsigned> lineColor = {};  ///< Red, green, blue; the colour of the theme when nothing is said.
  std::optional<double> lineWidth = {};    ///< In pixels.

  bool operator==(const ShapeLayer&) const = default;
};

/// Points with names over a grid.
struct PointLayer {
  std::vector<MapPoint> points;
  std::vector<std::string> labels = {};  ///< As many, or none.

  bool operator==(const PointLayer&) const = default;
};

/// What a user points at.
struct MapPick {
  MapPoint place;
  std::optional<std::pair<int, int>> cell;  ///< Of the first grid.
  std::optional<float> value;               ///< Of that cell; nothing for an empty one.
  std::optional<std::size_t> shape;         ///< Of the first layer of shapes, by its place from 0.
  std::string shapeValue = {};              ///< The text of that shape's value.
};

/// What must be computed before a map or chart can show all that it is to show. Whoever shows it has that done, and
/// then asks for the content anew; until then it lacks what is computed, and holds the rest.
using Awaited = std::vector<std::shared_ptr<Computation>>;

/// What a map shows, from the bottom up: grids, shapes, points.
struct MapContent {
  std::vector<GridLayer> grids;
  std::vector<ShapeLayer> shapes;
  std::vector<PointLayer> points;
  std::optional<Envelope> area;  ///< Shown at first; the envelope of all layers when nothing is said.
  std::string message;           ///< Shown in the place of a map that has nothing to show.
  std::function<void(const MapPick& pick)> picked;  ///< A click of the user; may be empty.
  Awaited awaited = {};

  bool IsEmpty() const { return grids.empty() && shapes.empty() && points.empty(); }
};

/// One curve of a chart.
struct Series {
  std::string name;
  std::string unit;
  std::vector<CYbDateTime> times;
  std::vector<double> values;  ///< As many; NaN for a gap.
  bool isStepped = false;      ///< The value holds over the interval that ends at its time.
};

struct SeriesContent {
  std::vector<Series> series;
  /// Shaded: the time that is simulated.
  std::optional<std::pair<CYbDateTime, CYbDateTime>> period;
  std::string message;  ///< Shown in the place of a chart that has nothing to show.
  Awaited awaited = {};

  bool IsEmpty() const { return series.empty(); }
};

/// The result if it is there; else null, and it is awaited.
template <class Data>
std::shared_ptr<const Data> NowOrAwaited(const std::shared_ptr<Computed<Data>>& computed, Awaited& awaited) {
  if (computed->IsDone()) return computed->Result();
  awaited.push_back(computed);
  return nullptr;
}

/// The content when all that it awaits is computed, here and now.
template <class Content>
Content Finished(const std::function<Content()>& content) {
  Content shown = content();
  while (!shown.awaited.empty()) {
    for (const auto& computation : shown.awaited) computation->Run();
    // What was computed must be known until it is asked for.
    Content next = content();
    shown = std::move(next);
  }
  return shown;
}

/// Whether both look the same on the screen: the same grids and shapes (not merely equal ones), and the same rest. What
/// a click does is not asked.
bool LooksSame(const MapContent& a, const MapContent& b);
bool LooksSame(const SeriesContent& a, const SeriesContent& b);

/// In short what is shown, for texts: "grid 142x97, 29 shapes", "2 series, 1461 values", or the message.
std::string Summary(const MapContent& content);
std::string Summary(const SeriesContent& content);

}  // namespace tervane
