// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/shown_unit.h"

#include <cmath>

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

double NiceStep(double atLeast) {
  const double power = std::pow(10.0, std::floor(std::log10(atLeast)));
  for (const double factor : {1.0, 2.0, 2.5, 5.0})
    if (factor * power >= atLeast * (1 - 1e-9)) return factor * power;
  return 10 * power;
}

}  // namespace tervane
