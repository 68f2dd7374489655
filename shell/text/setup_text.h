// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QPlainTextEdit>
#include <QTimer>
#include <string>
#include <vector>

#include "document/text_outline.h"
#include "document/text_taking.h"

namespace tervane {

/// The text of a setup in an editor: coloured, with line numbers, sections that fold, and marks at faulty lines. It
/// knows which lines were edited since the text was given. Lines count from 0.
///
/// A long text comes in pieces, so that the first screen is there at once; until it is whole it is only read. Colours
/// are made for what is seen.
class SetupText : public QPlainTextEdit {
  Q_OBJECT

 public:
  explicit SetupText(QWidget* parent = nullptr);

  /// Shows a text in the place of the one that was given last: lines that are alike stay as they are, folded or not,
  /// and so does the place of the cursor.
  void SetOutline(TextOutline outline);
  const TextOutline& Outline() const { return outline_; }
  bool IsWhole() const { return whole_ == outline_.LineCount(); }
  /// From 0 to 100.
  int PercentThere() const;

  bool IsEdited() const { return isEdited_; }
  /// The smallest section around all edited lines, with its texts; the section is `TextOutline::kNone` where they stand
  /// in none.
  struct Edited {
    int section = TextOutline::kNone;
    std::string before, after;
    int firstLine = 0;
    int firstEdited = 0, lastEdited = 0;  ///< In the text as it is now.
  };
  Edited EditedLines() const;
  /// From here on the edited text is held against this one.
  void Rebase(TextOutline outline);

  void SetProblems(std::vector<TextProblem> problems);
  const std::vector<TextProblem>& Problems() const { return problems_; }

  /// The line of the given text that stands where the cursor is.
  int OutlineLineAtCursor() const;
  /// Puts the cursor at the first character of a line that is shown; waits for it where the text is still coming.
  void GoToLine(int line);

  void FoldAt(int line);
  bool IsFolded(int line) const;
  void FoldAll(bool isFolded);

  int MarginWidth() const;
  void PaintMargin(QPaintEvent& event);
  void PressMargin(int y);

 signals:
  /// The user has changed the text.
  void Typed();
  /// The cursor is in another line and the text was edited, or the keyboard has left the editor.
  void LeftEdit();
  /// More of the text is there.
  void Came();

 protected:
  void paintEvent(QPaintEvent* event) override;
  void resizeEvent(QResizeEvent* event) override;
  void focusOutEvent(QFocusEvent* event) override;
  bool event(QEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;

 private:
  void Restyle();
  void FillOn();
  void OnContentsChange(int position, int removed, int added);
  void Replace(int first, int count, std::string_view text);
  QString TextOfLines(int first, int last) const;
  /// The line that ends the section that begins in a line; -1 where none begins.
  int EndOfSection(int line) const;
  void SetFolded(const QTextBlock& begin, int end, bool isFolded);
  const TextProblem* ProblemAt(int line) const;

  QWidget* margin_;
  TextOutline outline_;
  int whole_ = 1;  ///< Lines of the given text that are there.
  int wanted_ = -1;
  bool isOurs_ = false;  ///< The text is changed by the program.
  bool isEdited_ = false;
  int keptTop_ = 0, keptTail_ = 0;  ///< Lines in front and at the end that were not edited.
  int lastLine_ = 0;
  std::vector<TextProblem> problems_;
  QTimer filling_;
};

}  // namespace tervane
