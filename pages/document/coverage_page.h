// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "document/coverage_board.h"
#include "forms/page.h"
#include "forms/plots.h"

namespace tervane {

class CoverageFileList;
class CoverageTotalsList;

/// How the data cover the simulation and the model domain, and what the forcings come to.
class CCoverageDlg : public PageOf<CCoverageKvf> {
 public:
  CCoverageDlg(CYbSEKvfBase& node, PageContext context);
  ~CCoverageDlg() override;

  void OnRefresh() override { Follow(); }

 protected:
  void Describe(PageForm& form) override;

 private:
  /// Shows the board of now when it is computed; true when it is another one than before.
  bool Follow();
  void ShowBoard(std::shared_ptr<const CoverageBoard> board);
  void ShowFile(int row);
  void ShowTotals(int row);
  void GoTo(const std::string& path) const;

  std::string SimulationText() const;
  std::string DomainText() const;
  std::string RemarksText() const;
  MapContent Map();
  SeriesContent Chart();

  std::shared_ptr<const CoverageBoard> board_;  ///< Null until one is computed.
  std::unique_ptr<CoverageFileList> files_;
  std::unique_ptr<CoverageTotalsList> totals_;
  std::shared_ptr<TableForm> totalsTable_;
  std::string chosen_;                          ///< The path of the file or forcing that map and chart show.
  std::shared_ptr<const CYbShapeData> extent_;  ///< Of the chosen file.
};

}  // namespace tervane
