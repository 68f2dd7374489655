// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/datafile_writer.h"

#include <cmath>
#include <filesystem>

#include <gmock/gmock.h>

#include "tests/support/temp_folder.h"

namespace tervane::datafile_writer_test {
namespace {

using test::ReadFile;
using test::TempFolder;
using testing::HasSubstr;

constexpr const char* kUtm = R"(PROJCRS["WGS 84 / UTM zone 32N",BASEGEOGCRS["WGS 84"]])";

FileGeometry Grid(int nx, int ny, int nz, double rotation = 0, std::string projection = {}) {
  FileGeometry geometry;
  geometry.nx = nx;
  geometry.ny = ny;
  geometry.nz = nz;
  geometry.cellSize = geometry.cellHeight = 50;
  geometry.x0 = 500000.1;
  geometry.y0 = 6100000.2;
  geometry.rotation = rotation;
  geometry.projection = std::move(projection);
  return geometry;
}

NewDataFile Rain(int dimensions, FileGeometry geometry) {
  NewDataFile content;
  content.dimensions = dimensions;
  content.geometry = std::move(geometry);
  content.items = {{"Précipitation", 100182, 2001, ValueType::MeanStep}, {"Level", 100180, 1000, {}}};
  return content;
}

class DataFileWriterTest : public testing::Test {
 public:
  TempFolder folder;
  std::string path = folder.File("a.nds2");

