// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Somebody who presses and types whatever there is: nothing that he does may crash, be forgotten by undo, or be lost by
// a save. TERVANE_MONKEY_STEPS and TERVANE_MONKEY_SEED let him work longer, or otherwise.
#include <QAbstractItemView>
#include <QCheckBox>
#include <QComboBox>
#include <QDialog>
#include <QMenu>
#include <QPushButton>
#include <QRadioButton>
#include <QTabWidget>
#include <QTextBlock>
#include <QTimer>
#include <QToolButton>
#include <cstdlib>
#include <random>
#include <sstream>

#include <gmock/gmock.h>
#include <malloc.h>

#include "document/flow_model_document.h"
#include "shell/notes_view.h"
#include "shell/relief/relief_window.h"
#include "shell/text/text_view.h"
#include "tests/shell/opened_setup.h"

namespace tervane::program_test {
namespace {

using test::OpenedSetup;

int Wanted(const char* variable, int otherwise) {
  const char* told = std::getenv(variable);
  return told ? std::atoi(told) : otherwise;
}

/// As it would be saved, but for whether pages were visited, which is no change, and what a save computes anew.
std::string TextOf(const CFlowModelDoc& document) {
  std::istringstream lines(test::SavedText(document));
  std::string text;
  for (std::string line; std::getline(lines, line);)
    if (line.find("Touched = ") == std::string::npos && line.find("IsDataUsedInSetup = ") == std::string::npos)
      text += line + "\n";
  return text;
}

/// The first place where two texts differ, for who reads a failure.
std::string FirstDifference(const std::string& a, const std::string& b) {
  std::istringstream as(a), bs(b);
  std::string x, y, section;
  while (std::getline(as, x) && std::getline(bs, y)) {
    if (x != y) return section + x + " | " + y;
    if (x.find("section ") != std::string::npos) section = x;
  }
  return a.size() == b.size() ? "" : "one is longer";
}

class Monkey {
 public:
  Monkey(const test::Example& example, unsigned seed) : setup_(example), random_(seed) {
    setup_.Window().SetUnattended();
    // Dialogs and menus that he opens are given up.
    closer_.setInterval(2);
    QObject::connect(&closer_, &QTimer::timeout, [] {
      if (QWidget* popup = QApplication::activePopupWidget()) popup->close();
      if (auto* dialog = qobject_cast<QDialog*>(QApplication::activeModalWidget())) dialog->reject();
    });
    closer_.start();
    first_ = TextOf(Document());
  }

  void Work(int steps) {
    for (int step = 0; step < steps && !testing::Test::HasFailure(); ++step) {
      SCOPED_TRACE("step " + std::to_string(step) + " on " + setup_.Frame().CurrentPath());
      Step();
      Settle();
      HoldUndoAgainstText();
    }
  }
  /// Undo leads back to the first text, redo to the last one, and a saved file holds it.
  void Conclude() {
    setup_.Frame().Commit();
    Settle();
    const std::string last = TextOf(Document());
    int steps = 0;
    // Pages that were left are deleted when the event loop goes on.
    const auto letGo = [] { QApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete); };
    for (; setup_.Session().Steps().CanUndo() && steps < 100000; ++steps) {
      setup_.Frame().Undo();
      letGo();
    }
    EXPECT_EQ(FirstDifference(first_, TextOf(Document())), "") << "after undo of " << steps << " steps";
    // He may have taken back steps himself, which stay taken back.
    for (int step = 0; step < steps; ++step) {
      setup_.Frame().Redo();
      letGo();
    }
    EXPECT_EQ(FirstDifference(last, TextOf(Document())), "") << "after redo of " << steps << " steps";
    const std::string path = setup_.Folder().File("kept.tvd");
    ASSERT_TRUE(setup_.Session().SaveAs(path)) << setup_.Session().Error();
    CFlowModelDoc again;
    ASSERT_TRUE(again.OnOpenDocument(path)) << again.Error();
    EXPECT_EQ(FirstDifference(TextOf(Document()), TextOf(again)), "") << "what a save keeps";
  }

 private:
  CFlowModelDoc& Document() { return setup_.Session().Document(); }
  std::size_t Any(std::size_t count) { return std::uniform_int_distribution<std::size_t>(0, count - 1)(random_); }

  void Step() {
    switch (Any(14)) {
      case 0:
      case 1:
      case 2:
        return GoAnywhere();
      case 3:
        return setup_.Frame().Undo();
      case 4:
        return setup_.Frame().Redo();
      case 5:
        return setup_.Frame().Go(Any(2) == 0 ? -1 : 1);
      case 6:
        return EditText();
      case 7:
        return Note();
      default:
        return ActOnPage();
    }
  }

