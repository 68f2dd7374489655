// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <span>

#include "forms/page_rows.h"

namespace tervane {

class CSatZoneKvf;

/// The options of vertical discretization and the least thickness, on the page of the zone itself and on those of its
/// computational layers: with uniform layers, the latter are not in the tree. Gives the control of the options.
Control& DescribeVerticalDiscretization(PageForm& form, CSatZoneKvf& zone);

/// The page of the saturated zone.
std::span<const PageRow> SaturatedZonePages();

}  // namespace tervane
