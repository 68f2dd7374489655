// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/datafile.h"

#include <cmath>
#include <cstdlib>
#include <thread>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "platform/item_types.h"
#include "tests/support/temp_folder.h"

namespace tervane::datafile_test {
namespace {

using test::ReadFile;
using test::TempFolder;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

constexpr float kNone = kDeleteValue;

/// A file that another program would have written, from its text form; kinds are those of `ncgen -k`.
class ForeignFile : public testing::Test {
 public:
  TempFolder folder;

  void SetUp() override {
    ASSERT_EQ(std::system("command -v ncgen >/dev/null"), 0) << "ncgen makes the files of others: run scripts/packages";
  }
  std::string Make(const std::string& text, const std::string& kind = "classic") const {
    const std::string source = folder.Write("a.cdl", text);
    std::string path = folder.File("a.nc");
    EXPECT_EQ(std::system(fmt::format("ncgen -k '{}' -o '{}' '{}'", kind, path, source).c_str()), 0) << text;
    return path;
  }
  static std::vector<float> Values(const DataFile& file, ValueSelection selection = {},
                                   std::optional<int> inBaseUnitOf = {}) {
    std::vector<float> values(file.SizeOf(selection), 12345);
    EXPECT_EQ(file.Read(selection, values, inBaseUnitOf), "");
    return values;
  }
};

constexpr const char* kWeather = R"(netcdf a {
dimensions: time = UNLIMITED ; lat = 2 ; lon = 3 ; nv = 2 ;
variables:
  double time(time) ; time:units = "days since 2000-02-28" ; time:bounds = "tb" ;
  double tb(time, nv) ;
  float lat(lat) ; lat:units = "degrees_north" ;
  float lon(lon) ; lon:units = "degrees_east" ;
  short t2m(time, lat, lon) ; t2m:units = "K" ; t2m:long_name = "2 m temperature" ;
    t2m:scale_factor = 0.01 ; t2m:add_offset = 273.15 ; t2m:_FillValue = -9999s ;
    t2m:cell_methods = "time: mean" ; t2m:coordinates = "mask" ;
  int mask(lat, lon) ;
data:
  time = 0.5, 1.5 ; tb = 0, 1, 1, 2 ;
  lat = 51.5, 51.25 ; lon = 4, 4.25, 4.5 ;
  t2m = 100, 200, 300, 400, 500, _, 1, 2, 3, 4, 5, 6 ;
  mask = 1, 1, 1, 1, 1, 1 ;
})";

TEST_F(ForeignFile, PackedGeographicalNorthFirstGridIsReadInEveryKind) {
  for (const char* kind : {"classic", "64-bit offset", "64-bit data", "netCDF-4", "netCDF-4 classic model"}) {
    DataFile file;
    ASSERT_EQ(file.Open(Make(kWeather, kind)), "") << kind;
    ASSERT_EQ(file.Items().size(), 1u);
    const DataItem& item = file.Items()[0];
    EXPECT_EQ(item.name, "2 m temperature");
    EXPECT_EQ(item.itemType, quantity::kUndefined);
    EXPECT_EQ(item.unitKey, 2802);
    EXPECT_EQ(item.valueType, ValueType::MeanStep);
    EXPECT_EQ(item.dimensions, 2);
    const FileGeometry& geometry = item.geometry;
    EXPECT_TRUE(geometry.isGeographical);
    EXPECT_THAT((std::vector<double>{geometry.x0, geometry.y0, geometry.cellSize, geometry.cellHeight}),
                ElementsAre(3.875, 51.125, 0.25, 0.25));
    // Means stand at the ends of their days, not in the middle.
    EXPECT_EQ(file.Time().Start(), CYbDateTime(2000, 2, 29));
    EXPECT_EQ(file.Time().End(), CYbDateTime(2000, 3, 1));
    EXPECT_EQ(*file.Time().begin, CYbDateTime(2000, 2, 28));
    EXPECT_EQ(file.Time().stepSeconds, 86400);
    EXPECT_THAT(file.Notes(), ElementsAre(HasSubstr("ends are taken")));
    EXPECT_THAT(Values(file), ElementsAre(277.15f, 278.15f, kNone, 274.15f, 275.15f, 276.15f));
    EXPECT_THAT(Values(file, {}, 100006), ElementsAre(4, 5, kNone, 1, 2, 3));
    ItemStatistics statistics;
    ASSERT_EQ(file.Statistics(1, statistics), "");
    EXPECT_FALSE(statistics.isStored);
    EXPECT_EQ(statistics.count, 11u);
    EXPECT_NEAR(statistics.smallest, 273.16, 1e-4);
    EXPECT_NEAR(statistics.largest, 278.15, 1e-4);
  }
}

