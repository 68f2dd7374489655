// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/file_search.h"

#include <algorithm>
#include <filesystem>

#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

FileResult FilesByName::Search(const std::string& folder, const std::set<std::string>& names, ProgressPart progress) {
  namespace fs = std::filesystem;
  exact_.clear();
  alike_.clear();
  std::set<std::string> wanted;
  for (const std::string& name : names) wanted.insert(LowerCase(name));
  std::error_code error;
  fs::recursive_directory_iterator entry(NativePath(folder), fs::directory_options::skip_permission_denied, error);
  if (error) return {folder + ": " + error.message(), {}};
  while (entry != fs::recursive_directory_iterator()) {
    if (progress.IsCancelled()) return {folder + ": " + kCancelled, {}};
    const std::string name = TextOfPath(entry->path().filename());
    std::string lower = LowerCase(name);
    std::error_code ignored;
    if (wanted.contains(lower) && entry->is_regular_file(ignored)) {
      std::string path = TextOfPath(entry->path());
      if (names.contains(name)) exact_[name].push_back(path);
      alike_[std::move(lower)].push_back(std::move(path));
    }
    entry.increment(error);
    // What vanishes while it is walked is not there.
    if (error) break;
  }
  for (auto* found : {&exact_, &alike_})
    for (auto& [name, paths] : *found) std::ranges::sort(paths);
  return {};
}

const std::vector<std::string>& FilesByName::Of(const std::string& name) const {
  static const std::vector<std::string> kNone;
  if (const auto found = exact_.find(name); found != exact_.end()) return found->second;
  const auto found = alike_.find(LowerCase(name));
  return found != alike_.end() ? found->second : kNone;
}

}  // namespace tervane
