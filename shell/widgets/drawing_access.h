// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QAccessible>
#include <QString>
#include <functional>

class QWidget;

namespace tervane {

/// Makes a widget that paints itself known to screen readers as a drawing; to be called before anything asks for it.
/// `description` is asked each time for what is drawn or pointed at, and may be empty; the name is the widget's own.
void DescribeDrawing(QWidget& widget, std::function<QString()> description,
                     QAccessible::Role role = QAccessible::Graphic);

/// Has screen readers read that the description of a drawing is another one.
void TellDrawing(QWidget& widget);

/// Has screen readers read a text at once, which stands in the line of the status.
void Announce(QWidget& line, const QString& text);

}  // namespace tervane
