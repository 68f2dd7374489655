// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/page/table_head.h"

#include <QPainter>
#include <QStyle>
#include <algorithm>

namespace tervane {

TableHead::TableHead(const TableModel& model, QWidget* parent) : QHeaderView(Qt::Horizontal, parent), model_(model) {
  setSectionsClickable(true);
  setHighlightSections(true);
  setDefaultAlignment(Qt::AlignLeft | Qt::AlignVCenter | static_cast<Qt::Alignment>(Qt::TextWordWrap));
  // A wider head may need fewer lines.
  connect(this, &QHeaderView::sectionResized, this, [this] { emit geometriesChanged(); });
}

std::pair<int, int> TableHead::HeadOver(int section) const {
  int first = section;
  while (first > 0 && model_.Table().HeadSpan(first + 1) == 0) --first;
  const int last = first + std::max(model_.Table().HeadSpan(first + 1), 1) - 1;
  return {first, std::min(last, count() - 1)};
}

int TableHead::WidthOf(const std::pair<int, int>& columns) const {
  int width = 0;
  for (int column = columns.first; column <= columns.second; ++column) width += sectionSize(column);
  return width;
}

void TableHead::paintSection(QPainter* painter, const QRect& rect, int section) const {
  const std::pair<int, int> columns = HeadOver(section);
  if (columns.first == columns.second) return QHeaderView::paintSection(painter, rect, section);
  // Each of the columns draws its part of the whole head.
  const QRect whole(sectionViewportPosition(columns.first), rect.top(), WidthOf(columns), rect.height());
  painter->save();
  painter->setClipRect(rect, Qt::IntersectClip);
  QHeaderView::paintSection(painter, whole, columns.first);
  painter->restore();
}

QSize TableHead::sectionSizeFromContents(int section) const {
  const QSize size = QHeaderView::sectionSizeFromContents(section);
  const std::pair<int, int> columns = HeadOver(section);
  const int margin = style()->pixelMetric(QStyle::PM_HeaderMargin, nullptr, this);
  const QString text = model_.headerData(columns.first, Qt::Horizontal, Qt::DisplayRole).toString();
  const QRect room(0, 0, std::max(WidthOf(columns) - 2 * margin, 1), 10000);
  // The head of the current column is bold.
  QFont bold = font();
  bold.setBold(true);
  const QRect lines = QFontMetrics(bold).boundingRect(room, Qt::AlignLeft | Qt::TextWordWrap, text);
  return {size.width(), std::max(lines.height(), fontMetrics().height()) + 2 * margin};
}

}  // namespace tervane
