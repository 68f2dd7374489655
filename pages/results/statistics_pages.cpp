// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/results/statistics_pages.h"

#include <algorithm>
#include <cmath>
#include <utility>

#include <fmt/format.h>

#include "document/flow_model_document.h"
#include "forms/plots.h"
#include "pages/parts/passport_notice.h"
#include "platform/files.h"
#include "platform/paths.h"
#include "results/result_nodes.h"
#include "results/statistics_report.h"
#include "simspec/periods.h"

namespace tervane {

namespace {

using ComparisonComputation = Computed<PointComparison>;

/// How a point's two series are held against each other.
enum ComparisonView : int { kOverTime, kScatter, kDuration };

double OrGap(float value) { return value == kDeleteValue ? std::nan("") : static_cast<double>(value); }

Series OverTime(const std::string& name, const PointSeries& source, const std::string& unit, std::size_t color) {
  Series series;
  series.name = name;
  series.unit = unit;
  // Lines alone: filled steps would hide each other.
  series.color = color;
  for (std::size_t i = 0; i < source.stamps.size(); ++i) {
    series.times.push_back(CYbDateTime::FromSecondsSinceEpoch(source.stamps[i]));
    series.values.push_back(OrGap(source.values[i]));
  }
  return series;
}

Series OverNumbers(const std::string& name, const std::string& unit, std::vector<double> positions,
                   std::vector<double> values) {
  Series series;
  series.name = name;
  series.unit = unit;
  series.positions = std::move(positions);
  series.values = std::move(values);
  return series;
}

/// Simulated over observed values, and the line on which both are the same.
SeriesContent ScatterOf(const PointComparison& comparison) {
  std::vector<ComparedPair> pairs = comparison.pairs;
  std::ranges::sort(pairs, {}, &ComparedPair::observed);
  std::vector<double> observed, simulated;
  for (const ComparedPair& pair : pairs) {
    observed.push_back(pair.observed);
    simulated.push_back(pair.simulated);
  }
  SeriesContent chart;
  chart.numbers = NumberAxis{"Observed", comparison.unit};
  const double low = std::min(std::ranges::min(observed), std::ranges::min(simulated));
  const double high = std::max(std::ranges::max(observed), std::ranges::max(simulated));
  chart.series.push_back(OverNumbers("Simulated", comparison.unit, observed, simulated));
  chart.series.back().isPoints = true;
  chart.series.push_back(OverNumbers("1:1", comparison.unit, {low, high}, {low, high}));
  return chart;
}

SeriesContent DurationOf(const PointComparison& comparison) {
  std::vector<double> observed, simulated;
  for (const ComparedPair& pair : comparison.pairs) {
    observed.push_back(pair.observed);
    simulated.push_back(pair.simulated);
  }
  SeriesContent chart;
  chart.numbers = NumberAxis{"Time in which the value is reached or exceeded", "%"};
  for (auto& [name, values] :
       {std::pair("Simulated", std::move(simulated)), std::pair("Observed", std::move(observed))}) {
    DurationCurve curve = DurationCurveOf(values);
    chart.series.push_back(OverNumbers(name, comparison.unit, std::move(curve.percent), std::move(curve.values)));
  }
  return chart;
}

SeriesContent ChartOf(const PointComparison& comparison, int view, const ComparedPeriod& period) {
  SeriesContent chart;
  if (view != kOverTime && comparison.pairs.empty()) {
    chart.message = comparison.problem;
    return chart;
  }
  if (view == kScatter) return ScatterOf(comparison);
  if (view == kDuration) return DurationOf(comparison);
  if (comparison.simulated.stamps.empty() && comparison.observed.stamps.empty()) {
    chart.message = comparison.problem;
    return chart;
  }
  chart.series = {OverTime("Simulated", comparison.simulated, comparison.unit, 0),
                  OverTime("Observed", comparison.observed, comparison.unit, 1)};
  chart.period = {period.start, period.end};
  return chart;
}

/// Points with what was made of them, and the files in which that is kept.
class CRunStatisticsDlg : public PageOf<CRunStatisticsKvf> {
 public:
  using PageOf::PageOf;

  void SetData() override;
  void OnRefresh() override { ReadPoints(); }

 protected:
  void Describe(PageForm& form) override;

 private:
  using Table = TableOf<PointStatistics>;

  std::shared_ptr<Table> PointTable();
  std::string ReportPath() const;
  void ReadPoints();
  void Run();
  void Take(const StatisticsTable& table);
  /// Lets the figures follow the dates and the report.
  void FollowFigures(Awaited& awaited);
  SeriesContent Chart();
  DisplayUnits Units() const { return Context().displayUnits ? *Context().displayUnits : DisplayUnits(); }

  ComparedPeriod period_;
  std::vector<std::unique_ptr<PointStatistics>> rows_;
  std::shared_ptr<Table> table_;
  FileStamp readStamp_;
  std::string problem_;  ///< Why there are no points.
  std::string outcome_;  ///< Of the latest run on this page.
  int view_ = kOverTime;

