// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/grid_interpolation.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdint>
#include <limits>
#include <new>
#include <optional>
#include <utility>

#include <fmt/format.h>

#include "geometry/delaunay.h"
#include "geometry/quadrant_neighbours.h"
#include "platform/row_workers.h"

namespace tervane {
namespace {

// Everything below counts lengths in cells from the grid's lower left corner: cell i has its centre at i + 0.5. Weights
// of inverse distances do not change with the unit of length.

/// A point nearer to a centre than this, in cells, gives the cell its value: a weight would reach infinity.
constexpr double kHit = 1e-9;

/// The rows of the result.
struct Target {
  int nx, ny;
  float deleteValue;
  float* values;
  ProgressPart progress;

  float* Row(int j) const { return values + static_cast<std::ptrdiff_t>(j) * nx; }
};

/// The first and last cell whose centre lies in [low, high], cut to [0, count).
std::pair<int, int> CentresIn(double low, double high, int count) {
  const double first = std::ceil(low - 0.5), last = std::floor(high - 0.5);
  return {static_cast<int>(std::clamp(first, 0.0, static_cast<double>(count))),
          static_cast<int>(std::clamp(last, -1.0, static_cast<double>(count - 1)))};
}

/// Sorts many points and yet stops soon where that is asked for.
template <class Items, class Before>
void Sort(Items& items, ProgressPart progress, const Before& before) {
  std::sort(items.begin(), items.end(), [&](const auto& a, const auto& b) {
    progress.ThrowIfCancelled();
    return before(a, b);
  });
}

/// The mean of points at the same place; afterwards they are sorted by x, then y.
void MergeCoincident(std::vector<ScatteredPoint>& points, ProgressPart progress) {
  // By z last: the mean of a place then does not depend on the order of the file.
  Sort(points, progress, [](const ScatteredPoint& a, const ScatteredPoint& b) {
    return a.x != b.x ? a.x < b.x : a.y != b.y ? a.y < b.y : a.z < b.z;
  });
  auto out = points.begin();
  for (auto first = points.begin(); first != points.end();) {
    double sum = 0;
    auto last = first;
    for (; last != points.end() && last->x == first->x && last->y == first->y; ++last) sum += last->z;
    *out = {first->x, first->y, last - first == 1 ? first->z : sum / static_cast<double>(last - first)};
    first = last;
    ++out;
  }
  points.erase(out, points.end());
}

/// Sorts points by y, for walks row by row.
void SortByY(std::vector<ScatteredPoint>& points, ProgressPart progress) {
  Sort(points, progress,
       [](const ScatteredPoint& a, const ScatteredPoint& b) { return a.y != b.y ? a.y < b.y : a.x < b.x; });
}

/// The first of points sorted by y that is not below a limit.
std::vector<ScatteredPoint>::const_iterator FirstFrom(const std::vector<ScatteredPoint>& points, double limit) {
  return std::lower_bound(points.begin(), points.end(), limit,
                          [](const ScatteredPoint& point, double y) { return point.y < y; });
}

/// Gives cells of a row the values of points at their centres; the points are sorted by y.
void PutHits(const std::vector<ScatteredPoint>& points, int j, const Target& target) {
  const double y = j + 0.5;
  for (auto point = FirstFrom(points, y - kHit); point != points.end() && point->y <= y + kHit; ++point) {
    const double column = std::floor(point->x);
    if (!(column >= 0 && column < target.nx)) continue;
    if (std::hypot(point->x - column - 0.5, point->y - y) < kHit)
      target.Row(j)[static_cast<int>(column)] = static_cast<float>(point->z);
  }
}

// ---- Inverse distance

// Loops over many numbers are compiled for wider processors too, and the program takes what its processor has. Each
// cell has its own sum, so that results are the same to the last bit.
#if defined(__GNUC__) && !defined(__clang__) && defined(__x86_64__) && defined(__linux__)
#define TERVANE_ALSO_WIDE __attribute__((target_clones("avx2", "default")))
#else
#define TERVANE_ALSO_WIDE
#endif

/// Adds a point to the sums of cells whose centres lie `steps` + `offset` beside it.
template <bool isSquared, class Number>
TERVANE_ALSO_WIDE void AddWeights(Number offset, Number dy2, Number value, std::ptrdiff_t count,
                                  const Number* __restrict steps, Number* __restrict weights, Number* __restrict sums) {
  for (std::ptrdiff_t i = 0; i < count; ++i) {
    const Number dx = steps[i] + offset, distance2 = dx * dx + dy2;
    const Number weight = 1 / (isSquared ? distance2 : std::sqrt(distance2));
    weights[i] += weight;
    sums[i] += weight * value;
  }
}

/// The sums of a row: a few points are added in a number that is fast, and gathered in one that is precise.
template <class Number>
struct RowSums {
  explicit RowSums(std::size_t nx) : weights(nx), sums(nx), allWeights(nx), allSums(nx) {}

