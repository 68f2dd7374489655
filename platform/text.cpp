// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/text.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <iterator>
#include <numeric>
#include <utility>
#include <vector>

#include <fmt/format.h>

namespace tervane {
namespace {

char LowerAscii(char letter) { return letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter - 'A' + 'a') : letter; }

/// Length of the well-formed sequence of more than one byte at the text's start, or 0 when none stands there.
std::size_t MultiByteLength(std::string_view text) {
  const auto byte = [&](std::size_t i) { return i < text.size() ? static_cast<unsigned char>(text[i]) : 0u; };
  const auto continues = [&](std::size_t i) { return (byte(i) & 0xC0u) == 0x80u; };
  const unsigned lead = byte(0);
  if (lead >= 0xC2 && lead <= 0xDF) return continues(1) ? 2 : 0;
  if (lead >= 0xE0 && lead <= 0xEF) {
    if (lead == 0xE0 && byte(1) < 0xA0) return 0;  // overlong
    if (lead == 0xED && byte(1) > 0x9F) return 0;  // surrogate
    return continues(1) && continues(2) ? 3 : 0;
  }
  if (lead >= 0xF0 && lead <= 0xF4) {
    if (lead == 0xF0 && byte(1) < 0x90) return 0;  // overlong
    if (lead == 0xF4 && byte(1) > 0x8F) return 0;  // above U+10FFFF
    return continues(1) && continues(2) && continues(3) ? 4 : 0;
  }
  return 0;
}

/// std::to_chars writes an exponent with a sign and at least two digits: "1e+09" becomes "1e9". Gives the new end.
char* ShortenExponent(char* begin, char* end) {
  char* out = std::find(begin, end, 'e');
  if (out == end) return end;
  ++out;
  const char* in = out;
  if (*in == '-') ++out;
  in = std::find_if(in, static_cast<const char*>(end), [](char c) { return c >= '1' && c <= '9'; });
  return std::copy(in, static_cast<const char*>(end), out);
}

template <typename Number>
char* Shortest(Number value, char* buffer) {
  constexpr std::string_view kNotANumber = "nan";
  if (std::isnan(value)) return std::copy(kNotANumber.begin(), kNotANumber.end(), buffer);
  char* const bufferEnd = buffer + kNumberBuffer;
  const Number size = std::abs(value);
  // "100000" is longer than "1e5", but what a reader expects of a count or a coordinate.
  if (size < Number(1e9) && std::trunc(value) == value)
    return std::to_chars(buffer, bufferEnd, value, std::chars_format::fixed).ptr;
  char* const end = std::to_chars(buffer, bufferEnd, value).ptr;
  // Between these an exponent is never shorter.
  return size >= Number(1e-3) && size < Number(1e9) ? end : ShortenExponent(buffer, end);
}

/// The code of a control character at the text's start, one or two bytes long; nothing where none stands there.
std::optional<unsigned> ControlCode(std::string_view text) {
  const auto first = static_cast<unsigned char>(text[0]);
  if (first < 0x20 || first == 0x7F) return first;
  const bool isTwoBytes = first == 0xC2 && text.size() > 1 && static_cast<unsigned char>(text[1]) < 0xA0;
  return isTwoBytes ? std::optional<unsigned>(static_cast<unsigned char>(text[1])) : std::nullopt;
}

std::string Escaped(std::string_view text, bool keepsLines) {
  std::string shown;
  const auto isPlain = [](char c) { return c >= 0x20 && c < 0x7F; };
  while (!text.empty()) {
    const auto plain = static_cast<std::size_t>(std::find_if_not(text.begin(), text.end(), isPlain) - text.begin());
    shown += text.substr(0, plain);
    text.remove_prefix(plain);
    if (text.empty()) break;
    const std::size_t length = static_cast<unsigned char>(text[0]) < 0x80 ? 1 : MultiByteLength(text);
    const std::optional<unsigned> control = ControlCode(text);
    const bool isLineEnd = text[0] == '\n' || (text.size() > 1 && text[0] == '\r' && text[1] == '\n');
    if (length == 0)
      shown += fmt::format("\\x{:02x}", static_cast<unsigned char>(text[0]));
    else if (!control || (keepsLines && (isLineEnd || text[0] == '\t')))
      shown += text.substr(0, length);
    else
      shown += *control == '\n'   ? "\\n"
               : *control == '\r' ? "\\r"
               : *control == '\t' ? "\\t"
                                  : fmt::format("\\u{{{:x}}}", *control);
    text.remove_prefix(std::max<std::size_t>(length, 1));
  }
  return shown;
}

template <typename Number>
std::string ShortestText(Number value) {
  char buffer[kNumberBuffer];
  return {buffer, Shortest(value, buffer)};
}

}  // namespace

