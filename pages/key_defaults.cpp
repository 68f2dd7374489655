// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/key_defaults.h"

#include <algorithm>
#include <charconv>

#include <fmt/format.h>

#include "core/path.h"
#include "forms/entry.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// A number as a file holds it: "6f", "-0.5", "1e-4f".
std::optional<double> NumberOf(std::string_view text) {
  if (text.ends_with('f')) text.remove_suffix(1);
  double number = 0;
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (error != std::errc() || end != text.data() + text.size()) return std::nullopt;
  return number;
}

/// A default as it is typed into the control; nothing where it is of a kind that is not reset.
std::optional<std::string> TypedDefault(const Control& control, const KeyInfo& info) {
  const std::string& text = info.defaultValue;
  if (info.type == "bool") return text == "true" ? "1" : "0";
  if (info.type == "date") {
    CYbDateTime date;
    std::string typed = Replaced(text, ",", " ");
    int parts[5] = {};
    const char* at = typed.data();
    for (int& part : parts) {
      while (*at == ' ') ++at;
      const auto [end, error] = std::from_chars(at, typed.data() + typed.size(), part);
      if (error != std::errc()) return std::nullopt;
      at = end;
    }
    date = CYbDateTime(parts[0], parts[1], parts[2], parts[3], parts[4]);
    return date.IsValid() ? std::optional(date.Format(PageForm::kDateFormat)) : std::nullopt;
  }
  const std::optional<double> number = NumberOf(text);
  if (!number) return std::nullopt;
  if (info.type == "float") return ShownNumber(static_cast<float>(*number), control.NumberUnit());
  if (info.type == "double") return ShownNumber(*number, control.NumberUnit());
  if (info.type != "int") return std::nullopt;
  return std::to_string(static_cast<int>(*number) - info.inFile);
}

/// The same as it is read.
std::string ReadDefault(const Control& control, const KeyInfo& info) {
  const std::optional<std::string> typed = TypedDefault(control, info);
  if (!typed) return {};
  switch (control.kind) {
    case ControlKind::Check:
      return *typed == "0" ? "off" : "on";
    case ControlKind::Choice:
    case ControlKind::Radio: {
      const std::string_view text = TextOf(info.facts.choices, std::atoi(typed->c_str()));
      return text.empty() ? *typed : Replaced(text, "\n", " ");
    }
    default: {
      const std::string unit = control.UnitText();
      return unit.empty() ? *typed : fmt::format("{} {}", *typed, unit);
    }
  }
}

std::string ReadRange(const Control& control, const KeyFacts& facts) {
  if (!facts.HasRange()) return {};
  const auto limit = [&](double value) { return ShownNumber(value, control.NumberUnit()); };
  const std::string unit = control.UnitText().empty() ? "" : " " + control.UnitText();
  if (!facts.HasGreatest()) return fmt::format("{} or more{}", limit(facts.least), unit);
  if (facts.least == -std::numeric_limits<double>::infinity())
    return fmt::format("at most {}{}", limit(facts.greatest), unit);
  return fmt::format("{} to {}{}", limit(facts.least), limit(facts.greatest), unit);
}

}  // namespace

const KeyDefaults::Known& KeyDefaults::Find(const Control& control) {
  const auto found = known_.find(&control);
  if (found != known_.end()) return found->second;
  Known known{{}, nullptr};
  if (control.node && !control.key.empty()) {
    const std::string section = PathOf(*control.node);
    known = {section + ":" + control.key, KeyReference::Get().Find(section, control.key)};
  }
  return known_.emplace(&control, std::move(known)).first->second;
}

const std::string* KeyDefaults::Held(const Control& control) {
  auto held = held_.find(control.node);
  if (held == held_.end()) {
    held = held_.emplace(control.node, std::vector<KeyInfo>()).first;
    // Describing changes nothing; the declaration serves reading, too, and so cannot promise it.
    const_cast<CYbSEKvfBase*>(control.node)->DescribeKeys(held->second);
  }
  const auto info =
      std::ranges::find_if(held->second, [&](const KeyInfo& key) { return Trimmed(key.key) == control.key; });
  return info == held->second.end() ? nullptr : &info->defaultValue;
}

std::string KeyDefaults::ToolTip(const Control& control) {
  const Known& known = Find(control);
  if (known.path.empty()) return control.toolTip;
  std::string text = control.toolTip;
  const auto add = [&](const char* what, std::string_view value) {
    if (!value.empty()) text += fmt::format("{}{}: {}", text.empty() ? "" : "\n", what, value);
  };
  if (known.info && control.isOfKey) {
    add("Default", ReadDefault(control, *known.info));
    add("Range", ReadRange(control, known.info->facts));
    if (control.itemType) add("Stored in", known.info->facts.UnitText());
  }
  add("Key", known.path);
  return text;
}

std::optional<std::string> KeyDefaults::Reset(const Control& control) {
  if (!control.isOfKey || !control.enter) return std::nullopt;
  const KeyInfo* info = Find(control).info;
  const std::string* held = info ? Held(control) : nullptr;
  if (!held || *held == info->defaultValue) return std::nullopt;
  return TypedDefault(control, *info);
}

}  // namespace tervane
