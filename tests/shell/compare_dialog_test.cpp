// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/compare_dialog.h"

#include <QPushButton>

#include <gmock/gmock.h>

#include "shell/difference_list.h"
#include "tests/shell/opened_setup.h"

namespace tervane {
namespace {

using test::OpenedSetup;

TEST(CompareDialog, AValueIsTakenFromTheOtherSetupAndUndoTakesItBack) {
  OpenedSetup setup("section SimSpec {\nsection SimTitle {\nTitle = \"mine\"\n}\n}");
  auto other = std::make_unique<CFlowModelDoc>();
  ASSERT_TRUE(other->OpenText(
      test::SetupText(14,
                      "section SimSpec {\nModelType = 1\nsection SimTitle {\nTitle = \"theirs\"\n}\n}\n"
                      "section ExtraParams {\nNoOfParams = 1\nsection ExtraParam_1 {\nName = \"x\"\n}\n}"),
      "other.tvd"));
  CompareDialog dialog(setup.Session(), "karup.tvd", std::move(other), &setup.Window());
  dialog.show();
  auto* list = dialog.findChild<DifferenceList*>();
  const auto button = [&](const QString& text) {
    for (QPushButton* each : dialog.findChildren<QPushButton*>())
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
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "theirs");
  EXPECT_TRUE(list->findItems("Title", Qt::MatchExactly | Qt::MatchRecursive).isEmpty());
  EXPECT_EQ(setup.Session().Steps().UndoName(), "Take Title of other.tvd");
  // An item of a list that this setup has not got cannot be taken.
  choose("ExtraParams/ExtraParam_1");
  EXPECT_FALSE(button("Take This")->isEnabled());
  // What brings other nodes brings their entries in the tree.
  choose("ModelType");
  QString place;
  QObject::connect(&dialog, &CompareDialog::PlaceChosen, [&](const QString& path) { place = path; });
  button("Show on Its Page")->click();
  EXPECT_EQ(place, "SimSpec:ModelType");
  EXPECT_FALSE(dialog.isVisible());
  button("Take This")->click();
  EXPECT_EQ(setup.Value("SimSpec:ModelType"), "1");
  setup.Frame().Undo();
  setup.Frame().Undo();
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "mine");
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/SimTitle");
}

}  // namespace
}  // namespace tervane