  void Gather() {
    for (std::size_t i = 0; i < weights.size(); ++i) {
      allWeights[i] += static_cast<double>(std::exchange(weights[i], Number{0}));
      allSums[i] += static_cast<double>(std::exchange(sums[i], Number{0}));
    }
  }

  std::vector<Number> weights, sums;
  std::vector<double> allWeights, allSums;
};

/// Each point adds to the cells of a row within its reach: nothing is searched, and the sums stay in the fastest cache.
class InverseDistance {
 public:
  InverseDistance(std::vector<ScatteredPoint> points, double radius, bool isSquared, ProgressPart progress)
      : points_(std::move(points)), radius_(radius), isSquared_(isSquared) {
    std::vector<double> values;
    values.reserve(points_.size());
    double size = 0;
    for (const ScatteredPoint& point : points_) {
      values.push_back(point.z);
      size = std::max({size, std::abs(point.x), std::abs(point.y), std::abs(point.z)});
    }
    const auto [least, most] = std::minmax_element(values.begin(), values.end());
    least_ = *least;
    most_ = *most;
    const auto middle = values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2);
    std::nth_element(values.begin(), middle, values.end());
    median_ = *middle;
    // Squares and products with a weight stay far from the ends of single precision.
    constexpr double kSingle = 1e15;
    isSingle_ = size < kSingle;
    SortByY(points_, progress);
  }

  void Rows(int begin, int end, const Target& target) const {
    if (isSingle_) {
      RowsIn<float>(begin, end, target);
    } else {
      RowsIn<double>(begin, end, target);
    }
  }

 private:
  template <class Number>
  void RowsIn(int begin, int end, const Target& target) const {
    const auto nx = static_cast<std::size_t>(target.nx);
    std::vector<Number> steps(2 * nx - 1);
    for (std::size_t i = 0; i < steps.size(); ++i) steps[i] = static_cast<Number>(i) - static_cast<Number>(nx - 1);
    for (int j = begin; j < end; ++j) {
      RowSums<Number> row(nx);
      const double y = j + 0.5;
      // So few that what single precision loses with each does not show.
      constexpr int kTogether = 512;
      int together = 0;
      for (auto point = FirstFrom(points_, y - radius_); point != points_.end() && point->y <= y + radius_; ++point) {
        // Many points within a large radius make a single row take seconds.
        if (target.progress.IsCancelled()) return;
        AddPoint(*point, y, steps.data() + (nx - 1), row);
        if (++together % kTogether == 0) row.Gather();
      }
      row.Gather();
      for (std::size_t i = 0; i < nx; ++i) {
        const double weight = row.allWeights[i], value = median_ + row.allSums[i] / weight;
        target.Row(j)[i] = weight > 0 ? static_cast<float>(std::clamp(value, least_, most_)) : target.deleteValue;
      }
      PutHits(points_, j, target);
    }
  }

