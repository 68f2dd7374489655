// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTimer>
#include <QWidget>

namespace tervane {

/// A frame that lies over a widget for a moment, so that the eye finds it. It deletes itself.
class FlashMark : public QWidget {
  Q_OBJECT

 public:
  explicit FlashMark(QWidget* over);

 protected:
  void paintEvent(QPaintEvent* event) override;
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  QTimer timer_;
  int left_;  ///< Steps until it is gone; it fades in the last ones.
};

}  // namespace tervane
