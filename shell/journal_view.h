// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QTreeWidget>
#include <QWidget>
#include <functional>
#include <string>
#include <vector>

#include "document/edit_session.h"

class QComboBox;
class QLabel;
class QLineEdit;
class QToolButton;

namespace tervane {

class Host;
class Program;

/// The journal beside a setup as a list, the latest step on top: filtered, exported, and one of its steps taken back on
/// its own. Here it is chosen whether a journal is kept.
class JournalView : public QWidget {
  Q_OBJECT

 public:
  enum class Keep { No, OfThis, OfAll };

  /// `commit` hands over what was typed on the page, before the setup is changed from here.
  JournalView(EditSession& session, Host& host, Program& program, std::function<void()> commit);

  /// Follows the journal and the setup; what nobody sees is read when it is shown.
  void Sync();
  /// The user's choice for this setup, which the settings of the program keep.
  Keep Chosen() const;
  void Choose(Keep keep);
  /// Shows steps alone that hold this text.
  void Filter(const QString& text);
  /// Takes back the step that is chosen in the list; tells where that cannot be.
  void TakeBack();
  void ExportTo(const std::string& path);

 signals:
  void StepChosen(quint64 serial, const QString& key);

 protected:
  void showEvent(QShowEvent* event) override;

 private:
  /// Keeps a journal or not, as was chosen.
  void Apply();
  void Read();
  void Fill();
  void GoToChange(const QTreeWidgetItem* item);
  const JournalStep* ChosenStep() const;
  std::vector<JournalStep> Matching() const;
  void SyncButtons();

  EditSession& session_;
  Host& host_;
  Program& program_;
  std::function<void()> commit_;
  bool wantsNew_ = false;  ///< Chosen for a setup that has no file yet.
  std::string path_;       ///< Of the journal that was read.
  FileStamp read_;
  bool isStale_ = true;
  Journal journal_;
  QComboBox* keep_;
  QLineEdit* filter_;
  QLabel* told_;
  QTreeWidget* list_;
  QToolButton *takeBack_, *export_;
};

}  // namespace tervane
