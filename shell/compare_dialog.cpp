// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/compare_dialog.h"

#include <QDialogButtonBox>
#include <QFileInfo>
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

CompareDialog::CompareDialog(EditSession& session, const QString& name, std::unique_ptr<CFlowModelDoc> other,
                             QWidget* parent)
    : QDialog(parent),
      session_(session),
      other_(std::move(other)),
      otherName_(QFileInfo(ToQt(other_->PathName())).fileName()) {
  const Theme& theme = Theme::Get();
  setWindowTitle(tr("%1 and %2").arg(name, otherName_));
  resize(theme.Scaled(960), theme.Scaled(560));
  auto* all = new QVBoxLayout(this);
  summary_ = new QLabel;
  all->addWidget(summary_);
  list_ = new DifferenceList(name, otherName_);
  all->addWidget(list_, 1);
  told_ = new QLabel;
  told_->setWordWrap(true);
  all->addWidget(told_);
  auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close);
  take_ = buttons->addButton(tr("&Take This"), QDialogButtonBox::ActionRole);
  take_->setToolTip(tr("Gives this key the value that it has in %1; Undo takes that back").arg(otherName_));
  show_ = buttons->addButton(tr("&Show on Its Page"), QDialogButtonBox::ActionRole);
  all->addWidget(buttons);
  connect(take_, &QPushButton::clicked, this, &CompareDialog::Take);
  connect(show_, &QPushButton::clicked, this, [this] {
    const SetupDifference* chosen = list_->Chosen();
    if (!chosen) return;
    const QString path = ToQt(chosen->key.empty() ? chosen->path : chosen->path + ":" + chosen->key);
    accept();
    emit PlaceChosen(path);
  });
  connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
  connect(list_, &QTreeWidget::currentItemChanged, this, [this] {
    told_->clear();
    Sync();
  });
  Compare();
}

CompareDialog::~CompareDialog() = default;

void CompareDialog::Compare() {
  list_->Show(DifferencesBetween(session_.Document(), *other_));
  const auto count = list_->Differences().size();
  summary_->setText(count == 0 ? tr("Both setups hold the same.") : tr("Places that differ: %1").arg(count));
  Sync();
}

void CompareDialog::Sync() {
  const SetupDifference* chosen = list_->Chosen();
  const bool isThere = chosen && FindNode(session_.Document().Root(), ParseSetupPath(chosen->path).steps) != nullptr;
  take_->setEnabled(isThere && chosen->kind == SetupDifference::Kind::Changed && !chosen->key.empty());
  show_->setEnabled(isThere);
}

void CompareDialog::Take() {
  const SetupDifference* chosen = list_->Chosen();
  if (!chosen) return;
  const QString key = ToQt(chosen->key);
  std::string problem;
  CYbSEKvfBase* node = TakeValue(session_.Document(), *other_, *chosen, problem);
  if (!node) {
    told_->setText(tr("Not taken: %1.").arg(ToQt(problem)));
    return;
  }
  node->SetRevalidateAll();
  session_.UpdateDoc(*node, kDataChanged | kTreeRebuilt | kRefreshPlots,
                     FromQt(tr("Take %1 of %2").arg(key, otherName_)), nullptr, FromQt(key));
  Compare();
  told_->setText(tr("Taken: %1").arg(key));
}

}  // namespace tervane
