// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/typed_value.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <limits>
#include <vector>

#include <fmt/format.h>

#include "forms/entry.h"
#include "platform/key_number.h"
#include "platform/text.h"

namespace tervane {

namespace {

template <class Number>
bool ReadNumber(std::string_view text, Number& number) {
  const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
  return error == std::errc() && end == text.data() + text.size() && !text.empty();
}

/// A value in the form of the file.
std::string TakePlain(std::string_view text, KvfFile& file, KvfParam& param) {
  switch (param.type) {
    case KvfType::Int:
      return ReadNumber(text, param.asInt) ? "" : "a whole number from -2147483648 to 2147483647";
    case KvfType::Float:
      if (text.ends_with('f') && !text.ends_with("inf")) text.remove_suffix(1);
      return ReadNumber(text, param.asFloat) ? "" : "a number that fits a float";
    case KvfType::Double:
      return ReadNumber(text, param.asDouble) ? "" : "a number";
    case KvfType::Bool:
      param.asBool = text == "true";
      return text == "true" || text == "false" ? "" : "true or false";
    case KvfType::String:
    case KvfType::Filename:
      if (FirstInvalidUtf8(text)) return "a text in UTF-8";
      file.SetText(param, text);
      return "";
  }
  return "";
}

/// A number with a unit that converts to that of its key. "" when it was taken.
std::string TakeQuantity(std::string_view text, const KeyFacts& facts, KvfParam& param) {
  const FieldUnit unit{std::string(facts.unit), facts.itemType, nullptr};
  const std::string typed(text);
  return param.type == KvfType::Float ? EnterNumber(param.asFloat, typed, unit)
                                      : EnterNumber(param.asDouble, typed, unit);
}

/// The value of a choice by its text. "" when it was taken.
std::string TakeChoice(std::string_view text, const KeyInfo& info, KvfParam& param) {
  std::string texts;
  for (const KeyChoice& choice : info.facts.choices) {
    if (EqualIgnoringCase(choice.text, text)) {
      param.asInt = choice.value + info.inFile;
      return {};
    }
    texts += fmt::format("{}{} ({})", texts.empty() ? "" : ", ", choice.value + info.inFile, choice.text);
  }
  return fmt::format("one of {}", texts);
}

std::string TakeOne(std::string_view text, const KeyInfo* info, KvfFile& file, KvfParam& param) {
  std::string expected = TakePlain(text, file, param);
  if (expected.empty() || !info) return expected;
  const bool isReal = param.type == KvfType::Float || param.type == KvfType::Double;
  if (param.type == KvfType::Int && !info->facts.choices.empty()) return TakeChoice(Trimmed(text), *info, param);
  const bool hasUnit = info->facts.itemType != 0 || !info->facts.unit.empty();
  if (!isReal || !hasUnit || TakeQuantity(text, info->facts, param).empty()) return isReal && hasUnit ? "" : expected;
  return fmt::format("{}, or one with a unit that converts to {},", expected, info->facts.UnitText());
}

/// The parts of a typed value. A date may be typed as 2000-01-31 12:00.
std::vector<std::string_view> Parts(std::string_view value, std::string_view separators) {
  std::vector<std::string_view> parts;
  while (true) {
    const std::size_t end = value.find_first_of(separators);
    parts.push_back(Trimmed(value.substr(0, end)));
    if (end == std::string_view::npos) return parts;
    value.remove_prefix(end + 1);
  }
}

/// A date of whole numbers: year, month, day, and where there are five, hour and minute.
bool TakeDate(std::string_view typed, KvfNode& keyword) {
  CYbDateTime date;
  if (!EnterValue(date, std::string(typed)).empty()) return false;
  const int numbers[] = {date.Year(), date.Month(), date.Day(), date.Hour(), date.Minute()};
  for (std::uint32_t i = 0; i < keyword.count; ++i) keyword.params[i].asInt = numbers[i];
  return true;
}

/// A value of a program.
std::string TakePlain(const PlainValue& value, KvfFile& file, KvfParam& param) {
  if (const auto* text = std::get_if<std::string>(&value)) {
    if (!param.IsText()) return param.type == KvfType::Bool ? "true or false" : "a number";
    return TakePlain(std::string_view(*text), file, param);
  }
  const bool isTruth = std::holds_alternative<bool>(value);
  const auto* whole = std::get_if<std::int64_t>(&value);
  const double number = isTruth ? (std::get<bool>(value) ? 1 : 0)
                        : whole ? static_cast<double>(*whole)
                                : std::get<double>(value);
  switch (param.type) {
    case KvfType::Int:
      if (std::trunc(number) != number || std::abs(number + 0.5) > 2147483648.0)
        return "a whole number from -2147483648 to 2147483647";
      param.asInt = static_cast<int>(number);
      return "";
    case KvfType::Float:
      if (std::isfinite(number) && std::abs(number) > static_cast<double>(std::numeric_limits<float>::max()))
        return "a number that fits a float";
      param.asFloat = static_cast<float>(number);
      return "";
    case KvfType::Double:
      param.asDouble = number;
      return "";
    case KvfType::Bool:
      if (!isTruth && !SameNumber(number, 0) && !SameNumber(number, 1)) return "true or false";
      param.asBool = !SameNumber(number, 0);
      return "";
    case KvfType::String:
    case KvfType::Filename:
      return "a text";
  }
  return "";
}

/// A list of any length. What counts its values follows.
template <class Values>
std::string TakeList(const Values& values, bool isOfNumbers, KvfSection& section, KvfNode& keyword) {
  KvfFile& file = *section.file;
  auto* params = file.nodes.New<KvfParam>(std::max<std::size_t>(values.size(), 1));
  for (std::size_t i = 0; i < values.size(); ++i) {
    params[i].type = isOfNumbers ? KvfType::Int : KvfType::String;
    if (std::string expected = TakePlain(values[i], file, params[i]); !expected.empty()) return expected;
  }
  keyword.params = params;
  keyword.count = static_cast<std::uint32_t>(values.size());
  if (KvfNode* count = FindKvfNode(section, true, "ITEM_COUNT"); count && keyword.Name() == "ITEM_NUMBERS")
    file.ReplaceParams(*count, KvfType::Int).asInt = static_cast<int>(values.size());
  return {};
}

bool IsListOfNumbers(const KeyInfo* info) { return info && info->type == "int list"; }
bool IsList(const KeyInfo* info) { return IsListOfNumbers(info) || (info && info->type == "string list"); }

}  // namespace

std::string TakeTyped(std::string_view typed, const KeyInfo* info, KvfSection& section, KvfNode& keyword) {
  if (IsList(info))
    return TakeList(Trimmed(typed).empty() ? std::vector<std::string_view>() : Parts(typed, ","), IsListOfNumbers(info),
                    section, keyword);
  if (keyword.count == 1) return TakeOne(typed, info, *section.file, keyword.params[0]);
  // Numbers behind the name of a file are made when it is saved.
  if (keyword.params[0].type == KvfType::Filename) return TakeOne(typed, info, *section.file, keyword.params[0]);
  const bool isDate = info && (info->type == "date" || info->type == "day");
  if (isDate && TakeDate(typed, keyword)) return {};
  const auto parts = Parts(typed, typed.find(',') != std::string_view::npos ? "," : "-T: ");
  if (parts.size() != keyword.count)
    return isDate ? "a date as 2000-01-31 12:00, or its numbers separated by commas,"
                  : fmt::format("{} values separated by commas", keyword.count);
  for (std::uint32_t i = 0; i < keyword.count; ++i)
    if (std::string expected = TakePlain(parts[i], *section.file, keyword.params[i]); !expected.empty())
      return expected;
  return {};
}

PlainValue PlainValueOf(const KvfParam& param) {
  switch (param.type) {
    case KvfType::Int:
      return std::int64_t{param.asInt};
    case KvfType::Float:
      return static_cast<double>(param.asFloat);
    case KvfType::Double:
      return param.asDouble;
    case KvfType::Bool:
      return param.asBool;
    case KvfType::String:
    case KvfType::Filename:
      return std::string(param.Text());
  }
  return {};
}

std::string TakePlainValues(std::span<const PlainValue> values, const KeyInfo* info, KvfSection& section,
                            KvfNode& keyword) {
  if (IsList(info)) return TakeList(values, IsListOfNumbers(info), section, keyword);
  // Numbers behind the name of a file are made when it is saved.
  const std::size_t count = keyword.count > 0 && keyword.params[0].type == KvfType::Filename ? 1 : keyword.count;
  if (values.size() != count) return count == 1 ? std::string("one value") : fmt::format("{} values", count);
  std::vector<KvfParam> taken(keyword.params, keyword.params + count);
  for (std::size_t i = 0; i < count; ++i)
    if (std::string expected = TakePlain(values[i], *section.file, taken[i]); !expected.empty()) return expected;
  std::ranges::copy(taken, keyword.params);
  return {};
}

}  // namespace tervane
