// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_arrows.h"

#include <QPainterPath>
#include <algorithm>
#include <cmath>

#include "shell/maps/map_palette.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/shown_unit.h"

namespace tervane {

namespace {

constexpr double kApart = 26;    ///< Of two arrows, in pixels at zoom 1.
constexpr double kShortest = 2;  ///< What is shorter would tell no direction.

/// How many rows and columns go to one arrow.
int CellsPerArrow(const GridGeometry& geometry, const DrawnMap& map) {
  const double pixels = geometry.cellSize / map.window.metresPerPixel;
  return std::max(1, static_cast<int>(std::ceil(kApart * map.zoom / std::max(pixels, 1e-6))));
}

/// In pixels, of the strongest flow.
double LongestArrow(const GridGeometry& geometry, const DrawnMap& map) {
  const double pixels = geometry.cellSize / map.window.metresPerPixel;
  return std::min(pixels * CellsPerArrow(geometry, map), 3 * kApart * map.zoom);
}

}  // namespace

std::vector<DrawnArrow> ArrowsOn(const ArrowLayer& layer, const DrawnMap& map) {
  std::vector<DrawnArrow> arrows;
  const CTvn2DOrthoRotatedGridData &x = *layer.x, &y = *layer.y;
  const GridGeometry& geometry = x.Geometry();
  if (!(layer.strongest > 0) || !(y.Geometry() == geometry)) return arrows;
  const int every = CellsPerArrow(geometry, map);
  const double longest = LongestArrow(geometry, map);
  const GridTransform transform(geometry);
  // Only what is seen: the corners of the part in cells.
  const Envelope area = AreaOf(map.window, map.part);
  double west = geometry.nx, east = 0, south = geometry.ny, north = 0;
  for (const MapPoint corner : {MapPoint{area.xMin, area.yMin}, MapPoint{area.xMax, area.yMin},
                                MapPoint{area.xMin, area.yMax}, MapPoint{area.xMax, area.yMax}}) {
    const MapPoint cells = transform.ToCells(corner);
    west = std::min(west, cells.x);
    east = std::max(east, cells.x);
    south = std::min(south, cells.y);
    north = std::max(north, cells.y);
  }
  const auto first = [every](double limit) {
    return static_cast<int>(std::max(limit, 0.0)) / every * every + every / 2;
  };
  const double turn = geometry.rotation * std::acos(-1.0) / 180, cosine = std::cos(turn), sine = std::sin(turn);
  for (int j = first(south); j < std::min(north + 1, static_cast<double>(geometry.ny)); j += every)
    for (int i = first(west); i < std::min(east + 1, static_cast<double>(geometry.nx)); i += every) {
      const float flowX = x.Value(i, j), flowY = y.Value(i, j);
      if (x.IsEmptyValue(flowX) || y.IsEmptyValue(flowY)) continue;
      const double scale = longest / layer.strongest;
      const double u = static_cast<double>(flowX) * scale, v = static_cast<double>(flowY) * scale;
      if (!(std::hypot(u, v) >= kShortest)) continue;
      // Components are along the axes of the grid.
      const QPointF half((u * cosine - v * sine) / 2, -(u * sine + v * cosine) / 2);
      const QPointF middle = map.window.ToScreen(transform.ToWorld({i + 0.5, j + 0.5}));
      arrows.push_back({middle - half, middle + half});
    }
  return arrows;
}

void DrawArrows(QPainter& painter, const std::vector<DrawnArrow>& arrows, const DrawnMap& map) {
  QPainterPath path;
  for (const DrawnArrow& arrow : arrows) {
    const QPointF along = arrow.to - arrow.from;
    const double length = std::hypot(along.x(), along.y());
    const double head = std::min(6.0 * map.zoom, 0.45 * length);
    const QPointF back = along / length * head, side(-back.y() * 0.45, back.x() * 0.45);
    path.moveTo(arrow.from);
    path.lineTo(arrow.to);
    path.moveTo(arrow.to - back + side);
    path.lineTo(arrow.to);
    path.lineTo(arrow.to - back - side);
  }
  painter.setBrush(Qt::NoBrush);
  // An edge keeps them apart from any colour below.
  painter.setPen(QPen(EdgeColor(map.isDark), 3 * map.zoom, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
  painter.drawPath(path);
  painter.setPen(QPen(InkColor(map.isDark), 1.2 * map.zoom, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
  painter.drawPath(path);
}

KeyArrow KeyOf(const ArrowLayer& layer, const DrawnMap& map, const DisplayUnits& units) {
  if (!(layer.strongest > 0)) return {};
  const ShownUnit unit(layer.x->ItemType(), layer.x->ItemUnit(), &units);
  const double strongest = unit.Shown(layer.strongest) - unit.Shown(0);
  // A number that people like, at most the strongest.
  double told = NiceStep(strongest);
  if (told > strongest * (1 + 1e-6)) told = NiceStep(strongest / 2);
  KeyArrow key;
  key.length = LongestArrow(layer.x->Geometry(), map) * told / strongest;
  key.text = ToQt(FormatNumber(told, "%.4g"));
  if (!unit.Text().empty()) key.text += " " + ToQt(unit.Text());
  return key;
}

}  // namespace tervane
