// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/merge_view.h"

#include <QComboBox>
#include <QTableWidget>

#include <gmock/gmock.h>

#include "platform/files.h"
#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"

namespace tervane::merge_view_test {
namespace {

using test::OpenedSetup;

std::string Titled(const std::string& title, const std::string& description) {
  return "section SimSpec {\nsection SimTitle {\nTitle = \"" + title + "\"\nDescription = \"" + description +
         "\"\n}\n}";
}

TEST(MergeView, TheChosenSideOfAConflictIsSavedAndTheSetupIsReadAnew) {
  OpenedSetup setup(Titled("mine", "old"));
  const std::string base = setup.Folder().Write("base.tvd", test::SetupText(14, Titled("first", "old")));
  const std::string theirs = setup.Folder().Write("theirs.tvd", test::SetupText(14, Titled("theirs", "new")));
  auto* tabs = setup.Window().findChild<QTabWidget*>();
  const std::string mine = setup.Frame().Session().Path();
  ASSERT_TRUE(setup.Window().MergeWith(setup.Frame(), theirs, base));
  auto* view = qobject_cast<MergeView*>(tabs->currentWidget());
  ASSERT_TRUE(view);
  EXPECT_EQ(tabs->tabText(tabs->currentIndex()), "Merge of karup.tvd and theirs.tvd");
  auto* table = view->findChild<QTableWidget*>();
  ASSERT_EQ(table->rowCount(), 1);
  const auto text = [table](int column) { return table->item(0, column)->text(); };
  EXPECT_EQ(text(0), "SimSpec/SimTitle:Title");
  EXPECT_EQ(text(1) + text(2) + text(3), "\"first\"\"mine\"\"theirs\"");
  auto* take = qobject_cast<QComboBox*>(table->cellWidget(0, 4));
  EXPECT_EQ(take->currentText(), "Mine");
  EXPECT_EQ(take->count(), 3);
  view->Take(0, MergeSide::Theirs);
  QApplication::processEvents();
  EXPECT_EQ(qobject_cast<QComboBox*>(table->cellWidget(0, 4))->currentText(), "Theirs");
  ASSERT_TRUE(view->SaveTo(mine));
  for (int i = 0; i < 5; ++i) QApplication::processEvents();
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "theirs");
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Description"), "new") << "what only they have changed";
}

TEST(MergeView, AFileThatHasChangedIsMergedAgainBeforeItIsSaved) {
  OpenedSetup setup(Titled("mine", "old"));
  const std::string base = setup.Folder().Write("base.tvd", test::SetupText(14, Titled("first", "old")));
  const std::string theirs = setup.Folder().Write("theirs.tvd", test::SetupText(14, Titled("theirs", "new")));
  NobodyToAsk host;
  MergeView view({base, setup.Frame().Session().Path(), theirs}, host);
  setup.Folder().Write("theirs.tvd", test::SetupText(14, Titled("other theirs", "newer")));
  const std::string out = setup.Folder().File("merged.tvd");
  EXPECT_FALSE(view.SaveTo(out));
  EXPECT_FALSE(FileExists(out));
  EXPECT_EQ(view.Conflicts().front().theirs, "\"other theirs\"");
  EXPECT_TRUE(view.SaveTo(out));
  EXPECT_THAT(test::ReadFile(out), testing::HasSubstr("\"newer\""));
}

TEST(MergeView, WhatCannotBeMergedIsToldAndLeavesEverything) {
  OpenedSetup setup(Titled("mine", "old"));
  const std::string old = setup.Folder().Write("old.tvd", test::SetupText(10, Titled("first", "old")));
  const std::string theirs = setup.Folder().Write("theirs.tvd", test::SetupText(14, Titled("theirs", "new")));
  auto* tabs = setup.Window().findChild<QTabWidget*>();
  test::NextAnswer seen("OK");
  EXPECT_FALSE(setup.Window().MergeWith(setup.Frame(), theirs, old));
  EXPECT_THAT(seen.Text(), testing::HasSubstr("different document versions (10, 14 and 14)"));
  EXPECT_EQ(tabs->count(), 1);
}

}  // namespace
}  // namespace tervane::merge_view_test
