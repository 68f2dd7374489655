// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/why_dialog.h"

#include <QDialogButtonBox>
#include <QHeaderView>
#include <QPushButton>
#include <QTreeWidget>
#include <QVBoxLayout>

#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

enum ReasonRole { kReasonSerialRole = Qt::UserRole, kReasonKeyRole };

}  // namespace

WhyDialog::WhyDialog(const QString& title, const std::vector<Explanation>& explanations, const QString& yes,
                     const QString& no, QWidget* parent)
    : QDialog(parent), list_(new QTreeWidget) {
  setWindowTitle(title);
  const Theme& theme = Theme::Get();
  resize(theme.Scaled(680), theme.Scaled(explanations.size() > 1 ? 480 : 260));
  list_->setAccessibleName(title);
  list_->setHeaderLabels({tr("Reason"), tr("Page")});
  list_->setItemDelegate(new RowDelegate(list_));
  list_->setUniformRowHeights(true);
  list_->header()->setStretchLastSection(false);
  list_->header()->setSectionResizeMode(0, QHeaderView::Stretch);
  list_->header()->setSectionResizeMode(1, QHeaderView::ResizeToContents);
  for (const Explanation& why : explanations) {
    auto* subject = new QTreeWidgetItem(list_, {tr("%1 %2").arg(Translated(why.subject), why.holds ? yes : no)});
    QFont bold = list_->font();
    bold.setBold(true);
    subject->setFont(0, bold);
    subject->setFirstColumnSpanned(true);
    if (why.reasons.empty()) new QTreeWidgetItem(subject, {tr("It depends on nothing else.")});
    for (const Reason& reason : why.reasons) {
      auto* row = new QTreeWidgetItem(subject, {Translated(reason.text), Translated(reason.page)});
      row->setIcon(0, theme.Icon(reason.holds ? "ok" : "note"));
      row->setToolTip(0, row->text(0));
      row->setData(0, kReasonSerialRole, QVariant::fromValue<quint64>(reason.serial));
      row->setData(0, kReasonKeyRole, ToQt(reason.key));
    }
    subject->setExpanded(true);
  }
  connect(list_, &QTreeWidget::itemActivated, this, &WhyDialog::Choose);
  auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close);
  QPushButton* show = buttons->addButton(tr("&Show on Its Page"), QDialogButtonBox::ActionRole);
  show->setEnabled(false);
  connect(list_, &QTreeWidget::currentItemChanged, this, [show](QTreeWidgetItem* item) {
    show->setEnabled(item && item->data(0, kReasonSerialRole).toULongLong() != 0);
  });
  connect(show, &QPushButton::clicked, this, &WhyDialog::Choose);
  connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
  auto* all = new QVBoxLayout(this);
  all->addWidget(list_, 1);
  all->addWidget(buttons);
  if (list_->topLevelItemCount() > 0 && list_->topLevelItem(0)->childCount() > 0)
    list_->setCurrentItem(list_->topLevelItem(0)->child(0));
}

void WhyDialog::Choose() {
  const QTreeWidgetItem* item = list_->currentItem();
  const quint64 serial = item ? item->data(0, kReasonSerialRole).toULongLong() : 0;
  if (serial == 0) return;
  accept();
  emit Chosen(serial, item->data(0, kReasonKeyRole).toString());
}

}  // namespace tervane
