// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QWidget>
#include <vector>

class QGridLayout;

namespace tervane {

/// Groups that stand beside each other where there is room, and below each other where there is not.
class GroupRow : public QWidget {
  Q_OBJECT

 public:
  GroupRow();
  void Add(QWidget* group);
  /// The width at which all stand in one row.
  int FullWidth() const;

  QSize minimumSizeHint() const override;

 protected:
  void resizeEvent(QResizeEvent* event) override;

 private:
  int WidestGroup() const;
  void Arrange(int columns);

  QGridLayout* grid_;
  std::vector<QWidget*> groups_;
  int columns_ = 0;
};

}  // namespace tervane
