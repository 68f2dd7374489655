// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "engine/engine_program.h"

#include <sstream>

#include <gmock/gmock.h>

#include "core/kvf.h"
#include "data/datafile_writer.h"
#include "data/grid_files.h"
#include "data/series_file.h"
#include "execution/execute_flags.h"
#include "modelcells/model_layers.h"
#include "platform/item_types.h"
#include "platform/units.h"
#include "results/detailed_points.h"
#include "results/detailed_series.h"
#include "results/result_catalogue_file.h"
#include "results/storing.h"
#include "simspec/model_components.h"
#include "simspec/periods.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "spatial/zones.h"
#include "subsurface/computational_layers.h"
#include "subsurface/geology.h"
#include "subsurface/internal_boundary.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"
#include "surface/climate.h"
#include "surface/irrigation.h"
#include "surface/land_use.h"
#include "surface/overland.h"
#include "surface/rivers.h"
#include "surface/vegetation.h"
#include "tests/support/data_files.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"
#include "wqpt/registration_lenses.h"
#include "wqpt/sources.h"
#include "wqpt/species.h"

namespace tervane::engine_program_test {
namespace {

using testing::Each;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;

constexpr float kEmpty = kUsualDeleteValue;

/// A setup of 4 by 4 cells of 100 m at (1000, 2000); the domain leaves the two northern corners out.
class EngineProgram : public testing::Test {
 protected:
  EngineProgram() {
    WriteGrid("domain.nds2", {4, 4, 100, 1000, 2000, 0, {}}, {2, 2, 2, 2, 2, 1, 1, 2, 2, 1, 1, 2, kEmpty, 2, 2, kEmpty},
              quantity::kCode);
    Domain().GridFile().Choose(FileName("domain.nds2", folder.Path()));
    Domain().Type = CCatchmentKvf::kGridFile;
  }
  void WriteGrid(const std::string& name, const GridGeometry& geometry, std::vector<float> values, int itemType) {
    test::WriteGrid(folder.File(name), geometry, std::move(values), itemType);
  }
  CCatchmentKvf& Domain() { return *document.Root().Important(kDomain); }
  CData2DKvf& Topography() { return *document.Root().Important(kTopography); }

  EngineStatus Run(const std::string& option) {
    EXPECT_TRUE(document.OnSaveDocument(folder.File("a.tvd"))) << document.Error();
    std::ostringstream out;
    std::vector<std::string> arguments{folder.File("a.tvd")};
    if (!option.empty()) arguments.push_back(option);
    const EngineStatus status = RunEngineProgram(arguments, out);
    log = out.str();
    return status;
  }
  std::string ReportPath() const { return folder.File("a_results/a_PreProcessed.kvf"); }
  /// The values of an item of the grids that a run left.
  std::vector<float> Values(int item) {
    CTvn2DOrthoRotatedGridData grid;
    const FileResult result = ReadGridData(folder.File("a_results/a_PreProcessed.nds2"), item, grid);
    EXPECT_TRUE(result.Ok()) << result.error;
    return grid.Values();
  }

