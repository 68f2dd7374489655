// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/json.h"

#include <fmt/format.h>

namespace tervane {

std::string JsonQuoted(std::string_view text) {
  std::string json = "\"";
  for (const char c : text) {
    switch (c) {
      case '"':
        json += "\\\"";
        break;
      case '\\':
        json += "\\\\";
        break;
      case '\n':
        json += "\\n";
        break;
      default:
        if (static_cast<unsigned char>(c) < 0x20)
          json += fmt::format("\\u{:04x}", static_cast<unsigned char>(c));
        else
          json += c;
    }
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
