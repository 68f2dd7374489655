// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <vector>

#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/command_line.h"
#include "cli/commands.h"
#include "cli/json.h"
#include "cli/setup_file.h"

namespace tervane {

namespace {

/// A finding of any origin: of validation, or of reading the file.
struct Found {
  std::string path;
  std::string_view severity;
  std::string text;
  std::string key;
  std::string detail;
  int line = 0;
};

std::vector<Found> FindingsOf(const CFlowModelDoc& document) {
  std::vector<Found> found;
  for (const LoadReport::Entry& entry : document.Report().entries)
    found.push_back({entry.path,
                     entry.kind == LoadReport::Kind::Warning ? "warning" : "note",
                     entry.text,
                     entry.key,
                     {},
                     entry.line});
  WalkNodes(document.Root(), [&](const NodePlace& place) {
    for (const Finding& finding : place.node.Findings())
      found.push_back({place.path, finding.severity == Severity::Error ? "error" : "warning", finding.text, finding.key,
                       finding.detail, 0});
  });
  return found;
}

std::string_view KindName(KvfUnread::Kind kind) {
  switch (kind) {
    case KvfUnread::Kind::Target:
      return "target";
    case KvfUnread::Kind::Section:
      return "section";
    case KvfUnread::Kind::Keyword:
      return "key";
    case KvfUnread::Kind::Parameter:
      return "value";
    case KvfUnread::Kind::Comment:
      return "comment";
  }
  return {};
}

void WriteJson(const std::vector<Found>& findings, const std::vector<KvfUnread>& unread, std::ostream& out) {
  const auto optional = [](const std::string& text) { return text.empty() ? std::string() : JsonQuoted(text); };
  std::vector<std::string> found, notRead;
  for (const Found& finding : findings)
    found.push_back(JsonObject({{"path", JsonQuoted(finding.path)},
                                {"severity", JsonQuoted(finding.severity)},
                                {"text", JsonQuoted(finding.text)},
                                {"key", optional(finding.key)},
                                {"detail", optional(finding.detail)},
                                {"line", finding.line > 0 ? std::to_string(finding.line) : std::string()}}));
  for (const KvfUnread& entry : unread)
    notRead.push_back(JsonObject({{"path", JsonQuoted(entry.path)},
                                  {"kind", JsonQuoted(KindName(entry.kind))},
                                  {"text", JsonQuoted(entry.text)},
                                  {"line", std::to_string(entry.line)}}));
  fmt::print(out, "{}\n", JsonObject({{"findings", JsonArray(found)}, {"unread", JsonArray(notRead)}}));
}

}  // namespace

int CheckCommand(const std::string& file, bool json, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  const std::vector<Found> findings = FindingsOf(document);
  const std::vector<KvfUnread>& unread = document.Report().unread;
  if (json) {
    WriteJson(findings, unread, streams.out);
  } else {
    for (const Found& finding : findings) {
      const std::string line = finding.line > 0 ? fmt::format("{}:", finding.line) : std::string();
      fmt::print(streams.out, "{}:{} {}: {}{}{}: {}{}\n", file, line, finding.severity, finding.path,
                 finding.key.empty() ? "" : ":", finding.key, finding.text,
                 finding.detail.empty() ? std::string() : fmt::format(" ({})", finding.detail));
    }
    for (const KvfUnread& entry : unread)
      fmt::print(streams.out, "{}:{}: unread: {}{}{}\n", file, entry.line, entry.path, entry.path.empty() ? "" : ": ",
                 entry.text);
    if (findings.empty() && unread.empty()) fmt::print(streams.out, "{}: no findings\n", file);
  }
  return findings.empty() && unread.empty() ? kDone : kFindings;
}

}  // namespace tervane
