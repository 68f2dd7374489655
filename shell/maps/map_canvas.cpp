// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/map_canvas.h"

#include <QApplication>
#include <QFutureWatcher>
#include <QMouseEvent>
#include <QPainter>
#include <QPainterPath>
#include <QPromise>
#include <QThreadPool>
#include <algorithm>
#include <array>
#include <cmath>

#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr std::size_t kCellsAtOnce = 400'000;  ///< Made ready before the map is shown: a few milliseconds.
constexpr int kMargin = 8;
constexpr int kPadding = 10;      ///< Between map and legend.
constexpr int kSwatchWidth = 20;  ///< In pixels at zoom 1, as all of these.
constexpr double kClickRadius = 4;
constexpr double kReach = 6;  ///< How near a line or point must be to be pointed at.
constexpr double kZoomStep = 1.5;

using Made = std::shared_ptr<const GridPicture>;

double Scaled(double pixels) { return pixels * Theme::Get().Zoom(); }

ShownUnit CoordinateUnit(const DisplayUnits& units) { return {kCoordinateItemType, 1000, &units}; }

}  // namespace

struct MapCanvas::Layer {
  GridLayer grid;
  int unitKey = 0;
  Made picture;
  std::shared_ptr<std::atomic<bool>> isGivenUp = std::make_shared<std::atomic<bool>>(false);
  QFutureWatcher<Made> watcher;

  ~Layer() { *isGivenUp = true; }
};

struct MapCanvas::ScaleBar {
  double pixels = 0;
  QString text, half;
  QRectF box;
};

MapCanvas::MapCanvas(QWidget* parent) : QWidget(parent) {
  setMouseTracking(true);
  setFocusPolicy(Qt::StrongFocus);
  setMinimumSize(Theme::Get().Scaled(160), Theme::Get().Scaled(120));
  setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Expanding);
  setCursor(Qt::CrossCursor);
  connect(&Theme::Get(), &Theme::Changed, this, [this] { Arrange(); });
}

MapCanvas::~MapCanvas() = default;

// ---- Content

void MapCanvas::SetContent(MapContent content, const DisplayUnits* units) {
  const DisplayUnits chosen = units ? *units : DisplayUnits();
  const std::optional<Envelope> before = WholeArea();
  const bool wasEmpty = content_.IsEmpty();
  content_ = std::move(content);
  units_ = chosen;
  std::vector<std::unique_ptr<Layer>> old = std::move(layers_);
  layers_.clear();
  for (const GridLayer& grid : content_.grids) {
    const int unitKey = units_.UnitKey(grid.grid->ItemType());
    const auto same = std::ranges::find_if(old, [&](const auto& layer) {
      // How transparent a layer is, or whether it has a legend, does not change its colours.
      return layer && layer->grid.grid == grid.grid && layer->grid.isCodes == grid.isCodes &&
             layer->grid.highlighted == grid.highlighted && layer->grid.range == grid.range &&
             layer->unitKey == unitKey;
    });
    if (same != old.end()) {
      layers_.push_back(std::move(*same));
      layers_.back()->grid = grid;
      continue;
    }
    layers_.push_back(std::make_unique<Layer>());
    layers_.back()->grid = grid;
    layers_.back()->unitKey = unitKey;
    Prepare(*layers_.back());
  }
  shapes_.clear();
  for (const ShapeLayer& layer : content_.shapes) shapes_.emplace_back(layer);
  if (wasEmpty || WholeArea() != before) isFitted_ = true;
  Arrange();
}

void MapCanvas::Prepare(Layer& layer) {
  if (layer.grid.grid->Geometry().CellCount() <= kCellsAtOnce) {
    layer.picture = GridPicture::Make(layer.grid, units_, *layer.isGivenUp);
    return;
  }
  auto promise = std::make_shared<QPromise<Made>>();
  connect(&layer.watcher, &QFutureWatcher<Made>::finished, this, [this, &layer] {
    layer.picture = layer.watcher.result();
    Arrange();
  });
  layer.watcher.setFuture(promise->future());
  // The thread holds all that it works on: the canvas may be gone before it is done.
  QThreadPool::globalInstance()->start([promise, grid = layer.grid, units = units_, isGivenUp = layer.isGivenUp] {
    promise->start();
    promise->addResult(GridPicture::Make(grid, units, *isGivenUp));
    promise->finish();
  });
}

