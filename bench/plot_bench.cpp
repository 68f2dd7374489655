// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a user waits for at large maps and long series. Run it with QT_QPA_PLATFORM=offscreen. The peer of a map is the
// toolkit's own drawing of a picture of as many pixels, turned and shrunk alike.
#include <QApplication>
#include <QPainter>
#include <QScrollBar>
#include <QTemporaryDir>
#include <QTimer>
#include <algorithm>
#include <chrono>
#include <cmath>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include <qcustomplot.h>

#include "bench/desktop_figures.h"
#include "data/datafile_writer.h"
#include "data/grid_files.h"
#include "geometry/grid_interpolation.h"
#include "platform/item_types.h"
#include "shell/charts/series_plot.h"
#include "shell/editors/data_viewer.h"
#include "shell/editors/time_player.h"
#include "shell/maps/map_canvas.h"
#include "shell/maps/map_view.h"
#include "shell/relief/relief_canvas.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane::bench {

namespace {

constexpr int kSide = 5000;
constexpr QSize kSize(1000, 760);
constexpr int kFrames = 60;

std::shared_ptr<const CTvn2DOrthoRotatedGridData> LargeGrid(double rotation, bool isCodes) {
  std::vector<float> values(static_cast<std::size_t>(kSide) * kSide);
  for (int j = 0; j < kSide; ++j) {
    for (int i = 0; i < kSide; ++i) {
      const double height =
          1000 + 800 * std::sin(i / 310.0) * std::cos(j / 270.0) + 150 * std::sin(i / 17.0 + j / 23.0);
      values[static_cast<std::size_t>(j) * kSide + static_cast<std::size_t>(i)] =
          static_cast<float>(isCodes ? std::floor(height / 20) : height);
    }
  }
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  const GridGeometry geometry{kSide, kSide, 25, 400000, 5000000, rotation, {}};
  const std::string problem = isCodes ? grid->TakeValues(geometry, values, -9999, kWholeNumberUnit, quantity::kCode)
                                      : grid->TakeValues(geometry, values, -9999, 1000, quantity::kElevation);
  if (!problem.empty()) fmt::print("no grid: {}\n", problem);
  return grid;
}

void MeasureMap(const std::string& what, double rotation, bool isCodes) {
  MapContent content;
  content.grids = {{LargeGrid(rotation, isCodes), isCodes}};
  NobodyToAsk host;
  MapView view(host);
  view.resize(kSize);
  view.show();
  QApplication::processEvents();
  // The window answers at once, and the map appears when its grid is ready.
  const double answer = Milliseconds([&] {
    view.Show(content, nullptr);
    view.Canvas().grab();
  });
  const double picture = answer + Milliseconds([&] {
                           view.Canvas().WaitUntilReady();
                           view.Canvas().grab();
                         });
  Report(what + ": until the window answers", answer, 30, "ms");
  Report(what + ": until the first picture", picture, 1000, "ms");
  for (const double zoom : {1.0, 8.0}) {
    view.Canvas().Fit();
    view.Canvas().Zoom(zoom);
    const double frames = Milliseconds([&] {
      for (int i = 0; i < kFrames; ++i) {
        view.Canvas().Pan({i % 2 == 0 ? 7.0 : -5.0, 3.0});
        view.Canvas().repaint();
      }
    });
    Report(fmt::format("{}, zoom {}: a frame of panning ({:.0f} a second)", what, zoom, 1000 * kFrames / frames),
           frames / kFrames, 1000.0 / 30, "ms");
  }
}

/// Twenty layers of the ground from the side. The peer fills as many triangles with the toolkit's own painter.
void MeasureRelief() {
  constexpr int kCells = 500, kLayers = 20;
  Relief relief;
  relief.raster = {kCells, kCells, 100, 0, 0, 0, {}};
  for (int layer = 0; layer <= kLayers; ++layer) {
    std::vector<float> heights;
    for (int j = 0; j < kCells; ++j)
      for (int i = 0; i < kCells; ++i)
        heights.push_back(static_cast<float>(900 * std::sin(i / 60.0) * std::cos(j / 45.0) - 150 * layer));
    if (layer > 0) relief.bodies.back().bottom = heights;
    if (layer < kLayers) relief.bodies.push_back({.name = fmt::format("Layer {}", layer), .top = std::move(heights)});
  }
  ReliefCamera camera;
  camera.width = kSize.width();
  camera.rows = kSize.height();
  camera.exaggeration = 3;
  camera.Fit(relief);
  const double still = MedianOf([&] { DrawRelief(relief, camera, {}); });
  ReliefCanvas canvas;
  canvas.resize(kSize);
  canvas.show();
  canvas.SetRelief(std::make_shared<Relief>(relief), {}, {});
  const double moved = MedianOf([&] {
    canvas.Turn(3, 1);
    canvas.repaint();
  });
  for (ReliefBody& body : relief.bodies) body.opacity = 0.7;
  const double clear = MedianOf([&] { DrawRelief(relief, camera, {}); });
  QImage image(kSize, QImage::Format_ARGB32_Premultiplied);
  const double peer = Milliseconds([&] {
    QPainter painter(&image);
    painter.setPen(Qt::NoPen);
    painter.setBrush(Qt::darkGreen);
    for (int j = 0; j < kCells; ++j)
      for (int i = 0; i < kCells; ++i) {
        const QPointF at(i * 1.6, j * 1.2);
        const QPointF corners[] = {at, at + QPointF(1.6, 0), at + QPointF(1.6, 1.2)};
        painter.drawPolygon(corners, 3);
      }
  });
  Report("20 layers of 500 x 500 cells in 3D: a still picture", still, 1000, "ms");
  Report("the same, all of them transparent", clear, 1000, "ms");
  Report("the same: a frame while it turns", moved, 1000.0 / 30, "ms");
  ReportPeer("one layer's triangles, half of them, by the toolkit's painter", peer, "ms");
}

/// 100 layers of the backdrop with a million points together.
void MeasureBackdrop() {
  MapContent content;
  for (int layer = 0; layer < 100; ++layer) {
    auto shapes = std::make_shared<CTvnShapeData>();
    shapes->Create(ShapeKind::Line, {}, {});
    for (int line = 0; line < 10; ++line) {
      Shape shape;
      shape.parts = {0};
      for (int i = 0; i < 1000; ++i)
        shape.points.push_back(
            {400000 + i * 125.0, 5000000 + (layer * 10 + line) * 125.0 + 900 * std::sin(i / 9.0 + layer)});
      shapes->AddShape(std::move(shape));
    }
    content.above.push_back(
        {fmt::format("Layer {}", layer), ShapeLayer{.shapes = std::move(shapes), .style = ShapeStyle()}});
  }
  NobodyToAsk host;
  MapView view(host), second(host);
  for (MapView* each : {&view, &second}) {
    each->resize(kSize);
    each->show();
  }
  QApplication::processEvents();
  const auto show = [&](MapView& map) {
    return Milliseconds([&] {
      map.Show(content, nullptr);
      map.Canvas().WaitUntilReady();
      map.Canvas().grab();
    });
  };
  Report("100 layers with a million points: until the map is drawn", show(view), 100, "ms");
  Report("100 layers with a million points: a second map of them", show(second), 100, "ms");
  const double frames = Milliseconds([&] {
    for (int i = 0; i < kFrames; ++i) {
      view.Canvas().Pan({i % 2 == 0 ? 7.0 : -5.0, 3.0});
      view.Canvas().repaint();
    }
  });
  Report(fmt::format("100 layers: a frame of panning ({:.0f} a second)", 1000 * kFrames / frames), frames / kFrames,
         1000.0 / 30, "ms");
}

/// 100 rivers of 1000 points each that wind over the area of the grid.
std::shared_ptr<const std::vector<MapLine>> LargeNetwork() {
  auto network = std::make_shared<std::vector<MapLine>>(100);
  for (std::size_t river = 0; river < network->size(); ++river) {
    MapLine& line = (*network)[river];
    line.name = fmt::format("River {}", river + 1);
    for (int i = 0; i < 1000; ++i) {
      const double along = i * 125.0;
      line.points.push_back(
          {400000 + along + 300 * std::sin(i * 1.7),
           5000000 + 1250.0 * static_cast<double>(river) + 900 * std::sin(i / 9.0 + static_cast<double>(river))});
      line.chainages.push_back(along);
    }
  }
  return network;
}

void MeasureNetwork() {
  MapContent content;
  content.grids = {{LargeGrid(0, false)}};
  content.lines = {{LargeNetwork()}};
  content.lines[0].withPoints = true;
  NobodyToAsk host;
  MapView view(host);
  view.resize(kSize);
  view.Show(content, nullptr);
  view.show();
  view.Canvas().WaitUntilReady();
  QApplication::processEvents();
  for (const double zoom : {1.0, 8.0}) {
    view.Canvas().Fit();
    view.Canvas().Zoom(zoom);
    view.Canvas().repaint();
    // Zooming by a little draws all lines anew.
    Report(fmt::format("a network of 100,000 points over it, zoom {}: drawn", zoom), MedianOf([&] {
             view.Canvas().Zoom(1.0001);
             view.Canvas().repaint();
           }),
           50, "ms");
    std::vector<double> frames;
    for (int i = 0; i < kFrames; ++i)
      frames.push_back(Milliseconds([&] {
        view.Canvas().Pan({i % 2 == 0 ? 7.0 : -5.0, 3.0});
        view.Canvas().repaint();
      }));
    Report("  the same: a frame of panning", Median(frames), 1000.0 / 60, "ms");
    Report("  the same: what is under the pointer", MedianOf([&] {
             view.Canvas().TextAt({460000, 5060000});
           }),
           5, "ms");
  }
}

void MeasurePeer() {
  QImage image(kSide, kSide, QImage::Format_RGB32);
  image.fill(Qt::darkCyan);
  QImage target(kSize, QImage::Format_RGB32);
  ReportPeer("  peer: the toolkit draws a picture of as many pixels, turned", MedianOf([&] {
               QPainter painter(&target);
               painter.rotate(20);
               painter.scale(0.15, 0.15);
               painter.drawImage(0, 0, image);
             }),
             "ms");
}

/// Calls `passed` with each time that passes between two events of the window, in milliseconds, until `isOver`.
void WatchEvents(const std::function<bool()>& isOver, const std::function<void(double)>& passed) {
  QTimer tick;
  tick.start(0);
  while (!isOver()) passed(Milliseconds([] { QApplication::processEvents(QEventLoop::WaitForMoreEvents); }));
}

void MeasureInterpolation() {
  const GridGeometry geometry{kSide, kSide, 25, 400000, 5000000, 0, {}};
  std::vector<ScatteredPoint> points;
  for (int i = 0; i < 20'000; ++i)
    points.push_back({400000 + i * 7919 % 125000 + 0.5, 5000000 + i * 104729 % 125000 + 0.5, 100.0 + i % 500});
  const auto computation = [&] {
    return std::make_shared<ComputedGrid>(
        "Interpolating", [&](CTvn2DOrthoRotatedGridData& grid, ProgressPart progress) {
          InterpolationOptions options;
          options.searchRadius = 10'000;
          options.threads = 2;
          options.progress = progress;
          std::vector<float> values;
          FileResult result = Interpolate(points, geometry, -9999, options, values);
          if (result.Ok())
            result.error = grid.TakeValues(geometry, std::move(values), -9999, 1000, quantity::kElevation);
          return result;
        });
  };
  auto computed = computation();
  const std::function<MapContent()> content = [&computed] {
    MapContent map;
    if (auto grid = NowOrAwaited(computed, map.awaited)) map.grids = {{std::move(grid)}};
    return map;
  };
  NobodyToAsk host;
  MapView view(host);
  view.resize(kSize);
  view.show();
  QApplication::processEvents();
  double longest = Milliseconds([&] { view.ShowWhenThere(content, nullptr); });
  const double whole = Milliseconds([&] {
    WatchEvents([&] { return !view.IsBusy(); }, [&](double passed) { longest = std::max(longest, passed); });
  });
  ReportPeer("interpolate 25 million cells of 20,000 points, until the picture", whole, "ms");
  Report("  the longest time without an event of the window meanwhile", longest, 50, "ms");

  computed = computation();
  view.ShowWhenThere(content, nullptr);
  WatchEvents(
      [&, start = std::chrono::steady_clock::now()] {
        return std::chrono::steady_clock::now() - start > std::chrono::milliseconds(500);
      },
      [](double) {});
  view.StopWaiting();
  // Whoever runs it next waits for the thread that works on it.
  Progress cancelled;
  cancelled.Cancel();
  Report("  from cancelling to the end of the work", Milliseconds([&] { computed->Run(cancelled); }), 50, "ms");
}

/// A file of heads over days; the first cell of a day has its number.
std::string WriteHeads(const std::string& path, int cells, int steps) {
  NewDataFile content;
  content.geometry.nx = content.geometry.ny = cells;
  content.geometry.cellSize = 50;
  content.items = {{"Head", quantity::kElevation, 1000, {}}};
  DataFileWriter writer;
  std::string error = writer.Create(path, content);
  std::vector<float> values(static_cast<std::size_t>(cells) * static_cast<std::size_t>(cells));
  for (int step = 0; step < steps && error.empty(); ++step) {
    for (std::size_t i = 0; i < values.size(); ++i)
      values[i] = static_cast<float>(i % 977 + static_cast<std::size_t>(step));
    error = writer.AddStep(CYbDateTime(2000, 1, 1) + CYbDateTimeSpan{86400 * step});
    if (error.empty()) error = writer.Put(1, values);
  }
  return error.empty() ? writer.Finish().error : error;
}

/// Waits until the map shows a step.
void WaitForStep(DataViewer& viewer, int step) {
  const auto& canvas = *viewer.findChild<MapCanvas*>();
  WatchEvents(
      [&] {
        const auto& grids = canvas.Content().grids;
        return !grids.empty() &&
               std::abs(grids.front().grid->Values().front() - static_cast<float>(step % 977)) < 100 &&
               !canvas.IsPreparing() && !viewer.findChild<MapView*>()->IsBusy();
      },
      [](double) {});
}

void MeasureViewer() {
  const QTemporaryDir folder;
  const std::string path = FromQt(folder.filePath("heads.nds2"));
  if (const std::string error = WriteHeads(path, 1000, 100); !error.empty()) return fmt::print("no file: {}\n", error);
  NobodyToAsk host;
  const DisplayUnits units;
  std::unique_ptr<DataViewer> viewer;
  const double answer = Milliseconds([&] {
    viewer = std::make_unique<DataViewer>(path, host, units);
    viewer->resize(kSize);
    viewer->show();
    viewer->grab();
  });
  Report("a data file of 400 MB: until its tab answers", answer, 200, "ms");
  Report("  until its map", answer + Milliseconds([&] { WaitForStep(*viewer, 0); }), 500, "ms");
}

/// All steps are played once, as fast as they are read, and drawn.
void MeasurePlaying(int cells, int steps, double wanted) {
  const QTemporaryDir folder;
  const std::string path = FromQt(folder.filePath("heads.nds2"));
  if (const std::string error = WriteHeads(path, cells, steps); !error.empty())
    return fmt::print("no file: {}\n", error);
  NobodyToAsk host;
  const DisplayUnits units;
  DataViewer viewer(path, host, units);
  viewer.resize(kSize);
  viewer.show();
  WaitForStep(viewer, 0);
  auto& player = *viewer.findChild<TimePlayer*>();
  auto& canvas = *viewer.findChild<MapCanvas*>();
  std::vector<double> shown;
  int played = 0;
  QObject::connect(&player, &TimePlayer::StepChosen, &viewer, [&] {
    ++played;
    shown.push_back(Milliseconds([&] { canvas.repaint(); }));
  });
  player.SetSpeed(1000);
  player.Play();
  const double time = Milliseconds([&] { WatchEvents([&] { return !player.IsPlaying(); }, [](double) {}); });
  const std::string what = fmt::format("{0} x {0} cells", cells);
  if (shown.empty()) return fmt::print("WRONG: no step of {} was played\n", what);
  Report(what + ": a step that was read ahead is drawn", Median(shown), 1000 / wanted, "ms");
  Report(fmt::format("  played, {:.0f} steps a second: one step", 1000 * played / time), time / played, 1000 / wanted,
         "ms");
}

void MeasureSeries() {
  constexpr std::size_t kValues = 100'000;
  SeriesContent content;
  for (const bool isStepped : {false, true}) {
    Series series{isStepped ? "Rain" : "Flow", isStepped ? "mm" : "m3/s", {}, {}, isStepped};
    for (std::size_t i = 0; i < kValues; ++i) {
      series.times.push_back(CYbDateTime(1990, 1, 1) + CYbDateTimeSpan{3600 * static_cast<std::int64_t>(i)});
      series.values.push_back(50 + 40 * std::sin(static_cast<double>(i) / 900) +
                              static_cast<double>(i * 7919 % 100) / 10);
    }
    content.series.push_back(std::move(series));
  }
  NobodyToAsk host;
  SeriesPlot plot(host);
  plot.resize(kSize);
  plot.show();
  QApplication::processEvents();
  Report("2 series of 100,000 values: until the first picture", Milliseconds([&] {
           plot.Show(content);
           plot.Chart().replot();
         }),
         200, "ms");
  Report("the same: zoom and draw", MedianOf([&] {
           plot.Zoom(1.1);
           plot.Chart().replot();
         }),
         16, "ms");
  Report("the same: see that nothing changed", MedianOf([&] { plot.Show(content); }), 16, "ms");
}

/// As a page of stress periods shows the series that drive the model.
void MeasurePanels() {
  constexpr int kPanels = 100;
  constexpr std::int64_t kValues = 10'000;
  SeriesContent content;
  for (int panel = 0; panel < kPanels; ++panel) {
    Series& series = content.series.emplace_back();
    series.panel = panel;
    series.name = fmt::format("Well {}", panel + 1);
    series.unit = "m³/s";
    for (std::int64_t i = 0; i < kValues; ++i) {
      series.times.push_back(CYbDateTime(1990, 1, 1) + CYbDateTimeSpan{86400 * i});
      series.values.push_back(50 + 40 * std::sin(static_cast<double>(i + 100 * panel) / 90));
    }
    content.panelTitles.push_back(series.name);
  }
  for (int marker = 0; marker < 100; ++marker)
    content.markers.push_back(
        {.name = std::to_string(marker + 1), .time = CYbDateTime(1990, 1, 1) + CYbDateTimeSpan{86400 * 100 * marker}});
  NobodyToAsk host;
  SeriesPlot plot(host);
  plot.resize(kSize);
  plot.show();
  QApplication::processEvents();
  Report("100 charts of 10,000 values below each other: until the first picture", Milliseconds([&] {
           plot.Show(content);
           plot.Chart().replot();
         }),
         200, "ms");
  Report("the same: a marked date is moved, until it is seen", MedianOf([&] {
           content.markers[7].time = content.markers[7].time + CYbDateTimeSpan{86400};
           plot.Show(content);
           plot.Chart().replot();
         }),
         50, "ms");
  auto* const bar = plot.findChild<QScrollBar*>();
  Report("the same: scrolled by one", MedianOf([&] {
           bar->setValue(bar->value() + 1);
           plot.Chart().replot();
         }),
         16, "ms");
}

void Measure() {
  MeasureRelief();
  MeasureMap("25 million cells", 0, false);
  MeasureMap("25 million cells, turned", 20, false);
  MeasureMap("25 million codes, turned", 20, true);
  MeasureNetwork();
  MeasureBackdrop();
  MeasurePeer();
  MeasureInterpolation();
  MeasureViewer();
  MeasurePlaying(1000, 100, 60);
  MeasurePlaying(5000, 12, 20);
  MeasureSeries();
  MeasurePanels();
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) {
  QApplication application(argc, argv);
  const tervane::Theme theme;
  tervane::bench::Measure();
}
