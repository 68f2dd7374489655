// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <map>
#include <sstream>

#include <gmock/gmock.h>

#include "cli/command_line.h"
#include "document/flow_model_document.h"
#include "platform/grid_files.h"
#include "platform/grid_polygons.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "spatial/zones.h"

namespace tervane {
namespace {

const std::string kFolder = TERVANE_SOURCE_DIR "/examples/rhone/";

TEST(CheckCommand, TheRhoneIsWhole) {
  CTvn2DOrthoRotatedGridData heights;
  ASSERT_EQ(ReadGridData(kFolder + "dem.tif", 1, heights).error, "");
  for (const char* name : {"rhone.tvd", "rhone_xyz.tvd"}) {
    SCOPED_TRACE(name);
    std::ostringstream out, err;
    EXPECT_EQ(RunCommandLine({"check", kFolder + name}, out, err), kDone) << out.str();
    EXPECT_EQ(err.str(), "");

    CFlowModelDoc document;
    ASSERT_TRUE(document.OnOpenDocument(kFolder + name)) << document.Error();
    auto& root = document.Root();
    auto* domain = root.Important<CCatchmentKvf>("CATCHMENT");
    auto* topography = root.Important<CTopographyKvf>("TOPOGRAPHY");
    auto* subcatchments = root.Important<CSubcatchmentKvf>("SUBCATCHMENT");
    ASSERT_TRUE(domain && topography && subcatchments);
    std::string problem;
    const auto cells = domain->GetDomainGrid(&problem);
    ASSERT_TRUE(cells) << problem;
    const GridGeometry geometry = domain->GetModelGeometry();

    // Both sources give the heights of the raster, cell for cell.
    const auto ground = topography->GetGridData(&problem);
    ASSERT_TRUE(ground) << problem;
    ASSERT_EQ(ground->Values().size(), geometry.CellCount());
    for (std::size_t i = 0; i < geometry.CellCount(); ++i)
      ASSERT_NEAR(static_cast<double>(ground->Values()[i]), static_cast<double>(heights.Values()[i]), 0.06) << i;

    // Each cell of the domain lies in one of the sub-basins, and each of these is a zone.
    PolygonFile polygons;
    polygons.path = subcatchments->ShapeFile().File.Absolute();
    polygons.attribute = subcatchments->ShapeFile().Attribute();
    polygons.axisUnit = subcatchments->ShapeAxisUnit;
    CTvn2DOrthoRotatedGridData codes;
    ZoneTable table;
    ASSERT_EQ(codes.CreateGridData_GIS_Polygon(geometry, kUsualDeleteValue, polygons, table).error, "");
    std::map<int, int> cellsOfZone;
    int inside = 0;
    for (std::size_t i = 0; i < geometry.CellCount(); ++i) {
      if (cells->IsEmptyValue(cells->Values()[i])) continue;
      ++inside;
      ASSERT_FALSE(codes.IsEmptyValue(codes.Values()[i])) << i;
      ++cellsOfZone[static_cast<int>(codes.Values()[i])];
    }
    EXPECT_EQ(inside, 5285);
    EXPECT_EQ(cellsOfZone.size(), 29u);
    EXPECT_EQ(cellsOfZone[284], 495);
    EXPECT_EQ(subcatchments->GetZoneTitles().size(), 29u);
    for (const auto& [code, count] : cellsOfZone) EXPECT_NE(subcatchments->SelectZoneByCode(code), nullptr) << code;
    const SyncPlan plan = subcatchments->PlanZones(subcatchments->FindZones());
    EXPECT_TRUE(plan.added.empty() && plan.removed.empty());
  }
}

}  // namespace
}  // namespace tervane
