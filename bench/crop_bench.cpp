// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Calendars of crops, and large libraries of vegetations.
#include <string>
#include <vector>

#include <fmt/format.h>

#include "bench/median_table.h"
#include "libraries/soils.h"
#include "libraries/vegetations.h"
#include "surface/crop_calendar.h"
#include "surface/vegetation_file.h"

namespace tervane::bench {

namespace {

const CYbDateTime kStart{1000, 1, 1};
constexpr double kLength = 20;
constexpr int kVegetations = 1000, kStages = 20;

/// A rotation of three crops, recycled to so many crops. They are short, so that they fit into the years that there
/// are.
struct Rotation {
  explicit Rotation(int crops) : end(kStart + CYbDateTimeSpan::Days(kLength * crops)) {
    for (int i = 0; i < 3; ++i)
      planned.push_back({&file, kStart + CYbDateTimeSpan::Days(kLength * i), CYbDateTimeSpan::Days(kLength), true});
  }

  CTvnVegPropFile file{nullptr};
  std::vector<PlannedCrop> planned;
  CYbDateTime end;
};

FileContent LibraryText() {
  std::string text = "target TERVANE_VEGETATION {\n";
  for (int i = 1; i <= kVegetations; ++i) {
    text += fmt::format("  section Vegetation_{} {{\n    Name = \"Vegetation {}\"\n    Source = \"FAO 56\"\n", i, i);
    for (int stage = 0; stage < kStages; ++stage)
      text += fmt::format("    Stage = {}, {:.2f}, {:.2f}, {:.2f}\n", 10 * stage, 0.2 * stage, 0.05 * stage,
                          0.3 + 0.05 * stage);
    text += "  }\n";
  }
  return FileContent::Of(text + "}\n");
}

FileContent SoilText() {
  std::string text = "target TERVANE_SOILS {\n";
  for (int i = 1; i <= kVegetations; ++i) {
    text += fmt::format("  section Soil_{} {{\n    Name = \"Soil {}\"\n    Source = \"survey\"\n", i, i);
    text += fmt::format("    Retention = \"van Genuchten\", 0.43, 0.078, {}, 1.56\n", 1 + 0.01 * i);
    text += "    Conductivity = \"Mualem\", 2.889e-6, 0.5\n    BulkDensity = 1511.0\n  }\n";
  }
  return FileContent::Of(text + "}\n");
}

int Run(int argc, char** argv) {
  const FileContent text = LibraryText(), soils = SoilText();
  const Rotation large(100'000), small(10'000);
  const auto calendarOf = [](const Rotation& rotation) {
    return BuildVegCalendar(rotation.planned, kEntireScheme, rotation.end);
  };
  fmt::print("calendars of {} and {} crops, a library of {} bytes\n", calendarOf(large).entries.size(),
             calendarOf(small).entries.size(), text.size);
  MedianTable table(21);
  table.Add("calendar of 10,000 crops", [&] { return calendarOf(small); });
  table.Add("calendar of 100,000 crops", [&] { return calendarOf(large); });
  table.Add("read a library of 1,000 vegetations", [&] {
    Library library(kVegetationLibrary);
    if (const std::string error = ParseLibrary(text, "large.etv", library); !error.empty()) fmt::print("{}\n", error);
    return library;
  });
  table.Add("read and check a library of 1,000 soils", [&] {
    Library library(kSoilLibrary);
    if (const std::string error = ParseLibrary(soils, "large.uzs", library); !error.empty()) fmt::print("{}\n", error);
    if (!FindingsOf(library).empty()) fmt::print("the soils have findings\n");
    return library;
  });
  table.LimitTime("read and check a library of 1,000 soils", 20);
  table.LimitTime("calendar of 100,000 crops", 20);
  table.Limit("calendar of 100,000 crops", "calendar of 10,000 crops", 12);
  table.LimitTime("read a library of 1,000 vegetations", 20);
  table.Run(argc, argv);
  return 0;
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) { return tervane::bench::Run(argc, argv); }
