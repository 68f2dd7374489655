// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// One setup that is being edited, without its window: the document, undo, the lock against other editors, the autosave,
// and what is known of the file on disk.
#pragma once

#include <cstddef>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "core/undo.h"
#include "document/flow_model_document.h"
#include "document/journal.h"
#include "document/recovery.h"
#include "document/setup_diff.h"
#include "document/setup_lock.h"
#include "platform/files.h"

namespace tervane {

class EditSession {
 public:
  /// What views are told after a change; `hint` as of a page's update, all its bits after undo.
  using Listener = std::function<void(int hint)>;

  /// A new setup at its defaults. `recoveryFolder` is a folder of the user's for autosaves that cannot stand beside the
  /// setup; created when it is first needed.
  static std::unique_ptr<EditSession> New(std::string recoveryFolder);
  /// Opens a setup and takes its lock. Where another living editor holds it, or the folder or file cannot be written,
  /// the session is read-only. Null, with the reason in `error`, when the file cannot be opened.
  static std::unique_ptr<EditSession> Open(const std::string& path, std::string recoveryFolder, std::string& error);
  /// Opens what an autosave kept, in the place of the setup that it was made of; it is modified. An autosave of a setup
  /// that was never saved, or whose file is gone, opens as a new one. Null as above.
  static std::unique_ptr<EditSession> Recover(const Recovery& recovery, std::string recoveryFolder, std::string& error);
  /// Gives the lock back and removes the autosave: the user has saved, or does not want the changes.
  ~EditSession();
  EditSession(const EditSession&) = delete;
  EditSession& operator=(const EditSession&) = delete;

  CFlowModelDoc& Document() const { return *document_; }
  /// Empty for a setup that was never saved.
  const std::string& Path() const { return document_->PathName(); }

  // ---- Changes

  void Listen(Listener listener) { listener_ = std::move(listener); }
  /// Takes what a user did as one step to undo, validates `node` and what is below it (or all, where that was asked
  /// for), and tells the listener. Hint 0 tells the listener and does nothing else: the document is as it was.
  /// `control` is the name of the control on the node's page in which it was done, if it was in one.
  void UpdateDoc(CYbSEKvfBase& node, int hint, const std::string& action, const void* source = nullptr,
                 std::string control = {});
  /// What was changed since is a part of the latest step; nobody is told.
  void JoinStep();
  bool Undo();
  bool Redo();
  const UndoStack& Steps() const { return *undo_; }
  bool IsModified() const;
  /// Whether a save would change the file: not so after a change that was taken back, or one of what is shown alone.
  bool HasChangesToSave() const;

  // ---- Journal

  /// Whether each step is written into the journal beside the setup. One without a file keeps its steps until it has.
  void KeepJournal(bool keeps);
  bool KeepsJournal() const { return journal_ != nullptr; }
  /// Why the journal cannot be written, told once; the work goes on.
  std::string TakeJournalTrouble() { return journal_ ? journal_->TakeTrouble() : std::string(); }
  /// Takes back a step of the journal on its own, as a step of its own; why that cannot be, or nothing.
  std::string TakeBack(const JournalStep& step);

  // ---- The file

  bool IsReadOnly() const { return !readOnlyReason_.empty(); }
  /// Who holds the setup or why it cannot be written, as a sentence for the user.
  const std::string& ReadOnlyReason() const { return readOnlyReason_; }

  enum class OnDisk { AsKnown, Changed, Gone };
  /// Compares the file with what was last read or written here: by size and time, and where these differ by content.
  OnDisk CheckDisk();
  /// The user knows of the change on disk and keeps his own: later checks are silent until the file changes again.
  void AcceptDisk();

  /// False with the reason in `Error` when it failed; a read-only session saves under another path alone. Saving under
  /// another path moves the lock; a path that another living editor holds is refused. So is saving over a change on
  /// disk that was not accepted.
  bool Save() { return SaveAs(Path()); }
  bool SaveAs(const std::string& path);
  const std::string& Error() const { return error_; }
  /// What a save would change in the file on disk, or in an empty setup where there is none. Empty with an error when
  /// the file cannot be read.
  std::vector<SetupDifference> WhatWillBeSaved(std::string& error) const;

  // ---- Autosave

  /// True when changes were made since the last save or autosave.
  bool NeedsAutosave() const;
  /// Keeps the changes; what is wrong (a full disk) is told once in the result, and the work goes on.
  std::string Autosave();

 private:
  explicit EditSession(std::string recoveryFolder);
  /// Reads the setup and what is known of its file.
  bool Load(const std::string& path, std::string& error);
  /// Takes the lock of the setup, or finds why it cannot be written.
  void TakeLock(const std::string& path);
  /// Ends what loading began.
  void Begin();
  void ValidateAllAndNotify(const std::string& action);
  /// What a save would write otherwise than one of that document.
  std::vector<SetupDifference> Differences(const CFlowModelDoc& before) const;
  std::string AutosaveText(std::string& error) const;
  void RemoveAutosavesBut(const std::string& kept);

  /// What is known of the file on disk.
  struct Disk {
    std::optional<FileStamp> stamp;  ///< Nothing: the next look compares the content.
    std::string hash;                ///< Of its content; empty while there was no file.
  };

  std::string recoveryFolder_;
  std::unique_ptr<CFlowModelDoc> document_ = std::make_unique<CFlowModelDoc>();
  std::unique_ptr<UndoStack> undo_;
  std::unique_ptr<JournalKeeper> journal_;
  Listener listener_;
  SetupLock lock_;
  std::string readOnlyReason_;
  std::string error_;
  Disk known_;
  bool recovered_ = false;  ///< Holds changes of an autosave that were not saved yet.
  std::string formerPath_;  ///< Of a recovered setup whose file was gone.

  std::size_t changes_ = 0;
  std::size_t keptChanges_ = 0;         ///< Number of the change up to which all is saved or autosaved.
  std::vector<std::string> autosaves_;  ///< Those of this session, nearly always one.
  std::string autosaveError_;           ///< Was told already.
};

}  // namespace tervane
