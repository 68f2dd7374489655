// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <algorithm>
#include <filesystem>
#include <iterator>

#include <gmock/gmock.h>
#include <rapidjson/document.h>

#include "cli/command_line.h"
#include "tests/support/command_outcome.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::results_command_test {
namespace {

namespace fs = std::filesystem;
using test::Tervane;
using testing::HasSubstr;

/// The example with results, in a folder of its own.
struct ResultsCommand : testing::Test {
  test::TempFolder folder;
  std::string setup = folder.File("iceland/iceland.tvd");
  std::string page = folder.File("iceland/iceland_results/iceland_PreProcessed_Stat.Html");

  ResultsCommand() {
    fs::copy(fs::path(TERVANE_SOURCE_DIR) / "examples/iceland", folder.File("iceland"), fs::copy_options::recursive);
  }
};

TEST_F(ResultsCommand, TheFiguresOfTheExample) {
  const auto outcome = Tervane({"results", "stats", setup, "--json", "--from", "1973-01-01"});
  EXPECT_EQ(outcome.status, kDone) << outcome.err;
  rapidjson::Document json;
  json.Parse(outcome.out.c_str());
  ASSERT_FALSE(json.HasParseError()) << outcome.out;
  EXPECT_STREQ(json["start"].GetString(), "1973-01-01 00:00:00");
  ASSERT_EQ(json["points"].Size(), 2u);
  const auto& point = json["points"][0];
  EXPECT_STREQ(point["name"].GetString(), "Jökulsá, by a linear reservoir (no simulation)");
  EXPECT_EQ(point["pairs"].GetInt(), 731);
  // By the library of another language, from the two tables.
  EXPECT_NEAR(point["meanError"].GetDouble(), -1.1761751, 1e-5);
  EXPECT_NEAR(point["correlation"].GetDouble(), 0.6604826, 1e-6);
  EXPECT_NEAR(point["nashSutcliffe"].GetDouble(), 0.3222066, 1e-6);
  EXPECT_TRUE(point.HasMember("klingGupta"));
  EXPECT_FALSE(point.HasMember("layer"));
}

TEST_F(ResultsCommand, FilesAreWrittenWhenThatIsAsked) {
  const std::string before = test::ReadFile(page);
  EXPECT_THAT(Tervane({"results", "stats", setup, "--to", "1973-12-31"}).out, HasSubstr("1972-01-01 to 1973-12-31"));
  EXPECT_EQ(test::ReadFile(page), before);
  EXPECT_EQ(Tervane({"results", "stats", setup, "--to", "1973-12-31", "--write"}).status, kDone);
  EXPECT_THAT(test::ReadFile(page), HasSubstr("End date for statistical analysis  : 1973/12/31  00:00<br />"));
}

TEST_F(ResultsCommand, WhatCannotBeComparedIsRefused) {
  EXPECT_THAT(Tervane({"results", "stats", setup, "--from", "soon"}).err,
              HasSubstr("--from soon: a date was expected"));
  fs::remove(folder.File("iceland/flow_measured.nds0"));
  const auto outcome = Tervane({"results", "stats", setup});
  EXPECT_EQ(outcome.status, kCouldNot);
  EXPECT_THAT(outcome.err, HasSubstr("flow_measured.nds0"));
  fs::remove(folder.File("iceland/iceland_results/iceland_PreProcessed.kvf"));
  EXPECT_THAT(Tervane({"results", "stats", setup}).err, HasSubstr("Can not open file :"));
}

TEST_F(ResultsCommand, TypesOfASetupAndWhatTheOthersLack) {
  const std::string file = folder.Write("a.tvd", test::SetupText(14, ""));
  const auto types = [&](std::vector<std::string> further) {
    std::vector<std::string> arguments{"results", "types", "--json"};
    std::ranges::move(further, std::back_inserter(arguments));
    const auto outcome = Tervane(arguments);
    EXPECT_EQ(outcome.status, kDone) << outcome.err;
    rapidjson::Document json;
    json.Parse(outcome.out.c_str());
    EXPECT_FALSE(json.HasParseError()) << outcome.out;
    return json;
  };
  EXPECT_EQ(types({"--all"})["types"].Size(), 371u);
  const rapidjson::Document stored = types({"--setup", file});
  for (const auto& type : stored["types"].GetArray()) EXPECT_STRNE(type["stored"].GetString(), "missing");
  struct Case {
    int type;
    const char *stored, *member, *text;
  };
  const Case cases[] = {{61, "grids and series", "by", "OC+WM simulation"},
                        {145, "series", "by", "OC+TSOnly"},
                        {216, "missing", "why", "a water quality run lists its results itself"},
                        {48, "missing", "why", "no setup brings it in"},
                        {240, "missing", "why", "exchanged with other models alone"}};
  const rapidjson::Document all = types({"--setup", file, "--all"});
  for (const Case& one : cases)
    for (const auto& type : all["types"].GetArray()) {
      if (type["type"].GetInt() != one.type) continue;
      EXPECT_STREQ(type["stored"].GetString(), one.stored) << one.type;
      ASSERT_TRUE(type.HasMember(one.member)) << one.type;
      EXPECT_STREQ(type[one.member].GetString(), one.text);
    }
  // What is nearest: snow needs one more feature with two layers, two with the others.
  EXPECT_THAT(Tervane({"results", "types", "--setup", file, "--all"}).out,
              testing::ContainsRegex("100 +Total Snow storage +mm +SnowMelt +missing +SM\n"));
}

TEST_F(ResultsCommand, TheCostOfASetup) {
  const std::string file = folder.Write("a.tvd", test::SetupText(14, R"(section Catchment {
    type = 2
    nxShp = 10
    nyShp = 20
    section SHAPE_FILE {
      FILE_NAME = file "domain.shp"
    }
  }
  section StoringOfResults {
    WaterBalance = 0
    section GridSeriesOutput {
      NumberOfItems = 1
      section Item_1 {
        DataType = 61
      }
    }
  })"));
  const auto outcome = Tervane({"results", "cost", file, "--json"});
  EXPECT_EQ(outcome.status, kDone) << outcome.err;
  rapidjson::Document json;
  json.Parse(outcome.out.c_str());
  ASSERT_FALSE(json.HasParseError()) << outcome.out;
  EXPECT_EQ(json["bytes"].GetInt(), 10 * 20 * 31 * 4);
  EXPECT_GT(json["freeBytes"].GetDouble(), 0);
  EXPECT_THAT(Tervane({"results", "cost", file}).out, HasSubstr("sum: 24 KB in 1 file\n"));
  const auto other = Tervane({"results", "cost", folder.Write("b.tvd", test::SetupText(14, R"(section SimSpec {
    ModelType = 1
  })"))});
  EXPECT_EQ(other.status, kCouldNot);
  EXPECT_THAT(other.err, HasSubstr("stores other results"));
}

}  // namespace
}  // namespace tervane::results_command_test
