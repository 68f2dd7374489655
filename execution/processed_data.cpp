// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/processed_data.h"

#include <fmt/format.h>

#include "core/kvf.h"
#include "execution/processed_pages.h"
#include "platform/paths.h"

namespace tervane {

void CPreprocessedDataManager::Load() {
  while (CYbSEKvfBase* page = root_.GetFirstChild()) root_.RemoveChild(page);
  pageCount_ = 0;
  problem_.clear();
  readPath_ = path_;
  // Stamped before it is read: a change in between shows at the next look.
  readStamp_ = StampOf(path_);
  if (!readStamp_.exists) return;

  kvfGetErrorGlb();  // what an earlier reader left
  KvfFile* file = kvfLoadFile(path_, 0);
  if (kvfGetErrorGlb() != kKvfNoError) {
    problem_ = kvfErrorText();
  } else if (KvfNode* top = kvfSectionByNameNum(kvfTargetByNum(file, 1), "PAGE", 1)) {
    pageCount_ = BuildPreprocessedPages(top, std::make_shared<const std::string>(FolderOf(path_)), root_);
  } else {
    problem_ = fmt::format("{}: the report has no pages: a section PAGE was expected in its first target", path_);
  }
  kvfClose(&file);
}

CPreprocessedDataManager::OnDisk CPreprocessedDataManager::CheckDisk() const {
  if (path_ != readPath_) return OnDisk::Changed;
  const FileStamp stamp = StampOf(path_);
  if (stamp == readStamp_) return OnDisk::AsRead;
  return stamp.exists ? OnDisk::Changed : OnDisk::Gone;
}

std::string CPreprocessedDataManager::StateText() const {
  if (!problem_.empty()) return problem_;
  if (CheckDisk() == OnDisk::Gone) return "The report is no more on disk. The pages are those that it had.";
  if (!readStamp_.exists) return "There is no report yet: the preprocessor writes it.";
  return fmt::format("{} {}", pageCount_, pageCount_ == 1 ? "page" : "pages");
}

void CProcDataKvf::SetPath(std::string path) {
  if (!manager_) manager_ = std::make_unique<CPreprocessedDataManager>(*this);
  manager_->SetPath(std::move(path));
}

}  // namespace tervane
