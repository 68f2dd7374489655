// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/coverage.h"

#include <cmath>

#include <gmock/gmock.h>

#include "core/path.h"
#include "data/datafile_writer.h"
#include "data/grid_files.h"
#include "geometry/shapes.h"
#include "results/detailed_series.h"
#include "results/storing.h"
#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "simspec/periods.h"
#include "simspec/stress_periods.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "spatial/stations.h"
#include "surface/climate.h"
#include "surface/irrigation.h"
#include "surface/land_use.h"
#include "surface/stress_period_grids.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"
#include "wqpt/sources.h"
#include "wqpt/species.h"

namespace tervane::coverage_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr float kMissing = kDeleteValue;

/// A setup of the years 2000 and 2001 on a domain of 10 by 10 cells of 100 m.
class Coverage : public testing::Test {
 protected:
  Coverage() {
    auto& period = *document_.Root().Important(kSimulationPeriod);
    period.SIMSTART = CYbDateTime(2000, 7, 1);
    period.SIMEND = CYbDateTime(2001, 7, 1);
    auto& domain = *document_.Root().Important(kDomain);
    WritePolygons("domain.shp", {{0, 1000}});
    domain.Type = CCatchmentKvf::kShapeFile;
    domain.ShapeFile().Choose(FileName("domain.shp", folder_.Path()), {});
    domain.nxShp = domain.nyShp = 10;
    domain.sizeShp = 100;
    document_.Root().Validate();
  }

  /// Rectangles over the whole height, from x to x, numbered from 1.
  void WritePolygons(const std::string& name, const std::vector<std::pair<double, double>>& ranges) {
    CTvnShapeData shapes;
    shapes.Create(ShapeKind::Polygon, {{"CODE", AttributeKind::Whole}}, "");
    std::int64_t code = 0;
    for (const auto& [from, to] : ranges)
      shapes.AddShape({{{from, 0}, {from, 1000}, {to, 1000}, {to, 0}, {from, 0}}, {}, {}, {0}, {++code}});
    ASSERT_EQ(shapes.SaveShapeFile(folder_.File(name)).error, "");
  }
  /// Rain in mm/day over each of so many days from a date on; `values` go round.
  void WriteSeries(const std::string& name, const CYbDateTime& begin, int days, const std::vector<float>& values) {
    NewDataFile content;
    content.dimensions = 0;
    content.items = {{"Rain", 100431, 2004, ValueType::MeanStep}};
    content.begin = begin;
    DataFileWriter writer;
    ASSERT_EQ(writer.Create(folder_.File(name), content), "");
    for (int day = 0; day < days; ++day) {
      ASSERT_EQ(writer.AddStep(begin + CYbDateTimeSpan::Days(day + 1)), "");
      ASSERT_EQ(writer.Put(1, {&values[static_cast<std::size_t>(day) % values.size()], 1}), "");
    }
    ASSERT_EQ(writer.Finish().error, "");
  }
  C2DStationBasedDataKvf& Rain() {
    return dynamic_cast<C2DStationBasedDataKvf&>(
        *FindNode(document_.Root(), ParseSetupPath("Climate/PrecipitationRate").steps));
  }
  std::shared_ptr<const CoverageBoard> Board(const CoverageBoard* previous = nullptr) {
    document_.Root().Validate();
    auto board = std::make_shared<CoverageBoard>();
    EXPECT_EQ(ComputeCoverage(AskCoverage(document_.Root()), previous, *board).error, "");
    return board;
  }
  /// The row of a file by its name.
  static const CoverageRow& RowOf(const CoverageBoard& board, const std::string& file) {
    for (const CoverageRow& row : board.rows)
      if (row.file.use.path.ends_with("/" + file)) return row;
    throw std::runtime_error("no row of " + file);
  }

  test::TempFolder folder_;
  CFlowModelDoc document_;
};

