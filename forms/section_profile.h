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
    std::vector<double> crossing = {};  ///< The bottom where it was meant to lie above the top; else NaN.
    std::vector<double> thin = {};      ///< The bottom where the layer is thinner than it should be; else NaN.
  };
  struct Lens {
    std::string name;
    std::vector<double> top, bottom;  ///< NaN where the lens is not.
  };
  struct Curve {
    std::string name;
    std::vector<double> heights;
  };
  /// A screen near the line, at the nearest point of it.
  struct Screen {
    std::string name;
    double distance, top, bottom;
  };

  std::vector<SectionPoint> points;
  std::vector<double> ground;
  std::vector<Band> bands;  ///< From the top down.
  std::vector<Lens> lenses;
  std::vector<Curve> curves;
  std::vector<Screen> screens;  ///< From the start of the line on.

  /// The lowest and highest elevation between two distances; nothing where there is none.
  std::optional<std::pair<double, double>> Range(double from, double to) const;
};

/// Samples at a step in metres. Elevations in a unit that is no length count as metres.
SectionProfile ProfileOf(const SectionContent& content, double step);
/// The same at any places, whatever line was drawn, and without screens.
SectionProfile ProfileAt(const SectionContent& content, std::vector<SectionPoint> points);
/// The profile as a table in metres: a row of heads, and one for each sample; cells without a value are empty.
std::vector<std::vector<std::string>> SectionRows(const SectionProfile& profile);
/// A step that shows each cell and makes no more points than a screen has use for.
double StepFor(const SectionContent& content);

}  // namespace tervane
