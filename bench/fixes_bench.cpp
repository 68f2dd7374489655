// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How long it takes to find a thousand files that have moved and to save the setup, beside a bare walk of the folder.
#include <filesystem>
#include <fstream>
#include <string>

#include <fmt/format.h>
#include <unistd.h>

#include "bench/median_table.h"
#include "data/series_file.h"
#include "document/flow_model_document.h"
#include "fixes/quick_fixes.h"

namespace tervane::bench {

namespace {

constexpr int kStations = 1'000;
constexpr int kOthers = 20'000;  ///< Files that are not looked for.

std::string MovedSetup() {
  std::string text = fmt::format(
      "target TERVANE_FLOWMODEL {{\n  section FlowModelDocVersion {{\n    Version = 14\n  }}\n  section Climate {{\n"
      "    section PrecipitationRate {{\n      DistributionType = 2\n      section STATION_BASED {{\n"
      "        NO_TIMESERIES = {}\n      }}\n",
      kStations);
  for (int number = 1; number <= kStations; ++number)
    text += fmt::format(
        "      section TIME_SERIES_{0} {{\n        NAME = \"Gauge {0}\"\n        GRIDCODEID = \"{0}\"\n"
        "        TYPE = 2\n        section TIME_SERIES_FILE {{\n          FILE_NAME = file \"old/gauge_{0}.nds0\"\n"
        "        }}\n      }}\n",
        number);
  return text + "    }\n  }\n}\n";
}

void MakeFiles(const std::string& folder) {
  const std::string series = folder + "/series.nds0";
  WriteSeriesFile(series, {"rain", 100431, 3, {{2000, 1, 1}, {2000, 12, 31}}, {1, 1}});
  for (int number = 0; number < kOthers; ++number) {
    const std::string below = fmt::format("{}/data/{}/{}", folder, number % 10, number % 100);
    std::filesystem::create_directories(below);
    if (number < kStations)
      std::filesystem::copy_file(series, fmt::format("{}/gauge_{}.nds0", below, number + 1));
    else
      std::ofstream(fmt::format("{}/other_{}.txt", below, number)) << number;
  }
}

std::size_t Walk(const std::string& folder) {
  std::size_t files = 0;
  for (const auto& entry : std::filesystem::recursive_directory_iterator(folder)) files += entry.is_regular_file();
  return files;
}

std::size_t FixAndSaveTo(const std::string& file, const std::string& saved) {
  CFlowModelDoc document;
  if (!document.OnOpenDocument(file)) return 0;
  QuickFixes fixes(document);
  std::string error;
  std::size_t changed = 0;
  for (const FixRound& round : FixAll(document, fixes, nullptr, document.Root().SetupFolder(), false, error))
    changed += round.plan.values.size();
  if (changed < kStations || !document.OnSaveDocument(saved)) fmt::print("only {} fixed: {}\n", changed, error);
  return changed;
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) {
  using namespace tervane::bench;
  const std::string folder =
      (std::filesystem::temp_directory_path() / fmt::format("tervane_fixes_{}", getpid())).string();
  std::filesystem::create_directory(folder);
  MakeFiles(folder);
  const std::string file = folder + "/moved.tvd";
  std::ofstream(file) << MovedSetup();
  MedianTable table(7);
  table.Add("a bare walk of the folder", [folder] { return Walk(folder); });
  table.Add("1,000 moved files found, and the setup saved",
            [file, folder] { return FixAndSaveTo(file, folder + "/saved.tvd"); });
  table.LimitTime("1,000 moved files found, and the setup saved", 2000);
  table.Run(argc, argv);
  std::filesystem::remove_all(folder);
  return 0;
}
