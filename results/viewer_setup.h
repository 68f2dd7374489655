// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Setup files of the result viewer (.REV): a result with its palette between the layers of the backdrop, and flow
// vectors.
#pragma once

#include <string>

#include "overlays/overlays.h"
#include "platform/units.h"
#include "results/result_catalogue_file.h"

namespace tervane {

/// Where the setup file of an item stands in the result folder, with `\\` behind the folder, as the engines write
/// paths. Characters that names of files cannot have vanish, so that two items may share one.
std::string ViewerSetupFile(const std::string& resultFolder, const std::string& itemName);

struct ViewerSetup {
  const StoredItems& stored;
  const StoredItem& shown;
  bool withVectors = false;
  int layer = 1;  ///< From the top.
  const COverlaysKvf& overlays;
  const DisplayUnits& units;
};

/// Writes a setup file, in one step. "" or why it could not be written.
std::string WriteViewerSetup(const std::string& path, const ViewerSetup& setup);

}  // namespace tervane
