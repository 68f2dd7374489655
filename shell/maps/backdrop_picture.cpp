// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/maps/backdrop_picture.h"

#include <QImageReader>
#include <QPromise>
#include <QThreadPool>
#include <algorithm>
#include <cmath>

#include "shell/maps/map_lines.h"
#include "shell/maps/map_rendering.h"
#include "shell/maps/map_shapes.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

using MadePicture = SharedLayer::Picture;

// ---- Images

constexpr int kFinestImage = 4096;  ///< Pixels of a side: more than any screen shows at once.

class ImagePicture : public LayerPicture {
 public:
  ImagePicture(const ImageLayer& layer, QImage image) : layer_(layer), image_(std::move(image)) {}

  std::optional<Envelope> Area() const override {
    return Envelope{std::min(layer_.left, layer_.right), std::min(layer_.bottom, layer_.top),
                    std::max(layer_.left, layer_.right), std::max(layer_.bottom, layer_.top)};
  }
  void Draw(QPainter& painter, const DrawnMap& map, double /*pixelRatio*/) const override {
    const QPointF a = map.window.ToScreen({layer_.left, layer_.top});
    const QPointF b = map.window.ToScreen({layer_.right, layer_.bottom});
    const QPointF size = b - a;
    const QRectF seen = QRectF(a, b).normalized().intersected(map.part.adjusted(-2, -2, 2, 2));
    if (seen.isEmpty() || size.x() == 0 || size.y() == 0) return;
    // Only what is seen of it, at whole pixels of the image: a scaled picture of the rest may have no end of pixels.
    const double acrossPixel = size.x() / image_.width(), downPixel = size.y() / image_.height();
    const auto range = [](double from, double to, int most) {
      const double low = std::clamp(std::floor(std::min(from, to)), 0.0, static_cast<double>(most));
      const double high = std::clamp(std::ceil(std::max(from, to)), 0.0, static_cast<double>(most));
      return std::pair(low, high);
    };
    const auto [left, right] =
        range((seen.left() - a.x()) / acrossPixel, (seen.right() - a.x()) / acrossPixel, image_.width());
    const auto [top, bottom] =
        range((seen.top() - a.y()) / downPixel, (seen.bottom() - a.y()) / downPixel, image_.height());
    if (right <= left || bottom <= top) return;
    const QRectF source(left, top, right - left, bottom - top);
    painter.setRenderHint(QPainter::SmoothPixmapTransform, std::abs(acrossPixel) < 2);
    // A negative side mirrors.
    const QPointF target = a + QPointF(left * acrossPixel, top * downPixel);
    painter.save();
    painter.translate(target);
    painter.scale(acrossPixel, downPixel);
    painter.drawImage(QRectF(QPointF(), source.size()), image_, source);
    painter.restore();
  }

 private:
  ImageLayer layer_;
  QImage image_;
};

MadePicture MakeImage(const ImageLayer& layer, const std::atomic<bool>& isGivenUp) {
  QImageReader reader(ToQt(layer.path));
  reader.setAutoTransform(false);
  const QSize size = reader.size();
  if (size.isValid() && std::max(size.width(), size.height()) > kFinestImage)
    reader.setScaledSize(size.scaled(kFinestImage, kFinestImage, Qt::KeepAspectRatio));
  QImage image = reader.read();
  if (image.isNull() || isGivenUp) return nullptr;
  image = image.convertToFormat(QImage::Format_ARGB32);
  for (int y = 0; y < image.height(); ++y) {
    if (isGivenUp) return nullptr;
    auto* line = reinterpret_cast<QRgb*>(image.scanLine(y));
    for (int x = 0; x < image.width(); ++x) {
      QRgb& pixel = line[x];
      if (layer.transparentColor && (pixel & 0xffffff) == *layer.transparentColor)
        pixel = 0;
      else if (layer.isGrey)
        pixel = qRgba(qGray(pixel), qGray(pixel), qGray(pixel), qAlpha(pixel));
    }
  }
  return std::make_shared<ImagePicture>(layer, image.convertToFormat(QImage::Format_ARGB32_Premultiplied));
}

// ---- Other layers

class GridOfBackdrop : public LayerPicture {
 public:
  GridOfBackdrop(const GridLayer& layer, std::shared_ptr<const GridPicture> picture)
      : layer_(layer), picture_(std::move(picture)) {}
  std::optional<Envelope> Area() const override { return layer_.grid->GetEnvelope(); }
  void Draw(QPainter& painter, const DrawnMap& map, double pixelRatio) const override {
    // The part may reach beyond the frame of the map.
    const MapWindow part{map.part, map.window.ToMap(map.part.center()), map.window.metresPerPixel};
    picture_->Draw(painter, part, pixelRatio, painter.opacity() * (1 - layer_.transparency));
  }

