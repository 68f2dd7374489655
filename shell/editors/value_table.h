// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTableView>

namespace tervane {

/// The values of a data file as a table: cells are asked for when they are seen, and copied as a spreadsheet takes
/// them.
class ValueTable : public QTableView {
  Q_OBJECT

 public:
  ValueTable();

  /// Makes a cell the current one and shows it.
  void GoTo(int row, int column);
  /// The window around the selection, from top left to bottom right; false without one.
  bool Selected(int& top, int& left, int& bottom, int& right) const;

 signals:
  /// What the user should know: a selection that no clipboard takes.
  void Told(const QString& text);

 protected:
  /// Makes columns as wide as their heads and first cells, where they are few.
  void FitColumns();
  /// The same window where it can be copied; else the user is told why not.
  bool SelectedToCopy(int& top, int& left, int& bottom, int& right);

 private:
  void FollowTheme();
};

}  // namespace tervane
