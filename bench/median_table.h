// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Runs benchmarks in random order, repetition by repetition, so that a machine that slows down meanwhile slows all of
// them alike, and prints their medians and the ratios that have limits. Times are the processor's, of this process
// alone: on a busy machine a long call is interrupted and a short one is not.
#pragma once

#include <ctime>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include <benchmark/benchmark.h>
#include <malloc.h>

namespace tervane::bench {

class MedianTable : public benchmark::BenchmarkReporter {
 public:
  explicit MedianTable(int repetitions) : repetitions_(repetitions) {}

  /// A benchmark of one call; what `prepare` gives is handed to `measured`, and only that is timed. What `measured`
  /// gives dies outside the time.
  template <class Prepare, class Measured>
  void Add(const std::string& name, const Prepare& prepare, const Measured& measured) {
    names_.push_back(name);
    benchmark::RegisterBenchmark(name.c_str(),
                                 [=](benchmark::State& state) {
                                   for (auto _ : state) {
                                     auto&& prepared = prepare();
                                     // No memory that an earlier call left with the allocator: how much that is depends
                                     // on the order of the calls.
                                     malloc_trim(0);
                                     const std::clock_t start = std::clock();
                                     auto result = measured(prepared);
                                     benchmark::DoNotOptimize(result);
                                     state.SetIterationTime(static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC);
                                   }
                                 })
        ->UseManualTime()
        ->Unit(benchmark::kMillisecond)
        ->Iterations(1)
        ->Repetitions(repetitions_);
  }
  template <class Measured>
  void Add(const std::string& name, const Measured& measured) {
    Add(
        name, [] { return 0; }, [=](int) { return measured(); });
  }

  /// The median of one benchmark is to be at most `limit` times that of another.
  void Limit(const std::string& name, const std::string& other, double limit) {
    limits_.push_back({name, other, limit});
  }

  /// The median of one benchmark is to be at most so many milliseconds.
  void LimitTime(const std::string& name, double milliseconds) { timeLimits_[name] = milliseconds; }

  /// Runs what was added (the command line may choose, as in any Google Benchmark program) and prints the table.
  void Run(int argc, char** argv);

 private:
  struct RatioLimit {
    std::string name, other;
    double limit;
  };

  bool ReportContext(const Context& /*context*/) override { return true; }
  void ReportRuns(const std::vector<BenchmarkReporter::Run>& runs) override;
  /// Milliseconds; negative when it did not run.
  double Median(const std::string& name) const;

  int repetitions_;
  std::vector<std::string> names_;
  std::vector<RatioLimit> limits_;
  std::map<std::string, double> timeLimits_;
  std::map<std::string, std::vector<double>> times_;
};

/// "met" or "MISSED", for a figure that has a limit.
std::string_view Verdict(double figure, double limit);

}  // namespace tervane::bench
