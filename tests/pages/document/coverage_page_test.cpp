// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/document/coverage_page.h"

#include <filesystem>

#include <gmock/gmock.h>

#include "document/flow_model_document.h"
#include "forms/table_form.h"
#include "spatial/data2d.h"
#include "tests/support/page_driver.h"

namespace tervane::coverage_page_test {
namespace {

using testing::HasSubstr;

/// The board of the example, whose topography reaches the west alone.
class CoveragePage : public testing::Test {
 protected:
  CoveragePage() {
    EXPECT_TRUE(document_.OnOpenDocument(TERVANE_SOURCE_DIR "/examples/rhone/rhone_xyz.tvd")) << document_.Error();
    auto& topography = *document_.Root().Important(kTopography);
    topography.InterpMethod = 3;
    topography.SearchRadius = 400;
    page_ = MakePage(kCoveragePage, *document_.Root().GetImportantNode("COVERAGE"), Context());
    for (const auto& control : page_->Form().Controls()) {
      if (control->kind == ControlKind::Table) tables_.push_back(control->table.get());
      if (control->kind == ControlKind::Map) map_ = control.get();
      if (control->kind == ControlKind::Chart) chart_ = control.get();
    }
    for (const auto& control : page_->Form().Controls()) control->Text();
  }

  PageContext Context() {
    PageContext context{document_, host_, {}};
    context.selectNode = [this](const CYbSEKvfBase& node) { selected_ = PathOf(node); };
    return context;
  }
  int RowOf(const TableForm& table, const std::string& first) {
    for (int row = 1; row <= table.RowCount(); ++row)
      if (table.Cell(row, 1) == first) return row;
    ADD_FAILURE() << "no row " << first;
    return 1;
  }

  CFlowModelDoc document_;
  NobodyToAsk host_;
  std::string selected_;
  std::unique_ptr<CYbSEDlgBase> page_;
  std::vector<TableForm*> tables_;
  Control *map_ = nullptr, *chart_ = nullptr;
};

TEST_F(CoveragePage, ShowsOnTheMapWhereValuesAreMissingAndLeadsToTheNode) {
  ASSERT_EQ(tables_.size(), 2U);
  TableForm& files = *tables_[0];
  EXPECT_TRUE(files.IsShownOnly());
  EXPECT_EQ(files.Enter(1, 1, "x"), "the cell cannot be changed");
  const int row = RowOf(files, "Topography");
  EXPECT_THAT(files.Cell(row, 5), HasSubstr("cover"));
  files.Choose(row);
  EXPECT_THAT(FormText(page_->Form()), HasSubstr("Topography, dem.xyz.txt"));
  const MapContent map = Finished(map_->map);
  ASSERT_FALSE(map.grids.empty());
  EXPECT_EQ(map.shapes.size(), 1U) << "the extent of the file";
  ASSERT_TRUE(files.Press(row, 1));
  EXPECT_EQ(selected_, "Topography/XYZ_FILE");
  EXPECT_FALSE(files.Press(row, 2));
}

TEST_F(CoveragePage, TellsStationsOfOneCauseInOneLineThatOpens) {
  TableForm& files = *tables_[0];
  const int closed = files.RowCount();
  const int row = RowOf(files, "▸ 50 × Station Data - Precipitation Rate");
  ASSERT_TRUE(files.Press(row, 1));
  EXPECT_EQ(selected_, "") << "a group is no place";
  EXPECT_EQ(files.RowCount(), closed + 50);
  EXPECT_EQ(files.Cell(row, 1), "▾ 50 × Station Data - Precipitation Rate");
  EXPECT_EQ(files.Cell(row + 2, 1), "    Gauge 47: Station Data - Precipitation Rate");
  EXPECT_EQ(files.Cell(row + 2, 3), files.Cell(row, 3)) << "the same period";
  ASSERT_TRUE(files.Press(row + 2, 1));
  EXPECT_EQ(selected_, "Climate/PrecipitationRate/TIME_SERIES_2/TIME_SERIES_FILE");
  ASSERT_TRUE(files.Press(row, 1));
  EXPECT_EQ(files.RowCount(), closed);
}

TEST_F(CoveragePage, ShowsTheYearsOfAForcing) {
  TableForm& totals = *tables_[1];
  // All numbers of a forcing have as many decimals.
  const int gauge = RowOf(totals, "Precipitation Rate, total");
  for (const int period : {4, 5, 6, 7}) EXPECT_EQ(totals.Cell(gauge, period).find('.'), std::string::npos);
  EXPECT_EQ(totals.Head(4), "2012");
  const int row = RowOf(totals, "Reference Evapotranspiration, total");
  EXPECT_EQ(totals.Cell(row, 3), "mm");
  EXPECT_THAT(totals.Cell(row, 5), HasSubstr("831.9"));
  totals.Choose(row);
  const SeriesContent chart = Finished(chart_->chart);
  ASSERT_EQ(chart.series.size(), 1U);
  EXPECT_EQ(chart.series[0].unit, "mm");
  ASSERT_TRUE(totals.Press(row, 1));
  EXPECT_EQ(selected_, "Climate/POTEVAPTRANS");
}

TEST_F(CoveragePage, FollowsTheSetup) {
  document_.Root().Important(kTopography)->XyzFile().File = FileName("missing.txt", "/nowhere");
  document_.Root().Validate();
  EXPECT_THAT(FormText(page_->Form()), HasSubstr("/nowhere/missing.txt: it does not exist"));
}

}  // namespace
}  // namespace tervane::coverage_page_test
