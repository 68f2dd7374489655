// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QColor>

namespace tervane {

/// Colours of curves that are told apart on white and on dark ground, also by people who confuse red and green.
QColor CurveColor(std::size_t number, bool onDark);
/// Quiet colours of layers of the ground, which lie beside each other.
QColor LayerColor(std::size_t number, bool onDark);

}  // namespace tervane
