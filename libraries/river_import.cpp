// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/river_import.h"

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <set>
#include <unordered_map>
#include <unordered_set>

#include <fmt/format.h>

#include "geometry/cart.h"
#include "geometry/grid_section.h"
#include "platform/text.h"

namespace tervane {

namespace {

double Distance(MapPoint a, MapPoint b) { return std::hypot(b.x - a.x, b.y - a.y); }
std::string PlaceText(MapPoint place) { return fmt::format("{:.1f}, {:.1f}", place.x, place.y); }

/// The squares of the map in which things lie, so that what is near is found without looking at all.
class Squares {
 public:
  explicit Squares(double size) : size_(size) {}

  double Size() const { return size_; }

  void Add(MapPoint low, MapPoint high, std::size_t thing) {
    Visit(low, high, [&](std::uint64_t square) { squares_[square].push_back(thing); });
  }
  /// Calls `visit` for all that may lie within a distance; some several times.
  template <class Visitor>
  void Near(MapPoint place, double distance, const Visitor& visit) const {
    Visit({place.x - distance, place.y - distance}, {place.x + distance, place.y + distance},
          [&](std::uint64_t square) {
            if (const auto found = squares_.find(square); found != squares_.end())
              for (const std::size_t thing : found->second) visit(thing);
          });
  }

 private:
  std::int32_t Square(double coordinate) const {
    constexpr double kMost = 2e9;
    return static_cast<std::int32_t>(std::clamp(std::floor(coordinate / size_), -kMost, kMost));
  }
  template <class Visitor>
  void Visit(MapPoint low, MapPoint high, const Visitor& visit) const {
    for (std::int64_t i = Square(low.x); i <= Square(high.x); ++i)
      for (std::int64_t j = Square(low.y); j <= Square(high.y); ++j)
        visit(static_cast<std::uint64_t>(i) << 32 | static_cast<std::uint32_t>(j));
  }

  double size_;
  std::unordered_map<std::uint64_t, std::vector<std::size_t>> squares_;
};

// ---- Lines

/// Makes branches of lines, one by one.
class LineReader {
 public:
  LineReader(const CYbShapeData& shapes, const RiverImportOptions& options, RiverImport& import)
      : shapes_(shapes), options_(options), import_(import) {}

  void Read() {
    if (!FindNames()) return;
    std::size_t number = 0;
    for (const Shape& shape : shapes_.GetData()) ReadShape(shape, ++number);
    if (renamed_ > 0)
      import_.warnings.push_back(fmt::format("{} line{} the name of another one: a number stands behind {}", renamed_,
                                             renamed_ == 1 ? " has" : "s have", renamed_ == 1 ? "it" : "it in each"));
    if (import_.branches.empty()) import_.error = "there are no lines of which branches could be made";
  }

 private:
  bool FindNames() {
    const std::string& wanted = options_.nameAttribute;
    const auto& columns = shapes_.Columns();
    const auto found = std::ranges::find_if(columns, [&](const ShapeField& field) {
      return EqualIgnoringCase(field.name, wanted.empty() ? "name" : wanted);
    });
    if (found != columns.end()) nameColumn_ = static_cast<std::size_t>(found - columns.begin());
    if (found == columns.end() && !wanted.empty()) {
      import_.error = fmt::format("there is no attribute {}", wanted);
      for (const ShapeField& field : columns)
        import_.error += fmt::format("{}{}", &field == &columns.front() ? ": the file has " : ", ", field.name);
    }
    return import_.error.empty();
  }

  void ReadShape(const Shape& shape, std::size_t number) {
    if (shape.points.empty()) {
      import_.warnings.push_back(fmt::format("shape {} has no points and is left out", number));
      return;
    }
    std::string name;
    if (nameColumn_ < shape.values.size()) name = Trimmed(TextOf(shape.values[nameColumn_]));
    if (name.empty()) name = fmt::format("Branch {}", number);
    const std::size_t parts = std::max<std::size_t>(1, shape.parts.size());
    if (parts > 1)
      import_.warnings.push_back(fmt::format("shape {} ({}) has {} parts: each is a branch", number, name, parts));
    for (std::size_t part = 0; part < parts; ++part)
      ReadPart(shape, part, number, parts > 1 ? fmt::format("{} ({})", name, part + 1) : name);
  }

