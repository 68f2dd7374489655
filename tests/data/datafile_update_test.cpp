// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/datafile_update.h"

#include <cstdlib>
#include <fstream>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "tests/support/temp_folder.h"

namespace tervane::datafile_update_test {
namespace {

using test::TempFolder;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;

constexpr const char* kGrid = R"(netcdf a { dimensions: time = UNLIMITED; y = 3; x = 2; text = 4;
variables: double time(time); time:units = "days since 2000-01-01"; time:note = "kept";
  double y(y); y:standard_name = "projection_y_coordinate"; y:units = "m";
  double x(x); x:standard_name = "projection_x_coordinate"; x:units = "m";
  char label(text); label:long_name = "a text of others";
  TYPE level(time, y, x); level:units = "m"; level:_FillValue = FILL; level:history = "made by hand";
    level:actual_range = 1.f, 12.f; level:value_count = 11.;
  float rain(time, y, x); rain:units = "mm"; rain:valid_range = 0.f, 50.f;
  short packed(time, y, x); packed:scale_factor = 0.1;
  :institution = "elsewhere";
data: time = 0, 1; y = YS; x = 10, 20; label = "abcd";
  level = 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, FILL, 12;
  rain = 1, 1, 1, 1, 1, 1, 2, 2, 2, 2, 2, 2; packed = 1, 1, 1, 1, 1, 1, 2, 2, 2, 2, 2, 2; })";

std::string Replaced(std::string text, const std::string& what, const std::string& by) {
  for (std::size_t at = 0; (at = text.find(what, at)) != std::string::npos; at += by.size())
    text.replace(at, what.size(), by);
  return text;
}

class DataFileUpdateTest : public testing::Test {
 public:
  TempFolder folder;
  std::string path = folder.File("a.nds2");

  void Make(const std::string& kind, std::string text) {
    std::ofstream(folder.File("a.cdl")) << text;
    ASSERT_EQ(std::system(fmt::format("ncgen -k '{}' -o '{}' '{}'", kind, path, folder.File("a.cdl")).c_str()), 0);
  }
  /// The text form of the file, which shows all that it holds.
  std::string Dump(const std::string& file) const {
    EXPECT_EQ(std::system(fmt::format("ncdump '{}' > '{}'", file, folder.File("dump")).c_str()), 0);
    return test::ReadFile(folder.File("dump"));
  }
  static std::vector<float> Read(const std::string& file, int item, std::size_t step, std::size_t steps = 1) {
    DataFile data;
    EXPECT_EQ(data.Open(file), "");
    ValueSelection all{item, step, steps, {}};
    std::vector<float> values(data.SizeOf(all));
    EXPECT_EQ(data.Read(all, values), "");
    return values;
  }
  os::File Held() const {
    std::error_code error;
    return os::File::OpenForReading(path, error);
  }
};

TEST_F(DataFileUpdateTest, WhatIsNotChangedStaysInFilesOfEveryForm) {
  struct Row {
    const char *kind, *type, *fill, *ys;
  };
  const Row rows[] = {{"classic", "float", "-99.f", "1, 2, 3"},
                      {"64-bit offset", "double", "-99.", "3, 2, 1"},
                      {"nc4", "float", "-99.f", "3, 2, 1"},
                      {"cdf5", "float", "-99.f", "1, 2, 3"}};
  for (const Row& row : rows) {
    SCOPED_TRACE(row.kind);
    Make(row.kind, Replaced(Replaced(Replaced(kGrid, "TYPE", row.type), "FILL", row.fill), "YS", row.ys));
    const std::string before = Dump(path);
    std::vector<float> layer = Read(path, 1, 1);
    layer[1] = 100;
    layer[5] = kDeleteValue;
    os::File held = Held();
    DataFileUpdate update;
    ASSERT_EQ(update.Begin(held, path), "");
    ASSERT_EQ(update.PutLayer(1, {1, 0}, layer, [](int j) { return j != 1; }), "");
    ASSERT_EQ(update.Finish().error, "");
    EXPECT_EQ(Read(path, 1, 1), layer);
    EXPECT_THAT(Read(path, 1, 0), Not(testing::Contains(100)));
    DataFile data;
    ASSERT_EQ(data.Open(path), "");
    EXPECT_EQ(data.StoredStatistics(1)->largest, 100);
    EXPECT_EQ(data.StoredStatistics(1)->count, 10u);
    // But for the lines of what was changed, the text form is the same.
    const std::string after = Dump(path);
    std::string kept;
    for (const std::string& text : {before, after}) {
      std::string rest = text;
      for (const char* changed : {" level =", "actual_range", "value_count"}) {
        const std::size_t at = rest.find(changed);
        ASSERT_NE(at, std::string::npos) << changed;
        rest.erase(at, rest.find(';', at) - at);
      }
      if (kept.empty())
        kept = rest;
      else
        EXPECT_EQ(rest, kept);
    }
  }
}

