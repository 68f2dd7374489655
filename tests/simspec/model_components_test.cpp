// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/model_components.h"

#include <array>
#include <functional>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "platform/text.h"
#include "simspec/basic_parameters.h"
#include "simspec/control_parameters.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/split_at_arrow.h"

namespace tervane::model_components_test {
namespace {

using test::SplitAtArrow;
using test::TestSetup;
using testing::IsEmpty;

/// The nodes that decide.
struct Choice {
  explicit Choice(TestSetup& setup)
      : basics(setup.At<CBasicParaKvf>("SimSpec")),
        own(setup.At<CModelCompKvf>("SimSpec/ModelComp")),
        modflow(setup.At<CModModelCompKvf>("SimSpec/ModModelComp")),
        quality(setup.At<CModelCompWQKvf>("ModelCompWQ")),
        zone(setup.At<CCompControlParaSZKvf>("SimSpec/CompControlParaSZ")) {}
  CBasicParaKvf& basics;
  CModelCompKvf& own;
  CModModelCompKvf& modflow;
  CModelCompWQKvf& quality;
  CCompControlParaSZKvf& zone;
};

TEST(ModelComponents, TheyDecideWhichNodesTakePart) {
  constexpr const char* nodes[] = {"own => SimSpec/ModelComp",
                                   "step => SimSpec/CompControlParaTimeStep",
                                   "ol => SimSpec/CompControlParaOL",
                                   "uz => SimSpec/CompControlParaUZ",
                                   "sz => SimSpec/CompControlParaSZ",
                                   "mod => SimSpec/ModModelComp",
                                   "trans => SimSpec/CompControlParaSZ/CompControlParaSZPCGTrans",
                                   "WQ => ModelCompWQ",
                                   "PT => ModelCompPT",
                                   "steady => SimSpec/CompControlParaSZ/CompControlParaSZPCGSteady",
                                   "flags => ExecuteEngineFlagsKvf",
                                   "sor => SimSpec/CompControlParaSZ/CompControlParaSZSOR",
                                   "air => SimSpec/AirFlowSimulationParametersMod",
                                   "exchange => SimSpec/CompControlParaSZ/CompControlParaRivEx",
                                   "colloids => ModelCompWQ/ColloidControlPara",
                                   "overview => Overview",
                                   "periods => SimSpec/STRESSPERIODS",
                                   "solver => SimSpec/CompControlParaModSZ",
                                   "packages => SimSpec/CompControlParaModPackage",
                                   "output => OutputModflow"};
  struct Case {
    const char* what;
    std::function<void(Choice)> choose;
    std::string used;
  };
  const Case cases[] = {
      {"new", [](Choice) {}, "own step ol uz sz trans"},
      {"without OL", [](Choice c) { c.own.OL = 0; }, "own step uz sz trans"},
      {"OL by subcatchment", [](Choice c) { c.own.OL_ModelType = 1; }, "own step uz sz trans"},
      {"without UZ", [](Choice c) { c.own.UZ = 0; }, "own step ol sz trans"},
      {"without SZ", [](Choice c) { c.own.SZ = 0; }, "own step ol uz trans"},
      {"SZ as reservoirs", [](Choice c) { c.own.SZ_ModelType = 1; }, "own step ol uz trans"},
      {"without WM", [](Choice c) { c.own.WM = 0; }, "own step trans"},
      {"with river", [](Choice c) { c.own.River = 1; }, "own step ol uz sz trans exchange"},
      {"steady state", [](Choice c) { c.zone.SolverOption = c.own.River = 1; }, "own step ol uz sz steady"},
      {"overrelaxation", [](Choice c) { c.zone.SolverOption = 2; }, "own step ol uz sz sor"},
      {"overrelaxation with river", [](Choice c) { c.zone.SolverOption = 2, c.own.River = 1; },
       "own step ol uz sz sor exchange"},
      {"unknown solver", [](Choice c) { c.zone.SolverOption = 3; }, "own step ol uz sz"},
      {"WQ", [](Choice c) { c.own.WQ = 1; }, "own step ol uz sz trans WQ"},
      {"WQ of UZ", [](Choice c) { c.own.WQ = c.own.UZ = 1, c.own.OL = c.own.SZ = 0; }, "own step uz trans WQ"},
      {"WQ of nothing", [](Choice c) { c.own.WQ = 1, c.own.OL = c.own.UZ = c.own.SZ = 0; }, "own step trans"},
      {"WQ of OL", [](Choice c) { c.own.WQ = 1, c.own.WM = c.own.UZ = c.own.SZ = 0; }, "own step trans WQ"},
      {"PT", [](Choice c) { c.own.WQ = c.own.ADPTRadio = 1; }, "own step ol uz sz trans PT"},
      {"PT of SZ", [](Choice c) { c.own.WQ = c.own.ADPTRadio = 1, c.own.OL = c.own.UZ = 0; }, "own step sz trans PT"},
      {"neither AD nor PT", [](Choice c) { c.own.WQ = 1, c.own.ADPTRadio = 2; }, "own step ol uz sz trans"},
      {"colloids", [](Choice c) { c.quality.IncludeProcesses = 1, c.quality.ProcessType = 2; },
       "own step ol uz sz trans colloids"},
      {"processes off", [](Choice c) { c.quality.ProcessType = 2; }, "own step ol uz sz trans"},
      {"Kinetra", [](Choice c) { c.quality.IncludeProcesses = c.quality.ProcessType = 1; }, "own step ol uz sz trans"},
      {"Surfact", [](Choice c) { c.basics.ModelType = 1; }, "mod trans periods solver packages output"},
      {"Surfact with WQ", [](Choice c) { c.basics.ModelType = c.own.WQ = 1; },
       "mod trans periods solver packages output"},
      {"Modflow 96", [](Choice c) { c.basics.ModelType = 2; }, "trans periods solver packages output"},
      {"Modflow 2000", [](Choice c) { c.basics.ModelType = 3; }, "trans periods solver packages output"},
      {"Modflow without subsurface", [](Choice c) { c.basics.ModelType = 3, c.modflow.Subsurface = 0; },
       "trans periods solver output"},
      {"unknown engine", [](Choice c) { c.basics.ModelType = 4; }, "trans periods"}};
  for (const Case& c : cases) {
    TestSetup setup;
    c.choose(Choice(setup));
    std::string used;
    for (const char* node : nodes)
      if (setup.IsUsed(SplitAtArrow(node).second)) used += (used.empty() ? "" : " ") + SplitAtArrow(node).first;
    EXPECT_EQ(used, c.used) << c.what;
    for (const char* always : {"FlowModelDocVersion", "ViewSettings", "CIntroductionKvf", "Overlays", "SimSpec",
                               "SimSpec/SimTitle", "ExtraParams", "ModelCompWQ/WQTSC", "SimSpec/SimulationPeriod"})
      EXPECT_TRUE(setup.IsUsed(always)) << c.what << always;
  }
}

TEST(ModelComponents, AirFlowTakesPartOnlyWithSurfactInAVariablySaturatedSubsurface) {
  for (int engine = 0; engine <= 4; ++engine) {
    for (const auto& [subsurface, type] : {std::pair{0, 3}, {1, 0}, {1, 1}, {1, 2}, {1, 3}, {1, 4}}) {
      TestSetup setup(
          fmt::format("section SimSpec {{\nModelType = {}\nsection ModModelComp {{\nSubsurface = {}\n"
                      "Subsurface_ModelType = {}\n}}\n}}",
                      engine, subsurface, type));
      EXPECT_EQ(setup.IsUsed("SimSpec/AirFlowSimulationParametersMod"), engine == 1 && subsurface && type == 3);
    }
  }
}

TEST(ModelComponents, ANodeBelowOneThatTakesNoPartHasItsFlagOffInTheFile) {
  TestSetup setup;
  EXPECT_EQ(setup.Written("ModelCompWQ/SimTitleWQ:IsDataUsedInSetup"), "0");
  EXPECT_EQ(setup.Written("SimSpec/ModelComp:IsDataUsedInSetup"), "1");
  Choice(setup).own.WQ = 1;
  EXPECT_EQ(setup.Written("ModelCompWQ/SimTitleWQ:IsDataUsedInSetup"), "1");
  EXPECT_EQ(setup.Written("ModelCompWQ/ColloidControlPara:IsDataUsedInSetup"), "0");
}

TEST(ModelComponents, TheTypeOfSubsurfaceFlowFollowsEngineAndFlags) {
  struct Case {
    int engine;
    const char *type, *written;
    int rewetting, airFlow, variablySaturated;  ///< After asking.
  };
  const Case cases[] = {{1, "", "1", 1, 0, 0},   {1, "0", "0", 0, 0, 0},  {1, "1", "1", 1, 0, 0},
                        {1, "2", "2", 1, 0, 1},  {1, "3", "3", 1, 1, 1},  {1, "7", "2", 1, 0, 1},
                        {1, "-1", "1", 1, 0, 0}, {2, "", "1", 1, 0, 0},   {2, "0", "0", 0, 0, 0},
                        {2, "3", "1", 1, 1, 1},  {3, "2", "1", 1, 0, 1},  {0, "3", "3", 1, 1, 1},
                        {0, "9", "9", 1, 0, 1},  {4, "-7", "-7", 1, 0, 0}};
  for (const Case& c : cases) {
    const std::string key = *c.type ? std::string("Subsurface_ModelType = ") + c.type : "";
    TestSetup setup("section SimSpec {\nModelType = " + std::to_string(c.engine) + "\nsection ModModelComp {\n" + key +
                    "\n}\n}");
    EXPECT_EQ(setup.Written("SimSpec/ModModelComp:Subsurface_ModelType"), c.written) << c.engine << ' ' << key;
    const CModModelCompKvf& node = Choice(setup).modflow;
    EXPECT_EQ((std::array{node.WithCellRewetting, node.WithAirFlow, node.VariablySaturated}),
              (std::array{c.rewetting, c.airFlow, c.variablySaturated}))
        << key;
  }

  TestSetup setup("section SimSpec {\nModelType = 1\nsection ModModelComp {\nSubsurface_ModelType = 3\n}\n}");
  CModModelCompKvf& node = Choice(setup).modflow;
  node.WithAirFlow = 0;
  EXPECT_EQ(node.GetSubsurfaceModelType(), 2);
  Choice(setup).basics.ModelType = 3;
  node.WithCellRewetting = 0;
  EXPECT_EQ(node.GetSubsurfaceModelType(), 0);
  Choice(setup).basics.ModelType = 1;  // What was asked for was stored.
  node.WithAirFlow = 1;
  EXPECT_EQ(node.GetSubsurfaceModelType(), 0);
  node.ReadData(nullptr);  // An absent key reads as 1.
  EXPECT_EQ(node.GetSubsurfaceModelType(), 1);
}

TEST(ModelComponents, OnlyTwoEnginesHideTheRechargeTypeAndTheHeldOneStays) {
  TestSetup setup("section SimSpec {\nModelType = 3\nsection ModModelComp {\nRecharge_ModelType = 1\n}\n}");
  for (const auto& [engine, written] : {std::pair{0, "1"}, {1, "1"}, {2, "0"}, {3, "0"}, {4, "1"}, {1, "1"}}) {
    Choice(setup).basics.ModelType = engine;
    EXPECT_EQ(setup.Written("SimSpec/ModModelComp:Recharge_ModelType"), written) << engine;
  }
}

TEST(ModelComponents, TheOverviewShowsTheComponentsAndNotTheEngine) {
  TestSetup setup;
  std::vector<OverviewLine> lines;
  EXPECT_EQ(Choice(setup).basics.AddToOverview(lines, 1), 1);
  EXPECT_EQ(setup.Root().AddToOverview(lines, 0), 1);
  EXPECT_THAT(lines, IsEmpty());
  EXPECT_EQ(Choice(setup).own.AddToOverview(lines, 0), 1);
  EXPECT_EQ(Replaced(OverviewText(lines), "\r\n      ", "; "),
            "PAGE: Simulation specification; ET = 1; OL = 1; SZ = 1; UZ = 1; WM = 1; River = 0; WQ = 0; "
            "UZ_ModelType = 2; SZ_ModelType = 0; OL_ModelType = 0\r\n");
}

TEST(ModelComponents, WaterQualityOfATwoLayerUnsaturatedZoneIsAnError) {
  struct Case {
    int wq, uz, uzModelType, qualityUz;
    bool isError;
  };
  const Case cases[] = {{1, 1, 2, 1, true},  {0, 1, 2, 1, false}, {1, 0, 2, 1, false},
                        {1, 1, 0, 1, false}, {1, 1, 1, 1, false}, {1, 1, 2, 0, false}};
  for (const Case& c : cases) {
    TestSetup setup;
    const Choice choice(setup);
    choice.own.WQ = c.wq;
    choice.own.UZ = c.uz;
    choice.own.UZ_ModelType = c.uzModelType;
    choice.quality.UZ = c.qualityUz;
    EXPECT_EQ(choice.quality.Validate(), !c.isError);
    ASSERT_EQ(choice.quality.Findings().size(), c.isError ? 1U : 0U);
    if (c.isError) {
      EXPECT_EQ(choice.quality.Findings()[0].text,
                "UZ Water Quality is only allowed for the Richards Equation and Gravity flow methods.");
    }
    EXPECT_EQ(choice.quality.ValidateData(), 1);
  }
}

}  // namespace
}  // namespace tervane::model_components_test
