// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QPointer>
#include <QTimer>
#include <QWidget>
#include <string>

#include "core/host.h"
#include "document/setup_lock.h"
#include "edits/edited_file.h"

class QVBoxLayout;

namespace tervane {

class Banner;

/// A file that is edited in its tab. What the window asks of each kind is here: its title, undo, saving, and what
/// happens when another program writes the same file.
class EditTab : public QWidget {
  Q_OBJECT

 public:
  explicit EditTab(Host& host);
  ~EditTab() override;

  virtual EditedFile& File() = 0;
  const EditedFile& File() const { return const_cast<EditTab*>(this)->File(); }
  const std::string& Path() const { return File().Path(); }
  /// The name of the file, and the same with a star when there are changes to save.
  QString Name() const;
  QString Title() const;

  /// Hands over what was typed and not yet entered; to be called before every command.
  virtual void Commit() {}
  void Undo() { Step(&EditedFile::Undo); }
  void Redo() { Step(&EditedFile::Redo); }
  /// False when it failed; the user has been told why.
  bool Save(const std::string& path);
  /// What the dialog for another name asks.
  virtual Host::FileQuestion NameQuestion() const = 0;
  /// Follows another program that has changed the file; where there are changes to save, it asks in a banner.
  void CheckDisk();
  /// Reads the file again and throws the changes away that were not saved; the user is told when it cannot be read.
  void Reload();
  /// Makes all anew that was computed from colours and sizes.
  virtual void Redraw() { Sync(); }

 signals:
  /// The title or what can be undone is another one.
  void StateChanged();
  /// Who reads the file must read it again.
  void FileSaved(const QString& path);

 protected:
  /// What the tab shows, above its banners. Called once by the constructor of each kind.
  void SetBody(QWidget* body);
  /// Keeps other editors from writing the file as long as it is edited here; where another one has it, it is read-only.
  /// To be called once, after `SetBody`.
  void HoldFile();
  /// Shows the file as it is now.
  virtual void Sync() = 0;
  /// The same of a file that was read anew, which may hold other things.
  virtual void Reread() { Sync(); }
  /// After a save under another name.
  virtual void Renamed() {}
  Host& Outside() const { return host_; }
  void showEvent(QShowEvent* event) override;

 private:
  void Step(std::string (EditedFile::*step)());
  void ShowReadOnly();

  Host& host_;
  QVBoxLayout* all_;
  QPointer<Banner> diskBanner_, readOnlyBanner_;
  QTimer disk_;
  SetupLock lock_;
  bool isHolding_ = false;
};

}  // namespace tervane
