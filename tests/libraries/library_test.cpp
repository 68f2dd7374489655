// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/library.h"

#include <gmock/gmock.h>

#include "libraries/library_kinds.h"
#include "libraries/vegetations.h"
#include "tests/support/temp_folder.h"

namespace tervane::library_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

std::string Vegetations(const std::string& sections) { return "target TERVANE_VEGETATION {\n" + sections + "}\n"; }

Library Parsed(const std::string& text) {
  Library library(kVegetationLibrary);
  EXPECT_EQ(ParseLibrary(FileContent::Of(text), "crops.etv", library), "");
  return library;
}

std::string Written(const Library& library) {
  std::string error;
  std::string text = LibraryFileText(library, error);
  EXPECT_EQ(error, "");
  return text;
}

/// Comments and unknown parts at every place that a file has.
constexpr const char* kFull =
    "# head\n"
    "target OTHER {\n"
    "  Key = 1\n"
    "}\n"
    "# of the target\n"
    "target TERVANE_VEGETATION {\n"
    "  Version = 3\n"
    "  # of maize\n"
    "  section Vegetation_1 {  # first\n"
    "    # of the name\n"
    "    Name = \"Mai\\\"ze\"\n"
    "    Colour = 0.5f, file \"a.png\"\n"
    "    Stage = 0, 0.0, 0.2, 0.3, \"more\", 7  # sown\n"
    "    section Inner {\n"
    "      Deep = true\n"
    "    }\n"
    "    # ripe\n"
    "    Stage = 30, 4.0, 1.0, 1.2\n"
    "    Last = 2\n"
    "  }\n"
    "  section Soil_1 {\n"
    "  }\n"
    "  # of grass\n"
    "  section Vegetation_2 {\n"
    "    Name = \"Grass\"\n"
    "    Source = \"FAO 56\"\n"
    "    Stage = 0, 1.0, 0.5, 1.0\n"
    "  }\n"
    "  End = 9\n"
    "}\n"
    "# between\n"
    "target TERVANE_VEGETATION {\n"
    "  Second = 1\n"
    "}\n"
    "# foot\n";

TEST(Library, KeepsWhatItDoesNotKnowThroughASave) {
  const Library library = Parsed(kFull);
  EXPECT_THAT(FindingsOf(library), testing::IsEmpty());
  EXPECT_EQ(library.entries[0].Name(), "Mai\"ze");
  EXPECT_EQ(library.entries[1].fields[1].text, "FAO 56");
  EXPECT_EQ(Written(library), kFull);
}

TEST(Library, WhatStandsBetweenStaysWhenItsNeighboursGo) {
  Library library = Parsed(kFull);
  library.entries[0].DeleteRow(1);
  library.DeleteEntry(1);
  const std::string text = Written(library);
  for (const char* kept : {"section Inner {\n      Deep = true\n    }\n    Last = 2", "section Soil_1", "End = 9"})
    EXPECT_THAT(text, HasSubstr(kept));
  for (const char* gone : {"Stage = 30", "# ripe", "Grass", "# of grass"})
    EXPECT_THAT(text, testing::Not(HasSubstr(gone)));
}

TEST(Library, NumbersAreTakenInAnyFormAndWrittenAsTheirColumnSays) {
  const Library library = Parsed(Vegetations("section Vegetation_7 {\nName = \"A\"\nStage = 10.0, 1, 0.1f, 1e-1\n}\n"));
  EXPECT_THAT(Written(library), HasSubstr("section Vegetation_1 {\n    Name = \"A\"\n    Stage = 10, 1.0, 0.1, 0.1\n"));
}

