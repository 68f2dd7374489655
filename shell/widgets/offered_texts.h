// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QStringList>
#include <functional>

class QLineEdit;

namespace tervane {

/// Offers texts for a line in which any other may be typed: those that hold what is typed as it is typed, all of them
/// by the button at its end and by Alt and the arrow down. They are asked for each time; while there are none, nothing
/// is offered. `chosen` is told when one was taken.
void OfferTexts(QLineEdit& edit, std::function<QStringList()> texts, std::function<void()> chosen);

}  // namespace tervane
