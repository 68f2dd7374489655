// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/entry.h"

#include <charconv>

#include "platform/text.h"

namespace tervane {

namespace {

template <class Number>
bool Parse(const std::string& typed, Number& value) {
  const std::string_view text = Trimmed(typed);
  Number number{};
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  if (error != std::errc() || end != text.data() + text.size()) return false;
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

std::string EnterValue(FileName& value, const std::string& typed, const CYbSEKvfBase& node) {
  if (FirstInvalidUtf8(typed)) return "a file name in UTF-8 was expected";
  const std::string folder = node.GetRoot() ? node.GetRoot()->SetupFolder() : std::string();
  value = IsAbsolutePath(typed) ? FileName::Picked(typed, folder) : FileName(typed, folder);
  return {};
}

}  // namespace tervane
