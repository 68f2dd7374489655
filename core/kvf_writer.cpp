// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/kvf_writer.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <cstring>

#include <fmt/format.h>

#include "platform/text.h"

namespace tervane {

namespace {

bool IsPlain(char c) {
  const auto byte = static_cast<unsigned char>(c);
  return byte >= 0x20 && byte != 0x7F && c != '"' && c != '\\';
}

bool IsBareName(std::string_view name) {
  const auto isLetter = [](char c) { return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || c == '_'; };
  const auto isRest = [&](char c) { return isLetter(c) || (c >= '0' && c <= '9') || c == '.' || c == '%' || c == '-'; };
  return !name.empty() && isLetter(name[0]) && std::all_of(name.begin() + 1, name.end(), isRest);
}

void AppendQuoted(std::string_view value, std::string& text) {
  text += '"';
  while (!value.empty()) {
    const auto plain = static_cast<std::size_t>(std::find_if_not(value.begin(), value.end(), IsPlain) - value.begin());
    text += value.substr(0, plain);
    if (plain == value.size()) break;
    switch (const char c = value[plain]) {
      case '"':
        text += "\\\"";
        break;
      case '\\':
        text += "\\\\";
        break;
      case '\n':
        text += "\\n";
        break;
      case '\r':
        text += "\\r";
        break;
      case '\t':
        text += "\\t";
        break;
      default:
        text += fmt::format("\\u{{{:x}}}", static_cast<unsigned char>(c));
    }
    value.remove_prefix(plain + 1);
  }
  text += '"';
}

void AppendName(const KvfNode& node, std::string& text) {
  const std::string_view name = node.WrittenName();
  if (IsBareName(name))
    text += name;
  else
    AppendQuoted(name, text);
}

/// A float or double in its shortest form; a double that looks like a whole number gets a point.
template <class Number>
void AppendReal(Number value, std::string& text) {
  std::array<char, kNumberBuffer + 2> buffer;
  char* end = ShortestNumber(value, buffer.data());
  if constexpr (std::is_same_v<Number, double>) {
    const auto isWhole = [](char c) { return (c >= '0' && c <= '9') || c == '-'; };
    if (std::all_of(buffer.data(), end, isWhole)) {
      *end++ = '.';
      *end++ = '0';
    }
  } else {
    *end++ = 'f';
  }
  text.append(buffer.data(), end);
}

void AppendValue(const KvfParam& param, std::string& text) {
  switch (param.type) {
    case KvfType::Int: {
      std::array<char, 12> buffer;
      const auto result = std::to_chars(buffer.data(), buffer.data() + buffer.size(), param.asInt);
      text.append(buffer.data(), result.ptr);
      break;
    }
    case KvfType::Float:
      AppendReal(param.asFloat, text);
      break;
    case KvfType::Double:
      AppendReal(param.asDouble, text);
      break;
    case KvfType::Bool:
      text += param.asBool ? "true" : "false";
      break;
    case KvfType::Filename:
      text += "file ";
      [[fallthrough]];
    case KvfType::String:
      AppendQuoted(param.Text(), text);
      break;
  }
}

void AppendPlainValue(const KvfParam& param, std::string& text) {
  switch (param.type) {
    case KvfType::Float:
      text += ShortestNumber(param.asFloat);
      break;
    case KvfType::Double:
      text += ShortestNumber(param.asDouble);
      break;
    case KvfType::String:
    case KvfType::Filename:
      text += param.Text();
      break;
    default:
      AppendValue(param, text);
  }
}

template <class Append>
void AppendValues(const KvfNode& keyword, std::string& text, const Append& append) {
  for (std::uint32_t i = 0; i < keyword.count; ++i) {
    if (i > 0) text += ", ";
    append(keyword.params[i], text);
  }
}

/// The place of the first text in the tree that is no UTF-8, as the name that holds it; empty when all is well.
std::string FindBadText(const KvfSection& section) {
  for (const KvfNode* node = section.firstChild; node; node = node->next) {
    if (FirstInvalidUtf8(node->WrittenName())) return fmt::format("a name in {}", section.Name());
    if (const KvfSection* child = AsSection(node)) {
      if (std::string found = FindBadText(*child); !found.empty()) return found;
      continue;
    }
    for (std::uint32_t i = 0; i < node->count; ++i)
      if (node->params[i].IsText() && FirstInvalidUtf8(node->params[i].Text()))
        return fmt::format("{} in {}", node->Name(), section.Name());
  }
  return {};
}

}  // namespace

void AppendKvfNodes(const KvfSection& section, int level, std::string& text) {
  const std::size_t indent = 2 * static_cast<std::size_t>(level);
  for (const KvfNode* node = section.firstChild; node; node = node->next) {
    text.append(indent, ' ');
    if (const KvfSection* child = AsSection(node)) {
      text += child->kind == KvfKind::Target ? "target " : "section ";
      AppendName(*child, text);
      text += " {\n";
      AppendKvfNodes(*child, level + 1, text);
      text.append(indent, ' ');
      text += "}\n";
      continue;
    }
    AppendName(*node, text);
    text += node->count > 0 ? " = " : " =";
    AppendValues(*node, text, AppendValue);
    text += '\n';
  }
}

bool WriteKvfText(const KvfFile& file, std::string& text, std::string& error) {
  if (!file.unwritable.empty()) {
    error = file.unwritable;
    return false;
  }
  if (const std::string bad = FindBadText(file.top); !bad.empty()) {
    error = fmt::format("{} is no UTF-8 text", bad);
    return false;
  }
  text = file.header;
  AppendKvfNodes(file.top, 0, text);
  return true;
}

std::string KvfValueText(const KvfParam& param) {
  std::string text;
  AppendValue(param, text);
  return text;
}

std::string KvfValuesText(const KvfNode& keyword) {
  std::string text;
  AppendValues(keyword, text, AppendValue);
  return text;
}

std::string PlainValuesText(const KvfNode& keyword) {
  std::string text;
  AppendValues(keyword, text, AppendPlainValue);
  return text;
}

}  // namespace tervane
