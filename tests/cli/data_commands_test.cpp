// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <filesystem>

#include <gmock/gmock.h>
#include <rapidjson/document.h>

#include "data/datafile_writer.h"
#include "data/grid_files.h"
#include "geometry/cart.h"
#include "platform/files.h"
#include "platform/text.h"
#include "tests/support/command_outcome.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"

namespace tervane::data_commands_test {
namespace {

using test::ReadFile;
using test::TempFolder;
using test::Tervane;
using Outcome = test::CommandOutcome;
using testing::FloatEq;
using testing::HasSubstr;
using testing::Not;
using testing::Pointwise;

TEST(DataCommands, InfoAndStatsTellWhatAGridHolds) {
  const TempFolder folder;
  const std::string path = folder.File("a.nds2");
  NewDataFile content;
  content.geometry.nx = 2;
  content.geometry.ny = 2;
  content.geometry.cellSize = 50;
  content.geometry.rotation = 30;
  content.items = {{"Rain \"A\"", 100182, 2004, ValueType::MeanStep}};
  content.begin = CYbDateTime(2001, 1, 1);
  DataFileWriter writer;
  ASSERT_EQ(writer.Create(path, content), "");
  for (const int day : {2, 3}) {
    ASSERT_EQ(writer.AddStep({2001, 1, day}), "");
    ASSERT_EQ(writer.Put(1, std::vector{1.5f, 2.5f, kDeleteValue, static_cast<float>(day)}), "");
  }
  ASSERT_EQ(writer.Finish().error, "");

  const Outcome text = Tervane({"data", "info", path});
  EXPECT_EQ(text.status, kDone);
  EXPECT_EQ(text.err, "");
  EXPECT_EQ(text.out,
            path +
                ": 1 item\n"
                "time: 2 steps from 2001-01-02 to 2001-01-03 every 86400 s, the first begins at 2001-01-01\n"
                "item 1: Rain \"A\" [millimeter per day], Evapotranspiration (100182), mean over the step, grid "
                "2 x 2\n  cells of 50 m from 0, 0, turned by 30 degrees, no projection\n");
  rapidjson::Document json;
  json.Parse(Tervane({"data", "info", path, "--json"}).out.c_str());
  ASSERT_FALSE(json.HasParseError());
  EXPECT_STREQ(json["items"][0]["name"].GetString(), "Rain \"A\"");
  EXPECT_EQ(json["items"][0]["rotation"].GetDouble(), 30);
  EXPECT_STREQ(json["end"].GetString(), "2001-01-03 00:00:00");

  EXPECT_EQ(Tervane({"data", "stats", path}).out,
            "item 1: Rain \"A\" [millimeter per day]: smallest 1.5, largest 3, mean 2.16667, 6 values, 2 missing\n"
            "  step 1, 2001-01-02: smallest 1.5, largest 2.5, mean 2, 3 values, 1 missing\n"
            "  step 2, 2001-01-03: smallest 1.5, largest 3, mean 2.33333, 3 values, 1 missing\n");
  json.Parse(Tervane({"data", "stats", path, "--json"}).out.c_str());
  ASSERT_FALSE(json.HasParseError());
  EXPECT_EQ(json["items"][0]["all"]["values"].GetInt(), 6);
  EXPECT_EQ(json["items"][0]["steps"][0]["largest"].GetDouble(), 2.5);
  EXPECT_THAT(Tervane({"export", path, folder.File("a.csv")}).err, HasSubstr("is no time series"));
  const Outcome missing = Tervane({"data", "info", folder.File("b.nds2")});
  EXPECT_EQ(missing.status, kCouldNot);
  EXPECT_THAT(missing.err, HasSubstr("it does not exist"));
}

TEST(DataCommands, ASeriesGoesFromATableToADataFileAndBack) {
  const TempFolder folder;
  const std::string csv =
      folder.Write("in.csv", "time;Flow;Rain\n2000-02-28;1,5;0.1\n2000-02-29;;2\n2000-03-01 00:00;0.25;3\n");
  const std::string series = folder.File("a.nds0"), back = folder.File("back.csv");
  const Outcome imported = Tervane({"import", "series", csv, series, "--item", "evapotranspiration", "--column", "flow",
                                    "--unit", "mm/h", "--value-type", "mean-step", "--stamps", "begin"});
  EXPECT_EQ(imported.status, kDone) << imported.err;
  EXPECT_THAT(imported.err, HasSubstr("note: 1 missing value in line 3"));
  EXPECT_THAT(imported.out, HasSubstr("3 steps of Evapotranspiration from 2000-02-29 to 2000-03-02"));
  DataFile file;
  ASSERT_EQ(file.Open(series), "");
  EXPECT_EQ(*file.Time().begin, CYbDateTime(2000, 2, 28));
  EXPECT_EQ(file.Items()[0].unitKey, 2001);
  EXPECT_EQ(file.Items()[0].valueType, ValueType::MeanStep);
  EXPECT_EQ(Tervane({"export", series, back}).status, kDone);
  EXPECT_EQ(ReadFile(back),
            "time,\"Flow [millimeter per hour]\"\n2000-02-29 00:00:00,1.5\n2000-03-01 00:00:00,\n"
            "2000-03-02 00:00:00,0.25\n");
  // With the dates as they were in the table that it came from, it comes back as it was.
  const Outcome begins = Tervane({"export", series, back, "--stamps", "begin", "--force"});
  EXPECT_THAT(begins.out, HasSubstr("3 steps, each date is the begin of its interval"));
  EXPECT_THAT(ReadFile(back), HasSubstr("\n2000-02-28 00:00:00,1.5\n"));
  EXPECT_EQ(Tervane({"import", "series", back, series, "--item", "100182", "--unit", "mm/h", "--stamps", "begin",
                     "--value-type", "mean-step", "--force"})
                .status,
            kDone);
  EXPECT_THAT(Tervane({"export", series, back, "--force"}).out,
              HasSubstr("each date is the end of its interval; --st"));
  EXPECT_THAT(ReadFile(back), HasSubstr("\n2000-02-29 00:00:00,1.5\n"));
  // Again, from what was exported; a unit that is not of the table is brought to the base unit.
  const std::string again = folder.File("b.nds0");
  EXPECT_EQ(Tervane({"import", "series", back, again, "--item", "100182", "--unit", "10 mm/day"}).status, kDone);
  ASSERT_EQ(file.Open(again), "");
  std::vector<float> values(1);
  ASSERT_EQ(file.Read({}, values), "");
  EXPECT_EQ(values[0], 15);
}

TEST(DataCommands, EachColumnBecomesAnItem) {
  const TempFolder folder;
  const std::string csv = folder.Write("in.csv", "t,a,b,c\n2000-01-01,1,10,100\n2000-01-02,2,20,200\n");
  const std::string out = folder.File("a.nds0"), back = folder.File("back.csv");
  EXPECT_EQ(Tervane({"import", "series", csv, "--column", "c", "--column", "a", out, "--item", "999"}).status, kDone);
  EXPECT_THAT(Tervane({"export", out, back}).out, HasSubstr("each value holds at its date"));
  EXPECT_THAT(Tervane({"export", out, folder.File("c.csv"), "--stamps", "begin"}).err,
              HasSubstr("hold at their dates"));
  EXPECT_EQ(ReadFile(back), "time,\"c\",\"a\"\n2000-01-01 00:00:00,100,1\n2000-01-02 00:00:00,200,2\n");
  const Outcome all = Tervane({"import", "series", csv, out, "--item", "999", "--all-columns", "--force"});
  EXPECT_THAT(all.out, HasSubstr("3 items, 2 steps"));
}

TEST(DataCommands, PointsThatAreNoRasterAreToldAsPoints) {
  const TempFolder folder;
  const std::string out = folder.File("a.nds2");
  const std::pair<const char*, const char*> cases[] = {
      {"1 2 3\n1 5 6\n5 5 7\n", "its 3 points stand on no regular grid: name the file as \"Point XYZ(.txt)\""},
      {"1 2 3\n1 2 x\n", "d.xyz, line 2: z is \"x\", which is no number"}};
  for (const auto& [text, reason] : cases) {
    const Outcome outcome = Tervane({"import", "grid", folder.Write("d.xyz", text), out, "--item", "100180"});
    EXPECT_EQ(outcome.status, kCouldNot);
    EXPECT_THAT(outcome.err, HasSubstr(reason));
    EXPECT_FALSE(FileExists(out));
  }
}

TEST(DataCommands, ANoteOnAShapeTellsItsFolderOnce) {
  const TempFolder folder;
  test::WriteShapes(folder.File("zones.shp"), ShapeKind::Point, AttributeKind::Real, {4.0, 6.0});
  std::filesystem::remove(folder.File("zones.dbf"));
  std::filesystem::remove(folder.File("zones.shx"));
  EXPECT_EQ(Tervane({"data", "info", folder.File("zones.shp")}).err,
            folder.File("zones.shp") + ": note: zones.shx is missing; the index was made anew from the shapes\n" +
                folder.File("zones.shp") + ": note: zones.shp has no attributes: zones.dbf does not exist beside it\n");
}

TEST(DataCommands, AnImportThatIsRefusedWritesNothing) {
  const TempFolder folder;
  const std::string csv = folder.Write("in.csv", "t,a\n2000-01-01,1\n"), out = folder.File("a.nds0");
  struct Row {
    std::vector<std::string> options;
    const char* reason;
  };
  const Row rows[] = {
      {{"--item", "5"}, "there is no item type 5"},
      {{"--item", "100182", "--unit", "m"}, "\"m\" is no unit of Evapotranspiration"},
      {{"--item", "100182", "--unit", "furlongs per x"}, "no known unit"},
      {{"--item", "100182", "--column", "b"}, "line 1: there is no column \"b\", but \"a\""},
      {{"--item", "100182", "--stamps", "begin"}, "one line does not tell"},
      {{"--item", "100182", "--stamps", "middle"}, "middle"},
      {{"--item", "100182", "--value-type", "7"}, "7"},
      {{}, "--item"},
  };
  for (const Row& row : rows) {
    std::vector<std::string> arguments{"import", "series", csv, out};
    arguments.insert(arguments.end(), row.options.begin(), row.options.end());
    const Outcome outcome = Tervane(arguments);
    EXPECT_EQ(outcome.status, kCouldNot);
    EXPECT_THAT(outcome.err, HasSubstr(row.reason));
  }
  folder.Write("a.nds0", "mine");
  EXPECT_THAT(Tervane({"import", "series", csv, out, "--item", "100182"}).err, HasSubstr("--force"));
  EXPECT_EQ(ReadFile(out), "mine");
}

constexpr const char* kRaster =
    "ncols 4\nnrows 2\nxllcorner 100\nyllcorner 200\ncellsize 50\nNODATA_value -9\n1 2 3 4\n5 6 -9 8\n";

TEST(DataCommands, ARasterGoesToADataFileAndBack) {
  const TempFolder folder;
  const std::string grid = folder.File("a.nds2"), tif = folder.File("a.tif"), again = folder.File("b.nds2");
  const std::string raster = folder.Write("in.asc", kRaster);
  const Outcome imported = Tervane({"import", "grid", raster, grid, "--item", "100180"});
  EXPECT_EQ(imported.status, kDone) << imported.err;
  EXPECT_THAT(imported.err, HasSubstr("it names no unit: its values are taken as meter"));
  EXPECT_EQ(imported.out, grid + ": grid 4 x 2 of Elevation in meter, 7 values, 1 empty\n");

  CTvn2DOrthoRotatedGridData before, after;
  ASSERT_EQ(ReadGridData(grid, 1, before).error, "");
  EXPECT_EQ(before.Values(), (std::vector<float>{5, 6, kUsualDeleteValue, 8, 1, 2, 3, 4}));
  for (const double rotation : {0.0, 30.0, -72.5}) {
    SCOPED_TRACE(rotation);
    ASSERT_EQ(before.TakeValues({4, 2, 50, 100, 200, rotation, "EPSG:32632"}, std::vector(before.Values()),
                                kUsualDeleteValue, 1003, 100180),
              "");
    before.SetItemName("Ground");
    ASSERT_EQ(WriteGridData(grid, before).error, "");
    EXPECT_EQ(Tervane({"export", grid, tif, "--force"}).err, "");
    const Outcome back = Tervane({"import", "grid", tif, again, "--item", "100180", "--force"});
    EXPECT_EQ(back.err, "");
    EXPECT_THAT(back.out, HasSubstr("in foot"));
    ASSERT_EQ(ReadGridData(grid, 1, before).error, "");
    ASSERT_EQ(ReadGridData(again, 1, after).error, "");
    EXPECT_EQ(after.Values(), before.Values());
    EXPECT_EQ(after.ItemName(), "Ground");
    EXPECT_NEAR(after.Geometry().rotation, rotation, 1e-9);
    EXPECT_NEAR(after.Geometry().x0, 100, 1e-9);
    EXPECT_NEAR(after.Geometry().y0, 200, 1e-9);
    EXPECT_TRUE(CYbMapProjection(after.Geometry().projection).IsSameAs(CYbMapProjection("EPSG:32632")));
  }
  EXPECT_THAT(Tervane({"export", grid, tif, "--item", "2", "--force"}).err, HasSubstr("there is no item 2"));
  EXPECT_THAT(Tervane({"export", grid, tif, "--step", "2", "--force"}).err, HasSubstr("there is no step 2"));
  EXPECT_THAT(Tervane({"export", grid, folder.File("a.csv"), "--step", "1"}).err, HasSubstr("give OUT the extension"));
}

TEST(DataCommands, ARasterIsPutOnTheModelGrid) {
  const TempFolder folder;
  const std::string setup = folder.File("a.tvd"), out = folder.File("a.nds2");
  const std::string raster = folder.Write("in.asc", kRaster);
  const std::string codes = folder.Write("codes.asc", Replaced(kRaster, "cellsize 50", "cellsize 49.9999"));
  // Of more cells than can be held, of which the model needs few.
  const std::string large = folder.Write(
      "large.vrt",
      "<VRTDataset rasterXSize=\"40000\" rasterYSize=\"20000\"><GeoTransform>100, 1, 0, 300, 0, -1</GeoTransform>"
      "<VRTRasterBand dataType=\"Float32\" band=\"1\"/></VRTDataset>");
  ASSERT_EQ(Tervane({"new", setup}).status, kDone);
  const auto set = [&](const std::string& key, const std::string& value) {
    EXPECT_EQ(Tervane({"set", setup, "Catchment:" + key, value}).err, "");
  };
  struct Row {
    std::vector<std::string> arguments;
    const char *cellSize, *method;
    std::vector<float> expected;
  };
  const Row rows[] = {
      {{raster, "--item", "100180", "--unit", "m"}, "50", "cell for cell", {5, 6, 1, 2}},
      {{raster, "--item", "100180", "--unit", "km"}, "50", "cell for cell", {5000, 6000, 1000, 2000}},
      {{raster, "--item", "100180", "--unit", "cm"}, "50", "cell for cell", {0.05f, 0.06f, 0.01f, 0.02f}},
      {{raster, "--item", "100180"}, "100", "(average)", {3.5f, 5, kUsualDeleteValue, kUsualDeleteValue}},
      {{raster, "--item", "100180", "--resample", "nearest"},
       "100",
       "(nearest)",
       {2, 4, kUsualDeleteValue, kUsualDeleteValue}},
      {{codes, "--item", "100370"}, "100", "(nearest)", {2, 4, kUsualDeleteValue, kUsualDeleteValue}},
      {{codes, "--item", "999"}, "100", "(nearest)", {2, 4, kUsualDeleteValue, kUsualDeleteValue}},
      {{large, "--item", "999"}, "50", "(average)", {0, 0, 0, 0}},
  };
  set("type", "2");
  set("nxShp", "2");
  set("nyShp", "2");
  set("x0Shp", "100");
  set("y0Shp", "200");
  for (const Row& row : rows) {
    SCOPED_TRACE(row.method);
    set("sizeShp", row.cellSize);
    std::vector<std::string> arguments{"import", "grid", out, "--like", setup, "--force"};
    arguments.insert(arguments.begin() + 2, row.arguments.begin(), row.arguments.end());
    const Outcome outcome = Tervane(arguments);
    EXPECT_EQ(outcome.status, kDone) << outcome.err;
    EXPECT_THAT(outcome.out, HasSubstr(row.method));
    EXPECT_THAT(outcome.err, Not(HasSubstr("projection")));
    CTvn2DOrthoRotatedGridData grid;
    ASSERT_EQ(ReadGridData(out, 1, grid).error, "");
    EXPECT_THAT(grid.Values(), Pointwise(FloatEq(), row.expected));
  }
  set("MapProjShp", "EPSG:32632");
  EXPECT_THAT(
      Tervane({"import", "grid", raster, out, "--item", "999", "--like", setup, "--force"}).err,
      HasSubstr("warning: the raster has no known projection, so that its coordinates are taken as WGS 84 / UTM"));
}

TEST(DataCommands, ARasterThatIsRefusedWritesNothing) {
  const TempFolder folder;
  const std::string raster = folder.Write("in.asc", Replaced(kRaster, "1 2 3 4", "1.5 2 3 4"));
  const auto vrt = [&](const char* name, const char* place, const char* bands) {
    return folder.Write(
        name, std::string(R"(<VRTDataset rasterXSize="2" rasterYSize="2">)") + place + bands + "</VRTDataset>");
  };
  const char* const kBand = R"(<VRTRasterBand dataType="Float32" band="1"/>)";
  const std::string bands =
      vrt("bands.vrt", "<GeoTransform>0, 1, 0, 9, 0, -1</GeoTransform>",
          R"(<VRTRasterBand dataType="Float32" band="1"><Description>dry</Description></VRTRasterBand>
                                   <VRTRasterBand dataType="Float32" band="2"><UnitType>frogs</UnitType></VRTRasterBand>)");
  const std::string flat = vrt("flat.vrt", "<GeoTransform>0, 2, 0, 9, 0, -1</GeoTransform>", kBand);
  const std::string degrees =
      vrt("degrees.vrt", "<SRS>EPSG:4326</SRS><GeoTransform>7, 1, 0, 47, 0, -1</GeoTransform>", kBand);
  const std::string nowhere = vrt("nowhere.vrt", "", kBand);
  const std::string noDomain = folder.File("no_domain.tvd"), elsewhere = folder.File("elsewhere.tvd");
  ASSERT_EQ(Tervane({"new", noDomain}).status, kDone);
  ASSERT_EQ(Tervane({"new", elsewhere}).status, kDone);
  ASSERT_EQ(Tervane({"set", elsewhere, "Catchment:type", "2"}).status, kDone);
  ASSERT_EQ(Tervane({"set", elsewhere, "Catchment:x0Shp", "9e6"}).status, kDone);
  const std::string out = folder.Write("a.nds2", "mine");
  struct Row {
    std::vector<std::string> arguments;
    const char* reason;
  };
  const Row rows[] = {
      {{raster, "--item", "5"}, "there is no item type 5"},
      {{raster, "--item", "100180", "--unit", "s"}, "\"s\" is no unit of Elevation"},
      {{raster, "--item", "100180", "--band", "2"}, "there is no band 2, but 1 \"in\""},
      {{raster, "--item", "100180", "--band", "0"}, "0"},
      {{raster, "--item", "100370"}, "1.5 is no code"},
      {{raster, "--item", "999", "--resample", "nearest"}, "--like"},
      {{raster, "--item", "999", "--like", noDomain}, "the model domain: no file is chosen"},
      {{raster, "--item", "999", "--like", elsewhere}, "it has no value within the model grid"},
      {{bands, "--item", "999"}, "it has the bands 1 \"dry\", 2 \"bands 2\": tell which"},
      {{bands, "--item", "100180", "--band", "2"}, "\"frogs\" is no known unit; name the right one"},
      {{flat, "--item", "999"}, "it has cells of 2 x 1, square ones were expected; put it on a model grid"},
      {{degrees, "--item", "999"}, "its cells are in degrees"},
      {{nowhere, "--item", "999"}, "it has no place on the map"},
      {{folder.File("none.tif"), "--item", "999"}, "it does not exist"},
  };
  for (const Row& row : rows) {
    std::vector<std::string> arguments{"import", "grid"};
    arguments.insert(arguments.end(), row.arguments.begin(), row.arguments.end());
    arguments.insert(arguments.end(), {out, "--force"});
    const Outcome outcome = Tervane(arguments);
    EXPECT_EQ(outcome.status, kCouldNot);
    EXPECT_THAT(outcome.err, HasSubstr(row.reason));
    EXPECT_EQ(ReadFile(out), "mine");
  }
  EXPECT_THAT(Tervane({"import", "grid", raster, out, "--item", "999"}).err, HasSubstr("--force"));
}

TEST(DataCommands, InfoTellsWhatATemplateDeclares) {
  const TempFolder folder;
  const std::string path = folder.Write(
      "a.kinetra",
      "target KINETRA_SETUP {\nsection STATE_VARIABLES {\nsection STATE_VARIABLE_1 {\nSYMBOL = \"O2\"\nDESCRIPTION = "
      "\"Oxygen\"\nUNIT = \"mg/l\"\nDEFAULT_VALUE = 9\n}\n}\nsection CONSTANTS {\nsection CONSTANT_1 {\nSYMBOL = "
      "\"k\"\nDEFAULT_VALUE = 0.5\nMIN_VALUE = 0\nMAX_VALUE = 2\n}\nsection CONSTANT_2 {\nSYMBOL = \"K\"\n}\n}\n"
      "section STATE_VARIABLE_EQUATIONS {\nsection STATE_VARIABLE_EQUATION_1 {\nO2 = \"-k\"\n}\n}\n}\n");
  const Outcome text = Tervane({"data", "info", path});
  EXPECT_EQ(text.status, kDone);
  EXPECT_EQ(text.out, path +
                          ": 1 state variable, 2 constants, 0 forcings, 0 auxiliary variables, 0 processes, 0 derived "
                          "outputs\nstate variable O2: Oxygen [mg/l], 9, changes by -k\nconstant k [-], 0.5 (0 to 2), "
                          "given by the user\nconstant K [-], 0, given by the user\n");
  EXPECT_THAT(text.err, HasSubstr("note: the symbol K is declared more than once"));
  rapidjson::Document json;
  json.Parse(Tervane({"data", "info", path, "--json"}).out.c_str());
  ASSERT_FALSE(json.HasParseError());
  EXPECT_STREQ(json["stateVariables"][0]["expression"].GetString(), "-k");
  EXPECT_EQ(json["constants"][0]["maximum"].GetDouble(), 2);
  EXPECT_FALSE(json["constants"][1].HasMember("maximum"));
  const Outcome wrong = Tervane({"data", "info", folder.Write("b.kinetra", "target OTHER {\n}\n")});
  EXPECT_EQ(wrong.status, kCouldNot);
  EXPECT_THAT(wrong.err, HasSubstr("holds no target KINETRA_SETUP"));
}

TEST(DataCommands, InfoTellsTheEntriesOfALibrary) {
  const TempFolder folder;
  const std::string path = folder.Write("crops.etv",
                                        "target TERVANE_VEGETATION {\nsection Vegetation_1 {\nName = \"Maize\"\n"
                                        "Stage = 0, 0.1, 0.2, 0.3\nStage = 150, 4.0, 1.0, 1.2\n}\n"
                                        "section Vegetation_2 {\nName = \"Empty\"\n}\n}\n");
  const Outcome text = Tervane({"data", "info", path});
  EXPECT_EQ(text.status, kDone);
  EXPECT_EQ(text.out, path + ": 2 vegetations\nMaize: 2 stages, 150 days\nEmpty: 0 stages\n");
  EXPECT_EQ(text.err, path + ":7: Vegetation \"Empty\": it has no stages\n");

  rapidjson::Document json;
  json.Parse(Tervane({"data", "info", path, "--json"}).out.c_str());
  ASSERT_FALSE(json.HasParseError());
  EXPECT_STREQ(json["vegetations"][0]["name"].GetString(), "Maize");
  EXPECT_EQ(json["vegetations"][0]["length"].GetDouble(), 150);

  const Outcome wrong = Tervane({"data", "info", folder.Write("setup.etv", "target TERVANE_FLOWMODEL {\n}\n")});
  EXPECT_EQ(wrong.status, kCouldNot);
  EXPECT_THAT(wrong.err, HasSubstr("setup.etv is no vegetation property file: it has no target TERVANE_VEGETATION"));
}

}  // namespace
}  // namespace tervane::data_commands_test