  void GoAnywhere() {
    std::vector<std::uint64_t> pages;
    const std::function<void(CYbSEKvfBase&)> collect = [&](CYbSEKvfBase& node) {
      for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child)) {
        if (child->GetDlgRuntimeClass(kSetupDataTree) && child->IsDataUsedInSetup()) pages.push_back(child->Serial());
        collect(*child);
      }
    };
    collect(Document().Root());
    setup_.Frame().GoTo(pages[Any(pages.size())]);
  }

  /// Changes lines somewhere in the text; what the setup does not take is given up.
  void EditText() {
    setup_.Frame().ShowText(true);
    auto& view = *setup_.Frame().findChild<TextView*>();
    SetupText& text = view.Text();
    for (std::size_t edits = 1 + Any(2); edits > 0; --edits) {
      const auto line = static_cast<int>(Any(static_cast<std::size_t>(text.document()->blockCount())));
      text.GoToLine(line);
      QTextCursor cursor = text.textCursor();
      const auto lines = static_cast<int>(Any(3) == 0 ? Any(12) : 0);
      cursor.movePosition(QTextCursor::Down, QTextCursor::KeepAnchor, lines);
      cursor.movePosition(QTextCursor::EndOfBlock, QTextCursor::KeepAnchor);
      const QString chosen = cursor.selectedText().replace(QChar::ParagraphSeparator, '\n');
      switch (Any(4)) {
        case 0:
          cursor.insertText("");
          break;
        case 1:
          cursor.insertText(chosen + "\n" + chosen);
          break;
        default: {
          const qsizetype equals = chosen.indexOf('=');
          if (equals > 0) cursor.insertText(chosen.left(equals + 2) + Typed());
        }
      }
      QTest::keyClick(&text, Any(2) == 0 ? Qt::Key_Up : Qt::Key_Down);
      QApplication::processEvents();
    }
    view.Commit();
    if (view.HasTyping()) view.Drop();
    EXPECT_EQ(FirstDifference(FromQt(text.toPlainText()), test::SavedText(Document())), "") << "the text that is shown";
    setup_.Frame().ShowText(false);
  }

  void Note() {
    auto& view = *setup_.Frame().findChild<NotesView*>();
    const auto notes = view.Notes();
    if (notes.empty() || Any(2) == 0) {
      CYbSEKvfBase* node = FindNode(Document().Root(), ParseSetupPath(setup_.Frame().CurrentPath()).steps);
      return node ? view.Add(*node, "", "Anna", FromQt(Typed()) + "?") : void();
    }
    const std::string& name = notes[Any(notes.size())].note.name;
    Any(2) == 0 ? view.Answer(name, "Bo", "yes") : view.Remove(name);
  }

  void ActOnPage() {
    std::vector<QWidget*> widgets;
    for (const PageView* page : setup_.Frame().findChildren<PageView*>())
      for (QWidget* widget : page->findChildren<QWidget*>())
        if (widget->isVisible() && widget->isEnabled() && CanAct(*widget)) widgets.push_back(widget);
    if (widgets.empty()) return GoAnywhere();
    QWidget* w = widgets[Any(widgets.size())];
    Act(*w);
  }
  static bool CanAct(const QWidget& widget) {
    return qobject_cast<const QAbstractButton*>(&widget) || qobject_cast<const QComboBox*>(&widget) ||
           qobject_cast<const QLineEdit*>(&widget) || qobject_cast<const QAbstractItemView*>(&widget);
  }
  void Act(QWidget& widget) {
    if (auto* button = qobject_cast<QAbstractButton*>(&widget)) {
      // "Edit..." and its like lead out of the setup.
      if (button->text().contains("Edit") || button->text().contains("Launch")) return;
      return button->click();
    }
    if (auto* choice = qobject_cast<QComboBox*>(&widget)) {
      if (choice->count() == 0) return;
      choice->setFocus();
      choice->setCurrentIndex(static_cast<int>(Any(static_cast<std::size_t>(choice->count()))));
      emit choice->activated(choice->currentIndex());
      return;
    }
    if (auto* line = qobject_cast<QLineEdit*>(&widget)) {
      if (line->isReadOnly()) return;
      line->setFocus();
      line->selectAll();
      QTest::keyClicks(line, Typed());
      QTest::keyClick(line, Any(2) == 0 ? Qt::Key_Return : Qt::Key_Tab);
      return;
    }
    if (auto* view = qobject_cast<QAbstractItemView*>(&widget)) {
      const QAbstractItemModel* model = view->model();
      if (!model || model->rowCount() == 0 || model->columnCount() == 0) return;
      const auto row = static_cast<int>(Any(static_cast<std::size_t>(model->rowCount())));
      const auto column = static_cast<int>(Any(static_cast<std::size_t>(model->columnCount())));
      view->setFocus();
      view->setCurrentIndex(model->index(row, column));
      QTest::keyClicks(view, Typed());
      QTest::keyClick(QApplication::focusWidget() ? QApplication::focusWidget() : view, Qt::Key_Return);
    }
  }
  QString Typed() {
    static const char* const kTyped[] = {"1",    "2",          "0",     "-3.5",   "0.25",    "1e300", "",
                                         "12 h", "2001-03-31", "Karup", "a<&>\"", "3, 4, 5", "nan",   "99999999999"};
    return QString::fromUtf8(kTyped[Any(std::size(kTyped))]);
  }

  void Settle() {
    for (int i = 0; i < 2; ++i) QApplication::processEvents();
    for (QWidget* window : QApplication::topLevelWidgets())
      if (auto* relief = qobject_cast<ReliefWindow*>(window)) relief->close();
    // What he opened besides is closed, and he goes on with the setup.
    auto* tabs = setup_.Window().findChild<QTabWidget*>();
    for (int i = tabs->count(); i-- > 0;)
      if (!qobject_cast<DocumentFrame*>(tabs->widget(i))) setup_.Window().CloseTab(tabs->widget(i));
    for (int i = 0; i < tabs->count(); ++i)
      if (qobject_cast<DocumentFrame*>(tabs->widget(i))) tabs->setCurrentIndex(i);
    QApplication::processEvents();
  }

  /// One step back and forth again is where he was.
  void HoldUndoAgainstText() {
    if (Any(8) != 0 || !setup_.Session().Steps().CanUndo()) return;
    setup_.Frame().Commit();
    Settle();
    const std::string before = TextOf(Document());
    const std::string name = setup_.Session().Steps().UndoName();
    setup_.Frame().Undo();
    setup_.Frame().Redo();
    EXPECT_EQ(FirstDifference(before, TextOf(Document())), "") << "undo and redo of " << name;
  }

  test::OpenedSetup setup_;
  std::mt19937 random_;
  QTimer closer_;
  std::string first_;
};

