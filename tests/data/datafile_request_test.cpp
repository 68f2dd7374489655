// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/datafile_request.h"

#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "tests/support/temp_folder.h"

namespace tervane::datafile_request_test {
namespace {

using Period = DataFileRequest::Period;

TEST(DataFileRequest, TellsInWordsWhatIsNotMet) {
  const test::TempFolder folder;
  const std::string path = folder.File("a.nds0");
  NewDataFile content;
  content.dimensions = 0;
  content.items = {{"Rain", 100182, 2004, ValueType::MeanStep}, {"Level", 100180, 1000, {}}, {"Other", 999, 99000, {}}};
  content.begin = CYbDateTime(2001, 1, 1);
  DataFileWriter writer;
  ASSERT_EQ(writer.Create(path, content), "");
  for (int month = 2; month <= 6; ++month) {
    ASSERT_EQ(writer.AddStep({2001, month, 1}), "");
    for (const int item : {1, 2, 3}) ASSERT_EQ(writer.Put(item, std::vector{1.0f}), "");
  }
  ASSERT_EQ(writer.Finish().error, "");

  struct Row {
    std::vector<int> items;
    DataFileRequest request;
    const char* reason;
  };
  const CYbDateTime january(2001, 1, 1), february(2001, 2, 1), june(2001, 6, 1), next(2002, 1, 1, 12);
  const Row rows[] = {
      {{}, {{100182}, 0, Period{january, june}, 5}, ""},
      {{3}, {}, ""},
      {{1, 2}, {{100180, 100182}, {}, {}, {}}, ""},
      {{2}, {{100182}, {}, {}, {}}, "item 2 is Elevation, Evapotranspiration was expected"},
      {{}, {{100180, 100004}, {}, {}, {}}, "item 1 is Evapotranspiration, Elevation or Rainfall was expected"},
      {{3}, {{100180}, {}, {}, {}}, "item 3 has no item type, Elevation was expected"},
      {{1}, {{}, 2, {}, {}}, "item 1 is a time series, a grid was expected"},
      {{5}, {}, "there is no item 5: the file has 3"},
      {{0}, {}, "there is no item 0: the file has 3"},
      {{1}, {{}, {}, {}, 1}, "the file has 5 time steps, one was expected"},
      {{1}, {{}, {}, {}, 12}, "the file has 5 time steps, 12 were expected"},
      {{1},
       {{}, {}, Period{january, next}, {}},
       "the file covers 2001-01-01 to 2001-06-01, the simulation runs to 2002-01-01 12:00"},
      // An instantaneous value tells nothing of the time before it.
      {{2},
       {{}, {}, Period{january, june}, {}},
       "the file covers 2001-02-01 to 2001-06-01, the simulation starts at 2001-01-01"},
      {{2}, {{}, {}, Period{february, june}, {}}, ""},
      {{2},
       {{}, {}, Period{january, next}, {}},
       "the file covers 2001-02-01 to 2001-06-01, the simulation runs from 2001-01-01 to 2002-01-01 12:00"},
  };
  for (const Row& row : rows) EXPECT_EQ(WhyNotMet(path, row.items, row.request), row.reason);
  EXPECT_THAT(WhyNotMet(folder.File("b.nds0"), {}, {}), testing::HasSubstr("it does not exist"));
}

TEST(DataFileRequest, WhatNoQuantityOrGridCanBeMadeOfIsRefused) {
  DataFileFacts file;
  DataItem item;
  item.itemType = 100180;
  item.dimensions = 2;
  item.geometry.nx = item.geometry.ny = 3;
  item.unitText = "kg";
  item.scale = UnitScale{Dimension::Mass};
  file.items = {item};
  EXPECT_EQ(WhyNotMet(file, {}, {{100180}, 2, {}, {}}), "item 1 is in \"kg\", which is no unit of Elevation");
  EXPECT_EQ(WhyNotMet(file, {}, {{}, 2, {}, {}}), "");
  file.items[0].scale = UnitScale{Dimension::Length};
  file.items[0].geometry.cellSize = 100;
  file.items[0].geometry.cellHeight = 200;
  EXPECT_THAT(WhyNotMet(file, {}, {{100180}, 2, {}, {}}), testing::HasSubstr("cells of 100 x 200, square ones"));
  file.items[0].geometry.cellHeight = 100.00001;
  EXPECT_EQ(WhyNotMet(file, {}, {{100180}, 2, {}, {}}), "");
}

}  // namespace
}  // namespace tervane::datafile_request_test
