// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/execution/processed_pages.h"

#include <algorithm>
#include <cstdlib>
#include <iterator>
#include <tuple>

#include <fmt/format.h>

#include "data/datafile.h"
#include "document/flow_model_document.h"
#include "execution/pages.h"
#include "pages/parts/file_controls.h"
#include "pages/parts/plot_content.h"
#include "platform/item_types.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

constexpr const char* kNoFile = "The report names no file here.";
constexpr int kElevation = 100180;

/// The page of the ground's elevation in the report that holds a page; null when it has none.
const CPreprocessedDataEntity* ReportedTopography(const CYbSEKvfBase& page) {
  for (const CYbSEKvfBase* above = page.GetParent(); above; above = above->GetParent())
    for (const CYbSEKvfBase* child = above->GetFirstChild(); child; child = above->GetNextChild(child))
      if (const auto* grid = dynamic_cast<const CPreprocessedNDS2_PLOTkvf*>(child);
          grid && grid->GetTitle() == "Topography")
        return grid;
  return nullptr;
}

/// Up to six numbers separated by commas: year, month, day, hour, minute, second. What is missing or empty is 0.
CYbDateTime ParseListedDate(std::string_view text) {
  int fields[6] = {};
  for (int& field : fields) {
    const std::size_t comma = std::min(text.find(','), text.size());
    field = std::atoi(std::string(text.substr(0, comma)).c_str());
    text.remove_prefix(std::min(comma + 1, text.size()));
  }
  return {fields[0], fields[1], fields[2], fields[3], fields[4], fields[5]};
}

}  // namespace

void CProcDataDlg::Describe(PageForm& form) {
  const auto manager = [this] { return Node().Manager(); };
  form.ReadOnlyText("Report:", [manager] { return manager() ? manager()->Path() : std::string(); });
  form.Notice([manager] {
    return manager() ? manager()->StateText() : "The setup was never saved, so that nothing lies beside it.";
  });
}

void PreprocessedFilePage::DescribeFile(PageForm& form) {
  form.ReadOnlyText("Filename:", [this] { return Node().GetFile(); });
}

// ---- Time series

void CPreprocessedNDS0_PLOTDlg::Describe(PageForm& form) {
  DescribeFile(form);
  form.Button("Edit...",
              [this] {
                if (const std::string file = Node().GetFile(); !file.empty() && Context().openDataFile)
                  Context().openDataFile(file);
              })
      .ToolTip("Use time series editor to view time series data");
  form.Notice([this] {
    std::string notice;
    SeriesContent unused;
    ReadPeriod(notice, unused);
    return notice;
  });
  form.Chart([this] { return Chart(); });
}

void CPreprocessedNDS0_PLOTDlg::ReadPeriod(std::string& notice, SeriesContent& chart) const {
  const std::string &start = Node().GetValue("StartDate"), &end = Node().GetValue("EndDate");
  if (start.empty() || end.empty()) return;
  const CYbDateTime from = ParseListedDate(start), to = ParseListedDate(end);
  for (const auto& [key, text, date] : {std::tuple("StartDate", start, from), std::tuple("EndDate", end, to)})
    if (!date.IsValid())
      notice = fmt::format("{} = {} in the report is no date: the simulation period is not shown.", key, text);
  if (notice.empty()) chart.period = {from, to};
}

SeriesContent CPreprocessedNDS0_PLOTDlg::Chart() const {
  CTvnData0DFile file("TIME_SERIES_FILE", nullptr);
  file.File = FileName(Node().GetFile(), {});
  file.Items = {Item()};
  SeriesContent chart = FileChart(file);
  if (file.File.IsEmpty()) chart.message = kNoFile;
  std::string notice;
  ReadPeriod(notice, chart);
  return chart;
}

// ---- Grids

void CProcDataGridAndRiverPlot::AddLines(ShapeLayer layer) {
  // The grid stays in view, wherever a river may lead.
  if (!map_.grids.empty() && !map_.area) map_.area = map_.grids.front().grid->GetEnvelope();
  map_.shapes.push_back(std::move(layer));
}