TEST_F(DataFileUpdateTest, CellsThatStayKeepTheirDigitsAndTheirMarks) {
  // Numbers that no float has, and a mark that only missing_value tells.
  Make("classic",
       "netcdf a { dimensions: time = 1; y = 1; x = 4; variables: double time(time); time:units = \"days since "
       "2000-01-01\"; double y(y); y:standard_name = \"projection_y_coordinate\"; y:units = \"m\"; double x(x); "
       "x:standard_name = \"projection_x_coordinate\"; x:units = \"m\"; double level(time, y, x); level:units = "
       "\"m\"; level:missing_value = -9999.; data: time = 1; y = 5; x = 5, 15, 25, 35; level = 0.1, 0.2, -9999, 0.4; "
       "}");
  std::vector<float> layer = Read(path, 1, 0);
  ASSERT_EQ(layer.size(), 4U);
  EXPECT_EQ(layer[2], kDeleteValue);
  layer[1] = 7;
  layer[3] = kDeleteValue;
  os::File held = Held();
  DataFileUpdate update;
  ASSERT_EQ(update.Begin(held, path), "");
  ASSERT_EQ(update.PutLayer(1, {0, 0}, layer, [](int) { return true; }), "");
  ASSERT_EQ(update.Finish().error, "");
  EXPECT_THAT(Dump(path), testing::ContainsRegex("level =[ \n]*0\\.1, 7, -9999, -9999 ;"));
}

TEST_F(DataFileUpdateTest, WhatCannotBeChangedIsTold) {
  Make("classic", Replaced(Replaced(Replaced(kGrid, "TYPE", "float"), "FILL", "-99.f"), "YS", "1, 2, 3"));
  const FileUpdateFacts facts = UpdateFactsOf(path);
  ASSERT_EQ(facts.items.size(), 3u);
  EXPECT_EQ(facts.items[0].whyNot, "");
  EXPECT_EQ(facts.items[1].to, 50);
  EXPECT_THAT(facts.items[2].whyNot, HasSubstr("packed"));
  EXPECT_THAT(facts.whyNoOtherTimes, HasSubstr("more than series"));
  const std::string raster = folder.Write("a.asc", "ncols 1\nnrows 1\nxllcorner 0\nyllcorner 0\ncellsize 1\n5\n");
  EXPECT_THAT(UpdateFactsOf(raster).whyNot, HasSubstr("import"));
  EXPECT_THAT(UpdateFactsOf(folder.File("none.nds2")).whyNot, HasSubstr("none.nds2"));
}

TEST_F(DataFileUpdateTest, AFailedChangeLeavesTheFile) {
  Make("classic", Replaced(Replaced(Replaced(kGrid, "TYPE", "float"), "FILL", "-99.f"), "YS", "1, 2, 3"));
  const std::string before = test::ReadFile(path);
  os::File held = Held();
  DataFileUpdate update;
  ASSERT_EQ(update.Begin(held, path), "");
  EXPECT_THAT(update.PutLayer(1, {}, std::vector<float>(5), [](int) { return true; }),
              HasSubstr("nothing was written"));
  EXPECT_THAT(update.PutLayer(9, {}, std::vector<float>(6), [](int) { return true; }), HasSubstr("no item 9"));
  EXPECT_THAT(update.PutLayer(3, {}, std::vector<float>(6), [](int) { return true; }), HasSubstr("packed"));
  EXPECT_THAT(update.Begin(held, folder.File("missing/a.nds2")), HasSubstr("missing"));
  EXPECT_EQ(test::ReadFile(path), before);
}

