// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/soils.h"

#include <cmath>

#include <gmock/gmock.h>

#include "tests/support/temp_folder.h"

namespace tervane::soils_test {
namespace {

using testing::DoubleNear;
using testing::HasSubstr;

constexpr const char* kLoam =
    "section Soil_1 {\nName = \"Loam\"\nRetention = \"van Genuchten\", 0.43, 0.078, 3.6, 1.56\n"
    "Conductivity = \"Mualem\", 2.889e-6, 0.5\nBulkDensity = 1511\n}\n";

std::string Soils(const std::string& sections) { return "target TERVANE_SOILS {\n" + sections + "}\n"; }

Library Parsed(const std::string& text) {
  Library library(kSoilLibrary);
  EXPECT_EQ(ParseLibrary(FileContent::Of(text), "a.uzs", library), "");
  return library;
}

TEST(Soils, OfTheExampleAreTheTextureClassesAndSurviveASave) {
  const std::string path = TERVANE_SOURCE_DIR "/examples/soils.uzs";
  Library library(kSoilLibrary);
  ASSERT_EQ(ReadLibrary(path, library), "");
  for (const LibraryFinding& finding : FindingsOf(library)) ADD_FAILURE() << FindingText(path, library, finding);
  ASSERT_EQ(library.entries.size(), SoilTextures().size());
  for (std::size_t i = 0; i < library.entries.size(); ++i) {
    const LibraryEntry& entry = library.entries[i];
    LibraryEntry set = library.NewEntry(entry.Name());
    SetFromTexture(set, SoilTextures()[i]);
    EXPECT_EQ(entry.Name(), SoilTextures()[i].name);
    for (std::size_t field = 1; field < entry.fields.size(); ++field) {
      EXPECT_EQ(entry.fields[field].text, set.fields[field].text);
      EXPECT_EQ(entry.fields[field].numbers, set.fields[field].numbers) << entry.Name() << " " << field;
    }
    EXPECT_EQ(FirstFault(kSoilLibrary, set), "");
  }
  std::string error;
  EXPECT_EQ(LibraryFileText(library, error), test::ReadFile(path));
}

TEST(Soils, CurvesFollowTheirModels) {
  // Worked by hand from the formulas, at a suction of 10 m.
  const auto soil = [](const std::string& models) {
    return *SoilOf(Parsed(Soils("section Soil_1 {\nName = \"A\"\n" + models + "BulkDensity = 1500\n}\n")).entries[0]);
  };
  const Soil loam = *SoilOf(Parsed(Soils(kLoam)).entries[0]);
  const Soil brooks = soil("Retention = \"Brooks-Corey\", 0.4, 0.04, 0.1, 0.5\nConductivity = \"Mualem\", 1e-5, 0.5\n");
  const Soil campbell = soil("Retention = \"Campbell\", 0.4, 0.1, 4\nConductivity = \"Power law\", 1e-5, 11\n");
  EXPECT_THAT(WaterContent(loam, 10),
              DoubleNear(0.078 + 0.352 * std::pow(1 + std::pow(36.0, 1.56), -0.358974359), 1e-9));
  EXPECT_THAT(WaterContent(brooks, 10), DoubleNear(0.04 + 0.36 * 0.1, 1e-12));
  EXPECT_THAT(ConductivityAt(brooks, 10) / 1e-5, DoubleNear(std::pow(0.1, 6.5), 1e-15));
  EXPECT_THAT(WaterContent(campbell, 10), DoubleNear(0.4 * std::pow(100, -0.25), 1e-12));
  EXPECT_THAT(ConductivityAt(campbell, 10) / 1e-5, DoubleNear(std::pow(100, -2.75), 1e-15));
  for (const Soil& each : {loam, brooks, campbell}) {
    EXPECT_EQ(WaterContent(each, 0), each.thetaS);
    EXPECT_EQ(ConductivityAt(each, 0), each.ks);
    double water = each.thetaS + 1, conductivity = each.ks + 1;
    for (double suction = 0.2; suction < 1e6; suction *= 3) {
      EXPECT_LT(WaterContent(each, suction), water);
      EXPECT_LT(ConductivityAt(each, suction), conductivity);
      EXPECT_GT(ConductivityAt(each, suction), 0) << suction;
      water = WaterContent(each, suction);
      conductivity = ConductivityAt(each, suction);
    }
  }
}

TEST(Soils, EachModelHasItsParametersAndTheRestIsKept) {
  const std::string text =
      "target TERVANE_SOILS {\n  # dune\n  section Soil_1 {\n    Name = \"A\"\n"
      "    Retention = \"Campbell\", 0.4, 0.1, 4.0, 7  # of a survey\n"
      "    Conductivity = \"Power law\", 0.00001, 11.0\n    BulkDensity = 1500.0\n    Colour = \"brown\"\n  }\n"
      "  section Soil_2 {\n    Name = \"B\"\n    Retention = \"Brooks-Corey\", 0.4, 0.05, 0.2, 0.3\n"
      "    Conductivity = \"Mualem\", 0.00001, 0.5\n    BulkDensity = 1500.0\n  }\n}\n";
  const Library library = Parsed(text);
  EXPECT_THAT(FindingsOf(library), testing::IsEmpty());
  const auto campbell = SoilOf(library.entries[0]), brooks = SoilOf(library.entries[1]);
  ASSERT_TRUE(campbell && brooks);
  EXPECT_EQ(campbell->lambda, 0.25);
  EXPECT_EQ(campbell->thetaR, 0);
  EXPECT_EQ(campbell->exponent, 11);
  EXPECT_EQ(brooks->airEntry, 0.2);
  EXPECT_EQ(brooks->lambda, 0.3);
  std::string error;
  const std::string written = LibraryFileText(library, error);
  for (const char* kept : {"  # dune\n", "4.0, 7  # of a survey\n", "Colour = \"brown\"\n"})
    EXPECT_THAT(written, HasSubstr(kept));
  EXPECT_EQ(Parsed(written).entries, library.entries);
}

TEST(Soils, FaultsAreToldWithTheirPlace) {
  const struct {
    const char *wanted, *with, *finding;
  } cases[] = {
      {"Conductivity = \"Mualem\", 2.889e-6, 0.5\n", "", "Conductivity is missing"},
      {"\"Mualem\"", "\"mualem\"", "models are \"Mualem\", \"Power law\""},
      {", 3.6, 1.56", ", 3.6", "4 numbers were expected: Saturated water content, Residual water content, Alpha, n"},
      {"1.56", "1.0", "n is 1, a number above 1 and up to 20 was expected"},
      {"0.078", "0.5", "Residual water content is 0.5, less than the saturated 0.43 was expected"},
      {"0.43", "nan", "Saturated water content is missing, a number above 0 and up to 1 was expected"},
  };
  for (const auto& c : cases) {
    std::string text = kLoam;
    text.replace(text.find(c.wanted), std::string(c.wanted).size(), c.with);
    const Library library = Parsed(Soils(text));
    const auto findings = FindingsOf(library);
    ASSERT_FALSE(findings.empty()) << c.finding;
    EXPECT_THAT(FindingText("a.uzs", library, findings[0]), HasSubstr(c.finding));
    EXPECT_FALSE(SoilOf(library.entries[0]));
  }
}

TEST(Soils, AreFoundInTheirFileByName) {
  const test::TempFolder folder;
  const std::string good = folder.Write("a.uzs", Soils(kLoam));
  EXPECT_TRUE(IsSoilDBFileValid(good, "Loam"));
  EXPECT_THAT(WhySoilNotValid(good, "loam"), HasSubstr("has no soil \"loam\"; it has Loam"));
  EXPECT_THAT(WhySoilNotValid(folder.File("b.uzs"), "Loam"), HasSubstr("b.uzs"));
  const std::string cut = folder.Write("c.uzs", Soils(kLoam).substr(0, 120));
  EXPECT_THAT(WhySoilNotValid(cut, "Loam"), HasSubstr("c.uzs:"));
  std::string twice = Soils(std::string(kLoam) + kLoam);
  EXPECT_THAT(FindingsOf(Parsed(twice)).back().text, HasSubstr("the soil 1 has the same name"));
}

}  // namespace
}  // namespace tervane::soils_test
