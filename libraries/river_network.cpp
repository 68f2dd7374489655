// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "libraries/river_network.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "core/kvf_parser.h"
#include "platform/file_cache.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

FileResult Refused(std::string error) { return {std::move(error), {}}; }

bool HasExtension(std::string_view path, std::string_view extension) {
  return EqualIgnoringCase(ExtensionOf(path), extension);
}

/// The file that the keyword `nwk` names in the section `input` of that target.
NamedNetwork NetworkNamedIn(const std::string& path, std::string_view kind, std::string_view targetName) {
  FileContent text;
  if (FileResult read = ReadWholeFile(path, text); !read.Ok()) return {{}, std::move(read.error)};
  KvfFile file;
  if (!ParseKvf(text, file)) return {{}, fmt::format("{}:{}", path, file.syntaxError.message)};
  KvfSection* target = AsSection(FindKvfNode(file.top, false, targetName));
  if (!target) return {{}, fmt::format("{} is no {}: it has no target {}", path, kind, targetName)};
  KvfSection* input = AsSection(FindKvfNode(*target, false, "input"));
  const KvfNode* keyword = input ? FindKvfNode(*input, true, "nwk") : nullptr;
  if (!keyword) return {{}, fmt::format("{} names no river network: the keyword nwk in input is missing", path)};
  const std::string place = fmt::format("{}:{}", path, static_cast<int>(keyword->line));
  if (keyword->count == 0 || !keyword->params[0].IsText() || keyword->params[0].length == 0)
    return {{}, fmt::format("{}: nwk names no file", place)};
  std::string named = ResolvedPath(keyword->params[0].Text(), FolderOf(AbsoluteFromHere(path)));
  if (IsSameFile(named, path)) return {{}, fmt::format("{}: the file names itself as its river network", place)};
  return {std::move(named), {}};
}

/// The same, read again only when the file has changed.
std::string NamedOnce(const std::string& path, std::string& problem, NamedNetwork (*read)(const std::string&)) {
  static FileCache<NamedNetwork> cache(kMostFacts);
  const auto named = cache.Get(path, {}, [&] { return read(path); });
  problem = named->problem;
  return named->path;
}

}  // namespace

// ---- Branches

std::optional<std::pair<double, double>> RiverBranch::Chainages() const {
  if (points.empty()) return std::nullopt;
  const auto [low, high] = std::ranges::minmax_element(points, {}, &RiverPoint::chainage);
  return std::pair(low->chainage, high->chainage);
}

double RiverBranch::Length() const {
  double length = 0;
  for (std::size_t i = 1; i < points.size(); ++i)
    length += std::hypot(points[i].place.x - points[i - 1].place.x, points[i].place.y - points[i - 1].place.y);
  return length;
}

const RiverBranch* CYbSimpleRiverData::Find(std::string_view name) const {
  const auto found = std::ranges::find(branches, name, &RiverBranch::name);
  return found == branches.end() ? nullptr : &*found;
}

std::size_t CYbSimpleRiverData::PointCount() const {
  std::size_t count = 0;
  for (const RiverBranch& branch : branches) count += branch.points.size();
  return count;
}

std::optional<Envelope> CYbSimpleRiverData::Extent() const {
  std::optional<Envelope> extent;
  for (const RiverBranch& branch : branches)
    for (const RiverPoint& point : branch.points) {
      const auto [x, y] = point.place;
      if (!extent) extent = Envelope{x, y, x, y};
      *extent = {std::min(extent->xMin, x), std::min(extent->yMin, y), std::max(extent->xMax, x),
                 std::max(extent->yMax, y)};
    }
  return extent;
}

// ---- Files

FileResult CYbSimpleRiverData::ReadNetworkFile(const std::string& path) {
  FileContent text;
  if (FileResult read = ReadWholeFile(path, text); !read.Ok()) return read;
  return Refused(ParseNetwork(text, path));
}

FileResult CYbSimpleRiverData::ReadProjectFile(const std::string& path) {
  NamedNetwork named = NetworkOfProject(path);
  return named.problem.empty() ? ReadNetworkFile(named.path) : Refused(std::move(named.problem));
}

FileResult CYbSimpleRiverData::WriteNetworkFile(const std::string& path) const {
  for (const RiverFinding& finding : refused_)
    if (finding.severity == Severity::Error)
      return Refused(fmt::format("cannot write {}: {}; mend that first", path, FindingText(path_, finding)));
  std::string error;
  const std::string text = NetworkText(error);
  if (!error.empty()) return Refused(fmt::format("cannot write {}: {}", path, error));
  return WriteFileAtomically(path, text);
}

NamedNetwork NetworkOfSimulation(const std::string& path) {
  return NetworkNamedIn(path, "river simulation file", "FvRun");
}

NamedNetwork NetworkOfProject(const std::string& path) {
  return NetworkNamedIn(path, "river project file", "FLUVANE_Project");
}

const RiverBranch* RiverReading::Find(const std::string& name) const {
  const auto found = places.find(name);
  return found == places.end() ? nullptr : &network.branches[found->second];
}

std::shared_ptr<const RiverReading> ReadRiverOnce(const std::string& path) {
  static FileCache<RiverReading> cache(20);
  RiverReading none;
  std::string file = path;
  if (HasExtension(path, ".fvsim")) file = NamedOnce(path, none.problem, NetworkOfSimulation);
  if (HasExtension(path, ".fvproj")) file = NamedOnce(path, none.problem, NetworkOfProject);
  const bool isNamed = file != path;
  if (!none.problem.empty() || (!isNamed && !HasExtension(file, ".fvnwk")))
    return std::make_shared<const RiverReading>(std::move(none));
  return cache.Get(file, {}, [&] {
    RiverReading reading;
    reading.problem = reading.network.ReadNetworkFile(file).error;
    reading.findings = reading.network.Findings();
    for (std::size_t i = 0; i < reading.network.branches.size(); ++i)
      reading.places.try_emplace(reading.network.branches[i].name, i);
    return reading;
  });
}

// ---- Findings

std::string FindingText(const std::string& path, const RiverFinding& finding) {
  return finding.line > 0 ? fmt::format("{}:{}: {}", path, finding.line, finding.text)
                          : fmt::format("{}: {}", path, finding.text);
}

}  // namespace tervane
