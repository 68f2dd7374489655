// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/document/document_pages.h"

#include <fmt/format.h>

#include "data/grid_files.h"
#include "execution/processed_pages.h"
#include "overlays/image_place.h"
#include "overlays/pages.h"
#include "pages/document/coverage_page.h"
#include "pages/document/help_pages.h"
#include "pages/parts/domain_map.h"
#include "pages/parts/plot_content.h"
#include "platform/files.h"
#include "platform/item_types.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "platform/units.h"

namespace tervane {

std::string CTvnHelpView::PageName() const {
  const std::string& name = Node().GetHtml();
  return FindHelpPage(name) ? name : "default.htm";
}

bool CTvnHelpView::OnHelp() {
  const std::string uri = Outside().Setting("HelpURI");
  if (uri.empty()) return false;
  const bool isIntroduction = Node().GetHtml() == "Tvn.htm";
  Outside().OpenBrowser(fmt::format(
      "{}2017/{}", uri,
      isIntroduction ? "tervane/VORA_TVD_online/TVN_Getting_started/Introduction.htm" : "tervane/index.htm"));
  return true;
}

void CTvnHelpView::Describe(PageForm& form) {
  form.Notice([this] {
    std::string problem;
    PageText(problem);
    return problem;
  });
  form.Browser([this] {
        std::string unused;
        return PageText(unused);
      })
      .Folder(std::string(FolderOf(FileOfReport())));
}

std::string CTvnHelpView::FileOfReport() const {
  const auto* page = dynamic_cast<const CPreprocessedHTML*>(&Node());
  return page && !FindHelpPage(page->GetHtml()) ? page->GetFile() : std::string();
}

std::string CTvnHelpView::PageText(std::string& problem) const {
  constexpr std::uint64_t kMostBytes = 16 << 20;
  const std::string file = FileOfReport();
  FileContent content;
  if (StampOf(file).size > kMostBytes)
    problem = fmt::format("{}: it has more than the {} MB that are shown", file, kMostBytes >> 20);
  else if (!file.empty())
    problem = ReadWholeFile(file, content).error;
  return content.data ? std::string(content.Text()) : std::string(*FindHelpPage(PageName()));
}

void CDisplayDlg::SetData() {
  if (const auto* domain = Node().Important(kDomain)) Node().AdoptDomain(domain->GetEnvelope());
}

LineLayer CDisplayDlg::ShownArea() {
  const COverlaysKvf& n = Node();
  const std::vector<MapPoint> corners{{n.x0, n.y0}, {n.x1, n.y0}, {n.x1, n.y1}, {n.x0, n.y1}, {n.x0, n.y0}};
  // Another one only where the area is another, since a map is drawn anew for other lines.
  if (!frame_ || frame_->front().points != corners) {
    auto frame = std::make_shared<std::vector<MapLine>>(1);
    frame->front().points = corners;
    frame_ = std::move(frame);
  }
  return {.lines = frame_, .withNames = false};
}

void CDisplayDlg::Describe(PageForm& form) {
  COverlaysKvf& n = Node();
  const Condition isFree = !On(n.UseModelDomain);
  form.Check("Default map display based on the Model Domain", n.UseModelDomain);
  const auto corner = [&](PageForm& group, const char* label, double& value) {
    group.Number(label, value).Quantity(quantity::kMapCoordinate).EnabledWhen(isFree).Then([&n] {
      n.SetArea({n.x0, n.y0, n.x1, n.y1});
      return 0;
    });
  };
  PageForm& lower = form.Group("Lower Left corner");
  corner(lower, "X", n.x0);
  corner(lower, "Y", n.y0);
  PageForm& upper = form.GroupBeside("Upper Right corner");
  corner(upper, "X", n.x1);
  corner(upper, "Y", n.y1);
  form.Button("Import...", [this] { Import(); }).EnabledWhen(isFree);
  form.Map([this, &n] {
    MapContent map = DomainMap(n);
    if (map.grids.empty() && map.awaited.empty()) AddBackdrop(n, map);
    for (GridLayer& grid : map.grids) grid.withLegend = false;
    map.lines.push_back(ShownArea());
    map.area = Envelope{n.x0, n.y0, n.x1, n.y1};
    return map;
  });
}

void CDisplayDlg::Import() {
  Host::FileQuestion question;
  question.filter =
      "All legal files (*.nds2; *.bmpw; *.shp)|*.nds2; *.bmpw; *.shp|Two Dim Files (*.nds2)|*.nds2|"
      "Geo Reference Files (*.bmpw)|*.bmpw|Shape Files (*.shp)|*.shp|All Files (*.*)|*.*||";
  question.defaultExtension = "nds2";
  const auto path = Outside().AskFileToOpen(question);
  if (!path) return;
  const std::string extension = LowerCase(ExtensionOf(*path));
  std::optional<DataArea> area;
  if (extension == ".nds2") {
    GridGeometry geometry;
    const FileResult result = ReadGeoInfoFromNdsFile(*path, 1, geometry);
    const Envelope box = EnvelopeOf(geometry);
    if (result.Ok())
      area = DataArea{box.xMin, box.yMin, box.xMax, box.yMax};
    else
      Outside().ShowMessage(result.error, Host::Icon::Error);
  } else if (extension == ".bmpw") {
    area = ReadImagePlace(*path, Outside());
  } else if (extension == ".shp") {
    if (!FileExists(*path)) return Outside().ShowMessage("Can not open shape file", Host::Icon::Error);
    Host::ItemQuestion axis;
    axis.title = "Shape axis units";
    axis.file = *path;
    axis.heads = {"Unit of the coordinates"};
    const auto units = FindItemType(quantity::kMapCoordinate)->unitKeys;
    for (const int unit : units) axis.rows.push_back({{std::string(FindUnit(unit)->text)}, {}});
    axis.current = 0;
    const auto chosen = Outside().AskItem(axis);
    if (!chosen) return;
    CTvnShapeData shapes;
    shapes.SetAxisLengthUnit(units[static_cast<std::size_t>(*chosen)]);
    Envelope box;
    if (const FileResult result = shapes.ReadShapeFile(*path); !result.Ok() || !shapes.GetTranscribingRect(box))
      Outside().ShowMessage("Can not load shape file\n\n" + result.error, Host::Icon::Error);
    else
      area = DataArea{box.xMin, box.yMin, box.xMax, box.yMax};
  }
  if (!area) return;
  Node().SetArea(*area);
  UpdateDoc(kDataChanged, "Import Area");
}

std::span<const PageRow> DocumentPages() {
  static constexpr PageRow kRows[] = {
      PageIs<CCoverageDlg, CCoverageKvf>(kCoveragePage),
      PageIs<CDisplayDlg, COverlaysKvf>(kDisplayPage),
  };
  return kRows;
}

}  // namespace tervane
