// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/engine_search.h"

#include <gmock/gmock.h>

#include "tests/support/engine_script.h"
#include "tests/support/temp_folder.h"

namespace tervane::engine_search_test {
namespace {

using testing::AllOf;
using testing::HasSubstr;

TEST(EngineSearch, TheSettingComesBeforeTheEnvironmentAndThatBeforeTheFolderBeside) {
  const test::TempFolder folder;
  const EnginePlaces all{folder.File("none") + ":" + folder.File("a"), folder.File("b"), folder.File("c")};
  std::string problem;
  for (const char* name : {"c/Engine", "b/Engine.exe", "a/Engine"}) {
    const std::string path = test::WriteEngine(folder, name, "true");
    EXPECT_EQ(FindEngine("Engine.exe", all, problem), path);
    EXPECT_EQ(FindEngine("Engine", all, problem), path);
    EXPECT_EQ(problem, "");
  }
}

TEST(EngineSearch, TellsWhereItHasLookedAndWhatMayNotBeStarted) {
  const test::TempFolder folder;
  const EnginePlaces places{folder.File("a"), "", "/programs/engines"};
  std::string problem;
  EXPECT_EQ(FindEngine("Engine.exe", places, problem), "");
  EXPECT_THAT(problem,
              AllOf(HasSubstr("the engine Engine was not found"), HasSubstr(folder.File("a")),
                    HasSubstr("TERVANE_ENGINES of the environment (not set)"), HasSubstr("/programs/engines")));
  // Folders that were named for one run are the only ones.
  EXPECT_EQ(FindEngine("Missing", EnginePlaces::Only(folder.File("a")), problem), "");
  EXPECT_EQ(problem, "the engine Missing was not found in " + folder.File("a") + ": name the folder that has it");
  folder.Write("a/Engine", "#!/bin/sh\n");
  EXPECT_EQ(FindEngine("Engine.exe", places, problem), "");
  EXPECT_THAT(problem, AllOf(HasSubstr(folder.File("a/Engine")), HasSubstr("chmod +x")));
}

}  // namespace
}  // namespace tervane::engine_search_test
