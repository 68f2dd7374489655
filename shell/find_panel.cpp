// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/find_panel.h"

#include <QHeaderView>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QStackedWidget>
#include <QTreeWidget>
#include <QVBoxLayout>

#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr std::size_t kMostHits = 200;

QString TreeName(int tree) {
  return tree == kProcessedDataTree ? FindPanel::tr("Processed Data")
         : tree == kResultsTree     ? FindPanel::tr("Results")
                                    : FindPanel::tr("Setup Data");
}

}  // namespace

FindPanel::FindPanel(CYbSEDocument& document, QWidget* trees) : document_(document) {
  auto* all = new QVBoxLayout(this);
  const int gap = Theme::Get().Scaled(6);
  all->setContentsMargins(0, gap, 0, 0);
  all->setSpacing(gap);
  field_ = new QLineEdit;
  field_->setPlaceholderText(tr("Find a place, label or key (Ctrl+F)"));
  field_->setAccessibleName(tr("Find"));
  field_->setClearButtonEnabled(true);
  field_->addAction(Theme::Get().Icon("find"), QLineEdit::LeadingPosition);
  field_->installEventFilter(this);
  auto* row = new QHBoxLayout;
  row->setContentsMargins(gap, 0, gap, 0);
  row->addWidget(field_);
  all->addLayout(row);

  auto* results = new QWidget;
  auto* column = new QVBoxLayout(results);
  column->setContentsMargins(0, 0, 0, 0);
  column->setSpacing(gap);
  count_ = new QLabel;
  count_->setContentsMargins(gap, 0, gap, 0);
  column->addWidget(count_);
  list_ = new QTreeWidget;
  list_->setHeaderHidden(true);
  list_->setAccessibleName(tr("Places found"));
  list_->setRootIsDecorated(false);
  list_->setFrameShape(QFrame::NoFrame);
  list_->setAlternatingRowColors(true);
  list_->setItemDelegate(new RowDelegate(list_));
  list_->installEventFilter(this);
  column->addWidget(list_, 1);
  stack_ = new QStackedWidget;
  stack_->addWidget(trees);
  stack_->addWidget(results);
  all->addWidget(stack_, 1);

  connect(field_, &QLineEdit::textChanged, this, &FindPanel::Find);
  connect(list_, &QTreeWidget::itemClicked, this, [this](QTreeWidgetItem* item) { Choose(item); });
  connect(list_, &QTreeWidget::itemActivated, this, [this](QTreeWidgetItem* item) { Choose(item); });
}

void FindPanel::Start() {
  field_->setFocus();
  field_->selectAll();
}

bool FindPanel::FocusOnHits() {
  const bool areShown = stack_->currentIndex() == 1;
  if (areShown) list_->setFocus();
  return areShown;
}

void FindPanel::Forget() {
  index_.reset();
  if (!field_->text().isEmpty()) Find();
}

void FindPanel::Find() {
  const QString typed = field_->text().trimmed();
  stack_->setCurrentIndex(typed.isEmpty() ? 0 : 1);
  if (typed.isEmpty()) return;
  if (!index_) index_ = std::make_unique<SearchIndex>(document_);
  hits_ = index_->Find(FromQt(typed), kMostHits);
  list_->clear();
  for (const SearchHit& hit : hits_) {
    auto* item = new QTreeWidgetItem(list_);
    const QString title = Translated(hit.title), tree = TreeName(hit.tree);
    const bool isTitle = hit.kind == SearchHit::Kind::Title;
    // A name that leads to a label stands behind it, so that it is seen why.
    const bool isByKey = hit.kind == SearchHit::Kind::Label && !ToQt(hit.text).contains(typed, Qt::CaseInsensitive) &&
                         ToQt(hit.key).contains(typed, Qt::CaseInsensitive);
    QString text = isTitle ? title : Translated(hit.text);
    if (isByKey) text += QString(" (%1)").arg(ToQt(hit.key));
    item->setText(0, QString("%1\n%2").arg(text, isTitle ? tree : QString("%1 · %2").arg(title, tree)));
    item->setToolTip(0, ToQt(hit.key.empty() ? hit.path : hit.path + ":" + hit.key));
  }
  count_->setText(hits_.empty()               ? tr("Nothing found.")
                  : hits_.size() == kMostHits ? tr("Hits: the first %1").arg(hits_.size())
                                              : tr("Hits: %1").arg(hits_.size()));
  if (!hits_.empty()) list_->setCurrentItem(list_->topLevelItem(0));
}

void FindPanel::Choose(QTreeWidgetItem* item) {
  const int row = list_->indexOfTopLevelItem(item);
  if (row < 0 || row >= static_cast<int>(hits_.size())) return;
  const SearchHit& hit = hits_[static_cast<std::size_t>(row)];
  emit HitChosen(hit.serial, ToQt(hit.kind == SearchHit::Kind::Title ? "" : hit.label.empty() ? hit.key : hit.label));
}

bool FindPanel::eventFilter(QObject* watched, QEvent* event) {
  if (event->type() == QEvent::KeyPress) {
    const int key = static_cast<QKeyEvent*>(event)->key();
    if (key == Qt::Key_Escape) {
      field_->clear();
      emit Left();
      return true;
    }
    if (watched == field_ && key == Qt::Key_Down && list_->topLevelItemCount() > 0) {
      list_->setFocus();
      return true;
    }
    if (watched == field_ && (key == Qt::Key_Return || key == Qt::Key_Enter)) {
      Choose(list_->currentItem());
      return true;
    }
  }
  return QWidget::eventFilter(watched, event);
}

}  // namespace tervane