TEST(Monkey, WhateverIsPressedAndTypedIsUndoneAndKept) {
  const int steps = Wanted("TERVANE_MONKEY_STEPS", 80);
  unsigned seed = static_cast<unsigned>(Wanted("TERVANE_MONKEY_SEED", 1));
  for (const test::Example& example : {test::Example{"rhone", "rhone.tvd"}, test::Example{"rhone", "rhone_modflow.tvd"},
                                       test::Example{"rhone", "rhone_quality.tvd"}}) {
    SCOPED_TRACE(example.name + ", seed " + std::to_string(seed));
    Monkey monkey(example, seed++);
    monkey.Work(steps);
    monkey.Conclude();
  }
}

// ---- Much at once, and the same for very long

TEST(Program, AHundredSetupsAreOpenAndEachIsItself) {
  OpenedSetup setup;
  for (int number = 1; number < 100; ++number) {
    const std::string title = std::to_string(number);
    const std::string path = setup.Folder().Write(
        "setup" + title + ".tvd",
        test::SetupText(14, "section SimSpec {\nsection SimTitle {\nTitle = \"" + title + "\"\n}\n}"));
    ASSERT_TRUE(setup.Window().OpenDocument(ToQt(path)));
  }
  auto* tabs = setup.Window().findChild<QTabWidget*>();
  ASSERT_EQ(tabs->count(), 100);
  for (int number = 99; number > 0; number -= 7) {
    tabs->setCurrentIndex(number);
    EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), std::to_string(number));
    setup.GoTo("SimSpec/SimTitle:Title");
    setup.Type("changed");
    setup.Command("Save");
    EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "changed");
  }
  while (tabs->count() > 1) setup.Command("Close");
  EXPECT_EQ(setup.Path(), setup.Session().Path());
}

/// Bytes that the allocator has handed out, when all that waits to be deleted is.
std::size_t Taken() {
  for (int i = 0; i < 3; ++i) {
    QApplication::processEvents();
    QApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  }
  return mallinfo2().uordblks;
}

TEST(Program, TakesNoMoreMemoryTheLongerItGoesOn) {
  OpenedSetup setup;
  int number = 0;
  const auto work = [&] {
    for (const char* page : {"Climate/PrecipitationRate", "SimSpec", "SaturatedZone", "Catchment", "StoringOfResults"})
      setup.GoTo(page);
    setup.GoTo("SimSpec/SimTitle:Title");
    setup.Type(QString::number(++number));
    setup.Press(Qt::Key_Return);
    setup.Command("Text of the Setup");
    setup.Command("Text of the Setup");
    setup.Frame().Undo();
    setup.Frame().Redo();
    setup.Frame().Undo();
    if (number % 5 == 0) setup.Command("Save");
  };
  // Caches fill, and the list of visited pages.
  for (int i = 0; i < 40; ++i) work();
  const std::size_t before = Taken();
  constexpr int kRounds = 40;
  for (int i = 0; i < kRounds; ++i) work();
  const std::size_t after = Taken();
  // A page, a text or an open file that stays behind takes hundreds of thousands.
  EXPECT_LT(after, before + kRounds * 30'000);
}

}  // namespace
}  // namespace tervane::program_test
