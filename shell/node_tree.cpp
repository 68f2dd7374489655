// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/node_tree.h"

#include <QApplication>
#include <QClipboard>
#include <QContextMenuEvent>
#include <QMenu>
#include <QPainter>
#include <QSignalBlocker>
#include <QStyle>
#include <algorithm>
#include <array>
#include <functional>
#include <map>

#include "pages/tree_entries.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kMostOpen = 12;  ///< A branch of more entries begins closed, and tells their number.

enum ItemRole { kSerialRole = Qt::UserRole, kPathRole, kMarkRole, kShownMarkRole, kSharedRole, kNotesRole };
enum Mark { kNoMark, kWarning, kError };

/// Rows whose marks stand at their right end, so that no title moves when one comes.
class MarkedRowDelegate : public RowDelegate {
 public:
  using RowDelegate::RowDelegate;

 protected:
  void initStyleOption(QStyleOptionViewItem* option, const QModelIndex& index) const override {
    RowDelegate::initStyleOption(option, index);
    option->decorationPosition = QStyleOptionViewItem::Right;
  }
  void paint(QPainter* painter, const QStyleOptionViewItem& option, const QModelIndex& index) const override {
    RowDelegate::paint(painter, option, index);
    if (index.data(kNotesRole).toInt() == 0) return;
    // Beside the mark of findings, which has the end of the row.
    const int size = Theme::Get().Scaled(14);
    const QRect place(option.rect.right() - 2 * size - size / 2, option.rect.center().y() - size / 2, size, size);
    Theme::Get().Icon("review").paint(painter, QStyle::visualRect(option.direction, option.rect, place));
  }
};

/// Stands in several trees.
bool IsShared(const CYbSEKvfBase& node) {
  return std::ranges::count_if(std::array{kSetupDataTree, kProcessedDataTree, kResultsTree},
                               [&](TreeId tree) { return node.GetDlgRuntimeClass(tree) != nullptr; }) > 1;
}

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
  connect(this, &QTreeWidget::itemExpanded, this, &NodeTree::ShowMark);
  connect(this, &QTreeWidget::itemCollapsed, this, &NodeTree::ShowMark);
  connect(this, &QTreeWidget::currentItemChanged, this, [this](QTreeWidgetItem* item) {
    if (!item) return;
    Keep(*item);
    emit NodeChosen(item->data(0, kSerialRole).toULongLong());
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
    std::map<quint64, bool> isOpen;
    std::map<QString, bool> isPathOpen;
    for (const QTreeWidgetItem* item : items_) {
      if (item->childCount() == 0) continue;
      isOpen[item->data(0, kSerialRole).toULongLong()] = item->isExpanded();
      isPathOpen[item->data(0, kPathRole).toString()] = item->isExpanded();
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
      if (items_[i]->childCount() == 0) continue;
      const QString path = ToQt(found[i].path);
      const auto known = isOpen.find(entries[i].serial);
      const auto knownPath = isPathOpen.find(path);
      items_[i]->setExpanded(known != isOpen.end()           ? known->second
                             : knownPath != isPathOpen.end() ? knownPath->second
                                                             : BeginsClosed(*items_[i]) == toggled_.contains(path));
    }
    entries_ = std::move(entries);
    Select(current);
    viewport()->update();
  }

  for (std::size_t i = 0; i < found.size(); ++i) {
    QTreeWidgetItem* item = items_[i];
    const QString title = Translated(found[i].title);
    item->setText(0, BeginsClosed(*item) ? QString("%1 (%2)").arg(title).arg(item->childCount()) : title);
    item->setData(0, kPathRole, ToQt(found[i].path));
    item->setData(0, kSharedRole, IsShared(*found[i].node));
    item->setData(0, kMarkRole, showMarks ? MarkOf(*found[i].node, withEntry) : kNoMark);
    QStringList texts;
    for (const Finding& finding : found[i].node->Findings()) texts << Translated(finding.text);
    // A title that is cut can be read there.
    item->setToolTip(0, texts.isEmpty() ? title : texts.join("\n"));
  }
  for (QTreeWidgetItem* item : items_) ShowMark(item);
}

