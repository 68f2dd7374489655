// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/species.h"

#include <gmock/gmock.h>

#include "simspec/model_components.h"
#include "tests/wqpt/quality_setup.h"
#include "wqpt/processes.h"

namespace tervane::species_test {
namespace {

using test::QualitySetup;
using testing::ElementsAre;

TEST(Species, KeysOfAllVersions) {
  const auto item = [](int version, const std::string& keys) {
    QualitySetup setup("section Species { NumberOfSpecies = 1; section Species_1 { Name = \"A\"; " + keys + " } }",
                       version);
    return setup.WrittenKeys("Species/Species_1");
  };
  EXPECT_EQ(item(14, ""),
            "Include=1 Name=\"A\" Type=0 TypeStr=\"\" SolubilityinSurfaceWater=100000000f TypeforColloids=0 "
            "PlantUptakeTransFactor=0f");
  EXPECT_EQ(
      item(14,
           "Include = -1; Type = 2; TypeStr = \"2\"; TypeforColloids = 6; PlantUptakeTransFactor = 1.1754944e-38f;"),
      "Include=0 Name=\"A\" Type=2 TypeStr=\"2\" SolubilityinSurfaceWater=100000000f TypeforColloids=6");
  // The solubility had another name in one version, and was not there before.
  struct Case {
    int version;
    const char* solubility;
  };
  for (const Case& c : {Case{9, "100000000f"}, Case{10, "5f"}, Case{11, "7f"}, Case{14, "7f"}})
    EXPECT_THAT(item(c.version, "Solubility = 5f; SolubilityinSurfaceWater = 7f;"),
                testing::HasSubstr(std::string("SolubilityinSurfaceWater=") + c.solubility + " "))
        << c.version;
}

TEST(Species, ARenameReachesTheFirstProcessOfEachListThatNamesTheSpecies) {
  QualitySetup setup;
  auto& species = setup.At<CSpeciesListKvf>("Species");
  auto& processes = setup.At<CProcessesWQKvf>("Processes");
  species.AddItem();
  for (int i = 0; i < 2; ++i) {
    processes.Decays().AddItem()->Species = "Species_1";
    processes.Sorptions().AddItem()->Species = "Species_1";
    processes.Sorptions().GetItem(i + 1)->SorbedSpecies = "Species_1";
  }
  species.GetItem(1)->SetName("Nitrate");
  EXPECT_EQ(processes.Decays().GetItem(1)->Species, "Nitrate");
  EXPECT_EQ(processes.Decays().GetItem(2)->Species, "Species_1");
  EXPECT_EQ(processes.Sorptions().GetItem(1)->Species, "Nitrate");
  EXPECT_EQ(processes.Sorptions().GetItem(1)->SorbedSpecies, "Species_1");
  EXPECT_EQ(processes.Sorptions().GetItem(2)->Species, "Species_1");
  EXPECT_EQ(setup.Written("Overland/InitialMass/Species_1:Name"), "\"Nitrate\"");
}

TEST(Species, WhatIsRefused) {
  QualitySetup setup(
      "section SimSpec { section ModelComp { WQ = 1; ADPTRadio = 1; } } section Species { NumberOfSpecies = 2; "
      "section Species_1 { Name = \"A\"; Type = 1; PlantUptakeTransFactor = 1.5f; SolubilityinSurfaceWater = -1f; } "
      "section Species_2 { Name = \"a\"; SolubilityinSurfaceWater = 0f; PlantUptakeTransFactor = 1f; } }");
  EXPECT_THAT(setup.ErrorsAt("Species"),
              ElementsAre("The names of species should be unique!", "In PT the first specie must be Dissolved."));
  EXPECT_THAT(setup.ErrorsAt("Species/Species_1"),
              ElementsAre("The valid range of ET Uptake Factor is:0 to 1.",
                          "The valid range of Solubility in Surface Water is:greater than 0."));
  EXPECT_THAT(setup.ErrorsAt("Species/Species_2"), ElementsAre());
  setup.At<CModelCompKvf>("SimSpec/ModelComp").ADPTRadio = 0;
  setup.At<CSpeciesListKvf>("Species").GetItem(2)->SetName("B");
  EXPECT_THAT(setup.ErrorsAt("Species"), ElementsAre());
}

TEST(Species, ASetupOfVersionTenWithMassOnTheGroundIsToBeLookedAt) {
  const auto warns = [](int version, int overland) {
    QualitySetup setup("section SimSpec { section ModelComp { WQ = 1; } } section ModelCompWQ { OL = " +
                           std::to_string(overland) + "; }",
                       version);
    return std::ranges::any_of(setup.Report().entries, [](const LoadReport::Entry& entry) {
      return entry.kind == LoadReport::Kind::Warning && entry.text.find("Release 2007") != std::string::npos;
    });
  };
  EXPECT_TRUE(warns(10, 1));
  EXPECT_FALSE(warns(10, 0));
  EXPECT_FALSE(warns(9, 1));
  EXPECT_FALSE(warns(11, 1));
}

}  // namespace
}  // namespace tervane::species_test
