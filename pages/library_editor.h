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
#include "edits/edited_file.h"
#include "forms/page.h"
#include "forms/plots.h"
#include "libraries/library.h"

namespace tervane {

class LibraryEditor : public EditedFile {
 public:
  LibraryEditor(const LibraryKind& kind, std::string path);
  ~LibraryEditor() override;

  const LibraryKind& Kind() const { return *library_.kind; }

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
  /// What was typed and typed back is no change.
  bool IsModified() const override;

 protected:
  std::string Read() override;
  FileResult Write(const std::string& path, ProgressPart progress) override;
  void Saved() override;

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
  class StateStep;

  State Now() const;
  void GoTo(const State& state);
  void Insert(LibraryEntry entry, const std::string& action);
  void Check();
  std::string ActionName(const char* verb) const;

  Library library_;
  std::size_t current_ = 0;
  State shadow_, saved_;
  const void* source_ = nullptr;
  std::chrono::steady_clock::time_point latest_;
  std::vector<LibraryFinding> findings_;
  CYbSEDocument document_;
  std::unique_ptr<Node> node_;
};

}  // namespace tervane
