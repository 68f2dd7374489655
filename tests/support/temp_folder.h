// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>

namespace tervane::test {

/// A fresh folder for one test, removed with everything in it at the end.
class TempFolder {
 public:
  TempFolder();
  ~TempFolder();
  TempFolder(const TempFolder&) = delete;
  TempFolder& operator=(const TempFolder&) = delete;

  const std::string& Path() const { return path_; }
  std::string File(std::string_view name) const { return path_ + "/" + std::string(name); }
  /// Writes a file in the folder (subfolders are made) and gives its path.
  std::string Write(std::string_view name, std::string_view content) const;

 private:
  std::string path_;
};

/// The bytes of a file; a missing file fails the test.
std::string ReadFile(const std::string& path);

}  // namespace tervane::test
