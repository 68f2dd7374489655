// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Small operations on text that the standard library lacks. All text in the system is UTF-8.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace tervane {

/// One of the ten, whatever the locale.
inline bool IsDigit(char c) { return c >= '0' && c <= '9'; }

/// The text without blanks, tabs and line ends at both sides.
std::string_view Trimmed(std::string_view text);

/// Equal when the case of ASCII letters is ignored.
bool EqualIgnoringCase(std::string_view a, std::string_view b);

/// The text with its ASCII letters in lower case.
std::string LowerCase(std::string_view text);

/// The text with every `from` replaced by `to`; `from` must not be empty.
std::string Replaced(std::string_view text, std::string_view from, std::string_view to);

/// Place of the first byte that is no part of well-formed UTF-8 (overlong forms, surrogates and values above U+10FFFF
/// are none), or nothing when the whole text is.
std::optional<std::size_t> FirstInvalidUtf8(std::string_view text);

/// The text on one line, without what a terminal would obey: control characters as a setup writes them ("\n",
/// "\u{1b}"), bytes that are no UTF-8 as "\xff".
std::string OneLine(std::string_view text);
/// The same for a text of several lines, whose line ends and tabs stay.
std::string Printable(std::string_view text);

/// FNV-1a over the bytes. Names of files are made of it, so it stays as it is.
std::uint64_t HashOf(std::string_view text);

/// Number of edits (insert, delete, replace one byte) that lead from one text to the other, for "did you mean".
std::size_t EditDistance(std::string_view a, std::string_view b);

/// Shortest decimal text that reads back to the same bits, whatever the process's locale: "0.1", "1e9", "-inf", "nan".
/// A whole number below 1e9 has neither point nor exponent: "6", "100000".
std::string ShortestNumber(double value);
std::string ShortestNumber(float value);

/// The same into a buffer of at least `kNumberBuffer` bytes; gives the end of the text.
inline constexpr int kNumberBuffer = 40;
char* ShortestNumber(double value, char* buffer);
char* ShortestNumber(float value, char* buffer);

}  // namespace tervane
