// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/shown_unit.h"

#include "platform/text.h"
#include "shell/widgets/qt_text.h"

namespace tervane {

ShownUnit::ShownUnit(int itemType, int storedUnit, const DisplayUnits* units) {
  const ItemType* item = FindItemType(itemType);
  const Unit* stored = FindUnit(storedUnit);
  if (!stored && item) stored = &BaseUnit(*item);
  if (!stored) return;
  const Unit* shown = !item ? stored : units ? &units->UnitOf(*item) : &BaseUnit(*item);
  const auto there = ConversionBetween(stored->scale, shown->scale);
  const auto back = ConversionBetween(shown->scale, stored->scale);
  if (there && back) {
    toShown_ = *there;
    toStored_ = *back;
    text_ = shown->abbreviation;
  } else {
    text_ = stored->abbreviation;
  }
}

QString ShownUnit::Value(double stored) const {
  const QString number = ToQt(FormatNumber(Shown(stored), "%.6g"));
  return text_.empty() ? number : number + " " + ToQt(text_);
}

}  // namespace tervane
