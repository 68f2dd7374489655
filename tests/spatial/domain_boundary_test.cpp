// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/domain_boundary.h"

#include <string_view>

#include <gmock/gmock.h>

#include "platform/item_types.h"

namespace tervane::domain_boundary_test {
namespace {

/// A grid from rows of digits, the northern one first; a point is an empty cell.
CGeoDataBoundCondCatchmentData Domain(std::vector<std::string_view> rows) {
  CGeoDataBoundCondCatchmentData domain;
  const int nx = static_cast<int>(rows.front().size()), ny = static_cast<int>(rows.size());
  EXPECT_EQ(domain.SetGridData({nx, ny, 1, 0, 0, 0, {}}, 0, -1, 0, quantity::kCode), "");
  float* cells = domain.GetData();
  for (int j = 0; j < ny; ++j)
    for (int i = 0; i < nx; ++i) {
      const char c = rows[static_cast<std::size_t>(ny - 1 - j)][static_cast<std::size_t>(i)];
      cells[j * nx + i] = c == '.' ? -1.0F : static_cast<float>(c - '0');
    }
  return domain;
}

TEST(DomainBoundary, IsFollowedClockwiseOrRefused) {
  const struct {
    std::vector<std::string_view> rows;
    int result;
    std::size_t cells;
    const char* message;
  } cases[] = {
      {{".222.", "21112", "21112", ".222."}, 1, 10, ""},
      // The walk turns to the inside first, and so passes by its start.
      {{".222.", "22122", "21112", "22222"},
       0,
       0,
       "Invalid nds2 file for Model Domain.\nCheck for and remove disconnected outer boundary cells"},
      {{".2.", "212", ".2."}, 1, 4, ""},
      {{"...", ".2.", "..."}, 0, 0, ""},
      {{"...", "..."}, 0, 0, ""},
      {{"222", "232", "222"}, 0, 0, ""},
      {{"111", "121", "111"}, 0, 0, "Invalid value found at catchment boundary"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.rows.front());
    CGeoDataBoundCondCatchmentData domain = Domain(c.rows);
    std::string message;
    EXPECT_EQ(domain.PrepareBoundary(message), c.result);
    EXPECT_EQ(message, c.message);
    EXPECT_EQ(domain.BoundaryCells.size(), c.cells);
  }
}

TEST(DomainBoundary, EachConditionRunsFromItsPointToTheNextOne) {
  CGeoDataBoundCondCatchmentData domain = Domain({".2.", "212", ".2."});
  std::string message;
  ASSERT_EQ(domain.PrepareBoundary(message), 1);
  // North, east, south, west.
  ASSERT_EQ(domain.BoundaryCells, (std::vector<GridCell>{{1, 2}, {2, 1}, {1, 0}, {0, 1}}));
  const BoundaryItem east{MapPoint{3, 1.5}, 7}, west{MapPoint{0, 1.5}, 9};
  domain.PaintBoundaryTypes({east, west});
  EXPECT_EQ(domain.Value(2, 1), 7);
  EXPECT_EQ(domain.Value(1, 0), 7);
  EXPECT_EQ(domain.Value(0, 1), 9);
  EXPECT_EQ(domain.Value(1, 2), 9);  // around the start
  EXPECT_EQ(domain.Value(1, 1), -2);
  domain.PaintBoundaryNumbers({east});
  EXPECT_EQ(domain.Value(1, 2), 1);
  domain.PaintBoundaryTypes({east, {std::nullopt, 1}});
  EXPECT_EQ(domain.Value(2, 1), -1);
}

TEST(DomainBoundary, ConditionsAreBroughtIntoTheOrderOfTheBoundary) {
  CGeoDataBoundCondCatchmentData domain = Domain({".2.", "212", ".2."});
  const BoundaryItem north{MapPoint{1.5, 3}, 1}, east{MapPoint{3, 1.5}, 2}, alsoEast{MapPoint{2.9, 1.4}, 3},
      west{MapPoint{0, 1.5}, 4}, unplaced{std::nullopt, 5};
  using Order = std::vector<std::size_t>;
  EXPECT_EQ(domain.BoundaryOrder({west, north}), (Order{0, 1})) << "nothing is known before the boundary is traced";
  std::string message;
  ASSERT_EQ(domain.PrepareBoundary(message), 1);
  const struct {
    std::vector<BoundaryItem> items;
    Order order;
  } cases[] = {{{west, alsoEast, north, east}, {2, 1, 3, 0}}, {{west, unplaced, north}, {0, 1, 2}}, {{}, {}}};
  for (const auto& c : cases) EXPECT_EQ(domain.BoundaryOrder(c.items), c.order);
}

}  // namespace
}  // namespace tervane::domain_boundary_test
