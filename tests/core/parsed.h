// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

#include "core/kvf.h"
#include "core/kvf_parser.h"
#include "core/kvf_writer.h"
#include "platform/paths.h"

namespace tervane::test {

/// A parameter file, empty or from a text, closed at the end of a scope.
class Parsed {
 public:
  Parsed() : file_(kvfCreate()) {}
  explicit Parsed(std::string_view text, std::string_view path = "/setups/x.tvd") : Parsed() {
    file_->path = path;
    file_->folder = FolderOf(path);
    ok_ = ParseKvf(FileContent::Of(text), *file_);
  }
  ~Parsed() { kvfClose(&file_); }
  Parsed(const Parsed&) = delete;
  Parsed& operator=(const Parsed&) = delete;

  bool Ok() const { return ok_; }
  /// Empty when the text was accepted.
  const std::string& Message() const { return file_->syntaxError.message; }
  KvfFile* File() const { return file_; }
  KvfNode* Target(int number = 1) const { return kvfTargetByNum(file_, number); }
  /// The tree as text, or why it has none.
  std::string Written() const {
    std::string text, error;
    return WriteKvfText(*file_, text, error) ? text : "cannot write: " + error;
  }

 private:
  KvfFile* file_;
  bool ok_ = true;
};

}  // namespace tervane::test