  std::size_t FilesInFolder() const {
    const std::filesystem::directory_iterator begin(folder.Path());
    return static_cast<std::size_t>(std::distance(begin, std::filesystem::directory_iterator()));
  }
};

TEST_F(DataFileWriterTest, EveryKindComesBackAsItWasWritten) {
  struct Row {
    const char* name;
    int dimensions;
    FileGeometry geometry;
    bool hasTime;
  };
  FileGeometry geographical = Grid(4, 3, 1, 0, R"(GEOGCRS["WGS 84"])");
  geographical.cellSize = geographical.cellHeight = 0.1;
  geographical.x0 = 4.05;
  geographical.y0 = 51.3;
  geographical.isGeographical = true;
  const Row rows[] = {
      {"series", 0, {}, true},
      {"line", 1, Grid(7, 1, 1), true},
      {"grid", 2, Grid(5, 3, 1), true},
      {"grid without times", 2, Grid(5, 3, 1, 0, kUtm), false},
      {"one cell", 2, Grid(1, 1, 1), true},
      {"one row", 2, Grid(4, 1, 1, 0, kUtm), true},
      {"rotated grid", 2, Grid(5, 3, 1, 30, kUtm), true},
      {"rotated cell", 2, Grid(1, 1, 1, -45), false},
      {"geographical grid", 2, geographical, true},
      {"layers", 3, Grid(4, 3, 2, 0, kUtm), true},
      {"rotated layers", 3, Grid(4, 3, 2, 12.5), true},
  };
  for (const bool isCompressed : {false, true}) {
    for (const Row& row : rows) {
      SCOPED_TRACE(row.name);
      NewDataFile content = Rain(row.dimensions, row.geometry);
      content.isCompressed = isCompressed;
      content.hasTime = row.hasTime;
      const std::size_t steps = row.hasTime ? 3 : 1;
      const auto nx = static_cast<std::size_t>(row.geometry.nx), ny = static_cast<std::size_t>(row.geometry.ny);
      const std::size_t cells = nx * ny * static_cast<std::size_t>(row.geometry.nz);
      const auto valuesOf = [&](std::size_t step, int item) {
        std::vector<float> values(cells);
        for (std::size_t i = 0; i < cells; ++i)
          values[i] = static_cast<float>(item) * 1000.5f + static_cast<float>(step * cells + i);
        return values;
      };
      DataFileWriter writer;
      ASSERT_EQ(writer.Create(path, content), "");
      for (std::size_t step = 0; step < steps; ++step) {
        if (row.hasTime) {
          ASSERT_EQ(writer.AddStep(CYbDateTime(2000, 2, 28) + CYbDateTimeSpan::Days(1.0 + double(step))), "");
        }
        const std::vector<float> first = valuesOf(step, 1);
        for (int layer = 0; layer < row.geometry.nz; ++layer)
          ASSERT_EQ(
              writer.PutLayer(1, layer, std::span(first).subspan(static_cast<std::size_t>(layer) * nx * ny, nx * ny)),
              "");
        ASSERT_EQ(writer.Put(2, valuesOf(step, 2)), "");
      }
      ASSERT_EQ(writer.Finish().error, "");

      DataFile file;
      ASSERT_EQ(file.Open(path), "");
      EXPECT_THAT(file.Notes(), testing::IsEmpty());
      ASSERT_EQ(file.Items().size(), 2u);
      const DataItem& item = file.Items()[0];
      EXPECT_EQ(item.name, "Précipitation");
      EXPECT_EQ(item.itemType, 100182);
      EXPECT_EQ(item.unitKey, 2001);
      EXPECT_EQ(item.valueType, ValueType::MeanStep);
      EXPECT_EQ(file.Items()[1].valueType, ValueType::Instantaneous);
      EXPECT_EQ(item.dimensions, row.dimensions);
      FileGeometry expected = row.geometry;
      if (row.dimensions == 1) expected.y0 = 0;
      EXPECT_EQ(item.geometry, expected) << item.geometry.x0 << " " << item.geometry.cellSize;
      EXPECT_EQ(file.Time().steps, steps);
      EXPECT_EQ(file.Time().hasDates, row.hasTime);
      if (row.hasTime) {
        EXPECT_EQ(file.Time().stepSeconds, 86400);
        EXPECT_EQ(*file.Time().begin, CYbDateTime(2000, 2, 28));
        EXPECT_EQ(file.Time().Start(), CYbDateTime(2000, 2, 29));
        EXPECT_EQ(file.Time().End(), CYbDateTime(2000, 3, 2));
      }
      std::vector<float> values(cells);
      for (std::size_t step = 0; step < steps; ++step) {
        for (const int number : {1, 2}) {
          ASSERT_EQ(file.Read({number, step, 1, {}}, values), "");
          EXPECT_EQ(values, valuesOf(step, number));
        }
      }
      // Millimeters per hour, whose item type's base unit is millimeters per day.
      ASSERT_EQ(file.Read({1, 0, 1, {}}, values, 100182), "");
      EXPECT_EQ(values[0], 1000.5f * 24);
      ItemStatistics statistics;
      ASSERT_EQ(file.Statistics(2, statistics), "");
      EXPECT_TRUE(statistics.isStored);
      EXPECT_EQ(statistics.smallest, 2001);
      EXPECT_EQ(statistics.largest, 2001 + static_cast<double>(steps * cells - 1));
      EXPECT_EQ(statistics.count, steps * cells);
    }
  }
}

TEST_F(DataFileWriterTest, MissingValuesAreStoredAsSuchAndNotCounted) {
  DataFileWriter writer;
  ASSERT_EQ(writer.Create(path, Rain(2, Grid(4, 1, 1))), "");
  ASSERT_EQ(writer.AddStep({2000, 1, 1}), "");
  ASSERT_EQ(writer.Put(1, std::vector{1.0f, kDeleteValue, std::nanf(""), -INFINITY}), "");
  ASSERT_EQ(writer.Put(2, std::vector(4, kDeleteValue)), "");
  ASSERT_EQ(writer.Finish().error, "");
  DataFile file;
  ASSERT_EQ(file.Open(path), "");
  std::vector<float> values(4);
  ASSERT_EQ(file.Read({}, values), "");
  EXPECT_EQ(values, (std::vector{1.0f, kDeleteValue, kDeleteValue, kDeleteValue}));
  ItemStatistics statistics;
  ASSERT_EQ(file.Statistics(1, statistics), "");
  EXPECT_EQ(statistics.count, 1u);
  EXPECT_EQ(statistics.smallest, 1);
  ASSERT_EQ(file.Statistics(2, statistics), "");
  EXPECT_EQ(statistics.count, 0u);
  EXPECT_TRUE(std::isnan(statistics.largest));
  // A single step does not tell how long it was.
  EXPECT_EQ(*file.Time().begin, file.Time().Start());
}

TEST_F(DataFileWriterTest, WhatIsNotFinishedLeavesTheOldFileAndNothingElse) {
  struct Row {
    const char* what;
    std::string (*write)(DataFileWriter&);
    const char* error;
  };
  const Row rows[] = {
      {"given up", [](DataFileWriter&) { return std::string("-"); }, "-"},
      {"item left out",
       [](DataFileWriter& writer) {
         writer.AddStep({2000, 1, 1});
         writer.Put(1, std::vector<float>(4));
         return writer.Finish().error;
       },
       "step 1 lacks the values of item 2"},
      {"step not ended",
       [](DataFileWriter& writer) {
         writer.AddStep({2000, 1, 1});
         return writer.AddStep({2000, 1, 2});
       },
       "lacks the values of item 1"},
      {"put twice",
       [](DataFileWriter& writer) {
         writer.AddStep({2000, 1, 1});
         writer.Put(1, std::vector<float>(4));
         return writer.Put(1, std::vector<float>(4));
       },
       "put twice in step 1"},
      {"no step", [](DataFileWriter& writer) { return writer.Put(1, std::vector<float>(4)); }, "no step was begun"},
      {"wrong size",
       [](DataFileWriter& writer) {
         writer.AddStep({2000, 1, 1});
         return writer.Put(1, std::vector<float>(3));
       },
       "takes 4 values, 3 were given"},
      {"no such item",
       [](DataFileWriter& writer) {
         writer.AddStep({2000, 1, 1});
         return writer.Put(3, std::vector<float>(4));
       },
       "there is no item 3"},
      {"no date",
       [](DataFileWriter& writer) {
         return writer.AddStep({2001, 2, 29});
       },
       "is no date"},
      {"back in time",
       [](DataFileWriter& writer) {
         writer.AddStep({2000, 1, 2});
         writer.Put(1, std::vector<float>(4));
         writer.Put(2, std::vector<float>(4));
         return writer.AddStep({2000, 1, 2});
       },
       "is not later than the one before"},
  };
  folder.Write("a.nds2", "old");
  for (const Row& row : rows) {
    {
      DataFileWriter writer;
      ASSERT_EQ(writer.Create(path, Rain(2, Grid(2, 2, 1))), "");
      EXPECT_THAT(row.write(writer), HasSubstr(row.error)) << row.what;
      // The first goes without an end.
      if (&row != rows) {
        EXPECT_NE(writer.Finish().error, "") << row.what;
      }
    }
    EXPECT_EQ(ReadFile(path), "old") << row.what;
    EXPECT_EQ(FilesInFolder(), 1u) << row.what;
  }
}

TEST_F(DataFileWriterTest, WhatNoFileCanHoldIsRefused) {
  struct Row {
    void (*spoil)(NewDataFile&);
    const char* error;
  };
  const Row rows[] = {
      {[](NewDataFile& file) { file.items.clear(); }, "needs an item"},
      {[](NewDataFile& file) { file.items[0].itemType = 5; }, "no item type 5"},
      {[](NewDataFile& file) { file.items[0].unitKey = 1000; }, "meter is no unit of Evapotranspiration"},
      {[](NewDataFile& file) { file.items[0].name = "\xFF"; }, "UTF-8"},
      {[](NewDataFile& file) { file.geometry.nx = 0; }, "at least one cell"},
      {[](NewDataFile& file) { file.geometry.nx = file.geometry.ny = 30000; }, "900000000 cells is too large"},
      {[](NewDataFile& file) { file.geometry.cellSize = 0; }, "larger than 0"},
      {[](NewDataFile& file) { file.geometry.x0 = NAN; }, "must be numbers"},
      {[](NewDataFile& file) { file.geometry.cellHeight = 20; }, "must be square"},
      {[](NewDataFile& file) { file.dimensions = 4; }, "0 to 3 dimensions"},
  };
  for (const Row& row : rows) {
    NewDataFile content = Rain(2, Grid(2, 2, 1));
    row.spoil(content);
    DataFileWriter writer;
    EXPECT_THAT(writer.Create(path, content), HasSubstr(row.error));
  }
  DataFileWriter writer;
  EXPECT_THAT(writer.Create(folder.File("no/a.nds2"), Rain(2, Grid(2, 2, 1))), HasSubstr("does not exist"));
  EXPECT_EQ(FilesInFolder(), 0u);
}

TEST_F(DataFileWriterTest, LargeGridsGoInPiecesAndWhatIsCancelledLeavesTheOldFile) {
  // More than is read at once, and more columns and rows than a compressed piece has.
  const FileGeometry geometry = Grid(1500, 1100, 1);
  std::vector<float> values(1500 * 1100);
  for (std::size_t i = 0; i < values.size(); ++i) values[i] = static_cast<float>(i);
  for (const bool isCompressed : {false, true}) {
    SCOPED_TRACE(isCompressed);
    NewDataFile content;
    content.geometry = geometry;
    content.items = {{"Level", 100180, 1000, {}}};
    content.hasTime = false;
    content.isCompressed = isCompressed;
    DataFileWriter writer;
    Progress written;
    ASSERT_EQ(writer.Create(path, content), "");
    ASSERT_EQ(writer.Put(1, values, written), "");
    ASSERT_EQ(writer.Finish(written).error, "");
    EXPECT_GT(written.Done(), 0.9);

    DataFile file;
    ASSERT_EQ(file.Open(path), "");
    std::vector<float> read(values.size());
    Progress done;
    EXPECT_EQ(file.Read({}, read, {}, done), "");
    EXPECT_EQ(read, values);
    EXPECT_EQ(done.Done(), 1);
    Progress cancelled;
    cancelled.Cancel();
    EXPECT_THAT(file.Read({}, read, {}, cancelled), HasSubstr("a.nds2: cancelled"));

    const std::string before = ReadFile(path);
    ASSERT_EQ(writer.Create(path, content), "");
    EXPECT_THAT(writer.Put(1, values, cancelled), HasSubstr("cancelled"));
    EXPECT_THAT(writer.Finish(cancelled).error, HasSubstr("cancelled"));
    EXPECT_EQ(FilesInFolder(), 1U);
    EXPECT_EQ(ReadFile(path), before);
  }
}

}  // namespace
}  // namespace tervane::datafile_writer_test
