// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/date_entry.h"

#include <QCalendarWidget>
#include <QMenu>
#include <QWidgetAction>

namespace tervane {

namespace {

/// Of a date with its time, or of a day alone.
QString FormatOf(const QString& text) { return text.contains(':') ? "yyyy/MM/dd  HH:mm" : "yyyy/MM/dd"; }

}  // namespace

QDateTime DateOf(const QString& text) { return QDateTime::fromString(text, FormatOf(text)); }

QString SteppedDate(const QString& text, int cursor, int by) {
  const QDateTime date = DateOf(text);
  if (!date.isValid()) return {};
  const QDateTime stepped = cursor <= 4    ? date.addYears(by)
                            : cursor <= 7  ? date.addMonths(by)
                            : cursor <= 10 ? date.addDays(by)
                            : cursor <= 14 ? date.addSecs(3600 * by)
                                           : date.addSecs(60 * by);
  const bool isInRange = stepped.date().year() >= 1 && stepped.date().year() <= 9999;
  return isInRange ? stepped.toString(FormatOf(text)) : text;
}

QMenu* NewCalendarMenu(QWidget* parent, std::function<QString()> shown, std::function<void(const QString&)> choose) {
  auto* menu = new QMenu(parent);
  auto* calendar = new QCalendarWidget;
  calendar->setGridVisible(true);
  auto* action = new QWidgetAction(menu);
  action->setDefaultWidget(calendar);
  menu->addAction(action);
  QObject::connect(menu, &QMenu::aboutToShow, calendar, [calendar, shown] {
    if (const QDateTime date = DateOf(shown()); date.isValid()) calendar->setSelectedDate(date.date());
    calendar->setFocus();
  });
  const auto take = [menu, shown, choose](const QDate& day) {
    const QString before = shown();
    const QDateTime date = DateOf(before);
    const QTime time = date.isValid() ? date.time() : QTime(0, 0);
    menu->close();
    choose(QDateTime(day, time).toString(FormatOf(date.isValid() ? before : QString(":"))));
  };
  QObject::connect(calendar, &QCalendarWidget::clicked, menu, take);
  QObject::connect(calendar, &QCalendarWidget::activated, menu, take);
  return menu;
}

}  // namespace tervane
