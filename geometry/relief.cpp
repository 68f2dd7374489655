// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/relief.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <numbers>
#include <thread>

namespace tervane {

namespace {

constexpr float kFarthest = std::numeric_limits<float>::max();
constexpr double kDegree = std::numbers::pi / 180;

/// A place on the screen with what is interpolated between the corners of a triangle.
struct Corner {
  float x = 0, y = 0, depth = 0;
  float light = 1;
  float u = 0, v = 0;  ///< On the drape, in its pixels.
};

std::uint32_t Lit(std::uint32_t color, float light) {
  const auto part = [&](int shift) {
    const float value = static_cast<float>((color >> shift) & 0xffU) * light;
    return static_cast<std::uint32_t>(std::clamp(value, 0.0F, 255.0F)) << shift;
  };
  return 0xff000000U | part(16) | part(8) | part(0);
}

std::uint32_t Mixed(std::uint32_t under, std::uint32_t over, double opacity) {
  const auto part = [&](int shift) {
    const double a = (under >> shift) & 0xffU, b = (over >> shift) & 0xffU;
    return static_cast<std::uint32_t>(a + (b - a) * opacity + 0.5) << shift;
  };
  if ((under >> 24U) == 0) {
    const auto alpha = static_cast<std::uint32_t>(opacity * 255 + 0.5);
    return (alpha << 24U) | (over & 0xffffffU);
  }
  const double alpha = (under >> 24U) / 255.0;
  const auto sum = static_cast<std::uint32_t>((alpha + (1 - alpha) * opacity) * 255 + 0.5);
  return (sum << 24U) | part(16) | part(8) | part(0);
}

/// The columns or rows that are drawn: every so many of those between two fractions, and the last one.
std::vector<int> Chosen(int count, double from, double to, int every) {
  const int first = std::clamp(static_cast<int>(std::lround(from * (count - 1))), 0, count - 1);
  const int last = std::clamp(static_cast<int>(std::lround(to * (count - 1))), first, count - 1);
  std::vector<int> chosen;
  for (int i = first; i < last; i += every) chosen.push_back(i);
  chosen.push_back(last);
  return chosen;
}

/// The vertices of one surface on the screen.
struct Mesh {
  std::vector<Corner> corners;
  std::vector<std::uint8_t> isThere;
  std::vector<std::pair<float, float>> rows;  ///< From where to where on the screen, downwards, each row reaches.
};

/// A body as it is drawn: its surfaces on the chosen columns and rows.
struct DrawnBody {
  const ReliefBody* body = nullptr;
  std::uint16_t number = 0;
  Mesh top, bottom;
  std::vector<std::uint8_t> cells;  ///< Whether the body is in the cell to the upper right of a place.
};

/// Rows of the picture that one thread draws.
class Stripe {
 public:
  Stripe(ReliefPicture& picture, int from, int to)
      : picture_(picture),
        from_(from),
        to_(to),
        depth_(static_cast<std::size_t>(picture.width) * static_cast<std::size_t>(to - from), kFarthest) {}

  /// What follows belongs to a body; one that is not opaque is put over the others by `EndBody`.
  void BeginBody(const DrawnBody& body) {
    body_ = &body;
    isOpaque_ = body.body->opacity >= 1;
    if (isOpaque_) return;
    ownDepth_.assign(depth_.size(), kFarthest);
    ownColor_.assign(depth_.size(), 0);
    ownCell_.assign(depth_.size(), 0);
  }
  void EndBody() {
    if (isOpaque_) return;
    const std::size_t first = static_cast<std::size_t>(from_) * static_cast<std::size_t>(picture_.width);
    for (std::size_t i = 0; i < ownDepth_.size(); ++i) {
      if (ownDepth_[i] == kFarthest || ownDepth_[i] > depth_[i]) continue;
      picture_.pixels[first + i] = Mixed(picture_.pixels[first + i], ownColor_[i], body_->body->opacity);
      picture_.body[first + i] = body_->number;
      picture_.cell[first + i] = ownCell_[i];
    }
  }

