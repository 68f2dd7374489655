// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A setup under another climate: values and files in which each value is multiplied and shifted, month by month.
#pragma once

#include <array>
#include <string>
#include <vector>

#include "access/climate_inputs.h"
#include "platform/files.h"
#include "platform/progress.h"

namespace tervane {

/// What becomes of a value by the month in which it holds, January first: value * factor + shift, the shift in the base
/// unit of the quantity.
struct ClimateRule {
  std::array<double, 12> factor{1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1, 1};
  std::array<double, 12> shift{};

  bool ChangesNothing() const { return *this == ClimateRule(); }
  /// The same in all months.
  bool IsEven() const;
  bool operator==(const ClimateRule&) const = default;
};

/// Writes an item of a data file, changed by the rule, as a file of that item alone. A value over an interval belongs
/// to the month of the interval's middle. Sums since the start cannot be changed by month.
FileResult WriteChangedClimate(const std::string& from, int item, const ClimateRule& rule, int quantityItemType,
                               const std::string& to, ProgressPart progress = {});

/// A rule for each of `kClimateFamilies`.
using ClimateScenario = std::array<ClimateRule, kClimateFamilyCount>;

/// Changes the climate of a setup: constants in place, series and grids as new files in `folder`, which is made, and
/// which the setup then names. Files that are there are not replaced. `changes` gets a sentence for each. The reason
/// why it failed, or empty; then none of the new files is left, and the setup is not to be saved.
std::string ApplyClimateScenario(const CGlobal& root, const ClimateScenario& scenario, const std::string& folder,
                                 std::vector<std::string>& changes);

}  // namespace tervane
