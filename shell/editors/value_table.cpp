// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/value_table.h"

#include <QApplication>
#include <QHeaderView>
#include <algorithm>
#include <limits>

#include "shell/widgets/theme.h"

namespace tervane {

ValueTable::ValueTable() {
  setHorizontalScrollMode(QAbstractItemView::ScrollPerPixel);
  setWordWrap(false);
  // Columns are those of a map or a chart, values are numbers and dates.
  setLayoutDirection(Qt::LeftToRight);
  setAccessibleName(tr("Values"));
  verticalHeader()->setSectionResizeMode(QHeaderView::Fixed);
  setContextMenuPolicy(Qt::ActionsContextMenu);
  connect(&Theme::Get(), &Theme::Changed, this, &ValueTable::FollowTheme);
  FollowTheme();
}

void ValueTable::FollowTheme() {
  setFont(QApplication::font());
  verticalHeader()->setDefaultSectionSize(fontMetrics().height() + Theme::Get().Scaled(6));
  horizontalHeader()->setDefaultSectionSize(fontMetrics().horizontalAdvance("-0000000.000") + Theme::Get().Scaled(10));
  if (model()) FitColumns();
}

void ValueTable::FitColumns() {
  // Heads of series are names; those of grids are numbers, and there may be thousands of them.
  constexpr int kFewColumns = 60;
  if (model()->columnCount() > kFewColumns) return;
  for (int column = 0; column < model()->columnCount(); ++column) {
    const QString head = model()->headerData(column, Qt::Horizontal, Qt::DisplayRole).toString();
    const QString cell = model()->index(0, column).data().toString();
    const int wanted =
        std::max(horizontalHeader()->fontMetrics().horizontalAdvance(head), fontMetrics().horizontalAdvance(cell)) +
        Theme::Get().Scaled(24);
    setColumnWidth(column, std::clamp(wanted, horizontalHeader()->defaultSectionSize(), Theme::Get().Scaled(260)));
  }
}

void ValueTable::GoTo(int row, int column) {
  const QModelIndex index = model()->index(row, column);
  setCurrentIndex(index);
  scrollTo(index, QAbstractItemView::PositionAtCenter);
}

bool ValueTable::Selected(int& top, int& left, int& bottom, int& right) const {
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

bool ValueTable::SelectedToCopy(int& top, int& left, int& bottom, int& right) {
  constexpr double kMostCopied = 5e6;
  if (!Selected(top, left, bottom, right)) return false;
  const double cells = (1.0 + bottom - top) * (1.0 + right - left);
  if (cells <= kMostCopied) return true;
  emit Told(tr("%L1 cells are more than the clipboard takes; select at most %L2.")
                .arg(cells, 0, 'f', 0)
                .arg(kMostCopied, 0, 'f', 0));
  return false;
}

}  // namespace tervane
