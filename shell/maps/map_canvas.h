// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QPixmap>
#include <QWidget>
#include <atomic>
#include <memory>
#include <optional>
#include <span>
#include <vector>

#include "forms/plots.h"
#include "shell/maps/backdrop_picture.h"
#include "shell/maps/map_lines.h"
#include "shell/maps/map_rendering.h"
#include "shell/maps/map_shapes.h"

namespace tervane {

/// What a user does by dragging on the map in the place of moving it, which the middle button does then.
struct MapDrag {
  /// From one place to the next, at first from the place where the button went down to itself.
  std::function<void(MapPoint from, MapPoint to)> moved;
  /// At the place where it went up; nothing when the user has given up.
  std::function<void(std::optional<MapPoint> place)> ended;
  /// What is seen at the pointer, and of the drag so far where there is one.
  std::function<void(QPainter& painter, const MapWindow& window, MapPoint at, std::optional<MapPoint> from)> draw;
};

/// The map itself: its layers in a frame, with legend, north arrow and scale bar; moved by mouse and keyboard.
class MapCanvas : public QWidget {
  Q_OBJECT

 public:
  explicit MapCanvas(QWidget* parent = nullptr);
  ~MapCanvas() override;

  /// Shows another content; the part that is seen stays where the whole area is the same as before. Large grids are
  /// made ready in another thread, and appear when they are.
  void SetContent(MapContent content, const DisplayUnits* units);
  const MapContent& Content() const { return content_; }
  /// Shows the next step of the first grid and its flow in the place of the one before, which is all that changes. A
  /// grid that is `passing` holds but some of the cells, so that nobody can point at one.
  void ShowFrame(const GridLayer& grid, std::shared_ptr<const GridPicture> picture, std::optional<ArrowLayer> arrows,
                 bool isPassing);
  /// Cells of the first grid have other values, within the colours that it has.
  void UpdateCells(std::span<const CellWindow> windows);
  /// The first grid has other values or colours; what is seen stays until its picture is ready.
  void RemakeGrid(const GridLayer& grid);
  /// The user drags for this, or no longer.
  void SetDrag(std::optional<MapDrag> drag);
  /// The pictures of the grids; null for one that is in the making.
  const GridPicture* PictureOf(std::size_t grid) const;
  void SetPicked(std::function<void(const MapPick&)> picked) { content_.picked = std::move(picked); }
  /// Asks the user for a point or a line, or no longer; the same question asked again leaves what he has drawn.
  void Ask(std::optional<MapRequest> request);
  bool IsAsking() const { return request_.has_value(); }

  /// The part of the map that is seen, in the canvas's own coordinates.
  const MapWindow& Window() const { return window_; }
  /// The place that the keyboard points at; nothing until it does.
  const std::optional<MapPoint>& ReadingMark() const { return mark_; }
  /// What the user reads of a place: coordinates, cell, value, shape.
  QString TextAt(MapPoint place) const;
  QString Summary() const;
  /// What is drawn, for those who do not see it: legends and how many shapes, lines and points there are.
  QString LayersInWords() const;
  /// The pointer or the reading mark is on the map.
  bool IsPointedAt() const { return isPointed_; }
  void Fit();
  /// Shows more (above 1) or less; the place at that point of the screen stays there.
  void Zoom(double factor, QPointF around);
  void Zoom(double factor) { Zoom(factor, window_.rect.center()); }
  void Pan(QPointF by);
  bool IsPreparing() const;
  /// Waits until all grids are ready.
  void WaitUntilReady();
  /// The map as it is seen, with more pixels for paper.
  QImage Picture(double pixelRatio);
  /// Tells in the legend what the layers of the backdrop are, or no longer.
  void SetLayersInLegend(bool isOn);
  /// Draws the borders of a grid's cells where they are not too fine to be seen; nothing for none.
  void SetCellLines(std::optional<GridGeometry> grid);
  /// An area of the map alone, without what stands around it, transparent where nothing lies. It fills the picture.
  QImage AreaPicture(const Envelope& area, QSize pixels);
  /// What is shown when everything is.
  std::optional<Envelope> WholeArea() const;

  QSize sizeHint() const override { return {640, 480}; }

