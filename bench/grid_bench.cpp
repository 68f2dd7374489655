// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Interpolation, polygons and codes on large grids, beside GDAL, NumPy and, where it is installed, CGAL with the same
// input.
#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdio>
#include <ctime>
#include <filesystem>
#include <fstream>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include <cpl_conv.h>
#include <fmt/format.h>
#include <gdal_alg.h>
#include <ogrsf_frmts.h>

#include "bench/cgal_triangulation.h"
#include "bench/median_table.h"
#include "geometry/grid.h"
#include "geometry/grid_interpolation.h"
#include "geometry/grid_polygons.h"
#include "platform/item_types.h"
#include "spatial/domain_boundary.h"

namespace tervane::bench {
namespace {

constexpr float kEmpty = -9999;
constexpr int kSide = 1000;
constexpr int kLargeSide = 5000;

// ---- Scattered points

struct Points {
  std::vector<ScatteredPoint> all;
  std::vector<double> x, y, z;
};

Points RandomPoints(int count) {
  std::mt19937 random(1);
  std::uniform_real_distribution<double> place(0, kSide), height(0, 500);
  Points points;
  for (int i = 0; i < count; ++i) {
    points.all.push_back({place(random), place(random), height(random)});
    points.x.push_back(points.all.back().x);
    points.y.push_back(points.all.back().y);
    points.z.push_back(points.all.back().z);
  }
  return points;
}

std::vector<float> Interpolated(const Points& points, InterpolationMethod method) {
  InterpolationOptions options;
  options.method = method;
  options.searchRadius = 30;
  std::vector<float> values;
  const FileResult result = Interpolate(points.all, {kSide, kSide, 1, 0, 0, 0, ""}, kEmpty, options, values);
  if (!result.Ok()) fmt::print("WRONG: {}\n", result.error);
  return values;
}

std::vector<float> GdalGrid(const Points& points, GDALGridAlgorithm algorithm, const void* options) {
  std::vector<float> values(static_cast<std::size_t>(kSide) * kSide);
  const CPLErr error =
      GDALGridCreate(algorithm, options, static_cast<GUInt32>(points.x.size()), points.x.data(), points.y.data(),
                     points.z.data(), 0, kSide, 0, kSide, kSide, kSide, GDT_Float32, values.data(), nullptr, nullptr);
  if (error != CE_None) fmt::print("WRONG: GDAL does not interpolate\n");
  return values;
}

std::vector<float> GdalInverseDistance(const Points& points) {
  GDALGridInverseDistanceToAPowerNearestNeighborOptions options{};
  options.nSizeOfStructure = sizeof(options);
  options.dfPower = 2;
  options.dfRadius = 30;
  options.dfNoDataValue = static_cast<double>(kEmpty);
  return GdalGrid(points, GGA_InverseDistanceToAPowerNearestNeighbor, &options);
}

std::vector<float> GdalLinear(const Points& points) {
  GDALGridLinearOptions options{};
  options.nSizeOfStructure = sizeof(options);
  options.dfRadius = 0;
  options.dfNoDataValue = static_cast<double>(kEmpty);
  return GdalGrid(points, GGA_Linear, &options);
}

void PrintDifference(const char* what, const std::vector<float>& ours, const std::vector<float>& theirs) {
  std::size_t emptyOnce = 0;
  double most = 0;
  for (std::size_t i = 0; i < ours.size(); ++i) {
    if ((ours[i] == kEmpty) != (theirs[i] == kEmpty))
      ++emptyOnce;
    else
      most = std::max(most, static_cast<double>(std::abs(ours[i] - theirs[i])));
  }
  fmt::print("{}: largest difference {:.2g} of 500, {} of {} cells are empty with one alone\n", what, most, emptyOnce,
             ours.size());
}

/// The time of maps as large as a computer of two cores is asked for, and the processor's share of it: on a busy
/// machine half of that is what two idle cores would take.
void PrintLargeMaps() {
  constexpr double kLimit = 5000;
  const GridGeometry geometry{kLargeSide, kLargeSide, 25, 0, 0, 0, ""};
  std::mt19937 random(6);
  std::uniform_real_distribution<double> place(0, geometry.cellSize * kLargeSide), height(0, 500);
  std::vector<ScatteredPoint> points(20'000);
  for (ScatteredPoint& point : points) point = {place(random), place(random), height(random)};
  for (const auto& [what, method] : {std::pair{"bilinear", InterpolationMethod::Bilinear},
                                     {"triangular", InterpolationMethod::Triangular},
                                     {"inverse distance", InterpolationMethod::InverseDistance},
                                     {"inverse distance squared", InterpolationMethod::InverseDistanceSquared}}) {
    InterpolationOptions options;
    options.method = method;
    options.searchRadius = 10'000;
    options.threads = 2;
    std::vector<float> values;
    const auto start = std::chrono::steady_clock::now();
    const std::clock_t processor = std::clock();
    const FileResult result = Interpolate(points, geometry, kEmpty, options, values);
    const double all = 1000.0 * static_cast<double>(std::clock() - processor) / CLOCKS_PER_SEC;
    const std::chrono::duration<double, std::milli> time = std::chrono::steady_clock::now() - start;
    if (!result.Ok()) fmt::print("WRONG: {}\n", result.error);
    fmt::print(
        "25 million cells of 20,000 points, {}: {:.0f} ms in two threads ({:.0f} ms of processor time) of at most "
        "{} ms  {}\n",
        what, time.count(), all, kLimit, Verdict(time.count(), kLimit));
  }
}

// ---- Polygons

const GridGeometry kLarge{kLargeSide, kLargeSide, 1, 0, 0, 0, ""};

std::vector<Shape> RandomPolygons(int count) {
  std::mt19937 random(2);
  std::uniform_real_distribution<double> place(0, kLargeSide), radius(40, 160);
  std::vector<Shape> shapes;
  for (int k = 0; k < count; ++k) {
    Shape& shape = shapes.emplace_back();
    const double x = place(random), y = place(random);
    constexpr int kCorners = 60;
    for (int i = 0; i < kCorners; ++i) {
      const double angle = -2 * std::acos(-1.0) * i / kCorners, r = radius(random);
      shape.points.push_back({x + r * std::cos(angle), y + r * std::sin(angle)});
    }
    shape.points.push_back(shape.points.front());
    shape.parts = {0};
  }
  return shapes;
}

struct DatasetCloser {
  void operator()(GDALDataset* dataset) const { GDALClose(dataset); }
};
using Dataset = std::unique_ptr<GDALDataset, DatasetCloser>;

/// The polygons as a layer in memory, with their codes.
Dataset MakeLayer(const std::vector<Shape>& shapes) {
  Dataset dataset(GetGDALDriverManager()->GetDriverByName("Memory")->Create("", 0, 0, 0, GDT_Unknown, nullptr));
  OGRLayer* const layer = dataset->CreateLayer("zones", nullptr, wkbPolygon, nullptr);
  OGRFieldDefn field("CODE", OFTInteger);
  layer->CreateField(&field);
  for (std::size_t k = 0; k < shapes.size(); ++k) {
    OGRLinearRing ring;
    for (const MapPoint point : shapes[k].points) ring.addPoint(point.x, point.y);
    OGRPolygon polygon;
    polygon.addRing(&ring);
    OGRFeature feature(layer->GetLayerDefn());
    feature.SetField(0, static_cast<int>(k) + 1);
    feature.SetGeometry(&polygon);
    if (layer->CreateFeature(&feature) != OGRERR_NONE) fmt::print("WRONG: GDAL does not take a polygon\n");
  }
  return dataset;
}

/// Row 0 in the south, as our grids.
Dataset MakeRaster(std::vector<float>& values) {
  Dataset dataset(
      GetGDALDriverManager()->GetDriverByName("MEM")->Create("", kLargeSide, kLargeSide, 0, GDT_Float32, nullptr));
  const std::string pointer = fmt::format("DATAPOINTER={}", fmt::ptr(values.data()));
  char* options[] = {const_cast<char*>(pointer.c_str()), nullptr};
  dataset->AddBand(GDT_Float32, options);
  double transform[] = {0, 1, 0, 0, 0, 1};
  dataset->SetGeoTransform(transform);
  return dataset;
}

struct Burnt {
  std::vector<float> values = std::vector<float>(kLarge.CellCount(), 0.0f);
  Dataset raster;
};

std::unique_ptr<Burnt> NewBurnt(bool isGdal) {
  auto burnt = std::make_unique<Burnt>();
  if (isGdal) burnt->raster = MakeRaster(burnt->values);
  return burnt;
}

int Burn(Burnt& burnt, GDALDataset& layer) {
  OGRLayerH layers[] = {OGRLayer::ToHandle(layer.GetLayer(0))};
  int bands[] = {1};
  char attribute[] = "ATTRIBUTE=CODE";
  char* options[] = {attribute, nullptr};
  double noValue[] = {0};
  const CPLErr error = GDALRasterizeLayers(GDALDataset::ToHandle(burnt.raster.get()), 1, bands, 1, layers, nullptr,
                                           nullptr, noValue, options, nullptr, nullptr);
  burnt.raster->FlushCache();
  return static_cast<int>(error);
}

void PrintCells(const std::vector<float>& ours, const std::vector<float>& theirs) {
  std::size_t different = 0, covered = 0;
  for (std::size_t i = 0; i < ours.size(); ++i) {
    different += ours[i] != theirs[i];
    covered += ours[i] != 0;
  }
  fmt::print("polygons: {} of {} cells are covered, {} differ\n", covered, ours.size(), different);
}

// ---- Codes

/// Median milliseconds of processor time that NumPy takes for the distinct values, and their number; negative without
/// it.
double NumpyUnique(const std::vector<float>& values, std::size_t& count) {
  const std::string path = (std::filesystem::temp_directory_path() / "tervane_grid_bench.bin").string();
  std::ofstream(path, std::ios::binary)
      .write(reinterpret_cast<const char*>(values.data()), static_cast<std::streamsize>(values.size() * sizeof(float)));
  const std::string command =
      "/usr/bin/python3 -c 'import numpy,sys,time\n"
      "a=numpy.fromfile(sys.argv[1],dtype=numpy.float32)\nt=[]\n"
      "for k in range(5):\n s=time.process_time();u=numpy.unique(a);t.append(time.process_time()-s)\n"
      "print(len(u),sorted(t)[2]*1000)' " +
      path + " 2>/dev/null";
  double milliseconds = -1;
  if (std::FILE* const pipe = popen(command.c_str(), "r")) {
    if (std::fscanf(pipe, "%zu %lf", &count, &milliseconds) != 2) milliseconds = -1;
    pclose(pipe);
  }
  std::filesystem::remove(path);
  return milliseconds;
}

double OwnUnique(const std::vector<float>& values, std::size_t& count) {
  CTvn2DOrthoRotatedGridData grid;
  if (const std::string problem = grid.TakeValues(kLarge, values, kEmpty, 0, quantity::kCode); !problem.empty())
    return -1;
  std::vector<double> times;
  std::vector<unsigned> codes;
  for (int k = 0; k < 5; ++k) {
    const std::clock_t start = std::clock();
    grid.GetIntValues(codes);
    times.push_back(1000.0 * static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC);
  }
  count = codes.size();
  std::sort(times.begin(), times.end());
  return times[2];
}

void PrintCodes(const char* what, const std::vector<float>& values) {
  std::size_t own = 0, theirs = 0;
  const double ownTime = OwnUnique(values, own), numpyTime = NumpyUnique(values, theirs);
  if (numpyTime < 0) {
    fmt::print("distinct codes, {}: {:.1f} ms; there is no NumPy to compare with\n", what, ownTime);
    return;
  }
  if (own != theirs) fmt::print("WRONG: {} distinct codes, NumPy finds {}\n", own, theirs);
  fmt::print("distinct codes, {}: {} in {:.1f} ms, NumPy {:.1f} ms, ratio {:.3f} of at most 0.2  {}\n", what, own,
             ownTime, numpyTime, ownTime / numpyTime, Verdict(ownTime / numpyTime, 0.2));
}

// ---- Boundary

/// A domain over nearly the whole large grid, whose boundary goes in and out by that part of the grid.
std::vector<float> RoundDomain(double inAndOut) {
  std::mt19937 random(4);
  std::uniform_real_distribution<double> radius((0.49 - inAndOut) * kLargeSide, 0.49 * kLargeSide);
  constexpr int kCorners = 20'000;
  Shape shape;
  for (int i = 0; i < kCorners; ++i) {
    const double angle = -2 * std::acos(-1.0) * i / kCorners, r = radius(random);
    shape.points.push_back({kLargeSide / 2.0 + r * std::cos(angle), kLargeSide / 2.0 + r * std::sin(angle)});
  }
  shape.points.push_back(shape.points.front());
  shape.parts = {0};
  return DomainOfPolygons({shape}, kLarge);
}

/// The time of tracing the boundary, for a smooth and a jagged one.
void PrintTrace() {
  constexpr double kLimit = 500;
  for (const auto& [what, values] : {std::pair{"smooth", RoundDomain(0)}, std::pair{"jagged", RoundDomain(0.04)}}) {
    std::vector<double> times;
    std::size_t cells = 0;
    std::string message;
    int isTraced = 1;
    for (int k = 0; k < 5; ++k) {
      CGeoDataBoundCondCatchmentData domain;
      if (!domain.TakeValues(kLarge, values, kUsualDeleteValue, 0, quantity::kCode).empty()) return;
      const std::clock_t start = std::clock();
      isTraced = domain.PrepareBoundary(message);
      times.push_back(1000.0 * static_cast<double>(std::clock() - start) / CLOCKS_PER_SEC);
      cells = domain.BoundaryCells.size();
    }
    std::sort(times.begin(), times.end());
    fmt::print("boundary trace, {}: {} cells in {:.1f} ms of at most {} ms{}  {}\n", what, cells, times[2], kLimit,
               isTraced ? "" : " (refused: " + message + ")", Verdict(times[2], kLimit));
  }
}

int Run(int argc, char** argv) {
  GDALAllRegister();
  // One thread each: the times are those of the processor.
  CPLSetConfigOption("GDAL_NUM_THREADS", "1");
  // It would warn each time that the layer has no projection.
  CPLSetErrorHandler(CPLQuietErrorHandler);
  const Points points = RandomPoints(10'000);
  const std::vector<Shape> shapes = RandomPolygons(2'000);
  const Dataset layer = MakeLayer(shapes);
  std::vector<float> codes;
  for (std::size_t k = 0; k < shapes.size(); ++k) codes.push_back(static_cast<float>(k + 1));

  PrintDifference("inverse distance squared", Interpolated(points, InterpolationMethod::InverseDistanceSquared),
                  GdalInverseDistance(points));
  PrintDifference("triangular", Interpolated(points, InterpolationMethod::Triangular), GdalLinear(points));
  {
    const std::unique_ptr<Burnt> ours = NewBurnt(false), theirs = NewBurnt(true);
    PutPolygons(shapes, codes, kLarge, kEmpty, ours->values);
    Burn(*theirs, *layer);
    PrintCells(ours->values, theirs->values);
    PrintCodes("zones", ours->values);
    std::mt19937 random(3);
    for (float& value : ours->values) value = static_cast<float>(random() % 3000);
    PrintCodes("every cell another", ours->values);
  }

  PrintTrace();
  PrintLargeMaps();

  MedianTable table(5);
  table.Add("inverse distance squared",
            [&] { return Interpolated(points, InterpolationMethod::InverseDistanceSquared); });
  table.Add("GDAL invdistnn", [&] { return GdalInverseDistance(points); });
  table.Add("inverse distance", [&] { return Interpolated(points, InterpolationMethod::InverseDistance); });
  table.Add("bilinear", [&] { return Interpolated(points, InterpolationMethod::Bilinear); });
  table.Add("triangular", [&] { return Interpolated(points, InterpolationMethod::Triangular); });
  table.Add("GDAL linear", [&] { return GdalLinear(points); });
#ifdef TERVANE_HAS_CGAL
  const auto cgal = [&] { return CgalLinear(points.x, points.y, points.z, kSide, kEmpty); };
  PrintDifference("triangular beside CGAL", Interpolated(points, InterpolationMethod::Triangular), cgal());
  table.Add("CGAL triangulation", cgal);
  table.Limit("triangular", "CGAL triangulation", 1.0);
#endif
  table.Add(
      "polygons", [] { return NewBurnt(false); },
      [&](const std::unique_ptr<Burnt>& burnt) {
        PutPolygons(shapes, codes, kLarge, kEmpty, burnt->values);
        return 0;
      });
  table.Add(
      "GDAL rasterize", [] { return NewBurnt(true); },
      [&](const std::unique_ptr<Burnt>& burnt) { return Burn(*burnt, *layer); });
  table.Limit("inverse distance squared", "GDAL invdistnn", 0.125);
  table.Limit("triangular", "GDAL linear", 1.0);
  table.LimitTime("bilinear", 100);
  table.Limit("polygons", "GDAL rasterize", 0.25);
  table.Run(argc, argv);
  return 0;
}

}  // namespace
}  // namespace tervane::bench

int main(int argc, char** argv) { return tervane::bench::Run(argc, argv); }
