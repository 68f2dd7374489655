// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/river_commands.h"

#include <gmock/gmock.h>
#include <rapidjson/document.h>

#include "geometry/shapes.h"
#include "tests/support/command_outcome.h"
#include "tests/support/temp_folder.h"

namespace tervane::river_commands_test {
namespace {

using test::ReadFile;
using test::TempFolder;
using test::Tervane;
using Outcome = test::CommandOutcome;
using testing::HasSubstr;

class RiverCommands : public testing::Test {
 public:
  TempFolder folder;
  std::string lines = folder.File("lines.shp"), network = folder.File("a.fvnwk");

  RiverCommands() {
    CTvnShapeData shapes;
    shapes.Create(ShapeKind::Line, {{"NAME", AttributeKind::Text}}, {});
    const auto add = [&](const char* name, std::vector<MapPoint> points) {
      Shape line;
      line.points = std::move(points);
      line.parts = {0};
      line.values = {std::string(name)};
      shapes.AddShape(std::move(line));
    };
    add("Rhone", {{0, 2000}, {0, 1000}, {0, 0}});
    add("Brook", {{500, 1000}, {0, 1000}});
    add("Stub", {{3000, 0}, {3000, 60}});
    EXPECT_TRUE(shapes.SaveShapeFile(lines).Ok());
  }
};

TEST_F(RiverCommands, LinesBecomeANetworkThatInfoTells) {
  const Outcome made = Tervane({"import", "river", lines, network});
  EXPECT_EQ(made.status, kDone) << made.err;
  EXPECT_EQ(made.out, network + ": 3 branches with 7 points, 2.6 km, 1 end joined\n");
  EXPECT_EQ(made.err, lines + ": warning: Stub (shape 3) is only 60.0 m long, at 3000.0, 0.0\n");
  const Outcome told = Tervane({"data", "info", network});
  EXPECT_EQ(told.status, kDone);
  EXPECT_THAT(told.out, HasSubstr("branch Brook: 2 points, chainage 0.0 to 500.0, downstream end at Rhone 1000.0\n"));
  rapidjson::Document json;
  json.Parse(Tervane({"data", "info", network, "--json"}).out.c_str());
  ASSERT_FALSE(json.HasParseError());
  EXPECT_EQ(json["branches"][0]["to"].GetDouble(), 2000);
}

TEST_F(RiverCommands, WhatStandsThereIsKeptUnlessForcedAndThenWithItsStructures) {
  const std::string weir = "  section WEIR {\n    Crest = 4\n  }\n";
  const std::string old = "target FLUVANE_Network_Editor {\n" + weir + "}\n";
  folder.Write("a.fvnwk", old);
  EXPECT_EQ(Tervane({"import", "river", lines, network}).status, kCouldNot);
  EXPECT_EQ(ReadFile(network), old);
  const Outcome forced = Tervane({"import", "river", lines, network, "--force"});
  EXPECT_EQ(forced.status, kDone) << forced.err;
  EXPECT_THAT(forced.err, HasSubstr("its other sections are kept: WEIR"));
  EXPECT_THAT(ReadFile(network), HasSubstr(weir));
  // What is no network is not replaced at all.
  folder.Write("b.fvnwk", "notes of mine");
  EXPECT_EQ(Tervane({"import", "river", lines, folder.File("b.fvnwk"), "--force"}).status, kCouldNot);
  EXPECT_EQ(ReadFile(folder.File("b.fvnwk")), "notes of mine");
}

TEST_F(RiverCommands, FaultsAreFindingsWithTheirPlace) {
  folder.Write("a.fvnwk",
               "target FLUVANE_Network_editor {\n  section POINTS {\n    Point = 1, 0, 0, 0\n  }\n"
               "  section BRANCHES {\n    section Branch_1 {\n      Name = \"A\"\n      Points = 1\n    }\n  }\n}\n");
  const std::string simulation =
      folder.Write("a.fvsim", "target FvRun {\n  section input {\n    nwk = \"a.fvnwk\"\n  }\n}\n");
  const Outcome told = Tervane({"data", "info", simulation});
  EXPECT_EQ(told.status, kFindings);
  EXPECT_EQ(told.err, network + ":6: error: branch A: it has one point, two or more were expected\n");
  EXPECT_THAT(told.out, HasSubstr("network " + network));
  const Outcome missing = Tervane({"data", "info", folder.File("none.fvproj")});
  EXPECT_EQ(missing.status, kCouldNot);
  EXPECT_THAT(missing.err, HasSubstr("none.fvproj"));
}

}  // namespace
}  // namespace tervane::river_commands_test