  /// Whether anything between these heights of the screen is in the stripe.
  bool Reaches(float highest, float lowest) const {
    return lowest >= static_cast<float>(from_) && highest <= static_cast<float>(to_);
  }

  /// `drape` is null where the colour of the body is seen. Of a body only what faces the one who looks is seen:
  /// `facing` is the sign of the area of such a triangle on the screen, 0 for both sides.
  void Triangle(const Corner& a, const Corner& b, const Corner& c, std::uint32_t cell, const ReliefDrape* drape,
                float facing) {
    const float lowest = std::min({a.y, b.y, c.y}), highest = std::max({a.y, b.y, c.y});
    if (!(highest >= static_cast<float>(from_)) || !(lowest <= static_cast<float>(to_))) return;
    const float left = std::min({a.x, b.x, c.x}), right = std::max({a.x, b.x, c.x});
    if (!(right >= 0) || !(left <= static_cast<float>(picture_.width))) return;
    const float area = (b.x - a.x) * (c.y - a.y) - (c.x - a.x) * (b.y - a.y);
    if (area == 0 || area * facing < 0) return;
    // The centre of a pixel decides.
    const int x0 = std::max(0, static_cast<int>(std::ceil(left - 0.5F)));
    const int x1 = std::min(picture_.width - 1, static_cast<int>(std::floor(right - 0.5F)));
    const int y0 = std::max(from_, static_cast<int>(std::ceil(lowest - 0.5F)));
    const int y1 = std::min(to_ - 1, static_cast<int>(std::floor(highest - 0.5F)));
    if (x0 > x1 || y0 > y1) return;
    const float inverse = 1 / area;
    // Weights of b and c, and how they change from pixel to pixel.
    const float bx = (c.y - a.y) * inverse, by = -(c.x - a.x) * inverse;
    const float cx = -(b.y - a.y) * inverse, cy = (b.x - a.x) * inverse;
    // Neighbours share an edge: what lies on it belongs to one of them at least.
    constexpr float kEdge = -1e-4F;
    for (int y = y0; y <= y1; ++y) {
      const float py = static_cast<float>(y) + 0.5F - a.y, px = static_cast<float>(x0) + 0.5F - a.x;
      float wb = px * bx + py * by, wc = px * cx + py * cy;
      std::size_t at =
          static_cast<std::size_t>(y - from_) * static_cast<std::size_t>(picture_.width) + static_cast<std::size_t>(x0);
      for (int x = x0; x <= x1; ++x, wb += bx, wc += cx, ++at) {
        const float wa = 1 - wb - wc;
        if (wa < kEdge || wb < kEdge || wc < kEdge) continue;
        const float depth = wa * a.depth + wb * b.depth + wc * c.depth;
        float& nearest = isOpaque_ ? depth_[at] : ownDepth_[at];
        if (!(depth < nearest) || (!isOpaque_ && !(depth < depth_[at]))) continue;
        const float light = wa * a.light + wb * b.light + wc * c.light;
        std::uint32_t color = body_->body->color;
        if (drape) color = DrapeColor(*drape, wa * a.u + wb * b.u + wc * c.u, wa * a.v + wb * b.v + wc * c.v, color);
        nearest = depth;
        Put(at, Lit(color, light), cell);
      }
    }
  }

  /// A vertical line of some pixels; where it is hidden it shines through.
  void Line(float x, float yTop, float yBottom, float depthTop, float depthBottom, int width, std::uint32_t color) {
    constexpr double kHidden = 0.45;
    const int middle = static_cast<int>(std::floor(x));
    const float length = std::max(yBottom - yTop, 1e-6F);
    for (int y = std::max(from_, static_cast<int>(yTop)); y <= std::min(to_ - 1, static_cast<int>(yBottom)); ++y) {
      const float part = std::clamp((static_cast<float>(y) - yTop) / length, 0.0F, 1.0F);
      const float depth = depthTop + (depthBottom - depthTop) * part;
      for (int column = middle - width / 2; column <= middle + width / 2; ++column) {
        if (column < 0 || column >= picture_.width) continue;
        const std::size_t at = static_cast<std::size_t>(y - from_) * static_cast<std::size_t>(picture_.width) +
                               static_cast<std::size_t>(column);
        auto& pixel = picture_.pixels[First() + at];
        pixel = Mixed(pixel, color, depth <= depth_[at] ? 1 : kHidden);
      }
    }
  }

