// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTableView>
#include <QWidget>
#include <optional>

#include "shell/page/table_model.h"

class QDropEvent;
class QLabel;
class QLineEdit;
class QToolButton;

namespace tervane {

/// A table as a spreadsheet: cells are selected, copied, pasted and filled down, whole rows inserted, deleted and
/// moved.
class TableView : public QWidget {
  Q_OBJECT

 public:
  TableView(CYbSEDlgBase& page, Control& control);

  void Sync();
  void Commit();
  QWidget* FocusTarget() const;
  /// The width at which all columns are as wide as they begin.
  int WantedWidth() const;

  void Copy();
  void Cut();
  void Paste();
  void FillDown();
  void FillAll();
  void ClearCells();
  void ChangeRows(RowAction action);
  /// Selects a cell, counted from 1.
  void SelectCell(int row, int column);

 signals:
  void UnitChosen(int itemType, int unit);

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;

 private:
  /// The selection as one rectangle, the current cell when nothing is selected; nothing in an empty table.
  std::optional<CellRange> Selected() const;
  /// First and last of the rows that are selected as a whole; zeros when there are none.
  std::pair<int, int> SelectedRows() const;
  void MakeButtons();
  /// The field above rows that can be arranged; a click on a head then sorts by its column.
  void MakeFilter();
  void ShowArrangement();
  void MakeView();
  void ConnectView();
  void MakeActions();
  void ChangeRowOfCurrentCell(RowAction action);
  /// A file that is dragged over the cells; true where it is dealt with.
  bool TakeDraggedFile(QDropEvent& event);
  /// The cell with a file of which a place tells: the cell there, or the one on the left of the buttons there.
  QModelIndex FileCellAt(QPoint place) const;
  /// Makes the cell the current one of the row that is current in the form.
  void FollowCurrentRow();
  /// The first column in which something can be typed, from 0.
  int FirstEditableColumn(int row) const;
  /// Goes to the next cell as the key says; false at an end of the table.
  bool GoOn(int key, Qt::KeyboardModifiers modifiers);
  bool TakeKey(const QKeyEvent& keys);
  /// Opens the list or the calendar of the current cell.
  void OpenList();
  /// Says something above the table.
  void Tell(const QString& text);
  void ShowResult(const CellsResult& result, const QString& done);
  void SyncButtons();
  /// As a column begins: of what is only shown as wide as its head and cells, else as it is declared.
  int WidthOf(int column) const;
  /// In which no word of the head is cut, since a head breaks between words alone.
  int WidthOfHeadWords(int column) const;
  /// Of all columns as they begin, with the edges of the table.
  int WidthOfColumns() const;
  void FitColumns();
  void OfferUnits(int column, const QPoint& place);

  CYbSEDlgBase& page_;
  Control& control_;
  TableModel* model_;
  QTableView* view_;
  QLabel* message_;
  QLineEdit* filter_ = nullptr;
  QToolButton *insert_, *delete_, *up_, *down_;
  bool areColumnsTheUsers_ = false;  ///< He has moved an edge: they stay as he has them.
  bool isFitting_ = false;
  bool isSyncing_ = false;
  bool isSelectedByHead_ = false;  ///< In a table of one column each cell would be a whole row.
};

}  // namespace tervane
