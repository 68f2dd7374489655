// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/accessed_setup.h"

#include "core/open_kvf.h"
#include "document/journal.h"
#include "document/setup_lock.h"
#include "platform/paths.h"

namespace tervane {

bool AccessedSetup::Fail(std::string error) {
  error_ = std::move(error);
  if (host_) host_->ShowMessage(error_, Host::Icon::Error);
  return false;
}

bool AccessedSetup::Open(const std::string& path) {
  hooked_ = nullptr;
  error_.clear();
  document_ = std::make_unique<CFlowModelDoc>();
  // Before the reading, so that a change meanwhile is noticed.
  stamp_ = StampOf(path);
  if (document_->OnOpenDocument(path)) return true;
  std::string why = document_->Error();
  // What was read of a file before it failed is no setup.
  document_ = std::make_unique<CFlowModelDoc>();
  return Fail(std::move(why));
}

void AccessedSetup::Take(std::unique_ptr<CFlowModelDoc> document) {
  hooked_ = nullptr;
  error_.clear();
  document_ = std::move(document);
}

bool AccessedSetup::Save(const std::string& path) {
  error_.clear();
  SetupLock lock;
  if (lock.Take(path, SetupLock::Purpose::OneChange) == SetupLock::Outcome::Held)
    return Fail(path + ": " + lock.Reason());
  if (!hooked_) {
    const std::string& read = document_->PathName();
    const bool isSame = !read.empty() && (path == read || IsSameFile(path, read));
    if (isSame && StampOf(path) != stamp_)
      return Fail(path +
                  ": another program has changed it since it was read; open it again, or save under another name");
    std::string trouble;
    if (!SaveKeepingJournal(*document_, path, "Save by a Program", trouble)) return Fail(document_->Error());
    if (!trouble.empty() && host_) host_->ShowMessage(trouble, Host::Icon::Warning);
    stamp_ = StampOf(path);
    return true;
  }
  const OpenKvf file(kvfCreate());
  kvfGetErrorGlb();  // what an earlier writer left
  file->folder = FolderOf(path);
  hooked_->Save(file.get());
  kvfWrite(file.get(), path);
  return kvfGetErrorGlb() == kKvfNoError || Fail(kvfErrorText());
}

std::string AccessedSetup::Folder() const {
  if (hooked_) return hooked_->SetupFolder();
  return document_->PathName().empty() ? std::string() : std::string(FolderOf(document_->PathName()));
}

}  // namespace tervane
