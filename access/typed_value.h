// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Values as people type them on the command line: in the form of the file, and as a page of the desktop takes them; and
// as programs hand them over.
#pragma once

#include <cstdint>
#include <span>
#include <string>
#include <string_view>
#include <variant>

#include "core/key_exchange.h"
#include "core/kvf_tree.h"

namespace tervane {

/// Puts a typed value into a keyword of that section, in the type that it has. `info` is what is known of the key, or
/// null: it brings the texts of choices ("Richards equation"), units ("2 days" for hours), dates ("2011-01-01") and
/// lists of any length ("3, 4"). Gives what was expected when the text is no such value; then the keyword stays.
std::string TakeTyped(std::string_view typed, const KeyInfo* info, KvfSection& section, KvfNode& keyword);

/// A value of a program.
using PlainValue = std::variant<bool, std::int64_t, double, std::string>;
/// The value of a parameter as a program sees it.
PlainValue PlainValueOf(const KvfParam& param);

/// Puts values of a program into a keyword, as many as it has, or any number where the key is a list. A number is taken
/// where nothing is lost, true and false also as 1 and 0. Gives what was expected, and then the keyword stays.
std::string TakePlainValues(std::span<const PlainValue> values, const KeyInfo* info, KvfSection& section,
                            KvfNode& keyword);

}  // namespace tervane
