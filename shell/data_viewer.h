// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QDialog>
#include <string>

#include "platform/host.h"
#include "platform/units.h"

class QComboBox;
class QStackedWidget;

namespace tervane {

class MapView;
class SeriesPlot;

/// A data file in a window of its own: its items, each as a map or a chart. Nothing is changed here.
class DataViewer : public QDialog {
  Q_OBJECT

 public:
  /// `problem` says why the file cannot be shown; then there is nothing to see.
  DataViewer(const std::string& path, Host& host, const DisplayUnits& units, std::string& problem, QWidget* parent);

 private:
  void ShowItem(int number);

  std::string path_;
  const DisplayUnits& units_;
  QComboBox* items_;
  QStackedWidget* views_;
  MapView* map_;
  SeriesPlot* chart_;
};

}  // namespace tervane
