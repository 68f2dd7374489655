// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/open_setup.h"

#include <gmock/gmock.h>

#include "document/setup_lock.h"
#include "spatial/file_nodes.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::open_setup_test {
namespace {

using testing::HasSubstr;

CYbSEKvfBase& At(OpenSetup& setup, const std::string& path) {
  std::string problem;
  const OpenSetup::Place* place = setup.Find(path, problem);
  EXPECT_TRUE(place) << problem;
  return *place->node->Get();
}

std::vector<std::string> NamesOf(OpenSetup& setup, const std::string& path, const std::string& key) {
  std::vector<std::string> names;
  CYbSEKvfBase& list = At(setup, path);
  for (int number = 1; number <= list.GetChildCount(); ++number) {
    std::string problem;
    const KvfNode* name = setup.Keys().Find(*list.GetChild(number), {key, 1}, problem);
    names.emplace_back(name ? name->params[0].Text() : problem);
  }
  return names;
}

void Add(OpenSetup& setup, const std::string& path, const std::string& key, const std::string& name) {
  std::string problem;
  CYbSEKvfBase* item = setup.InsertItem(At(setup, path), 1 << 20, nullptr, problem);
  ASSERT_TRUE(item) << problem;
  EXPECT_EQ(setup.Keys().Set(*item, {key, 1}, name), "");
}

TEST(OpenSetup, ItemsAreAddedCopiedMovedAndRemoved) {
  OpenSetup setup;
  for (const char* name : {"a", "b", "c"}) Add(setup, "Species", "Name", name);
  EXPECT_THAT(NamesOf(setup, "Species", "Name"), testing::ElementsAre("a", "b", "c"));
  EXPECT_TRUE(setup.MoveItem(At(setup, "Species"), 1, 3));
  EXPECT_THAT(NamesOf(setup, "Species", "Name"), testing::ElementsAre("b", "c", "a"));
  EXPECT_TRUE(setup.MoveItem(At(setup, "Species"), 3, 1));
  EXPECT_FALSE(setup.MoveItem(At(setup, "Species"), 3, 4));
  std::string problem;
  EXPECT_TRUE(setup.InsertItem(At(setup, "Species"), 1, nullptr, problem)) << problem;
  EXPECT_TRUE(setup.RemoveItem(At(setup, "Species"), 1));
  EXPECT_FALSE(setup.RemoveItem(At(setup, "Species"), 4));
  EXPECT_THAT(NamesOf(setup, "Species", "Name"), testing::ElementsAre("a", "b", "c"));

  Add(setup, "ExtraParams", "Name", "x");
  CYbSEKvfBase& extra = At(setup, "ExtraParams");
  ASSERT_TRUE(setup.InsertItem(extra, 1, extra.GetChild(1), problem)) << problem;
  EXPECT_THAT(NamesOf(setup, "ExtraParams", "Name"), testing::ElementsAre("x", "x"));
  EXPECT_FALSE(setup.InsertItem(At(setup, "Species"), 9, extra.GetChild(1), problem));
  EXPECT_THAT(problem, HasSubstr("of another kind"));
  EXPECT_FALSE(setup.InsertItem(At(setup, "SimSpec/SimTitle"), 1, nullptr, problem));
  EXPECT_THAT(problem, HasSubstr("holds no items"));
}

TEST(OpenSetup, AHeldNodeIsKnownToBeGone) {
  OpenSetup setup;
  for (const char* name : {"a", "b"}) Add(setup, "Species", "Name", name);
  const auto first = setup.Hold(*At(setup, "Species").GetChild(1)),
             second = setup.Hold(*At(setup, "Species").GetChild(2));
  setup.RemoveItem(At(setup, "Species"), 1);
  EXPECT_FALSE(first->Get());
  EXPECT_EQ(second->Get(), At(setup, "Species").GetChild(1));
  Add(setup, "Species", "Name", "c");
  EXPECT_FALSE(first->Get());
  const auto held = setup.Hold(At(setup, "SimSpec/SimTitle"));
  EXPECT_TRUE(held->Get());
  EXPECT_FALSE(setup.Open("/no/such.tvd"));
  EXPECT_FALSE(held->Get());
}

TEST(OpenSetup, ACopyIsAlikeAndGoesItsOwnWay) {
  const test::TempFolder folder;
  OpenSetup setup;
  ASSERT_TRUE(setup.Open(folder.Write("a.tvd", test::SetupText(14, "")))) << setup.Error();
  std::string problem;
  OpenSetup copy;
  ASSERT_TRUE(setup.CopyTo(copy, problem)) << problem;
  EXPECT_EQ(copy.Document().PathName(), "");
  Add(copy, "Species", "Name", "a");
  EXPECT_EQ(At(setup, "Species").GetChildCount(), 0);
  EXPECT_FALSE(copy.Save(""));
  EXPECT_TRUE(copy.Save(folder.File("b.tvd"))) << copy.Error();
}

TEST(OpenSetup, ACopyOfWhatWasNeverSavedIsBoundToNoFolder) {
  const test::TempFolder folder;
  OpenSetup setup, copy;
  EXPECT_EQ(setup.Keys().Set(At(setup, "Topography/NDS_2D_DATA_FILE"), {"FILE_NAME", 1}, "dem.nds2"), "");
  std::string problem;
  ASSERT_TRUE(setup.CopyTo(copy, problem)) << problem;
  EXPECT_EQ(copy.Root().SetupFolder(), "");
  ASSERT_TRUE(copy.Save(folder.File("b.tvd"))) << copy.Error();
  CYbSEKvfBase& file = At(copy, "Topography/NDS_2D_DATA_FILE");
  EXPECT_EQ(dynamic_cast<DataFileNode&>(file).File.Absolute(), folder.File("dem.nds2"));
}

TEST(OpenSetup, NamesOfFilesStartFromTheFolderOfTheFirstSave) {
  const test::TempFolder folder;
  OpenSetup setup;
  CYbSEKvfBase& file = At(setup, "Topography/NDS_2D_DATA_FILE");
  EXPECT_EQ(setup.Keys().Set(file, {"FILE_NAME", 1}, "dem.nds2"), "");
  ASSERT_TRUE(setup.Save(folder.File("a.tvd"))) << setup.Error();
  EXPECT_EQ(dynamic_cast<DataFileNode&>(file).File.Absolute(), folder.File("dem.nds2"));
}

TEST(OpenSetup, WhatAnEditorHoldsIsNotSaved) {
  const test::TempFolder folder;
  const std::string path = folder.Write("a.tvd", test::SetupText(14, ""));
  OpenSetup setup;
  ASSERT_TRUE(setup.Open(path));
  SetupLock editor;
  ASSERT_EQ(editor.Take(path), SetupLock::Outcome::Taken);
  EXPECT_FALSE(setup.Save(""));
  EXPECT_THAT(setup.Error(), HasSubstr("it is open in another window"));
}

}  // namespace
}  // namespace tervane::open_setup_test
