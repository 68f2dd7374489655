// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The order in which the rows of a table are looked at.
#include <algorithm>
#include <cmath>
#include <numeric>

#include "forms/table_form.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// What a row is sorted by: its number, or its text.
struct SortKey {
  std::optional<double> number;
  std::string text;
};

SortKey KeyOf(const CellValue& value, std::string shown) {
  SortKey key{{}, LowerCase(shown)};
  if (const auto* whole = std::get_if<int>(&value)) key.number = *whole;
  if (const auto* single = std::get_if<float>(&value)) key.number = static_cast<double>(*single);
  if (const auto* real = std::get_if<double>(&value)) key.number = *real;
  if (key.number && std::isnan(*key.number)) key = {};
  return key;
}

/// Numbers within texts go by their value: "Gauge 9" stands before "Gauge 10".
bool IsBefore(std::string_view a, std::string_view b) {
  while (!a.empty() && !b.empty()) {
    if (!IsDigit(a.front()) || !IsDigit(b.front())) {
      if (a.front() != b.front()) return a.front() < b.front();
      a.remove_prefix(1);
      b.remove_prefix(1);
      continue;
    }
    const auto takeNumber = [](std::string_view& text) {
      while (text.size() > 1 && text[0] == '0' && IsDigit(text[1])) text.remove_prefix(1);
      std::size_t count = 0;
      while (count < text.size() && IsDigit(text[count])) ++count;
      const std::string_view number = text.substr(0, count);
      text.remove_prefix(count);
      return number;
    };
    const std::string_view first = takeNumber(a), second = takeNumber(b);
    if (first.size() != second.size()) return first.size() < second.size();
    if (first != second) return first < second;
  }
  return a.size() < b.size();
}

bool IsBefore(const SortKey& a, const SortKey& b) {
  return a.number && b.number ? *a.number < *b.number : IsBefore(a.text, b.text);
}

}  // namespace

void TableForm::SortBy(int column) {
  const TableColumn* chosen = Column(column);
  if (!chosen || !CanArrange()) return;
  const bool isAgain = sortedBy_ == chosen;
  if (isAgain && isDescending_) chosen = nullptr;
  isDescending_ = isAgain && !isDescending_;
  sortedBy_ = chosen;
  Arrange();
  FollowCurrent();
}

int TableForm::SortedColumn() const {
  for (int column = 1; column <= ColumnCount(); ++column)
    if (sortedBy_ && Column(column) == sortedBy_) return column;
  return 0;
}

void TableForm::Filter(std::string text) {
  if (!CanArrange() || text == filter_) return;
  filter_ = std::move(text);
  Arrange();
  FollowCurrent();
}

void TableForm::Arrange() {
  rows_->Arrange({});
  allRows_ = rows_->Count();
  if (!CanArrange() || (filter_.empty() && !sortedBy_)) return;
  const std::string wanted = LowerCase(filter_);
  std::vector<int> rows(static_cast<std::size_t>(allRows_));
  std::iota(rows.begin(), rows.end(), 1);
  std::erase_if(rows, [&](int row) {
    for (int column = 1; !wanted.empty() && column <= ColumnCount(); ++column)
      if (!Column(column)->IsButton() && LowerCase(ShownCell(row, column)).find(wanted) != std::string::npos)
        return false;
    return !wanted.empty();
  });
  if (sortedBy_) {
    std::vector<SortKey> keys(static_cast<std::size_t>(allRows_) + 1);
    for (const int row : rows)
      keys[static_cast<std::size_t>(row)] = KeyOf(sortedBy_->get(row), ShownCell(row, *sortedBy_));
    std::ranges::stable_sort(rows, [&](int a, int b) {
      const SortKey &first = keys[static_cast<std::size_t>(a)], &second = keys[static_cast<std::size_t>(b)];
      // What holds nothing stands last in either direction.
      if (first.text.empty() != second.text.empty()) return second.text.empty();
      return isDescending_ ? IsBefore(second, first) : IsBefore(first, second);
    });
  }
  rows_->Arrange(rows);
}

}  // namespace tervane
