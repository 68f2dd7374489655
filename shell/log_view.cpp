// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/log_view.h"

#include <QTime>

namespace tervane {

LogView::LogView(const QString& emptyText) {
  setReadOnly(true);
  setFrameShape(QFrame::NoFrame);
  setPlaceholderText(emptyText);
  setMaximumBlockCount(100'000);
}

void LogView::Add(const QString& line) { appendPlainText(QTime::currentTime().toString("HH:mm:ss  ") + line); }

}  // namespace tervane
