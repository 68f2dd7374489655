// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/results/statistics_pages.h"

#include <filesystem>

#include <gmock/gmock.h>

#include "data/series_file.h"
#include "forms/plots.h"
#include "platform/item_types.h"
#include "results/result_nodes.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::statistics_pages_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

constexpr const char* kPoint =
    "DataTypeName = \"river discharge\"\nSimDataFileName = file \"sim.nds0\"\nSimDataFileItemNo = 1\n"
    "InclObsData = 1\nObsDataFileName = file \"OBSERVED\"\nObsDataFileItemNo = 1\n}\n";

struct StatisticsPage : testing::Test {
  test::TempFolder folder;
  CFlowModelDoc document;
  std::vector<std::string> changes;
  test::ScriptedHost host;
  std::unique_ptr<CYbSEDlgBase> page;

  CRunStatisticsKvf& Node() { return *document.Root().Important(kPostProcessing)->Child<CRunStatisticsKvf>(); }
  std::string Result(const std::string& name) const { return folder.File("karup_results/" + name); }
  void WriteSeries(const std::string& name, std::vector<float> values) {
    NewSeries series{"Flow", quantity::kDischarge, 0, {}, std::move(values)};
    for (std::size_t i = 0; i < series.values.size(); ++i)
      series.times.push_back(CYbDateTime(2000, 1, 2 + static_cast<int>(i)));
    test::Require(WriteSeriesFile(Result(name), series).error);
  }
  void WriteReport(const std::string& secondObserved = "good.nds0") {
    const auto point = [](const char* number, std::string name, const std::string& observed) {
      std::string text = std::string("section Item_") + number + " {\nName = \"" + name + "\"\n" + kPoint;
      return text.replace(text.find("OBSERVED"), 8, observed);
    };
    folder.Write("karup_results/karup_PreProcessed.kvf",
                 "target Extra_Data {\nsection DetailedTimeseriesOutput {\nNumberOfItems = 2\n" +
                     point("1", "Upper", "bad.nds0") + point("2", "Lower", secondObserved) + "}\n}\n");
  }
  void Open() {
    ASSERT_TRUE(document.OnOpenDocument(folder.Write(
        "karup.tvd", test::SetupText(14,
                                     "section SimSpec {\nsection SimulationPeriod {\nSIMSTART = 2000, 1, 1, 0, 0\n"
                                     "SIMEND = 2000, 2, 1, 0, 0\n}\n}"))));
    folder.Write("karup_results/x", "");
    WriteSeries("sim.nds0", {1, 2, 3, 4});
    WriteSeries("good.nds0", {1, 2, 3, 5});
    WriteSeries("bad.nds0", {4, 3, 2, 1});
    WriteReport();
    PageContext context{document, host, [this](int hint, const std::string& action, const void*) {
                          changes.push_back(std::to_string(hint) + " " + action);
                        }};
    page = MakePage(kRunStatisticsPage, Node(), context);
  }
  Control& Find(ControlKind kind, const std::string& label = {}) {
    for (const auto& control : page->Form().Controls())
      if (control->kind == kind && (label.empty() || control->label == label)) return *control;
    throw std::logic_error("no such control");
  }
  void Run() {
    host.Expect("It can take several minutes to generate the statistics. Continue?", Host::Answer::Yes);
    page->Press(Find(ControlKind::Button, "Run Statistics"));
  }
  SeriesContent Chart() { return Finished(Find(ControlKind::Chart).chart); }
};

