// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QAbstractTableModel>

#include "pages/data_file_view.h"
#include "shell/editors/value_table.h"

namespace tervane {

/// The values of a data file as a table that is only read.
class DataTable : public ValueTable {
  Q_OBJECT

 public:
  explicit DataTable(DataFileView& file);

  /// Other rows, columns or heads than before.
  void Reset();
  /// The same rows and columns with other values.
  void Refill();

  /// Copies the selection; all with its heads when the whole table is selected. A slot's name, as all widgets have it.
  Q_INVOKABLE void copy() { Copy(false); }
  void CopyWithHeads() { Copy(true); }

 protected:
  void keyPressEvent(QKeyEvent* event) override;

 private:
  class Model;

  void Copy(bool withHeads);

  DataFileView& file_;
  Model* model_;
};

}  // namespace tervane
