// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/river_simulation_file.h"

#include <gmock/gmock.h>

#include "tests/support/temp_folder.h"

namespace tervane::river_simulation_file_test {
namespace {

using test::ReadFile;
using test::TempFolder;

TEST(RiverSimulationFile, GetsTheSetupsResultLocationAndKeepsAllElse) {
  const TempFolder folder;
  const std::string path = folder.Write("river.fvsim", R"(# of the user
target FLUVANE {
  "network " = 1, 2f, 3.0, true, "x", file "net.fvnwk"
  section Reach {
  }
  section Reach {
    A =   # nothing
  }
}
target System {
  Old = 1
}
# second
target FLUVANE {
  B = 2
}
)");
  std::string error;
  EXPECT_EQ(RewriteRiverSimulationFile(path, "", 1, "out", error), 0) << error;
  EXPECT_EQ(ReadFile(path), R"(# of the user
# nothing
target FLUVANE {
  "network " = 1, 2f, 3.0, true, "x", file "net.fvnwk"
  section Reach {
  }
  section Reach {
    A =
  }
}
# second
target FLUVANE {
  B = 2
}
target SYSTEM {
  ProjectResultRoot = file ""
  UseCustomResultFolder = 1
  CustomResultFolder = file "out"
}
)");
}

TEST(RiverSimulationFile, IsLeftAloneWhenItHasTheLocationAlready) {
  const TempFolder folder;
  const std::string location =
      "target SYSTEM {\nProjectResultRoot = file \"/runs\"\nUseCustomResultFolder=0\n"
      "CustomResultFolder = file \"\"\n}\n";
  const std::string own = location + "# own layout\ntarget FvRun {\nA=1\n}\n";
  const std::string path = folder.Write("river.fvsim", own);
  std::string error;
  EXPECT_EQ(RewriteRiverSimulationFile(path, "/runs", 0, "", error), 0) << error;
  EXPECT_EQ(ReadFile(path), own);
  // One of two would be the engine's choice.
  folder.Write("river.fvsim", own + location);
  EXPECT_EQ(RewriteRiverSimulationFile(path, "/runs", 0, "", error), 0) << error;
  const std::string once = ReadFile(path);
  EXPECT_EQ(once.find("SYSTEM"), once.rfind("SYSTEM"));
}

TEST(RiverSimulationFile, AFileThatCannotBeReadStaysAsItWas) {
  const TempFolder folder;
  const std::string path = folder.Write("river.fvsim", "target FLUVANE {\n  A = 12x\n");
  std::string error;
  EXPECT_EQ(RewriteRiverSimulationFile(path, "", 0, "", error), -1);
  EXPECT_THAT(error, testing::HasSubstr("river.fvsim:2:7"));
  EXPECT_EQ(ReadFile(path), "target FLUVANE {\n  A = 12x\n");
  EXPECT_EQ(RewriteRiverSimulationFile(folder.File("missing"), "", 0, "", error), -1);
}

}  // namespace
}  // namespace tervane::river_simulation_file_test
