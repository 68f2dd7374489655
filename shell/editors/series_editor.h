// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTimer>
#include <functional>
#include <set>
#include <string>
#include <vector>

#include "edits/series_edit.h"
#include "forms/plots.h"
#include "shell/editors/edit_tab.h"

class QLineEdit;
class QLabel;
class QListWidget;

namespace tervane {

class EditPanel;
class EditTable;
class SeriesPlot;

/// The series of a data file, to be changed: a chart of those that are chosen, all values as a table below, and what is
/// done to the rows that are selected there, or to all, beside both. Values are in the unit of the file.
class SeriesEditor : public EditTab {
  Q_OBJECT

 public:
  SeriesEditor(const std::string& path, Host& host);
  ~SeriesEditor() override;

  EditedFile& File() override { return edit_; }
  SeriesEdit& Edited() { return edit_; }
  void Commit() override;
  Host::FileQuestion NameQuestion() const override;

 protected:
  void Sync() override;

 private:
  EditPanel* BuildPanel();
  EditTable* BuildTable();
  /// The series of the file in the list, where it has others.
  void FillList();
  SeriesContent Chart() const;
  /// What the user has changed or chosen is shown.
  void Follow();
  void ShowStatistics();
  /// The rows that are selected in the table, all without a selection of several cells.
  RowSpan Rows() const;
  /// The series whose columns are selected, those in the list without one.
  std::vector<std::size_t> Chosen() const;
  /// One of those steps, by the texts of the panel.
  struct Span {
    std::int64_t seconds = 0;
    int months = 0;
  };
  static Span SpanOf(int unit, int count);
  /// A date that stands in a field; one that is not valid, and it is told, where there is none.
  CYbDateTime DateIn(const QLineEdit& field);

  SeriesEdit edit_;
  QListWidget* list_;
  SeriesPlot* chart_;
  EditTable* table_;
  EditPanel* panel_;
  QLabel* statistics_ = nullptr;
  QTimer rest_;
};

}  // namespace tervane
