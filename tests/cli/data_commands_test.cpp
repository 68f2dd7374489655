// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <sstream>

#include <gmock/gmock.h>
#include <rapidjson/document.h>

#include "cli/command_line.h"
#include "platform/datafile_writer.h"
#include "tests/support/temp_folder.h"

namespace tervane {
namespace {

using test::ReadFile;
using test::TempFolder;
using testing::HasSubstr;

struct Outcome {
  int status;
  std::string out, err;
};

Outcome Tervane(const std::vector<std::string>& arguments) {
  std::ostringstream out, err;
  const int status = RunCommandLine(arguments, out, err);
  return {status, out.str(), err.str()};
}

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
  const Outcome imported = Tervane({"import", "series", csv, series, "--item", "100182", "--column", "flow", "--unit",
                                    "mm/h", "--value-type", "mean-step", "--stamps", "begin"});
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
  // Again, from what was exported; a unit that is not of the table is brought to the base unit.
  const std::string again = folder.File("b.nds0");
  EXPECT_EQ(Tervane({"import", "series", back, again, "--item", "100182", "--unit", "10 mm/day"}).status, kDone);
  ASSERT_EQ(file.Open(again), "");
  std::vector<float> values(1);
  ASSERT_EQ(file.Read({}, values), "");
  EXPECT_EQ(values[0], 15);
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

}  // namespace
}  // namespace tervane
