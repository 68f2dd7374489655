// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Numbers in what decides a kept result. A value that is no number (NaN) is never `==` to itself: a key that holds one
// would never be met again, and each look would start a new computation.
#pragma once

#include <cmath>

namespace tervane {

/// Whether two numbers are the same; two that are none are.
inline bool SameNumber(double a, double b) { return a == b || (std::isnan(a) && std::isnan(b)); }

/// A number that is compared so.
template <class Number>
class KeyNumber {
 public:
  KeyNumber(Number value = 0) : value_(value) {}
  operator Number() const { return value_; }
  bool operator==(const KeyNumber& other) const {
    return SameNumber(static_cast<double>(value_), static_cast<double>(other.value_));
  }

 private:
  Number value_;
};

}  // namespace tervane
