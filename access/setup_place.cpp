// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/setup_place.h"

#include <vector>

#include <fmt/format.h>

#include "platform/suggestion.h"
#include "platform/text.h"

namespace tervane {

CYbSEKvfBase* FindNodeOrTell(CYbSEKvfBase& root, const SetupPath& path, const std::string& typed,
                             std::string& problem) {
  if (!path.error.empty()) {
    problem = fmt::format("{}: {}", typed, path.error);
    return nullptr;
  }
  CYbSEKvfBase* node = &root;
  for (const PathStep& step : path.steps) {
    CYbSEKvfBase* child = FindChild(*node, step);
    if (!child) {
      std::vector<std::string> names;
      for (CYbSEKvfBase* other = node->GetFirstChild(); other; other = node->GetNextChild(other))
        names.push_back(StepName(*other));
      problem = fmt::format("{}: there is no {} here{}", typed, PathName(step.name, step.instance),
                            Suggestion(step.name, names));
      return nullptr;
    }
    node = child;
  }
  return node;
}

KvfNode* FindKeyOrTell(KvfSection& section, const PathStep& key, const std::string& typed, std::string& problem) {
  if (key.name.empty()) {
    problem = fmt::format("{}: a key was expected behind the section, as in SimSpec:ModelType", typed);
    return nullptr;
  }
  if (KvfNode* found = FindKvfNode(section, true, Trimmed(key.name), static_cast<std::size_t>(key.instance)))
    return found;
  std::vector<std::string> names;
  for (const KvfNode* node = section.firstChild; node; node = node->next)
    if (node->IsKeyword()) names.emplace_back(node->Name());
  problem = fmt::format("{}: there is no key {} here{}", typed, key.name, Suggestion(key.name, names));
  return nullptr;
}

}  // namespace tervane
