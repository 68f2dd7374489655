// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QAccessible>
#include <QApplication>
#include <QDialog>
#include <QKeySequence>
#include <QMessageBox>
#include <QTest>
#include <QTimer>
#include <deque>
#include <functional>
#include <string>

#include <gtest/gtest.h>

#include "shell/widgets/qt_text.h"

namespace tervane::test {

/// Somebody who has no mouse and sees what a screen reader tells. Each step is done when the window waits for him, also
/// while a dialog or a menu is open.
class Typist {
 public:
  /// Presses keys one after the other: "Alt+F, S".
  Typist& Press(const QString& keys) {
    return Then(
        "press " + keys,
        [keys] {
          const QKeySequence sequence = QKeySequence::fromString(keys);
          for (int i = 0; i < sequence.count(); ++i) Key(sequence[static_cast<uint>(i)]);
          EXPECT_GT(sequence.count(), 0) << FromQt(keys);
          return true;
        },
        true);
  }
  Typist& Type(const QString& text) {
    for (const QChar letter : text)
      Then(
          "type " + text,
          [letter] {
            if (QWindow* window = Window()) QTest::keyClick(window, letter.toLatin1());
            return true;
          },
          true);
    return *this;
  }
  /// Presses a key until what has the keyboard bears that name, as often as a patient user would.
  Typist& To(const QString& name, const QString& key = "Tab") {
    return Then("go to " + name + " by " + key, [name, key, told = QStringList()]() mutable {
      if (Name() == name) return true;
      constexpr qsizetype kMost = 60;
      told << Name();
      if (told.size() > kMost) {
        ADD_FAILURE() << "only came to " << FromQt(told.mid(0, 40).join(" | "));
        return true;
      }
      Key(QKeySequence::fromString(key)[0]);
      return false;
    });
  }
  /// Waits until something is so.
  Typist& Until(const QString& what, std::function<bool()> isSo) { return Then("wait until " + what, std::move(isSo)); }
  Typist& Check(std::function<void()> check) {
    return Then(
        "look",
        [check = std::move(check)] {
          check();
          return true;
        },
        true);
  }
  /// Waits until what has the keyboard bears that name.
  Typist& At(const QString& name) {
    return Then("be at " + name, [name] { return Name() == name; });
  }

  /// What the screen reader tells of where the keyboard is: of a tree, list or table the current cell.
  static QString Name() { return Told(QAccessible::Name); }
  static QString Told(QAccessible::Text kind) {
    QWidget* focus = Focus();
    const QAccessibleInterface* shown = focus ? QAccessible::queryAccessibleInterface(focus) : nullptr;
    if (!shown) return {};
    if (const QAccessibleInterface* child = shown->focusChild(); child && child != shown) shown = child;
    // Labels that stand in front end with a colon.
    QString text = shown->text(kind);
    if (text.endsWith(':')) text.chop(1);
    return text;
  }

  void Run() {
    Next(0);
    while (!steps_.empty()) QApplication::processEvents(QEventLoop::WaitForMoreEvents);
    for (int i = 0; i < 3; ++i) QApplication::processEvents();
  }

 private:
  struct Step {
    QString name;
    std::function<bool()> isDone;
    bool acts;  ///< Once, and may open a dialog in which the next steps are done.
  };

  static QWidget* Focus() {
    if (QWidget* popup = QApplication::activePopupWidget()) return popup;
    return QApplication::focusWidget();
  }
  static QWindow* Window() {
    QWindow* window = QGuiApplication::focusWindow();
    EXPECT_TRUE(window) << "no window has the keyboard";
    return window;
  }
  static void Key(QKeyCombination key) {
    if (QWindow* window = Window()) QTest::keyClick(window, key.key(), key.keyboardModifiers());
  }

  /// Without a screen nobody gives the keyboard back to the window below one that was closed.
  static bool IsAnyWindowActive() {
    if (QGuiApplication::focusWindow()) return true;
    QWidget* top = QApplication::activeModalWidget();
    for (QWidget* each : QApplication::topLevelWidgets())
      if (!top && each->isVisible() && each->windowType() == Qt::Window) top = each;
    if (top) top->activateWindow();
    return false;
  }

  Typist& Then(const QString& name, std::function<bool()> isDone, bool acts = false) {
    steps_.push_back({name, std::move(isDone), acts});
    return *this;
  }

  void Next(int waited) {
    constexpr int kTick = 10, kLongest = 30'000;
    QTimer::singleShot(kTick, &life_, [this, waited] {
      if (steps_.empty()) return;
      if (testing::Test::HasFailure() || waited > kLongest) return GiveUp();
      if (!IsAnyWindowActive()) return Next(waited + kTick);
      if (!steps_.front().acts) {
        if (!steps_.front().isDone()) return Next(waited + kTick);
        steps_.pop_front();
        return Next(0);
      }
      const Step step = std::move(steps_.front());
      steps_.pop_front();
      Next(0);
      step.isDone();
    });
  }
  void GiveUp() {
    ADD_FAILURE() << "gave up at: " << FromQt(steps_.front().name) << "; the keyboard is at " << FromQt(Name()) << ": "
                  << FromQt(Told(QAccessible::Description)) << " in "
                  << FromQt(QApplication::activeWindow() ? QApplication::activeWindow()->windowTitle() : QString());
    if (const auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget()))
      ADD_FAILURE() << FromQt(box->text());
    steps_.clear();
    Leave();
  }
  /// Closes what is open, so that the test comes to its end.
  static void Leave() {
    QWidget* open =
        QApplication::activePopupWidget() ? QApplication::activePopupWidget() : QApplication::activeModalWidget();
    if (!open) return;
    QTimer::singleShot(0, qApp, &Typist::Leave);
    if (auto* dialog = qobject_cast<QDialog*>(open))
      dialog->reject();
    else
      open->close();
  }

  std::deque<Step> steps_;
  QObject life_;  ///< Timers that are still to come go with it.
};

}  // namespace tervane::test
