// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What many zones cost: finding their codes in a large grid, bringing them in step with it, and opening a setup of
// them.
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include <fmt/format.h>
#include <unistd.h>

#include "bench/median_table.h"
#include "data/grid_files.h"
#include "document/flow_model_document.h"
#include "platform/item_types.h"
#include "surface/overland.h"

namespace tervane::bench {
namespace {

constexpr int kSide = 5000;
constexpr int kZonesASide = 100;
constexpr int kZones = kZonesASide * kZonesASide;

/// Writes a grid of square patches, each with a code of its own from `firstCode` on.
void WritePatches(const std::string& path, int firstCode) {
  std::vector<float> codes;
  codes.reserve(static_cast<std::size_t>(kSide) * kSide);
  constexpr int kPatch = kSide / kZonesASide;
  for (int row = 0; row < kSide; ++row)
    for (int column = 0; column < kSide; ++column)
      codes.push_back(static_cast<float>(firstCode + row / kPatch * kZonesASide + column / kPatch));
  CTvn2DOrthoRotatedGridData grid;
  std::string problem =
      grid.TakeValues({kSide, kSide, 10, 0, 0, 0, {}}, std::move(codes), kUsualDeleteValue, 0, quantity::kCode);
  if (problem.empty()) problem = WriteGridData(path, grid).error;
  if (!problem.empty()) fmt::print("WRONG: {}\n", problem);
}

/// A setup whose zones of overland flow come from a file.
std::unique_ptr<CFlowModelDoc> SetupOver(const std::string& file) {
  auto setup = std::make_unique<CFlowModelDoc>();
  setup->Root().Important(kOverlandZones)->GridFile().Choose(FileName(file, {}));
  return setup;
}

CTopographicalRoutingKvf& ZonesOf(const std::unique_ptr<CFlowModelDoc>& setup) {
  return *setup->Root().Important(kOverlandZones);
}

/// What a page does when a file was chosen: looks, asks where work would be lost, and brings the zones in step.
int Synchronise(const std::unique_ptr<CFlowModelDoc>& setup) {
  CTopographicalRoutingKvf& zones = ZonesOf(setup);
  const FoundZones found = zones.FindZones();
  if (!zones.PlanZones(found).editedRemoved.empty()) fmt::print("WRONG: nobody has edited a zone\n");
  return zones.SyncZones(found);
}

std::string TextOf(const CFlowModelDoc& setup) {
  std::string text, error;
  if (!setup.BuildText("/setups", text, error)) fmt::print("not saved: {}\n", error);
  return text;
}

int Run(int argc, char** argv) {
  const std::string folder =
      (std::filesystem::temp_directory_path() / fmt::format("tervane_zone_bench_{}", getpid())).string();
  std::filesystem::create_directory(folder);
  const std::string codes = folder + "/codes.nds2", others = folder + "/others.nds2";
  WritePatches(codes, 1);
  WritePatches(others, kZones / 2);

  const std::unique_ptr<CFlowModelDoc> inStep = SetupOver(codes);
  Synchronise(inStep);
  const std::string text = TextOf(*inStep);
  if (ZoneItems(ZonesOf(inStep)).size() != kZones) fmt::print("WRONG: not all zones were found\n");

  MedianTable table(5);
  const auto first = fmt::format("{} zones from {} x {} codes", kZones, kSide, kSide);
  table.Add(
      first, [codes] { return SetupOver(codes); }, Synchronise);
  table.Add(first + ", again", [&] { return Synchronise(inStep); });
  table.Add(
      first + ", half of them others",
      [&] {
        std::unique_ptr<CFlowModelDoc> setup = SetupOver(others);
        if (!setup->OpenText(text, "/setups/a.tvd")) fmt::print("not opened: {}\n", setup->Error());
        ZonesOf(setup).GridFile().Choose(FileName(others, {}));
        return setup;
      },
      Synchronise);
  table.Add(
      fmt::format("open a setup of {} zones", kZones), [] { return std::make_unique<CFlowModelDoc>(); },
      [&text](const auto& setup) { return setup->OpenText(text, "/setups/a.tvd"); });
  table.LimitTime(first, 1000);
  table.LimitTime(first + ", again", 300);
  table.LimitTime(first + ", half of them others", 1000);
  table.LimitTime(fmt::format("open a setup of {} zones", kZones), 1000);
  table.Run(argc, argv);
  std::filesystem::remove_all(folder);
  return 0;
}

}  // namespace
}  // namespace tervane::bench

int main(int argc, char** argv) { return tervane::bench::Run(argc, argv); }
