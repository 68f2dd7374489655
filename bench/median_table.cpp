// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "bench/median_table.h"

#include <algorithm>

#include <fmt/format.h>

namespace tervane::bench {

void MedianTable::Run(int argc, char** argv) {
  std::string interleaving = "--benchmark_enable_random_interleaving=true";
  std::vector<char*> arguments(argv, argv + argc);
  arguments.insert(arguments.begin() + 1, interleaving.data());
  int count = static_cast<int>(arguments.size());
  benchmark::Initialize(&count, arguments.data());
  if (benchmark::ReportUnrecognizedArguments(count, arguments.data())) return;
  benchmark::RunSpecifiedBenchmarks(this);

  fmt::print("\n{:<44} {:>10} {:>10} {:>10}\n", "milliseconds of processor time", "median", "least", "most");
  for (const std::string& name : names_) {
    const auto found = times_.find(name);
    if (found == times_.end()) continue;
    const auto [least, most] = std::minmax_element(found->second.begin(), found->second.end());
    fmt::print("{:<44} {:>10.3f} {:>10.3f} {:>10.3f}", name, Median(name), *least, *most);
    if (const auto limit = timeLimits_.find(name); limit != timeLimits_.end())
      fmt::print("  limit {:g}  {}", limit->second, Verdict(Median(name), limit->second));
    fmt::print("\n");
  }
  fmt::print("\n{:<76} {:>7} {:>7}\n", "ratio of medians", "found", "limit");
  for (const RatioLimit& limit : limits_) {
    if (Median(limit.name) < 0 || Median(limit.other) < 0) continue;
    const double ratio = Median(limit.name) / Median(limit.other);
    fmt::print("{:<76} {:>7.2f} {:>7.2f}  {}\n", fmt::format("{} / {}", limit.name, limit.other), ratio, limit.limit,
               Verdict(ratio, limit.limit));
  }
}

void MedianTable::ReportRuns(const std::vector<BenchmarkReporter::Run>& runs) {
  for (const BenchmarkReporter::Run& run : runs)
    if (run.run_type == BenchmarkReporter::Run::RT_Iteration)
      times_[run.run_name.function_name].push_back(run.GetAdjustedRealTime());
}

double MedianTable::Median(const std::string& name) const {
  const auto found = times_.find(name);
  if (found == times_.end()) return -1;
  std::vector<double> times = found->second;
  const auto middle = times.begin() + static_cast<std::ptrdiff_t>(times.size() / 2);
  std::nth_element(times.begin(), middle, times.end());
  return *middle;
}

std::string_view Verdict(double figure, double limit) { return figure <= limit ? "met" : "MISSED"; }

}  // namespace tervane::bench
