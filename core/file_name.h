// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

#include "platform/paths.h"

namespace tervane {

/// A file name as a setup holds it: the text as it stood, and the folder of the file that it was read from.
class FileName {
 public:
  FileName() = default;
  FileName(std::string text, std::string folder) : text_(std::move(text)), folder_(std::move(folder)) {}
  /// A name that the user picked: stored with `/`, relative to the setup's folder when it lies at or below it.
  static FileName Picked(std::string_view path, std::string_view setupFolder) {
    return {StoredPath(path, setupFolder), std::string(setupFolder)};
  }

  const std::string& Text() const { return text_; }
  const std::string& Folder() const { return folder_; }
  bool IsEmpty() const { return text_.empty(); }
  /// What to open: absolute when the folder is known. Empty stays empty.
  std::string Absolute() const { return ResolvedPath(text_, folder_); }

  /// The text as a file in `folder` must hold it to mean the same file: unchanged in the folder that it was read from
  /// (and where one of the folders is unknown), otherwise rebased.
  std::string TextIn(std::string_view folder) const {
    const bool stays = text_.empty() || folder == folder_ || folder.empty() || folder_.empty() || IsAbsolutePath(text_);
    return stays ? text_ : RelativePath(Absolute(), folder);
  }

  bool operator==(const FileName&) const = default;

 private:
  std::string text_;
  std::string folder_;
};

}  // namespace tervane
