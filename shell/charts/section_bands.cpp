// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/section_bands.h"

#include <algorithm>
#include <cmath>

namespace tervane {

void BandPlottable::SetData(std::vector<double> positions, std::vector<double> top, std::vector<double> bottom) {
  positions_ = std::move(positions);
  top_ = std::move(top);
  bottom_ = std::move(bottom);
}

QCPRange BandPlottable::getKeyRange(bool& isFound, QCP::SignDomain /*domain*/) const {
  isFound = !positions_.empty();
  return isFound ? QCPRange(positions_.front(), positions_.back()) : QCPRange();
}

QCPRange BandPlottable::getValueRange(bool& isFound, QCP::SignDomain /*domain*/, const QCPRange& keys) const {
  isFound = false;
  QCPRange range;
  for (std::size_t i = 0; i < positions_.size(); ++i) {
    const bool isAsked = keys == QCPRange() || keys.contains(positions_[i]);
    if (!isAsked || std::isnan(top_[i]) || std::isnan(bottom_[i])) continue;
    const QCPRange here(bottom_[i], top_[i]);
    range = isFound ? range.expanded(here) : here;
    isFound = true;
  }
  return range;
}

QPointF BandPlottable::ToScreen(double position, double value) const {
  // Far zoomed in, coordinates would grow beyond what the painter can draw.
  constexpr double kFar = 1e5;
  return {std::clamp(keyAxis()->coordToPixel(position), -kFar, kFar),
          std::clamp(valueAxis()->coordToPixel(value), -kFar, kFar)};
}

void BandPlottable::draw(QCPPainter* painter) {
  applyFillAntialiasingHint(painter);
  painter->setPen(mPen);
  painter->setBrush(mBrush);
  const QCPRange seen = keyAxis()->range();
  QPolygonF upper, lower;
  bool isThick = false;
  const auto finish = [&] {
    if (isThick) {
      std::reverse(lower.begin(), lower.end());
      painter->drawPolygon(upper + lower);
    }
    upper.clear();
    lower.clear();
    isThick = false;
  };
  for (std::size_t i = 0; i < positions_.size(); ++i) {
    // One point more at either side of what is seen.
    if (i + 1 < positions_.size() && positions_[i + 1] < seen.lower) continue;
    if (i > 0 && positions_[i - 1] > seen.upper) break;
    if (std::isnan(top_[i]) || std::isnan(bottom_[i])) {
      finish();
      continue;
    }
    upper << ToScreen(positions_[i], top_[i]);
    lower << ToScreen(positions_[i], bottom_[i]);
    isThick = isThick || top_[i] > bottom_[i];
  }
  finish();
}

void BandPlottable::drawLegendIcon(QCPPainter* painter, const QRectF& place) const {
  painter->setPen(mPen);
  painter->setBrush(mBrush);
  painter->drawRect(place.adjusted(1, 2, -1, -2));
}

}  // namespace tervane