  test::TempFolder folder;
  CFlowModelDoc document;
  std::string log;
};

TEST_F(EngineProgram, PlacesThePointsOfDetailedSeries) {
  auto& points = *document.Root().Important(kStoringResults)->Child<CDetailedTSOutputListKvf>();
  points.SetItemCount(2, 1);
  constexpr int kWaterOnGround = 61;
  const auto place = [&](int number, const char* name, double x, double y) {
    CDetailedTSOutputItemKvf& point = *points.GetItem(number);
    point.Name = name;
    point.HydrComp = kWaterOnGround;
    point.X = x;
    point.Y = y;
  };
  place(1, "Gauge", 1150, 2050);
  place(2, "Outside", 1050, 2350);
  ASSERT_TRUE(WriteSeriesFile(folder.File("gauge.nds0"), {.name = "gauge",
                                                          .itemType = quantity::kWaterLevel,
                                                          .valueType = static_cast<int>(ValueType::Instantaneous),
                                                          .times = {{2000, 1, 1}, {2000, 12, 1}},
                                                          .values = {1, 2}})
                  .Ok());
  points.GetItem(1)->InclObserved = 1;
  points.GetItem(1)->Observed().Choose(FileName("gauge.nds0", folder.Path()));
  ASSERT_EQ(Run("/PP"), kEngineDone) << log;
  EXPECT_THAT(log, HasSubstr("DetailedTimeseriesOutput/Item_2: the point lies outside the model domain"));
  std::vector<DetailedPoint> placed;
  ASSERT_EQ(ReadDetailedPoints(ReportPath(), placed).error, "");
  ASSERT_EQ(placed.size(), 2U);
  EXPECT_EQ(placed[0].name, "Gauge");
  EXPECT_EQ(placed[0].dataType, "depth of overland water");
  EXPECT_EQ(std::pair(placed[0].column, placed[0].row), std::pair(2, 1));
  EXPECT_EQ(placed[0].layer, 0);
  EXPECT_EQ(placed[0].observed, (SeriesPlace{folder.File("gauge.nds0"), 1}));
  EXPECT_FALSE(placed[1].includesObserved);
}

TEST_F(EngineProgram, PutsQuantitiesOnTheCellsOfTheDomain) {
  // Half the cell size, so that a model cell's centre is a corner of four; the plane rises by 1 a metre to the east.
  std::vector<float> plane;
  for (int j = 0; j < 8; ++j)
    for (int i = 0; i < 8; ++i) plane.push_back(static_cast<float>(50 * i + 25));
  WriteGrid("dem.nds2", {8, 8, 50, 1000, 2000, 0, {}}, plane, 100180);
  Topography().Type = CData2DKvf::kGridFile;
  Topography().GridFile().Choose(FileName("dem.nds2", folder.Path()));

  ASSERT_EQ(Run("/PP"), kEngineDone) << log;
  EXPECT_THAT(Values(2),
              ElementsAre(50, 150, 250, 350, 50, 150, 250, 350, 50, 150, 250, 350, kEmpty, 150, 250, kEmpty));
  EXPECT_THAT(log, Not(HasSubstr("warning")));

  KvfFile* report = kvfLoadFile(ReportPath(), 1);
  KvfNode* top = kvfSectionByNameNum(kvfTargetByNameNum(report, "PreProcessed_Data", 1), "PAGE", 1);
  std::string text, file;
  kvfGetParam(kvfSectionByNameNum(top, "TEXT", 1), "Text", &text, 1, 1);
  EXPECT_THAT(text, HasSubstr("0.14 km2 in 14 cells"));
  EXPECT_THAT(text, HasSubstr("Topography: 50 m to 350 m"));
  KvfNode* page = kvfSectionByNameNum(kvfSectionByNameNum(top, "PAGE", 2), "NDS2_PLOT", 1);
  kvfGetParamFilename(page, "Filename", &file, 1, 1);
  EXPECT_EQ(file, folder.File("a_results/a_PreProcessed.nds2"));
  int item = 0;
  kvfGetParam(kvfSectionByNameNum(kvfTargetByNameNum(report, "Extra_Data", 1), "Topography", 1), "ItemNo", &item, 1, 1);
  EXPECT_EQ(item, 2);
  kvfClose(&report);

  // What it made is listed among the results, by what it is.
  StoredItems stored;
  EXPECT_EQ(ReadStoredItems(folder.File("a_results/a.tvdres"), true, stored), "");
  ASSERT_GE(stored.items.size(), 2U);
  EXPECT_EQ(stored.items[1].name, "Input: Topography");
  EXPECT_EQ(stored.items[1].path, file);
  EXPECT_EQ(stored.items[1].item, 2);
  EXPECT_FALSE(stored.area.IsUndefined());
}

TEST_F(EngineProgram, TellsCellsWithoutValueAndZonesByName) {
  WriteGrid("codes.nds2", {2, 4, 100, 1000, 2000, 0, {}}, {5, 5, 5, 5, 8, 8, 8, 8}, quantity::kCode);
  document.Root().Important(kModelComponents)->OL_ModelType = 1;
  document.Root().Child<CTopographicalRoutingKvf>()->DistributionType = CodedZonesKvf::kUniform;
  auto& zones = *document.Root().Important(kSubcatchments);
  zones.GridFile().Choose(FileName("codes.nds2", folder.Path()));
  zones.Type = CodedZonesKvf::kGridCodes;
  ASSERT_EQ(zones.SyncZones(), kAdded);
  zones.SelectZoneByCode(8)->SetStationName("Upper valley");

  ASSERT_EQ(Run("/PP"), kEngineDone) << log;
  EXPECT_THAT(log, HasSubstr("warning: Subcatchments: 7 cells of the domain have no Subcatchments"));
  EXPECT_THAT(test::ReadFile(ReportPath()), HasSubstr("8, Upper valley: 0.03 km2"));
}

TEST_F(EngineProgram, TellsWhereAndHowMuchIsIrrigated) {
  WriteGrid("codes.nds2", {2, 4, 100, 1000, 2000, 0, {}}, {5, 5, 5, 5, 8, 8, 8, 8}, quantity::kCode);
  NewDataFile content;
  content.dimensions = 0;
  content.items = {{"Cap", quantity::kWaterVolume, BaseUnit(*FindItemType(quantity::kWaterVolume)).key}};
  DataFileWriter writer;
  ASSERT_EQ(writer.Create(folder.File("cap.nds0"), content), "");
  for (const CYbDateTime& day : {CYbDateTime(2000, 1, 1), CYbDateTime(2000, 3, 1)}) {
    ASSERT_EQ(writer.AddStep(day), "");
    ASSERT_EQ(writer.Put(1, std::vector{40.0F}), "");
  }
  ASSERT_EQ(writer.Finish().error, "");

  auto& landUse = *document.Root().Important(kLandUse);
  landUse.Irrigation = 1;
  auto& areas = *landUse.Child<CIrrCommandAreasKvf>();
  areas.GridFile().Choose(FileName("codes.nds2", folder.Path()));
  ASSERT_EQ(areas.SyncZones(), kAdded);
  auto& orchards = dynamic_cast<CIrrCommandAreasPropKvf&>(*areas.SelectZoneByCode(5));
  orchards.SetStationName("Orchards");
  CIrrCommandAreasPropSourceItemKvf& source = *orchards.Sources().GetItem(1);
  source.SourceTypeCode = CIrrCommandAreasPropSourceItemKvf::kExternal;
  source.IrrigationLicenseIncluded = 1;
  source.LicenseFile().Choose(FileName("cap.nds0", folder.Path()));
  landUse.Child<CIrrDemandKvf>()->DistributionType = CodedZonesKvf::kUniform;

  ASSERT_EQ(Run("/PP"), kEngineDone) << log;
  EXPECT_THAT(log, Not(HasSubstr("have no Irrigation")));  // where no area is, nothing is watered
  const std::string report = test::ReadFile(ReportPath());
  for (const char* expected : {"Irrigation command areas: 0.07 km2 in 7 cells", "5, Orchards: 0.04 km2",
                               "TITLE = \"License Limited Irrigation, Orchards, source 1\"", "file \"../cap.nds0\""})
    EXPECT_THAT(report, HasSubstr(expected));
  source.LicenseFile().Choose(FileName("away.nds0", folder.Path()));
  EXPECT_EQ(Run("/PP"), kEngineFailed);
  EXPECT_THAT(log, HasSubstr("Source1/TIME_SERIES_FILE:FILE_NAME: cannot read"));
}

TEST_F(EngineProgram, PutsConcentrationsSourcesAndLensesOnTheCellsUnderTheirOwnersNames) {
  // Codes on the western column, which has two cells in the domain's south.
  WriteGrid("west.nds2", {1, 4, 100, 1000, 2000, 0, {}}, {4, 4, kEmpty, kEmpty}, quantity::kCode);
  CModelCompKvf& components = *document.Root().Important(kModelComponents);
  components.WQ = components.SZ = 1;
  CModelCompWQKvf& quality = *document.Root().Important(kWaterQualityComponents);
  quality.SZ = 1;
  document.Root().Important(kSpecies)->AddItem()->SetName("Salt");
  auto& sources = *document.Root().Important(kSources);
  sources.AddItemNode();
  CSourceWQItemKvf& source = *sources.GetItem(1);
  source.SourceName = "Landfill";
  source.SetSourceType(1);
  source.Strength().Global().FIXED_VALUE = 2;
  source.Child<ExtentKvf>()->GridFile().Choose(FileName("west.nds2", folder.Path()));

  ASSERT_EQ(Run("/PP"), kEngineDone) << log;
  std::string report = test::ReadFile(ReportPath());
  for (const char* expected : {"Landfill: Horizontal Extent: 0.02 km2 in 2 cells", "4, inside: 0.02 km2",
                               "2 g/s, constant", "Aquifer, Initial Concentration: Salt: 0 "})
    EXPECT_THAT(report, HasSubstr(expected));
  EXPECT_THAT(log, Not(HasSubstr("have no Horizontal")));  // a source is where it is

  components.ADPTRadio = kParticleTracking;
  document.Root().Important(kParticleTrackingComponents)->RegistrationZoneRadio = CModelCompPTKvf::kByLenses;
  CRegLensePTItemKvf& lens = *document.Root().Important(kRegistrationLenses)->AddItem();
  lens.LenseName = "Gravel";
  lens.Child<ExtentKvf>()->GridFile().Choose(FileName("west.nds2", folder.Path()));
  WriteGrid("west.nds2", {1, 4, 100, 5000, 2000, 0, {}}, {4, 4, kEmpty, kEmpty}, quantity::kCode);
  ASSERT_EQ(Run("/PP"), kEngineDone) << log;
  report = test::ReadFile(ReportPath());
  EXPECT_THAT(report, HasSubstr("Gravel: Upper Level: 0 m everywhere"));
  EXPECT_THAT(log, HasSubstr("Gravel: Horizontal Extent has no value in any cell of the domain"));
}

TEST_F(EngineProgram, LeavesTheRiverNetworkAsLines) {
  folder.Write("net.fvnwk",
               "target FLUVANE_Network_editor {\n  section POINTS {\n    Point = 1, 1000, 2100, 0\n"
               "    Point = 2, 1400, 2100, 400\n    Point = 3, 1, 1, 1\n  }\n  section BRANCHES {\n"
               "    section Branch_1 {\n      Name = \"Rhone\"\n      Points = 1, 2\n    }\n  }\n}\n");
  folder.Write("run.fvsim", "target FvRun {\n  section input {\n    nwk = \"net.fvnwk\"\n  }\n}\n");
  document.Root().Important(kModelComponents)->River = 1;
  dynamic_cast<CRiverKvf&>(*document.Root().Important(kRiver)).SetRiverFile(FileName("run.fvsim", folder.Path()));
  ASSERT_EQ(Run("/PP"), kEngineDone) << log;
  EXPECT_THAT(log, HasSubstr("net.fvnwk:5: point 3 belongs to no branch"));
  EXPECT_THAT(test::ReadFile(ReportPath()), HasSubstr("SHAPE_PLOT"));
  CYbShapeData lines;
  ASSERT_TRUE(lines.ReadShapeAndDbfFile(folder.File("a_results/a_PreProcessed_Rivers.shp"), "NAME").Ok());
  ASSERT_EQ(lines.GetData().size(), 1U);
  EXPECT_EQ(TextOf(lines.GetData()[0].Value()), "Rhone");
  EXPECT_EQ(lines.GetData()[0].points.back(), (MapPoint{1400, 2100}));
}

TEST_F(EngineProgram, TakesTheMeanOfTheStepsOfTheSimulation) {
  NewDataFile content;
  content.geometry = FileGeometryOf({4, 4, 100, 1000, 2000, 0, {}});
  content.items = {{"Rain", 100431, 2004, ValueType::MeanStep}};
  DataFileWriter writer;
  ASSERT_EQ(writer.Create(folder.File("rain.nds2"), content), "");
  // The first step ends where the simulation begins.
  for (const int day : {1, 2, 3}) {
    ASSERT_EQ(writer.AddStep({2000, 1, day}), "");
    ASSERT_EQ(writer.Put(1, std::vector<float>(16, static_cast<float>(100 / day))), "");
  }
  ASSERT_EQ(writer.Finish().error, "");
  document.Root().Important(kSimulationPeriod)->SIMEND = {2000, 1, 3};
  auto& rain = *document.Root().Important(kPrecipitation);
  rain.DistributionType = C2DStationBasedDataKvf::kFullyDistributed;
  rain.FullyDistributed().GridFile().Choose(FileName("rain.nds2", folder.Path()));

  ASSERT_EQ(Run("/PP"), kEngineDone) << log;
  EXPECT_FLOAT_EQ(Values(3)[0], (50 + 33) / 2.0F);
  EXPECT_THAT(test::ReadFile(ReportPath()), HasSubstr("mean of the time steps: 41.5 mm/day everywhere"));
}

TEST_F(EngineProgram, LeavesLayersBoundariesAndWellsOfTheSaturatedZone) {
  auto& zone = *document.Root().Important(kSaturatedZone);
  Topography().FixedValue = 100;
  zone.Layers().SetItemCount(2, 1);
  zone.LayersOfGeology().SetItemCount(2, 1);
  zone.LayersOfGeology().GetItem(1)->Name = "Sand";
  const auto level = [&](int layer) -> CData2DKvf& { return *PropertyOf(*zone.Layers().GetItem(layer), "LowerLevel"); };
  level(1).FixedValue = -20;
  level(1).RelativeToGround = 1;
  // In its two northern rows the second level lies above the first one.
  WriteGrid("bottom.nds2", {4, 4, 100, 1000, 2000, 0, {}},
            {50, 50, 50, 50, 50, 50, 50, 50, 90, 90, 90, 90, 90, 90, 90, 90}, quantity::kElevation);
  level(2).Type = CData2DKvf::kGridFile;
  level(2).RelativeToGround = 0;
  level(2).GridFile().Choose(FileName("bottom.nds2", folder.Path()));

  CGeoDataBoundCondListKvf& outer = zone.LayersOfGeology().GetItem(1)->OuterBoundary();
  outer.SetItemCount(1, 1);
  outer.GetItem(1)->BoundaryType = CGeoDataBoundCondItemKvf::kFixedHead;
  auto& inner = *zone.LayersOfGeology().GetItem(1)->Child<CSZVerDiscrInternalBoundaryKvf>();
  WriteGrid(
      "inner.nds2", {4, 4, 100, 1000, 2000, 0, {}},
      {7, kEmpty, kEmpty, kEmpty, kEmpty, 7, 8, kEmpty, kEmpty, kEmpty, kEmpty, kEmpty, kEmpty, kEmpty, kEmpty, kEmpty},
      quantity::kCode);
  inner.Type = ZoneSource::kGridCodes;
  inner.GridFile().Choose(FileName("inner.nds2", folder.Path()));
  inner.SyncZones();
  dynamic_cast<CSZVerDiscrInternalBoundaryPropKvf&>(*inner.SelectZoneByCode(7)).BoundaryType =
      CSZVerDiscrInternalBoundaryPropKvf::kInactive;

  folder.Write(
      "a.WEL",
      "target WEL_CFG {\nsection WELLDATA {\nNoWells = 2\n"
      "section Well_1 {\nName = \"East\"\nX = 1150.0\nY = 2050.0\nLevel = 100.0\nDepth = 60.0\nNoFilters = 3\n"
      "section Filter_1 {\nTop = 95.0\nBottom = 85.0\n}\nsection Filter_2 {\nTop = 90.0\nBottom = 60.0\n}\n"
      "section Filter_3 {\nTop = 45.0\nBottom = 40.0\n}\n}\n"
      "section Well_2 {\nName = \"Far\"\nX = 1.0\nY = 2.0\nLevel = 100.0\nDepth = 60.0\nNoFilters = 0\n}\n}\n}\n");
  zone.Wells = 1;
  document.Root().Important(kWells)->Filename = FileName("a.WEL", folder.Path());

  ASSERT_EQ(Run("/PP"), kEngineDone) << log;
  const auto layers = [&](int item, int layer) {
    CTvn2DOrthoRotatedGridData grid;
    EXPECT_EQ(ReadGridData(folder.File("a_results/a_PreProcessed.nds3"), item, grid, {}, {0, layer}).error, "");
    return grid.Values();
  };
  const float none = kEmpty;
  // Layer 0 is the bottom. What was too thin has the thickness that the setup asks for.
  EXPECT_THAT(layers(ModelLayers::kLowerLevels, 1), Each(testing::AnyOf(80, none)));
  EXPECT_THAT(layers(ModelLayers::kLowerLevels, 0),
              ElementsAre(50, 50, 50, 50, 50, 50, 50, 50, 79.5, 79.5, 79.5, 79.5, none, 79.5, 79.5, none));
  EXPECT_THAT(layers(ModelLayers::kUpperLevels, 1), Each(testing::AnyOf(100, none)));
  EXPECT_THAT(layers(ModelLayers::kUpperLevels, 0), Each(testing::AnyOf(80, none)));
  EXPECT_THAT(log, HasSubstr("6 cells of computational layers were thinner than 0.5 m"));
  EXPECT_THAT(log, HasSubstr("1 wells lie outside the model, the first is Far"));
  EXPECT_THAT(log, HasSubstr("1 filters of wells lie in no computational layer, the first is filter 3 of East"));

  const std::string report = test::ReadFile(ReportPath());
  for (const char* expected :
       {"NDS3_PLOT", "SZ_Included = 1", "NumberOfLayers = 2",
        "East, filter 1: column 2, row 1 from the south, layer 1\\\\n",
        "East, filter 2: column 2, row 1 from the south, layers 1 to 2\\\\n",
        "filter 3: column 2, row 1 from the south, no", "Boundary Codes, Sand: 0.14 km2", "1, inside: 0.03 km2",
        "11, outer boundary: Fixed Head: 0.08 km2", "26, internal boundary: Inactive Cells: 0.02 km2",
        "2, outer boundary without a condition: 0.1 km2"})
    EXPECT_THAT(report, HasSubstr(expected));

  // Levels that are told by the setup's own layers count in their place; a uniform discretization has none.
  zone.TypeOfVerDiscr = CSatZoneKvf::kExplicitLevels;
  zone.OwnLayers().SetItemCount(1, 1);
  PropertyOf(*zone.OwnLayers().GetItem(1), "LowerLevel")->FixedValue = 10;
  ASSERT_EQ(Run("/PP"), kEngineDone) << log;
  EXPECT_THAT(layers(ModelLayers::kLowerLevels, 0), Each(testing::AnyOf(10, none)));
  zone.TypeOfVerDiscr = CSatZoneKvf::kUniform;
  ASSERT_EQ(Run("/PP"), kEngineDone) << log;
  EXPECT_THAT(test::ReadFile(ReportPath()), HasSubstr("SZ_Included = 0"));
}

/// A real catchment with stations, snow and zones.
TEST_F(EngineProgram, TellsWhichCropGrowsWhen) {
  folder.Write("crops.etv",
               "target TERVANE_VEGETATION {\nsection Vegetation_1 {\nName = \"Rye\"\nStage = 0, 1.0, 0.2, 0.3\n"
               "Stage = 10, 2.0, 1.0, 1.0\n}\n}\n");
  CVegetationKvf& vegetation = *document.Root().Important(kVegetation);
  vegetation.Global().FIXED_VALUE_LAI = 3;
  ASSERT_EQ(Run("/PP"), kEngineDone) << log;
  EXPECT_THAT(test::ReadFile(ReportPath()), HasSubstr("Leaf area index 3, root depth 0 m, constant"));
  vegetation.Global().TYPE = VegetationCourse::kCrops;
  CVegetationItemKvf& crop = *vegetation.Global().Crops().AddItem();
  crop.StartDate = {2000, 1, 5};
  crop.VegPropFile().Choose(FileName("crops.etv", folder.Path()), "Rye");
  ASSERT_EQ(Run("/PP"), kEngineDone) << log;
  EXPECT_THAT(test::ReadFile(ReportPath()), HasSubstr("2000-01-01 to 2000-01-05: no crop"));
  EXPECT_THAT(test::ReadFile(ReportPath()), HasSubstr("2000-01-05 to 2000-01-15: Rye"));
  crop.VegPropFile().SetVegetationName("Rice");
  ASSERT_EQ(Run("/PP"), kEngineFailed);
  EXPECT_THAT(log, HasSubstr("has no vegetation \"Rice\""));
}

TEST(EngineProgramExample, ReportsTheRhone) {
  test::TempFolder folder;
  std::filesystem::copy(std::string(TERVANE_SOURCE_DIR) + "/examples/rhone", folder.Path(),
                        std::filesystem::copy_options::recursive);
  std::filesystem::remove(folder.File("subbasins.prj"));  // worth a note to who edits, and nothing here
  std::ostringstream out;
  ASSERT_EQ(RunEngineProgram({folder.File("rhone.tvd"), "/PP"}, out), kEngineDone) << out.str();
  // One gauge's area is smaller than a cell.
  EXPECT_THAT(out.str(), HasSubstr("warning: Climate/PrecipitationRate/TIME_SERIES_31:GRIDCODEID"));
  const std::string report = test::ReadFile(folder.File("rhone_results/rhone_PreProcessed.kvf"));
  for (const char* expected : {"Model Domain and Grid: 5285 km2 in 5285 cells", "Topography: 374.216 m to 4292.8 m",
                               "Precipitation Rate: 5285 km2", "45, Gauge 45: ", "TITLE = \"Gauge 262\"",
                               "Filename = file \"../temperature.nds0\"", "StartDate = 2012, 1, 1, 0, 0, 0",
                               "Vegetation: 5285 km2 in 5285 cells", "1, colline: 252 km2",
                               "2013-08-29 to 2014-07-25: Winter rape", "Irrigation command areas: 66 km2 in 66 cells",
                               "1, Rhone plain: 66 km2", "Irrigation: Moisture Deficit Start, Crops", "0.55, constant",
                               "Manning Number: 1.25 m^(1/3)/s to 20 m^(1/3)/s"})
    EXPECT_THAT(report, HasSubstr(expected));
  // Water is to get to a part of the model alone.
  EXPECT_THAT(out.str(), testing::Not(HasSubstr("LandUse")));
  CYbShapeData rivers;
  ASSERT_TRUE(rivers.ReadShapeAndDbfFile(folder.File("rhone_results/rhone_PreProcessed_Rivers.shp"), "NAME").Ok());
  EXPECT_EQ(rivers.GetData().size(), 4U);

  for (const auto& [setup, expected] :
       {std::pair{"rhone_quality", std::vector{"TITLE = \"Chloride\""}},
        std::pair{"rhone_particles", std::vector{"Initial Number of Particles Per Cell"}}}) {
    std::ostringstream told;
    ASSERT_EQ(RunEngineProgram({folder.File(setup + std::string(".tvd")), "/PP"}, told), kEngineDone) << told.str();
    const std::string made = test::ReadFile(folder.File(fmt::format("{0}_results/{0}_PreProcessed.kvf", setup)));
    for (const char* text : expected) EXPECT_THAT(made, HasSubstr(text));
  }

  std::ostringstream faults;
  EXPECT_EQ(RunEngineProgram({folder.File("rhone_faults.tvd"), "/PP"}, faults), kEngineFailed);
  for (const char* expected :
       {"error: Topography/NDS_2D_DATA_FILE:FILE_NAME: cannot read", "error: Climate:SM: The snowmelt model",
        "TIME_SERIES_50/TIME_SERIES_FILE:FILE_NAME: the file covers 2012-01-01 to 2016-01-01",
        "AirTemperature/GLOBAL/TIME_SERIES_FILE:FILE_NAME: item 1 is Precipitation Rate"})
    EXPECT_THAT(faults.str(), HasSubstr(expected));
  EXPECT_FALSE(FileExists(folder.File("rhone_faults_results/rhone_faults_PreProcessed.kvf")));
}

TEST_F(EngineProgram, RefusesWhatItCannotDo) {
  auto& flags = *document.Root().Important(kExecuteFlags);
  struct Case {
    const char* what;
    std::function<void()> prepare;
    const char* option;
    const char* message;
    bool leavesReport;
  };
  const Case cases[] = {
      {"water movement", [] {}, "/WM", "there is no water movement simulation", false},
      {"water quality", [] {}, "/WQ", "there is no water quality simulation", false},
      {"what the file says", [] {}, "", "simulates no water: there is no water movement simulation; the prepro", true},
      {"preprocessing alone", [&] { flags.WM = 0; }, "", "progress 100 Done", true},
      {"an unknown option", [] {}, "/XX", "usage:", false},
      {"a missing file",
       [&] {
         Topography().Type = CData2DKvf::kGridFile;
         Topography().GridFile().Choose(FileName("away.nds2", folder.Path()));
       },
       "/PP", "error: Topography/NDS_2D_DATA_FILE", false},
      {"a missing file that no validation reads",
       [&] {
         Topography().Type = CData2DKvf::kXyzFile;
         Topography().XyzFile().File = FileName("away.txt", folder.Path());
       },
       "/PP", "error: Topography: ", false},
  };
  for (const Case& test : cases) {
    SCOPED_TRACE(test.what);
    std::filesystem::remove(ReportPath());
    test.prepare();
    const EngineStatus status = Run(test.option);
    EXPECT_THAT(log, HasSubstr(test.message));
    EXPECT_EQ(status == kEngineDone, std::string_view(test.message).starts_with("progress 100"));
    EXPECT_EQ(FileExists(ReportPath()), test.leavesReport);
  }
}

}  // namespace
}  // namespace tervane::engine_program_test