TEST_F(Coverage, CountsTheCellsWithoutAValue) {
  auto& topography = *document_.Root().Important(kTopography);
  topography.Type = CData2DKvf::kGridFile;
  topography.GridFile().Choose(FileName("dem.nds2", folder_.Path()));
  // Seven columns, and one empty cell in them.
  CTvn2DOrthoRotatedGridData dem;
  ASSERT_EQ(dem.SetGridData({7, 10, 100, 0, 0, 0, {}}, 5, kUsualDeleteValue, 1000, 100180), "");
  dem.GetData()[3] = kUsualDeleteValue;
  ASSERT_EQ(WriteGridData(folder_.File("dem.nds2"), dem).error, "");
  const auto board = Board();
  EXPECT_EQ(board->domainCells, 100U);
  const CoverageRow& row = RowOf(*board, "dem.nds2");
  EXPECT_EQ(row.missing, 31U);
  EXPECT_EQ(row.state, CoverageState::Warning);
  EXPECT_EQ(MissingCellsText(row), "31 cells of the domain have no topography");
  EXPECT_EQ(row.AreaText(), "31 of 100 cells have no value");
  ASSERT_NE(row.missingCells, nullptr);
  EXPECT_EQ(row.missingCells->Value(3, 0), 2.0F);
  EXPECT_EQ(row.missingCells->Value(4, 0), 1.0F);

  // A grid of points reaches as far as its search radius.
  topography.Type = CData2DKvf::kXyzFile;
  topography.XyzFile().File = FileName("dem.txt", folder_.Path());
  folder_.Write("dem.txt", "0 0 5\n");
  topography.SearchRadius = 80;
  EXPECT_EQ(RowOf(*Board(), "dem.txt").missing, 99U);
  topography.SearchRadius = 5000;
  EXPECT_EQ(RowOf(*Board(), "dem.txt").AreaText(), "covers the domain");
  // Nodes of points have no validation: the board tells what is wrong with them.
  folder_.Write("dem.txt", "0 0 5\n1 x 3\n");
  const auto broken = Board();
  EXPECT_EQ(RowOf(*broken, "dem.txt").state, CoverageState::Error);
  EXPECT_THAT(RowOf(*broken, "dem.txt").problem, HasSubstr("dem.txt, line 2: y is \"x\""));
}

TEST_F(Coverage, ZonesThatSpeakOfAPartOfTheModelMayLeaveCells) {
  auto& landUse = *document_.Root().Important(kLandUse);
  landUse.Irrigation = 1;
  auto& areas = *landUse.Child<CIrrCommandAreasKvf>();
  areas.Type = CodedZonesKvf::kPolygons;
  areas.ShapeFile().Choose(FileName("irrigated.shp", folder_.Path()), "CODE");
  const struct {
    double from, to;
    std::size_t missing;
    const char* text;
    const char* warning;
  } cases[] = {
      {300, 900, 40, "covers 60 of 100 cells", ""},
      {0, 1000, 0, "covers the domain", ""},
      {900.1, 949, 100, "covers no cell of the domain", "100 cells of the domain have no irrigation command areas"},
  };
  for (const auto& c : cases) {
    WritePolygons("irrigated.shp", {{c.from, c.to}});
    const auto board = Board();
    const CoverageRow& row = RowOf(*board, "irrigated.shp");
    EXPECT_EQ(row.missing, c.missing);
    EXPECT_EQ(row.AreaText(), c.text);
    EXPECT_EQ(MissingCellsText(row), c.warning);
    EXPECT_EQ(row.state == CoverageState::Warning, *c.warning != 0) << c.text;
  }
}

TEST_F(Coverage, KnowsWhereSourcesLieAndWhoseAQuantityIs) {
  document_.Root().Important(kModelComponents)->WQ = 1;
  document_.Root().Important(kSpecies)->AddItem();
  auto& sources = *document_.Root().Important(kSources);
  sources.AddItemNode();
  CSourceWQItemKvf& source = *sources.GetItem(1);
  source.SourceName = "Landfill";
  source.SetSourceType(1);
  auto& extent = *source.Child<ExtentKvf>();
  extent.type = ExtentKvf::kShapeFile;
  extent.ShapeFile().Choose(FileName("landfill.shp", folder_.Path()), {});
  const struct {
    double from, to;
    const char* text;
    bool isWarning;
  } cases[] = {{300, 500, "covers 20 of 100 cells", false}, {901, 949, "covers no cell of the domain", true}};
  for (const auto& c : cases) {
    // Polygons need no attribute.
    WritePolygons("landfill.shp", {{c.from, c.to}});
    const auto board = Board();
    const CoverageRow& row = RowOf(*board, "landfill.shp");
    EXPECT_EQ(row.problem, "");
    EXPECT_EQ(row.file.title, "Landfill: Horizontal Extent");
    EXPECT_EQ(row.AreaText(), c.text);
    EXPECT_EQ(row.state == CoverageState::Warning, c.isWarning) << c.text;
    ASSERT_FALSE(board->forcings.empty());
    EXPECT_EQ(board->forcings.back().forcing.forcing.title, "Landfill: Strength");
  }
}

