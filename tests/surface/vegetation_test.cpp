// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/vegetation.h"

#include <algorithm>
#include <functional>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "platform/item_types.h"
#include "simspec/periods.h"
#include "spatial/coverage.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"

namespace tervane::vegetation_test {
namespace {

using test::TestSetup;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr const char* kPath = "LandUse/Vegetation";

std::string Sections(const std::string& inVegetation) {
  return fmt::format("section LandUse {{\nsection Vegetation {{\n{}\n}}\n}}", inVegetation);
}

TEST(Vegetation, HoldsItsKeysInTheOrderOfTheFile) {
  TestSetup setup;
  auto& vegetation = setup.At<CVegetationKvf>(kPath);
  vegetation.AddChild(vegetation.CreateStationItem());
  vegetation.Global().Crops().AddItem()->VegPropFile().Choose(FileName("crops.etv", "/setups"), "Maize");
  const std::pair<const char*, const char*> cases[] = {
      {"", "DistributionType=1 C1=0.3 C2=0.2 C3=20.0 C_INT=0.05 A_ROOT=0.25 ETReduced=1.0"},
      {"/GLOBAL", "FIXED_VALUE_LAI=0f FIXED_VALUE_RD=0f TYPE=1"},
      {"/GLOBAL/TIME_SERIES_FILE_2", "FILE_NAME=file \"\" ITEM_COUNT=0 ITEM_NUMBERS="},
      {"/GLOBAL/VEG_PROP_FILES", "YbSEKvfListItemCount=1 RecycleMode=0"},
      // A new crop begins with the simulation.
      {"/GLOBAL/VEG_PROP_FILES/VegNo_1", "STARTDATE=2000, 1, 1"},
      {"/GLOBAL/VEG_PROP_FILES/VegNo_1/VEG_PROP_FILE", "FILE_NAME=file \"crops.etv\" VEGETATION=\"Maize\""},
      {"/STATION_BASED", "NO_TIMESERIES=1 TYPE=1 ShapeAxisUnit=1000 ShapeGapFillName=\"\""},
      {"/FULLY_DISTRIBUTED", "TYPE=1"},
      {"/FULLY_DISTRIBUTED/NDS_2D_DATA_FILE#2", "FILE_NAME=file \"\" ITEM_COUNT=0 ITEM_NUMBERS="},
      {"/TIME_SERIES_1",
       "NAME=\"Undefined\" GRIDCODEID=\"Undefined\" GRIDCODE=0 FIXED_VALUE_LAI=0f FIXED_VALUE_RD=0f TYPE=2"},
      {"/TIME_SERIES_1/VEG_PROP_FILES", "YbSEKvfListItemCount=0 RecycleMode=0"},
  };
  for (const auto& [path, keys] : cases) EXPECT_EQ(setup.WrittenKeys(std::string(kPath) + path), keys) << path;
  EXPECT_EQ(vegetation.Global().LaiFile().ItemTypes, std::vector{quantity::kLeafAreaIndex});
  EXPECT_EQ(vegetation.Global().RootDepthFile().ItemTypes, std::vector{quantity::kRootDepth});
}

TEST(Vegetation, BothSeriesHadOneSectionNameUntilVersion4) {
  const std::string series =
      "section {0} {{\nFILE_NAME = file \"lai.nds0\"\n}}\nsection {1} {{\nFILE_NAME = file \"rd.nds0\"\n}}\n";
  for (const int version : {-1, 4, 5}) {
    SCOPED_TRACE(version);
    const std::string one = version < 5 ? "TIME_SERIES_FILE" : "TIME_SERIES_FILE_1";
    const std::string files = fmt::format(fmt::runtime(series), one, version < 5 ? one : "TIME_SERIES_FILE_2");
    TestSetup setup(Sections(fmt::format("section GLOBAL {{\nTYPE = 2\n{}}}\nsection STATION_BASED {{\nNO_TIMESERIES = "
                                         "1\n}}\nsection TIME_SERIES_1 {{\nNAME = \"Sion\"\n{}}}",
                                         files, files)),
                    version);
    EXPECT_TRUE(setup.Report().unread.empty());
    for (const char* node : {"/GLOBAL", "/TIME_SERIES_1"}) {
      EXPECT_EQ(setup.Written(std::string(kPath) + node + "/TIME_SERIES_FILE_1:FILE_NAME"), "file \"lai.nds0\"");
      EXPECT_EQ(setup.Written(std::string(kPath) + node + "/TIME_SERIES_FILE_2:FILE_NAME"), "file \"rd.nds0\"");
    }
  }
}

/// Files in a folder, and a setup whose vegetation they are for.
class VegetationFiles : public testing::Test {
 protected:
  VegetationFiles() {
    folder.Write("crops.etv",
                 "target TERVANE_VEGETATION {\n"
                 "section Vegetation_1 {\nName = \"Maize\"\nStage = 0, 0.0, 0.2, 0.3\nStage = 100, 4.0, 1.2, 1.2\n}\n"
                 "section Vegetation_2 {\nName = \"Bare\"\nStage = 0, 0.0, 0.1, 0.3\n}\n"
                 "section Vegetation_3 {\nName = \"Empty\"\n}\n}\n");
    folder.Write("cut.etv", "target TERVANE_VEGETATION {\nsection Vegetation_1 {\nName = \"Ma");
  }
  CVegetationItemKvf& AddCrop(CVegetationListKvf& list, const char* name, const CYbDateTime& start) {
    CVegetationItemKvf& crop = *list.AddItem();
    crop.VegPropFile().Choose(FileName("crops.etv", folder.Path()), name);
    crop.StartDate = start;
    return crop;
  }
  /// Validates, and gives the findings of a node as "error: text (detail)".
  std::string FindingsOf(CYbSEKvfBase& node) {
    vegetation.Validate();
    std::string text;
    for (const Finding& finding : node.Findings())
      text += fmt::format("{}: {} ({}) ", NameOf(finding.severity), finding.text, finding.detail);
    return text;
  }

