// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What maps and charts of pages show, without any toolkit.
#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

#include "geometry/grid.h"
#include "geometry/level.h"
#include "geometry/shapes.h"
#include "overlays/overlay_styles.h"
#include "platform/computation.h"
#include "platform/dates.h"
#include "platform/files.h"
#include "platform/shared_values.h"

namespace tervane {

class Host;

/// The one thing of a layer that stands out from the others.
struct Highlight {
  std::optional<float> code = {};         ///< Cells of a grid with this value.
  std::string name = {};                  ///< Shapes of this value, points and lines of this name; empty for none.
  std::optional<std::size_t> place = {};  ///< The shape, point or line of this place from 0.

  bool IsOf(std::size_t itsPlace, std::string_view itsName) const {
    return place == itsPlace || (!name.empty() && name == itsName);
  }
  bool IsOfShape(std::size_t itsPlace, const Shape& shape) const;
  bool IsNone() const { return *this == Highlight(); }
  bool operator==(const Highlight&) const = default;
};

/// How numbers become colours with a legend: as kinds with a name each, or as classes of one scale.
struct ValueScale {
  std::string title = {};                                  ///< Above the legend.
  std::vector<std::pair<double, std::string>> names = {};  ///< Of the kinds, in the legend's order; none for a scale.
  int itemType = 0, unit = 0;                              ///< Of a scale, which is shown in the user's unit.

  bool operator==(const ValueScale&) const = default;
};

/// A value of cells that has a meaning of its own.
struct CellClass {
  float value = 0;
  std::string name;
  unsigned color = 0;  ///< Red, green, blue.

  bool operator==(const CellClass&) const = default;
};

/// The colours of a scale from low to high.
enum class Ramp {
  OfQuantity,  ///< What suits the values: those of ground for elevations, else `Amounts`.
  Amounts,
  Terrain,
  VioletToYellow,  ///< These three grow lighter evenly, so that equal steps look equal.
  BlueToYellow,    ///< Also told apart by those who do not tell red from green.
  VioletToOrange,
  Difference,  ///< Blue below the middle, red above.
};

/// A class of a scale that has borders of its own.
struct ScaleClass {
  double upTo = 0;     ///< The largest value, in the grid's unit.
  unsigned color = 0;  ///< Red, green, blue.

  bool operator==(const ScaleClass&) const = default;
};

/// A grid on a map.
struct GridLayer {
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> grid;
  bool isCodes = false;        ///< Whole-number codes: one colour each, the classes of the legend are the codes.
  Highlight highlighted = {};  ///< With a code two colours: cells of this value, and the others.
  bool withLegend = true;
  double transparency = 0;  ///< 0 opaque, 1 invisible.
  /// Smallest and largest value of all grids that are shown in turn, so that a colour means the same in each.
  std::optional<std::pair<float, float>> range = {};
  std::vector<std::pair<unsigned, std::string>> names = {};  ///< Of codes, for the legend; a code without one is told.
  /// In the place of codes and scales: cells of these values have these colours and names, the legend their order.
  /// Cells of other values are left out.
  std::vector<CellClass> classes = {};
  bool isHillshaded = false;  ///< Of elevations: slopes are lit from the north-west.
  Ramp ramp = Ramp::OfQuantity;
  /// In the place of ramp and range: ascending classes. What lies beyond the last one has its colour.
  std::vector<ScaleClass> scale = {};

  bool operator==(const GridLayer&) const = default;
};

/// Whether cells of equal values look the same in both: all but the values, the legend and the transparency.
bool HasSameColors(const GridLayer& a, const GridLayer& b);

/// Flow through the cells of a grid, as arrows that keep apart however near the map is seen.
struct ArrowLayer {
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> x, y;  ///< Along the axes of the grid.
  double strongest = 0;  ///< The flow of the longest arrow, so that a length means the same at all times.

