// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "overlays/image_place.h"

#include <gmock/gmock.h>

#include "data/raster_file.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::image_place_test {
namespace {

/// An image of 4 x 2 pixels.
std::string WriteImage(const test::TempFolder& folder) {
  // A bitmap file: a head of 54 bytes, then two rows of 12.
  std::string bytes("BM\x4e\0\0\0\0\0\0\0\x36\0\0\0\x28\0\0\0\x04\0\0\0\x02\0\0\0\x01\0\x18\0\0\0\0\0\x18\0\0\0", 38);
  bytes.resize(54, '\0');
  bytes.resize(78, '\x7f');
  return folder.Write("map.bmp", bytes);
}

TEST(ImagePlace, WorldFilesAreReadWithTheirHalfPixels) {
  const test::TempFolder folder;
  const std::string image = WriteImage(folder);
  test::ScriptedHost host;
  const auto place = ReadGeoReference(folder.Write("map.bpw", "10\n0\nno number\n-20\n1000\n+5000\n"), image, host);
  ASSERT_TRUE(place);
  EXPECT_EQ(*place, (DataArea{995, 2.5 * -20 + 5000, 4.5 * 10 + 1000, 5010}));
  EXPECT_TRUE(ReadGeoReference(folder.Write("map.PNW", "10\r\n0\r\n0\r\n-20\r\n1000\r\n5000"), image, host));

  const struct {
    const char *file, *text;
  } refused[] = {{"a.bpw", "10\n0\n0\n-20\n1000\n"},
                 {"b.bpw", "10\n0\n0\nwide\n1000\n5000\n"},
                 {"c.tiw", "1\0000\0\n"},
                 {"d.jpw", ""},
                 {"e.giw", "nan\n0\n0\n-20\n1000\n5000\n"}};
  for (const auto& row : refused) {
    host.Expect("Could not load geo reference file", Host::Answer::Ok);
    EXPECT_FALSE(ReadGeoReference(folder.Write(row.file, row.text), image, host)) << row.file;
    EXPECT_TRUE(host.IsDone()) << row.file;
  }
  // The size of the image is needed.
  for (const std::string& none : {std::string(), folder.File("gone.bmp"), folder.File("a.bpw")}) {
    host.Expect("Could not load geo reference file", Host::Answer::Ok);
    EXPECT_FALSE(ReadGeoReference(folder.File("map.bpw"), none, host));
  }
  host.Expect("Could not load geo reference file", Host::Answer::Ok);
  EXPECT_FALSE(ReadGeoReference(folder.File("gone.bpw"), image, host));
  EXPECT_FALSE(ReadGeoReference(folder.Write("map.txt", "10\n"), image, host));
  EXPECT_TRUE(host.IsDone());
}

TEST(ImagePlace, ParameterFilesTellTheirCornersAndRastersTheirOwn) {
  const test::TempFolder folder;
  test::ScriptedHost host;
  const std::string corners =
      "target QUARZEL_Graphical_Images {\n  section World_Coordinates {\n    x0 = 1.0\n    y0 = 2.0\n    x1 = 3.0\n    "
      "y1 = 4.0\n  }\n}\n";
  for (const char* name : {"a.bmpw", "a.jpgw", "a.gifw", "a.pngw", "a.TIFW"}) {
    const auto place = ReadGeoReference(folder.Write(name, corners), {}, host);
    ASSERT_TRUE(place) << name;
    EXPECT_EQ(*place, (DataArea{1, 2, 3, 4}));
  }
  host.Expect("Can not open file", Host::Answer::Ok);
  EXPECT_FALSE(ReadGeoReference(folder.File("gone.pngw"), {}, host));
  host.Expect("Syntax error in file name:", Host::Answer::Ok);
  EXPECT_FALSE(ReadGeoReference(folder.Write("bad.pngw", "target {"), {}, host));

  NewRaster raster;
  raster.geometry = FileGeometryOf(GridGeometry{2, 1, 50, 700, 300, 0, "EPSG:32632"});
  raster.name = "map";
  ASSERT_TRUE(WriteGeoTiff(folder.File("own.tif"), raster, std::vector<float>{1, 2}).Ok());
  const auto own = ReadGeoReference(folder.File("own.tif"), {}, host);
  ASSERT_TRUE(own);
  EXPECT_EQ(*own, (DataArea{700, 300, 800, 350}));
  EXPECT_TRUE(host.IsDone());
}

}  // namespace
}  // namespace tervane::image_place_test
