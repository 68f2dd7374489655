// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QHeaderView>

#include "shell/page/table_model.h"

namespace tervane {

/// The heads of a table's columns: they break into lines where they are too long, and may go over several columns.
class TableHead : public QHeaderView {
  Q_OBJECT

 public:
  TableHead(const TableModel& model, QWidget* parent);

 protected:
  void paintSection(QPainter* painter, const QRect& rect, int section) const override;
  QSize sectionSizeFromContents(int section) const override;

 private:
  /// First and last of the columns under the head that stands over a column.
  std::pair<int, int> HeadOver(int section) const;
  int WidthOf(const std::pair<int, int>& columns) const;

  const TableModel& model_;
};

}  // namespace tervane
