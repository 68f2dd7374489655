// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/data2d_pages.h"

#include "pages/parts/create_dialogs.h"
#include "pages/parts/plot_content.h"
#include "platform/units.h"

namespace tervane {

namespace {

constexpr int kHorizontalLength = 100217;

}  // namespace

void CData2DDlg::OnRefresh() {
  Node().SetGridDataValid(0);
  Node().SetShapeDataValid(0);
  UpdateDoc(kDataChanged | kRefreshPlots, "Refresh Map");
}

MapContent CData2DDlg::Map() {
  CData2DKvf& n = Node();
  const bool isScattered = n.Type == CData2DKvf::kShapeFile || n.Type == CData2DKvf::kXyzFile;
  if (!n.ShowGridData && !(isScattered && n.ShowShapeData)) return {};
  MapContent map = GridMap(n, n.ShowGridData ? n.GridComputation() : nullptr);
  if (!map.grids.empty()) map.grids.front().isCodes = n.IsCode();
  if (!isScattered || !n.ShowShapeData) return map;
  const auto shapes = n.ShapeComputation();
  if (auto data = NowOrAwaited(shapes, map.awaited))
    map.shapes.push_back({std::move(data), {}});
  else if (shapes->IsDone() && map.message.empty())
    map.message = shapes->Problem();
  return map;
}

void CData2DDlg::Describe(PageForm& form) {
  CData2DKvf& n = Node();
  const auto is = [&n](int type) { return [&n, type] { return n.Type == type; }; };
  const auto isFile = [&n] { return n.Type != CData2DKvf::kUniform; };
  const auto isScattered = [&n] { return n.Type == CData2DKvf::kShapeFile || n.Type == CData2DKvf::kXyzFile; };
  const auto isInterpolated = [&n, isScattered] { return isScattered() && n.IsInterpolated(); };

  std::vector<std::string> sources{"Uniform", "Grid file (.nds2)"};
  if (n.Kind().mayBeScattered) sources.insert(sources.end(), {"Point/Line (.shp)", "Point XYZ(.txt)"});
  form.Choice("Data Type:", n.Type, std::move(sources)).RevalidatesLater();
  if (n.IsCode()) {
    // Codes are whole numbers, whatever the file keeps them in.
    form.Integer(
            "Value", [&n] { return static_cast<int>(n.FixedValue); },
            [&n](int value) { n.FixedValue = static_cast<float>(value); })
        .Key("FixedValue")
        .ShownWhen(is(CData2DKvf::kUniform));
  } else {
    form.Number("Value", n.FixedValue).Quantity(n.GetItemType()).ShownWhen(is(CData2DKvf::kUniform));
  }
  form.DataFile("Filename:", n.GridFile())
      .Filter(kGridFileFilter)
      .DefaultExtension("nds2")
      .ShownWhen(is(CData2DKvf::kGridFile));
  form.ShapeFile("Filename:", n.ShapeFile())
      .Filter(kShapeFileFilter)
      .DefaultExtension("shp")
      .ShownWhen(is(CData2DKvf::kShapeFile));
  form.File("Filename:", n.XyzFile().File)
      .Key("FILE_NAME")
      .Filter("XYZ files (*.txt) |*.txt|All Files (*.*) |*.*||")
      .DefaultExtension("txt")
      .ShownWhen(is(CData2DKvf::kXyzFile));
  form.Shown("Attribute:", [&n] { return n.GetNdsItemName(); }).ShownWhen(is(CData2DKvf::kGridFile));
  form.Text(
          "Attribute:", [&n] { return n.ShapeFile().Attribute(); },
          [&n](const std::string& name) { n.ShapeFile().Choose(n.ShapeFile().File, name); })
      .ShownWhen(is(CData2DKvf::kShapeFile));
  form.Button("Edit...", [this] { EditDataFile(Context(), Node(), Node().GridFile().File); })
      .ShownWhen(is(CData2DKvf::kGridFile));
  form.Button("Create...",
              [this] {
                CData2DKvf& node = Node();
                CData2DNdsCreateDlg dialog(Context(), node.FixedValue, node, node.GetItemType());
                if (const auto file = dialog.Run()) {
                  node.GridFile().Choose(*file);
                  UpdateDoc(kDataChanged, "Create Grid File");
                }
              })
      .Beside()
      .ShownWhen(is(CData2DKvf::kGridFile));
  form.Button("Edit...",
              [this] {
                if (Context().openDataFile) Context().openDataFile(Node().XyzFile().File.Absolute());
              })
      .ShownWhen(is(CData2DKvf::kXyzFile));
  if (n.HasRelativeToGround()) form.Check("Values relative to ground", n.RelativeToGround);

  PageForm& units = form.Group("Units of Shape Files");
  form.Controls().back()->ShownWhen(isScattered);
  UnitKeyChoice(units, "Units of X- and Y-axises:", "ShapeAxisUnit", n.ShapeAxisUnit, kCoordinateItemType);
  UnitKeyChoice(units, "Item Unit:", "ShapeItemUnit", n.ShapeItemUnit, n.Kind().itemType);
  form.Choice("Interpolation Method:", n.InterpMethod,
              {"Bilinear", "Triangular", "Inverse Distance", "Inverse Distance Squared"})
      .ShownWhen(isInterpolated);
  form.Number("Search Radius:", n.SearchRadius).Quantity(kHorizontalLength).ShownWhen(isInterpolated);
  form.Check("Show grid data", n.ShowGridData).ShownWhen(isFile);
  form.Check("Show shape raw data", n.ShowShapeData).ShownWhen(isScattered);
  form.Map([this] { return Map(); }).ShownWhen(isFile);
}

}  // namespace tervane
