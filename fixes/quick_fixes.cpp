// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "fixes/quick_fixes.h"

#include <algorithm>
#include <unordered_map>
#include <unordered_set>

#include "fixes/converted_files.h"
#include "platform/paths.h"
#include "simspec/period_fixes.h"
#include "spatial/data_use.h"
#include "spatial/file_fixes.h"

namespace tervane {

namespace {

using NodesBySerial = std::unordered_map<std::uint64_t, CYbSEKvfBase*>;

void CollectSetupNodes(CYbSEKvfBase& node, NodesBySerial& nodes) {
  nodes.emplace(node.Serial(), &node);
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
    if (child->HoldsSetup()) CollectSetupNodes(*child, nodes);
}

FoundAt AtNode(CYbSEKvfBase& node, const SetupFinding& finding) {
  return {&node, finding.text, finding.key, finding.detail};
}

bool CanBeFixed(const SetupFinding& finding) {
  return finding.serial != 0 && !finding.isPast && !finding.key.empty() && finding.kind != SetupFinding::Kind::Unread;
}

/// Nodes of files that nothing is found of, since where they are read tells it: points of a text file.
void AddMissedFiles(CYbSEKvfBase& root, std::vector<FoundAt>& found) {
  NodesBySerial nodes;
  CollectSetupNodes(root, nodes);
  std::unordered_set<const CYbSEKvfBase*> known;
  for (const FoundAt& finding : found) known.insert(finding.node);
  std::vector<FoundAt> more;
  for (const auto& [serial, node] : nodes) {
    const auto* user = dynamic_cast<const FileUser*>(node);
    if (!user || known.contains(node) || !node->IsDataUsedInSetup()) continue;
    const std::optional<FileUse> use = user->UsedFile();
    if (!use || use->path.empty() || FileExists(use->path)) continue;
    FoundAt missed{node, "The file is not there", "FILE_NAME", {}};
    if (!MissedFile(missed).empty()) more.push_back(std::move(missed));
  }
  std::ranges::sort(more, {}, [](const FoundAt& finding) { return finding.node->Serial(); });
  found.insert(found.end(), more.begin(), more.end());
}

}  // namespace

QuickFixes::QuickFixes(CFlowModelDoc& document)
    : keys_(document), document_(document), kinds_{MovedFiles(keys_),     kOnlyItem,     kProjectionOfShapes,
                                                   ConvertedFiles(keys_), kPeriodOfData, kDateWithinSimulation,
                                                   NumberInRange(keys_),  OnlyOffer()} {}

QuickFixes::~QuickFixes() = default;

const FixKind* QuickFixes::KindOf(std::string_view name) const {
  const auto kind = std::ranges::find(kinds_, name, &FixKind::name);
  return kind != kinds_.end() ? &*kind : nullptr;
}

bool QuickFixes::NeedsFiles(const FixKind& kind) { return kind.name == kMovedFile; }

std::vector<const FixKind*> QuickFixes::KindsFor(CYbSEKvfBase& node, const SetupFinding& finding) const {
  std::vector<const FixKind*> kinds;
  if (!CanBeFixed(finding)) return kinds;
  const FoundAt found = AtNode(node, finding);
  for (const FixKind& kind : kinds_)
    if (kind.isFor(found)) kinds.push_back(&kind);
  return kinds;
}

std::vector<FoundAt> QuickFixes::FoundFor(const FixKind& kind, const std::vector<SetupFinding>& findings) const {
  NodesBySerial nodes;
  CollectSetupNodes(document_.Root(), nodes);
  std::vector<FoundAt> found;
  for (const SetupFinding& finding : findings) {
    const auto node = CanBeFixed(finding) ? nodes.find(finding.serial) : nodes.end();
    if (node == nodes.end()) continue;
    FoundAt at = AtNode(*node->second, finding);
    if (kind.isFor(at)) found.push_back(std::move(at));
  }
  return found;
}

std::vector<FoundAt> QuickFixes::AllFoundFor(const FixKind& kind) const {
  std::vector<FoundAt> found = FoundFor(kind, FindingsOf(document_));
  if (NeedsFiles(kind)) AddMissedFiles(document_.Root(), found);
  return found;
}

std::shared_ptr<Computed<FilesByName>> QuickFixes::SearchFor(const std::vector<FoundAt>& found,
                                                             const std::string& folder) {
  std::set<std::string> names;
  for (const FoundAt& finding : found)
    if (const std::string path = MissedFile(finding); !path.empty()) names.emplace(FileNameOf(path));
  return std::make_shared<Computed<FilesByName>>(
      "Searching " + folder, [names = std::move(names), folder](FilesByName& files, ProgressPart progress) {
        return files.Search(folder, names, progress);
      });
}

std::vector<std::shared_ptr<Computation>> QuickFixes::PreparationsOf(const FixPlan& plan) {
  std::vector<std::shared_ptr<Computation>> preparations;
  for (const FixedValue& value : plan.values)
    if (value.preparation && std::ranges::find(preparations, value.preparation) == preparations.end())
      preparations.push_back(value.preparation);
  return preparations;
}

void QuickFixes::Apply(FixPlan& plan) {
  std::erase_if(plan.values, [&](const FixedValue& value) {
    std::string why = value.apply();
    if (why.empty()) return false;
    plan.left.push_back({value.node, value.key, std::move(why)});
    return true;
  });
}

std::vector<FixRound> FixAll(CFlowModelDoc& document, QuickFixes& fixes, const FixKind* only, const std::string& folder,
                             bool isTrial, std::string& error) {
  std::vector<FixRound> rounds;
  for (const FixKind& kind : fixes.Kinds()) {
    if (only && only != &kind) continue;
    const std::vector<FoundAt> found = fixes.AllFoundFor(kind);
    if (found.empty()) continue;
    FixContext context{folder};
    std::shared_ptr<Computed<FilesByName>> search;
    if (QuickFixes::NeedsFiles(kind)) {
      search = QuickFixes::SearchFor(found, folder);
      search->Run();
      error = search->Problem();
      context.files = search->Result().get();
    }
    FixRound& round = rounds.emplace_back(FixRound{&kind, {}});
    kind.plan(found, context, round.plan);
    const auto preparations = QuickFixes::PreparationsOf(round.plan);
    if (isTrial && !preparations.empty()) continue;
    for (const std::shared_ptr<Computation>& preparation : preparations) preparation->Run();
    QuickFixes::Apply(round.plan);
    if (!round.plan.values.empty()) document.Root().Validate();
  }
  return rounds;
}

}  // namespace tervane