  bool operator==(const ArrowLayer&) const = default;
};

/// Shapes over a grid.
struct ShapeLayer {
  std::shared_ptr<const CYbShapeData> shapes;
  Highlight highlighted = {};
  std::optional<unsigned> lineColor = {};  ///< Red, green, blue; the colour of the theme when nothing is said.
  std::optional<double> lineWidth = {};    ///< In pixels.
  bool isFilled = false;                   ///< Polygons have a quiet colour for each value, and a legend.
  bool withLabels = false;                 ///< Polygons bear their value where it fits.
  bool isDomain = false;                   ///< The outline of the model's domain, in a colour of its own.
  /// What values are called in the legend and on the map; a value without a name is told.
  std::vector<std::pair<std::string, std::string>> names = {};
  /// In the place of colours of the program: how a layer of the backdrop is drawn.
  std::optional<ShapeStyle> style = {};

  bool operator==(const ShapeLayer&) const = default;
};

/// A line of a network, or a piece of a boundary.
struct MapLine {
  std::string name = {};
  std::vector<MapPoint> points;
  std::vector<double> chainages = {};  ///< In metres, as many as points, or none: then it counts from the first point.
  std::optional<double> value = {};    ///< For `LineLayer::painted`.
};

/// Lines over a grid. A line that stands out lies above the others.
struct LineLayer {
  std::shared_ptr<const std::vector<MapLine>> lines;
  Highlight highlighted = {};
  bool withPoints = false;                 ///< Points are marked, and their chainages told, where there is room.
  bool withNames = true;                   ///< The same for names.
  std::optional<ValueScale> painted = {};  ///< Lines are coloured by their value; those without one stay quiet.
  std::optional<unsigned> lineColor = {};  ///< Red, green, blue.
  std::optional<double> lineWidth = {};    ///< In pixels.

  bool operator==(const LineLayer&) const = default;
};

/// Points with names over a grid.
struct PointLayer {
  std::vector<MapPoint> points;
  std::vector<std::string> labels = {};  ///< As many, or none.
  bool isNumbered = false;               ///< Markers hold their number from 1.
  Highlight highlighted = {};

  bool operator==(const PointLayer&) const = default;
};

/// An image on a map, turned to the north, between its sides.
struct ImageLayer {
  std::string path;
  FileStamp stamp;  ///< Of the file as it is meant, so that another one is read anew.
  double left = 0, right = 0, bottom = 0, top = 0;
  std::optional<unsigned> transparentColor = {};  ///< Red, green, blue.
  bool isGrey = false;

  bool operator==(const ImageLayer&) const = default;
};

/// A layer of the backdrop, below or above what the map is about. Nobody points at it.
struct BackdropLayer {
  std::string title;
  std::variant<ImageLayer, GridLayer, ShapeLayer, LineLayer, PointLayer> drawn;
  double transparency = 0;  ///< In addition to that of a grid: 0 as it is, 1 invisible.

  bool operator==(const BackdropLayer&) const = default;
};

/// What a user points at.
struct MapPick {
  MapPoint place;
  std::optional<std::pair<int, int>> cell;  ///< Of the first grid.
  std::optional<float> value;               ///< Of that cell; nothing for an empty one.
  std::optional<std::size_t> shape;         ///< Of the first layer of shapes, by its place from 0.
  std::string shapeValue = {};              ///< The text of that shape's value.
  std::optional<std::size_t> line;          ///< Of the first layer of lines.
  double chainage = 0;                      ///< Along that line.
  std::optional<std::size_t> point;         ///< Of the first layer of points.
};

/// What a page asks of the user on its map. As long as it is asked, the pointer is a target: a click gives a point,
/// several clicks and a double click a line, Esc gives up.
struct MapRequest {
  enum class Kind { Point, Line };

  Kind kind = Kind::Point;
  std::string prompt;  ///< Shown on the map: "Click the place of the well North 3."
  std::function<void(const std::vector<MapPoint>& points)> taken;
  std::function<void()> givenUp = {};

