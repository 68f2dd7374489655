// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Fields that stand below a table and show its current row. They are told as the columns of a table are:
//
//   form.Table(table);
//   RowFields<Well> fields(form, table);
//   fields.Value("Depth:", &Well::Depth).Quantity(kDepth);
#pragma once

#include "forms/table_of.h"
#include "spatial/file_nodes.h"

namespace tervane {

/// Adds a control to the form that shows and takes what the column says of the current row, and is disabled without
/// one.
Control& AddRowField(PageForm& form, std::shared_ptr<TableForm> table, std::shared_ptr<TableColumn> column,
                     std::string label, CellKind kind);

/// Adds a control for a data file of the current row, with the item that is chosen in it; `current` gives the file,
/// null without a row.
Control& AddRowFile(PageForm& form, std::shared_ptr<TableForm> table, std::function<DataFileNode*()> current,
                    std::string label);

template <class Row>
class RowFields : public ColumnMaker<Row> {
 public:
  RowFields(PageForm& form, std::shared_ptr<TableOf<Row>> table) : form_(form), table_(std::move(table)) {}

  /// A data file of the row, by the request of its node.
  Control& DataFile(std::string label, std::function<DataFileNode&(Row&)> file) {
    return AddRowFile(
        form_, table_,
        [table = table_, file = std::move(file)]() -> DataFileNode* {
          Row* row = table->Current();
          return row ? &file(*row) : nullptr;
        },
        std::move(label));
  }

 protected:
  TableColumn& AddOf(std::string label, std::optional<CellKind> kind) override {
    auto column = std::make_shared<TableColumn>();
    this->SetControl(AddRowField(form_, table_, column, std::move(label), kind.value_or(CellKind::Text)));
    return *column;
  }
  std::shared_ptr<RowsOf<Row>> Rows() const override { return table_->Rows(); }

 private:
  PageForm& form_;
  std::shared_ptr<TableOf<Row>> table_;
};

}  // namespace tervane
