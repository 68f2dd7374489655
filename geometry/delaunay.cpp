// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/delaunay.h"

#include <algorithm>
#include <cmath>
#include <cstddef>
#include <utility>

namespace tervane {
namespace {

__extension__ using Int128 = __int128;

/// Above 0 when a, b, c turn counter-clockwise, 0 when they lie on one line. Differences have 31 bits: no overflow.
std::int64_t Turn(LatticePoint a, LatticePoint b, LatticePoint c) {
  return (b.x - a.x) * (c.y - a.y) - (b.y - a.y) * (c.x - a.x);
}

/// True when d lies inside the circle through a, b, c, which turn counter-clockwise.
bool IsInCircle(LatticePoint a, LatticePoint b, LatticePoint c, LatticePoint d) {
  const std::int64_t ax = a.x - d.x, ay = a.y - d.y, bx = b.x - d.x, by = b.y - d.y, cx = c.x - d.x, cy = c.y - d.y;
  const std::int64_t bc = bx * cy - by * cx, ca = cx * ay - cy * ax, ab = ax * by - ay * bx;
  const std::int64_t aa = ax * ax + ay * ay, bb = bx * bx + by * by, cc = cx * cx + cy * cy;
  const auto real = [](std::int64_t number) { return static_cast<double>(number); };
  const double ta = real(aa) * real(bc), tb = real(bb) * real(ca), tc = real(cc) * real(ab);
  const double sum = ta + tb + tc;
  // Each term carries three roundings, the sum two: floating point decides unless it is as near to zero as that.
  constexpr double kError = 1e-15;
  if (std::abs(sum) > kError * (std::abs(ta) + std::abs(tb) + std::abs(tc))) return sum > 0;
  return Int128{aa} * bc + Int128{bb} * ca + Int128{cc} * ab > 0;
}

using Edge = std::uint32_t;

/// Edges with direction, in rings around their origins. The other direction of an edge has the number next to it.
class EdgeStore {
 public:
  explicit EdgeStore(std::size_t points) {
    // A triangulation has fewer than three edges for each point.
    edges_.reserve(6 * points);
  }

  static Edge Sym(Edge e) { return e ^ 1u; }
  std::uint32_t Origin(Edge e) const { return edges_[e].origin; }
  std::uint32_t End(Edge e) const { return edges_[Sym(e)].origin; }
  Edge OriginNext(Edge e) const { return edges_[e].next; }
  Edge OriginPrevious(Edge e) const { return edges_[e].previous; }
  Edge LeftNext(Edge e) const { return edges_[Sym(e)].previous; }
  Edge RightPrevious(Edge e) const { return edges_[Sym(e)].next; }

  Edge Make(std::uint32_t origin, std::uint32_t end) {
    Edge e = free_;
    if (e != kNone) {
      free_ = edges_[e].next;
    } else {
      e = static_cast<Edge>(edges_.size());
      edges_.resize(edges_.size() + 2);
    }
    edges_[e] = {origin, e, e};
    edges_[Sym(e)] = {end, Sym(e), Sym(e)};
    return e;
  }
  /// Joins the rings of two edges, or parts them when they are one.
  void Splice(Edge a, Edge b) {
    const Edge afterA = edges_[a].next, afterB = edges_[b].next;
    edges_[a].next = afterB;
    edges_[b].next = afterA;
    edges_[afterA].previous = b;
    edges_[afterB].previous = a;
  }
  /// A new edge from the end of a to the origin of b, so that all three have the same face on their left.
  Edge Connect(Edge a, Edge b) {
    const Edge e = Make(End(a), Origin(b));
    Splice(e, LeftNext(a));
    Splice(Sym(e), b);
    return e;
  }
  void Remove(Edge e) {
    Splice(e, OriginPrevious(e));
    Splice(Sym(e), OriginPrevious(Sym(e)));
    e &= ~1u;
    edges_[e] = {kNone, free_, 0};
    edges_[Sym(e)].origin = kNone;
    free_ = e;
  }

  Edge Count() const { return static_cast<Edge>(edges_.size()); }
  bool IsRemoved(Edge e) const { return edges_[e].origin == kNone; }

 private:
  static constexpr std::uint32_t kNone = 0xFFFFFFFFu;
  struct Entry {
    std::uint32_t origin = kNone;
    Edge next = 0, previous = 0;
  };
  std::vector<Entry> edges_;
  Edge free_ = kNone;
};

class Triangulation {
 public:
  Triangulation(const std::vector<LatticePoint>& points, ProgressPart progress)
      : points_(points), edges_(points.size()), progress_(progress) {}

  std::vector<Triangle> Run() {
    if (points_.size() < 3) return {};
    Divide(0, static_cast<std::uint32_t>(points_.size()));
    std::vector<Triangle> triangles;
    triangles.reserve(2 * points_.size());
    for (Edge e = 0; e < edges_.Count(); ++e) {
      if ((e & 0xFFFFu) == 0) progress_.ThrowIfCancelled();
      if (edges_.IsRemoved(e)) continue;
      const Edge second = edges_.LeftNext(e), third = edges_.LeftNext(second);
      // Each face once, and not the outer one, which lies on the right of its edges' turn.
      if (e > second || e > third || edges_.LeftNext(third) != e) continue;
      const Triangle triangle = {edges_.Origin(e), edges_.Origin(second), edges_.Origin(third)};
      if (Turn(points_[triangle[0]], points_[triangle[1]], points_[triangle[2]]) > 0) triangles.push_back(triangle);
    }
    return triangles;
  }

