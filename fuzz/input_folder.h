// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "fuzz/require.h"
#include "platform/os.h"
#include "platform/paths.h"

namespace tervane::fuzz {

/// One input as several files that belong together, as those of a shape file do. The files stand behind each other,
/// with lines "@@.EXTENSION" between them, that stand for the extension of the file that follows. All are called
/// "fuzzed". They are written into a folder of the process, which is empty again for the next input: set TMPDIR to a
/// folder in memory.
class InputFolder {
 public:
  InputFolder(std::string_view input, std::string_view firstExtension) {
    constexpr std::string_view kMark = "\n@@.";
    // What more files a mutation makes tell nothing new.
    constexpr std::size_t kMostFiles = 6;
    std::string extension(firstExtension);
    while (files_.size() < kMostFiles) {
      const std::size_t mark = input.find(kMark);
      Write("fuzzed" + extension, input.substr(0, mark));
      if (mark == std::string_view::npos) break;
      input.remove_prefix(mark + kMark.size());
      const std::size_t end = input.find('\n');
      extension = ".";
      for (const char c : input.substr(0, end))
        if (((c >= 'a' && c <= 'z') || (c >= '0' && c <= '9')) && extension.size() < 8) extension += c;
      input.remove_prefix(end == std::string_view::npos ? input.size() : end + 1);
    }
  }
  ~InputFolder() {
    std::error_code ignored;
    for (const auto& entry : std::filesystem::directory_iterator(Folder())) std::filesystem::remove_all(entry, ignored);
  }
  InputFolder(const InputFolder&) = delete;
  InputFolder& operator=(const InputFolder&) = delete;

  std::string Path(std::string_view extension) const { return At("fuzzed" + std::string(extension)); }

  /// Nobody may have changed what is only read.
  void RequireUnchanged() const {
    for (const auto& [name, content] : files_) {
      std::ifstream file(NativePath(At(name)), std::ios::binary);
      Require(std::string(std::istreambuf_iterator<char>(file), {}) == content, "what is read stays as it was", name);
    }
  }

 private:
  /// Made for the process, and removed at its end.
  static const std::filesystem::path& Folder() {
    struct Made {
      std::filesystem::path path = std::filesystem::temp_directory_path() / ("tervane_fuzz_" + Unique());
      Made() { std::filesystem::create_directories(path); }
      ~Made() {
        std::error_code ignored;
        std::filesystem::remove_all(path, ignored);
      }
      Made(const Made&) = delete;
      Made& operator=(const Made&) = delete;
      static std::string Unique() { return std::to_string(os::ProcessId()); }
    };
    static const Made made;
    return made.path;
  }
  static std::string At(const std::string& name) { return TextOfPath(Folder() / name); }
  void Write(const std::string& name, std::string_view content) {
    std::ofstream(NativePath(At(name)), std::ios::binary) << content;
    std::erase_if(files_, [&name](const auto& file) { return file.first == name; });
    files_.emplace_back(name, content);
  }

  std::vector<std::pair<std::string, std::string>> files_;
};

}  // namespace tervane::fuzz