bool MapCanvas::IsPreparing() const {
  return std::ranges::any_of(layers_, [](const auto& layer) { return !layer->picture; });
}

void MapCanvas::WaitUntilReady() {
  for (const auto& layer : layers_) {
    if (layer->picture) continue;
    layer->watcher.waitForFinished();
    layer->picture = layer->watcher.result();
  }
  Arrange();
}

std::optional<Envelope> MapCanvas::WholeArea() const {
  if (content_.area) return content_.area;
  std::optional<Envelope> all;
  const auto add = [&all](const Envelope& area) {
    all = all ? Envelope{std::min(all->xMin, area.xMin), std::min(all->yMin, area.yMin), std::max(all->xMax, area.xMax),
                         std::max(all->yMax, area.yMax)}
              : area;
  };
  for (const GridLayer& layer : content_.grids)
    if (layer.grid->Geometry().CellCount() > 0) add(layer.grid->GetEnvelope());
  for (const ShapePicture& layer : shapes_)
    if (layer.Area()) add(*layer.Area());
  for (const PointLayer& layer : content_.points)
    for (const MapPoint& point : layer.points) add({point.x, point.y, point.x, point.y});
  return all;
}

// ---- What is seen

void MapCanvas::Redraw() {
  scene_ = {};
  update();
}

void MapCanvas::Arrange() {
  const double margin = Scaled(kMargin);
  const QFontMetricsF metrics(font());
  QRectF map = QRectF(rect()).adjusted(margin, margin, -margin, -margin);
  hasTicks_ = map.width() > Scaled(460) && map.height() > Scaled(280);
  if (hasTicks_) map.adjust(metrics.height() + Scaled(6), 0, 0, -metrics.height() - Scaled(6));
  legendPlace_ = {};
  // On a small map the legend stands back where it would take more than nearly half of the place.
  if (const double width = LegendWidth(); width > 0 && width + Scaled(kPadding) < 0.45 * map.width()) {
    legendPlace_ = QRectF(map.right() - width, map.top(), width, map.height());
    map.setRight(legendPlace_.left() - Scaled(kPadding));
  }
  window_.rect = map.toAlignedRect();
  if (isFitted_)
    Fit();
  else
    Redraw();
}

void MapCanvas::Fit() {
  isFitted_ = true;
  constexpr double kBorder = 1.06;
  if (const std::optional<Envelope> area = WholeArea(); area && window_.rect.width() > 0 && window_.rect.height() > 0) {
    window_.centre = {(area->xMin + area->xMax) / 2, (area->yMin + area->yMax) / 2};
    const double metres =
        std::max((area->xMax - area->xMin) / window_.rect.width(), (area->yMax - area->yMin) / window_.rect.height());
    // A single point has no extent of its own.
    window_.metresPerPixel = metres > 0 ? metres * kBorder : 1;
  }
  Redraw();
}

void MapCanvas::Zoom(double factor, QPointF around) {
  constexpr double kNearest = 1e-3, kFarthest = 1e6;
  const MapPoint fixed = window_.ToMap(around);
  const double metres = std::clamp(window_.metresPerPixel / factor, kNearest, kFarthest);
  const double part = metres / window_.metresPerPixel;
  window_.centre = {fixed.x + (window_.centre.x - fixed.x) * part, fixed.y + (window_.centre.y - fixed.y) * part};
  window_.metresPerPixel = metres;
  isFitted_ = false;
  Redraw();
}

void MapCanvas::Pan(QPointF by) {
  window_.centre.x -= by.x() * window_.metresPerPixel;
  window_.centre.y += by.y() * window_.metresPerPixel;
  isFitted_ = false;
  Redraw();
}

double MapCanvas::Reach() const { return Scaled(kReach) * window_.metresPerPixel; }

MapPick MapCanvas::PickAt(MapPoint place) const {
  MapPick pick;
  pick.place = place;
  if (!content_.grids.empty()) {
    const CTvn2DOrthoRotatedGridData& grid = *content_.grids.front().grid;
    double i = 0, j = 0;
    grid.GetCellCoordFromXYWorldCoord(place.x, place.y, i, j);
    if (i >= 0 && j >= 0 && i < grid.Geometry().nx && j < grid.Geometry().ny) {
      pick.cell = {static_cast<int>(i), static_cast<int>(j)};
      const float value = grid.Value(pick.cell->first, pick.cell->second);
      if (!grid.IsEmptyValue(value)) pick.value = value;
    }
  }
  if (!shapes_.empty()) pick.shape = shapes_.front().At(place, Reach());
  if (pick.shape) {
    const Shape& shape = content_.shapes.front().shapes->GetData()[*pick.shape];
    if (shape.HasValue()) pick.shapeValue = TextOf(shape.Value());
  }
  return pick;
}

