// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "modflow6/modflow6_export.h"

#include <cmath>
#include <filesystem>
#include <functional>
#include <map>
#include <set>
#include <string>

#include <gmock/gmock.h>

#include "platform/files.h"
#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "simspec/modflow_solvers.h"
#include "simspec/periods.h"
#include "simspec/stress_periods.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "spatial/series_totals.h"
#include "subsurface/geology.h"
#include "subsurface/internal_boundary.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/wells.h"
#include "surface/climate.h"
#include "tests/modflow6/model_reader.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"

namespace tervane::modflow6_export_test {
namespace {

using modflow6::ExportModflow6;
using modflow6::ExportReport;
using modflow6::Fate;
using modflow6::Modflow6Options;
using test::ModelReader;
using testing::DoubleNear;
using testing::HasSubstr;

/// Cancels when it was asked that often.
class TestLog : public WorkLog {
 public:
  explicit TestLog(int asksBeforeCancel = -1) : left_(asksBeforeCancel) {}
  void Progress(int, std::string_view) override {}
  void Error(std::string_view, std::string_view) override {}
  void Warning(std::string_view, std::string_view) override {}
  bool IsCancelled() const override {
    if (left_ > 0) --left_;
    return left_ == 0;
  }

 private:
  mutable int left_;
};

/// The example with a Modflow engine, where it stands.
class Rhone {
 public:
  Rhone() {
    EXPECT_TRUE(setup.OnOpenDocument(TERVANE_SOURCE_DIR "/examples/rhone/rhone_modflow.tvd")) << setup.Error();
  }

  FileResult Export(const std::string& name, const Modflow6Options& options = {}, TestLog log = TestLog()) {
    report = {};
    return ExportModflow6(setup.Root(), "Rhone, Modflow", folder.File(name), options, log, report);
  }
  ModelReader Exported(const std::string& name, const Modflow6Options& options = {}) {
    const FileResult result = Export(name, options);
    EXPECT_EQ(result.error, "");
    return ModelReader(folder.File(name));
  }
  bool Tells(Fate fate, const std::string& place, const std::string& text) const {
    return std::ranges::any_of(report.Entries(), [&](const modflow6::ExportEntry& entry) {
      return entry.fate == fate && entry.place == place && entry.text.find(text) != std::string::npos;
    });
  }