  template <class Number>
  void AddPoint(const ScatteredPoint& point, double y, const Number* steps, RowSums<Number>& row) const {
    const double dy = point.y - y, dy2 = dy * dy;
    const double rest = radius_ * radius_ - dy2;
    if (rest < 0) return;
    const auto nx = static_cast<int>(row.weights.size());
    const double half = std::sqrt(rest);
    const auto [first, last] = CentresIn(point.x - half, point.x + half, nx);
    if (first > last) return;
    // The column of the point, from which others are whole steps away: a short distance loses nothing by rounding.
    const int column = static_cast<int>(std::clamp(std::floor(point.x), 0.0, nx - 1.0));
    const auto add = isSquared_ ? AddWeights<true, Number> : AddWeights<false, Number>;
    // Values count from their median: of sums of differences, rounding takes less.
    add(static_cast<Number>(column + 0.5 - point.x), static_cast<Number>(dy2), static_cast<Number>(point.z - median_),
        last - first + 1, steps + (first - column), row.weights.data() + first, row.sums.data() + first);
  }

  std::vector<ScatteredPoint> points_;
  double radius_;
  bool isSquared_;
  double least_, most_, median_;
  bool isSingle_;
};

// ---- Bilinear

/// A point as a cell sees it from its centre.
struct Neighbour {
  double x = 0, y = 0, z = 0;
  double distance2 = 0;
};

/// The value at (0, 0) of a + b x + c y + d x y through four points; nothing when there is no such surface, or when it
/// would leave the range of the four values.
std::optional<double> BilinearValue(const std::array<Neighbour, 4>& points) {
  // The weights w solve sum w = 1, sum w x = 0, sum w y = 0, sum w x y = 0: but for a factor they are the minors of the
  // rows x, y, x y.
  struct Column {
    double x, y, xy;
  };
  std::array<Column, 4> columns;
  double scale = 0;
  for (std::size_t k = 0; k < 4; ++k) {
    const auto& [x, y, z, distance2] = points[k];
    columns[k] = {x, y, x * y};
    scale = std::max(scale, distance2);
  }
  const auto cross = [](const Column& a, const Column& b) {
    return Column{a.y * b.xy - a.xy * b.y, a.xy * b.x - a.x * b.xy, a.x * b.y - a.y * b.x};
  };
  const auto product = [](const Column& a, const Column& b) { return a.x * b.x + a.y * b.y + a.xy * b.xy; };
  const Column first = cross(columns[0], columns[1]), second = cross(columns[2], columns[3]);
  std::array<double, 4> weights = {product(columns[1], second), -product(columns[0], second),
                                   product(columns[3], first), -product(columns[2], first)};
  double sum = 0, size = 0, value = 0;
  for (std::size_t k = 0; k < 4; ++k) {
    sum += weights[k];
    size += std::abs(weights[k]);
    value += weights[k] * points[k].z;
  }
  double least = 0;
  for (const double weight : weights) least = std::min(least, std::copysign(1.0, sum) * weight);
  constexpr double kRounding = 1e-12;
  const bool isSurface = std::abs(sum) > kRounding * size && size >= kRounding * scale * scale;
  if (!isSurface || least < -kRounding * std::abs(sum)) return std::nullopt;
  return value / sum;
}

class Bilinear {
 public:
  Bilinear(std::vector<ScatteredPoint> points, double radius, ProgressPart progress)
      : points_(std::move(points)), radius_(radius) {
    SortByY(points_, progress);
  }

  void Rows(int begin, int end, const Target& target) const {
    QuadrantNeighbours neighbours(points_, target.nx, radius_);
    neighbours.Find(begin, end, target.progress);
    const std::uint32_t none = neighbours.NoPoint();
    const double radius2 = radius_ * radius_;
    for (int j = begin; j < end; ++j) {
      target.progress.ThrowIfCancelled();
      const std::array<const std::uint32_t*, 4> nearest = {neighbours.Row(0, j), neighbours.Row(1, j),
                                                           neighbours.Row(2, j), neighbours.Row(3, j)};
      std::array<Neighbour, 4> found;
      for (int i = 0; i < target.nx; ++i) {
        std::size_t count = 0;
        for (const std::uint32_t* const quadrant : nearest) {
          if (quadrant[i] == none) continue;
          const ScatteredPoint& point = points_[quadrant[i]];
          const double x = point.x - (i + 0.5), y = point.y - (j + 0.5), distance2 = x * x + y * y;
          found[count] = {x, y, point.z, distance2};
          count += distance2 <= radius2;
        }
        target.Row(j)[i] = count == 0 ? target.deleteValue : static_cast<float>(ValueOf(found, count));
      }
      PutHits(points_, j, target);
    }
  }

