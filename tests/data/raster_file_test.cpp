// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/raster_file.h"

#include <array>
#include <cmath>
#include <filesystem>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "data/datafile.h"
#include "data/datafile_request.h"
#include "data/grid_files.h"
#include "geometry/cart.h"
#include "platform/item_types.h"
#include "tests/support/temp_folder.h"

namespace tervane::raster_file_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

using test::ReadFile;
using test::TempFolder;

FileGeometry Geometry(int nx, int ny, double cellSize, double rotation, std::string projection) {
  FileGeometry geometry;
  geometry.nx = nx;
  geometry.ny = ny;
  geometry.cellSize = geometry.cellHeight = cellSize;
  geometry.x0 = 400000;
  geometry.y0 = 5100000;
  geometry.rotation = rotation;
  geometry.projection = std::move(projection);
  return geometry;
}

std::vector<float> CellNumbers(int count) {
  std::vector<float> values(static_cast<std::size_t>(count));
  for (std::size_t i = 0; i < values.size(); ++i) values[i] = static_cast<float>(i) + 0.25f;
  return values;
}

TEST(RasterFile, AGeoTiffComesBackAsItWasWritten) {
  const TempFolder folder;
  FileGeometry flat = Geometry(5, 4, 50, 0, "EPSG:32632");
  flat.cellHeight = 20;
  for (const FileGeometry& geometry : {Geometry(5, 4, 50, 0, "EPSG:32632"), Geometry(5, 4, 50, 30, "EPSG:32632"),
                                       Geometry(5, 4, 25, -110, {}), flat}) {
    SCOPED_TRACE(geometry.rotation);
    const std::string path = folder.File("a.tif");
    std::vector<float> values = CellNumbers(20);
    values[7] = kDeleteValue;
    ASSERT_EQ(WriteGeoTiff(path, {geometry, "Ground", 100180, 1000, {}}, values).error, "");
    RasterFile file;
    ASSERT_EQ(file.Open(path), "");
    const RasterFacts& facts = file.Facts();
    EXPECT_EQ(facts.format, "GeoTIFF");
    EXPECT_THAT(facts.notes, IsEmpty());
    EXPECT_EQ(facts.geometry.nx, 5);
    EXPECT_EQ(facts.geometry.ny, 4);
    EXPECT_NEAR(facts.geometry.cellSize, geometry.cellSize, 1e-9);
    EXPECT_NEAR(facts.geometry.cellHeight, geometry.cellHeight, 1e-9);
    EXPECT_NEAR(facts.geometry.x0, geometry.x0, 1e-6);
    EXPECT_NEAR(facts.geometry.y0, geometry.y0, 1e-6);
    EXPECT_NEAR(facts.geometry.rotation, geometry.rotation, 1e-9);
    EXPECT_TRUE(CYbMapProjection(facts.geometry.projection).IsSameAs(CYbMapProjection(geometry.projection)));
    ASSERT_EQ(facts.bands.size(), 1u);
    EXPECT_EQ(facts.bands[0].name, "Ground");
    EXPECT_EQ(facts.bands[0].unitText, "m");
    EXPECT_EQ(facts.bands[0].itemType, 100180);
    std::vector<float> read(20);
    ASSERT_EQ(file.Read(1, {0, 0, 5, 4}, read), "");
    EXPECT_EQ(read, values);
    // A part: rows 1 and 2 from the south, columns 2 and 3.
    read.resize(4);
    ASSERT_EQ(file.Read(1, {2, 1, 2, 2}, read), "");
    EXPECT_THAT(read, ElementsAre(kDeleteValue, 8.25f, 12.25f, 13.25f));
    EXPECT_THAT(file.Read(1, {2, 1, 4, 1}, read), HasSubstr("is not in it"));
    EXPECT_THAT(file.Read(2, {0, 0, 2, 2}, read), HasSubstr("there is no band 2"));
  }
  // Nothing is left beside it.
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(folder.Path()), {}), 1);
}

