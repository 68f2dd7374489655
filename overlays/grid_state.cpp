// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "overlays/grid_state.h"

#include <fmt/format.h>

#include "core/kvf.h"
#include "geometry/cart.h"
#include "platform/files.h"
#include "platform/paths.h"

namespace tervane {

namespace {

void PutColor(KvfFile* file, const char* key, const OverlayColor& color) {
  kvfPutListParam(file, key, "iii", color.r, color.g, color.b);
}

void PutLayerFile(KvfFile* file, int kind, const FileName& name) {
  kvfAddKeyword(file, "ImageFileName");
  kvfAddInt(file, kind);
  kvfAddFilename(file, name.Absolute());
}

void PutImage(KvfFile* file, const COverlayBMPKvf& image) {
  PutLayerFile(file, 0, image.Filename);
  kvfPutParam(file, "AxisUnit", 0);
  kvfAddSection(file, "PROPERTIES");
  kvfPutParam(file, "Display", image.Display != 0);
  kvfPutParam(file, "wc_x0", image.BMP_X0);
  kvfPutParam(file, "wc_y0", image.BMP_Y0);
  kvfPutParam(file, "wc_x1", image.BMP_X1);
  kvfPutParam(file, "wc_y1", image.BMP_Y1);
  kvfPutParam(file, "DisplayStyle", image.BMP_DisplayStyle);
  const int color = image.BMP_TransparentColor;
  PutColor(file, "TransparentColor", {color & 0xff, color >> 8 & 0xff, color >> 16 & 0xff});
  kvfEndSection(file);
}

void PutShape(KvfFile* file, const COverlayShapeKvf& shape) {
  PutLayerFile(file, 1, shape.Filename);
  kvfAddString(file, shape.ItemDescr);
  kvfPutParam(file, "AxisUnit", shape.ShapeAxisUnit);
  kvfAddSection(file, "PROPERTIES");
  kvfAddSection(file, "Quarzel_Shape_Polygon_Object");
  kvfPutParam(file, "Base_Title", "Shape Polylines");
  kvfPutParam(file, "Base_Reg_Key", "");
  kvfPutParam(file, "Base_Col_Red", shape.LineColor.r);
  kvfPutParam(file, "Base_Col_Green", shape.LineColor.g);
  kvfPutParam(file, "Base_Col_Blue", shape.LineColor.b);
  kvfPutParam(file, "Base_Display_On", true);
  kvfPutParam(file, "Line_Thickness", shape.LineThickness);
  kvfPutParam(file, "Line_Style", shape.LineStyle);
  kvfPutParam(file, "Line_Polygon_Style", shape.PolygonStyle);
  kvfPutParam(file, "Draw_Text", shape.ShowLineText);
  kvfPutParam(file, "Text_Color_Style", shape.LineTextColorOption);
  PutColor(file, "Text_Color", shape.LineTextColor);
  kvfPutParam(file, "Text_Bk_Mode", shape.LineTextBackground);
  kvfEndSection(file);
  kvfPutParam(file, "Display", shape.Display != 0);
  kvfPutParam(file, "ConversionType", 2);
  kvfPutParam(file, "ProjectionType", "");
  kvfEndSection(file);
}

void PutRiver(KvfFile* file, const COverlayRiverKvf& river) {
  PutLayerFile(file, 3, river.FvrNwkFilename_Specified);
  kvfPutParam(file, "AxisUnit", 0);
  kvfAddSection(file, "PROPERTIES");
  kvfPutParam(file, "Display", river.Display != 0);
  kvfPutParam(file, "ConversionType", 2);
  kvfPutParam(file, "ProjectionType", CYbMapProjection::IDtoProjectionString(1));
  kvfPutParam(file, "DisplayType", 4);
  kvfPutParam(file, "MarkerSize", 0.2);
  kvfEndSection(file);
}

/// Each layer counts, also one of a kind that the file has no place for.
void PutLayers(KvfFile* file, const COverlayListKvf& list, int& counter) {
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    ++counter;
    const OverlayLayer* layer = list.GetItem(number)->Layer();
    const auto* river = dynamic_cast<const COverlayRiverKvf*>(layer);
    if (const auto* image = dynamic_cast<const COverlayBMPKvf*>(layer))
      PutImage(file, *image);
    else if (const auto* shape = dynamic_cast<const COverlayShapeKvf*>(layer))
      PutShape(file, *shape);
    else if (river && !river->LayerFile().IsEmpty())
      PutRiver(file, *river);
    else
      continue;
    kvfPutParam(file, "OverlayDrawingOrder", counter);
  }
}

bool HasShownLayer(const COverlayListKvf& list) {
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    const COverlayItemKvf& item = *list.GetItem(number);
    if (item.Type >= COverlayItemKvf::kImage && item.Type <= COverlayItemKvf::kRiver && item.Layer()->Display)
      return true;
  }
  return false;
}

}  // namespace

std::string PrepareGridState(const COverlaysKvf& overlays, const FileName& grid, std::optional<int> item, Host& host) {
  if (grid.IsEmpty()) {
    host.ShowMessage("Grid File Name is empty. Please select a Grid File or create a new Grid File before editing.",
                     Host::Icon::Warning);
    return {};
  }
  const std::string absolute = grid.Absolute();
  const std::string path = fmt::format("{}gsf", absolute.substr(0, absolute.size() - ExtensionOf(absolute).size() +
                                                                       (ExtensionOf(absolute).empty() ? 0 : 1)));
  if (FileExists(path) && host.Ask("Grid State File .gsf excist. Continue and overwrite excisting gsf file?.",
                                   Host::Icon::Question, Host::Buttons::YesNo) != Host::Answer::Yes)
    return {};

  KvfFile* file = kvfCreate();
  kvfAddTarget(file, "GRID_EDITOR");
  kvfAddSection(file, "GRID_DATA");
  kvfPutParamFilename(file, "FILE_NAME", absolute);
  if (item) kvfPutParam(file, "itemNo", *item);
  kvfEndSection(file);

  kvfAddSection(file, "IMAGE_FILES");
  int counter = -1;
  PutLayers(file, overlays.Background(), counter);
  const int behindBackground = ++counter;
  PutLayers(file, overlays.Foreground(), counter);
  ++counter;
  kvfEndSection(file);

  kvfAddSection(file, "GRID_EDIT_VIEW");
  kvfPutParam(file, "VIEW_TYPE", "CGridEditMapView");
  kvfPutParam(file, "View_Slice_Type", 0);
  const bool isShaded = HasShownLayer(overlays.Background());
  kvfPutParam(file, "View_Shading_Type", isShaded ? 1 : 0);
  if (isShaded) {
    kvfPutParam(file, "View_Box_Divider", 0);
    kvfPutParam(file, "View_Box_Transparency_Val", overlays.CurrentTransparency());
  }
  kvfPutListParam(file, "View_Overlay_Drawing_Order", "iiiii", behindBackground, counter, counter, counter, counter);
  kvfEndSection(file);
  kvfPutParam(file, "SelfDestruct", true);

  kvfWrite(file, path);
  const bool isWritten = kvfGetErrorGlb() == kKvfNoError;
  kvfClose(&file);
  return isWritten ? path : std::string();
}

}  // namespace tervane
