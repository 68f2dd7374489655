// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Large well files, sections and columns through many layers of large grids, boundaries of many segments, and setups of
// many layers that are opened, saved and edited.
#include <algorithm>
#include <cmath>
#include <memory>
#include <numbers>
#include <random>
#include <string>
#include <vector>

#include <fmt/format.h>

#include "bench/median_table.h"
#include "bench/whole_setup.h"
#include "forms/section_profile.h"
#include "libraries/wells.h"
#include "spatial/domain_boundary.h"
#include "subsurface/computational_layers.h"
#include "subsurface/geology.h"
#include "subsurface/saturated_zone.h"

namespace tervane::bench {

namespace {

constexpr int kWells = 20'000, kFilters = 50'000;
constexpr int kCells = 1000, kLayers = 20;

FileContent WellText() {
  std::string text = fmt::format("target WEL_CFG {{\n  section WELLDATA {{\n    NoWells = {}\n", kWells);
  int filters = 0;
  for (int i = 1; i <= kWells; ++i) {
    text += fmt::format(
        "    section Well_{} {{\n      Name = \"Well {}\"\n      X = {}.5\n      Y = {}.5\n      Level = 100.0\n"
        "      Depth = 80.0\n",
        i, i, i % 1000, i / 1000);
    const int count = i % 2 == 0 ? 2 : 3;
    for (int number = 1; number <= count; ++number, ++filters)
      text += fmt::format(
          "      section Filter_{} {{\n        Top = {}.0\n        Bottom = {}.0\n"
          "        TimeSeries = file \"series/pumping.nds0\", {}\n      }}\n",
          number, 90 - 20 * number, 80 - 20 * number, number);
    text += "    }\n";
  }
  if (filters != kFilters) fmt::print("there are {} filters\n", filters);
  return FileContent::Of(text + "  }\n}\n");
}

/// A hilly level at that depth, of 1 km x 1 km cells of a metre.
std::shared_ptr<const CTvn2DOrthoRotatedGridData> Hills(double depth) {
  std::vector<float> values(static_cast<std::size_t>(kCells) * kCells);
  for (int row = 0; row < kCells; ++row)
    for (int column = 0; column < kCells; ++column)
      values[static_cast<std::size_t>(row) * kCells + static_cast<std::size_t>(column)] =
          static_cast<float>(20 * std::sin(0.01 * column) * std::cos(0.013 * row) - depth);
  auto grid = std::make_shared<CTvn2DOrthoRotatedGridData>();
  if (const std::string error =
          grid->TakeValues({kCells, kCells, 1, 0, 0, 0, {}}, std::move(values), -1e30f, 1000, 100180);
      !error.empty())
    fmt::print("{}\n", error);
  return grid;
}

SectionContent Layers() {
  SectionContent section;
  section.ground = Level{Hills(0)};
  for (int i = 1; i <= kLayers; ++i) section.surfaces.push_back({fmt::format("Layer {}", i), {Hills(5 * i)}});
  section.line = {{10, 10}, {500, 900}, {990, 20}};
  section.minimumThickness = 0.5;
  return section;
}

// ---- Boundaries

constexpr int kDomainSide = 2000, kSegments = 1000;

/// A round domain: 1 inside, 2 at its boundary.
CGeoDataBoundCondCatchmentData Domain() {
  const auto isInside = [](int i, int j) {
    constexpr double kMiddle = kDomainSide / 2.0;
    return std::hypot(i + 0.5 - kMiddle, j + 0.5 - kMiddle) < kMiddle - 2;
  };
  std::vector<float> codes;
  codes.reserve(static_cast<std::size_t>(kDomainSide) * kDomainSide);
  for (int j = 0; j < kDomainSide; ++j)
    for (int i = 0; i < kDomainSide; ++i) {
      const bool isSurrounded = isInside(i - 1, j) && isInside(i + 1, j) && isInside(i, j - 1) && isInside(i, j + 1);
      codes.push_back(!isInside(i, j) ? kUsualDeleteValue : isSurrounded ? 1.0F : 2.0F);
    }
  CGeoDataBoundCondCatchmentData domain;
  if (const std::string error = domain.TakeValues({kDomainSide, kDomainSide, 10, 0, 0, 0, {}}, std::move(codes),
                                                  kUsualDeleteValue, 0, quantity::kCode);
      !error.empty())
    fmt::print("{}\n", error);
  return domain;
}

/// Segments around it in no order.
std::vector<BoundaryItem> Segments() {
  std::vector<BoundaryItem> segments;
  for (int i = 0; i < kSegments; ++i) {
    const double angle = 2 * std::numbers::pi * i / kSegments, radius = 5.0 * kDomainSide;
    segments.push_back({MapPoint{radius * (1 + std::cos(angle)), radius * (1 + std::sin(angle))}, i % 4});
  }
  std::shuffle(segments.begin(), segments.end(), std::mt19937(1));
  return segments;
}

std::size_t TraceSortPaint(CGeoDataBoundCondCatchmentData& domain, const std::vector<BoundaryItem>& segments) {
  std::string message;
  if (!domain.PrepareBoundary(message)) fmt::print("WRONG: not traced: {}\n", message);
  std::vector<BoundaryItem> sorted;
  for (const std::size_t item : domain.BoundaryOrder(segments)) sorted.push_back(segments[item]);
  domain.PaintBoundaryTypes(sorted);
  if (domain.BoundaryPoints.size() != segments.size()) fmt::print("WRONG: not all segments were painted\n");
  return domain.BoundaryCells.size();
}

// ---- Setups of many layers

constexpr int kFew = 20, kMany = 200;
/// Some 70,000 quantities, 300,000 nodes with those of their files.
constexpr int kVeryMany = 2400;

/// Puts that many layers into each list. Files are named and not in use, as in a setup that was worked on.
void MakeLayers(CFlowModelDoc& setup, int count) {
  const CSatZoneKvf& zone = *setup.Root().Important(kSaturatedZone);
  for (CYbSEKvfListBaseInterface* list : {static_cast<CYbSEKvfListBaseInterface*>(&zone.Layers()),
                                          static_cast<CYbSEKvfListBaseInterface*>(&zone.LayersOfGeology()),
                                          static_cast<CYbSEKvfListBaseInterface*>(&zone.OwnLayers())})
    list->SetItemCount(count, 1);
  for (int number = 1; number <= count; ++number) {
    const CGeoLayerSZItemKvf& layer = *zone.Layers().GetItem(number);
    for (CYbSEKvfBase* child = layer.GetFirstChild(); child; child = layer.GetNextChild(child))
      if (auto* property = dynamic_cast<CData2DKvf*>(child))
        property->GridFile().File = FileName(fmt::format("maps/layer_{}.nds2", number), "/setups");
  }
}

int TakingPartBelow(CYbSEKvfBase& node) {
  int count = 0;
  for (CYbSEKvfBase* child = node.GetFirstChild(); child; child = node.GetNextChild(child))
    if (child->IsDlgUsedInSetup()) count += 1 + TakingPartBelow(*child);
  return count;
}

/// A setup that is opened, validated, saved and asked who takes part.
struct LayeredSetup {
  std::string label, text;
  CFlowModelDoc setup;

