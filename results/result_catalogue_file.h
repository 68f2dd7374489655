// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What runs leave: the gridded items that their catalogue files (.tvdres, .TvdWQres) name.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "core/node.h"
#include "geometry/cart.h"
#include "simspec/model_components.h"

namespace tervane {

/// An item of a result file.
struct StoredItem {
  std::string name;
  std::string path;
  int item = 0;                 ///< Its number in the file.
  int dataType = 0;             ///< Its code in the catalogue of result types.
  bool mayHaveVectors = false;  ///< Flow can be drawn over it.

  bool operator==(const StoredItem&) const = default;
};

/// The items of one or two catalogue files, with the area of the model.
struct StoredItems {
  static constexpr int kFlowInX = 102, kFlowInY = 103;

  std::vector<StoredItem> items;
  DataArea area{0, 0, 100.0, 100.0};
  std::string projection = CYbMapProjection::IDtoProjectionString(1);

  /// The first item of that type; null when there is none.
  const StoredItem* FirstOf(int dataType) const;
};

/// Reads a catalogue file behind what is there already, or in its place. An empty name or a missing file adds nothing.
/// "" or why nothing of the file was taken.
std::string ReadStoredItems(const std::string& path, bool clears, StoredItems& stored);

/// Writes items as a catalogue file, for an engine of that name. A catalogue of another engine is not replaced. "" or
/// why nothing was written.
std::string WriteStoredItems(const std::string& path, const StoredItems& stored, const std::string& engine);

/// The catalogue files beside a setup.
struct CatalogueFiles {
  std::string simulation, waterQuality;
};
/// Reads the catalogues of a setup: that of its flow, or of the flow that its water quality uses, and with water
/// quality that of its own. The items of a catalogue that cannot be read are missing; `problems` tells why, with its
/// path.
struct CatalogueProblem {
  std::string path, text;

  bool operator==(const CatalogueProblem&) const = default;
};
StoredItems ReadCatalogues(const CModelCompKvf& components, const CatalogueFiles& files,
                           std::vector<CatalogueProblem>& problems);

}  // namespace tervane
