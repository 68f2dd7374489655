// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/changes_dialog.h"

#include <QDialogButtonBox>
#include <QLabel>
#include <QPushButton>
#include <QVBoxLayout>

#include "shell/difference_list.h"
#include "shell/widgets/theme.h"

namespace tervane {

ChangesDialog::ChangesDialog(const std::vector<SetupDifference>& differences, Save saves, QWidget* parent)
    : QDialog(parent) {
  setWindowTitle(tr("What will be saved"));
  const Theme& theme = Theme::Get();
  resize(theme.Scaled(860), theme.Scaled(480));
  auto* all = new QVBoxLayout(this);
  auto* summary = new QLabel(
      differences.empty() ? tr("A save would change nothing in the file on disk.")
                          : tr("Places that a save will change in the file on disk: %1").arg(differences.size()));
  all->addWidget(summary);
  if (saves == Save::OverAnother) {
    auto* warning =
        new QLabel(tr("Another program has changed the file since it was read here. A save takes that back."));
    warning->setWordWrap(true);
    all->addWidget(warning);
  }

  auto* list = new DifferenceList(tr("On disk"), tr("Will be saved"));
  list->Show(differences);
  all->addWidget(list, 1);

  auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close);
  auto* save =
      buttons->addButton(saves == Save::OverAnother ? tr("&Save Over It") : tr("&Save"), QDialogButtonBox::AcceptRole);
  save->setEnabled(saves != Save::No);
  buttons->button(QDialogButtonBox::Close)->setDefault(true);
  connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
  connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
  all->addWidget(buttons);
}

}  // namespace tervane
