// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/wells.h"

#include <gtest/gtest.h>

#include "tests/support/temp_folder.h"

namespace tervane {
namespace {

TEST(Wells, AnEmptyFileHasTheAreaAndTheSectionsOfItsEditor) {
  const test::TempFolder folder;
  ASSERT_EQ(WriteEmptyWellFile(folder.File("a.WEL"), {.xMin = 10.9, .yMin = -20.9, .xMax = 1e12, .yMax = 40}).error,
            "");
  EXPECT_EQ(test::ReadFile(folder.File("a.WEL")),
            "target MAP {\n  section GEOMETRY {\n    x0 = 10\n    y0 = -20\n    x1 = 2147483647\n    y1 = 40\n"
            "    OverlayFilename = file \"\"\n  }\n}\ntarget SOIL {\n  section DEFAULT_DATA {\n    SoilTextOn = 1\n"
            "    MapTextOn = 1\n  }\n}\ntarget WEL_CFG {\n  section WELLDATA {\n    Touched = 0\n    NoWells = 0\n"
            "    IncludeFractureWell = 0\n  }\n  section WELLFIELD {\n    Touched = 0\n    NoWellFields = 0\n  }\n"
            "  section Foreground {\n    Touched = 0\n    NumberOfLayers = 0\n  }\n  section Background {\n"
            "    Touched = 0\n    NumberOfLayers = 0\n  }\n}\n");
  EXPECT_NE(WriteEmptyWellFile(folder.File("away/a.WEL"), {}).error, "");
}

}  // namespace
}  // namespace tervane
