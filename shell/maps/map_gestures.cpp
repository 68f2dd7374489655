// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a user does on a map with mouse and keyboard: moving it, picking, and answering what a page asks.
#include <QMouseEvent>
#include <QPainter>
#include <algorithm>
#include <cmath>
#include <utility>

#include "geometry/grid_section.h"
#include "shell/maps/map_canvas_parts.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr double kClickRadius = 4;  ///< In pixels at zoom 1.
constexpr double kZoomStep = 1.5;

constexpr double kTargetSize = 27;  ///< In pixels at zoom 1.
constexpr double kMarkStep = 10;    ///< The same, by which a key moves the reading mark.

/// A circle with a cross that leaves its middle free.
void DrawTarget(QPainter& painter, QPointF middle, double size, double zoom) {
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setBrush(Qt::NoBrush);
  const double radius = size * 0.3, gap = size * 0.1, arm = size / 2 - 1;
  for (const QPen& pen : {QPen(Qt::white, 3.2 * zoom), QPen(QColor(0x1d, 0x22, 0x2a), 1.4 * zoom)}) {
    painter.setPen(pen);
    painter.drawEllipse(middle, radius, radius);
    for (const double side : {-1.0, 1.0}) {
      painter.drawLine(middle + QPointF(side * gap, 0), middle + QPointF(side * arm, 0));
      painter.drawLine(middle + QPointF(0, side * gap), middle + QPointF(0, side * arm));
    }
  }
}

QCursor TargetCursor(double zoom) {
  const int size = static_cast<int>(std::lround(kTargetSize * zoom)) | 1;
  QPixmap picture(size, size);
  picture.fill(Qt::transparent);
  QPainter painter(&picture);
  DrawTarget(painter, QPointF(size, size) / 2, size, zoom);
  painter.end();
  return QCursor(picture);
}

/// The way in which an arrow key leads; nothing for another key.
QPointF WayOf(int key) {
  switch (key) {
    case Qt::Key_Left:
      return {-1, 0};
    case Qt::Key_Right:
      return {1, 0};
    case Qt::Key_Up:
      return {0, -1};
    case Qt::Key_Down:
      return {0, 1};
    default:
      return {};
  }
}

}  // namespace

// ---- Mouse and keyboard

void MapCanvas::resizeEvent(QResizeEvent* /*event*/) { Arrange(); }

void MapCanvas::changeEvent(QEvent* event) {
  if (event->type() == QEvent::FontChange || event->type() == QEvent::PaletteChange) Arrange();
  QWidget::changeEvent(event);
}

void MapCanvas::mousePressEvent(QMouseEvent* event) {
  const bool isMoving = event->button() == Qt::MiddleButton && drag_ && gesture_ == Gesture::None;
  if ((event->button() != Qt::LeftButton && !isMoving) || content_.IsEmpty()) return QWidget::mousePressEvent(event);
  setFocus(Qt::MouseFocusReason);
  mark_.reset();
  pressedAt_ = draggedTo_ = event->position();
  isSecondClick_ = isTaken_ = false;
  if (drag_ && !isMoving && window_.rect.contains(pressedAt_)) {
    gesture_ = Gesture::Drag;
    isPointed_ = true;
    if (drag_->moved) drag_->moved(window_.ToMap(pressedAt_), window_.ToMap(pressedAt_));
    return update();
  }
  gesture_ = event->modifiers() & Qt::ShiftModifier ? Gesture::Box : Gesture::Press;
}

void MapCanvas::mouseMoveEvent(QMouseEvent* event) {
  const QPointF at = event->position();
  if (gesture_ == Gesture::Press && (at - pressedAt_).manhattanLength() > kClickRadius) {
    gesture_ = Gesture::Pan;
    setCursor(Qt::ClosedHandCursor);
  }
  if (gesture_ == Gesture::Pan) Pan(at - draggedTo_);
  if (gesture_ == Gesture::Box || drag_) update();
  if (gesture_ == Gesture::Drag && drag_->moved) drag_->moved(window_.ToMap(draggedTo_), window_.ToMap(at));
  draggedTo_ = at;
  isPointed_ = true;
  const bool isOnMap = !content_.IsEmpty() && window_.rect.contains(at);
  emit PointedAt(isOnMap ? DrawnText(window_.ToMap(at)) + TextAt(window_.ToMap(at)) : QString());
  if (!drawn_.empty()) update();
}

