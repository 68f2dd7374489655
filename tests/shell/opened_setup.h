// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QApplication>
#include <QClipboard>
#include <QLabel>
#include <QLineEdit>
#include <QTest>
#include <filesystem>
#include <memory>
#include <string>

#include <gtest/gtest.h>

#include "document/edit_session.h"
#include "shell/document_frame.h"
#include "shell/main_window.h"
#include "shell/page/page_view.h"
#include "shell/program.h"
#include "shell/widgets/qt_text.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::test {

/// A setup among the examples.
struct Example {
  std::string folder, name;
};

/// A window with one setup open, worked as a user works it.
class OpenedSetup {
 public:
  explicit OpenedSetup(std::string_view sections = {}, QSize size = {1280, 800}) {
    Open(
        "karup.tvd", [sections](const TempFolder& folder) { folder.Write("karup.tvd", SetupText(14, sections)); },
        size);
  }
  /// Opens a copy of the example with all that lies in its folder.
  explicit OpenedSetup(const Example& example, QSize size = {1280, 800}) {
    Open(
        example.name,
        [&example](const TempFolder& folder) {
          std::filesystem::copy(std::string(TERVANE_SOURCE_DIR) + "/examples/" + example.folder, folder.Path(),
                                std::filesystem::copy_options::recursive);
        },
        size);
  }

  const TempFolder& Folder() const { return folder_; }
  const std::string& Path() const { return path_; }
  tervane::Program& Program() { return program_; }
  MainWindow& Window() { return window_; }
  DocumentFrame& Frame() { return *window_.Frame(); }
  EditSession& Session() { return Frame().Session(); }
  std::string Value(std::string_view path) { return ValueOf(Session().Document(), path); }

  /// Shows a page and puts the keyboard on the control of a key or label.
  void GoTo(const std::string& path) {
    EXPECT_TRUE(Frame().GoToPath(path)) << path;
    QApplication::processEvents();
  }
  /// The widget that has the keyboard.
  template <class Widget>
  Widget* Focused() {
    auto* widget = qobject_cast<Widget*>(window_.focusWidget());
    EXPECT_TRUE(widget);
    return widget;
  }
  /// Replaces the text of the line that has the keyboard, without entering it.
  void Type(const QString& text) {
    auto* line = Focused<QLineEdit>();
    line->selectAll();
    QTest::keyClicks(line, text);
  }
  void Press(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
    QTest::keyClick(window_.focusWidget(), key, modifiers);
  }
  /// Gives a command of the menus by its text.
  void Command(const QString& text) {
    for (QAction* action : window_.findChildren<QAction*>()) {
      if (QString(action->text()).remove('&').section('\t', 0, 0) != text) continue;
      EXPECT_TRUE(action->isEnabled()) << FromQt(text);
      action->trigger();
      return;
    }
    ADD_FAILURE() << "no command " << FromQt(text);
  }
  QAction* Action(const QString& text) {
    for (QAction* action : window_.findChildren<QAction*>())
      if (QString(action->text()).remove('&') == text) return action;
    return nullptr;
  }
  /// The page shows that text in some label.
  bool Shows(const QString& text) {
    for (const QLabel* label : window_.findChildren<QLabel*>())
      if (label->isVisible() && label->text().contains(text)) return true;
    return false;
  }

 private:
  template <class Fill>
  void Open(const std::string& name, const Fill& fill, QSize size) {
    fill(folder_);
    path_ = folder_.File(name);
    window_.resize(size);
    window_.show();
    EXPECT_TRUE(window_.OpenDocument(ToQt(path_)));
  }

  TempFolder folder_;
  std::string path_;
  tervane::Program program_{ToQt(folder_.File("settings/quarzel.ini"))};
  MainWindow window_{program_};
};

}  // namespace tervane::test