 private:
  static double ValueOf(const std::array<Neighbour, 4>& found, std::size_t count) {
    double weights = 0, sum = 0;
    if (count == found.size()) {
      if (const std::optional<double> value = BilinearValue(found)) return *value;
    }
    for (std::size_t k = 0; k < count; ++k) {
      const double weight = 1 / std::sqrt(found[k].distance2);
      weights += weight;
      sum += weight * found[k].z;
    }
    return sum / weights;
  }

  std::vector<ScatteredPoint> points_;
  double radius_;
};

// ---- Triangles

class Triangular {
 public:
  /// The points stand in world coordinates.
  Triangular(const std::vector<ScatteredPoint>& points, const GridGeometry& geometry, ProgressPart progress) {
    PutOnLattice(points, geometry, progress);
    triangles_ = Triangulate(lattice_, progress);
    rows_.reserve(triangles_.size());
    for (const Triangle& triangle : triangles_) {
      const auto [low, high] = std::minmax({points_[triangle[0]].y, points_[triangle[1]].y, points_[triangle[2]].y});
      rows_.push_back(CentresIn(low - tolerance_, high + tolerance_, geometry.ny));
    }
  }

  bool HasTriangles() const { return !triangles_.empty(); }
  std::size_t MergedPoints() const { return merged_; }

  void Rows(int begin, int end, const Target& target) const {
    std::fill(target.Row(begin), target.Row(end), target.deleteValue);
    for (std::size_t t = 0; t < triangles_.size(); ++t) {
      const int first = std::max(rows_[t].first, begin), last = std::min(rows_[t].second, end - 1);
      if (first <= last) Fill(triangles_[t], first, last, target);
    }
  }

 private:
  /// Whole coordinates make the triangulation exact. They are taken on the map, so that points on a line or a regular
  /// grid of the map stay on one, for which the step is a power of two; the longer side of the points has a billion
  /// steps.
  void PutOnLattice(const std::vector<ScatteredPoint>& points, const GridGeometry& geometry, ProgressPart progress) {
    const GridTransform transform(geometry);
    double xMin = points[0].x, yMin = points[0].y, xMax = xMin, yMax = yMin;
    for (const ScatteredPoint& point : points) {
      xMin = std::min(xMin, point.x);
      xMax = std::max(xMax, point.x);
      yMin = std::min(yMin, point.y);
      yMax = std::max(yMax, point.y);
    }
    const double extent = std::max({xMax - xMin, yMax - yMin, std::numeric_limits<double>::min()});
    const double step = std::exp2(std::ceil(std::log2(extent / static_cast<double>(kLatticeSize - 1))));
    struct Placed {
      LatticePoint place;
      ScatteredPoint point;
    };
    std::vector<Placed> placed;
    placed.reserve(points.size());
    const auto onLattice = [step](double offset) { return static_cast<std::int64_t>(std::llround(offset / step)); };
    for (const ScatteredPoint& point : points) {
      placed.push_back({{onLattice(point.x - xMin), onLattice(point.y - yMin)}, point});
    }
    Sort(placed, progress, [](const Placed& a, const Placed& b) {
      return a.place.x != b.place.x   ? a.place.x < b.place.x
             : a.place.y != b.place.y ? a.place.y < b.place.y
                                      : a.point.z < b.point.z;
    });
    lattice_.reserve(placed.size());
    points_.reserve(placed.size());
    for (std::size_t first = 0, last = 0; first < placed.size(); first = last) {
      ScatteredPoint sum;
      for (; last < placed.size() && placed[last].place == placed[first].place; ++last) {
        const ScatteredPoint& point = placed[last].point;
        sum = {sum.x + point.x, sum.y + point.y, sum.z + point.z};
      }
      // The lattice decides who is whose neighbour; the planes go through the points themselves.
      const auto count = static_cast<double>(last - first);
      const MapPoint cells = transform.ToCells({sum.x / count, sum.y / count});
      lattice_.push_back(placed[first].place);
      points_.push_back({cells.x, cells.y, sum.z / count});
    }
    merged_ = placed.size() - lattice_.size();
    // Where points stand at the centres of cells, rounding must not put the outermost of them outside the hull.
    tolerance_ = std::max(1e-6, 2 * step / geometry.cellSize);
  }

