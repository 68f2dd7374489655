// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QAbstractTableModel>
#include <QTableView>
#include <QWidget>

#include "forms/page.h"
#include "forms/table_form.h"

class QLabel;
class QToolButton;

namespace tervane {

/// The rows and cells of a table form for the toolkit's views. Rows and columns count from 0 here.
class TableModel : public QAbstractTableModel {
  Q_OBJECT

 public:
  TableModel(CYbSEDlgBase& page, Control& control)
      : page_(page), control_(control), rows_(Table().RowCount()), heads_(Heads()) {}

  TableForm& Table() const { return *control_.table; }
  /// Follows the list, also in its number of rows.
  void Sync();
  /// Why the latest value that was set was refused; empty when it was taken.
  const QString& Refusal() const { return refusal_; }

  int rowCount(const QModelIndex& parent = {}) const override { return parent.isValid() ? 0 : rows_; }
  int columnCount(const QModelIndex& parent = {}) const override;
  QVariant data(const QModelIndex& index, int role) const override;
  bool setData(const QModelIndex& index, const QVariant& value, int role) override;
  QVariant headerData(int section, Qt::Orientation orientation, int role) const override;
  Qt::ItemFlags flags(const QModelIndex& index) const override;

 private:
  QStringList Heads() const;

  CYbSEDlgBase& page_;
  Control& control_;
  int rows_;
  QStringList heads_;  ///< Of the columns that views know.
  QString refusal_;
};

/// A table as a spreadsheet: cells are selected, copied, pasted and filled down, whole rows inserted, deleted and
/// moved.
class TableView : public QWidget {
  Q_OBJECT

 public:
  TableView(CYbSEDlgBase& page, Control& control);

  void Sync();
  void Commit();
  QWidget* FocusTarget() const;

  void Copy();
  void Cut();
  void Paste();
  void FillDown();
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
  void ChangeRowOfCurrentCell(RowAction action);
  void Tell(const CellsResult& result, const QString& done);
  void SyncButtons();
  void FitColumns();
  void OfferUnits(int column, const QPoint& place);

  CYbSEDlgBase& page_;
  Control& control_;
  TableModel* model_;
  QTableView* view_;
  QLabel* message_;
  QToolButton *insert_, *delete_, *up_, *down_;
  bool hasFittedColumns_ = false;
};

}  // namespace tervane
