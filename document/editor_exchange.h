// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What other editors of the program are told of a setup while they edit one of its files: where the model lies, its
// geology and the layers of its maps.
#pragma once

#include <deque>
#include <memory>
#include <string>
#include <string_view>

#include "core/host.h"
#include "core/message.h"
#include "geometry/grid.h"

namespace tervane {

class CFlowModelDoc;

/// A level or an extent: a grid, or one value everywhere.
struct CTvnDataExchangeGeoLayer {
  std::string Name;
  std::shared_ptr<const CTvn2DOrthoRotatedGridData> GridData;
  float FixedValue = 0;
  int RelativeToGround = 0;
};

/// A layer of maps; what its kind does not use stays at its default. Colours have red in the low byte.
struct CTvnDataExchangeOverlay {
  int Type = 0;  ///< 1 image, 2 grid, 3 shape.
  std::string BMPFilename;
  int BMPDisplayStyle = 0;
  int BMPX0 = 0, BMPX1 = 0, BMPY0 = 0, BMPY1 = 0;
  unsigned BMPTransparentColor = 0;
  std::string GridFilename;
  float GridTransparency = 0;
  int GridItemnumber = 0;
  std::string ShapeFilename;
  int ShapePointStyle = 0, ShapePointType = 0, ShapePolygonStyle = 0, ShapeLineStyle = 0;
  float ShapePointSize = 0, ShapeLineThickness = 0;
  unsigned ShapePointColor = 0, ShapeLineColor = 0;
};

/// What a request is filled with. The lists grow as they are filled, and what they gave stays where it is.
struct CTvnFlowModelData {
  double x0 = 0, y0 = 0, CellSize = 0;
  int nx = 0, ny = 0;
  std::string MapProjection;
  double Rotation = 0;
  int FractureWell = 0;

  std::deque<CTvnDataExchangeGeoLayer> Topography, GeoLayers, LenseLayers, CalculatedTopography, CalculatedGeoLayers;
  std::deque<CTvnDataExchangeOverlay> ForegroundOverlays, BackgroundOverlays;
};

/// Does what a message to the frame of a setup asks for, and sends the answer. A request for layers or the domain is
/// answered once after a page has handed a file over for which they are wanted. False for a message of another kind.
bool AnswerEditor(CFlowModelDoc& document, const Message& message, Host& host);

}  // namespace tervane
