// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/changes_dialog.h"

#include <QDialogButtonBox>
#include <QHeaderView>
#include <QLabel>
#include <QPushButton>
#include <QTreeWidget>
#include <QVBoxLayout>

#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

QString ValueText(const std::string& value, const std::string& meaning, bool isDefault) {
  if (value.empty()) return isDefault ? ChangesDialog::tr("(default)") : QString("—");
  const QString text = meaning.empty() ? ToQt(value) : QString("%1 [%2]").arg(ToQt(value), ToQt(meaning));
  return isDefault ? ChangesDialog::tr("%1 (default)").arg(text) : text;
}

QString KindText(SetupDifference::Kind kind) {
  switch (kind) {
    case SetupDifference::Kind::Changed:
      return ChangesDialog::tr("Changed");
    case SetupDifference::Kind::Added:
      return ChangesDialog::tr("Added");
    case SetupDifference::Kind::Removed:
      return ChangesDialog::tr("Removed");
    case SetupDifference::Kind::Moved:
      return ChangesDialog::tr("Moved");
  }
  return {};
}

}  // namespace

ChangesDialog::ChangesDialog(const std::vector<SetupDifference>& differences, bool maySave, QWidget* parent)
    : QDialog(parent) {
  setWindowTitle(tr("What will be saved"));
  const Theme& theme = Theme::Get();
  resize(theme.Scaled(860), theme.Scaled(480));
  auto* all = new QVBoxLayout(this);
  auto* summary = new QLabel(
      differences.empty() ? tr("A save would change nothing in the file on disk.")
                          : tr("Places that a save will change in the file on disk: %1").arg(differences.size()));
  all->addWidget(summary);

  auto* list = new QTreeWidget;
  list->setRootIsDecorated(true);
  list->setAlternatingRowColors(true);
  list->setUniformRowHeights(true);
  list->setHeaderLabels({tr("Section and key"), tr("Change"), tr("On disk"), tr("Will be saved")});
  QTreeWidgetItem* section = nullptr;
  std::string path;
  for (const SetupDifference& difference : differences) {
    if (!section || path != difference.path) {
      path = difference.path;
      section = new QTreeWidgetItem(list, {ToQt(path)});
      section->setExpanded(true);
    }
    const bool isSection = difference.key.empty();
    QTreeWidgetItem* row = isSection ? section : new QTreeWidgetItem(section, {ToQt(difference.key)});
    row->setText(1, KindText(difference.kind));
    if (isSection && difference.from.empty() && difference.to.empty()) continue;
    row->setText(2, ValueText(difference.from, difference.fromMeaning, difference.fromDefault));
    row->setText(3, ValueText(difference.to, difference.toMeaning, difference.toDefault));
    for (const int column : {2, 3}) row->setToolTip(column, row->text(column));
  }
  list->setColumnWidth(0, theme.Scaled(340));
  list->setColumnWidth(1, theme.Scaled(90));
  list->setColumnWidth(2, theme.Scaled(190));
  all->addWidget(list, 1);

  auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close);
  auto* save = buttons->addButton(tr("&Save"), QDialogButtonBox::AcceptRole);
  save->setEnabled(maySave);
  connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
  connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
  all->addWidget(buttons);
}

}  // namespace tervane
