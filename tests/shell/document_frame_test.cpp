// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/document_frame.h"

#include <QCheckBox>
#include <QTreeWidget>

#include <gmock/gmock.h>

#include "shell/find_panel.h"
#include "shell/findings_view.h"
#include "shell/node_tree.h"
#include "tests/shell/opened_setup.h"

namespace tervane {
namespace {

using test::OpenedSetup;

constexpr const char* kWaterQualityTooEarly =
    "section SimSpec {\nsection ModelComp {\nWQ = 1\n}\n}\n"
    "section ModelCompWQ {\nsection SimulationPeriodWQ {\nSimStart = 1999, 12, 31, 0, 0\n}\n}";

TEST(DocumentFrame, AFindingLeadsToTheControlThatItSpeaksOf) {
  OpenedSetup setup(kWaterQualityTooEarly);
  auto* findings = setup.Frame().findChild<FindingsView*>();
  ASSERT_EQ(findings->Count(), 2);  // the other one is the domain, which has no file
  setup.Command("Next Finding");
  EXPECT_EQ(setup.Frame().CurrentPath(), "ModelCompWQ/SimulationPeriodWQ");
  EXPECT_EQ(setup.Focused<QLineEdit>()->text(), "1999/12/31  00:00");
  setup.Type("2000/01/01");
  setup.Press(Qt::Key_Return);
  EXPECT_EQ(findings->Count(), 1);
  setup.Command("Undo Change Start Date");
  EXPECT_EQ(findings->Count(), 2);
}

TEST(DocumentFrame, ANodeThatLeavesTheSetupGivesItsPlaceToTheNearestAbove) {
  OpenedSetup setup(kWaterQualityTooEarly);
  setup.GoTo("SimSpec:WQ");
  setup.Focused<QCheckBox>()->click();
  EXPECT_EQ(setup.Value("SimSpec/ModelComp:WQ"), "0");
  EXPECT_FALSE(setup.Frame()
                   .findChild<NodeTree*>()
                   ->findItems("Water Quality Simulation Period", Qt::MatchExactly | Qt::MatchRecursive)
                   .size());
  setup.Frame().Undo();
  setup.GoTo("ModelCompWQ/SimulationPeriodWQ");
  setup.Frame().Redo();
  EXPECT_NE(setup.Frame().CurrentPath(), "ModelCompWQ/SimulationPeriodWQ");
  EXPECT_FALSE(setup.Frame().CurrentPath().empty());
}

TEST(DocumentFrame, FindListsPlacesLabelsAndKeysAndLeadsThere) {
  OpenedSetup setup;
  setup.Command("Find…");
  setup.Type("increment");
  setup.Press(Qt::Key_Return);
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/CompControlParaTimeStep");
  EXPECT_EQ(setup.Focused<QLineEdit>()->text(), "0.05");
  setup.Command("Find…");
  setup.Type("nothing like this");
  EXPECT_TRUE(setup.Shows("Nothing found"));
  setup.Press(Qt::Key_Escape);
  EXPECT_FALSE(setup.Shows("Nothing found"));
}

TEST(DocumentFrame, BackAndForwardGoAmongTheVisitedNodes) {
  OpenedSetup setup;
  for (const char* path : {"SimSpec", "SimSpec/SimTitle", "ExtraParams"}) setup.GoTo(path);
  setup.Command("Back");
  setup.Command("Back");
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec");
  setup.Command("Forward");
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/SimTitle");
  setup.GoTo("Overlays");
  EXPECT_FALSE(setup.Frame().CanGo(1));
  setup.Command("Copy Path");
  EXPECT_EQ(QApplication::clipboard()->text(), "Overlays");
}

TEST(DocumentFrame, UndoTakesBackWhatAnyPageChangedAndTheTitleTells) {
  OpenedSetup setup;
  setup.GoTo("SimSpec/SimTitle:Title");
  setup.Type("Karup");
  setup.Press(Qt::Key_Return);
  EXPECT_EQ(setup.Frame().Title(), "karup.tvd *");
  // The field has the keyboard, and nothing is left in it that it could take back itself.
  setup.Press(Qt::Key_Z, Qt::ControlModifier);
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "");
  EXPECT_EQ(setup.Frame().Title(), "karup.tvd");
  EXPECT_EQ(setup.Focused<QLineEdit>()->text(), "");
}

}  // namespace
}  // namespace tervane
