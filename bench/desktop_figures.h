// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Times that a user of the desktop waits, and how they are told against their limits.
#pragma once

#include <algorithm>
#include <chrono>
#include <functional>
#include <string>
#include <vector>

#include <fmt/format.h>

#include "bench/median_table.h"

namespace tervane::bench {

inline constexpr int kRepetitions = 10;

inline double Milliseconds(const std::function<void()>& measured) {
  const auto start = std::chrono::steady_clock::now();
  measured();
  return std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start).count();
}

inline double Median(std::vector<double> times) {
  std::ranges::sort(times);
  return times[times.size() / 2];
}

inline double MedianOf(const std::function<void()>& measured) {
  std::vector<double> times;
  for (int i = 0; i < kRepetitions; ++i) times.push_back(Milliseconds(measured));
  return Median(times);
}

inline void Report(const std::string& what, double figure, double limit, const char* unit) {
  fmt::print("{:<64} {:>8.1f} {:<2}  limit {:>4.0f}  {}\n", what, figure, unit, limit, Verdict(figure, limit));
}

inline void ReportPeer(const std::string& what, double figure, const char* unit) {
  fmt::print("{:<64} {:>8.1f} {}\n", what, figure, unit);
}

}  // namespace tervane::bench
