// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "modflow6/export_report.h"

#include <algorithm>
#include <unordered_set>

#include <fmt/format.h>

#include "core/node.h"

namespace tervane::modflow6 {

std::string NameOf(Fate fate) {
  return fate == Fate::Carried ? "carried over" : fate == Fate::Changed ? "changed" : "left out";
}

void ExportReport::Add(Fate fate, std::string place, std::string text) {
  entries_.push_back({fate, std::move(place), std::move(text)});
}

namespace {

/// What the entries speak of.
struct Spoken {
  std::unordered_set<std::string> whole;   ///< Nodes, with all below them.
  std::unordered_set<std::string> partly;  ///< Nodes of which a key is told, and those above any node that is.

  explicit Spoken(const std::vector<ExportEntry>& entries) {
    for (const ExportEntry& entry : entries) {
      const std::size_t key = entry.place.find(':');
      std::string path = entry.place.substr(0, key);
      (key == std::string::npos ? whole : partly).insert(path);
      for (std::size_t end = path.rfind('/'); end != std::string::npos; end = path.rfind('/')) {
        path.resize(end);
        partly.insert(path);
      }
    }
  }
};

void LeaveOutBelow(CYbSEKvfBase& node, const Spoken& spoken, ExportReport& report) {
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child)) {
    if (!child->HoldsSetup() || !child->IsDataUsedInSetup()) continue;
    const std::string path = PathOf(*child);
    if (spoken.whole.contains(path)) continue;
    if (!spoken.partly.contains(path) && child->GetDlgRuntimeClass(kSetupDataTree))
      report.Add(Fate::LeftOut, path, fmt::format("{} has no counterpart", child->GetTitle()));
    else
      LeaveOutBelow(*child, spoken, report);
  }
}

}  // namespace

void ExportReport::LeaveOutTheRest(CYbSEKvfBase& root) { LeaveOutBelow(root, Spoken(entries_), *this); }

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
