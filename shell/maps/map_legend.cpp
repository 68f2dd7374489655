// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The legend beside a map.
#include <QPainter>
#include <algorithm>
#include <cmath>

#include "platform/item_types.h"
#include "shell/maps/map_canvas_parts.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kSwatchWidth = 20;  ///< In pixels at zoom 1.
constexpr int kBetween = 12;      ///< Between the parts of two layers.

QFont Bold(QFont font) {
  font.setBold(true);
  return font;
}

double RowGap(const LegendBlock& legend) { return Scaled(legend.isScale ? 3 : 4); }

/// The height at which nothing is left out or made flat, without the title's further lines.
double WantedHeight(const LegendBlock& legend, const QFontMetricsF& metrics) {
  const auto rows = static_cast<double>(legend.rows.size() + (legend.hidden > 0) + !legend.title.isEmpty());
  return rows * (metrics.height() + RowGap(legend)) + Scaled(kBetween);
}

void DrawSwatch(QPainter& painter, const QRectF& swatch, QColor color, const LegendBlock& legend) {
  if (legend.areLines) {
    const double y = swatch.center().y();
    painter.setPen(QPen(color, Scaled(3.4), Qt::SolidLine, Qt::RoundCap));
    painter.drawLine(QPointF(swatch.left() + Scaled(2), y), QPointF(swatch.right() - Scaled(2), y));
    return;
  }
  color.setAlphaF(color.alphaF() * static_cast<float>(legend.opacity));
  painter.fillRect(swatch, color);
  painter.setPen(QPen(Theme::Get().QuietColor(), 1));
  painter.setBrush(Qt::NoBrush);
  painter.setRenderHint(QPainter::Antialiasing, false);
  painter.drawRect(swatch);
  painter.setRenderHint(QPainter::Antialiasing);
}

}  // namespace

std::vector<LegendBlock> MapCanvas::Legends() const {
  std::vector<LegendBlock> all;
  const auto add = [&all](const LegendBlock& legend) {
    if (!legend.rows.empty()) all.push_back(legend);
  };
  // What stands on top is told first.
  for (auto lines = lines_.rbegin(); lines != lines_.rend(); ++lines) {
    add(lines->Legend());
    if (!lines->Legend().rows.empty()) all.back().areLines = true;
  }
  for (auto shapes = shapes_.rbegin(); shapes != shapes_.rend(); ++shapes) add(shapes->Legend());
  for (auto layer = layers_.rbegin(); layer != layers_.rend(); ++layer) {
    if (!(*layer)->picture || !(*layer)->grid.withLegend) continue;
    const CTvn2DOrthoRotatedGridData& grid = *(*layer)->grid.grid;
    LegendBlock legend = (*layer)->picture->Palette().Legend();
    legend.title = Translated(grid.ItemName());
    const ItemType* item = FindItemType(grid.ItemType());
    if (legend.title.isEmpty() && item && item->code != quantity::kUndefined)
      legend.title = Translated(std::string(item->name));
    if (!(*layer)->grid.isCodes)
      legend.title = TitleWithUnit(legend.title, ShownUnit(grid.ItemType(), grid.ItemUnit(), &units_).Text());
    legend.opacity = 1 - (*layer)->grid.transparency;
    all.push_back(std::move(legend));
  }
  if (hasLayersInLegend_) add(LegendOfLayers());
  return all;
}

LegendBlock MapCanvas::LegendOfLayers() const {
  struct ColorOf {
    QColor operator()(const ImageLayer& /*image*/) const { return {}; }
    QColor operator()(const GridLayer& /*grid*/) const { return QColor(RampColor(0.5)); }
    QColor operator()(const ShapeLayer& shapes) const {
      const bool arePoints = shapes.shapes && shapes.shapes->Kind() == ShapeKind::Point;
      if (!shapes.style) return LineColor(isDark);
      return QColor::fromRgb(arePoints ? shapes.style->pointColor : shapes.style->lineColor);
    }
    QColor operator()(const LineLayer& lines) const {
      return lines.lineColor ? QColor::fromRgb(*lines.lineColor) : LineColor(isDark);
    }
    QColor operator()(const PointLayer& /*points*/) const { return InkColor(isDark); }

    bool isDark;
  };
  LegendBlock legend;
  legend.title = tr("Layers");
  for (const auto* layers : {&content_.above, &content_.below})
    for (auto layer = layers->rbegin(); layer != layers->rend(); ++layer)
      legend.Add(std::visit(ColorOf{Theme::Get().IsDark()}, layer->drawn), Translated(layer->title));
  return legend;
}

