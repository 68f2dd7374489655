// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QAbstractTableModel>
#include <QStringList>

#include "forms/page.h"
#include "forms/table_form.h"

namespace tervane {

/// The rows and cells of a table form for the toolkit's views. Rows and columns count from 0 here.
class TableModel : public QAbstractTableModel {
  Q_OBJECT

 public:
  TableModel(CYbSEDlgBase& page, Control& control)
      : page_(page), control_(control), rows_(Table().RowCount()), columns_(Columns()) {}

  TableForm& Table() const { return *control_.table; }
  /// Follows the form, also in its numbers of rows and columns.
  void Sync();
  /// Why the latest value that was set was refused; empty when it was taken.
  const QString& Refusal() const { return refusal_; }

  int rowCount(const QModelIndex& parent = {}) const override { return parent.isValid() ? 0 : rows_; }
  int columnCount(const QModelIndex& parent = {}) const override {
    return parent.isValid() ? 0 : static_cast<int>(columns_.size());
  }
  QVariant data(const QModelIndex& index, int role) const override;
  bool setData(const QModelIndex& index, const QVariant& value, int role) override;
  QVariant headerData(int section, Qt::Orientation orientation, int role) const override;
  Qt::ItemFlags flags(const QModelIndex& index) const override;

 private:
  /// What tells that the columns are others, whatever the units of their numbers are.
  QStringList Columns() const;
  bool IsGreyText(int row, int column) const;
  /// What nobody types is a text of ours as a rule, and stands in the user's language.
  QString ShownText(int row, int column) const;

  CYbSEDlgBase& page_;
  Control& control_;
  int rows_;
  QStringList columns_;  ///< That views know.
  QString refusal_;
};

}  // namespace tervane
