// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/series_totals.h"

#include <algorithm>
#include <cmath>
#include <map>

#include <fmt/format.h>

#include "platform/units.h"

namespace tervane {

namespace {

constexpr double kNoTotal = std::numeric_limits<double>::quiet_NaN();
constexpr std::size_t kStepsAtOnce = 1 << 18;

bool IsOverSteps(ValueType type) { return type == ValueType::StepAccumulated || type == ValueType::MeanStep; }

/// The length that nine of ten steps have; 0 where steps differ, as of months or events.
std::int64_t UsualStep(const TimeAxis& time) {
  if (time.stepSeconds > 0) return time.stepSeconds;
  std::map<std::int64_t, std::size_t> lengths;
  for (std::size_t i = 1; i < time.stamps.size(); ++i) ++lengths[time.stamps[i] - time.stamps[i - 1]];
  const auto usual = std::ranges::max_element(lengths, {}, [](const auto& length) { return length.second; });
  const bool isUsual = usual != lengths.end() && usual->second * 10 >= (time.stamps.size() - 1) * 9;
  return isUsual ? usual->first : 0;
}

/// The part of a span that lies in another one; empty where none does.
TimeSpan Common(const TimeSpan& a, const TimeSpan& b) {
  const TimeSpan common{std::max(a.start, b.start), std::min(a.end, b.end)};
  return common.Seconds() > 0 ? common : TimeSpan{};
}

/// Gaps in the order of time; those that touch are one.
class GapList {
 public:
  explicit GapList(const std::optional<TimeSpan>& watched) : watched_(watched) {}

  void Add(const TimeSpan& span) {
    const TimeSpan gap = watched_ ? Common(span, *watched_) : TimeSpan{};
    if (gap.Seconds() <= 0) return;
    if (!gaps_.empty() && gaps_.back().end >= gap.start)
      gaps_.back().end = std::max(gaps_.back().end, gap.end);
    else
      gaps_.push_back(gap);
  }
  std::vector<TimeSpan> Take() { return std::move(gaps_); }

