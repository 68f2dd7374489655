// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/key_reference.h"

#include <charconv>

#include "core/list.h"
#include "core/path.h"
#include "document/global.h"
#include "platform/text.h"
#include "spatial/zone_sync.h"

namespace tervane {

namespace {

/// Takes out the keys that stand in sections of their own within the node's.
std::vector<KeySection> TakeInner(KeySection& section) {
  std::vector<KeySection> inner;
  for (const KeyInfo& key : section.keys) {
    if (key.section.empty()) continue;
    const std::string path = JoinPath(section.path, PathName(key.section));
    if (inner.empty() || inner.back().path != path)
      inner.push_back({path, section.className, section.title, false, {}});
    inner.back().keys.push_back(key);
  }
  std::erase_if(section.keys, [](const KeyInfo& key) { return !key.section.empty(); });
  return inner;
}

void Describe(CYbSEKvfBase& node, const std::string& parentPath, std::vector<KeySection>& sections) {
  const std::string& name = node.GetSectionName();
  const std::string path = name.empty() ? parentPath : JoinPath(parentPath, PathName(name));
  auto* list = dynamic_cast<CYbSEKvfListBaseInterface*>(&node);
  KeySection section{path, ClassNameOf(node), node.GetTitle(), list != nullptr, {}};
  node.DescribeKeys(section.keys);
  std::vector<KeySection> inner = TakeInner(section);
  if (!name.empty() || !section.keys.empty()) sections.push_back(std::move(section));
  std::ranges::move(inner, std::back_inserter(sections));
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
    Describe(*child, path, sections);
  // All items are alike: one that is not in the list stands for them.
  if (list && list->GetItemCount() == 0) Describe(*list->NewItemNode(), path, sections);
  if (auto* zones = dynamic_cast<CFMSEKvfBase*>(&node); zones && ZoneItems(*zones).empty())
    if (const auto zone = zones->CreateStationItem()) Describe(*zone, path, sections);
}

/// The name with `%d` for the number that it ends in: "Item_12" gives "Item_%d".
std::string Numbered(const std::string& name) {
  const std::size_t digits = name.find_last_not_of("0123456789") + 1;
  return digits < name.size() ? name.substr(0, digits) + "%d" : name;
}

}  // namespace

std::string NumberlessPath(std::string_view path) {
  std::string result;
  while (!path.empty()) {
    const std::size_t end = std::min(path.find('/'), path.size());
    result += Numbered(std::string(path.substr(0, end)));
    path.remove_prefix(end);
    if (path.empty()) break;
    result += '/';
    path.remove_prefix(1);
  }
  return result;
}

KeyReference::KeyReference() {
  CGlobal root;
  for (CYbSEKvfBase* child = root.GetFirstChild(); child; child = root.GetNextChild(child))
    Describe(*child, {}, sections_);
  for (std::size_t i = 0; i < sections_.size(); ++i) byPath_.emplace(sections_[i].path, i);
}

std::string KeyReference::PathOfKind(std::string_view sectionPath) const {
  std::string path;
  for (const PathStep& step : ParseSetupPath(sectionPath).steps) {
    // Like sections hold the same keys. A name may end in a number of its own.
    std::string own = JoinPath(path, PathName(step.name));
    path = byPath_.contains(own) ? std::move(own) : JoinPath(path, PathName(Numbered(step.name)));
  }
  return path;
}

const KeyReference& KeyReference::Get() {
  static const KeyReference reference;
  return reference;
}

const KeyInfo* KeyReference::Find(std::string_view sectionPath, std::string_view key) const {
  auto found = byPath_.find(std::string(sectionPath));
  if (found == byPath_.end()) found = byPath_.find(PathOfKind(sectionPath));
  if (found == byPath_.end()) return nullptr;
  for (const KeyInfo& info : sections_[found->second].keys)
    if (Trimmed(info.key) == key) return &info;
  return nullptr;
}

std::string_view KeyReference::DefaultOf(std::string_view sectionPath, std::string_view key) const {
  const KeyInfo* const info = Find(sectionPath, key);
  return info ? std::string_view(info->defaultValue) : std::string_view();
}

std::string_view KeyReference::MeaningOf(std::string_view sectionPath, std::string_view key,
                                         std::string_view value) const {
  const KeyInfo* const info = Find(sectionPath, key);
  if (!info) return {};
  if (info->facts.choices.empty()) return info->facts.UnitText();
  int number = 0;
  const auto [end, error] = std::from_chars(value.data(), value.data() + value.size(), number);
  if (error != std::errc() || end != value.data() + value.size()) return {};
  return TextOf(info->facts.choices, number - info->inFile);
}

}  // namespace tervane
