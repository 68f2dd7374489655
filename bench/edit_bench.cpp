// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a user waits for who paints on a grid of 5,000 x 5,000 cells. Run it with QT_QPA_PLATFORM=offscreen. The peer of
// a stroke is a bare loop that writes as many cells and remembers what they were.
#include <QApplication>
#include <QLineEdit>
#include <QMouseEvent>
#include <QSpinBox>
#include <QTemporaryDir>
#include <cmath>
#include <string>
#include <vector>

#include "bench/desktop_figures.h"
#include "data/grid_files.h"
#include "platform/item_types.h"
#include "shell/editors/grid_editor.h"
#include "shell/maps/map_canvas.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane::bench {

namespace {

constexpr int kSide = 5000, kWidth = 40, kMoves = 60;
constexpr double kStroke = 16;

std::string WriteGround(const QTemporaryDir& folder) {
  std::vector<float> values(static_cast<std::size_t>(kSide) * kSide);
  for (std::size_t cell = 0; cell < values.size(); ++cell)
    values[cell] = static_cast<float>(1000 + 800 * std::sin(static_cast<double>(cell % kSide) / 310) *
                                                 std::cos(static_cast<double>(cell / kSide) / 270));
  CTvn2DOrthoRotatedGridData grid;
  std::string path = FromQt(folder.filePath("ground.nds2"));
  const std::string why = grid.TakeValues({kSide, kSide, 25, 400000, 5000000, 0, {}}, std::move(values),
                                          kUsualDeleteValue, 1000, quantity::kElevation);
  if (!why.empty() || !WriteGridData(path, grid).Ok()) fmt::print("no grid: {}\n", why);
  return path;
}

/// The same cells, written and remembered without anything around.
double BareLoop(GridEdit& edit) {
  std::vector<float> cells = edit.Grid()->Values();
  std::vector<std::pair<std::size_t, float>> before;
  return MedianOf([&] {
    before.clear();
    for (std::size_t j = 2000; j < 2000 + kWidth; ++j)
      for (std::size_t cell = j * kSide + 1000; cell < j * kSide + 1000 + 3000; ++cell) {
        before.emplace_back(cell, cells[cell]);
        cells[cell] = 900;
      }
  });
}

void MeasureModel(const std::string& path) {
  GridEdit edit(path);
  const auto at = [&](int i, int j) { return edit.Grid()->CellCentre(i, j); };
  float value = 900;
  const double stroke = MedianOf([&] {
    value += 1;
    if (!edit.BeginStroke("Paint", value).empty()) return;
    edit.StrokeTo(at(1000, 2020), at(4000, 2020), kWidth);
    edit.EndStroke();
  });
  Report("a stroke over 3,000 cells, 40 wide", stroke, kStroke, "ms");
  ReportPeer("  a bare loop that writes and remembers as many cells", BareLoop(edit), "ms");
  Report("the same taken back", MedianOf([&] { edit.Undo(); }), kStroke, "ms");
  edit.PaintLine({at(10, 20), at(110, 20)}, 1, 5);
  const std::size_t before = edit.BytesOfSteps();
  edit.PaintLine({at(10, 10), at(110, 10)}, 1, 5);
  Report("a line of 100 cells: what its step takes", static_cast<double>(edit.BytesOfSteps() - before) / 1024, 4, "kB");
}

void MeasureEditor(const std::string& path) {
  NobodyToAsk host;
  GridEditor editor(path, host);
  editor.resize(1280, 900);
  editor.show();
  QApplication::processEvents();
  auto& canvas = *editor.findChild<MapCanvas*>();
  canvas.WaitUntilReady();
  canvas.grab();
  for (QLineEdit* line : editor.findChildren<QLineEdit*>())
    if (line->accessibleName() == "Value") line->setText("900");
  for (QSpinBox* box : editor.findChildren<QSpinBox*>())
    if (box->accessibleName() == "Width") box->setValue(kWidth);
  editor.SetTool(GridEditor::Tool::Brush);
  const auto send = [&](QEvent::Type type, QPointF place, Qt::MouseButton button) {
    QMouseEvent event(type, place, place, button, Qt::LeftButton, {});
    QApplication::sendEvent(&canvas, &event);
  };
  for (const double zoom : {1.0, 8.0}) {
    canvas.Fit();
    canvas.Zoom(zoom);
    canvas.repaint();
    const QPointF middle = canvas.Window().rect.center();
    std::vector<double> moves;
    send(QEvent::MouseButtonPress, middle, Qt::LeftButton);
    for (int i = 0; i < kMoves; ++i) {
      const QPointF to = middle + QPointF(120 * std::cos(i / 7.0), 120 * std::sin(i / 7.0));
      moves.push_back(Milliseconds([&] {
        send(QEvent::MouseMove, to, Qt::NoButton);
        canvas.repaint();
      }));
    }
    send(QEvent::MouseButtonRelease, middle, Qt::LeftButton);
    Report(fmt::format("zoom {}: a move of the brush, until it is seen", zoom), Median(moves), kStroke, "ms");
    Report(fmt::format("zoom {}: the longest of {}", zoom, kMoves), *std::ranges::max_element(moves), 2 * kStroke,
           "ms");
    Report(fmt::format("zoom {}: the stroke is taken back, until it is seen", zoom), Milliseconds([&] {
             editor.Undo();
             canvas.repaint();
           }),
           kStroke, "ms");
  }
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) {
  QApplication application(argc, argv);
  const tervane::Theme theme;
  const QTemporaryDir folder;
  const std::string path = tervane::bench::WriteGround(folder);
  tervane::bench::MeasureModel(path);
  tervane::bench::MeasureEditor(path);
}