  void Fill(const Triangle& triangle, int first, int last, const Target& target) const {
    const ScatteredPoint &a = points_[triangle[0]], &b = points_[triangle[1]], &c = points_[triangle[2]];
    const double bx = b.x - a.x, by = b.y - a.y, bz = b.z - a.z, cx = c.x - a.x, cy = c.y - a.y, cz = c.z - a.z;
    const double turn = bx * cy - by * cx;
    const double slopeX = (bz * cy - cz * by) / turn, slopeY = (bx * cz - cx * bz) / turn;
    // A triangle thinner than the tolerance is left to its neighbours, which reach over it: its plane may be steep at
    // will.
    const double longest2 =
        std::max({bx * bx + by * by, cx * cx + cy * cy, (cx - bx) * (cx - bx) + (cy - by) * (cy - by)});
    if (turn * turn < tolerance_ * tolerance_ / 4 * longest2) return;
    // A plane leaves the range of its corners only through rounding.
    const auto [least, most] = std::minmax({a.z, b.z, c.z});
    for (int j = first; j <= last; ++j) {
      const double y = j + 0.5;
      const auto [innerLeft, innerRight] = Reach({&a, &b, &c}, y, 0);
      const auto [left, right] = Reach({&a, &b, &c}, y, tolerance_);
      const auto [begin, end] = CentresIn(left - tolerance_, right + tolerance_, target.nx);
      float* const row = target.Row(j);
      const double atRow = a.z + slopeY * (y - a.y);
      for (int i = begin; i <= end; ++i) {
        const double x = i + 0.5;
        const bool isInside = x >= innerLeft && x <= innerRight;
        if (!isInside && row[i] != target.deleteValue && row[i] == row[i]) continue;
        row[i] = static_cast<float>(std::clamp(atRow + slopeX * (x - a.x), least, most));
      }
    }
  }

  /// The part of the x axis that a triangle takes between y - margin and y + margin; nothing has its ends the wrong way
  /// round. Both triangles of an edge reckon from its lower end, so that no cell falls between them.
  static std::pair<double, double> Reach(const std::array<const ScatteredPoint*, 3>& corners, double y, double margin) {
    double left = std::numeric_limits<double>::infinity(), right = -left;
    for (std::size_t k = 0; k < 3; ++k) {
      const ScatteredPoint &p = *corners[k], &q = *corners[(k + 1) % 3];
      const bool isUp = p.y < q.y || (p.y == q.y && p.x < q.x);
      const ScatteredPoint &low = isUp ? p : q, &high = isUp ? q : p;
      const double bottom = std::max(y - margin, low.y), top = std::min(y + margin, high.y);
      if (bottom > top) continue;
      const bool isLevel = low.y == high.y;
      const double slope = isLevel ? 0 : (high.x - low.x) / (high.y - low.y);
      const double atBottom = low.x + (bottom - low.y) * slope;
      const double atTop = isLevel ? high.x : low.x + (top - low.y) * slope;
      left = std::min({left, atBottom, atTop});
      right = std::max({right, atBottom, atTop});
    }
    return {left, right};
  }

