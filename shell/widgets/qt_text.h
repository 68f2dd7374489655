// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Texts on their way between the model, which has UTF-8, and the toolkit.
#pragma once

#include <QCoreApplication>
#include <QString>
#include <string>
#include <string_view>

namespace tervane {

inline QString ToQt(std::string_view text) {
  return QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size()));
}
inline std::string FromQt(const QString& text) { return text.toStdString(); }

/// A text of a page or of the tree in the user's language, where a translation is installed.
inline QString Translated(const std::string& text) { return QCoreApplication::translate("Pages", text.c_str()); }

}  // namespace tervane
