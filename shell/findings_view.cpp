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

#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

enum Column { kKindColumn, kPlaceColumn, kTextColumn, kLineColumn };

QString PathText(const SetupFinding& finding) {
  return ToQt(finding.key.empty() ? finding.path : finding.path + ":" + finding.key);
}

QString KindText(SetupFinding::Kind kind) {
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
           x.detail == y.detail && x.line == y.line;
  });
}

}  // namespace

FindingsView::FindingsView() {
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
}

void FindingsView::Show(std::vector<SetupFinding> findings) {
  // The worst first; what the file's reading left stands behind what can be mended on a page.
  std::ranges::stable_sort(findings, {}, &SetupFinding::kind);
  if (SameFindings(findings, findings_)) return;
  findings_ = std::move(findings);
  clear();
  QList<QTreeWidgetItem*> items;
  for (const SetupFinding& finding : findings_) {
    auto* item = new QTreeWidgetItem;
    const bool isError = finding.kind == SetupFinding::Kind::Error;
    const bool isWarning = finding.kind == SetupFinding::Kind::Warning;
    item->setIcon(kKindColumn, Theme::Get().Icon(isError ? "error" : isWarning ? "warning" : "note"));
    item->setText(kKindColumn, KindText(finding.kind));
    item->setText(kPlaceColumn, PathText(finding));
    QString text = Translated(finding.text).simplified();
    if (!finding.detail.empty()) text += " — " + ToQt(finding.detail);
    item->setText(kTextColumn, text);
    item->setToolTip(kTextColumn, text);
    item->setToolTip(kPlaceColumn, PathText(finding));
    if (finding.line > 0) item->setText(kLineColumn, QString::number(finding.line));
    items << item;
  }
  addTopLevelItems(items);
  const bool hasLines = std::ranges::any_of(findings_, [](const SetupFinding& finding) { return finding.line > 0; });
  setColumnHidden(kLineColumn, !hasLines);
  resizeColumnToContents(kPlaceColumn);
  setColumnWidth(kPlaceColumn, std::min(columnWidth(kPlaceColumn), Theme::Get().Scaled(300)));
}

int FindingsView::Count() const {
  return static_cast<int>(std::ranges::count_if(findings_, [](const SetupFinding& finding) {
    return finding.kind == SetupFinding::Kind::Error || finding.kind == SetupFinding::Kind::Warning;
  }));
}

void FindingsView::Step(int by) {
  if (findings_.empty()) return;
  const int count = topLevelItemCount();
  const int current = currentItem() ? indexOfTopLevelItem(currentItem()) : (by > 0 ? -1 : count);
  setCurrentItem(topLevelItem((current + by + count) % count));
  Choose(currentItem());
}

void FindingsView::Choose(QTreeWidgetItem* item) {
  const int row = indexOfTopLevelItem(item);
  if (row >= 0 && row < static_cast<int>(findings_.size()))
    emit FindingChosen(SetupFinding(findings_[static_cast<std::size_t>(row)]));
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

void FindingsView::contextMenuEvent(QContextMenuEvent* event) {
  QTreeWidgetItem* item = itemAt(event->pos());
  if (!item) return;
  QMenu menu;
  menu.addAction(tr("&Go to Place"), this, [this, item] { Choose(item); });
  menu.addAction(tr("&Copy"), this, [item] {
    QApplication::clipboard()->setText(
        QString("%1: %2: %3").arg(item->text(kKindColumn), item->text(kPlaceColumn), item->text(kTextColumn)));
  });
  menu.exec(event->globalPos());
}

}  // namespace tervane
