// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/compare_view.h"

#include <QPushButton>

#include <gmock/gmock.h>

#include "shell/difference_list.h"
#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"

namespace tervane::compare_view_test {
namespace {

using test::OpenedSetup;

TEST(CompareView, AValueIsTakenFromTheOtherSetupAndUndoTakesItBack) {
  OpenedSetup setup("section SimSpec {\nsection SimTitle {\nTitle = \"mine\"\n}\n}");
  DocumentFrame& frame = setup.Frame();
  const std::string other = setup.Folder().Write(
      "other.tvd",
      test::SetupText(14,
                      "section SimSpec {\nModelType = 1\nsection SimTitle {\nTitle = \"theirs\"\n}\n}\n"
                      "section ExtraParams {\nNoOfParams = 1\nsection ExtraParam_1 {\nName = \"x\"\n}\n}"));
  ASSERT_TRUE(setup.Window().CompareWith(frame, other));
  auto* tabs = setup.Window().findChild<QTabWidget*>();
  auto* view = qobject_cast<CompareView*>(tabs->currentWidget());
  ASSERT_TRUE(view);
  EXPECT_EQ(tabs->tabText(tabs->currentIndex()), "karup.tvd and other.tvd");
  auto* list = view->findChild<DifferenceList*>();
  const auto button = [&](const QString& text) {
    for (QPushButton* each : view->findChildren<QPushButton*>())
      if (QString(each->text()).remove('&') == text) return each;
    return static_cast<QPushButton*>(nullptr);
  };
  const auto choose = [&](const QString& text) {
    const auto rows = list->findItems(text, Qt::MatchExactly | Qt::MatchRecursive);
    EXPECT_FALSE(rows.isEmpty()) << FromQt(text);
    if (!rows.isEmpty()) list->setCurrentItem(rows.back());
  };
  choose("Title");
  EXPECT_EQ(list->currentItem()->text(2), "\"mine\"");
  EXPECT_EQ(list->currentItem()->text(3), "\"theirs\"");
  ASSERT_TRUE(button("Take This")->isEnabled());
  button("Take This")->click();
  const auto value = [&frame](const char* path) { return test::ValueOf(frame.Session().Document(), path); };
  EXPECT_EQ(value("SimSpec/SimTitle:Title"), "theirs");
  EXPECT_TRUE(list->findItems("Title", Qt::MatchExactly | Qt::MatchRecursive).isEmpty());
  EXPECT_EQ(frame.Session().Steps().UndoName(), "Take Title of other.tvd");
  choose("ExtraParams/ExtraParam_1");
  EXPECT_EQ(list->currentItem()->text(2), "not there");
  button("Take This")->click();
  EXPECT_EQ(value("ExtraParams/ExtraParam_1:Name"), "x");
  EXPECT_EQ(frame.Session().Steps().UndoName(), "Take ExtraParams/ExtraParam_1 of other.tvd");
  frame.Undo();
  // What brings other nodes brings their entries in the tree.
  choose("ModelType");
  button("Take This")->click();
  EXPECT_EQ(value("SimSpec:ModelType"), "1");
  choose("NoOfParams");
  button("Show on Its Page")->click();
  EXPECT_EQ(tabs->currentWidget(), &frame);
  EXPECT_EQ(frame.CurrentPath(), "ExtraParams");
  setup.Frame().Undo();
  setup.Frame().Undo();
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "mine");
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/SimTitle");
  // What has changed meanwhile is seen when the tab is.
  tabs->setCurrentWidget(view);
  EXPECT_FALSE(list->findItems("Title", Qt::MatchExactly | Qt::MatchRecursive).isEmpty());
  const test::NextAnswer refused("OK");
  EXPECT_FALSE(setup.Window().CompareWith(frame, setup.Folder().Write("none.tvd", "no setup")));
  // The tab goes with that of its setup.
  tabs->setCurrentWidget(&frame);
  setup.Command("Close");
  EXPECT_EQ(setup.Window().findChild<CompareView*>(), nullptr);
}

}  // namespace
}  // namespace tervane::compare_view_test
