// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <QWidget>
#include <array>
#include <string>

#include "access/file_merge.h"
#include "core/host.h"
#include "platform/files.h"

class QLabel;
class QTableWidget;

namespace tervane {

/// The files of a merge.
struct MergeFiles {
  std::string base, mine, theirs;
};

/// What comes of a merge of two setups that were made from one: each conflict with its three values, of which the user
/// takes one, and the merged setup to be saved.
class MergeView : public QWidget {
  Q_OBJECT

 public:
  MergeView(MergeFiles files, Host& host);

  /// "Merge of karup.tvd and other.tvd"
  QString Title() const;
  /// Why the files cannot be merged; empty when they can.
  const std::string& Problem() const { return merge_.result.problem; }
  const std::vector<MergeConflict>& Conflicts() const { return merge_.result.conflicts; }
  void Take(std::size_t conflict, MergeSide side);
  void TakeAll(MergeSide side);
  /// Writes the merged setup. False, with a message, where that fails or a file is another one than was merged.
  bool SaveTo(const std::string& path);

 signals:
  void Saved(const QString& path);

 private:
  /// Merges anew, by what the user has taken.
  void Merge();
  std::array<FileStamp, 3> Stamps() const {
    return {StampOf(files_.base), StampOf(files_.mine), StampOf(files_.theirs)};
  }
  void Fill();
  void AskAndSave();

  MergeFiles files_;
  Host& host_;
  MergeChoices choices_;
  std::array<FileStamp, 3> stamps_;  ///< Of the files as they were merged.
  FileMerge merge_;
  QLabel* summary_;
  QTableWidget* table_;
};

}  // namespace tervane