 private:
  std::size_t First() const { return static_cast<std::size_t>(from_) * static_cast<std::size_t>(picture_.width); }

  static std::uint32_t DrapeColor(const ReliefDrape& drape, float u, float v, std::uint32_t under) {
    const int column = std::clamp(static_cast<int>(u), 0, drape.width - 1);
    const int row = std::clamp(static_cast<int>(v), 0, drape.height - 1);
    const std::uint32_t color = drape.pixels[static_cast<std::size_t>(row) * static_cast<std::size_t>(drape.width) +
                                             static_cast<std::size_t>(column)];
    const std::uint32_t alpha = color >> 24U;
    return alpha == 0xff ? color : Mixed(under | 0xff000000U, color, alpha / 255.0);
  }

  void Put(std::size_t at, std::uint32_t color, std::uint32_t cell) {
    if (!isOpaque_) {
      ownColor_[at] = color;
      ownCell_[at] = cell;
      return;
    }
    picture_.pixels[First() + at] = color;
    picture_.body[First() + at] = body_->number;
    picture_.cell[First() + at] = cell;
  }

  ReliefPicture& picture_;
  int from_, to_;
  std::vector<float> depth_;  ///< Of what is opaque.
  std::vector<float> ownDepth_;
  std::vector<std::uint32_t> ownColor_, ownCell_;
  const DrawnBody* body_ = nullptr;
  bool isOpaque_ = true;
};

class Drawer {
 public:
  Drawer(const Relief& relief, const ReliefCamera& camera, const ReliefDrawing& drawing)
      : relief_(relief),
        camera_(camera),
        drawing_(drawing),
        transform_(relief.raster),
        columns_(Chosen(relief.raster.nx, drawing.part.west, drawing.part.east, std::max(1, drawing.every))),
        rows_(Chosen(relief.raster.ny, drawing.part.south, drawing.part.north, std::max(1, drawing.every))) {}

  ReliefPicture Draw() {
    ReliefPicture picture;
    const auto pixels = static_cast<std::size_t>(camera_.width) * static_cast<std::size_t>(camera_.rows);
    picture.width = camera_.width;
    picture.height = camera_.rows;
    picture.pixels.assign(pixels, 0);
    picture.body.assign(pixels, ReliefPicture::kNothing);
    picture.cell.assign(pixels, 0);
    MakeBodies();
    if (pixels > 0 && !IsGivenUp()) InStripes(picture);
    return IsGivenUp() ? ReliefPicture{} : picture;
  }

 private:
  bool IsGivenUp() const { return drawing_.isGivenUp && drawing_.isGivenUp->load(std::memory_order_relaxed); }
  std::size_t At(std::size_t column, std::size_t row) const { return row * columns_.size() + column; }
  std::size_t CellOf(std::size_t column, std::size_t row) const {
    return static_cast<std::size_t>(rows_[row]) * static_cast<std::size_t>(relief_.raster.nx) +
           static_cast<std::size_t>(columns_[column]);
  }

  /// Tasks that do not touch each other, shared by the processors.
  template <class Task>
  static void Share(std::size_t count, const Task& task) {
    std::atomic<std::size_t> next{0};
    const auto work = [&] {
      for (std::size_t i = next++; i < count; i = next++) task(i);
    };
    const std::size_t others = std::min<std::size_t>(count, std::max(1U, std::thread::hardware_concurrency())) - 1;
    std::vector<std::thread> threads;
    for (std::size_t i = 0; i < others; ++i) threads.emplace_back(work);
    work();
    for (std::thread& thread : threads) thread.join();
  }

