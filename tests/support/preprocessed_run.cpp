// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "tests/support/preprocessed_run.h"

#include <cmath>
#include <cstring>
#include <filesystem>
#include <stdexcept>

#include <fmt/format.h>

#include "data/datafile_writer.h"
#include "geometry/shapes.h"
#include "platform/item_types.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"

namespace tervane::test {

namespace {

constexpr int kColumns = 48, kRows = 36, kLayers = 3;
const GridGeometry kPlace{kColumns, kRows, 500, 480000, 6210000, 12, {}};

FileGeometry Geometry(int layers) {
  FileGeometry geometry;
  geometry.nx = kColumns;
  geometry.ny = kRows;
  geometry.nz = layers;
  geometry.cellSize = geometry.cellHeight = kPlace.cellSize;
  geometry.x0 = kPlace.x0;
  geometry.y0 = kPlace.y0;
  geometry.rotation = kPlace.rotation;
  return geometry;
}

/// Values of all cells inside an ellipse, from functions of the cell.
template <class Function>
std::vector<float> Cells(const Function& function) {
  std::vector<float> values;
  for (int j = 0; j < kRows; ++j) {
    for (int i = 0; i < kColumns; ++i) {
      const double u = (i + 0.5) / kColumns * 2 - 1, v = (j + 0.5) / kRows * 2 - 1;
      values.push_back(u * u + v * v < 0.97 ? static_cast<float>(function(u, v)) : kDeleteValue);
    }
  }
  return values;
}

void WriteGrids(const std::string& path) {
  NewDataFile content;
  content.geometry = Geometry(1);
  content.hasTime = false;
  content.items = {{"Model domain", quantity::kCode, kWholeNumberUnit}, {"Topography", 100180, 1000}};
  DataFileWriter writer;
  Require(writer.Create(path, content));
  Require(writer.Put(1, Cells([](double u, double v) { return u * u + v * v < 0.88 ? 1 : 2; })));
  Require(writer.Put(
      2, Cells([](double u, double v) { return 42 + 25 * u + 12 * v + 9 * std::sin(5 * u) * std::cos(4 * v); })));
  Require(writer.Finish().error);
}

void WriteLayers(const std::string& path) {
  NewDataFile content;
  content.dimensions = 3;
  content.geometry = Geometry(kLayers);
  content.hasTime = false;
  content.items = {{"Lower level", 100180, 1000}};
  DataFileWriter writer;
  Require(writer.Create(path, content));
  for (int layer = 0; layer < kLayers; ++layer)
    Require(writer.PutLayer(1, layer,
                            Cells([&](double u, double v) { return 10 * u + 8 * v * v - 30 * (kLayers - layer); })));
  Require(writer.Finish().error);
}

void WriteSeries(const std::string& path) {
  NewDataFile content;
  content.dimensions = 0;
  content.items = {{"Precipitation", 100182, 2004, ValueType::MeanStep}};
  content.begin = CYbDateTime(2001, 1, 1);
  DataFileWriter writer;
  Require(writer.Create(path, content));
  for (int day = 1; day <= 730; ++day) {
    Require(writer.AddStep(CYbDateTime(2001, 1, 1) + CYbDateTimeSpan::Days(day)));
    const double wet = std::sin(day * 0.7) + std::sin(day * 0.23) + 0.6 * std::cos(day * 0.0172);
    const auto value = static_cast<float>(std::max(0.0, wet) * 6);
    Require(writer.Put(1, std::span(&value, 1)));
  }
  Require(writer.Finish().error);
}

void WriteLine(const std::string& path) {
  NewDataFile content;
  content.dimensions = 1;
  content.hasTime = false;
  content.geometry.nx = 40;
  content.geometry.cellSize = 250;
  content.items = {{"Bed level", 100180, 1000}};
  DataFileWriter writer;
  Require(writer.Create(path, content));
  std::vector<float> values(40, 12.5F);
  Require(writer.Put(1, values));
  Require(writer.Finish().error);
}

/// The main river and a tributary as corners of cells, counted from the lower left, from the spring down.
std::vector<std::vector<MapPoint>> Branches() {
  std::vector<std::vector<MapPoint>> branches(2);
  for (int step = 0; step <= 36; ++step)
    branches[0].push_back({40.0 - step, std::round(24 - step * 0.35 + 3 * std::sin(step * 0.3))});
  for (int step = 0; step <= 14; ++step) branches[1].push_back({24.0 - step * 0.2, std::round(32 - step * 1.0)});
  for (MapPoint& corner : branches[1]) corner.x = std::round(corner.x);
  return branches;
}

void WriteRiver(const std::string& path) {
  RiverBytes river;
  river.nx = kColumns;
  river.ny = kRows;
  river.cellSize = kPlace.cellSize;
  river.x0 = kPlace.x0;
  river.y0 = kPlace.y0;
  river.rotation = kPlace.rotation;
  river.first.assign(kPlace.CellCount(), 0);
  river.second.assign(kPlace.CellCount(), 0);
  const GridTransform transform(kPlace);
  for (const std::vector<MapPoint>& branch : Branches()) {
    for (std::size_t n = 0; n < branch.size(); ++n) {
      const MapPoint at = transform.ToWorld({branch[n].x + 0.3 * std::sin(static_cast<double>(n)), branch[n].y + 0.25});
      river.river.push_back({n == 0 ? 3 : 0, at.x, at.y});
      if (n == 0) continue;
      // Along the row first, then along the column.
      const int fromI = static_cast<int>(branch[n - 1].x), fromJ = static_cast<int>(branch[n - 1].y);
      const int toI = static_cast<int>(branch[n].x), toJ = static_cast<int>(branch[n].y);
      for (int i = std::min(fromI, toI); i < std::max(fromI, toI); ++i)
        river.second[static_cast<std::size_t>((fromJ - 1) * kColumns + i)] = 1;
      for (int j = std::min(fromJ, toJ); j < std::max(fromJ, toJ); ++j)
        river.first[static_cast<std::size_t>(j * kColumns + toI - 1)] = 1;
    }
  }
  const std::string bytes = river.Bytes();
  Require(WriteFileAtomically(path, bytes).error);
}

void WriteShapes(const std::string& path) {
  CTvnShapeData basins;
  basins.Create(ShapeKind::Polygon, {{"NAME", AttributeKind::Text}}, {});
  const GridTransform transform(kPlace);
  for (int part = 0; part < 3; ++part) {
    const double left = 4 + 13 * part, right = left + 13;
    Shape basin;
    for (const MapPoint corner :
         {MapPoint{left, 8}, {left + 1.5, 28}, {right + 1.5, 28.0 - part}, {right, 8}, {left, 8}})
      basin.points.push_back(transform.ToWorld(corner));
    basin.parts = {0};
    basin.values = {fmt::format("Basin {}", part + 1)};
    basins.AddShape(std::move(basin));
  }
  Require(basins.SaveShapeFile(path).error);
}

}  // namespace

std::string RiverBytes::Bytes() const {
  std::string bytes;
  const auto put = [&bytes](auto number) {
    char raw[sizeof number];
    std::memcpy(raw, &number, sizeof number);
    bytes.append(raw, sizeof number);
  };
  put(version);
  put(nx);
  put(ny);
  put(points.value_or(static_cast<int>(river.size())));
  put(projectionLength.value_or(static_cast<int>(projection.size()) + 1));
  bytes.append(projection.c_str(), projection.size() + 1);
  for (const double number : {cellSize, x0, y0, rotation}) put(number);
  put(-1e-35F);
  for (const auto* grid : {&first, &second})
    for (const int value : *grid) put(value);
  for (const Point& point : river) {
    put(point.flag);
    put(point.x);
    put(point.y);
  }
  return bytes;
}

void WritePreprocessedRun(const std::string& resultFolder, const std::string& baseName) {
  std::filesystem::create_directories(resultFolder);
  const auto file = [&](const std::string& name) { return resultFolder + "/" + name; };
  WriteGrids(file("karup_2d.nds2"));
  WriteLayers(file("karup_3d.nds3"));
  WriteSeries(file("karup_0d.nds0"));
  WriteLine(file("karup_1d.nds1"));
  WriteShapes(file("basins.shp"));
  std::string log;
  for (int step = 1; step <= 40; ++step)
    log += fmt::format("{:>4}  reading and interpolating item {:>3} ... done\n", step, step * 7);
  Require(WriteFileAtomically(file("karup.log"), log).error);
  Require(
      WriteFileAtomically(file("balance.htm"),
                          "<html><body><h1>Water balance</h1><table border=1 cellpadding=4><tr><td>Precipitation</td>"
                          "<td>812 mm</td></tr><tr><td>Evapotranspiration</td><td>455 mm</td></tr></table>"
                          "</body></html>")
          .error);
  WriteRiver(file(baseName + "_PreProcessed_River.bin"));
  // Last, as the preprocessor does: what the report names is there.
  Require(WriteFileAtomically(file(baseName + "_PreProcessed.kvf"),
                              ReadFile(TERVANE_SOURCE_DIR "/tests/execution/karup_PreProcessed.kvf"))
              .error);
}

}  // namespace tervane::test