TEST_F(Coverage, HoldsPeriodsAndGapsAgainstTheSimulation) {
  Rain().DistributionType = C2DStationBasedDataKvf::kUniform;
  Rain().Global().TYPE = CGlobalKvf::kTimeVarying;
  Rain().Global().SeriesFile().Choose(FileName("rain.nds0", folder_.Path()));
  const struct {
    CYbDateTime begin;
    int days;
    std::vector<float> values;
    const char* text;
    CoverageState state;
  } rows[] = {
      {{2000, 1, 1}, 731, {1}, "covers the simulation", CoverageState::Fine},
      {{2000, 7, 11}, 400, {1}, "starts 10 days late", CoverageState::Warning},
      {{2000, 7, 1}, 180, {1}, "ends 185 days early", CoverageState::Warning},
      {{2000, 7, 1}, 365, {1, 1, 1, 1, kMissing}, "73 gaps, 73 days", CoverageState::Warning},
      {{1990, 1, 1}, 10, {1}, "ends 365 days early", CoverageState::Warning},
  };
  for (const auto& row : rows) {
    WriteSeries("rain.nds0", row.begin, row.days, row.values);
    const auto board = Board();
    EXPECT_EQ(RowOf(*board, "rain.nds0").TimeText(), row.text);
    EXPECT_EQ(RowOf(*board, "rain.nds0").state, row.state) << row.text;
  }
}

TEST_F(Coverage, HoldsObservedValuesAgainstTheSimulationThatTheyNeedNotCover) {
  auto& point = *document_.Root().Important(kStoringResults)->Child<CDetailedTSOutputListKvf>()->AddItem();
  point.HydrComp = 61;
  point.InclObserved = 1;
  const struct {
    CYbDateTime begin;
    int days;
    std::string text;
    CoverageState state;
  } cases[] = {
      {{2000, 1, 1}, 800, "covers the simulation", CoverageState::Fine},
      {{2000, 7, 11}, 345, "starts 10 days late; ends 10 days early", CoverageState::Fine},
      {{1990, 1, 1}, 300, "ends 365 days early", CoverageState::Warning},
  };
  int number = 0;
  for (const auto& c : cases) {
    const std::string file = "observed" + std::to_string(++number) + ".nds0";
    WriteSeries(file, c.begin, c.days, {1, 2});
    point.Observed().Choose(FileName(file, folder_.Path()));
    const auto board = Board();
    const CoverageRow& row = RowOf(*board, file);
    EXPECT_EQ(row.TimeText(), c.text);
    EXPECT_EQ(row.state, c.state) << row.TimeText();
    EXPECT_THAT(point.Observed().Findings(), IsEmpty());
    const std::string told = row.remarks.empty() ? std::string() : row.remarks.front().text;
    EXPECT_EQ(told, c.state == CoverageState::Warning ? "It has no values in the time of the simulation" : "");
  }
}

TEST_F(Coverage, HoldsSeriesAndSpansAgainstStressPeriods) {
  auto& root = document_.Root();
  root.Important(kBasicParameters)->ModelType = kEngineModflowSurfact;
  root.Important(kModflowComponents)->Recharge = 1;
  root.Important(kClimate)->RechargeOption = CPrecipitationRelatedKvf::kGivenLayer;
  root.Important(kStressPeriods)->MakePeriods({{2000, 8, 1}, {2000, 9, 1}, {2001, 1, 1}}, StressPeriodSteps());
  // It ends with 2000, and its first month is missing.
  WriteSeries("rain.nds0", {2000, 8, 1}, 153, {1});
  Rain().Global().TYPE = CGlobalKvf::kTimeVarying;
  Rain().Global().SeriesFile().Choose(FileName("rain.nds0", folder_.Path()));
  const auto board = Board();
  ASSERT_EQ(board->request.stressPeriods.size(), 4U);
  std::vector<std::string> told;
  for (const CoverageRow& row : board->rows)
    for (const Finding& remark : row.remarks)
      if (remark.text.find("stress periods") != std::string::npos) told.push_back(remark.text);
  EXPECT_THAT(told, ElementsAre(HasSubstr("2 of 4 stress periods have times without values, the first is period 1")));
  ASSERT_EQ(board->spans.size(), 1U);
  EXPECT_EQ(board->spans[0].text, "Recharge Layer: no values for stress periods 1 to 4");
  root.Important(kClimate)->Child<CRechargeAndPondingModListKvf>()->AddItem();
  EXPECT_THAT(Board()->spans, IsEmpty());
  root.Important(kBasicParameters)->ModelType = kEngineTervane;
  EXPECT_THAT(Board()->request.stressPeriods, IsEmpty());
}

