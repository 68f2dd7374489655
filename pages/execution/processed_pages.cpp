// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/execution/processed_pages.h"

#include <algorithm>
#include <cstdlib>
#include <iterator>
#include <optional>
#include <tuple>

#include <fmt/format.h>

#include "data/datafile.h"
#include "document/flow_model_document.h"
#include "execution/pages.h"
#include "execution/processed_data.h"
#include "execution/processed_pages.h"
#include "execution/processed_river.h"
#include "forms/plots.h"
#include "pages/parts/file_controls.h"
#include "pages/parts/further_series.h"
#include "pages/parts/passport_notice.h"
#include "pages/parts/plot_content.h"
#include "pages/parts/section_tool.h"
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
      if (child->GetDlgRuntimeClass(kProcessedDataTree) == &kPreprocessedNds2Page && child->GetTitle() == "Topography")
        return dynamic_cast<const CPreprocessedDataEntity*>(child);
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

/// Which item of its file a page shows.
int ItemOf(const CPreprocessedDataEntity& n) { return n.GetNumber("ItemNo"); }

/// Where the report lies, and what was read of it.
void DescribeReport(PageForm& form, CProcDataKvf& n, CYbSEDlgBase& page) {
  DescribeStale(form, page);
  const auto manager = [&n] { return n.Manager(); };
  form.ReadOnlyText("Report:", [manager] { return manager() ? manager()->Path() : std::string(); });
  form.Notice([manager] {
    return manager() ? manager()->StateText() : "The setup was never saved, so that nothing lies beside it.";
  });
}

/// A page without content, which has pages below it.
void DescribeNothing(PageForm& /*form*/, CPreprocessedDataEntity& /*n*/) {}

/// The name of a page's file; of a line nothing else is shown. What is older than its inputs is told.
void DescribeFile(PageForm& form, CPreprocessedDataEntity& n, CYbSEDlgBase& page) {
  DescribeStale(form, page);
  form.ReadOnlyText("Filename:", [&n] { return n.GetFile(); });
}

/// The button that opens the file of grids.
void EditGridButton(PageForm& form, CPreprocessedDataEntity& n, const CYbSEDlgBase& page) {
  form.Button("Edit...", [&n, &page] { EditDataFile(page.Context(), n, FileName(n.GetFile(), {}), ItemOf(n)); })
      .ToolTip("Use grid editor to view preprocessed grid data");
}

// ---- Time series

/// Puts the period that the report tells into the chart; nothing, with the reason in `notice`, where it is none.
void ReadPeriod(const CPreprocessedDataEntity& n, std::string& notice, SeriesContent& chart) {
  const std::string &start = n.GetValue("StartDate"), &end = n.GetValue("EndDate");
  if (start.empty() || end.empty()) return;
  const CYbDateTime from = ParseListedDate(start), to = ParseListedDate(end);
  for (const auto& [key, text, date] : {std::tuple("StartDate", start, from), std::tuple("EndDate", end, to)})
    if (!date.IsValid())
      notice = fmt::format("{} = {} in the report is no date: the simulation period is not shown.", key, text);
  if (notice.empty()) chart.period = {from, to};
}

/// The series that a node of the report names.
void PutSeries(const CPreprocessedDataEntity& n, CTvnData0DFile& file) {
  file.File = FileName(n.GetFile(), {});
  file.Items = {ItemOf(n)};
}

SeriesContent SeriesChart(const CPreprocessedDataEntity& n) {
  CTvnData0DFile file("TIME_SERIES_FILE", nullptr);
  PutSeries(n, file);
  SeriesContent chart = FileChart(file);
  if (file.File.IsEmpty()) chart.message = kNoFile;
  std::string notice;
  ReadPeriod(n, notice, chart);
  return chart;
}

/// A time series with the simulation period.
void DescribeSeries(PageForm& form, CPreprocessedDataEntity& n, CYbSEDlgBase& page) {
  DescribeFile(form, n, page);
  form.Button("Edit...", [&n, &page] { page.Outside().OpenInEditor(n.GetFile()); })
      .ToolTip("Use time series editor to view time series data");
  form.Notice([&n] {
    std::string notice;
    SeriesContent unused;
    ReadPeriod(n, notice, unused);
    return notice;
  });
  form.Chart(WithFurtherSeries([&n] { return SeriesChart(n); },
                               [&n] {
                                 CTvnData0DFile file("TIME_SERIES_FILE", nullptr);
                                 PutSeries(n, file);
                                 return OffersBeside(file, {}, {});
                               }));
}

// ---- Grids

/// Adds a part of the river network to the map of a grid.
void AddRiver(MapContent& map, ShapeLayer layer) {
  // The grid stays in view, wherever a river may lead.
  if (!map.grids.empty() && !map.area) map.area = map.grids.front().grid->GetEnvelope();
  map.shapes.push_back(std::move(layer));
}

/// A grid, with the river network where the report asks for it.
class CPreprocessedNDS2_PLOT : public PageOf<CPreprocessedDataEntity> {
 public:
  using PageOf::PageOf;

  void SetData() override;
  /// Reads the river network again.
  void OnRefresh() override { ReadRiver(); }

 protected:
  void Describe(PageForm& form) override;

 private:
  MapContent Map();
  void ReadRiver();

