// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/compare_view.h"

#include <QFileInfo>
#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>
#include <QVBoxLayout>

#include "core/path.h"
#include "document/setup_merge.h"
#include "forms/page_form.h"
#include "shell/difference_list.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

CompareView::CompareView(EditSession& session, const QString& name, std::unique_ptr<CFlowModelDoc> other)
    : session_(session),
      other_(std::move(other)),
      otherName_(QFileInfo(ToQt(other_->PathName())).fileName()),
      title_(tr("%1 and %2").arg(name, otherName_)) {
  auto* all = new QVBoxLayout(this);
  summary_ = new QLabel;
  all->addWidget(summary_);
  list_ = new DifferenceList(name, otherName_);
  all->addWidget(list_, 1);
  told_ = new QLabel;
  told_->setWordWrap(true);
  all->addWidget(told_);
  auto* buttons = new QHBoxLayout;
  buttons->addStretch();
  take_ = new QPushButton(tr("Ta&ke This"));
  take_->setToolTip(
      tr("Gives this key the value that it has in %1, adds an item that only %1 has, or removes one that it has not; "
         "Undo takes that back")
          .arg(otherName_));
  show_ = new QPushButton(tr("Show on Its &Page"));
  buttons->addWidget(take_);
  buttons->addWidget(show_);
  all->addLayout(buttons);
  connect(take_, &QPushButton::clicked, this, &CompareView::Take);
  connect(show_, &QPushButton::clicked, this, [this] {
    const SetupDifference* chosen = list_->Chosen();
    if (!chosen) return;
    emit PlaceChosen(ToQt(chosen->key.empty() ? chosen->path : chosen->path + ":" + chosen->key));
  });
  connect(list_, &QTreeWidget::currentItemChanged, this, [this] {
    told_->clear();
    Sync();
  });
}

CompareView::~CompareView() = default;

QString CompareView::Path() const { return ToQt(other_->PathName()); }

void CompareView::showEvent(QShowEvent* event) {
  QWidget::showEvent(event);
  // The setup may be another one than when this was last seen.
  Compare();
}

void CompareView::Compare() {
  list_->Show(DifferencesBetween(session_.Document(), *other_));
  const auto count = list_->Differences().size();
  summary_->setText(count == 0 ? tr("Both setups hold the same.") : tr("Places that differ: %1").arg(count));
  Sync();
}

void CompareView::Sync() {
  const SetupDifference* chosen = list_->Chosen();
  const bool isThere = chosen && FindNode(session_.Document().Root(), ParseSetupPath(chosen->path).steps) != nullptr;
  const bool isValue = isThere && chosen->kind == SetupDifference::Kind::Changed && !chosen->key.empty();
  take_->setEnabled(isValue || (chosen && IsOfItem(*chosen)));
  show_->setEnabled(isThere);
}

void CompareView::Take() {
  const SetupDifference* chosen = list_->Chosen();
  if (!chosen) return;
  const QString key = ToQt(chosen->key), taken = key.isEmpty() ? ToQt(chosen->path) : key;
  std::string problem;
  CYbSEKvfBase* node = key.isEmpty() ? TakeItem(session_.Document(), *other_, *chosen, problem)
                                     : TakeValue(session_.Document(), *other_, *chosen, problem);
  if (!node) {
    told_->setText(tr("Not taken: %1.").arg(Translated(problem)));
    return;
  }
  node->SetRevalidateAll();
  session_.UpdateDoc(*node, kDataChanged | kTreeRebuilt | kRefreshPlots,
                     FromQt(tr("Take %1 of %2").arg(taken, otherName_)), nullptr, FromQt(key));
  Compare();
  told_->setText(tr("Taken: %1").arg(taken));
}

}  // namespace tervane