  /// What figures were made of, besides the points.
  struct FiguresAsked {
    ComparedPeriod period;
    DisplayUnits units;
    FileStamp report;

    bool operator==(const FiguresAsked&) const = default;
  } figuresAsked_;
  /// Makes the figures of all points beside the window, and writes nothing.
  std::shared_ptr<Computed<StatisticsTable>> figures_;
  bool areTaken_ = false;

  /// What the shown comparison was made of.
  struct ComparisonAsked {
    DetailedPoint point;
    ComparedPeriod period;
    DisplayUnits units;
    std::vector<FileStamp> files;

    bool operator==(const ComparisonAsked&) const = default;
  } comparisonAsked_;
  std::shared_ptr<ComparisonComputation> comparison_;
};

std::shared_ptr<TableOf<PointStatistics>> CRunStatisticsDlg::PointTable() {
  auto table = std::make_shared<Table>(std::make_shared<ArrangedRows<PointStatistics>>([this] {
    std::vector<PointStatistics*> rows;
    for (const auto& row : rows_) rows.push_back(row.get());
    return rows;
  }));
  table->ItemName("Point");
  table->ShowOnly();
  table->ReportCurrentRow();
  table->Value("Name", [](PointStatistics& row) { return row.point.name; })
      .Width(190)
      .ToolTipOf([](PointStatistics& row) { return row.problem; });
  table->Value("Data type", [](PointStatistics& row) { return row.point.dataType; }).Width(100);
  table
      ->Value("Layer",
              [](PointStatistics& row) -> CellValue {
                if (row.point.layer < 1) return std::string();
                return row.point.layer;
              })
      .Width(45);
  table->Value("Unit", [](PointStatistics& row) { return row.unit; }).Width(45);
  table
      ->Value("Pairs",
              [](PointStatistics& row) -> CellValue {
                if (row.figures.pairs == 0) return std::string();
                return static_cast<int>(row.figures.pairs);
              })
      .Width(45);
  const auto figure = [&table](const char* head, std::optional<double> RunStatistics::*member, const char* toolTip) {
    table
        ->Value(head,
                [member](PointStatistics& row) -> CellValue {
                  const std::optional<double>& value = row.figures.*member;
                  if (!value) return std::string();
                  return *value;
                })
        .Width(64)
        .Format("%.4g")
        .ToolTip(toolTip);
  };
  figure("ME", &RunStatistics::meanError, "Mean error, observed minus simulated");
  figure("MAE", &RunStatistics::meanAbsoluteError, "Mean absolute error");
  figure("RMSE", &RunStatistics::rootMeanSquareError, "Root mean square error");
  figure("STDres", &RunStatistics::residualDeviation, "Standard deviation of the errors");
  figure("R", &RunStatistics::correlation, "Correlation");
  figure("R2", &RunStatistics::nashSutcliffe, "Efficiency of Nash and Sutcliffe");
  figure("KGE", &RunStatistics::klingGupta, "Efficiency of Kling and Gupta");
  figure("PBIAS [%]", &RunStatistics::percentBias, "Percent bias; above 0 where the simulated values are too low");
  return table;
}

void CRunStatisticsDlg::Describe(PageForm& form) {
  DescribePassport(form, *this);
  if (const auto* simulation = Node().Important(kSimulationPeriod))
    period_ = {simulation->GetSimStartDate(), simulation->SIMEND};
  form.Date("Start date:", period_.start).Hint(kViewOnly);
  form.Date("End date:", period_.end).Hint(kViewOnly).Beside();
  form.Button("Run Statistics", [this] { Run(); })
      .ToolTip("Compares all points that have observed values, and writes the figures as a table and as a shape file");
  form.Notice([this] { return problem_.empty() ? outcome_ : problem_; });
  table_ = PointTable();
  form.Table(table_);
  form.Notice([this] {
    const PointStatistics* shown = table_->Current();
    return shown && !shown->problem.empty() ? fmt::format("{}: {}.", shown->point.name, shown->problem) : std::string();
  });
  form.Choice("Show point as:", view_, {"Series over time", "Scatter with the 1:1 line", "Duration curves"})
      .Hint(kViewOnly);
  form.Report([this] { return Node().HtmlFilename.Absolute(); });
  form.Chart([this] { return Chart(); });
}

std::string CRunStatisticsDlg::ReportPath() const {
  const auto* document = dynamic_cast<const CFlowModelDoc*>(&Context().document);
  if (!document || document->PathName().empty()) return {};
  return ResolvedPath(document->PreprocessorReport(), {});
}

void CRunStatisticsDlg::SetData() {
  const std::string report = ReportPath();
  if (report.empty())
    problem_ = "The setup was never saved, so that no results lie beside it.";
  else if (StampOf(report) != readStamp_ || rows_.empty())
    ReadPoints();
  if (table_->CurrentRow() == 0 && table_->RowCount() > 0) table_->Choose(1);
}

void CRunStatisticsDlg::ReadPoints() {
  const std::string report = ReportPath();
  if (report.empty()) return;
  readStamp_ = StampOf(report);
  rows_.clear();
  outcome_.clear();
  std::vector<DetailedPoint> points;
  problem_ = readStamp_.exists
                 ? ReadDetailedPoints(report, points).error
                 : "There is no report of the preprocessor yet, which names the points with observed values.";
  for (const DetailedPoint& point : points)
    if (point.includesObserved) rows_.push_back(std::make_unique<PointStatistics>(PointStatistics{point, {}, {}, {}}));
  if (problem_.empty() && rows_.empty())
    problem_ = "The report of the preprocessor names no point with observed values.";
  table_->Follow();
}

void CRunStatisticsDlg::Run() {
  if (Outside().Ask("It can take several minutes to generate the statistics. Continue?", Host::Icon::Question,
                    Host::Buttons::YesNo) != Host::Answer::Yes)
    return;
  const std::string report = ReportPath();
  if (report.empty()) return Outside().ShowMessage(problem_, Host::Icon::Warning);
  std::vector<DetailedPoint> points;
  if (const FileResult read = ReadDetailedPoints(report, points); !read.Ok())
    return Outside().ShowMessage(read.error, Host::Icon::Error);
  const StatisticsFiles files = StatisticsFilesBeside(report);
  const auto computing = std::make_shared<Computed<StatisticsTable>>(
      "Comparing simulated with observed series",
      [points, period = period_, units = Units(), files](StatisticsTable& table, ProgressPart progress) {
        FileResult computed = ComputeStatistics(points, period, units, table, progress);
        return computed.Ok() ? WriteStatistics(table, units, files) : computed;
      });
  if (!Outside().Compute(computing)) return;
  if (!computing->Result()) return Outside().ShowMessage(computing->Problem(), Host::Icon::Error);
  ReadPoints();
  Take(*computing->Result());
  if (!computing->Result()->stopped.empty()) {
    outcome_ = "The statistics end before the last point. " + computing->Result()->stopped;
    Outside().ShowMessage(outcome_, Host::Icon::Warning);
    return UpdateDoc(kViewOnly, "Run Statistics");
  }
  const std::string& folder = Node().GetRoot()->SetupFolder();
  Node().HtmlFilename = FileName::Picked(files.html, folder);
  Node().ShapeFilename = FileName::Picked(files.shape, folder);
  UpdateDoc(kDataChanged, "Run Statistics");
}

void CRunStatisticsDlg::Take(const StatisticsTable& table) {
  for (std::size_t i = 0; i < std::min(rows_.size(), table.rows.size()); ++i)
    if (rows_[i]->point == table.rows[i].point) *rows_[i] = table.rows[i];
}

void CRunStatisticsDlg::FollowFigures(Awaited& awaited) {
  FiguresAsked asked{period_, Units(), readStamp_};
  if (!figures_ || !(asked == figuresAsked_)) {
    figuresAsked_ = std::move(asked);
    areTaken_ = false;
    std::vector<DetailedPoint> points;
    for (const auto& row : rows_) points.push_back(row->point);
    figures_ = std::make_shared<Computed<StatisticsTable>>(
        "Comparing simulated with observed series",
        [points, period = period_, units = Units()](StatisticsTable& table, ProgressPart progress) {
          return ComputeStatistics(points, period, units, table, progress);
        });
  }
  if (const auto table = NowOrAwaited(figures_, awaited); table && !std::exchange(areTaken_, true)) Take(*table);
}

SeriesContent CRunStatisticsDlg::Chart() {
  const PointStatistics* shown = table_->Current();
  if (!shown) return {.series = {}, .period = {}, .message = "There is no point to show."};
  const DetailedPoint& point = shown->point;
  ComparisonAsked asked{point, period_, Units(), {StampOf(point.simulated.path), StampOf(point.observed.path)}};
  if (!comparison_ || !(asked == comparisonAsked_)) {
    comparisonAsked_ = std::move(asked);
    comparison_ = std::make_shared<ComparisonComputation>(
        "Reading " + point.name,
        [point, period = period_, units = Units()](PointComparison& comparison, ProgressPart progress) {
          comparison = PointComparer(period, units).Compare(point, progress);
          return progress.IsCancelled() ? FileResult{kCancelled, {}} : FileResult{};
        });
  }
  Awaited awaited;
  const auto comparison = NowOrAwaited(comparison_, awaited);
  FollowFigures(awaited);
  SeriesContent chart = comparison ? ChartOf(*comparison, view_, period_) : SeriesContent();
  chart.awaited = std::move(awaited);
  return chart;
}

}  // namespace

std::span<const PageRow> StatisticsPages() {
  static constexpr PageRow kRows[] = {PageIs<CRunStatisticsDlg, CRunStatisticsKvf>(kRunStatisticsPage)};
  return kRows;
}

}  // namespace tervane
