// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/row_delegate.h"

#include <QApplication>
#include <QEvent>
#include <QPalette>

#include "shell/widgets/theme.h"

namespace tervane {

RowDelegate::RowDelegate(QAbstractItemView* view) : QStyledItemDelegate(view), view_(view) {
  view_->installEventFilter(this);
  FollowFocus(false);
}

QSize RowDelegate::sizeHint(const QStyleOptionViewItem& option, const QModelIndex& index) const {
  const QSize size = QStyledItemDelegate::sizeHint(option, index);
  return {size.width(), size.height() + Theme::Get().Scaled(6)};
}

bool RowDelegate::eventFilter(QObject* watched, QEvent* event) {
  if (watched != view_) return QStyledItemDelegate::eventFilter(watched, event);
  if (event->type() == QEvent::FocusIn) FollowFocus(true);
  if (event->type() == QEvent::FocusOut) FollowFocus(false);
  return false;
}

void RowDelegate::FollowFocus(bool hasFocus) {
  QPalette palette = QApplication::palette();
  if (!hasFocus) {
    palette.setColor(QPalette::Highlight, Theme::Get().IsDark() ? QColor(0x3f, 0x4b, 0x57) : QColor(0xd3, 0xdf, 0xe9));
    palette.setColor(QPalette::HighlightedText, palette.color(QPalette::Text));
  }
  view_->setPalette(palette);
}

}  // namespace tervane