TEST_F(StatisticsPage, ARunFillsTableFilesAndKeys) {
  Open();
  Control& table = Find(ControlKind::Table);
  ASSERT_EQ(table.table->RowCount(), 2);
  // Figures come beside the window, and follow the dates; nothing is written.
  EXPECT_EQ(table.table->ShownCell(2, 6), "");
  Chart();
  EXPECT_EQ(table.table->ShownCell(2, 6), "0.25");
  EXPECT_EQ(page->Enter(Find(ControlKind::Date, "End date:"), "2000/01/04  00:00"), "");
  Chart();
  EXPECT_EQ(table.table->ShownCell(2, 6), "0");
  EXPECT_EQ(page->Enter(Find(ControlKind::Date, "End date:"), "2000/02/01  00:00"), "");
  host.Expect("It can take several minutes", Host::Answer::No);
  page->Press(Find(ControlKind::Button, "Run Statistics"));
  EXPECT_FALSE(FileExists(Result("karup_PreProcessed_Stat.Html")));

  Run();
  EXPECT_EQ(changes.back(), "1 Run Statistics");
  EXPECT_EQ(Node().HtmlFilename.Absolute(), Result("karup_PreProcessed_Stat.Html"));
  EXPECT_EQ(Node().ShapeFilename.Absolute(), Result("karup_PreProcessed_Stat.shp"));
  EXPECT_THAT(test::ReadFile(Result("karup_PreProcessed_Stat.Html")),
              HasSubstr("Start date for statistical analysis: 2000/01/01  00:00<br />"));
  EXPECT_EQ(table.table->ShownCell(1, 1), "Upper");
  EXPECT_EQ(table.table->ShownCell(1, 10), "-1");  // R
  EXPECT_EQ(table.table->ShownCell(2, 6), "0.25");
  // The worst point first.
  table.table->SortBy(10);
  table.table->SortBy(10);
  EXPECT_EQ(table.table->ShownCell(1, 1), "Lower");
  EXPECT_TRUE(host.IsDone());
}

TEST_F(StatisticsPage, APointIsShownInThreeWays) {
  Open();
  page->ChooseRow(Find(ControlKind::Table), 2);
  SeriesContent chart = Chart();
  ASSERT_EQ(chart.series.size(), 2U);
  EXPECT_THAT(chart.series[1].values, ElementsAre(1, 2, 3, 5));
  Control& view = Find(ControlKind::Choice);
  EXPECT_EQ(page->Enter(view, "1"), "");
  chart = Chart();
  EXPECT_TRUE(chart.series[0].isPoints);
  EXPECT_THAT(chart.series[0].positions, ElementsAre(1, 2, 3, 5));
  EXPECT_THAT(chart.series[0].values, ElementsAre(1, 2, 3, 4));
  EXPECT_THAT(chart.series[1].positions, ElementsAre(1, 5));
  EXPECT_THAT(chart.series[1].values, ElementsAre(1, 5));
  EXPECT_EQ(page->Enter(view, "2"), "");
  chart = Chart();
  EXPECT_THAT(chart.series[0].positions, ElementsAre(20, 40, 60, 80));
  EXPECT_THAT(chart.series[1].values, ElementsAre(5, 3, 2, 1));
  EXPECT_THAT(changes, testing::Each(testing::StartsWith("0 ")));
}

TEST_F(StatisticsPage, ASeriesThatIsAwayLeavesTheKeys) {
  Open();
  WriteReport("gone.nds0");
  host.Expect("It can take several minutes", Host::Answer::Yes);
  host.Expect("gone.nds0", Host::Answer::Ok);
  page->Press(Find(ControlKind::Button, "Run Statistics"));
  EXPECT_TRUE(Node().HtmlFilename.IsEmpty());
  const std::string html = test::ReadFile(Result("karup_PreProcessed_Stat.Html"));
  EXPECT_THAT(html, HasSubstr("<td>Upper</td>"));
  EXPECT_THAT(html, testing::Not(HasSubstr("</html>")));
  page->ChooseRow(Find(ControlKind::Table), 2);
  EXPECT_THAT(Chart().message, HasSubstr("gone.nds0"));
  EXPECT_TRUE(host.IsDone());
}

TEST_F(StatisticsPage, WithoutAReportItTellsWhatIsMissing) {
  Open();
  std::filesystem::remove(Result("karup_PreProcessed.kvf"));
  page->OnRefresh();
  EXPECT_THAT(FormText(page->Form()), HasSubstr("There is no report of the preprocessor yet"));
  host.Expect("It can take several minutes", Host::Answer::Yes);
  host.Expect("Can not open file :\n" + Result("karup_PreProcessed.kvf"), Host::Answer::Ok);
  page->Press(Find(ControlKind::Button, "Run Statistics"));
  EXPECT_TRUE(host.IsDone());
}

}  // namespace
}  // namespace tervane::statistics_pages_test
