// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "overlays/overlay_walk.h"

#include <fmt/format.h>

#include "geometry/cart.h"

namespace tervane {

const OverlayFileForm kGridStateForm{.nameKey = "ImageFileName",
                                     .imageKind = 0,
                                     .shapeKind = 1,
                                     .riverKind = 3,
                                     .countsEvery = true,
                                     .tellsDisplay = true,
                                     .imagesHaveUnit = true,
                                     .tellsPlacement = true,
                                     .attribute = OverlayFileForm::Attribute::Always,
                                     .imageCornerPrefix = "wc_",
                                     .lineTitle = "Shape Polylines"};
const OverlayFileForm kResultViewerForm{.nameKey = "DataFileName",
                                        .imageKind = 2,
                                        .shapeKind = 3,
                                        .fromLast = true,
                                        .attribute = OverlayFileForm::Attribute::WhenGiven,
                                        .imageCornerPrefix = "",
                                        .lineTitle = "",
                                        .hasPoints = true,
                                        .hasTwoBackgrounds = true};
const OverlayFileForm kNetworkEditorForm{.nameKey = "DataFileName",
                                         .imageKind = 0,
                                         .shapeKind = 1,
                                         .imagesHaveUnit = true,
                                         .imageCornerPrefix = "",
                                         .lineTitle = "",
                                         .joinsTexts = true};

namespace {

/// Writes one layer, without the end of its properties.
class LayerWriter {
 public:
  LayerWriter(KvfFile* file, const OverlayFileForm& form) : file_(file), form_(form) {}

  /// False, with nothing written, for a layer that the file has no place for.
  bool Write(const OverlayLayer& layer) const {
    const auto* river = dynamic_cast<const COverlayRiverKvf*>(&layer);
    if (const auto* image = dynamic_cast<const COverlayBMPKvf*>(&layer); image && form_.imageKind >= 0)
      PutImage(*image);
    else if (const auto* shape = dynamic_cast<const COverlayShapeKvf*>(&layer); shape && form_.shapeKind >= 0)
      PutShape(*shape);
    else if (river && form_.riverKind >= 0 && !river->ShownFile().IsEmpty())
      PutRiver(*river);
    else
      return false;
    return true;
  }

 private:
  void PutColor(const char* key, const OverlayColor& color) const {
    kvfPutListParam(file_, key, "iii", color.r, color.g, color.b);
  }
  void PutName(int kind, const FileName& name) const {
    kvfAddKeyword(file_, form_.nameKey);
    kvfAddInt(file_, kind);
    kvfAddFilename(file_, name.Absolute());
  }
  void PutDisplay(const OverlayLayer& layer) const {
    if (form_.tellsDisplay) kvfPutParam(file_, "Display", layer.Display != 0);
  }

  void PutImage(const COverlayBMPKvf& image) const {
    PutName(form_.imageKind, image.Filename);
    if (form_.imagesHaveUnit) kvfPutParam(file_, "AxisUnit", 0);
    kvfAddSection(file_, "PROPERTIES");
    PutDisplay(image);
    const auto corner = [this](const char* name, double value) {
      kvfPutParam(file_, fmt::format("{}{}", form_.imageCornerPrefix, name), value);
    };
    corner("x0", image.BMP_X0);
    corner("y0", image.BMP_Y0);
    corner("x1", image.BMP_X1);
    corner("y1", image.BMP_Y1);
    kvfPutParam(file_, "DisplayStyle", image.BMP_DisplayStyle);
    const int color = image.BMP_TransparentColor;
    PutColor("TransparentColor", {color & 0xff, color >> 8 & 0xff, color >> 16 & 0xff});
  }

