// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QWidget>

#include "pages/result_view.h"

class QComboBox;
class QLabel;
class QToolButton;

namespace tervane {

/// What a user chooses for the map of a result: colours, differences, flow, and what is to be done with it.
class ResultTools : public QWidget {
  Q_OBJECT

 public:
  /// All must outlive it.
  ResultTools(ResultView& view, DataFileView& file, Host& host);

  /// Shows what holds for the item that is shown.
  void Sync();

 signals:
  /// The map is to be shown anew.
  void Changed();
  void LineWanted();
  void AnimationWanted();
  /// Cells were forgotten.
  void CellsChanged();

 private:
  void SubtractFile();

  ResultView& view_;
  DataFileView& file_;
  Host& host_;
  QComboBox *colors_, *flows_;
  QLabel* flowLabel_;
  QToolButton *difference_, *cells_, *line_, *animation_;
  QAction *thisStep_, *otherRun_, *none_, *keep_, *forget_;
};

}  // namespace tervane
