// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "modflow6/export_report.h"

#include <algorithm>

#include <fmt/format.h>

#include "core/node.h"

namespace tervane::modflow6 {

std::string NameOf(Fate fate) {
  return fate == Fate::Carried ? "carried over" : fate == Fate::Changed ? "changed" : "left out";
}

void ExportReport::Add(Fate fate, std::string place, std::string text) {
  entries_.push_back({fate, std::move(place), std::move(text)});
}

bool ExportReport::SpeaksOf(const std::string& path) const {
  return std::ranges::any_of(entries_, [&](const ExportEntry& entry) {
    const std::size_t key = entry.place.find(':');
    const std::string node = entry.place.substr(0, key);
    // Who speaks of a key alone says nothing of the nodes below.
    return node == path || (key == std::string::npos && path.starts_with(node + "/"));
  });
}

void ExportReport::LeaveOutTheRest(CYbSEKvfBase& root) {
  for (CYbSEKvfBase* child = root.GetFirstChild(); child; child = root.GetNextChild(child)) {
    if (!child->HoldsSetup() || !child->IsDataUsedInSetup()) continue;
    const std::string path = PathOf(*child);
    if (SpeaksOf(path)) continue;
    // A branch of which something is spoken further down is told node by node.
    const bool isSplit =
        std::ranges::any_of(entries_, [&](const ExportEntry& entry) { return entry.place.starts_with(path + "/"); });
    if (!isSplit && child->GetDlgRuntimeClass(kSetupDataTree))
      Add(Fate::LeftOut, path, fmt::format("{} has no counterpart", child->GetTitle()));
    else
      LeaveOutTheRest(*child);
  }
}

std::size_t ExportReport::Count(Fate fate) const {
  return static_cast<std::size_t>(std::ranges::count(entries_, fate, &ExportEntry::fate));
}

std::string ExportReport::Text() const {
  std::string text;
  for (const Fate fate : {Fate::LeftOut, Fate::Changed, Fate::Carried}) {
    if (Count(fate) == 0) continue;
    text += fmt::format("{}{}:\n", text.empty() ? "" : "\n", NameOf(fate));
    for (const ExportEntry& entry : entries_)
      if (entry.fate == fate)
        text += fmt::format("  {}: {}\n", entry.place.empty() ? "setup" : entry.place, entry.text);
  }
  return text;
}

}  // namespace tervane::modflow6