TEST_F(Coverage, WeighsStationsByTheirShareOfTheDomain) {
  C2DStationBasedDataKvf& rain = Rain();
  WritePolygons("stations.shp", {{0, 300}, {300, 900}});
  rain.DistributionType = C2DStationBasedDataKvf::kStationBased;
  rain.Stations().TYPE = CStationBasedKvf::kPolygons;
  rain.Stations().ShapeFile().Choose(FileName("stations.shp", folder_.Path()), "CODE");
  ASSERT_EQ(rain.SyncStations(), kAdded);
  WriteSeries("west.nds0", {2000, 1, 1}, 731, {1});
  auto& west = dynamic_cast<C2DStationBasedDataTimeSeriesKvf&>(*ZoneItems(rain)[0]);
  auto& east = dynamic_cast<C2DStationBasedDataTimeSeriesKvf&>(*ZoneItems(rain)[1]);
  west.SeriesFile().Choose(FileName("west.nds0", folder_.Path()));
  east.TYPE = C2DStationBasedDataTimeSeriesKvf::kConstant;
  east.FIXED_VALUE = 4;
  const auto board = Board();
  ASSERT_EQ(board->periods.size(), 3U);
  EXPECT_EQ(board->periods[0].name, "2000");
  EXPECT_EQ(board->periods[2].name, "simulation");
  const auto found = std::ranges::find_if(
      board->forcings, [](const ForcingTotals& each) { return each.forcing.path == "Climate/PrecipitationRate"; });
  ASSERT_NE(found, board->forcings.end());
  EXPECT_THAT(found->Heading(), HasSubstr("total [mm]"));
  ASSERT_EQ(found->columns.size(), 3U);
  const auto valuesOf = [&](std::size_t column) {
    std::vector<double> values;
    for (const PeriodSum& sum : found->columns[column].sums) values.push_back(found->form.Of(sum));
    return values;
  };
  EXPECT_THAT(valuesOf(1), ElementsAre(366, 365, 365));
  EXPECT_THAT(valuesOf(2), ElementsAre(4 * 366, 4 * 365, 4 * 365));
  // A third of the area that has a station is the west's.
  EXPECT_THAT(valuesOf(0),
              ElementsAre(testing::DoubleEq(3 * 366), testing::DoubleEq(3 * 365), testing::DoubleEq(3 * 365)));
  EXPECT_DOUBLE_EQ(*found->columns[1].share, 0.3);
  EXPECT_THAT(found->remarks,
              ElementsAre(testing::Field(&Finding::text, "10 cells of the domain belong to no station")));
  EXPECT_EQ(RowOf(*board, "stations.shp").missing, 10U);
  // One station fills the gaps between the polygons.
  rain.Stations().ShapeGapFillName = west.NAME;
  const auto filled = Board();
  EXPECT_EQ(RowOf(*filled, "stations.shp").missing, 0U);
}

TEST_F(Coverage, TakesWhatStayedTheSameFromTheBoardBefore) {
  WriteSeries("rain.nds0", {2000, 1, 1}, 731, {1});
  Rain().DistributionType = C2DStationBasedDataKvf::kUniform;
  Rain().Global().TYPE = CGlobalKvf::kTimeVarying;
  Rain().Global().SeriesFile().Choose(FileName("rain.nds0", folder_.Path()));
  const auto first = Board();
  const auto again = Board(first.get());
  EXPECT_EQ(again->domain, first->domain);
  EXPECT_EQ(again->rows.size(), first->rows.size());
  document_.Root().Important(kSimulationPeriod)->SIMEND = CYbDateTime(2003, 1, 1);
  EXPECT_EQ(RowOf(*Board(again.get()), "rain.nds0").TimeText(), "ends 365 days early");

  // What is no number does not make each look another one.
  Rain().Global().TYPE = CGlobalKvf::kConstant;
  Rain().Global().FIXED_VALUE = std::nanf("");
  document_.Root().Important(kDomain)->y0Shp = std::nan("");
  EXPECT_EQ(AskCoverage(document_.Root()), AskCoverage(document_.Root()));

  Progress progress;
  progress.Cancel();
  CoverageBoard cancelled;
  EXPECT_EQ(ComputeCoverage(AskCoverage(document_.Root()), nullptr, cancelled, progress).error, kCancelled);
}

}  // namespace
}  // namespace tervane::coverage_test
