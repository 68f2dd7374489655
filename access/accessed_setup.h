// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>

#include "core/host.h"
#include "document/flow_model_document.h"
#include "platform/files.h"

namespace tervane {

/// A setup in the hands of another program: opened from a file, or the tree of somebody else.
class AccessedSetup {
 public:
  /// What is to be told goes to `host`, which outlives the setup; without one it is only kept.
  explicit AccessedSetup(Host* host = nullptr) : host_(host) {}

  /// The tree: that of the file that was opened last, of somebody else, or a new one.
  CGlobal& Root() const { return hooked_ ? *hooked_ : document_->Global(); }
  /// The document of the tree; not of one from outside.
  CFlowModelDoc& Document() const { return *document_; }
  /// Works on a setup that somebody else has made, which was never saved.
  void Take(std::unique_ptr<CFlowModelDoc> document);
  /// Works on a tree from outside, which outlives this object.
  void Hook(CGlobal* root) { hooked_ = root; }
  /// Reads a setup with all that follows the reading. False, with the reason in `Error`, when it cannot be read; then
  /// the tree is a new one.
  bool Open(const std::string& path);
  /// Writes the setup in one step. An editor or command that has the file open is not overrun, nor is what another
  /// program has written into the file since it was read. False with the reason in `Error`, and the old file stands.
  bool Save(const std::string& path);
  const std::string& Error() const { return error_; }
  /// Tells a reason of the caller's; false.
  bool Refuse(std::string why) { return Fail(std::move(why)); }
  /// The folder of the file; empty while there is none.
  std::string Folder() const;

 private:
  bool Fail(std::string error);

  Host* host_;
  std::unique_ptr<CFlowModelDoc> document_ = std::make_unique<CFlowModelDoc>();
  CGlobal* hooked_ = nullptr;
  FileStamp stamp_;  ///< Of the document's file, as it was read or saved.
  std::string error_;
};

}  // namespace tervane
