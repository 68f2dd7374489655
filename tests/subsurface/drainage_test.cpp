// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/drainage.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "subsurface/saturated_zone.h"
#include "tests/simspec/test_setup.h"

namespace tervane {
namespace {

using test::TestSetup;

TEST(Drainage, TheOptionDecidesWhichMapsTakePart) {
  TestSetup setup;
  auto& zone = setup.At<CSatZoneKvf>("SaturatedZone");
  auto& drainage = setup.At<CDrainageSZKvf>("SaturatedZone/Drainage");
  EXPECT_FALSE(setup.IsUsed("SaturatedZone/Drainage"));
  zone.Drainage = 1;
  EXPECT_TRUE(setup.IsUsed("SaturatedZone/Drainage"));
  EXPECT_FALSE(setup.IsUsed("SaturatedZone/Drainage_Modflow"));
  for (const auto& [option, used] : {std::pair(0, "Level"),
                                     {1, "Level TimeConstant"},
                                     {2, "Level TimeConstant DrainCode"},
                                     {3, "Level TimeConstant DrainCode DistributedOptionCode"},
                                     {4, "Level TimeConstant"}}) {
    drainage.SetOption(option);
    std::string names;
    for (const char* name : {"Level", "TimeConstant", "DrainCode", "DistributedOptionCode"})
      if (setup.IsUsed(fmt::format("SaturatedZone/Drainage/{}", name)))
        names += (names.empty() ? "" : " ") + std::string(name);
    EXPECT_EQ(names, used) << option;
  }
  setup.At<CBasicParaKvf>("SimSpec").ModelType = kEngineModflow96;
  EXPECT_FALSE(setup.IsUsed("SaturatedZone/Drainage"));
  EXPECT_TRUE(setup.IsUsed("SaturatedZone/Drainage_Modflow"));
}

TEST(Drainage, SetupsBelowVersion8KeepTheOptionInTheSaturatedZone) {
  const struct {
    int version;
    const char* zone;  ///< Keys of the saturated zone.
    int drainage, option;
  } cases[] = {
      {7, "DrainageOption = 3", 1, 3},  {7, "DrainageOption = 0", 0, 1}, {7, "Drainage = 1", 0, 1},
      {-1, "DrainageOption = 2", 1, 2}, {8, "Drainage = 1", 1, 4},       {14, "DrainageOption = 3", 0, 4},
  };
  for (const auto& c : cases) {
    TestSetup setup(
        fmt::format("section SaturatedZone {{\n{}\nsection Drainage {{\nDrainageOption = 4\n}}\n}}", c.zone),
        c.version);
    EXPECT_EQ(setup.Written("SaturatedZone:Drainage"), std::to_string(c.drainage)) << c.version << c.zone;
    EXPECT_EQ(setup.Written("SaturatedZone/Drainage:DrainageOption"), std::to_string(c.option)) << c.version << c.zone;
    EXPECT_EQ(setup.Written("SaturatedZone:DrainageOption"), "");
  }
}

TEST(Drainage, ModflowDrainsAreANamedList) {
  TestSetup setup(
      "section SaturatedZone {\nsection Drainage_Modflow {\nNumberOfLayers = 3\nsection Drainage_Modflow_2 {\n"
      "Name = \"North\"\nsection Level {\nFixedValue = 5f\n}\n}\n}\n}");
  auto& drains = setup.At<CDrainageMFSZKvf>("SaturatedZone/Drainage_Modflow");
  ASSERT_EQ(drains.GetItemCount(), 3);
  EXPECT_EQ(drains.GetItem(1)->Name, "Drain");
  EXPECT_EQ(drains.GetItem(2)->GetAbbreviatedTitle(), "North");
  EXPECT_EQ(setup.WrittenKeys("SaturatedZone/Drainage_Modflow"), "YbSEKvfListItemCount=3 NumberOfLayers=3");
  EXPECT_EQ(setup.Written("SaturatedZone/Drainage_Modflow/Drainage_Modflow_2/Level:FixedValue"), "5f");
  EXPECT_EQ(setup.Root().Important(kDrainTimeConstant)->GetParent(), drains.GetItem(3));
  drains.DeleteItem(3, 1);
  ASSERT_NE(setup.Root().Important(kDrainTimeConstant), nullptr);
  EXPECT_EQ(setup.Root().Important(kDrainTimeConstant)->GetParent(), drains.GetItem(2));
}

}  // namespace
}  // namespace tervane