  void MakeBodies() {
    for (std::size_t i = 0; i < relief_.bodies.size(); ++i)
      if (relief_.bodies[i].isShown) bodies_.push_back({&relief_.bodies[i], static_cast<std::uint16_t>(i), {}, {}, {}});
    if (bodies_.empty()) return;
    Share(bodies_.size(), [&](std::size_t i) {
      DrawnBody& drawn = bodies_[i];
      drawn.top = MeshOf(drawn.body->top, *drawn.body);
      if (!drawn.body->IsSurface()) drawn.bottom = MeshOf(drawn.body->bottom, *drawn.body);
      drawn.cells.assign(columns_.size() * rows_.size(), 0);
      for (std::size_t row = 0; row + 1 < rows_.size(); ++row)
        for (std::size_t column = 0; column + 1 < columns_.size(); ++column)
          drawn.cells[At(column, row)] = IsIn(drawn, column, row) ? 1 : 0;
    });
  }

  Mesh MeshOf(const std::vector<float>& heights, const ReliefBody& body) const {
    Mesh mesh;
    mesh.corners.resize(columns_.size() * rows_.size());
    mesh.isThere.resize(mesh.corners.size());
    // The projection is linear: what a step along the axes of the raster and upwards adds is the same everywhere.
    const auto own = [&](double i, double j) { return camera_.See(transform_.ToWorld({i, j}), 0); };
    const ReliefCamera::Seen origin = own(0.5, 0.5), alongX = own(1.5, 0.5), alongY = own(0.5, 1.5);
    const ReliefCamera::Seen up = camera_.See(transform_.ToWorld({0.5, 0.5}), 1);
    const auto at = [&](double ReliefCamera::Seen::*part, double i, double j, double z) {
      return static_cast<float>(origin.*part + (alongX.*part - origin.*part) * i + (alongY.*part - origin.*part) * j +
                                (up.*part - origin.*part) * z);
    };
    const int nx = relief_.raster.nx, ny = relief_.raster.ny;
    const double drapeX = body.drape ? static_cast<double>(body.drape->width) / nx : 0;
    const double drapeY = body.drape ? static_cast<double>(body.drape->height) / ny : 0;
    mesh.rows.assign(rows_.size(), {kFarthest, -kFarthest});
    for (std::size_t row = 0; row < rows_.size(); ++row)
      for (std::size_t column = 0; column < columns_.size(); ++column) {
        const std::size_t place = At(column, row);
        const float height = heights[CellOf(column, row)];
        if (std::isnan(height)) continue;
        const double i = columns_[column], j = rows_[row];
        Corner& corner = mesh.corners[place];
        mesh.isThere[place] = 1;
        corner.x = at(&ReliefCamera::Seen::x, i, j, double{height});
        corner.y = at(&ReliefCamera::Seen::y, i, j, double{height});
        corner.depth = at(&ReliefCamera::Seen::depth, i, j, double{height});
        mesh.rows[row] = {std::min(mesh.rows[row].first, corner.y), std::max(mesh.rows[row].second, corner.y)};
        corner.light = LightAt(heights, column, row);
        corner.u = static_cast<float>((i + 0.5) * drapeX);
        corner.v = static_cast<float>((ny - j - 0.5) * drapeY);
      }
    return mesh;
  }

  /// How bright a slope is, lit from the upper left of the one who looks.
  float LightAt(const std::vector<float>& heights, std::size_t column, std::size_t row) const {
    const std::size_t left = column > 0 ? column - 1 : column, right = std::min(column + 1, columns_.size() - 1);
    const std::size_t below = row > 0 ? row - 1 : row, above = std::min(row + 1, rows_.size() - 1);
    const auto slope = [&](std::size_t c0, std::size_t r0, std::size_t c1, std::size_t r1, int cells) -> float {
      if (cells == 0) return 0.0F;
      const float from = heights[CellOf(c0, r0)], to = heights[CellOf(c1, r1)];
      if (std::isnan(from) || std::isnan(to)) return 0.0F;
      return (to - from) * static_cast<float>(camera_.exaggeration / (relief_.raster.cellSize * cells));
    };
    const float dx = slope(left, row, right, row, columns_[right] - columns_[left]);
    const float dy = slope(column, below, column, above, rows_[above] - rows_[below]);
    const double turned = (relief_.raster.rotation + camera_.heading) * kDegree;
    // Slopes to the right and away from the one who looks.
    const auto rightwards = static_cast<float>(dx * std::cos(turned) - dy * std::sin(turned));
    const auto away = static_cast<float>(dx * std::sin(turned) + dy * std::cos(turned));
    constexpr float kLightX = -0.45F, kLightY = 0.45F, kLightZ = 0.77F, kLeast = 0.42F, kMost = 1.12F;
    const float cosine =
        (-rightwards * kLightX - away * kLightY + kLightZ) / std::sqrt(rightwards * rightwards + away * away + 1);
    return kLeast + (kMost - kLeast) * std::clamp(cosine, 0.0F, 1.0F);
  }

