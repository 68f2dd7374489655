// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <map>

#include <gmock/gmock.h>
#include <rapidjson/document.h>

#include "data/grid_files.h"
#include "document/flow_model_document.h"
#include "geometry/grid_polygons.h"
#include "simspec/river_branches.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "spatial/zones.h"
#include "surface/crop_course.h"
#include "surface/vegetation.h"
#include "tests/support/command_outcome.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::check_command_test {
namespace {

const std::string kFolder = TERVANE_SOURCE_DIR "/examples/rhone/";

TEST(CheckCommand, SpeaksGermanButInJson) {
  const std::string setup = kFolder + "rhone.tvd";
  EXPECT_EQ(test::Tervane({"check", setup, "--language", "de"}).out,
            setup +
                ": Warnung: Climate/PrecipitationRate/TIME_SERIES_31:GRIDCODEID: Es bekommt keine Zelle des "
                "Modells: sein Inhalt wird nirgends verwendet\n");
  EXPECT_EQ(test::Tervane({"check", setup, "--language", "de", "--json"}).out,
            test::Tervane({"check", setup, "--json"}).out);
  const test::TempFolder folder;
  const std::string several = folder.Write(
      "several.tvd", test::SetupText(14,
                                     "section SimSpec {\nsection SimulationPeriod {\nSIMEND = 1999, 1, 1, 0, 0\n}\n"
                                     "NotAKey = 1\n}"));
  const std::string told = test::Tervane({"check", several, "--language", "de"}).out;
  EXPECT_THAT(told, testing::HasSubstr("Fehler: "));
  EXPECT_THAT(told, testing::HasSubstr("nicht gelesen: SimSpec"));
  EXPECT_THAT(told, testing::Not(testing::HasSubstr("error")));
}

TEST(CheckCommand, TheRhoneIsWhole) {
  CTvn2DOrthoRotatedGridData heights;
  ASSERT_EQ(ReadGridData(kFolder + "dem.tif", 1, heights).error, "");
  for (const char* name : {"rhone.tvd", "rhone_xyz.tvd"}) {
    SCOPED_TRACE(name);
    // One gauge is so near to others that no cell is its own.
    const test::CommandOutcome checked = test::Tervane({"check", kFolder + name});
    EXPECT_EQ(checked.status, kFindings);
    EXPECT_EQ(checked.out, kFolder + name +
                               ": warning: Climate/PrecipitationRate/TIME_SERIES_31:GRIDCODEID: It gets no cell of the "
                               "model: what it holds is used nowhere\n");
    EXPECT_EQ(checked.err, "");

    CFlowModelDoc document;
    ASSERT_TRUE(document.OnOpenDocument(kFolder + name)) << document.Error();
    auto& root = document.Root();
    auto* domain = root.Important(kDomain);
    auto* topography = root.Important(kTopography);
    auto* subcatchments = root.Important(kSubcatchments);
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

    // In each belt something grows at all times, and no crop takes the field of another one.
    const auto& vegetation = *root.Important(kVegetation);
    std::string covers;
    for (const CFMSEKvfGroupBase* item : ZoneItems(vegetation)) {
      const CropDevelopment crops = dynamic_cast<const CVegetationTimeSeriesKvf&>(*item).Crops().Development();
      EXPECT_EQ(crops.problem, "");
      covers += item->GetStationName() + ":";
      for (const CropStretch& stretch : crops.stretches) {
        EXPECT_EQ(stretch.kind, CropStretch::Kind::Crop) << item->GetStationName();
        const std::string crop = " " + stretch.file->VegetationName();
        if (!covers.ends_with(crop)) covers += crop;
      }
      covers += "\n";
    }
    EXPECT_EQ(covers,
              "colline: Grass Maize Winter wheat Winter rape Grass\nmontane: Deciduous forest\n"
              "subalpine: Coniferous forest\nalpine: Permanent pasture\nnival: Bare soil\n");
    // The network is the one of the lines, with the sliver.
    const RiverBranches rivers = RiverBranches::Of(root);
    EXPECT_EQ(rivers.Reading().network.branches.size(), 4u);
    EXPECT_TRUE(rivers.Reading().findings.empty());
  }
}

TEST(CheckCommand, TheRhoneWithQualityAndWithParticlesIsWhole) {
  for (const char* name : {"rhone_quality.tvd", "rhone_particles.tvd"}) {
    SCOPED_TRACE(name);
    const test::CommandOutcome checked = test::Tervane({"check", kFolder + name});
    EXPECT_EQ(checked.status, kFindings);  // The gauge alone.
    EXPECT_EQ(std::ranges::count(checked.out, '\n'), 1) << checked.out;
  }
  const test::CommandOutcome species = test::Tervane({"show", "--species", kFolder + "rhone_quality.tvd"});
  for (const char* expected :
       {"Atrazine\n", "Ground decay: set: Decay of Atrazine", "Ground sorption: set: Sorption of Atrazine",
        "Sources: set: Fields of the valley", "Sources: set: Salt in the rain", "Overland mass: set  (Overland"})
    EXPECT_THAT(species.out, testing::HasSubstr(expected));
}

/// Runs a command; gives its status.
int Tervane(const std::vector<std::string>& arguments, std::string& out) {
  const test::CommandOutcome outcome = test::Tervane(arguments);
  out = outcome.out;
  return outcome.status;
}

TEST(CheckCommand, CoverageTellsHowTheDataFit) {
  std::string out;
  EXPECT_EQ(Tervane({"check", "--coverage", kFolder + "rhone_xyz.tvd"}, out), kDone) << out;
  EXPECT_THAT(out, testing::HasSubstr("simulation: 2012-01-01 to 2015-12-31\ndomain: 5285 of 142 x 97 cells"));
  EXPECT_THAT(out, testing::ContainsRegex("ok +Topography +dem.xyz.txt +13774 points +covers the domain"));
  EXPECT_THAT(out, testing::ContainsRegex("ok +Irrigation command areas +irrigated.shp .*covers 66 of 5285 cells"));
  // Of the year 2013, area-weighted: what the stations' columns and their shares give.
  EXPECT_THAT(out, testing::ContainsRegex("  domain \\(100%\\) +[0-9.]+ +[0-9.]+ +[0-9.]+ +[0-9.]+ +[0-9.]+\n"));

  EXPECT_EQ(Tervane({"check", "--coverage", "--json", kFolder + "rhone_faults.tvd"}, out), kFindings);
  rapidjson::Document json;
  json.Parse(out.c_str());
  ASSERT_FALSE(json.HasParseError());
  EXPECT_EQ(json["domainCells"].GetInt(), 5285);
  std::map<std::string, std::string> states;
  for (const auto& file : json["files"].GetArray()) states[file["path"].GetString()] = file["state"].GetString();
  EXPECT_EQ(states["Catchment/SHAPE_FILE"], "ok");
  EXPECT_EQ(states["Topography/NDS_2D_DATA_FILE"], "error");
  EXPECT_EQ(states["Climate/PrecipitationRate/TIME_SERIES_1/TIME_SERIES_FILE"], "warning");
  const auto& rain = json["forcings"][0];
  EXPECT_STREQ(rain["kind"].GetString(), "total");
  EXPECT_STREQ(rain["unit"].GetString(), "mm");
  double shares = 0, weighted = 0, domain = 0;
  for (const auto& column : rain["columns"].GetArray()) {
    const double value = column["values"][1]["value"].GetDouble();
    if (std::string(column["name"].GetString()) == "domain") {
      domain = value;
      continue;
    }
    shares += column["share"].GetDouble();
    weighted += column["share"].GetDouble() * value;
  }
  EXPECT_NEAR(shares, 1, 1e-9);
  EXPECT_NEAR(weighted, domain, 1e-6 * domain);
}

TEST(CheckCommand, InfoTellsOfPointsAndShapes) {
  std::string out;
  EXPECT_EQ(Tervane({"data", "info", kFolder + "dem.xyz.txt"}, out), kDone);
  EXPECT_THAT(out, testing::HasSubstr("13774 points, x 323500 to 464500, y 5075500 to 5171500"));
  EXPECT_EQ(Tervane({"data", "info", kFolder + "domain.shp"}, out), kDone);
  EXPECT_THAT(out, testing::HasSubstr("1 polygons, x 329000 to 459000"));
  EXPECT_THAT(out, testing::HasSubstr("attribute CODE: whole number"));
}

}  // namespace
}  // namespace tervane::check_command_test
