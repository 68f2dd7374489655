// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "forms/page.h"
#include "forms/table_of.h"
#include "surface/crop_list.h"

namespace tervane {

/// The table of a sequence of crops.
std::shared_ptr<TableOf<CVegetationItemKvf>> CVegetationGrid(CVegetationListKvf& crops, const CYbSEDlgBase& page);

}  // namespace tervane