std::string_view Trimmed(std::string_view text) {
  constexpr std::string_view kBlanks = " \t\r\n";
  const std::size_t begin = text.find_first_not_of(kBlanks);
  if (begin == std::string_view::npos) return {};
  return text.substr(begin, text.find_last_not_of(kBlanks) - begin + 1);
}

bool EqualIgnoringCase(std::string_view a, std::string_view b) {
  return std::equal(a.begin(), a.end(), b.begin(), b.end(),
                    [](char x, char y) { return LowerAscii(x) == LowerAscii(y); });
}

std::string LowerCase(std::string_view text) {
  std::string lower(text);
  std::ranges::transform(lower, lower.begin(), LowerAscii);
  return lower;
}

std::string Replaced(std::string_view text, std::string_view from, std::string_view to) {
  std::string result;
  result.reserve(text.size());
  std::size_t done = 0;
  for (std::size_t found; (found = text.find(from, done)) != std::string_view::npos; done = found + from.size()) {
    result.append(text, done, found - done).append(to);
  }
  return result.append(text, done);
}

std::string OneLine(std::string_view text) { return Escaped(text, false); }

std::string Printable(std::string_view text) { return Escaped(text, true); }

std::optional<std::size_t> FirstInvalidUtf8(std::string_view text) {
  std::size_t place = 0;
  while (place < text.size()) {
    // Setups are nearly all ASCII: eight bytes in one step.
    std::uint64_t eight;
    while (text.size() - place >= sizeof eight) {
      std::memcpy(&eight, text.data() + place, sizeof eight);
      if ((eight & 0x8080808080808080u) != 0) break;
      place += sizeof eight;
    }
    if (place == text.size()) break;
    const bool isAscii = static_cast<unsigned char>(text[place]) < 0x80;
    const std::size_t length = isAscii ? 1 : MultiByteLength(text.substr(place));
    if (length == 0) return place;
    place += length;
  }
  return std::nullopt;
}

std::uint64_t HashOf(std::string_view text) {
  std::uint64_t hash = 14695981039346656037u;
  for (const char c : text) hash = (hash ^ static_cast<unsigned char>(c)) * 1099511628211u;
  return hash;
}

std::size_t EditDistance(std::string_view a, std::string_view b) {
  // One row of the table of distances between the beginnings of both texts.
  std::vector<std::size_t> row(b.size() + 1);
  std::iota(row.begin(), row.end(), std::size_t{0});
  for (std::size_t i = 0; i < a.size(); ++i) {
    std::size_t diagonal = std::exchange(row[0], i + 1);
    for (std::size_t j = 0; j < b.size(); ++j) {
      const std::size_t replaced = diagonal + (a[i] == b[j] ? 0 : 1);
      diagonal = row[j + 1];
      row[j + 1] = std::min({replaced, diagonal + 1, row[j] + 1});
    }
  }
  return row[b.size()];
}

std::string ShortestNumber(double value) { return ShortestText(value); }
std::string ShortestNumber(float value) { return ShortestText(value); }
char* ShortestNumber(double value, char* buffer) { return Shortest(value, buffer); }
char* ShortestNumber(float value, char* buffer) { return Shortest(value, buffer); }

}  // namespace tervane
