// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <string_view>

#include "core/key_facts.h"
#include "platform/units.h"

namespace tervane {

/// The ways between the unit in which a file holds a number and another one.
struct KeyUnits {
  UnitConversion toOther, fromOther;
};
/// By the name or text of the other unit, as people type it; nothing with the problem for a key without a unit, an
/// unknown unit, and one that measures something else.
std::optional<KeyUnits> UnitsBetween(const KeyFacts& facts, std::string_view unit, std::string& problem);

}  // namespace tervane
