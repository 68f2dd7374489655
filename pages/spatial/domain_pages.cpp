// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/domain_pages.h"

#include <algorithm>

#include "forms/map_question.h"
#include "geometry/cart.h"
#include "pages/parts/create_dialogs.h"
#include "pages/parts/domain_map.h"
#include "pages/parts/file_controls.h"
#include "pages/parts/projection_dialog.h"
#include "platform/files.h"
#include "platform/item_types.h"
#include "platform/units.h"
#include "spatial/domain.h"
#include "spatial/pages.h"

namespace tervane {

namespace {

/// The model domain and its grid.
class CCatchmentDlg : public PageOf<CCatchmentKvf> {
 public:
  CCatchmentDlg(CYbSEKvfBase& node, const PageContext& context)
      : PageOf(node, context), question_(Context().syncSoon) {}

 protected:
  void Describe(PageForm& form) override;

 private:
  /// A number of the grid: the file's, or the node's own, which can be changed.
  Control& GridNumber(PageForm& form, const std::string& label, double& own, double GridGeometry::*inFile);
  bool BrowseShape(Host& host, const Host::FileQuestion& question);
  /// Takes a shape file with the unit of its coordinates, which is asked for; false when the user gave up.
  bool TakeShape(Host& host, const FileName& file);
  void TakeGrid();
  MapContent Map();

