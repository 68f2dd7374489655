// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QAbstractTableModel>
#include <QTableView>

#include "pages/data_file_view.h"

namespace tervane {

/// The values of a data file as a table that is only read: cells are asked for when they are seen, and copied as a
/// spreadsheet takes them.
class DataTable : public QTableView {
  Q_OBJECT

 public:
  explicit DataTable(DataFileView& file);

  /// Other rows, columns or heads than before.
  void Reset();
  /// The same rows and columns with other values.
  void Refill();
  /// Makes a cell the current one and shows it.
  void GoTo(std::size_t row, std::size_t column);

  /// Copies the selection; all with its heads when the whole table is selected. A slot's name, as all widgets have it.
  Q_INVOKABLE void copy() { Copy(false); }
  void CopyWithHeads() { Copy(true); }

 signals:
  /// What the user should know: a selection that no clipboard takes.
  void Told(const QString& text);

 protected:
  void keyPressEvent(QKeyEvent* event) override;

 private:
  class Model;

  void Copy(bool withHeads);
  void FollowTheme();

  DataFileView& file_;
  Model* model_;
};

}  // namespace tervane
