// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/river_commands.h"

#include <algorithm>
#include <initializer_list>

#include <fmt/format.h>
#include <fmt/ostream.h>
#include <fmt/ranges.h>

#include "cli/offers.h"
#include "cli/parts/json.h"
#include "data/grid_files.h"
#include "libraries/river_import.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

// ---- What there is

std::string JunctionText(std::string_view end, const RiverJunction& junction) {
  return junction.IsNone() ? std::string()
                           : fmt::format(", {} end at {} {:.1f}", end, junction.branch, junction.chainage);
}

double LengthOf(const CYbSimpleRiverData& network) {
  double length = 0;
  for (const RiverBranch& branch : network.branches) length += branch.Length();
  return length;
}

std::string Counted(std::size_t count, std::string_view one, std::string_view many) {
  return fmt::format("{} {}", count, count == 1 ? one : many);
}

void WriteAsText(const std::string& path, const CYbSimpleRiverData& network, std::ostream& out) {
  fmt::print(out, "{}: {}, {}, {:.1f} km\n", path, Counted(network.branches.size(), "branch", "branches"),
             Counted(network.PointCount(), "point", "points"), LengthOf(network) / 1000);
  if (network.Path() != path) fmt::print(out, "network {}\n", network.Path());
  for (const RiverBranch& branch : network.branches) {
    const auto range = branch.Chainages().value_or(std::pair(0.0, 0.0));
    fmt::print(out, "branch {}: {}, chainage {:.1f} to {:.1f}{}{}{}\n", branch.name,
               Counted(branch.points.size(), "point", "points"), range.first, range.second,
               branch.direction == RiverBranch::kToLowerChainages ? ", flows to lower chainages" : "",
               JunctionText("upstream", branch.upstream), JunctionText("downstream", branch.downstream));
  }
  if (const auto kept = network.KeptSections(); !kept.empty())
    fmt::print(out, "other sections: {}\n", fmt::join(kept, ", "));
}

std::string JsonJunction(const RiverJunction& junction) {
  if (junction.IsNone()) return {};
  return JsonObject({{"branch", JsonQuoted(junction.branch)}, {"chainage", ShortestNumber(junction.chainage)}});
}

void WriteAsJson(const CYbSimpleRiverData& network, std::ostream& out) {
  std::vector<std::string> branches, kept;
  for (const RiverBranch& branch : network.branches) {
    const auto range = branch.Chainages();
    branches.push_back(JsonObject({{"name", JsonQuoted(branch.name)},
                                   {"topoId", JsonQuoted(branch.topoId)},
                                   {"points", std::to_string(branch.points.size())},
                                   {"length", ShortestNumber(branch.Length())},
                                   {"from", range ? ShortestNumber(range->first) : ""},
                                   {"to", range ? ShortestNumber(range->second) : ""},
                                   {"direction", std::to_string(branch.direction)},
                                   {"upstream", JsonJunction(branch.upstream)},
                                   {"downstream", JsonJunction(branch.downstream)}}));
  }
  for (const std::string& section : network.KeptSections()) kept.push_back(JsonQuoted(section));
  fmt::print(out, "{}\n",
             JsonObject({{"network", JsonQuoted(network.Path())},
                         {"branches", JsonArray(branches)},
                         {"otherSections", JsonArray(kept)}}));
}

// ---- Making one of lines

struct RiverImportCommand {
  std::string in, out, name, ground;
  double tolerance = RiverImportOptions().tolerance;
  double sliver = RiverImportOptions().sliver;
  int item = 1;
  bool force = false;
};

/// The network whose branches are to be replaced, with its structures, or a new one. False, with a message, for a file
/// that is no network.
bool FindNetwork(const std::string& path, CYbSimpleRiverData& network, Streams streams) {
  network = CYbSimpleRiverData::Empty({});
  if (!FileExists(path)) return true;
  if (const FileResult read = network.ReadNetworkFile(path); !read.Ok()) {
    Refuse(streams, fmt::format("{}; it is left as it is", read.error));
    return false;
  }
  if (const auto kept = network.KeptSections(); !kept.empty())
    fmt::print(streams.err, "{}: note: its other sections are kept: {}\n", path, fmt::join(kept, ", "));
  return true;
}