void MapCanvas::SetLayersInLegend(bool isOn) {
  hasLayersInLegend_ = isOn;
  Arrange();
}

QString MapCanvas::LayersInWords() const {
  constexpr std::size_t kMostNames = 8;
  QStringList parts;
  for (const LegendBlock& legend : Legends()) {
    QStringList names;
    for (const LegendRow& row : legend.rows)
      if (!row.text.isEmpty()) names << row.text;
    const auto count = static_cast<std::size_t>(names.size()) + legend.hidden;
    // Of a scale its ends tell enough.
    if (legend.isScale && names.size() > 2) names = {names.front(), "…", names.back()};
    if (!legend.isScale && count > kMostNames) names = names.mid(0, kMostNames) << HiddenText(count - kMostNames);
    parts << (legend.title.isEmpty() ? QString() : legend.title + ": ") + names.join(legend.isScale ? " " : ", ");
  }
  const auto add = [&parts](const QString& text, std::size_t count) {
    if (count > 0) parts << text.arg(count);
  };
  std::size_t shapes = 0, lines = 0, points = 0;
  for (const ShapeLayer& layer : content_.shapes) shapes += layer.shapes ? layer.shapes->GetData().size() : 0;
  for (const LineLayer& layer : content_.lines) lines += layer.lines ? layer.lines->size() : 0;
  for (const PointLayer& layer : content_.points) points += layer.points.size();
  add(tr("Shapes: %1"), shapes);
  add(tr("Lines: %1"), lines);
  add(tr("Points: %1"), points);
  QStringList backdrop;
  for (const auto* layers : {&content_.above, &content_.below})
    for (auto layer = layers->rbegin(); layer != layers->rend(); ++layer) backdrop << Translated(layer->title);
  if (!backdrop.isEmpty()) parts << tr("Backdrop: %1").arg(backdrop.join(", "));
  return parts.join("; ");
}

QString MapCanvas::HiddenText(std::size_t count) const { return tr("and %n more", nullptr, static_cast<int>(count)); }

double MapCanvas::LegendWidth() const {
  const QFontMetricsF metrics(font()), bold(Bold(font()));
  // A long name is cut rather than taking the map's place; a long title breaks into lines.
  const double widest = Scaled(190);
  double width = 0;
  for (const LegendBlock& legend : Legends()) {
    for (const LegendRow& row : legend.rows)
      width = std::max(width, std::min(widest, Scaled(kSwatchWidth + 8) + metrics.horizontalAdvance(row.text)));
    width = std::max(width, metrics.horizontalAdvance(HiddenText(10000)) * (legend.hidden > 0));
    for (const QString& word : legend.title.split(' ')) width = std::max(width, bold.horizontalAdvance(word));
  }
  return width > 0 ? std::ceil(std::max(width, Scaled(90))) + 2 : 0;
}

void MapCanvas::ScrollLegend(double pixels) {
  const double before = legendScroll_;
  legendScroll_ = std::clamp(legendScroll_ + pixels, 0.0, legendMost_);
  if (legendScroll_ != before) Redraw();
}

