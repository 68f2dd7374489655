// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QDialog>
#include <QWidget>
#include <cstdint>
#include <functional>
#include <vector>

#include "document/edit_session.h"
#include "simspec/review_notes.h"

class QComboBox;
class QLineEdit;
class QMenu;
class QPlainTextEdit;
class QToolButton;
class QTreeWidget;
class QTreeWidgetItem;

namespace tervane {

class Host;
class Program;

/// Asks for the text of a note or an answer, and for who says it.
class NoteDialog : public QDialog {
  Q_OBJECT

 public:
  /// The author is kept in the settings of the program.
  NoteDialog(const QString& title, const QString& about, Program& program, QWidget* parent);

  std::string Text() const;
  std::string Author() const;
  void accept() override;

 private:
  Program& program_;
  QPlainTextEdit* text_;
  QLineEdit* author_;
};

/// The review notes of a setup with their answers, as a list that leads to their places; they are answered, closed,
/// removed and exported there. Each of that is a step of the setup's undo.
class NotesView : public QWidget {
  Q_OBJECT

 public:
  /// The node of a serial number, or null.
  using NodeOf = std::function<CYbSEKvfBase*(std::uint64_t serial)>;
  struct PlacedNote {
    ReviewNote note;
    std::uint64_t serial;  ///< Of the node at which it stands; 0 where its place is gone.

    bool operator==(const PlacedNote&) const = default;
  };

  NotesView(EditSession& session, Host& host, Program& program, NodeOf nodeOf);

  /// Follows the setup, and has notes follow nodes that were moved or renamed by the latest step, as a part of it.
  void Sync();
  const std::vector<PlacedNote>& Notes() const { return notes_; }
  /// Notes that are not done.
  int OpenCount() const;
  /// Asks for a note at a node, or at a key of it, and adds it.
  void AddAt(CYbSEKvfBase& node, const std::string& key);
  /// Adds a note; the date is that of now.
  void Add(CYbSEKvfBase& node, const std::string& key, const std::string& author, const std::string& text);
  void Answer(const std::string& name, const std::string& author, const std::string& text);
  void SetState(const std::string& name, ReviewState state);
  void Remove(const std::string& name);
  /// Chooses a note in the list.
  void Select(const std::string& name);

 signals:
  void NoteChosen(quint64 serial, const QString& key);

 private:
  CExtraParamsKvf& List() const;
  const PlacedNote* Find(const std::string& name) const;
  const PlacedNote* Chosen() const;
  void Fill();
  void Choose(const QTreeWidgetItem* item);
  void ShowMenu(const QPoint& place);
  void AskForAnswer();
  void Export();
  void Change(const ReviewNote& note, int hint, const QString& action);
  void SyncButtons();

  EditSession& session_;
  Host& host_;
  Program& program_;
  NodeOf nodeOf_;
  std::vector<PlacedNote> notes_;
  QComboBox* filter_;
  QTreeWidget* list_;
  QToolButton *answer_, *done_, *remove_, *export_;
};

}  // namespace tervane
