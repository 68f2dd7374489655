// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>
#include <fmt/ostream.h>

#include "cli/offers.h"
#include "cli/parts/json.h"
#include "cli/parts/setup_file.h"
#include "core/kvf_writer.h"
#include "core/list.h"
#include "document/key_reference.h"
#include "pages/why.h"
#include "platform/text.h"
#include "wqpt/species_matrix.h"

namespace tervane {

namespace {

enum class TreeForm { Text, Paths, Json };

struct TreeOptions {
  std::string file, path;
  bool all = false, paths = false, species = false, json = false;
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
        fmt::print(streams.out, "{}\n", OneLine(place.path));
        break;
      case TreeForm::Text:
        fmt::print(streams.out, "{:{}}{}  {}{}\n", "", 2 * (place.depth - 1), StepName(place.node),
                   OneLine(place.node.GetTitle()), place.takesPart ? "" : "  (takes no part)");
        break;
    }
  });
  if (form == TreeForm::Json) fmt::print(streams.out, "{}\n", JsonObject({{"nodes", JsonArray(json)}}));
  return kDone;
}

/// The node's keys as they would be saved, with their defaults where they differ, and its findings.
void ShowNode(const NodePlace& place, const WrittenSetup& written, const KeyReference& reference, Streams streams) {
  fmt::print(streams.out, "{}  {} ({}){}\n", OneLine(place.path), OneLine(place.node.GetTitle()),
             ClassNameOf(place.node), place.takesPart ? "" : ", takes no part");
  for (const Finding& finding : place.node.Findings())
    fmt::print(streams.out, "  ! {}: {}\n", NameOf(finding.severity), OneLine(finding.text));
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

/// The same in JSON.
std::string JsonNode(const NodePlace& place, const WrittenSetup& written, const KeyReference& reference) {
  std::vector<std::string> findings, keys;
  for (const Finding& finding : place.node.Findings())
    findings.push_back(JsonObject({{"severity", JsonQuoted(NameOf(finding.severity))},
                                   {"text", JsonQuoted(finding.text)},
                                   {"key", finding.key.empty() ? "" : JsonQuoted(finding.key)},
                                   {"detail", finding.detail.empty() ? "" : JsonQuoted(finding.detail)}}));
  const KvfSection* section = place.node.GetSectionName().empty() ? nullptr : written.SectionOf(place.node);
  for (const KvfNode* node = section ? section->firstChild : nullptr; node; node = node->next)
    if (node->IsKeyword()) keys.push_back(JsonKey(*node, place.path, reference));
  return JsonObject({{"path", JsonQuoted(place.path)},
                     {"class", JsonQuoted(ClassNameOf(place.node))},
                     {"title", JsonQuoted(place.node.GetTitle())},
                     {"used", JsonBool(place.takesPart)},
                     {"findings", JsonArray(findings)},
                     {"keys", JsonArray(keys)}});
}

int ShowCommand(const std::string& file, const std::string& typed, bool json, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  PrintLoadReportHint(document, streams);
  const SetupPath path = ParseSetupPath(typed);
  const CYbSEKvfBase* wanted = FindNodeOrReport(document, path, typed, streams);
  if (!wanted) return kCouldNot;
  if (!path.key.name.empty()) return GetCommand(file, typed, json, streams);
  const WrittenSetup written(document);
  const KeyReference reference;
  std::vector<std::string> nodes;
  WalkNodes(document.Root(), [&](const NodePlace& place) {
    const CYbSEKvfBase* node = &place.node;
    while (node && node != wanted) node = node->GetParent();
    if (!node) return;
    json ? nodes.push_back(JsonNode(place, written, reference)) : ShowNode(place, written, reference, streams);
  });
  if (json) fmt::print(streams.out, "{}\n", JsonObject({{"nodes", JsonArray(nodes)}}));
  return kDone;
}

/// Where each species takes part: a block a species, a line for each place that has something of it.
int SpeciesCommand(const std::string& file, bool json, Streams streams) {
  CFlowModelDoc document;
  if (!OpenSetup(document, file, streams)) return kCouldNot;
  PrintLoadReportHint(document, streams);
  const SpeciesMatrix matrix = MatrixOfSpecies(document.Root());
  std::vector<std::string> species, strays;
  for (const SpeciesRow& row : matrix.rows) {
    std::vector<std::string> uses;
    if (!json) fmt::print(streams.out, "{}\n", OneLine(row.name));
    for (std::size_t place = 0; place < matrix.places.size(); ++place) {
      const SpeciesUse& use = row.uses[place];
      if (!use.node) continue;
      const std::string path = PathOf(*use.node);
      const std::string text = SpeciesUseText(use);
      if (!json) {
        fmt::print(streams.out, "  {}: {}  ({})\n", matrix.places[place], OneLine(text), OneLine(path));
        if (use.state != SpeciesUse::State::Off) continue;
        for (const Reason& reason : WhyTakesPart(document, *use.node).reasons)
          if (!reason.holds) fmt::print(streams.out, "    {}\n", OneLine(reason.text));
        continue;
      }
      std::vector<std::string> names;
      for (const std::string& name : use.names) names.push_back(JsonQuoted(name));
      uses.push_back(JsonObject({{"place", JsonQuoted(matrix.places[place])},
                                 {"state", JsonQuoted(text.substr(0, text.find(':')))},
                                 {"by", names.empty() ? "" : JsonArray(names)},
                                 {"path", JsonQuoted(path)}}));
    }
    species.push_back(JsonObject({{"name", JsonQuoted(row.name)}, {"uses", JsonArray(uses)}}));
  }
  for (const auto& [name, node] : matrix.withoutSpecies) {
    if (!json) fmt::print(streams.out, "names no species of the setup: {}\n", OneLine(name));
    strays.push_back(JsonQuoted(name));
  }
  if (json)
    fmt::print(streams.out, "{}\n",
               JsonObject({{"species", JsonArray(species)}, {"withoutSpecies", JsonArray(strays)}}));
  return kDone;
}

}  // namespace

void OfferTreeCommands(CommandOffers& offers) {
  auto options = std::make_shared<TreeOptions>();
  Command tree = offers.Offer("tree", "List the nodes that take part", [offers, options] {
    const TreeForm form = options->json ? TreeForm::Json : options->paths ? TreeForm::Paths : TreeForm::Text;
    return TreeCommand(options->file, options->all, form, offers.Output());
  });
  AddSetup(tree, options->file);
  tree.AddFlag("--all", options->all, "Also the nodes that take no part");
  tree.AddFlag("--paths", options->paths, "One PATH a line");
  tree.AddFlag("--json", options->json, "As JSON");

  Command show = offers.Offer("show", "Show nodes with their keys, as they would be saved", [offers, options] {
    return options->species ? SpeciesCommand(options->file, options->json, offers.Output())
                            : ShowCommand(options->file, options->path, options->json, offers.Output());
  });
  AddSetup(show, options->file);
  show.Add("PATH", options->path, "The node; without it the whole setup");
  show.AddFlag("--species", options->species, "Where each species takes part, and why not");
  show.AddFlag("--json", options->json, "As JSON");
}

}  // namespace tervane
