// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/path.h"

#include <charconv>

#include <fmt/format.h>

namespace tervane {

std::string PathName(std::string_view name, int instance) {
  std::string result;
  if (name.empty() || name.find_first_of("/#:\"") != std::string_view::npos) {
    result += '"';
    for (const char c : name) {
      if (c == '"' || c == '\\') result += '\\';
      result += c;
    }
    result += '"';
  } else {
    result = name;
  }
  if (instance > 1) result += fmt::format("#{}", instance);
  return result;
}

std::string JoinPath(std::string_view path, std::string_view name) {
  return path.empty() ? std::string(name) : fmt::format("{}/{}", path, name);
}

namespace {

/// Reads one name with its instance number from `text` at `at`; gives a message when there is none.
std::string ReadStep(std::string_view text, std::size_t& at, PathStep& step) {
  if (at < text.size() && text[at] == '"') {
    for (++at; at < text.size() && text[at] != '"'; ++at) {
      if (text[at] == '\\' && at + 1 < text.size()) ++at;
      step.name += text[at];
    }
    if (at == text.size()) return "the closing \" of a name is missing";
    ++at;
  } else {
    const std::size_t end = std::min(text.find_first_of("/#:\"", at), text.size());
    step.name = text.substr(at, end - at);
    at = end;
    if (step.name.empty()) return fmt::format("a name was expected at place {}", at + 1);
  }
  if (at < text.size() && text[at] == '#') {
    const char* begin = text.data() + at + 1;
    const auto [end, error] = std::from_chars(begin, text.data() + text.size(), step.instance);
    if (error != std::errc() || step.instance < 1) return "a number from 1 was expected behind #";
    at = static_cast<std::size_t>(end - text.data());
  }
  return {};
}

}  // namespace

SetupPath ParseSetupPath(std::string_view text) {
  SetupPath path;
  std::size_t at = 0;
  bool inKey = !text.empty() && text[0] == ':';
  if (inKey) ++at;
  while (path.error.empty() && (at < text.size() || inKey)) {
    PathStep& step = inKey ? path.key : path.steps.emplace_back();
    path.error = ReadStep(text, at, step);
    if (!path.error.empty() || at == text.size()) break;
    const char separator = text[at++];
    if (inKey || (separator != '/' && separator != ':')) {
      std::size_t end = at;
      while (end < text.size() && (static_cast<unsigned char>(text[end]) & 0xC0) == 0x80) ++end;
      path.error = fmt::format("'{}' was not expected at place {}", text.substr(at - 1, end - at + 1), at);
    } else if (separator == ':') {
      inKey = true;
    } else if (at == text.size()) {
      path.error = "a name was expected behind the last /";
    }
  }
  return path;
}

}  // namespace tervane
