// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the characters of a parameter file may be: parser and writer look into the same table.
#pragma once

#include <algorithm>
#include <array>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>
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

/// Eight characters that are looked at in one step, so that no loop over characters ends where the processor did not
/// foresee it. Each question is how many of them, from the first on, are of a class.
class EightChars {
 public:
  explicit EightChars(const char* at) {
    if constexpr (std::endian::native == std::endian::little) {
      std::memcpy(&bytes_, at, sizeof bytes_);
    } else {
      for (int i = 8; i-- > 0;) bytes_ = bytes_ << 8 | static_cast<unsigned char>(at[i]);
    }
  }

  /// Letters, digits and underscores: most of the class kNameRest.
  int WordChars() const {
    return Until(bytes_ | (Outside(bytes_ | Each(0x20), 'a', 'z') & Outside(bytes_, '0', '9') & Other('_')));
  }
  /// Of the class kDigit.
  int Digits() const { return Until(bytes_ | Outside(bytes_, '0', '9')); }
  /// Of the class kPlain.
  int PlainChars() const { return Until(bytes_ | Outside(bytes_, ' ', '~') | ~(Other('"') & Other('\\'))); }
  int Blanks() const { return std::countr_zero(bytes_ ^ Each(' ')) / 8; }

  /// The number that the first `count` (1 to 8) characters show. Neighbours are joined: digits to pairs, pairs to
  /// fours, fours to all eight.
  std::uint64_t NumberOf(int count) const {
    // The missing digits become zeros in front.
    std::uint64_t parts = (bytes_ - Each('0')) << (64 - 8 * count);
    parts = (parts * 10 + (parts >> 8)) & 0x00FF'00FF'00FF'00FF;
    parts = (parts * 100 + (parts >> 16)) & 0x0000'FFFF'0000'FFFF;
    return (parts * 10'000 + (parts >> 32)) & 0xFFFF'FFFF;
  }

 private:
  // The first character is the lowest byte. An answer stands in the highest bit of each byte. A byte whose highest bit
  // is set, or that gives the answer that is looked for, may spoil the answers of the bytes above it: these are behind.

  static constexpr std::uint64_t Each(std::uint64_t byte) { return byte * 0x0101'0101'0101'0101; }
  static std::uint64_t Outside(std::uint64_t bytes, std::uint64_t least, std::uint64_t most) {
    return (bytes + Each(0x7F - most)) | ~(bytes + Each(0x80 - least));
  }
  std::uint64_t Other(std::uint64_t byte) const { return (bytes_ ^ Each(byte)) + Each(0x7F); }
  static int Until(std::uint64_t answers) { return std::countr_zero(answers & Each(0x80)) / 8; }

  std::uint64_t bytes_ = 0;
};

/// Steps over the characters of a word or bare name, of which the first has been looked at.
inline std::string_view ScanWord(const char*& at) {
  const char* word = at;
  for (int count = 8; count == 8; at += count) count = EightChars(at).WordChars();
  while (Is(*at, kNameRest)) ++at;
  return {word, static_cast<std::size_t>(at - word)};
}

/// Whether a name may stand without quotes.
inline bool IsBareName(std::string_view name) {
  return !name.empty() && Is(name[0], kNameStart) &&
         std::all_of(name.begin() + 1, name.end(), [](char c) { return Is(c, kNameRest); });
}

}  // namespace tervane
