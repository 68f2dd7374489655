// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/relief.h"

#include <cmath>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace tervane {
namespace {

constexpr std::uint32_t kRed = 0xffff0000, kBlue = 0xff0000ff;
constexpr float kGap = std::numeric_limits<float>::quiet_NaN();

/// A raster of 10 x 10 cells of 100 m, and on it surfaces of one height.
Relief Block(std::initializer_list<std::pair<float, std::uint32_t>> surfaces) {
  Relief relief;
  relief.raster.nx = relief.raster.ny = 10;
  relief.raster.cellSize = 100;
  for (const auto& [height, color] : surfaces)
    relief.bodies.push_back({.name = "body", .top = std::vector<float>(100, height), .color = color});
  return relief;
}

ReliefCamera CameraOn(const Relief& relief, double heading, double pitch) {
  ReliefCamera camera;
  camera.heading = heading;
  camera.pitch = pitch;
  camera.exaggeration = 1;
  camera.width = 200;
  camera.rows = 160;
  camera.Fit(relief);
  return camera;
}

/// The body at a place of the map and a height, as drawn.
std::uint16_t BodyAt(const Relief& relief, const ReliefCamera& camera, MapPoint place, double height,
                     ReliefDrawing drawing = {}) {
  const ReliefPicture picture = DrawRelief(relief, camera, drawing);
  const auto seen = camera.See(place, height);
  return picture.body[static_cast<std::size_t>(seen.y) * 200 + static_cast<std::size_t>(seen.x)];
}

TEST(ReliefTest, TheUpperSurfaceHidesTheLowerOneFromAboveAndTheLowerOneFromBelow) {
  const Relief relief = Block({{100.0F, kRed}, {0.0F, kBlue}});
  for (const double heading : {0.0, 90.0, 217.0}) {
    EXPECT_EQ(BodyAt(relief, CameraOn(relief, heading, 60), {500, 500}, 100), 0) << heading;
    EXPECT_EQ(BodyAt(relief, CameraOn(relief, heading, -60), {500, 500}, 0), 1) << heading;
  }
}

TEST(ReliefTest, ACellIsSeenWhereTheCameraPutsIt) {
  Relief relief = Block({{0.0F, kRed}});
  relief.raster.rotation = 30;
  relief.raster.x0 = 40'000;
  const GridTransform transform(relief.raster);
  for (const double pitch : {90.0, 40.0, 20.0}) {
    const ReliefCamera camera = CameraOn(relief, 125, pitch);
    const ReliefPicture picture = DrawRelief(relief, camera, {});
    // The places of heights are the corners of what is drawn: (7.1, 3.2) lies behind the one of column 6, row 2.
    const auto seen = camera.See(transform.ToWorld({7.1, 3.2}), 0);
    const std::size_t at = static_cast<std::size_t>(seen.y) * 200 + static_cast<std::size_t>(seen.x);
    EXPECT_EQ(picture.cell[at], 26U) << pitch;
  }
}

TEST(ReliefTest, WhatIsCutAwayShowsTheLayersOnTheWall) {
  Relief relief = Block({{100.0F, kRed}, {40.0F, kBlue}});
  relief.bodies[0].bottom = std::vector<float>(100, 40);
  relief.bodies[1].bottom = std::vector<float>(100, -80);
  const ReliefCamera camera = CameraOn(relief, 0, 20);
  const ReliefDrawing cut{{.south = 0.5}};
  const double y = 0.5 * 9 * 100 + 50 + 50;  // The row of heights that is nearest to the middle.
  EXPECT_EQ(BodyAt(relief, camera, {500, y}, 70, cut), 0);
  EXPECT_EQ(BodyAt(relief, camera, {500, y}, -20, cut), 1);
  EXPECT_EQ(BodyAt(relief, camera, {500, 120}, -75, cut), ReliefPicture::kNothing);
}

TEST(ReliefTest, ABodyIsOnlyWhereItHasHeightsAndThickness) {
  Relief relief = Block({{100.0F, kRed}, {0.0F, kBlue}});
  relief.bodies[0].bottom = std::vector<float>(100, 100);
  for (std::size_t i = 0; i < 100; ++i) {
    if (i % 10 < 5) relief.bodies[0].bottom[i] = 50;
    if (i / 10 >= 5) relief.bodies[0].top[i] = kGap;
  }
  const ReliefCamera camera = CameraOn(relief, 0, 90);
  EXPECT_EQ(BodyAt(relief, camera, {250, 250}, 100), 0);
  EXPECT_EQ(BodyAt(relief, camera, {850, 250}, 0), 1) << "without thickness";
  EXPECT_EQ(BodyAt(relief, camera, {250, 850}, 0), 1) << "without heights";
}

TEST(ReliefTest, WhatIsNotOpaqueLetsThroughWhatLiesBelow) {
  Relief relief = Block({{100.0F, kRed}, {0.0F, kBlue}});
  relief.bodies[0].opacity = 0.5;
  const ReliefPicture picture = DrawRelief(relief, CameraOn(relief, 0, 90), {});
  const std::uint32_t middle = picture.pixels[80 * 200 + 100];
  EXPECT_NEAR((middle >> 16U) & 0xffU, middle & 0xffU, 2);
  EXPECT_GT(middle & 0xffU, 60U);
  EXPECT_EQ(picture.body[80 * 200 + 100], 0) << "what is nearest is pointed at";
  relief.bodies[0].isShown = false;
  EXPECT_EQ(DrawRelief(relief, CameraOn(relief, 0, 90), {}).body[80 * 200 + 100], 1);
}

TEST(ReliefTest, APictureLiesOverARasterThatIsTurned) {
  // The western half of the area is red.
  ReliefDrape picture{2, 1, {kRed, kBlue}};
  Relief relief = Block({{0.0F, 0xff808080}});
  relief.raster.rotation = 90;
  relief.raster.x0 = 1000;
  relief.bodies[0].drape = DrapeOver(relief.raster, picture, {0, 0, 1000, 1000});
  const ReliefCamera camera = CameraOn(relief, 0, 90);
  const ReliefPicture drawn = DrawRelief(relief, camera, {});
  EXPECT_EQ(drawn.pixels[80 * 200 + 60] & 0xffU, 0U) << "the west is red";
  EXPECT_EQ((drawn.pixels[80 * 200 + 140] >> 16U) & 0xffU, 0U) << "the east is blue";
}

TEST(ReliefTest, AWellInTheGroundShinesThrough) {
  Relief relief = Block({{0.0F, kRed}});
  relief.wells.push_back({"North 3", {500, 500}, -10, -300});
  const ReliefCamera camera = CameraOn(relief, 0, 30);
  const ReliefPicture picture = DrawRelief(relief, camera, {});
  const auto seen = camera.See({500, 500}, -20);
  EXPECT_GT(picture.pixels[static_cast<std::size_t>(seen.y) * 200 + static_cast<std::size_t>(seen.x)] & 0xffU, 60U);
}

TEST(ReliefTest, NothingIsDrawnOfWhatIsEmptyOrGivenUp) {
  EXPECT_TRUE(DrawRelief(Relief(), CameraOn(Block({}), 0, 30), {}).pixels.empty());
  const std::atomic<bool> isGivenUp{true};
  const Relief relief = Block({{0.0F, kRed}});
  EXPECT_TRUE(DrawRelief(relief, CameraOn(relief, 0, 30), {{}, 1, &isGivenUp}).pixels.empty());
}

TEST(ReliefTest, AMovedViewIsMovedByThosePixels) {
  const Relief relief = Block({{0.0F, kRed}});
  for (const double pitch : {80.0, 45.0, 2.0}) {
    ReliefCamera camera = CameraOn(relief, 70, pitch);
    const auto before = camera.See({300, 700}, 0);
    camera.Pan(12, -7);
    const auto after = camera.See({300, 700}, 0);
    EXPECT_NEAR(after.x - before.x, 12, 1e-6) << pitch;
    EXPECT_NEAR(after.y - before.y, -7, 1e-6) << pitch;
  }
}

TEST(ReliefTest, ManyCellsAreThinnedWhileTheViewMoves) {
  Relief relief = Block({{0.0F, kRed}, {1.0F, kBlue}});
  EXPECT_EQ(EveryFor(relief, 1000), 1);
  EXPECT_EQ(EveryFor(relief, 50), 2);
  relief.bodies[0].isShown = false;
  EXPECT_EQ(EveryFor(relief, 100), 1);
}

}  // namespace
}  // namespace tervane
