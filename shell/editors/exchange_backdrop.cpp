// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/exchange_backdrop.h"

#include <string>
#include <utility>

namespace tervane {

namespace {

void AddGrids(const std::deque<CTvnDataExchangeGeoLayer>& layers, const std::string& kind,
              std::vector<BackdropLayer>& backdrop) {
  for (auto layer = layers.rbegin(); layer != layers.rend(); ++layer) {
    if (!layer->GridData || layer->GridData->Geometry().CellCount() == 0) continue;
    GridLayer grid{layer->GridData};
    grid.withLegend = false;
    backdrop.push_back({layer->Name.empty() ? kind : kind + ": " + layer->Name, std::move(grid)});
  }
}

}  // namespace

std::vector<BackdropLayer> ExchangeBackdrop(const CTvnFlowModelData& answer) {
  std::vector<BackdropLayer> backdrop;
  AddGrids(answer.CalculatedGeoLayers, "Computational Layer", backdrop);
  AddGrids(answer.LenseLayers, "Geological Lens", backdrop);
  AddGrids(answer.GeoLayers, "Geological Layer", backdrop);
  AddGrids(answer.Topography, "Topography", backdrop);
  if (answer.nx > 0 && answer.ny > 0 && answer.CellSize > 0) {
    const GridTransform transform(
        {answer.nx, answer.ny, answer.CellSize, answer.x0, answer.y0, answer.Rotation, answer.MapProjection});
    const double nx = answer.nx, ny = answer.ny;
    auto lines = std::make_shared<std::vector<MapLine>>(1);
    for (const MapPoint& corner : {MapPoint{0, 0}, {nx, 0}, {nx, ny}, {0, ny}, {0, 0}})
      lines->front().points.push_back(transform.ToWorld(corner));
    LineLayer border;
    border.lines = std::move(lines);
    border.withNames = false;
    backdrop.push_back({"Model Grid", std::move(border)});
  }
  return backdrop;
}

}  // namespace tervane
