// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <vector>

#include "forms/page.h"
#include "subsurface/valued_boundary.h"

namespace tervane {

/// How the value of a boundary is given: the file holds the number.
inline constexpr const char* kBoundaryValueTypes[] = {"Fixed (Use initial value)", "Fixed (Specified)",
                                                      "Time varying (.nds0)", "Time varying (.nds2)"};

/// The value of a boundary on its page: how it is given, the number, or the file. What is offered and what it is called
/// follows the kind of boundary.
struct BoundaryValue {
  /// Of some kinds of boundaries.
  struct Words {
    std::vector<int> boundaries;
    int first, last;  ///< The ways that are offered; where the first one is missing the second one is "Constant".
    std::string value;
    std::string series;
  };

  ValuedBoundary& boundary;
  std::function<int()> itemType;
  std::string typeLabel;
  const char* gridFilter;
  std::vector<Words> words;
};

/// Its controls. The grid file is edited on the setup's backdrop.
void DescribeBoundaryValue(PageForm& form, const CYbSEDlgBase& page, const BoundaryValue& told);
/// The chart of its series, over the simulation's period, while there is one.
void ChartOfBoundary(PageForm& form, const BoundaryValue& told);

}  // namespace tervane