  MapQuestion question_;
};

Control& CCatchmentDlg::GridNumber(PageForm& form, const std::string& label, double& own,
                                   double GridGeometry::*inFile) {
  CCatchmentKvf& n = Node();
  Control& control = form.Number(label, own);
  control.text = [&n, &control, inFile] { return ShownNumber(n.GetModelGeometry().*inFile, control.NumberUnit()); };
  control.EnabledWhen(Is(n.Type, CCatchmentKvf::kShapeFile));
  return control.RevalidatesLater();
}

bool CCatchmentDlg::BrowseShape(Host& host, const Host::FileQuestion& asked) {
  CCatchmentKvf& n = Node();
  const std::string folder = n.GetRoot() ? n.GetRoot()->SetupFolder() : std::string();
  Host::FileQuestion question = asked;
  question.current = n.ShapeFile().File.IsEmpty() ? folder : n.ShapeFile().File.Absolute();
  const auto path = host.AskFileToOpen(question);
  return path && TakeShape(host, FileName::Picked(*path, folder));
}

bool CCatchmentDlg::TakeShape(Host& host, const FileName& file) {
  CCatchmentKvf& n = Node();
  const auto& units = FindItemType(quantity::kMapCoordinate)->unitKeys;
  Host::ItemQuestion axis;
  axis.title = "Shape axis units";
  axis.file = file.Absolute();
  axis.heads = {"Unit of the coordinates"};
  for (const int unit : units) {
    if (unit == n.ShapeAxisUnit) axis.current = static_cast<int>(axis.rows.size());
    axis.rows.push_back({{std::string(FindUnit(unit)->text)}, {}});
  }
  const auto chosen = host.AskItem(axis);
  if (!chosen) return false;
  std::string problem;
  if (!n.ChooseShapeFile(file, units[static_cast<std::size_t>(*chosen)], problem))
    host.ShowMessage("Can not load shape file\n\n" + problem, Host::Icon::Error);
  return true;
}

void CCatchmentDlg::Describe(PageForm& form) {
  CCatchmentKvf& n = Node();
  const Condition fromGrid = Is(n.Type, CCatchmentKvf::kGridFile), fromShape = Is(n.Type, CCatchmentKvf::kShapeFile);
  form.Radio("", n.Type).RevalidatesLater();
  form.DataFile("Filename:", n.GridFile())
      .Filter(kGridFileFilter)
      .DefaultExtension("nds2")
      .ShownWhen(fromGrid)
      .RevalidatesLater();
  form.Button("Edit...",
              [this] {
                AllowRequest(Node(), Node().GridFile().File, &EditorRequests::domain);
                EditDataFile(Context(), Node(), Node().GridFile().File);
              })
      .ShownWhen(fromGrid);
  form.Button("Create...",
              [this] {
                if (!MayCreateFile(Context())) return;
                CData2DNdsCreateDlg dialog(Context(), Node());
                if (const auto file = dialog.Run()) {
                  Node().GridFile().Choose(*file);
                  Node().SetRevalidateAll();
                  UpdateDoc(kDataChanged, "Create Grid File");
                }
              })
      .Beside()
      .ShownWhen(fromGrid);
  Control& shape = form.ShapeFile("Filename:", n.ShapeFile());
  shape.Filter(kShapeFileFilter).DefaultExtension("shp").ShownWhen(fromShape).RevalidatesLater();
  shape.browse = [this, &shape](Host& host) { return BrowseShape(host, shape.fileQuestion); };
  shape.enter = [this, enter = std::move(shape.enter)](const std::string& typed) {
    CData2DShpFile& node = Node().ShapeFile();
    const FileName before = node.File;
    const std::string attribute = node.Attribute();
    std::string expected = enter(typed);
    const bool isOther = expected.empty() && node.File.Text() != before.Text() && FileExists(node.File.Absolute());
    if (!isOther || TakeShape(Outside(), node.File)) return expected;
    node.Choose(before, attribute);
    return std::string("the unit of the file's coordinates must be chosen");
  };
  form.Button("Create...",
              [this] {
                CData2DShpCreateDlg dialog(Context(), Node(), "ModelDomain");
                if (const auto file = dialog.Run()) {
                  Node().ShapeFile().Choose(*file, {});
                  Node().SetRevalidateAll();
                  UpdateDoc(kDataChanged, "Create Shape File");
                }
              })
      .ShownWhen(fromShape);

  PageForm& grid = form.Group("Grid");
  const auto cells = [&](const char* label, const char* key, int& own, int GridGeometry::*inFile) {
    grid.Integer(
            label, [&n, inFile] { return n.GetModelGeometry().*inFile; }, [&own](int value) { own = value; })
        .Key(key)
        .EnabledWhen(fromShape)
        .RevalidatesLater();
  };
  cells("NX:", "nxShp", n.nxShp, &GridGeometry::nx);
  cells("NY:", "nyShp", n.nyShp, &GridGeometry::ny);
  GridNumber(grid, "Cell Size:", n.sizeShp, &GridGeometry::cellSize);
  GridNumber(grid, "X0:", n.x0Shp, &GridGeometry::x0);
  GridNumber(grid, "Y0:", n.y0Shp, &GridGeometry::y0);
  grid.Button("Pick Corner on Map",
              [this] {
                question_.AskPoint("Click the lower left corner of the grid. Esc gives up.", [this](MapPoint corner) {
                  Node().x0Shp = corner.x;
                  Node().y0Shp = corner.y;
                  Node().SetRevalidateAll();
                  UpdateDoc(kDataChanged, "Pick Corner of the Grid");
                });
              })
      .ToolTip("Takes X0 and Y0 from a click on the map")
      .EnabledWhen(fromShape);
  grid.Button("Take Grid from File...", [this] { TakeGrid(); })
      .Beside()
      .ToolTip("Takes all values of the grid and the projection from a raster, or fits them to a shape file")
      .EnabledWhen(fromShape);
  GridNumber(grid, "Rotation:", n.rotationShp, &GridGeometry::rotation);
  // Shown by its name; any text that tells a coordinate system may be typed.
  grid.Text(
          "Map Projection Type:", [&n] { return CYbMapProjection(n.GetModelGeometry().projection).Name(); },
          [&n](const std::string& text) { n.MapProjShp = text; })
      .Key("MapProjShp")
      .EnabledWhen(fromShape)
      .RevalidatesLater();
  grid.Button("Choose...",
              [this] {
                if (const auto chosen = ProjectionDialog(Context(), Node(), Node().MapProjShp).Run()) {
                  Node().MapProjShp = *chosen;
                  Node().SetRevalidateAll();
                  UpdateDoc(kDataChanged, "Choose Coordinate System");
                }
              })
      .Beside()
      .ToolTip("Finds a coordinate system by its name, EPSG code or place")
      .EnabledWhen(fromShape);

  form.Map([this] { return Map(); });
}

void CCatchmentDlg::TakeGrid() {
  const auto path = AskFile({"Take Grid from File",
                             "Rasters and shape files (*.nds2;*.tif;*.asc;*.shp)|*.nds2;*.tif;*.asc;*.shp|All Files "
                             "(*.*)|*.*||",
                             "nds2",
                             {}},
                            {});
  if (!path) return;
  std::string problem;
  if (!Node().TakeGrid(*path, problem)) return Outside().ShowMessage(problem, Host::Icon::Error);
  Node().SetRevalidateAll();
  UpdateDoc(kDataChanged, "Take Grid from File");
}

MapContent CCatchmentDlg::Map() {
  MapContent map = DomainMap(Node());
  question_.PutOn(map);
  return map;
}

}  // namespace

std::span<const PageRow> DomainPages() {
  static constexpr PageRow kRows[] = {
      PageIs<CCatchmentDlg, CCatchmentKvf>(kCatchmentPage),
  };
  return kRows;
}

}  // namespace tervane
