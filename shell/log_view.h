// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QPlainTextEdit>

namespace tervane {

/// A log that grows at its end.
class LogView : public QPlainTextEdit {
  Q_OBJECT

 public:
  /// `emptyText` is shown until something was logged.
  explicit LogView(const QString& emptyText);

  /// Adds a line with the time of day.
  void Add(const QString& line);
};

}  // namespace tervane
