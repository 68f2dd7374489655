// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What the preprocessor made of a setup, as pages below "Processed data": read from its report, and again when the
// report changes.
#pragma once

#include <memory>
#include <string>

#include "core/node.h"
#include "execution/pages.h"
#include "platform/files.h"

namespace tervane {

/// Makes the pages of a report below a node, and knows when they are to be made anew.
class CPreprocessedDataManager {
 public:
  explicit CPreprocessedDataManager(CYbSEKvfBase& root) : root_(root) {}

  void SetPath(std::string path) { path_ = std::move(path); }
  /// Full path of the report.
  const std::string& Path() const { return path_; }

  /// Removes all pages and makes those of the report, none where it cannot be read.
  void Load();
  enum class OnDisk { AsRead, Changed, Gone };
  /// Compares the report with what was read: by its path, size and time. Before the first reading it has changed; one
  /// that was not there when it was to be read is no change until it comes.
  OnDisk CheckDisk() const;

  /// Why the report gave no pages, with its file and place; empty when it gave some, or when there is no report.
  const std::string& Problem() const { return problem_; }
  int PageCount() const { return pageCount_; }
  /// In one sentence what the pages stand for.
  std::string StateText() const;

 private:
  CYbSEKvfBase& root_;
  std::string path_;
  std::string readPath_;  ///< Of the report that was read last.
  FileStamp readStamp_;
  std::string problem_;
  int pageCount_ = 0;
};

/// The entry above all processed data. It has no section: its pages are never saved.
class CProcDataKvf : public CYbSEKvfBase {
 public:
  explicit CProcDataKvf(CYbSEKvfBase* parent) : CYbSEKvfBase("Processed data", "ProcData", parent) {
    SetSectionUsed(0);
  }

  /// Says where the report is, and makes the manager that reads it when it is told to.
  void SetPath(std::string path);
  /// Null until a path was set.
  CPreprocessedDataManager* Manager() const { return manager_.get(); }

  const PageClass* GetDlgRuntimeClass(int treeId) const override {
    return treeId == kProcessedDataTree ? &kProcDataPage : nullptr;
  }
  bool HoldsSetup() const override { return false; }
  int AddToOverview(std::vector<OverviewLine>& /*lines*/, int /*level*/) override { return 1; }

 private:
  std::unique_ptr<CPreprocessedDataManager> manager_;
};
inline constexpr ImportantName<CProcDataKvf> kProcessedData{"PROCESSED_DATA"};

}  // namespace tervane
