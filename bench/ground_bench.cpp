// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Large well files, and sections and columns through many layers of large grids.
#include <cmath>
#include <string>
#include <vector>

#include <fmt/format.h>

#include "bench/median_table.h"
#include "forms/section_profile.h"
#include "libraries/wells.h"

namespace tervane::bench {

namespace {

constexpr int kWells = 20'000, kFilters = 50'000;
constexpr int kCells = 1000, kLayers = 20;

FileContent WellText() {
  std::string text = fmt::format("target WEL_CFG {{\n  section WELLDATA {{\n    NoWells = {}\n", kWells);
  int filters = 0;
  for (int i = 1; i <= kWells; ++i) {
    text += fmt::format(
        "    section Well_{} {{\n      Name = \"Well {}\"\n      X = {}.5\n      Y = {}.5\n      Level = 100.0\n"
        "      Depth = 80.0\n",
        i, i, i % 1000, i / 1000);
    const int count = i % 2 == 0 ? 2 : 3;
    for (int number = 1; number <= count; ++number, ++filters)
      text += fmt::format(
          "      section Filter_{} {{\n        Top = {}.0\n        Bottom = {}.0\n"
          "        TimeSeries = file \"series/pumping.nds0\", {}\n      }}\n",
          number, 90 - 20 * number, 80 - 20 * number, number);
    text += "    }\n";
  }
  if (filters != kFilters) fmt::print("there are {} filters\n", filters);
  return FileContent::Of(text + "  }\n}\n");
}

/// A hilly level at that depth, of 1 km x 1 km cells of a metre.
std::shared_ptr<const CTvn2DOrthoRotatedGridData> Hills(double depth) {
  std::vector<float> values(static_cast<std::size_t>(kCells) * kCells);
  for (int row = 0; row < kCells; ++row)
    for (int column = 0; column < kCells; ++column)
      values[static_cast<std::size_t>(row) * kCells + static_cast<std::size_t>(column)] =
          static_cast<float>(20 * std::sin(0.01 * column) * std::cos(0.013 * row) - depth);
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  if (const std::string error =
          grid->TakeValues({kCells, kCells, 1, 0, 0, 0, {}}, std::move(values), -1e30f, 1000, 100180);
      !error.empty())
    fmt::print("{}\n", error);
  return grid;
}

SectionContent Layers() {
  SectionContent section;
  section.ground = Level{Hills(0)};
  for (int i = 1; i <= kLayers; ++i) section.surfaces.push_back({fmt::format("Layer {}", i), {Hills(5 * i)}});
  section.line = {{10, 10}, {500, 900}, {990, 20}};
  section.minimumThickness = 0.5;
  return section;
}

int Run(int argc, char** argv) {
  const FileContent wells = WellText();
  const SectionContent section = Layers();
  fmt::print("{} wells with {} filters in {} bytes; {} layers of {} x {} cells\n", kWells, kFilters, wells.size,
             kLayers, kCells, kCells);
  MedianTable table(11);
  table.Add("read 20,000 wells", [&] {
    Library library(kWellLibrary);
    if (const std::string error = ParseLibrary(wells, "large.WEL", library); !error.empty()) fmt::print("{}\n", error);
    return WellsOf(library);
  });
  table.Add("section through 20 layers", [&] { return ProfileOf(section, StepFor(section)); });
  table.Add("column through 20 layers", [&] {
    SectionContent column = section;
    column.line = {{500, 500}, {500.001, 500}};
    return ProfileOf(column, 1);
  });
  table.LimitTime("read 20,000 wells", 300);
  // What is moved follows the pointer at 30 pictures a second.
  table.LimitTime("section through 20 layers", 33);
  table.LimitTime("column through 20 layers", 10);
  table.Run(argc, argv);
  return 0;
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) { return tervane::bench::Run(argc, argv); }
