// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/data_table.h"

#include <QAction>
#include <QApplication>
#include <QClipboard>
#include <QHeaderView>
#include <QKeyEvent>
#include <algorithm>
#include <limits>

#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

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
  setHorizontalScrollMode(QAbstractItemView::ScrollPerPixel);
  setWordWrap(false);
  setAccessibleName(tr("Values"));
  for (QHeaderView* head : {horizontalHeader(), verticalHeader()}) head->setSectionResizeMode(QHeaderView::Interactive);
  verticalHeader()->setSectionResizeMode(QHeaderView::Fixed);
  setContextMenuPolicy(Qt::ActionsContextMenu);
  const auto add = [this](const QString& text, void (DataTable::*command)()) {
    auto* action = new QAction(text, this);
    connect(action, &QAction::triggered, this, command);
    addAction(action);
  };
  add(tr("&Copy"), &DataTable::copy);
  add(tr("Copy with &Heads"), &DataTable::CopyWithHeads);
  connect(&Theme::Get(), &Theme::Changed, this, &DataTable::FollowTheme);
  FollowTheme();
}

void DataTable::FollowTheme() {
  setFont(QApplication::font());
  verticalHeader()->setDefaultSectionSize(fontMetrics().height() + Theme::Get().Scaled(6));
  horizontalHeader()->setDefaultSectionSize(fontMetrics().horizontalAdvance("-0000000.000") + Theme::Get().Scaled(10));
}

void DataTable::Reset() {
  model_->Reset();
  // Heads of series are names; those of grids are numbers, and there may be thousands of them.
  constexpr int kFewColumns = 60;
  if (model_->columnCount() > kFewColumns) return;
  for (int column = 0; column < model_->columnCount(); ++column) {
    const QString head = model_->headerData(column, Qt::Horizontal, Qt::DisplayRole).toString();
    const int wanted = horizontalHeader()->fontMetrics().horizontalAdvance(head) + Theme::Get().Scaled(24);
    setColumnWidth(column, std::clamp(wanted, horizontalHeader()->defaultSectionSize(), Theme::Get().Scaled(260)));
  }
}

void DataTable::Refill() { model_->Refill(); }

void DataTable::GoTo(std::size_t row, std::size_t column) {
  const QModelIndex index = model_->index(static_cast<int>(row), static_cast<int>(column));
  setCurrentIndex(index);
  scrollTo(index, QAbstractItemView::PositionAtCenter);
}

void DataTable::Copy(bool withHeads) {
  constexpr double kMostCopied = 5e6;
  const QItemSelection selection = selectionModel()->selection();
  if (selection.isEmpty()) return;
  int top = std::numeric_limits<int>::max(), left = top, bottom = -1, right = -1;
  for (const QItemSelectionRange& range : selection) {
    top = std::min(top, range.top());
    left = std::min(left, range.left());
    bottom = std::max(bottom, range.bottom());
    right = std::max(right, range.right());
  }
  const double cells = (1.0 + bottom - top) * (1.0 + right - left);
  if (cells > kMostCopied) {
    emit Told(tr("%L1 cells are more than the clipboard takes; select at most %L2.")
                  .arg(cells, 0, 'f', 0)
                  .arg(kMostCopied, 0, 'f', 0));
    return;
  }
  const bool isAll = top == 0 && left == 0 && bottom == model_->rowCount() - 1 && right == model_->columnCount() - 1;
  const auto at = [](int number) { return static_cast<std::size_t>(number); };
  QApplication::clipboard()->setText(
      ToQt(file_.CellsAsText(at(top), at(bottom), at(left), at(right), withHeads || isAll)));
  emit Told({});
}

void DataTable::keyPressEvent(QKeyEvent* event) {
  if (event->matches(QKeySequence::Copy)) return copy();
  QTableView::keyPressEvent(event);
}

}  // namespace tervane
