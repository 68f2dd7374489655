// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/findings_view.h"

#include <QApplication>
#include <QClipboard>
#include <QContextMenuEvent>
#include <QHeaderView>
#include <QMenu>
#include <QPainter>
#include <algorithm>

#include "document/flow_model_document.h"
#include "fixes/quick_fixes.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

enum FindingColumn { kKindColumn, kPlaceColumn, kTextColumn, kLineColumn };

QString PathText(const SetupFinding& finding) {
  return ToQt(finding.key.empty() ? finding.path : finding.path + ":" + finding.key);
}

QString FindingText(const SetupFinding& finding) {
  const QString text = Translated(finding.text).simplified();
  return finding.detail.empty() ? text : text + " — " + Translated(finding.detail);
}

void CollectNodes(CYbSEKvfBase& node, std::unordered_map<std::uint64_t, CYbSEKvfBase*>& wanted) {
  if (const auto found = wanted.find(node.Serial()); found != wanted.end()) found->second = &node;
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
    CollectNodes(*child, wanted);
}

QString TextOfKind(SetupFinding::Kind kind) {
  switch (kind) {
    case SetupFinding::Kind::Error:
      return FindingsView::tr("Error");
    case SetupFinding::Kind::Warning:
      return FindingsView::tr("Warning");
    case SetupFinding::Kind::Note:
      return FindingsView::tr("Note");
    case SetupFinding::Kind::Unread:
      return FindingsView::tr("Not read");
  }
  return {};
}

bool SameFindings(const std::vector<SetupFinding>& a, const std::vector<SetupFinding>& b) {
  return std::ranges::equal(a, b, [](const SetupFinding& x, const SetupFinding& y) {
    return x.kind == y.kind && x.serial == y.serial && x.path == y.path && x.key == y.key && x.text == y.text &&
           x.detail == y.detail && x.line == y.line && x.isPast == y.isPast;
  });
}

}  // namespace

FindingsView::FindingsView(CFlowModelDoc& document) : document_(document) {
  setRootIsDecorated(false);
  setUniformRowHeights(true);
  setAlternatingRowColors(true);
  setFrameShape(QFrame::NoFrame);
  setHeaderLabels({tr("Kind"), tr("Place"), tr("Finding"), tr("Line")});
  header()->setStretchLastSection(false);
  header()->setSectionResizeMode(kKindColumn, QHeaderView::ResizeToContents);
  header()->setSectionResizeMode(kTextColumn, QHeaderView::Stretch);
  header()->setSectionResizeMode(kLineColumn, QHeaderView::ResizeToContents);
  setColumnHidden(kLineColumn, true);
  setItemDelegate(new RowDelegate(this));
  connect(this, &QTreeWidget::itemClicked, this, [this](QTreeWidgetItem* item) { Choose(item); });
  connect(this, &QTreeWidget::itemActivated, this, [this](QTreeWidgetItem* item) { Choose(item); });
  connect(this, &QTreeWidget::itemExpanded, this, &FindingsView::Fill);
}

FindingsView::Nodes FindingsView::NodesOfFindings() const {
  Nodes nodes;
  for (const SetupFinding& finding : findings_)
    if (finding.serial) nodes.emplace(finding.serial, nullptr);
  if (!nodes.empty()) CollectNodes(document_.Root(), nodes);
  return nodes;
}

QTreeWidgetItem* FindingsView::NewLine(const SetupFinding& finding, const QString& place, const QString& text) const {
  auto* item = new QTreeWidgetItem;
  const bool isError = finding.kind == SetupFinding::Kind::Error;
  const bool isWarning = finding.kind == SetupFinding::Kind::Warning;
  item->setIcon(kKindColumn, Theme::Get().Icon(isError ? "error" : isWarning ? "warning" : "note"));
  item->setText(kKindColumn, TextOfKind(finding.kind));
  item->setText(kPlaceColumn, place.isEmpty() ? PathText(finding) : Translated(FromQt(place)));
  item->setText(kTextColumn, text);
  item->setToolTip(kTextColumn, text);
  item->setToolTip(kPlaceColumn, PathText(finding));
  if (finding.line > 0) item->setText(kLineColumn, QString::number(finding.line));
  if (finding.isPast)
    for (int column = 0; column < columnCount(); ++column) item->setForeground(column, Theme::Get().QuietColor());
  return item;
}