  CFlowModelDoc setup;
  test::TempFolder folder;
  ExportReport report;
};

TEST(Modflow6Export, TheRhoneIsWhatItsSetupSays) {
  Rhone rhone;
  const ModelReader model = rhone.Exported("model");
  EXPECT_EQ(model.layers, 3);
  EXPECT_EQ(model.rows, 97);
  EXPECT_EQ(model.columns, 142);
  EXPECT_EQ(model.periods, (std::vector<ModelReader::Row>{
                               {"366", "1", "1.1"}, {"365", "12", "1.1"}, {"365", "12", "1.1"}, {"364", "12", "1.1"}}));
  // The first period is steady, the second begins what is not.
  std::string storage;
  for (const test::InputBlock& block : model.files.at("STO6"))
    if (block.name.starts_with("PERIOD")) storage += block.name + " " + block.lines.at(0).at(0) + ", ";
  EXPECT_EQ(storage, "PERIOD 1 STEADY-STATE, PERIOD 2 TRANSIENT, ");

  // A cell of the plain, at Saxon: row 53 from the north. The clay lies in the alluvium, 7 of 80 m.
  const int row = 53, column = 46;
  EXPECT_NEAR(model.At("TOP/1", row, column) - model.At("BOTM/1", row, column), 80, 1e-3);
  EXPECT_NEAR(model.At("K/1", row, column), (73 * 1e-3 + 7 * 1e-8) / 80 * 86400, 1e-3);
  EXPECT_NEAR(model.At("K33/1", row, column), 80 / (73 / 1e-4 + 7 / 1e-9) * 86400, 1e-7);
  EXPECT_NEAR(model.At("SY/1", row, column), (73 * 0.2 + 7 * 0.03) / 80, 1e-5);
  EXPECT_NEAR(model.At("K/2", row, column), 1e-5 * 86400, 1e-5);
  EXPECT_NEAR(model.At("TOP/1", row, column) - model.At("STRT/1", row, column), 3, 1e-3);

  // What rains and what is pumped: the means of the series over the periods.
  double drains = 0;
  for (const auto& entry : model.stresses.at("drn").at(1)) drains += std::stod(entry[4]);
  EXPECT_NEAR(drains, static_cast<double>(model.stresses.at("drn").at(1).size()) * 1e-6 * 1e6 * 86400, 1);
  const TimeSpan second{CYbDateTime(2013, 1, 1).SecondsSinceEpoch(), CYbDateTime(2014, 1, 1).SecondsSinceEpoch()};
  const SeriesFacts pumping = SumSeries(TERVANE_SOURCE_DIR "/examples/rhone/pumping.nds0", 2, {second}, {}, {});
  double sion = 0;
  for (const auto& entry : model.stresses.at("wel").at(2))
    if (entry[4] == "Sion Sud") sion += std::stod(entry[3]);
  EXPECT_THAT(sion, DoubleNear(-pumping.sums[0].integral / static_cast<double>(second.Seconds()) * 86400, 2500));
  EXPECT_LT(sion, -1000);
  double rain = 0;
  int cells = 0;
  for (int r = 1; r <= model.rows; ++r)
    for (int c = 1; c <= model.columns; ++c)
      if (model.IsActive(1, r, c)) rain += model.At("RECHARGE@2/1", r, c), ++cells;
  EXPECT_NEAR(rain / cells * 365, 0.25 * 1.0, 0.2);  // A quarter of some 1000 mm a year.
  EXPECT_EQ(model.stresses.at("chd").at(1).size(), 6U);

  EXPECT_TRUE(rhone.Tells(Fate::Carried, "SaturatedZone/GeoLayersSZ/Layer_1/HorHydrCon", "K of NPF"));
  EXPECT_TRUE(rhone.Tells(Fate::Changed, "SaturatedZone/GeoLayersSZ/Layer_1/HorizontalAnisotropyRatio", "0"));
  EXPECT_TRUE(rhone.Tells(Fate::LeftOut, "SimSpec/CompControlParaModPackage:HDRY", "1e30"));
  // Of a node of which only a key is told, those below are told one by one.
  EXPECT_TRUE(rhone.Tells(Fate::Carried, "Climate:RechargeOption", "highest active cell"));
  EXPECT_TRUE(rhone.Tells(Fate::LeftOut, "Climate/TempLapseRate", "no counterpart"));
  EXPECT_THAT(test::ReadFile(rhone.folder.File("model/export-report.txt")), HasSubstr("left out:"));
}

TEST(Modflow6Export, BinaryArraysHoldWhatTextDoes) {
  Rhone rhone;
  const ModelReader text = rhone.Exported("text");
  const ModelReader binary = rhone.Exported("binary", {.arrays = Modflow6Options::Arrays::Binary});
  ASSERT_EQ(text.arrays.size(), binary.arrays.size());
  // Values have the precision of their files.
  for (const auto& [name, array] : text.arrays) {
    const std::vector<float> singles(array.values.begin(), array.values.end());
    const std::vector<double>& stored = binary.arrays.at(name).values;
    EXPECT_EQ(singles, std::vector<float>(stored.begin(), stored.end())) << name;
  }
}

TEST(Modflow6Export, EnginesAndOptionsDecideWhatIsWritten) {
  Rhone rhone;
  auto& basics = *rhone.setup.Root().Important(kBasicParameters);
  auto& zone = *rhone.setup.Root().Important(kSaturatedZone);
  auto& periods = *rhone.setup.Root().Important(kStressPeriods);

  basics.ModelType = kEngineModflowSurfact;
  periods.GetItem(2)->DELT = 2;
  periods.GetItem(2)->TSDIV = 1;
  const ModelReader adaptive = rhone.Exported("adaptive");
  EXPECT_TRUE(adaptive.Options("TDIS").contains("ATS6"));
  EXPECT_TRUE(FileExists(rhone.folder.File("adaptive/rhone__modflow.ats")));
  EXPECT_THAT(test::ReadFile(rhone.folder.File("adaptive/rhone__modflow.ats")), HasSubstr("  2 2 1e-05 1000 1.1 0\n"));
  EXPECT_TRUE(rhone.Tells(Fate::Changed, "SimSpec/STRESSPERIODS", "nearest"));

  // What cannot be had without Newton-Raphson has it, whatever the solver says.
  auto& components = *rhone.setup.Root().Important(kModflowComponents);
  components.ChooseVariablySaturated(1);
  basics.Child<CCompControlParaModKvf>()->SolverOption = kSolverPCG4;
  rhone.Exported("saturated");
  EXPECT_THAT(test::ReadFile(rhone.folder.File("saturated/rhone__modflow.nam")), HasSubstr("NEWTON"));
  components.ChooseVariablySaturated(0);

  basics.ModelType = kEngineModflow96;
  periods.MfSteadyState = 1;
  zone.Wells = zone.Drainage = 0;
  zone.MimimumLayerThickness = 100;
  const ModelReader thick = rhone.Exported("thick");
  EXPECT_FALSE(thick.files.contains("STO6"));
  EXPECT_FALSE(thick.files.contains("WEL6"));
  EXPECT_FALSE(thick.files.contains("DRN6"));
  EXPECT_NEAR(thick.At("TOP/1", 53, 46) - thick.At("BOTM/1", 53, 46), 100, 1e-3);
  EXPECT_TRUE(rhone.Tells(Fate::Changed, "SaturatedZone:MimimumLayerThickness", "end lower"));
  const ModelReader thin = rhone.Exported("thin", {.thinCells = ModelLayers::ThinCells::Vanish});
  EXPECT_EQ(thin.At("IDOMAIN/1", 53, 46), -1);
  EXPECT_TRUE(thin.IsActive(3, 53, 46));
}

/// Six by five cells of 100 m, flat at 100 m, whose outer cells are the boundary; two layers of 20 and 30 m.
class Box {
 public:
  explicit Box(const std::string& layers, const std::string& zone = "", const std::string& further = "")
      : setup(Sections(layers, zone) + further) {
    GridGeometry geometry;
    geometry.nx = 6, geometry.ny = 5, geometry.cellSize = 100;
    std::vector<float> domain(30, 2.0F), zones(30, kUsualDeleteValue), units(30, 1.0F);
    for (int j = 1; j < 4; ++j)
      for (int i = 1; i < 5; ++i) domain[static_cast<std::size_t>(6 * j + i)] = 1;
    // A line along the boundary must not begin in a corner.
    domain[6 * 4] = kUsualDeleteValue;
    zones[6 * 1 + 2] = zones[6 * 1 + 3] = 7;
    zones[6 * 2 + 2] = 8;
    zones[6 * 3 + 2] = 9;
    units[6 * 2 + 4] = 2;
    test::WriteGrid(folder.File("domain.nds2"), geometry, domain, quantity::kCode);
    test::WriteGrid(folder.File("zones.nds2"), geometry, zones, quantity::kCode);
    test::WriteGrid(folder.File("units.nds2"), geometry, units, quantity::kCode);
    setup.Root().Important(kDomain)->GridFile().Choose(FileName(folder.File("domain.nds2"), {}));
  }

