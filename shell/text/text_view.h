// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTimer>
#include <QWidget>
#include <cstdint>
#include <string>

#include "document/edit_session.h"
#include "shell/text/setup_text.h"

class QLabel;
class QLineEdit;
class QListWidget;
class QToolButton;

namespace tervane {

/// The setup as the text that would be saved, to be edited beside its pages. What is typed is taken by the setup, as a
/// step of its undo, when the cursor leaves the line; until it can be taken it stays in the text, marked with the
/// reason.
class TextView : public QWidget {
  Q_OBJECT

 public:
  explicit TextView(EditSession& session, QWidget* parent = nullptr);

  SetupText& Text() const { return *text_; }

  /// Shows the text of the setup as it is now, unless the user is editing it.
  void Follow();
  /// Puts the cursor on a node's section, or on that key of it.
  void GoTo(const CYbSEKvfBase& node, const std::string& key = {});
  /// The node in whose section the cursor stands, and the key of its line; 0 where there is none.
  struct Place {
    std::uint64_t serial = 0;
    std::string key;
  };
  Place PlaceAtCursor() const;

  /// Tells what is wrong with what is being typed; called when the keys pause.
  void LookAtTyping();
  /// Has the setup take what was typed; what it cannot take stays, with the reason below the text.
  void Commit();
  /// Something was typed that the setup has not taken.
  bool HasTyping() const { return text_->IsEdited(); }
  /// Takes typing back, or does it again, that the setup has not taken; false where there is none.
  bool UndoTyping();
  bool RedoTyping();
  /// Goes on with a text that another view of the setup has had, with what the setup has not taken of it.
  void Resume(const QString& typed);
  /// Gives up what the setup has not taken.
  void Drop();
  void StartFind();

 signals:
  /// There is typing that can be undone, or none any more.
  void TypingChanged();

 protected:
  void showEvent(QShowEvent* event) override;
  void keyPressEvent(QKeyEvent* event) override;

 private:
  EditedSection EditedNow(SetupText::Edited& lines) const;
  TextOutline OutlineNow(std::string& error) const;
  void ShowProblems(std::vector<TextProblem> problems);
  void ShowStatus();
  void FindOn(bool isBackward);

  EditSession& session_;
  SetupText* text_;
  QLabel* status_;
  QListWidget* problems_;
  QWidget *problemBar_, *findBar_;
  QToolButton* drop_;
  QLineEdit* find_;
  QLabel* found_;
  QTimer checking_;
  bool isTaking_ = false;
  bool isStale_ = true;     ///< The setup has changed since its text was made.
  bool wasTyping_ = false;  ///< As it was told last.
  int triedRevision_ = -1;  ///< Of the text whose typing was tried last.
};

}  // namespace tervane