void FindingsView::Show(std::vector<SetupFinding> findings) {
  // The worst first; what the file's reading left stands behind what can be mended on a page, what may hold no more
  // behind all.
  std::ranges::stable_sort(findings, {},
                           [](const SetupFinding& finding) { return std::pair(finding.isPast, finding.kind); });
  if (SameFindings(findings, findings_)) return;
  findings_ = std::move(findings);
  // Groups that were opened stay open.
  std::vector<std::string> opened;
  for (int row = 0; row < topLevelItemCount(); ++row)
    if (topLevelItem(row)->isExpanded()) opened.push_back(groups_[static_cast<std::size_t>(row)].Place());
  clear();
  groups_ = GroupFindings(findings_);
  const Nodes nodes = NodesOfFindings();
  PlaceNames names(document_);
  const auto nodeOf = [&](const SetupFinding& finding) { return finding.serial ? nodes.at(finding.serial) : nullptr; };
  QList<QTreeWidgetItem*> items;
  for (const FindingGroup& group : groups_) {
    const SetupFinding& first = group.First();
    CYbSEKvfBase* node = nodeOf(first);
    // What the file holds and no node knows has its path alone.
    const bool isKnown = node && first.kind != SetupFinding::Kind::Unread;
    if (group.IsOne()) {
      items << NewLine(first, isKnown ? ToQt(names.Of(*node, first.path, first.key)) : QString(), FindingText(first));
      continue;
    }
    std::vector<CYbSEKvfBase*> all;
    for (const SetupFinding& finding : group.findings) all.push_back(nodeOf(finding));
    QTreeWidgetItem* line = NewLine(first, ToQt(PlaceNames::OfAll(all)),
                                    tr("%1: %2 places").arg(FindingText(first)).arg(group.findings.size()));
    line->setToolTip(kPlaceColumn, ToQt(group.Place()));
    line->setChildIndicatorPolicy(QTreeWidgetItem::ShowIndicator);
    items << line;
  }
  addTopLevelItems(items);
  setRootIsDecorated(std::ranges::any_of(groups_, [](const FindingGroup& group) { return !group.IsOne(); }));
  for (int row = 0; row < topLevelItemCount(); ++row)
    if (std::ranges::find(opened, groups_[static_cast<std::size_t>(row)].Place()) != opened.end())
      topLevelItem(row)->setExpanded(true);
  const bool hasLines = std::ranges::any_of(findings_, [](const SetupFinding& finding) { return finding.line > 0; });
  setColumnHidden(kLineColumn, !hasLines);
  resizeColumnToContents(kPlaceColumn);
  // What is found needs more room than where it was found.
  const int widest = std::max(width() * 2 / 5, Theme::Get().Scaled(160));
  setColumnWidth(kPlaceColumn, std::min({columnWidth(kPlaceColumn), Theme::Get().Scaled(340), widest}));
}

void FindingsView::Fill(QTreeWidgetItem* item) {
  const int row = indexOfTopLevelItem(item);
  if (row < 0 || item->childCount() > 0) return;
  const Nodes nodes = NodesOfFindings();
  PlaceNames names(document_);
  for (const SetupFinding& finding : groups_[static_cast<std::size_t>(row)].findings) {
    CYbSEKvfBase* node = finding.serial ? nodes.at(finding.serial) : nullptr;
    item->addChild(
        NewLine(finding, node ? ToQt(names.Of(*node, finding.path, finding.key)) : QString(), FindingText(finding)));
  }
}

int FindingsView::Count() const {
  return static_cast<int>(std::ranges::count_if(findings_, [](const SetupFinding& finding) {
    return !finding.isPast &&
           (finding.kind == SetupFinding::Kind::Error || finding.kind == SetupFinding::Kind::Warning);
  }));
}

void FindingsView::Step(int by) {
  if (findings_.empty()) return;
  QTreeWidgetItem* next = !currentItem() ? nullptr : by > 0 ? itemBelow(currentItem()) : itemAbove(currentItem());
  // An open group is stepped through; behind the last line comes the first.
  if (!next && by > 0) next = topLevelItem(0);
  if (!next) {
    next = topLevelItem(topLevelItemCount() - 1);
    if (next->isExpanded()) next = next->child(next->childCount() - 1);
  }
  setCurrentItem(next);
  Choose(next);
}

