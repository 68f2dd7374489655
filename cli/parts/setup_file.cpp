// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/parts/setup_file.h"

#include <algorithm>
#include <optional>
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

bool OpenSetup(CFlowModelDoc& document, const std::string& file, Streams streams) {
  if (document.OnOpenDocument(file)) return true;
  fmt::print(streams.err, "{}\n", document.Error());
  return false;
}

namespace {

void PrintHeld(const std::string& file, const std::string& reason, Streams streams) {
  fmt::print(streams.err, "{}: {}; close it there, or add --force to write it all the same\n", file, reason);
}

}  // namespace

bool HoldSetup(SetupLock& lock, const std::string& file, bool force, Streams streams) {
  // Where no lock can be written, the setup cannot be saved either, and that save tells why.
  const bool isHeld = lock.Take(file, SetupLock::Purpose::OneChange) == SetupLock::Outcome::Held;
  if (isHeld && !force) PrintHeld(file, lock.Reason(), streams);
  return !isHeld || force;
}

bool RefuseHeld(const std::string& file, bool force, Streams streams) {
  const std::optional<LockHolder> holder = force ? std::nullopt : HolderOf(file);
  if (holder) PrintHeld(file, HolderSentence(*holder), streams);
  return holder.has_value();
}

void PrintLoadReport(const CFlowModelDoc& document, Streams streams) {
  const LoadReport& report = document.Report();
  for (const LoadReport::Entry& entry : report.entries)
    fmt::print(streams.err, "{}:{}: {}{}{}: {}\n", document.PathName(), entry.line, entry.path,
               entry.key.empty() ? "" : ":", entry.key, OneLine(entry.text));
  for (const KvfUnread& unread : report.unread)
    fmt::print(streams.err, "{}:{}: {}\n", document.PathName(), unread.line, OneLine(unread.text));
}

void PrintLoadReportHint(const CFlowModelDoc& document, Streams streams) {
  const LoadReport& report = document.Report();
  if (report.IsEmpty()) return;
  fmt::print(streams.err, "{}: {} notes of the reading, {} things that nothing reads: tervane check tells them\n",
             document.PathName(), report.entries.size(), report.unread.size());
}

void ReadProcessedData(const CFlowModelDoc& document, Streams streams) {
  CPreprocessedDataManager* report = document.AttachPreprocessorReport();
  if (!report) return;
  report->Load();
  if (!report->Problem().empty()) fmt::print(streams.err, "{}\n", report->Problem());
}

CYbSEKvfBase* FindNodeOrReport(CFlowModelDoc& document, const SetupPath& path, const std::string& typed,
                               Streams streams) {
  if (!path.error.empty()) {
    fmt::print(streams.err, "{}: {}\n", typed, path.error);
    return nullptr;
  }
  CYbSEKvfBase* node = &document.Root();
  for (const PathStep& step : path.steps) {
    CYbSEKvfBase* child = FindChild(*node, step);
    if (!child) {
      std::vector<std::string> names;
      for (CYbSEKvfBase* other = node->GetFirstChild(); other; other = node->GetNextChild(other))
        names.push_back(StepName(*other));
      fmt::print(streams.err, "{}: there is no {} here{} (tervane tree FILE --all --paths lists all places)\n", typed,
                 PathName(step.name, step.instance), Suggestion(step.name, names));
      return nullptr;
    }
    node = child;
  }
  return node;
}

WrittenSetup::WrittenSetup(const CFlowModelDoc& document)
    : file_(document.BuildFile(std::string(FolderOf(AbsoluteFromHere(document.PathName()))))),
      target_(AsSection(FindKvfNode(file_->top, false, document.Root().GetTargetName()))) {}

KvfSection* WrittenSetup::SectionOf(const CYbSEKvfBase& node) const {
  const CYbSEKvfBase* parent = node.GetParent();
  if (!parent) return target_;
  if (const auto known = sections_.find(&node); known != sections_.end()) return known->second;
  KvfSection* const section = SectionOf(*parent);
  // Like sections are told apart by their place among each other.
  std::unordered_map<std::string, std::size_t> instances;
  for (CYbSEKvfBase* child = parent->GetFirstChild(); child; child = parent->GetNextChild(child)) {
    const std::string name = child->FormattedSectionName();
    const bool isInParents = !section || child->GetSectionName().empty();
    sections_[child] = isInParents ? section : AsSection(FindKvfNode(*section, false, name, ++instances[name]));
  }
  return sections_[&node];
}

KvfNode* FindKeyOrReport(KvfSection& section, const PathStep& key, const std::string& typed, Streams streams) {
  if (key.name.empty()) {
    fmt::print(streams.err, "{}: a key was expected behind the section, as in SimSpec:ModelType\n", typed);
    return nullptr;
  }
  if (KvfNode* found = FindKvfNode(section, true, Trimmed(key.name), static_cast<std::size_t>(key.instance)))
    return found;
  std::vector<std::string> names;
  for (const KvfNode* node = section.firstChild; node; node = node->next)
    if (node->IsKeyword()) names.emplace_back(node->Name());
  fmt::print(streams.err, "{}: there is no key {} here{}\n", typed, key.name, Suggestion(key.name, names));
  return nullptr;
}

}  // namespace tervane
