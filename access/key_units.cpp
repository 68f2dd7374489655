// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/key_units.h"

#include <fmt/format.h>

namespace tervane {

std::optional<KeyUnits> UnitsBetween(const KeyFacts& facts, std::string_view unit, std::string& problem) {
  const ItemType* type = FindItemType(facts.itemType);
  const std::string_view own = facts.UnitText();
  std::optional<UnitScale> scale;
  if (type)
    scale = BaseUnit(*type).scale;
  else if (const auto fixed = own.empty() ? std::nullopt : ParseUnit(own))
    scale = fixed->scale;
  if (!scale) {
    problem = "the key has no unit";
    return std::nullopt;
  }
  const std::optional<ParsedUnit> other = ParseUnit(unit);
  if (!other) {
    problem = fmt::format("{} is no unit that is known", unit);
    return std::nullopt;
  }
  const auto to = ConversionBetween(*scale, other->scale), from = ConversionBetween(other->scale, *scale);
  if (!to || !from) {
    problem = fmt::format("{} does not convert to {}", unit, own);
    return std::nullopt;
  }
  return KeyUnits{*to, *from};
}

}  // namespace tervane
