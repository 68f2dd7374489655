// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/overland.h"

#include <functional>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "simspec/control_parameters.h"
#include "simspec/model_components.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/split_at_arrow.h"

namespace tervane::overland_test {
namespace {

using test::SplitAtArrow;
using test::TestSetup;

/// A setup with what decides.
struct Choice {
  TestSetup setup;
  COverlandKvf& overland = setup.At<COverlandKvf>("Overland");
  CPondedDrainageKvf& drainage = setup.At<CPondedDrainageKvf>("Overland/Drainage");
  CBasicParaKvf& basics = setup.At<CBasicParaKvf>("SimSpec");
  CModelCompKvf& own = setup.At<CModelCompKvf>("SimSpec/ModelComp");
  CModModelCompKvf& modflow = setup.At<CModModelCompKvf>("SimSpec/ModModelComp");
  CModelCompWQKvf& quality = setup.At<CModelCompWQKvf>("ModelCompWQ");
  CCompControlParaOLKvf& control = setup.At<CCompControlParaOLKvf>("SimSpec/CompControlParaOL");

  void Reduce() { overland.OverlandGroundWaterExchangeOption = overland.ReducedPavedLeakage = 1; }
  void ReduceWherePonded() {
    Reduce();
    overland.ReducedPavedLeakage = 0;
    overland.SpecifyOnlyReducedContactInPonded = control.SolverOption = control.Multicell = 1;
  }
  void Drain(int option) {
    overland.Drainage = 1;
    drainage.DrainageOption = option;
  }
};

TEST(Overland, ComponentsAndSwitchesDecideWhatTakesPart) {
  constexpr const char* nodes[] = {"flow => Overland",
                                   "water => Overland/Manning",
                                   "water => Overland/DetentionStorage",
                                   "water => Overland/InitialWaterDepth",
                                   "leak => Overland/LeakageCoeff",
                                   "ponded => Overland/OnlyReducedContactInPonded",
                                   "areas => Overland/SeparatedFlowAreas",
                                   "X => Overland/DispersionCoeff_X",
                                   "Y => Overland/DispersionCoeff_Y",
                                   "paved => Overland/PavedAreaFraction",
                                   "drains => Overland/Drainage",
                                   "rate => Overland/Drainage/MaxStorageChangeRate",
                                   "runoff => Overland/Drainage/DrRunoffCoefficient",
                                   "level => Overland/Drainage/Level",
                                   "codes => Overland/Drainage/DrainCode",
                                   "options => Overland/Drainage/DistributedOptionCode",
                                   "zones => OverlandSubcatchment"};
  const struct {
    const char* what;
    std::function<void(Choice&)> choose;
    const char* used;
  } cases[] = {
      {"new", [](Choice&) {}, "flow water water water"},
      {"without OL", [](Choice& c) { c.own.OL = 0, c.overland.SeparatedFlowAreas = 1; }, ""},
      {"without WM", [](Choice& c) { c.own.WM = 0; }, "flow"},
      {"by subcatchments", [](Choice& c) { c.own.OL_ModelType = 1, c.Reduce(); }, "zones"},
      {"Modflow", [](Choice& c) { c.basics.ModelType = 1; }, ""},
      {"Modflow with OL", [](Choice& c) { c.basics.ModelType = 2, c.modflow.OL = 1; }, "flow water water water"},
      {"separated areas", [](Choice& c) { c.overland.SeparatedFlowAreas = 1; }, "flow water water water areas"},
      {"reduced exchange", [](Choice& c) { c.Reduce(); }, "flow water water water leak paved"},
      {"without a reduced exchange", [](Choice& c) { c.overland.ReducedPavedLeakage = 1; }, "flow water water water"},
      {"no exchange without ground", [](Choice& c) { c.Reduce(), c.own.UZ = c.own.SZ = 0; },
       "flow water water water paved"},
      {"exchange with SZ", [](Choice& c) { c.Reduce(), c.own.UZ = 0; }, "flow water water water leak paved"},
      {"no exchange with reservoirs", [](Choice& c) { c.Reduce(), c.own.UZ = 0, c.own.SZ_ModelType = 1; },
       "flow water water water paved"},
      {"where ponded", [](Choice& c) { c.ReduceWherePonded(); }, "flow water water water leak ponded"},
      {"by another solver", [](Choice& c) { c.ReduceWherePonded(), c.control.SolverOption = 0; },
       "flow water water water leak"},
      {"without multicells", [](Choice& c) { c.ReduceWherePonded(), c.control.Multicell = 0; },
       "flow water water water leak"},
      {"dispersion", [](Choice& c) { c.own.WQ = c.quality.OL = 1; }, "flow water water water X Y"},
      {"no water quality", [](Choice& c) { c.quality.OL = 1; }, "flow water water water"},
      {"downhill", [](Choice& c) { c.Drain(1); }, "flow water water water drains runoff level"},
      {"by codes", [](Choice& c) { c.Drain(2); }, "flow water water water drains runoff level codes"},
      {"distributed", [](Choice& c) { c.Drain(3); }, "flow water water water drains runoff level codes options"},
      {"removed", [](Choice& c) { c.Drain(4), c.drainage.SpecifyMaxStorageChangeRate = 1; },
       "flow water water water drains rate runoff level"},
  };
  for (const auto& c : cases) {
    Choice choice;
    c.choose(choice);
    std::string used;
    for (const char* node : nodes)
      if (choice.setup.At<CYbSEKvfBase>(SplitAtArrow(node).second).IsDataUsedInSetup())
        used += (used.empty() ? "" : " ") + SplitAtArrow(node).first;
    EXPECT_EQ(used, c.used) << c.what;
  }
}

TEST(Overland, AKeyAndASectionMayBearOneName) {
  TestSetup setup(
      "section Overland {\nSeparatedFlowAreas = 1\nDrainage = 1\nsection SeparatedFlowAreas {\n"
      "FixedValue = 7f\n}\nsection Drainage {\nDrainageOption = 3\n}\nsection OnlyReducedContactInPonded {\n"
      "DistributionType = 0\nType = 2\n}\n}");
  EXPECT_TRUE(setup.Report().IsEmpty());
  EXPECT_EQ(setup.WrittenKeys("Overland"),
            "SeparatedFlowAreas=1 OverlandGroundWaterExchangeOption=0 SpecifyOnlyReducedContactInPonded=0 "
            "ReducedPavedLeakage=0 Drainage=1");
  EXPECT_EQ(setup.Written("Overland/SeparatedFlowAreas:FixedValue"), "7f");
  EXPECT_EQ(setup.WrittenKeys("Overland/Drainage"), "GradientCheck=1 SpecifyMaxStorageChangeRate=0 DrainageOption=3");
  EXPECT_EQ(setup.WrittenKeys("Overland/OnlyReducedContactInPonded"), "DistributionType=0 Type=2 ShapeAxisUnit=1000");
  EXPECT_EQ(setup.Written("Overland/Drainage/Level:RelativeToGround"), "1");
}

TEST(Overland, AMapOfAreasAsksForTheFileThatItUses) {
  for (const auto& [distribution, type, expected] :
       {std::tuple{0, 0, ""}, {0, 1, ""}, {1, 0, "grid"}, {1, 1, "shape"}}) {
    Choice choice;
    choice.ReduceWherePonded();
    auto& areas = choice.setup.At<CPondedWaterExchangeKvf>("Overland/OnlyReducedContactInPonded");
    areas.DistributionType = distribution;
    areas.Type = type;
    EXPECT_EQ(areas.Validate(), *expected == 0);
    EXPECT_EQ(areas.GridFile().Findings().size(), std::string_view(expected) == "grid" ? 1U : 0U);
    EXPECT_EQ(areas.ShapeFile().Findings().size(), std::string_view(expected) == "shape" ? 1U : 0U);
  }
}

TEST(Overland, SetupsBelowVersion14KeepPavedAreasInTheLandUse) {
  const std::string landUse =
      "section LandUse {\nPaved = 1\nSpecifyMaxPavedStorageChangeRate = 1\nsection MaxPavedStorageChangeRate {\n"
      "FixedValue = 3f\n}\nsection PavedRunoffCoefficient {\nType = 1\nFixedValue = 0.5f\n}\n}\n";
  const std::string both = landUse + "section Overland {\nDrainage = 0\nsection Drainage {\nGradientCheck = 1\n}\n}";
  const std::string own =
      "section Overland {\nDrainage = 1\nsection Drainage {\nsection DrRunoffCoefficient {\n"
      "FixedValue = 0.25f\n}\n}\n}";
  const struct {
    const char* what;
    int version;
    std::string sections;
    const char *drains, *keys, *rate, *runoff;
  } cases[] = {
      {"none", -1, both, "1", "GradientCheck=0 SpecifyMaxStorageChangeRate=1 DrainageOption=1", "3f", "0.5f"},
      {"the last old one", 13, both, "1", "GradientCheck=0 SpecifyMaxStorageChangeRate=1 DrainageOption=1", "3f",
       "0.5f"},
      {"old without land use", 8, own, "0", "GradientCheck=0 SpecifyMaxStorageChangeRate=0 DrainageOption=1", "10f",
       "0.25f"},
      {"the first new one", 14, own, "1", "GradientCheck=1 SpecifyMaxStorageChangeRate=0 DrainageOption=1", "10f",
       "0.25f"},
      {"new with a land use", 14, both, "0", "GradientCheck=1 SpecifyMaxStorageChangeRate=0 DrainageOption=1", "10f",
       "1f"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    const TestSetup setup(c.sections, c.version);
    EXPECT_EQ(setup.Written("Overland:Drainage"), c.drains);
    EXPECT_EQ(setup.WrittenKeys("Overland/Drainage"), c.keys);
    EXPECT_EQ(setup.Written("Overland/Drainage/MaxStorageChangeRate:FixedValue"), c.rate);
    EXPECT_EQ(setup.Written("Overland/Drainage/DrRunoffCoefficient:FixedValue"), c.runoff);
  }
}

TEST(Overland, ZonesKeepTheirValuesByTheirOrder) {
  const std::string zones =
      "section OverlandSubcatchment {\nNO_ZONES = 2\nsection TopographicalRouting {\nGRIDCODEID = \"4\"\n"
      "Name = \"Slope\"\n}\nsection TopographicalRouting {\nGRIDCODEID = \"x\"\nSlope = 0.3f\n}\n}";
  TestSetup setup(zones);
  EXPECT_TRUE(setup.Report().IsEmpty());
  EXPECT_EQ(setup.WrittenKeys("OverlandSubcatchment/TopographicalRouting#2"),
            "ProfileSecNumber=2 GRIDCODEID=\"x\" GRIDCODE=0 Name=\"\" Slope=0.3f ManningNb=10f InitialDepth=0f "
            "DetentionStorage=0f SlopeLength=100f");
  EXPECT_EQ(setup.At<CTopographicalRoutingPropKvf>("OverlandSubcatchment/TopographicalRouting").GetAbbreviatedTitle(),
            "Slope");
}

}  // namespace
}  // namespace tervane::overland_test