 private:
  /// The edges of a hull that leave its leftmost point counter-clockwise and its rightmost point clockwise.
  using Hull = std::pair<Edge, Edge>;

  bool IsLeft(std::uint32_t point, Edge e) const {
    return Turn(points_[point], points_[edges_.Origin(e)], points_[edges_.End(e)]) > 0;
  }
  bool IsRight(std::uint32_t point, Edge e) const {
    return Turn(points_[point], points_[edges_.End(e)], points_[edges_.Origin(e)]) > 0;
  }
  bool IsIn(std::uint32_t a, std::uint32_t b, std::uint32_t c, std::uint32_t d) const {
    return IsInCircle(points_[a], points_[b], points_[c], points_[d]);
  }

  Hull Divide(std::uint32_t begin, std::uint32_t end) {
    constexpr std::uint32_t kAskEvery = 1024;
    if (end - begin > kAskEvery) {
      progress_.ThrowIfCancelled();
      progress_.Report(static_cast<double>(begin) / static_cast<double>(points_.size()));
    }
    if (end - begin == 2) {
      const Edge e = edges_.Make(begin, begin + 1);
      return {e, EdgeStore::Sym(e)};
    }
    if (end - begin == 3) return MakeThree(begin);
    const std::uint32_t middle = begin + (end - begin) / 2;
    const Hull left = Divide(begin, middle);
    return Merge(left, Divide(middle, end));
  }

  Hull MakeThree(std::uint32_t first) {
    const Edge a = edges_.Make(first, first + 1), b = edges_.Make(first + 1, first + 2);
    edges_.Splice(EdgeStore::Sym(a), b);
    const std::int64_t turn = Turn(points_[first], points_[first + 1], points_[first + 2]);
    if (turn == 0) return {a, EdgeStore::Sym(b)};
    const Edge c = edges_.Connect(b, a);
    return turn > 0 ? Hull{a, EdgeStore::Sym(b)} : Hull{EdgeStore::Sym(c), c};
  }

  Hull Merge(Hull left, Hull right) {
    Edge leftInner = left.second, rightInner = right.first;
    // The lower common tangent.
    for (;;) {
      if (IsLeft(edges_.Origin(rightInner), leftInner))
        leftInner = edges_.LeftNext(leftInner);
      else if (IsRight(edges_.Origin(leftInner), rightInner))
        rightInner = edges_.RightPrevious(rightInner);
      else
        break;
    }
    Edge base = edges_.Connect(EdgeStore::Sym(rightInner), leftInner);
    if (edges_.Origin(leftInner) == edges_.Origin(left.first)) left.first = EdgeStore::Sym(base);
    if (edges_.Origin(rightInner) == edges_.Origin(right.second)) right.second = base;
    // Up from there, each step one triangle, edges that its circle does not allow being taken away.
    for (;;) {
      const std::uint32_t from = edges_.Origin(base), to = edges_.End(base);
      Edge leftEdge = edges_.OriginNext(EdgeStore::Sym(base));
      const bool isLeft = IsRight(edges_.End(leftEdge), base);
      if (isLeft) {
        for (Edge next = edges_.OriginNext(leftEdge); IsIn(to, from, edges_.End(leftEdge), edges_.End(next));
             next = edges_.OriginNext(leftEdge)) {
          edges_.Remove(leftEdge);
          leftEdge = next;
        }
      }
      Edge rightEdge = edges_.OriginPrevious(base);
      const bool isRight = IsRight(edges_.End(rightEdge), base);
      if (isRight) {
        for (Edge next = edges_.OriginPrevious(rightEdge); IsIn(to, from, edges_.End(rightEdge), edges_.End(next));
             next = edges_.OriginPrevious(rightEdge)) {
          edges_.Remove(rightEdge);
          rightEdge = next;
        }
      }
      if (!isLeft && !isRight) break;
      const bool isRightTaken = !isLeft || (isRight && IsIn(edges_.End(leftEdge), edges_.Origin(leftEdge),
                                                            edges_.Origin(rightEdge), edges_.End(rightEdge)));
      base = isRightTaken ? edges_.Connect(rightEdge, EdgeStore::Sym(base))
                          : edges_.Connect(EdgeStore::Sym(base), EdgeStore::Sym(leftEdge));
    }
    return {left.first, right.second};
  }

  const std::vector<LatticePoint>& points_;
  EdgeStore edges_;
  ProgressPart progress_;
};

}  // namespace

std::vector<Triangle> Triangulate(const std::vector<LatticePoint>& points, ProgressPart progress) {
  return Triangulation(points, progress).Run();
}

}  // namespace tervane
