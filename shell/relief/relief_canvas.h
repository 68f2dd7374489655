// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QFutureWatcher>
#include <QImage>
#include <QTimer>
#include <QWidget>
#include <atomic>
#include <functional>
#include <memory>

#include "geometry/relief.h"
#include "platform/units.h"

namespace tervane {

/// Bodies of the ground as seen from the side, turned by mouse and keyboard. While it moves it is coarse; a fine
/// picture is made in another thread when it rests.
class ReliefCanvas : public QWidget {
  Q_OBJECT

 public:
  explicit ReliefCanvas(QWidget* parent = nullptr);
  ~ReliefCanvas() override;

  /// Shows another relief; null for none, and then a message. The view stays where the raster is the same.
  void SetRelief(std::shared_ptr<Relief> relief, const DisplayUnits& units, const QString& message);
  const Relief* Shown() const { return relief_.get(); }
  /// Changes what is shown and how: visibility, opacity, colours.
  void Change(const std::function<void(Relief& relief)>& change);

  const ReliefCamera& Camera() const { return camera_; }
  void SetExaggeration(double times);
  /// Degrees to the right and downwards.
  void Turn(double heading, double pitch);
  /// Moves the picture by pixels.
  void Pan(QPointF by);
  const ReliefPart& Part() const { return part_; }
  void SetPart(const ReliefPart& part);
  void Fit();
  void Zoom(double factor);

  /// What the user reads of a place of the screen; empty where nothing is.
  QString TextAt(QPointF place) const;
  /// The view with more pixels, for paper.
  QImage Picture(double pixelRatio);
  /// Draws the fine picture now.
  void WaitUntilFine();

  QSize sizeHint() const override { return {760, 560}; }

 signals:
  void PointedAt(const QString& text);
  void Moved();

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  /// What came while nobody saw it is drawn now.
  void showEvent(QShowEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  void mouseMoveEvent(QMouseEvent* event) override;
  void mouseDoubleClickEvent(QMouseEvent* event) override;
  void wheelEvent(QWheelEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void leaveEvent(QEvent* event) override;

 private:
  ReliefCamera CameraFor(double pixelRatio) const;
  /// After the view has changed: a coarse picture now, a fine one soon.
  void Move();
  void DrawCoarse();
  void StartFine();
  void GiveUpFine();
  void Take(ReliefPicture picture);
  void DrawMarks(QPainter& painter, const QRectF& place) const;
  void DrawHeights(QPainter& painter) const;
  void DrawNorth(QPainter& painter, QPointF at) const;
  void DrawLength(QPainter& painter, QPointF at) const;
  void DrawWellNames(QPainter& painter) const;

  std::shared_ptr<Relief> relief_;
  DisplayUnits units_;
  QString message_;
  ReliefCamera camera_;
  ReliefPart part_;
  ReliefPicture picture_;  ///< As last drawn, which may be coarse.
  QImage image_;
  bool isFitted_ = true;
  QTimer rest_;
  QFutureWatcher<std::shared_ptr<ReliefPicture>> watcher_;
  std::shared_ptr<std::atomic<bool>> isGivenUp_;
  QPointF draggedTo_;
};

}  // namespace tervane
