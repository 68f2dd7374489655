// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/relief/relief_canvas.h"

#include <QMouseEvent>
#include <QPainter>
#include <QPainterPath>
#include <QPromise>
#include <QThreadPool>
#include <algorithm>
#include <array>
#include <cmath>
#include <numbers>

#include "platform/item_types.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/shown_unit.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr std::size_t kCellsWhileMoving = 120'000;
constexpr int kCoarsePixels = 2;  ///< Of the screen, for one of a coarse picture.
constexpr int kRest = 120;        ///< In milliseconds, until the view is taken to stand still.
constexpr double kTurnPerPixel = 0.35, kTurnPerKey = 5, kStepOfZoom = 1.25;
constexpr double kSteepest = 90, kFlattest = -60;
constexpr int kMetre = 1000;

}  // namespace

ReliefCanvas::ReliefCanvas(QWidget* parent) : QWidget(parent) {
  setMouseTracking(true);
  setLayoutDirection(Qt::LeftToRight);
  setFocusPolicy(Qt::StrongFocus);
  setMinimumSize(Theme::Get().Scaled(240), Theme::Get().Scaled(180));
  setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Expanding);
  setCursor(Qt::OpenHandCursor);
  setAccessibleName(tr("3D view"));
  camera_.heading = 20;
  rest_.setSingleShot(true);
  rest_.setInterval(kRest);
  connect(&rest_, &QTimer::timeout, this, &ReliefCanvas::StartFine);
  connect(&watcher_, &QFutureWatcher<std::shared_ptr<ReliefPicture>>::finished, this, [this] {
    if (watcher_.future().resultCount() == 0) return;
    // One that was given up has no pixels.
    if (const auto made = watcher_.result(); made->width > 0) Take(std::move(*made));
  });
  connect(&Theme::Get(), &Theme::Changed, this, [this] { update(); });
}

ReliefCanvas::~ReliefCanvas() { GiveUpFine(); }

void ReliefCanvas::SetRelief(std::shared_ptr<Relief> relief, const DisplayUnits& units, const QString& message) {
  GiveUpFine();
  const bool isSamePlace = relief_ && relief && relief_->raster == relief->raster;
  relief_ = std::move(relief);
  units_ = units;
  message_ = message;
  if (!isSamePlace) {
    isFitted_ = true;
    part_ = {};
  }
  if (isFitted_)
    Fit();
  else
    Move();
}

void ReliefCanvas::Change(const std::function<void(Relief& relief)>& change) {
  if (!relief_) return;
  GiveUpFine();
  change(*relief_);
  Move();
}

void ReliefCanvas::SetExaggeration(double times) {
  camera_.exaggeration = times;
  if (isFitted_)
    Fit();
  else
    Move();
}

void ReliefCanvas::Turn(double heading, double pitch) {
  camera_.heading = std::fmod(camera_.heading + heading + 360, 360);
  camera_.pitch = std::clamp(camera_.pitch + pitch, kFlattest, kSteepest);
  Move();
}

void ReliefCanvas::Pan(QPointF by) {
  isFitted_ = false;
  camera_.Pan(by.x(), by.y());
  Move();
}

void ReliefCanvas::SetPart(const ReliefPart& part) {
  part_ = part;
  Move();
}

void ReliefCanvas::Fit() {
  isFitted_ = true;
  camera_.width = width();
  camera_.rows = height();
  if (relief_) camera_.Fit(*relief_);
  Move();
}

void ReliefCanvas::Zoom(double factor) {
  camera_.metresPerPixel /= factor;
  isFitted_ = false;
  Move();
}

// ---- Drawing

ReliefCamera ReliefCanvas::CameraFor(double pixelRatio) const {
  ReliefCamera camera = camera_;
  camera.width = std::max(1, static_cast<int>(std::lround(width() * pixelRatio)));
  camera.rows = std::max(1, static_cast<int>(std::lround(height() * pixelRatio)));
  camera.metresPerPixel /= pixelRatio;
  return camera;
}

void ReliefCanvas::Move() {
  GiveUpFine();
  if (relief_ && isVisible()) DrawCoarse();
  update();
  emit Moved();
}

void ReliefCanvas::DrawCoarse() {
  Take(DrawRelief(*relief_, CameraFor(1.0 / kCoarsePixels), {part_, EveryFor(*relief_, kCellsWhileMoving)}));
  rest_.start();
}