  bool AsksSame(const MapRequest& other) const { return kind == other.kind && prompt == other.prompt; }
};

/// What must be computed before a map or chart can show all that it is to show. Whoever shows it has that done, and
/// then asks for the content anew; until then it lacks what is computed, and holds the rest.
using Awaited = std::vector<std::shared_ptr<Computation>>;

/// What a map shows, from the bottom up: grids, shapes, lines, points. A user points at the first layer of each kind.
struct MapContent {
  std::vector<GridLayer> grids = {};
  std::vector<ShapeLayer> shapes = {};
  std::vector<LineLayer> lines = {};
  std::vector<PointLayer> points = {};
  std::optional<ArrowLayer> arrows = {};  ///< Over the grids, below all else.
  /// The backdrop from the bottom up: below the grids, and above all but the points.
  std::vector<BackdropLayer> below = {}, above = {};
  /// A line over all grids, shapes and lines that shows where the model lies; nobody points at it. Null for none.
  std::shared_ptr<const CYbShapeData> domain = {};
  std::optional<Envelope> area;  ///< Shown at first; the envelope of all layers when nothing is said.
  std::string message;           ///< Shown in the place of a map that has nothing to show.
  std::function<void(const MapPick& pick)> picked;  ///< A click of the user; may be empty.
  std::optional<MapRequest> request = {};
  Awaited awaited = {};

  /// The backdrop alone is something to look at, too.
  bool IsEmpty() const {
    return grids.empty() && shapes.empty() && lines.empty() && points.empty() && below.empty() && above.empty();
  }
};

/// Of the first layer of each kind: cells of that code, and what has that name or place.
void LetStandOut(MapContent& map, const Highlight& highlighted);

/// A surface of a section: elevations in the grid's unit.
struct SectionSurface {
  std::string name;  ///< Of what lies between it and the surface above.
  Level bottom;
  std::optional<unsigned> color = {};  ///< Red, green, blue; one of the program's when nothing is said.

  bool operator==(const SectionSurface&) const = default;
};

/// A body inside the layers, where its extent has a value other than 0; everywhere without an extent.
struct SectionLens {
  std::string name;
  Level top, bottom;
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> extent = nullptr;

  bool operator==(const SectionLens&) const = default;
};

/// A level that is drawn as a line: a head, the bottom of a computational layer.
struct SectionCurve {
  std::string name;
  Level level;
  bool isDashed = false;
  bool isStepped = false;  ///< Values hold for whole cells, as those of zones do.

  bool operator==(const SectionCurve&) const = default;
};

/// A stretch of a well, which is shown where the section passes near it.
struct SectionScreen {
  std::string name;
  MapPoint place;
  double top = 0, bottom = 0;  ///< Elevations in metres.

  bool operator==(const SectionScreen&) const = default;
};

/// A cut through the ground along a line of the map.
struct SectionContent {
  std::vector<MapPoint> line;  ///< None while the user has drawn none.
  std::optional<Level> ground;
  std::vector<SectionSurface> surfaces;  ///< From the top down.
  std::vector<SectionLens> lenses = {};
  std::vector<SectionCurve> curves = {};
  std::vector<SectionScreen> screens = {};
  double screenReach = 0;       ///< In metres: how far from the line a screen is shown.
  double minimumThickness = 0;  ///< In metres: layers that are thinner are marked, as are levels that cross.
  std::string message;          ///< Shown in the place of a section that has nothing to show.
  Awaited awaited = {};

  bool IsEmpty() const { return line.size() < 2 || !ground || surfaces.empty(); }
};

/// A stretch of a depth column, from the end of the one above it.
struct DepthBlock {
  std::string name;
  double bottom = 0;  ///< In metres below the ground.
  int parts = 1;      ///< Of equal height, into which it is divided.

  bool operator==(const DepthBlock&) const = default;
};
struct DepthColumn {
  std::string title;
  std::vector<DepthBlock> blocks;  ///< From the ground down. Blocks of one name have one colour.

  double Bottom() const { return blocks.empty() ? 0 : blocks.back().bottom; }
  bool operator==(const DepthColumn&) const = default;
};

/// Columns beside each other over one axis of depth.
struct DepthContent {
  std::vector<DepthColumn> columns;
  std::string message;  ///< Shown in the place of columns that have nothing to show.

