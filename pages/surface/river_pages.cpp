// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/river_pages.h"

#include "pages/parts/domain_map.h"
#include "pages/parts/file_controls.h"
#include "pages/parts/river_map.h"
#include "simspec/conditions.h"
#include "surface/pages.h"
#include "surface/rivers.h"

namespace tervane {

namespace {

/// Transparency of the domain below the rivers.
constexpr double kQuiet = 0.7;
constexpr int kFollowedByTree = kDataChanged | kTreeRebuilt;

void EditButton(PageForm& form, const CYbSEDlgBase& page, const FileName& file, const Condition& isShown = {}) {
  form.Button("Edit...",
              [&page, &file] {
                if (!file.IsEmpty()) page.Outside().OpenInEditor(file.Absolute());
              })
      .ShownWhen(isShown);
}

/// With the own engine: river simulations.
class CRiverDlg : public PageOf<CRiverKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override {
    constexpr const char* kFilter = "River Simulation File (*.fvproj;*.fvsim)|*.fvproj;*.fvsim|All Files (*.*) |*.*||";
    CRiverKvf& n = Node();
    Control& main = form.File("River Simulation File:", n.Filename).Filter(kFilter).Hint(kFollowedByTree);
    main.enter = [&n](const std::string& typed) {
      FileName file = n.Filename;
      std::string expected = EnterValue(file, typed, &n);
      if (expected.empty()) n.SetRiverFile(std::move(file));
      return expected;
    };
    EditButton(form, *this, n.Filename);
    form.Notice([&n] { return RiverFaults(n.Filename); });
    PageForm& areas = form.Group("Inundation Areas");
    areas.Check("Flood Codes", n.FloodCodes).Hint(kFollowedByTree);
    areas.Check("Bathymetry", n.Bathymetry).Hint(kFollowedByTree);
    const Condition hasQuality = Component(&CModelCompKvf::WQ) && WaterQualityComponent(&CModelCompWQKvf::River);
    form.File("River Simulation File for Water Quality:", n.FilenameWQ)
        .Filter(kFilter)
        .Hint(kFollowedByTree)
        .ShownWhen(hasQuality);
    EditButton(form, *this, n.FilenameWQ, hasQuality);
  }
};

/// With Modflow: a river network.
class CRiverMFDlg : public PageOf<CRiverMFKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override {
    CRiverMFKvf& n = Node();
    form.File("River Network File (*.FVNWK)", n.Filename)
        .Filter("River Network File (*.FVNWK) |*.FVNWK|All Files (*.*) |*.*||")
        .DefaultExtension("FVNWK")
        .Hint(kFollowedByTree);
    EditButton(form, *this, n.Filename);
    form.Button("Create...", [this] { CreateNetwork(); }).Beside();
    form.Notice([&n] { return RiverFaults(n.Filename); });
    form.Check("Show Rivers map", n.IncludeMap);
    Control& map = form.Map([&n] {
      MapContent content = DomainMap(n);
      for (GridLayer& grid : content.grids) {
        grid.withLegend = false;
        grid.transparency = kQuiet;
      }
      AddRiver(content, n.Filename);
      return content;
    });
    map.label = n.GetTitle();
    map.ShownWhen(On(n.IncludeMap));
  }

 private:
  void CreateNetwork() {
    CRiverMFKvf& n = Node();
    Host::FileQuestion question;
    question.title = "Create River Network File";
    question.filter = "River Network parameter file (*.FVNWK)|*.FVNWK||";
    question.defaultExtension = "FVNWK";
    const auto file = CreateFileByDialog(*this, std::move(question), n.Filename,
                                         [&n](const std::string& path) { return n.CreateNetworkFile(path); });
    if (!file) return;
    n.SetFilename(*file);
    UpdateDoc(kFollowedByTree, "Create River Network File");
  }
};

}  // namespace

std::span<const PageRow> RiverPages() {
  static constexpr PageRow kRows[] = {
      PageIs<CRiverDlg, CRiverKvf>(kRiverPage),
      PageIs<CRiverMFDlg, CRiverMFKvf>(kModflowRiverPage),
  };
  return kRows;
}

}  // namespace tervane
