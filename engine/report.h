// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The report of a preprocessor: a tree of pages, and behind it what other programs look up.
#pragma once

#include <string>
#include <utility>
#include <variant>
#include <vector>

#include "platform/dates.h"
#include "results/detailed_points.h"

namespace tervane {

/// What a page shows, as the report names it.
namespace report_kind {
inline constexpr const char* kNothing = "BLANK";
inline constexpr const char* kSeries = "NDS0_PLOT";
inline constexpr const char* kGrid = "NDS2_PLOT";
inline constexpr const char* kLayers = "NDS3_PLOT";
inline constexpr const char* kText = "TEXT";
inline constexpr const char* kShapes = "SHAPE_PLOT";
}  // namespace report_kind

/// A file that a page shows; written relative to the report.
struct ReportFile {
  std::string path;
};

/// A page and those below it.
struct ReportPage {
  std::string title;
  std::string abbreviatedTitle;  ///< For trees; may be empty.
  std::string kind = report_kind::kNothing;
  using Value = std::variant<int, std::string, ReportFile, CYbDateTime>;
  std::vector<std::pair<std::string, Value>> keys;
  std::vector<ReportPage> pages;

  /// Lines of text; they may hold line ends.
  void ShowText(const std::string& text);
  void ShowGrid(const std::string& path, int item);
  void ShowLayers(const std::string& path, int item);
  /// `axisUnit` is that of the coordinates, one of item 100187.
  void ShowShapes(const std::string& path, int axisUnit);
  void ShowSeries(const std::string& path, int item, const CYbDateTime& start, const CYbDateTime& end);
};

struct Report {
  ReportPage top;
  std::string topographyFile;  ///< Of the surface that the model uses; empty when the setup has none.
  int topographyItem = 0;
  std::string lowerLevelFile;  ///< Of the computational layers; empty when the setup has none.
  int lowerLevelItem = 0, numberOfLayers = 0;
  std::vector<DetailedPoint> detailedPoints;  ///< At which a simulation stores series.
};

/// Writes the report in one step. "" or why that failed; then an old report stands.
std::string WriteReport(const std::string& path, const Report& report);

}  // namespace tervane
