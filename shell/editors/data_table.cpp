// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/data_table.h"

#include <QAction>
#include <QApplication>
#include <QClipboard>
#include <QKeyEvent>

#include "shell/widgets/qt_text.h"

namespace tervane {

class DataTable::Model : public QAbstractTableModel {
 public:
  explicit Model(DataFileView& file) : file_(file) {}

  void Reset() {
    beginResetModel();
    rows_ = static_cast<int>(file_.RowCount());
    columns_ = static_cast<int>(file_.ColumnCount());
    endResetModel();
  }
  void Refill() {
    // Views fetch again only what they show.
    if (rows_ > 0 && columns_ > 0) emit dataChanged(index(0, 0), index(rows_ - 1, columns_ - 1));
  }

  int rowCount(const QModelIndex& parent = {}) const override { return parent.isValid() ? 0 : rows_; }
  int columnCount(const QModelIndex& parent = {}) const override { return parent.isValid() ? 0 : columns_; }
  QVariant data(const QModelIndex& index, int role) const override {
    if (role == Qt::TextAlignmentRole) return static_cast<int>(Qt::AlignVCenter | Qt::AlignRight);
    if (role != Qt::DisplayRole) return {};
    return ToQt(file_.Cell(static_cast<std::size_t>(index.row()), static_cast<std::size_t>(index.column())));
  }
  QVariant headerData(int section, Qt::Orientation orientation, int role) const override {
    if (role != Qt::DisplayRole) return {};
    const auto number = static_cast<std::size_t>(section);
    return ToQt(orientation == Qt::Horizontal ? file_.ColumnHead(number) : file_.RowHead(number));
  }

 private:
  DataFileView& file_;
  // What the view counts with stays the same until it is told.
  int rows_ = 0, columns_ = 0;
};

DataTable::DataTable(DataFileView& file) : file_(file), model_(new Model(file)) {
  model_->setParent(this);
  setModel(model_);
  setEditTriggers(QAbstractItemView::NoEditTriggers);
  const auto add = [this](const QString& text, void (DataTable::*command)()) {
    auto* action = new QAction(text, this);
    connect(action, &QAction::triggered, this, command);
    addAction(action);
  };
  add(tr("&Copy"), &DataTable::copy);
  add(tr("Copy with &Heads"), &DataTable::CopyWithHeads);
}

void DataTable::Reset() {
  model_->Reset();
  FitColumns();
}

void DataTable::Refill() { model_->Refill(); }

void DataTable::Copy(bool withHeads) {
  int top = 0, left = 0, bottom = 0, right = 0;
  if (!SelectedToCopy(top, left, bottom, right)) return;
  const bool isAll = top == 0 && left == 0 && bottom == model_->rowCount() - 1 && right == model_->columnCount() - 1;
  const auto at = [](int number) { return static_cast<std::size_t>(number); };
  QApplication::clipboard()->setText(
      ToQt(file_.CellsAsText(at(top), at(bottom), at(left), at(right), withHeads || isAll)));
  emit Told({});
}

void DataTable::keyPressEvent(QKeyEvent* event) {
  if (event->matches(QKeySequence::Copy)) return copy();
  ValueTable::keyPressEvent(event);
}

}  // namespace tervane