QString MapCanvas::TextAt(MapPoint place) const {
  const ShownUnit unit = CoordinateUnit(units_);
  // As fine as a pixel of the screen tells them apart.
  const double step = std::pow(10.0, std::floor(std::log10(std::max(unit.Shown(window_.metresPerPixel), 1e-3))));
  const double decimals = std::min(step, 1.0);
  QString text =
      tr("x %1  y %2").arg(NumberInSteps(unit.Shown(place.x), decimals), NumberInSteps(unit.Shown(place.y), decimals));
  if (unit.Text() != "m") text += " " + ToQt(unit.Text());
  const MapPick pick = PickAt(place);
  if (pick.cell) {
    text += "   " + tr("cell %1, %2").arg(pick.cell->first).arg(pick.cell->second);
    const GridLayer& layer = content_.grids.front();
    text += "   " + (pick.value ? ShownUnit(layer.grid->ItemType(), layer.grid->ItemUnit(), &units_)
                                      .Value(static_cast<double>(*pick.value))
                                : tr("no value"));
  }
  if (pick.shape) {
    const QString value = ToQt(pick.shapeValue);
    text += "   " + (value.isEmpty() ? tr("shape %1").arg(*pick.shape + 1)
                                     : tr("shape %1: %2").arg(*pick.shape + 1).arg(value));
  }
  return text;
}

QString MapCanvas::Summary() const {
  if (content_.grids.empty()) return {};
  const GridGeometry& geometry = content_.grids.front().grid->Geometry();
  const ShownUnit unit = CoordinateUnit(units_);
  QString text = QString::fromUtf8("%1 × %2 ").arg(geometry.nx).arg(geometry.ny) +
                 tr("cells of %1").arg(unit.Value(geometry.cellSize));
  if (geometry.rotation != 0) text += tr(", turned by %1°").arg(ToQt(FormatNumber(geometry.rotation, "%.6g")));
  return text;
}

// ---- Drawing

QImage MapCanvas::Picture(double pixelRatio) {
  WaitUntilReady();
  QImage picture((QSizeF(size()) * pixelRatio).toSize(), QImage::Format_RGB32);
  picture.setDevicePixelRatio(pixelRatio);
  QPainter painter(&picture);
  painter.setFont(font());
  Render(painter, pixelRatio);
  return picture;
}

void MapCanvas::paintEvent(QPaintEvent* /*event*/) {
  if (scene_.isNull()) {
    scene_ = QPixmap((QSizeF(size()) * devicePixelRatioF()).toSize());
    scene_.setDevicePixelRatio(devicePixelRatioF());
    QPainter painter(&scene_);
    painter.setFont(font());
    Render(painter, devicePixelRatioF());
  }
  QPainter painter(this);
  painter.drawPixmap(0, 0, scene_);
  if (gesture_ != Gesture::Box) return;
  QColor veil = palette().color(QPalette::Highlight);
  painter.setPen(QPen(veil, 1.5));
  veil.setAlpha(50);
  painter.setBrush(veil);
  painter.drawRect(QRectF(pressedAt_, draggedTo_).normalized());
}

