// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/edit_table.h"

#include <QAbstractTableModel>
#include <QAction>
#include <QApplication>
#include <QClipboard>
#include <QHeaderView>
#include <QKeyEvent>
#include <algorithm>
#include <limits>
#include <utility>

#include "shell/widgets/theme.h"

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
  setHorizontalScrollMode(QAbstractItemView::ScrollPerPixel);
  setWordWrap(false);
  setAccessibleName(tr("Values"));
  verticalHeader()->setSectionResizeMode(QHeaderView::Fixed);
  setContextMenuPolicy(Qt::ActionsContextMenu);
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
  connect(&Theme::Get(), &Theme::Changed, this, &EditTable::FollowTheme);
  FollowTheme();
}

void EditTable::FollowTheme() {
  setFont(QApplication::font());
  verticalHeader()->setDefaultSectionSize(fontMetrics().height() + Theme::Get().Scaled(6));
  horizontalHeader()->setDefaultSectionSize(fontMetrics().horizontalAdvance("-0000000.000") + Theme::Get().Scaled(10));
}

void EditTable::Reset() {
  const QModelIndex current = currentIndex();
  const int row = current.row(), column = current.column();
  model_->Reset();
  if (row >= 0 && model_->rowCount() > 0 && model_->columnCount() > 0)
    setCurrentIndex(model_->index(std::min(row, model_->rowCount() - 1), std::min(column, model_->columnCount() - 1)));
  // Heads of series are names; those of grids are numbers, and there may be thousands of them.
  constexpr int kFewColumns = 60;
  if (model_->columnCount() > kFewColumns) return;
  for (int each = 0; each < model_->columnCount(); ++each) {
    const QString head = model_->headerData(each, Qt::Horizontal, Qt::DisplayRole).toString();
    const QString cell = model_->rowCount() > 0 ? content_.text(0, each) : QString();
    const int wanted =
        std::max(horizontalHeader()->fontMetrics().horizontalAdvance(head), fontMetrics().horizontalAdvance(cell)) +
        Theme::Get().Scaled(24);
    setColumnWidth(each, std::clamp(wanted, horizontalHeader()->defaultSectionSize(), Theme::Get().Scaled(260)));
  }
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

void EditTable::GoTo(int row, int column) {
  const QModelIndex index = model_->index(row, column);
  setCurrentIndex(index);
  scrollTo(index, QAbstractItemView::PositionAtCenter);
}

bool EditTable::Selected(int& top, int& left, int& bottom, int& right) const {
  top = left = std::numeric_limits<int>::max();
  bottom = right = -1;
  for (const QItemSelectionRange& range : selectionModel()->selection()) {
    top = std::min(top, range.top());
    left = std::min(left, range.left());
    bottom = std::max(bottom, range.bottom());
    right = std::max(right, range.right());
  }
  return bottom >= 0;
}

void EditTable::Tell(const QString& told) {
  emit Told(told);
  emit Changed();
}

void EditTable::copy() {
  constexpr double kMostCopied = 5e6;
  int top = 0, left = 0, bottom = 0, right = 0;
  if (!Selected(top, left, bottom, right)) return;
  const double cells = (1.0 + bottom - top) * (1.0 + right - left);
  if (cells > kMostCopied) {
    emit Told(tr("%L1 cells are more than the clipboard takes; select at most %L2.")
                  .arg(cells, 0, 'f', 0)
                  .arg(kMostCopied, 0, 'f', 0));
    return;
  }
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
  QTableView::keyPressEvent(event);
}

}  // namespace tervane
