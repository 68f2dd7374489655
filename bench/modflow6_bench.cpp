// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// A large setup that is exported as a model of MODFLOW 6, as text and in binary form.
#include <cmath>
#include <ctime>
#include <filesystem>
#include <string>
#include <vector>

#include <fmt/format.h>
#include <sys/resource.h>
#include <unistd.h>

#include "bench/median_table.h"
#include "data/datafile_writer.h"
#include "data/series_file.h"
#include "document/flow_model_document.h"
#include "modflow6/modflow6_export.h"
#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "simspec/periods.h"
#include "simspec/stress_periods.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "subsurface/computational_layers.h"
#include "subsurface/geology.h"
#include "subsurface/ground_properties.h"
#include "subsurface/saturated_zone.h"
#include "surface/climate.h"

namespace tervane::bench {

namespace {

constexpr int kSide = 1000, kLayers = 10, kPeriods = 100;

class NoLog : public WorkLog {
 public:
  void Progress(int /*percent*/, std::string_view /*doing*/) override {}
  void Error(std::string_view /*place*/, std::string_view /*text*/) override {}
  void Warning(std::string_view /*place*/, std::string_view /*text*/) override {}
};

void MustBe(const std::string& error) {
  if (!error.empty()) fmt::print("WRONG: {}\n", error);
}

/// A file with one grid, made of a function of row and column.
template <class At>
void WriteGrid(const std::string& path, int itemType, int unit, const At& at) {
  NewDataFile content;
  GridGeometry geometry;
  geometry.nx = geometry.ny = kSide;
  geometry.cellSize = 100;
  content.geometry = FileGeometryOf(geometry);
  content.hasTime = false;
  content.items = {{"Values", itemType, unit}};
  std::vector<float> values;
  for (int j = 0; j < kSide; ++j)
    for (int i = 0; i < kSide; ++i) values.push_back(at(i, j));
  DataFileWriter writer;
  MustBe(writer.Create(path, content));
  MustBe(writer.Put(1, values));
  MustBe(writer.Finish().error);
}

void UseGrid(CData2DKvf& quantity, const std::string& path) {
  quantity.Type = CData2DKvf::kGridFile;
  quantity.GridFile().Choose(FileName(path, {}));
}

void Fill(CFlowModelDoc& setup, const std::string& folder) {
  CYbSEKvfGlobalBase& root = setup.Root();
  constexpr int kMetres = 1000;
  const auto hill = [](int i, int j) { return static_cast<float>(20 * std::sin(0.01 * i) * std::cos(0.013 * j)); };
  WriteGrid(folder + "/domain.nds2", quantity::kCode, kWholeNumberUnit,
            [](int i, int j) { return i == 0 || j == 0 || i == kSide - 1 || j == kSide - 1 ? 2.0F : 1.0F; });
  WriteGrid(folder + "/ground.nds2", quantity::kElevation, kMetres, hill);
  WriteGrid(folder + "/fraction.nds2", quantity::kFraction, kDimensionlessUnit,
            [](int i, int j) { return static_cast<float>(0.2 + 0.1 * std::sin(0.02 * (i + j))); });
  root.Important(kDomain)->GridFile().Choose(FileName(folder + "/domain.nds2", {}));
  UseGrid(*root.Important(kTopography), folder + "/ground.nds2");

  root.Important(kBasicParameters)->ModelType = kEngineModflow96;
  root.Important(kModflowComponents)->Recharge = 1;
  auto& simulation = *root.Important(kSimulationPeriod);
  simulation.SIMSTART = CYbDateTime(2000, 1, 1);
  simulation.SIMEND =
      CYbDateTime::FromSecondsSinceEpoch(simulation.SIMSTART.SecondsSinceEpoch() + 10 * kPeriods * 86400);
  root.Important(kStressPeriods)->MakeEqualPeriods(kPeriods, {});
  NewSeries rain{"Rain", quantity::kPrecipitationRate, static_cast<int>(ValueType::MeanStep), {}, {}};
  for (int day = 0; day <= 10 * kPeriods; ++day) {
    rain.times.push_back(CYbDateTime::FromSecondsSinceEpoch(simulation.SIMSTART.SecondsSinceEpoch() + day * 86400));
    rain.values.push_back(static_cast<float>(3 + 2 * std::sin(0.1 * day)));
  }
  MustBe(WriteSeriesFile(folder + "/rain.nds0", rain).error);
  CGlobalKvf& precipitation = root.Important(kPrecipitation)->Global();
  precipitation.TYPE = CGlobalKvf::kTimeVarying;
  precipitation.SeriesFile().Choose(FileName(folder + "/rain.nds0", {}));
  UseGrid(*PropertyOf(*root.Important(kClimate), "RechargeFraction"), folder + "/fraction.nds2");

  auto& zone = *root.Important(kSaturatedZone);
  zone.Layers().SetItemCount(kLayers, 1);
  zone.LayersOfGeology().SetItemCount(kLayers, 1);
  for (int number = 1; number <= kLayers; ++number) {
    const std::string path = fmt::format("{}/level_{}.nds2", folder, number);
    WriteGrid(path, quantity::kElevation, kMetres, [&](int i, int j) {
      return hill(i, j) - static_cast<float>(number * 10) - 0.01F * static_cast<float>(i);
    });
    UseGrid(*PropertyOf(*zone.Layers().GetItem(number), "LowerLevel"), path);
  }
}

/// The most memory that this process ever had, in megabytes.
long PeakMegabytes() {
  rusage usage{};
  getrusage(RUSAGE_SELF, &usage);
  return usage.ru_maxrss / 1024;
}

int Run() {
  namespace fs = std::filesystem;
  const fs::path folder = fs::temp_directory_path() / fmt::format("tervane_modflow6_bench_{}", getpid());
  fs::create_directories(folder);
  CFlowModelDoc setup;
  Fill(setup, folder.string());
  fmt::print("{} x {} cells, {} layers, {} periods\n", kSide, kSide, kLayers, kPeriods);
  for (const auto form : {modflow6::Modflow6Options::Arrays::Binary, modflow6::Modflow6Options::Arrays::Text}) {
    NoLog log;
    modflow6::ExportReport report;
    const std::clock_t start = std::clock();
    const FileResult exported = modflow6::ExportModflow6(setup.Root(), "bench", (folder / "model").string(),
                                                         {.arrays = form, .force = true}, log, report);
    MustBe(exported.error);
    const double seconds = static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC;
    fmt::print("export {}: {:.1f} s (limit 20: {}), most memory {} MB (limit 1000: {})\n",
               form == modflow6::Modflow6Options::Arrays::Text ? "as text" : "in binary form", seconds,
               Verdict(seconds, 20), PeakMegabytes(), Verdict(static_cast<double>(PeakMegabytes()), 1000));
  }
  fs::remove_all(folder);
  return 0;
}

}  // namespace

}  // namespace tervane::bench

int main() { return tervane::bench::Run(); }
