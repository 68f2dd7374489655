// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Two setups with very many items are merged. The peer is the reading of the three texts, without which nothing can be
// merged; twice the items tell whether it is linear.
#include <string>

#include <fmt/format.h>

#include "bench/desktop_figures.h"
#include "core/kvf_parser.h"
#include "document/three_way_merge.h"

namespace tervane::bench {

namespace {

/// A list of items of which some have another value, and some stand behind.
std::string SetupWith(int items, int changedEvery, const std::string& added) {
  std::string text =
      "target TERVANE_FLOWMODEL {\n  section FlowModelDocVersion {\n    Version = 14\n  }\n  section List {\n";
  text += fmt::format("    YbSEKvfListItemCount = {}\n", added.empty() ? items : items + 1);
  for (int number = 1; number <= items; ++number)
    text +=
        fmt::format("    section Item_{} {{\n      Name = \"item {}\"\n      Value = {}.5\n      Type = 2\n    }}\n",
                    number, number, number % changedEvery == 0 ? -number : number);
  if (!added.empty()) text += fmt::format("    section Item_{} {{\n      Name = \"{}\"\n    }}\n", items + 1, added);
  return text + "  }\n}\n";
}

struct Sides {
  KvfFile base, mine, theirs;

  explicit Sides(int items) {
    const auto parse = [](const std::string& text, KvfFile& file) {
      if (!ParseKvf(FileContent::Of(text), file)) fmt::print("{}\n", file.syntaxError.message);
    };
    parse(SetupWith(items, items + 1, ""), base);
    parse(SetupWith(items, 7, "mine"), mine);
    parse(SetupWith(items, 11, "theirs"), theirs);
  }
};

void Measure(int items, double limit) {
  const double reading = MedianOf([&] { const Sides sides(items); });
  Sides sides(items);
  std::size_t conflicts = 0;
  const double merging = MedianOf([&] {
    KvfFile merged;
    conflicts = MergeSetups(sides.base, sides.mine, sides.theirs, merged).conflicts.size();
  });
  Report(fmt::format("merging {} items ({} conflicts)", items, conflicts), merging, limit, "ms");
  ReportPeer("  reading the three texts", reading, "ms");
}

}  // namespace

}  // namespace tervane::bench

int main() {
  tervane::bench::Measure(50'000, 500);
  tervane::bench::Measure(100'000, 1000);
}
