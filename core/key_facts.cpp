// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/key_facts.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "platform/text.h"
#include "platform/units.h"

namespace tervane {

std::string_view TextOf(KeyChoices choices, int value) {
  for (const KeyChoice& choice : choices)
    if (choice.value == value) return choice.text;
  return {};
}

std::string KeyFacts::RangeText() const {
  if (!HasRange()) return {};
  if (!HasGreatest())
    return fmt::format(fmt::runtime(isLeastOutside ? "above {}" : "{} or more"), ShortestNumber(least));
  if (least == -std::numeric_limits<double>::infinity()) return fmt::format("at most {}", ShortestNumber(greatest));
  return fmt::format("{} to {}", ShortestNumber(least), ShortestNumber(greatest));
}

std::string_view KeyFacts::UnitText() const {
  if (unit.starts_with('[') && unit.ends_with(']')) return unit.substr(1, unit.size() - 2);
  if (!unit.empty()) return unit;
  const ItemType* const quantity = FindItemType(itemType);
  return quantity ? BaseUnit(*quantity).abbreviation : std::string_view();
}

std::string WhyStray(const KeyFacts& facts, double value) {
  if (!std::isfinite(value)) return fmt::format("The value {} is no finite number.", value);
  // Limits are decimal numbers, values may have single precision.
  const double slack = 1e-6 * std::abs(value);
  const bool isTooSmall = facts.isLeastOutside ? value <= facts.least : value < facts.least - slack;
  if (isTooSmall || value > facts.greatest + slack)
    return fmt::format("The value {} is outside its range: {}.", fmt::format("{:.7g}", value), facts.RangeText());
  const auto isChosen = [&](const KeyChoice& choice) { return static_cast<double>(choice.value) == value; };
  if (facts.choices.empty() || std::ranges::any_of(facts.choices, isChosen)) return {};
  std::string texts;
  for (const KeyChoice& choice : facts.choices)
    texts += fmt::format("{}{} ({})", texts.empty() ? "" : ", ", choice.value, choice.text);
  return fmt::format("The value {} is none of its choices: {}.", fmt::format("{:.7g}", value), texts);
}

}  // namespace tervane