  LayeredSetup(int count, MedianTable& table) : label(fmt::format("{} layers", count)) {
    MakeLayers(setup, count);
    text = TextOf(setup);
    table.Add(
        "open " + label, [] { return std::make_unique<CFlowModelDoc>(); },
        [this](auto& opened) {
          if (!opened->OpenText(text, "/setups/layers.tvd")) fmt::print("WRONG: not opened: {}\n", opened->Error());
          return opened.get();
        });
    table.Add("validate " + label, [this] { return setup.Root().Validate(); });
    table.Add("save " + label, [this] { return TextOf(setup); });
    table.Add("who takes part, " + label, [this] { return TakingPartBelow(setup.Root()); });
  }
};

/// Layers that are edited.
struct EditedLayers : EditedSetup {
  CGeoLayerSZKvf& layers = session->Document().Root().Important(kSaturatedZone)->Layers();

  EditedLayers(int count, MedianTable& table) : EditedSetup(fmt::format("{} layers", count)) {
    MakeLayers(session->Document(), count);
    session->UpdateDoc(layers, 1, "Make Layers");
    fmt::print("editing {}, {} nodes: {} MB\n", label, NodesBelow(session->Document().Root()), memory.Megabytes());
    const double structure = count > kMany ? 100 : 50;
    Add(table, "type a value", 50, 1, [this]() -> CYbSEKvfBase& {
      CData2DKvf& level = *layers.GetItem(layers.GetItemCount() / 2)->Child<CData2DKvf>();
      level.FixedValue += 1;
      return level;
    });
    AddUndo(table, 100);
    Add(table, "rename a layer", structure, 1, [this]() -> CYbSEKvfBase& {
      layers.GetItem(1)->Name += "x";
      return layers;
    });
    Add(table, "add a layer", structure, 2, [this]() -> CYbSEKvfBase& {
      layers.InsertItem(2, 1);
      return layers;
    });
    Add(table, "delete a layer", structure, 4, [this]() -> CYbSEKvfBase& {
      layers.DeleteItem(2, 1);
      return layers;
    });
  }
};

int Run(int argc, char** argv) {
  const FileContent wells = WellText();
  const SectionContent section = Layers();
  fmt::print("{} wells with {} filters in {} bytes; {} layers of {} x {} cells\n", kWells, kFilters, wells.size,
             kLayers, kCells, kCells);
  MedianTable table(11);
  table.Add("read 20,000 wells", [&] {
    Library library(kWellLibrary);
    if (const std::string error = ParseLibrary(wells, "large.WEL", library); !error.empty()) fmt::print("{}\n", error);
    return WellsOf(library);
  });
  table.Add("section through 20 layers", [&] { return ProfileOf(section, StepFor(section)); });
  table.Add("column through 20 layers", [&] {
    SectionContent column = section;
    column.line = {{500, 500}, {500.001, 500}};
    return ProfileOf(column, 1);
  });
  table.LimitTime("read 20,000 wells", 300);
  // What is moved follows the pointer at 30 pictures a second.
  table.LimitTime("section through 20 layers", 33);
  table.LimitTime("column through 20 layers", 10);

  const CGeoDataBoundCondCatchmentData domain = Domain();
  const std::vector<BoundaryItem> segments = Segments();
  table.Add(
      "trace, sort and paint 1,000 segments", [&] { return domain; },
      [&](CGeoDataBoundCondCatchmentData& traced) { return TraceSortPaint(traced, segments); });
  table.LimitTime("trace, sort and paint 1,000 segments", 200);

  const LayeredSetup few(kFew, table), many(kMany, table);
  // Ten times the size; the rest is for what no longer fits the processor's caches.
  for (const char* what : {"open ", "validate ", "save ", "who takes part, "})
    table.Limit(what + many.label, what + few.label, 11);
  table.LimitTime("who takes part, " + many.label, 20);
  const EditedLayers edited(kMany, table), full(kVeryMany, table);
  table.Run(argc, argv);
  return 0;
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) { return tervane::bench::Run(argc, argv); }
