// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <bit>
#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

namespace tervane {

/// Values of some cells of a grid, those that stand side by side together: a change costs what it touches.
class CellRuns {
 public:
  /// Best in ascending order of the cells.
  void Add(std::size_t cell, float value) {
    if (runs_.empty() || runs_.back().cell + runs_.back().count != cell) runs_.push_back({cell, 0});
    ++runs_.back().count;
    values_.push_back(value);
  }
  bool IsEmpty() const { return runs_.empty(); }
  std::size_t Count() const { return values_.size(); }
  std::size_t Bytes() const { return values_.capacity() * sizeof(float) + runs_.capacity() * sizeof(Run); }

  /// Calls `found(cell, values)` for each run with its first cell.
  template <class Found>
  void ForEach(const Found& found) {
    std::size_t place = 0;
    for (const Run& run : runs_) {
      found(run.cell, std::span(values_).subspan(place, run.count));
      place += run.count;
    }
  }

 private:
  struct Run {
    std::size_t cell, count;
  };
  std::vector<Run> runs_;
  std::vector<float> values_;
};

/// A set of cells of a grid, a bit for each.
class CellSet {
 public:
  CellSet() = default;
  explicit CellSet(std::size_t cells) : cells_(cells), words_((cells + 63) / 64) {}

  bool Has(std::size_t cell) const { return (words_[cell / 64] >> (cell % 64) & 1) != 0; }
  void Add(std::size_t cell) { words_[cell / 64] |= std::uint64_t{1} << (cell % 64); }
  void Remove(std::size_t cell) { words_[cell / 64] &= ~(std::uint64_t{1} << (cell % 64)); }
  bool IsEmpty() const;
  std::size_t Count() const;
  void AddAll(const CellSet& other);
  void RemoveAll(const CellSet& other);
  void KeepAll(const CellSet& other);

  /// Calls `found(cell)` for each cell, ascending.
  template <class Found>
  void ForEach(const Found& found) const {
    for (std::size_t word = 0; word < words_.size(); ++word)
      for (std::uint64_t bits = words_[word]; bits != 0; bits &= bits - 1)
        found(word * 64 + static_cast<std::size_t>(std::countr_zero(bits)));
  }

 private:
  std::size_t cells_ = 0;
  std::vector<std::uint64_t> words_;
};

}  // namespace tervane