  double Bottom() const;
  bool operator==(const DepthContent&) const = default;
};

/// One curve of a chart.
struct Series {
  std::string name;
  std::string unit;
  SharedValues<CYbDateTime> times;
  SharedValues<double> values;         ///< As many; NaN for a gap.
  bool isStepped = false;              ///< The value holds over the interval that ends at its time.
  std::vector<double> positions = {};  ///< In the place of times, for a chart over numbers (`SeriesContent::numbers`).
  int panel = 0;                       ///< Which of several charts below each other, from 0.
  /// Its values stand on a logarithmic axis, which has no place for those that are not above 0.
  bool isLogarithmic = false;
  /// The number of its colour, where it is not that of its place among the series.
  std::optional<std::size_t> color = {};
  bool isPoints = false;  ///< Each value is a dot of its own; no line leads from one to the next.
};

/// A series of a file that a user may lay over those of a chart.
struct SeriesOffer {
  std::string name;
  std::string group;  ///< What it is one of: "In the same file".
  std::string path;
  int item = 1;

  bool IsSame(const SeriesOffer& other) const { return path == other.path && item == other.item; }
};

/// What a user may lay over the series of a chart. It outlives the chart that shows it.
struct SeriesChoice {
  std::function<std::vector<SeriesOffer>()> offers;
  std::function<bool(const SeriesOffer& offer)> isShown;
  std::function<void(const SeriesOffer& offer, bool shown)> show;
  /// Asks for a series of any other file; false when the user gave up.
  std::function<bool(Host& host)> addFile;
};

/// A stretch of time in a strip above the curves: what was going on meanwhile.
struct TimeBar {
  enum class Kind {
    Thing,    ///< Of its name; bars of one name have one colour.
    Gap,      ///< Nothing where something was expected.
    Overlap,  ///< Two things at once; lies over the bars of both.
  };

  std::string name;
  CYbDateTime start, end;
  Kind kind = Kind::Thing;

  bool operator==(const TimeBar&) const = default;
};

/// A date that is marked in a chart.
struct DateMarker {
  std::string name;
  CYbDateTime time;
  std::function<void(const CYbDateTime& time)> moved = {};  ///< The user has dragged it; empty where he may not.
  bool standsOut = false;                                   ///< Before all others: what the user looks at.
};

/// A date that a page asks of the user on its chart: a click gives it, Esc gives up.
struct DateRequest {
  std::string prompt;  ///< "Click the begin of the growing season."
  std::function<void(const CYbDateTime& time)> taken;
  std::function<void()> givenUp = {};
};

/// The horizontal axis of curves over a number, such as those of retention.
struct NumberAxis {
  std::string title, unit;
  bool isLogarithmic = false;  ///< Positions that are not above 0 are left out.

  bool operator==(const NumberAxis&) const = default;
};

/// In each chart the first two units have an axis of their own, the second one on the right.
struct SeriesContent {
  std::vector<Series> series;
  /// Shaded: the time that is simulated.
  std::optional<std::pair<CYbDateTime, CYbDateTime>> period;
  std::string message;  ///< Shown in the place of a chart that has nothing to show.
  Awaited awaited = {};
  std::optional<NumberAxis> numbers = {};  ///< The chart is over these, not over time.
  std::vector<DateMarker> markers = {};
  std::optional<DateRequest> request = {};
  std::vector<TimeBar> bars = {};  ///< Ascending by their start.
  /// Of the charts below each other, each in its corner; those beyond have none.
  std::vector<std::string> panelTitles = {};
  std::optional<SeriesChoice> choice = {};

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
/// The same without the dates that are marked, and these alone.
bool LooksSameButForMarkers(const SeriesContent& a, const SeriesContent& b);
bool LooksSame(const std::vector<DateMarker>& a, const std::vector<DateMarker>& b);
bool LooksSame(const SectionContent& a, const SectionContent& b);

/// In short what is shown, for texts: "grid 142x97, 29 shapes", "2 series, 1461 values", or the message; and what
/// stands out and is asked for.
std::string Summary(const MapContent& content);
std::string Summary(const SeriesContent& content);
std::string Summary(const SectionContent& content);
std::string Summary(const DepthContent& content);

}  // namespace tervane