void MapCanvas::Render(QPainter& painter, double pixelRatio) {
  const bool isDark = Theme::Get().IsDark();
  const double zoom = Theme::Get().Zoom();
  painter.setRenderHint(QPainter::Antialiasing);
  painter.fillRect(rect(), palette().color(QPalette::Base));
  if (content_.IsEmpty()) {
    painter.setPen(Theme::Get().QuietColor());
    const double margin = Scaled(16);
    const QString message = content_.message.empty() ? tr("There is nothing to show.") : Translated(content_.message);
    painter.drawText(QRectF(rect()).adjusted(margin, margin, -margin, -margin), Qt::AlignCenter | Qt::TextWordWrap,
                     message);
    return;
  }
  painter.save();
  painter.setClipRect(window_.rect);
  for (const auto& layer : layers_)
    if (layer->picture) layer->picture->Draw(painter, window_, pixelRatio, 1 - layer->grid.transparency);
  // On a small map lines and points are finer too.
  const double small = std::clamp(std::min(window_.rect.width(), window_.rect.height()) / Scaled(400), 0.6, 1.0);
  for (const ShapePicture& shapes : shapes_) shapes.Draw(painter, window_, isDark, zoom * small);
  const ScaleBar scale = MakeScaleBar();
  std::vector<QRectF> taken{NorthArrowPlace(), scale.box};
  for (const PointLayer& points : content_.points)
    DrawLabelledPoints(painter, window_, points, isDark, zoom * small, taken);
  DrawNorthArrow(painter);
  DrawScaleBar(painter, scale);
  if (IsPreparing()) {
    const QString text = tr("Drawing...");
    QRectF chip = QFontMetricsF(font()).boundingRect(text);
    chip.adjust(-Scaled(14), -Scaled(8), Scaled(14), Scaled(8));
    chip.moveCenter(window_.rect.center());
    painter.setPen(palette().color(QPalette::Mid));
    painter.setBrush(palette().color(QPalette::Window));
    painter.drawRoundedRect(chip, Scaled(6), Scaled(6));
    painter.setPen(palette().color(QPalette::WindowText));
    painter.drawText(chip, Qt::AlignCenter, text);
  }
  painter.restore();
  DrawFrame(painter);
  DrawLegends(painter);
}

void MapCanvas::DrawFrame(QPainter& painter) {
  const QColor ink = Theme::Get().QuietColor();
  painter.setRenderHint(QPainter::Antialiasing, false);
  painter.setPen(QPen(ink, 1));
  painter.setBrush(Qt::NoBrush);
  painter.drawRect(window_.rect.adjusted(0, 0, -1, -1));
  if (hasTicks_) {
    const ShownUnit unit = CoordinateUnit(units_);
    const QFontMetricsF metrics(painter.font());
    const double width = metrics.horizontalAdvance("0000000.0") + Scaled(24);
    const double step = NiceStep(unit.Shown(window_.metresPerPixel) * width);
    const MapPoint low = window_.ToMap(window_.rect.bottomLeft()), high = window_.ToMap(window_.rect.topRight());
    const double tick = Scaled(4);
    painter.setPen(ink);
    for (double i = std::ceil(unit.Shown(low.x) / step); i * step <= unit.Shown(high.x); ++i) {
      const double x = window_.ToScreen({unit.Stored(i * step), 0}).x(), y = window_.rect.bottom();
      const QString text = NumberInSteps(i * step, step);
      const double half = metrics.horizontalAdvance(text) / 2;
      // A label may reach a little beyond the frame, not into the legend.
      if (x - half < 0 || x + half > window_.rect.right() + Scaled(kPadding)) continue;
      painter.drawLine(QPointF(x, y), QPointF(x, y + tick));
      painter.drawText(QPointF(x - half, y + tick + metrics.ascent()), text);
    }
    for (double i = std::ceil(unit.Shown(low.y) / step); i * step <= unit.Shown(high.y); ++i) {
      const double y = window_.ToScreen({0, unit.Stored(i * step)}).y(), x = window_.rect.left();
      const QString text = NumberInSteps(i * step, step);
      const double half = metrics.horizontalAdvance(text) / 2;
      if (y - half < 0 || y + half > height()) continue;
      painter.drawLine(QPointF(x, y), QPointF(x - tick, y));
      painter.save();
      painter.translate(x - tick - metrics.descent(), y + half);
      painter.rotate(-90);
      painter.drawText(QPointF(0, 0), text);
      painter.restore();
    }
  }
  painter.setRenderHint(QPainter::Antialiasing);
}

QRectF MapCanvas::NorthArrowPlace() const {
  const double size = Scaled(22);
  return {window_.rect.right() - size - Scaled(8), window_.rect.top() + Scaled(8), size, size * 1.7};
}

