// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// The pages of processed data: what the preprocessor made of the setup. Nothing is changed on them; files are read when
// a page is shown.
#pragma once

#include <memory>
#include <span>
#include <string>

#include "execution/processed_data.h"
#include "execution/processed_pages.h"
#include "execution/processed_river.h"
#include "forms/page_rows.h"
#include "forms/plots.h"
#include "pages/parts/section_tool.h"

namespace tervane {

/// Where the report lies, and what was read of it.
class CProcDataDlg : public PageOf<CProcDataKvf> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

/// A page without content, which has pages below it.
class CPreprocessedBlankDlg : public PageOf<CPreprocessedDataEntity> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& /*form*/) override {}
};

/// What pages over a data file have in common: its name, and a button that opens it.
class PreprocessedFilePage : public PageOf<CPreprocessedDataEntity> {
 public:
  using PageOf::PageOf;

 protected:
  void DescribeFile(PageForm& form);
  int Item() const { return Node().GetNumber("ItemNo"); }
};

/// A time series with the simulation period.
class CPreprocessedNDS0_PLOTDlg : public PreprocessedFilePage {
 public:
  using PreprocessedFilePage::PreprocessedFilePage;

 protected:
  void Describe(PageForm& form) override;

 private:
  SeriesContent Chart() const;
  /// The period that the report tells; null, with the reason in `notice`, where it tells none that is one.
  void ReadPeriod(std::string& notice, SeriesContent& chart) const;
};

/// A line: its file alone is shown.
class CPreProcessedNDS1_PLOTDlg : public PreprocessedFilePage {
 public:
  using PreprocessedFilePage::PreprocessedFilePage;

 protected:
  void Describe(PageForm& form) override { DescribeFile(form); }
};

/// A map of a grid to which the river network may be added.
class CProcDataGridAndRiverPlot {
 public:
  explicit CProcDataGridAndRiverPlot(MapContent map) : map_(std::move(map)) {}

  void Add(const CProcDataRiverLinkOverlay& links);
  void Add(const CProcDataRiverPointOverlay& points);
  MapContent Take() { return std::move(map_); }

 private:
  void AddLines(ShapeLayer layer);

  MapContent map_;
};

/// A grid, with the river network where the report asks for it.
class CPreprocessedNDS2_PLOT : public PreprocessedFilePage {
 public:
  using PreprocessedFilePage::PreprocessedFilePage;

  void SetData() override;
  /// Reads the river network again.
  void OnRefresh() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  MapContent Map();
  void ReadRiver();

  bool isRiverRead_ = false;
  std::string riverProblem_;
  std::optional<CProcDataRiverLinkOverlay> links_;
  std::optional<CProcDataRiverPointOverlay> points_;
};

/// One of several layers of grids, counted from the top. Elevations are bottoms of layers, which a section shows below
/// the topography of the report.
class CPreprocessedNDS3_PLOTDlg : public PreprocessedFilePage {
 public:
  CPreprocessedNDS3_PLOTDlg(CYbSEKvfBase& node, PageContext context)
      : PreprocessedFilePage(node, std::move(context)), section_(Context().syncSoon) {}

  void SetData() override;
  /// Looks at the file's layers again.
  void OnRefresh() override;

 protected:
  void Describe(PageForm& form) override;

 private:
  bool HasFixedLayer() const { return !Node().GetValue("LayerNo").empty(); }
  MapContent Map() const;
  SectionContent Section() const;

  SectionTool section_;
  bool isRead_ = false;
  bool areElevations_ = false;
  int layers_ = 0;
  int selection_ = 0;  ///< 0 for the top.
  std::string problem_;
};

/// A text of the report.
class CPreprocessedTextDlg : public PageOf<CPreprocessedDataEntity> {
 public:
  using PageOf::PageOf;

 protected:
  void Describe(PageForm& form) override;
};

/// A text file.
class CPreprocessedTXTFILEDlg : public PreprocessedFilePage {
 public:
  using PreprocessedFilePage::PreprocessedFilePage;

 protected:
  void Describe(PageForm& form) override;
};

/// A shape file.
class CPreprocessedSHAPE_PLOTDlg : public PreprocessedFilePage {
 public:
  using PreprocessedFilePage::PreprocessedFilePage;

 protected:
  void Describe(PageForm& form) override;
};

/// The pages of what the preprocessor left.
std::span<const PageRow> ProcessedPages();

}  // namespace tervane
