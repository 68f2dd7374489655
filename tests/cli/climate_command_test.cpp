// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <filesystem>

#include <gmock/gmock.h>
#include <rapidjson/document.h>

#include "cli/command_line.h"
#include "tests/support/command_outcome.h"
#include "tests/support/temp_folder.h"

namespace tervane::climate_command_test {
namespace {

namespace fs = std::filesystem;
using test::ReadFile;
using test::Tervane;
using testing::HasSubstr;

struct ClimateCommand : testing::Test {
  test::TempFolder folder;
  std::string setup = folder.File("rhone/rhone.tvd");

  ClimateCommand() {
    fs::copy(fs::path(TERVANE_SOURCE_DIR) / "examples/rhone", folder.File("rhone"), fs::copy_options::recursive);
  }
};

TEST_F(ClimateCommand, ListsAndChangesWhatDrivesASetup) {
  const auto list = Tervane({"climate-change", setup, "--json"});
  EXPECT_EQ(list.status, kDone) << list.err;
  rapidjson::Document json;
  json.Parse(list.out.c_str());
  ASSERT_FALSE(json.HasParseError()) << list.out;
  EXPECT_GT(json["climate"].Size(), 2u);
  EXPECT_STREQ(json["climate"][0]["quantity"].GetString(), "precipitation");

  const std::string warmer = folder.File("rhone/warmer.tvd"), definition = folder.File("def.kvf");
  const auto changed = Tervane({"climate-change", setup, "-o", warmer, "--scale", "precipitation=1.1", "--shift",
                                "temperature=2", "--definition", definition});
  EXPECT_EQ(changed.status, kDone) << changed.err;
  EXPECT_TRUE(fs::exists(folder.File("rhone/warmer_climate")));
  EXPECT_THAT(ReadFile(definition), HasSubstr("section Temperature {"));
  EXPECT_THAT(Tervane({"climate-change", warmer}).out, HasSubstr("warmer_climate/"));
  EXPECT_EQ(Tervane({"check", warmer}).status, Tervane({"check", setup}).status);
}

TEST_F(ClimateCommand, RefusesWhatIsNoChange) {
  for (const char* wrong : {"rain=2", "precipitation", "precipitation=", "precipitation=x", "precipitation=1,2"})
    EXPECT_EQ(Tervane({"climate-change", setup, "-o", folder.File("x.tvd"), "--scale", wrong}).status, kCouldNot)
        << wrong;
  EXPECT_EQ(Tervane({"climate-change", setup, "--shift", "temperature=2"}).status, kCouldNot);  // where to?
  EXPECT_EQ(Tervane({"climate-change", setup, "-o", setup, "--shift", "temperature=2"}).status, kCouldNot);
  EXPECT_FALSE(fs::exists(folder.File("x.tvd")));
}

}  // namespace
}  // namespace tervane::climate_command_test
