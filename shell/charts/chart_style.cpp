// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/chart_style.h"

#include <QApplication>
#include <algorithm>
#include <array>
#include <utility>

#include <qcustomplot.h>

#include "shell/widgets/theme.h"

namespace tervane {

namespace {

template <std::size_t count>
QColor ColorOf(const std::array<std::pair<QRgb, QRgb>, count>& colors, std::size_t number, bool onDark) {
  const auto& [light, dark] = colors[number % count];
  return onDark ? dark : light;
}

}  // namespace

QColor CurveColor(std::size_t number, bool onDark) {
  constexpr std::array<std::pair<QRgb, QRgb>, 8> kColors{{{0xff1f6fb2, 0xff62aef0},
                                                          {0xffd1601a, 0xffff9b54},
                                                          {0xff2b8a4b, 0xff62c987},
                                                          {0xffa63a78, 0xffe58abf},
                                                          {0xff7a5c16, 0xffd9b64a},
                                                          {0xff5b50b5, 0xffa79df5},
                                                          {0xff128a91, 0xff4fd0d6},
                                                          {0xff555c66, 0xffb9c0ca}}};
  return ColorOf(kColors, number, onDark);
}

QColor LayerColor(std::size_t number, bool onDark) {
  constexpr std::array<std::pair<QRgb, QRgb>, 8> kColors{{{0xffe9d8a6, 0xff8d7f52},
                                                          {0xffb7c9a8, 0xff64785a},
                                                          {0xffd9b08c, 0xff866549},
                                                          {0xffa9c4cf, 0xff567684},
                                                          {0xffcdb4c9, 0xff79607a},
                                                          {0xffc9c2b8, 0xff6f6a63},
                                                          {0xffe3c3ae, 0xff8e6c58},
                                                          {0xff9fbfae, 0xff4f7364}}};
  return ColorOf(kColors, number, onDark);
}

void StyleChart(QCustomPlot& chart) {
  const Theme& theme = Theme::Get();
  const QPalette colors = QApplication::palette();
  const QColor ink = colors.color(QPalette::Text), quiet = theme.QuietColor();
  QColor grid = quiet;
  grid.setAlpha(70);
  chart.setBackground(colors.color(QPalette::Base));
  for (QCPAxisRect* rect : chart.axisRects()) {
    for (QCPAxis* axis : rect->axes()) {
      axis->setBasePen(QPen(quiet, 1));
      axis->setTickPen(QPen(quiet, 1));
      axis->setSubTickPen(QPen(quiet, 1));
      axis->setTickLabelColor(ink);
      axis->setLabelColor(ink);
      axis->setTickLabelFont(QApplication::font());
      axis->setLabelFont(QApplication::font());
      axis->grid()->setPen(QPen(grid, 1));
      axis->grid()->setZeroLinePen(QPen(quiet, 1));
      axis->setTickLength(0, theme.Scaled(5));
      axis->setSubTickLength(0, theme.Scaled(3));
    }
  }
  chart.legend->setFont(QApplication::font());
  chart.legend->setTextColor(ink);
  chart.legend->setBrush(Qt::NoBrush);
  chart.legend->setBorderPen(Qt::NoPen);
  chart.legend->setVisible(true);
  // A row as high as its text would cut what hangs below the line.
  chart.legend->setIconSize(theme.Scaled(24), QFontMetrics(QApplication::font()).lineSpacing() + theme.Scaled(3));
  chart.selectionRect()->setPen(QPen(colors.color(QPalette::Highlight), 1.5));
  QColor veil = colors.color(QPalette::Highlight);
  veil.setAlpha(50);
  chart.selectionRect()->setBrush(veil);
}

void PutLegendAbove(QCustomPlot& chart) {
  chart.plotLayout()->insertRow(0);
  auto* names = new QCPLayoutGrid;
  chart.plotLayout()->addElement(0, 0, names);
  names->addElement(0, 0, chart.legend);
  names->addElement(0, 1, new QCPLayoutElement(&chart));
  names->setColumnStretchFactor(0, 0.001);
  chart.plotLayout()->setRowStretchFactor(0, 0.001);
  chart.legend->setFillOrder(QCPLegend::foColumnsFirst);
}

void ArrangeLegend(QCustomPlot& chart, int widest) {
  const int columns = chart.width() / (std::max(widest, 1) + Theme::Get().Scaled(44));
  // One that leaves no place for the curves is left out, as a layout knows it: without a height.
  const int rows = (chart.legend->itemCount() + std::max(1, columns) - 1) / std::max(1, columns);
  const bool fits = rows * QFontMetrics(chart.legend->font()).height() <= chart.height() / 2;
  chart.legend->setVisible(fits);
  chart.legend->setMinimumSize(fits ? QSize(0, 0) : QSize(1, 1));
  chart.legend->setMaximumSize(QWIDGETSIZE_MAX, fits ? QWIDGETSIZE_MAX : 1);
  if (chart.legend->wrap() == std::max(1, columns)) return;
  chart.legend->setWrap(std::max(1, columns));
  // The names that are there already move, too.
  chart.legend->setFillOrder(chart.legend->fillOrder(), true);
}

}  // namespace tervane
