// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/domain_map.h"

#include <algorithm>
#include <iterator>

#include "pages/parts/plot_content.h"
#include "spatial/domain.h"

namespace tervane {

namespace {

MapContent MapOf(const CYbSEKvfBase& node) {
  auto* domain = node.Important(kDomain);
  if (!domain) return {};
  if (domain->Type == CCatchmentKvf::kGridFile) {
    MapContent map = FileMap(domain->GridFile());
    if (!map.grids.empty()) {
      map.grids.front().isCodes = true;
      map.grids.front().withLegend = false;
    }
    return map;
  }
  if (domain->ShapeFile().File.IsEmpty()) return GridMap(node, nullptr, "No file is chosen.");
  MapContent map = GridMap(node, domain->DomainFromShape());
  if (!map.grids.empty()) {
    map.grids.front().isCodes = true;
    map.grids.front().names = {{1, "inside"}, {2, "outer boundary"}};
  }
  // The first layer is the file's own; the backdrop is there with the grid.
  MapContent outline = ShapeFileMap(domain->ShapeFile(), domain->ShapeAxisUnit);
  if (!outline.shapes.empty()) map.shapes.insert(map.shapes.begin(), std::move(outline.shapes.front()));
  std::ranges::move(outline.awaited, std::back_inserter(map.awaited));
  return map;
}

}  // namespace

MapContent DomainMap(const CYbSEKvfBase& node) {
  MapContent map = MapOf(node);
  // What shows the domain needs no line around it.
  map.domain = nullptr;
  return map;
}

}  // namespace tervane
