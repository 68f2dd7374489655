// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Texts that have not the room that they need, however long a language makes them.
#pragma once

#include <QAbstractButton>
#include <QApplication>
#include <QComboBox>
#include <QGroupBox>
#include <QHeaderView>
#include <QLabel>
#include <QRegularExpression>
#include <QStyle>
#include <QStyleOptionComboBox>
#include <QTranslator>
#include <algorithm>
#include <string>

#include "shell/widgets/qt_text.h"

namespace tervane::test {

/// Makes every text 40 % longer, as another language may.
class LongTexts : public QTranslator {
 public:
  LongTexts() { QCoreApplication::installTranslator(this); }
  ~LongTexts() override { QCoreApplication::removeTranslator(this); }
  LongTexts(const LongTexts&) = delete;
  LongTexts& operator=(const LongTexts&) = delete;

  bool isEmpty() const override { return false; }
  QString translate(const char* context, const char* text, const char* /*meaning*/, int /*n*/) const override {
    // The toolkit's own words say what they are of: keys, for one, are read again.
    if (std::string_view(context).starts_with("Q")) return {};
    QString longer = QString::fromUtf8(text);
    const qsizetype more = (2 * longer.size() + 4) / 5;
    for (qsizetype i = 0; i < more; ++i) longer += i % 8 == 0 ? QChar(' ') : QChar("aeinorst"[i % 8]);
    return longer;
  }
};

/// A line for each text of the window that is cut, or that lies over something else.
inline std::string CutTexts(const QWidget& window) {
  std::string faults;
  const auto tell = [&](const QWidget& widget, const QString& text, const char* what) {
    faults += FromQt(QString("\"%1\" %2 (%3x%4)\n").arg(text, what).arg(widget.width()).arg(widget.height()));
  };
  for (const QWidget* widget : window.findChildren<QWidget*>()) {
    if (!widget->isVisible()) continue;
    if (const auto* head = qobject_cast<const QHeaderView*>(widget); head && head->orientation() == Qt::Horizontal) {
      const int margin = head->style()->pixelMetric(QStyle::PM_HeaderMargin);
      for (int section = 0; section < head->count(); ++section) {
        if (head->isSectionHidden(section)) continue;
        const QString text = head->model()->headerData(section, Qt::Horizontal).toString();
        int needed = head->sectionSizeHint(section);
        // A head that breaks into lines needs the room of its longest word.
        if (head->defaultAlignment() & Qt::TextWordWrap) {
          needed = 0;
          for (const QString& word : text.split(QRegularExpression("\\s")))
            needed = std::max(needed, head->fontMetrics().horizontalAdvance(word) + 2 * margin);
        }
        if (head->sectionSize(section) < needed) tell(*widget, text, "is a head that is cut");
      }
      continue;
    }
    const auto* label = qobject_cast<const QLabel*>(widget);
    const auto* button = qobject_cast<const QAbstractButton*>(widget);
    const auto* list = qobject_cast<const QComboBox*>(widget);
    const auto* group = qobject_cast<const QGroupBox*>(widget);
    const QString text = label    ? label->text()
                         : button ? button->text()
                         : list   ? list->currentText()
                         : group  ? group->title()
                                  : QString();
    if (text.isEmpty()) continue;
    const bool wraps = label && label->wordWrap();
    // What gives way on purpose has its whole text as a tool tip, or tells it elsewhere.
    const bool givesWay = widget->sizePolicy().horizontalPolicy() == QSizePolicy::Ignored;
    if (!wraps && !givesWay && widget->width() < widget->minimumSizeHint().width())
      tell(*widget, text, "is cut at the right");
    const int neededHeight = wraps ? label->heightForWidth(label->width()) : widget->sizeHint().height();
    if (widget->height() < std::min(neededHeight, widget->minimumSizeHint().height()))
      tell(*widget, text, "is cut below");
    for (const QWidget* sibling : widget->parentWidget()->findChildren<QWidget*>(Qt::FindDirectChildrenOnly))
      if (sibling != widget && sibling->isVisible() && !sibling->isWindow() && !sibling->inherits("QFocusFrame") &&
          sibling->geometry().intersects(widget->geometry()))
        tell(*widget, text, "lies over something");
  }
  return faults;
}

}  // namespace tervane::test