void MapCanvas::DrawNorthArrow(QPainter& painter) {
  const QRectF place = NorthArrowPlace();
  const double size = place.width();
  QColor paper = palette().color(QPalette::Base);
  paper.setAlpha(215);
  painter.setPen(Qt::NoPen);
  painter.setBrush(paper);
  painter.drawRoundedRect(place.adjusted(-2, -2, 2, 2), Scaled(4), Scaled(4));
  const QColor ink = palette().color(QPalette::Text);
  const double x = place.center().x(), top = place.top() + Scaled(2), bottom = top + size * 0.85;
  QPainterPath left, right;
  left.addPolygon(QPolygonF({{x, top}, {x, bottom - size * 0.2}, {x - size * 0.32, bottom}, {x, top}}));
  right.addPolygon(QPolygonF({{x, top}, {x, bottom - size * 0.2}, {x + size * 0.32, bottom}, {x, top}}));
  painter.setPen(QPen(ink, 1));
  painter.setBrush(Qt::NoBrush);
  painter.fillPath(left, ink);
  painter.drawPath(left);
  painter.drawPath(right);
  QFont bold = painter.font();
  bold.setBold(true);
  const QFont plain = painter.font();
  painter.setFont(bold);
  painter.drawText(QRectF(place.left(), bottom, size, place.bottom() - bottom), Qt::AlignCenter, tr("N", "north"));
  painter.setFont(plain);
}

MapCanvas::ScaleBar MapCanvas::MakeScaleBar() const {
  const ShownUnit unit = CoordinateUnit(units_);
  const double widest = std::min(Scaled(140), window_.rect.width() / 3) * window_.metresPerPixel;
  QString name = ToQt(unit.Text());
  // Metres become kilometres where they are many; another unit of the user's stays.
  const bool inKilometres = name == "m" && widest >= 1000;
  if (inKilometres) name = "km";
  const double factor = inKilometres ? 1000 : 1, most = unit.Shown(widest) / factor;
  // Halves are told too: 2.5 would give odd ones.
  double length = std::pow(10.0, std::floor(std::log10(most)));
  for (const double times : {5.0, 2.0})
    if (times * length <= most) {
      length *= times;
      break;
    }
  ScaleBar scale;
  scale.pixels = unit.Stored(length * factor) / window_.metresPerPixel;
  scale.text = ToQt(FormatNumber(length, "%.6g")) + " " + name;
  scale.half = ToQt(FormatNumber(length / 2, "%.6g"));
  const QFontMetricsF metrics(font());
  const double padding = Scaled(6), height = Scaled(5) + metrics.height() + 2 * padding - Scaled(4);
  const double textEnd = scale.pixels + metrics.horizontalAdvance(scale.text) - metrics.horizontalAdvance("0") / 2;
  scale.box = QRectF(window_.rect.left() + Scaled(8), window_.rect.bottom() - Scaled(8) - height, textEnd + 2 * padding,
                     height);
  return scale;
}

void MapCanvas::DrawScaleBar(QPainter& painter, const ScaleBar& scale) {
  if (!(scale.pixels > 4) || scale.box.width() > window_.rect.width()) return;
  const QFontMetricsF metrics(painter.font());
  const double bar = Scaled(5), padding = Scaled(6), digit = metrics.horizontalAdvance("0") / 2;
  QColor paper = palette().color(QPalette::Base);
  paper.setAlpha(215);
  painter.setPen(Qt::NoPen);
  painter.setBrush(paper);
  painter.drawRoundedRect(scale.box, Scaled(4), Scaled(4));
  const QColor ink = palette().color(QPalette::Text);
  const QPointF start(scale.box.left() + padding, scale.box.bottom() - padding - bar);
  painter.fillRect(QRectF(start, QSizeF(scale.pixels, bar)), palette().color(QPalette::Base));
  painter.fillRect(QRectF(start, QSizeF(scale.pixels / 2, bar)), ink);
  painter.setPen(QPen(ink, 1));
  painter.setBrush(Qt::NoBrush);
  painter.drawRect(QRectF(start, QSizeF(scale.pixels, bar)));
  const double baseline = start.y() - Scaled(3) - metrics.descent() * 0.5;
  painter.drawText(QPointF(start.x() - digit / 2, baseline), "0");
  const double halfWidth = metrics.horizontalAdvance(scale.half), halfAt = start.x() + (scale.pixels - halfWidth) / 2;
  if (halfAt + halfWidth + digit < start.x() + scale.pixels - digit)
    painter.drawText(QPointF(halfAt, baseline), scale.half);
  painter.drawText(QPointF(start.x() + scale.pixels - digit, baseline), scale.text);
}