void ReliefCanvas::StartFine() {
  if (!relief_ || !isVisible()) return;
  GiveUpFine();
  isGivenUp_ = std::make_shared<std::atomic<bool>>(false);
  auto promise = std::make_shared<QPromise<std::shared_ptr<ReliefPicture>>>();
  watcher_.setFuture(promise->future());
  QThreadPool::globalInstance()->start([promise, relief = std::shared_ptr<const Relief>(relief_),
                                        camera = CameraFor(devicePixelRatioF()), part = part_, flag = isGivenUp_] {
    promise->start();
    promise->addResult(std::make_shared<ReliefPicture>(DrawRelief(*relief, camera, {part, 1, flag.get()})));
    promise->finish();
  });
}

void ReliefCanvas::GiveUpFine() {
  rest_.stop();
  if (!isGivenUp_) return;
  *isGivenUp_ = true;
  // What is drawn may be changed from now on.
  watcher_.waitForFinished();
  watcher_.setFuture({});
  isGivenUp_.reset();
}

void ReliefCanvas::Take(ReliefPicture picture) {
  picture_ = std::move(picture);
  image_ = QImage(reinterpret_cast<const uchar*>(picture_.pixels.data()), picture_.width, picture_.height,
                  picture_.width * 4, QImage::Format_ARGB32);
  update();
}

void ReliefCanvas::WaitUntilFine() {
  if (!relief_) return;
  GiveUpFine();
  Take(DrawRelief(*relief_, CameraFor(devicePixelRatioF()), {part_}));
}

QImage ReliefCanvas::Picture(double pixelRatio) {
  QImage picture((QSizeF(size()) * pixelRatio).toSize(), QImage::Format_ARGB32_Premultiplied);
  picture.setDevicePixelRatio(pixelRatio);
  picture.fill(palette().color(QPalette::Base));
  if (!relief_) return picture;
  const ReliefPicture drawn = DrawRelief(*relief_, CameraFor(pixelRatio), {part_});
  QPainter painter(&picture);
  painter.drawImage(QRectF(rect()), QImage(reinterpret_cast<const uchar*>(drawn.pixels.data()), drawn.width,
                                           drawn.height, drawn.width * 4, QImage::Format_ARGB32));
  DrawMarks(painter, rect());
  return picture;
}

void ReliefCanvas::paintEvent(QPaintEvent* /*event*/) {
  QPainter painter(this);
  painter.fillRect(rect(), palette().color(QPalette::Base));
  if (!relief_) {
    painter.setPen(Theme::Get().QuietColor());
    const int margin = Theme::Get().Scaled(16);
    painter.drawText(rect().adjusted(margin, margin, -margin, -margin), Qt::AlignCenter | Qt::TextWordWrap, message_);
    return;
  }
  painter.setRenderHint(QPainter::SmoothPixmapTransform);
  painter.drawImage(QRectF(rect()), image_);
  DrawMarks(painter, rect());
}

void ReliefCanvas::DrawMarks(QPainter& painter, const QRectF& place) const {
  painter.setRenderHint(QPainter::Antialiasing);
  const double margin = Theme::Get().Scaled(14);
  DrawHeights(painter);
  DrawWellNames(painter);
  DrawNorth(painter, {place.right() - Theme::Get().Scaled(40), place.top() + Theme::Get().Scaled(44)});
  DrawLength(painter, {place.left() + margin, place.bottom() - margin});
}

/// Heights along the upright edge of the block that is farthest to the left.
void ReliefCanvas::DrawHeights(QPainter& painter) const {
  const auto heights = relief_->Heights();
  if (!heights || camera_.pitch > 80 || !(heights->second > heights->first)) return;
  const GridTransform transform(relief_->raster);
  MapPoint corner;
  double left = std::numeric_limits<double>::max();
  for (const double i : {part_.west, part_.east})
    for (const double j : {part_.south, part_.north}) {
      const MapPoint here = transform.ToWorld({i * relief_->raster.nx, j * relief_->raster.ny});
      if (const double x = camera_.See(here, heights->first).x; x < left) {
        left = x;
        corner = here;
      }
    }
  const auto at = [&](double height) {
    const auto seen = camera_.See(corner, height);
    return QPointF(seen.x - Theme::Get().Scaled(8), seen.y);
  };
  const ShownUnit length(quantity::kElevation, kMetre, &units_);
  const bool isLength = !relief_->unit;
  const auto shown = [&](double height) { return isLength ? length.Shown(height) : height; };
  const double lowest = shown(heights->first), highest = shown(heights->second);
  const double pixels = std::abs(at(heights->first).y() - at(heights->second).y());
  const double rowHeight = painter.fontMetrics().height() * 1.6;
  if (pixels < rowHeight) return;
  const double step = NiceStep((highest - lowest) * rowHeight / pixels);
  painter.setPen(QPen(palette().color(QPalette::Text), 1));
  painter.drawLine(at(heights->first), at(heights->second));
  for (double height = std::ceil(lowest / step) * step; height <= highest; height += step) {
    const QPointF tick = at(isLength ? length.Stored(height) : height);
    painter.drawLine(tick, tick - QPointF(Theme::Get().Scaled(4), 0));
    const QString text = QString::number(std::abs(height) < step / 2 ? 0 : height, 'g', 6);
    painter.drawText(QRectF(tick.x() - 206, tick.y() - rowHeight / 2, 200 - Theme::Get().Scaled(2), rowHeight),
                     Qt::AlignRight | Qt::AlignVCenter, text);
  }
  painter.drawText(QRectF(at(heights->second) + QPointF(-150, -1.6 * rowHeight), QSizeF(160, rowHeight)),
                   Qt::AlignRight | Qt::AlignVCenter, ToQt(isLength ? length.Text() : *relief_->unit));
}