void CProcDataGridAndRiverPlot::Add(const CProcDataRiverLinkOverlay& links) {
  AddLines({links.Lines(), {}, CProcDataRiverLinkOverlay::kColor, CProcDataRiverLinkOverlay::kPenWidth});
}

void CProcDataGridAndRiverPlot::Add(const CProcDataRiverPointOverlay& points) { AddLines({points.Lines(), {}}); }

void CPreprocessedNDS2_PLOT::Describe(PageForm& form) {
  DescribeFile(form);
  form.Button("Edit...", [this] { EditDataFile(Context(), Node(), FileName(Node().GetFile(), {}), Item()); })
      .ToolTip("Use grid editor to view preprocessed grid data");
  form.Notice([this] { return riverProblem_; });
  form.Map([this] { return Map(); });
}

void CPreprocessedNDS2_PLOT::SetData() {
  if (!isRiverRead_) ReadRiver();
}

void CPreprocessedNDS2_PLOT::OnRefresh() { ReadRiver(); }

void CPreprocessedNDS2_PLOT::ReadRiver() {
  isRiverRead_ = true;
  riverProblem_.clear();
  links_.reset();
  points_.reset();
  const auto* document = dynamic_cast<const CFlowModelDoc*>(&Context().document);
  if (Node().GetNumber("RIVER_OVERLAY") < 1 || !document || document->PathName().empty()) return;
  ProcessedRiver river;
  if (const auto result = ReadProcessedRiver(ResolvedPath(document->PreprocessedRiverData(), {}), river);
      !result.Ok()) {
    riverProblem_ = result.message;
    if (!Context().isReplacement) Outside().Tell(result.message, Host::Icon::Warning);
    return;
  }
  if (river.firstLinks && river.secondLinks) links_.emplace(*river.firstLinks, *river.secondLinks);
  if (!river.flags.empty()) points_.emplace(river.flags, river.x, river.y);
}

MapContent CPreprocessedNDS2_PLOT::Map() {
  const std::string path = Node().GetFile();
  if (path.empty()) return GridMap(Node(), nullptr, kNoFile);
  MapContent map = GridFileMap(Node(), path, Item());
  // A network alone would hide why there is no grid.
  if (map.grids.empty()) return map;
  CProcDataGridAndRiverPlot plot(std::move(map));
  if (links_) plot.Add(*links_);
  if (points_) plot.Add(*points_);
  return plot.Take();
}

// ---- Layers

void CPreprocessedNDS3_PLOTDlg::Describe(PageForm& form) {
  DescribeFile(form);
  form.Choice(
          "Layer:", [this] { return selection_; }, [this](int layer) { selection_ = layer; },
          [this] {
            std::vector<std::string> names;
            for (int layer = 1; layer <= layers_; ++layer)
              names.push_back(fmt::format("Computational Layer {}", layer));
            return names;
          })
      .EnabledWhen("the report leaves the layer open", [this] { return !HasFixedLayer(); })
      .Hint(kViewOnly);
  form.Button("Edit...", [this] { EditDataFile(Context(), Node(), FileName(Node().GetFile(), {}), Item()); })
      .ToolTip("Use grid editor to view preprocessed grid data");
  const Condition areLayers = Sentence("the file has layers", [this] { return areElevations_ && layers_ > 0; });
  section_.DescribeButtons(form, areLayers);
  form.Map([this] { return Map(); });
  section_.DescribeSection(
      form, [this] { return Section(); }, areLayers);
}

void CPreprocessedNDS3_PLOTDlg::SetData() {
  if (isRead_) return;
  isRead_ = true;
  areElevations_ = false;
  layers_ = 0;
  DataFile file;
  const std::string path = Node().GetFile();
  problem_ = path.empty() ? kNoFile : file.Open(path);
  if (problem_.empty()) {
    const int number = Item(), count = static_cast<int>(file.Items().size());
    if (number < 1 || number > count)
      problem_ = fmt::format("{}: there is no item {}: the file has {}", path, number, count);
    else if (const DataItem& item = file.Items()[static_cast<std::size_t>(number - 1)]; item.dimensions != 3)
      problem_ = fmt::format("{}: item {} has no layers", path, number);
    else {
      layers_ = item.geometry.nz;
      areElevations_ = item.itemType == kElevation;
    }
  }
  if (HasFixedLayer()) selection_ = Node().GetNumber("LayerNo") - 1;
  selection_ = std::clamp(selection_, 0, std::max(layers_ - 1, 0));
}

