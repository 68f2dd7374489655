// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Runs stored inputs through a fuzz target, with any compiler: `kvf_parser_replay FOLDER|FILE ...`.
#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <string>
#include <vector>

#include "platform/files.h"
#include "platform/paths.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace tervane {
namespace {

/// The file itself, or all files of a folder in the order of their names; none where nothing stands there.
std::vector<std::string> FilesAt(const std::string& path) {
  namespace fs = std::filesystem;
  if (fs::is_regular_file(NativePath(path))) return {path};
  std::vector<std::string> files;
  if (!fs::is_directory(NativePath(path))) return files;
  for (const fs::directory_entry& entry : fs::recursive_directory_iterator(NativePath(path)))
    if (entry.is_regular_file()) files.push_back(TextOfPath(entry.path()));
  std::sort(files.begin(), files.end());
  return files;
}

int Replay(const std::vector<std::string>& paths) {
  std::size_t count = 0;
  for (const std::string& path : paths) {
    const std::vector<std::string> files = FilesAt(path);
    if (files.empty()) return std::fprintf(stderr, "%s: no inputs\n", path.c_str()), 1;
    for (const std::string& file : files) {
      FileContent content;
      if (const FileResult result = ReadWholeFile(file, content); !result.Ok())
        return std::fprintf(stderr, "%s\n", result.error.c_str()), 1;
      // Ahead of the run, so that the last line names the input that ends the process.
      std::fprintf(stderr, "%s\n", file.c_str());
      LLVMFuzzerTestOneInput(reinterpret_cast<const std::uint8_t*>(content.data.get()), content.size);
    }
    count += files.size();
  }
  std::printf("%zu inputs\n", count);
  return count > 0 ? 0 : 1;
}

}  // namespace
}  // namespace tervane

int main(int count, char** arguments) { return tervane::Replay({arguments + 1, arguments + count}); }
