// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/charts/depth_columns.h"

#include <gmock/gmock.h>

#include "shell/widgets/qt_text.h"

namespace tervane::depth_columns_test {
namespace {

class Depths : public testing::Test {
 protected:
  Depths() { view_.resize(400, 400); }
  /// What is told in a column, a fraction of its height below its top.
  std::string At(int column, double fraction) {
    const QRect all = view_.rect();
    for (int x = all.width() - 1, found = 0; x >= 0; --x)
      if (const QString text = view_.TextAt({x, static_cast<int>(all.height() * fraction)}); !text.isEmpty())
        if (++found == 1 && column == 2) return FromQt(text);
    for (int x = 0; x < all.width(); ++x)
      if (const QString text = view_.TextAt({x, static_cast<int>(all.height() * fraction)}); !text.isEmpty())
        return FromQt(text);
    return {};
  }

  DepthColumns view_;
};

TEST_F(Depths, BlocksLieWhereTheirDepthsAre) {
  view_.Show({{{"Soils", {{"Loam", 1}, {"Clay", 4}}}, {"Cells", {{"20 x 0.1", 2, 20}}}}, {}}, nullptr);
  EXPECT_EQ(At(1, 0.2), "Loam, 0 to 1 m");
  EXPECT_EQ(At(1, 0.8), "Clay, 1 to 4 m");
  EXPECT_EQ(At(2, 0.2), "20 x 0.1, 0 to 2 m");
  // Below its end a column has nothing.
  EXPECT_EQ(At(2, 0.8), "Clay, 1 to 4 m");
}

TEST_F(Depths, WhatCannotBeDrawnDoesNoHarm) {
  const double infinite = std::numeric_limits<double>::infinity(), none = std::nan("");
  for (const double bottom : {0.0, -3.0, infinite, none, 1e-300, 1e30}) {
    view_.Show({{{"Soils", {{"Loam", bottom}}}, {"Cells", {{"cells", bottom, 1'000'000'000}}}}, "nothing"}, nullptr);
    EXPECT_FALSE(view_.grab().isNull()) << bottom;
  }
  view_.Show({{}, "nothing"}, nullptr);
  EXPECT_FALSE(view_.grab().isNull());
}

}  // namespace
}  // namespace tervane::depth_columns_test
