// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/saturated_zone.h"

#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "tests/simspec/test_setup.h"

namespace tervane {
namespace {

TEST(SaturatedZone, TakesPartByTheComponentsOfTheEngine) {
  test::TestSetup setup;
  auto& zone = setup.At<CSatZoneKvf>("SaturatedZone");
  auto& basics = setup.At<CBasicParaKvf>("SimSpec");
  auto& own = setup.At<CModelCompKvf>("SimSpec/ModelComp");
  auto& modflow = setup.At<CModModelCompKvf>("SimSpec/ModModelComp");
  struct {
    int engine, isOn, method, subsurface;
    bool takesPart;
  } constexpr cases[] = {
      {kEngineTervane, 1, kFiniteDifferenceSaturated, 0, true},      {kEngineTervane, 1, kLinearReservoir, 1, false},
      {kEngineTervane, 0, kFiniteDifferenceSaturated, 1, false},     {kEngineModflow96, 0, kLinearReservoir, 1, true},
      {kEngineModflow2000, 1, kFiniteDifferenceSaturated, 0, false},
  };
  for (const auto& c : cases) {
    basics.ModelType = c.engine;
    own.SZ = c.isOn;
    own.SZ_ModelType = c.method;
    modflow.Subsurface = c.subsurface;
    EXPECT_EQ(zone.IsDlgUsedInSetup() != 0, c.takesPart) << c.engine << c.isOn << c.method;
  }
}

}  // namespace
}  // namespace tervane
