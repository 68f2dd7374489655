// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/check_fixes.h"

#include <fmt/format.h>
#include <gmock/gmock.h>
#include <rapidjson/document.h>

#include "data/datafile_writer.h"
#include "data/grid_files.h"
#include "data/series_file.h"
#include "document/setup_lock.h"
#include "geometry/cart.h"
#include "geometry/shapes.h"
#include "platform/item_types.h"
#include "spatial/domain.h"
#include "tests/support/command_outcome.h"
#include "tests/support/data_files.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::check_fixes_test {
namespace {

using test::ReadFile;
using test::Tervane;
using testing::AllOf;
using testing::HasSubstr;
using testing::Not;

/// A setup of sections that are told in few lines: a brace ends its line.
std::string SetupOf(const std::string& sections) {
  std::string lines;
  for (const char c : sections) {
    if (c == '}') lines += '\n';
    lines += c;
    if (c == '{' || c == '}') lines += '\n';
  }
  return test::SetupText(14, lines);
}

/// Gauges of rain that take their series from these files, and what else the setup holds.
std::string SetupWithGauges(const std::vector<std::string>& files, const std::string& more = {}) {
  std::string text = fmt::format(
      "section Climate {{ section PrecipitationRate {{ DistributionType = 2\n"
      "section STATION_BASED {{ NO_TIMESERIES = {} }}\n",
      files.size());
  for (std::size_t place = 0; place < files.size(); ++place)
    text += fmt::format(
        "section TIME_SERIES_{0} {{ NAME = \"G{0}\"\n GRIDCODEID = \"{0}\"\n TYPE = 2\n"
        "section TIME_SERIES_FILE {{ FILE_NAME = file \"{1}\"\n ITEM_COUNT = 1\n ITEM_NUMBERS = 1 }} }}\n",
        place + 1, files[place]);
  return SetupOf(text + "} }" + more);
}

class CheckFixes : public testing::Test {
 public:
  /// A series of rain from the first day of 2000 to the last one of that month of the year.
  void WriteRain(const std::string& name, int lastMonth) const {
    NewSeries series{"rain", 100431, 3, {}, {}};
    for (int month = 1; month <= lastMonth; ++month) {
      series.times.emplace_back(2000, month, 28);
      series.values.push_back(1);
    }
    test::Require(WriteSeriesFile(folder.Write(name, ""), series).error);
  }
  test::CommandOutcome Fix(std::vector<std::string> more = {}) const {
    more.insert(more.begin(), {"check", file, "--fix"});
    return Tervane(more);
  }
  /// A domain of 10 by 10 cells over a shape file of one square kilometre in UTM zone 32.
  CCatchmentKvf& DomainOfSquare(CFlowModelDoc& document) const {
    CTvnShapeData shapes;
    shapes.Create(ShapeKind::Polygon, {{"CODE", AttributeKind::Whole}}, "EPSG:32632");
    const double x = 500'000, y = 5'000'000;
    shapes.AddShape(
        {{{x, y}, {x, y + 1000}, {x + 1000, y + 1000}, {x + 1000, y}, {x, y}}, {}, {}, {0}, {std::int64_t{1}}});
    test::Require(shapes.SaveShapeFile(folder.File("domain.shp")).error);
    CCatchmentKvf& domain = *document.Root().Important(kDomain);
    domain.Type = CCatchmentKvf::kShapeFile;
    domain.ShapeFile().Choose(FileName("domain.shp", folder.Path()), {});
    domain.nxShp = domain.nyShp = 10;
    domain.sizeShp = 100;
    domain.x0Shp = x;
    domain.y0Shp = y;
    return domain;
  }
  std::string Value(const std::string& path) const { return Tervane({"get", file, path}).out; }

