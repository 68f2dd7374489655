// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/xyz_text.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace tervane::xyz_text_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

TEST(XyzText, ReadsEverySeparatorHeadingAndComment) {
  for (const std::string_view text : {
           "1.5 2 -3e2\n4 5 6\n",
           "\xEF\xBB\xBFX,Y,Z\r\n1.5,2,-300\r\n4,5,6\r\n",
           "id x y\n\n# points\n\t1.5\t2\t-300\n! more\n4\t5\t6\tname 7",
           "X;Y;Z\n1,5;2;-300\n4;5;+6\n",
           "1.5 2 -300\r4 5 6\r",
           "1,5 2,0 -300,0\n4 5 6\n",
           "1.5, 2, -300\n4, 5, 6\n",
       }) {
    std::vector<ScatteredPoint> points{{9, 9, 9}};
    EXPECT_EQ(ParseXyz(text, "p.txt", points).error, "") << text;
    EXPECT_THAT(points, ElementsAre(ScatteredPoint{1.5, 2, -300}, ScatteredPoint{4, 5, 6})) << text;
  }
}

TEST(XyzText, TellsTheLineOfWhatIsWrong) {
  const struct {
    std::string_view text;
    const char* error;
  } rows[] = {
      {"", "no points"},
      {"x y z\n", "no points"},
      {"1 2 3\n4 5\n", "p.txt, line 2: z is missing"},
      {"x y z\n# c\n1 2 3\n\n4,x,5\n", "line 5: y is \"x\""},
      {"1 2 inf\n", "line 1: z is \"inf\""},
      {"1 2 3\nend of points\n", "line 2: x is \"end\""},
      {"1,5;2,5,5;3\n", "y is \"2,5,5\""},
      {"1 2 3\x01\x80\n", "z is \"3??\""},
      {"\xFE\xFF", "UTF-16"},
  };
  for (const auto& row : rows) {
    std::vector<ScatteredPoint> points{{9, 9, 9}};
    EXPECT_THAT(ParseXyz(row.text, "p.txt", points).error, HasSubstr(row.error));
    EXPECT_TRUE(points.empty());
  }
  std::vector<ScatteredPoint> points;
  EXPECT_THAT(ReadXyzFile("/nowhere/p.txt", points).error, HasSubstr("/nowhere/p.txt"));
}

}  // namespace
}  // namespace tervane::xyz_text_test
