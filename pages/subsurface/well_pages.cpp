// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/well_pages.h"

#include <fmt/format.h>

#include "libraries/wells.h"
#include "pages/parts/domain_map.h"
#include "pages/parts/file_controls.h"
#include "pages/parts/well_map.h"
#include "platform/files.h"
#include "simspec/basic_parameters.h"
#include "simspec/conditions.h"
#include "subsurface/pages.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"

namespace tervane {

namespace {

constexpr const char* kWellFilter = "Well parameter file (*.WEL)|*.WEL||";
constexpr int kFollowedByTree = kDataChanged | kTreeRebuilt;

/// What is wrong with the wells of a file; empty where nothing is, and without a file.
std::string WellFaults(const FileName& file) {
  if (file.IsEmpty()) return {};
  const auto reading = ReadLibraryOnce(kWellLibrary, file.Absolute());
  if (!reading->problem.empty()) return reading->problem;
  const std::vector<LibraryFinding>& findings = reading->findings;
  if (findings.empty()) return {};
  std::string text = FindingText(file.Text(), reading->library, findings.front());
  if (findings.size() > 1) text += fmt::format(" ({} more)", findings.size() - 1);
  return text;
}

class CSZWellDlg : public PageOf<CSZWellKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override {
    CSZWellKvf& n = Node();
    form.File("Filename", n.Filename).Filter(kWellFilter).DefaultExtension("WEL").Hint(kFollowedByTree);
    form.Button("Edit...", [this] { Edit(); });
    form.Button("Create...", [this] { Create(); }).Beside();
    if (auto* zone = n.Important(kSaturatedZone))
      form.Check("Use Fracture well option", zone->FractureWells)
          .Of(*zone, "FractureWells")
          .ShownWhen(WithEngine({kEngineModflowSurfact}))
          .EnabledWhen(On(zone->Wells));
    form.Notice([&n] { return WellFaults(n.Filename); });
    form.Check("Show well location map", n.IncludeMap);
    Control& map = form.Map([&n] {
      MapContent content = DomainMap(n);
      for (GridLayer& grid : content.grids) grid.withLegend = false;
      CTvnWellDataList wells;
      if (!n.Filename.IsEmpty() && wells.LoadWellDataFile(n.Filename.Absolute())) AddWells(content, wells.Wells());
      return content;
    });
    map.label = n.GetTitle();
    map.ShownWhen(On(n.IncludeMap));
  }

 private:
  void Edit() {
    const FileName& file = Node().Filename;
    AllowRequest(Node(), file, &EditorRequests::layers);
    if (file.IsEmpty()) return;
    if (!WhyNotReadable(file.Absolute()).empty())
      Outside().ShowMessage("The pumping-well file is missing", Host::Icon::Error);
    else
      Outside().OpenInEditor(file.Absolute());
  }

  void Create() {
    CSZWellKvf& n = Node();
    Host::FileQuestion question;
    question.title = "Create Well File";
    question.filter = kWellFilter;
    question.defaultExtension = "WEL";
    const auto file = CreateFileByDialog(*this, std::move(question), n.Filename,
                                         [&n](const std::string& path) { return n.CreateWellFile(path); });
    if (!file) return;
    n.SetFilename(*file);
    UpdateDoc(kDataChanged, "Create Well File");
  }
};

}  // namespace

std::span<const PageRow> WellPages() {
  static constexpr PageRow kRows[] = {PageIs<CSZWellDlg, CSZWellKvf>(kWellsPage)};
  return kRows;
}

}  // namespace tervane
