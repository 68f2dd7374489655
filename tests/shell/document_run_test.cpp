// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/document_run.h"

#include <QProgressBar>
#include <QPushButton>
#include <QSignalSpy>
#include <QToolBar>
#include <QToolButton>

#include <gmock/gmock.h>

#include "execution/engine_search.h"
#include "platform/files.h"
#include "shell/findings_view.h"
#include "shell/log_view.h"
#include "shell/run_panel.h"
#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"
#include "tests/support/engine_script.h"

namespace tervane {
namespace {

using test::NextAnswer;
using test::OpenedSetup;
using testing::HasSubstr;
using testing::StartsWith;

/// A setup with an engine for it.
class RunOf : public OpenedSetup {
 public:
  explicit RunOf(const std::string& commands, std::string_view sections = {}) : OpenedSetup(sections) {
    Program().Settings().setValue(kEnginePathSetting, ToQt(Folder().File("engines")));
    test::WriteEngine(Folder(), "engines/Tvn_Simulation", commands);
  }

  DocumentRun& Run() { return Frame().Run(); }
  bool WaitForEnd() {
    const bool hasEnded = QTest::qWaitFor([&] { return !Run().IsExecuting(); }, 20'000);
    QApplication::processEvents();
    return hasEnded;
  }
  QStringList Log() {
    QStringList lines;
    for (std::size_t i = 0; i < Run().Log().Count(); ++i)
      lines << QString::fromStdString(std::string(Run().Log().Line(i)));
    return lines;
  }
  bool ShowsProgress() { return Window().findChild<RunWindow*>() != nullptr; }
  void ClickButton(const QString& toolTip, Qt::KeyboardModifiers modifiers) {
    for (QToolButton* button : Window().findChildren<QToolButton*>())
      if (button->isVisible() && button->toolTip() == toolTip) {
        const QPoint place = button->mapTo(&Window(), button->rect().center());
        return QTest::mouseClick(Window().windowHandle(), Qt::LeftButton, modifiers, place);
      }
    ADD_FAILURE() << "no button " << FromQt(toolTip);
  }
};

/// Waits until the test lets it go on.
constexpr const char* kWait = "\nwhile [ ! -e go ]; do sleep 0.02; done";

TEST(DocumentRun, SavesRunsAndLeadsFromAMessageToTheControl) {
  RunOf setup(
      "echo \"got $2, $(grep -c 'Title = .Karup' \"$1\")\"; echo 'error: SimSpec/SimTitle:Title: is odd'\n"
      "echo 'warning: Nowhere:Key: hm'; echo 'progress 42 half'" +
      std::string(kWait));
  setup.GoTo("SimSpec/SimTitle:Title");
  setup.Type("Karup");  // not entered yet
  QSignalSpy ended(&setup.Frame(), &DocumentFrame::RunEnded);
  setup.Command("Run water movement only");
  EXPECT_TRUE(setup.ShowsProgress());
  EXPECT_FALSE(setup.Action("Execute...")->isEnabled());
  EXPECT_TRUE(setup.Action("Run preprocessor only")->isEnabled());
  auto* bar = setup.Frame().findChild<QProgressBar*>();
  EXPECT_TRUE(QTest::qWaitFor([&] { return bar->isVisible() && bar->value() == 42; }));
  EXPECT_TRUE(setup.Shows("half"));
  setup.Folder().Write("go", "");
  ASSERT_TRUE(setup.WaitForEnd());
  EXPECT_EQ(ended.count(), 1);
  EXPECT_TRUE(setup.Action("Execute...")->isEnabled());
  QApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  EXPECT_FALSE(setup.ShowsProgress());
  EXPECT_TRUE(setup.Shows("The run is done after"));
  EXPECT_TRUE(setup.Log().contains("got /WM, 1")) << FromQt(setup.Log().join("\n"));

  auto* findings = setup.Frame().findChild<FindingsView*>();
  EXPECT_FALSE(findings->findItems("Nowhere:Key: hm — told by the engine", Qt::MatchExactly, 2).empty());
  const auto odd = findings->findItems("SimSpec/SimTitle:Title", Qt::MatchExactly, 1);
  ASSERT_EQ(odd.size(), 1);
  setup.GoTo("ExtraParams");
  emit findings->itemActivated(odd[0], 1);
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/SimTitle");
  EXPECT_EQ(setup.Focused<QLineEdit>()->text(), "Karup");
}

TEST(DocumentRun, WithShiftNoWindowShowsTheProgress) {
  RunOf setup("true");
  setup.ClickButton("Run water movement only", Qt::ShiftModifier);
  EXPECT_TRUE(setup.Run().IsExecuting());
  EXPECT_FALSE(setup.ShowsProgress());
  EXPECT_TRUE(setup.WaitForEnd());
  setup.ClickButton("Run water movement only", Qt::NoModifier);
  EXPECT_TRUE(setup.ShowsProgress());
  EXPECT_TRUE(setup.WaitForEnd());
}

TEST(DocumentRun, ExpectsTheReportOfThePreprocessorWhereItRuns) {
  RunOf setup("true");
  setup.Command("Execute...");
  EXPECT_TRUE(setup.WaitForEnd());
  EXPECT_THAT(FromQt(setup.Run().Sentence()), HasSubstr("has not written its report"));
  setup.Command("Preprocessing");
  setup.Command("Execute...");
  EXPECT_TRUE(setup.WaitForEnd());
  EXPECT_THAT(FromQt(setup.Run().Sentence()), StartsWith("The run is done"));
}

TEST(DocumentRun, StopsWhenTheUserConfirms) {
  RunOf setup(kWait);
  setup.Command("Run water movement only");
  {
    const NextAnswer no("No");
    setup.Command("Stop…");
    EXPECT_THAT(no.Text(), HasSubstr("Stop the engine that runs karup.tvd?"));
  }
  QTest::qWait(200);
  EXPECT_TRUE(setup.Run().IsExecuting());
  const NextAnswer yes("Yes");
  setup.Command("Stop…");
  EXPECT_TRUE(setup.WaitForEnd());
  EXPECT_TRUE(setup.Shows("The run was stopped after"));
}

TEST(DocumentRun, WithoutASaveNothingRuns) {
  RunOf setup("touch started");
  setup.Command("Preprocessing");
  setup.Folder().Write("karup.tvd", test::SetupText(14, "section SimSpec {\n}"));  // by another program
  std::vector<std::string> told;
  QTimer answers;
  QObject::connect(&answers, &QTimer::timeout, [&] {
    if (auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget())) {
      told.push_back(FromQt(box->text()));
      box->reject();
    }
  });
  answers.start(5);
  setup.Command("Execute...");
  EXPECT_FALSE(setup.Run().IsExecuting());
  ASSERT_EQ(told.size(), 2u);
  EXPECT_EQ(told[1], "Unable to run setup: Failed to save specification file.");
  EXPECT_FALSE(FileExists(setup.Folder().File("started")));
}

TEST(DocumentRun, TellsWhereEnginesAreLookedFor) {
  OpenedSetup setup;
  setup.Program().Settings().setValue(kEnginePathSetting, "/no/such/folder");
  const NextAnswer answer("OK");
  setup.Command("Execute...");
  EXPECT_THAT(answer.Text(), HasSubstr("the engine Tvn_Simulation was not found"));
  EXPECT_THAT(answer.Text(), HasSubstr("/no/such/folder"));
}

TEST(DocumentRun, GoesOnWhenTheSetupIsClosedAndIsFoundAgain) {
  RunOf setup("echo 'progress 7 slow'" + std::string(kWait) + "; exit 4");
  setup.Command("Run water movement only");
  ASSERT_TRUE(QTest::qWaitFor([&] { return setup.Run().Progress().has_value(); }));
  const NextAnswer yes("Yes");
  ASSERT_TRUE(setup.Window().CloseDocument(&setup.Frame()));
  EXPECT_THAT(yes.Text(), HasSubstr("let the engine run on?"));

  ASSERT_TRUE(setup.Window().OpenDocument(ToQt(setup.Path())));
  EXPECT_TRUE(setup.Run().IsExecuting());
  EXPECT_TRUE(QTest::qWaitFor([&] { return setup.Run().Progress().has_value(); }));
  ASSERT_TRUE(setup.Window().CloseDocument(&setup.Frame()));
  setup.Folder().Write("go", "");
  std::string problem;
  const std::string state = setup.Folder().File("karup_results/karup_Run.txt");
  ASSERT_TRUE(QTest::qWaitFor([&] {
    const auto read = ReadRunState(state, problem);
    return read && read->HasEnded();
  }));
  ASSERT_TRUE(setup.Window().OpenDocument(ToQt(setup.Path())));
  EXPECT_TRUE(setup.WaitForEnd());
  EXPECT_TRUE(setup.Shows("exit status 4"));
  // Once.
  ASSERT_TRUE(QTest::qWaitFor([&] { return ReadRunState(state, problem)->isTold; }));
  ASSERT_TRUE(setup.Window().CloseDocument(&setup.Frame()));
  ASSERT_TRUE(setup.Window().OpenDocument(ToQt(setup.Path())));
  EXPECT_FALSE(setup.Run().IsExecuting());
  EXPECT_FALSE(setup.Shows("exit status 4"));
}

}  // namespace
}  // namespace tervane
