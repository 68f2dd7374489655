// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/results/storing_pages.h"

#include <map>

#include <fmt/format.h>

#include "document/flow_model_document.h"
#include "forms/table_of.h"
#include "forms/table_rows.h"
#include "results/pages.h"
#include "results/storing.h"
#include "results/storing_cost.h"
#include "results/tick_presets.h"
#include "simspec/conditions.h"

namespace tervane {

namespace {

// ---- What is stored, and how often

/// An interval whose label and field follow rules of their own.
void Interval(PageForm& form, const char* label, const Condition& labelled, float& interval, const Condition& enabled) {
  form.Label(label).EnabledWhen(labelled);
  form.Number("", interval).Beside().EnabledWhen(enabled).ToolTip(label);
}

void DescribeWaterMovement(PageForm& form, CStoringResultsKvf& n) {
  const Condition withGround = Component(&CModelCompKvf::SZ);
  PageForm& group = form.Group("Water Movement Output");
  PageForm& intervals = group.Group("Storing interval for grid series output");
  intervals.Number("Overland (OL):", n.WM_OverlandFrequency).EnabledWhen(Component(&CModelCompKvf::OL));
  intervals.Shown("", [&n] { return n.GetWaterMovementLabel() + ":"; });
  intervals.Number("", n.WM_PrecFrequency).Beside().ToolTip("Precipitation, snow melt, ET and UZ");
  intervals.Number("SZ-Heads:", n.WM_FHeadsFrequency).EnabledWhen(withGround);
  intervals.Number("SZ-Fluxes:", n.WM_FluxesFrequency).EnabledWhen(withGround);
}

void DescribeWaterQuality(PageForm& form, CStoringResultsKvf& n) {
  const Condition overland = WaterQualityComponent(&CModelCompWQKvf::OL),
                  soil = WaterQualityComponent(&CModelCompWQKvf::UZ),
                  ground = WaterQualityComponent(&CModelCompWQKvf::SZ);
  const Condition particles = Method(&CModelCompKvf::ADPTRadio, kParticleTracking);
  PageForm& group = form.Group("Water Quality output", Component(&CModelCompKvf::WQ));
  PageForm& grids = group.Group("Storing interval for grid series output");
  Interval(grids, "Overland (OL):", overland && Component(&CModelCompKvf::OL), n.WQ_OverlandFrequency, overland);
  Interval(grids, "Unsaturated Zone:", soil && Component(&CModelCompKvf::UZ), n.WQ_UnsaturatedZoneFrequency, soil);
  Interval(grids, "Saturated Zone:", ground && Component(&CModelCompKvf::SZ), n.WQ_SaturatedZoneFrequency,
           ground || particles);
  PageForm& balance = group.Group("Storing interval for mass balance output");
  balance.Number("Time Series:(.nds0)", n.WQ_TimeSeriesFrequency);
  balance.Number("Summary(ASCII)", n.WQ_SummaryFrequency);
  PageForm& tracks = group.Group("Storing of PT results");
  tracks.Check("Save intermediate particle locations", n.PTLocationFile).EnabledWhen(particles);
  tracks.Check("Save particle location history as a shape file", n.PTHistoryShapeFile).EnabledWhen(particles);
  tracks.Number("Minimum output time step (hrs)", n.MinPTLocationFrequency)
      .Unit("")
      .EnabledWhen(particles && On(n.PTLocationFile));
}

void DescribeStoring(PageForm& form, CStoringResultsKvf& n) {
  const Condition storesInput = !(Component(&CModelCompKvf::WQ) && OwnEngine());
  const Condition storesHotStart = On(n.HotStartData);
  form.Radio("", n.ResultUnitRadio);
  form.Check("Storing of input data for WQ simulation", n.ADInputData).EnabledWhen(storesInput);
  form.Radio("", n.AdRadio).EnabledWhen(storesInput && On(n.ADInputData));
  form.Check("Storing of Water balance", n.WaterBalance);
  form.Check("Storing of Hot start data", n.HotStartData);
  form.Check("Only store Hot start data at the end of simulation", n.OnlyStoreHotDataAtEndOfSimulation)
      .EnabledWhen(storesHotStart);
  form.Number("Hot start storing interval:", n.HotstartStoringTimestep_Hrs)
      .Unit("")
      .EnabledWhen(storesHotStart && !On(n.OnlyStoreHotDataAtEndOfSimulation));
  form.Label("(hrs)").Beside().EnabledWhen(storesHotStart);
  DescribeWaterMovement(form, n);
  DescribeWaterQuality(form, n);
}

// ---- The types on grids

class COutputGridSeriesListDlg : public PageOf<COutputGridSeriesListKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;

