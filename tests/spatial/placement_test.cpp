// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/placement.h"

#include <filesystem>

#include <gmock/gmock.h>

#include "data/grid_files.h"
#include "geometry/shapes.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::placement_test {
namespace {

using testing::HasSubstr;

/// A setup with a domain of 10 by 10 cells of 100 m in UTM zone 32, whose topography comes from a file.
class Placement : public testing::Test {
 protected:
  Placement() {
    CCatchmentKvf& domain = *document_.Root().Important(kDomain);
    WriteSquare("domain.shp", 500'000, 5'000'000, "EPSG:32632");
    domain.Type = CCatchmentKvf::kShapeFile;
    domain.ShapeFile().Choose(FileName("domain.shp", folder_.Path()), {});
    domain.nxShp = domain.nyShp = 10;
    domain.sizeShp = 100;
    domain.x0Shp = 500'000;
    domain.y0Shp = 5'000'000;
    domain.MapProjShp = "EPSG:32632";
  }

  /// A square of one kilometre from that corner on.
  void WriteSquare(const std::string& name, double x, double y, const std::string& projection) {
    CTvnShapeData shapes;
    shapes.Create(ShapeKind::Polygon, {{"CODE", AttributeKind::Whole}}, projection);
    shapes.AddShape(
        {{{x, y}, {x, y + 1000}, {x + 1000, y + 1000}, {x + 1000, y}, {x, y}}, {}, {}, {0}, {std::int64_t{1}}});
    ASSERT_EQ(shapes.SaveShapeFile(folder_.File(name)).error, "");
  }
  void WriteGrid(const std::string& name, double x, double y, double cellSize, const std::string& projection) {
    CTvn2DOrthoRotatedGridData grid;
    ASSERT_EQ(grid.SetGridData({10, 10, cellSize, x, y, 0, projection}, 5, kUsualDeleteValue, 1000, 100180), "");
    ASSERT_EQ(WriteGridData(folder_.File(name), grid).error, "");
  }
  /// The findings of a node, one line each: "warning: text (detail)".
  std::string FindingsOf(CYbSEKvfBase& node) {
    document_.Root().Validate();
    std::string lines;
    for (const Finding& finding : node.Findings())
      lines += std::string(NameOf(finding.severity)) + ": " + finding.text + " (" + finding.detail + ")\n";
    return lines;
  }

  test::TempFolder folder_;
  CFlowModelDoc document_;
};

TEST_F(Placement, OfAShapeFileIsHeldAgainstTheDomain) {
  CCatchmentKvf& domain = *document_.Root().Important(kDomain);
  const struct {
    const char* projection;
    double x;
    const char* findings;  ///< Of all, in their order.
    const char* detail;
  } rows[] = {
      {"EPSG:32632", 500'500, "", ""},
      {"EPSG:32633", 500'500, "warning: The file has another projection than the model domain", "UTM zone 33N"},
      {"EPSG:4326", 7, "warning: The coordinates of the file are in degrees", "WGS 84"},
      {"EPSG:32632", 600'000, "warning: The file does not overlap the model domain", "x 600000 to 601000"},
      {"no system", 500'500, "warning: The projection of the file is not known", "no system"},
      {"", 500'500, "note: The file tells no projection", "other.prj does not exist"},
  };
  for (const auto& row : rows) {
    std::filesystem::remove(folder_.File("other.prj"));
    WriteSquare("other.shp", row.x, row.x < 1000 ? 46 : 5'000'000, row.projection);
    domain.ShapeFile().Choose(FileName("other.shp", folder_.Path()), {});
    const std::string found = FindingsOf(domain.ShapeFile());
    EXPECT_THAT(found, HasSubstr(row.findings));
    EXPECT_THAT(found, HasSubstr(row.detail));
    EXPECT_EQ(found.empty(), row.findings[0] == '\0') << found;
    EXPECT_NE(domain.ShapeFile().Valid(), 0) << "the verdict on the file stays as it is";
  }
}

TEST_F(Placement, OfAGridFileIsHeldAgainstTheDomain) {
  auto& topography = *document_.Root().Important(kTopography);
  topography.Type = CData2DKvf::kGridFile;
  topography.GridFile().Choose(FileName("dem.nds2", folder_.Path()));
  WriteGrid("dem.nds2", 500'000, 5'000'000, 100, "EPSG:32632");
  EXPECT_EQ(FindingsOf(topography.GridFile()), "");
  WriteGrid("dem.nds2", 400'000, 5'000'000, 100, "EPSG:32633");
  const std::string found = FindingsOf(topography.GridFile());
  EXPECT_THAT(found, HasSubstr("warning: The file has another projection than the model domain"));
  EXPECT_THAT(found, HasSubstr("warning: The file does not overlap the model domain"));
  // What is not in use is held against nothing.
  topography.Type = CData2DKvf::kUniform;
  EXPECT_EQ(FindingsOf(topography.GridFile()), "");
}

TEST(PlacementOfFiles, WithoutAPlaceIsAWarning) {
  FilePlace place;
  EXPECT_TRUE(FindMisplacement(place, {10, 10, 100, 0, 0, 0, {}}).empty()) << "the file cannot be read";
  place.isUnplaced = true;
  const std::vector<Finding> findings = FindMisplacement(place, {10, 10, 100, 0, 0, 0, {}});
  ASSERT_EQ(findings.size(), 1U);
  EXPECT_EQ(findings[0].severity, Severity::Warning);
  EXPECT_EQ(findings[0].text, "The file does not tell where its grid lies");
}

}  // namespace
}  // namespace tervane::placement_test
