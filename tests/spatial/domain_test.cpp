// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/domain.h"

#include <gmock/gmock.h>

#include "platform/item_types.h"
#include "spatial/domain_boundary.h"
#include "tests/support/data_files.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::domain_test {
namespace {

using testing::HasSubstr;

constexpr const char* kDegrees =
    "GEOGCS[\"WGS 84\",DATUM[\"WGS_1984\",SPHEROID[\"WGS 84\",6378137,298.257223563]],PRIMEM[\"Greenwich\",0],"
    "UNIT[\"degree\",0.0174532925199433]]";

TEST(Domain, TellsWhatIsWrongWithItsFile) {
  const struct {
    const char* what;
    std::vector<float> values;
    const char* projection;
    const char* error;  ///< Of the domain itself or of its file; empty for a domain that will do.
  } cases[] = {
      {"inside and boundary", {1, 2}, "", ""},
      {"between the codes, which counts as boundary", {1, 1.5F}, "", ""},
      {"a third code", {1, 3}, "", "Only 3 type of values is allowed."},
      {"zeros outside", {0, 1}, "", "Only 3 type of values is allowed."},
      {"no cells", {kUsualDeleteValue, kUsualDeleteValue}, "", ""},
      {"degrees", {1, 2}, kDegrees, " is not supported by Tervane. Only projected coordinate systems are allowed"},
      {"no grid", {}, "", "File is not valid"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    test::TempFolder folder;
    if (c.values.empty()) {
      folder.Write("domain.nds2", "no data file");
    } else {
      test::WriteGrid(folder.File("domain.nds2"), {2, 1, 100, 0, 0, 0, c.projection}, c.values, quantity::kCode);
    }
    CFlowModelDoc document;
    auto& domain = *document.Root().Important(kDomain);
    domain.GridFile().Choose(FileName("domain.nds2", folder.Path()));
    document.Root().Validate();
    std::string found;
    for (const CYbSEKvfBase* node : {static_cast<CYbSEKvfBase*>(&domain), domain.GetFirstChild()})
      for (const Finding& finding : node->Findings())
        if (finding.severity == Severity::Error) found += finding.text;
    if (*c.error)
      EXPECT_THAT(found, HasSubstr(c.error));
    else
      EXPECT_EQ(found, "");
  }
}

TEST(Domain, ABoundaryThatBeginsInASquareCornerTellsWhichCellToLeaveOut) {
  constexpr float kOut = kUsualDeleteValue;
  std::vector<float> rectangle{2, 2, 2, 2, 2, 1, 1, 2, 2, 1, 1, 2, 2, 2, 2, 2};
  const auto trace = [](const std::vector<float>& cells) {
    test::TempFolder folder;
    test::WriteGrid(folder.File("domain.nds2"), {4, 4, 100, 0, 0, 0, "NON-UTM"}, cells, quantity::kCode);
    CFlowModelDoc document;
    auto& domain = *document.Root().Important(kDomain);
    domain.GridFile().Choose(FileName("domain.nds2", folder.Path()));
    const auto traced = domain.Traced();
    traced->Run();
    return traced->Result() ? traced->Result()->fault : traced->Problem();
  };
  EXPECT_THAT(trace(rectangle), testing::StartsWith("Invalid nds2 file for Model Domain.\n"));
  EXPECT_THAT(trace(rectangle), HasSubstr("column 1, row 4 from the south"));
  rectangle[12] = kOut;
  EXPECT_EQ(trace(rectangle), "");
  // Where one cell is not all that is wrong, nothing is advised.
  EXPECT_THAT(trace({2, 2, 2, 2, 2, 1, 1, 2, 2, 1, 1, 2, 2, kOut, 2, 2}), testing::Not(HasSubstr("Leave this cell")));
}

TEST(Domain, AChosenShapeFilePutsTheGridWhereItLies) {
  test::TempFolder folder;
  CFlowModelDoc document;
  auto& domain = *document.Root().Important(kDomain);
  domain.nxShp = 11;
  domain.nyShp = 6;
  CTvnShapeData shapes;
  shapes.Create(ShapeKind::Polygon, {{"CODE", AttributeKind::Whole}}, {});
  Shape square;
  square.points = {{1000, 2000}, {1000, 2900}, {2905, 2900}, {2905, 2000}, {1000, 2000}};
  square.parts = {0};
  square.values = {1};
  shapes.AddShape(square);
  ASSERT_EQ(shapes.SaveShapeFile(folder.File("a.shp")).error, "");

  std::string problem;
  ASSERT_TRUE(domain.ChooseShapeFile(FileName("a.shp", folder.Path()), 1000, problem)) << problem;
  EXPECT_EQ((std::vector{domain.x0Shp, domain.y0Shp, domain.sizeShp}), (std::vector<double>{1000, 2000, 190}));
  EXPECT_FALSE(domain.ChooseShapeFile(FileName("away.shp", folder.Path()), 1000, problem));
  EXPECT_THAT(problem, HasSubstr("away.shp"));
  EXPECT_EQ(domain.x0Shp, 1000);
}

}  // namespace
}  // namespace tervane::domain_test
