// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a section shows, sampled along its line.
#pragma once

#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "forms/plots.h"
#include "geometry/grid_section.h"

namespace tervane {

/// Elevations in metres; NaN where there is none.
struct SectionProfile {
  /// What lies between the surface above and its own bottom. Where a bottom lies above its top, the layer has no
  /// thickness there, and layers below begin at that top.
  struct Band {
    std::string name;
    std::vector<double> top, bottom;
  };

  std::vector<SectionPoint> points;
  std::vector<double> ground;
  std::vector<Band> bands;  ///< From the top down.

  /// The lowest and highest elevation between two distances; nothing where there is none.
  std::optional<std::pair<double, double>> Range(double from, double to) const;
};

/// Samples at a step in metres. Elevations in a unit that is no length count as metres.
SectionProfile ProfileOf(const SectionContent& content, double step);
/// A step that shows each cell and makes no more points than a screen has use for.
double StepFor(const SectionContent& content);

}  // namespace tervane
