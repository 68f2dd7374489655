// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/irrigation.h"

#include <functional>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "spatial/coverage.h"
#include "surface/land_use.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/split_at_arrow.h"

namespace tervane::irrigation_test {
namespace {

using test::SplitAtArrow;
using test::TestSetup;
using Source = CIrrCommandAreasPropSourceItemKvf;
using Demand = CIrrDemandPropKvf;

/// A setup with one command area of one source, and one demand.
std::string OneOfEach(const std::string& source = "", const std::string& demand = "") {
  return fmt::format(
      "section LandUse {{\nIrrigation = 1\nPriorities = 2\nsection CommandAreas {{\nNO_AREAS = 1\nsection CommandArea "
      "{{\nsection Sources {{\nNumberOfSources = 1\nsection Source1 {{\n{}\n}}\n}}\n}}\n}}\nsection Demands {{\n"
      "NO_DEMANDS = 1\nsection Demand {{\n{}\n}}\n}}\n}}",
      source, demand);
}

struct Irrigated {
  explicit Irrigated(const std::string& sourceKeys = "", const std::string& demandKeys = "", int version = 14)
      : setup(OneOfEach(sourceKeys, demandKeys), version) {}
  TestSetup setup;
  CLandUseKvf& landUse = setup.At<CLandUseKvf>("LandUse");
  CModelCompKvf& own = setup.At<CModelCompKvf>("SimSpec/ModelComp");
  CIrrCommandAreasPropKvf& area = setup.At<CIrrCommandAreasPropKvf>("LandUse/CommandAreas/CommandArea");
  Source& source = *area.Sources().GetItem(1);
  Demand& demand = setup.At<Demand>("LandUse/Demands/Demand");
};

constexpr const char* kSourcePath = "LandUse/CommandAreas/CommandArea/Sources/Source1";

TEST(Irrigation, TakesPartWhereItIsWantedAndPossible) {
  constexpr const char* nodes[] = {"areas => CommandAreas",
                                   "sheet => CommandAreas/CommandArea/INDIRECT_APPLICATION_AREA", "demands => Demands",
                                   "priorities => Priorities"};
  const struct {
    const char* what;
    std::function<void(Irrigated&)> choose;
    const char* used;
  } cases[] = {
      {"all", [](Irrigated&) {}, "areas demands priorities"},
      {"not wanted", [](Irrigated& c) { c.landUse.Irrigation = 0; }, ""},
      {"without priorities", [](Irrigated& c) { c.landUse.Priorities = 0; }, "areas demands"},
      {"by volume", [](Irrigated& c) { c.landUse.Priorities = 2; }, "areas demands priorities"},
      {"without ET", [](Irrigated& c) { c.own.ET = 0; }, ""},
      {"without UZ", [](Irrigated& c) { c.own.UZ = 0; }, ""},
      {"Modflow", [](Irrigated& c) { c.setup.At<CBasicParaKvf>("SimSpec").ModelType = 1; }, ""},
      {"as a sheet", [](Irrigated& c) { c.source.SetShownApplication(Source::kSheet); },
       "areas sheet demands priorities"},
      {"another source as a sheet",
       [](Irrigated& c) {
         c.area.Sources().AddItem()->SetShownApplication(Source::kSheet);
         c.source.SetShownApplication(Source::kDrip);
       },
       "areas sheet demands priorities"},
      {"no more as a sheet",
       [](Irrigated& c) {
         c.source.SetShownApplication(Source::kSheet);
         c.source.SetShownApplication(Source::kDrip);
       },
       "areas demands priorities"},
  };
  for (const auto& c : cases) {
    Irrigated irrigated;
    c.choose(irrigated);
    std::string used;
    for (const char* node : nodes)
      if (irrigated.setup.At<CYbSEKvfBase>("LandUse/" + SplitAtArrow(node).second).IsDataUsedInSetup())
        used += (used.empty() ? "" : " ") + SplitAtArrow(node).first;
    EXPECT_EQ(used, c.used) << c.what;
  }
}

TEST(Irrigation, OneChoiceShowsTheTwoKeysOfTheApplication) {
  const struct {
    int water, direct, shown, waterAfter, directAfter;
  } cases[] = {{1, 1, 1, 1, 1}, {2, 1, 2, 2, 1}, {1, 2, 3, 2, 2}, {2, 2, 3, 2, 2}, {2, 7, 3, 2, 2}};
  for (const auto& c : cases) {
    Source source(nullptr);
    source.WaterApplication = c.water;
    source.DirectApplication = c.direct;
    EXPECT_EQ(source.ShownApplication(), c.shown);
    source.SetShownApplication(c.shown);
    EXPECT_EQ(source.WaterApplication, c.waterAfter);
    EXPECT_EQ(source.DirectApplication, c.directAfter);
  }
}

TEST(Irrigation, ASourceWritesAllKindsAndReadsThoseOfItsVersion) {
  const std::string kNew =
      "SourceTypeCode = 2\nUpstreamChainageRS = 10f\nDownstreamChainageRS = 20f\n"
      "UseThresholdDischargeRateRS = 0\nThresholdDischargeRateStopRS = 3f\n"
      "ThresholdDischargeRateRestartRS = 4f\nThresholdStageRestartRS = 5f\n"
      "IrrigationLicenseIncluded = 1\nRS_6 = 77f\nTYPE = 9\nsection TIME_SERIES_FILE {\n"
      "FILE_NAME = file \"licence.nds0\"\n}";
  EXPECT_EQ(Irrigated(kNew).setup.WrittenKeys(kSourcePath),
            "SourceTypeCode=2 WaterApplication=1 DirectApplication=1 RiverNameRS=\"\" UpstreamChainageRS=10f "
            "DownstreamChainageRS=20f CapacityRS=0f UseThresholdDischargeRateRS=0 ThresholdDischargeRateStopRS=3f "
            "ThresholdDischargeRateRestartRS=4f UseThresholdStageRS=0 ThresholdStageStopRS=0f "
            "ThresholdStageRestartRS=5f WellXposSIWS=0f WellYposSIWS=0f ScreenTopDepthSIWS=0f CapacitySIWS=0f "
            "ThresholdDepthSIWS=0f ScreenBottomDepthSIWS=0f ScreenTopDepthSWS=0f ThresholdDepthSWS=0f CapacitySWS=0f "
            "ScreenBottomDepthSWS=0f CapacityES=0f RS_6=4f RS_7=5f IrrigationLicenseIncluded=1 TYPE=2");
  const std::string kOld = "RiverChainageRS = 7f\nThresholdDischargeRateRS = 2f\n" + kNew;
  const struct {
    int version;
    const char *upstream, *downstream, *used, *stop, *restart, *stage, *license, *file;
  } cases[] = {
      {-1, "7f", "7f", "1", "2f", "2.02f", "0f", "0", "file \"\""},
      {6, "7f", "7f", "1", "2f", "2.02f", "0f", "0", "file \"\""},
      {7, "7f", "7f", "0", "3f", "4f", "5f", "0", "file \"\""},
      {8, "7f", "7f", "0", "3f", "4f", "5f", "0", "file \"\""},
      {9, "7f", "7f", "0", "3f", "4f", "5f", "1", "file \"licence.nds0\""},
      {14, "7f", "7f", "0", "3f", "4f", "5f", "1", "file \"licence.nds0\""},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.version);
    const Irrigated irrigated(kOld, "", c.version);
    EXPECT_TRUE(irrigated.setup.Report().IsEmpty());
    const auto written = [&](const char* key) { return irrigated.setup.Written(std::string(kSourcePath) + ":" + key); };
    EXPECT_EQ(written("UpstreamChainageRS"), c.upstream);
    EXPECT_EQ(written("DownstreamChainageRS"), c.downstream);
    EXPECT_EQ(written("UseThresholdDischargeRateRS"), c.used);
    EXPECT_EQ(written("ThresholdDischargeRateStopRS"), c.stop);
    EXPECT_EQ(written("ThresholdDischargeRateRestartRS"), c.restart);
    EXPECT_EQ(written("ThresholdStageRestartRS"), c.stage);
    EXPECT_EQ(written("IrrigationLicenseIncluded"), c.license);
    EXPECT_EQ(written("RiverChainageRS"), "");
    EXPECT_EQ(irrigated.setup.Written(std::string(kSourcePath) + "/TIME_SERIES_FILE:FILE_NAME"), c.file);
  }
}

TEST(Irrigation, AnAreaBeginsWithOneSourceAndHasAsManyAsItsSetupCounts) {
  CIrrCommandAreasKvf areas(nullptr);
  const std::shared_ptr<CFMSEKvfGroupBase> item = areas.CreateStationItem();
  auto& fresh = dynamic_cast<CIrrCommandAreasPropKvf&>(*item);
  ASSERT_EQ(fresh.Sources().GetItemCount(), 1);
  EXPECT_EQ(fresh.Sources().GetItem(1)->SourceTypeCode, Source::kRiver);
  EXPECT_EQ(fresh.Sources().GetItem(1)->ShownApplication(), Source::kSprinkler);

  for (const auto& [sources, count, written] :
       {std::tuple{"", 1, "NumberOfSources=1"},  // without the section it is as it begins
        {"section Sources {\n}", 0, "NumberOfSources=0"},
        {"section Sources {\nNumberOfSources = 0\n}", 0, "NumberOfSources=0"},
        {"section Sources {\nNumberOfSources = -4\n}", 0, "NumberOfSources=0"},
        {"section Sources {\nNumberOfSources = 3\nsection Source2 {\nSourceTypeCode = 4\n}\n}", 3,
         "NumberOfSources=3"}}) {
    TestSetup setup(
        fmt::format("section LandUse {{\nsection CommandAreas {{\nNO_AREAS = 1\nsection CommandArea {{\n"
                    "AreaName = \"Farms\"\nAreaCodeID = \"12\"\n{}\n}}\n}}\n}}",
                    sources));
    const std::string path = "LandUse/CommandAreas/CommandArea";
    EXPECT_EQ(setup.At<CIrrCommandAreasPropKvf>(path).Sources().GetItemCount(), count);
    EXPECT_EQ(setup.WrittenKeys(path + "/Sources"), written);
    EXPECT_EQ(setup.WrittenKeys(path), "AreaName=\"Farms\" AreaCodeID=\"12\" AreaCode=12");
    EXPECT_EQ(setup.At<CIrrCommandAreasPropKvf>(path).GetAbbreviatedTitle(), "Farms");
  }
}

TEST(Irrigation, ADemandAsksForTheFilesOfItsKindAlone) {
  const std::string constants =
      "DemandMoistureDeficitStartConst = 0.1f\nDemandMoistureDeficitEndConst = 0.2f\n"
      "DemandConstValue = 0.3f\nCropStressFactorConstValue = 0.4f\n"
      "PondingDepthConstValue = 0.5f";
  for (const auto& [kind, temporal, used, first, end] : {std::tuple{1, 1, "", 1, 0},
                                                         {1, 2, "1", 1, 0},
                                                         {2, 2, "23", 2, 3},
                                                         {3, 2, "4", 4, 0},
                                                         {4, 2, "5", 5, 0},
                                                         {2, 1, "", 2, 3},
                                                         {2, 3, "", 2, 3},
                                                         {5, 2, "", 0, 0}}) {
    SCOPED_TRACE(fmt::format("{} {}", kind, temporal));
    Irrigated irrigated("", constants);
    irrigated.demand.DemandType = kind;
    irrigated.demand.TYPE = temporal;
    irrigated.demand.Validate();
    std::string asked;
    for (const DemandValue& value : Demand::Values())
      if (!irrigated.demand.FileOf(value).Findings().empty()) asked += value.fileSection[17];
    EXPECT_EQ(asked, used);
    const auto fileNumber = [](const CFMData0DFile* file) { return file ? file->GetSectionName()[17] - '0' : 0; };
    EXPECT_EQ(fileNumber(irrigated.demand.GetDemandFile()), first);
    EXPECT_EQ(fileNumber(irrigated.demand.GetDemandEndFile()), end);
    EXPECT_EQ(irrigated.setup.WrittenKeys("LandUse/Demands/Demand"),
              fmt::format("DemandName=\"\" DemandCodeID=\"\" DemandCode=0 DemandType={} "
                          "DemandReferenceMoistureContent=1 TYPE={} DemandMoistureDeficitStartConst=0.1f "
                          "DemandMoistureDeficitEndConst=0.2f DemandConstValue=0.3f CropStressFactorConstValue=0.4f "
                          "PondingDepthConstValue=0.5f",
                          kind, temporal));
  }
}

TEST(Irrigation, LicensesAndDemandsAreForcings) {
  Irrigated irrigated("", "DemandName = \"Orchards\"\nDemandMoistureDeficitStartConst = 0.5f");
  const auto told = [&] {
    irrigated.setup.Root().Validate();
    std::string text;
    for (const CoverageForcing& asked : AskCoverage(irrigated.setup.Root()).forcings)
      if (asked.path.starts_with("LandUse/") && asked.path != "LandUse/Vegetation") {
        text += asked.forcing.title + ":";
        for (const ForcingSeries& series : asked.forcing.series)
          text += fmt::format(" [{}] {}", series.name,
                              series.constant ? fmt::format("{}", static_cast<double>(*series.constant)) : series.path);
        text += "\n";
      }
    return text;
  };
  EXPECT_EQ(told(), "Irrigation: Demand: [Orchards] 0\n");
  irrigated.demand.DemandType = Demand::kMaxAllowedDeficit;
  EXPECT_EQ(told(),
            "Irrigation: Moisture Deficit Start: [Orchards] 0.5\nIrrigation: Moisture Deficit End: [Orchards] 0\n");
  irrigated.demand.DemandType = Demand::kPondingDepth;
  irrigated.demand.TYPE = Demand::kSeries;
  irrigated.demand.GetDemandFile()->Choose(FileName("ponds.nds0", "/setups"));
  EXPECT_EQ(told(), "Irrigation: Ponding Depth: [Orchards] /setups/ponds.nds0\n");
  irrigated.demand.TYPE = Demand::kVegetationProperties;
  EXPECT_EQ(told(), "");
  irrigated.area.SetStationName("Plain");
  Source& second = *irrigated.area.Sources().AddItem();
  second.IrrigationLicenseIncluded = 1;
  second.LicenseFile().Choose(FileName("cap.nds0", "/setups"));
  EXPECT_EQ(told(), "License Limited Irrigation: [Plain, source 2] /setups/cap.nds0\n");
  irrigated.landUse.Irrigation = 0;
  EXPECT_EQ(told(), "");
}

TEST(Irrigation, PrioritiesKeepPolygonsThatAFileHoldsAndMakeNoZones) {
  TestSetup setup("section LandUse {\nIrrigation = 1\nPriorities = 2\nsection Priorities {\nType = 2\n}\n}");
  EXPECT_EQ(setup.WrittenKeys("LandUse/Priorities"), "DistributionType=1 Type=2 ShapeAxisUnit=1000");
  auto& priorities = setup.At<CIrrPrioritiesKvf>("LandUse/Priorities");
  EXPECT_EQ(priorities.SyncZones(), kNothing);
  EXPECT_EQ(setup.WrittenKeys("LandUse/Demands"),
            "DistributionType=1 Type=1 ShapeAxisUnit=1000 ShapeGapFillName=\"\" NO_DEMANDS=0");
  EXPECT_EQ(setup.WrittenKeys("LandUse/CommandAreas"), "DistributionType=1 Type=1 ShapeAxisUnit=1000 NO_AREAS=0");
  // The list lacks polygons, and so does what it warns of.
  priorities.Validate();
  EXPECT_EQ(priorities.GridFile().Findings().size(), 0U);
  EXPECT_EQ(priorities.ShapeFile().Findings().size(), 1U);
}

}  // namespace
}  // namespace tervane::irrigation_test
