// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Maps and charts of pages as drawings in SVG, for reports.
#pragma once

#include <optional>

#include "forms/plots.h"
#include "pages/report/report.h"

namespace tervane {

/// Nothing where the content has nothing to show.
std::optional<ReportPicture> DrawMap(const MapContent& content);
std::optional<ReportPicture> DrawChart(const SeriesContent& content);

/// A text as it stands in XML.
std::string XmlText(std::string_view text);
/// A colour, "#rrggbb".
std::string SvgColor(unsigned color);
/// A colour for each whole number, told apart side by side.
unsigned ReportColor(std::size_t number);
/// Borders of 4 to 9 classes of one width around these values, at numbers that people like.
std::vector<double> NiceBorders(double smallest, double largest, int most = 8);
/// A number with as many decimals as steps of that width need.
std::string NumberAt(double value, double step);

}  // namespace tervane
