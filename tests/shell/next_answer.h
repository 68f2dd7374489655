// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QAbstractButton>
#include <QApplication>
#include <QMessageBox>
#include <QTimer>
#include <string>

#include <gtest/gtest.h>

#include "shell/widgets/qt_text.h"

namespace tervane::test {

/// Answers the next message box with the button of that text, and keeps what it said.
class NextAnswer {
 public:
  explicit NextAnswer(const QString& button) {
    timer_.setInterval(5);
    QObject::connect(&timer_, &QTimer::timeout, [this, button] {
      auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
      if (!box) return;
      text_ = FromQt(box->text());
      for (QAbstractButton* each : box->buttons())
        if (QString(each->text()).remove('&') == button) return each->click();
      ADD_FAILURE() << "no button " << FromQt(button) << " under: " << text_;
      box->reject();
    });
    timer_.start();
  }
  const std::string& Text() const { return text_; }

 private:
  QTimer timer_;
  std::string text_;
};

}  // namespace tervane::test
