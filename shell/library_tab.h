// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QWidget>
#include <string>

#include "pages/library_editor.h"

class QListWidget;
class QToolButton;

namespace tervane {

class PageView;

/// A library in its tab: its entries at the left, the chosen one as a page.
class LibraryTab : public QWidget {
  Q_OBJECT

 public:
  LibraryTab(const LibraryKind& kind, const std::string& path, Host& host);
  ~LibraryTab() override;

  LibraryEditor& Editor() { return editor_; }
  const LibraryEditor& Editor() const { return editor_; }
  const std::string& Path() const { return editor_.Path(); }
  /// The name of the file, and the same with a star when there are changes to save.
  QString Name() const;
  QString Title() const;

  /// Hands over what was typed and not yet entered; to be called before every command.
  void Commit();
  void Undo();
  void Redo();
  /// False when it failed; the user has been told why.
  bool Save(const std::string& path);
  /// Follows another program that has changed the file, unless there are changes to save.
  void CheckDisk();
  /// Reads the file again and throws the changes away that were not saved; the user is told when it cannot be read.
  void Reload();
  /// Makes all anew that was computed from colours and sizes.
  void Redraw();

 signals:
  /// The title or what can be undone is another one.
  void StateChanged();

 private:
  QWidget* BuildList();
  void BuildPage();
  void Sync();
  void Act(void (LibraryEditor::*operation)());

  LibraryEditor editor_;
  Host& host_;
  QListWidget* list_;
  QToolButton *add_, *copy_, *delete_;
  QWidget* pagePlace_;
  PageView* page_ = nullptr;
};

}  // namespace tervane