int ImportRiver(const RiverImportCommand& command, Streams streams) {
  if (RefuseToReplace(command.out, command.force, streams)) return kCouldNot;
  CYbSimpleRiverData network;
  if (!FindNetwork(command.out, network, streams)) return kCouldNot;
  CYbShapeData shapes;
  // Lines without a table have no names, which is no reason to refuse them.
  if (!shapes.ReadShapeAndDbfFile(command.in, "").Ok())
    if (const FileResult read = shapes.ReadShapeFile(command.in); !read.Ok()) return Refuse(streams, read.error);
  CTvn2DOrthoRotatedGridData ground;
  if (!command.ground.empty())
    if (const FileResult read = ReadGridData(command.ground, command.item, ground); !read.Ok())
      return Refuse(streams, read.error);
  RiverImport import = BranchesOfLines(
      shapes, {command.name, command.tolerance, command.sliver, command.ground.empty() ? nullptr : &ground});
  if (!import.error.empty()) return Refuse(streams, fmt::format("{}: {}", command.in, import.error));
  for (const std::string& warning : import.warnings) fmt::print(streams.err, "{}: warning: {}\n", command.in, warning);

  network.TakeBranches(std::move(import.branches));
  if (const auto extent = network.Extent()) network.SetArea(*extent);
  const FileResult written = network.WriteNetworkFile(command.out);
  if (!written.Ok()) return Refuse(streams, written.error);
  if (!written.note.empty()) fmt::print(streams.err, "{}: {}\n", command.out, written.note);
  for (const RiverFinding& finding : network.Findings())
    fmt::print(streams.err, "{}: warning: {}\n", command.out, finding.text);
  fmt::print(streams.out, "{}: {} with {}, {:.1f} km, {} joined{}\n", command.out,
             Counted(network.branches.size(), "branch", "branches"), Counted(network.PointCount(), "point", "points"),
             LengthOf(network) / 1000, Counted(import.junctions, "end", "ends"),
             import.turned > 0 ? fmt::format(", {} turned downhill", Counted(import.turned, "line", "lines")) : "");
  return kDone;
}

}  // namespace

bool LeadsToRiver(const std::string& path) {
  constexpr std::string_view kExtensions[] = {".fvnwk", ".fvproj", ".fvsim"};
  return std::ranges::find(kExtensions, LowerCase(ExtensionOf(path))) != std::end(kExtensions);
}

int PrintRiver(const std::string& path, bool json, Streams streams) {
  const auto reading = ReadRiverOnce(path);
  if (!reading->problem.empty()) return Refuse(streams, reading->problem);
  json ? WriteAsJson(reading->network, streams.out) : WriteAsText(path, reading->network, streams.out);
  for (const RiverFinding& finding : reading->findings)
    fmt::print(streams.err, "{}\n",
               FindingText(reading->network.Path(), {finding.severity, finding.line,
                                                     fmt::format("{}: {}", NameOf(finding.severity), finding.text)}));
  return reading->findings.empty() ? kDone : kFindings;
}

void OfferRiverImport(CommandOffers& offers, const Command& family) {
  auto options = std::make_shared<RiverImportCommand>();
  Command river = offers.Offer(
      "river", "Make a river network (.fvnwk) of the lines of a shape file",
      [offers, options] { return ImportRiver(*options, offers.Output()); }, &family);
  river.Add("LINES", options->in, "The shape file (.shp)").Required();
  river.Add("OUT", options->out, "The network (.fvnwk)").Required();
  river.Add("--name", options->name, "The attribute with the names of the branches; NAME, if there is one");
  river.Add("--ground", options->ground, "A grid of elevations (.nds2): branches flow downhill");
  river.Add("--item", options->item, "The item of the grid; the first");
  river.Add("--tolerance", options->tolerance, "Ends within this distance are joined, in metres; 1").NotNegative();
  river.Add("--sliver", options->sliver, "Shorter lines are told, in metres; 100").NotNegative();
  river.AddFlag("--force", options->force, "Take the place of the branches of a network that is there");
}

}  // namespace tervane