  std::vector<LatticePoint> lattice_;
  std::vector<ScatteredPoint> points_;
  std::vector<Triangle> triangles_;
  std::vector<std::pair<int, int>> rows_;
  std::size_t merged_ = 0;
  double tolerance_ = 0;
};

std::string WhyNot(const std::vector<ScatteredPoint>& points, const GridGeometry& geometry,
                   const InterpolationOptions& options) {
  if (std::string problem = geometry.Problem(); !problem.empty()) return problem;
  if (options.method < InterpolationMethod::Bilinear || options.method > InterpolationMethod::InverseDistanceSquared) {
    return fmt::format("there is no interpolation method {}", static_cast<int>(options.method));
  }
  const bool needsRadius = options.method != InterpolationMethod::Triangular;
  if (needsRadius && (!(options.searchRadius > 0) || !std::isfinite(options.searchRadius))) {
    return fmt::format("the search radius is {}, not above 0", options.searchRadius);
  }
  if (points.empty()) return "there are no points to interpolate";
  for (const ScatteredPoint& point : points) {
    if (!(std::abs(point.z) <= static_cast<double>(std::numeric_limits<float>::max())) || !std::isfinite(point.x) ||
        !std::isfinite(point.y)) {
      return fmt::format("the point ({}, {}) has the value {}, which a grid cannot hold", point.x, point.y, point.z);
    }
  }
  return {};
}

FileResult InterpolateChecked(std::vector<ScatteredPoint> points, const GridGeometry& geometry, float deleteValue,
                              const InterpolationOptions& options, std::vector<float>& values) {
  // A triangulation takes as long as filling the rows; all else is quick beside them.
  const ProgressPart making = options.progress.Part(0, options.method == InterpolationMethod::Triangular ? 0.5 : 0.05);
  const ProgressPart filling = options.progress.Part(options.method == InterpolationMethod::Triangular ? 0.5 : 0.05, 1);
  MergeCoincident(points, making);
  const bool isOnMap = options.method == InterpolationMethod::Triangular;
  const GridTransform transform(geometry);
  for (ScatteredPoint& point : points) {
    if (isOnMap) break;
    const MapPoint cells = transform.ToCells({point.x, point.y});
    point.x = cells.x;
    point.y = cells.y;
  }
  const double radius = options.searchRadius / geometry.cellSize;
  values.resize(geometry.CellCount());
  const Target target{geometry.nx, geometry.ny, deleteValue, values.data(), filling};
  const auto run = [&](int rowsAtOnce, const auto& method) {
    ForRows(geometry.ny, rowsAtOnce, options.threads, filling,
            [&](int begin, int end) { method.Rows(begin, end, target); });
  };
  // Many points within reach make a row slow, and a user who cancels should not wait for several.
  constexpr int kFewRows = 8;
  // A sweep over rows first takes in all points within reach, so that it should not be for a few rows alone.
  constexpr int kRowsOfSweep = 32;
  constexpr std::size_t kManyPoints = 100'000;
  FileResult result;
  switch (options.method) {
    case InterpolationMethod::Bilinear:
      run(kRowsOfSweep, Bilinear(std::move(points), radius, making));
      break;
    case InterpolationMethod::Triangular: {
      const Triangular triangular(points, geometry, making);
      if (!triangular.HasTriangles())
        result.note = "all points lie on one line and span no triangle: all cells are empty";
      if (triangular.MergedPoints() > 0) {
        result.note += fmt::format("{}{} points lie so near to others, for the extent of all, that they count as one",
                                   result.note.empty() ? "" : "; ", triangular.MergedPoints());
      }
      // Each block of rows goes through all triangles, so that there should not be many.
      constexpr int kBlocks = 16;
      run(std::max(1, geometry.ny / (kBlocks * std::max(1, options.threads)) + 1), triangular);
      break;
    }
    default:
      run(points.size() > kManyPoints ? 1 : kFewRows,
          InverseDistance(std::move(points), radius, options.method == InterpolationMethod::InverseDistanceSquared,
                          making));
  }
  return result;
}

}  // namespace

FileResult Interpolate(std::vector<ScatteredPoint> points, const GridGeometry& geometry, float deleteValue,
                       const InterpolationOptions& options, std::vector<float>& values) {
  FileResult result{WhyNot(points, geometry, options), {}};
  try {
    if (result.Ok()) result = InterpolateChecked(std::move(points), geometry, deleteValue, options, values);
  } catch (const std::bad_alloc&) {
    result.error = "there is no memory for the interpolation";
  } catch (const Cancelled&) {
    result = {kCancelled, {}};
  }
  if (!result.Ok()) values.clear();
  return result;
}

}  // namespace tervane
