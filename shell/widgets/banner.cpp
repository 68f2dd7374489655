// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/banner.h"

#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>
#include <QToolButton>

#include "shell/widgets/theme.h"

namespace tervane {

Banner::Banner(const QString& text, const std::vector<Answer>& answers) {
  const Theme& theme = Theme::Get();
  setAutoFillBackground(true);
  QPalette palette = this->palette();
  palette.setColor(QPalette::Window, theme.IsDark() ? QColor(0x4a, 0x3d, 0x17) : QColor(0xff, 0xf4, 0xcf));
  setPalette(palette);
  auto* row = new QHBoxLayout(this);
  row->setContentsMargins(theme.Scaled(12), theme.Scaled(6), theme.Scaled(8), theme.Scaled(6));
  auto* label = new QLabel(text);
  label->setWordWrap(true);
  row->addWidget(label, 1);
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
  row->addWidget(close);
  connect(close, &QToolButton::clicked, this, [this] {
    hide();
    deleteLater();
  });
}

}  // namespace tervane
