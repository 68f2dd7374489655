// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "geometry/grid.h"
#include "modelcells/model_grids.h"

namespace tervane {

/// Names the quantities that were put on the cells of a model, and the levels of its layers where that file is told, in
/// a catalogue, so that they are listed among the results. None of them is a result of a simulation. "" or why not.
std::string WriteCatalogueOfInput(const std::string& path, const ModelGridFile& grids, const std::string& layersFile,
                                  const CTvn2DOrthoRotatedGridData& domain);

}  // namespace tervane