TEST_F(DataFileUpdateTest, AFileThatWasRemovedIsSavedAll) {
  Make("classic", Replaced(Replaced(Replaced(kGrid, "TYPE", "float"), "FILL", "-99.f"), "YS", "1, 2, 3"));
  os::File held = Held();
  std::remove(path.c_str());
  DataFileUpdate update;
  ASSERT_EQ(update.Begin(held, path), "");
  ASSERT_EQ(update.Finish().error, "");
  EXPECT_EQ(Read(path, 2, 1).front(), 2);
}

TEST_F(DataFileUpdateTest, SeriesGetOtherTimesWithAllElseOfTheirFile) {
  const char* const kSeries = R"(netcdf a { dimensions: time = LENGTH; nv = 2; text = 4;
variables: TIME time(time); time:units = "days since 2000-01-01"; time:bounds = "b"; time:note = "kept";
  double b(time, nv); char label(text); double place; place:units = "m";
  float rain(time); rain:units = "mm"; rain:_FillValue = -5.f; rain:cell_methods = "time: sum";
    rain:actual_range = 1.f, 3.f; rain:value_count = 3.; double flow(time); flow:cell_methods = "time: mean";
  :institution = "elsewhere";
data: time = 1, 2, 3; b = 0, 1, 1, 2, 2, 3; label = "abcd"; place = 7; rain = 1, 2, 3; flow = 4, 5, 6; })";
  for (const char* kind : {"classic", "nc4", "cdf5", "64-bit offset"})
    for (const char* time : {"double", "int"})
      for (const char* length : {"UNLIMITED", "3"}) {
        SCOPED_TRACE(fmt::format("{} {} {}", kind, time, length));
        Make(kind, Replaced(Replaced(kSeries, "TIME", time), "LENGTH", length));
        EXPECT_EQ(UpdateFactsOf(path).whyNoOtherTimes, "");
        DataFile old;
        ASSERT_EQ(old.Open(path), "");
        const std::int64_t first = old.Time().stamps[0];
        RewrittenSeries series{
            {first, first + 3600, first + 7200, first + 90000}, first - 60, {{1, kDeleteValue, 8, 9}, {4, 5, 6, 7}}};
        os::File held = Held();
        const std::string to = folder.File("b.nds0");
        ASSERT_EQ(RewriteSeries(held, to, series).error, "");
        DataFile made;
        ASSERT_EQ(made.Open(to), "");
        EXPECT_EQ(made.Time().stamps, series.stamps);
        EXPECT_EQ(made.Time().begin->SecondsSinceEpoch(), first - 60);
        EXPECT_EQ(Read(to, 1, 0, 4), series.items[0]);
        EXPECT_EQ(Read(to, 2, 0, 4), series.items[1]);
        EXPECT_EQ(made.StoredStatistics(1)->largest, 9);
        const std::string dump = Dump(to);
        for (const char* kept : {"institution = \"elsewhere\"", "note = \"kept\"", "label = \"abcd\"", "place = 7",
                                 "_FillValue = -5.f", "days since 2000-01-01"})
          EXPECT_THAT(dump, HasSubstr(kept));
        // Of nothing, and of times that do not ascend, no file is made.
        EXPECT_THAT(RewriteSeries(held, to, {{}, {}, {{}, {}}}).error, HasSubstr("no steps"));
        series.stamps[1] = first;
        EXPECT_THAT(RewriteSeries(held, to, series).error, HasSubstr("not later"));
        EXPECT_EQ(Dump(to), dump);
      }
}

}  // namespace
}  // namespace tervane::datafile_update_test
