// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/coverage.h"

#include <algorithm>
#include <cmath>
#include <map>
#include <new>

#include <fmt/format.h>
#include <fmt/ranges.h>

#include "data/datafile_facts.h"
#include "data/datafile_request.h"
#include "data/grid_files.h"
#include "geometry/grid_polygons.h"
#include "geometry/shapes.h"
#include "platform/item_types.h"
#include "platform/text.h"
#include "simspec/periods.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "spatial/placement.h"
#include "spatial/zone_sync.h"

namespace tervane {

namespace {

constexpr double kNone = std::numeric_limits<double>::quiet_NaN();
constexpr std::size_t kMostYears = 500;

using GridData = CTvn2DOrthoRotatedGridData;

bool HasError(const std::vector<Finding>& findings) {
  return std::ranges::any_of(findings, [](const Finding& finding) { return finding.severity == Severity::Error; });
}

CYbDateTime DateAt(std::int64_t seconds) { return CYbDateTime::FromSecondsSinceEpoch(seconds); }

/// A step of a file of grids, as a mean over the domain.
class DomainMeans {
 public:
  /// `wasMissing` is set for the cells of the domain that have no value in a step.
  DomainMeans(const DataFile& file, int number, const GridData& domain, const std::optional<TimeSpan>& watched,
              std::vector<bool>& wasMissing)
      : file_(file),
        number_(number),
        item_(file.Items()[static_cast<std::size_t>(number - 1)]),
        watched_(watched),
        wasMissing_(wasMissing) {
    GridGeometry grid;
    problem_ = ToModelGrid(item_.geometry, grid);
    if (problem_.empty()) places_ = PlacesOf(domain, grid);
    wasMissing_.assign(places_.size(), false);
    values_.resize(item_.CellsOfLayer());
  }

  std::string Read(std::size_t step, double& mean) {
    if (!problem_.empty()) return problem_;
    const ValueSelection selection{number_, step, 1, item_.dimensions == 3 ? std::optional(0) : std::nullopt};
    if (std::string error = file_.Read(selection, values_, item_.itemType); !error.empty()) return error;
    const bool isWatched =
        !watched_ || file_.Time().stamps.empty() ||
        (file_.Time().stamps[step] > watched_->start && (step == 0 || file_.Time().stamps[step - 1] < watched_->end));
    double sum = 0;
    std::size_t count = 0;
    for (std::size_t i = 0; i < places_.size(); ++i) {
      const float value = places_[i] < 0 ? kDeleteValue : values_[static_cast<std::size_t>(places_[i])];
      if (value == kDeleteValue) {
        if (isWatched) wasMissing_[i] = true;
        continue;
      }
      sum += static_cast<double>(value);
      ++count;
    }
    mean = count > 0 ? sum / static_cast<double>(count) : kNone;
    return {};
  }

 private:
  const DataFile& file_;
  const int number_;
  const DataItem& item_;
  std::optional<TimeSpan> watched_;
  std::vector<bool>& wasMissing_;
  std::vector<std::ptrdiff_t> places_;  ///< Of each cell of the domain in the file's grid; -1 off it.
  std::vector<float> values_;
  std::string problem_;  ///< Why the file's cells are no grid of a model.
};

class CoverageBuilder {
 public:
  CoverageBuilder(const CoverageRequest& request, const CoverageBoard* previous, ProgressPart progress)
      : previous_(previous), progress_(progress) {
    board_.request = request;
  }

