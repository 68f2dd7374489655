// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/projection_list.h"

#include <gmock/gmock.h>

#include "geometry/cart.h"

namespace tervane::projection_list_test {
namespace {

std::vector<std::string> Codes(std::string_view typed, std::size_t most) {
  std::string problem;
  std::vector<std::string> codes;
  for (const KnownProjection& found : FindProjections(typed, most, problem)) codes.push_back(found.code);
  EXPECT_EQ(problem, "");
  return codes;
}

TEST(ProjectionList, IsSearchedByNameCodeAndPlace) {
  EXPECT_THAT(Codes("wgs 84 / utm ZONE 32n", 1), testing::ElementsAre("EPSG:32632"));
  EXPECT_THAT(Codes("EPSG:2056", 1), testing::ElementsAre("EPSG:2056"));
  EXPECT_THAT(Codes("2056", 1), testing::ElementsAre("EPSG:2056"));
  EXPECT_THAT(Codes("switzerland", 100), testing::Contains("EPSG:2056"));
  EXPECT_THAT(Codes("utm denmark", 100), testing::Contains("EPSG:25832"));  // name and place
  for (const char* nothing : {"", "  ", "xyzzy", "utm xyzzy", "'; drop"})
    EXPECT_THAT(Codes(nothing, 10), testing::IsEmpty());
  EXPECT_EQ(Codes("utm", 5).size(), 5u);
}

TEST(ProjectionList, ATextByItsCodeIsTheSystem) {
  for (const char* code : {"EPSG:32632", "EPSG:2056", "EPSG:4326"}) {
    const std::string text = ProjectionTextOf(code);
    EXPECT_EQ(CYbMapProjection(text).Problem(), "") << code;
    EXPECT_TRUE(CYbMapProjection(text).IsSameAs(CYbMapProjection(code))) << code;
  }
  EXPECT_EQ(ProjectionTextOf("EPSG:1"), "");
  EXPECT_EQ(ProjectionTextOf("nothing"), "");
}

}  // namespace
}  // namespace tervane::projection_list_test
