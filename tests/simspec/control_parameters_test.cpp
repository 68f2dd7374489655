// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/control_parameters.h"

#include <gmock/gmock.h>

#include "tests/simspec/test_setup.h"

namespace tervane {
namespace {

using test::kNoVersion;
using test::TestSetup;

TEST(ControlParameters, ANewSetupHasTheDefaultsOfAllSolversInTheOrderOfTheFile) {
  TestSetup setup;
  struct Case {
    const char* section;
    const char* keys;
  };
  for (const Case& c :
       {Case{"SimSpec/CompControlParaOL",
             "SolverOption=0 MaxNoOfIter=200 MaxHeadChange=1e-4f MaxResidualError=1e-4f RelaxFactor=0.9f "
             "MaxCourant_Explicit=0.8f WaterDepthThreshold=1e-4f OLFlowReductionGradientThreshold=1e-4f "
             "OLRiverExchangeOption=0 WeirFlowReductionDepthThreshold=0.1f Multicell=0 MulticellFactor=2f"},
        {"SimSpec/CompControlParaUZ",
         "MaxWaterBalanceError=0.03f MaxNoOfIter=50 IterStopCriteria=0.002f CouplingCriteria=0.001f"},
        {"SimSpec/CompControlParaSZ", "SolverOption=0"},
        {"SimSpec/CompControlParaSZ/CompControlParaSZPCGTrans",
         "MaxNoOfIter=50 GradualDrainActivation=1 MaxHeadChange=0.005f HorizontalConductanceAveraging=1 "
         "MaxResidualError=5e-4f SatThicknessThreshold=0.05f UnderRelaxFactor=0.99f UnderRelaxation=0"},
        {"SimSpec/CompControlParaSZ/CompControlParaSZPCGSteady",
         "MaxNoOfIter=1000 GradualDrainActivation=1 MaxHeadChange=0.001f HorizontalConductanceAveraging=1 "
         "MaxResidualError=1e-5f SatThicknessThreshold=0.05f UnderRelaxFactor=0.2f UnderRelaxation=1"},
        {"SimSpec/CompControlParaSZ/CompControlParaSZSOR",
         "MaxNoOfIter=200 MaxHeadChange=0.001f MaxResidualError=1e-4f SatThicknessThreshold=0.05f "
         "OverRelaxFactor=1.3f"},
        {"SimSpec/CompControlParaSZ/CompControlParaRivEx", "MaxFractionHPointVolume=0.9f"},
        {"SimSpec/AirFlowSimulationParametersMod",
         "DensityWater=1000f DensityAir=1.777f ViscosityWater=0.001f ViscosityAir=1.983e-5f "
         "CompressibilityWater=1e-8f CompressibilityAir=1.777e-5f StdAtmPressure=1010f GravityAcceleration=9.81f "
         "TypeAmbientWaterHeadInput=0"},
        {"ModelCompWQ/ColloidControlPara",
         "ConversionFactor=0.7 MaxPrecDepthPerTimeStep=1.0 PrecThresholdRate=0.1 FractionTransportedParticle=1.0 "
         "WaterDepthCorr=1.0 DetachmentModel=2 ErosionModel=2 IncludeSorption=0"}})
    EXPECT_EQ(setup.WrittenKeys(c.section), c.keys) << c.section;
}

TEST(ControlParameters, BeforeVersion10OverlandFlowHadThreeParameters) {
  const std::string keys =
      "section SimSpec {\nsection CompControlParaOL {\nSolverOption = 1\nMaxNoOfIter = 9\nIterStopCriteria = 0.01f\n"
      "MaxHeadChange = 2f\nMaxResidualError = 3f\nRelaxFactor = 4f\nMaxCourant_Explicit = 5f\nWaterDepthThreshold = "
      "6f\n"
      "OLFlowReductionGradientThreshold = 7f\nOLRiverExchangeOption = 1\nWeirFlowReductionDepthThreshold = 8f\n"
      "Multicell = 1\nMulticellFactor = 9f\n}\n}";
  const char* old =
      "SolverOption=0 MaxNoOfIter=9 MaxHeadChange=0.01f MaxResidualError=1e-4f RelaxFactor=0.9f "
      "MaxCourant_Explicit=0.8f WaterDepthThreshold=6f OLFlowReductionGradientThreshold=1e-4f "
      "OLRiverExchangeOption=0 WeirFlowReductionDepthThreshold=0.1f Multicell=0 MulticellFactor=2f";
  const char* current =
      "SolverOption=1 MaxNoOfIter=9 MaxHeadChange=2f MaxResidualError=3f RelaxFactor=4f MaxCourant_Explicit=5f "
      "WaterDepthThreshold=6f OLFlowReductionGradientThreshold=7f OLRiverExchangeOption=1 "
      "WeirFlowReductionDepthThreshold=8f Multicell=1 MulticellFactor=9f";
  for (const auto& [version, written] :
       {std::pair{kNoVersion, old}, {6, old}, {7, old}, {9, old}, {10, current}, {14, current}})
    EXPECT_EQ(TestSetup(keys, version).WrittenKeys("SimSpec/CompControlParaOL"), written) << version;
}

TEST(ControlParameters, ValuesOutsideTheirRangesAreKeptAndNotRefused) {
  TestSetup setup("section SimSpec {\nsection CompControlParaUZ {\nMaxNoOfIter = -5\nIterStopCriteria = -1f\n}\n}");
  EXPECT_EQ(setup.Written("SimSpec/CompControlParaUZ:MaxNoOfIter"), "-5");
  EXPECT_EQ(setup.Written("SimSpec/CompControlParaUZ:IterStopCriteria"), "-1f");
  EXPECT_EQ(setup.Root().Validate(), 1);
}

}  // namespace
}  // namespace tervane
