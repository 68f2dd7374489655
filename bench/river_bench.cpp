// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// River networks of a country: making one of mapped lines, and reading one.
#include <cmath>
#include <string>
#include <vector>

#include <fmt/format.h>

#include "bench/desktop_figures.h"
#include "libraries/river_import.h"

namespace tervane::bench {

namespace {

/// A tree of rivers: each line of a level ends in a line of the level below it, in its middle or where it begins.
CTvnShapeData MappedRivers(int count, int pointsOfEach) {
  CTvnShapeData shapes;
  shapes.Create(ShapeKind::Line, {{"NAME", AttributeKind::Text}}, {});
  const int side = static_cast<int>(std::sqrt(count));
  for (int number = 0; number < count; ++number) {
    const double x = 1000.0 * (number % side), y = 1000.0 * (number / side);
    Shape line;
    for (int i = 0; i < pointsOfEach; ++i) {
      const double along = static_cast<double>(i) / (pointsOfEach - 1);
      // From the north to the south; every third swings into its neighbour's middle.
      const double sway = number % 3 == 0 ? 1000 * along * along : 0;
      line.points.push_back(
          {x + sway + 20 * std::sin(9 * along) * (1 - along), y + 1000 - (sway > 0 ? 500 : 1000) * along});
    }
    line.parts = {0};
    line.values = {fmt::format("River {}", number)};
    shapes.AddShape(std::move(line));
  }
  return shapes;
}

int Run() {
  constexpr int kLines = 10'000;
  const CTvnShapeData shapes = MappedRivers(kLines, 10);
  RiverImport import;
  Report("10,000 lines of 10 points made a network", MedianOf([&] { import = BranchesOfLines(shapes, {}); }), 1000,
         "ms");
  fmt::print("{} branches, {} ends joined, {} warnings\n", import.branches.size(), import.junctions,
             import.warnings.size());
  CYbSimpleRiverData network = CYbSimpleRiverData::Empty({});
  network.TakeBranches(std::move(import.branches));
  std::string error, text;
  Report("100,000 points as the text of a network", MedianOf([&] { text = network.NetworkText(error); }), 500, "ms");
  const FileContent content = FileContent::Of(text);
  Report("the same read and checked", MedianOf([&] {
           CYbSimpleRiverData read;
           error = read.ParseNetwork(content, "bench.fvnwk");
           if (!error.empty() || read.Findings().size() > static_cast<std::size_t>(kLines)) fmt::print("WRONG\n");
         }),
         300, "ms");
  return 0;
}

}  // namespace

}  // namespace tervane::bench

int main() { return tervane::bench::Run(); }