 private:
  GridLayer layer_;
  std::shared_ptr<const GridPicture> picture_;
};

/// What draws shapes or lines.
template <class VectorPicture>
class VectorsOfBackdrop : public LayerPicture {
 public:
  explicit VectorsOfBackdrop(VectorPicture picture) : picture_(std::move(picture)) {}
  std::optional<Envelope> Area() const override { return picture_.Area(); }
  void Draw(QPainter& painter, const DrawnMap& map, double /*pixelRatio*/) const override {
    picture_.Draw(painter, map);
  }
  void DrawTexts(QPainter& painter, const DrawnMap& map, LabelPlaces& places) const override {
    picture_.DrawLabels(painter, map, places);
  }

 private:
  VectorPicture picture_;
};

class PointsOfBackdrop : public LayerPicture {
 public:
  explicit PointsOfBackdrop(const PointLayer& layer) : layer_(layer) {}
  std::optional<Envelope> Area() const override { return EnvelopeAround(layer_.points); }
  void Draw(QPainter& painter, const DrawnMap& map, double /*pixelRatio*/) const override {
    LabelPlaces none(map.part);
    PointLayer markers = layer_;
    markers.labels.clear();
    DrawLabelledPoints(painter, markers, map, none);
  }
  void DrawTexts(QPainter& painter, const DrawnMap& map, LabelPlaces& places) const override {
    if (layer_.labels.size() == layer_.points.size()) DrawLabelledPoints(painter, layer_, map, places);
  }

 private:
  PointLayer layer_;
};

struct PictureMaker {
  const std::atomic<bool>& isGivenUp;

  MadePicture operator()(const ImageLayer& layer) const { return MakeImage(layer, isGivenUp); }
  MadePicture operator()(const GridLayer& layer) const {
    auto picture = GridPicture::Make(layer, DisplayUnits(), isGivenUp);
    return picture ? std::make_shared<GridOfBackdrop>(layer, std::move(picture)) : nullptr;
  }
  MadePicture operator()(const ShapeLayer& layer) const {
    return std::make_shared<VectorsOfBackdrop<ShapePicture>>(ShapePicture(layer));
  }
  MadePicture operator()(const LineLayer& layer) const {
    return std::make_shared<VectorsOfBackdrop<LinePicture>>(LinePicture(layer, DisplayUnits()));
  }
  MadePicture operator()(const PointLayer& layer) const { return std::make_shared<PointsOfBackdrop>(layer); }
};

/// How long it may take, so that what takes but a moment is there at once.
struct IsLarge {
  bool operator()(const ImageLayer& /*layer*/) const { return true; }
  bool operator()(const GridLayer& layer) const { return layer.grid->Geometry().CellCount() > 100'000; }
  bool operator()(const ShapeLayer& layer) const { return layer.shapes->GetData().size() > 20'000; }
  bool operator()(const LineLayer& layer) const { return layer.lines->size() > 20'000; }
  bool operator()(const PointLayer& /*layer*/) const { return false; }
};

}  // namespace

std::shared_ptr<SharedLayer> SharedLayer::Of(const Drawn& drawn) {
  static std::vector<std::weak_ptr<SharedLayer>> known;
  std::erase_if(known, [](const auto& layer) { return layer.expired(); });
  for (const auto& layer : known)
    if (auto shared = layer.lock(); shared && shared->drawn_ == drawn) return shared;
  auto made = std::make_shared<SharedLayer>(drawn);
  known.push_back(made);
  return made;
}

SharedLayer::SharedLayer(Drawn drawn) : drawn_(std::move(drawn)) {
  auto promise = std::make_shared<QPromise<Picture>>();
  future_ = promise->future();
  // The thread holds all that it works on: the layer may be gone before it is done.
  const auto make = [promise, layer = drawn_, isGivenUp = isGivenUp_] {
    promise->start();
    promise->addResult(std::visit(PictureMaker{*isGivenUp}, layer));
    promise->finish();
  };
  std::visit(IsLarge(), drawn_) ? QThreadPool::globalInstance()->start(make) : make();
}

SharedLayer::~SharedLayer() { *isGivenUp_ = true; }

SharedLayer::Picture SharedLayer::Get() const {
  return future_.isFinished() && future_.resultCount() > 0 ? future_.result() : nullptr;
}

}  // namespace tervane
