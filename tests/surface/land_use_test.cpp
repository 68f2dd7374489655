// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/land_use.h"

#include <functional>

#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "tests/simspec/test_setup.h"

namespace tervane::land_use_test {
namespace {

using test::TestSetup;

TEST(LandUse, ComponentsDecideWhatTakesPartAndWhetherIrrigationIsPossible) {
  const struct {
    const char* what;
    std::function<void(CModelCompKvf&)> choose;
    bool landUse, vegetation, irrigation;
    int engine = kEngineTervane;
  } cases[] = {
      {"new", [](CModelCompKvf&) {}, true, true, true},
      {"without ET", [](CModelCompKvf& c) { c.ET = 0; }, true, false, false},
      {"without UZ", [](CModelCompKvf& c) { c.UZ = 0; }, true, true, false},
      {"without UZ and SZ", [](CModelCompKvf& c) { c.UZ = c.SZ = 0; }, false, false, false},
      {"without UZ and OL", [](CModelCompKvf& c) { c.UZ = c.OL = 0; }, false, false, false},
      {"without UZ, OL by subcatchment", [](CModelCompKvf& c) { c.UZ = 0, c.OL_ModelType = 1; }, false, false, false},
      {"UZ alone", [](CModelCompKvf& c) { c.OL = c.SZ = 0; }, true, true, true},
      {"Modflow", [](CModelCompKvf&) {}, false, false, false, kEngineModflow2000},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    TestSetup setup;
    auto& landUse = setup.At<CLandUseKvf>("LandUse");
    landUse.Irrigation = 1;
    setup.At<CBasicParaKvf>("SimSpec").ModelType = c.engine;
    c.choose(setup.At<CModelCompKvf>("SimSpec/ModelComp"));
    EXPECT_EQ(landUse.IsDataUsedInSetup(), c.landUse);
    EXPECT_EQ(setup.At<CYbSEKvfBase>("LandUse/Vegetation").IsDataUsedInSetup(), c.vegetation);
    EXPECT_EQ(landUse.IsIrrigationPossible(), c.irrigation);
    // What was chosen stays.
    EXPECT_EQ(setup.Written("LandUse:Irrigation"), "1");
  }
}

TEST(LandUse, PrioritiesAreCountedFromOneInTheFile) {
  TestSetup without("section LandUse {\nIrrigation = 1\n}"), with("section LandUse {\nPriorities = 3\n}");
  EXPECT_EQ(without.At<CLandUseKvf>("LandUse").Priorities, CLandUseKvf::kNoPriorities);
  EXPECT_EQ(with.At<CLandUseKvf>("LandUse").Priorities, CLandUseKvf::kEqualVolume);
  EXPECT_EQ(without.WrittenKeys("LandUse"), "Irrigation=1 Priorities=1");
  EXPECT_EQ(with.WrittenKeys("LandUse"), "Irrigation=0 Priorities=3");
}

}  // namespace
}  // namespace tervane::land_use_test