  test::TempFolder folder;
  TestSetup setup;
  CVegetationKvf& vegetation = setup.At<CVegetationKvf>(kPath);
  CVegetationListKvf& crops = vegetation.Global().Crops();
};

TEST_F(VegetationFiles, OnlyTheFilesOfTheStateInForceAreChecked) {
  vegetation.AddChild(vegetation.CreateStationItem());
  auto& station = dynamic_cast<CVegetationTimeSeriesKvf&>(*ZoneItems(vegetation).front());
  crops.AddItem();
  station.Crops().AddItem();
  const std::pair<const char*, CYbSEKvfBase*> files[] = {
      {"lai ", &vegetation.Global().LaiFile()},
      {"rd ", &vegetation.Global().RootDepthFile()},
      {"crop ", &crops.GetItem(1)->VegPropFile()},
      {"codes ", &vegetation.Stations().GridFile()},
      {"polygons ", &vegetation.Stations().ShapeFile()},
      {"grid-lai ", &vegetation.FullyDistributed().LaiFile()},
      {"grid-rd ", &vegetation.FullyDistributed().RootDepthFile()},
      {"station-lai ", &station.LaiFile()},
      {"station-rd ", &station.RootDepthFile()},
      {"station-crop ", &station.Crops().GetItem(1)->VegPropFile()},
  };
  const struct {
    int distribution, type, stationsType, stationType;
    const char* checked;
  } cases[] = {
      {0, 0, 0, 1, ""},
      {0, 1, 0, 1, "lai rd "},
      {0, 2, 0, 1, "crop "},
      {1, 1, 0, 0, "codes "},
      {1, 2, 1, 1, "polygons station-lai station-rd "},
      {1, 0, 0, 2, "codes station-crop "},
      {2, 1, 0, 2, "grid-lai grid-rd "},
  };
  for (const auto& c : cases) {
    vegetation.DistributionType = c.distribution;
    vegetation.Global().TYPE = c.type;
    vegetation.Stations().TYPE = c.stationsType;
    station.TYPE = c.stationType;
    vegetation.Validate();
    std::string checked;
    for (const auto& [name, file] : files) checked += file->Findings().empty() ? "" : name;
    EXPECT_EQ(checked, c.checked) << c.distribution << c.type << c.stationsType << c.stationType;
    EXPECT_EQ(station.IsDataUsedInSetup(), c.distribution == 1);
  }
}

TEST_F(VegetationFiles, ACropTellsWhatIsWrongWithItsFileAndItsDate) {
  vegetation.Global().TYPE = VegetationCourse::kCrops;
  AddCrop(crops, "Maize", {2000, 1, 10});
  CVegetationItemKvf& crop = AddCrop(crops, "Maize", {2000, 1, 20});
  CTvnVegPropFile& file = crop.VegPropFile();
  const auto choose = [&](const char* name, const char* vegetationName) {
    return [&file, this, name, vegetationName] { file.Choose(FileName(name, folder.Path()), vegetationName); };
  };
  const struct {
    const char* what;
    std::function<void()> change;
    const char *ofFile, *ofCrop;  ///< Parts of what is told; empty for nothing.
  } cases[] = {
      {"all well", [] {}, "", ""},
      {"no file", choose("", "Maize"), "error: The vegetation property file is not valid (no file is chosen)", ""},
      {"a missing file", choose("none.etv", "Maize"), "none.etv", ""},
      {"a file that is cut", choose("cut.etv", "Maize"), "cut.etv:3", ""},
      {"no vegetation", choose("crops.etv", ""), "error: The vegetation is not valid (no vegetation is chosen)", ""},
      {"another vegetation", choose("crops.etv", "Rice"), "has no vegetation \"Rice\"; it has Maize, Bare, Empty", ""},
      {"without stages", choose("crops.etv", "Empty"), "it has no stages", ""},
      {"length 0", choose("crops.etv", "Bare"), "", "warning: The crop has the length 0"},
      {"backwards",
       [&] {
         choose("crops.etv", "Maize")(), crop.StartDate = {2000, 1, 5};
       },
       "", "warning: The crop begins before the one above it"},
      {"behind the end",
       [&] {
         crop.StartDate = {2000, 2, 1};
       },
       "", "note: The crop and all below it are not used"},
      {"no date",
       [&] {
         crop.StartDate = {2000, 13, 1};
       },
       "", "error: The start date is no date"},
      {"not in force", [&] { vegetation.Global().TYPE = VegetationCourse::kConstant, file.Choose({}, ""); }, "", ""},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    c.change();
    for (const auto& [node, expected] : {std::pair<CYbSEKvfBase*, const char*>{&file, c.ofFile}, {&crop, c.ofCrop}}) {
      const std::string found = FindingsOf(*node);
      if (*expected)
        EXPECT_THAT(found, HasSubstr(expected));
      else
        EXPECT_EQ(found, "");
    }
  }
}

TEST_F(VegetationFiles, ACropEndsWithItsLastStage) {
  CVegetationItemKvf& crop = AddCrop(crops, "Maize", {2000, 1, 1});
  EXPECT_EQ(crop.GetEndDate(), CYbDateTime(2000, 4, 10));
  crop.StartDate = {9999, 12, 1};
  EXPECT_EQ(crop.GetEndDate(), CYbDateTime(9999, 12, 31));
  crop.VegPropFile().SetVegetationName("Rice");
  EXPECT_EQ(crop.GetEndDate(), crop.StartDate);
  crop.StartDate = {2000, 0, 1};
  EXPECT_FALSE(crop.GetEndDate().IsValid());
}

TEST_F(VegetationFiles, ACalendarThatIsTooLongIsCutWithAWarning) {
  folder.Write("days.etv",
               "target TERVANE_VEGETATION {\nsection Vegetation_1 {\nName = \"Day\"\nStage = 0, 1.0, 0.2, 0.3\n"
               "Stage = 1, 1.0, 0.2, 0.3\n}\n}\n");
  vegetation.Global().TYPE = VegetationCourse::kCrops;
  AddCrop(crops, "Day", {2000, 1, 1}).VegPropFile().Choose(FileName("days.etv", folder.Path()), "Day");
  setup.At<CSimPeriodKvf>("SimSpec/SimulationPeriod").SIMEND = {9000, 1, 1};
  EXPECT_THAT(FindingsOf(crops), IsEmpty());
  crops.RecycleMode = kEachEntry;
  EXPECT_THAT(FindingsOf(crops), HasSubstr("warning: The calendar of crops has more than 1000000 entries"));
  EXPECT_THAT(crops.Development().problem, HasSubstr("1000000 crops"));
}

TEST_F(VegetationFiles, GridsThatDoNotChangeAreAskedForWithOneTimeStep) {
  CVegetationFullyDistKvf& fully = vegetation.FullyDistributed();
  for (CFMData2DNdsFile* file : {&fully.LaiFile(), &fully.RootDepthFile()}) {
    fully.TYPE = CVegetationFullyDistKvf::kConstant;
    EXPECT_EQ(file->SelectionRequest().steps, 1U);
    fully.TYPE = CVegetationFullyDistKvf::kTimeVarying;
    EXPECT_EQ(file->SelectionRequest().steps, std::nullopt);
    EXPECT_TRUE(file->SelectionRequest().period.has_value());
  }
}

TEST_F(VegetationFiles, BothQuantitiesAreForcings) {
  const auto only = [&](std::size_t number) {
    const std::vector<Forcing> forcings = vegetation.CurrentForcings();
    EXPECT_EQ(forcings.size(), 2U);
    return forcings.at(number);
  };
  vegetation.Global().FIXED_VALUE_RD = 0.5F;
  EXPECT_EQ(static_cast<double>(only(1).series.at(0).constant.value_or(0)), 0.5);
  vegetation.Global().TYPE = VegetationCourse::kCrops;
  AddCrop(crops, "Maize", {2000, 1, 11});
  const std::int64_t start = CYbDateTime(2000, 1, 11).SecondsSinceEpoch(),
                     end = CYbDateTime(2000, 2, 1).SecondsSinceEpoch();
  // 21 of 100 days on the way from 0 to 4.
  EXPECT_THAT(only(0).series.at(0).lines, testing::Optional(ElementsAre(ForcingLine{start, end, 0, 0.84})));
  CoverageBoard board;
  ASSERT_EQ(ComputeCoverage(AskCoverage(setup.Root()), nullptr, board).error, "");
  const auto totals = std::ranges::find(board.forcings, "Leaf Area Index",
                                        [](const ForcingTotals& each) { return each.forcing.forcing.title; });
  ASSERT_NE(totals, board.forcings.end());
  const PeriodSum& sum = totals->columns.at(0).sums.back();
  EXPECT_EQ(sum.covered, end - start);
  EXPECT_NEAR(totals->form.Of(sum), 0.42, 1e-9);
  vegetation.DistributionType = CVegetationKvf::kFullyDistributed;
  EXPECT_THAT(vegetation.CurrentForcings(), IsEmpty());
  vegetation.FullyDistributed().TYPE = CVegetationFullyDistKvf::kTimeVarying;
  EXPECT_TRUE(only(1).overGrid.has_value());
  vegetation.DistributionType = CVegetationKvf::kStationBased;
  vegetation.AddChild(vegetation.CreateStationItem());
  EXPECT_EQ(only(0).series.at(0).name, "Undefined");
}

TEST_F(VegetationFiles, AStationWhoseCropsAUserChoseIsNamedBeforeItGoes) {
  test::WriteCodes(folder.File("codes.nds2"), {1, 2});
  vegetation.DistributionType = CVegetationKvf::kStationBased;
  vegetation.Stations().GridFile().Choose(FileName("codes.nds2", folder.Path()));
  vegetation.SyncStations();
  auto& station = dynamic_cast<CVegetationTimeSeriesKvf&>(*vegetation.SelectStationByName("2"));
  EXPECT_EQ(station.GetTitle(), "Vegetation");
  AddCrop(station.Crops(), "Maize", {2000, 1, 1});
  test::WriteCodes(folder.File("codes.nds2"), {7});
  EXPECT_THAT(vegetation.PlanStations(vegetation.FindStations()).editedRemoved, ElementsAre(&station));
}

}  // namespace
}  // namespace tervane::vegetation_test