void CPreprocessedNDS3_PLOTDlg::OnRefresh() {
  isRead_ = false;
  SetData();
}

MapContent CPreprocessedNDS3_PLOTDlg::Map() const {
  if (layers_ == 0) return GridMap(Node(), nullptr, problem_);
  // The file counts its layers from the bottom.
  MapContent map = GridFileMap(Node(), Node().GetFile(), Item(), {0, layers_ - selection_ - 1});
  section_.PutOn(map);
  return map;
}

SectionContent CPreprocessedNDS3_PLOTDlg::Section() const {
  SectionContent section;
  const CPreprocessedDataEntity* topography = ReportedTopography(Node());
  if (!topography) {
    section.message = "The report has no page of the topography, below which layers could be shown.";
    return section;
  }
  const auto take = [&section](MapContent map) {
    std::ranges::move(map.awaited, std::back_inserter(section.awaited));
    if (map.grids.empty() && !map.message.empty()) section.message = map.message;
    return map.grids.empty() ? nullptr : map.grids.front().grid;
  };
  section.ground = take(GridFileMap(*topography, topography->GetFile(), topography->GetNumber("ItemNo")));
  for (int layer = 1; layer <= layers_; ++layer)
    if (auto bottom = take(GridFileMap(Node(), Node().GetFile(), Item(), {0, layers_ - layer})))
      section.surfaces.push_back({fmt::format("Computational Layer {}", layer), std::move(bottom)});
  return section;
}

// ---- Texts and shapes

void CPreprocessedTextDlg::Describe(PageForm& form) {
  form.TextView("", [this] { return Replaced(Replaced(Node().GetValue("Text"), "\\n", "\r\n"), "\\r", "\r"); });
}

void CPreprocessedTXTFILEDlg::Describe(PageForm& form) {
  DescribeFile(form);
  form.TextFile([this] { return Node().GetFile(); });
}

void CPreprocessedSHAPE_PLOTDlg::Describe(PageForm& form) {
  DescribeFile(form);
  form.Map([this] {
    CData2DShpFile file(nullptr);
    file.File = FileName(Node().GetFile(), {});
    const int unit = Node().GetNumber("enuAxisUnit");
    MapContent map = ShapeFileMap(file, unit ? unit : BaseUnit(*FindItemType(quantity::kMapCoordinate)).key);
    if (file.File.IsEmpty()) map.message = kNoFile;
    return map;
  });
}

namespace {

constexpr PageRow kPages[] = {
    PageIs<CProcDataDlg, CProcDataKvf>(kProcDataPage),
    PageIs<CPreprocessedBlankDlg, CPreprocessedDataEntity>(kPreprocessedBlankPage),
    PageIs<CPreprocessedNDS0_PLOTDlg, CPreprocessedDataEntity>(kPreprocessedNds0Page),
    PageIs<CPreProcessedNDS1_PLOTDlg, CPreprocessedDataEntity>(kPreprocessedNds1Page),
    PageIs<CPreprocessedNDS2_PLOT, CPreprocessedDataEntity>(kPreprocessedNds2Page),
    PageIs<CPreprocessedNDS3_PLOTDlg, CPreprocessedDataEntity>(kPreprocessedNds3Page),
    PageIs<CPreprocessedTextDlg, CPreprocessedDataEntity>(kPreprocessedTextPage),
    PageIs<CPreprocessedTXTFILEDlg, CPreprocessedDataEntity>(kPreprocessedTextFilePage),
    PageIs<CPreprocessedSHAPE_PLOTDlg, CPreprocessedDataEntity>(kPreprocessedShapePage),
};

}  // namespace

std::span<const PageRow> ProcessedPages() { return kPages; }

}  // namespace tervane
