// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/main_window.h"

#include <QDir>
#include <QPushButton>
#include <QTabWidget>

#include <gmock/gmock.h>

#include "shell/widgets/theme.h"
#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"

namespace tervane {
namespace {

using test::NextAnswer;
using test::OpenedSetup;
using testing::HasSubstr;

QPushButton* ReloadButton(OpenedSetup& setup) {
  for (QPushButton* button : setup.Frame().findChildren<QPushButton*>())
    if (button->text() == "&Reload") return button;
  return nullptr;
}

TEST(MainWindow, RunCommandsFollowTheComponents) {
  OpenedSetup setup;
  QAction* quality = setup.Action("Water quality");
  EXPECT_FALSE(quality->isEnabled());
  EXPECT_FALSE(quality->isChecked());
  EXPECT_TRUE(setup.Action("Preprocessing")->isChecked());
  setup.Command("Preprocessing");
  EXPECT_FALSE(setup.Action("Preprocessing")->isChecked());
  EXPECT_EQ(setup.Value("ExecuteEngineFlagsKvf:PP"), "0");
  EXPECT_EQ(setup.Session().Steps().UndoName(), "Change Preprocessing");

  OpenedSetup withQuality(
      "section SimSpec {\nsection ModelComp {\nWQ = 1\n}\n}\nsection ExecuteEngineFlagsKvf {\nWQ = 1\n}");
  EXPECT_TRUE(withQuality.Action("Water quality")->isEnabled());
  EXPECT_TRUE(withQuality.Action("Water quality")->isChecked());
}

TEST(MainWindow, RefreshMarksTheDocumentModified) {
  OpenedSetup setup;
  setup.Command("Refresh");
  EXPECT_TRUE(setup.Session().IsModified());
  EXPECT_FALSE(setup.Session().Steps().CanUndo());
}

TEST(MainWindow, WithoutAUserAMessageIsPrintedAndNothingWaits) {
  OpenedSetup setup;
  setup.Window().SetUnattended();
  const NextAnswer box("OK");
  EXPECT_FALSE(setup.Window().OpenFile("/missing/karup.tvd"));
  EXPECT_EQ(box.Text(), "");
}

TEST(MainWindow, MarksInTheTreeAreShownAsTheSetupSays) {
  OpenedSetup setup("section ViewSettings {\nShowValidationIcons = 0\n}");
  EXPECT_FALSE(setup.Action("Show Validation Icons")->isChecked());
  setup.Command("Show Validation Icons");
  EXPECT_EQ(setup.Value("ViewSettings:ShowValidationIcons"), "1");
}

TEST(MainWindow, ClosingAsksForChangesAndLosesNoneUnasked) {
  for (const char* answer : {"Cancel", "Save", "Discard"}) {
    SCOPED_TRACE(answer);
    OpenedSetup setup;
    setup.GoTo("SimSpec/SimTitle:Title");
    setup.Type("Karup");  // still in the field
    const std::string before = test::ReadFile(setup.Path());
    const NextAnswer next(answer);
    EXPECT_EQ(setup.Window().CloseDocument(&setup.Frame()), std::string(answer) != "Cancel");
    EXPECT_THAT(next.Text(), HasSubstr("karup.tvd"));
    const std::string after = test::ReadFile(setup.Path());
    EXPECT_EQ(after != before, std::string(answer) == "Save");
    EXPECT_EQ(setup.Window().Frame() != nullptr, std::string(answer) == "Cancel");
    if (setup.Window().Frame()) {
      const NextAnswer throwAway("Discard");
      setup.Window().close();
    }
  }
}

TEST(MainWindow, AFileThatIsNoSetupIsRefusedWithItsReason) {
  OpenedSetup setup;
  const std::string broken = setup.Folder().Write("broken.tvd", "target TERVANE_FLOWMODEL {\n  Key = 12x\n}\n");
  const NextAnswer next("OK");
  EXPECT_FALSE(setup.Window().OpenDocument(ToQt(broken)));
  EXPECT_THAT(next.Text(), HasSubstr("broken.tvd:2:"));
}

TEST(MainWindow, OneFileIsOpenInOneTab) {
  OpenedSetup setup;
  setup.Window().NewDocument();
  DocumentFrame* untitled = &setup.Frame();
  EXPECT_TRUE(setup.Window().OpenDocument(ToQt(setup.Path())));
  EXPECT_NE(&setup.Frame(), untitled);
  EXPECT_EQ(setup.Window().findChild<QTabWidget*>()->count(), 2);
}

TEST(MainWindow, ASecondEditorOpensReadOnlyAndMaySaveElsewhere) {
  OpenedSetup first;
  Program program(ToQt(first.Folder().File("second/quarzel.ini")));
  MainWindow second(program);
  second.show();
  ASSERT_TRUE(second.OpenDocument(ToQt(first.Path())));
  EXPECT_TRUE(second.Frame()->Session().IsReadOnly());
  EXPECT_THAT(FromQt(second.Frame()->Title()), HasSubstr("read-only"));
  EXPECT_TRUE(second.Frame()->Save(first.Folder().File("copy.tvd")));
  EXPECT_FALSE(second.Frame()->Session().IsReadOnly());
}

TEST(MainWindow, AFileThatChangedOnDiskIsReadAgainOnRequest) {
  OpenedSetup setup;
  setup.Folder().Write("karup.tvd",
                       test::SetupText(14, "section SimSpec {\nsection SimTitle {\nTitle = \"other\"\n}\n}"));
  setup.Frame().CheckDisk();
  QPushButton* reload = ReloadButton(setup);
  ASSERT_TRUE(reload);
  reload->click();
  QApplication::processEvents();
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "other");
}

TEST(MainWindow, AFileThatBecameUnreadableTakesNothingAway) {
  OpenedSetup setup;
  const DocumentFrame* frame = &setup.Frame();
  setup.Folder().Write("karup.tvd", "no setup");
  setup.Frame().CheckDisk();
  QPushButton* reload = ReloadButton(setup);
  ASSERT_TRUE(reload);
  const NextAnswer answer("OK");
  reload->click();
  QApplication::processEvents();
  EXPECT_THAT(answer.Text(), HasSubstr("karup.tvd:1:"));
  EXPECT_EQ(setup.Window().Frame(), frame);
}

TEST(MainWindow, WhatACrashLeftIsOfferedOnlyWhileItsSetupIsOpenNowhere) {
  OpenedSetup setup;
  const std::string folder = setup.Program().RecoveryFolder();
  ASSERT_TRUE(QDir().mkpath(ToQt(folder)));
  AutosaveContent content;
  content.setup = setup.Path();
  content.process = RunningProcess::This();
  content.process.started = "earlier";
  content.text = test::SetupText(14, "section SimSpec {\nsection SimTitle {\nTitle = \"left\"\n}\n}");
  ASSERT_TRUE(WriteAutosave(NewAutosaveName(setup.Path(), folder), content).Ok());
  const NextAnswer answer("No");
  setup.Window().OfferRecoveries();
  EXPECT_EQ(answer.Text(), "");
  ASSERT_TRUE(setup.Window().CloseDocument(&setup.Frame()));
  setup.Window().OfferRecoveries();
  EXPECT_THAT(answer.Text(), HasSubstr(setup.Path()));
}

TEST(MainWindow, ZoomAndAppearanceKeepPageAndTypedTexts) {
  OpenedSetup setup;
  setup.GoTo("SimSpec/SimTitle:Title");
  setup.Type("Karup");
  setup.Command("Zoom In");
  setup.Command("Dark");
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/SimTitle");
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "Karup");
  EXPECT_TRUE(Theme::Get().IsDark());
  setup.Command("Actual Size");
  setup.Command("As the System");
}

}  // namespace
}  // namespace tervane