void NodeTree::ShowNotes(const std::map<std::uint64_t, int>& counts) {
  for (std::size_t i = 0; i < items_.size() && i < entries_.size(); ++i) {
    const auto found = counts.find(entries_[i].serial);
    const int count = found == counts.end() ? 0 : found->second;
    if (items_[i]->data(0, kNotesRole).toInt() == count) continue;
    items_[i]->setData(0, kNotesRole, count);
    items_[i]->setData(0, Qt::AccessibleDescriptionRole,
                       count == 0   ? QString()
                       : count == 1 ? tr("1 review note")
                                    : tr("%1 review notes").arg(count));
  }
}

bool NodeTree::BeginsClosed(const QTreeWidgetItem& item) { return item.childCount() > kMostOpen; }

void NodeTree::ShowMark(QTreeWidgetItem* item) const {
  const std::function<int(const QTreeWidgetItem*)> worst = [&](const QTreeWidgetItem* at) {
    int mark = at->data(0, kMarkRole).toInt();
    for (int child = 0; child < at->childCount(); ++child) mark = std::max(mark, worst(at->child(child)));
    return mark;
  };
  const int mark = item->isExpanded() ? item->data(0, kMarkRole).toInt() : worst(item);
  const QVariant shown = item->data(0, kShownMarkRole);
  if (shown.isValid() && shown.toInt() == mark) return;
  item->setData(0, kShownMarkRole, mark);
  item->setIcon(0, mark == kNoMark ? QIcon() : Theme::Get().Icon(mark == kError ? "error" : "warning"));
}

QStringList NodeTree::Branches() const {
  QStringList branches;
  for (const QTreeWidgetItem* item : items_)
    if (item->childCount() > 0 && item->isExpanded() == BeginsClosed(*item))
      branches << item->data(0, kPathRole).toString();
  return branches;
}

void NodeTree::RestoreBranches(const QStringList& branches) {
  toggled_ = {branches.begin(), branches.end()};
  for (QTreeWidgetItem* item : items_)
    if (item->childCount() > 0)
      item->setExpanded(BeginsClosed(*item) == toggled_.contains(item->data(0, kPathRole).toString()));
}

void NodeTree::Keep(const QTreeWidgetItem& item) {
  if (!item.data(0, kSharedRole).toBool()) latest_ = item.data(0, kPathRole).toString();
}

bool NodeTree::HasOwn() const {
  return std::ranges::any_of(items_, [](const QTreeWidgetItem* item) { return !item->data(0, kSharedRole).toBool(); });
}

bool NodeTree::IsAtOwn() const { return currentItem() && !currentItem()->data(0, kSharedRole).toBool(); }

void NodeTree::ChooseLatest() {
  QTreeWidgetItem *first = nullptr, *latest = nullptr;
  for (QTreeWidgetItem* item : items_) {
    if (item->data(0, kSharedRole).toBool()) continue;
    if (!first) first = item;
    if (!latest_.isEmpty() && item->data(0, kPathRole).toString() == latest_) latest = item;
  }
  if (QTreeWidgetItem* chosen = latest ? latest : first ? first : topLevelItem(0)) setCurrentItem(chosen);
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
  if (!item) return false;
  Keep(*item);
  scrollToItem(item);
  return true;
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

bool NodeTree::focusNextPrevChild(bool next) {
  if (!next) return QTreeWidget::focusNextPrevChild(next);
  emit TabbedOn();
  return true;
}

void NodeTree::contextMenuEvent(QContextMenuEvent* event) {
  QMenu menu;
  if (const QTreeWidgetItem* item = itemAt(event->pos())) {
    menu.addAction(tr("&Copy Path"), this,
                   [item] { QApplication::clipboard()->setText(item->data(0, kPathRole).toString()); });
    menu.addAction(tr("Add &Note…"), this, [this, item] { emit NoteWanted(item->data(0, kSerialRole).toULongLong()); });
    menu.addAction(tr("&Why Is This Here?"), this,
                   [this, item] { emit WhyAsked(item->data(0, kSerialRole).toULongLong()); });
    menu.addSeparator();
  }
  menu.addAction(tr("&Expand All"), this, &QTreeWidget::expandAll);
  menu.addAction(tr("C&ollapse All"), this, &QTreeWidget::collapseAll);
  menu.exec(event->globalPos());
}

}  // namespace tervane
