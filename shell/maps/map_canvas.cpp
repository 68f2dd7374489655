// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <QApplication>
#include <QFutureWatcher>
#include <QPainter>
#include <QPainterPath>
#include <QPromise>
#include <QThreadPool>
#include <algorithm>
#include <cmath>

#include "shell/maps/map_canvas_parts.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr std::size_t kCellsAtOnce = 400'000;  ///< Made ready before the map is shown: a few milliseconds.
constexpr int kMargin = 8;
constexpr double kReach = 6;  ///< How near a line or point must be to be pointed at, in pixels at zoom 1.
constexpr int kChainageType = 100143;

using Made = std::shared_ptr<const GridPicture>;

/// The nearest point whose marker is at the place.
std::optional<std::size_t> PointAt(const PointLayer& layer, MapPoint place, double metresPerPixel) {
  std::optional<std::size_t> found;
  double nearest = std::max(Scaled(kReach), MarkerReach(layer, Theme::Get().Zoom())) * metresPerPixel;
  for (std::size_t i = 0; i < layer.points.size(); ++i) {
    const double distance = std::hypot(layer.points[i].x - place.x, layer.points[i].y - place.y);
    if (distance >= nearest) continue;
    nearest = distance;
    found = i;
  }
  return found;
}

}  // namespace

MapCanvas::MapCanvas(QWidget* parent)
    : QWidget(parent), ground_(std::make_unique<Scene>()), vectors_(std::make_unique<Scene>()) {
  setMouseTracking(true);
  setFocusPolicy(Qt::StrongFocus);
  setMinimumSize(Theme::Get().Scaled(160), Theme::Get().Scaled(120));
  setSizePolicy(QSizePolicy::Expanding, QSizePolicy::Expanding);
  setCursor(Qt::CrossCursor);
  setAccessibleName(tr("Map"));
  connect(&Theme::Get(), &Theme::Changed, this, [this] { Arrange(); });
}

MapCanvas::~MapCanvas() = default;

// ---- Content

void MapCanvas::SetContent(MapContent content, const DisplayUnits* units) {
  const DisplayUnits chosen = units ? *units : DisplayUnits();
  const std::optional<Envelope> area = WholeArea();
  const bool wasEmpty = content_.IsEmpty();
  content_ = std::move(content);
  units_ = chosen;
  std::vector<std::unique_ptr<Layer>> old = std::move(layers_);
  layers_.clear();
  for (const GridLayer& grid : content_.grids) {
    const int unitKey = units_.UnitKey(grid.grid->ItemType());
    const auto same = std::ranges::find_if(old, [&](const auto& layer) {
      return layer && layer->grid.grid == grid.grid && HasSameColors(layer->grid, grid) && layer->unitKey == unitKey;
    });
    if (same != old.end()) {
      layers_.push_back(std::move(*same));
      layers_.back()->grid = grid;
      continue;
    }
    layers_.push_back(std::make_unique<Layer>());
    layers_.back()->grid = grid;
    layers_.back()->unitKey = unitKey;
    // Another step of the same item: the one before stays until the new picture is there.
    const std::size_t place = layers_.size() - 1;
    const Layer* before = place < old.size() ? old[place].get() : nullptr;
    if (before && before->unitKey == unitKey && HasSameColors(before->grid, grid) &&
        before->grid.grid->ItemName() == grid.grid->ItemName() &&
        before->grid.grid->ItemType() == grid.grid->ItemType() &&
        before->grid.grid->Geometry() == grid.grid->Geometry()) {
      layers_.back()->picture = old[place]->picture;
      layers_.back()->isOld = true;
    }
    Prepare(*layers_.back());
  }
  isPassing_ = false;
  shapes_.clear();
  for (const ShapeLayer& layer : content_.shapes) shapes_.emplace_back(layer);
  domain_.reset();
  if (content_.domain) domain_.emplace(ShapeLayer{.shapes = content_.domain, .isDomain = true});
  lines_.clear();
  for (const LineLayer& layer : content_.lines) lines_.emplace_back(layer, units_);
  FollowBackdrop(content_.below, below_);
  FollowBackdrop(content_.above, above_);
  if (wasEmpty || WholeArea() != area) {
    isFitted_ = true;
    DropMark();
  }
  Arrange();
}

