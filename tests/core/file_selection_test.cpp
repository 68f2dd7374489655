// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/file_selection.h"

#include <gmock/gmock.h>

#include "core/kvf_parser.h"
#include "core/kvf_writer.h"

namespace tervane::file_selection_test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

/// Loads the node from a target with that section and gives the section as it is saved.
std::string LoadAndSave(CYbSEKvfBase& node, std::string_view section) {
  KvfFile* file = kvfCreate();
  file->folder = "/data";
  EXPECT_TRUE(ParseKvf(FileContent::Of(section), *file)) << file->syntaxError.message;
  node.Load(kvfTargetByNum(file, 1));
  EXPECT_THAT(CollectUnread(*file), IsEmpty());
  kvfClose(&file);
  KvfFile* saved = kvfCreate();
  saved->folder = "/data";
  kvfAddTarget(saved, "T");
  node.Save(saved);
  std::string text;
  AppendKvfNodes(*AsSection(saved->top.firstChild), 0, text);
  kvfClose(&saved);
  return text;
}

TEST(FileSelection, KeepsTheFileAndTheChosenItems) {
  CYbSEKvfGlobalBase root("T");
  auto* grid = root.NewChild<YbSENdsSelection>("", "NDS");
  const std::string text =
      "section NDS {\n  Touched = 0\n  FILE_NAME = file \"maps\\\\a.nds2\"\n  ITEM_COUNT = 2\n  ITEM_NUMBERS = 3, "
      "1\n}\n";
  EXPECT_EQ(LoadAndSave(*grid, "target T {\n" + text + "}"), text);
  EXPECT_EQ(grid->File.Absolute(), "/data/maps/a.nds2");
  EXPECT_THAT(grid->Items, ElementsAre(3, 1));
  EXPECT_EQ(grid->ItemNumber(1), 1);
  EXPECT_EQ(grid->ItemNumber(2), 0);

  auto* shape = root.NewChild<YbSEShpSelection>("", "SHP");
  const std::string named =
      "section SHP {\n  Touched = 0\n  FILE_NAME = file \"\"\n  ITEM_COUNT = 1\n  ITEM_NUMBERS = \"a name\"\n}\n";
  EXPECT_EQ(LoadAndSave(*shape, "target T {\n" + named + "}"), named);
  EXPECT_EQ(shape->ItemDescr(0), "a name");
}

TEST(FileSelection, TakesNoMoreItemsThanAreCountedAndNoneOfAnotherType) {
  const struct {
    const char* keys;
    std::vector<int> items;
  } cases[] = {{"ITEM_COUNT = 1\nITEM_NUMBERS = 4, 5\n", {4}},
               {"ITEM_COUNT = 3\nITEM_NUMBERS = 4, 5\n", {4, 5}},
               {"ITEM_COUNT = 0\nITEM_NUMBERS =\n", {}},
               {"ITEM_COUNT = 1\nITEM_NUMBERS = \"x\"\n", {7}},
               {"", {7}}};
  for (const auto& c : cases) {
    CYbSEKvfGlobalBase root("T");
    auto* grid = root.NewChild<YbSENdsSelection>("", "NDS");
    grid->Items = {7};
    LoadAndSave(*grid, std::string("target T {\nsection NDS {\n") + c.keys + "}\n}");
    EXPECT_EQ(grid->Items, c.items) << c.keys;
  }
}

}  // namespace
}  // namespace tervane::file_selection_test