TEST(Library, FilesThatAreNoneAreRefusedWithTheirReason) {
  const struct {
    std::string text, reason;
  } cases[] = {
      {"", "crops.etv:1:1: the file is empty"},
      {"target TERVANE_FLOWMODEL {\n}\n",
       "crops.etv is no vegetation property file: it has no target TERVANE_VEGETATION"},
      {std::string(kFull).substr(0, 300), "crops.etv:"},
      {Vegetations("section Vegetation_1 {\nStage = 0, 1x\n}\n"), "crops.etv:3:"},
      {Vegetations("section Vegetation_1 {\nName = \"A\n}\n"), "crops.etv:3:"},
      {std::string("CDF\x01\0\0\0\x02", 8), "crops.etv:1:"},
  };
  for (const auto& [text, reason] : cases) {
    SCOPED_TRACE(text);
    Library library(kVegetationLibrary);
    EXPECT_THAT(ParseLibrary(FileContent::Of(text), "crops.etv", library), HasSubstr(reason));
    EXPECT_TRUE(library.entries.empty());
  }
}

TEST(Library, EveryCutOfAFileIsRefused) {
  const std::string whole = Vegetations("section Vegetation_1 {\nName = \"A\"\nStage = 0, 1.0, 0.5, 1.0\n}\n");
  for (std::size_t size = 0; size + 1 < whole.size(); ++size) {
    Library library(kVegetationLibrary);
    EXPECT_NE(ParseLibrary(FileContent::Of(whole.substr(0, size)), "crops.etv", library), "") << size;
  }
}

TEST(Library, FindingsSayWhereAndWhat) {
  const std::string good = "Stage = 0, 1.0, 0.5, 1.0\n";
  const struct {
    std::string sections;
    std::vector<std::string> findings;
  } cases[] = {
      {"", {"c.etv: the library has no vegetations"}},
      {"section Vegetation_1 {\nName = \"A\"\n" + good + "}\n", {}},
      {"section Vegetation_1 {\nName = \"A\"\n}\n", {"c.etv:2: Vegetation \"A\": it has no stages"}},
      {"section Vegetation_1 {\n" + good + "}\n", {"c.etv:2: Vegetation 1: it has no name"}},
      {"section Vegetation_1 {\nName = \"A\"\n" + good + "}\nsection Vegetation_2 {\nName = \"A\"\n" + good + "}\n",
       {"c.etv:6: Vegetation \"A\": the vegetation 1 has the same name; the first is used"}},
      {"section Vegetation_1 {\nName = \"A\"\nStage = 9, 1.0, 0.5, 1.0\n" + good + "}\n",
       {"c.etv:5: Vegetation \"A\", stage 2: Day 0 stands behind 9"}},
      {"section Vegetation_1 {\nName = \"A\"\nStage = -1, 21.0, -0.5, nan\n}\n",
       {"c.etv:4: Vegetation \"A\", stage 1: Day is -1, a whole number from 0 to 36500 was expected",
        "c.etv:4: Vegetation \"A\", stage 1: LAI is 21, a number from 0 to 20 was expected",
        "c.etv:4: Vegetation \"A\", stage 1: RD is -0.5, a number from 0 to 50 m was expected",
        "c.etv:4: Vegetation \"A\", stage 1: Kc is missing, a number from 0 to 3 was expected"}},
      {"section Vegetation_1 {\nName = \"A\"\nStage = 1.5, 1.0, 0.5, 1.0\n}\n",
       {"c.etv:4: Vegetation \"A\", stage 1: Day is 1.5, a whole number from 0 to 36500 was expected"}},
      {"section Vegetation_1 {\nName = 3\nName = \"A\"\nName = \"B\"\nStage = 1, 2\nStage = 0, \"x\", 1.0, 1.0\n" +
           good + "}\n",
       {"c.etv:3: Vegetation \"A\": Name = 3: one text in quotes was expected",
        "c.etv:5: Vegetation \"A\": Name = \"B\": it is there twice; the first is used",
        "c.etv:6: Vegetation \"A\": Stage = 1, 2: 4 numbers were expected: Day, LAI, RD, Kc",
        "c.etv:7: Vegetation \"A\": Stage = 0, \"x\", 1.0, 1.0: 4 numbers were expected: Day, LAI, RD, Kc"}},
  };
  for (const auto& [sections, expected] : cases) {
    SCOPED_TRACE(sections);
    const Library library = Parsed(Vegetations(sections));
    std::vector<std::string> found;
    for (const LibraryFinding& finding : FindingsOf(library)) found.push_back(FindingText("c.etv", library, finding));
    EXPECT_EQ(found, expected);
    // What could not be taken is kept.
    EXPECT_EQ(FindingsOf(Parsed(Written(library))).size(), expected.size());
  }
}

