// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Dates that are typed in fields and cells: "2000/01/31  12:00".
#pragma once

#include <QDateTime>
#include <QString>
#include <functional>

class QMenu;
class QWidget;

namespace tervane {

/// Not valid for another text.
QDateTime DateOf(const QString& text);
/// The date with the part counted in which the cursor stands; empty where there is none.
QString SteppedDate(const QString& text, int cursor, int by);
/// A menu with a calendar. It begins at the day of `shown()`; `choose` takes the chosen one with the time of day that
/// was shown.
QMenu* NewCalendarMenu(QWidget* parent, std::function<QString()> shown, std::function<void(const QString&)> choose);

}  // namespace tervane
