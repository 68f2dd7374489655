// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/run/log_view.h"

#include <QApplication>
#include <QClipboard>
#include <QScrollBar>
#include <QTest>

#include <gtest/gtest.h>

namespace tervane::log_view_test {
namespace {

class LogViewTest : public testing::Test {
 protected:
  LogViewTest() {
    view.resize(600, 300);
    view.show();
    Add(1000);
  }
  void Add(int count) {
    LogPiece piece;
    for (int i = 0; i < count; ++i) {
      piece.Append("line " + std::to_string(next++));
      piece.EndLine();
    }
    tail.Add(std::move(piece));
    view.Follow();
  }
  /// The line at a place of the view, as it is copied.
  QString Shown(int y) {
    QTest::mousePress(view.viewport(), Qt::LeftButton, Qt::NoModifier, QPoint(20, y));
    QMouseEvent move(QEvent::MouseMove, QPointF(20, y), view.viewport()->mapToGlobal(QPointF(20, y)), Qt::LeftButton,
                     Qt::LeftButton, Qt::NoModifier);
    QApplication::sendEvent(view.viewport(), &move);
    QTest::mouseRelease(view.viewport(), Qt::LeftButton, Qt::NoModifier, QPoint(20, y));
    QTest::keyClick(&view, Qt::Key_C, Qt::ControlModifier);
    return QApplication::clipboard()->text();
  }

  LogTail tail;
  LogView view{tail, "nothing"};
  int next = 0;
};

TEST_F(LogViewTest, StaysAtTheEndUntilTheUserLeavesIt) {
  EXPECT_EQ(view.verticalScrollBar()->value(), view.verticalScrollBar()->maximum());
  Add(500);
  EXPECT_EQ(view.verticalScrollBar()->value(), view.verticalScrollBar()->maximum());
  QTest::keyClick(&view, Qt::Key_Home);
  Add(500);
  EXPECT_EQ(Shown(10), "line 0\n");
}

TEST_F(LogViewTest, TheLinesInSightStayWhenOthersGoInFrontOfThem) {
  view.verticalScrollBar()->setValue(700);
  EXPECT_EQ(Shown(10), "line 700\n");
  while (tail.Dropped() == 0) Add(300);
  ASSERT_GT(tail.Dropped(), 0u);
  const QString first = Shown(10);
  EXPECT_TRUE(first == "line 700\n" || first == QString("line %1\n").arg(tail.Dropped())) << first.toStdString();
}

TEST_F(LogViewTest, CopiesWhatIsChosenOrAll) {
  view.copy();
  EXPECT_EQ(QApplication::clipboard()->text().count('\n'), 1000);
  QTest::keyClick(&view, Qt::Key_Home);
  Shown(10);
  QTest::mouseClick(view.viewport(), Qt::LeftButton, Qt::NoModifier, QPoint(20, 10));
  QMouseEvent move(QEvent::MouseMove, QPointF(20, 10 + 2 * view.fontMetrics().lineSpacing()), QPointF(), Qt::LeftButton,
                   Qt::LeftButton, Qt::NoModifier);
  QApplication::sendEvent(view.viewport(), &move);
  view.copy();
  EXPECT_EQ(QApplication::clipboard()->text(), "line 0\nline 1\nline 2\n");
}

}  // namespace
}  // namespace tervane::log_view_test