  void InStripes(ReliefPicture& picture) const {
    // More stripes than processors, since not all have as much to draw.
    constexpr int kStripes = 8;
    const int rows = (picture.height + kStripes - 1) / kStripes;
    Share(kStripes, [&](std::size_t i) {
      const int from = static_cast<int>(i) * rows, to = std::min(picture.height, from + rows);
      if (from >= to) return;
      Stripe stripe(picture, from, to);
      for (const DrawnBody& body : bodies_)
        if (body.body->opacity >= 1) DrawBody(stripe, body);
      // From above the lowest is the farthest.
      const auto drawClear = [&](const DrawnBody& body) {
        if (body.body->opacity < 1) DrawBody(stripe, body);
      };
      if (camera_.pitch >= 0)
        for (auto body = bodies_.rbegin(); body != bodies_.rend(); ++body) drawClear(*body);
      else
        for (const DrawnBody& body : bodies_) drawClear(body);
      DrawWells(stripe);
    });
  }

  void DrawWells(Stripe& stripe) const {
    constexpr std::uint32_t kWellColor = 0xff1f4fd8;
    constexpr int kWidth = 3;
    for (const ReliefWell& well : relief_.wells) {
      const MapPoint cells = transform_.ToCells(well.place);
      const auto isWithin = [](double at, const std::vector<int>& chosen) {
        return at >= chosen.front() && at <= chosen.back() + 1;
      };
      if (!isWithin(cells.x, columns_) || !isWithin(cells.y, rows_)) continue;
      const auto top = camera_.See(well.place, well.top), bottom = camera_.See(well.place, well.bottom);
      const auto [upper, lower] = std::minmax({top.y, bottom.y});
      const bool isTurned = bottom.y < top.y;
      stripe.Line(static_cast<float>(top.x), static_cast<float>(upper), static_cast<float>(lower),
                  static_cast<float>(isTurned ? bottom.depth : top.depth),
                  static_cast<float>(isTurned ? top.depth : bottom.depth), kWidth, kWellColor);
    }
  }

  /// The body is in the cell between four places: it has a top and a bottom at each, and is not thin at all of them.
  bool IsIn(const DrawnBody& body, std::size_t column, std::size_t row) const {
    bool isThick = body.body->IsSurface();
    for (const std::size_t place :
         {At(column, row), At(column + 1, row), At(column, row + 1), At(column + 1, row + 1)}) {
      if (!body.top.isThere[place]) return false;
      if (body.body->IsSurface()) continue;
      if (!body.bottom.isThere[place]) return false;
      const std::size_t cell = CellOf(place % columns_.size(), place / columns_.size());
      isThick = isThick || body.body->top[cell] > body.body->bottom[cell];
    }
    return isThick;
  }

  void DrawBody(Stripe& stripe, const DrawnBody& body) const {
    stripe.BeginBody(body);
    const ReliefDrape* drape = body.body->drape && body.body->drape->width > 0 ? body.body->drape.get() : nullptr;
    const std::size_t columns = columns_.size(), rows = rows_.size();
    const bool isSurface = body.body->IsSurface();
    for (std::size_t row = 0; row < rows && !IsGivenUp(); ++row) {
      if (!IsInStripe(stripe, body, row)) continue;
      for (std::size_t column = 0; column < columns; ++column) {
        const bool isIn = body.cells[At(column, row)];
        if (isIn) {
          const auto cell = static_cast<std::uint32_t>(CellOf(column, row));
          // On the screen, which counts downwards, what is seen from above goes round the other way.
          Cell(stripe, body.top, column, row, cell, drape, isSurface ? 0.0F : -1.0F);
          if (!isSurface) Cell(stripe, body.bottom, column, row, cell, nullptr, 1);
        }
        if (isSurface) continue;
        // Where the body ends there is a wall.
        if (isIn != (column > 0 && body.cells[At(column - 1, row)]))
          Wall(stripe, body, {column, row}, {column, row + 1});
        if (isIn != (row > 0 && body.cells[At(column, row - 1)])) Wall(stripe, body, {column, row}, {column + 1, row});
      }
    }
    stripe.EndBody();
  }

