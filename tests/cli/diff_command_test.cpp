// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <filesystem>

#include <gmock/gmock.h>
#include <rapidjson/document.h>

#include "cli/command_line.h"
#include "document/setup_lock.h"
#include "tests/support/command_outcome.h"
#include "tests/support/temp_folder.h"

namespace tervane::diff_command_test {
namespace {

namespace fs = std::filesystem;
using test::ReadFile;
using test::Tervane;
using testing::HasSubstr;

struct MergeCommand : testing::Test {
  test::TempFolder folder;
  std::string base = folder.File("base.tvd"), mine = folder.File("mine.tvd"), theirs = folder.File("theirs.tvd");

  MergeCommand() {
    Tervane({"new", base});
    for (const std::string& side : {mine, theirs}) fs::copy_file(base, side);
  }
  static void Set(const std::string& file, const char* path, const char* value) {
    ASSERT_EQ(Tervane({"set", file, path, value}).status, kDone);
  }
};

TEST_F(MergeCommand, WritesIntoMineAsVersionControlAsks) {
  Set(mine, "SimSpec/ModelComp:River", "1");
  Set(theirs, "Topography:FixedValue", "77");
  const auto merged = Tervane({"merge", base, mine, theirs, "-o", mine});
  EXPECT_EQ(merged.status, kDone) << merged.err;
  EXPECT_THAT(merged.out, HasSubstr("0 conflicts"));
  EXPECT_EQ(Tervane({"get", mine, "SimSpec/ModelComp:River"}).out, "1\n");
  EXPECT_EQ(Tervane({"get", mine, "Topography:FixedValue"}).out, "77\n");
  EXPECT_EQ(Tervane({"merge", base, mine, theirs, "-o", theirs}).status, kCouldNot);  // without --force
}

TEST_F(MergeCommand, TellsConflictsAndRefusesWhatItCannotMerge) {
  Set(mine, "Topography:FixedValue", "11");
  Set(theirs, "Topography:FixedValue", "12");
  const std::string out = folder.File("out.tvd");
  const auto merged = Tervane({"merge", base, mine, theirs, "-o", out, "--json"});
  EXPECT_EQ(merged.status, kFindings);
  rapidjson::Document json;
  json.Parse(merged.out.c_str());
  ASSERT_FALSE(json.HasParseError()) << merged.out;
  ASSERT_EQ(json["conflicts"].Size(), 1u);
  EXPECT_STREQ(json["conflicts"][0]["path"].GetString(), "Topography");
  EXPECT_STREQ(json["conflicts"][0]["theirs"].GetString(), "12f");
  EXPECT_EQ(Tervane({"get", out, "Topography:FixedValue"}).out, "11\n");

  // What stands at the place of the result stays.
  const std::string bad = folder.Write("bad.tvd", "target {"), before = ReadFile(mine);
  for (const auto& [a, b] : {std::pair(bad, theirs), std::pair(folder.File("gone.tvd"), theirs), std::pair(base, bad)})
    EXPECT_EQ(Tervane({"merge", a, mine, b, "-o", mine}).status, kCouldNot);
  SetupLock lock;
  ASSERT_EQ(lock.Take(mine), SetupLock::Outcome::Taken);
  EXPECT_THAT(Tervane({"merge", base, mine, theirs, "-o", mine}).err, HasSubstr("close it there"));
  EXPECT_EQ(ReadFile(mine), before);
}

}  // namespace
}  // namespace tervane::diff_command_test
