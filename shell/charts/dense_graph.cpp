// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/dense_graph.h"

#include <QImage>
#include <algorithm>
#include <cmath>
#include <limits>

namespace tervane {

void DenseGraph::draw(QCPPainter* painter) {
  Iterator begin, end;
  getVisibleDataBounds(begin, end, QCPDataRange(0, dataCount()));
  // With fewer points lines are told apart, and look better when they are drawn one by one.
  constexpr int kManyInColumn = 2;
  const bool isLinear = keyAxis()->scaleType() == QCPAxis::stLinear && valueAxis()->scaleType() == QCPAxis::stLinear;
  if (isLinear && lineStyle() != lsNone && end - begin > kManyInColumn * clipRect().width()) {
    DrawColumns(painter, ColumnsOf(begin, end));
    return;
  }
  QCPGraph::draw(painter);
  if (scatterStyle().isNone()) DrawLonePoints(painter, begin, end);
}

std::vector<DenseGraph::Column> DenseGraph::ColumnsOf(Iterator begin, Iterator end) const {
  constexpr double kInfinity = std::numeric_limits<double>::infinity();
  const QRect area = clipRect();
  std::vector<Column> columns(static_cast<std::size_t>(area.width()), {kInfinity, -kInfinity});
  const auto add = [&columns](int column, double value) {
    Column& taken = columns[static_cast<std::size_t>(column)];
    taken.least = std::min(taken.least, value);
    taken.most = std::max(taken.most, value);
  };
  const int last = area.width() - 1;
  // A line is drawn in the pixel whose middle is nearest.
  const double start = keyAxis()->pixelToCoord(area.left() - 0.5);
  const double perKey = area.width() / (keyAxis()->pixelToCoord(area.left() - 0.5 + area.width()) - start);
  double xBefore = 0, before = std::numeric_limits<double>::quiet_NaN();
  for (Iterator point = begin; point != end; ++point) {
    const double x = (point->key - start) * perKey, value = point->value;
    if (std::isfinite(value)) {
      const double column = std::floor(x);
      if (column >= 0 && column <= last) add(static_cast<int>(column), value);
      // Where a line passes from one column to the next, it belongs to both.
      if (std::isfinite(before) && std::floor(xBefore) < column) {
        const double slope = (value - before) / (x - xBefore);
        const int first = static_cast<int>(std::clamp(std::floor(xBefore) + 1, 0.0, last + 1.0));
        for (int border = first; border <= std::min(column, last + 1.0); ++border) {
          const double there = before + (border - xBefore) * slope;
          if (border > 0) add(border - 1, there);
          if (border <= last) add(border, there);
        }
      }
    }
    xBefore = x;
    before = value;
  }
  return columns;
}

void DenseGraph::DrawColumns(QCPPainter* painter, const std::vector<Column>& columns) const {
  const QRect area = clipRect();
  const auto row = [&](double value) {
    const double y = valueAxis()->coordToPixel(value) - area.top();
    return static_cast<int>(std::lround(std::clamp(y, -1.0, area.height() + 0.0)));
  };
  // Pixel by pixel: the toolkit would divide each of some thousand narrow shapes among threads, and wait for them.
  QImage picture(area.size(), QImage::Format_ARGB32_Premultiplied);
  picture.fill(Qt::transparent);
  const auto paint = [&](int x, int top, int bottom, QRgb color) {
    for (int y = std::max(top, 0); y <= std::min(bottom, area.height() - 1); ++y)
      reinterpret_cast<QRgb*>(picture.scanLine(y))[x] = color;
  };
  const bool isFilled = brush().style() != Qt::NoBrush, isDrawn = pen().style() != Qt::NoPen;
  const QRgb fill = qPremultiply(brush().color().rgba()), line = qPremultiply(pen().color().rgba());
  const int zero = row(0);
  for (int x = 0; x < area.width(); ++x) {
    const Column& column = columns[static_cast<std::size_t>(x)];
    if (column.least > column.most) continue;
    const int top = row(column.most), bottom = row(column.least);
    if (isFilled) paint(x, std::min(top, zero), std::max(bottom, zero), fill);
    if (isDrawn) paint(x, top, bottom, line);
  }
  // Smoothed drawing would shift it by half a pixel.
  painter->setAntialiasing(false);
  painter->drawImage(area.topLeft(), picture);
}

void DenseGraph::DrawLonePoints(QCPPainter* painter, Iterator begin, Iterator end) const {
  const auto isGap = [this](Iterator point) { return point == data()->constEnd() || !std::isfinite(point->value); };
  const QCPScatterStyle dot(QCPScatterStyle::ssDisc, pen().widthF() + 2);
  applyScattersAntialiasingHint(painter);
  dot.applyTo(painter, pen());
  for (Iterator point = begin; point != end; ++point) {
    if (isGap(point) || !isGap(point + 1) || (point != data()->constBegin() && !isGap(point - 1))) continue;
    dot.drawShape(painter, coordsToPixels(point->key, point->value));
  }
}

}  // namespace tervane
