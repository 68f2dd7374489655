// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <map>
#include <set>
#include <string>
#include <vector>

#include "platform/files.h"
#include "platform/progress.h"

namespace tervane {

/// Where files of some names stand at and below a folder.
class FilesByName {
 public:
  /// Looks for all names in one walk; names are the same in any case of ASCII letters, since setups come from systems
  /// that make no difference. Folders behind symbolic links, and folders that may not be read, are passed over. The
  /// error tells which folder cannot be read, or that the search was cancelled.
  FileResult Search(const std::string& folder, const std::set<std::string>& names, ProgressPart progress = {});

  /// The files of a name in the order of their paths: those that are written exactly so, else those that differ in the
  /// case of letters. Absolute where the folder was.
  const std::vector<std::string>& Of(const std::string& name) const;

 private:
  std::map<std::string, std::vector<std::string>> exact_, alike_;  ///< The second by names in lower case.
};

}  // namespace tervane