TEST_F(ForeignFile, ValuesComeInOurOrderWhateverTheFilesOrder) {
  struct Row {
    const char* shape;
    const char* axes;  ///< Values of z, y, x.
    std::vector<float> values;
  };
  // Stored are 0, 1, 2, ... in the file's order; wanted is z from the bottom, y from the south, x from the west.
  const Row rows[] = {
      {"z, y, x", "z = 1, 2 ; y = 5, 15 ; x = 5, 15", {0, 1, 2, 3, 4, 5, 6, 7}},
      {"z, y, x", "z = 1, 2 ; y = 15, 5 ; x = 5, 15", {2, 3, 0, 1, 6, 7, 4, 5}},
      {"z, y, x", "z = 2, 1 ; y = 5, 15 ; x = 5, 15", {4, 5, 6, 7, 0, 1, 2, 3}},
      {"z, y, x", "z = 1, 2 ; y = 5, 15 ; x = 15, 5", {1, 0, 3, 2, 5, 4, 7, 6}},
      {"x, y, z", "z = 1, 2 ; y = 5, 15 ; x = 5, 15", {0, 4, 2, 6, 1, 5, 3, 7}},
      {"y, z, x", "z = 1, 2 ; y = 15, 5 ; x = 5, 15", {4, 5, 0, 1, 6, 7, 2, 3}},
  };
  for (const char* type : {"float", "int"}) {
    for (const Row& row : rows) {
      DataFile file;
      const std::string text = fmt::format(
          "netcdf a {{ dimensions: x = 2 ; y = 2 ; z = 2 ; variables: {} v({}) ; double x(x) ; double y(y) ;"
          "double z(z) ; z:positive = \"up\" ; data: v = 0, 1, 2, 3, 4, 5, 6, 7 ; {} ; }}",
          type, row.shape, row.axes);
      ASSERT_EQ(file.Open(Make(text)), "") << text;
      EXPECT_EQ(file.Items()[0].dimensions, 3);
      EXPECT_EQ(Values(file), row.values) << text;
      ValueSelection top;
      top.layer = 1;
      EXPECT_EQ(Values(file, top), std::vector<float>(row.values.begin() + 4, row.values.end())) << text;
      ValueSelection column;
      column.cells = CellWindow{1, 0, 1, 2};
      EXPECT_EQ(Values(file, column), (std::vector<float>{row.values[1], row.values[3], row.values[5], row.values[7]}))
          << text;
      ValueSelection cell = top;
      cell.cells = CellWindow{0, 1, 1, 1};
      EXPECT_EQ(Values(file, cell), std::vector<float>{row.values[6]}) << text;
      cell.cells = CellWindow{1, 1, 2, 1};
      std::vector<float> two(2);
      EXPECT_NE(file.Read(cell, two), "");
    }
  }
}

TEST_F(ForeignFile, WhatIsNoValueIsTheDeleteValue) {
  struct Row {
    const char* type;
    const char* attributes;
    const char* data;
    std::vector<float> values;
  };
  const Row rows[] = {
      {"float", "", "1, NaNf, Infinityf", {1, kNone, kNone}},
      {"float", "v:_FillValue = 0.f ;", "1, 0, 2", {1, kNone, 2}},
      {"float", "v:_FillValue = NaNf ; v:missing_value = -99.f ;", "1, NaNf, -99", {1, kNone, kNone}},
      {"float", "", "1, 9.96921e36f, 2", {1, kNone, 2}},
      {"double", "v:missing_value = -9999., -8888. ;", "-9999, -8888, 3", {kNone, kNone, 3}},
      {"double", "v:valid_min = 0. ;", "-1, 0, 1", {kNone, 0, 1}},
      {"float", "v:valid_range = 0.f, 5.f ;", "-1, 5, 6", {kNone, 5, kNone}},
      {"byte", "v:_Unsigned = \"true\" ; v:_FillValue = -1b ;", "-1, -2, 3", {kNone, 254, 3}},
      {"byte", "", "-127, 0, 1", {-127, 0, 1}},
      {"int", "", "-2147483647, 0, 1", {kNone, 0, 1}},
      {"short", "v:scale_factor = 0. ;", "1, 2, 3", {0, 0, 0}},
      {"float", "v:missing_value = \"none\" ; v:scale_factor = \"x\" ;", "1, 2, 3", {1, 2, 3}},
  };
  for (const Row& row : rows) {
    DataFile file;
    ASSERT_EQ(file.Open(Make(fmt::format("netcdf a {{ dimensions: time = 3 ; variables: {} v(time) ; {}"
                                         " double time(time) ; time:units = \"days since 2000-01-01\" ;"
                                         " data: v = {} ; time = 1, 2, 4 ; }}",
                                         row.type, row.attributes, row.data))),
              "");
    ValueSelection all;
    all.steps = 3;
    EXPECT_EQ(Values(file, all), row.values) << row.type << row.attributes;
    EXPECT_EQ(file.Time().stepSeconds, 0);
    EXPECT_FALSE(file.Items()[0].geometry.IsPlaced());
  }
}

