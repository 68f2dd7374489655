// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "modflow6/building.h"

#include <cmath>
#include <limits>

#include <fmt/format.h>

#include "data/datafile_facts.h"
#include "modelcells/model_grids.h"
#include "platform/units.h"
#include "spatial/data2d.h"
#include "spatial/series_totals.h"

namespace tervane::modflow6 {

double SiFactorOf(int itemType) {
  const ItemType* type = FindItemType(itemType);
  return type ? BaseUnit(*type).scale.numerator / BaseUnit(*type).scale.denominator : 1;
}

// ---- Series

namespace {

/// A mean of less of a period would be one of another time.
constexpr double kLeastCovered = 0.99;

TimeSpan SpanOf(const Period& period) { return {period.start.SecondsSinceEpoch(), period.end.SecondsSinceEpoch()}; }

}  // namespace

SeriesOverPeriods::SeriesOverPeriods(const std::vector<Period>& periods) : periods_(periods) {}

std::string SeriesOverPeriods::NameOf(std::size_t period) const {
  const Period& named = periods_[period];
  return fmt::format("stress period {} ({} to {})", period + 1, DateInWords(named.start), DateInWords(named.end));
}

FileResult SeriesOverPeriods::Means(const std::string& path, int item, std::vector<double>& means) {
  std::vector<double>& known = known_[{path, item}];
  std::string note;
  if (known.empty()) {
    std::vector<TimeSpan> spans;
    for (const Period& period : periods_) spans.push_back(SpanOf(period));
    const SeriesFacts facts = SumSeries(path, item, spans, {}, {});
    if (!facts.error.empty()) return {facts.error, {}};
    const DataItem* header = DataFileFactsOf(path)->Item(item);
    const double factor = header ? SiFactorOf(header->itemType) : 1;
    std::vector<double> made;
    for (std::size_t period = 0; period < spans.size(); ++period) {
      const PeriodSum& sum = facts.sums[period];
      const double covered = static_cast<double>(sum.covered) / static_cast<double>(spans[period].Seconds());
      if (covered < kLeastCovered)
        return {fmt::format("{}: item {} covers {:.0f} % of {}: lengthen the series, or choose another one", path, item,
                            covered * 100, NameOf(period)),
                {}};
      if (covered < 1 && note.empty())
        note = fmt::format("{}: item {} lacks a small part of {}", path, item, NameOf(period));
      made.push_back(sum.integral / static_cast<double>(sum.covered) * factor);
    }
    known = std::move(made);
  }
  means = known;
  return {{}, note};
}

FileResult SeriesOverPeriods::Means(const ForcingSeries& series, int itemType, std::vector<double>& means) {
  if (!series.problem.empty()) return {series.problem, {}};
  if (!series.constant) return Means(series.path, series.item, means);
  means.assign(periods_.size(), static_cast<double>(*series.constant) * SiFactorOf(itemType));
  return {};
}

FileResult SeriesOverPeriods::MeanGrid(const std::string& path, int item, std::size_t period,
                                       CTvn2DOrthoRotatedGridData& mean) const {
  const TimeSpan span = SpanOf(periods_[period]);
  const auto facts = DataFileFactsOf(path);
  const DataItem* header = facts->Item(item);
  FileResult made = MeanOfGrids(path, item, span.start, span.end, mean);
  if (!made.Ok()) return made;
  if (header) {
    const auto factor = static_cast<float>(SiFactorOf(header->itemType));
    float* value = mean.GetData();
    bool isEmpty = true;
    for (std::size_t cell = 0; cell < mean.Geometry().CellCount(); ++cell) {
      if (mean.IsEmptyValue(value[cell])) continue;
      value[cell] *= factor;
      isEmpty = false;
    }
    if (isEmpty)
      return {fmt::format("{}: item {} has no value in {}: choose a file that covers it", path, item, NameOf(period)),
              {}};
  }
  return made;
}

// ---- The whole

bool Building::Fail(const CYbSEKvfBase& node, const std::string& why) const {
  log.Error(PathOf(node), why);
  return false;
}

void Building::Tell(Fate fate, const CYbSEKvfBase& node, std::string text, std::string_view key) const {
  report.Add(fate, key.empty() ? PathOf(node) : fmt::format("{}:{}", PathOf(node), key), std::move(text));
}

bool Building::Take(const CData2DKvf& quantity, LayerValues& values) const {
  const auto factor = static_cast<float>(SiFactorOf(quantity.GetItemType()));
  if (quantity.Type == CData2DKvf::kUniform) {
    values = LayerValues(quantity.FixedValue * factor);
    return true;
  }
  if (const std::string reason = quantity.WhyFileNotValid(); !reason.empty()) return Fail(quantity, reason);
  CTvn2DOrthoRotatedGridData grid;
  if (const FileResult made = MakeQuantity(quantity, domain.Geometry())(grid); !made.Ok())
    return Fail(quantity, made.error);
  std::vector<float> onModel;
  if (const std::string problem = PutOnModel(grid, domain.Geometry(), quantity.IsCode(), onModel); !problem.empty())
    return Fail(quantity, problem);
  for (float& value : onModel)
    if (value != kDeleteValue) value *= factor;
  values = LayerValues(std::move(onModel));
  return true;
}

}  // namespace tervane::modflow6