  /// The lines of a package in a period, as `layer row column value ...`.
  static std::vector<std::string> Lines(const ModelReader& model, const std::string& package, int period = 1) {
    std::vector<std::string> lines;
    if (!model.stresses.contains(package)) return lines;
    for (const ModelReader::Row& entry : model.stresses.at(package).at(period)) {
      lines.emplace_back();
      for (const std::string& word : entry) lines.back() += (lines.back().empty() ? "" : " ") + word;
    }
    return lines;
  }
  ModelReader Exported() {
    ExportReport report;
    TestLog log;
    const FileResult result = ExportModflow6(setup.Root(), "box", folder.File("model"), {.force = true}, log, report);
    EXPECT_EQ(result.error, "");
    return ModelReader(folder.File("model"));
  }

  test::TempFolder folder;
  test::TestSetup setup;

 private:
  static std::string Sections(const std::string& layers, const std::string& zone) {
    return "section SimSpec {\n ModelType = 2\n}\nsection Topography {\n FixedValue = 100.0f\n}\n"
           "section SaturatedZone {\n TypeOfVerDiscr = 2\n" +
           zone +
           "section CompLayersSZ {\n NumberOfLayers = 2\n"
           "section Layer_1 {\n section LowerLevel {\n FixedValue = 80.0f\n}\n" +
           layers + "}\nsection Layer_2 {\n section LowerLevel {\n FixedValue = 50.0f\n}\n}\n}\n}\n";
  }
};

std::string Segment(int number, double x, double y, const std::string& keys) {
  return fmt::format("section OuterBoundaryProp_{} {{\n Name = \"S{}\"\n X = {:.1f}\n Y = {:.1f}\n {}\n}}\n", number,
                     number, x, y, keys);
}

TEST(Modflow6Export, EachKindOfBoundaryBecomesItsPackage) {
  // From the north-west clockwise: a head along the north, a flux in the east, a gradient in the south.
  Box box("section OuterBoundary {\n NumberOfBoundaryConditions = 4\n" +
          Segment(1, 150, 450, "BoundaryType = 1\nType = 1\nFixedValue = 95.0f") +
          Segment(2, 550, 450, "BoundaryType = 2\nType = 1\nFixedValue = 0.004f") +
          Segment(3, 550, 50, "BoundaryType = 3\nType = 1\nFixedValue = 0.01f") +
          Segment(4, 50, 50, "BoundaryType = 0") + "}\n");
  const ModelReader model = box.Exported();
  EXPECT_THAT(Box::Lines(model, "chd"), testing::ElementsAre("1 1 2 95 S1_1", "1 1 3 95 S1_1", "1 1 4 95 S1_1"));
  // The line along the boundary cuts corners, so that it is longer in the cells beside them. 0.004 m3/s in all; 0.01
  // times 1e-4 m/s in 20 m of thickness for each metre.
  const double beside = 50 + 50 * std::sqrt(2);
  const std::map<std::string, double> lengths{{"1 5", beside}, {"2 6", beside}, {"3 6", 100}, {"4 6", beside},
                                              {"5 5", beside}, {"5 4", 100},    {"5 3", 100}};
  std::set<std::string> cells;
  double along = 0, rates = 0;
  for (const ModelReader::Row& entry : model.stresses.at("flux").at(1)) {
    const std::string cell = entry[1] + " " + entry[2];
    cells.insert(cell);
    ASSERT_TRUE(lengths.contains(cell)) << cell;
    const double length = lengths.at(cell), rate = std::stod(entry[3]);
    if (entry[4] == "S3_1") {
      EXPECT_NEAR(rate, 1.728 * length, 1e-3) << cell;
      continue;
    }
    along += length;
    rates += rate;
    EXPECT_NEAR(rate / length, rates / along, 1e-5) << cell;
  }
  EXPECT_NEAR(rates, 345.6, 1e-3);
  EXPECT_EQ(cells.size(), lengths.size());
}

TEST(Modflow6Export, ZonesInsideALayerBecomeTheirPackages) {
  const auto zone = [](int code, const std::string& keys) {
    return fmt::format("section InternalBoundaryProp {{\n GridCode = \"{}\"\n ID = \"Z{}\"\n{}\n}}\n", code, code,
                       keys);
  };
  Box box("section InternalBoundary {\n Type = 1\n NoInternalBoundaries = 3\n" +
          zone(7,
               "BoundaryType = 3\nType = 1\nFixedValue = 90.0f\nHeadControlLeakage = 0\n"
               "section Conductance {\n FixedValue = 0.5f\n}\n") +
          zone(8, "BoundaryType = 6\n") + zone(9, "BoundaryType = 1\nType = 1\nFixedValue = 85.0f\n") + "}\n");
  auto& boundary = box.setup.At<CSZVerDiscrInternalBoundaryKvf>("SaturatedZone/CompLayersSZ/Layer_1/InternalBoundary");
  boundary.GridFile().Choose(FileName(box.folder.File("zones.nds2"), {}));
  const ModelReader model = box.Exported();
  // A half of 0.5 m2/s each.
  EXPECT_THAT(Box::Lines(model, "ghb"), testing::ElementsAre("1 4 3 90 21600 Z7_1", "1 4 4 90 21600 Z7_1"));
  EXPECT_THAT(Box::Lines(model, "chd"), testing::ElementsAre("1 2 3 85 Z9_1"));
  EXPECT_EQ(model.At("IDOMAIN/1", 3, 3), 0);
  EXPECT_EQ(model.At("IDOMAIN/2", 3, 3), 1);
}

TEST(Modflow6Export, UnitsLevelsAndRewettingReachTheCells) {
  // One geological layer down to 70 m, of two units; below it the same goes on.
  Box box(
      "section WettingThreshold {\n FixedValue = -0.1f\n}\n",
      "Threshold = 1\nTypeOfGeoParaDistribution = 1\n"
      "section GeoUnitsSZProperties {\n NumberOfGeoUnits = 2\n"
      "section GeoUnit_1 {\n SoilCode = 1\n HorConduc = 0.001f\n VerConduc = 0.0001f\n}\n"
      "section GeoUnit_2 {\n SoilCode = 2\n HorConduc = 0.01f\n VerConduc = 0.001f\n}\n}\n"
      "section GeoLayersSZ {\n NumberOfLayers = 1\nsection Layer_1 {\n section LowerLevel {\n FixedValue = 70.0f\n}\n"
      "section HorizontalAnisotropyRatio {\n FixedValue = 0.5f\n}\n}\n}\n");
  CData2DKvf& units = box.setup.At<CData2DKvf>("SaturatedZone/GeoLayersSZ/Layer_1/GeoUnit");
  units.Type = CData2DKvf::kGridFile;
  units.GridFile().Choose(FileName(box.folder.File("units.nds2"), {}));
  const ModelReader model = box.Exported();
  EXPECT_NEAR(model.At("K/1", 3, 5), 864, 1e-3);
  EXPECT_NEAR(model.At("K/2", 3, 5), 864, 1e-3);
  EXPECT_NEAR(model.At("K/1", 3, 4), 86.4, 1e-3);
  EXPECT_NEAR(model.At("K33/2", 3, 4), 8.64, 1e-3);
  EXPECT_EQ(model.At("K22/1", 2, 2), 0.5);
  EXPECT_TRUE(model.Options("NPF6").contains("K22OVERK"));
  EXPECT_TRUE(model.Options("NPF6").contains("REWET"));
  EXPECT_NEAR(model.At("WETDRY/1", 2, 2), -0.1, 1e-6);
}

TEST(Modflow6Export, EvapotranspirationOfAnOldFileIsThereOnceMore) {
  const auto spans = [](const std::string& section, const std::string& keys) {
    return "section " + section + " {\n YbSEKvfListItemCount = 1\nsection STRESSPERIODSPAN_1 {\n StressPeriodTo = 1\n" +
           keys + "}\n}\n";
  };
  Box box("", "",
          "section Evapotrans {\n ETLayer = 1\n" +
              spans("ETSurfaceElevation", "RelativeToGround = 1\nFixedValue = -0.5f\n") +
              spans("ETExtinctionDepth", "FixedValue = 2.0f\n") + spans("ETLayer", "FixedValue = 2.0f\n") + "}\n");
  box.setup.Root().Important(kModflowComponents)->ET = 1;
  box.setup.Root().Important(kReferenceEvapotranspiration)->Global().FIXED_VALUE = 3;
  const ModelReader model = box.Exported();
  EXPECT_NEAR(model.At("SURFACE@1/1", 3, 3), 99.5, 1e-4);
  EXPECT_EQ(model.At("DEPTH@1/1", 3, 3), 2);
  EXPECT_EQ(model.At("IEVT@1/1", 3, 3), 2);
  EXPECT_NEAR(model.At("RATE@1/1", 3, 3), 0.003, 1e-8);
}

TEST(Modflow6Export, WhatIsNoModelIsRefusedAndTheFolderStaysAsItWas) {
  struct Case {
    std::function<void(CYbSEKvfGlobalBase&)> change;
    const char* error;
  };
  const Case cases[] = {
      {[](auto& root) { root.Important(kBasicParameters)->ModelType = kEngineTervane; }, "choose a Modflow engine"},
      {[](auto& root) { root.Important(kModflowComponents)->Subsurface = 0; }, "no flow below ground"},
      {[](auto& root) { root.Important(kSaturatedZone)->TypeOfVerDiscr = CSatZoneKvf::kUniform; },
       "define them by geological layers"},
      {[](auto& root) { root.Important(kDomain)->ShapeFile().File = FileName("gone.shp", "/nowhere"); }, "gone.shp"},
      {[](auto& root) { root.Important(kStressPeriods)->SetItemCount(0, 1); }, "there are no stress periods"},
      {[](auto& root) {
         auto& periods = *root.Important(kStressPeriods);
         periods.GetItem(1)->SetEndDate(CYbDateTime(2015, 1, 1));
       },
       "dates must increase"},
      {[](auto& root) { root.Important(kSimulationPeriod)->SIMEND = CYbDateTime(2029, 1, 1); },
       "covers 7 % of stress period 4"},
      {[](auto& root) { root.Important(kWells)->Filename = FileName("gone.WEL", "/nowhere"); }, "gone.WEL"},
  };
  for (const Case& c : cases) {
    Rhone rhone;
    c.change(rhone.setup.Root());
    EXPECT_THAT(rhone.Export("model").error, HasSubstr(c.error));
    EXPECT_TRUE(std::filesystem::is_empty(rhone.folder.Path())) << c.error;
  }

  Rhone rhone;
  rhone.folder.Write("file", "");
  EXPECT_THAT(rhone.Export("file").error, HasSubstr("name a folder"));
  rhone.folder.Write("other/mfsim.nam", "of another model");
  EXPECT_THAT(rhone.Export("other").error, HasSubstr("holds a model"));
  EXPECT_EQ(test::ReadFile(rhone.folder.File("other/mfsim.nam")), "of another model");
  rhone.folder.Write("other/notes.txt", "of the user");
  EXPECT_EQ(rhone.Export("other", {.force = true}).error, "");
  EXPECT_EQ(ModelReader(rhone.folder.File("other")).layers, 3);
  EXPECT_EQ(test::ReadFile(rhone.folder.File("other/notes.txt")), "of the user");
  // Cancelled early, and while arrays are written.
  for (const int asks : {1, 5, 300, 1000}) {
    EXPECT_EQ(rhone.Export("cancelled", {}, TestLog(asks)).error, "cancelled") << asks;
    EXPECT_FALSE(std::filesystem::exists(rhone.folder.File("cancelled")));
    EXPECT_FALSE(std::filesystem::exists(rhone.folder.File("cancelled.writing")));
  }
}

}  // namespace
}  // namespace tervane::modflow6_export_test
