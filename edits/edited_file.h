// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What all files have in common that a user changes in a tab of their own: undo, the mark of unsaved changes, saving in
// one step, and other programs that write the same file.
#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "platform/files.h"
#include "platform/progress.h"

namespace tervane {

/// Knows a file again by its content. Files beyond 1 GB are known by their size and time alone.
class KnownFile {
 public:
  /// Takes the file as it is now.
  void Remember(const std::string& path);
  /// Whether another content stands there now, or none.
  bool IsOther(const std::string& path);

 private:
  FileStamp stamp_;
  std::optional<FileStamp> other_;  ///< Of another content, which is not looked at again.
  std::string hash_;
};

/// One action of the user, which can be taken back and done again.
class EditStep {
 public:
  virtual ~EditStep() = default;
  /// Called before, for what may fail. "" or why the step cannot be made.
  virtual std::string Prepare() { return {}; }
  /// Puts what the step holds in the place of what it finds, and holds that.
  virtual void Swap() = 0;
  /// What the step takes of the memory.
  virtual std::size_t Bytes() const = 0;
};

/// A file while it is edited.
class EditedFile {
 public:
  explicit EditedFile(std::string path) : path_(std::move(path)) {}
  virtual ~EditedFile() = default;
  EditedFile(const EditedFile&) = delete;
  EditedFile& operator=(const EditedFile&) = delete;

  const std::string& Path() const { return path_; }
  /// Why the file cannot be edited or shown; empty when it can.
  const std::string& Problem() const { return problem_; }
  /// Why nothing can be saved in its place ("you may not write to the file"); empty when it can. Under another name it
  /// can.
  const std::string& WhyReadOnly() const { return whyHeld_.empty() ? whyReadOnly_ : whyHeld_; }
  /// Somebody else has it open; nobody with an empty text.
  void SetHeld(std::string why) { whyHeld_ = std::move(why); }

  /// Reads the file again and forgets all changes. "" or why not; what cannot be read takes nothing away.
  std::string Reload();
  /// Whether another program has changed or removed the file since it was read, saved or kept.
  bool IsOtherOnDisk() { return known_.IsOther(path_); }
  /// The user's own content is to stay: what stands on the disk now is no longer told.
  void KeepMine() { known_.Remember(path_); }
  /// Saves in one step; under another name, that is edited from then on. A failure leaves both files as they were.
  FileResult Save(const std::string& path, ProgressPart progress = {});

  virtual bool IsModified() const { return done_.size() != saved_ || isSavedLost_; }
  bool CanUndo() const { return !done_.empty(); }
  bool CanRedo() const { return !undone_.empty(); }
  std::string UndoName() const { return CanUndo() ? done_.back().name : std::string(); }
  std::string RedoName() const { return CanRedo() ? undone_.back().name : std::string(); }
  /// "" or why not; then nothing has changed.
  std::string Undo() { return Go(done_, undone_); }
  std::string Redo() { return Go(undone_, done_); }
  /// What all steps take of the memory.
  std::size_t BytesOfSteps() const { return bytes_; }

 protected:
  virtual std::string Read() = 0;
  /// Writes all; `path` may be that of the file.
  virtual FileResult Write(const std::string& path, ProgressPart progress) = 0;
  /// After `Write` has succeeded.
  virtual void Saved() {}
  /// After a step was done, taken back or done again.
  virtual void Stepped() {}

  /// The first reading, to be called by the constructor of the class that reads.
  void Begin() { problem_ = Reload(); }
  /// Takes a step that was done. The oldest ones go where they are too many or too large.
  void Take(std::string name, std::unique_ptr<EditStep> step);
  /// Forgets all steps: what is held now is what the file has.
  void ForgetSteps();

 private:
  struct NamedStep {
    std::string name;
    std::unique_ptr<EditStep> step;
  };

  std::string Go(std::vector<NamedStep>& from, std::vector<NamedStep>& to);
  void AskRights();

  std::string path_, problem_, whyReadOnly_, whyHeld_;
  KnownFile known_;
  std::vector<NamedStep> done_, undone_;
  std::size_t saved_ = 0;     ///< How many steps were done when the file was saved.
  bool isSavedLost_ = false;  ///< No undo leads there any more.
  std::size_t bytes_ = 0;
};

}  // namespace tervane
