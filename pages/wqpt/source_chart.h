// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The water quality sources of a setup over the time of its simulation.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "forms/plots.h"
#include "wqpt/sources.h"

namespace tervane {

/// A source as the chart draws it: what holds all the time, or values over time in the base unit of their quantity.
struct DrawnSource {
  std::string name;
  int itemType = 0;
  double constant = 0;
  std::shared_ptr<const Series> series = nullptr;  ///< Null for a constant.
  int unit = 0;                                    ///< In which the series is; a unit key.

  bool operator==(const DrawnSource&) const = default;
};

/// Sums of the mass of all sources, one for each quantity; each holds over the interval that ends at its time. A source
/// gives nothing outside the time of its values. What cannot be added is told in `left`: masses of steps that differ.
std::vector<Series> SumsOfMass(const std::vector<DrawnSource>& sources, const CYbDateTime& start,
                               const CYbDateTime& end, std::vector<std::string>& left);

/// The chart of a page, which keeps its sums until a source has changed.
class SourceChart {
 public:
  /// Each source as a bar, below it the sums of mass and the concentrations.
  SeriesContent Content(const CSourcesWQListKvf& list);
  /// What is not among the curves, and why: as of the latest content.
  const std::vector<std::string>& Left() const { return left_; }

 private:
  std::vector<DrawnSource> drawn_;
  CYbDateTime start_, end_;
  std::vector<Series> sums_;
  std::vector<std::string> left_, leftOfSums_;
};

}  // namespace tervane