TEST(Library, TellsWhyAnEntryCannotBeUsed) {
  const Library library = Parsed(Vegetations(
      "section Vegetation_1 {\nName = \"A\"\nStage = 0, 1.0, 0.5, 1.0\n}\nsection Vegetation_2 {\nName = \"B\"\n}\n"));
  EXPECT_EQ(WhyNoEntry("c.etv", library, "A"), "");
  EXPECT_THAT(WhyNoEntry("c.etv", library, "B"), HasSubstr("it has no stages"));
  EXPECT_EQ(WhyNoEntry("c.etv", library, "C"), "c.etv has no vegetation \"C\"; it has A, B");
}

TEST(Library, IsWrittenAsAWholeOrNotAtAll) {
  const test::TempFolder folder;
  const std::string path = folder.Write("c.etv", kFull);
  Library library(kVegetationLibrary);
  ASSERT_EQ(ReadLibrary(path, library), "");
  library.entries[0].fields[0].text = "\xff";
  EXPECT_FALSE(WriteLibrary(path, library).Ok());
  EXPECT_EQ(test::ReadFile(path), kFull);
  library.entries[0].fields[0].text = library.FreeName("Grass");
  EXPECT_TRUE(WriteLibrary(path, library).Ok());
  EXPECT_EQ(ReadLibraryOnce(kVegetationLibrary, path)->library.entries[0].Name(), "Grass 2");
  EXPECT_THAT(ReadLibraryOnce(kVegetationLibrary, folder.File("none.etv"))->problem, HasSubstr("none.etv"));
}

TEST(Vegetations, GiveTheirStagesInTimeOrder) {
  const test::TempFolder folder;
  const std::string path = folder.Write(
      "c.etv",
      Vegetations("section Vegetation_1 {\nName = \"A\"\nStage = 60, 3.0, 1.0, 1.2\nStage = -5, 1.0, 1.0, 1.0\n"
                  "Stage = 0, 1.0, 0.5, 0.3\n}\n"));
  const CTvnVegPropStageDataList stages = GetVegPropStages(path, "A");
  ASSERT_EQ(stages.size(), 2u);
  EXPECT_EQ(stages[0].DayStamp(), 0);
  EXPECT_EQ(stages[1].DayStamp(), 60);
  EXPECT_EQ(stages[1].lai, 3);
  EXPECT_EQ(stages[0].rootDepth, 0.5);
  EXPECT_EQ(stages[0].cropCoefficient, 0.3);
  EXPECT_TRUE(GetVegPropStages(path, "B").empty());
}

TEST(Vegetations, OfTheExampleAreSoundAndSurviveASave) {
  const std::string path = TERVANE_SOURCE_DIR "/examples/crops.etv";
  ASSERT_EQ(LibraryKindOf(path), &kVegetationLibrary);
  Library library(kVegetationLibrary);
  ASSERT_EQ(ReadLibrary(path, library), "");
  EXPECT_GE(library.entries.size(), 12u);
  for (const LibraryFinding& finding : FindingsOf(library)) ADD_FAILURE() << FindingText(path, library, finding);
  EXPECT_EQ(Written(library), test::ReadFile(path));
}

TEST(LibraryKinds, AreKnownByTheExtension) {
  EXPECT_EQ(LibraryKindOf("a/B.ETV"), &kVegetationLibrary);
  for (const char* path : {"", "etv", "a.etv/b", "b.etv2"}) EXPECT_EQ(LibraryKindOf(path), nullptr) << path;
}

}  // namespace
}  // namespace tervane::library_test