// ---- Legend

QString MapCanvas::LegendTitle(const Layer& layer) const {
  const CTvn2DOrthoRotatedGridData& grid = *layer.grid.grid;
  QString title = ToQt(grid.ItemName());
  const ItemType* item = FindItemType(grid.ItemType());
  if (title.isEmpty() && item && item->code != kUndefinedItemType) title = Translated(std::string(item->name));
  const std::string unit = ShownUnit(grid.ItemType(), grid.ItemUnit(), &units_).Text();
  if (!unit.empty() && !layer.grid.isCodes) title += (title.isEmpty() ? "[" : " [") + ToQt(unit) + "]";
  return title;
}

QString MapCanvas::HiddenText(std::size_t count) const { return tr("and %n more", nullptr, static_cast<int>(count)); }

double MapCanvas::LegendWidth() const {
  const QFontMetricsF metrics(font());
  double width = 0;
  for (const auto& layer : layers_) {
    if (!layer->picture || !layer->grid.withLegend) continue;
    const MapPalette& colors = layer->picture->Palette();
    for (const MapPalette::Row& row : colors.Legend())
      width = std::max(width, Scaled(kSwatchWidth + 8) + metrics.horizontalAdvance(row.text));
    width = std::max(width, metrics.horizontalAdvance(HiddenText(10000)) * (colors.HiddenCodes() > 0));
    // A long title breaks into lines, so that it does not take the map's place.
    QFont bold = font();
    bold.setBold(true);
    const QFontMetricsF boldMetrics(bold);
    for (const QString& word : LegendTitle(*layer).split(' '))
      width = std::max(width, boldMetrics.horizontalAdvance(word));
  }
  return width > 0 ? std::ceil(std::max(width, Scaled(90))) + 2 : 0;
}

void MapCanvas::DrawLegends(QPainter& painter) {
  if (legendPlace_.isEmpty()) return;
  QRectF place = legendPlace_;
  // What stands on top is told first.
  for (auto layer = layers_.rbegin(); layer != layers_.rend(); ++layer) {
    if (!(*layer)->picture || !(*layer)->grid.withLegend) continue;
    place.setTop(place.top() + DrawLegend(painter, **layer, place) + Scaled(12));
  }
}

