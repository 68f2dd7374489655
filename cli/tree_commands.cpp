// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/json.h"
#include "cli/offers.h"
#include "cli/setup_file.h"
#include "core/kvf_writer.h"
#include "core/list.h"
#include "document/key_reference.h"

namespace tervane {

namespace {

enum class TreeForm { Text, Paths, Json };

struct TreeOptions {
  std::string file, path;
  bool all = false, paths = false, json = false;
};

int TreeCommand(const std::string& file, bool all, TreeForm form, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  PrintLoadReportHint(document, streams);
  ReadProcessedData(document, streams);
  std::vector<std::string> json;
  WalkNodes(document.Root(), [&](const NodePlace& place) {
    if (!all && !place.takesPart) return;
    switch (form) {
      case TreeForm::Json:
        json.push_back(JsonObject({{"path", JsonQuoted(place.path)},
                                   {"class", JsonQuoted(ClassNameOf(place.node))},
                                   {"title", JsonQuoted(place.node.GetTitle())},
                                   {"used", JsonBool(place.takesPart)}}));
        break;
      case TreeForm::Paths:
        fmt::print(streams.out, "{}\n", place.path);
        break;
      case TreeForm::Text:
        fmt::print(streams.out, "{:{}}{}  {}{}\n", "", 2 * (place.depth - 1), StepName(place.node),
                   place.node.GetTitle(), place.takesPart ? "" : "  (takes no part)");
        break;
    }
  });
  if (form == TreeForm::Json) fmt::print(streams.out, "{}\n", JsonObject({{"nodes", JsonArray(json)}}));
  return kDone;
}

/// The node's keys as they would be saved, with their defaults where they differ, and its findings.
void ShowNode(const NodePlace& place, const WrittenSetup& written, const KeyReference& reference, Streams streams) {
  fmt::print(streams.out, "{}  {} ({}){}\n", place.path, place.node.GetTitle(), ClassNameOf(place.node),
             place.takesPart ? "" : ", takes no part");
  for (const Finding& finding : place.node.Findings())
    fmt::print(streams.out, "  ! {}: {}\n", NameOf(finding.severity), finding.text);
  const KvfSection* section = place.node.GetSectionName().empty() ? nullptr : written.SectionOf(place.node);
  for (const KvfNode* node = section ? section->firstChild : nullptr; node; node = node->next) {
    if (!node->IsKeyword()) continue;
    const std::string value = KvfValuesText(*node);
    const std::string_view standard = reference.DefaultOf(place.path, node->Name());
    const std::string_view meaning = reference.MeaningOf(place.path, node->Name(), value);
    fmt::print(streams.out, "  {} = {}{}{}\n", node->Name(), value,
               meaning.empty() ? std::string() : fmt::format("  [{}]", meaning),
               standard.empty() || standard == value ? std::string() : fmt::format("  (default {})", standard));
  }
}

int ShowCommand(const std::string& file, const std::string& typed, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  PrintLoadReportHint(document, streams);
  const SetupPath path = ParseSetupPath(typed);
  const CYbSEKvfBase* wanted = FindNodeOrReport(document, path, typed, streams);
  if (!wanted) return kCouldNot;
  if (!path.key.name.empty()) return GetCommand(file, typed, streams);
  const WrittenSetup written(document);
  const KeyReference reference;
  WalkNodes(document.Root(), [&](const NodePlace& place) {
    for (const CYbSEKvfBase* node = &place.node; node; node = node->GetParent())
      if (node == wanted) return ShowNode(place, written, reference, streams);
  });
  return kDone;
}

}  // namespace

void OfferTreeCommands(CommandOffers& offers) {
  auto options = std::make_shared<TreeOptions>();
  CLI::App* tree = offers.Command("tree", "List the nodes that take part", [offers, options] {
    const TreeForm form = options->json ? TreeForm::Json : options->paths ? TreeForm::Paths : TreeForm::Text;
    return TreeCommand(options->file, options->all, form, offers.Output());
  });
  AddSetup(tree, options->file);
  tree->add_flag("--all", options->all, "Also the nodes that take no part");
  tree->add_flag("--paths", options->paths, "One PATH a line");
  tree->add_flag("--json", options->json, "As JSON");

  CLI::App* show = offers.Command("show", "Show nodes with their keys, as they would be saved", [offers, options] {
    return ShowCommand(options->file, options->path, offers.Output());
  });
  AddSetup(show, options->file);
  show->add_option("PATH", options->path, "The node; without it the whole setup");
}

}  // namespace tervane
