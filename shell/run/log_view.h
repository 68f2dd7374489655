// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QAbstractScrollArea>
#include <cstdint>
#include <functional>

#include "execution/run_log.h"

namespace tervane {

/// Shows a log that others fill. It holds no text of its own and draws the lines in sight alone, so that it does not
/// matter how many there are, or how fast they come.
class LogView : public QAbstractScrollArea {
  Q_OBJECT

 public:
  /// `emptyText` is shown until something was logged. The lines outlive the view.
  LogView(const LogTail& lines, const QString& emptyText);

  /// To be called when lines were added: stays at the end when it is there, else at the lines that are shown.
  void Follow();
  /// Tells the file that has the whole log; empty where there is none.
  void SetFile(std::function<QString()> file) { file_ = std::move(file); }

 public slots:
  /// Copies the chosen lines, or all when none is chosen.
  void copy();
  void selectAll();

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void changeEvent(QEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;
  void mousePressEvent(QMouseEvent* event) override;
  void mouseMoveEvent(QMouseEvent* event) override;
  void contextMenuEvent(QContextMenuEvent* event) override;

 private:
  int LineHeight() const;
  int LinesInSight() const;
  std::uint64_t LineAt(int y) const;
  void SetBars();
  QString TextOf(std::size_t index) const;

  const LogTail& lines_;
  QString emptyText_;
  std::function<QString()> file_;
  std::uint64_t dropped_ = 0;  ///< As the scroll bar knows it.
  /// The chosen lines by their numbers among all that ever came, the second one behind the last; none when equal.
  std::uint64_t anchor_ = 0, chosenBegin_ = 0, chosenEnd_ = 0;
};

}  // namespace tervane
