// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QColor>
#include <QList>
#include <QTextLayout>

namespace tervane {

/// The colours of a setup's text; each has a contrast of more than 4.5 to the ground of an editor.
struct TextColors {
  QColor section, text, number, comment, quiet;

  static TextColors Of(bool isDark);
};

/// The colours of a line, which needs no other line for that.
QList<QTextLayout::FormatRange> FormatsOf(const QString& line, const TextColors& colors);

}  // namespace tervane
