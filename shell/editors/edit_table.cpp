// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/edit_table.h"

#include <QAbstractTableModel>
#include <QAction>
#include <QApplication>
#include <QClipboard>
#include <QKeyEvent>
#include <algorithm>
#include <utility>

namespace tervane {

class EditTable::Model : public QAbstractTableModel {
 public:
  explicit Model(EditTable& table) : QAbstractTableModel(&table), table_(table) {}

  void Reset() {
    beginResetModel();
    rows_ = table_.content_.rows();
    columns_ = table_.content_.columns();
    endResetModel();
  }
  void Refill() {
    if (rows_ > 0 && columns_ > 0) emit dataChanged(index(0, 0), index(rows_ - 1, columns_ - 1));
  }
  bool IsAsWide() const { return rows_ == table_.content_.rows() && columns_ == table_.content_.columns(); }

  int rowCount(const QModelIndex& parent = {}) const override { return parent.isValid() ? 0 : rows_; }
  int columnCount(const QModelIndex& parent = {}) const override { return parent.isValid() ? 0 : columns_; }
  QVariant data(const QModelIndex& index, int role) const override {
    if (role == Qt::TextAlignmentRole) return static_cast<int>(Qt::AlignVCenter | Qt::AlignRight);
    if (role != Qt::DisplayRole && role != Qt::EditRole) return {};
    return table_.content_.text(index.row(), index.column());
  }
  QVariant headerData(int section, Qt::Orientation orientation, int role) const override {
    if (role != Qt::DisplayRole) return {};
    return orientation == Qt::Horizontal ? table_.content_.columnHead(section) : table_.content_.rowHead(section);
  }
  Qt::ItemFlags flags(const QModelIndex& index) const override {
    const Qt::ItemFlags usual = QAbstractTableModel::flags(index);
    return table_.content_.mayEdit(index.column()) ? usual | Qt::ItemIsEditable : usual;
  }
  bool setData(const QModelIndex& index, const QVariant& value, int role) override {
    if (role != Qt::EditRole || value.toString() == data(index, role).toString()) return false;
    table_.Tell(table_.content_.enter(index.row(), index.column(), value.toString().trimmed()));
    return true;
  }

 private:
  EditTable& table_;
  // What the view counts with stays the same until it is told.
  int rows_ = 0, columns_ = 0;
};

EditTable::EditTable(EditTableContent content) : content_(std::move(content)), model_(new Model(*this)) {
  setModel(model_);
  // What is done to a selection is done to all cells of its window.
  setSelectionMode(QAbstractItemView::ContiguousSelection);
  const auto add = [this](const QString& text, const QKeySequence& keys, void (EditTable::*command)()) {
    auto* action = new QAction(text, this);
    // The keys are heard below; here they are told.
    action->setText(text + "\t" + keys.toString(QKeySequence::NativeText));
    connect(action, &QAction::triggered, this, command);
    addAction(action);
  };
  add(tr("&Copy"), QKeySequence::Copy, &EditTable::copy);
  add(tr("&Paste"), QKeySequence::Paste, &EditTable::paste);
  add(tr("&Delete Values"), QKeySequence::Delete, &EditTable::Clear);
}

void EditTable::Reset() {
  const QModelIndex current = currentIndex();
  const int row = current.row(), column = current.column();
  model_->Reset();
  if (row >= 0 && model_->rowCount() > 0 && model_->columnCount() > 0)
    setCurrentIndex(model_->index(std::min(row, model_->rowCount() - 1), std::min(column, model_->columnCount() - 1)));
  FitColumns();
}

void EditTable::Refill() {
  if (model_->IsAsWide())
    model_->Refill();
  else
    Reset();
}

void EditTable::CommitOpenEditor() {
  if (state() != QAbstractItemView::EditingState) return;
  QWidget* const editor = indexWidget(currentIndex());
  if (!editor) return;
  commitData(editor);
  closeEditor(editor, QAbstractItemDelegate::NoHint);
}

void EditTable::Tell(const QString& told) {
  emit Told(told);
  emit Changed();
}

void EditTable::copy() {
  int top = 0, left = 0, bottom = 0, right = 0;
  if (!SelectedToCopy(top, left, bottom, right)) return;
  QString text;
  for (int row = top; row <= bottom; ++row)
    for (int column = left; column <= right; ++column)
      text += content_.text(row, column) + (column == right ? "\n" : "\t");
  QApplication::clipboard()->setText(text);
  emit Told({});
}

void EditTable::paste() {
  const QModelIndex current = currentIndex();
  int top = current.row(), left = current.column(), bottom = 0, right = 0;
  Selected(top, left, bottom, right);
  if (top >= 0 && left >= 0 && top < model_->rowCount())
    Tell(content_.paste(top, left, QApplication::clipboard()->text()));
}

void EditTable::Clear() {
  int top = 0, left = 0, bottom = 0, right = 0;
  if (Selected(top, left, bottom, right)) Tell(content_.clear(top, left, bottom, right));
}

void EditTable::keyPressEvent(QKeyEvent* event) {
  if (event->matches(QKeySequence::Copy)) return copy();
  if (event->matches(QKeySequence::Paste)) return paste();
  if (event->matches(QKeySequence::Delete) || event->key() == Qt::Key_Backspace) return Clear();
  ValueTable::keyPressEvent(event);
}

}  // namespace tervane
