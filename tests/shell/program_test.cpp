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
#include <QTimer>
#include <QToolButton>
#include <cstdlib>
#include <random>
#include <sstream>

#include <gmock/gmock.h>

#include "document/flow_model_document.h"
#include "shell/relief/relief_window.h"
#include "tests/shell/opened_setup.h"

namespace tervane::program_test {
namespace {

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
    while (setup_.Session().Steps().CanUndo() && ++steps < 100000) setup_.Frame().Undo();
    EXPECT_EQ(FirstDifference(first_, TextOf(Document())), "") << "after undo of " << steps << " steps";
    // He may have taken back steps himself, which stay taken back.
    for (int step = 0; step < steps; ++step) setup_.Frame().Redo();
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
    switch (Any(12)) {
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

}  // namespace
}  // namespace tervane::program_test
