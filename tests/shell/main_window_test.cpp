// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/main_window.h"

#include <QDir>
#include <QHash>
#include <QMenu>
#include <QMenuBar>
#include <QPushButton>
#include <QTabWidget>
#include <QTreeWidget>
#include <map>
#include <optional>

#include <gmock/gmock.h>

#include "shell/changes_dialog.h"
#include "shell/difference_list.h"
#include "shell/widgets/banner.h"
#include "shell/widgets/theme.h"
#include "tests/shell/all_windows.h"
#include "tests/shell/cut_texts.h"
#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"

namespace tervane::main_window_test {
namespace {

using test::NextAnswer;
using test::OpenedSetup;
using testing::HasSubstr;

QPushButton* ReloadButton(OpenedSetup& setup) {
  for (QPushButton* button : setup.Frame().findChildren<QPushButton*>())
    if (QString(button->text()).remove('&') == "Reload") return button;
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

TEST(MainWindow, RefreshMarksTheDocumentModifiedAndClosingAsksForNothing) {
  OpenedSetup setup;
  setup.Command("Refresh");
  EXPECT_TRUE(setup.Session().IsModified());
  EXPECT_FALSE(setup.Session().Steps().CanUndo());
  const NextAnswer asked("Cancel");
  EXPECT_TRUE(setup.Window().CloseDocument(&setup.Frame()));
  EXPECT_EQ(asked.Text(), "");
}

/// The letters that the texts of a menu mark, each with the text.
void CheckLetters(const QMenu& menu) {
  QHash<QChar, QString> letters;
  for (const QAction* action : menu.actions()) {
    if (action->isSeparator()) continue;
    const QString text = action->text();
    const auto mark = text.indexOf('&');
    EXPECT_GE(mark, 0) << "no letter: " << FromQt(text);
    if (mark < 0) continue;
    const QChar letter = text[mark + 1].toLower();
    EXPECT_FALSE(letters.contains(letter)) << FromQt(text) << " and " << FromQt(letters.value(letter));
    letters.insert(letter, text);
    if (action->menu() && action->menu()->title() != "Open &Recent") CheckLetters(*action->menu());
  }
}

TEST(MainWindow, EveryLetterMeansOneThing) {
  OpenedSetup setup;
  QMenu bar;
  for (QAction* action : setup.Window().menuBar()->actions()) bar.addAction(action);
  CheckLetters(bar);
  // What waits at the foot is chosen by letters too, which are none of the menus'.
  setup.Folder().Write("karup.tvd", test::SetupText(14, "section SimSpec {\nsection SimTitle {\nTitle = \"x\"\n}\n}"));
  setup.Frame().CheckDisk();
  int buttons = 0;
  for (const Banner* banner : setup.Frame().findChildren<Banner*>())
    for (const QPushButton* button : banner->findChildren<QPushButton*>()) {
      ++buttons;
      bar.addAction(button->text());
    }
  EXPECT_GE(buttons, 3);
  CheckLetters(bar);
}

TEST(MainWindow, NoWindowHasACutText) {
  const struct {
    double zoom;
    bool isLong;
  } cases[] = {{1, false}, {1.5, false}, {2, false}, {1, true}};
  for (const auto& [zoom, isLong] : cases) {
    std::optional<test::LongTexts> texts;
    if (isLong) texts.emplace();
    Theme::Get().SetZoom(zoom);
    int count = 0;
    test::LookAtAllWindows([&](const std::string& name, QWidget& window) {
      SCOPED_TRACE(name + " at " + std::to_string(zoom) + (isLong ? " with long texts" : ""));
      for (int i = 0; i < 3; ++i) QApplication::processEvents();
      EXPECT_EQ(test::CutTexts(window), "");
      if (qobject_cast<QMainWindow*>(&window)) {
        EXPECT_EQ(window.size(), QSize(1280, 800)) << "nothing makes the window larger than it was";
      }
      ++count;
    });
    EXPECT_GT(count, 25);
  }
  Theme::Get().SetZoom(1);
}

TEST(MainWindow, ReadFromTheRightDrawingsAndDataStayAsTheyAre) {
  QApplication::setLayoutDirection(Qt::RightToLeft);
  std::map<std::string, int> kept;
  test::LookAtAllWindows([&](const std::string& name, QWidget& window) {
    SCOPED_TRACE(name);
    for (int i = 0; i < 3; ++i) QApplication::processEvents();
    EXPECT_EQ(test::CutTexts(window), "");
    for (const QWidget* widget : window.findChildren<QWidget*>()) {
      if (!widget->isVisible()) continue;
      for (const char* drawn : {"tervane::MapCanvas", "QCustomPlot", "tervane::ReliefCanvas", "tervane::SetupText",
                                "tervane::LogView", "tervane::ValueTable"}) {
        if (!widget->inherits(drawn)) continue;
        ++kept[drawn];
        EXPECT_EQ(widget->layoutDirection(), Qt::LeftToRight) << drawn;
      }
      if (widget->inherits("tervane::NodeTree")) {
        EXPECT_EQ(widget->layoutDirection(), Qt::RightToLeft);
      }
    }
  });
  QApplication::setLayoutDirection(Qt::LeftToRight);
  EXPECT_EQ(kept.size(), 6U);
}

TEST(MainWindow, ReadFromTheRightAValueLooksAsItIsWritten) {
  const auto drawn = [](Qt::LayoutDirection direction) {
    DifferenceList list("On disk", "Will be saved");
    list.setLayoutDirection(direction);
    list.Show({{SetupDifference::Kind::Changed, "SimSpec", "SIMEND", "2015, 12, 31", "file \"dem.nds2\""}});
    list.resize(900, 200);
    list.show();
    std::vector<QImage> cells;
    for (const int column : {2, 3}) {
      QRect place = list.visualRect(list.model()->index(0, column, list.model()->index(0, 0)));
      // Within the cell it stands at its left or at its right.
      const QImage cell = list.viewport()->grab(place.adjusted(1, 1, -1, -1)).toImage();
      int left = cell.width(), right = 0;
      for (int x = 0; x < cell.width(); ++x)
        for (int y = 0; y < cell.height(); ++y)
          if (qGray(cell.pixel(x, y)) < 128) left = std::min(left, x), right = std::max(right, x);
      cells.push_back(cell.copy(left, 0, right - left + 1, cell.height()));
    }
    return cells;
  };
  const std::vector<QImage> fromLeft = drawn(Qt::LeftToRight);
  EXPECT_GT(fromLeft.front().width(), 40);
  EXPECT_EQ(drawn(Qt::RightToLeft), fromLeft);
}

TEST(MainWindow, AFileThatAnotherProgramChangedIsNotSavedOverWithoutALook) {
  const auto change = [](OpenedSetup& setup) {
    setup.GoTo("SimSpec/SimTitle:Title");
    setup.Type("mine");
    setup.Folder().Write("karup.tvd",
                         test::SetupText(14, "section SimSpec {\nsection SimTitle {\nTitle = \"theirs\"\n}\n}"));
  };
  {
    OpenedSetup setup;
    change(setup);
    // The key that confirms without a look cancels.
    QTimer::singleShot(50, [] { QTest::keyClick(QApplication::activeModalWidget(), Qt::Key_Return); });
    EXPECT_FALSE(setup.Window().SaveDocument());
    EXPECT_THAT(test::ReadFile(setup.Path()), HasSubstr("theirs"));
    const NextAnswer saveAs("Discard");
    setup.Window().CloseDocument(&setup.Frame());
  }
  {
    OpenedSetup setup;
    change(setup);
    {
      const NextAnswer reload("Reload");
      EXPECT_FALSE(setup.Window().SaveDocument());
      EXPECT_THAT(reload.Text(), HasSubstr("Another program has changed karup.tvd"));
    }
    const NextAnswer throwAway("Yes");
    QApplication::processEvents();
    EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "theirs");
  }
  {
    OpenedSetup setup;
    change(setup);
    const NextAnswer differences("Differences…");
    std::string shown;
    QTimer look;
    QObject::connect(&look, &QTimer::timeout, [&] {
      auto* dialog = qobject_cast<ChangesDialog*>(QApplication::activeModalWidget());
      if (!dialog) return;
      look.stop();
      for (const QTreeWidgetItem* row :
           dialog->findChild<QTreeWidget*>()->findItems("Title", Qt::MatchExactly | Qt::MatchRecursive))
        shown = FromQt(row->text(2) + " -> " + row->text(3));
      for (QPushButton* button : dialog->findChildren<QPushButton*>())
        if (button->text() == "&Save Over It") return button->click();
      ADD_FAILURE() << "no button to save over it";
      dialog->reject();
    });
    look.start(5);
    EXPECT_TRUE(setup.Window().SaveDocument());
    EXPECT_EQ(shown, "\"theirs\" -> \"mine\"");
    EXPECT_THAT(test::ReadFile(setup.Path()), HasSubstr("mine"));
  }
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
}  // namespace tervane::main_window_test
