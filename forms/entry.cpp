// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/entry.h"

#include <charconv>
#include <cmath>
#include <limits>

#include <fmt/format.h>

#include "platform/text.h"

namespace tervane {

namespace {

template <class Number>
bool Parse(const std::string& typed, Number& value) {
  const std::string_view text = Trimmed(typed);
  Number number{};
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (error != std::errc() || end != text.data() + text.size()) return false;
  // "inf" and "nan" are numbers to the library, not to a model.
  if constexpr (std::is_floating_point_v<Number>)
    if (!std::isfinite(number)) return false;
  value = number;
  return true;
}

constexpr const char* kNumberExpected = "a number with a point, such as 0.5 or 1e-4, was expected";

}  // namespace

std::string EnterValue(int& value, const std::string& typed) {
  return Parse(typed, value) ? "" : "a whole number was expected";
}

std::string EnterValue(float& value, const std::string& typed) { return Parse(typed, value) ? "" : kNumberExpected; }

std::string EnterValue(double& value, const std::string& typed) { return Parse(typed, value) ? "" : kNumberExpected; }

namespace {

template <class Real>
std::string EnterReal(Real& value, const std::string& typed, const FieldUnit& unit) {
  const ItemType* itemType = FindItemType(unit.itemType);
  // A number alone in the stored unit needs no conversion, which could cost its last digit.
  const bool isStoredUnit = !itemType || BaseUnit(*itemType).key == unit.Key();
  const bool takesAny = !itemType || BaseUnit(*itemType).key != kWholeNumberUnit;
  if (isStoredUnit && takesAny && Parse(typed, value)) return {};
  if (!itemType && unit.fixed.empty()) return kNumberExpected;
  const ParsedQuantity parsed =
      itemType ? ParseQuantity(typed, *itemType, unit.Key()) : ParseQuantity(typed, std::string_view(unit.fixed));
  if (!parsed.Ok()) return parsed.error;
  if (std::abs(parsed.value) > static_cast<double>(std::numeric_limits<Real>::max()))
    return fmt::format("a number of at most {:.0e} was expected", std::numeric_limits<Real>::max());
  value = static_cast<Real>(parsed.value);
  return {};
}

template <class Real>
std::string ShownReal(Real value, const FieldUnit& unit, const std::string& format) {
  const ItemType* itemType = FindItemType(unit.itemType);
  const bool isConverted = itemType && BaseUnit(*itemType).key != unit.Key();
  if (!isConverted) return format.empty() ? ShortestNumber(value) : FormatNumber(static_cast<double>(value), format);
  // A conversion leaves noise in the last digit: 0.3 ft would show as 0.30000000000000004.
  const std::string digits = fmt::format("%.{}g", std::numeric_limits<Real>::digits10 + (sizeof(Real) == 4 ? 1 : 0));
  return FormatQuantity(static_cast<double>(value), *itemType, unit.Key(), format.empty() ? digits : format);
}

}  // namespace

std::string EnterNumber(float& value, const std::string& typed, const FieldUnit& unit) {
  return EnterReal(value, typed, unit);
}

std::string EnterNumber(double& value, const std::string& typed, const FieldUnit& unit) {
  return EnterReal(value, typed, unit);
}

std::string ShownNumber(float value, const FieldUnit& unit, const std::string& format) {
  return ShownReal(value, unit, format);
}

std::string ShownNumber(double value, const FieldUnit& unit, const std::string& format) {
  return ShownReal(value, unit, format);
}

int FieldUnit::Key() const {
  const ItemType* type = FindItemType(itemType);
  if (!type) return 0;
  return displayUnits ? displayUnits->UnitKey(itemType) : BaseUnit(*type).key;
}

std::string FieldUnit::Text() const {
  return FindItemType(itemType) ? std::string(FindUnit(Key())->abbreviation) : fixed;
}

std::vector<UnitChoice> FieldUnit::Choices() const {
  std::vector<UnitChoice> choices;
  const ItemType* type = FindItemType(itemType);
  if (!type || type->unitKeys.size() < 2) return choices;
  for (const int key : type->unitKeys) choices.push_back({key, std::string(FindUnit(key)->text)});
  return choices;
}

std::string EnterValue(std::string& value, const std::string& typed) {
  if (FirstInvalidUtf8(typed)) return "a text in UTF-8 was expected";
  value = typed;
  return {};
}

std::string EnterValue(CYbDateTime& value, const std::string& typed) {
  std::string text(Trimmed(Replaced(Replaced(typed, "-", "/"), "T", " ")));
  if (text.find(':') == std::string::npos) text += " 00:00";
  const CYbDateTime date = CYbDateTime::Parse(text, "%Y/%m/%d %H:%M");
  if (!date.IsValid()) return "a date as 2000/01/31 12:00 was expected";
  value = date;
  return {};
}

std::string EnterValue(FileName& value, const std::string& typed, const CYbSEKvfBase* node) {
  if (FirstInvalidUtf8(typed)) return "a file name in UTF-8 was expected";
  const std::string folder = !node ? value.Folder() : node->GetRoot() ? node->GetRoot()->SetupFolder() : std::string();
  value = IsAbsolutePath(typed) ? FileName::Picked(typed, folder) : FileName(typed, folder);
  return {};
}

}  // namespace tervane
