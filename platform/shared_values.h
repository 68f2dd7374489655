// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <algorithm>
#include <cstddef>
#include <initializer_list>
#include <memory>
#include <utility>
#include <vector>

namespace tervane {

/// A vector that its copies share until one of them is changed: to take a million values along, or to see that they
/// are still the same, costs nothing.
template <class T>
class SharedValues {
 public:
  // As any container that is only read.
  using value_type = T;
  using const_iterator = typename std::vector<T>::const_iterator;
  using iterator = const_iterator;

  SharedValues() = default;
  SharedValues(std::vector<T> values) : values_(std::make_shared<std::vector<T>>(std::move(values))) {}
  SharedValues(std::initializer_list<T> values) : SharedValues(std::vector<T>(values)) {}

  const std::vector<T>& Values() const {
    static const std::vector<T> kNone;
    return values_ ? *values_ : kNone;
  }
  /// To be changed: what others share stays as it is.
  std::vector<T>& Change() {
    if (!values_)
      values_ = std::make_shared<std::vector<T>>();
    else if (values_.use_count() > 1)
      values_ = std::make_shared<std::vector<T>>(*values_);
    return *values_;
  }
  operator const std::vector<T>&() const { return Values(); }

  bool empty() const { return Values().empty(); }
  std::size_t size() const { return Values().size(); }
  const T& operator[](std::size_t place) const { return Values()[place]; }
  const T& front() const { return Values().front(); }
  const T& back() const { return Values().back(); }
  auto begin() const { return Values().begin(); }
  auto end() const { return Values().end(); }
  void push_back(T value) { Change().push_back(std::move(value)); }

  /// Whether they are equal by `same`, which is not asked where both share their values.
  template <class Same>
  bool IsEqual(const SharedValues& other, Same same) const {
    return values_ == other.values_ || std::ranges::equal(Values(), other.Values(), same);
  }
  bool operator==(const SharedValues& other) const { return values_ == other.values_ || Values() == other.Values(); }

 private:
  std::shared_ptr<std::vector<T>> values_;
};

}  // namespace tervane