 private:
  std::optional<TimeSpan> watched_;
  std::vector<TimeSpan> gaps_;
};

/// From when on the first value holds, where anything tells.
std::int64_t BeginOfFirstStep(const TimeAxis& time) {
  if (time.begin && time.begin->IsValid()) return std::min(time.begin->SecondsSinceEpoch(), time.stamps.front());
  return time.stamps.front() - time.stepSeconds;
}

}  // namespace

void PeriodSums::Add(const TimeSpan& span, double first, double last) {
  if (span.Seconds() <= 0) return;
  const auto length = static_cast<double>(span.Seconds());
  const auto at = [&](std::int64_t moment) {
    return first + (last - first) * static_cast<double>(moment - span.start) / length;
  };
  for (std::size_t i = 0; i < periods_.size(); ++i) {
    const TimeSpan part = Common(span, periods_[i]);
    if (part.Seconds() <= 0) continue;
    sums_[i].integral += (at(part.start) + at(part.end)) / 2 * static_cast<double>(part.Seconds());
    sums_[i].covered += part.Seconds();
  }
}

SeriesFacts SumSteps(const DataItem& item, const TimeAxis& time, const std::vector<TimeSpan>& periods,
                     const std::optional<TimeSpan>& watched, const ReadStep& read, ProgressPart progress) {
  SeriesFacts facts;
  PeriodSums sums(periods);
  GapList gaps(watched);
  std::vector<TimeSpan> wanted = periods;
  if (watched) wanted.push_back(*watched);
  const auto isWanted = [&](const TimeSpan& span) {
    return std::ranges::any_of(wanted, [&](const TimeSpan& each) { return Common(span, each).Seconds() > 0; });
  };
  const std::int64_t usual = UsualStep(time);
  const bool isOverSteps = IsOverSteps(item.valueType), isSummed = item.valueType == ValueType::Accumulated;
  std::optional<std::size_t> readStep;
  double before = kNoTotal, value = kNoTotal;
  for (std::size_t step = 0; step < time.stamps.size(); ++step) {
    if (progress.IsCancelled()) {
      facts.error = kCancelled;
      return facts;
    }
    progress.Report(static_cast<double>(step) / static_cast<double>(time.stamps.size()));
    const bool isFirst = step == 0;
    const TimeSpan span{isFirst ? BeginOfFirstStep(time) : time.stamps[step - 1], time.stamps[step]};
    if (!isWanted(span)) continue;
    before = isFirst && isSummed ? 0 : kNoTotal;
    if (!isFirst && !isOverSteps) {
      before = value;
      // The one in front was passed over.
      if (readStep != step - 1)
        if (facts.error = read(step - 1, before); !facts.error.empty()) return facts;
    }
    if (facts.error = read(step, value); !facts.error.empty()) return facts;
    readStep = step;
    // An instantaneous value tells nothing of the time before the first.
    if (isFirst && !isOverSteps && !isSummed) continue;
    const bool isLong = usual > 0 && !isFirst && span.Seconds() > usual + usual / 2;
    if (std::isnan(value) || (!isOverSteps && std::isnan(before))) {
      gaps.Add(span);
      continue;
    }
    if (isLong) gaps.Add(isOverSteps ? TimeSpan{span.start, span.end - usual} : span);
    const auto length = static_cast<double>(span.Seconds());
    if (item.valueType == ValueType::MeanStep)
      sums.Add(span, value, value);
    else if (item.valueType == ValueType::StepAccumulated)
      sums.Add(span, value / length, value / length);
    else if (isSummed)
      sums.Add(span, (value - before) / length, (value - before) / length);
    else
      sums.Add(span, before, value);
  }
  progress.Report(1);
  facts.sums = sums.Sums();
  facts.gaps = gaps.Take();
  return facts;
}

SeriesFacts SumSeries(const std::string& path, int number, const std::vector<TimeSpan>& periods,
                      const std::optional<TimeSpan>& watched, ProgressPart progress) {
  SeriesFacts facts;
  const auto header = DataFileFactsOf(path);
  facts.error = header->error.empty() ? header->WhyNoItem(number) : header->error;
  if (!facts.error.empty()) return facts;
  const DataItem& item = *header->Item(number);
  if (item.dimensions != 0 || !item.hasTime || header->time.stamps.empty()) {
    facts.error = fmt::format("{}: item {} is no time series with dates", path, number);
    return facts;
  }
  DataFile file;
  if (facts.error = file.Open(path); !facts.error.empty()) return facts;
  std::vector<float> values;
  std::size_t firstRead = 0;
  return SumSteps(
      item, header->time, periods, watched,
      [&](std::size_t step, double& value) -> std::string {
        if (values.empty() || step < firstRead || step >= firstRead + values.size()) {
          firstRead = step;
          values.resize(std::min(kStepsAtOnce, header->time.stamps.size() - step));
          const ValueSelection selection{number, step, values.size(), {}};
          if (std::string error = file.Read(selection, values, item.itemType); !error.empty()) return error;
        }
        const float read = values[step - firstRead];
        value = read == kDeleteValue ? kNoTotal : static_cast<double>(read);
        return {};
      },
      progress);
}

// ---- How sums are told

namespace {

constexpr int kMillimetres = 1002, kCubicMetres = 1600, kKilograms = 4201, kKilogramsPerHectare = 4403;
constexpr int kMillimetresPerDay = 2004;

/// The unit in which a rate over time is an amount; null for what is no rate of an amount.
const Unit* AmountOf(const Unit& rate) {
  switch (rate.scale.dimension) {
    case Dimension::Velocity:
      // Depths of water are counted by the day; what is counted by the second is a speed.
      return rate.key == kMillimetresPerDay ? FindUnit(kMillimetres) : nullptr;
    case Dimension::VolumePerTime:
      return FindUnit(kCubicMetres);
    case Dimension::MassPerTime:
      return FindUnit(kKilograms);
    case Dimension::MassPerAreaAndTime:
      return FindUnit(kKilogramsPerHectare);
    default:
      return nullptr;
  }
}

}  // namespace

TotalForm TotalFormOf(int itemType, ValueType valueType) {
  TotalForm form;
  const ItemType* type = FindItemType(itemType);
  if (!type) return form;
  const Unit& base = BaseUnit(*type);
  form.unit = base.abbreviation;
  // Their integral is the amount itself, in the base unit.
  form.isTotal = valueType == ValueType::StepAccumulated || valueType == ValueType::Accumulated;
  if (form.isTotal) return form;
  if (const Unit* amount = AmountOf(base)) {
    form.isTotal = true;
    form.unit = amount->abbreviation;
    form.factor = base.scale.numerator / base.scale.denominator * amount->scale.denominator / amount->scale.numerator;
  }
  return form;
}

double TotalForm::Of(const PeriodSum& sum) const {
  if (sum.covered <= 0) return kNoTotal;
  return (isTotal ? sum.integral : sum.integral / static_cast<double>(sum.covered)) * factor;
}

FileResult ComputeMeans(const std::vector<SeriesOfFile>& series, const TimeSpan& span, ProgressPart progress,
                        SeriesMeans& means) {
  constexpr double kDay = 86400;
  for (std::size_t i = 0; i < series.size(); ++i) {
    const auto& [path, stamp, number] = series[i];
    const double count = static_cast<double>(series.size());
    const ProgressPart part = progress.Part(static_cast<double>(i) / count, static_cast<double>(i + 1) / count);
    const auto facts = DataFileFactsOf(path);
    if (number < 1 || number > static_cast<int>(facts->items.size()) || means.means.contains({path, number})) continue;
    const DataItem& item = facts->items[static_cast<std::size_t>(number - 1)];
    const SeriesFacts read = SumSeries(path, number, {span}, {}, part);
    if (part.IsCancelled()) return {kCancelled, {}};
    if (!read.error.empty() || read.sums.empty() || read.sums.front().covered <= 0) continue;
    const TotalForm form = TotalFormOf(item.itemType, item.valueType);
    SeriesMeans::Mean& mean = means.means[{path, number}];
    mean.value = form.Of(read.sums.front());
    mean.unit = form.unit;
    if (!form.isTotal) continue;
    mean.value *= kDay / static_cast<double>(read.sums.front().covered);
    mean.unit += "/day";
  }
  return {};
}

}  // namespace tervane
