// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/river_simulation_file.h"

#include <gmock/gmock.h>

#include "tests/support/temp_folder.h"

namespace tervane {
namespace {

using test::ReadFile;
using test::TempFolder;

TEST(RiverSimulationFile, GetsTheSetupsResultLocationAndKeepsAllElse) {
  const TempFolder folder;
  const std::string path = folder.Write("river.fvsim", R"(target FLUVANE {
  "network " = 1, 2f, 3.0, true, "x", file "net.fvnwk"
  section Reach {
  }
  section Reach {
    A =
  }
}
target System {
  Old = 1
}
target FLUVANE {
  B = 2
}
)");
  std::string error;
  EXPECT_EQ(RewriteRiverSimulationFile(path, "", 1, "out", error), 0) << error;
  const std::string expected = R"(target FLUVANE {
  "network " = 1, 2f, 3.0, true, "x", file "net.fvnwk"
  section Reach {
  }
  section Reach {
    A =
  }
}
target FLUVANE {
  B = 2
}
target SYSTEM {
  ProjectResultRoot = file ""
  UseCustomResultFolder = 1
  CustomResultFolder = file "out"
}
)";
  EXPECT_EQ(ReadFile(path), expected);
  // Once more: the new target is replaced, not repeated.
  EXPECT_EQ(RewriteRiverSimulationFile(path, "", 1, "out", error), 0);
  EXPECT_EQ(ReadFile(path), expected);
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
}  // namespace tervane
