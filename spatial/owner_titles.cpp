// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/owner_titles.h"

#include "core/dependent_list.h"
#include "core/list.h"

namespace tervane {

namespace {

bool IsEntry(const CYbSEKvfBase& node) { return dynamic_cast<const CTvnItemInterface*>(&node) != nullptr; }

bool IsItem(const CYbSEKvfBase& node) {
  const auto* list = dynamic_cast<const CYbSEKvfListBaseInterface*>(node.GetParent());
  return list && list->GetNumberWhatIs(&node) > 0;
}

}  // namespace

std::string OwnersOf(const CYbSEKvfBase& node) {
  std::string owners;
  const std::string title = node.GetTitle(), parts = ", " + title + ", ";
  const auto putInFront = [&](const std::string& name) {
    // Some titles are made of those above.
    if (name.empty() || (title != name && parts.find(", " + name + ", ") != std::string::npos)) return;
    owners = owners.empty() ? name : name + ", " + owners;
  };
  if (IsEntry(node) && node.GetParent() && title == node.GetAbbreviatedTitle())
    putInFront(node.GetParent()->GetTitle());
  for (const CYbSEKvfBase* above = node.GetParent(); above; above = above->GetParent())
    if (IsEntry(*above) || IsItem(*above)) putInFront(above->GetAbbreviatedTitle());
  return owners;
}

std::string WithOwners(const std::string& owners, const std::string& title) {
  return owners.empty() ? title : owners + ": " + title;
}

}  // namespace tervane