  /// What lines and points of a shape begin with.
  void PutBase(const COverlayShapeKvf& shape, std::string_view title, const OverlayColor& color) const {
    kvfPutParam(file_, "Base_Title", title.empty() ? std::string_view(shape.GetTitle()) : title);
    kvfPutParam(file_, "Base_Reg_Key", "");
    kvfPutParam(file_, "Base_Col_Red", color.r);
    kvfPutParam(file_, "Base_Col_Green", color.g);
    kvfPutParam(file_, "Base_Col_Blue", color.b);
    kvfPutParam(file_, "Base_Display_On", form_.tellsDisplay || shape.Display != 0);
  }
  /// What they end with.
  void PutTexts(int isShown, int colorStyle, const OverlayColor& color, int background) const {
    kvfPutParam(file_, "Draw_Text", isShown);
    kvfPutParam(file_, "Text_Color_Style", colorStyle);
    PutColor("Text_Color", color);
    constexpr int kOpaque = 1, kTransparent = 2;
    const bool isAsHeld = !form_.hasTwoBackgrounds || background == kOpaque;
    kvfPutParam(file_, "Text_Bk_Mode", isAsHeld ? background : kTransparent);
  }

  void PutEitherText(const COverlayShapeKvf& shape) const {
    kvfPutParam(file_, "Draw_Text", shape.ShowLineText != 0 || shape.ShowPointText != 0);
    kvfPutParam(file_, "Text_Color_Style", 0);
    PutColor("Text_Color", shape.LineTextColor);
    kvfPutParam(file_, "Text_Bk_Mode", shape.LineTextBackground);
  }

  void PutShape(const COverlayShapeKvf& shape) const {
    PutName(form_.shapeKind, shape.Filename);
    using Attribute = OverlayFileForm::Attribute;
    if (form_.attribute == Attribute::Always || (form_.attribute == Attribute::WhenGiven && !shape.ItemDescr.empty()))
      kvfAddString(file_, shape.ItemDescr);
    kvfPutParam(file_, "AxisUnit", shape.ShapeAxisUnit);
    kvfAddSection(file_, "PROPERTIES");
    kvfAddSection(file_, "Quarzel_Shape_Polygon_Object");
    PutBase(shape, form_.lineTitle, shape.LineColor);
    kvfPutParam(file_, "Line_Thickness", shape.LineThickness);
    kvfPutParam(file_, "Line_Style", shape.LineStyle);
    kvfPutParam(file_, "Line_Polygon_Style", shape.PolygonStyle);
    if (form_.joinsTexts)
      PutEitherText(shape);
    else
      PutTexts(shape.ShowLineText, shape.LineTextColorOption, shape.LineTextColor, shape.LineTextBackground);
    kvfEndSection(file_);
    if (form_.hasPoints) {
      kvfAddSection(file_, "Quarzel_Shape_Point_Object");
      PutBase(shape, {}, shape.PointColor);
      kvfPutParam(file_, "Point_Type", shape.PointType);
      kvfPutParam(file_, "Point_Size", shape.PointSize);
      kvfPutParam(file_, "Point_Style", shape.PointStyle);
      PutTexts(shape.ShowPointText, shape.PointTextColorOption, shape.PointTextColor, shape.PointTextBackground);
      kvfEndSection(file_);
    }
    PutDisplay(shape);
    if (!form_.tellsPlacement) return;
    kvfPutParam(file_, "ConversionType", 2);
    kvfPutParam(file_, "ProjectionType", "");
  }

  void PutRiver(const COverlayRiverKvf& river) const {
    PutName(form_.riverKind, river.ShownFile());
    kvfPutParam(file_, "AxisUnit", 0);
    kvfAddSection(file_, "PROPERTIES");
    PutDisplay(river);
    kvfPutParam(file_, "ConversionType", 2);
    kvfPutParam(file_, "ProjectionType", CYbMapProjection::IDtoProjectionString(1));
    kvfPutParam(file_, "DisplayType", 4);
    kvfPutParam(file_, "MarkerSize", 0.2);
  }

  KvfFile* file_;
  const OverlayFileForm& form_;
};

}  // namespace

void WriteOverlays(KvfFile* file, const COverlayListKvf& list, const OverlayFileForm& form, int& counter) {
  const LayerWriter writer(file, form);
  const int count = list.GetItemCount();
  for (int step = 1; step <= count; ++step) {
    const OverlayLayer* layer = list.GetItem(form.fromLast ? count + 1 - step : step)->Layer();
    if (form.countsEvery) ++counter;
    if (!layer || !writer.Write(*layer)) continue;
    kvfPutParam(file, "OverlayDrawingOrder", counter);
    kvfEndSection(file);
    if (!form.countsEvery) ++counter;
  }
}

}  // namespace tervane
