// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A file of time series while it is changed. Values are in the unit of the file, so that what is typed is what is
// stored.
#pragma once

#include <cstdint>
#include <optional>
#include <set>
#include <string>
#include <vector>

#include "data/datafile.h"
#include "data/datafile_update.h"
#include "edits/edited_file.h"
#include "edits/resampling.h"

namespace tervane {

/// Rows [first, first + count) of the table.
struct RowSpan {
  std::size_t first = 0, count = 0;

  std::size_t End() const { return first + count; }
};

enum class GapFill { Linear, Constant, Previous };

struct SeriesStatistics {
  std::uint64_t count = 0, missing = 0;
  double smallest = 0, largest = 0, sum = 0, mean = 0;  ///< Not numbers without a value.
};

/// All series of the file are in memory, over one axis of times. Series are counted from 0. Each operation is one step
/// of undo, which costs what it changed; it gives "" or why not, and then has changed nothing.
class SeriesEdit : public EditedFile {
 public:
  explicit SeriesEdit(std::string path);

  std::size_t SeriesCount() const { return items_.size(); }
  const DataItem& ItemOf(std::size_t series) const { return items_[series]; }
  /// Why its values cannot be changed; empty when they can.
  const std::string& WhyNotChanged(std::size_t series) const { return updates_[series].whyNot; }
  /// Why rows cannot come, go or get other times; empty when they can.
  const std::string& WhyNoOtherTimes() const { return whyNoOtherTimes_; }
  const std::vector<std::string>& Notes() const { return notes_; }

  std::size_t Rows() const { return rows_.stamps.size(); }
  CYbDateTime TimeOf(std::size_t row) const { return CYbDateTime::FromSecondsSinceEpoch(rows_.stamps[row]); }
  const std::vector<std::int64_t>& Stamps() const { return rows_.stamps; }
  float ValueOf(std::size_t series, std::size_t row) const { return rows_.values[series][row]; }
  const std::vector<float>& ValuesOf(std::size_t series) const { return rows_.values[series]; }
  /// The distance of the times when all are equal, else 0.
  std::int64_t StepSeconds() const;
  SeriesStatistics Statistics(std::size_t series, const RowSpan& rows) const;

  std::string SetValue(std::size_t series, std::size_t row, float value);
  /// A time that lies between those of the rows beside.
  std::string SetTime(std::size_t row, const CYbDateTime& time);
  /// Puts a row without values in front of a row, in the middle between the times; at the end, one step later.
  std::string InsertRow(std::size_t row);
  std::string DeleteRows(const RowSpan& rows);
  std::string DeleteValues(const RowSpan& rows, const std::vector<std::size_t>& series);
  /// Takes what a spreadsheet gives. Where each line begins with a time its values go to that time, in a row of its own
  /// where there is none; else they go to the rows from `row` on. The first number goes to `series`. `note` tells what
  /// was done.
  std::string Paste(std::size_t row, std::size_t series, const std::string& text, std::string& note);
  /// Of the missing values in those rows. Linear ones need a value on both sides, previous ones one before.
  std::string FillGaps(const RowSpan& rows, const std::vector<std::size_t>& series, GapFill fill, float constant);
  /// Each value becomes value * factor + offset.
  std::string Scale(const RowSpan& rows, const std::vector<std::size_t>& series, double factor, double offset);
  /// Moves all times; months keep the day, or take the last one of a shorter month.
  std::string ShiftTimes(std::int64_t seconds, int months);
  /// Keeps the rows from one time to another, both included.
  std::string Cut(const CYbDateTime& from, const CYbDateTime& to);
  std::string ResampleTo(const ResamplingStep& step);

 protected:
  std::string Read() override;
  FileResult Write(const std::string& path, ProgressPart progress) override;
  void Saved() override;

 private:
  class ValuesStep;
  class RowsStep;
  /// Values of one series that stand one behind the other.
  struct Stretch {
    std::size_t series, first;
    std::vector<float> values;
  };

  std::string WhyNotValue(std::size_t series, double value) const;
  std::string WhyNotTimes() const;
  /// Puts values in the place of others.
  void ChangeValues(const std::string& name, std::vector<Stretch> stretches);
  /// Puts rows in the place of others.
  void ChangeRows(const std::string& name, const RowSpan& old, SeriesRows rows);
  RowSpan Within(RowSpan rows) const;
  /// Calls `newValue(row, value)` for each value, which gives another one, the same or an error.
  template <class NewValue>
  std::string ChangeEach(const std::string& name, RowSpan rows, const std::vector<std::size_t>& series,
                         const NewValue& newValue);
  struct PastedRow;
  std::string PasteByTime(std::size_t series, std::vector<PastedRow> pasted, std::string& note);

  os::File original_;
  std::vector<int> numbers_;  ///< Of the items in the file.
  std::vector<DataItem> items_;
  std::vector<ItemUpdateFacts> updates_;
  std::string whyNoOtherTimes_;
  std::vector<std::string> notes_;
  SeriesRows rows_;
  std::vector<std::int64_t> savedStamps_;
  std::optional<std::int64_t> savedBegin_;
  std::set<std::size_t> changed_;  ///< Series whose values may differ from the file's.
};

}  // namespace tervane
