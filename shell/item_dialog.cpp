// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/item_dialog.h"

#include <QDialogButtonBox>
#include <QDir>
#include <QLabel>
#include <QPushButton>
#include <QTreeWidget>
#include <QVBoxLayout>

#include "shell/widgets/qt_text.h"
#include "shell/widgets/row_delegate.h"
#include "shell/widgets/theme.h"

namespace tervane {

ItemDialog::ItemDialog(const Host::ItemQuestion& question, QWidget* parent) : QDialog(parent), question_(question) {
  const Theme& theme = Theme::Get();
  setWindowTitle(Translated(question.title));
  resize(theme.Scaled(720), theme.Scaled(320));
  auto* all = new QVBoxLayout(this);
  all->addWidget(new QLabel(QDir::toNativeSeparators(ToQt(question.file))));
  list_ = new QTreeWidget;
  list_->setAccessibleName(windowTitle());
  list_->setRootIsDecorated(false);
  list_->setAlternatingRowColors(true);
  list_->setItemDelegate(new RowDelegate(list_));
  QStringList heads;
  for (const std::string& head : question.heads) heads << Translated(head);
  list_->setHeaderLabels(heads);
  for (const Host::ItemQuestion::Row& row : question.rows) {
    auto* item = new QTreeWidgetItem(list_);
    for (std::size_t i = 0; i < row.cells.size(); ++i) item->setText(static_cast<int>(i), ToQt(row.cells[i]));
    if (row.refusal.empty()) continue;
    // It can be pointed at, to read why.
    for (int i = 0; i < list_->columnCount(); ++i) item->setForeground(i, theme.QuietColor());
    item->setIcon(0, theme.Icon("warning"));
    item->setData(0, Qt::AccessibleDescriptionRole, tr("It cannot be chosen: %1.").arg(ToQt(row.refusal)));
  }
  for (int i = 0; i < list_->columnCount(); ++i) list_->resizeColumnToContents(i);
  all->addWidget(list_, 1);
  refusal_ = new QLabel;
  refusal_->setWordWrap(true);
  all->addWidget(refusal_);
  auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
  ok_ = buttons->button(QDialogButtonBox::Ok);
  all->addWidget(buttons);
  connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
  connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
  connect(list_, &QTreeWidget::currentItemChanged, this, &ItemDialog::Sync);
  connect(list_, &QTreeWidget::itemActivated, this, [this] {
    if (ok_->isEnabled()) accept();
  });
  const int first = question.current >= 0 ? question.current : 0;
  list_->setCurrentItem(list_->topLevelItem(first));
  Sync();
}

int ItemDialog::Chosen() const { return list_->indexOfTopLevelItem(list_->currentItem()); }

void ItemDialog::Sync() {
  const int row = Chosen();
  const bool isRow = row >= 0 && row < static_cast<int>(question_.rows.size());
  const std::string refusal = isRow ? question_.rows[static_cast<std::size_t>(row)].refusal : std::string();
  ok_->setEnabled(isRow && refusal.empty());
  refusal_->setText(refusal.empty() ? QString() : tr("It cannot be chosen: %1.").arg(Translated(refusal)));
}

}  // namespace tervane
