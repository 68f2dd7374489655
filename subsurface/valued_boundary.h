// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <functional>

#include "spatial/file_nodes.h"

namespace tervane {

/// What a boundary has wherever it lies: its kind, and a value that is kept, constant, or taken from a file. For a node
/// to derive from.
class ValuedBoundary {
 public:
  /// How the value is given, `Type`.
  enum Value : int { kInitialValue = 0, kConstant = 1, kSeries = 2, kGridSeries = 3 };

  float FixedValue = 0;
  int BoundaryType = 0;
  int Type = kInitialValue;

  CFMData0DFile& SeriesFile() const { return *seriesFile_; }
  CFMData2DNdsFile& GridFile() const { return *gridFile_; }

 protected:
  /// Makes the two files as children of the node, of a quantity that the kind decides. The conditions say which kinds
  /// of boundaries take one.
  void MakeFiles(CYbSEKvfBase& node, const std::function<int()>& itemType, const Condition& mayBeSeries,
                 const Condition& mayBeGrid);

 private:
  CFMData0DFile* seriesFile_ = nullptr;
  CFMData2DNdsFile* gridFile_ = nullptr;
};

}  // namespace tervane
