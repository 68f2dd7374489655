// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The axes of a chart: time or a number, and values.
#pragma once

#include <QString>
#include <optional>

#include "forms/plots.h"

class QCPAxis;
class QCPRange;

namespace tervane {

/// Ticks at whole hours, days, months and years; or of numbers, also logarithmic.
void SetUpAxis(QCPAxis& axis, const std::optional<NumberAxis>& numbers);
/// The axis of values, beside the curves.
void SetUpValueAxis(QCPAxis& axis, bool isLogarithmic);
/// A range with room at both ends, by parts of its size as the axis shows it.
QCPRange WithRoom(const QCPAxis& axis, double below, double above);
/// Moves what is shown by a part of it.
void MoveAxis(QCPAxis& axis, double part);
/// The title of such an axis, "Suction [cm]"; empty for time.
QString AxisTitle(const std::optional<NumberAxis>& numbers);
/// What a user reads of a place on the axis: a date, or a number with its unit.
QString PlaceText(double place, const std::optional<NumberAxis>& numbers);
/// The place of a date, and the date of a place.
double AxisCoordinate(const CYbDateTime& time);
/// `perPixel` is the time between two pixels, in seconds: a date that is picked tells no more than that.
CYbDateTime DateAt(double place, double perPixel);

}  // namespace tervane
