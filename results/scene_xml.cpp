// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/scene_xml.h"

#include <algorithm>
#include <array>

#include <fmt/format.h>

#include "core/kvf_tree.h"

namespace tervane {

namespace {

/// What Windows-1252 has at 0x80 to 0x9F; 0 where it has nothing.
constexpr std::array<unsigned, 32> kUpperControls{0x20AC, 0,      0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021,
                                                  0x02C6, 0x2030, 0x0160, 0x2039, 0x0152, 0,      0x017D, 0,
                                                  0,      0x2018, 0x2019, 0x201C, 0x201D, 0x2022, 0x2013, 0x2014,
                                                  0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0,      0x017E, 0x0178};

/// The next character of a text in UTF-8.
unsigned TakeCharacter(std::string_view& text) {
  const auto byte = [&text](std::size_t at) { return static_cast<unsigned char>(text[at]); };
  const unsigned first = byte(0);
  const std::size_t length = first < 0x80 ? 1 : first < 0xE0 ? 2 : first < 0xF0 ? 3 : 4;
  unsigned code = length == 1 ? first : first & (0xFFU >> (length + 1));
  for (std::size_t i = 1; i < length && i < text.size(); ++i) code = code << 6 | (byte(i) & 0x3FU);
  text.remove_prefix(std::min(length, text.size()));
  return code;
}

void AppendEncoded(std::string_view text, std::string& out) {
  while (!text.empty()) {
    const unsigned code = TakeCharacter(text);
    const auto upper = std::ranges::find(kUpperControls, code);
    if (code == '&')
      out += "&amp;";
    else if (code < 0x80 || (code >= 0xA0 && code <= 0xFF))
      out += static_cast<char>(code);
    else if (upper != kUpperControls.end())
      out += static_cast<char>(0x80 + (upper - kUpperControls.begin()));
    else
      out += fmt::format("&#{};", code);
  }
}

std::string ValueText(const KvfParam& param) {
  switch (param.type) {
    case KvfType::Int:
      return std::to_string(param.asInt);
    case KvfType::Float:
      return fmt::format("{:.15g}", static_cast<double>(param.asFloat));
    case KvfType::Double:
      return fmt::format("{:.15g}", param.asDouble);
    case KvfType::Bool:
      return param.asBool ? "True" : "False";
    case KvfType::String:
    case KvfType::Filename:
      break;
  }
  return std::string(param.Text());
}

void AppendNodes(const KvfSection& section, std::size_t depth, std::string& out) {
  const std::string indent((depth - 1) * 4, ' ');
  for (const KvfNode* node = section.firstChild; node; node = node->next) {
    const std::string name(node->Name());
    if (const KvfSection* child = AsSection(node)) {
      AppendEncoded(fmt::format("{}<{}>", indent, name), out);
      out += '\n';
      AppendNodes(*child, depth + 1, out);
      AppendEncoded(fmt::format("{}</{}>", indent, name), out);
    } else {
      AppendEncoded(fmt::format("{}<{}>{}</{}>", indent, name, node->count > 0 ? ValueText(node->params[0]) : "", name),
                    out);
    }
    out += '\n';
  }
}

}  // namespace

std::string SceneXml(const KvfFile& file) {
  std::string text = "<?xml version=\"1.0\" encoding=\"Windows-1252\"?>\n";
  AppendNodes(file.top, 1, text);
  return text;
}

}  // namespace tervane
