// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What nodes want held against each other in each cell of the domain: levels that are to lie in order, heads below the
// ground, codes that something else must know. All are copies of values: another thread looks.
#pragma once

#include <string>
#include <vector>

#include "core/node.h"
#include "geometry/level.h"
#include "platform/progress.h"
#include "spatial/data_use.h"

namespace tervane {

class CData2DKvf;

/// A quantity that is to be looked at, with its name in what is told.
struct CheckedQuantity {
  std::string name;
  GridSource source = {};
  KeyNumber<float> value = 0;  ///< Where it is uniform.
  bool isUniform = true;
  bool isAboveGround = false;
  std::shared_ptr<ComputedGrid> grid = {};  ///< Where the node keeps it.

  bool operator==(const CheckedQuantity&) const = default;
};
/// A quantity as its node tells it.
CheckedQuantity AskQuantity(std::string name, CData2DKvf& quantity);

/// A place that is to lie above a level.
struct CheckedPlace {
  std::string name;
  MapPoint place;
  KeyNumber<double> height = 0;  ///< An elevation in metres.

  bool operator==(const CheckedPlace&) const = default;
};

struct CellCheck {
  enum class Kind {
    LevelsDescend,    ///< Each level lies at or below the one before it, the first below the ground.
    BelowGround,      ///< Each level lies at or below the ground.
    CodesKnown,       ///< Each quantity holds only those codes.
    PlacesAboveLevel  ///< Each place lies above the last level.
  };

  Kind kind = Kind::LevelsDescend;
  CheckedQuantity ground = {};
  std::vector<CheckedQuantity> quantities = {};
  std::vector<int> codes = {};
  std::vector<CheckedPlace> places = {};

  bool operator==(const CellCheck&) const = default;
};

/// A node that has such wishes.
class CellChecker {
 public:
  virtual ~CellChecker() = default;
  virtual std::vector<CellCheck> CurrentChecks() const = 0;
};

/// What is wrong in the cells of the domain: "Moraine lies above Alluvium in 12 of 5285 cells (0.2 %)".
std::vector<Finding> FindingsInCells(const CellCheck& check, const CTvn2DOrthoRotatedGridData& domain,
                                     ProgressPart progress = {});

}  // namespace tervane
