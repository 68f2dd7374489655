// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What is told of a key once, where it is declared, besides its name and its member. Pages, tables, the reference of
// keys, search and the findings for stray values read it there.
#pragma once

#include <limits>
#include <span>
#include <string>
#include <string_view>

namespace tervane {

/// A value that a key may have, with the text that people read.
struct KeyChoice {
  int value;
  std::string_view text;
  bool isOffered = true;  ///< False for what files may hold and pages do not offer.
};
using KeyChoices = std::span<const KeyChoice>;

/// The text of a value; empty when the value is none of the choices.
std::string_view TextOf(KeyChoices choices, int value);

struct KeyFacts {
  KeyChoices choices = {};      ///< Empty for a key that may hold any value of its type.
  int itemType = 0;             ///< The quantity whose base unit the file holds; 0 for none.
  std::string_view unit = {};   ///< A fixed unit: "hours".
  std::string_view label = {};  ///< What people call it where no page has a control for it.
  double least = -std::numeric_limits<double>::infinity();
  double greatest = std::numeric_limits<double>::infinity();
  bool isLeastOutside = false;  ///< Values are above `least`, which is none of them.

  bool HasRange() const { return least > -std::numeric_limits<double>::infinity() || HasGreatest(); }
  bool HasGreatest() const { return greatest < std::numeric_limits<double>::infinity(); }
  /// "0 to 1", "0 or more", "above 0", "at most 1"; empty without a range.
  std::string RangeText() const;
  /// What is read behind a number: the fixed unit without brackets, or the abbreviation of the quantity's base unit;
  /// empty for neither.
  std::string_view UnitText() const;
};

/// What is wrong with a value by the facts of its key, as a sentence; empty when nothing is. A number that is none is
/// always wrong.
std::string WhyStray(const KeyFacts& facts, double value);

}  // namespace tervane
