// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/river_map.h"

#include <algorithm>
#include <deque>

#include <fmt/format.h>

#include "libraries/river_network.h"
#include "platform/paths.h"

namespace tervane {

namespace {

using Lines = std::shared_ptr<const std::vector<MapLine>>;

Lines MakeLines(const RiverReading& reading) {
  auto lines = std::make_shared<std::vector<MapLine>>();
  for (const RiverBranch& branch : reading.network.branches) {
    MapLine& line = lines->emplace_back();
    line.name = branch.name;
    for (const RiverPoint& point : branch.points) {
      line.points.push_back(point.place);
      line.chainages.push_back(point.chainage);
    }
  }
  return lines;
}

/// The lines of a network are made once: a map asks for them after every change of its page.
Lines LinesOf(const std::shared_ptr<const RiverReading>& reading) {
  static std::deque<std::pair<std::shared_ptr<const RiverReading>, Lines>> recent;
  constexpr std::size_t kMost = 8;
  for (const auto& [known, lines] : recent)
    if (known == reading) return lines;
  recent.emplace_front(reading, MakeLines(*reading));
  if (recent.size() > kMost) recent.pop_back();
  return recent.front().second;
}

}  // namespace

LineLayer RiverLines(const FileName& file) {
  constexpr unsigned kRiverBlue = 0x1f5fa8;
  LineLayer layer;
  layer.lines = LinesOf(ReadRiverOnce(file.Absolute()));
  layer.withPoints = true;
  layer.lineColor = kRiverBlue;
  return layer;
}

void AddRiver(MapContent& map, const FileName& file) {
  LineLayer layer = RiverLines(file);
  if (!layer.lines->empty()) map.lines.push_back(std::move(layer));
}

std::string RiverFaults(const FileName& file) {
  const std::string path = file.Absolute();
  if (path.empty() || !WhyNotReadable(path).empty()) return {};
  const auto reading = ReadRiverOnce(path);
  if (!reading->problem.empty()) return reading->problem;
  constexpr std::size_t kMost = 3;
  std::string text;
  const std::string name(FileNameOf(reading->network.Path()));
  for (std::size_t i = 0; i < std::min(kMost, reading->findings.size()); ++i)
    text += fmt::format("{}{}", i > 0 ? "\n" : "", FindingText(name, reading->findings[i]));
  if (const std::size_t all = reading->findings.size(); all > kMost) text += fmt::format("\nand {} more", all - kMost);
  return text;
}

}  // namespace tervane
