// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/saturated_zone.h"

#include <gmock/gmock.h>

#include "core/kvf.h"
#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "subsurface/wells.h"
#include "tests/simspec/test_setup.h"

namespace tervane::saturated_zone_test {
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

TEST(SaturatedZone, TellsAViewerOfScenesOfItsWells) {
  const auto told = [](CSatZoneKvf& zone, bool isDone) {
    KvfFile* file = kvfCreate();
    kvfAddTarget(file, "Scene");
    std::string error, text, problem;
    EXPECT_EQ(zone.AddWellOverlaySection(file, error), isDone);
    EXPECT_EQ(error, isDone ? "" : "Missing data for saturated zone. Well file is not specified");
    kvfEndSection(file);
    EXPECT_TRUE(WriteKvfText(*file, text, problem)) << problem;
    kvfClose(&file);
    return text;
  };
  test::TestSetup setup;
  auto& zone = setup.At<CSatZoneKvf>("SaturatedZone");
  EXPECT_EQ(told(zone, true), "target Scene {\n}\n");
  zone.Wells = 1;
  EXPECT_NE(told(zone, false).find("section Wells {"), std::string::npos);
  setup.At<CSZWellKvf>("SaturatedZone/Well").Filename = FileName("a.WEL", "/setups");
  const std::string text = told(zone, true);
  EXPECT_NE(text.find("WellFileName = file \"/setups/a.WEL\"\n    LabelVisible = 1\n    FilterStartAngle = 0"),
            std::string::npos)
      << text;
}

TEST(SaturatedZone, IsTheSubsurfaceWithAModflowEngine) {
  test::TestSetup setup;
  auto& zone = setup.At<CSatZoneKvf>("SaturatedZone");
  for (const auto& [engine, title] : {std::pair{kEngineTervane, "Saturated Zone"},
                                      {kEngineModflowSurfact, "Subsurface"},
                                      {kEngineModflow2000, "Subsurface"}}) {
    setup.At<CBasicParaKvf>("SimSpec").ModelType = engine;
    EXPECT_EQ(zone.GetTitle(), title);
  }
}

}  // namespace
}  // namespace tervane::saturated_zone_test
