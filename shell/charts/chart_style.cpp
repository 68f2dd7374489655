// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/chart_style.h"

#include <QApplication>
#include <algorithm>

#include <qcustomplot.h>

#include "shell/widgets/theme.h"

namespace tervane {

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
