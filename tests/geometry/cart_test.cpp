// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "geometry/cart.h"

#include <cmath>
#include <string>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/support/temp_folder.h"

namespace tervane::cart_test {
namespace {

using testing::HasSubstr;

const std::string kLocal = CYbMapProjection::IDtoProjectionString(1);
const std::string kUtmAsInShapeFiles =
    R"(PROJCS["WGS_1984_UTM_Zone_32N",GEOGCS["GCS_WGS_1984",DATUM["D_WGS_1984",SPHEROID["WGS_1984",6378137.0,298.257223563]],)"
    R"(PRIMEM["Greenwich",0.0],UNIT["Degree",0.0174532925199433]],PROJECTION["Transverse_Mercator"],)"
    R"(PARAMETER["False_Easting",500000.0],PARAMETER["False_Northing",0.0],PARAMETER["Central_Meridian",9.0],)"
    R"(PARAMETER["Scale_Factor",0.9996],PARAMETER["Latitude_Of_Origin",0.0],UNIT["Meter",1.0]])";

TEST(MapProjection, IsTold) {
  const struct {
    std::string text;
    bool isKnown, isGeographical, isLocal;
    const char* name;
  } rows[] = {
      {"EPSG:32632", true, false, false, "WGS 84 / UTM zone 32N"},
      {" EPSG:4326\n", true, true, false, "WGS 84"},
      {"EPSG:4979", true, true, false, "WGS 84"},
      {"EPSG:25832+7837", true, false, false, "ETRS89 / UTM zone 32N"},
      {"+proj=utm +zone=32 +datum=WGS84", true, false, false, "+proj=utm +zone=32 +datum=WGS84"},
      {"+proj=longlat +ellps=bessel +towgs84=1,2,3 +type=crs", true, true, false,
       "+proj=longlat +ellps=bessel +towgs84=1,2,3 +type=crs"},
      {kUtmAsInShapeFiles, true, false, false, "WGS 84 / UTM zone 32N"},
      {R"(LOCAL_CS["Site grid",UNIT["metre",1]])", true, false, true, "Site grid"},
      {kLocal, true, false, true, "Local plane"},
      {"", true, false, true, ""},
      {"EPSG:999999", false, false, false, "EPSG:999999"},
      {"+proj=axisswap +order=2,1", false, false, false, "+proj=axisswap +order=2,1"},
      {"WGS 84 / UTM zone 32N", true, false, false, "WGS 84 / UTM zone 32N"},
      {"LONG/LAT?", false, false, false, "LONG/LAT?"},
      {std::string("EPSG:4326\0x", 11), false, false, false, nullptr},
      {std::string(100000, '['), false, false, false, nullptr},
  };
  for (const auto& row : rows) {
    const CYbMapProjection projection(row.text);
    EXPECT_EQ(projection.Problem().empty(), row.isKnown) << projection.Problem();
    EXPECT_EQ(projection.IsGeographical(), row.isGeographical) << row.text;
    EXPECT_EQ(projection.IsLocal(), row.isLocal) << row.text;
    EXPECT_EQ(projection.Name(), row.name ? row.name : row.text);
  }
  EXPECT_EQ(CYbMapProjection::IDtoProjectionString(2), "");
}

TEST(MapProjection, IsComparedByMeaning) {
  const struct {
    std::string a, b;
    bool isSame;
  } rows[] = {
      {"EPSG:32632", " EPSG:32632 ", true},
      {"EPSG:32632", kUtmAsInShapeFiles, true},
      {"EPSG:32632", "+proj=utm +zone=32 +datum=WGS84 +units=m", true},
      {"EPSG:32632", "EPSG:32633", false},
      {"EPSG:32632", "EPSG:25832", false},
      {"EPSG:4326", "OGC:CRS84", true},
      {kLocal, kLocal, true},
      {kLocal, "EPSG:32632", false},
      {"nonsense", "nonsense", true},
      {"nonsense", "EPSG:32632", false},
  };
  for (const auto& row : rows) {
    EXPECT_EQ(CYbMapProjection(row.a).IsSameAs(CYbMapProjection(row.b)), row.isSame) << row.a << " and " << row.b;
    EXPECT_EQ(CYbMapProjection(row.b).IsSameAs(CYbMapProjection(row.a)), row.isSame) << row.b << " and " << row.a;
  }
}

TEST(Cartography, TurnsPointsIntoLongitudeAndLatitude) {
  for (const std::string& text :
       {std::string("EPSG:32632"), kUtmAsInShapeFiles, std::string("+proj=utm +zone=32 +datum=WGS84")}) {
    const CYbCartography cartography(text, 0, 0, 0);
    EXPECT_EQ(cartography.Problem(), "");
    double longitude = 0, latitude = 0;
    // On the central meridian 0.9996 times the length of the meridian arc, which is 4 984 944.378 m up to 45 degrees;
    // in a thread of its own, since the object is not bound to one.
    std::thread([&] { EXPECT_TRUE(cartography.Proj2Geo(500000, 4984944.378 * 0.9996, longitude, latitude)); }).join();
    EXPECT_NEAR(longitude, 9, 1e-9);
    EXPECT_NEAR(latitude, 45, 1e-8);
    longitude = 77;
    EXPECT_FALSE(cartography.Proj2Geo(std::nan(""), 0, longitude, latitude));
    EXPECT_FALSE(cartography.Proj2Geo(1e30, 1e30, longitude, latitude));
    EXPECT_EQ(longitude, 77);
  }
  for (const auto& [text, problem] :
       {std::pair{kLocal, "no place on the globe"}, {std::string("nonsense"), "\"nonsense\" is no"}}) {
    const CYbCartography cartography(text, 0, 0, 0);
    double longitude = 0, latitude = 0;
    EXPECT_THAT(cartography.Problem(), HasSubstr(problem));
    EXPECT_FALSE(cartography.Proj2Geo(500000, 5000000, longitude, latitude));
  }
}

TEST(ProjectionFile, IsReadOrRefused) {
  const test::TempFolder folder;
  std::string text;
  EXPECT_EQ(ReadProjectionFile(folder.Write("a.prj", kUtmAsInShapeFiles + "\r\n"), text).error, "");
  EXPECT_EQ(text, kUtmAsInShapeFiles);
  EXPECT_THAT(ReadProjectionFile(folder.Write("b.prj", "PROJCS[\"cut"), text).error,
              HasSubstr("b.prj: \"PROJCS[\"cut\" is no"));
  EXPECT_EQ(text, "PROJCS[\"cut");
  EXPECT_THAT(ReadProjectionFile(folder.Write("c.prj", " \n"), text).error, HasSubstr("empty"));
  EXPECT_THAT(ReadProjectionFile(folder.Write("d.prj", std::string(200'000, '[')), text).error, HasSubstr("too many"));
  EXPECT_THAT(ReadProjectionFile(folder.File("none.prj"), text).error, HasSubstr("none.prj"));
}

}  // namespace
}  // namespace tervane::cart_test
