// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/results/geo_scene_pages.h"

#include "document/flow_model_document.h"
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

void DescribeScene(PageForm& form, CGeoScene3DKvf& n, CYbSEDlgBase& page) {
  form.Number("Vertical exaggeration factor:", n.VerticalExaggerationFactor);
  form.Radio("", n.LayerType);
  form.Check("Show Lenses", n.ShowLenses).EnabledWhen(Is(n.LayerType, CGeoScene3DKvf::kGeological));
  if (n.IsOfResults()) {
    form.Check("Use all time steps", n.UseAllTimeSteps);
    form.Integer("Show every", n.ShowEveryTimeStep).Unit("time step").EnabledWhen(!On(n.UseAllTimeSteps));
  }
  form.Number("Transparency of surfaces:", n.Transparency);
  form.Button("Launch GeoScene3D...", [&n, &page] { Launch(n, page); });
}

}  // namespace

std::span<const PageRow> GeoScenePages() {
  static constexpr PageRow kRows[] = {DescribedBy<DescribeScene>(kGeoScenePage)};
  return kRows;
}

}  // namespace tervane
