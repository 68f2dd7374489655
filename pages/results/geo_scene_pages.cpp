// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/results/geo_scene_pages.h"

#include <algorithm>
#include <iterator>

#include "data/datafile_facts.h"
#include "document/flow_model_document.h"
#include "pages/parts/plot_content.h"
#include "pages/parts/section_tool.h"
#include "platform/files.h"
#include "platform/os_process.h"
#include "platform/paths.h"
#include "results/geo_scene.h"
#include "results/pages.h"

namespace tervane {

namespace {

/// Writes the scene of a node and shows it in the viewer.
void Launch(const CGeoScene3DKvf& node, const CYbSEDlgBase& page) {
  const auto* document = dynamic_cast<const CFlowModelDoc*>(&page.Context().document);
  const auto refuse = [&page](const std::string& why) { page.Outside().ShowMessage(why, Host::Icon::Error); };
  if (!document || document->PathName().empty())
    return refuse("Could not open GeoScene3D: \nThe setup must be saved first: results lie beside its file.");
  const std::string folder = document->getResultFolder();
  const std::string scene = ResultFileName(folder, "GeoScene3DSetup", "xml");
  const std::string stem = ResultFileName(folder, BaseNameOf(document->PathName()), "");
  if (const std::string problem = node.WriteScene(stem, scene); !problem.empty())
    return refuse("Could not open GeoScene3D: \n" + problem);
  const std::string program = GeoSceneProgram();
  if (program.empty()) return refuse("Unable to look-up GeoScene3D file name from registry");
  std::error_code error;
  os::ProgramStart start;
  start.program = program;
  start.arguments = {ResolvedPath(scene, {})};
  auto viewer = os::DetachedProgram::Start(start, error);
  if (error) return refuse("Unable to execute " + program + ":\nFailed to create procces.");
  if (!viewer.AnnounceWhenReady("WM_GS3Orvik_Update")) refuse("GeoScene3D is not ready to receive windows messages");
}

/// The page of a scene: what the viewer gets, and the same surfaces here.
class CGeoScene3DDlg : public PageOf<CGeoScene3DKvf> {
 public:
  CGeoScene3DDlg(CYbSEKvfBase& node, const PageContext& context)
      : PageOf(node, context), section_(Context().syncSoon) {}

 protected:
  void Describe(PageForm& form) override;

 private:
  /// The path of a file of the results, as "_CompLayers.nds2"; empty for a setup that was never saved.
  std::string ResultOf(const char* ending) const;
  std::string SurfaceFile() const;
  MapContent Terrain() const;
  SectionContent Surfaces() const;

  SectionTool section_;
};

void CGeoScene3DDlg::Describe(PageForm& form) {
  CGeoScene3DKvf& n = Node();
  form.Number("Vertical exaggeration factor:", n.VerticalExaggerationFactor);
  form.Radio("", n.LayerType);
  form.Check("Show Lenses", n.ShowLenses).EnabledWhen(Is(n.LayerType, CGeoScene3DKvf::kGeological));
  if (n.IsOfResults()) {
    form.Check("Use all time steps", n.UseAllTimeSteps);
    form.Integer("Show every", n.ShowEveryTimeStep).Unit("time step").EnabledWhen(!On(n.UseAllTimeSteps));
  }
  form.Number("Transparency of surfaces:", n.Transparency);
  form.Button("Launch GeoScene3D...", [&n, this] { Launch(n, *this); });
  const Condition areThere = Sentence("the surfaces are there", [this] { return FileExists(SurfaceFile()); });
  section_.DescribeButtons(form, areThere);
  form.Map([this] { return Terrain(); }).ShownWhen(areThere);
  section_.DescribeSection(
      form, [this] { return Surfaces(); }, areThere);
}

std::string CGeoScene3DDlg::ResultOf(const char* ending) const {
  const auto* document = dynamic_cast<const CFlowModelDoc*>(&Context().document);
  if (!document || document->PathName().empty()) return {};
  return ResultFileName(document->getResultFolder(), BaseNameOf(document->PathName()), "") + ending;
}

std::string CGeoScene3DDlg::SurfaceFile() const {
  return ResultOf(Node().LayerType == CGeoScene3DKvf::kGeological ? "_GeoLayers.nds2" : "_CompLayers.nds2");
}

MapContent CGeoScene3DDlg::Terrain() const {
  MapContent map = GridFileMap(Node(), SurfaceFile(), 1);
  section_.PutOn(map);
  return map;
}

SectionContent CGeoScene3DDlg::Surfaces() const {
  SectionContent section;
  const auto take = [&](const std::string& file, int item, GridSlice slice = {}) {
    MapContent map = GridFileMap(Node(), file, item, slice);
    std::ranges::move(map.awaited, std::back_inserter(section.awaited));
    if (map.grids.empty()) section.message = map.message;
    return Level{map.grids.empty() ? nullptr : map.grids.front().grid};
  };
  int number = 0;
  const std::string surfaces = SurfaceFile();
  for (const DataItem& item : DataFileFactsOf(surfaces)->items) {
    const Level level = take(surfaces, ++number);
    if (!level.grid) continue;
    if (number == 1)
      section.ground = level;
    else
      section.surfaces.push_back({item.name, level});
  }
  const auto add = [&](const std::string& name, const Level& level) {
    if (level.grid) section.curves.push_back({name, level});
  };
  if (const std::string lenses = ResultOf("_GeoLenses.nds2");
      Node().LayerType == CGeoScene3DKvf::kGeological && Node().ShowLenses && FileExists(lenses)) {
    int lens = 0;
    for (const DataItem& item : DataFileFactsOf(lenses)->items) add(item.name, take(lenses, ++lens));
  }
  if (const std::string heads = ResultOf("_3DSZ.nds3"); Node().IsOfResults() && FileExists(heads)) {
    const auto& items = DataFileFactsOf(ResultOf("_CompLayers.nds2"))->items;
    const DataItem* head = DataFileFactsOf(heads)->Item(1);
    // A layer's head bears the name of its surface; the file counts its layers from the bottom.
    const int layers = head ? head->geometry.nz : 0;
    for (int i = std::min(static_cast<int>(items.size()) - 1, layers); i > 0; --i)
      add("Head elevation: " + items[static_cast<std::size_t>(i)].name, take(heads, 1, {0, layers - i}));
  }
  return section;
}

}  // namespace

std::span<const PageRow> GeoScenePages() {
  static constexpr PageRow kRows[] = {PageIs<CGeoScene3DDlg, CGeoScene3DKvf>(kGeoScenePage)};
  return kRows;
}

}  // namespace tervane
