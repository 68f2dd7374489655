// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "wqpt/processes.h"

#include <gmock/gmock.h>

#include "simspec/model_components.h"
#include "tests/wqpt/quality_setup.h"

namespace tervane::processes_test {
namespace {

using test::QualitySetup;

const std::string kProcessSections =
    "section Species { NumberOfSpecies = 2; section Species_1 { Name = \"A\"; } section Species_2 { Name = \"B\"; Type "
    "= 1; } } "
    "section Processes { section Decay_Processes { NumberOfDecay = 2; section Decay_1 { Name = \"D\"; Species = \"a\"; "
    "} "
    "section Decay_2 { Name = \"E\"; Species = \"B\"; } } "
    "section Sorption_Processes { NumberOfSorption = 1; section Sorption_1 { Name = \"S\"; } } } ";

TEST(Processes, KeysInTheOrderOfTheFile) {
  QualitySetup setup(kProcessSections);
  EXPECT_EQ(setup.WrittenKeys("Processes/Decay_Processes/Decay_1"),
            "Species=\"a\" IsTemperatureDependant=0 IsWaterContentDependant=0 Name=\"D\" Temperature=20f "
            "TemperatureExponent=0.01f WaterContentExponent=1f");
  EXPECT_EQ(setup.WrittenKeys("Processes/Sorption_Processes/Sorption_1"),
            "Name=\"S\" Type=0 Species=\"\" SorbedSpecies=\"\" IsothermType=0 KineticType=0 EQSorptionFraction=0.7f "
            "BiasFactor=0f");
}

TEST(Processes, TheyTakePartByTheChoicesOfWaterQuality) {
  QualitySetup setup;
  auto& components = setup.At<CModelCompKvf>("SimSpec/ModelComp");
  auto& quality = setup.At<CModelCompWQKvf>("ModelCompWQ");
  struct Case {
    int wq, tracked, included, type;
    bool isUsed;
  };
  for (const Case& c : {Case{1, 0, 1, 0, true}, Case{1, 0, 1, 1, false}, Case{1, 0, 1, 2, true},
                        Case{0, 0, 1, 0, false}, Case{1, 1, 1, 0, false}, Case{1, 0, 0, 0, false}}) {
    components.WQ = c.wq;
    components.ADPTRadio = c.tracked;
    quality.IncludeProcesses = c.included;
    quality.ProcessType = c.type;
    EXPECT_EQ(setup.IsUsed("Processes"), c.isUsed) << c.wq << c.tracked << c.included << c.type;
    EXPECT_EQ(setup.IsUsed("Species"), c.wq == 1);
  }
}

/// Which decays take part over ground and in the soil.
std::string UsedDecays(QualitySetup& setup) {
  std::string used;
  for (const char* zone : {"Overland", "Unsatzone"})
    for (const char* entry : {"/Decay_Processes/Decay_1", "/Decay_Processes/Decay_2"})
      used += setup.IsUsed(std::string(zone) + entry) ? '1' : '0';
  return used;
}

TEST(Processes, ADecayCountsWhereTheTypeOfItsSpeciesDecays) {
  QualitySetup setup(kProcessSections);
  auto& species = setup.At<CSpeciesListKvf>("Species");
  EXPECT_EQ(UsedDecays(setup), "1011");
  // A type reaches the processes when the list refreshes what follows it.
  species.GetItem(1)->SetType(CSpeciesItemKvf::kSuspended);
  EXPECT_EQ(UsedDecays(setup), "1011");
  species.RefreshDependents();
  EXPECT_EQ(UsedDecays(setup), "1001");
  // A process without its species is off everywhere, and keeps its text.
  species.DeleteItem(2, 1);
  species.RefreshDependents();
  EXPECT_EQ(UsedDecays(setup), "1000");
  EXPECT_EQ(setup.At<CProcessesWQKvf>("Processes").Decays().GetItem(2)->Species, "B");
}

TEST(Processes, ASpeciesThatIsGoneIsReplacedByOneThatIsOffered) {
  QualitySetup setup(
      "section SimSpec { section ModelComp { WQ = 1; } } section ModelCompWQ { IncludeProcesses = 1; OL = 1; } section "
      "Species { NumberOfSpecies = 3; section Species_1 { Name = \"A\"; } section Species_2 { Name = \"B\"; Type = 1; "
      "} "
      "section Species_3 { Name = \"C\"; Type = 3; } } section Processes { section Decay_Processes { NumberOfDecay = "
      "1; "
      "section Decay_1 { Species = \"gone\"; } } section Sorption_Processes { NumberOfSorption = 1; section Sorption_1 "
      "{ "
      "Species = \"A\"; SorbedSpecies = \"gone\"; } } }");
  setup.Root().Validate();
  const auto offered = [](CYbSEKvfBase& node) {
    std::string texts;
    for (const Mend& mend : dynamic_cast<OffersMends&>(node).MendsOf(node.Findings().front()))
      texts += mend.text + "; ";
    return texts;
  };
  auto& decay = *setup.At<CProcessesWQKvf>("Processes").Decays().GetItem(1);
  auto& sorption = *setup.At<CProcessesWQKvf>("Processes").Sorptions().GetItem(1);
  // What has no phase does not decay.
  EXPECT_EQ(offered(decay), "Change Species to A; Change Species to B; ");
  EXPECT_EQ(offered(sorption), "Change SorbedSpecies to B; ");
  EXPECT_FALSE(setup.IsUsed("Overland/Decay_Processes/Decay_1"));
  decay.TakeMend(decay.MendsOf(decay.Findings().front()).front());
  sorption.TakeMend(sorption.MendsOf(sorption.Findings().front()).front());
  setup.Root().Validate();
  EXPECT_TRUE(decay.Findings().empty() && sorption.Findings().empty());
  EXPECT_TRUE(setup.IsUsed("Overland/Decay_Processes/Decay_1")) << "what follows the process is told";
  EXPECT_TRUE(decay.MendsOf({Severity::Error, "", "Name", ""}).empty());
}

TEST(Processes, WhatIsRefusedFirst) {
  struct Case {
    const char* keys;
    const char* error;
    const char* other = "X";  ///< The name of the second item; the first is "y".
  };
  const Case decays[] = {
      {"Temperature = 200f;", "Duplicate Decay Name.", "Y"},
      {"Temperature = 100.5f; TemperatureExponent = -1f;", "Tempreture value should between -100 and 100"},
      {"Temperature = -100f; TemperatureExponent = -1f;",
       "Exponent is invalid, value must be greater than or equal to 0 ."},
      {"WaterContentExponent = -0.1f;", "Exponent is invalid, value must be greater than or equal to 0 ."},
      {"TemperatureExponent = 0f; Temperature = 100f;", "Species can not be empty."},
      {"Species = \"A\";", ""}};
  const Case sorptions[] = {{"", "Duplicate Sorption Name.", "Y"},
                            {"", "Species can not be empty"},
                            {"Species = \"A\"; EQSorptionFraction = 7f;", "Sorbed Species can not be empty"},
                            {"Species = \"A\"; SorbedSpecies = \"B\"; EQSorptionFraction = 7f;", ""}};
  const auto firstError = [](const std::string& list, const std::string& item, const Case& c) {
    QualitySetup setup(
        "section SimSpec { section ModelComp { WQ = 1; } } section ModelCompWQ { IncludeProcesses = 1; } section "
        "Species { NumberOfSpecies = 2; section Species_1 { Name = \"A\"; } section Species_2 { Name = \"B\"; "
        "} } "
        "section Processes { section " +
        list + " { YbSEKvfListItemCount = 2; section " + item + "_1 { Name = \"y\"; " + c.keys + " } section " + item +
        "_2 { Name = \"" + c.other + "\"; } } }");
    auto& node = setup.At<CYbSEKvfBase>("Processes/" + list + "/" + item + "_1");
    node.Validate();
    return node.Findings().empty() ? std::string() : node.Findings().front().text;
  };
  for (const Case& c : decays) EXPECT_EQ(firstError("Decay_Processes", "Decay", c), c.error) << c.keys;
  for (const Case& c : sorptions) EXPECT_EQ(firstError("Sorption_Processes", "Sorption", c), c.error) << c.keys;
}

}  // namespace
}  // namespace tervane::processes_test