TEST(RasterFile, ARasterIsADataFileOfOneStep) {
  const TempFolder folder;
  const std::string path = folder.Write("ground.asc",
                                        "ncols 3\nnrows 2\nxllcorner 100\nyllcorner 200\ncellsize 50\nNODATA_value -9\n"
                                        "1 2 3\n4 -9 6.5\n");
  DataFile file;
  ASSERT_EQ(file.Open(path), "");
  ASSERT_EQ(file.Items().size(), 1u);
  const DataItem& item = file.Items()[0];
  EXPECT_EQ(item.name, "ground");
  EXPECT_EQ(item.itemType, quantity::kUndefined);
  EXPECT_EQ(item.dimensions, 2);
  EXPECT_EQ(item.geometry.x0, 100);
  EXPECT_FALSE(item.hasTime);
  EXPECT_EQ(file.Time().steps, 1u);
  ItemStatistics statistics;
  ASSERT_EQ(file.Statistics(1, statistics), "");
  EXPECT_EQ(statistics.largest, 6.5);
  EXPECT_EQ(statistics.count, 5u);

  CTvn2DOrthoRotatedGridData grid;
  ASSERT_EQ(ReadGridData(path, 1, grid).error, "");
  EXPECT_THAT(grid.Values(), ElementsAre(4, kUsualDeleteValue, 6.5f, 1, 2, 3));
  DataFileRequest request;
  request.dimensions = 2;
  request.steps = 1;
  EXPECT_EQ(WhyNotMet(path, {}, request), "");
  request.itemTypes = {100180};
  EXPECT_THAT(WhyNotMet(path, {}, request), HasSubstr("has no item type, Elevation was expected"));
  EXPECT_THAT(WhyNotMet(path, std::array{2}, request), HasSubstr("there is no item 2: the file has 1"));

  // Values in another unit than the base unit of the type that the file names.
  ASSERT_EQ(WriteGeoTiff(folder.File("feet.tif"), {item.geometry, "Ground", 100180, 1003, {}}, CellNumbers(6)).error,
            "");
  ASSERT_EQ(ReadGridData(folder.File("feet.tif"), 1, grid).error, "");
  EXPECT_EQ(grid.ItemType(), 100180);
  EXPECT_FLOAT_EQ(grid.Value(0, 0), static_cast<float>(0.25 * Convert(1, *FindUnit(1003), *FindUnit(1000))));
}

TEST(RasterFile, ACutGeoTiffIsAnErrorAndNotZeros) {
  const TempFolder folder;
  const std::string path = folder.File("a.tif");
  ASSERT_EQ(
      WriteGeoTiff(path, {Geometry(60, 50, 50, 0, "EPSG:32632"), "Ground", 100180, 1000, {}}, CellNumbers(3000)).error,
      "");
  const std::string whole = ReadFile(path);
  for (int percent = 1; percent < 100; percent += 7) {
    SCOPED_TRACE(percent);
    const std::string cut = folder.Write(
        "cut.tif", std::string_view(whole).substr(0, whole.size() * static_cast<std::size_t>(percent) / 100));
    DataFile file;
    std::string error = file.Open(cut);
    std::vector<float> values(3000);
    if (error.empty()) error = file.Read({}, values);
    EXPECT_THAT(error, testing::StartsWith("cannot read " + cut));
  }
}

TEST(RasterFile, WhatCannotBeReadIsToldInWords) {
  const TempFolder folder;
  const auto raster = [](const char* size, const char* bands) {
    return fmt::format("<VRTDataset {}>{}</VRTDataset>", size, bands);
  };
  struct Row {
    std::string name, content;
    const char* reason;
  };
  const Row rows[] = {
      // No memory is asked for its values.
      {"large.vrt",
       raster(R"(rasterXSize="40000" rasterYSize="20000")", R"(<VRTRasterBand dataType="Float32" band="1"/>)"),
       "it has 800000000 cells; at most 400000000 can be read"},
      {"complex.vrt", raster(R"(rasterXSize="4" rasterYSize="2")", R"(<VRTRasterBand dataType="CFloat32" band="1"/>)"),
       "it has complex numbers alone"},
      {"none.vrt", raster(R"(rasterXSize="4" rasterYSize="2")", ""), "bands on VRTDataset"},
      {"text.tif", "hello", "neither a data file nor a raster"},
      {"short.tif", "II*", "it is too short"},
      {"lost.vrt",
       raster(
           R"(rasterXSize="4" rasterYSize="2")",
           R"(<VRTRasterBand dataType="Byte" band="1"><SimpleSource><SourceFilename>no.tif</SourceFilename></SimpleSource></VRTRasterBand>)"),
       "it is cut or damaged"},
  };
  for (const Row& row : rows) {
    SCOPED_TRACE(row.name);
    const std::string path = folder.Write(row.name, row.content);
    DataFile file;
    std::string error = file.Open(path);
    std::vector<float> values(8);
    if (error.empty()) error = file.Read({}, values);
    EXPECT_THAT(error, HasSubstr(row.reason));
    EXPECT_THAT(error, HasSubstr(path));
  }
  DataFile file;
  EXPECT_THAT(file.Open(folder.Path()), HasSubstr("folder"));
}

TEST(RasterFile, AGeoTiffThatCannotBeWrittenLeavesTheOldFile) {
  const TempFolder folder;
  const std::string path = folder.Write("a.tif", "mine");
  const FileResult result =
      WriteGeoTiff(path, {Geometry(2, 2, 50, 0, "GEOGCS[nonsense"), "Ground", 100180, 1000, {}}, CellNumbers(4));
  EXPECT_THAT(result.error, HasSubstr("projection"));
  EXPECT_EQ(ReadFile(path), "mine");
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(folder.Path()), {}), 1);
}

}  // namespace
}  // namespace tervane::raster_file_test
