// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/cell_checks.h"

#include <gmock/gmock.h>

#include "spatial/data2d.h"

namespace tervane::cell_checks_test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

constexpr float kEmpty = -99;

/// A row of cells of 10 m; quantities are kept grids.
CTvn2DOrthoRotatedGridData Row(std::vector<float> values) {
  CTvn2DOrthoRotatedGridData grid;
  const GridGeometry place{static_cast<int>(values.size()), 1, 10, 0, 0, 0, {}};
  EXPECT_EQ(grid.TakeValues(place, std::move(values), kEmpty, 1000, quantity::kElevation), "");
  return grid;
}
CheckedQuantity Grid(std::string name, std::vector<float> values, bool isAboveGround = false) {
  CheckedQuantity quantity{.name = std::move(name)};
  quantity.isUniform = false;
  quantity.isAboveGround = isAboveGround;
  quantity.grid = std::make_shared<ComputedGrid>("", [values](CTvn2DOrthoRotatedGridData& grid, ProgressPart) {
    grid = Row(values);
    return FileResult();
  });
  return quantity;
}
CheckedQuantity Uniform(std::string name, float value, bool isAboveGround = false) {
  CheckedQuantity quantity{.name = std::move(name)};
  quantity.value = value;
  quantity.isAboveGround = isAboveGround;
  return quantity;
}
std::vector<std::string> Found(const CellCheck& check) {
  std::vector<std::string> texts;
  // The last cell is no part of the domain.
  for (const Finding& finding : FindingsInCells(check, Row({1, 1, 2, kEmpty}))) texts.push_back(finding.text);
  return texts;
}

TEST(CellChecks, LevelsThatCrossAreCountedInTheCellsOfTheDomain) {
  const CheckedQuantity ground = Grid("the ground", {100, 90, 80, 0});
  CellCheck check{.ground = ground};
  check.quantities = {Uniform("Sand", -5, true), Grid("Clay", {50, 88, 70, 999}), Uniform("Rock", 60)};
  EXPECT_THAT(Found(check), ElementsAre("Clay lies above Sand in 1 of 3 cells (33 %)",
                                        "Rock lies above Clay in 1 of 3 cells (33 %)"));
  check.kind = CellCheck::Kind::BelowGround;
  check.quantities = {Uniform("A head", 85), Uniform("Another", -1, true), Grid("A third", {kEmpty, 95, 95, 95})};
  EXPECT_THAT(Found(check), ElementsAre("A head lies above the ground in 1 of 3 cells (33 %)",
                                        "A third lies above the ground in 2 of 3 cells (67 %)"));
}

TEST(CellChecks, CodesAndPlacesAreHeldAgainstWhatIsKnown) {
  CellCheck check{.kind = CellCheck::Kind::CodesKnown, .ground = Uniform("the ground", 100)};
  check.codes = {1, 2};
  check.quantities = {Grid("A map", {1, 7, 2, 9}), Uniform("Another", 2)};
  EXPECT_THAT(Found(check), ElementsAre("A map has codes of no unit in 1 of 3 cells (33 %): 7"));

  check.kind = CellCheck::Kind::PlacesAboveLevel;
  check.quantities = {Uniform("the bottom", -50, true)};
  check.places = {{"Deep", {5, 5}, 49}, {"Flat", {5, 5}, 51}, {"Away", {500, 5}, 51}};
  EXPECT_THAT(Found(check), ElementsAre("Deep reaches down to 49 m, below the bottom at 50 m"));
  check.quantities.clear();
  EXPECT_THAT(Found(check), IsEmpty());
}

}  // namespace
}  // namespace tervane::cell_checks_test
