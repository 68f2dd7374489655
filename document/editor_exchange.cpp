// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/editor_exchange.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <utility>

#include <fmt/format.h>

#include "core/open_kvf.h"
#include "data/grid_files.h"
#include "document/flow_model_document.h"
#include "overlays/overlay_walk.h"
#include "platform/paths.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "subsurface/geology.h"
#include "subsurface/ground_properties.h"
#include "subsurface/wells.h"

namespace tervane {

namespace {

using Layers = std::deque<CTvnDataExchangeGeoLayer>;

/// Adds a layer with the grid of a quantity, or its value where it is uniform.
CTvnDataExchangeGeoLayer& AddLayer(Layers& layers, CData2DKvf& quantity) {
  CTvnDataExchangeGeoLayer& layer = layers.emplace_back();
  if (quantity.Type != CData2DKvf::kUniform)
    layer.GridData = quantity.GetGridData();
  else
    layer.FixedValue = quantity.FixedValue;
  return layer;
}

void AddGeology(CFlowModelDoc& document, CTvnFlowModelData& data) {
  const CYbSEKvfBase& root = document.Root();
  if (auto* topography = root.Important(kTopography)) AddLayer(data.Topography, *topography);
  if (const auto* layers = root.Important(kGeologicalLayers)) {
    for (int number = 1; number <= layers->GetItemCount(); ++number) {
      CYbSEKvfBase& item = *layers->GetItem(number);
      CData2DKvf& level = *PropertyOf(item, "LowerLevel");
      CTvnDataExchangeGeoLayer& layer = AddLayer(data.GeoLayers, level);
      layer.RelativeToGround = level.RelativeToGround;
      layer.Name = item.GetTitle();
    }
  }
  const auto* lenses = root.Important(kGeologicalLenses);
  for (int number = 1; lenses && number <= lenses->GetItemCount(); ++number) {
    CYbSEKvfBase& item = *lenses->GetItem(number);
    for (const char* section : {"HorBoundary", "UpperLevel", "LowerLevel"}) {
      CData2DKvf& part = *PropertyOf(item, section);
      CTvnDataExchangeGeoLayer& layer = AddLayer(data.LenseLayers, part);
      layer.Name = item.GetTitle();
      if (part.HasRelativeToGround()) layer.RelativeToGround = part.RelativeToGround;
    }
  }
}

/// A grid that the preprocessor has made; null where it cannot be read.
std::shared_ptr<const CTvn2DOrthoRotatedGridData> ReadMadeGrid(KvfNode* section, int layer) {
  std::string path;
  int item = 0;
  if (!kvfGetParamFilename(section, "Filename", &path, 1, 1) || !kvfGetParam(section, "ItemNo", &item, 1, 1)) return {};
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  return ReadGridData(path, item, *grid, {}, {0, layer}).Ok() ? grid : nullptr;
}

void AddCalculatedLayers(const CFlowModelDoc& document, CTvnFlowModelData& data, Host& host) {
  if (document.PathName().empty()) return;
  const std::string path = ResolvedPath(document.PreprocessorReport(), {});
  if (!FileExists(path)) return;
  kvfGetErrorGlb();  // what an earlier reader left
  const OpenKvf file(kvfLoadFile(path, 1));
  if (const int error = kvfGetErrorGlb(); error != kKvfNoError) {
    if (error != kKvfSyntaxError) return;
    host.ShowMessage(kvfErrorText(), Host::Icon::Error);
    host.ShowMessage("Syntax error in file :\n" + path, Host::Icon::Error);
    return;
  }
  KvfNode* extra = kvfTargetByNameNum(file.get(), "Extra_Data", 1);
  auto topography = ReadMadeGrid(kvfSectionByNameNum(extra, "Topography", 1), 0);
  if (!topography) return;
  data.CalculatedTopography.emplace_back().GridData = std::move(topography);
  KvfNode* levels = kvfSectionByNameNum(extra, "LowerLevel", 1);
  int isIncluded = 0, count = 0;
  kvfGetParam(levels, "SZ_Included", &isIncluded, 1, 1);
  kvfGetParam(levels, "NumberOfLayers", &count, 1, 1);
  if (!isIncluded) return;
  // From the top down; the file counts its layers from the bottom.
  for (int layer = count - 1; layer >= 0; --layer) {
    auto level = ReadMadeGrid(levels, layer);
    if (!level) return;
    data.CalculatedGeoLayers.emplace_back().GridData = std::move(level);
  }
}

unsigned HostColor(const OverlayColor& color) {
  const auto part = [](int value) { return static_cast<unsigned>(std::clamp(value, 0, 255)); };
  return part(color.r) | part(color.g) << 8 | part(color.b) << 16;
}

int Rounded(double value) {
  constexpr double kMost = std::numeric_limits<int>::max();
  return std::isfinite(value) ? static_cast<int>(std::clamp(std::round(value), -kMost, kMost)) : 0;
}

std::string PathOfLayer(const FileName& file) { return file.IsEmpty() ? std::string() : file.Absolute(); }

void AddOverlays(const COverlayListKvf& list, std::deque<CTvnDataExchangeOverlay>& overlays) {
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    const OverlayLayer* layer = list.GetItem(number)->Layer();
    if (!layer || !layer->Display) continue;
    CTvnDataExchangeOverlay overlay;
    overlay.Type = list.GetItem(number)->Type;
    if (const auto* image = dynamic_cast<const COverlayBMPKvf*>(layer)) {
      overlay.BMPFilename = PathOfLayer(image->Filename);
      overlay.BMPDisplayStyle = image->BMP_DisplayStyle;
      overlay.BMPX0 = Rounded(image->BMP_X0);
      overlay.BMPX1 = Rounded(image->BMP_X1);
      overlay.BMPY0 = Rounded(image->BMP_Y0);
      overlay.BMPY1 = Rounded(image->BMP_Y1);
      overlay.BMPTransparentColor = static_cast<unsigned>(image->BMP_TransparentColor);
    } else if (const auto* grid = dynamic_cast<const COverlayGridKvf*>(layer)) {
      overlay.GridFilename = PathOfLayer(grid->LayerFile());
      overlay.GridTransparency = grid->Transparency;
      overlay.GridItemnumber = grid->GridFile().SelectedItem();
    } else if (const auto* shape = dynamic_cast<const COverlayShapeKvf*>(layer)) {
      overlay.ShapeFilename = PathOfLayer(shape->Filename);
      overlay.ShapePointStyle = shape->PointStyle;
      overlay.ShapePointType = shape->PointType;
      overlay.ShapePolygonStyle = shape->PolygonStyle;
      overlay.ShapeLineStyle = shape->LineStyle;
      overlay.ShapePointSize = shape->PointSize;
      overlay.ShapeLineThickness = shape->LineThickness;
      overlay.ShapePointColor = HostColor(shape->PointColor);
      overlay.ShapeLineColor = HostColor(shape->LineColor);
    } else {
      continue;
    }
    overlays.push_back(std::move(overlay));
  }
}

/// Adds the layers of maps, and sends what is filled now.
void SendWithOverlays(const CFlowModelDoc& document, CTvnFlowModelData& data, int answer, Host& host) {
  if (const auto* list = document.Root().Important(kForegroundOverlays)) AddOverlays(*list, data.ForegroundOverlays);
  if (const auto* list = document.Root().Important(kBackgroundOverlays)) AddOverlays(*list, data.BackgroundOverlays);
  host.Send({kFrameMessage, answer, &data});
}

void SendLayers(CFlowModelDoc& document, CTvnFlowModelData& data, Host& host) {
  AddGeology(document, data);
  AddCalculatedLayers(document, data, host);
  data.FractureWell = FractureWellsInUse(document.Root());
  SendWithOverlays(document, data, kLayers, host);
}

void SendDomain(const CFlowModelDoc& document, CTvnFlowModelData& data, Host& host) {
  if (const auto* domain = document.Root().Important(kDomain)) {
    const GridGeometry geometry = domain->GetModelGeometry();
    data.x0 = geometry.x0;
    data.y0 = geometry.y0;
    data.CellSize = geometry.cellSize;
    data.nx = geometry.nx;
    data.ny = geometry.ny;
    data.MapProjection = geometry.projection;
    data.Rotation = geometry.rotation;
  }
  SendWithOverlays(document, data, kDomainData, host);
}

void SendOverlayList(const CFlowModelDoc& document, MessageReceiver& window) {
  const OpenKvf file(kvfCreate());
  kvfAddTarget(file.get(), "FLUVANE_Network_Editor");
  kvfAddSection(file.get(), "LAYER_FILES");
  int counter = 0;
  for (const COverlayListKvf* list :
       {document.Root().Important(kBackgroundOverlays), document.Root().Important(kForegroundOverlays)})
    if (list) WriteOverlays(file.get(), *list, kNetworkEditorForm, counter);
  kvfEndSection(file.get());
  kvfEndSection(file.get());
  window.Receive({kFrameMessage, kOverlayList, file.get()});
}

}  // namespace

bool AnswerEditor(CFlowModelDoc& document, const Message& message, Host& host) {
  if (message.name != kFrameMessage) return false;
  auto* const* data = std::get_if<CTvnFlowModelData*>(&message.lParam);
  auto* const* window = std::get_if<MessageReceiver*>(&message.lParam);
  EditorRequests& requests = document.Global().Requests;
  switch (message.wParam) {
    case kAskLayers:
      if (data && *data && std::exchange(requests.layers, false)) SendLayers(document, **data, host);
      return true;
    case kAskOverlayList:
      if (window && *window) SendOverlayList(document, **window);
      return true;
    case kAskDomain:
      if (data && *data && std::exchange(requests.domain, false)) SendDomain(document, **data, host);
      return true;
    default:
      return false;
  }
}

}  // namespace tervane
