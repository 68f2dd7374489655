// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/data2d_pages.h"

#include <limits>

#include <fmt/format.h>

#include "pages/parts/create_dialogs.h"
#include "pages/parts/decay_rate.h"
#include "pages/parts/file_controls.h"
#include "pages/parts/ground_views.h"
#include "pages/parts/plot_content.h"
#include "platform/item_types.h"
#include "platform/units.h"
#include "spatial/cell_totals.h"
#include "spatial/data2d.h"
#include "spatial/pages.h"

namespace tervane {

namespace {

/// Any quantity with one value for each cell of the model.
class CData2DDlg : public PageOf<CData2DKvf> {
 public:
  using PageOf::PageOf;

  /// Builds the grid anew from its files.
  void OnRefresh() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  MapContent QuantityMap();
  MapContent Map();
  void DescribeTotals(PageForm& form);
  /// The adding up of what the quantity comes to; null where a total says nothing.
  std::shared_ptr<Computed<CellTotalsResult>> Totals();
  std::string TotalsNotice();
  /// Layer by layer.
  SeriesContent TotalsChart();

  std::optional<CellTotals> totals_;  ///< As they were asked for last.
  std::shared_ptr<Computed<CellTotalsResult>> sums_;
  GroundViews ground_{*this};
};

void CData2DDlg::OnRefresh() {
  Node().SetGridDataValid(0);
  Node().SetShapeDataValid(0);
  UpdateDoc(kDataChanged | kRefreshPlots, "Refresh Map");
}

MapContent CData2DDlg::QuantityMap() {
  CData2DKvf& n = Node();
  const bool isScattered = n.Type == CData2DKvf::kShapeFile || n.Type == CData2DKvf::kXyzFile;
  if (!n.ShowGridData && !(isScattered && n.ShowShapeData)) return {};
  if (const std::string why = n.WhyFileNotValid(); !why.empty()) return GridMap(n, nullptr, why);
  MapContent map = GridMap(n, n.ShowGridData ? n.GridComputation() : nullptr);
  if (!map.grids.empty()) map.grids.front().isCodes = n.IsCode();
  if (!isScattered || !n.ShowShapeData) return map;
  const auto shapes = n.ShapeComputation();
  if (auto data = NowOrAwaited(shapes, map.awaited))
    map.shapes.push_back({std::move(data), {}});
  else if (shapes->IsDone() && map.message.empty())
    map.message = shapes->Problem();
  return map;
}

MapContent CData2DDlg::Map() {
  MapContent map = QuantityMap();
  ground_.PutOn(map);
  return map;
}

std::shared_ptr<Computed<CellTotalsResult>> CData2DDlg::Totals() {
  const TotalsOfQuantities* above = TotalsAbove(Node());
  std::optional<CellTotals> now = above ? above->TotalsOf(Node()) : std::nullopt;
  if (now == totals_) return sums_;
  totals_ = std::move(now);
  sums_ = nullptr;
  if (totals_)
    sums_ = std::make_shared<Computed<CellTotalsResult>>(
        "Adding up the cells", [totals = *totals_](CellTotalsResult& result, ProgressPart progress) {
          return AddUpCells(totals, progress, result);
        });
  return sums_;
}

std::string CData2DDlg::TotalsNotice() {
  const auto sums = Totals();
  if (!sums) return {};
  // Nobody would come back to what is computed beside the window.
  if (!Context().syncSoon) sums->Run();
  if (!sums->IsDone()) return totals_->title + ": being added up";
  return sums->Result() ? TotalsText(*totals_, *sums->Result())
                        : fmt::format("{} is not known: {}", totals_->title, sums->Problem());
}

SeriesContent CData2DDlg::TotalsChart() {
  SeriesContent chart;
  chart.numbers = NumberAxis{"Layer", {}};
  const auto sums = Totals();
  const auto result = sums ? NowOrAwaited(sums, chart.awaited) : nullptr;
  if (!result) return chart;
  Series series;
  series.name = totals_->title;
  series.unit = totals_->unit;
  series.isStepped = true;
  for (std::size_t layer = 0; layer < result->layers.size(); ++layer) {
    const bool isKnown = totals_->layers[layer].problem.empty();
    const double sum = isKnown ? result->layers[layer].sum : std::numeric_limits<double>::quiet_NaN();
    // A step from the middle of a layer's number to that of the next.
    if (layer == 0) {
      series.positions.push_back(0.5);
      series.values.push_back(sum);
    }
    series.positions.push_back(static_cast<double>(layer) + 1.5);
    series.values.push_back(sum);
  }
  chart.series.push_back(std::move(series));
  return chart;
}

void CData2DDlg::DescribeTotals(PageForm& form) {
  const TotalsOfQuantities* above = TotalsAbove(Node());
  const std::optional<CellTotals> totals = above ? above->TotalsOf(Node()) : std::nullopt;
  if (!totals) return;
  form.Notice([this] { return TotalsNotice(); });
  if (!totals->isForArea) form.Chart([this] { return TotalsChart(); }).Caption("Layer by layer");
}

void CData2DDlg::Describe(PageForm& form) {
  CData2DKvf& n = Node();
  const Condition isUniform = Is(n.Type, CData2DKvf::kUniform), isGrid = Is(n.Type, CData2DKvf::kGridFile);
  const Condition isShape = Is(n.Type, CData2DKvf::kShapeFile), isXyz = Is(n.Type, CData2DKvf::kXyzFile);
  const Condition isScattered = isShape || isXyz;

  Control& source = form.Choice("Data Type:", n.Type).RevalidatesLater();
  if (!n.Kind().mayBeScattered) {
    std::vector<std::string> sources = source.Options();
    sources.resize(2);
    source.options = [sources] { return sources; };
  }
  if (n.IsCode()) {
    // Codes are whole numbers, whatever the file keeps them in.
    form.Integer(
            "Value", [&n] { return static_cast<int>(n.FixedValue); },
            [&n](int value) { n.FixedValue = static_cast<float>(value); })
        .Key("FixedValue")
        .ShownWhen(isUniform);
  } else {
    // Another quantity while the values are relative to ground.
    form.Number("Value", n.FixedValue).QuantityBy([&n] { return n.GetItemType(); }).ShownWhen(isUniform);
    if (n.Kind().itemType == quantity::kHalfLife)
      form.Shown("Rate (ln 2 / half life)", [&n] { return DecayRateText(n.FixedValue); }).ShownWhen(isUniform);
  }
  form.DataFile("Filename:", n.GridFile()).Filter(kGridFileFilter).DefaultExtension("nds2").ShownWhen(isGrid);
  form.ShapeFile("Filename:", n.ShapeFile()).Filter(kShapeFileFilter).DefaultExtension("shp").ShownWhen(isShape);
  form.File("Filename:", n.XyzFile().File)
      .Filter("XYZ files (*.txt) |*.txt|All Files (*.*) |*.*||")
      .DefaultExtension("txt")
      .ShownWhen(isXyz);
  form.Shown("Attribute:", [&n] { return n.GetNdsItemName(); }).ShownWhen(isGrid);
  form.Text(
          "Attribute:", [&n] { return n.ShapeFile().Attribute(); },
          [&n](const std::string& name) { n.ShapeFile().Choose(n.ShapeFile().File, name); })
      .Of(n.ShapeFile(), "ITEM_NUMBERS")
      .ShownWhen(isShape);
  form.Button("Edit...", [this] { EditDataFile(Context(), Node(), Node().GridFile().File); }).ShownWhen(isGrid);
  form.Button("Create...",
              [this] {
                CData2DKvf& node = Node();
                CData2DNdsCreateDlg dialog(Context(), node.FixedValue, node, node.GetItemType());
                if (const auto file = dialog.Run()) {
                  node.GridFile().Choose(*file);
                  UpdateDoc(kDataChanged, "Create Grid File");
                }
              })
      .Beside()
      .ShownWhen(isGrid);
  form.Button("Edit...", [this] { Outside().OpenInEditor(Node().XyzFile().File.Absolute()); }).ShownWhen(isXyz);
  if (n.HasRelativeToGround()) form.Check("Values relative to ground", n.RelativeToGround);

  PageForm& units = form.Group("Units of Shape Files", isScattered);
  UnitKeyChoice(units, "Units of X- and Y-axises:", "ShapeAxisUnit", n.ShapeAxisUnit, quantity::kMapCoordinate);
  UnitKeyChoice(units, "Item Unit:", "ShapeItemUnit", n.ShapeItemUnit, n.Kind().itemType);
  if (n.IsInterpolated()) {
    form.Choice("Interpolation Method:", n.InterpMethod).ShownWhen(isScattered);
    form.Number("Search Radius:", n.SearchRadius).ShownWhen(isScattered);
  }
  form.Check("Show grid data", n.ShowGridData).ShownWhen(!isUniform);
  form.Check("Show shape raw data", n.ShowShapeData).ShownWhen(isScattered);
  ground_.DescribeButtons(form, !isUniform);
  form.Map([this] { return Map(); }).ShownWhen(!isUniform);
  ground_.DescribeSection(form, !isUniform);
  DescribeTotals(form);
}

}  // namespace

std::span<const PageRow> Data2DPages() {
  static constexpr PageRow kRows[] = {
      PageIs<CData2DDlg, CData2DKvf>(kData2DPage),
  };
  return kRows;
}

}  // namespace tervane
