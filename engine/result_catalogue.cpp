// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "engine/result_catalogue.h"

#include "modelcells/model_layers.h"
#include "results/result_catalogue_file.h"

namespace tervane {

std::string WriteCatalogueOfInput(const std::string& path, const ModelGridFile& grids, const std::string& layersFile,
                                  const CTvn2DOrthoRotatedGridData& domain) {
  StoredItems stored;
  int number = 0;
  for (const ModelGrid& grid : grids.Grids())
    stored.items.push_back({"Input: " + grid.title, grids.Path(), ++number, 0, false});
  if (!layersFile.empty()) {
    stored.items.push_back({"Input: Lower levels of layers", layersFile, ModelLayers::kLowerLevels, 0, false});
    stored.items.push_back({"Input: Upper levels of layers", layersFile, ModelLayers::kUpperLevels, 0, false});
  }
  const Envelope extent = domain.GetEnvelope();
  stored.area = {extent.xMin, extent.yMin, extent.xMax, extent.yMax};
  stored.projection = domain.Geometry().projection;
  return WriteStoredItems(path, stored, "Tervane stand-in engine");
}

}  // namespace tervane
