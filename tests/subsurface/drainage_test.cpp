// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/drainage.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "core/undo.h"
#include "simspec/basic_parameters.h"
#include "subsurface/saturated_zone.h"
#include "tests/simspec/test_setup.h"

namespace tervane::drainage_test {
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
}

TEST(Drainage, TheDrainThatWasMadeLastAnswersWhateverHappensToTheOthers) {
  // What is done, and behind each the drain that answers, by its name. New drains are called A, B, C, ...
  constexpr auto kNobody = "-";
  struct Step {
    const char* what;
    int number = 0;
    const char* answers;
  };
  const std::vector<Step> cases[] = {
      {{"insert", 0, "A"}, {"delete", 1, kNobody}, {"undo", 0, "A"}, {"undo", 0, kNobody}, {"redo", 0, "A"}},
      // In front of another one it is still the last that was made.
      {{"insert", 0, "A"}, {"insert", 1, "B"}, {"delete", 2, "B"}, {"undo", 0, "B"}, {"delete", 1, "A"}},
      {{"insert", 0, "A"}, {"insert", 1, "B"}, {"delete", 1, "A"}, {"undo", 0, "B"}, {"redo", 0, "A"}},
      {{"insert", 0, "A"}, {"insert", 0, "B"}, {"insert", 1, "C"}, {"undo", 0, "B"}, {"undo", 0, "A"}},
      {{"insert", 0, "A"}, {"insert", 0, "B"}, {"up", 2, "B"}, {"delete", 1, "A"}, {"undo", 0, "B"}},
      {{"insert", 0, "A"}, {"insert", 0, "B"}, {"clear", 0, kNobody}, {"insert", 0, "C"}, {"undo", 0, kNobody}},
      // One that only looks as if it came.
      {{"insert", 0, "A"}, {"make and drop", 0, "A"}, {"delete", 1, kNobody}, {"make and drop", 0, kNobody}},
  };
  for (const auto& steps : cases) {
    TestSetup setup;
    auto& drains = setup.At<CDrainageMFSZKvf>("SaturatedZone/Drainage_Modflow");
    UndoStack undo(setup.Root());
    char next = 'A';
    std::string done;
    for (const Step& step : steps) {
      const std::string_view what = step.what;
      done += fmt::format(" {} {}", what, step.number);
      const int before = drains.GetItemCount();
      if (what == "insert") step.number > 0 ? drains.InsertItem(step.number, 1) : drains.AddItemNode();
      if (what == "delete") drains.DeleteItem(step.number, 1);
      if (what == "clear") drains.SetItemCount(0, 1);
      if (what == "up") drains.MoveItemUp(step.number, 1);
      if (what == "make and drop") drains.NewItemNode();
      if (what == "undo") undo.Undo();
      if (what == "redo") undo.Redo();
      if (what == "insert" && drains.GetItemCount() > before)
        drains.GetItem(step.number > 0 ? step.number : drains.GetItemCount())->Name = next++;
      undo.Commit(step.what);
      const auto* answering = setup.Root().Important(kDrainTimeConstant);
      const auto* drain = answering ? dynamic_cast<CDrainageMFSZItemKvf*>(answering->GetParent()) : nullptr;
      EXPECT_EQ(drain ? drain->Name : kNobody, step.answers) << done;
      EXPECT_TRUE(!drain || drains.GetNumberWhatIs(drain) > 0) << done;
    }
  }
}

}  // namespace
}  // namespace tervane::drainage_test
