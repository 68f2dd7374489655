// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/page/form_dialog.h"

#include <QDialogButtonBox>
#include <QTimer>
#include <QVBoxLayout>

#include "shell/page/page_view.h"
#include "shell/widgets/theme.h"

namespace tervane {

FormDialog::FormDialog(const QString& title, CYbSEDlgBase& form, std::function<std::string()> accept, QWidget* parent)
    : QDialog(parent), form_(form), accept_(std::move(accept)) {
  setWindowTitle(title);
  auto* all = new QVBoxLayout(this);
  view_ = new PageView(form);
  all->addWidget(view_, 1);
  auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
  all->addWidget(buttons);
  connect(buttons, &QDialogButtonBox::accepted, this, &FormDialog::TryAccept);
  connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
  // A dialog has no document that tells of changes: its form follows its own.
  form.FollowItself([this] { view_->Sync(); }, [this] { QTimer::singleShot(0, view_, &PageView::Sync); });
  resize(view_->WantedSize() + QSize(0, Theme::Get().Scaled(80)));
  view_->FocusOn({});
}

void FormDialog::TryAccept() {
  view_->Commit();
  const std::string problem = accept_();
  if (problem.empty()) return accept();
  if (problem != " ") form_.Outside().ShowMessage(problem, Host::Icon::Warning);
}

}  // namespace tervane
