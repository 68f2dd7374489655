// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Where the values of a series stand on the horizontal axis of a chart.
#pragma once

#include <cstddef>
#include <optional>
#include <utility>

#include <qcustomplot.h>

#include "forms/plots.h"

namespace tervane {

std::size_t PlaceCount(const Series& series);
/// On the horizontal axis; NaN where a value has no place.
double ValueCoordinate(const Series& series, std::size_t number);
/// From the first to the last place of a value; nothing without one.
std::optional<std::pair<double, double>> PlacesOf(const SeriesContent& content);
/// The points of a curve. A logarithmic axis has no place for what is not above 0: there it has a gap, or no point
/// where that is the horizontal one.
QSharedPointer<QCPGraphDataContainer> PointsOf(const Series& series, bool hasLogarithmicPlaces,
                                               bool hasLogarithmicValues);

}  // namespace tervane
