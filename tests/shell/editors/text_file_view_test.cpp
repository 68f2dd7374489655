// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/text_file_view.h"

#include <QApplication>
#include <QPlainTextEdit>
#include <QScrollBar>
#include <filesystem>

#include <gmock/gmock.h>

#include "tests/support/temp_folder.h"

namespace tervane::text_file_view_test {
namespace {

using testing::HasSubstr;

TEST(TextFileView, ReadsAsFarAsTheUserScrolls) {
  const test::TempFolder folder;
  std::string text;
  for (int line = 1; line <= 100'000; ++line) text += "line " + std::to_string(line) + "\n";
  const std::string path = folder.Write("engine.log", text);
  TextFileView view;
  view.resize(500, 300);
  view.show();
  view.Show(path);
  QApplication::processEvents();
  EXPECT_EQ(view.Text().verticalScrollBar()->value(), 0);
  EXPECT_LT(view.Text().toPlainText().size(), 300 * 1024);
  EXPECT_THAT(view.Status().toStdString(), HasSubstr("are shown"));
  int steps = 0;
  for (; !view.Status().isEmpty() && steps < 50; ++steps) {
    const int before = view.Text().verticalScrollBar()->maximum();
    view.Text().verticalScrollBar()->setValue(before);
    QApplication::processEvents();
  }
  EXPECT_GT(steps, 2);
  EXPECT_EQ(view.Text().toPlainText().toStdString(), text);
}

TEST(TextFileView, FollowsTheFileAndSaysWhyThereIsNone) {
  const test::TempFolder folder;
  const std::string path = folder.Write("engine.log", "one\r\ntwo");
  TextFileView view;
  view.Show(path);
  EXPECT_EQ(view.Text().toPlainText().toStdString(), "one\ntwo");
  folder.Write("engine.log", "three and more");
  view.Show(path);
  EXPECT_EQ(view.Text().toPlainText().toStdString(), "three and more");
  std::filesystem::remove(path);
  view.Show(path);
  EXPECT_EQ(view.Text().toPlainText().toStdString(), "");
  EXPECT_THAT(view.Status().toStdString(), HasSubstr("cannot read " + path));
}

}  // namespace
}  // namespace tervane::text_file_view_test