  void ReadPart(const Shape& shape, std::size_t part, std::size_t number, const std::string& name) {
    RiverBranch branch;
    const std::size_t begin = shape.parts.empty() ? 0 : shape.parts[part];
    for (std::size_t i = begin; i < shape.PartEnd(part); ++i)
      if (branch.points.empty() || branch.points.back().place != shape.points[i])
        branch.points.push_back({.place = shape.points[i]});
    const auto isFinite = [](const RiverPoint& point) {
      return std::isfinite(point.place.x) && std::isfinite(point.place.y);
    };
    if (branch.points.size() < 2 || !std::ranges::all_of(branch.points, isFinite)) {
      import_.warnings.push_back(
          fmt::format("shape {} ({}) {} and is left out", number, name,
                      branch.points.size() < 2 ? "is a single place" : "has a coordinate that is no number"));
      return;
    }
    branch.name = FreeName(name);
    TurnDownhill(branch);
    double chainage = 0;
    for (std::size_t i = 0; i < branch.points.size(); ++i) {
      if (i > 0) chainage += Distance(branch.points[i - 1].place, branch.points[i].place);
      branch.points[i].chainage = chainage;
    }
    if (chainage < options_.sliver)
      import_.warnings.push_back(fmt::format("{} (shape {}) is only {:.1f} m long, at {}", branch.name, number,
                                             chainage, PlaceText(branch.points.front().place)));
    if (Distance(branch.points.front().place, branch.points.back().place) <= options_.tolerance)
      import_.warnings.push_back(fmt::format("{} (shape {}) ends where it begins, at {}", branch.name, number,
                                             PlaceText(branch.points.front().place)));
    import_.branches.push_back(std::move(branch));
  }

  std::string FreeName(const std::string& wanted) {
    if (names_.insert(wanted).second) return wanted;
    ++renamed_;
    int& number = latest_.try_emplace(wanted, 1).first->second;
    std::string name;
    do name = fmt::format("{} {}", wanted, ++number);
    while (!names_.insert(name).second);
    return name;
  }

  void TurnDownhill(RiverBranch& branch) {
    if (!options_.ground) return;
    const std::vector<double> heights = ValuesAlong(
        *options_.ground, {{0, branch.points.front().place}, {1, branch.points.back().place}}, GridSampling::Bilinear);
    if (!std::isfinite(heights[0]) || !std::isfinite(heights[1])) {
      import_.warnings.push_back(fmt::format("{} leaves the ground grid: it flows as it is drawn", branch.name));
    } else if (heights[0] == heights[1]) {
      import_.warnings.push_back(fmt::format("the ends of {} lie at one height: it flows as it is drawn", branch.name));
    } else if (heights[0] < heights[1]) {
      std::ranges::reverse(branch.points);
      ++import_.turned;
    }
  }

  const CYbShapeData& shapes_;
  const RiverImportOptions& options_;
  RiverImport& import_;
  std::size_t nameColumn_ = static_cast<std::size_t>(-1);
  std::unordered_set<std::string> names_;
  std::unordered_map<std::string, int> latest_;
  std::size_t renamed_ = 0;
};

// ---- Junctions

/// Joins ends of branches. End 2k is the upstream end of branch k, end 2k + 1 its downstream end.
class Joiner {
 public:
  Joiner(RiverImport& import, double tolerance)
      : import_(import),
        branches_(import.branches),
        tolerance_(std::max(tolerance, 0.0)),
        near_(std::max(tolerance_ * kNearlyMeets, 1e-6)),
        ends_(near_),
        segments_(SegmentSquare()) {
    for (std::size_t end = 0; end < 2 * branches_.size(); ++end) ends_.Add(PlaceOf(end), PlaceOf(end), end);
    for (std::size_t branch = 0; branch < branches_.size(); ++branch)
      for (std::size_t i = 1; i < branches_[branch].points.size(); ++i) {
        AddSegment(branches_[branch].points[i - 1].place, branches_[branch].points[i].place, pieces_.size());
        pieces_.push_back({branch, i});
      }
  }

  void Join() {
    std::vector<bool> isDone(2 * branches_.size(), false);
    for (std::size_t end = 0; end < isDone.size(); ++end) {
      if (isDone[end]) continue;
      JoinMeeting(EndsAround(end, isDone));
    }
  }

 private:
  struct Piece {
    std::size_t branch, point;  ///< From the point before it to this one.
  };
  struct Hit {
    double distance;
    std::size_t branch;
    double chainage;
  };

  MapPoint PlaceOf(std::size_t end) const {
    const RiverBranch& branch = branches_[end / 2];
    return end % 2 == 0 ? branch.points.front().place : branch.points.back().place;
  }
  double ChainageOf(std::size_t end) const {
    const RiverBranch& branch = branches_[end / 2];
    return end % 2 == 0 ? branch.points.front().chainage : branch.points.back().chainage;
  }
  static bool IsDownstream(std::size_t end) { return end % 2 == 1; }
  double LengthOf(std::size_t end) const { return branches_[end / 2].points.back().chainage; }

  /// About the length of a segment, so that each lies in few squares and a square holds few of them.
  double SegmentSquare() const {
    double length = 0;
    std::size_t count = 0;
    for (const RiverBranch& branch : branches_) {
      length += branch.points.back().chainage;
      count += branch.points.size() - 1;
    }
    return std::max(near_, count > 0 ? 2 * length / static_cast<double>(count) : near_);
  }

  /// Piece by piece, since the rectangle around a long segment holds many squares that it does not come to.
  void AddSegment(MapPoint from, MapPoint to, std::size_t number) {
    const double count = std::max(1.0, std::ceil(Distance(from, to) / segments_.Size()));
    const auto at = [&](double i) {
      return MapPoint{from.x + (to.x - from.x) * i / count, from.y + (to.y - from.y) * i / count};
    };
    for (double i = 0; i < count; ++i) {
      const MapPoint a = at(i), b = at(i + 1);
      segments_.Add({std::min(a.x, b.x), std::min(a.y, b.y)}, {std::max(a.x, b.x), std::max(a.y, b.y)}, number);
    }
  }

