// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/parts/setup_file.h"

#include <optional>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "access/setup_place.h"
#include "document/journal.h"
#include "platform/text.h"

namespace tervane {

bool OpenSetup(CFlowModelDoc& document, const std::string& file, Streams streams) {
  if (document.OnOpenDocument(file)) return true;
  fmt::print(streams.err, "{}\n", document.Error());
  return false;
}

bool SaveSetup(CFlowModelDoc& document, const std::string& file, std::string_view command, Streams streams) {
  std::string trouble;
  if (!SaveKeepingJournal(document, file, fmt::format("tervane {}", command), trouble)) {
    fmt::print(streams.err, "{}\n", document.Error());
    return false;
  }
  for (const std::string& note : document.SaveNotes()) fmt::print(streams.err, "{}: {}\n", file, note);
  if (!trouble.empty()) fmt::print(streams.err, "{}\n", trouble);
  return true;
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
  std::string problem;
  CYbSEKvfBase* node = FindNodeOrTell(document.Root(), path, typed, problem);
  if (!node)
    fmt::print(streams.err, "{}{}\n", problem,
               path.error.empty() ? " (tervane tree FILE --all --paths lists all places)" : "");
  return node;
}

KvfNode* FindKeyOrReport(KvfSection& section, const PathStep& key, const std::string& typed, Streams streams) {
  std::string problem;
  KvfNode* found = FindKeyOrTell(section, key, typed, problem);
  if (!found) fmt::print(streams.err, "{}\n", problem);
  return found;
}

}  // namespace tervane
