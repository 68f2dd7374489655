// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Values as people type them, for controls and cells alike. Each gives what was expected when the text is no such
// value, and then leaves the value as it was.
#pragma once

#include <string>
#include <vector>

#include "core/file_name.h"
#include "core/node.h"
#include "platform/dates.h"
#include "platform/units.h"

namespace tervane {

/// A unit that may be chosen for a quantity.
struct UnitChoice {
  int key;           ///< As `DisplayUnits::Choose` takes it.
  std::string text;  ///< "kilometer"
};

/// The unit of a number on a page: that in which the user sees the quantity of its item type, whose base unit the node
/// stores, or a fixed text that names the unit of the stored number.
struct FieldUnit {
  std::string fixed;                           ///< "hours", "[m/d]"; not asked when there is an item type.
  int itemType = 0;                            ///< 0 for none.
  const DisplayUnits* displayUnits = nullptr;  ///< Null for base units.

  /// What stands behind the number; empty for nothing.
  std::string Text() const;
  /// Empty where there is nothing to choose.
  std::vector<UnitChoice> Choices() const;
  /// The unit that is shown, of those choices; 0 where there is none.
  int Key() const;
};

std::string EnterValue(int& value, const std::string& typed);
std::string EnterValue(float& value, const std::string& typed);
std::string EnterValue(double& value, const std::string& typed);
/// A number in its field's unit, or with a unit that converts to it: "5", "5 km".
std::string EnterNumber(float& value, const std::string& typed, const FieldUnit& unit);
std::string EnterNumber(double& value, const std::string& typed, const FieldUnit& unit);
/// A number in its field's unit. `format` is a printf format of one double; empty for the shortest text, of a converted
/// number with as many digits as the type holds.
std::string ShownNumber(float value, const FieldUnit& unit, const std::string& format = {});
std::string ShownNumber(double value, const FieldUnit& unit, const std::string& format = {});
std::string EnterValue(std::string& value, const std::string& typed);
/// A date, also of days alone: "2000/01/31 12:00", "2000-01-31".
std::string EnterValue(CYbDateTime& value, const std::string& typed);
/// A name that is typed stays as it is; an absolute one at or below the folder of the node's setup becomes relative.
/// Without a node it is the folder of the name before.
std::string EnterValue(FileName& value, const std::string& typed, const CYbSEKvfBase* node);

}  // namespace tervane
