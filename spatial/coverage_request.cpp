// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <fmt/format.h>

#include "core/walked_node.h"
#include "geometry/shapes.h"
#include "simspec/periods.h"
#include "simspec/stress_periods.h"
#include "spatial/coverage.h"
#include "spatial/data2d.h"
#include "spatial/owner_titles.h"
#include "spatial/zone_sync.h"

namespace tervane {

namespace {

/// What the file of a node is called for people: by the nearest page above, with whose it is: the station, and what the
/// page is a part of.
void GiveTitles(const CYbSEKvfBase& node, CoverageFile& file) {
  const CYbSEKvfBase* shown = &node;
  while (shown && !shown->GetDlgRuntimeClass(kSetupDataTree)) shown = shown->GetParent();
  if (!shown) shown = &node;
  file.quantity = shown->GetTitle();
  std::string owners = OwnersOf(*shown);
  const std::string& name = shown->GetAbbreviatedTitle();
  if (dynamic_cast<const CFMSEKvfGroupBase*>(shown) && !name.empty())
    owners = owners.empty() ? name : fmt::format("{}, {}", owners, name);
  file.title = WithOwners(owners, file.quantity);
}

std::optional<TimeSpan> SimulationOf(const CYbSEKvfBase& root) {
  const auto* period = root.Important(kSimulationPeriod);
  if (!period) return std::nullopt;
  const CYbDateTime start = period->GetSimStartDate(), end = period->SIMEND;
  if (!start.IsValid() || !end.IsValid() || end <= start) return std::nullopt;
  return TimeSpan{start.SecondsSinceEpoch(), end.SecondsSinceEpoch()};
}

std::vector<TimeSpan> StressPeriodsOf(CYbSEKvfBase& root) {
  std::vector<TimeSpan> spans;
  auto* periods = root.Important(kStressPeriods);
  const std::optional<TimeSpan> simulation = SimulationOf(root);
  if (!periods || !simulation || !periods->IsDataUsedInSetup()) return spans;
  std::int64_t start = simulation->start;
  for (const CYbDateTime& date : periods->GetDateMarkers()) {
    // Dates in no order are told by the list itself.
    if (!date.IsValid() || date.SecondsSinceEpoch() <= start) return {};
    spans.push_back({start, date.SecondsSinceEpoch()});
    start = spans.back().end;
  }
  return spans;
}

CoverageFile AskFile(const CYbSEKvfBase& node, const std::string& path, FileUse use) {
  CoverageFile file;
  file.path = path;
  file.serial = node.Serial();
  GiveTitles(node, file);
  file.findings = node.Findings();
  // What the owner makes of the file, or its grid as it is.
  if (auto* owner = dynamic_cast<CellValues*>(node.GetParent()); owner && use.isOverArea) {
    file.values = owner->CurrentSource();
    file.grid = owner->GridComputation();
    file.mayLeaveCells = owner->MayLeaveCells();
  } else if (use.isOverArea && use.kind == FileUse::Kind::Data) {
    GridSource& source = file.values.emplace();
    source.type = CData2DKvf::kGridFile;
    source.file = use.path;
    source.stamps = use.stamps;
    source.item = use.item;
  }
  file.use = std::move(use);
  return file;
}

/// Adds the files and forcings of all nodes below that take part.
void AddRequestsBelow(const CYbSEKvfBase& node, WalkedNode& place, CoverageRequest& request) {
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child)) {
    if (!child->HoldsSetup() || !child->IsDlgUsedInSetup()) continue;
    WalkedNode childPlace(place, *child);
    if (const auto* user = dynamic_cast<const FileUser*>(child))
      if (std::optional<FileUse> use = user->UsedFile())
        request.files.push_back(AskFile(*child, childPlace.Path(), *std::move(use)));
    if (const auto* driver = dynamic_cast<const ForcingNode*>(child))
      for (Forcing& forcing : driver->CurrentForcings()) {
        forcing.title = WithOwners(OwnersOf(*child), forcing.title);
        request.forcings.push_back({childPlace.Path(), child->Serial(), std::move(forcing)});
      }
    if (const auto* checker = dynamic_cast<const CellChecker*>(child))
      for (CellCheck& check : checker->CurrentChecks())
        request.checks.push_back({childPlace.Path(), child->Serial(), std::move(check)});
    if (const auto* spans = dynamic_cast<const StressPeriodSpans*>(child))
      request.spans.push_back({child->GetTitle(), spans->SpanEnds()});
    AddRequestsBelow(*child, childPlace, request);
  }
}

}  // namespace

CoverageRequest AskCoverage(CYbSEKvfBase& root) {
  CoverageRequest request;
  request.simulation = SimulationOf(root);
  request.stressPeriods = StressPeriodsOf(root);
  request.domain = AskDomain(root);
  WalkedNode place(root);
  AddRequestsBelow(root, place, request);
  return request;
}

}  // namespace tervane
