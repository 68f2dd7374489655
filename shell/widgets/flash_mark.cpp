// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/flash_mark.h"

#include <QEvent>
#include <QPainter>

#include "shell/widgets/theme.h"

namespace tervane {

namespace {

constexpr int kStep = 50, kSteps = 30, kFading = 10;  ///< In milliseconds and steps.

}  // namespace

FlashMark::FlashMark(QWidget* over) : QWidget(over), left_(kSteps) {
  setAttribute(Qt::WA_TransparentForMouseEvents);
  setFocusPolicy(Qt::NoFocus);
  setGeometry(over->rect());
  over->installEventFilter(this);
  connect(&timer_, &QTimer::timeout, this, [this] {
    if (--left_ <= 0) return deleteLater();
    update();
  });
  timer_.start(kStep);
  show();
  raise();
}

void FlashMark::paintEvent(QPaintEvent* /*event*/) {
  QPainter painter(this);
  painter.setRenderHint(QPainter::Antialiasing);
  const double width = Theme::Get().Scaled(2), strength = std::min(1.0, static_cast<double>(left_) / kFading);
  QColor line = Theme::Get().NoteColor(), inside = line;
  line.setAlphaF(static_cast<float>(strength));
  inside.setAlphaF(static_cast<float>(0.12 * strength));
  painter.setPen(QPen(line, width));
  painter.setBrush(inside);
  painter.drawRoundedRect(QRectF(rect()).adjusted(width / 2, width / 2, -width / 2, -width / 2), 3 * width / 2,
                          3 * width / 2);
}

bool FlashMark::eventFilter(QObject* watched, QEvent* event) {
  if (event->type() == QEvent::Resize && watched == parent()) setGeometry(parentWidget()->rect());
  return QWidget::eventFilter(watched, event);
}

}  // namespace tervane
