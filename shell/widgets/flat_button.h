// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QBoxLayout>
#include <QToolButton>
#include <functional>

namespace tervane {

/// Adds a button with a text, without a frame, that the Tab key reaches and a mouse leaves the keyboard where it is.
inline QToolButton* AddFlatButton(QBoxLayout& row, const QString& text, std::function<void()> press) {
  auto* button = new QToolButton;
  button->setText(text);
  button->setAutoRaise(true);
  button->setFocusPolicy(Qt::TabFocus);
  QObject::connect(button, &QToolButton::clicked, button, std::move(press));
  row.addWidget(button);
  return button;
}

}  // namespace tervane
