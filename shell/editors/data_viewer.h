// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTimer>
#include <QWidget>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "core/host.h"
#include "pages/data_file_view.h"
#include "pages/parts/further_series.h"
#include "pages/result_view.h"
#include "platform/units.h"

class QComboBox;
class QLabel;
class QLineEdit;
class QListWidget;
class QSplitter;
class QStackedWidget;
class QTabWidget;

namespace tervane {

class DataTable;
class FramesAhead;
class MapView;
class ResultTools;
class SeriesPlot;
class TimePlayer;
struct ReadyFrame;

/// A data file in its tab: its items at the left, the chosen one as a map or chart, and its values as a table. The
/// steps of grids are played; below the map stand series of cells and values along a line. A setup of the result viewer
/// shows its result so, in its colours and with its layers. Nothing is changed here; a file that is replaced on the
/// disk is read again.
class DataViewer : public QWidget {
  Q_OBJECT

 public:
  /// The user's units must outlive the viewer.
  DataViewer(const std::string& path, Host& host, const DisplayUnits& units);
  /// What is put over the maps of the file, such as where a model lies.
  void PutOverMaps(std::function<void(MapContent& map)> put);
  ~DataViewer() override;

  const std::string& Path() const { return path_; }
  /// The name of the file.
  QString Title() const;
  /// Why there is nothing to show; empty when there is.
  const std::string& Problem() const { return setupProblem_.empty() ? file_.Problem() : setupProblem_; }
  /// Reads the file again if it is another one than before, or always.
  void Reload(bool always);

 protected:
  void showEvent(QShowEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;

 private:
  QWidget* BuildChoices();
  QWidget* BuildBody();
  void Connect();
  void FollowTheme();
  /// Reads the setup of the result viewer anew, where it is one that is shown.
  void ReadSetup();
  /// After another item was chosen, or another file read.
  void ShowItem();
  /// After another step or layer was chosen.
  void ShowSlice();
  void ShowMap();
  /// What stands below the map, beside the table.
  void ShowCharts();
  /// The user moves the slider, or plays: what was read ahead is shown at once, the rest when it stands still.
  void GoToStep(int step);
  void ShowFrame(const ReadyFrame& ready);
  /// How many rows and columns go to one that is read while steps pass.
  int Every() const;
  void AskLine();
  void PickCell(const MapPick& pick);
  void SaveAnimation();
  QImage AnimationPicture(std::size_t step, std::string& problem);
  void GoToDate();
  void ShowNotes(const QString& text);

  std::string path_, setupProblem_;
  FileStamp setupStamp_;
  bool isSetup_ = false;
  std::vector<std::string> setupNotes_;
  DataFileView file_;
  Host& host_;
  ResultView result_;
  FurtherSeries further_;
  const DisplayUnits& units_;
  DisplayUnits shownUnits_;
  QStackedWidget* whole_;
  QLabel* problem_;
  QListWidget* items_;
  TimePlayer* player_;
  ResultTools* tools_;
  std::unique_ptr<FramesAhead> frames_;
  QLabel *layerLabel_, *told_, *tableText_;
  QComboBox* layers_;
  QLineEdit* date_;
  QSplitter* split_;
  QStackedWidget* plots_;
  MapView* map_;
  SeriesPlot* chart_;
  DataTable* table_;
  QTabWidget* below_;
  SeriesPlot *cells_, *profile_;
  QTimer disk_, rest_;
  int direction_ = 1;  ///< In which the user goes through the steps.
  bool asksLine_ = false;
};

}  // namespace tervane
