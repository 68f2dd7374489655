// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/document/overlay_pages.h"

#include "forms/table_of.h"
#include "overlays/image_place.h"
#include "overlays/overlays.h"
#include "overlays/pages.h"
#include "pages/parts/domain_map.h"
#include "pages/parts/file_controls.h"
#include "pages/parts/plot_content.h"
#include "pages/parts/river_map.h"
#include "platform/file_cache.h"
#include "platform/item_types.h"

namespace tervane {

namespace {

constexpr int kOwnFile = 1;  ///< Of rivers and wells; else they follow the setup.
/// Titles in the tree follow what a layer shows.
constexpr int kTitleChange = kDataChanged | kTreeRebuilt;

/// The domain with the backdrop; the backdrop alone while there is no domain.
void DescribeBackdropMap(PageForm& form, const CYbSEKvfBase& node) {
  form.Map([&node] {
    MapContent map = DomainMap(node);
    if (map.grids.empty() && map.shapes.empty() && map.awaited.empty()) AddBackdrop(node, map);
    for (GridLayer& grid : map.grids) {
      grid.withLegend = false;
      grid.transparency = 0.7;
    }
    return map;
  });
}

void DescribeOverlays(PageForm& form, COverlayListKvf& n) {
  using Item = COverlayItemKvf;
  auto table = std::make_shared<TableOf<Item>>(n);
  table->ItemName("Layer");
  table
      ->Choice("Type", &Item::Type,
               CellChoices{{Item::kImage, "Image"},
                           {Item::kGrid, "Grid"},
                           {Item::kShape, "Shape"},
                           {Item::kRiver, "River"},
                           {Item::kWell, "Well"}})
      .Width(110)
      .Hint(kTitleChange);
  table
      ->Value("Display",
              [](Item& item) {
                OverlayLayer* layer = item.Layer();
                return layer ? CellPlace(CheckOf{&layer->Display}) : CellPlace(NoCell());
              })
      .Key("Display")
      .Width(50)
      .Hint(kTitleChange);
  table
      ->Value("Overlay File",
              [](Item& item) {
                const OverlayLayer* layer = item.Layer();
                return layer ? layer->ShownFile().Text() : std::string();
              })
      .Width(260);
  form.Table(table);
  form.Notice([] { return std::string("A layer lies over those above it in the table."); });
  DescribeBackdropMap(form, n);
}

/// The form of the layer in force.
template <class Layer>
Layer& LayerOf(PageForm& form, COverlayItemKvf& item) {
  Layer& layer = *item.Child<Layer>();
  form.Keys().Add(layer);
  return layer;
}

void DescribeDisplay(PageForm& form, OverlayLayer& layer) { form.Check("Display", layer.Display).Hint(kTitleChange); }

/// A choice of a style; the numbers that files may hold besides show as they are.
Control& StyleChoice(PageForm& form, const char* label, int& style, KeyChoices choices) {
  std::vector<std::string> texts;
  std::vector<int> values;
  for (const KeyChoice& choice : choices) {
    texts.emplace_back(choice.text);
    values.push_back(choice.value);
  }
  Control& control = form.Choice(label, style, std::move(texts));
  control.optionValues = std::move(values);
  return control;
}

// ---- Kinds

void ImportPlace(COverlayBMPKvf& image, const CYbSEDlgBase& page) {
  Host::FileQuestion question;
  question.filter =
      "Geo Reference Files (*.bmpw;*.bpw)|*.bmpw; *.bpw|(*.jpgw;*.jpw)|*.jpgw; *.jpw|(*.gifw;*.giw)|*.gifw; "
      "*.giw|(*.pngw;*.pnw)|*.pngw; *.pnw|(*.tifw;*.tiw)|*.tifw; *.tiw|All Files (*.*)|*.*||";
  question.current = image.Filename.Absolute();
  const auto path = page.Outside().AskFileToOpen(question);
  if (!path) return;
  const auto place = ReadGeoReference(*path, image.Filename.IsEmpty() ? "" : image.Filename.Absolute(), page.Outside());
  if (!place) return;
  image.BMP_X0 = place->x0;
  image.BMP_X1 = place->x1;
  image.BMP_Y0 = place->y0;
  image.BMP_Y1 = place->y1;
  page.UpdateDoc(kDataChanged, "Import Place of Image");
}

void DescribeImage(PageForm& form, COverlayItemKvf& item, CYbSEDlgBase& page) {
  auto& n = LayerOf<COverlayBMPKvf>(form, item);
  DescribeDisplay(form, n);
  form.File("Image:", n.Filename)
      .Filter("Image files (*.bmp;*.gif;*.jpg;*.png;*.tif) |*.bmp; *.gif; *.jpg; *.png; *.tif|All Files (*.*) |*.*||")
      .Hint(kTitleChange);
  PageForm& lower = form.Group("Lower Left corner");
  lower.Number("X", n.BMP_X0);
  lower.Number("Y", n.BMP_Y0);
  PageForm& upper = form.GroupBeside("Upper Right corner");
  upper.Number("X", n.BMP_X1);
  upper.Number("Y", n.BMP_Y1);
  form.Button("Import...", [&n, &page] { ImportPlace(n, page); }).ToolTip("Takes the corners from a geo-reference");
  StyleChoice(form, "Colours:", n.BMP_DisplayStyle, kImageColorings);
  form.Color("Transparent colour:", n.BMP_TransparentColor).EnabledWhen("one colour is transparent", [&n] {
    return n.BMP_DisplayStyle == kKeyedImage || n.BMP_DisplayStyle == kKeyedGreyImage;
  });
  DescribeBackdropMap(form, item);
}

void DescribeGrid(PageForm& form, COverlayItemKvf& item, CYbSEDlgBase& page) {
  auto& n = LayerOf<COverlayGridKvf>(form, item);
  DescribeDisplay(form, n);
  CTvnData2DNdsFile& file = n.GridFile();
  form.DataFile("Grid file:", file).Filter("Grid file (*.nds2)|*.nds2||").DefaultExtension("Nds2").Hint(kTitleChange);
  form.Button("Edit...", [&file, &page] { page.Outside().OpenInEditor(file.File.Absolute()); })
      .EnabledWhen("a file is chosen", [&file] { return !file.File.IsEmpty(); });
  form.Percent("Transparency:", n.Transparency).ToolTip("More than 100 % is none");
  DescribeBackdropMap(form, item);
}

std::vector<std::string> AttributesOf(const FileName& file) {
  using Names = std::vector<std::string>;
  static FileCache<Names> known(100);
  if (file.IsEmpty()) return {};
  const std::string path = file.Absolute();
  return *known.Get(path, {}, StampsOfShape(path), [&path] {
    Names names;
    CYbShapeData shapes;
    if (shapes.ReadShapeAndDbfFile(path, "").Ok())
      for (const ShapeField& field : shapes.Fields()) names.push_back(field.name);
    return names;
  });
}

/// The texts of points, or of lines and polygons.
void DescribeTexts(PageForm& form, int& isShown, int& coloring, OverlayColor& color, int& ground) {
  form.Check("Show texts", isShown);
  const Condition shown = On(isShown);
  StyleChoice(form, "Colour of texts:", coloring, kTextColorings).EnabledWhen(shown);
  form.Color("Own colour:", color.r, color.g, color.b).EnabledWhen(shown);
  StyleChoice(form, "Background:", ground, kTextGrounds).EnabledWhen(shown);
}

void DescribeShape(PageForm& form, COverlayItemKvf& item) {
  auto& n = LayerOf<COverlayShapeKvf>(form, item);
  DescribeDisplay(form, n);
  form.File("Shape file:", n.Filename)
      .Filter("Shape Files (*.shp)|*.shp|All Files (*.*)|*.*||")
      .DefaultExtension("shp")
      .Hint(kTitleChange);
  form.Text("Attribute of texts:", n.ItemDescr).Offers([&n] { return AttributesOf(n.Filename); });
  UnitKeyChoice(form, "Unit of coordinates:", "ShapeAxisUnit", n.ShapeAxisUnit, quantity::kMapCoordinate);
  PageForm& points = form.Group("Points");
  StyleChoice(points, "Marker:", n.PointType, kPointMarkers);
  StyleChoice(points, "Edge:", n.PointStyle, kPointEdges);
  points.Number("Size:", n.PointSize);
  points.Color("Colour:", n.PointColor.r, n.PointColor.g, n.PointColor.b);
  DescribeTexts(points, n.ShowPointText, n.PointTextColorOption, n.PointTextColor, n.PointTextBackground);
  PageForm& lines = form.GroupBeside("Lines and polygons");
  StyleChoice(lines, "Line:", n.LineStyle, kLineDashes);
  StyleChoice(lines, "Polygons:", n.PolygonStyle, kPolygonFills);
  lines.Number("Thickness:", n.LineThickness);
  lines.Color("Colour:", n.LineColor.r, n.LineColor.g, n.LineColor.b);
  DescribeTexts(lines, n.ShowLineText, n.LineTextColorOption, n.LineTextColor, n.LineTextBackground);
  DescribeBackdropMap(form, item);
}

/// What follows the setup, or shows a file of its own.
Control& DescribeSource(PageForm& form, const char* label, int& source, const char* fileLabel, FileName& file,
                        const OverlayLayer& layer) {
  form.Radio(label, source).Hint(kTitleChange);
  Control& control = form.File(fileLabel, file).Hint(kTitleChange).EnabledWhen(Is(source, kOwnFile));
  form.ReadOnlyText("Shown file:", [&layer] { return layer.ShownFile().Text(); });
  return control;
}

void DescribeRiver(PageForm& form, COverlayItemKvf& item) {
  auto& n = LayerOf<COverlayRiverKvf>(form, item);
  DescribeDisplay(form, n);
  DescribeSource(form, "River network", n.SourceFvrNwkType, "River network file:", n.FvrNwkFilename_Specified, n)
      .Filter("River Network Files (*.fvproj;*.fvnwk)|*.fvproj;*.fvnwk|All Files (*.*) |*.*||")
      .DefaultExtension("fvnwk");
  form.Notice([&n] { return RiverFaults(n.DrawnFile()); });
  DescribeBackdropMap(form, item);
}

void DescribeWells(PageForm& form, COverlayItemKvf& item) {
  auto& n = LayerOf<COverlayWellKvf>(form, item);
  DescribeDisplay(form, n);
  DescribeSource(form, "Wells", n.SourceWellType, "Well file:", n.WellFilename, n)
      .Filter("Well Files (*.WEL) |*.WEL|All Files (*.*) |*.*||")
      .DefaultExtension("WEL");
  form.Check("Show names", n.Lables);
  DescribeBackdropMap(form, item);
}

}  // namespace

std::span<const PageRow> OverlayPages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeOverlays>(kOverlayListPage), DescribedBy<DescribeImage>(kImageOverlayPage),
      DescribedBy<DescribeGrid>(kGridOverlayPage),     DescribedBy<DescribeShape>(kShapeOverlayPage),
      DescribedBy<DescribeRiver>(kRiverOverlayPage),   DescribedBy<DescribeWells>(kWellOverlayPage),
  };
  return kRows;
}

}  // namespace tervane
