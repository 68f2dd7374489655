// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/banner.h"

#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>
#include <QToolButton>

#include "shell/widgets/theme.h"

namespace tervane {

QColor Banner::Ground(Tone tone, bool isDark) {
  switch (tone) {
    case Tone::Question:
      return isDark ? QColor(0x4a, 0x3d, 0x17) : QColor(0xff, 0xf4, 0xcf);
    case Tone::Good:
      return isDark ? QColor(0x1f, 0x43, 0x2c) : QColor(0xdc, 0xf3, 0xe2);
    case Tone::Bad:
      return isDark ? QColor(0x54, 0x27, 0x24) : QColor(0xfd, 0xe3, 0xe0);
  }
  return {};
}

Banner::Banner(const QString& text, const std::vector<Answer>& answers, Tone tone) : text_(text) {
  const Theme& theme = Theme::Get();
  setAutoFillBackground(true);
  setAccessibleName(text);
  QPalette palette = this->palette();
  palette.setColor(QPalette::Window, Ground(tone, theme.IsDark()));
  setPalette(palette);
  auto* row = new QHBoxLayout(this);
  row->setContentsMargins(theme.Scaled(12), theme.Scaled(6), theme.Scaled(8), theme.Scaled(6));
  label_ = new QLabel(text);
  label_->setTextFormat(Qt::PlainText);
  label_->setWordWrap(true);
  row->addWidget(label_, 1);
  for (const Answer& answer : answers) {
    auto* button = new QPushButton(answer.first);
    row->addWidget(button);
    connect(button, &QPushButton::clicked, this, [this, act = answer.second] {
      deleteLater();
      hide();
      act();
    });
  }
  auto* close = new QToolButton;
  close->setIcon(theme.Icon("close"));
  close->setAutoRaise(true);
  close->setToolTip(tr("Close this message"));
  close->setAccessibleName(close->toolTip());
  row->addWidget(close);
  connect(close, &QToolButton::clicked, this, [this] {
    hide();
    deleteLater();
  });
}

void Banner::Age(const QString& reason) {
  label_->setText(reason.isEmpty() ? text_ : text_ + " " + reason);
  QPalette palette = QFrame().palette();
  if (reason.isEmpty()) palette.setColor(QPalette::Window, this->palette().color(QPalette::Window));
  palette.setColor(QPalette::WindowText,
                   reason.isEmpty() ? palette.color(QPalette::WindowText) : Theme::Get().QuietColor());
  label_->setPalette(palette);
}

}  // namespace tervane