  /// Whether something of a row of cells is in the stripe.
  static bool IsInStripe(const Stripe& stripe, const DrawnBody& body, std::size_t row) {
    float highest = kFarthest, lowest = -kFarthest;
    for (const Mesh* mesh : {&body.top, &body.bottom})
      for (std::size_t i = row; i < std::min(row + 2, mesh->rows.size()); ++i) {
        highest = std::min(highest, mesh->rows[i].first);
        lowest = std::max(lowest, mesh->rows[i].second);
      }
    return stripe.Reaches(highest, lowest);
  }

  static void Quad(Stripe& stripe, const std::array<Corner, 4>& corners, std::uint32_t cell, const ReliefDrape* drape,
                   float facing) {
    stripe.Triangle(corners[0], corners[1], corners[2], cell, drape, facing);
    stripe.Triangle(corners[0], corners[2], corners[3], cell, drape, facing);
  }
  void Cell(Stripe& stripe, const Mesh& mesh, std::size_t column, std::size_t row, std::uint32_t cell,
            const ReliefDrape* drape, float facing) const {
    Quad(stripe,
         {mesh.corners[At(column, row)], mesh.corners[At(column + 1, row)], mesh.corners[At(column + 1, row + 1)],
          mesh.corners[At(column, row + 1)]},
         cell, drape, facing);
  }

  using Place = std::pair<std::size_t, std::size_t>;
  void Wall(Stripe& stripe, const DrawnBody& body, Place from, Place to) const {
    const std::size_t a = At(from.first, from.second), b = At(to.first, to.second);
    std::array corners{body.top.corners[a], body.top.corners[b], body.bottom.corners[b], body.bottom.corners[a]};
    // Walls of the two directions are told apart by their light, as the sides of a box.
    const float light = from.first == to.first ? 0.72F : 0.86F;
    for (Corner& corner : corners) corner.light = light;
    Quad(stripe, corners, static_cast<std::uint32_t>(CellOf(from.first, from.second)), nullptr, 0);
  }