TEST_F(ForeignFile, WhatCannotBeUsedIsToldWithItsReason) {
  struct Row {
    const char* text;  ///< Behind the dimensions.
    const char* error;
    const char* note;
  };
  constexpr const char* kTime = "double time(time) ; time:units = \"days since 2000-01-01\" ;";
  const Row rows[] = {
      {"time = 2 ; variables: float v(time) ; TIME data: time = 1, 1 ;",
       "time of step 2, 2000-01-02 00:00:00, is not later", ""},
      {"time = 2 ; variables: float v(time) ; TIME data: time = 2, 1 ;", "sort the steps by time", ""},
      {"time = 2 ; variables: float v(time) ; TIME time:calendar = \"360_day\" ; data: time = 1, 2 ;", "360_day", ""},
      {"time = 2 ; variables: float v(time) ; TIME data: time = 1, NaN ;", "time of step 2 is nan", ""},
      {"time = 2 ; variables: float v(time) ; TIME data: time = 1, 1e9 ;", "no date of the years 1 to 9999", ""},
      {"time = 2 ; variables: float v(time) ; char time(time) ;", "times in time are no numbers", ""},
      {"time = 2 ; variables: float v(time) ; double time(time) ;", "were expected", ""},
      {"time = 2 ; variables: float v(time) ;", "", "no variable that tells the times"},
      {"time = UNLIMITED ; variables: float v(time) ; TIME", "", "no time steps"},
      {"x = 2 ; variables: char v(x) ;", "holds no item", ""},
      {"x = 2 ; variables: float crs ;", "holds no item", ""},
      {"x = 2 ; y = 2 ; variables: float v(y, x) ;", "", "place of v is unknown: x: it has no coordinates"},
      {"x = 3 ; y = 1 ; variables: float v(y, x) ; double x(x) ; double y(y) ; data: x = 1, 2, 4 ; y = 1 ;", "",
       "not equally spaced"},
      {"x = 2 ; y = 2 ; variables: float v(y, x) ; char x(x) ; double y(y) ; data: y = 1, 2 ;", "",
       "coordinates are no numbers"},
      {"x = 2 ; y = 1 ; variables: float v(y, x) ; double x(x) ; x:units = \"radian\" ; double y(y) ; data: x = 1, 2 ; "
       "y = 1 ;",
       "", "no length"},
      {"x = 2 ; y = 1 ; variables: float v(y, x) ; double x(x) ; x:units = \"km\" ; double y(y) ; data: x = 1, 2 ; y = "
       "1 ;",
       "", "converted from km"},
      {"x = 2 ; y = 2 ; a = 2 ; b = 2 ; variables: float v(a, b, y, x) ; float w(x) ;", "",
       "variable v is left out: it has more than three"},
      {"time = 1 ; t = 1 ; variables: float v(time, t) ; float w(time) ;", "",
       "variable v is left out: it has two dimensions of time"},
      {"x = 2 ; variables: float v(x) ; v:item_type = 5 ;", "", "item type 5, which is unknown"},
      {"x = 2 ; variables: float v(x) ; v:item_type = 100006 ; v:units = \"m\" ;", "",
       "\"m\", which is none of Temperature"},
  };
  for (const Row& row : rows) {
    std::string text = row.text;
    if (const std::size_t place = text.find("TIME"); place != std::string::npos) text.replace(place, 4, kTime);
    DataFile file;
    const std::string path = Make("netcdf a { dimensions: " + text + " }");
    const std::string error = file.Open(path);
    EXPECT_EQ(error.empty(), *row.error == '\0') << text << error;
    EXPECT_THAT(error, HasSubstr(row.error)) << text;
    if (!error.empty()) {
      EXPECT_THAT(error, testing::StartsWith("cannot read " + path + ": "));
    }
    if (error.empty()) {
      EXPECT_THAT(file.Notes(), testing::Contains(HasSubstr(row.note))) << text;
    }
  }
}

