// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>

#include "cli/command_line.h"
#include "platform/files.h"
#include "tests/support/command_outcome.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::ground_commands_test {
namespace {

using test::SetupText;
using test::TempFolder;
using test::Tervane;
using testing::HasSubstr;
using testing::StartsWith;

/// A level ground of 100 m with a layer of 20 m and soils of two layers.
std::string WriteSetup(const TempFolder& folder) {
  return folder.Write("a.tvd", SetupText(14, R"(section Topography {
  FixedValue = 100f
}
section SaturatedZone {
  section GeoLayersSZ {
    YbSEKvfListItemCount = 1
    section Layer_1 {
      Name = "Sand, \"fine\""
      section LowerLevel {
        FixedValue = -20f
        RelativeToGround = 1
      }
    }
  }
})"));
}

TEST(GroundCommands, ASectionIsATableOverItsLine) {
  const TempFolder folder;
  const std::string file = WriteSetup(folder);
  const auto section =
      Tervane({"section", file, "--from", "0,0", "--through", "300,0", "--to", "300,400", "--step", "500"});
  EXPECT_EQ(section.status, kDone) << section.err;
  EXPECT_THAT(section.out, StartsWith("Distance [m],X,Y,Ground [m],\"Sand, \"\"fine\"\", bottom [m]\",Initial head"));
  EXPECT_THAT(section.out, HasSubstr("ET Surface Depth [m]\n0,0,0,100,80,"));
  EXPECT_THAT(section.out, HasSubstr("\n300,300,0,100,80,"));
  EXPECT_THAT(section.out, HasSubstr(",99.9\n700,300,400,100,80,"));

  const auto column = Tervane({"column", file, "--at", "5,5"});
  EXPECT_EQ(column.status, kDone) << column.err;
  EXPECT_THAT(column.out, HasSubstr("\nSoil,Global,100,,,,1e-05,,,Global,\n"));
  EXPECT_THAT(column.out, HasSubstr("\nLayer,\"Sand, \"\"fine\"\"\",100,80,20,"));
}

TEST(GroundCommands, AModelOfModflow6IsWrittenWithAnAccountAndReplacesNoOther) {
  const TempFolder folder;
  const std::string setup = std::string(TERVANE_SOURCE_DIR) + "/examples/rhone/rhone_modflow.tvd";
  const std::string model = folder.File("model");
  const auto exported = Tervane({"export", "modflow6", setup, model});
  EXPECT_EQ(exported.status, kDone) << exported.err;
  EXPECT_TRUE(FileExists(model + "/mfsim.nam"));
  EXPECT_THAT(exported.out, HasSubstr("Recharge"));
  const auto again = Tervane({"export", "modflow6", setup, model});
  EXPECT_EQ(again.status, kCouldNot);
  EXPECT_THAT(again.err, HasSubstr("--force"));
  const auto json = Tervane({"export", "modflow6", setup, model, "--force", "--binary", "--json"});
  EXPECT_EQ(json.status, kDone) << json.err;
  EXPECT_THAT(json.out, HasSubstr("\"fate\""));
  const std::string bare = folder.Write("bare.tvd", SetupText(14, ""));
  EXPECT_EQ(Tervane({"export", "modflow6", bare, folder.File("none")}).status, kCouldNot);
  EXPECT_FALSE(FileExists(folder.File("none/mfsim.nam")));
}

TEST(GroundCommands, WhatCannotBeCutIsTold) {
  const TempFolder folder;
  const std::string file = WriteSetup(folder);
  const std::string bare = folder.Write("b.tvd", SetupText(14, "section SimSpec {\nsection ModelComp {\nSZ = 0\n}\n}"));
  const std::string missing = folder.Write(
      "c.tvd", SetupText(14,
                         "section Topography {\nType = 1\nsection NDS_2D_DATA_FILE {\nFILE_NAME = file \"away.nds2\"\n"
                         "}\n}"));
  const struct {
    std::vector<std::string> arguments;
    const char* message;
  } cases[] = {
      {{"section", file, "--from", "0,0"}, "--to is required"},
      {{"section", file, "--from", "0;0", "--to", "1,1"}, "0;0: a place was expected"},
      {{"section", file, "--from", "0,0", "--to", "1,inf"}, "1,inf: a place was expected"},
      {{"section", file, "--from", "0,0", "--through", "x", "--to", "1,1"}, "--through x: a place was expected"},
      {{"section", file, "--from", "7,7", "--to", "7,7"}, "the line has no length"},
      {{"section", bare, "--from", "0,0", "--to", "1,1"}, "the saturated zone takes no part"},
      {{"section", missing, "--from", "0,0", "--to", "1,1"}, "away.nds2"},
      {{"column", missing, "--at", "0,0"}, "the place has no ground"},
      {{"column", folder.File("none.tvd"), "--at", "0,0"}, "none.tvd"},
  };
  for (const auto& c : cases) {
    const auto outcome = Tervane(c.arguments);
    EXPECT_EQ(outcome.status, kCouldNot) << c.message;
    EXPECT_THAT(outcome.err, HasSubstr(c.message));
    EXPECT_EQ(outcome.out, "");
  }
}

}  // namespace
}  // namespace tervane::ground_commands_test