 signals:
  /// The pointer is at another place; nothing when it has left the map.
  void PointedAt(const QString& text);

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void changeEvent(QEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  void mouseMoveEvent(QMouseEvent* event) override;
  void mouseReleaseEvent(QMouseEvent* event) override;
  void mouseDoubleClickEvent(QMouseEvent* event) override;
  void wheelEvent(QWheelEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void leaveEvent(QEvent* event) override;

 private:
  struct Layer;  ///< A grid and its picture, which may still be in the making.
  enum class Gesture { None, Press, Pan, Box, Drag };

  void Prepare(Layer& layer);
  void Arrange();
  void Redraw();
  void Render(QPainter& painter, double pixelRatio, bool isScreen);
  void EndDrag(std::optional<MapPoint> place);
  /// All layers, within the window.
  /// What stands on the map, as far as it is seen through `part`.
  void RenderLayers(QPainter& painter, double pixelRatio, bool isScreen, const QRectF& part);
  void RenderPart(QPainter& painter, double pixelRatio, bool isScreen, const QRectF& part);
  /// How layers are drawn now.
  DrawnMap Drawn() const;
  struct Scene;     ///< A part of the map as last drawn.
  struct Backdrop;  ///< A layer of the backdrop, which may still be in the making.
  using DrawPart = std::function<void(QPainter& painter, const DrawnMap& map)>;
  void FollowBackdrop(const std::vector<BackdropLayer>& layers, std::vector<std::unique_ptr<Backdrop>>& made);
  /// What `part` draws. On the screen what was drawn is moved along with the map, and only its borders are drawn anew.
  void DrawScene(Scene& scene, QPainter& painter, double pixelRatio, bool isScreen, const DrawPart& part);
  void DrawBackdrop(const std::vector<std::unique_ptr<Backdrop>>& backdrop, QPainter& painter, const DrawnMap& map,
                    double pixelRatio) const;
  void DrawVectors(QPainter& painter, double pixelRatio, bool isScreen);
  void DrawMarkers(QPainter& painter);
  /// Flow, and at the top an arrow that tells what lengths mean.
  void DrawFlow(QPainter& painter);
  void DrawPreparing(QPainter& painter);
  /// What is asked of the user and what he has drawn so far.
  void DrawRequest(QPainter& painter);
  void SyncCursor();
  void TakeClick(MapPoint clicked);
  void EndLine();
  void Answer();
  void GiveUp();
  bool PressInRequest(int key);
  /// Moves the reading mark by pixels, and the map along where the mark would leave it.
  void MoveMark(QPointF by);
  void PointAtMark();
  void DropMark();
  /// Does what a click at the reading mark does.
  void ClickAtMark();
  void DrawMark(QPainter& painter);
  QString DrawnText(MapPoint place) const;
  /// What the legend tells, from the top down.
  std::vector<LegendBlock> Legends() const;
  LegendBlock LegendOfLayers() const;
  void DrawCellLines(QPainter& painter) const;
  /// On the screen what has no room is reached by scrolling; on paper it is counted.
  void DrawLegends(QPainter& painter, bool isScreen);
  void ScrollLegend(double pixels);
  double DrawLegend(QPainter& painter, const LegendBlock& legend, QRectF place);
  void DrawFrame(QPainter& painter);
  QRectF NorthArrowPlace() const;
  void DrawNorthArrow(QPainter& painter);
  /// The length that the scale bar shows, with its texts and its place.
  struct ScaleBar;
  ScaleBar MakeScaleBar() const;
  void DrawScaleBar(QPainter& painter, const ScaleBar& scale);
  double LegendWidth() const;
  QString HiddenText(std::size_t count) const;
  MapPick PickAt(MapPoint place) const;
  double Reach() const;

  MapContent content_;
  DisplayUnits units_;
  std::vector<std::unique_ptr<Layer>> layers_;
  std::vector<ShapePicture> shapes_;
  std::optional<ShapePicture> domain_;
  std::vector<LinePicture> lines_;
  std::vector<std::unique_ptr<Backdrop>> below_, above_;
  std::unique_ptr<Scene> ground_;   ///< What lies below the grids.
  std::unique_ptr<Scene> vectors_;  ///< What lies above them, without points.
  std::optional<MapRequest> request_;
  std::optional<MapDrag> drag_;
  std::vector<MapPoint> drawn_;  ///< Points of a line that is asked for.
  std::optional<MapPoint> mark_;
  MapWindow window_;
  QRectF legendPlace_;
  double legendScroll_ = 0;  ///< How many pixels of the legend are above its place.
  double legendMost_ = 0;    ///< How far it can be scrolled.
  bool hasTicks_ = false;
  bool isFitted_ = true;  ///< The whole area is seen, and is to be after a change of size too.
  QPixmap scene_;         ///< As last drawn; null when it must be drawn anew.
  Gesture gesture_ = Gesture::None;
  bool isSecondClick_ = false;
  bool isTaken_ = false;    ///< The last click gave a point that was asked for.
  bool isPointed_ = false;  ///< The pointer is over the map, or the keyboard points at a place.
  bool hasLayersInLegend_ = false;
  std::optional<GridGeometry> cellLines_;
  bool isPassing_ = false;  ///< The first grid has but some of its cells.
  QPointF pressedAt_, draggedTo_;
};

}  // namespace tervane
