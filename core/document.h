// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "core/engine_shell.h"
#include "core/node.h"

namespace tervane {

/// What a program shows after opening a setup: what the reading met, and what the file holds that nothing reads.
struct LoadReport {
  enum class Kind { Note, Warning };
  struct Entry {
    Kind kind;
    int line;          ///< 0 when it speaks of no line.
    std::string path;  ///< Of the node; may be empty.
    std::string key;   ///< May be empty.
    std::string text;
  };

  std::vector<Entry> entries;
  std::vector<KvfUnread> unread;

  bool IsEmpty() const { return entries.empty() && unread.empty(); }
};

/// The document of a setup editor, without its window: the file, its result folder, and the road between file and tree.
class CYbSEDocument {
 public:
  explicit CYbSEDocument(std::unique_ptr<CYbSEKvfGlobalBase> root);
  virtual ~CYbSEDocument() = default;
  CYbSEDocument(const CYbSEDocument&) = delete;
  CYbSEDocument& operator=(const CYbSEDocument&) = delete;

  CYbSEKvfGlobalBase& Root() const { return *root_; }
  const std::string& PathName() const { return path_; }
  bool IsModified() const { return modified_; }
  void SetModified(bool modified) { modified_ = modified; }
  const LoadReport& Report() const { return report_; }

  /// Loads a setup into a tree at its defaults. False when the file cannot be read, is no parameter file or lacks the
  /// target: `Error` says why, and the document is not to be used.
  virtual bool OnOpenDocument(const std::string& path);
  /// The same from a text in memory; `path` stands for its place in messages and names.
  bool OpenText(std::string_view text, const std::string& path);
  /// Saves under that path, atomically. The first save over the file that was read keeps that file beside it when it
  /// was written by another version, or when its reading left something to report. False when it failed; the old file
  /// then stands.
  virtual bool OnSaveDocument(const std::string& path);
  const std::string& Error() const { return error_; }
  /// This document holds a changed copy of `other`, and will be saved in its place.
  void Continue(const CYbSEDocument& other) {
    path_ = other.path_;
    header_ = other.header_;
    original_ = other.original_;
  }
  /// From here on this is a setup that was never saved; the names of files in it keep their meaning.
  void BecomeNew() {
    path_.clear();
    original_ = {};
  }
  /// What the user should know of the latest save: where the original was kept, a hard link.
  const std::vector<std::string>& SaveNotes() const { return saveNotes_; }

  /// The file as it would be written to that folder; to be closed by the caller.
  KvfFile* BuildFile(const std::string& folder) const;
  /// The text of that file; empty with an error when it cannot be written.
  bool BuildText(const std::string& folder, std::string& text, std::string& error) const;

  // ---- Engines. What is set for a start stays for the later ones.

  /// The program that runs engines for this document, which outlives it; without one nothing runs.
  void SetEngineShell(EngineShell* shell) { engineShell_ = shell; }
  virtual void SetEngine(const std::string& fileName) { launch_.Engine = fileName; }
  void SetInputName(const std::string& path) { launch_.Input = path; }
  void SetExtraExecuteArgument(const std::string& options) { launch_.Options = options; }
  void SetExtraLog(const std::string& path) { launch_.ExtraLog = path; }
  /// Starts what was set. The first number tells whether a window shows the progress; the text and the other numbers
  /// are of no meaning here.
  void RunEnginePrg2(int showsProgress, const char* text, int, int, int, int);
  /// Non-zero while an engine runs this document.
  virtual int IsExecuting() const { return engineShell_ && engineShell_->IsExecuting() ? 1 : 0; }

  /// The folder of the results: the custom folder when it is in use, else BASENAME_results below the project's root, or
  /// beside the setup where its file names no root.
  std::string getResultFolder() const;
  bool UseCustomResultFolder = false;
  FileName CustomResultFolder;

 protected:
  EngineShell* GetEngineShell() const { return engineShell_; }
  /// A file that the engine must leave; set anew for each start.
  void SetReport(const std::string& path) { launch_.Report = path; }
  /// What the user should know of the save that is being done.
  void AddSaveNote(std::string note) { saveNotes_.push_back(std::move(note)); }
  /// Below which results lie, as the file holds it; mostly empty.
  const FileName& ProjectResultRoot() const { return projectResultRoot_; }
  /// What a kind of document does when its tree has been read.
  virtual void OnLoaded() {}
  void AddToReport(LoadReport::Kind kind, std::string text) {
    report_.entries.push_back({kind, 0, {}, {}, std::move(text)});
  }

 private:
  bool LoadTree(KvfFile* file, const std::string& path);
  /// Copies the file that was read beside it; false when that failed.
  bool KeepOriginal();
  bool IsOriginal(const std::string& path) const;

  std::unique_ptr<CYbSEKvfGlobalBase> root_;
  std::string path_;
  std::string error_;
  std::string header_;          ///< Comments in front of the first target.
  FileName projectResultRoot_;  ///< As the file holds it; other programs set it.
  LoadReport report_;
  std::vector<std::string> saveNotes_;
  bool modified_ = false;
  EngineShell* engineShell_ = nullptr;
  CYbSimpleLaunch launch_;

  /// The file that was read.
  struct Original {
    std::string path;
    int version = -1;
    bool mustBeKept = false;  ///< It holds what the next save will not.
  };
  Original original_;
};

}  // namespace tervane
