// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QString>
#include <string>

#include "platform/units.h"

namespace tervane {

/// The unit in which a user sees values that are stored in another one.
class ShownUnit {
 public:
  /// `units` are the user's; null for base units.
  ShownUnit(int itemType, int storedUnit, const DisplayUnits* units);

  double Shown(double stored) const { return toShown_(stored); }
  double Stored(double shown) const { return toStored_(shown); }
  /// "m³/s"; empty where nothing stands behind a number.
  const std::string& Text() const { return text_; }
  /// "412.5 m"
  QString Value(double stored) const;

 private:
  std::string text_;
  UnitConversion toShown_, toStored_;
};

/// The smallest of 1, 2, 2.5 or 5 times a power of ten that is not below.
double NiceStep(double atLeast);

}  // namespace tervane
