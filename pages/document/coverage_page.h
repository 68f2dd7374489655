// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <set>
#include <string>
#include <vector>

#include "document/coverage_board.h"
#include "forms/page.h"
#include "forms/plots.h"
#include "forms/table_of.h"

namespace tervane {

/// A row of the table of totals: a forcing's station, or its mean over the domain.
struct CoverageTotalsRow {
  const ForcingTotals* totals = nullptr;
  std::size_t column = 0;
  int decimals = 0;
};

/// A row of the table of files: a file, or several of one cause in one line, which opens.
struct CoverageFileRow {
  const CoverageRow* file = nullptr;  ///< The first of several.
  std::size_t count = 1;
  bool isOpen = false;
  std::string cause = {};  ///< What those of a group have in common.
  bool isInGroup = false;  ///< Of a group that is open.
};

/// How the data cover the simulation and the model domain, and what the forcings come to.
class CCoverageDlg : public PageOf<CCoverageKvf> {
 public:
  using PageOf::PageOf;

  void OnRefresh() override { Follow(); }

 protected:
  void Describe(PageForm& form) override;

 private:
  /// Shows the board of now when it is computed; true when it is another one than before.
  bool Follow();
  void ShowBoard(std::shared_ptr<const CoverageBoard> board);
  void GroupFiles();
  /// A group opens or closes; of a file its page is shown.
  void OpenOrGoTo(const CoverageFileRow& row);
  void ShowFile(int row);
  void ShowTotals(int row);
  void GoTo(const std::string& path) const;

  std::string SimulationText() const;
  std::string DomainText() const;
  std::string RemarksText() const;
  std::string ChecksText() const;
  MapContent Map();
  SeriesContent Chart();

  std::shared_ptr<const CoverageBoard> board_;  ///< Null until one is computed.
  std::vector<CoverageFileRow> files_;
  std::set<std::string> open_;  ///< The causes of the groups that are open.
  std::vector<CoverageTotalsRow> totals_;
  std::shared_ptr<TableOf<CoverageTotalsRow>> totalsTable_;
  std::string chosen_;                          ///< The path of the file or forcing that map and chart show.
  std::shared_ptr<const CYbShapeData> extent_;  ///< Of the chosen file.
};

}  // namespace tervane