  /// The ends that meet at one place, from one to the next within the tolerance.
  std::vector<std::size_t> EndsAround(std::size_t first, std::vector<bool>& isDone) const {
    std::vector<std::size_t> meeting{first};
    isDone[first] = true;
    for (std::size_t next = 0; next < meeting.size(); ++next) {
      const MapPoint place = PlaceOf(meeting[next]);
      ends_.Near(place, tolerance_, [&](std::size_t end) {
        if (isDone[end] || Distance(place, PlaceOf(end)) > tolerance_) return;
        isDone[end] = true;
        meeting.push_back(end);
      });
    }
    return meeting;
  }

  void JoinMeeting(const std::vector<std::size_t>& meeting) {
    std::set<std::size_t> own;
    for (const std::size_t end : meeting) own.insert(end / 2);
    // Another line goes through the place: all come to it there.
    if (const std::optional<Hit> through = NearestLine(PlaceOf(meeting.front()), tolerance_, own)) {
      for (const std::size_t end : meeting) JoinTo(end, through->branch, through->chainage);
      return;
    }
    if (own.size() == 1) {
      TellNearMiss(meeting.front(), own);
      return;
    }
    // What comes goes on in the longest branch that begins here; where none does, in the longest that ends here.
    const std::size_t onward = Longest(meeting, false), inward = Longest(meeting, true);
    for (const std::size_t end : meeting) {
      const std::size_t other =
          IsDownstream(end) ? (onward != kNone ? onward : inward) : (inward != kNone ? inward : onward);
      if (other / 2 != end / 2) JoinTo(end, other / 2, ChainageOf(other));
    }
  }

  static constexpr std::size_t kNone = static_cast<std::size_t>(-2);
  std::size_t Longest(const std::vector<std::size_t>& ends, bool isDownstream) const {
    std::size_t longest = kNone;
    for (const std::size_t end : ends)
      if (IsDownstream(end) == isDownstream && (longest == kNone || LengthOf(end) > LengthOf(longest))) longest = end;
    return longest;
  }

  void JoinTo(std::size_t end, std::size_t branch, double chainage) {
    RiverBranch& joined = branches_[end / 2];
    (IsDownstream(end) ? joined.downstream : joined.upstream) = {branches_[branch].name, chainage};
    ++import_.junctions;
  }

  std::optional<Hit> NearestLine(MapPoint place, double within, const std::set<std::size_t>& butNot) const {
    std::optional<Hit> nearest;
    segments_.Near(place, within, [&](std::size_t number) {
      const Piece& piece = pieces_[number];
      if (butNot.contains(piece.branch)) return;
      const RiverPoint& from = branches_[piece.branch].points[piece.point - 1];
      const RiverPoint& to = branches_[piece.branch].points[piece.point];
      const double dx = to.place.x - from.place.x, dy = to.place.y - from.place.y;
      const double along =
          std::clamp(((place.x - from.place.x) * dx + (place.y - from.place.y) * dy) / (dx * dx + dy * dy), 0.0, 1.0);
      const double distance = Distance(place, {from.place.x + along * dx, from.place.y + along * dy});
      if (distance <= within && (!nearest || distance < nearest->distance))
        nearest = Hit{distance, piece.branch, from.chainage + along * (to.chainage - from.chainage)};
    });
    return nearest;
  }

  void TellNearMiss(std::size_t end, const std::set<std::size_t>& own) {
    const std::optional<Hit> missed = NearestLine(PlaceOf(end), near_, own);
    if (!missed || !told_.insert(std::minmax(end / 2, missed->branch)).second) return;
    import_.warnings.push_back(fmt::format("{} nearly meets {}: {:.2f} m are between them, at {}",
                                           branches_[end / 2].name, branches_[missed->branch].name, missed->distance,
                                           PlaceText(PlaceOf(end))));
  }

  RiverImport& import_;
  std::vector<RiverBranch>& branches_;
  const double tolerance_, near_;
  Squares ends_, segments_;
  std::vector<Piece> pieces_;
  std::set<std::pair<std::size_t, std::size_t>> told_;
};

}  // namespace

RiverImport BranchesOfLines(const CYbShapeData& shapes, const RiverImportOptions& options) {
  RiverImport import;
  if (shapes.Kind() != ShapeKind::Line) {
    import.error = fmt::format("lines were expected, the file holds {}",
                               shapes.Kind() == ShapeKind::Polygon ? "polygons" : "points");
    return import;
  }
  if (!shapes.Projection().empty() && CYbMapProjection(shapes.Projection()).IsGeographical()) {
    import.error = "the lines are in degrees, which have no lengths: project them first";
    return import;
  }
  LineReader(shapes, options, import).Read();
  if (import.error.empty()) Joiner(import, options.tolerance).Join();
  return import;
}

}  // namespace tervane
