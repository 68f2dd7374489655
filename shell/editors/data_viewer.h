// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTimer>
#include <QWidget>
#include <functional>
#include <string>

#include "core/host.h"
#include "pages/data_file_view.h"
#include "pages/parts/further_series.h"
#include "platform/units.h"

class QComboBox;
class QLabel;
class QLineEdit;
class QListWidget;
class QSlider;
class QSplitter;
class QStackedWidget;
class QToolButton;

namespace tervane {

class DataTable;
class MapView;
class SeriesPlot;

/// A data file in its tab: its items at the left, the chosen one as a map or chart, and its values as a table. Nothing
/// is changed here; a file that is replaced on the disk is read again.
class DataViewer : public QWidget {
  Q_OBJECT

 public:
  /// The user's units must outlive the viewer.
  DataViewer(const std::string& path, Host& host, const DisplayUnits& units);
  /// What is put over the maps of the file, such as where a model lies.
  void PutOverMaps(std::function<void(MapContent& map)> put);
  ~DataViewer() override;

  const std::string& Path() const { return file_.Path(); }
  /// The name of the file.
  QString Title() const;
  /// Why there is nothing to show; empty when there is.
  const std::string& Problem() const { return file_.Problem(); }
  /// Reads the file again if it is another one than before, or always.
  void Reload(bool always);

 protected:
  void showEvent(QShowEvent* event) override;

 private:
  QWidget* BuildChoices();
  QWidget* BuildBody();
  void FollowTheme();
  /// After another item was chosen, or another file read.
  void ShowItem();
  /// After another step or layer was chosen.
  void ShowSlice();
  void GoToDate();
  void ShowNotes(const QString& text);

  DataFileView file_;
  FurtherSeries further_;
  const DisplayUnits& units_;
  DisplayUnits shownUnits_;
  QStackedWidget* whole_;
  QLabel* problem_;
  QListWidget* items_;
  QWidget* stepRow_;
  QSlider* steps_;
  QLabel *step_, *layerLabel_, *told_, *tableText_;
  QToolButton *earlier_, *later_;
  QComboBox* layers_;
  QLineEdit* date_;
  QSplitter* split_;
  QStackedWidget* plots_;
  MapView* map_;
  SeriesPlot* chart_;
  DataTable* table_;
  QTimer disk_;
};

}  // namespace tervane
