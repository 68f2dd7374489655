// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The families of controls on the screen, of which `ControlWidget::Make` chooses one.
#pragma once

#include <QEvent>
#include <QGuiApplication>
#include <QLabel>
#include <memory>

#include "shell/page/control_widget.h"

namespace tervane {

/// Check boxes, radio groups and drop lists.
std::unique_ptr<ControlWidget> MakeOptionWidget(CYbSEDlgBase& page, Control& control);
/// Fields in which one types: texts, numbers, dates, file names.
std::unique_ptr<ControlWidget> MakeFieldWidget(CYbSEDlgBase& page, Control& control);
/// What is only read or pressed: labels, values, notices, buttons, texts, a browser.
std::unique_ptr<ControlWidget> MakeReadingWidget(CYbSEDlgBase& page, Control& control);
/// A report in HTML.
std::unique_ptr<ControlWidget> MakeReportWidget(CYbSEDlgBase& page, Control& control);
/// What takes all the room that it gets: tables, maps, charts.
std::unique_ptr<ControlWidget> MakeLargeWidget(CYbSEDlgBase& page, Control& control);

/// The widest text of a check box, radio button or label of its own, in pixels at zoom 1; a longer one breaks into
/// lines.
inline constexpr int kWidestOption = 460;

/// A text as it is, where the toolkit would take an ampersand for the mark of a key.
QString WithoutMarks(QString text);
/// A label that breaks into lines only where it must; `widest` is in pixels at zoom 1.
QLabel* NewLabel(const QString& text, int widest);
/// Undo and redo are the field's own while something typed in it is not entered yet, and the document's otherwise.
bool LeavesToDocument(QEvent* event);

/// Where lines of a label begin: on the side from which the window is read, whatever the language of its text.
inline Qt::Alignment AtBegin() {
  const bool isFromRight = QGuiApplication::layoutDirection() == Qt::RightToLeft;
  return (isFromRight ? Qt::AlignRight : Qt::AlignLeft) | Qt::AlignAbsolute | Qt::AlignVCenter;
}

}  // namespace tervane
