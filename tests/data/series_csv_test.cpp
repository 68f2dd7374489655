// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "data/series_csv.h"

#include <gmock/gmock.h>

namespace tervane::series_csv_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

TEST(SeriesCsv, TablesOfAllFormsAreRead) {
  const char* const texts[] = {
      "time,v\n2000-02-29,1.5\n2000-03-01 06:30,-2e3\n",
      "\xEF\xBB\xBFtime;v\r\n2000-02-29;1,5\r\n2000-03-01T06:30:00Z;-2000\r\n\r\n",
      "time\tother\tV\n2000-02-29\tx\t+1.5\n\n2000-03-01 06:30:00\ty\t-2000",
      "time,\"the \"\"other\"\", cell\",\" v \"\n\"2000-02-28 24:00\",\"two\nlines\",1.5,\n2000-03-01 "
      "06:30,,\"-2000\"\n",
  };
  for (const char* text : texts) {
    const CsvSeries series = ReadCsvSeries(text, "v");
    EXPECT_EQ(series.error, "") << text;
    EXPECT_THAT(series.values, ElementsAre(1.5f, -2000.0f)) << text;
    EXPECT_THAT(series.stamps, ElementsAre(CYbDateTime(2000, 2, 29), CYbDateTime(2000, 3, 1, 6, 30))) << text;
    EXPECT_THAT(series.notes, testing::IsEmpty()) << text;
  }
}

TEST(SeriesCsv, RowsArePastedWithOrWithoutNames) {
  const char* const texts[] = {
      "2000-02-29\t1.5\n2000-03-01 06:30\t-2e3\n", "day;rain\n2000/02/29;1,5\n2000/03/01 06:30;-2000\n",
      "2000/02/29 1.5\r\n2000/03/01 06:30   -2000", "\nDate Value\n2000-02-29 1,5\n\n2000-03-01T06:30 -2000\n",
      "2000-02-29,1.5\n2000-03-01 06:30:00,-2000\n"};
  for (const char* text : texts) {
    const CsvSeries series = ReadPastedSeries(text);
    EXPECT_EQ(series.error, "") << text;
    EXPECT_THAT(series.values, ElementsAre(1.5f, -2000.0f)) << text;
    EXPECT_THAT(series.stamps, ElementsAre(CYbDateTime(2000, 2, 29), CYbDateTime(2000, 3, 1, 6, 30))) << text;
  }
  EXPECT_THAT(ReadPastedSeries("2000-01-01 1\n2000-02-30 2\n").error, HasSubstr("line 2: \"2000-02-30\" is no date"));
  EXPECT_THAT(ReadPastedSeries("2000-01-01\t1\n2000-01-01\t2\n").error, HasSubstr("stands already in line 1"));
  EXPECT_THAT(ReadPastedSeries("2000-01-01\t1\t2\n").error, HasSubstr("name the column to read"));
}

TEST(SeriesCsv, GapsAndMissingValuesAreToldWithTheirLines) {
  std::string text = "t,v\n";
  for (int day = 1; day <= 28; ++day)
    if (day != 10 && day != 11)
      text += "2001-02-" + std::string(day < 10 ? "0" : "") + std::to_string(day) + (day % 4 == 0 ? ",NA\n" : ",1\n");
  const CsvSeries series = ReadCsvSeries(text, "");
  EXPECT_EQ(series.error, "");
  EXPECT_EQ(series.values[3], kDeleteValue);
  EXPECT_THAT(series.notes, ElementsAre("7 missing values in lines 5, 9, 11, 15, 19 and 2 more",
                                        "1 gap before line 11: the step is otherwise 86400 s"));
  // Months have no one length.
  EXPECT_THAT(ReadCsvSeries("t,v\n2001-01-01,1\n2001-02-01,1\n2001-03-01,1\n", "").notes, testing::IsEmpty());
}

TEST(SeriesCsv, WhatCannotBeReadIsToldWithItsLine) {
  struct Row {
    std::string rows;
    const char* error;
  };
  const Row rows[] = {
      {"2000-01-01,1\n2001-02-29,1\n", "line 3: \"2001-02-29\" is no date"},
      {"2000-01-01,1\n\n2000-01-01 00:00,1\n", "line 4: 2000-01-01 00:00:00 stands already in line 2; remove one"},
      {"2000-01-02,1\n2000-01-01,1\n", "line 3: 2000-01-01 00:00:00 is earlier than 2000-01-02 00:00:00 in line 2"},
      {"1/2/2000,1\n", "line 2: \"1/2/2000\" is no date"},
      {"2000-01-01 06,1\n", "is no date"},
      {"2000-01-01T06:00+02:00,1\n", "is no date"},
      {"2000-01-01 25:00,1\n", "is no date"},
      {"2000-01-01,1,5\n", "line 2: it has 3 cells, 2 were expected; decimals stand behind a point"},
      {"2000-01-01\n", "line 2: it has 1 cells"},
      {"2000-01-01,abc\n", "line 2: \"abc\" is no number"},
      {"2000-01-01,1e39\n", "\"1e39\" is no number that can be stored"},
      {"2000-01-01,inf\n", "is no number"},
      {"2000-01-01,-1e30\n", "is no number that can be stored"},
      {"2000-01-01,\"1\n2000-01-02,2\n", "line 2: a quote is not closed"},
      {"", "no line behind the names"},
      {std::string("2000-01-01\0,1", 13), "zero characters"},
  };
  for (const Row& row : rows)
    EXPECT_THAT(ReadCsvSeries("t,v\n" + row.rows, "v").error, HasSubstr(row.error)) << row.rows;
  struct Names {
    const char* text;
    const char* column;
    const char* error;
  };
  const Names names[] = {{"", "v", "it is empty"},
                         {"time\n", "v", "names of columns were expected"},
                         {"t,a,b\n", "", "name the column to read: \"a\", \"b\""},
                         {"t,a,b\n", "c", "there is no column \"c\", but \"a\", \"b\""},
                         {"t,a,A\n", "a", "several columns are named \"a\""}};
  for (const Names& row : names) EXPECT_THAT(ReadCsvSeries(row.text, row.column).error, HasSubstr(row.error));
}

}  // namespace
}  // namespace tervane::series_csv_test
