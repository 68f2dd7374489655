// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/named_places.h"

#include <gmock/gmock.h>

#include "geometry/shapes.h"
#include "simspec/model_components.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::named_places_test {
namespace {

using test::TempFolder;
using testing::HasSubstr;

TEST(NamedPlaces, TablesHaveTheirColumnsInAnyOrder) {
  TempFolder folder;
  const NamedPlaces read =
      ReadNamedPlaces(folder.Write("a.csv", "y;Name;X;remark\n200,5;North 3;100;deep\n;lost;1;\n3;;4;\n"));
  EXPECT_EQ(read.problem, "");
  ASSERT_EQ(read.places.size(), 2u);
  EXPECT_EQ(read.places[0].name, "North 3");
  EXPECT_EQ(read.places[0].place, (MapPoint{100, 200.5}));
  EXPECT_EQ(read.places[1].name, "");
  ASSERT_EQ(read.notes.size(), 1u);
  EXPECT_THAT(read.notes[0], HasSubstr("a.csv:3: x and y are \"1\" and \"\", numbers were expected"));
}

TEST(NamedPlaces, WhatHoldsNoneSaysWhy) {
  TempFolder folder;
  struct Case {
    const char* file;
    std::string text;
    const char* problem;
  };
  const Case cases[] = {{"none.csv", "", "is empty"},
                        {"head.csv", "name,x,y\n", "holds no points"},
                        {"column.csv", "name,x\nA,1\n", "there is no column \"y\""},
                        {"bad.csv", "name,x,y\nA,one,2\n", "\"one\" and \"2\""},
                        {"wide.csv", std::string("\xFF\xFEn\0", 4), "UTF-16"},
                        {"no.shp", "text", "no.shp"}};
  for (const Case& one : cases) {
    const NamedPlaces read = ReadNamedPlaces(folder.Write(one.file, one.text));
    EXPECT_THAT(read.problem, HasSubstr(one.problem)) << one.file;
    EXPECT_TRUE(read.places.empty()) << one.file;
  }
}

TEST(NamedPlaces, PointShapesAreNamedByAText) {
  TempFolder folder;
  CTvnShapeData shapes;
  shapes.Create(ShapeKind::Point, {{"DEPTH", AttributeKind::Real}, {"WELL", AttributeKind::Text}}, {});
  shapes.AddShape({{{10, 20}}, {}, {}, {0}, {2.5, std::string("Mill")}});
  ASSERT_TRUE(shapes.SaveShapeFile(folder.File("p.shp")).Ok());
  const NamedPlaces read = ReadNamedPlaces(folder.File("p.shp"));
  ASSERT_EQ(read.places.size(), 1u) << read.problem;
  EXPECT_EQ(read.places[0].name, "Mill");
  EXPECT_EQ(read.places[0].place, (MapPoint{10, 20}));

  shapes.Create(ShapeKind::Polygon, {}, {});
  shapes.AddShape({{{0, 0}, {0, 1}, {1, 1}, {0, 0}}, {}, {}, {0}, {}});
  ASSERT_TRUE(shapes.SaveShapeFile(folder.File("q.shp")).Ok());
  EXPECT_THAT(ReadNamedPlaces(folder.File("q.shp")).problem, HasSubstr("holds no points"));
}

TEST(NamedPlaces, WellsCountWhileTheSetupIncludesThem) {
  test::TestSetup setup;
  EXPECT_THAT(WellPlacesOf(setup.Root()).problem, HasSubstr("includes no wells"));
  setup.At<CSatZoneKvf>("SaturatedZone").Wells = 1;
  setup.Root().Important(kWells)->SetFilename(FileName("wells.WEL", TERVANE_SOURCE_DIR "/examples/rhone"));
  const NamedPlaces read = WellPlacesOf(setup.Root());
  EXPECT_EQ(read.problem, "");
  EXPECT_FALSE(read.places.empty());
}

}  // namespace
}  // namespace tervane::named_places_test
