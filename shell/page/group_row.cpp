// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/page/group_row.h"

#include <QGridLayout>
#include <QResizeEvent>
#include <algorithm>

#include "shell/widgets/theme.h"

namespace tervane {

GroupRow::GroupRow() : grid_(new QGridLayout(this)) {
  grid_->setContentsMargins(0, 0, 0, 0);
  grid_->setSpacing(Theme::Get().Scaled(12));
}

void GroupRow::Add(QWidget* group) {
  groups_.push_back(group);
  Arrange(static_cast<int>(groups_.size()));
}

int GroupRow::WidestGroup() const {
  int widest = 0;
  for (const QWidget* group : groups_) widest = std::max(widest, group->minimumSizeHint().width());
  return widest;
}

int GroupRow::FullWidth() const {
  const int count = static_cast<int>(groups_.size());
  return count * (WidestGroup() + grid_->spacing());
}

QSize GroupRow::minimumSizeHint() const {
  // One column must fit; a full row need not.
  return {WidestGroup(), grid_->minimumSize().height()};
}

void GroupRow::resizeEvent(QResizeEvent* event) {
  QWidget::resizeEvent(event);
  const int fitting = (event->size().width() + grid_->spacing()) / std::max(1, WidestGroup() + grid_->spacing());
  Arrange(std::clamp(fitting, 1, static_cast<int>(groups_.size())));
}

void GroupRow::Arrange(int columns) {
  if (columns == columns_ && grid_->count() == static_cast<int>(groups_.size())) return;
  columns_ = columns;
  for (QWidget* group : groups_) grid_->removeWidget(group);
  for (int i = 0; i < static_cast<int>(groups_.size()); ++i)
    grid_->addWidget(groups_[static_cast<std::size_t>(i)], i / columns, i % columns, Qt::AlignTop);
  for (int column = 0; column < static_cast<int>(groups_.size()); ++column)
    grid_->setColumnStretch(column, column < columns ? 1 : 0);
}

}  // namespace tervane
