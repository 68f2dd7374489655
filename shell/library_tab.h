// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "pages/library_editor.h"
#include "shell/editors/edit_tab.h"

class QListWidget;
class QToolButton;

namespace tervane {

class PageView;

/// A library in its tab: its entries at the left, the chosen one as a page.
class LibraryTab : public EditTab {
  Q_OBJECT

 public:
  LibraryTab(const LibraryKind& kind, const std::string& path, Host& host);
  ~LibraryTab() override;

  LibraryEditor& Editor() { return editor_; }
  const LibraryEditor& Editor() const { return editor_; }
  EditedFile& File() override { return editor_; }

  void Commit() override;
  Host::FileQuestion NameQuestion() const override;
  void Redraw() override;

 protected:
  void Sync() override;
  /// The page bears the file's name.
  void Renamed() override { BuildPage(); }

 private:
  QWidget* BuildList();
  void BuildPage();
  void Act(void (LibraryEditor::*operation)());

  LibraryEditor editor_;
  QListWidget* list_;
  QToolButton *add_, *copy_, *delete_;
  QWidget* pagePlace_;
  PageView* page_ = nullptr;
};

}  // namespace tervane
