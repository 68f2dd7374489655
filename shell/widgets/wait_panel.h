// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QElapsedTimer>
#include <QFrame>
#include <QTimer>

class QLabel;
class QProgressBar;
class QPushButton;

namespace tervane {

class Background;

/// Tells over a widget what is computed for it and how far that is, and lets the user cancel it and start it again. It
/// appears only when that takes longer than a blink.
class WaitPanel : public QFrame {
  Q_OBJECT

 public:
  WaitPanel(Background& background, QWidget& over);

  /// Follows what the background waits for now; hides when that is nothing.
  void Sync();

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  void Place();

  Background& background_;
  QWidget& over_;
  QLabel* text_;
  QProgressBar* bar_;
  QPushButton* button_;
  QElapsedTimer since_;
  QTimer tick_;
};

}  // namespace tervane
