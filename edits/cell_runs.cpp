// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "edits/cell_runs.h"

#include <algorithm>

namespace tervane {

bool CellSet::IsEmpty() const {
  return std::ranges::all_of(words_, [](std::uint64_t word) { return word == 0; });
}

std::size_t CellSet::Count() const {
  std::size_t count = 0;
  for (const std::uint64_t word : words_) count += static_cast<std::size_t>(std::popcount(word));
  return count;
}

void CellSet::AddAll(const CellSet& other) {
  for (std::size_t i = 0; i < words_.size(); ++i) words_[i] |= other.words_[i];
}
void CellSet::RemoveAll(const CellSet& other) {
  for (std::size_t i = 0; i < words_.size(); ++i) words_[i] &= ~other.words_[i];
}
void CellSet::KeepAll(const CellSet& other) {
  for (std::size_t i = 0; i < words_.size(); ++i) words_[i] &= other.words_[i];
}

}  // namespace tervane
