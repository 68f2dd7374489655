// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/node_tree.h"

#include <QApplication>
#include <QClipboard>
#include <QContextMenuEvent>
#include <QMenu>
#include <QPainter>
#include <QSignalBlocker>
#include <algorithm>
#include <set>

#include "pages/tree_entries.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

enum ItemRole { kSerialRole = Qt::UserRole, kPathRole, kMarkRole };
enum Mark { kNoMark, kWarningBelow, kErrorBelow, kWarning, kError };

/// Rows whose marks stand at their right end, so that no title moves when one comes.
class MarkedRowDelegate : public RowDelegate {
 public:
  using RowDelegate::RowDelegate;

 protected:
  void initStyleOption(QStyleOptionViewItem* option, const QModelIndex& index) const override {
    RowDelegate::initStyleOption(option, index);
    option->decorationPosition = QStyleOptionViewItem::Right;
  }
};

/// The worst of a node's own findings.
Mark OwnMark(const CYbSEKvfBase& node) {
  Mark mark = kNoMark;
  for (const Finding& finding : node.Findings())
    if (finding.severity != Severity::Note)
      mark = std::max(mark, finding.severity == Severity::Error ? kError : kWarning);
  return mark;
}

/// The findings of all nodes below that have no entry of their own belong to this one.
Mark MarkOf(const CYbSEKvfBase& node, const std::set<const CYbSEKvfBase*>& withEntry) {
  Mark mark = OwnMark(node);
  for (const CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
    if (!withEntry.contains(child)) mark = std::max(mark, MarkOf(*child, withEntry));
  return mark;
}

}  // namespace

NodeTree::NodeTree(int treeId, QString emptyText) : treeId_(treeId), emptyText_(std::move(emptyText)) {
  setHeaderHidden(true);
  setUniformRowHeights(true);
  setItemDelegate(new MarkedRowDelegate(this));
  setFrameShape(QFrame::NoFrame);
  setTextElideMode(Qt::ElideRight);
  connect(this, &QTreeWidget::currentItemChanged, this, [this](QTreeWidgetItem* item) {
    if (item) emit NodeChosen(item->data(0, kSerialRole).toULongLong());
  });
}

void NodeTree::Sync(CYbSEKvfGlobalBase& root, bool showMarks) {
  const std::vector<TreeEntry> found = TreeEntries(root, treeId_);
  std::vector<Entry> entries;
  std::set<const CYbSEKvfBase*> withEntry;
  for (const TreeEntry& entry : found) {
    entries.push_back({entry.node->Serial(), entry.depth});
    withEntry.insert(entry.node);
  }
  if (entries != entries_) {
    const QSignalBlocker blocker(this);
    // Nodes that were made anew are known by their paths.
    std::set<quint64> closed, known;
    std::set<QString> closedPaths;
    for (const QTreeWidgetItem* item : items_) {
      known.insert(item->data(0, kSerialRole).toULongLong());
      if (item->childCount() == 0 || item->isExpanded()) continue;
      closed.insert(item->data(0, kSerialRole).toULongLong());
      closedPaths.insert(item->data(0, kPathRole).toString());
    }
    const quint64 current = currentItem() ? currentItem()->data(0, kSerialRole).toULongLong() : 0;
    clear();
    items_.clear();
    std::vector<QTreeWidgetItem*> above;
    for (const Entry& entry : entries) {
      above.resize(static_cast<std::size_t>(entry.depth));
      auto* item = above.empty() ? new QTreeWidgetItem(this) : new QTreeWidgetItem(above.back());
      item->setData(0, kSerialRole, QVariant::fromValue<quint64>(entry.serial));
      above.push_back(item);
      items_.push_back(item);
    }
    for (std::size_t i = 0; i < items_.size(); ++i) {
      const bool isClosed = known.contains(entries[i].serial) ? closed.contains(entries[i].serial)
                                                              : closedPaths.contains(ToQt(found[i].path));
      items_[i]->setExpanded(!isClosed);
    }
    entries_ = std::move(entries);
    Select(current);
    viewport()->update();
  }

  const Theme& theme = Theme::Get();
  const QIcon error = theme.Icon("error"), warning = theme.Icon("warning");
  std::vector<Mark> marks(found.size(), kNoMark);
  for (std::size_t i = 0; i < found.size(); ++i) {
    items_[i]->setText(0, Translated(found[i].title));
    items_[i]->setData(0, kPathRole, ToQt(found[i].path));
    marks[i] = showMarks ? MarkOf(*found[i].node, withEntry) : kNoMark;
  }
  for (std::size_t i = 0; i < found.size(); ++i) {
    // An entry that is closed shows what it hides.
    const Mark mark = marks[i];
    if (items_[i]->data(0, kMarkRole).toInt() == mark && items_[i]->data(0, kMarkRole).isValid()) continue;
    items_[i]->setData(0, kMarkRole, mark);
    items_[i]->setIcon(0, mark == kError ? error : mark == kWarning ? warning : QIcon());
    QStringList texts;
    for (const Finding& finding : found[i].node->Findings()) texts << Translated(finding.text);
    items_[i]->setToolTip(0, texts.join("\n"));
  }
}

QTreeWidgetItem* NodeTree::ItemOf(std::uint64_t serial) const {
  for (std::size_t i = 0; i < entries_.size(); ++i)
    if (entries_[i].serial == serial) return items_[i];
  return nullptr;
}

bool NodeTree::Select(std::uint64_t serial) {
  const QSignalBlocker blocker(this);
  QTreeWidgetItem* item = ItemOf(serial);
  setCurrentItem(item);
  if (item) scrollToItem(item);
  return item != nullptr;
}

void NodeTree::paintEvent(QPaintEvent* event) {
  QTreeWidget::paintEvent(event);
  if (topLevelItemCount() > 0) return;
  QPainter painter(viewport());
  painter.setPen(Theme::Get().QuietColor());
  const int margin = Theme::Get().Scaled(16);
  painter.drawText(viewport()->rect().adjusted(margin, margin, -margin, -margin),
                   Qt::AlignTop | Qt::AlignHCenter | Qt::TextWordWrap, emptyText_);
}

void NodeTree::contextMenuEvent(QContextMenuEvent* event) {
  QMenu menu;
  if (const QTreeWidgetItem* item = itemAt(event->pos())) {
    menu.addAction(tr("&Copy Path"), this,
                   [item] { QApplication::clipboard()->setText(item->data(0, kPathRole).toString()); });
    menu.addAction(tr("&Why Is This Here?"), this,
                   [this, item] { emit WhyAsked(item->data(0, kSerialRole).toULongLong()); });
    menu.addSeparator();
  }
  menu.addAction(tr("&Expand All"), this, &QTreeWidget::expandAll);
  menu.addAction(tr("C&ollapse All"), this, &QTreeWidget::collapseAll);
  menu.exec(event->globalPos());
}

}  // namespace tervane