const SetupFinding* FindingsView::FindingOfLine(QTreeWidgetItem* item) const {
  if (!item) return nullptr;
  const int group = indexOfTopLevelItem(item->parent() ? item->parent() : item);
  const int place = item->parent() ? item->parent()->indexOfChild(item) : 0;
  if (group < 0) return nullptr;
  return &groups_[static_cast<std::size_t>(group)].findings[static_cast<std::size_t>(place)];
}

void FindingsView::Choose(QTreeWidgetItem* item) {
  // A copy: the list may be another one before its place is shown.
  if (const SetupFinding* finding = FindingOfLine(item)) emit FindingChosen(SetupFinding(*finding));
}

void FindingsView::paintEvent(QPaintEvent* event) {
  QTreeWidget::paintEvent(event);
  if (topLevelItemCount() > 0) return;
  QPainter painter(viewport());
  painter.setPen(Theme::Get().QuietColor());
  const int margin = Theme::Get().Scaled(12);
  painter.drawText(viewport()->rect().adjusted(margin, margin, -margin, -margin), Qt::AlignTop | Qt::AlignLeft,
                   tr("No findings."));
}

void FindingsView::FillMenu(QMenu& menu, QTreeWidgetItem* item) {
  menu.addAction(tr("&Go to Place"), this, [this, item] { Choose(item); });
  menu.addAction(tr("&Copy"), this, [item] {
    QApplication::clipboard()->setText(
        QString("%1: %2: %3").arg(item->text(kKindColumn), item->text(kPlaceColumn), item->text(kTextColumn)));
  });
  const SetupFinding* finding = FindingOfLine(item);
  const bool isGroup = !item->parent() && !groups_[static_cast<std::size_t>(indexOfTopLevelItem(item))].IsOne();
  if (!finding || !finding->serial) return;
  Nodes nodes{{finding->serial, nullptr}};
  CollectNodes(document_.Root(), nodes);
  CYbSEKvfBase* node = nodes.begin()->second;
  if (!node) return;
  AddFixes(menu, *node,
           isGroup ? groups_[static_cast<std::size_t>(indexOfTopLevelItem(item))].findings
                   : std::vector<SetupFinding>{*finding});
  const std::vector<Mend> mends = isGroup ? std::vector<Mend>() : MendsOf(*node, *finding);
  if (mends.empty()) return;
  menu.addSeparator();
  constexpr std::size_t kFew = 6;
  QMenu& offered = mends.size() > kFew ? *menu.addMenu(tr("&Mend")) : menu;
  for (const Mend& mend : mends)
    offered.addAction(Translated(mend.text).replace("&", "&&"), this,
                      [this, serial = finding->serial, mend] { emit MendChosen(serial, mend); });
}

void FindingsView::AddFixes(QMenu& menu, CYbSEKvfBase& node, const std::vector<SetupFinding>& findings) {
  const QuickFixes fixes(document_);
  for (const FixKind* kind : fixes.KindsFor(node, findings.front())) {
    // What a finding offers stands below by its own name.
    if (kind->name == QuickFixes::kOffer && findings.size() == 1) continue;
    const QString title = Translated(std::string(kind->title)), name = ToQt(std::string(kind->name));
    menu.addSeparator();
    menu.addAction(findings.size() == 1 ? title : tr("%1 at %2 Places").arg(title).arg(findings.size()), this,
                   [this, name, findings] { emit FixChosen(name, findings); });
    const std::size_t all = fixes.FoundFor(*kind, findings_).size();
    if (all > findings.size())
      menu.addAction(tr("Fix All %1 of This Kind").arg(all), this, [this, name] { emit FixChosen(name, {}); });
  }
}

void FindingsView::contextMenuEvent(QContextMenuEvent* event) {
  QTreeWidgetItem* item = itemAt(event->pos());
  if (!item) return;
  QMenu menu;
  FillMenu(menu, item);
  menu.exec(event->globalPos());
}

}  // namespace tervane
