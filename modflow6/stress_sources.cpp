// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "modflow6/stress_sources.h"

#include <algorithm>
#include <limits>

namespace tervane::modflow6 {

bool StressPackage::IsEmpty() const { return MostEntries() == 0; }

std::size_t StressPackage::MostEntries() const {
  std::size_t most = 0;
  for (const auto& [period, list] : entries) most = std::max(most, list.size());
  return most;
}

FileResult Collect(const std::vector<StressSource>& sources, const FlowModel& model, StressPackage& package) {
  const bool varies = std::ranges::any_of(sources, &StressSource::varies);
  const std::vector<StressEntry>* before = nullptr;
  for (std::size_t period = 0; period < (varies ? model.periods.size() : 1); ++period) {
    std::vector<StressEntry> entries;
    for (const StressSource& source : sources)
      if (FileResult added = source.add(period, entries); !added.Ok()) return added;
    const auto areSame = [](const StressEntry& a, const StressEntry& b) {
      return a.cell == b.cell && a.layer == b.layer && a.value == b.value && a.conductance == b.conductance;
    };
    if (before && std::ranges::equal(entries, *before, areSame)) continue;
    before = &(package.entries[period] = std::move(entries));
  }
  return {};
}

StressSource FollowingCells(std::vector<StressEntry> entries, std::vector<double> means, std::vector<double> shares) {
  const bool varies = std::ranges::adjacent_find(means, std::not_equal_to<>()) != means.end();
  return {varies, [entries = std::move(entries), means = std::move(means), shares = std::move(shares)](
                      std::size_t period, std::vector<StressEntry>& all) {
            for (std::size_t i = 0; i < entries.size(); ++i) {
              all.push_back(entries[i]);
              all.back().value = means[period] * (shares.empty() ? 1 : shares[i]);
            }
            return FileResult{};
          }};
}

std::uint16_t AddName(StressPackage& package, const std::string& name) {
  constexpr std::size_t kMost = std::numeric_limits<std::uint16_t>::max();
  // Names only help to read the file: beyond that many the last serves all.
  if (package.names.size() < kMost) package.names.push_back(name);
  return static_cast<std::uint16_t>(package.names.size() - 1);
}

}  // namespace tervane::modflow6
