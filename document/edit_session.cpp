// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/edit_session.h"

#include <algorithm>
#include <filesystem>
#include <new>

#include <fmt/format.h>

#include "core/open_kvf.h"
#include "platform/os.h"
#include "platform/paths.h"
#include "platform/text.h"
#include "results/grid_series.h"

namespace tervane {

namespace {

namespace fs = std::filesystem;

/// Data, items added and deleted, the tree, the order: what undo may have changed.
constexpr int kAllHints = 1 | 2 | 4 | 8 | 16;

std::string HashText(std::string_view content) { return fmt::format("{:016x}", HashOf(content)); }

}  // namespace

EditSession::EditSession(std::string recoveryFolder) : recoveryFolder_(std::move(recoveryFolder)) {}

EditSession::~EditSession() {
  RemoveAutosavesBut({});
  try {
    if (journal_ && IsModified()) journal_->TakeEvent(*document_, "Close Without Saving");
  } catch (const std::exception&) {
    // The journal lacks its last line; nothing else is left to be done.
  }
}

// ---- Opening

std::unique_ptr<EditSession> EditSession::New(std::string recoveryFolder) {
  std::unique_ptr<EditSession> session(new EditSession(std::move(recoveryFolder)));
  session->Begin();
  return session;
}

std::unique_ptr<EditSession> EditSession::Open(const std::string& path, std::string recoveryFolder,
                                               std::string& error) {
  std::unique_ptr<EditSession> session(new EditSession(std::move(recoveryFolder)));
  // Before it is read, so that no change of another program comes between.
  session->TakeLock(path);
  try {
    if (!session->Load(path, error)) return nullptr;
    session->Begin();
  } catch (const std::bad_alloc&) {
    error = fmt::format("{}: there is not enough memory for this setup", path);
    return nullptr;
  }
  return session;
}

std::unique_ptr<EditSession> EditSession::Recover(const Recovery& recovery, std::string recoveryFolder,
                                                  std::string& error) {
  AutosaveContent content;
  if (!ReadAutosave(recovery.autosave, content, error)) return nullptr;
  if (content.process.IsOnThisHost() && content.process.MayRun()) {
    error = fmt::format("{}: another window has recovered these changes already", recovery.autosave);
    return nullptr;
  }
  std::unique_ptr<EditSession> session(new EditSession(std::move(recoveryFolder)));
  CFlowModelDoc& document = *session->document_;
  if (!document.OpenText(content.text, recovery.setup)) {
    error = document.Error();
    return nullptr;
  }
  // What holds for the file on disk, above all that it must be kept beside the first save, holds for its changed copy.
  EditSession original({});
  std::string whyGone;
  if (!recovery.setup.empty() && original.Load(recovery.setup, whyGone)) {
    document.Continue(*original.document_);
    session->known_ = original.known_;
    if (content.basedOn != original.known_.hash) session->known_ = {std::nullopt, content.basedOn};
    session->TakeLock(recovery.setup);
  } else {
    session->formerPath_ = recovery.setup;
    document.BecomeNew();
  }
  session->recovered_ = true;
  session->autosaves_.push_back(recovery.autosave);
  session->Begin();
  // From now on the changes are this program's, and offered to no other.
  session->changes_ = 1;
  session->Autosave();
  session->autosaveError_.clear();
  return session;
}

bool EditSession::Load(const std::string& path, std::string& error) {
  // Stamped before it is read: a change in between shows at the next look.
  known_.stamp = StampOf(path);
  FileContent content;
  if (const FileResult result = ReadWholeFile(path, content); !result.Ok()) {
    error = result.error;
    return false;
  }
  known_.hash = HashText(content.Text());
  if (!document_->OpenText(content.Text(), path)) {
    error = document_->Error();
    return false;
  }
  return true;
}

void EditSession::TakeLock(const std::string& path) {
  std::error_code error;
  if (!os::MayWrite(path, error)) {
    readOnlyReason_ = fmt::format("it is write-protected: {}", error.message());
  } else if (lock_.Take(path) != SetupLock::Outcome::Taken) {
    readOnlyReason_ = lock_.Reason();
  }
}

void EditSession::Begin() { undo_ = std::make_unique<UndoStack>(document_->Root()); }

// ---- Changes

void EditSession::UpdateDoc(CYbSEKvfBase& node, int hint, const std::string& action, const void* source,
                            std::string control) {
  if (hint == 0) {
    if (listener_) listener_(hint);
    return;
  }
  ++changes_;
  if (document_->Root().TakeRevalidateAll())
    document_->Root().Validate();
  else
    node.Validate();
  if (hint & kFollowsFromStep) {
    undo_->Join();
    if (journal_) journal_->Take(*document_, action, PathOf(node));
    if (listener_) listener_(hint);
    return;
  }
  // A value that validation mends belongs to the step that made it wrong. What undo does not know of, such as the
  // custom result folder, counts as a change all the same.
  if (!undo_->Commit(action, source, std::chrono::steady_clock::now(), {node.Serial(), std::move(control)}))
    document_->SetModified(true);
  if (journal_) journal_->Take(*document_, action, PathOf(node));
  if (listener_) listener_(hint);
}

void EditSession::JoinStep() {
  undo_->Join();
  if (journal_) journal_->Take(*document_, undo_->UndoName(), {});
}

void EditSession::ValidateAllAndNotify(const std::string& action) {
  ++changes_;
  document_->Root().TakeRevalidateAll();
  document_->Root().Validate();
  if (journal_) journal_->Take(*document_, action, {});
  if (listener_) listener_(kAllHints);
}

bool EditSession::Undo() {
  const std::string name = undo_->UndoName();
  if (!undo_->Undo()) return false;
  ValidateAllAndNotify("Undo " + name);
  return true;
}

bool EditSession::Redo() {
  const std::string name = undo_->RedoName();
  if (!undo_->Redo()) return false;
  ValidateAllAndNotify("Redo " + name);
  return true;
}

void EditSession::KeepJournal(bool keeps) {
  if (keeps == KeepsJournal()) return;
  journal_ = keeps ? std::make_unique<JournalKeeper>(*document_) : nullptr;
}

std::string EditSession::TakeBack(const JournalStep& step) {
  std::string problem;
  if (CYbSEKvfBase* node = TakeBackStep(*document_, step, problem))
    UpdateDoc(*node, kAllHints, fmt::format("Take Back {}", step.action));
  return problem;
}

bool EditSession::IsModified() const { return recovered_ || document_->IsModified() || !undo_->IsSaved(); }

bool EditSession::HasChangesToSave() const {
  if (!IsModified() || recovered_) return recovered_;
  // Without its file all would be lost that the file does not hold.
  if (!Path().empty() && !FileExists(Path())) return true;
  // What the file means is held against what a save would write: keys that it lacks are no change.
  CFlowModelDoc before;
  if (!Path().empty() && !before.OnOpenDocument(Path())) return true;
  return !Differences(before).empty();
}

std::vector<SetupDifference> EditSession::Differences(const CFlowModelDoc& before) const {
  return CompareDocuments(before, *document_);
}

// ---- The file

EditSession::OnDisk EditSession::CheckDisk() {
  if (Path().empty()) return OnDisk::AsKnown;
  const FileStamp stamp = StampOf(Path());
  if (stamp == known_.stamp) return OnDisk::AsKnown;
  if (!stamp.exists) return OnDisk::Gone;
  FileContent content;
  if (!ReadWholeFile(Path(), content).Ok() || HashText(content.Text()) != known_.hash) return OnDisk::Changed;
  known_.stamp = stamp;
  return OnDisk::AsKnown;
}

void EditSession::AcceptDisk() {
  if (Path().empty()) return;
  known_.stamp = StampOf(Path());
  FileContent content;
  if (ReadWholeFile(Path(), content).Ok()) known_.hash = HashText(content.Text());
}

bool EditSession::SaveAs(const std::string& path) {
  error_.clear();
  if (path.empty()) {
    error_ = "the setup was never saved: choose a name for it";
    return false;
  }
  SetupLock lock;
  const bool isInPlace = !Path().empty() && RealPath(path) == RealPath(Path());
  if (!isInPlace && lock.Take(path) != SetupLock::Outcome::Taken)
    error_ = fmt::format("{} is not written: {}", path, lock.Reason());
  else if (isInPlace && IsReadOnly())
    error_ = fmt::format("{} is not written: {}; save under another name", path, readOnlyReason_);
  else if (isInPlace && CheckDisk() == OnDisk::Changed)
    error_ = fmt::format("{} is not written: another program has changed it; keep yours or open it again", path);
  else if (!document_->OnSaveDocument(path))
    error_ = document_->Error();
  if (!error_.empty()) return false;

  if (!isInPlace) {
    std::swap(lock_, lock);
    readOnlyReason_.clear();
  }
  // What the file no longer holds is gone here, too.
  if (auto* gridSeries = document_->Root().Important(kOutputGridSeries); gridSeries && gridSeries->RefreshItems())
    undo_->Join();
  undo_->MarkSaved();
  recovered_ = false;
  formerPath_.clear();
  keptChanges_ = changes_;
  RemoveAutosavesBut({});
  // Of what was written, not of what stands there: another program may have been as quick.
  std::string reason;
  known_ = {std::nullopt, HashText(AutosaveText(reason))};
  if (journal_) journal_->TakeEvent(*document_, "Save");
  return true;
}

std::vector<SetupDifference> EditSession::WhatWillBeSaved(std::string& error) const {
  error.clear();
  OpenKvf before;
  if (Path().empty() || !FileExists(Path())) {
    before.reset(CFlowModelDoc().BuildFile({}));
  } else {
    kvfGetErrorGlb();  // what an earlier reader left
    before.reset(kvfLoadFile(Path(), 0));
    if (kvfGetErrorGlb() != kKvfNoError) {
      error = kvfErrorText();
      return {};
    }
  }
  const OpenKvf after(document_->BuildFile(document_->Root().SetupFolder()));
  return CompareFiles(*before, *after, document_->Root().GetTargetName());
}

// ---- Autosave

bool EditSession::NeedsAutosave() const { return changes_ != keptChanges_; }

std::string EditSession::AutosaveText(std::string& error) const {
  std::string text;
  document_->BuildText(document_->Root().SetupFolder(), text, error);
  return text;
}

std::string EditSession::Autosave() {
  if (!IsModified()) {
    keptChanges_ = changes_;
    RemoveAutosavesBut({});
    return {};
  }
  const std::string& setup = Path().empty() ? formerPath_ : Path();
  std::string failure;
  AutosaveContent content{{}, known_.hash, RunningProcess::This(), AutosaveText(failure)};
  if (!setup.empty()) content.setup = TextOfPath(fs::absolute(NativePath(setup)));

  const auto isOwn = [&](const std::string& place) {
    return std::find(autosaves_.begin(), autosaves_.end(), place) != autosaves_.end();
  };
  const auto keepAt = [&](const std::string& place) {
    const FileResult result = WriteAutosave(place, content);
    if (failure.empty()) failure = result.error;
    if (!result.Ok()) return false;
    if (!isOwn(place)) autosaves_.push_back(place);
    RemoveAutosavesBut(place);
    return true;
  };
  bool isKept = false;
  if (failure.empty()) {
    // The place beside the setup is that of the lock's holder alone.
    const std::string beside = lock_.IsTaken() ? AutosaveBeside(Path()) : std::string();
    isKept = !beside.empty() && (isOwn(beside) || MayReplaceAutosave(beside, Path())) && keepAt(beside);
    if (!isKept) {
      const auto known = std::find_if(autosaves_.begin(), autosaves_.end(),
                                      [&](const std::string& place) { return FolderOf(place) == recoveryFolder_; });
      std::error_code ignored;
      fs::create_directories(NativePath(recoveryFolder_), ignored);
      isKept = keepAt(known == autosaves_.end() ? NewAutosaveName(setup, recoveryFolder_) : std::string(*known));
    }
  }
  if (isKept) {
    keptChanges_ = changes_;
    autosaveError_.clear();
    return {};
  }
  failure = fmt::format("the unsaved changes cannot be kept: {}", failure);
  return std::exchange(autosaveError_, failure) == failure ? std::string() : failure;
}

void EditSession::RemoveAutosavesBut(const std::string& kept) {
  std::error_code ignored;
  for (const std::string& place : autosaves_)
    if (place != kept) fs::remove(NativePath(place), ignored);
  std::erase_if(autosaves_, [&](const std::string& place) { return place != kept; });
}

}  // namespace tervane
