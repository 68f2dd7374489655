// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/results/viewer_pages.h"

#include <algorithm>
#include <map>

#include <fmt/format.h>

#include "document/flow_model_document.h"
#include "pages/parts/passport_notice.h"
#include "platform/paths.h"
#include "results/result_nodes.h"
#include "results/viewer_setup.h"

namespace tervane {

namespace {

/// Catalogues that cannot be used are told once for each file as it stands, not whenever a page looks at them.
bool IsToldAnew(const CatalogueProblem& problem) {
  static std::map<std::string, FileStamp> told;
  const FileStamp stamp = StampOf(problem.path);
  const auto [place, isNew] = told.try_emplace(problem.path, stamp);
  return isNew || std::exchange(place->second, stamp) != stamp;
}

/// The gridded results of a run.
class CResultViewerDlg : public PageOf<CResultViewerKvf> {
 public:
  using PageOf::PageOf;

  void SetData() override;
  void OnRefresh() override { Read(); }

 protected:
  void Describe(PageForm& form) override;

 private:
  struct Row {
    StoredItem item;
    bool withVectors = false;
  };

  std::shared_ptr<TableOf<Row>> CResultViewerGrid();
  void Read();
  void View(const Row& row);

  StoredItems stored_;
  std::vector<Row> rows_;
  std::string notice_;
};

std::shared_ptr<TableOf<CResultViewerDlg::Row>> CResultViewerDlg::CResultViewerGrid() {
  auto table = std::make_shared<TableOf<Row>>(rows_);
  table->KeepRows();
  table->Value("Item", [](Row& row) { return row.item.name; }).Width(220).GreyWhen([](Row&) { return true; });
  table->Value("Add XY-flow\nvectors", &Row::withVectors)
      .Width(72)
      .GreyWhen([](Row& row) { return !row.item.mayHaveVectors; })
      .Hint(kViewOnly);
  table->Button("", "View result...", [this](Row& row) { View(row); }).Width(90);
  table->Value("Filename", [](Row& row) { return row.item.path; }).Width(340);
  return table;
}

void CResultViewerDlg::Describe(PageForm& form) {
  DescribePassport(form, *this);
  form.Integer("Layer number:", Node().LayerNo)
      .ToolTip("The layer of results with layers that the viewer shows first, counted from the top");
  form.Notice([this] { return notice_; });
  form.Table(CResultViewerGrid());
}

void CResultViewerDlg::SetData() { Read(); }

void CResultViewerDlg::Read() {
  const auto* document = dynamic_cast<const CFlowModelDoc*>(&Context().document);
  const auto* components = Node().Important(kModelComponents);
  if (!document || !components) return;
  if (document->PathName().empty()) {
    notice_ = "The setup was never saved, so that no results lie beside it.";
    return;
  }
  std::vector<CatalogueProblem> problems;
  const CatalogueFiles files{ResolvedPath(document->SimulationCatalogue(), {}),
                             ResolvedPath(document->WaterQualityCatalogue(), {})};
  stored_ = ReadCatalogues(*components, files, problems);
  std::vector<Row> rows;
  for (const StoredItem& item : stored_.items) {
    const auto before = std::ranges::find(rows_, item, &Row::item);
    rows.push_back({item, before != rows_.end() && before->withVectors});
  }
  rows_ = std::move(rows);

  notice_.clear();
  for (const CatalogueProblem& problem : problems) {
    if (IsToldAnew(problem)) Outside().ShowMessage(problem.text, Host::Icon::Warning);
    notice_ += (notice_.empty() ? "" : "\n\n") + problem.text;
  }
  if (problems.empty() && rows_.empty())
    notice_ = fmt::format("There are no gridded results yet: a run names them in {}.", files.simulation);
}

void CResultViewerDlg::View(const Row& row) {
  const auto* overlays = Node().Important(kOverlays);
  if (!overlays) return;
  const std::string path = ResolvedPath(ViewerSetupFile(Context().document.getResultFolder(), row.item.name), {});
  const auto open = [&] { Outside().OpenInEditor(path); };
  if (FileExists(path)) {
    const auto answer =
        Outside().Ask("Do you want to overwrite the existing Results Viewer setup file for this item?\n" + path,
                      Host::Icon::Question, Host::Buttons::YesNoCancel);
    if (answer == Host::Answer::No) open();
    if (answer != Host::Answer::Yes) return;
  }
  const DisplayUnits baseUnits;
  const ViewerSetup setup{stored_,        row.item,  row.withVectors,
                          Node().LayerNo, *overlays, Context().displayUnits ? *Context().displayUnits : baseUnits};
  if (const std::string error = WriteViewerSetup(path, setup); !error.empty())
    Outside().ShowMessage(fmt::format("Could not create result viewer input file:\n{}\n\n{}", path, error),
                          Host::Icon::Error);
  else
    open();
}

}  // namespace

std::span<const PageRow> ViewerPages() {
  static constexpr PageRow kRows[] = {PageIs<CResultViewerDlg, CResultViewerKvf>(kResultViewerPage)};
  return kRows;
}

}  // namespace tervane