void ReliefCanvas::DrawNorth(QPainter& painter, QPointF at) const {
  const double length = Theme::Get().Scaled(26), turn = camera_.heading * std::numbers::pi / 180;
  const double flat = std::max(0.25, std::abs(std::sin(camera_.pitch * std::numbers::pi / 180)));
  const QPointF north(-std::sin(turn) * length, -std::cos(turn) * length * flat * (camera_.pitch < 0 ? -1 : 1));
  const QPointF side = QPointF(-north.y(), north.x()) * 0.28;
  QPainterPath arrow(at + north);
  arrow.lineTo(at - north * 0.6 + side);
  arrow.lineTo(at - north * 0.3);
  arrow.lineTo(at - north * 0.6 - side);
  arrow.closeSubpath();
  painter.setPen(QPen(palette().color(QPalette::Text), 1.2));
  painter.setBrush(palette().color(QPalette::Text));
  painter.drawPath(arrow);
  const double text = painter.fontMetrics().height();
  painter.drawText(QRectF(at + north * 1.45 - QPointF(text, text / 2), QSizeF(2 * text, text)), Qt::AlignCenter, "N");
}

/// Lengths to the right are true from wherever one looks.
void ReliefCanvas::DrawLength(QPainter& painter, QPointF at) const {
  const ShownUnit unit(quantity::kMapCoordinate, kMetre, &units_);
  const double shown = NiceStep(unit.Shown(camera_.metresPerPixel) * Theme::Get().Scaled(90));
  const double pixels = unit.Stored(shown) / camera_.metresPerPixel, tick = Theme::Get().Scaled(5);
  painter.setPen(QPen(palette().color(QPalette::Text), 1.2));
  painter.drawLine(at, at + QPointF(pixels, 0));
  for (const double x : {0.0, pixels}) painter.drawLine(at + QPointF(x, -tick), at + QPointF(x, 0));
  const QString text =
      tr("%1 %2, heights x %3")
          .arg(QString::number(shown, 'g', 6), ToQt(unit.Text()), QString::number(camera_.exaggeration, 'g', 4));
  painter.drawText(at + QPointF(0, -1.6 * tick), text);
}

void ReliefCanvas::DrawWellNames(QPainter& painter) const {
  constexpr std::size_t kMostNames = 60;
  if (relief_->wells.size() > kMostNames) return;
  const GridTransform transform(relief_->raster);
  std::vector<QRectF> taken;
  for (const ReliefWell& well : relief_->wells) {
    const MapPoint cells = transform.ToCells(well.place);
    if (cells.x < part_.west * relief_->raster.nx || cells.x > part_.east * relief_->raster.nx ||
        cells.y < part_.south * relief_->raster.ny || cells.y > part_.north * relief_->raster.ny)
      continue;
    const auto top = camera_.See(well.place, well.top);
    const QRectF box = painter.fontMetrics().boundingRect(ToQt(well.name));
    const QPointF at(top.x - box.width() / 2, top.y - Theme::Get().Scaled(5));
    const QRectF place = box.translated(at).adjusted(-2, -1, 2, 1);
    if (std::ranges::any_of(taken, [&place](const QRectF& other) { return other.intersects(place); })) continue;
    taken.push_back(place);
    QColor paper = palette().color(QPalette::Base);
    paper.setAlpha(190);
    painter.fillRect(place, paper);
    painter.setPen(palette().color(QPalette::Text));
    painter.drawText(at, ToQt(well.name));
  }
}

