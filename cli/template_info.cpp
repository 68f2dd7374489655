// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/template_info.h"

#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>
#include <fmt/ranges.h>

#include "cli/parts/json.h"
#include "platform/text.h"
#include "wqpt/kinetra_template.h"

namespace tervane {

namespace {

using Item = CKinetraSolverItem;

std::string_view SourceText(const Item& item) { return item.IsModelParameter() ? "the model" : "the user"; }

/// "constant k1: how fast it decays [1/day], 0.5 (0 to 10), given by the user"
std::string ItemText(const KinetraSection& section, const Item& item) {
  const bool isGiven = IsGiven(item.kind);
  std::string text = LowerCase(section.name);
  if (!item.symbol.empty()) text += " " + item.symbol;
  if (!item.description.empty()) text += ": " + item.description;
  if (!item.unitText.empty()) text += fmt::format(" [{}]", item.unitText);
  if (isGiven || item.kind == KinetraItemKind::StateVariable) text += ", " + ShortestNumber(item.defaultValue);
  if (item.minimum <= item.maximum)
    text += fmt::format(" ({} to {})", ShortestNumber(item.minimum), ShortestNumber(item.maximum));
  if (isGiven) text += fmt::format(", given by {}", SourceText(item));
  if (!item.expression.empty())
    text += (item.kind == KinetraItemKind::StateVariable ? ", changes by " : " = ") + item.expression;
  return text;
}

/// "Auxiliary variables": "auxiliaryVariables".
std::string JsonName(const KinetraSection& section) {
  std::string name;
  bool isNewWord = false;
  for (const char c : LowerCase(section.names)) {
    if (c != ' ') name += isNewWord ? static_cast<char>(c - 'a' + 'A') : c;
    isNewWord = c == ' ';
  }
  return name;
}

std::string ItemJson(const Item& item) {
  const bool isGiven = IsGiven(item.kind), isValue = isGiven || item.kind == KinetraItemKind::StateVariable;
  const auto quoted = [](std::string_view text) { return text.empty() ? std::string() : JsonQuoted(text); };
  const auto when = [](bool is, double number) { return is ? ShortestNumber(number) : std::string(); };
  const bool hasRange = isValue && item.minimum <= item.maximum;
  return JsonObject({{"symbol", quoted(item.symbol)},
                     {"description", quoted(item.description)},
                     {"unit", quoted(item.unitText)},
                     {"itemType", isValue ? std::to_string(item.quantity) : ""},
                     {"default", when(isValue, item.defaultValue)},
                     {"minimum", when(hasRange, item.minimum)},
                     {"maximum", when(hasRange, item.maximum)},
                     {"givenBy", isGiven ? JsonQuoted(SourceText(item)) : ""},
                     {"expression", quoted(item.expression)},
                     {"type", quoted(item.typeText)},
                     {"stored", JsonBool(item.isOutput)}});
}

}  // namespace

int PrintTemplate(const std::string& path, bool json, Streams streams) {
  const auto content = ReadKinetraTemplate(path);
  if (!content->problem.empty()) {
    fmt::print(streams.err, "{}\n", content->problem);
    return kCouldNot;
  }
  for (const std::string& odd : content->Oddities()) fmt::print(streams.err, "{}: note: {}\n", path, odd);
  std::vector<std::string> counts, names;
  std::vector<std::pair<std::string_view, std::string>> members;
  for (const KinetraSection& section : KinetraSections()) names.push_back(JsonName(section));
  for (const KinetraSection& section : KinetraSections()) {
    const std::vector<Item>& items = (*content).*section.items;
    counts.push_back(fmt::format("{} {}", items.size(), LowerCase(items.size() == 1 ? section.name : section.names)));
    std::vector<std::string> elements;
    for (const Item& item : items) elements.push_back(ItemJson(item));
    members.emplace_back(names[members.size()], JsonArray(elements));
  }
  if (json) {
    fmt::print(streams.out, "{}\n", JsonObject(members));
    return kDone;
  }
  fmt::print(streams.out, "{}: {}\n", path, fmt::join(counts, ", "));
  for (const KinetraSection& section : KinetraSections())
    for (const Item& item : (*content).*section.items) fmt::print(streams.out, "{}\n", ItemText(section, item));
  return kDone;
}

}  // namespace tervane
