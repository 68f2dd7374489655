// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Statistics of a run with many points, and large catalogues of results.
#include <cmath>
#include <filesystem>
#include <string>
#include <vector>

#include <fmt/format.h>
#include <unistd.h>

#include "bench/median_table.h"
#include "data/datafile_writer.h"
#include "results/result_catalogue_file.h"
#include "results/statistics_report.h"

namespace tervane::bench {

namespace {

namespace fs = std::filesystem;

constexpr int kPoints = 1000, kSteps = 10000, kItems = 10000;
constexpr std::int64_t kDay = 86400;

float FlowAt(int point, int step) {
  return 10.0F + static_cast<float>(point % 7) + 5.0F * std::sin(0.017F * static_cast<float>(step + point));
}

/// Two series of a point, whose times lie apart.
struct SeriesOfPoint {
  std::vector<std::int64_t> simulatedAt, observedAt;
  std::vector<float> simulated, observed;

  SeriesOfPoint() {
    for (int step = 0; step < kSteps; ++step) {
      simulatedAt.push_back(kDay * step);
      observedAt.push_back(kDay * step + kDay / 3);
      simulated.push_back(FlowAt(1, step));
      observed.push_back(step % 50 == 0 ? kDeleteValue : FlowAt(2, step));
    }
  }
};

void WriteFlows(const std::string& path) {
  NewDataFile content;
  content.dimensions = 0;
  for (int point = 0; point < kPoints; ++point)
    content.items.push_back(
        {fmt::format("Point {}", point + 1), quantity::kDischarge, BaseUnit(*FindItemType(quantity::kDischarge)).key});
  DataFileWriter writer;
  std::string error = writer.Create(path, content);
  const CYbDateTime start(1990, 1, 1);
  for (int step = 0; step < kSteps && error.empty(); ++step) {
    error = writer.AddStep(start + CYbDateTimeSpan{kDay * step});
    for (int point = 0; point < kPoints && error.empty(); ++point) {
      const float value = FlowAt(point, step);
      error = writer.Put(point + 1, std::span(&value, 1));
    }
  }
  if (error.empty()) error = writer.Finish().error;
  if (!error.empty()) fmt::print("WRONG: {}\n", error);
}

int Run(int argc, char** argv) {
  const fs::path folder = fs::temp_directory_path() / fmt::format("tervane_results_bench_{}", getpid());
  fs::create_directories(folder);
  MedianTable table(5);

  const SeriesOfPoint series;
  const std::string inMemory = "statistics of 1,000 points with 10,000 steps each";
  table.Add(inMemory, [&] {
    std::size_t pairs = 0;
    for (int point = 0; point < kPoints; ++point)
      pairs +=
          StatisticsOf(PairsOf({series.simulatedAt, series.simulated, ValueType::Instantaneous, {}},
                               {series.observedAt, series.observed, ValueType::Instantaneous, {}}, 0, kDay * kSteps))
              .pairs;
    return pairs;
  });
  table.LimitTime(inMemory, 500);

  const std::string simulated = (folder / "simulated.nds0").string();
  WriteFlows(simulated);
  std::vector<DetailedPoint> points(kPoints);
  for (int i = 0; i < kPoints; ++i) {
    points[static_cast<std::size_t>(i)].simulated = {simulated, i + 1};
    points[static_cast<std::size_t>(i)].includesObserved = true;
    points[static_cast<std::size_t>(i)].observed = {simulated, kPoints - i};
  }
  const std::string fromFiles = "statistics of 1,000 such points, read from a file of 1,000 items";
  table.Add(fromFiles, [&] {
    StatisticsTable statistics;
    ComputeStatistics(points, {CYbDateTime(1990, 1, 1), CYbDateTime(2018, 1, 1)}, DisplayUnits(), statistics);
    if (!statistics.stopped.empty() || statistics.rows.size() != points.size())
      fmt::print("WRONG: {} rows, {}\n", statistics.rows.size(), statistics.stopped);
    return statistics.rows.size();
  });
  table.LimitTime(fromFiles, 5000);

  StoredItems stored;
  for (int i = 0; i < kItems; ++i)
    stored.items.push_back({fmt::format("Item {}", i + 1), (folder / "a.nds3").string(), i + 1, 102 + i % 2, false});
  const std::string catalogue = (folder / "many.tvdres").string();
  if (const std::string error = WriteStoredItems(catalogue, stored, "bench"); !error.empty())
    fmt::print("WRONG: {}\n", error);
  const std::string reading = "read a catalogue of 10,000 items";
  table.Add(reading, [&] {
    StoredItems read;
    if (const std::string error = ReadStoredItems(catalogue, true, read); !error.empty() || read.items.size() != kItems)
      fmt::print("WRONG: {} items, {}\n", read.items.size(), error);
    return read.items.size();
  });
  table.LimitTime(reading, 50);
  table.Run(argc, argv);
  fs::remove_all(folder);
  return 0;
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) { return tervane::bench::Run(argc, argv); }
