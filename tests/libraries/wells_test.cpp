// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/wells.h"

#include <gtest/gtest.h>

#include "tests/support/temp_folder.h"

namespace tervane::wells_test {
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

constexpr const char* kFull =
    "target MAP {\n"
    "  Zoom = 3\n"
    "}\n"
    "target WEL_CFG {\n"
    "  section WELLFIELD {\n"
    "    NoWellFields = 0\n"
    "  }\n"
    "  section WELLDATA {\n"
    "    NoWells = 2\n"
    "    Touched = 1\n"
    "    # the oldest\n"
    "    section Well_1 {  # of 1921\n"
    "      Name = \"North 3\"\n"
    "      X = 351000.5\n"
    "      Y = 5113000.0\n"
    "      Level = 410.0\n"
    "      Depth = 60.0\n"
    "      Field = \"North\"\n"
    "      NoFilters = 1\n"
    "      Diameter = 0.3f\n"
    "      section Filter_1 {\n"
    "        Top = 390.0\n"
    "        Bottom = 370.0\n"
    "        TimeSeries = file \"series/pumping.nds0\", 4\n"
    "        Slots = 12\n"
    "      }\n"
    "    }\n"
    "    section Well_2 {\n"
    "      Name = \"South\"\n"
    "      X = 1.0\n"
    "      Y = 2.0\n"
    "      Level = 100.0\n"
    "      Depth = 20.0\n"
    "      NoFilters = 2\n"
    "      section Filter_1 {\n"
    "        Top = 70.0\n"
    "        Bottom = 75.0\n"
    "      }\n"
    "      section Filter_2 {\n"
    "        Top = 90.0\n"
    "        Bottom = 79.0\n"
    "      }\n"
    "    }\n"
    "  }\n"
    "  section Foreground {\n"
    "    NumberOfLayers = 0\n"
    "  }\n"
    "}\n";

TEST(Wells, AreReadWithTheirFiltersAndWhatIsNotKnownStaysThroughASave) {
  const test::TempFolder folder;
  const std::string path = folder.Write("a.WEL", kFull);
  CTvnWellDataList list;
  ASSERT_TRUE(list.LoadWellDataFile(path)) << list.Problem();
  ASSERT_EQ(list.Wells().size(), 2U);
  EXPECT_EQ(list.Wells()[0].name, "North 3");
  EXPECT_EQ(list.Wells()[0].place, (MapPoint{351000.5, 5113000}));
  EXPECT_EQ(list.Wells()[0].Bottom(), 350);
  EXPECT_EQ(list.Wells()[0].filters.at(0).timeSeries.Absolute(), folder.File("series/pumping.nds0"));
  EXPECT_LT(list.Wells()[0], list.Wells()[1]);
  EXPECT_EQ(TvnGetAbstractionFileList(path),
            (std::vector<CTvnAbstraction>{{"North 3", 1, folder.File("series/pumping.nds0"), 4}}));

  Library library(kWellLibrary);
  ASSERT_EQ(ReadLibrary(path, library), "");
  std::string error, found;
  EXPECT_EQ(LibraryFileText(library, error), kFull);
  for (const LibraryFinding& finding : FindingsOf(library)) found += FindingText("a.WEL", library, finding) + "\n";
  EXPECT_EQ(found,
            "a.WEL:35: Well \"South\", filter 1: its top, 70 m, does not lie above its bottom, 75 m\n"
            "a.WEL:39: Well \"South\", filter 2: it reaches down to 79 m, below the bottom of the well at 80 m\n");
  // Saved elsewhere, names of files lead to the same ones.
  const test::TempFolder other;
  ASSERT_TRUE(WriteLibrary(other.File("b.WEL"), library).Ok());
  ASSERT_TRUE(list.LoadWellDataFile(other.File("b.WEL")));
  EXPECT_EQ(list.Wells()[0].filters.at(0).timeSeries.Absolute(), folder.File("series/pumping.nds0"));

  EXPECT_FALSE(list.LoadWellDataFile(folder.File("away.WEL")));
  EXPECT_TRUE(list.Wells().empty());
  EXPECT_FALSE(list.LoadWellDataFile(folder.Write("cut.WEL", std::string(kFull).substr(0, 700))));
  EXPECT_NE(list.Problem().find("cut.WEL:"), std::string::npos);
}

TEST(Wells, ATableOfTextGivesWellsAndTellsWhatItDoesNotTake) {
  const test::TempFolder folder;
  const std::string path = folder.Write("wells.csv",
                                        "Name;X;Y;Level;Depth;Top;Bottom;File;Item\n"
                                        "North;1,5;2;100,25;40;90;80;p.nds0;2\n"
                                        "North;;;;;75;70;;\n"
                                        "South;7;8;;10;;;;\n"
                                        ";1;2;3;4;;;;\n"
                                        "East;1;2;30;10;29;x;;\n");
  WellImport import;
  ASSERT_EQ(ReadWellTable(path, import), "");
  const std::vector<CTvnWellData> wells = WellsOf(import.wells);
  ASSERT_EQ(wells.size(), 2U);
  EXPECT_EQ(wells[0].place, (MapPoint{1.5, 2}));
  EXPECT_EQ(wells[0].level, 100.25);
  ASSERT_EQ(wells[0].filters.size(), 2U);
  EXPECT_EQ(wells[0].filters[0].item, 2);
  EXPECT_EQ(wells[1].name, "East");
  ASSERT_EQ(import.notes.size(), 3U);
  EXPECT_EQ(import.notes[0], path + ":4: level of South is \"\", a number was expected");
  WellImport none;
  EXPECT_NE(ReadWellTable(folder.Write("b.csv", "name,x\n"), none), "");
}

}  // namespace
}  // namespace tervane::wells_test
