// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/model_components.h"

#include <functional>
#include <set>

#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "tests/simspec/test_setup.h"

namespace tervane {
namespace {

using test::TestSetup;
using testing::ElementsAre;
using testing::IsEmpty;

/// The nodes that decide.
struct Choice {
  explicit Choice(TestSetup& setup)
      : basics(setup.At<CBasicParaKvf>("SimSpec")),
        own(setup.At<CModelCompKvf>("SimSpec/ModelComp")),
        modflow(setup.At<CModModelCompKvf>("SimSpec/ModModelComp")),
        quality(setup.At<CModelCompWQKvf>("ModelCompWQ")) {}
  CBasicParaKvf& basics;
  CModelCompKvf& own;
  CModModelCompKvf& modflow;
  CModelCompWQKvf& quality;
};

TEST(ModelComponents, ANewSetupHasTheOwnEngineWithoutRiversAndWaterQuality) {
  TestSetup setup;
  EXPECT_EQ(setup.Written("SimSpec:ModelType"), "0");
  EXPECT_EQ(setup.WrittenKeys("SimSpec/ModelComp"),
            "ET=1 OL=1 SZ=1 UZ=1 WM=1 River=0 WQ=0 ADPTRadio=0 UZ_ModelType=2 SZ_ModelType=0 OL_ModelType=0 "
            "UseCurrentWmSimulation=1 FilenameTvdRes=file \"\"");
  EXPECT_EQ(setup.WrittenKeys("SimSpec/ModModelComp"),
            "OL=0 River=0 RiverModelType=0 Recharge=0 Recharge_ModelType=0 Subsurface=1 Subsurface_ModelType=1 "
            "Modflow2000_BCFType=1 ET=0");
  EXPECT_EQ(setup.WrittenKeys("ModelCompWQ"), "OL=0 River=0 UZ=0 PlantUptake=0 SZ=0 IncludeProcesses=0 ProcessType=0");
  EXPECT_EQ(setup.WrittenKeys("ModelCompPT"),
            "InitDensityRadio=1 ParticleMass=100.0 InitLocationRadio=0 DistanceFracFromBottom=0.5 "
            "AvoidInitParticlesInFixedCells=0 AvoidInitParticlesAboveWaterTable=1 RegistrationZoneRadio=0 "
            "AutomaticWellRegistration=1");
  EXPECT_THAT(setup.Report().unread, IsEmpty());
}

TEST(ModelComponents, TheyDecideWhichNodesTakePart) {
  // A path goes by its last section; the nodes that always take part are not listed, but checked.
  const std::string control = "SimSpec/CompControlPara";
  const std::set<std::string> always = {
      "FlowModelDocVersion", "ViewSettings",      "CIntroductionKvf",        "Overlays", "SimSpec", "SimSpec/SimTitle",
      "ExtraParams",         "ModelCompWQ/WQTSC", "SimSpec/SimulationPeriod"};
  const std::set<std::string> own = {"SimSpec/ModelComp", control + "TimeStep"};
  const std::string ol = control + "OL", uz = control + "UZ", sz = control + "SZ", modComp = "SimSpec/ModModelComp",
                    air = "SimSpec/AirFlowSimulationParametersMod", transient = sz + "/CompControlParaSZPCGTrans",
                    steady = sz + "/CompControlParaSZPCGSteady", overrelaxation = sz + "/CompControlParaSZSOR",
                    exchange = sz + "/CompControlParaRivEx", colloids = "ModelCompWQ/ColloidControlPara";
  const std::set<std::string> others = {
      "ExecuteEngineFlagsKvf", "Overview", "ModelCompWQ", "ModelCompPT", modComp, ol, uz, sz, air, transient, steady,
      overrelaxation,          exchange,   colloids};
  const auto join = [](std::set<std::string> to, const std::set<std::string>& more) {
    to.insert(more.begin(), more.end());
    return to;
  };
  struct Case {
    const char* what;
    std::function<void(Choice)> choose;
    std::set<std::string> used;  ///< Beside those that always take part.
  };
  const Case cases[] = {
      {"new", [](Choice) {}, join(own, {ol, uz, sz, transient})},
      {"without OL", [](Choice c) { c.own.OL = 0; }, join(own, {uz, sz, transient})},
      {"OL by subcatchment", [](Choice c) { c.own.OL_ModelType = 1; }, join(own, {uz, sz, transient})},
      {"without UZ", [](Choice c) { c.own.UZ = 0; }, join(own, {ol, sz, transient})},
      {"without SZ", [](Choice c) { c.own.SZ = 0; }, join(own, {ol, uz, transient})},
      {"SZ as reservoirs", [](Choice c) { c.own.SZ_ModelType = 1; }, join(own, {ol, uz, transient})},
      {"without WM", [](Choice c) { c.own.WM = 0; }, join(own, {transient})},
      {"with river", [](Choice c) { c.own.River = 1; }, join(own, {ol, uz, sz, transient, exchange})},
      {"WQ", [](Choice c) { c.own.WQ = 1; }, join(own, {ol, uz, sz, transient, "ModelCompWQ"})},
      {"WQ of UZ alone", [](Choice c) { c.own.WQ = c.own.UZ = 1, c.own.OL = c.own.SZ = 0; },
       join(own, {uz, transient, "ModelCompWQ"})},
      {"WQ of nothing", [](Choice c) { c.own.WQ = 1, c.own.OL = c.own.UZ = c.own.SZ = 0; }, join(own, {transient})},
      {"WQ of OL without WM", [](Choice c) { c.own.WQ = 1, c.own.WM = c.own.UZ = c.own.SZ = 0; },
       join(own, {transient, "ModelCompWQ"})},
      {"PT", [](Choice c) { c.own.WQ = c.own.ADPTRadio = 1; }, join(own, {ol, uz, sz, transient, "ModelCompPT"})},
      {"PT of SZ alone", [](Choice c) { c.own.WQ = c.own.ADPTRadio = 1, c.own.OL = c.own.UZ = 0; },
       join(own, {sz, transient, "ModelCompPT"})},
      {"PT of nothing", [](Choice c) { c.own.WQ = c.own.ADPTRadio = 1, c.own.OL = c.own.UZ = c.own.SZ = 0; },
       join(own, {transient})},
      {"neither AD nor PT", [](Choice c) { c.own.WQ = 1, c.own.ADPTRadio = 2; }, join(own, {ol, uz, sz, transient})},
      {"colloids", [](Choice c) { c.quality.IncludeProcesses = 1, c.quality.ProcessType = 2; },
       join(own, {ol, uz, sz, transient, colloids})},
      {"processes off", [](Choice c) { c.quality.ProcessType = 2; }, join(own, {ol, uz, sz, transient})},
      {"Kinetra", [](Choice c) { c.quality.IncludeProcesses = c.quality.ProcessType = 1; },
       join(own, {ol, uz, sz, transient})},
      {"Surfact", [](Choice c) { c.basics.ModelType = 1; }, {modComp, transient}},
      {"Surfact with WQ", [](Choice c) { c.basics.ModelType = c.own.WQ = 1; }, {modComp, transient}},
      {"Surfact with air",
       [](Choice c) {
         c.basics.ModelType = 1;
         c.modflow.WithAirFlow = 1;
       },
       {modComp, transient}},
      {"Modflow 96", [](Choice c) { c.basics.ModelType = 2; }, {transient}},
      {"Modflow 2000", [](Choice c) { c.basics.ModelType = 3; }, {transient}},
      {"unknown engine", [](Choice c) { c.basics.ModelType = 4; }, {transient}}};
  for (const Case& c : cases) {
    TestSetup setup;
    c.choose(Choice(setup));
    std::set<std::string> used;
    for (const std::set<std::string>& paths : {always, own, others})
      for (const std::string& path : paths)
        if (setup.IsUsed(path)) used.insert(path);
    EXPECT_EQ(used, join(always, c.used)) << c.what;
  }
}

TEST(ModelComponents, TheSolverOfTheSaturatedZoneDecidesWhichOfItsNodesTakePart) {
  const std::string zone = "SimSpec/CompControlParaSZ/CompControlPara";
  for (const int river : {0, 1}) {
    for (int solver = 0; solver <= 3; ++solver) {
      TestSetup setup("section SimSpec {\nsection ModelComp {\nRiver = " + std::to_string(river) +
                      "\n}\nsection CompControlParaSZ {\nSolverOption = " + std::to_string(solver) + "\n}\n}");
      EXPECT_EQ(setup.IsUsed(zone + "SZPCGTrans"), solver == 0);
      EXPECT_EQ(setup.IsUsed(zone + "SZPCGSteady"), solver == 1);
      EXPECT_EQ(setup.IsUsed(zone + "SZSOR"), solver == 2);
      EXPECT_EQ(setup.IsUsed(zone + "RivEx"), solver != 1 && river);
    }
  }
}

TEST(ModelComponents, AirFlowTakesPartOnlyWithSurfactInAVariablySaturatedSubsurface) {
  for (int engine = 0; engine <= 4; ++engine) {
    for (const int subsurface : {0, 1}) {
      for (int type = 0; type <= 4; ++type) {
        TestSetup setup("section SimSpec {\nModelType = " + std::to_string(engine) +
                        "\nsection ModModelComp {\nSubsurface = " + std::to_string(subsurface) +
                        "\nSubsurface_ModelType = " + std::to_string(type) + "\n}\n}");
        EXPECT_EQ(setup.IsUsed("SimSpec/AirFlowSimulationParametersMod"), engine == 1 && subsurface && type == 3);
      }
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
    const char* key;  ///< As read.
    const char* written;
    int rewetting, airFlow, variablySaturated;  ///< After asking.
  };
  const char* absent = "";
  for (const Case& c : {Case{1, absent, "1", 1, 0, 0},
                        {1, "Subsurface_ModelType = 0", "0", 0, 0, 0},
                        {1, "Subsurface_ModelType = 1", "1", 1, 0, 0},
                        {1, "Subsurface_ModelType = 2", "2", 1, 0, 1},
                        {1, "Subsurface_ModelType = 3", "3", 1, 1, 1},
                        {1, "Subsurface_ModelType = 7", "2", 1, 0, 1},
                        {1, "Subsurface_ModelType = -1", "1", 1, 0, 0},
                        {2, absent, "1", 1, 0, 0},
                        {2, "Subsurface_ModelType = 0", "0", 0, 0, 0},
                        {2, "Subsurface_ModelType = 3", "1", 1, 1, 1},
                        {3, "Subsurface_ModelType = 2", "1", 1, 0, 1},
                        {0, "Subsurface_ModelType = 3", "3", 1, 1, 1},
                        {0, "Subsurface_ModelType = 9", "9", 1, 0, 1},
                        {4, "Subsurface_ModelType = -7", "-7", 1, 0, 0}}) {
    TestSetup setup("section SimSpec {\nModelType = " + std::to_string(c.engine) + "\nsection ModModelComp {\n" +
                    c.key + "\n}\n}");
    EXPECT_EQ(setup.Written("SimSpec/ModModelComp:Subsurface_ModelType"), c.written) << c.engine << ' ' << c.key;
    const CModModelCompKvf& node = Choice(setup).modflow;
    EXPECT_EQ(node.WithCellRewetting, c.rewetting) << c.engine << ' ' << c.key;
    EXPECT_EQ(node.WithAirFlow, c.airFlow) << c.engine << ' ' << c.key;
    EXPECT_EQ(node.VariablySaturated, c.variablySaturated) << c.engine << ' ' << c.key;
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
  EXPECT_EQ(Choice(setup).own.AddToOverview(lines, 2), 1);
  std::vector<std::string> texts;
  for (const OverviewLine& line : lines) {
    EXPECT_EQ(line.title, "Simulation specification");
    EXPECT_EQ(line.level, 2);
    texts.push_back(line.text);
  }
  EXPECT_THAT(texts, ElementsAre("ET = 1", "OL = 1", "SZ = 1", "UZ = 1", "WM = 1", "River = 0", "WQ = 0",
                                 "UZ_ModelType = 2", "SZ_ModelType = 0", "OL_ModelType = 0"));
}

TEST(ModelComponents, WaterQualityOfATwoLayerUnsaturatedZoneIsAnError) {
  struct Case {
    int wq, uz, uzModelType, qualityUz;
    bool isError;
  };
  for (const Case& c : {Case{1, 1, 2, 1, true},
                        {0, 1, 2, 1, false},
                        {1, 0, 2, 1, false},
                        {1, 1, 0, 1, false},
                        {1, 1, 1, 1, false},
                        {1, 1, 2, 0, false}}) {
    TestSetup setup;
    const Choice choice(setup);
    choice.own.WQ = c.wq;
    choice.own.UZ = c.uz;
    choice.own.UZ_ModelType = c.uzModelType;
    choice.quality.UZ = c.qualityUz;
    EXPECT_EQ(setup.Root().Validate(), !c.isError);
    ASSERT_EQ(choice.quality.Findings().size(), c.isError ? 1U : 0U);
    if (c.isError) {
      EXPECT_EQ(choice.quality.Findings()[0].text,
                "UZ Water Quality is only allowed for the Richards Equation and Gravity flow methods.");
    }
    EXPECT_EQ(choice.quality.ValidateData(), 1);
  }
}

}  // namespace
}  // namespace tervane
