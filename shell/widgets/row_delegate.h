// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QAbstractItemView>
#include <QStyledItemDelegate>

namespace tervane {

/// Rows of trees and lists with some air between them. The selected row of the view that is its parent stands back
/// while the view has not the keyboard.
class RowDelegate : public QStyledItemDelegate {
 public:
  explicit RowDelegate(QAbstractItemView* view);

  QSize sizeHint(const QStyleOptionViewItem& option, const QModelIndex& index) const override;

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  void FollowFocus(bool hasFocus);

  QAbstractItemView* view_;
};

}  // namespace tervane
