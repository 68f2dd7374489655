// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a quantity comes to over the cells of the domain, layer by layer. All are copies of values: another thread may
// add them up.
#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "core/node.h"
#include "platform/computation.h"
#include "spatial/cell_checks.h"
#include "spatial/domain_cells.h"

namespace tervane {

/// A quantity that takes part in a total; it counts in the base unit of its item type.
struct TotalledQuantity {
  CheckedQuantity quantity;
  int itemType = 0;
  /// Of a map of codes: what a code stands for. A code that is not there stands for nothing.
  std::map<int, KeyNumber<double>> valueOfCode = {};

  bool operator==(const TotalledQuantity&) const = default;
};
TotalledQuantity AskTotalled(CData2DKvf& quantity);

/// Bodies below each other: each ends at its level, the first begins at the ground. A level above the one before it
/// makes its body as thick as nothing.
struct TotalledBodies {
  TotalledQuantity ground;
  std::vector<TotalledQuantity> bottoms;

  bool operator==(const TotalledBodies&) const = default;
};

/// Sums over the cells, one for each layer. Without layers below ground the values of the cells are added, where they
/// hold for an area times that of the cell; with them a value is multiplied with the area of the cell, and with the
/// thickness of the layer in each body times the share that counts there.
struct CellTotals {
  struct Layer {
    std::string name;
    TotalledQuantity value;
    std::string problem;  ///< Why there is no total; empty where there is one.

    bool operator==(const Layer&) const = default;
  };

  std::string title;  ///< "Initial mass of Chloride".
  std::string unit;
  double factor = 1;  ///< From what is added up to the unit.
  DomainSource domain;
  std::vector<Layer> layers;
  std::size_t layer = 0;   ///< Whose page asks.
  bool isForArea = false;  ///< The values hold for a square metre.
  std::optional<TotalledBodies> levels;
  TotalledBodies bodies;
  std::vector<TotalledQuantity> shares;  ///< One for each body.
  std::string remark;                    ///< What is to be known of the sums; may be empty.

  bool operator==(const CellTotals&) const = default;
};

struct CellTotalsResult {
  struct Sum {
    double sum = 0;
    std::size_t unknown = 0;  ///< Cells of the domain that are left out, since something is not known there.
  };
  std::vector<Sum> layers;
  std::size_t cells = 0;
};
FileResult AddUpCells(const CellTotals& totals, ProgressPart progress, CellTotalsResult& result);

/// Who knows what a quantity comes to: a node above it.
class TotalsOfQuantities {
 public:
  virtual ~TotalsOfQuantities() = default;
  /// Nothing for a quantity of which a total says nothing.
  virtual std::optional<CellTotals> TotalsOf(CData2DKvf& quantity) const = 0;
};
/// The nearest one above a node; null where there is none.
const TotalsOfQuantities* TotalsAbove(const CYbSEKvfBase& node);

/// What was added up, in words, for the layer that asks and for all: "Initial mass of Chloride: 12.5 kg in Layer 1, 45
/// kg in all 3 layers."
std::string TotalsText(const CellTotals& totals, const CellTotalsResult& result);

}  // namespace tervane