double MapCanvas::DrawLegend(QPainter& painter, const Layer& layer, QRectF place) {
  const MapPalette& colors = layer.picture->Palette();
  const QColor ink = palette().color(QPalette::Text);
  QFont bold = painter.font();
  const QFont plain = painter.font();
  bold.setBold(true);
  painter.setFont(bold);
  painter.setPen(ink);
  QRectF title;
  painter.drawText(place, Qt::AlignLeft | Qt::AlignTop | Qt::TextWordWrap, LegendTitle(layer), &title);
  painter.setFont(plain);
  double y = title.isEmpty() ? place.top() : title.bottom() + Scaled(5);

  const QFontMetricsF metrics(plain);
  std::size_t count = colors.Legend().size(), hidden = colors.HiddenCodes();
  const double room = place.bottom() - y, usual = metrics.height() + Scaled(colors.IsScale() ? 3 : 4);
  double rowHeight = usual;
  if (colors.IsScale()) {
    // A scale stays whole: its rows grow flat, and only every so many are labelled.
    rowHeight = std::min(usual, std::max(room / static_cast<double>(std::max<std::size_t>(count, 1)), 3.0));
  } else if (usual * static_cast<double>(count + (hidden > 0)) > room) {
    const auto fits = static_cast<std::size_t>(std::max(room / usual - 1, 0.0));
    hidden += count - std::min(count, fits);
    count = std::min(count, fits);
  }
  const auto labelEvery = static_cast<std::size_t>(std::ceil(metrics.height() * 0.85 / rowHeight));
  for (std::size_t i = 0; i < count; ++i) {
    const MapPalette::Row& row = colors.Legend()[i];
    const double gap = colors.IsScale() ? 0 : Scaled(4);
    const QRectF swatch(place.left(), y + gap / 2, Scaled(kSwatchWidth), rowHeight - gap);
    QColor color = row.color;
    color.setAlphaF(static_cast<float>(1 - layer.grid.transparency));
    painter.fillRect(swatch, color);
    painter.setPen(QPen(Theme::Get().QuietColor(), 1));
    painter.setBrush(Qt::NoBrush);
    painter.setRenderHint(QPainter::Antialiasing, false);
    painter.drawRect(swatch);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(ink);
    if (i % labelEvery == 0)
      painter.drawText(QRectF(swatch.right() + Scaled(8), y + rowHeight / 2 - usual / 2, place.width(), usual),
                       Qt::AlignLeft | Qt::AlignVCenter, row.text);
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

// ---- Mouse and keyboard

void MapCanvas::resizeEvent(QResizeEvent* /*event*/) { Arrange(); }

void MapCanvas::changeEvent(QEvent* event) {
  if (event->type() == QEvent::FontChange || event->type() == QEvent::PaletteChange) Arrange();
  QWidget::changeEvent(event);
}

void MapCanvas::mousePressEvent(QMouseEvent* event) {
  if (event->button() != Qt::LeftButton || content_.IsEmpty()) return QWidget::mousePressEvent(event);
  setFocus(Qt::MouseFocusReason);
  pressedAt_ = draggedTo_ = event->position();
  isSecondClick_ = false;
  gesture_ = event->modifiers() & Qt::ShiftModifier ? Gesture::Box : Gesture::Press;
}

void MapCanvas::mouseMoveEvent(QMouseEvent* event) {
  const QPointF at = event->position();
  if (gesture_ == Gesture::Press && (at - pressedAt_).manhattanLength() > kClickRadius) {
    gesture_ = Gesture::Pan;
    setCursor(Qt::ClosedHandCursor);
  }
  if (gesture_ == Gesture::Pan) Pan(at - draggedTo_);
  if (gesture_ == Gesture::Box) update();
  draggedTo_ = at;
  const bool isOnMap = !content_.IsEmpty() && window_.rect.contains(at);
  emit PointedAt(isOnMap ? TextAt(window_.ToMap(at)) : QString());
}

void MapCanvas::mouseReleaseEvent(QMouseEvent* event) {
  if (event->button() != Qt::LeftButton) return QWidget::mouseReleaseEvent(event);
  const Gesture gesture = std::exchange(gesture_, Gesture::None);
  setCursor(Qt::CrossCursor);
  const QPointF at = event->position();
  if (gesture == Gesture::Box) {
    const QRectF box = QRectF(pressedAt_, at).normalized();
    if (box.width() > kClickRadius && box.height() > kClickRadius) {
      const MapPoint centre = window_.ToMap(box.center());
      Zoom(std::min(window_.rect.width() / box.width(), window_.rect.height() / box.height()));
      window_.centre = centre;
    }
    Redraw();
  } else if (gesture == Gesture::Press && !isSecondClick_ && window_.rect.contains(at)) {
    // The page may be replaced by what the click does.
    const auto picked = content_.picked;
    if (picked) picked(PickAt(window_.ToMap(at)));
  }
}

void MapCanvas::mouseDoubleClickEvent(QMouseEvent* event) {
  if (event->button() != Qt::LeftButton) return;
  isSecondClick_ = true;
  Fit();
}

void MapCanvas::wheelEvent(QWheelEvent* event) {
  const int turned = event->angleDelta().y();
  if (content_.IsEmpty() || turned == 0) return event->ignore();
  Zoom(std::pow(kZoomStep, turned / 120.0), event->position());
  event->accept();
}

void MapCanvas::keyPressEvent(QKeyEvent* event) {
  const double step = 0.15 * std::min(window_.rect.width(), window_.rect.height());
  switch (event->key()) {
    case Qt::Key_Plus:
    case Qt::Key_Equal:
      return Zoom(kZoomStep);
    case Qt::Key_Minus:
      return Zoom(1 / kZoomStep);
    case Qt::Key_Left:
      return Pan({step, 0});
    case Qt::Key_Right:
      return Pan({-step, 0});
    case Qt::Key_Up:
      return Pan({0, step});
    case Qt::Key_Down:
      return Pan({0, -step});
    case Qt::Key_Home:
      return Fit();
    case Qt::Key_Escape:
      gesture_ = Gesture::None;
      return update();
    default:
      QWidget::keyPressEvent(event);
  }
}

void MapCanvas::leaveEvent(QEvent* /*event*/) { emit PointedAt({}); }

}  // namespace tervane
