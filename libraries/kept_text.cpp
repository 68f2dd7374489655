// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/kept_text.h"

#include <algorithm>
#include <charconv>
#include <cmath>

#include <fmt/format.h>

#include "core/kvf_writer.h"
#include "platform/text.h"

namespace tervane {

std::string IndentedLine(int level, std::string_view text) {
  return fmt::format("{:{}}{}", "", 2 * static_cast<std::size_t>(level), text);
}

std::string IndentedLines(int level, std::string_view lines) {
  std::string text;
  for (std::size_t begin = 0; begin < lines.size();) {
    const std::size_t end = std::min(lines.find('\n', begin), lines.size());
    text += IndentedLine(level, lines.substr(begin, end - begin)) + "\n";
    begin = end + 1;
  }
  return text;
}

std::string KvfNodeText(const KvfNode& node, int level) {
  KvfSection one;
  std::string text;
  if (const KvfSection* section = AsSection(&node)) {
    KvfSection copy = *section;
    copy.next = nullptr;
    one.firstChild = &copy;
    AppendKvfNodes(one, level, text);
  } else {
    KvfNode copy = node;
    copy.next = nullptr;
    one.firstChild = &copy;
    AppendKvfNodes(one, level, text);
  }
  return text;
}

std::string KvfTextValue(std::string_view text) {
  KvfParam param;
  param.type = KvfType::String;
  param.text = text.empty() ? "" : text.data();
  param.length = static_cast<std::uint32_t>(text.size());
  return KvfValueText(param);
}

bool IsKvfNumber(const KvfParam& param) {
  return param.type == KvfType::Int || param.type == KvfType::Double || param.type == KvfType::Float;
}

bool IsNumberedName(std::string_view name, std::string_view pattern) {
  const std::string_view prefix = pattern.substr(0, pattern.find("%d"));
  return name.size() > prefix.size() && name.starts_with(prefix) &&
         std::ranges::all_of(name.substr(prefix.size()), [](char c) { return c >= '0' && c <= '9'; });
}

std::string NumberedName(std::string_view pattern, std::size_t number) {
  return fmt::format("{}{}", pattern.substr(0, pattern.find("%d")), number);
}

double KvfNumber(const KvfParam& param) {
  switch (param.type) {
    case KvfType::Int:
      return param.asInt;
    case KvfType::Double:
      return param.asDouble;
    case KvfType::Float: {
      const std::string text = ShortestNumber(param.asFloat);
      double value = param.asFloat;
      std::from_chars(text.data(), text.data() + text.size(), value);
      return value;
    }
    default:
      return std::numeric_limits<double>::quiet_NaN();
  }
}

void AddCorners(KvfFile& file, KvfSection& section, const Envelope& area) {
  constexpr double kLeast = std::numeric_limits<int>::min(), kMost = std::numeric_limits<int>::max();
  const std::pair<std::string_view, double> corners[] = {
      {"x0", area.xMin}, {"y0", area.yMin}, {"x1", area.xMax}, {"y1", area.yMax}};
  for (const auto& [key, value] : corners) {
    file.BeginKeyword(section, key);
    file.AddParam(KvfType::Int).asInt =
        std::isfinite(value) ? static_cast<int>(std::clamp(std::trunc(value), kLeast, kMost)) : 0;
  }
}

int KeptText::LastLineOf(const KvfNode& node) {
  int last = static_cast<int>(node.line);
  if (const KvfSection* section = AsSection(&node))
    for (const KvfNode* child = section->firstChild; child; child = child->next)
      last = std::max(last, LastLineOf(*child));
  return last;
}

std::string KeptText::CommentsUntil(int line) {
  std::string text;
  for (; next_ < file_.comments.size() && file_.comments[next_].line < line; ++next_) {
    text += Trimmed(file_.comments[next_].text);
    text += '\n';
  }
  return text;
}

std::string KeptText::CommentOn(int line) {
  if (next_ == file_.comments.size() || file_.comments[next_].line != line) return {};
  return std::string(Trimmed(file_.comments[next_++].text));
}

void KeptText::Keep(const KvfNode& node, int level) {
  KeepCommentsUntil(LastLineOf(node) + 1, level);
  kept_ += KvfNodeText(node, level);
}

}  // namespace tervane