void MapCanvas::Prepare(Layer& layer) {
  if (layer.grid.grid->Geometry().CellCount() <= kCellsAtOnce) {
    layer.picture = GridPicture::Make(layer.grid, units_, *layer.isGivenUp);
    layer.isOld = false;
    return;
  }
  auto promise = std::make_shared<QPromise<Made>>();
  connect(&layer.watcher, &QFutureWatcher<Made>::finished, this, [this, &layer] {
    layer.picture = layer.watcher.result();
    layer.isOld = false;
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

void MapCanvas::FollowBackdrop(const std::vector<BackdropLayer>& layers, std::vector<std::unique_ptr<Backdrop>>& made) {
  std::vector<std::unique_ptr<Backdrop>> now;
  for (const BackdropLayer& layer : layers) {
    auto& backdrop = *now.emplace_back(std::make_unique<Backdrop>());
    backdrop.layer = SharedLayer::Of(layer.drawn);
    backdrop.transparency = layer.transparency;
    if (backdrop.layer->IsReady()) continue;
    connect(&backdrop.watcher, &QFutureWatcher<SharedLayer::Picture>::finished, this, [this] { Arrange(); });
    backdrop.watcher.setFuture(backdrop.layer->Future());
  }
  // What is shown on goes from the old to the new, and is not let go between them.
  made = std::move(now);
}

bool MapCanvas::IsPreparing() const {
  const auto isMade = [](const auto& layer) { return layer->layer->IsReady(); };
  return !std::ranges::all_of(layers_, [](const auto& layer) { return layer->picture && !layer->isOld; }) ||
         !std::ranges::all_of(below_, isMade) || !std::ranges::all_of(above_, isMade);
}

void MapCanvas::ShowFrame(const GridLayer& grid, std::shared_ptr<const GridPicture> picture,
                          std::optional<ArrowLayer> arrows, bool isPassing) {
  if (layers_.empty()) return;
  content_.grids.front() = grid;
  content_.arrows = std::move(arrows);
  // Another one, so that a picture in the making is given up.
  layers_.front() = std::make_unique<Layer>();
  layers_.front()->grid = grid;
  layers_.front()->unitKey = units_.UnitKey(grid.grid->ItemType());
  layers_.front()->picture = std::move(picture);
  isPassing_ = isPassing;
  if (isPointed_ && gesture_ == Gesture::None) emit PointedAt(TextAt(window_.ToMap(draggedTo_)));
  Redraw();
}

void MapCanvas::UpdateCells(std::span<const CellWindow> windows) {
  if (windows.empty() || layers_.empty() || !layers_.front()->picture || layers_.front()->isOld) return;
  // It was made here, and nobody else draws it.
  std::const_pointer_cast<GridPicture>(layers_.front()->picture)->Update(layers_.front()->grid, windows);
  if (scene_.isNull()) return update();
  // What lies in the corners of those cells, and as much as a coarser level shows of them.
  const GridTransform transform(layers_.front()->grid.grid->Geometry());
  const double around = 1 + 2 * window_.metresPerPixel / layers_.front()->grid.grid->Geometry().cellSize;
  QPolygonF corners;
  for (const CellWindow& cells : windows)
    for (const double i : {cells.i - around, cells.i + cells.nx + around})
      for (const double j : {cells.j - around, cells.j + cells.ny + around})
        corners << window_.ToScreen(transform.ToWorld({i, j}));
  const QRectF part = QRectF(corners.boundingRect().toAlignedRect()) & window_.rect;
  if (part.isEmpty()) return;
  QPainter painter(&scene_);
  painter.setFont(font());
  painter.setRenderHint(QPainter::Antialiasing);
  painter.setClipRect(part);
  painter.fillRect(part, palette().color(QPalette::Base));
  RenderPart(painter, devicePixelRatioF(), true, part);
  painter.end();
  update(part.toAlignedRect());
}

void MapCanvas::RemakeGrid(const GridLayer& grid) {
  if (layers_.empty()) return;
  content_.grids.front() = grid;
  auto layer = std::make_unique<Layer>();
  layer->grid = grid;
  layer->unitKey = units_.UnitKey(grid.grid->ItemType());
  layer->picture = layers_.front()->picture;
  layer->isOld = layer->picture != nullptr;
  layers_.front() = std::move(layer);
  Prepare(*layers_.front());
  Arrange();
}

const GridPicture* MapCanvas::PictureOf(std::size_t grid) const {
  return grid < layers_.size() && !layers_[grid]->isOld ? layers_[grid]->picture.get() : nullptr;
}

void MapCanvas::WaitUntilReady() {
  if (!IsPreparing()) return;
  for (const auto& layer : layers_) {
    if (layer->picture && !layer->isOld) continue;
    layer->watcher.waitForFinished();
    layer->picture = layer->watcher.result();
    layer->isOld = false;
  }
  for (const auto* backdrop : {&below_, &above_})
    for (const auto& layer : *backdrop) QFuture(layer->layer->Future()).waitForFinished();
  Arrange();
}

std::optional<Envelope> MapCanvas::WholeArea() const {
  if (content_.area) return content_.area;
  std::optional<Envelope> all;
  for (const GridLayer& layer : content_.grids)
    if (layer.grid->Geometry().CellCount() > 0) Extend(all, layer.grid->GetEnvelope());
  for (const ShapePicture& layer : shapes_) Extend(all, layer.Area());
  for (const LinePicture& layer : lines_) Extend(all, layer.Area());
  for (const PointLayer& layer : content_.points) Extend(all, EnvelopeAround(layer.points));
  if (all) return all;
  // The backdrop decides only where nothing else is shown.
  for (const auto* backdrop : {&below_, &above_})
    for (const auto& layer : *backdrop)
      if (const auto picture = layer->layer->Get()) Extend(all, picture->Area());
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
  hasTicks_ = map.width() > Scaled(240) && map.height() > Scaled(170);
  if (hasTicks_) map.adjust(metrics.height() + Scaled(6), 0, 0, -metrics.height() - Scaled(6));
  legendPlace_ = {};
  // On a small map the legend stands back where it would take more than nearly half of the place.
  if (const double width = LegendWidth(); width > 0 && width + Scaled(kLegendPadding) < 0.45 * map.width()) {
    legendPlace_ = QRectF(map.right() - width, map.top(), width, map.height());
    map.setRight(legendPlace_.left() - Scaled(kLegendPadding));
  }
  window_.rect = map.toAlignedRect();
  ground_->picture = vectors_->picture = {};
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
  if (!content_.grids.empty() && !isPassing_) {
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
  if (!lines_.empty()) {
    if (const auto at = lines_.front().At(place, Reach())) {
      pick.line = at->line;
      pick.chainage = at->chainage;
    }
  }
  if (!content_.points.empty()) pick.point = PointAt(content_.points.front(), place, window_.metresPerPixel);
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
    const auto own = std::ranges::find_if(layer.classes, [&](const auto& each) { return pick.value == each.value; });
    if (own != layer.classes.end())
      text += "   " + ToQt(own->name);
    else
      text += "   " + (pick.value ? ShownUnit(layer.grid->ItemType(), layer.grid->ItemUnit(), &units_)
                                        .Value(static_cast<double>(*pick.value))
                                  : tr("no value"));
  }
  if (pick.shape) {
    const QString value = ToQt(pick.shapeValue);
    text += "   " + (value.isEmpty() ? tr("shape %1").arg(*pick.shape + 1)
                                     : tr("shape %1: %2").arg(*pick.shape + 1).arg(value));
  }
  if (pick.line) {
    const LineLayer& layer = content_.lines.front();
    const MapLine& line = (*layer.lines)[*pick.line];
    text += "   " + (line.name.empty() ? tr("line %1").arg(*pick.line + 1) : ToQt(line.name));
    text += ", " + tr("chainage %1").arg(ShownUnit(kChainageType, 1000, &units_).Value(std::round(pick.chainage)));
    if (layer.painted && line.value) text += "   " + lines_.front().Colors().TextOf(*line.value);
  }
  if (pick.point) {
    const PointLayer& layer = content_.points.front();
    text += "   " + tr("point %1").arg(*pick.point + 1);
    if (layer.labels.size() == layer.points.size()) text += ": " + ToQt(layer.labels[*pick.point]);
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
  Render(painter, pixelRatio, false);
  return picture;
}

void MapCanvas::paintEvent(QPaintEvent* /*event*/) {
  if (scene_.isNull()) {
    scene_ = QPixmap((QSizeF(size()) * devicePixelRatioF()).toSize());
    scene_.setDevicePixelRatio(devicePixelRatioF());
    QPainter painter(&scene_);
    painter.setFont(font());
    Render(painter, devicePixelRatioF(), true);
  }
  QPainter painter(this);
  painter.drawPixmap(0, 0, scene_);
  if (request_ && !content_.IsEmpty()) DrawRequest(painter);
  if (drag_ && drag_->draw && isPointed_ && !content_.IsEmpty()) {
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setClipRect(window_.rect);
    const bool isDrag = gesture_ == Gesture::Drag;
    drag_->draw(painter, window_, window_.ToMap(draggedTo_),
                isDrag ? std::optional(window_.ToMap(pressedAt_)) : std::nullopt);
    painter.restore();
  }
  if (mark_ && !content_.IsEmpty()) DrawMark(painter);
  if (gesture_ != Gesture::Box) return;
  QColor veil = palette().color(QPalette::Highlight);
  painter.setPen(QPen(veil, 1.5));
  veil.setAlpha(50);
  painter.setBrush(veil);
  painter.drawRect(QRectF(pressedAt_, draggedTo_).normalized());
}

DrawnMap MapCanvas::Drawn() const {
  // On a small map lines and points are finer too.
  const double small = std::clamp(std::min(window_.rect.width(), window_.rect.height()) / Scaled(400), 0.6, 1.0);
  return {window_, window_.rect, Theme::Get().IsDark(), Theme::Get().Zoom() * small};
}

void MapCanvas::Render(QPainter& painter, double pixelRatio, bool isScreen) {
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
  RenderPart(painter, pixelRatio, isScreen, window_.rect);
  painter.restore();
  DrawFrame(painter);
  DrawLegends(painter, isScreen);
}

void MapCanvas::RenderPart(QPainter& painter, double pixelRatio, bool isScreen, const QRectF& part) {
  RenderLayers(painter, pixelRatio, isScreen, part);
  DrawNorthArrow(painter);
  DrawScaleBar(painter, MakeScaleBar());
  if (IsPreparing()) DrawPreparing(painter);
}

QImage MapCanvas::AreaPicture(const Envelope& area, QSize pixels) {
  WaitUntilReady();
  QImage picture(pixels, QImage::Format_ARGB32_Premultiplied);
  picture.fill(Qt::transparent);
  const MapWindow seen = window_;
  window_.rect = QRectF(QPointF(), QSizeF(pixels));
  window_.centre = {(area.xMin + area.xMax) / 2, (area.yMin + area.yMax) / 2};
  window_.metresPerPixel =
      std::max((area.xMax - area.xMin) / pixels.width(), (area.yMax - area.yMin) / pixels.height());
  QPainter painter(&picture);
  painter.setRenderHint(QPainter::Antialiasing);
  RenderLayers(painter, 1, false, window_.rect);
  window_ = seen;
  return picture;
}

void MapCanvas::RenderLayers(QPainter& painter, double pixelRatio, bool isScreen, const QRectF& part) {
  MapWindow seen = window_;
  seen.rect = part;
  seen.centre = window_.ToMap(part.center());
  if (!below_.empty())
    DrawScene(*ground_, painter, pixelRatio, isScreen, [this, pixelRatio](QPainter& inner, const DrawnMap& map) {
      DrawBackdrop(below_, inner, map, pixelRatio);
    });
  for (const auto& layer : layers_)
    if (layer->picture) layer->picture->Draw(painter, seen, pixelRatio, 1 - layer->grid.transparency);
  DrawCellLines(painter);
  DrawVectors(painter, pixelRatio, isScreen);
  DrawFlow(painter);
  DrawMarkers(painter);
}

void MapCanvas::DrawBackdrop(const std::vector<std::unique_ptr<Backdrop>>& backdrop, QPainter& painter,
                             const DrawnMap& map, double pixelRatio) const {
  for (const auto& layer : backdrop) {
    const auto picture = layer->layer->Get();
    if (!picture) continue;
    painter.setOpacity(1 - layer->transparency);
    picture->Draw(painter, map, pixelRatio);
  }
  painter.setOpacity(1);
}

void MapCanvas::DrawVectors(QPainter& painter, double pixelRatio, bool isScreen) {
  if (shapes_.empty() && lines_.empty() && !domain_ && above_.empty()) return;
  DrawScene(*vectors_, painter, pixelRatio, isScreen, [this, pixelRatio](QPainter& inner, const DrawnMap& map) {
    for (const ShapePicture& shapes : shapes_)
      if (!shapes.ArePoints()) shapes.Draw(inner, map);
    for (const LinePicture& lines : lines_) lines.Draw(inner, map);
    DrawBackdrop(above_, inner, map, pixelRatio);
    if (domain_) domain_->Draw(inner, map);
  });
}

void MapCanvas::DrawScene(Scene& scene, QPainter& painter, double pixelRatio, bool isScreen, const DrawPart& part) {
  DrawnMap map = Drawn();
  painter.setRenderHint(QPainter::Antialiasing);
  if (!isScreen) return part(painter, map);
  const QSize pixels = (QSizeF(size()) * pixelRatio).toSize();
  const bool isAlike = scene.picture.size() == pixels && scene.window.rect == window_.rect &&
                       scene.window.metresPerPixel == window_.metresPerPixel;
  QRegion missing(QRect({}, pixels));
  if (isAlike) {
    const QPointF by = (window_.ToScreen(scene.window.centre) - window_.rect.center()) * pixelRatio;
    const QPoint whole = by.toPoint();
    constexpr double kUnseen = 0.02;  // of a pixel
    if ((by - whole).manhattanLength() < kUnseen && std::abs(whole.x()) < pixels.width() &&
        std::abs(whole.y()) < pixels.height()) {
      missing = {};
      if (!whole.isNull()) scene.picture.scroll(whole.x(), whole.y(), scene.picture.rect(), &missing);
      scene.window.centre.x -= whole.x() / pixelRatio * window_.metresPerPixel;
      scene.window.centre.y += whole.y() / pixelRatio * window_.metresPerPixel;
    } else {
      scene.window = window_;
    }
  } else {
    scene.picture = QPixmap(pixels);
    // Without this a picture has no transparency.
    scene.picture.fill(Qt::transparent);
    scene.picture.setDevicePixelRatio(pixelRatio);
    scene.window = window_;
  }
  map.window = scene.window;
  QPainter inner(&scene.picture);
  inner.setRenderHint(QPainter::Antialiasing);
  for (const QRect& border : missing) {
    const QRectF place(QPointF(border.topLeft()) / pixelRatio, QSizeF(border.size()) / pixelRatio);
    // Also what the frame hides now: it comes into view when the map is moved.
    map.part = place;
    inner.setClipRect(place);
    inner.setCompositionMode(QPainter::CompositionMode_Source);
    inner.fillRect(place, Qt::transparent);
    inner.setCompositionMode(QPainter::CompositionMode_SourceOver);
    part(inner, map);
  }
  inner.end();
  painter.drawPixmap(0, 0, scene.picture);
}

void MapCanvas::DrawMarkers(QPainter& painter) {
  const DrawnMap map = Drawn();
  for (const ShapePicture& shapes : shapes_)
    if (shapes.ArePoints()) shapes.Draw(painter, map);
  LabelPlaces places(window_.rect);
  places.Take(NorthArrowPlace());
  places.Take(MakeScaleBar().box);
  for (const PointLayer& points : content_.points) DrawLabelledPoints(painter, points, map, places);
  for (const LinePicture& lines : lines_) lines.DrawLabels(painter, map, places);
  for (const ShapePicture& shapes : shapes_) shapes.DrawLabels(painter, map, places);
  for (const auto* backdrop : {&above_, &below_})
    for (const auto& layer : *backdrop)
      if (const auto picture = layer->layer->Get(); picture && layer->transparency < 1)
        picture->DrawTexts(painter, map, places);
}

void MapCanvas::DrawPreparing(QPainter& painter) {
  const QString text = tr("Drawing...");
  QRectF chip = QFontMetricsF(font()).boundingRect(text);
  chip.adjust(-Scaled(14), -Scaled(8), Scaled(14), Scaled(8));
  chip.moveCenter(window_.rect.center());
  DrawChip(painter, chip, text, palette());
}

}  // namespace tervane
