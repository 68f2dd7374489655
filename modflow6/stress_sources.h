// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "modflow6/building.h"

namespace tervane::modflow6 {

/// What gives a boundary package entries: a segment, a zone, a well, a drain.
struct StressSource {
  bool varies = false;  ///< Its entries differ from period to period.
  std::function<FileResult(std::size_t period, std::vector<StressEntry>& entries)> add;
};

/// Fills a package; a period that is like the one before it holds no entries of its own.
FileResult Collect(const std::vector<StressSource>& sources, const FlowModel& model, StressPackage& package);

/// A source whose cells all follow a value over time: each its share of it.
StressSource FollowingCells(std::vector<StressEntry> entries, std::vector<double> means, std::vector<double> shares);

/// The place of a name in a package, which it enters.
std::uint16_t AddName(StressPackage& package, const std::string& name);

}  // namespace tervane::modflow6