// ---- Pointing and moving

QString ReliefCanvas::TextAt(QPointF place) const {
  if (!relief_ || picture_.width == 0 || width() == 0) return {};
  const int x = static_cast<int>(place.x() * picture_.width / width());
  const int y = static_cast<int>(place.y() * picture_.height / height());
  if (x < 0 || y < 0 || x >= picture_.width || y >= picture_.height) return {};
  const std::size_t at =
      static_cast<std::size_t>(y) * static_cast<std::size_t>(picture_.width) + static_cast<std::size_t>(x);
  if (picture_.body[at] == ReliefPicture::kNothing) return {};
  const ReliefBody& body = relief_->bodies[picture_.body[at]];
  const std::size_t cell = picture_.cell[at], nx = static_cast<std::size_t>(relief_->raster.nx);
  const MapPoint world = GridTransform(relief_->raster)
                             .ToWorld({static_cast<double>(cell % nx) + 0.5, static_cast<double>(cell / nx) + 0.5});
  const ShownUnit length(quantity::kElevation, kMetre, &units_), across(quantity::kMapCoordinate, kMetre, &units_);
  const auto height = [&](float value) {
    if (!relief_->unit) return length.Value(double{value});
    return QString("%1 %2").arg(QString::number(double{value}, 'g', 6), ToQt(*relief_->unit)).trimmed();
  };
  QString text = tr("%1  x %2, y %3").arg(ToQt(body.name), across.Value(world.x), across.Value(world.y));
  if (body.IsSurface()) return text + tr("  at %1").arg(height(body.top[cell]));
  return text + tr("  from %1 to %2, %3 thick")
                    .arg(height(body.top[cell]), height(body.bottom[cell]), height(body.top[cell] - body.bottom[cell]));
}

void ReliefCanvas::resizeEvent(QResizeEvent* /*event*/) {
  camera_.width = width();
  camera_.rows = height();
  if (isFitted_)
    Fit();
  else
    Move();
}

void ReliefCanvas::showEvent(QShowEvent* event) {
  QWidget::showEvent(event);
  Move();
}

void ReliefCanvas::mousePressEvent(QMouseEvent* event) { draggedTo_ = event->position(); }

void ReliefCanvas::mouseMoveEvent(QMouseEvent* event) {
  const QPointF by = event->position() - draggedTo_;
  draggedTo_ = event->position();
  const bool isPanned = (event->buttons() & (Qt::MiddleButton | Qt::RightButton)) ||
                        (event->buttons() && (event->modifiers() & Qt::ShiftModifier));
  if (isPanned) {
    Pan(by);
  } else if (event->buttons() & Qt::LeftButton) {
    Turn(by.x() * kTurnPerPixel, by.y() * kTurnPerPixel);
  } else {
    emit PointedAt(TextAt(event->position()));
  }
}

void ReliefCanvas::mouseDoubleClickEvent(QMouseEvent* /*event*/) { Fit(); }

void ReliefCanvas::wheelEvent(QWheelEvent* event) {
  constexpr double kNotch = 120;
  Zoom(std::pow(kStepOfZoom, event->angleDelta().y() / kNotch));
  event->accept();
}

void ReliefCanvas::keyPressEvent(QKeyEvent* event) {
  // What is seen moves as on a map: towards the key's side lies more of the ground.
  const double step = event->modifiers() & Qt::ShiftModifier ? 0.1 * std::min(width(), height()) : 0;
  switch (event->key()) {
    case Qt::Key_Left:
      return step > 0 ? Pan({step, 0}) : Turn(kTurnPerKey, 0);
    case Qt::Key_Right:
      return step > 0 ? Pan({-step, 0}) : Turn(-kTurnPerKey, 0);
    case Qt::Key_Up:
      return step > 0 ? Pan({0, step}) : Turn(0, kTurnPerKey);
    case Qt::Key_Down:
      return step > 0 ? Pan({0, -step}) : Turn(0, -kTurnPerKey);
    case Qt::Key_Plus:
    case Qt::Key_Equal:
      return Zoom(kStepOfZoom);
    case Qt::Key_Minus:
      return Zoom(1 / kStepOfZoom);
    case Qt::Key_Home:
      return Fit();
    default:
      QWidget::keyPressEvent(event);
  }
}

void ReliefCanvas::leaveEvent(QEvent* /*event*/) { emit PointedAt({}); }

}  // namespace tervane