  bool isRiverRead_ = false;
  std::string riverProblem_;
  std::optional<CProcDataRiverLinkOverlay> links_;
  std::optional<CProcDataRiverPointOverlay> points_;
};

void CPreprocessedNDS2_PLOT::Describe(PageForm& form) {
  DescribeFile(form, Node(), *this);
  EditGridButton(form, Node(), *this);
  form.Notice([this] { return riverProblem_; });
  form.Map([this] { return Map(); });
}

void CPreprocessedNDS2_PLOT::SetData() {
  if (!isRiverRead_) ReadRiver();
}

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
    if (!Context().isReplacement) Outside().ShowMessage(result.message, Host::Icon::Warning);
    return;
  }
  if (river.firstLinks && river.secondLinks) links_.emplace(*river.firstLinks, *river.secondLinks);
  if (!river.flags.empty()) points_.emplace(river.flags, river.x, river.y);
}

MapContent CPreprocessedNDS2_PLOT::Map() {
  const std::string path = Node().GetFile();
  if (path.empty()) return GridMap(Node(), nullptr, kNoFile);
  MapContent map = GridFileMap(Node(), path, ItemOf(Node()));
  // A network alone would hide why there is no grid.
  if (map.grids.empty()) return map;
  if (links_)
    AddRiver(map, {links_->Lines(), {}, CProcDataRiverLinkOverlay::kColor, CProcDataRiverLinkOverlay::kPenWidth});
  if (points_) AddRiver(map, {points_->Lines(), {}});
  return map;
}

// ---- Layers

/// One of several layers of grids, counted from the top. Elevations are bottoms of layers, which a section shows below
/// the topography of the report.
class CPreprocessedNDS3_PLOTDlg : public PageOf<CPreprocessedDataEntity> {
 public:
  CPreprocessedNDS3_PLOTDlg(CYbSEKvfBase& node, const PageContext& context)
      : PageOf(node, context), section_(Context().syncSoon) {}

  void SetData() override;
  /// Looks at the file's layers again.
  void OnRefresh() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  bool HasFixedLayer() const { return !Node().GetValue("LayerNo").empty(); }
  MapContent Map() const;
  SectionContent Section() const;

  SectionTool section_;
  bool isRead_ = false;
  bool areElevations_ = false;
  int layers_ = 0;
  int selection_ = 0;  ///< 0 for the top.
  std::string problem_;
};

void CPreprocessedNDS3_PLOTDlg::Describe(PageForm& form) {
  DescribeFile(form, Node(), *this);
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
  EditGridButton(form, Node(), *this);
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
    const int number = ItemOf(Node()), count = static_cast<int>(file.Items().size());
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
  MapContent map = GridFileMap(Node(), Node().GetFile(), ItemOf(Node()), {0, layers_ - selection_ - 1});
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
  if (auto ground = take(GridFileMap(*topography, topography->GetFile(), topography->GetNumber("ItemNo"))))
    section.ground = Level{std::move(ground)};
  for (int layer = 1; layer <= layers_; ++layer)
    if (auto bottom = take(GridFileMap(Node(), Node().GetFile(), ItemOf(Node()), {0, layers_ - layer})))
      section.surfaces.push_back({fmt::format("Computational Layer {}", layer), {std::move(bottom)}});
  return section;
}

// ---- Texts and shapes

/// A text of the report.
void DescribeText(PageForm& form, CPreprocessedDataEntity& n) {
  form.TextView("", [&n] { return Replaced(Replaced(n.GetValue("Text"), "\\n", "\r\n"), "\\r", "\r"); });
}

void DescribeTextFile(PageForm& form, CPreprocessedDataEntity& n, CYbSEDlgBase& page) {
  DescribeFile(form, n, page);
  form.TextFile([&n] { return n.GetFile(); });
}

void DescribeShapes(PageForm& form, CPreprocessedDataEntity& n, CYbSEDlgBase& page) {
  DescribeFile(form, n, page);
  form.Map([&n] {
    CData2DShpFile file(nullptr);
    file.File = FileName(n.GetFile(), {});
    const int unit = n.GetNumber("enuAxisUnit");
    MapContent map = ShapeFileMap(file, unit ? unit : BaseUnit(*FindItemType(quantity::kMapCoordinate)).key);
    if (file.File.IsEmpty()) map.message = kNoFile;
    return map;
  });
}

}  // namespace

std::span<const PageRow> ProcessedPages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeReport>(kProcDataPage),
      DescribedBy<DescribeNothing>(kPreprocessedBlankPage),
      DescribedBy<DescribeSeries>(kPreprocessedNds0Page),
      DescribedBy<DescribeFile>(kPreprocessedNds1Page),
      PageIs<CPreprocessedNDS2_PLOT, CPreprocessedDataEntity>(kPreprocessedNds2Page),
      PageIs<CPreprocessedNDS3_PLOTDlg, CPreprocessedDataEntity>(kPreprocessedNds3Page),
      DescribedBy<DescribeText>(kPreprocessedTextPage),
      DescribedBy<DescribeTextFile>(kPreprocessedTextFilePage),
      DescribedBy<DescribeShapes>(kPreprocessedShapePage),
  };
  return kRows;
}

}  // namespace tervane