  test::TempFolder folder;
  std::string file = folder.File("a.tvd");
  const std::string gauge = "Climate/PrecipitationRate/TIME_SERIES_";
};

TEST_F(CheckFixes, MovedFilesAreFoundByTheirNamesAndAmbiguousOnesLeft) {
  const std::string text =
      SetupWithGauges({"D:\\\\old\\\\One.nds0", "gone/two.nds0", "two.nds0", "nowhere.nds0", "twice.nds0", "here.nds0"},
                      "section SimSpec { section SimulationPeriod { SIMSTART = 2000, 2, 1, 0, 0\n"
                      "SIMEND = 2000, 3, 1, 0, 0 } }");
  folder.Write("a.tvd", text);
  for (const char* name :
       {"data/one.nds0", "data/deep/two.nds0", "a/twice.nds0", "b/twice.nds0", "here.nds0", "data/here.nds0"})
    WriteRain(name, 6);

  const test::CommandOutcome dry = Fix({"--only", "moved-file", "--dry-run"});
  EXPECT_EQ(ReadFile(file), text);
  EXPECT_THAT(dry.out, HasSubstr("3 values would change; nothing was written"));
  const test::CommandOutcome fixed = Fix({"--only", "moved-file"});
  EXPECT_EQ(fixed.status, kFindings);
  EXPECT_THAT(fixed.out, AllOf(HasSubstr("One.nds0 -> data/one.nds0\n"),
                               HasSubstr(gauge + "2/TIME_SERIES_FILE:FILE_NAME: gone/two.nds0 -> data/deep/two.nds0\n"),
                               HasSubstr("left moved-file: " + gauge +
                                         "4/TIME_SERIES_FILE:FILE_NAME: there is no nowhere.nds0 below "),
                               HasSubstr("2 files are called twice.nds0, among them " + folder.File("a/twice.nds0")),
                               HasSubstr("3 values changed, and the setup is saved")));
  EXPECT_THAT(Value(gauge + "1/TIME_SERIES_FILE:FILE_NAME"), HasSubstr("data/one.nds0"));
  EXPECT_THAT(Value(gauge + "3/TIME_SERIES_FILE:FILE_NAME"), HasSubstr("data/deep/two.nds0"));
  EXPECT_THAT(Value(gauge + "5/TIME_SERIES_FILE:FILE_NAME"), Not(HasSubstr("a/")));
  EXPECT_THAT(Value(gauge + "6/TIME_SERIES_FILE:FILE_NAME"), Not(HasSubstr("data")));
  // What is left is ambiguous in the whole folder alone.
  EXPECT_THAT(Fix({"--only", "moved-file", "--search", folder.File("b")}).out,
              HasSubstr("twice.nds0 -> b/twice.nds0\n"));
}

TEST_F(CheckFixes, ThePeriodBecomesWhatAllFilesCover) {
  folder.Write("a.tvd", SetupWithGauges({"long.nds0", "short.nds0"},
                                        "section SimSpec { section SimulationPeriod {\n"
                                        "SIMSTART = 2000, 2, 1, 0, 0\nSIMEND = 2001, 1, 1, 0, 0 } }"));
  WriteRain("long.nds0", 6);
  WriteRain("short.nds0", 3);
  EXPECT_THAT(Fix({"--only", "period-of-data"}).out,
              HasSubstr("fix period-of-data: SimSpec/SimulationPeriod:SIMEND: 2001-01-01 -> 2000-03-28\n"));
  EXPECT_EQ(Value("SimSpec/SimulationPeriod:SIMEND"), "2000, 3, 28, 0, 0\n");
  EXPECT_EQ(Value("SimSpec/SimulationPeriod:SIMSTART"), "2000, 2, 1, 0, 0\n");
  EXPECT_THAT(Fix({"--only", "period-of-data"}).out, HasSubstr("nothing was fixed"));

  // Where no period is left nothing changes.
  Tervane({"set", file, "SimSpec/SimulationPeriod:SIMSTART", "2000-05-01", "SimSpec/SimulationPeriod:SIMEND",
           "2001-01-01"});
  EXPECT_THAT(Fix({"--only", "period-of-data"}).out,
              AllOf(HasSubstr("no simulation lies within what the files cover"), HasSubstr("nothing was fixed")));
  EXPECT_EQ(Value("SimSpec/SimulationPeriod:SIMEND"), "2001, 1, 1, 0, 0\n");
}

TEST_F(CheckFixes, TheOnlyItemThatWillDoIsTaken) {
  folder.Write("a.tvd", SetupWithGauges({"one.nds0", "two.nds0"}));
  for (const auto& [name, items] : {std::pair<const char*, std::vector<int>>{"one.nds0", {100180, 100431, 100180}},
                                    {"two.nds0", {100180, 100431, 100431}}}) {
    NewDataFile content;
    content.dimensions = 0;
    for (const int item : items)
      content.items.push_back(
          {fmt::format("item {}", item), item, BaseUnit(*FindItemType(item)).key, ValueType::MeanStep});
    DataFileWriter writer;
    test::Require(writer.Create(folder.File(name), content));
    for (const int month : {1, 12}) {
      test::Require(writer.AddStep({2000, month, 28}));
      for (int item = 1; item <= 3; ++item) test::Require(writer.Put(item, std::vector<float>{1}));
    }
    test::Require(writer.Finish().error);
  }
  const test::CommandOutcome fixed = Fix({"--only", "only-item"});
  EXPECT_THAT(fixed.out, AllOf(HasSubstr(gauge + "1/TIME_SERIES_FILE:ITEM_NUMBERS: 1 (item 100180) -> 2 (item 100431)"),
                               HasSubstr("2 items of the file will do: choose one on the page")));
  EXPECT_EQ(Value(gauge + "1/TIME_SERIES_FILE:ITEM_NUMBERS"), "2\n");
  EXPECT_EQ(Value(gauge + "2/TIME_SERIES_FILE:ITEM_NUMBERS"), "1\n");
}

TEST_F(CheckFixes, ValuesOutsideWhatIsAllowedBecomeTheNearest) {
  const struct {
    const char *sections, *path, *kind, *after;
  } rows[] = {
      {"section SimSpec { section CompControlParaOL { RelaxFactor = 5.0f } }", "SimSpec/CompControlParaOL:RelaxFactor",
       "range", "1"},
      {"section SimSpec { section CompControlParaOL { RelaxFactor = -5.0f } }", "SimSpec/CompControlParaOL:RelaxFactor",
       "range", "0.01"},
      {"section SimSpec { section CompControlParaOL { MaxNoOfIter = -3 } }", "SimSpec/CompControlParaOL:MaxNoOfIter",
       "range", "1"},
      {"section SimSpec { section ModelComp { WQ = 1 } section SimulationPeriod { SIMSTART = 2000, 1, 1, 0, 0\n"
       "SIMEND = 2000, 3, 1, 0, 0 } }\nsection ModelCompWQ { section SimulationPeriodWQ {\n"
       "SimStart = 1999, 1, 1, 0, 0\nSimEnd = 2000, 2, 1, 0, 0 } }",
       "ModelCompWQ/SimulationPeriodWQ:SimStart", "date-within-simulation", "2000, 1, 1, 0, 0"},
      {"section SimSpec { section ModelComp { WQ = 1 } }\nsection Species { NumberOfSpecies = 1 }\n"
       "section Sources { NumberOfSources = 1\nsection Source_1 { Species = \"gone\"\nExtentType = 0 } }",
       "Sources/Source_1:Species", "offer", "Species_1"},
  };
  for (const auto& row : rows) {
    SCOPED_TRACE(std::string(row.path) + " " + row.after);
    folder.Write("a.tvd", SetupOf(row.sections));
    const test::CommandOutcome fixed = Fix();
    EXPECT_THAT(fixed.out, HasSubstr(fmt::format("{}: fix {}: {}: ", file, row.kind, row.path)));
    EXPECT_EQ(Value(row.path), std::string(row.after) + "\n");
  }
}

TEST_F(CheckFixes, TheDomainTakesTheProjectionOfItsShapes) {
  CFlowModelDoc document;
  CCatchmentKvf& domain = DomainOfSquare(document);
  domain.MapProjShp = "EPSG:32633";
  ASSERT_TRUE(document.OnSaveDocument(file)) << document.Error();
  EXPECT_THAT(Fix().out,
              HasSubstr("fix projection: Catchment:MapProjShp: WGS 84 / UTM zone 33N -> WGS 84 / UTM zone 32N"));
  EXPECT_THAT(Fix().out, AllOf(HasSubstr("nothing was fixed"), Not(HasSubstr("another projection"))));
}

TEST_F(CheckFixes, AFileInAnotherSystemIsConvertedBesideItself) {
  CFlowModelDoc document;
  CCatchmentKvf& domain = DomainOfSquare(document);
  domain.MapProjShp = "EPSG:32632";
  // The same ground in the next zone, where it lies 6 degrees from the middle.
  const CYbProjectionChange change("EPSG:32633", "EPSG:32632");
  double otherX = domain.x0Shp, otherY = domain.y0Shp;
  ASSERT_TRUE(change.Back(otherX, otherY));
  CTvn2DOrthoRotatedGridData grid;
  ASSERT_EQ(grid.SetGridData({40, 40, 100, otherX - 1500, otherY - 1500, 0, "EPSG:32633"}, 5, kUsualDeleteValue, 1000,
                             quantity::kElevation),
            "");
  test::Require(WriteGridData(folder.File("dem.nds2"), grid).error);
  folder.Write("dem_converted.nds2", "mine");
  auto& topography = *document.Root().Important(kTopography);
  topography.Type = CData2DKvf::kGridFile;
  topography.GridFile().Choose(FileName("dem.nds2", folder.Path()));
  ASSERT_TRUE(document.OnSaveDocument(file)) << document.Error();

  const std::string told = "fix convert: Topography/NDS_2D_DATA_FILE:FILE_NAME: dem.nds2 -> dem_converted_2.nds2";
  EXPECT_THAT(Fix({"--dry-run"}).out, HasSubstr(told));
  EXPECT_FALSE(FileExists(folder.File("dem_converted_2.nds2")));
  EXPECT_THAT(Fix().out, AllOf(HasSubstr(told), HasSubstr("1 value")));
  EXPECT_EQ(ReadFile(folder.File("dem_converted.nds2")), "mine");
  EXPECT_THAT(Tervane({"check", file}).out, Not(HasSubstr("another projection")));
  CTvn2DOrthoRotatedGridData converted;
  test::Require(ReadGridData(folder.File("dem_converted_2.nds2"), 1, converted).error);
  EXPECT_EQ(converted.Geometry().nx, 10);
  for (int cell = 0; cell < 100; ++cell) EXPECT_FLOAT_EQ(converted.Value(cell % 10, cell / 10), 5);
}

TEST_F(CheckFixes, WhatCannotBeDoneIsToldAndWritesNothing) {
  const std::string text = SetupWithGauges({"one.nds0"});
  folder.Write("a.tvd", text);
  WriteRain("data/one.nds0", 6);
  EXPECT_THAT(Fix({"--only", "moved-files"}).err,
              HasSubstr("there is no kind of fix moved-files; did you mean moved-file?"));
  EXPECT_EQ(Fix({"--search", folder.File("nowhere")}).status, kCouldNot);
  EXPECT_NE(Tervane({"check", file, "--dry-run"}).status, kDone);
  {
    SetupLock lock;
    ASSERT_EQ(lock.Take(file), SetupLock::Outcome::Taken);
    EXPECT_EQ(Fix().status, kCouldNot);
    EXPECT_THAT(Fix({"--dry-run"}).out, HasSubstr("would change"));
  }
  EXPECT_EQ(ReadFile(file), text);

  const test::CommandOutcome fixed = Fix({"--only", "moved-file", "--json"});
  rapidjson::Document json;
  json.Parse(fixed.out.c_str());
  ASSERT_FALSE(json.HasParseError()) << fixed.out;
  EXPECT_TRUE(json["fixed"]["saved"].GetBool());
  ASSERT_EQ(json["fixed"]["changes"].Size(), 1u);
  EXPECT_STREQ(json["fixed"]["changes"][0]["after"].GetString(), "data/one.nds0");
  EXPECT_EQ(json["fixed"]["left"].Size(), 0u);
  EXPECT_NE(ReadFile(file), text);
}

TEST_F(CheckFixes, ADryRunTellsWhatIsFoundInTheFile) {
  folder.Write("a.tvd", SetupWithGauges({"gone/one.nds0"}));
  WriteRain("data/one.nds0", 6);
  const auto found = [](const test::CommandOutcome& outcome) {
    rapidjson::Document told;
    told.Parse(outcome.out.c_str());
    return told["findings"].Size();
  };
  const test::CommandOutcome before = Tervane({"check", file, "--json"}), dry = Fix({"--dry-run", "--json"});
  EXPECT_EQ(found(dry), found(before));
  EXPECT_EQ(dry.status, before.status);
  EXPECT_LT(found(Fix({"--json"})), found(before));
}

TEST_F(CheckFixes, CoverageMendsNothing) {
  folder.Write("a.tvd", SetupWithGauges({}));
  const test::CommandOutcome outcome = Fix({"--coverage"});
  EXPECT_EQ(outcome.status, kCouldNot);
  EXPECT_THAT(outcome.err, HasSubstr("leave --fix out"));
}

}  // namespace
}  // namespace tervane::check_fixes_test
