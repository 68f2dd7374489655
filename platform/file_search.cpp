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
  std::vector<fs::path> folders{NativePath(folder)};
  for (bool isFirst = true; !folders.empty(); isFirst = false) {
    const fs::path here = std::move(folders.back());
    folders.pop_back();
    std::error_code error;
    // The folder itself must be readable.
    const auto options = isFirst ? fs::directory_options::none : fs::directory_options::skip_permission_denied;
    for (fs::directory_iterator entry(here, options, error); !error && entry != fs::directory_iterator();
         entry.increment(error)) {
      if (progress.IsCancelled()) return {folder + ": " + kCancelled, {}};
      std::error_code ignored;
      if (entry->symlink_status(ignored).type() == fs::file_type::directory) {
        folders.push_back(entry->path());
        continue;
      }
      const std::string name = TextOfPath(entry->path().filename());
      std::string lower = LowerCase(name);
      if (!wanted.contains(lower) || !entry->is_regular_file(ignored)) continue;
      std::string path = TextOfPath(entry->path());
      if (names.contains(name)) exact_[name].push_back(path);
      alike_[std::move(lower)].push_back(std::move(path));
    }
    // What vanishes while it is walked is not there.
    const bool isGone = error == std::errc::no_such_file_or_directory || error == std::errc::not_a_directory;
    if (error && (isFirst || !isGone)) return {TextOfPath(here) + ": " + error.message(), {}};
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
