// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/cell_value.h"

#include <cmath>

#include "forms/page_form.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// A lambda for each alternative of a variant.
template <class... Parts>
struct Each : Parts... {
  using Parts::operator()...;
};
template <class... Parts>
Each(Parts...) -> Each<Parts...>;

std::string EnterCheck(bool& value, const std::string& typed) {
  const std::string_view text = Trimmed(typed);
  if (text != "1" && text != "0") return "1 or 0 was expected";
  value = text == "1";
  return {};
}

}  // namespace

CellValue ValueAt(const CellPlace& place) {
  return std::visit(Each{[](const NoCell& none) { return CellValue(none); },
                         [](CheckOf check) { return CellValue(*check.flag != 0); },
                         [](const auto* value) { return CellValue(*value); }},
                    place);
}

void StoreAt(const CellPlace& place, CellValue value) {
  std::visit(Each{[](const NoCell&) {}, [&](CheckOf check) { *check.flag = std::get<bool>(value) ? 1 : 0; },
                  [&]<class Value>(Value* target) { *target = std::get<Value>(std::move(value)); }},
             place);
}

CellKind KindOf(const CellValue& value) {
  return std::visit(Each{[](bool) { return CellKind::Check; }, [](int) { return CellKind::Integer; },
                         [](float) { return CellKind::Number; }, [](double) { return CellKind::Number; },
                         [](const FileName&) { return CellKind::File; },
                         [](const CYbDateTime&) { return CellKind::Date; }, [](const auto&) { return CellKind::Text; }},
                    value);
}

std::string CellText(const CellValue& value, const FieldUnit& unit, const std::string& format) {
  const auto number = [&](auto real) { return std::isfinite(real) ? ShownNumber(real, unit, format) : std::string(); };
  return std::visit(
      Each{[](const NoCell&) { return std::string(); }, [](bool check) { return std::string(check ? "1" : "0"); },
           [](int whole) { return std::to_string(whole); }, [&](float real) { return number(real); },
           [&](double real) { return number(real); }, [](const std::string& text) { return text; },
           [](const FileName& name) { return name.Text(); },
           [&](const CYbDateTime& date) { return date.Format(format.empty() ? PageForm::kDateFormat : format); }},
      value);
}

std::string EnterCell(CellValue& value, const std::string& typed, const FieldUnit& unit, const CYbSEKvfBase* node) {
  return std::visit(
      Each{[](const NoCell& none) { return none.why; }, [&](bool& check) { return EnterCheck(check, typed); },
           [&](int& whole) { return EnterValue(whole, typed); },
           [&](float& real) { return EnterNumber(real, typed, unit); },
           [&](double& real) { return EnterNumber(real, typed, unit); },
           [&](std::string& text) { return EnterValue(text, typed); },
           [&](FileName& name) { return EnterValue(name, typed, node); },
           [&](CYbDateTime& date) { return EnterValue(date, typed); }},
      value);
}

}  // namespace tervane