  CoverageBoard Make() {
    MakePeriods();
    part_ = progress_.Part(0, 1.0 / static_cast<double>(board_.request.files.size() + 2));
    MakeDomain();
    const auto parts = static_cast<double>(board_.request.files.size() + board_.request.forcings.size() + 1);
    double done = 1;
    for (const CoverageFile& file : board_.request.files) {
      part_ = progress_.Part(done / parts, (done + 1) / parts);
      board_.rows.push_back(MakeRow(file));
      ++done;
    }
    for (const CoverageForcing& forcing : board_.request.forcings) {
      part_ = progress_.Part(done / parts, (done + 1) / parts);
      const ForcingTotals* same = nullptr;
      if (IsOfSameSetting())
        for (const ForcingTotals& each : previous_->forcings)
          if (each.forcing.path == forcing.path && each.forcing.forcing == forcing.forcing) same = &each;
      board_.forcings.push_back(same ? *same : MakeForcing(forcing));
      board_.forcings.back().forcing = forcing;
      ++done;
    }
    for (const CoverageCheck& check : board_.request.checks) {
      LeaveIfCancelled();
      const CoverageCheckResult* same = nullptr;
      if (IsOfSameSetting())
        for (const CoverageCheckResult& each : previous_->checks)
          if (each.check == check) same = &each;
      if (same)
        board_.checks.push_back(*same);
      else if (board_.domain)
        board_.checks.push_back({check, FindingsInCells(check.check, *board_.domain, progress_.Part(done / parts, 1))});
    }
    for (const CoverageSpans& spans : board_.request.spans) LookForSpans(spans);
    LeaveIfCancelled();
    progress_.Report(1);
    return std::move(board_);
  }

 private:
  void LeaveIfCancelled() const { progress_.ThrowIfCancelled(); }
  bool IsOfSameSetting() const {
    return previous_ && previous_->request.simulation == board_.request.simulation &&
           previous_->request.domain == board_.request.domain;
  }

  void MakePeriods();
  void MakeDomain();

  CoverageRow MakeRow(const CoverageFile& file);
  void ReadData(CoverageRow& row);
  void ReadShape(CoverageRow& row);
  void ReadPoints(CoverageRow& row);
  void LookForCells(CoverageRow& row);
  void TakeMissing(CoverageRow& row, const std::vector<bool>& isMissing);
  std::string StressPeriodsText(const CoverageRow& row) const;
  void LookForSpans(const CoverageSpans& spans);
  void Conclude(CoverageRow& row);

  ForcingTotals MakeForcing(const CoverageForcing& forcing);
  void AddDomainColumn(ForcingTotals& totals);

  std::vector<TimeSpan> Spans() const {
    std::vector<TimeSpan> spans;
    for (const TotalsPeriod& period : board_.periods) spans.push_back(period.span);
    return spans;
  }
  /// An item over time is read once for its row and its forcing.
  const SeriesFacts& FactsOfSeries(const std::string& path, int item);
  struct GridSeries {
    SeriesFacts facts;
    std::vector<bool> wasMissing;
  };
  const GridSeries& FactsOfGrids(const std::string& path, int item);

