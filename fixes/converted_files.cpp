// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "fixes/converted_files.h"

#include <map>
#include <memory>
#include <optional>
#include <set>

#include <fmt/format.h>

#include "data/projection_copy.h"
#include "geometry/cart.h"
#include "platform/paths.h"
#include "spatial/data_use.h"
#include "spatial/file_fixes.h"
#include "spatial/placement.h"

namespace tervane {

namespace {

constexpr const char* kFileKey = "FILE_NAME";

/// The file of a finding that a copy would mend.
std::optional<FileUse> ForeignFile(const FoundAt& found) {
  if (found.key != kFileKey || (found.text != kOtherProjection && found.text != kInDegrees)) return std::nullopt;
  const auto* user = dynamic_cast<const FileUser*>(found.node);
  std::optional<FileUse> use = user ? user->UsedFile() : std::nullopt;
  if (use && (use->kind == FileUse::Kind::Points || !FileExists(use->path))) return std::nullopt;
  return use;
}

/// A name beside a file at which nothing stands and that no other copy takes.
std::string FreeNameBeside(const std::string& path, const std::set<std::string>& taken) {
  const std::string extension(ExtensionOf(path));
  const std::string stem = path.substr(0, path.size() - extension.size()) + "_converted";
  std::string name = stem + extension;
  for (int number = 2; FileExists(name) || taken.contains(name); ++number)
    name = fmt::format("{}_{}{}", stem, number, extension);
  return name;
}

struct Copy {
  std::string path;
  std::shared_ptr<Computation> making;
  std::function<std::string()> problem;  ///< To be asked once it is made.
};

Copy CopyOf(const FileUse& use, const GridGeometry& domain, std::string to) {
  struct Made {};
  const auto make = [use, domain, to](Made&, ProgressPart progress) {
    return use.kind == FileUse::Kind::Data ? CopyGridsOnto(domain, use.path, to, progress)
                                           : CopyShapesInto(domain.projection, use.axisUnit, use.path, to, progress);
  };
  auto making = std::make_shared<Computed<Made>>("Converting " + std::string(FileNameOf(use.path)), make);
  return {std::move(to), making, [making] { return making->Problem(); }};
}

void PlanCopies(SetupKeys& keys, std::span<const FoundAt> found, FixPlan& plan) {
  // Nodes that use one file get one copy; shapes whose coordinates they read in other units are written apart.
  std::map<std::pair<std::string, int>, Copy> copies;
  std::set<std::string> taken;
  for (const FoundAt& finding : found) {
    const auto leave = [&](std::string why) { plan.left.push_back({finding.node, finding.key, std::move(why)}); };
    const std::optional<FileUse> use = ForeignFile(finding);
    const std::optional<GridGeometry> domain = DomainGeometryOf(*finding.node);
    if (!use || !domain) continue;
    const CYbProjectionChange change(LocateFile(*use).projection, domain->projection);
    if (!change.Problem().empty()) {
      leave(change.Problem());
      continue;
    }
    const auto [place, isNew] = copies.try_emplace({use->path, use->axisUnit});
    if (isNew) place->second = CopyOf(*use, *domain, FreeNameBeside(use->path, taken));
    const Copy& copy = place->second;
    taken.insert(copy.path);
    const std::string folder = finding.node->GetRoot() ? finding.node->GetRoot()->SetupFolder() : std::string();
    const std::string after = StoredPath(copy.path, folder);
    plan.values.push_back({finding.node, finding.key, StoredPath(use->path, folder), after,
                           [&keys, node = finding.node, key = finding.key, after, problem = copy.problem] {
                             if (std::string why = problem(); !why.empty()) return why;
                             const PlainValue value = after;
                             return keys.Set(*node, {key}, std::span(&value, 1));
                           },
                           copy.making});
  }
}

}  // namespace

FixKind ConvertedFiles(SetupKeys& keys) {
  return {"convert", "Convert the File to the System of the Domain",
          [](const FoundAt& found) { return ForeignFile(found).has_value(); },
          [&keys](std::span<const FoundAt> found, const FixContext&, FixPlan& plan) { PlanCopies(keys, found, plan); }};
}

}  // namespace tervane