TEST_F(ForeignFile, HugeGridsAreRefusedBeforeMemoryIsAsked) {
  struct Row {
    const char* dimensions;
    const char* error;
  };
  // What was never written takes no room in such a file.
  constexpr Row kRows[] = {{"x = 30000 ; y = 30000", "900000000 cells; at most 400000000"},
                           {"x = 20000000 ; y = 1", "20000000 cells in one direction"},
                           {"x = 2 ; time = 60000000", "60000000 time steps"}};
  for (const Row& row : kRows) {
    const bool hasTime = std::string_view(row.dimensions).find("time") != std::string_view::npos;
    DataFile file;
    const std::string path =
        Make(fmt::format(
                 "netcdf a {{ dimensions: {} ; variables: float v({}) ; v:_Storage = \"chunked\" ; v:_ChunkSizes = 1, "
                 "1 ; v:_NoFill = \"true\" ; {} }}",
                 row.dimensions, hasTime ? "time, x" : "y, x", hasTime ? "byte time(time) ;" : ""),
             "netCDF-4");
    EXPECT_THAT(file.Open(path), HasSubstr(row.error)) << row.dimensions;
  }
}

TEST_F(ForeignFile, ACutOrDamagedFileIsRefusedOrReadButNeverAsZeros) {
  for (const char* kind : {"classic", "64-bit offset", "64-bit data", "netCDF-4"}) {
    const std::string whole = ReadFile(Make(kWeather, kind));
    const std::string path = folder.File("cut.nc");
    std::vector<float> expected;
    {
      DataFile file;
      ASSERT_EQ(file.Open(folder.File("a.nc")), "");
      expected = Values(file, {1, 1, 1, {}});
    }
    const std::size_t stride = whole.size() > 4000 ? 61 : 1;
    for (std::size_t size = 0; size < whole.size(); size += stride) {
      folder.Write("cut.nc", whole.substr(0, size));
      DataFile file;
      const std::string error = file.Open(path);
      // The padding behind the last value may be missing.
      if (!error.empty() || size + 4 > whole.size()) continue;
      std::vector<float> values(6);
      const std::string readError = file.Read({1, 1, 1, {}}, values);
      EXPECT_TRUE(!readError.empty() || values == expected) << kind << " cut to " << size;
    }
    if (std::string_view(kind) == "netCDF-4") continue;
    // Each byte of the header in turn, as large and as small as it can be: no crash, no hang.
    const std::size_t header = std::min<std::size_t>(whole.size(), 900);
    for (std::size_t i = 4; i < header; ++i) {
      for (const char byte : {'\xFF', '\x7F', '\0'}) {
        std::string damaged = whole;
        damaged[i] = byte;
        folder.Write("cut.nc", damaged);
        DataFile file;
        if (!file.Open(path).empty()) continue;
        for (std::size_t n = 1; n <= file.Items().size(); ++n) {
          const ValueSelection first{static_cast<int>(n), 0, 1, {}};
          if (file.SizeOf(first) > 1000) continue;
          std::vector<float> values(file.SizeOf(first));
          (void)file.Read(first, values);
        }
      }
    }
  }
}

TEST(DataFile, WhatIsNoDataFileIsNamed) {
  const TempFolder folder;
  struct Row {
    std::string content;
    const char* error;
  };
  const Row rows[] = {{"", "too short"},
                      {"hello, world", "it is neither a data file nor a raster"},
                      {"CDF\x03" + std::string(40, '\0'), "known version"},
                      {"CDF\x01", "header is cut or damaged"},
                      {"CDF\x01" + std::string(28, '\xFF'), "header is cut or damaged"},
                      {"\x89HDF\r\n\x1a\n" + std::string(100, '\0'), "cannot read"}};
  for (const Row& row : rows) {
    DataFile file;
    EXPECT_THAT(file.Open(folder.Write("x.nds2", row.content)), HasSubstr(row.error));
  }
  DataFile file;
  EXPECT_THAT(file.Open(folder.File("missing.nds2")), HasSubstr("it does not exist"));
  EXPECT_THAT(file.Open(folder.Path()), HasSubstr("it is a folder"));
  // The library itself would look for this one in the network.
  EXPECT_THAT(file.Open("http://127.0.0.1:1/a.nc"), HasSubstr("it does not exist"));
}

TEST_F(ForeignFile, ManyThreadsReadAtOnce) {
  const std::string path = Make(kWeather, "netCDF-4");
  std::vector<std::thread> threads;
  for (int i = 0; i < 4; ++i) {
    threads.emplace_back([&] {
      for (int run = 0; run < 20; ++run) {
        DataFile file;
        ASSERT_EQ(file.Open(path), "");
        ASSERT_EQ(Values(file)[0], 277.15f);
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
}

}  // namespace
}  // namespace tervane::datafile_test
