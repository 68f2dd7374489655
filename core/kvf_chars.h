// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the characters of a parameter file may be: parser and writer look into the same table.
#pragma once

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace tervane {

enum KvfCharClass : std::uint8_t {
  kNameStart = 1,
  kNameRest = 2,
  kDigit = 4,
  kPlain = 8,       // stands for itself inside a string, and needs no look at UTF-8
  kUnescaped = 16,  // stands for itself inside a string
  kComment = 32,    // may stand in a comment, and needs no look at UTF-8
  kDelimiter = 64   // ends a number or a word
};

namespace kvf_chars {

constexpr std::array<std::uint8_t, 256> MakeClasses() {
  std::array<std::uint8_t, 256> classes{};
  for (int c = 0; c < 256; ++c) {
    const bool letter = (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || c == '_';
    const bool digit = c >= '0' && c <= '9';
    const bool plain = c >= 0x20 && c < 0x7F && c != '"' && c != '\\';
    std::uint8_t set = 0;
    if (letter) set |= kNameStart;
    if (letter || digit || c == '.' || c == '%' || c == '-') set |= kNameRest;
    if (digit) set |= kDigit;
    if (plain) set |= kPlain;
    if (plain || c >= 0x80) set |= kUnescaped;
    if ((c >= 0x20 && c < 0x7F) || c == '\t') set |= kComment;
    if (c == ' ' || c == '\t' || c == '\r' || c == '\n' || c == ',' || c == '#' || c == '\0') set |= kDelimiter;
    classes[static_cast<std::size_t>(c)] = set;
  }
  return classes;
}

inline constexpr std::array<std::uint8_t, 256> kClasses = MakeClasses();

}  // namespace kvf_chars

inline bool Is(char c, KvfCharClass charClass) {
  return (kvf_chars::kClasses[static_cast<unsigned char>(c)] & charClass) != 0;
}

/// Whether a name may stand without quotes.
inline bool IsBareName(std::string_view name) {
  return !name.empty() && Is(name[0], kNameStart) &&
         std::all_of(name.begin() + 1, name.end(), [](char c) { return Is(c, kNameRest); });
}

}  // namespace tervane
