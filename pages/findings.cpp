// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/findings.h"

#include <unordered_map>

namespace tervane {

namespace {

using SerialsByPath = std::unordered_map<std::string, std::uint64_t>;

/// The node at a path that may lead to a key, or to what the tree does not have; else the nearest above it.
std::uint64_t NearestSerial(const SerialsByPath& serials, const std::string& typed) {
  std::uint64_t nearest = 0;
  std::string path;
  for (const PathStep& step : ParseSetupPath(typed).steps) {
    path = JoinPath(path, PathName(step.name, step.instance));
    const auto found = serials.find(path);
    if (found == serials.end()) break;
    nearest = found->second;
  }
  return nearest;
}

SetupFinding::Kind KindOf(Severity severity) {
  return severity == Severity::Error     ? SetupFinding::Kind::Error
         : severity == Severity::Warning ? SetupFinding::Kind::Warning
                                         : SetupFinding::Kind::Note;
}

}  // namespace

std::string_view KindName(SetupFinding::Kind kind) {
  switch (kind) {
    case SetupFinding::Kind::Error:
      return "error";
    case SetupFinding::Kind::Warning:
      return "warning";
    case SetupFinding::Kind::Note:
      return "note";
    case SetupFinding::Kind::Unread:
      return "unread";
  }
  return {};
}

std::vector<SetupFinding> FindingsOf(const CYbSEDocument& document) {
  using Kind = SetupFinding::Kind;
  const LoadReport& report = document.Report();
  SerialsByPath serials;
  std::vector<SetupFinding> ofNodes;
  WalkNodes(document.Root(), [&](const NodePlace& place) {
    if (!report.IsEmpty()) serials.emplace(place.path, place.node.Serial());
    for (const Finding& finding : place.node.Findings())
      ofNodes.push_back(
          {KindOf(finding.severity), place.path, finding.text, finding.key, finding.detail, 0, place.node.Serial()});
  });
  std::vector<SetupFinding> found;
  for (const LoadReport::Entry& entry : report.entries)
    found.push_back({entry.kind == LoadReport::Kind::Warning ? Kind::Warning : Kind::Note,
                     entry.path,
                     entry.text,
                     entry.key,
                     {},
                     entry.line,
                     NearestSerial(serials, entry.path)});
  found.insert(found.end(), std::make_move_iterator(ofNodes.begin()), std::make_move_iterator(ofNodes.end()));
  for (const KvfUnread& entry : report.unread)
    found.push_back(
        {Kind::Unread, entry.path, entry.text, {}, {}, entry.line, NearestSerial(serials, entry.path), entry.kind});
  return found;
}

}  // namespace tervane
