// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "edits/series_edit.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <new>
#include <utility>

#include <fmt/format.h>

#include "data/csv_reader.h"
#include "data/series_block.h"
#include "platform/text.h"

namespace tervane {

namespace {

template <class Value>
void Splice(std::vector<Value>& values, const RowSpan& old, std::vector<Value>& other) {
  const auto first = values.begin() + static_cast<std::ptrdiff_t>(old.first);
  std::vector<Value> taken(first, first + static_cast<std::ptrdiff_t>(old.count));
  const std::size_t common = std::min(old.count, other.size());
  const auto behind = std::copy_n(other.begin(), common, first);
  if (other.size() > common)
    values.insert(behind, other.begin() + static_cast<std::ptrdiff_t>(common), other.end());
  else
    values.erase(behind, behind + static_cast<std::ptrdiff_t>(old.count - common));
  other = std::move(taken);
}

std::optional<std::int64_t> ParseStamp(std::string text) {
  std::ranges::replace(text, '-', '/');
  std::ranges::replace(text, 'T', ' ');
  const std::string_view trimmed = Trimmed(text);
  for (const char* format : {"%Y/%m/%d %H:%M:%S", "%Y/%m/%d %H:%M", "%Y/%m/%d"})
    if (const CYbDateTime time = CYbDateTime::Parse(trimmed, format); time.IsValid()) return time.SecondsSinceEpoch();
  return std::nullopt;
}

std::string TextOfStamp(std::int64_t stamp) {
  return CYbDateTime::FromSecondsSinceEpoch(stamp).Format("%Y-%m-%d %H:%M:%S");
}

}  // namespace

class SeriesEdit::ValuesStep : public EditStep {
 public:
  ValuesStep(SeriesEdit& edit, std::vector<Stretch> stretches) : edit_(edit), stretches_(std::move(stretches)) {}

  void Swap() override {
    for (Stretch& stretch : stretches_) {
      std::swap_ranges(stretch.values.begin(), stretch.values.end(),
                       edit_.rows_.values[stretch.series].begin() + static_cast<std::ptrdiff_t>(stretch.first));
      edit_.changed_.insert(stretch.series);
    }
  }
  std::size_t Bytes() const override {
    std::size_t bytes = sizeof(*this);
    for (const Stretch& stretch : stretches_) bytes += sizeof(stretch) + stretch.values.capacity() * sizeof(float);
    return bytes;
  }

 private:
  SeriesEdit& edit_;
  std::vector<Stretch> stretches_;
};

class SeriesEdit::RowsStep : public EditStep {
 public:
  RowsStep(SeriesEdit& edit, const RowSpan& old, SeriesRows rows) : edit_(edit), old_(old), rows_(std::move(rows)) {}

  void Swap() override {
    const std::size_t count = rows_.stamps.size();
    Splice(edit_.rows_.stamps, old_, rows_.stamps);
    for (std::size_t series = 0; series < rows_.values.size(); ++series) {
      // Series that stay as they are need not be writable.
      std::vector<float>& values = edit_.rows_.values[series];
      const auto first = values.begin() + static_cast<std::ptrdiff_t>(old_.first);
      const bool stays =
          old_.count == count && std::equal(rows_.values[series].begin(), rows_.values[series].end(), first);
      Splice(values, old_, rows_.values[series]);
      if (!stays) edit_.changed_.insert(series);
    }
    std::swap(edit_.rows_.begin, rows_.begin);
    old_.count = count;
  }
  std::size_t Bytes() const override {
    return sizeof(*this) + rows_.stamps.capacity() * sizeof(std::int64_t) +
           rows_.values.size() * rows_.stamps.size() * sizeof(float);
  }