  const CoverageBoard* previous_;
  ProgressPart progress_, part_;
  CoverageBoard board_;
  std::map<std::pair<std::string, int>, SeriesFacts> series_;
  std::map<std::pair<std::string, int>, GridSeries> grids_;
};

void CoverageBuilder::MakePeriods() {
  const std::optional<TimeSpan>& simulation = board_.request.simulation;
  if (!simulation) return;
  const int first = DateAt(simulation->start).Year(), last = DateAt(simulation->end - 1).Year();
  for (int year = first; year <= last && board_.periods.size() < kMostYears; ++year) {
    const CYbDateTime begin(year, 1, 1), end(year + 1, 1, 1);
    if (!end.IsValid()) break;
    board_.periods.push_back({std::to_string(year), {begin.SecondsSinceEpoch(), end.SecondsSinceEpoch()}});
  }
  board_.periods.push_back({"simulation", *simulation});
}

void CoverageBuilder::MakeDomain() {
  if (IsOfSameSetting()) {
    board_.domain = previous_->domain;
    board_.domainProblem = previous_->domainProblem;
    board_.domainCells = previous_->domainCells;
    return;
  }
  auto grid = std::make_shared<GridData>();
  const FileResult result = ReadDomain(board_.request.domain, part_, *grid);
  LeaveIfCancelled();
  board_.domainProblem = result.error;
  if (!result.Ok()) return;
  for (const float value : grid->Values()) board_.domainCells += !grid->IsEmptyValue(value);
  if (board_.domainCells == 0) board_.domainProblem = "no cell lies inside";
  board_.domain = std::move(grid);
}

// ---- Files

CoverageRow CoverageBuilder::MakeRow(const CoverageFile& file) {
  LeaveIfCancelled();
  CoverageRow row;
  if (IsOfSameSetting()) {
    const auto same = std::ranges::find_if(previous_->rows, [&](const CoverageRow& each) {
      return each.file.path == file.path && each.file.use == file.use && each.file.values == file.values;
    });
    if (same != previous_->rows.end()) row = *same;
    row.remarks.clear();
  }
  const bool isAtHand = !row.file.path.empty();
  row.file = file;
  if (!isAtHand) {
    if (file.use.path.empty()) {
      row.problem = "no file is chosen";
    } else {
      try {
        if (file.use.kind == FileUse::Kind::Data) ReadData(row);
        if (file.use.kind == FileUse::Kind::Shape) ReadShape(row);
        if (file.use.kind == FileUse::Kind::Points) ReadPoints(row);
        const FilePlace place = LocateFile(file.use);
        row.extent = place.extent;
        row.isInDegrees = place.isGeographical;
        if (row.problem.empty() && !row.isInDegrees) LookForCells(row);
      } catch (const std::bad_alloc&) {
        row.problem = "it needs more than the free memory";
      }
    }
  }
  Conclude(row);
  part_.Report(1);
  return row;
}

void CoverageBuilder::ReadData(CoverageRow& row) {
  const FileUse& use = row.file.use;
  const auto facts = DataFileFactsOf(use.path);
  row.problem = facts->error.empty() ? facts->WhyNoItem(use.item) : facts->error;
  if (!row.problem.empty()) return;
  const DataItem& item = *facts->Item(use.item);
  const Unit* unit = FindUnit(item.unitKey);
  const std::string_view unitText = unit && !unit->abbreviation.empty() ? unit->abbreviation : item.unitText;
  row.item = unitText.empty() ? item.name : fmt::format("{} [{}]", item.name, unitText);
  if (item.hasTime && use.isOverTime && facts->time.stamps.empty())
    row.problem = facts->time.steps == 0 ? "the file has no time steps" : "the file has no dates";
  if (!item.hasTime || facts->time.stamps.empty()) return;
  row.steps = facts->time.stamps.size();
  row.period = TimeSpan{StartOfValues(item, facts->time).SecondsSinceEpoch(), facts->time.stamps.back()};
  const std::optional<TimeSpan>& simulation = board_.request.simulation;
  if (!use.isOverTime || !simulation) return;
  row.late = std::clamp(row.period->start - simulation->start, std::int64_t{0}, simulation->Seconds());
  row.early = std::clamp(simulation->end - row.period->end, std::int64_t{0}, simulation->Seconds());
  if (item.dimensions != 0) return;
  const SeriesFacts& series = FactsOfSeries(use.path, use.item);
  row.problem = series.error;
  row.gaps = series.gaps;
}

void CoverageBuilder::ReadShape(CoverageRow& row) {
  const auto facts = ShapeFactsOf(row.file.use.path);
  row.problem = facts->error;
  if (!row.problem.empty()) return;
  row.item = row.file.use.attribute;
}

void CoverageBuilder::ReadPoints(CoverageRow& row) {
  const auto facts = XyzFactsOf(row.file.use.path);
  row.problem = facts->error;
  if (!row.problem.empty()) return;
  row.item = facts->points == 1 ? "1 point" : fmt::format("{} points", facts->points);
}

void CoverageBuilder::LookForCells(CoverageRow& row) {
  if (!row.file.values || !board_.domain || board_.domainCells == 0 || HasError(row.file.findings)) return;
  const GridSource& source = *row.file.values;
  const auto facts = source.type == CData2DKvf::kGridFile ? DataFileFactsOf(source.file) : nullptr;
  const DataItem* item = facts ? facts->Item(source.item) : nullptr;
  std::vector<bool> isMissing;
  if (item && item->hasTime && row.file.use.isOverTime && !facts->time.stamps.empty()) {
    const GridSeries& grids = FactsOfGrids(source.file, source.item);
    row.problem = grids.facts.error;
    row.gaps = grids.facts.gaps;
    isMissing = grids.wasMissing;
  } else {
    std::shared_ptr<ComputedGrid> made = row.file.grid;
    if (!made)
      made = std::make_shared<ComputedGrid>(
          std::string(), [source](GridData& grid, ProgressPart progress) { return BuildGrid(source, progress, grid); });
    made->Run(part_);
    LeaveIfCancelled();
    row.problem = made->Problem();
    if (made->Result()) {
      for (const std::optional<float>& value : ValuesIn(*board_.domain, *made->Result())) isMissing.push_back(!value);
    }
  }
  if (row.problem.empty()) TakeMissing(row, isMissing);
}

void CoverageBuilder::TakeMissing(CoverageRow& row, const std::vector<bool>& isMissing) {
  row.cells = board_.domainCells;
  row.missing = static_cast<std::size_t>(std::ranges::count(isMissing, true));
  if (row.missing == 0) return;
  std::vector<float> marks(board_.domain->Values().size(), kUsualDeleteValue);
  std::size_t cell = 0;
  for (std::size_t i = 0; i < marks.size(); ++i)
    if (!board_.domain->IsEmptyValue(board_.domain->Values()[i])) marks[i] = isMissing[cell++] ? 2.0F : 1.0F;
  auto grid = std::make_shared<GridData>();
  if (grid->TakeValues(board_.domain->Geometry(), std::move(marks), kUsualDeleteValue, kWholeNumberUnit,
                       quantity::kCode)
          .empty())
    row.missingCells = std::move(grid);
}

/// Which stress periods have times without values; empty where none has.
std::string CoverageBuilder::StressPeriodsText(const CoverageRow& row) const {
  if (!row.problem.empty() || !row.period || !row.file.use.isOverTime) return {};
  std::size_t count = 0, first = 0, gap = 0;
  const std::vector<TimeSpan>& periods = board_.request.stressPeriods;
  for (std::size_t i = 0; i < periods.size(); ++i) {
    // Both ascend.
    while (gap < row.gaps.size() && row.gaps[gap].end <= periods[i].start) ++gap;
    const bool hasGap = gap < row.gaps.size() && row.gaps[gap].start < periods[i].end;
    if (!hasGap && periods[i].start >= row.period->start && periods[i].end <= row.period->end) continue;
    if (count++ == 0) first = i;
  }
  if (count == 0) return {};
  return fmt::format("{} of {} stress periods have times without values, the first is period {} from {} to {}", count,
                     periods.size(), first + 1, DateInWords(DateAt(periods[first].start)),
                     DateInWords(DateAt(periods[first].end)));
}

void CoverageBuilder::LookForSpans(const CoverageSpans& spans) {
  const int periods = static_cast<int>(board_.request.stressPeriods.size());
  if (periods == 0) return;
  const int end = spans.ends.empty() ? 0 : *std::ranges::max_element(spans.ends);
  if (end >= periods) return;
  board_.spans.push_back(
      {Severity::Warning,
       fmt::format("{}: no values for stress period{} {}", spans.title, end + 1 == periods ? "" : "s",
                   end + 1 == periods ? fmt::format("{}", periods) : fmt::format("{} to {}", end + 1, periods)),
       {},
       {}});
}

void CoverageBuilder::Conclude(CoverageRow& row) {
  const auto add = [&](Severity severity, std::string text) {
    row.remarks.push_back({severity, std::move(text), {}, {}});
  };
  row.remarks = row.file.findings;
  if (!row.problem.empty() && !HasError(row.remarks)) add(Severity::Error, row.problem);
  // Nodes of points have no validation.
  if (row.problem.empty() && row.file.use.kind == FileUse::Kind::Points && board_.request.domain.geometry)
    std::ranges::move(FindMisplacement(LocateFile(row.file.use), *board_.request.domain.geometry),
                      std::back_inserter(row.remarks));
  const std::optional<TimeSpan>& simulation = board_.request.simulation;
  const bool isApart = row.file.use.isOverTime && row.period && simulation &&
                       (row.period->end < simulation->start || row.period->start > simulation->end);
  // Validation tells it of what must cover the simulation.
  if (isApart && row.remarks.empty()) add(Severity::Warning, "It has no values in the time of the simulation");
  constexpr std::size_t kMostGaps = 5;
  for (std::size_t i = 0; i < std::min(row.gaps.size(), kMostGaps); ++i)
    add(Severity::Warning, fmt::format("No values from {} to {}", DateInWords(DateAt(row.gaps[i].start)),
                                       DateInWords(DateAt(row.gaps[i].end))));
  if (row.gaps.size() > kMostGaps) add(Severity::Warning, fmt::format("And {} gaps more", row.gaps.size() - kMostGaps));
  if (std::string text = StressPeriodsText(row); !text.empty()) add(Severity::Warning, std::move(text));
  if (std::string missing = MissingCellsText(row); !missing.empty()) add(Severity::Warning, std::move(missing));
  std::ranges::stable_sort(row.remarks, {}, &Finding::severity);
  row.state = CoverageState::Fine;
  if (row.remarks.empty()) return;
  const Severity worst = row.remarks.front().severity;
  row.state = worst == Severity::Error     ? CoverageState::Error
              : worst == Severity::Warning ? CoverageState::Warning
                                           : CoverageState::Note;
}

// ---- Over time

const SeriesFacts& CoverageBuilder::FactsOfSeries(const std::string& path, int item) {
  const auto [found, isNew] = series_.try_emplace({path, item});
  if (isNew) found->second = SumSeries(path, item, Spans(), board_.request.simulation, part_);
  LeaveIfCancelled();
  return found->second;
}

const CoverageBuilder::GridSeries& CoverageBuilder::FactsOfGrids(const std::string& path, int number) {
  const auto [found, isNew] = grids_.try_emplace({path, number});
  GridSeries& grids = found->second;
  if (!isNew) return grids;
  DataFile file;
  SeriesFacts& facts = grids.facts;
  if (facts.error = file.Open(path); !facts.error.empty()) return grids;
  if (number < 1 || static_cast<std::size_t>(number) > file.Items().size() || !board_.domain) {
    facts.error = board_.domain ? fmt::format("{}: there is no item {}", path, number) : "there is no domain";
    return grids;
  }
  const DataItem& item = file.Items()[static_cast<std::size_t>(number - 1)];
  if (item.dimensions < 2 || !item.hasTime || file.Time().stamps.empty()) {
    facts.error = fmt::format("{}: item {} holds no grids with dates", path, number);
    return grids;
  }
  DomainMeans means(file, number, *board_.domain, board_.request.simulation, grids.wasMissing);
  facts = SumSteps(
      item, file.Time(), Spans(), board_.request.simulation,
      [&](std::size_t step, double& value) { return means.Read(step, value); }, part_);
  LeaveIfCancelled();
  return grids;
}

// ---- Forcings

/// What a constant comes to.
std::vector<PeriodSum> SumsOfConstant(double value, const std::vector<TimeSpan>& periods) {
  std::vector<PeriodSum> sums;
  for (const TimeSpan& period : periods)
    sums.push_back({value * static_cast<double>(period.Seconds()), period.Seconds()});
  return sums;
}

/// What lines come to.
std::vector<PeriodSum> SumsOfLines(const std::vector<ForcingLine>& lines, const std::vector<TimeSpan>& periods) {
  PeriodSums sums(periods);
  for (const ForcingLine& line : lines) sums.Add({line.start, line.end}, line.first, line.last);
  return sums.Sums();
}

ForcingTotals CoverageBuilder::MakeForcing(const CoverageForcing& asked) {
  LeaveIfCancelled();
  ForcingTotals totals;
  totals.forcing = asked;
  const Forcing& forcing = asked.forcing;
  int itemType = forcing.itemType;
  ValueType valueType = ValueType::MeanStep;
  const auto takeKind = [&](const std::string& path, int number) {
    const auto facts = DataFileFactsOf(path);
    if (const DataItem* item = facts->Item(number)) {
      itemType = item->itemType;
      valueType = item->valueType;
    }
  };
  if (forcing.overGrid) {
    takeKind(forcing.overGrid->path, forcing.overGrid->item);
    const GridSeries& grids = FactsOfGrids(forcing.overGrid->path, forcing.overGrid->item);
    totals.columns.push_back({"domain", 1.0, grids.facts.sums, grids.facts.error});
  }
  for (const ForcingSeries& series : forcing.series) {
    ForcingTotals::Column column;
    column.name = series.name.empty() ? "all" : series.name;
    if (series.constant) {
      column.sums = SumsOfConstant(*series.constant, Spans());
    } else if (series.lines) {
      column.sums = SumsOfLines(*series.lines, Spans());
    } else if (!series.problem.empty()) {
      column.problem = series.problem;
    } else {
      takeKind(series.path, series.item);
      const SeriesFacts& facts = FactsOfSeries(series.path, series.item);
      column.sums = facts.sums;
      column.problem = series.path.empty() ? "no file is chosen" : facts.error;
    }
    totals.columns.push_back(std::move(column));
  }
  totals.form = TotalFormOf(itemType, valueType);
  if (forcing.areas) AddDomainColumn(totals);
  part_.Report(1);
  return totals;
}

void CoverageBuilder::AddDomainColumn(ForcingTotals& totals) {
  if (!board_.domain || board_.domainCells == 0) return;
  AreaCells areas;
  const FileResult counted = CountCells(*board_.domain, *totals.forcing.forcing.areas, part_, areas);
  LeaveIfCancelled();
  if (!counted.Ok()) {
    totals.remarks.push_back({Severity::Error, counted.error, {}, {}});
    return;
  }
  ForcingTotals::Column mean;
  mean.name = "domain";
  mean.share = 0;
  mean.sums.resize(board_.periods.size());
  std::vector<double> weights(board_.periods.size(), 0);
  for (std::size_t i = 0; i < totals.columns.size(); ++i) {
    ForcingTotals::Column& column = totals.columns[i];
    const auto found = areas.cellsOfId.find(totals.forcing.forcing.series[i].id);
    const std::size_t cells = found == areas.cellsOfId.end() ? 0 : found->second;
    if (found != areas.cellsOfId.end()) areas.cellsOfId.erase(found);
    column.share = static_cast<double>(cells) / static_cast<double>(board_.domainCells);
    *mean.share += *column.share;
    if (cells == 0) {
      totals.remarks.push_back(
          {Severity::Note, fmt::format("Station {} has no cell in the domain", column.name), {}, {}});
      continue;
    }
    for (std::size_t p = 0; p < mean.sums.size() && p < column.sums.size(); ++p) {
      if (column.sums[p].covered == 0) continue;
      // The mean of the time that a station has values for stands for its area.
      const double rate = column.sums[p].integral / static_cast<double>(column.sums[p].covered);
      mean.sums[p].integral += *column.share * rate;
      weights[p] += *column.share;
      mean.sums[p].covered = std::max(mean.sums[p].covered, column.sums[p].covered);
    }
  }
  for (std::size_t p = 0; p < mean.sums.size(); ++p)
    if (weights[p] > 0) mean.sums[p].integral *= static_cast<double>(mean.sums[p].covered) / weights[p];
  std::vector<std::string> withoutStation;
  std::size_t cells = areas.withoutId;
  for (const auto& [id, count] : areas.cellsOfId) {
    withoutStation.push_back(id);
    cells += count;
  }
  if (cells > 0)
    totals.remarks.push_back({Severity::Warning,
                              fmt::format("{} cells of the domain belong to no station{}{}", cells,
                                          withoutStation.empty() ? "" : ": those of ", fmt::join(withoutStation, ", ")),
                              {},
                              {}});
  // Of many stations the mean is looked for first.
  totals.columns.insert(totals.columns.begin(), std::move(mean));
}

}  // namespace

FileResult ComputeCoverage(const CoverageRequest& request, const CoverageBoard* previous, CoverageBoard& board,
                           ProgressPart progress) {
  try {
    board = CoverageBuilder(request, previous, progress).Make();
  } catch (const Cancelled&) {
    return {kCancelled, {}};
  }
  return {};
}

}  // namespace tervane
