// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/parts/json.h"

#include <algorithm>

#include <fmt/format.h>

#include "platform/text.h"

namespace tervane {

namespace {

/// Bytes of the character at the text's start; 0 where its first byte begins none.
std::size_t CharacterLength(std::string_view text) {
  for (std::size_t length = 1; length <= std::min<std::size_t>(text.size(), 4); ++length)
    if (!FirstInvalidUtf8(text.substr(0, length))) return length;
  return 0;
}

}  // namespace

std::string JsonQuoted(std::string_view text) {
  std::string json = "\"";
  while (!text.empty()) {
    const std::size_t length = CharacterLength(text);
    const auto byte = static_cast<unsigned char>(text[0]);
    const bool isHighControl = length == 2 && byte == 0xC2 && static_cast<unsigned char>(text[1]) < 0xA0;
    if (byte == '"' || byte == '\\')
      json += fmt::format("\\{}", text[0]);
    else if (byte == '\n')
      json += "\\n";
    else if (byte < 0x20 || byte == 0x7F || length == 0)
      // A byte that is no UTF-8 is told by its number.
      json += fmt::format("\\u{:04x}", byte);
    else if (isHighControl)
      json += fmt::format("\\u{:04x}", static_cast<unsigned char>(text[1]));
    else
      json += text.substr(0, length);
    text.remove_prefix(std::max<std::size_t>(length, 1));
  }
  return json += '"';
}

std::string JsonObject(const std::vector<std::pair<std::string_view, std::string>>& members) {
  std::string json = "{";
  for (const auto& [name, value] : members) {
    if (value.empty()) continue;
    if (json.size() > 1) json += ", ";
    json += JsonQuoted(name) + ": " + value;
  }
  return json += '}';
}

std::string JsonArray(const std::vector<std::string>& elements) {
  if (elements.empty()) return "[]";
  std::string json = "[\n";
  for (const std::string& element : elements) {
    if (&element != elements.data()) json += ",\n";
    json += "  " + element;
  }
  return json += "\n]";
}

}  // namespace tervane
