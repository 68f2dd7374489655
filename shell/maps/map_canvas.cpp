// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
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

#include "shell/maps/map_canvas_parts.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr std::size_t kCellsAtOnce = 400'000;  ///< Made ready before the map is shown: a few milliseconds.
constexpr int kMargin = 8;
constexpr double kClickRadius = 4;  ///< In pixels at zoom 1, as all of these.
constexpr double kReach = 6;        ///< How near a line or point must be to be pointed at.
constexpr double kZoomStep = 1.5;

using Made = std::shared_ptr<const GridPicture>;

}  // namespace

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
  if (const double width = LegendWidth(); width > 0 && width + Scaled(kLegendPadding) < 0.45 * map.width()) {
    legendPlace_ = QRectF(map.right() - width, map.top(), width, map.height());
    map.setRight(legendPlace_.left() - Scaled(kLegendPadding));
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
