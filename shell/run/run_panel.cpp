// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/run/run_panel.h"

#include <QHBoxLayout>
#include <QLabel>
#include <QProgressBar>
#include <QPushButton>

#include "shell/run/document_run.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane {

RunPanel::RunPanel(DocumentRun& run) : run_(run) {
  const Theme& theme = Theme::Get();
  auto* row = new QHBoxLayout(this);
  row->setContentsMargins(theme.Scaled(8), theme.Scaled(4), theme.Scaled(8), theme.Scaled(4));
  row->setSpacing(theme.Scaled(8));
  bar_ = new QProgressBar;
  bar_->setFixedWidth(theme.Scaled(220));
  text_ = new QLabel;
  // The engine's words do not size the window.
  text_->setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Preferred);
  text_->setTextFormat(Qt::PlainText);
  time_ = new QLabel;
  stop_ = new QPushButton(tr("Sto&p"));
  // No key that is meant for something else stops an engine.
  stop_->setAutoDefault(false);
  row->addWidget(bar_);
  row->addWidget(text_, 1);
  row->addWidget(time_);
  row->addWidget(stop_);
  connect(stop_, &QPushButton::clicked, &run_, &DocumentRun::Stop);
  for (const auto signal : {&DocumentRun::Begun, &DocumentRun::Moved}) connect(&run_, signal, this, &RunPanel::Sync);
  connect(&run_, &DocumentRun::Ended, this, &RunPanel::Sync);
  Sync();
}

void RunPanel::Sync() {
  if (!run_.IsExecuting()) return hide();
  // Without a parent it would be a window of its own for a moment.
  if (parentWidget()) show();
  const auto& progress = run_.Progress();
  // Nothing is known before the engine tells it: the bar then only moves.
  bar_->setRange(0, progress ? 100 : 0);
  if (progress) bar_->setValue(static_cast<int>(progress->percent));
  const QString said = progress ? Translated(progress->text) : QString();
  text_->setText(run_.IsStopping() ? tr("Stopping…") : said.isEmpty() ? tr("Running %1").arg(run_.Name()) : said);
  text_->setToolTip(said);
  time_->setText(run_.Duration());
}

RunWindow::RunWindow(DocumentRun& run, QWidget* parent) : QDialog(parent) {
  setWindowTitle(tr("Running %1").arg(run.Name()));
  auto* all = new QVBoxLayout(this);
  all->addWidget(new RunPanel(run));
  auto* hint = new QLabel(tr("You can close this window, and the editor too: the engine runs on."));
  hint->setForegroundRole(QPalette::PlaceholderText);
  all->addWidget(hint);
  resize(Theme::Get().Scaled(560), sizeHint().height());
}

}  // namespace tervane
