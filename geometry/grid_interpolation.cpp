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
#include <nanoflann.hpp>

#include "geometry/delaunay.h"
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

// ---- Inverse distance

/// Each point adds to the cells of a row within its reach: nothing is searched, and the sums stay in the fastest cache.
class InverseDistance {
 public:
  InverseDistance(std::vector<ScatteredPoint> points, double radius, bool isSquared, ProgressPart progress)
      : points_(std::move(points)), radius_(radius), isSquared_(isSquared) {
    Sort(points_, progress,
         [](const ScatteredPoint& a, const ScatteredPoint& b) { return a.y != b.y ? a.y < b.y : a.x < b.x; });
  }

  void Rows(int begin, int end, const Target& target) const {
    const auto nx = static_cast<std::size_t>(target.nx);
    std::vector<double> centres(nx), weights(nx), sums(nx);
    std::vector<std::pair<int, double>> hits;
    for (std::size_t i = 0; i < nx; ++i) centres[i] = static_cast<double>(i) + 0.5;
    for (int j = begin; j < end; ++j) {
      std::fill(weights.begin(), weights.end(), 0.0);
      std::fill(sums.begin(), sums.end(), 0.0);
      hits.clear();
      const double y = j + 0.5;
      const auto isBelow = [](const ScatteredPoint& point, double limit) { return point.y < limit; };
      for (auto point = std::lower_bound(points_.begin(), points_.end(), y - radius_, isBelow);
           point != points_.end() && point->y <= y + radius_; ++point) {
        // Many points within a large radius make a single row take seconds.
        if (target.progress.IsCancelled()) return;
        AddPoint(*point, y, centres, weights, sums, hits);
      }
      float* const row = target.Row(j);
      for (std::size_t i = 0; i < nx; ++i) {
        row[i] = weights[i] > 0 ? static_cast<float>(sums[i] / weights[i]) : target.deleteValue;
      }
      for (const auto& [i, value] : hits) row[i] = static_cast<float>(value);
    }
  }

 private:
  void AddPoint(const ScatteredPoint& point, double y, const std::vector<double>& centres, std::vector<double>& weights,
                std::vector<double>& sums, std::vector<std::pair<int, double>>& hits) const {
    const double dy = point.y - y, dy2 = dy * dy;
    const double rest = radius_ * radius_ - dy2;
    if (rest < 0) return;
    const double half = std::sqrt(rest);
    const auto [first, last] = CentresIn(point.x - half, point.x + half, static_cast<int>(centres.size()));
    Add(point, dy2, first, last, centres.data(), weights.data(), sums.data());
    const double nearest = std::floor(point.x);
    if (nearest < first || nearest > last) return;
    const double dx = point.x - nearest - 0.5;
    if (dx * dx + dy2 < kHit * kHit) hits.emplace_back(static_cast<int>(nearest), point.z);
  }

  void Add(const ScatteredPoint& point, double dy2, int first, int last, const double* __restrict centres,
           double* __restrict weights, double* __restrict sums) const {
    const double x = point.x, z = point.z;
    if (isSquared_) {
      for (int i = first; i <= last; ++i) {
        const double dx = centres[i] - x;
        const double weight = 1 / (dx * dx + dy2);
        weights[i] += weight;
        sums[i] += weight * z;
      }
    } else {
      for (int i = first; i <= last; ++i) {
        const double dx = centres[i] - x;
        const double weight = 1 / std::sqrt(dx * dx + dy2);
        weights[i] += weight;
        sums[i] += weight * z;
      }
    }
  }

  std::vector<ScatteredPoint> points_;
  double radius_;
  bool isSquared_;
};

// ---- Bilinear

struct PointCloud {
  const std::vector<ScatteredPoint>& points;
  ProgressPart progress;

  std::size_t kdtree_get_point_count() const { return points.size(); }
  double kdtree_get_pt(std::size_t index, std::size_t dimension) const {
    // The only place at which the making of a tree can be left.
    progress.ThrowIfCancelled();
    return dimension == 0 ? points[index].x : points[index].y;
  }
  template <class Box>
  bool kdtree_get_bbox(Box& /*box*/) const {
    return false;
  }
};
using PointTree =
    nanoflann::KDTreeSingleIndexAdaptor<nanoflann::L2_Simple_Adaptor<double, PointCloud>, PointCloud, 2, std::uint32_t>;

/// Collects the nearest point of each quadrant around a centre. An axis belongs to the quadrant that it opens, counted
/// counter-clockwise.
class QuadrantNeighbours {
 public:
  struct Neighbour {
    double x = 0, y = 0;  ///< Relative to the centre.
    double z = 0;
    double distance2 = 0;
    std::uint32_t index = 0;
  };

  QuadrantNeighbours(const std::vector<ScatteredPoint>& points, double x, double y, double radius2)
      : points_(points), x_(x), y_(y) {
    // The tree takes what lies nearer than the limit, and the radius itself is to count.
    limit_ = std::nextafter(radius2, std::numeric_limits<double>::infinity());
    for (Neighbour& neighbour : found) neighbour.distance2 = limit_;
  }