void MapCanvas::mouseReleaseEvent(QMouseEvent* event) {
  // A point that is asked for may be given by either button.
  const bool asksPoint = request_ && request_->kind == MapRequest::Kind::Point;
  if (event->button() == Qt::RightButton && asksPoint && window_.rect.contains(event->position())) {
    TakeClick(window_.ToMap(event->position()));
    isTaken_ = false;  // no double click follows
    return;
  }
  const bool isMoved = event->button() == Qt::MiddleButton && (gesture_ == Gesture::Pan || gesture_ == Gesture::Press);
  if (event->button() != Qt::LeftButton && !isMoved) return QWidget::mouseReleaseEvent(event);
  if (gesture_ == Gesture::Drag) return EndDrag(window_.ToMap(event->position()));
  const Gesture gesture = std::exchange(gesture_, Gesture::None);
  SyncCursor();
  const QPointF at = event->position();
  if (gesture == Gesture::Box) {
    const QRectF box = QRectF(pressedAt_, at).normalized();
    if (box.width() > kClickRadius && box.height() > kClickRadius) {
      const MapPoint centre = window_.ToMap(box.center());
      Zoom(std::min(window_.rect.width() / box.width(), window_.rect.height() / box.height()));
      window_.centre = centre;
    }
    Redraw();
  } else if (gesture == Gesture::Press && !isMoved && !isSecondClick_ && window_.rect.contains(at)) {
    if (request_) return TakeClick(window_.ToMap(at));
    // The page may be replaced by what the click does.
    const auto picked = content_.picked;
    if (picked) picked(PickAt(window_.ToMap(at)));
  }
}

void MapCanvas::mouseDoubleClickEvent(QMouseEvent* event) {
  if (event->button() != Qt::LeftButton) return;
  isSecondClick_ = true;
  // The second of two quick dabs is one, too.
  if (drag_) return mousePressEvent(event);
  if (request_) return EndLine();
  // The second click upon one that gave a point is none of its own.
  if (!std::exchange(isTaken_, false)) Fit();
}

void MapCanvas::wheelEvent(QWheelEvent* event) {
  const int turned = event->angleDelta().y();
  if (content_.IsEmpty() || turned == 0) return event->ignore();
  if (legendPlace_.contains(event->position())) {
    ScrollLegend(-turned / 2.0);
    return event->accept();
  }
  Zoom(std::pow(kZoomStep, turned / 120.0), event->position());
  event->accept();
}

void MapCanvas::keyPressEvent(QKeyEvent* event) {
  const QPointF way = WayOf(event->key());
  if (!way.isNull() && (event->modifiers() & Qt::ControlModifier))
    return MoveMark(way * (event->modifiers() & Qt::ShiftModifier ? 1 : Scaled(kMarkStep)));
  if (request_ && PressInRequest(event->key())) return;
  // Whole pixels, by which what is drawn can be moved.
  const double step = std::round(0.15 * std::min(window_.rect.width(), window_.rect.height()));
  switch (event->key()) {
    case Qt::Key_Plus:
    case Qt::Key_Equal:
      return Zoom(kZoomStep);
    case Qt::Key_Minus:
      return Zoom(1 / kZoomStep);
    case Qt::Key_Left:
    case Qt::Key_Right:
    case Qt::Key_Up:
    case Qt::Key_Down:
      return Pan(-step * way);
    case Qt::Key_Return:
    case Qt::Key_Enter:
      return mark_ ? ClickAtMark() : QWidget::keyPressEvent(event);
    case Qt::Key_PageUp:
      return ScrollLegend(-legendPlace_.height() / 2);
    case Qt::Key_PageDown:
      return ScrollLegend(legendPlace_.height() / 2);
    case Qt::Key_Home:
      return Fit();
    case Qt::Key_Escape:
      if (gesture_ == Gesture::Drag) return EndDrag({});
      if (gesture_ == Gesture::None && mark_) return DropMark();
      gesture_ = Gesture::None;
      return update();
    default:
      QWidget::keyPressEvent(event);
  }
}

// ---- The reading mark, which the keyboard moves in the place of a pointer

void MapCanvas::MoveMark(QPointF by) {
  if (content_.IsEmpty()) return;
  if (!mark_ || !window_.rect.contains(window_.ToScreen(*mark_))) {
    mark_ = window_.ToMap(window_.rect.center());
    return PointAtMark();
  }
  const QPointF to = window_.ToScreen(*mark_) + by;
  mark_ = window_.ToMap(to);
  if (!window_.rect.contains(to)) Pan((window_.rect.center() - to) / 2);
  PointAtMark();
}

void MapCanvas::PointAtMark() {
  // What follows the pointer follows the mark.
  draggedTo_ = window_.ToScreen(*mark_);
  isPointed_ = true;
  emit PointedAt(DrawnText(*mark_) + TextAt(*mark_));
  update();
}

void MapCanvas::DropMark() {
  if (!std::exchange(mark_, {})) return;
  isPointed_ = false;
  emit PointedAt({});
  update();
}

void MapCanvas::ClickAtMark() {
  const MapPoint place = *mark_;
  if (request_) {
    // The second time at one place is what a double click is.
    const std::vector<MapPoint> before = drawn_;
    TakeClick(place);
    if (request_ && drawn_ == before) return EndLine();
    isTaken_ = false;
    return mark_ ? PointAtMark() : update();
  }
  if (drag_) {
    if (drag_->moved) drag_->moved(place, place);
    return EndDrag(place);
  }
  // The page may be replaced by what the click does.
  if (const auto picked = content_.picked) picked(PickAt(place));
}

