// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "platform/dates.h"

namespace tervane {

/// Days since 1899-12-30 00:00, as other programs of the house pass dates. The whole days of a date before that count
/// backward, and its time of the day forward: -1.25 is six o'clock on 1899-12-29.
double OleDateOf(const CYbDateTime& date);
/// To the second; not valid for a number that is none, or far from every date.
CYbDateTime FromOleDate(double days);

}  // namespace tervane