 private:
  SeriesEdit& edit_;
  RowSpan old_;
  SeriesRows rows_;
};

struct SeriesEdit::PastedRow {
  std::optional<std::int64_t> stamp;
  std::vector<float> values;
};

SeriesEdit::SeriesEdit(std::string path) : EditedFile(std::move(path)) { Begin(); }

std::string SeriesEdit::Read() {
  std::error_code error;
  os::File original = os::File::OpenForReading(Path(), error);
  DataFile file;
  if (std::string problem = file.Open(Path()); !problem.empty()) return problem;
  if (error) return fmt::format("cannot read {}: {}", Path(), error.message());
  const auto refused = [&](const std::string& why) { return fmt::format("cannot edit {}: {}", Path(), why); };
  const FileUpdateFacts facts = UpdateFactsOf(Path());
  if (!facts.whyNot.empty()) return refused(facts.whyNot);
  std::vector<int> numbers;
  std::vector<DataItem> items;
  std::vector<ItemUpdateFacts> updates;
  for (std::size_t i = 0; i < file.Items().size(); ++i) {
    if (file.Items()[i].dimensions != 0 || !file.Items()[i].hasTime) continue;
    numbers.push_back(static_cast<int>(i) + 1);
    items.push_back(file.Items()[i]);
    updates.push_back(facts.items[i]);
  }
  if (items.empty()) return refused("it holds no series");
  if (!file.Time().hasDates) return refused("its steps have no dates");
  SeriesRows rows;
  try {
    if (std::string problem = ReadSeriesTogether(Path(), numbers, rows.values); !problem.empty()) return problem;
  } catch (const std::bad_alloc&) {
    return refused("it needs more than the free memory");
  }
  rows.stamps = file.Time().stamps;
  if (file.Time().begin) rows.begin = file.Time().begin->SecondsSinceEpoch();
  original_ = std::move(original);
  numbers_ = std::move(numbers);
  items_ = std::move(items);
  updates_ = std::move(updates);
  whyNoOtherTimes_ = facts.whyNoOtherTimes;
  notes_ = file.Notes();
  rows_ = std::move(rows);
  savedStamps_ = rows_.stamps;
  savedBegin_ = rows_.begin;
  changed_.clear();
  return {};
}

FileResult SeriesEdit::Write(const std::string& path, ProgressPart progress) {
  if (rows_.stamps != savedStamps_ || rows_.begin != savedBegin_)
    return RewriteSeries(original_, path, {rows_.stamps, rows_.begin, rows_.values}, progress);
  DataFileUpdate update;
  if (std::string error = update.Begin(original_, path, progress.Part(0, 0.5)); !error.empty()) return {error, {}};
  for (const std::size_t series : changed_)
    if (std::string error = update.PutSeries(numbers_[series], rows_.values[series]); !error.empty())
      return {error, {}};
  return update.Finish(progress.Part(0.5, 1));
}

void SeriesEdit::Saved() {
  std::error_code error;
  os::File original = os::File::OpenForReading(Path(), error);
  // What is held would be the file before; all that differs from it stays to be written.
  if (error) return;
  original_ = std::move(original);
  savedStamps_ = rows_.stamps;
  savedBegin_ = rows_.begin;
  changed_.clear();
}

std::int64_t SeriesEdit::StepSeconds() const {
  const std::vector<std::int64_t>& stamps = rows_.stamps;
  if (stamps.size() < 2) return 0;
  const std::int64_t step = stamps[1] - stamps[0];
  for (std::size_t i = 2; i < stamps.size(); ++i)
    if (stamps[i] - stamps[i - 1] != step) return 0;
  return step;
}

RowSpan SeriesEdit::Within(RowSpan rows) const {
  rows.first = std::min(rows.first, Rows());
  rows.count = std::min(rows.count, Rows() - rows.first);
  return rows;
}

SeriesStatistics SeriesEdit::Statistics(std::size_t series, const RowSpan& asked) const {
  ValueSummary summary;
  const RowSpan rows = Within(asked);
  summary.Add(std::span(rows_.values[series]).subspan(rows.first, rows.count));
  constexpr double kNone = std::numeric_limits<double>::quiet_NaN();
  if (summary.count == 0) return {0, summary.missing, kNone, kNone, 0, kNone};
  return {summary.count, summary.missing, static_cast<double>(summary.smallest), static_cast<double>(summary.largest),
          summary.sum,   summary.Mean()};
}

// ---- Changes

std::string SeriesEdit::WhyNotValue(std::size_t series, double value) const {
  if (!updates_[series].whyNot.empty())
    return fmt::format("{} cannot be changed: {}", items_[series].name, updates_[series].whyNot);
  if (value == static_cast<double>(kDeleteValue)) return {};
  if (!std::isfinite(value)) return "a number was expected";
  if (std::abs(value) > static_cast<double>(std::numeric_limits<float>::max()))
    return fmt::format("{} is too large for single precision", ShortestNumber(value));
  if (value < updates_[series].from || value > updates_[series].to)
    return fmt::format("{}: the file takes values from {} to {}", items_[series].name,
                       ShortestNumber(updates_[series].from), ShortestNumber(updates_[series].to));
  return {};
}

std::string SeriesEdit::WhyNotTimes() const {
  return whyNoOtherTimes_.empty() ? std::string()
                                  : fmt::format("the times of the file cannot be changed: {}", whyNoOtherTimes_);
}

void SeriesEdit::ChangeValues(const std::string& name, std::vector<Stretch> stretches) {
  // Only what differs, from the first to the last.
  std::vector<Stretch> kept;
  for (Stretch& stretch : stretches) {
    const float* old = rows_.values[stretch.series].data() + stretch.first;
    std::size_t begin = 0, end = stretch.values.size();
    while (begin < end && stretch.values[begin] == old[begin]) ++begin;
    while (end > begin && stretch.values[end - 1] == old[end - 1]) --end;
    if (begin == end) continue;
    kept.push_back({stretch.series,
                    stretch.first + begin,
                    {stretch.values.begin() + static_cast<std::ptrdiff_t>(begin),
                     stretch.values.begin() + static_cast<std::ptrdiff_t>(end)}});
  }
  if (kept.empty()) return;
  auto step = std::make_unique<ValuesStep>(*this, std::move(kept));
  step->Swap();
  Take(name, std::move(step));
}

void SeriesEdit::ChangeRows(const std::string& name, const RowSpan& old, SeriesRows rows) {
  auto step = std::make_unique<RowsStep>(*this, old, std::move(rows));
  step->Swap();
  Take(name, std::move(step));
}

template <class NewValue>
std::string SeriesEdit::ChangeEach(const std::string& name, RowSpan rows, const std::vector<std::size_t>& series,
                                   const NewValue& newValue) {
  rows = Within(rows);
  std::vector<Stretch> stretches;
  for (const std::size_t each : series) {
    Stretch stretch{each, rows.first, {}};
    for (std::size_t row = rows.first; row < rows.End(); ++row) {
      const double value = newValue(each, row, rows_.values[each][row]);
      if (std::string why = WhyNotValue(each, value); !why.empty()) return why;
      stretch.values.push_back(static_cast<float>(value));
    }
    stretches.push_back(std::move(stretch));
  }
  ChangeValues(name, std::move(stretches));
  return {};
}

std::string SeriesEdit::SetValue(std::size_t series, std::size_t row, float value) {
  return ChangeEach("Change Value", {row, 1}, {series},
                    [&](std::size_t, std::size_t, float) { return static_cast<double>(value); });
}

std::string SeriesEdit::DeleteValues(const RowSpan& rows, const std::vector<std::size_t>& series) {
  return ChangeEach("Delete Values", rows, series,
                    [&](std::size_t, std::size_t, float) { return static_cast<double>(kDeleteValue); });
}

std::string SeriesEdit::Scale(const RowSpan& rows, const std::vector<std::size_t>& series, double factor,
                              double offset) {
  if (!std::isfinite(factor) || !std::isfinite(offset)) return "a number was expected";
  return ChangeEach("Scale", rows, series, [&](std::size_t, std::size_t, float value) {
    return value == kDeleteValue ? static_cast<double>(value) : static_cast<double>(value) * factor + offset;
  });
}

std::string SeriesEdit::FillGaps(const RowSpan& asked, const std::vector<std::size_t>& series, GapFill fill,
                                 float constant) {
  const RowSpan rows = Within(asked);
  std::vector<Stretch> stretches;
  for (const std::size_t each : series) {
    if (std::string why = WhyNotValue(each, static_cast<double>(fill == GapFill::Constant ? constant : kDeleteValue));
        !why.empty())
      return why;
    const std::vector<float>& values = rows_.values[each];
    for (std::size_t row = rows.first; row < rows.End(); ++row) {
      if (values[row] != kDeleteValue) continue;
      std::size_t begin = row, end = row;
      // The gap may be larger than what is selected of it.
      while (begin > 0 && values[begin - 1] == kDeleteValue) --begin;
      while (end < values.size() && values[end] == kDeleteValue) ++end;
      const bool hasBefore = begin > 0, hasBehind = end < values.size();
      Stretch stretch{each, row, {}};
      for (; row < std::min(end, rows.End()); ++row) {
        float value = constant;
        if (fill == GapFill::Previous) value = hasBefore ? values[begin - 1] : kDeleteValue;
        if (fill == GapFill::Linear) {
          value = kDeleteValue;
          if (hasBefore && hasBehind) {
            const double length = static_cast<double>(rows_.stamps[end] - rows_.stamps[begin - 1]);
            const double part = static_cast<double>(rows_.stamps[row] - rows_.stamps[begin - 1]) / length;
            const auto before = static_cast<double>(values[begin - 1]), behind = static_cast<double>(values[end]);
            value = static_cast<float>(before + (behind - before) * part);
          }
        }
        stretch.values.push_back(value);
      }
      stretches.push_back(std::move(stretch));
    }
  }
  ChangeValues("Fill Gaps", std::move(stretches));
  return {};
}

std::string SeriesEdit::SetTime(std::size_t row, const CYbDateTime& time) {
  if (std::string why = WhyNotTimes(); !why.empty()) return why;
  if (row >= Rows() || !time.IsValid()) return "a date as 2000-01-31 12:00 was expected";
  const std::int64_t stamp = time.SecondsSinceEpoch();
  if (row > 0 && stamp <= rows_.stamps[row - 1])
    return fmt::format("a time after {}, that of the row before, was expected", TextOfStamp(rows_.stamps[row - 1]));
  if (row + 1 < Rows() && stamp >= rows_.stamps[row + 1])
    return fmt::format("a time before {}, that of the next row, was expected", TextOfStamp(rows_.stamps[row + 1]));
  if (stamp == rows_.stamps[row]) return {};
  SeriesRows rows{{stamp}, {}, rows_.begin};
  if (row == 0 && rows.begin && *rows.begin >= stamp) rows.begin.reset();
  for (const auto& values : rows_.values) rows.values.push_back({values[row]});
  ChangeRows("Change Time", {row, 1}, std::move(rows));
  return {};
}

std::string SeriesEdit::InsertRow(std::size_t row) {
  if (std::string why = WhyNotTimes(); !why.empty()) return why;
  row = std::min(row, Rows());
  const std::vector<std::int64_t>& stamps = rows_.stamps;
  constexpr std::int64_t kDay = 86400;
  const std::int64_t step = stamps.size() > 1 ? stamps[stamps.size() - 1] - stamps[stamps.size() - 2] : kDay;
  SeriesRows rows{{}, std::vector<std::vector<float>>(SeriesCount(), {kDeleteValue}), rows_.begin};
  if (stamps.empty()) {
    rows.stamps = {0};
  } else if (row == stamps.size()) {
    rows.stamps = {stamps.back() + step};
  } else if (row == 0) {
    const std::int64_t first = stamps.size() > 1 ? stamps[1] - stamps[0] : kDay;
    rows.stamps = {stamps[0] - first};
    if (rows.begin) *rows.begin -= first;
  } else {
    rows.stamps = {stamps[row - 1] + (stamps[row] - stamps[row - 1]) / 2};
    if (rows.stamps[0] <= stamps[row - 1]) return "there is no second between the times of the two rows";
  }
  if (!CYbDateTime::FromSecondsSinceEpoch(rows.stamps[0]).IsValid()) return "no date lies beyond";
  ChangeRows("Insert Row", {row, 0}, std::move(rows));
  return {};
}

std::string SeriesEdit::DeleteRows(const RowSpan& asked) {
  if (std::string why = WhyNotTimes(); !why.empty()) return why;
  const RowSpan rows = Within(asked);
  if (rows.count == 0) return {};
  if (rows.count == Rows()) return "a series needs a row: delete the values instead";
  SeriesRows none{{}, std::vector<std::vector<float>>(SeriesCount()), rows_.begin};
  // What is the first now begins where the last one that went has ended.
  if (rows.first == 0 && rows_.begin) none.begin = rows_.stamps[rows.count - 1];
  ChangeRows("Delete Rows", rows, std::move(none));
  return {};
}

std::string SeriesEdit::ShiftTimes(std::int64_t seconds, int months) {
  if (std::string why = WhyNotTimes(); !why.empty()) return why;
  SeriesRows rows = rows_;
  const auto moved = [&](std::int64_t stamp) { return (months == 0 ? stamp : MonthsLater(stamp, months)) + seconds; };
  for (std::size_t row = 0; row < rows.stamps.size(); ++row) {
    rows.stamps[row] = moved(rows.stamps[row]);
    if (!CYbDateTime::FromSecondsSinceEpoch(rows.stamps[row]).IsValid())
      return "a time would lie outside the years 1 to 9999";
    if (row > 0 && rows.stamps[row] <= rows.stamps[row - 1])
      return fmt::format("two times would fall on {}, since months differ in length", TextOfStamp(rows.stamps[row]));
  }
  if (rows.begin) rows.begin = moved(*rows.begin);
  if (rows.begin && *rows.begin >= rows.stamps.front())
    return fmt::format("the first step would have no length, since months differ in length: it would end on {}",
                       TextOfStamp(rows.stamps.front()));
  if (rows.stamps == rows_.stamps) return {};
  // The values stay where they are.
  rows.values.clear();
  ChangeRows("Shift Times", {0, Rows()}, std::move(rows));
  return {};
}

std::string SeriesEdit::Cut(const CYbDateTime& from, const CYbDateTime& to) {
  if (std::string why = WhyNotTimes(); !why.empty()) return why;
  if (!from.IsValid() || !to.IsValid() || to < from) return "a period from one date to a later one was expected";
  const std::vector<std::int64_t>& stamps = rows_.stamps;
  const auto first =
      static_cast<std::size_t>(std::ranges::lower_bound(stamps, from.SecondsSinceEpoch()) - stamps.begin());
  const auto end = static_cast<std::size_t>(std::ranges::upper_bound(stamps, to.SecondsSinceEpoch()) - stamps.begin());
  if (first >= end) return "no row lies in that period";
  SeriesRows rows{
      {stamps.begin() + static_cast<std::ptrdiff_t>(first), stamps.begin() + static_cast<std::ptrdiff_t>(end)},
      {},
      rows_.begin};
  if (end - first == Rows()) return {};
  if (first > 0 && rows.begin) rows.begin = stamps[first - 1];
  for (const auto& values : rows_.values)
    rows.values.emplace_back(values.begin() + static_cast<std::ptrdiff_t>(first),
                             values.begin() + static_cast<std::ptrdiff_t>(end));
  ChangeRows("Cut to Period", {0, Rows()}, std::move(rows));
  return {};
}

std::string SeriesEdit::ResampleTo(const ResamplingStep& step) {
  if (std::string why = WhyNotTimes(); !why.empty()) return why;
  std::vector<ValueType> types;
  for (const DataItem& item : items_) types.push_back(item.valueType);
  SeriesRows rows;
  if (std::string why = Resample(rows_, types, step, rows); !why.empty()) return why;
  // Values of a moment have no interval of which a begin could be told.
  if (!rows_.begin) rows.begin.reset();
  ChangeRows("Resample", {0, Rows()}, std::move(rows));
  return {};
}

// ---- What is pasted

std::string SeriesEdit::Paste(std::size_t row, std::size_t series, const std::string& text, std::string& note) {
  note.clear();
  std::vector<PastedRow> pasted;
  std::vector<std::string> cells;
  CsvReader reader(text, false);
  bool areTimes = true, isHead = false;
  while (reader.Next(cells)) {
    PastedRow& line = pasted.emplace_back();
    line.stamp = ParseStamp(cells[0]);
    const std::size_t first = line.stamp ? 1 : 0;
    for (std::size_t i = first; i < cells.size(); ++i) {
      const std::string_view cell = Trimmed(cells[i]);
      const auto number = cell.empty() ? std::optional(static_cast<double>(kDeleteValue))
                                       : ParseCsvNumber(cell, !reader.SeparatesByComma());
      if (!number && pasted.size() == 1 && note.empty()) {
        isHead = true;
        break;
      }
      if (!number) return fmt::format("line {}: {} is no number", reader.Line(), cell);
      if (series + line.values.size() >= SeriesCount())
        return fmt::format("line {} has more values than there are series from {} on", reader.Line(),
                           items_[series].name);
      if (std::string why = WhyNotValue(series + line.values.size(), *number); !why.empty())
        return fmt::format("line {}: {}", reader.Line(), why);
      line.values.push_back(static_cast<float>(*number));
    }
    if (std::exchange(isHead, false)) {
      pasted.clear();
      note = "The first line holds names and was left out. ";
      continue;
    }
    areTimes = areTimes && line.stamp.has_value();
  }
  if (pasted.empty()) return "there are no numbers to paste";
  if (areTimes) return PasteByTime(series, std::move(pasted), note);
  if (row + pasted.size() > Rows())
    return fmt::format("{} lines are more than the {} rows from here to the end; paste them with their times",
                       pasted.size(), Rows() - std::min(row, Rows()));
  std::vector<Stretch> stretches;
  for (std::size_t i = 0; i < pasted.size(); ++i) {
    if (pasted[i].stamp) return fmt::format("line {} begins with a time, and others do not", i + 1);
    for (std::size_t k = 0; k < pasted[i].values.size(); ++k) {
      // Lines of one length, which is the usual, are one stretch a series.
      if (k < stretches.size() && stretches[k].values.size() == i)
        stretches[k].values.push_back(pasted[i].values[k]);
      else
        stretches.push_back({series + k, row + i, {pasted[i].values[k]}});
    }
  }
  ChangeValues("Paste", std::move(stretches));
  return {};
}

std::string SeriesEdit::PasteByTime(std::size_t series, std::vector<PastedRow> pasted, std::string& note) {
  std::ranges::stable_sort(pasted, {}, &PastedRow::stamp);
  for (std::size_t i = 1; i < pasted.size(); ++i)
    if (pasted[i].stamp == pasted[i - 1].stamp)
      return fmt::format("the time {} stands in two lines", TextOfStamp(*pasted[i].stamp));
  const std::vector<std::int64_t>& stamps = rows_.stamps;
  const auto first = static_cast<std::size_t>(std::ranges::lower_bound(stamps, *pasted.front().stamp) - stamps.begin());
  const auto end = static_cast<std::size_t>(std::ranges::upper_bound(stamps, *pasted.back().stamp) - stamps.begin());
  SeriesRows rows{{}, std::vector<std::vector<float>>(SeriesCount()), rows_.begin};
  std::size_t added = 0, row = first;
  const auto take = [&](std::int64_t stamp, bool isThere) {
    rows.stamps.push_back(stamp);
    for (std::size_t k = 0; k < SeriesCount(); ++k)
      rows.values[k].push_back(isThere ? rows_.values[k][row] : kDeleteValue);
  };
  for (const PastedRow& line : pasted) {
    for (; row < end && stamps[row] < *line.stamp; ++row) take(stamps[row], true);
    const bool isThere = row < end && stamps[row] == *line.stamp;
    take(*line.stamp, isThere);
    row += isThere ? 1 : 0;
    added += isThere ? 0 : 1;
    for (std::size_t k = 0; k < line.values.size(); ++k) rows.values[series + k].back() = line.values[k];
  }
  if (added > 0)
    if (std::string why = WhyNotTimes(); !why.empty()) return why;
  if (first == 0 && rows.begin && !rows.stamps.empty() && rows.stamps.front() <= *rows.begin) rows.begin.reset();
  note += fmt::format("{} rows were added, {} have other values.", added, pasted.size() - added);
  ChangeRows("Paste", {first, end - first}, std::move(rows));
  return {};
}

}  // namespace tervane