  bool addPoint(double distance2, std::uint32_t index) {
    const ScatteredPoint& point = points_[index];
    const double dx = point.x - x_, dy = point.y - y_;
    const std::size_t quadrant = dx > 0 && dy >= 0 ? 0 : dx <= 0 && dy > 0 ? 1 : dx < 0 ? 2 : 3;
    Neighbour& neighbour = found[quadrant];
    const bool isTie = distance2 == neighbour.distance2 && index < neighbour.index;
    if (distance2 < neighbour.distance2 || isTie) neighbour = {dx, dy, point.z, distance2, index};
    return true;
  }
  double worstDist() const {
    double worst = 0;
    for (const Neighbour& neighbour : found) worst = std::max(worst, neighbour.distance2);
    return worst;
  }
  bool full() const { return true; }
  std::size_t size() const { return found.size(); }

  bool Has(const Neighbour& neighbour) const { return neighbour.distance2 < limit_; }
  std::array<Neighbour, 4> found;

 private:
  const std::vector<ScatteredPoint>& points_;
  double x_, y_;
  double limit_;
};

/// The weights with which a + b x + c y + d x y through four points has its value at (0, 0); nothing when there is no
/// such surface, or when it would leave the range of the four values.
std::optional<std::array<double, 4>> BilinearWeights(const std::array<QuadrantNeighbours::Neighbour, 4>& points) {
  double scale = 0;
  for (const auto& point : points) scale = std::max({scale, std::abs(point.x), std::abs(point.y)});
  // The weights w solve sum w = 1, sum w x = 0, sum w y = 0, sum w x y = 0: but for a factor they are the minors of the
  // rows x, y, x y.
  std::array<std::array<double, 3>, 4> columns;
  for (std::size_t k = 0; k < 4; ++k) {
    const double x = points[k].x / scale, y = points[k].y / scale;
    columns[k] = {x, y, x * y};
  }
  const auto minor = [&columns](std::size_t p, std::size_t q, std::size_t r) {
    const auto &a = columns[p], &b = columns[q], &c = columns[r];
    return a[0] * (b[1] * c[2] - b[2] * c[1]) - a[1] * (b[0] * c[2] - b[2] * c[0]) + a[2] * (b[0] * c[1] - b[1] * c[0]);
  };
  std::array<double, 4> weights = {minor(1, 2, 3), -minor(0, 2, 3), minor(0, 1, 3), -minor(0, 1, 2)};
  double sum = 0, size = 0;
  for (const double weight : weights) {
    sum += weight;
    size += std::abs(weight);
  }
  constexpr double kRounding = 1e-12;
  if (!(std::abs(sum) > kRounding * size) || size < kRounding) return std::nullopt;
  for (double& weight : weights) {
    weight /= sum;
    if (weight < -kRounding) return std::nullopt;
  }
  return weights;
}

class Bilinear {
 public:
  Bilinear(std::vector<ScatteredPoint> points, double radius, ProgressPart progress)
      : points_(std::move(points)), cloud_{points_, progress}, tree_(2, cloud_), radius2_(radius * radius) {}

  void Rows(int begin, int end, const Target& target) const {
    for (int j = begin; j < end; ++j) {
      for (int i = 0; i < target.nx; ++i) target.Row(j)[i] = ValueAt(i + 0.5, j + 0.5, target.deleteValue);
    }
  }

 private:
  float ValueAt(double x, double y, float deleteValue) const {
    QuadrantNeighbours neighbours(points_, x, y, radius2_);
    const std::array<double, 2> query = {x, y};
    tree_.findNeighbors(neighbours, query.data(), {});
    std::size_t count = 0;
    double weights = 0, sum = 0;
    for (const auto& neighbour : neighbours.found) {
      if (!neighbours.Has(neighbour)) continue;
      ++count;
      if (neighbour.distance2 < kHit * kHit) return static_cast<float>(neighbour.z);
      const double weight = 1 / std::sqrt(neighbour.distance2);
      weights += weight;
      sum += weight * neighbour.z;
    }
    if (count == 0) return deleteValue;
    if (count == 4) {
      if (const auto bilinear = BilinearWeights(neighbours.found)) {
        sum = 0;
        for (std::size_t k = 0; k < 4; ++k) sum += (*bilinear)[k] * neighbours.found[k].z;
        return static_cast<float>(sum);
      }
    }
    return static_cast<float>(sum / weights);
  }

  std::vector<ScatteredPoint> points_;
  PointCloud cloud_;
  PointTree tree_;
  double radius2_;
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
  constexpr std::size_t kManyPoints = 100'000;
  FileResult result;
  switch (options.method) {
    case InterpolationMethod::Bilinear:
      run(kFewRows, Bilinear(std::move(points), radius, making));
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