  const Relief& relief_;
  const ReliefCamera& camera_;
  const ReliefDrawing& drawing_;
  GridTransform transform_;
  std::vector<int> columns_, rows_;
  std::vector<DrawnBody> bodies_;
};

}  // namespace

std::shared_ptr<const ReliefDrape> DrapeOver(const GridGeometry& raster, const ReliefDrape& picture,
                                             const Envelope& area) {
  auto drape = std::make_shared<ReliefDrape>();
  const int longest = std::max({1, raster.nx, raster.ny});
  const double perCell = std::max(1.0, static_cast<double>(std::max(picture.width, picture.height)) / longest);
  drape->width = std::max(1, static_cast<int>(raster.nx * perCell));
  drape->height = std::max(1, static_cast<int>(raster.ny * perCell));
  drape->pixels.assign(static_cast<std::size_t>(drape->width) * static_cast<std::size_t>(drape->height), 0);
  const GridTransform transform(raster);
  for (int row = 0; row < drape->height; ++row)
    for (int column = 0; column < drape->width; ++column) {
      const MapPoint world = transform.ToWorld(
          {(column + 0.5) * raster.nx / drape->width, raster.ny - (row + 0.5) * raster.ny / drape->height});
      const double x = (world.x - area.xMin) / (area.xMax - area.xMin) * picture.width;
      const double y = (area.yMax - world.y) / (area.yMax - area.yMin) * picture.height;
      if (!(x >= 0 && y >= 0 && x < picture.width && y < picture.height)) continue;
      drape->pixels[static_cast<std::size_t>(row) * static_cast<std::size_t>(drape->width) +
                    static_cast<std::size_t>(column)] =
          picture.pixels[static_cast<std::size_t>(y) * static_cast<std::size_t>(picture.width) +
                         static_cast<std::size_t>(x)];
    }
  return drape;
}

std::optional<std::pair<double, double>> Relief::Heights() const {
  std::optional<std::pair<double, double>> range;
  const auto add = [&range](double height) {
    if (std::isnan(height)) return;
    if (!range) range = {height, height};
    range = {std::min(range->first, height), std::max(range->second, height)};
  };
  for (const ReliefBody& body : bodies)
    for (const auto* heights : {&body.top, &body.bottom})
      for (const float height : *heights) add(double{height});
  for (const ReliefWell& well : wells) add(well.top), add(well.bottom);
  return range;
}

ReliefCamera::Seen ReliefCamera::See(MapPoint place, double elevation) const {
  const double dx = place.x - centre.x, dy = place.y - centre.y, dz = (elevation - height) * exaggeration;
  const double c = std::cos(heading * kDegree), s = std::sin(heading * kDegree);
  const double right = dx * c - dy * s, away = dx * s + dy * c;
  const double sinPitch = std::sin(pitch * kDegree), cosPitch = std::cos(pitch * kDegree);
  const double up = away * sinPitch + dz * cosPitch;
  return {width / 2.0 + right / metresPerPixel, rows / 2.0 - up / metresPerPixel, away * cosPitch - dz * sinPitch};
}

void ReliefCamera::Fit(const Relief& relief) {
  const GridTransform transform(relief.raster);
  const auto heights = relief.Heights().value_or(std::pair{0.0, 0.0});
  centre = transform.ToWorld({relief.raster.nx / 2.0, relief.raster.ny / 2.0});
  height = (heights.first + heights.second) / 2;
  metresPerPixel = 1;
  double widest = 0, highest = 0;
  for (const double i : {0.0, static_cast<double>(relief.raster.nx)})
    for (const double j : {0.0, static_cast<double>(relief.raster.ny)})
      for (const double z : {heights.first, heights.second}) {
        const Seen seen = See(transform.ToWorld({i, j}), z);
        widest = std::max(widest, std::abs(seen.x - width / 2.0));
        highest = std::max(highest, std::abs(seen.y - rows / 2.0));
      }
  // At the sides there is room for the numbers of heights.
  constexpr double kBeside = 1.25, kAbove = 1.12;
  const double metres = std::max(widest * kBeside / std::max(1, width), highest * kAbove / std::max(1, rows)) * 2;
  metresPerPixel = metres > 0 ? metres : 1;
}

void ReliefCamera::Pan(double right, double down) {
  const double c = std::cos(heading * kDegree), s = std::sin(heading * kDegree);
  // Along the ground; seen from the side, upwards.
  const double sinPitch = std::sin(pitch * kDegree), cosPitch = std::cos(pitch * kDegree);
  const double metres = metresPerPixel;
  double away = 0;
  if (std::abs(sinPitch) > 0.2)
    away = down * metres / sinPitch;
  else
    height += down * metres / (cosPitch * exaggeration);
  centre.x += -right * metres * c + away * s;
  centre.y += right * metres * s + away * c;
}

ReliefPicture DrawRelief(const Relief& relief, const ReliefCamera& camera, const ReliefDrawing& drawing) {
  if (relief.raster.nx < 1 || relief.raster.ny < 1 || camera.width < 1 || camera.rows < 1) return {};
  return Drawer(relief, camera, drawing).Draw();
}

int EveryFor(const Relief& relief, std::size_t mostCells) {
  std::size_t shown = 0;
  for (const ReliefBody& body : relief.bodies) shown += body.isShown ? (body.IsSurface() ? 1U : 2U) : 0U;
  const double cells = static_cast<double>(shown) * relief.raster.nx * relief.raster.ny;
  return std::max(
      1, static_cast<int>(std::ceil(std::sqrt(cells / static_cast<double>(std::max<std::size_t>(1, mostCells))))));
}

}  // namespace tervane