void MapCanvas::DrawLegends(QPainter& painter, bool isScreen) {
  legendMost_ = isScreen ? 0 : legendMost_;
  if (legendPlace_.isEmpty()) return;
  const std::vector<LegendBlock> legends = Legends();
  const QFontMetricsF metrics(painter.font());
  double wanted = 0;
  for (const LegendBlock& legend : legends) wanted += WantedHeight(legend, metrics);
  const bool hasKinds = std::ranges::any_of(legends, [](const LegendBlock& legend) { return !legend.isScale; });
  if (isScreen && hasKinds && wanted > legendPlace_.height()) {
    // One line more, since a long title breaks.
    legendMost_ = wanted + metrics.height() - legendPlace_.height();
    legendScroll_ = std::min(legendScroll_, legendMost_);
    painter.save();
    painter.setClipRect(legendPlace_.adjusted(-1, -1, 1, 1));
    QRectF place = legendPlace_.translated(0, -legendScroll_);
    place.setHeight(wanted + legendPlace_.height());
    for (const LegendBlock& legend : legends)
      place.setTop(place.top() + DrawLegend(painter, legend, place) + Scaled(kBetween));
    painter.restore();
    const double length = legendPlace_.height() / (legendMost_ + legendPlace_.height());
    QColor bar = Theme::Get().QuietColor();
    bar.setAlpha(140);
    painter.fillRect(QRectF(legendPlace_.right() - Scaled(4), legendPlace_.top() + legendScroll_ * length, Scaled(4),
                            legendPlace_.height() * length),
                     bar);
    return;
  }
  // Where not all has room, each gives up its share.
  const double share = std::min(1.0, legendPlace_.height() / std::max(wanted, 1.0));
  QRectF place = legendPlace_;
  for (const LegendBlock& legend : legends) {
    QRectF own = place;
    if (share < 1 && &legend != &legends.back()) own.setHeight(share * WantedHeight(legend, metrics));
    place.setTop(place.top() + DrawLegend(painter, legend, own) + Scaled(kBetween));
  }
}

double MapCanvas::DrawLegend(QPainter& painter, const LegendBlock& legend, QRectF place) {
  const QColor ink = palette().color(QPalette::Text);
  const QFont plain = painter.font();
  painter.setFont(Bold(plain));
  painter.setPen(ink);
  QRectF title;
  painter.drawText(place, Qt::AlignLeft | Qt::AlignTop | Qt::TextWordWrap, legend.title, &title);
  painter.setFont(plain);
  double y = title.isEmpty() ? place.top() : title.bottom() + Scaled(5);

  const QFontMetricsF metrics(plain);
  std::size_t count = legend.rows.size(), hidden = legend.hidden;
  const double room = place.bottom() - y, usual = metrics.height() + RowGap(legend);
  double rowHeight = usual;
  if (legend.isScale) {
    // A scale stays whole: its rows grow flat, and only every so many are labelled.
    rowHeight = std::min(usual, std::max(room / static_cast<double>(std::max<std::size_t>(count, 1)), 3.0));
  } else if (usual * static_cast<double>(count + (hidden > 0)) > room) {
    const auto fits = static_cast<std::size_t>(std::max(room / usual - 1, 0.0));
    hidden += count - std::min(count, fits);
    count = std::min(count, fits);
  }
  const auto labelEvery = static_cast<std::size_t>(std::ceil(metrics.height() * 0.85 / rowHeight));
  for (std::size_t i = 0; i < count; ++i) {
    const LegendRow& row = legend.rows[i];
    const double gap = legend.isScale ? 0 : Scaled(4);
    const QRectF swatch(place.left(), y + gap / 2, Scaled(kSwatchWidth), rowHeight - gap);
    DrawSwatch(painter, swatch, row.color, legend);
    painter.setPen(ink);
    const QRectF text(swatch.right() + Scaled(8), y + rowHeight / 2 - usual / 2,
                      place.right() - swatch.right() - Scaled(8), usual);
    if (i % labelEvery == 0)
      painter.drawText(text, Qt::AlignLeft | Qt::AlignVCenter,
                       metrics.elidedText(row.text, Qt::ElideRight, text.width() + 1));
    y += rowHeight;
  }
  if (hidden > 0) {
    painter.setPen(Theme::Get().QuietColor());
    painter.drawText(QRectF(place.left(), y, place.width(), usual), Qt::AlignLeft | Qt::AlignVCenter,
                     HiddenText(hidden));
    y += usual;
  }
  return y - place.top();
}

}  // namespace tervane
