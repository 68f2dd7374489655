// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A library while it is edited, without any toolkit: its entries, the one that is shown with its page, undo and saving.
#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "core/document.h"
#include "forms/page.h"
#include "forms/plots.h"
#include "libraries/library.h"

namespace tervane {

class LibraryEditor {
 public:
  LibraryEditor(const LibraryKind& kind, std::string path);
  ~LibraryEditor();
  LibraryEditor(const LibraryEditor&) = delete;
  LibraryEditor& operator=(const LibraryEditor&) = delete;

  const LibraryKind& Kind() const { return *library_.kind; }
  const std::string& Path() const { return path_; }
  /// Why the file cannot be edited; empty when it can.
  const std::string& Problem() const { return problem_; }
  /// Reads the file again and forgets all changes; what cannot be read takes nothing away.
  std::string Reload();
  /// Whether another program has changed the file since it was read or saved.
  bool IsOtherOnDisk() const;

  // ---- Entries, counted from 0

  const Library& Content() const { return library_; }
  std::size_t Current() const { return current_; }
  void Choose(std::size_t entry);
  /// Puts a new entry behind the current one and makes it the current one.
  void Add();
  void Duplicate();
  void Delete();
  bool HasFindings() const { return !findings_.empty(); }
  bool HasFindings(std::size_t entry) const;

  /// The page of the current entry. `changed` is called after every change, `soon` asks to show the page anew.
  std::unique_ptr<CYbSEDlgBase> MakePage(Host& host, std::function<void()> changed, std::function<void()> soon);

  // ---- Changes

  /// Takes what is different now as one step. Changes of one source in quick succession are one.
  void CommitValue(const std::string& action, const void* source = nullptr);
  bool CanUndo() const { return !undone_.empty(); }
  bool CanRedo() const { return !redone_.empty(); }
  std::string UndoName() const { return CanUndo() ? undone_.back().action : std::string(); }
  std::string RedoName() const { return CanRedo() ? redone_.back().action : std::string(); }
  void Undo() { Step(undone_, redone_); }
  void Redo() { Step(redone_, undone_); }
  bool IsModified() const;
  FileResult Save(const std::string& path);

 private:
  class Node;
  class Page;
  class Rows;

  /// All that a change may change. Entries that a step leaves alone are shared between states.
  struct State {
    std::vector<std::shared_ptr<const LibraryEntry>> entries;
    std::string atEnd;
    std::size_t current = 0;

    bool HoldsSame(const State& other) const;
  };
  struct Change {
    std::string action;
    State state;  ///< To go back to.
  };

  State Now() const;
  void GoTo(const State& state);
  void Step(std::vector<Change>& from, std::vector<Change>& to);
  /// Forgets all changes: what is held now is what the file has.
  void Begin();
  void Insert(LibraryEntry entry, const std::string& action);
  void Check();
  std::string ActionName(const char* verb) const;

  std::string path_, problem_;
  FileStamp stamp_;
  Library library_;
  std::size_t current_ = 0;
  State shadow_, saved_;
  std::vector<Change> undone_, redone_;
  const void* source_ = nullptr;
  std::chrono::steady_clock::time_point latest_;
  std::vector<LibraryFinding> findings_;
  CYbSEDocument document_;
  std::unique_ptr<Node> node_;
};

}  // namespace tervane
