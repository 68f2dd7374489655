// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/decay_rate.h"

#include <numbers>

#include <fmt/format.h>

#include "platform/item_types.h"
#include "platform/units.h"

namespace tervane {

std::string DecayRateText(double halfLife) {
  const ItemType* quantity = FindItemType(quantity::kHalfLife);
  if (!(halfLife > 0) || !quantity) return {};
  return fmt::format("{:.6g} 1/{}", std::numbers::ln2 / halfLife, BaseUnit(*quantity).abbreviation);
}

}  // namespace tervane
