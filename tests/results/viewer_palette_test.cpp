// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/viewer_palette.h"

#include <gmock/gmock.h>

namespace tervane::viewer_palette_test {
namespace {

TEST(ViewerPalette, TheRangeHasClassesThatAreEasyToRead) {
  const struct {
    double a, b, low, high;
  } cases[] = {
      {0, 16, 0, 16},              // a step of 1 counts as ten tenths, and stays
      {0, 1.6, 0, 1.6},            // as does 0.1
      {0, 24, 0, 24},              // 1.5 is one of the steps
      {0, 96, 0, 96},              // the greatest value is a multiple, and stays on top
      {96, 0, 0, 96},              // in any order
      {0, 100, -24, 104},          // 6.25 becomes 8: above 100 the next multiple is 104
      {3, 99, 6, 102},             // the top comes first: the lowest values may lie below the classes
      {193, 4292.8, -2000, 4400},  // 2.56 hundreds become 4
      {5, 5, -11, 5},              // one value has classes of 1
      {5.5, 5.5, -10, 6},
      {0, 0, -16, 0},
      {-3, -3, -18, -2},  // below 0 the whole part is cut toward 0, and one more is added
      {-5.5, -5.5, -20, -4},
      {-100, -50, -108, -44},
  };
  for (const auto& c : cases) {
    const PaletteRange range = ScaledRange(c.a, c.b);
    EXPECT_NEAR(range.low, c.low, 1e-9) << c.a << " to " << c.b;
    EXPECT_NEAR(range.high, c.high, 1e-9) << c.a << " to " << c.b;
  }
}

TEST(ViewerPalette, ClassesAreInSinglePrecision) {
  const auto classes = ClassesOf({0, 1.6});
  EXPECT_EQ(classes.front(), 0.1F);
  EXPECT_EQ(classes[6], 0.7F);
  EXPECT_EQ(classes.back(), 1.6F);
}

TEST(ViewerPalette, BothPalettesAsAFileHoldsThem) {
  KvfFile* file = kvfCreate();
  kvfAddTarget(file, "T");
  WriteResultPalette(file, "Head [meter]", {0, 16});
  WriteVectorPalette(file);
  KvfNode* target = kvfTargetByNameNum(file, "T", 1);
  const auto row = [&](int section, int number) {
    KvfNode* keyword = kvfKeywordByNameNum(kvfSectionByNameNum(target, "Quarzel_Palette_Definition", section),
                                           "RGB_Color_Value", number);
    std::vector<double> values;
    for (int i = 1; i <= 3; ++i) values.push_back(kvfGetInt(kvfParamByNum(keyword, i)));
    const KvfParam* last = kvfParamByNum(keyword, 4);
    if (section == 1 ? kvfIsFloat(last) : kvfIsDouble(last))
      values.push_back(section == 1 ? static_cast<double>(kvfGetFloat(last)) : kvfGetDouble(last));
    return values;
  };
  using testing::ElementsAre;
  EXPECT_THAT(row(1, 1), ElementsAre(128, 0, 128, 1));
  EXPECT_THAT(row(1, 8), ElementsAre(0, 196, 110, 8));
  EXPECT_THAT(row(1, 9), ElementsAre(0, 196, 110, 9));
  EXPECT_THAT(row(1, 12), ElementsAre(85, 255, 0, 12));
  EXPECT_THAT(row(1, 16), ElementsAre(255, 0, 0, 16));
  EXPECT_THAT(row(2, 1), ElementsAre(128, 0, 128, -0.4));
  EXPECT_THAT(row(2, 9), ElementsAre(0, 226, 55, 0));
  EXPECT_THAT(row(2, 16), ElementsAre(255, 0, 0, 0.35));
  EXPECT_FALSE(
      kvfKeywordByNameNum(kvfSectionByNameNum(target, "Quarzel_Palette_Definition", 2), "RGB_Color_Value", 17));
  kvfClose(&file);
}

}  // namespace
}  // namespace tervane::viewer_palette_test
