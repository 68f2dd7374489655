// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/import_unit.h"

#include <cmath>
#include <optional>

#include <fmt/format.h>

#include "platform/item_types.h"

namespace tervane {

std::string TakeUnit(const std::string& text, const ItemType& type, NewItem& item, std::span<float> values) {
  item.unitKey = BaseUnit(type).key;
  if (text.empty()) return {};
  const std::optional<ParsedUnit> unit = ParseUnit(text);
  if (!unit) return fmt::format("\"{}\" is no known unit", text);
  if (unit->unit != nullptr && (AllowsUnit(type, unit->unit->key) || type.code == quantity::kUndefined)) {
    item.unitKey = unit->unit->key;
    return {};
  }
  const Unit& base = BaseUnit(type);
  const std::optional<UnitConversion> conversion = ConversionBetween(unit->scale, base.scale);
  if (!conversion) return fmt::format("\"{}\" is no unit of {}, which is stored in {}", text, type.name, base.text);
  for (float& value : values) {
    if (value == kDeleteValue) continue;
    value = static_cast<float>((*conversion)(static_cast<double>(value)));
    if (!std::isfinite(value)) return fmt::format("a value is too large in {}", base.text);
  }
  return {};
}

}  // namespace tervane
