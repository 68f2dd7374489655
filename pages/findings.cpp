// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/findings.h"

#include <map>
#include <tuple>
#include <unordered_map>

#include <fmt/format.h>

#include "core/walked_node.h"
#include "document/key_reference.h"
#include "platform/text.h"

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

/// The findings of all nodes below, in the order of the walk. A path is made for a node that has some alone.
void AddFindings(const CYbSEKvfBase& node, WalkedNode& place, std::vector<SetupFinding>& found) {
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child)) {
    if (!child->HoldsSetup()) continue;
    WalkedNode childPlace(place, *child);
    for (const Finding& finding : child->Findings())
      found.push_back(
          {KindOf(finding.severity), childPlace.Path(), finding.text, finding.key, finding.detail, 0, child->Serial()});
    AddFindings(*child, childPlace, found);
  }
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
  if (!report.IsEmpty())
    WalkNodes(document.Root(), [&](const NodePlace& place) { serials.emplace(place.path, place.node.Serial()); });
  std::vector<SetupFinding> ofNodes;
  WalkedNode root(document.Root());
  AddFindings(document.Root(), root, ofNodes);
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

SetupFinding FindingOf(const CYbSEDocument& document, const EngineMessage& message) {
  const SetupPath path = ParseSetupPath(message.place);
  CYbSEKvfBase* node = nullptr;
  if (path.error.empty())
    for (const PathStep& step : path.steps) {
      CYbSEKvfBase* child = FindChild(node ? *node : document.Root(), step);
      if (!child) break;
      node = child;
    }
  const auto kind = message.isError ? SetupFinding::Kind::Error : SetupFinding::Kind::Warning;
  SetupFinding finding{kind, {}, message.text, {}, "told by the engine"};
  if (node) {
    const std::string_view place = message.place;
    const std::size_t key = path.key.name.empty() ? std::string::npos : place.rfind(':');
    finding.path = place.substr(0, key);
    finding.key = path.key.name;
    finding.serial = node->Serial();
  } else if (!message.place.empty()) {
    finding.text = message.place + ": " + message.text;
  }
  return finding;
}

void AddEngineMessages(const CYbSEDocument& document, const std::vector<EngineMessage>& messages,
                       const std::string& whyPast, std::vector<SetupFinding>& findings) {
  using Kind = SetupFinding::Kind;
  std::map<std::pair<std::uint64_t, std::string>, std::size_t> known;
  for (std::size_t i = 0; i < findings.size(); ++i)
    if (findings[i].serial != 0 && !findings[i].key.empty() && findings[i].kind <= Kind::Note)
      known.try_emplace({findings[i].serial, findings[i].key}, i);
  for (const EngineMessage& message : messages) {
    SetupFinding said = FindingOf(document, message);
    if (!whyPast.empty()) said.isPast = true, said.detail = whyPast;
    const auto place = known.find({said.serial, said.key});
    if (said.key.empty() || place == known.end()) {
      findings.push_back(std::move(said));
      continue;
    }
    // What the editor finds holds now, whatever an engine said before.
    SetupFinding& same = findings[place->second];
    if (said.isPast) continue;
    same.kind = std::min(same.kind, said.kind);
    if (said.text == same.text || said.text == same.detail) continue;
    same.detail += fmt::format("{}the engine: {}", same.detail.empty() ? "" : "; ", said.text);
  }
}

std::vector<Mend> MendsOf(const CYbSEKvfBase& node, const SetupFinding& finding) {
  const auto* offers = dynamic_cast<const OffersMends*>(&node);
  if (!offers || finding.isPast || finding.key.empty()) return {};
  for (const Finding& own : node.Findings())
    if (own.key == finding.key && own.text == finding.text && own.detail == finding.detail) return offers->MendsOf(own);
  return {};
}

std::string FindingGroup::Text() const {
  std::string text = First().text;
  if (!First().detail.empty()) text += fmt::format(" ({})", First().detail);
  if (!IsOne()) text += fmt::format(": {} places", findings.size());
  return text;
}

std::string FindingGroup::Place() const {
  const auto withKey = [&](const std::string& path) {
    return First().key.empty() ? path : fmt::format("{}:{}", path, First().key);
  };
  return withKey(IsOne() ? First().path : Replaced(NumberlessPath(First().path), "%d", "*"));
}

std::vector<FindingGroup> GroupFindings(std::vector<SetupFinding> findings) {
  std::vector<FindingGroup> groups;
  std::map<std::tuple<SetupFinding::Kind, std::string, std::string, std::string, std::string>, std::size_t> places;
  for (SetupFinding& finding : findings) {
    // What the file's reading met stands in lines of their own.
    const bool isAlone = finding.line > 0;
    const auto [place, isNew] = isAlone ? std::pair(places.end(), true)
                                        : places.try_emplace({finding.kind, finding.text, finding.detail, finding.key,
                                                              NumberlessPath(finding.path)},
                                                             groups.size());
    if (isNew) groups.emplace_back();
    groups[isNew ? groups.size() - 1 : place->second].findings.push_back(std::move(finding));
  }
  return groups;
}

}  // namespace tervane
