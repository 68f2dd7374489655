// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/wait_panel.h"

#include <QEvent>
#include <QHBoxLayout>
#include <QLabel>
#include <QProgressBar>
#include <QPushButton>
#include <QVBoxLayout>
#include <cmath>

#include "shell/widgets/background.h"
#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kBlink = 200;  ///< Milliseconds that nobody minds.
constexpr int kTick = 80;

}  // namespace

WaitPanel::WaitPanel(Background& background, QWidget& over) : QFrame(&over), background_(background), over_(over) {
  setFrameShape(QFrame::StyledPanel);
  setAutoFillBackground(true);
  setCursor(Qt::ArrowCursor);
  text_ = new QLabel;
  text_->setTextFormat(Qt::PlainText);
  bar_ = new QProgressBar;
  bar_->setRange(0, 100);
  button_ = new QPushButton;
  auto* all = new QVBoxLayout(this);
  all->addWidget(text_);
  auto* row = new QHBoxLayout;
  row->addWidget(bar_, 1);
  row->addStretch();
  row->addWidget(button_);
  all->addLayout(row);
  hide();
  over.installEventFilter(this);
  connect(button_, &QPushButton::clicked, this, [this] {
    background_.IsCancelled() ? background_.StartAgain() : background_.Cancel();
    Sync();
  });
  connect(&tick_, &QTimer::timeout, this, &WaitPanel::Sync);
}

void WaitPanel::Sync() {
  const bool isCancelled = background_.IsCancelled();
  if (!background_.IsWaiting() && !isCancelled) {
    tick_.stop();
    return hide();
  }
  if (isCancelled) {
    tick_.stop();
  } else if (!tick_.isActive()) {
    since_.start();
    tick_.start(kTick);
  }
  if (!isCancelled && !isVisible() && since_.elapsed() < kBlink) return;
  text_->setText(isCancelled ? tr("Cancelled: %1").arg(background_.Title()) : background_.Title());
  bar_->setVisible(!isCancelled);
  // Never full before the end.
  bar_->setValue(static_cast<int>(std::floor(99 * background_.Done())));
  button_->setText(isCancelled ? tr("Start &Again") : tr("Cancel"));
  show();
  Place();
}

void WaitPanel::Place() {
  const int width = std::min(std::max(sizeHint().width(), Theme::Get().Scaled(280)), over_.width());
  resize(width, sizeHint().height());
  move((over_.width() - width) / 2, (over_.height() - height()) / 2);
  raise();
}

bool WaitPanel::eventFilter(QObject* watched, QEvent* event) {
  if (event->type() == QEvent::Resize && isVisible()) Place();
  return QFrame::eventFilter(watched, event);
}

}  // namespace tervane