void MapCanvas::DrawMark(QPainter& painter) {
  painter.save();
  painter.setClipRect(window_.rect);
  const double zoom = Theme::Get().Zoom();
  DrawTarget(painter, window_.ToScreen(*mark_), kTargetSize * zoom, zoom);
  painter.restore();
}

void MapCanvas::SetDrag(std::optional<MapDrag> drag) {
  if (gesture_ == Gesture::Drag) EndDrag({});
  drag_ = std::move(drag);
  update();
}

void MapCanvas::EndDrag(std::optional<MapPoint> place) {
  gesture_ = Gesture::None;
  // It may be another one behind that.
  if (const auto ended = drag_->ended) ended(place);
  update();
}

void MapCanvas::leaveEvent(QEvent* /*event*/) {
  isPointed_ = false;
  if (!drawn_.empty() || drag_) update();
  emit PointedAt({});
}

// ---- What a page asks of the user

void MapCanvas::Ask(std::optional<MapRequest> request) {
  const bool isSame = request && request_ && request->AsksSame(*request_);
  const bool isNew = request && !isSame;
  request_ = std::move(request);
  if (isSame) return;
  drawn_.clear();
  // Esc is to be heard here.
  if (isNew && isVisible()) setFocus(Qt::OtherFocusReason);
  SyncCursor();
  update();
}

void MapCanvas::SyncCursor() { setCursor(request_ ? TargetCursor(Theme::Get().Zoom()) : QCursor(Qt::CrossCursor)); }

void MapCanvas::TakeClick(MapPoint clicked) {
  // No more digits than a pixel tells apart.
  const double step = std::pow(10.0, std::floor(std::log10(window_.metresPerPixel)));
  const MapPoint place{std::round(clicked.x / step) * step, std::round(clicked.y / step) * step};
  if (request_->kind == MapRequest::Kind::Line) {
    if (drawn_.empty() || !(drawn_.back() == place)) drawn_.push_back(place);
    return update();
  }
  drawn_ = {place};
  isTaken_ = true;
  Answer();
}

void MapCanvas::EndLine() {
  if (request_->kind == MapRequest::Kind::Line && drawn_.size() > 1) Answer();
}

void MapCanvas::Answer() {
  // The page may ask the next question, or be replaced by what the answer does.
  const MapRequest answered = *std::exchange(request_, {});
  const std::vector<MapPoint> points = std::exchange(drawn_, {});
  SyncCursor();
  update();
  if (answered.taken) answered.taken(points);
}

void MapCanvas::GiveUp() {
  const MapRequest left = *std::exchange(request_, {});
  drawn_.clear();
  SyncCursor();
  update();
  if (left.givenUp) left.givenUp();
}

bool MapCanvas::PressInRequest(int key) {
  switch (key) {
    case Qt::Key_Escape:
      // First a box that is being drawn.
      if (gesture_ == Gesture::Box) return false;
      GiveUp();
      return true;
    case Qt::Key_Return:
    case Qt::Key_Enter:
      if (mark_)
        ClickAtMark();
      else
        EndLine();
      return true;
    case Qt::Key_Backspace:
      if (!drawn_.empty()) drawn_.pop_back();
      update();
      return true;
    default:
      return false;
  }
}

QString MapCanvas::DrawnText(MapPoint place) const {
  if (!request_ || drawn_.empty()) return {};
  std::vector<MapPoint> line = drawn_;
  line.push_back(place);
  return tr("length %1").arg(CoordinateUnit(units_).Value(std::round(LengthOf(line)))) + "   ";
}

void MapCanvas::DrawRequest(QPainter& painter) {
  painter.setRenderHint(QPainter::Antialiasing);
  painter.save();
  painter.setClipRect(window_.rect);
  DrawnMap map = Drawn();
  std::vector<MapPoint> line = drawn_;
  if (isPointed_ && !drawn_.empty()) line.push_back(window_.ToMap(draggedTo_));
  std::vector<QPolygonF> seen;
  AddScreenLine(seen, line, false, map);
  DrawEdgedLines(painter, seen, kHighlightColor, 2, map);
  for (const MapPoint& point : drawn_) DrawMarker(painter, window_.ToScreen(point), true, 0.8 * map.zoom);
  painter.restore();
  const double widest = std::max(window_.rect.width() - 2 * Scaled(50), Scaled(80));
  QRectF chip = QFontMetricsF(font()).boundingRect(QRectF(0, 0, widest, height()), Qt::AlignCenter | Qt::TextWordWrap,
                                                   Translated(request_->prompt));
  chip.adjust(-Scaled(12), -Scaled(6), Scaled(12), Scaled(6));
  chip.moveCenter({window_.rect.center().x(), 0});
  chip.moveTop(window_.rect.top() + Scaled(8));
  DrawChip(painter, chip, Translated(request_->prompt), palette());
}

}  // namespace tervane