 private:
  /// The rows as the setup has them now; each type keeps its row.
  std::vector<GridSeriesRow*> Rows();
  std::string SizeOf(const GridSeriesRow& row) const;
  /// What all stored types take, file by file, and what the disk has left.
  std::string CostText() const;

  std::map<int, GridSeriesRow> rows_;
  std::optional<CostOfTypes> costs_;
};

std::vector<GridSeriesRow*> COutputGridSeriesListDlg::Rows() {
  if (const auto* storing = Node().Important(kStoringResults)) costs_.emplace(*storing);
  std::vector<GridSeriesRow*> rows;
  for (GridSeriesRow& row : Node().Rows()) rows.push_back(&(rows_[row.type->newDataType] = std::move(row)));
  return rows;
}

std::string COutputGridSeriesListDlg::SizeOf(const GridSeriesRow& row) const {
  if (!costs_ || !ResultCatalogue::Own().FileOf(*row.type)) return {};
  const std::optional<double> bytes = costs_->Of(*row.type).Bytes();
  return bytes ? SizeInWords(*bytes) : "not known";
}

std::string COutputGridSeriesListDlg::CostText() const {
  const auto* storing = Node().Important(kStoringResults);
  if (!storing) return {};
  const StoringCost cost = ForecastCost(*storing, Node().Rows());
  std::string text = cost.Text();
  for (const FileCost& file : cost.files)
    text += fmt::format("{}{} {}", &file == &cost.files.front() ? ": " : ", ", file.file->suffix,
                        file.unknownTypes == file.types ? "not known" : SizeInWords(file.bytes));
  // Of the disk that the results will be on, where it is known what they take.
  if (Context().document.PathName().empty() || !(cost.bytes > 0)) return text;
  if (const auto free = FreeBytesAt(ResolvedPath(Context().document.getResultFolder(), {})))
    text +=
        fmt::format(". The disk has {} left{}", SizeInWords(*free), cost.bytes > *free ? ", which is too little" : "");
  return text;
}

void COutputGridSeriesListDlg::Describe(PageForm& form) {
  COutputGridSeriesListKvf& n = Node();
  if (const auto* document = dynamic_cast<const CFlowModelDoc*>(&Context().document))
    n.SetIndexPath(document->GridSeriesIndex());
  form.FollowWhenShown([&n] { return n.RefreshItems(); });
  bool isFirst = true;
  for (const TickPreset& preset : TickPresets()) {
    Control& button = form.Button(preset.label, [this, &preset] {
      if (TakePreset(Node(), preset)) UpdateDoc(kDataChanged, preset.action);
    });
    button.ToolTip(preset.toolTip);
    if (!std::exchange(isFirst, false)) button.Beside();
  }
  auto table = std::make_shared<TableOf<GridSeriesRow>>(
      std::make_shared<ArrangedRows<GridSeriesRow>>([this] { return Rows(); }));
  table->ItemName("Type");
  table->KeepRows();
  table
      ->Value(
          "Enable", [](const GridSeriesRow& row) { return row.IsStored(); },
          [&n](GridSeriesRow& row, bool isTicked) {
            n.SetTicked(row.type->newDataType, isTicked);
            row.isTicked = isTicked;
          })
      .Key("DataType")
      .Width(60)
      .GreyWhen([](const GridSeriesRow& row) { return !row.requiredFor.empty(); });
  const auto name = [](const GridSeriesRow& row) { return std::string(row.type->name); };
  table->Value("Item", name).Width(330).ToolTipOf(name);
  table->Value("Required for", [](const GridSeriesRow& row) { return row.requiredFor; }).Width(160);
  const auto file = [](const GridSeriesRow& row) { return row.fileName; };
  table->Value("Filename", file).Width(260).ToolTipOf(file);
  table->Value("Size", [this](const GridSeriesRow& row) { return SizeOf(row); })
      .Width(90)
      .ToolTip("By the setup: what the type will take in its file, where it is stored");
  form.Table(table);
  form.Notice([this] { return CostText(); });
}

}  // namespace

std::span<const PageRow> StoringPages() {
  static constexpr PageRow kRows[] = {
      DescribedBy<DescribeStoring>(kStoringResultsPage),
      PageIs<COutputGridSeriesListDlg, COutputGridSeriesListKvf>(kGridSeriesPage),
  };
  return kRows;
}

}  // namespace tervane
