// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Numbers of a parameter file, and the words that stand for numbers. All texts that are looked at are followed by eight
// NULs.
#pragma once

#include <array>
#include <charconv>
#include <cmath>
#include <cstdint>
#include <limits>
#include <string_view>
#include <system_error>
#include <type_traits>

#include "core/kvf_chars.h"
#include "core/kvf_tree.h"

namespace tervane {

namespace kvf_number {

/// 1, 10, 100, ...
template <class Number, std::size_t count>
constexpr std::array<Number, count> PowersOfTen() {
  std::array<Number, count> powers{1};
  for (std::size_t i = 1; i < count; ++i) powers[i] = powers[i - 1] * 10;
  return powers;
}

/// The value mantissa * 10^exponent where one rounding gives it, so that it is the same as of a careful conversion: the
/// mantissa and the power of ten are both numbers of that type. False for the rare others.
template <class Real>
bool RealOf(std::uint64_t mantissa, int exponent, bool negative, Real& value) {
  constexpr int largestExponent = std::is_same_v<Real, float> ? 10 : 22;
  static constexpr auto powers = PowersOfTen<Real, largestExponent + 1>();
  if (mantissa > std::uint64_t{1} << std::numeric_limits<Real>::digits) return false;
  if (exponent < -largestExponent || exponent > largestExponent) return false;
  const Real whole = static_cast<Real>(mantissa);
  value = exponent < 0 ? whole / powers[static_cast<std::size_t>(-exponent)]
                       : whole * powers[static_cast<std::size_t>(exponent)];
  if (negative) value = -value;
  return true;
}

/// Steps over digits and appends them to `mantissa`, which holds up to 19; gives their number.
inline std::ptrdiff_t ScanDigits(const char*& at, std::uint64_t& mantissa) {
  static constexpr auto powers = PowersOfTen<std::uint64_t, 9>();
  const char* begin = at;
  for (int count = 8; count == 8; at += count) {
    const EightChars digits(at);
    count = digits.Digits();
    if (count == 0) break;
    mantissa = mantissa * powers[static_cast<std::size_t>(count)] + digits.NumberOf(count);
  }
  return at - begin;
}

/// Takes inf, nan, inff or nanf; false when the word is none of them.
inline bool TakeNotFinite(std::string_view word, int sign, KvfParam& value) {
  const bool isFloat = word == "inff" || word == "nanf";
  if (!isFloat && word != "inf" && word != "nan") return false;
  if (isFloat) {
    using Limits = std::numeric_limits<float>;
    value.type = KvfType::Float;
    value.asFloat = std::copysign(word[0] == 'i' ? Limits::infinity() : Limits::quiet_NaN(), static_cast<float>(sign));
  } else {
    using Limits = std::numeric_limits<double>;
    value.type = KvfType::Double;
    value.asDouble = std::copysign(word[0] == 'i' ? Limits::infinity() : Limits::quiet_NaN(), sign);
  }
  return true;
}

/// A float or double whose parts have been read; `mantissa` and `exponent` are its value where `isKnown`.
template <class Real>
const char* TakeReal(std::string_view number, bool isKnown, std::uint64_t mantissa, int exponent, Real& value) {
  if (isKnown && RealOf(mantissa, exponent, number[0] == '-', value)) return nullptr;
  const char* end = number.data() + number.size();
  const std::from_chars_result result = std::from_chars(number.data(), end, value);
  if (result.ec == std::errc::result_out_of_range)
    return std::is_same_v<Real, float> ? "a number that fits a float was expected"
                                       : "a number that fits a double was expected";
  return result.ptr == end ? nullptr : "a number was expected";
}

}  // namespace kvf_number

/// Reads a number and steps behind it. Null when it is one, else what was expected; an empty text where nothing that
/// begins like a number stands.
inline const char* ScanKvfNumber(const char*& at, KvfParam& value) {
  const char* number = at;
  const bool negative = *at == '-';
  if (negative) ++at;
  std::uint64_t mantissa = 0;
  std::ptrdiff_t digitCount = kvf_number::ScanDigits(at, mantissa);
  if (digitCount > 0 && Is(*at, kDelimiter)) {
    const std::uint64_t most = negative ? 0x8000'0000u : 0x7FFF'FFFFu;
    // 19 digits cannot have overflowed the 64 bits.
    if (digitCount > 19 || mantissa > most) return "a whole number from -2147483648 to 2147483647 was expected";
    value.type = KvfType::Int;
    const auto whole = static_cast<std::int64_t>(mantissa);
    value.asInt = static_cast<std::int32_t>(negative ? -whole : whole);
    return nullptr;
  }
  if (negative && (*at == 'i' || *at == 'n')) {
    const bool isNumber = kvf_number::TakeNotFinite(ScanWord(at), -1, value) && Is(*at, kDelimiter);
    return isNumber ? nullptr : "a number was expected";
  }
  std::ptrdiff_t fractionCount = 0;
  if (*at == '.') {
    ++at;
    fractionCount = kvf_number::ScanDigits(at, mantissa);
    digitCount += fractionCount;
  }
  if (digitCount == 0) return "";
  bool isKnown = digitCount <= 19;  // more may not have fitted
  int exponent = 0;
  if (*at == 'e' || *at == 'E') {
    ++at;
    const bool isSmall = *at == '-';
    if (*at == '+' || *at == '-') ++at;
    std::uint64_t size = 0;
    const std::ptrdiff_t exponentCount = kvf_number::ScanDigits(at, size);
    if (exponentCount == 0) return "a number was expected: its exponent is missing";
    isKnown = isKnown && exponentCount <= 4;
    if (isKnown) exponent = isSmall ? -static_cast<int>(size) : static_cast<int>(size);
  }
  const std::string_view text(number, static_cast<std::size_t>(at - number));
  const bool isFloat = *at == 'f';
  if (isFloat) ++at;
  if (!Is(*at, kDelimiter)) return "a number was expected";
  value.type = isFloat ? KvfType::Float : KvfType::Double;
  exponent -= static_cast<int>(fractionCount);
  return isFloat ? kvf_number::TakeReal(text, isKnown, mantissa, exponent, value.asFloat)
                 : kvf_number::TakeReal(text, isKnown, mantissa, exponent, value.asDouble);
}

}  // namespace tervane
