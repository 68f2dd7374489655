// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/backdrop.h"

#include <algorithm>

#include "libraries/wells.h"
#include "pages/parts/plot_content.h"
#include "pages/parts/river_map.h"
#include "pages/parts/well_map.h"
#include "platform/paths.h"

namespace tervane {

namespace {

using Drawn = std::optional<decltype(BackdropLayer::drawn)>;

unsigned Rgb(const OverlayColor& color) {
  const auto part = [](int value) { return static_cast<unsigned>(std::clamp(value, 0, 255)); };
  return part(color.r) << 16 | part(color.g) << 8 | part(color.b);
}

Drawn DrawnOf(const COverlayBMPKvf& image) {
  ImageLayer layer;
  layer.path = image.Filename.Absolute();
  layer.stamp = StampOf(layer.path);
  if (!layer.stamp.exists) return {};
  layer.left = image.BMP_X0;
  layer.right = image.BMP_X1;
  layer.bottom = image.BMP_Y0;
  layer.top = image.BMP_Y1;
  const int coloring = image.BMP_DisplayStyle;
  layer.isGrey = coloring == kGreyImage || coloring == kKeyedGreyImage;
  const int color = image.BMP_TransparentColor;
  if (coloring == kKeyedImage || coloring == kKeyedGreyImage)
    layer.transparentColor = Rgb({color & 0xff, color >> 8 & 0xff, color >> 16 & 0xff});
  return layer;
}

Drawn DrawnOf(const COverlayGridKvf& grid, Awaited& awaited) {
  if (grid.LayerFile().IsEmpty() || grid.GridFile().Items.empty()) return {};
  GridLayer layer;
  layer.grid = NowOrAwaited(RecentGrid(grid.LayerFile().Absolute(), grid.GridFile().SelectedItem()), awaited);
  if (!layer.grid) return {};
  layer.withLegend = false;
  // The default, 2, is beyond what can be transparent: such a layer has none.
  const double transparency = static_cast<double>(grid.Transparency);
  layer.transparency = transparency > 1 ? 0 : std::max(0.0, transparency);
  return layer;
}

ShapeStyle StyleOf(const COverlayShapeKvf& shape) {
  const auto text = [](int isShown, int coloring, const OverlayColor& own, const OverlayColor& ofShape, int ground) {
    return TextStyle{isShown != 0, Rgb(coloring == kColorOfShape ? ofShape : own), ground == kOpaqueText};
  };
  ShapeStyle style;
  style.marker = shape.PointType;
  style.hasEdge = shape.PointStyle == kEdgedPoints;
  style.pointSize = static_cast<double>(shape.PointSize);
  style.pointColor = Rgb(shape.PointColor);
  style.pointText = text(shape.ShowPointText, shape.PointTextColorOption, shape.PointTextColor, shape.PointColor,
                         shape.PointTextBackground);
  style.dash = shape.LineStyle;
  style.fill = shape.PolygonStyle;
  style.lineWidth = static_cast<double>(shape.LineThickness);
  style.lineColor = Rgb(shape.LineColor);
  style.lineText = text(shape.ShowLineText, shape.LineTextColorOption, shape.LineTextColor, shape.LineColor,
                        shape.LineTextBackground);
  return style;
}

Drawn DrawnOf(const COverlayShapeKvf& shape, Awaited& awaited) {
  if (shape.Filename.IsEmpty()) return {};
  ShapeLayer layer;
  layer.shapes = NowOrAwaited(RecentShapes(shape.Filename.Absolute(), shape.ItemDescr, shape.ShapeAxisUnit), awaited);
  if (!layer.shapes) return {};
  layer.style = StyleOf(shape);
  return layer;
}

Drawn DrawnOf(const COverlayRiverKvf& river) {
  LineLayer layer = RiverLines(river.DrawnFile());
  if (layer.lines->empty()) return {};
  return layer;
}

Drawn DrawnOf(const COverlayWellKvf& wells) {
  CTvnWellDataList list;
  const FileName file = wells.ShownFile();
  if (file.IsEmpty() || !list.LoadWellDataFile(file.Absolute())) return {};
  PointLayer layer = PointsOf(list.Wells());
  if (layer.points.empty()) return {};
  if (!wells.Lables) layer.labels.clear();
  return layer;
}

Drawn DrawnOf(const OverlayLayer& layer, Awaited& awaited) {
  if (const auto* image = dynamic_cast<const COverlayBMPKvf*>(&layer)) return DrawnOf(*image);
  if (const auto* grid = dynamic_cast<const COverlayGridKvf*>(&layer)) return DrawnOf(*grid, awaited);
  if (const auto* shape = dynamic_cast<const COverlayShapeKvf*>(&layer)) return DrawnOf(*shape, awaited);
  if (const auto* river = dynamic_cast<const COverlayRiverKvf*>(&layer)) return DrawnOf(*river);
  if (const auto* wells = dynamic_cast<const COverlayWellKvf*>(&layer)) return DrawnOf(*wells);
  return {};
}

}  // namespace

std::vector<BackdropLayer> BuildPlotOverlays(const COverlayListKvf& list, Awaited& awaited) {
  std::vector<BackdropLayer> layers;
  for (int number = 1; number <= list.GetItemCount(); ++number) {
    const COverlayItemKvf& item = *list.GetItem(number);
    const OverlayLayer* layer = item.Layer();
    if (!layer || !layer->Display) continue;
    if (auto drawn = DrawnOf(*layer, awaited)) layers.push_back({item.GetAbbreviatedTitle(), *std::move(drawn)});
  }
  return layers;
}

}  // namespace tervane
