// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QAction>
#include <QImage>
#include <QWidget>
#include <functional>
#include <vector>

#include "platform/host.h"

class QLabel;
class QToolButton;

namespace tervane {

/// What stands around a map or a chart: a line that tells what is pointed at, buttons to see more or less of it, and a
/// context menu that takes its picture along.
class PlotFrame : public QWidget {
  Q_OBJECT

 public:
  /// What the buttons and the menu ask of the plot.
  struct Plot {
    QWidget* widget = nullptr;
    std::function<void(double factor)> zoom;
    std::function<void()> fit;
    std::function<QImage(double pixelRatio)> picture;
  };

  void SetStatus(const QString& text);
  QString Status() const;

 protected:
  PlotFrame(Host& host, QWidget* parent);
  void Hold(Plot plot);
  /// A further command of the context menu.
  QAction* AddCommand(const QString& text, std::function<void()> command);
  void resizeEvent(QResizeEvent* event) override;

 private:
  void Export();
  void FollowTheme();
  void ArrangeStatus();

  Host& host_;
  Plot plot_;
  QLabel* status_;
  std::vector<std::pair<QToolButton*, QString>> buttons_;
};

}  // namespace tervane
