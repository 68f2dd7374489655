// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/climate.h"

#include <functional>

#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/split_at_arrow.h"

namespace tervane::climate_test {
namespace {

using test::SplitAtArrow;
using test::TestSetup;

/// Water quality that the climate asks: what decays, and what the templates take.
class Decays : public CTvnKvfBase, public DecayProcessList {
 public:
  explicit Decays(CYbSEKvfBase* parent) : CTvnKvfBase("", "", parent) {}
  bool IsAnyTemperatureDependent() const override { return areWarm; }
  bool areWarm = true;
};
class Templates : public CTvnKvfBase, public ProcessTemplates {
 public:
  explicit Templates(CYbSEKvfBase* parent) : CTvnKvfBase("", "", parent) {}
  bool IsBuiltInUsed(int code) const override { return code == used; }
  bool IsTemplateUsed(int /*compartment*/) const override { return true; }
  int used = kAirTemperature;
};

/// A setup with its switches.
struct Choice {
  TestSetup setup;
  CPrecipitationRelatedKvf& climate = setup.At<CPrecipitationRelatedKvf>("Climate");
  CBasicParaKvf& basics = setup.At<CBasicParaKvf>("SimSpec");
  CModelCompKvf& own = setup.At<CModelCompKvf>("SimSpec/ModelComp");
  CModModelCompKvf& modflow = setup.At<CModModelCompKvf>("SimSpec/ModModelComp");
  CModelCompWQKvf& quality = setup.At<CModelCompWQKvf>("ModelCompWQ");
  Decays& decays = *setup.Root().NewChild<Decays>();
  Templates& templates = *setup.Root().NewChild<Templates>();

  Choice() {
    setup.Root().RegisterImportantNode(&decays, "DECAY_LIST");
    setup.Root().RegisterImportantNode(&templates, "KINETRASPEC");
  }
  void Processes(int type) {
    own.WQ = quality.IncludeProcesses = 1;
    quality.ProcessType = type;
  }
};

TEST(Climate, SwitchesAndComponentsDecideWhatTakesPart) {
  constexpr const char* nodes[] = {"prec => PrecipitationRate",
                                   "precLapse => PrecipLapseRate",
                                   "et => POTEVAPTRANS",
                                   "sun => SWSolarRadiation",
                                   "temp => AirTemperature",
                                   "lapse => TempLapseRate",
                                   "wet => WetLapseRate",
                                   "melt => SNOWMELTCONST",
                                   "snow => SNOWMELTCONST/ThreshMeltTemp",
                                   "snow => SNOWMELTCONST/DegreeDayFactor",
                                   "rad => SNOWMELTCONST/RadMeltingCoeff",
                                   "snow => SNOWMELTCONST/MinSnowStorage",
                                   "snow => SNOWMELTCONST/MaxWetSnowFrac",
                                   "snow => SNOWMELTCONST/InitialSnowStorage",
                                   "snow => SNOWMELTCONST/InitialWetSnowFrac",
                                   "net => NetRainfallFraction",
                                   "infiltration => InfiltrationFraction"};
  const struct {
    const char* what;
    std::function<void(Choice&)> choose;
    const char* used;
  } cases[] = {
      {"new", [](Choice&) {}, "prec et"},
      {"without ET", [](Choice& c) { c.own.ET = 0; }, "prec net"},
      {"without UZ", [](Choice& c) { c.own.UZ = 0; }, "prec et infiltration"},
      {"snow", [](Choice& c) { c.climate.SM = 1; }, "prec et temp melt snow snow snow snow snow snow"},
      {"snow in the sun", [](Choice& c) { c.climate.SM = c.climate.IncludeSolarRadiation = 1; },
       "prec et sun temp melt snow snow rad snow snow snow snow"},
      {"sun alone", [](Choice& c) { c.climate.IncludeSolarRadiation = 1; }, "prec et sun"},
      {"rain by height", [](Choice& c) { c.climate.CorrectPrecipitation = 1; }, "prec precLapse et"},
      {"temperature by height", [](Choice& c) { c.climate.CorrectAirTemperature = 1; }, "prec et lapse"},
      {"also wet", [](Choice& c) { c.climate.CorrectAirTemperature = c.climate.UseWetDryLapseRate = 1; },
       "prec et lapse wet"},
      {"wet alone", [](Choice& c) { c.climate.UseWetDryLapseRate = 1; }, "prec et"},
      {"warm decay", [](Choice& c) { c.Processes(0); }, "prec et temp"},
      {"cold decay", [](Choice& c) { c.Processes(0), c.decays.areWarm = false; }, "prec et"},
      {"decay with colloids", [](Choice& c) { c.Processes(2); }, "prec et"},
      {"no processes", [](Choice& c) { c.Processes(0), c.quality.IncludeProcesses = 0; }, "prec et"},
      {"no water quality", [](Choice& c) { c.Processes(0), c.own.WQ = 0; }, "prec et"},
      {"templates of temperature", [](Choice& c) { c.Processes(1); }, "prec et temp"},
      {"templates of radiation", [](Choice& c) { c.Processes(1), c.templates.used = 2030; }, "prec et sun"},
      {"templates of soil", [](Choice& c) { c.Processes(1), c.templates.used = 2090; }, "prec et"},
      {"Modflow", [](Choice& c) { c.basics.ModelType = 1, c.climate.SM = 1; }, ""},
      {"Modflow with recharge",
       [](Choice& c) {
         c.basics.ModelType = 2, c.modflow.Recharge = c.climate.SM = c.climate.CorrectPrecipitation = 1;
       },
       "prec precLapse"},
  };
  for (const auto& c : cases) {
    Choice choice;
    c.choose(choice);
    std::string used;
    for (const char* node : nodes)
      if (choice.setup.At<CYbSEKvfBase>("Climate/" + SplitAtArrow(node).second).IsDataUsedInSetup())
        used += (used.empty() ? "" : " ") + SplitAtArrow(node).first;
    EXPECT_EQ(used, c.used) << c.what;
  }
}

TEST(Climate, SnowNeedsEvapotranspiration) {
  for (const auto& [engine, et, snow, isError] :
       {std::tuple{0, 0, 1, true}, {0, 1, 1, false}, {0, 0, 0, false}, {1, 0, 1, false}}) {
    Choice choice;
    choice.basics.ModelType = engine;
    choice.modflow.Recharge = 1;
    choice.own.ET = et;
    choice.climate.SM = snow;
    EXPECT_EQ(choice.climate.ValidateData(), !isError);
    choice.climate.Validate();
    EXPECT_EQ(choice.climate.Findings().size(), isError ? 1U : 0U);
    if (isError) {
      EXPECT_EQ(choice.climate.Findings()[0].text,
                "The snowmelt model can only be included if the evapotranspiration model (ET) is included.");
    }
  }
}

TEST(Climate, ForcingsAreOneKindWithDifferences) {
  TestSetup setup;
  const struct {
    const char* section;
    const char* keys;
    const char* stationClass;
    const char* stationTitle;
    const char* stationKeys;  ///< Without elevation.
    std::vector<int> itemTypes;
  } cases[] = {
      {"PrecipitationRate",
       "DistributionType=1 Elevation=0f",
       "CPrecTimeSeriesKvf",
       "Station Data - Precipitation Rate",
       " Elevation=0f",
       {100431, 100004}},
      {"POTEVAPTRANS",
       "DistributionType=1",
       "CPotEvapTransTimeSeriesKvf",
       "Station Data - Potential EvapoTranspiration",
       "",
       {100387, 100005}},
      {"AirTemperature",
       "DistributionType=1 Elevation=0f",
       "CSnowmeltTimeSeriesKvf",
       "Station Data - Air Temperature",
       " Elevation=0f",
       {100006}},
      {"SWSolarRadiation",
       "DistributionType=1",
       "C2DStationBasedDataTimeSeriesKvf",
       "2D Station Based Data",
       "",
       {100203, 100004}},
      {"SNOWMELTCONST/DegreeDayFactor",
       "DistributionType=1",
       "C2DStationBasedDataTimeSeriesKvf",
       "2D Station Based Data",
       "",
       {100178, 100004}},
  };
  for (const auto& c : cases) {
    const std::string path = std::string("Climate/") + c.section;
    auto& forcing = setup.At<C2DStationBasedDataKvf>(path);
    forcing.AddChild(forcing.CreateStationItem());
    const CFMSEKvfGroupBase& station = *ZoneItems(forcing).front();
    EXPECT_EQ(setup.WrittenKeys(path), c.keys);
    EXPECT_EQ(ClassNameOf(station), c.stationClass);
    EXPECT_EQ(station.GetTitle(), c.stationTitle);
    EXPECT_EQ(
        setup.WrittenKeys(path + "/TIME_SERIES_1"),
        std::string("NAME=\"Undefined\" GRIDCODEID=\"Undefined\" GRIDCODE=0 FIXED_VALUE=0f TYPE=2") + c.stationKeys);
    EXPECT_EQ(forcing.Global().SeriesFile().ItemTypes, c.itemTypes);
    EXPECT_EQ(dynamic_cast<const C2DStationBasedDataTimeSeriesKvf&>(station).SeriesFile().ItemTypes, c.itemTypes);
    EXPECT_EQ(forcing.FullyDistributed().GridFile().ItemTypes, std::vector{c.itemTypes.front()});
  }
  EXPECT_EQ(setup.Written("Climate/SNOWMELTCONST/DegreeDayFactor/GLOBAL:FIXED_VALUE"), "2f");
}

TEST(Climate, ElevationsStayWhereTheCorrectionIsOff) {
  TestSetup setup("section Climate {\nsection PrecipitationRate {\nDistributionType = 3\nElevation = 800f\n}\n}");
  EXPECT_EQ(setup.Written("Climate/PrecipitationRate:Elevation"), "800f");
}

TEST(Climate, OldSetupsHoldEvapotranspirationElsewhereAndTheirSnowInTwoNumbers) {
  const std::string stations = "section STATION_BASED {\nNO_TIMESERIES = 1\n}\nsection TIME_SERIES_1 {\nNAME = ";
  const std::string twice = "section Climate {\nsection POTEVAPTRANS {\n" + stations + "\"first\"\n}\n}\n}\n" +
                            "section Evapotrans {\nETLayer = 1\nsection POTEVAPTRANS {\nDistributionType = 2\n" +
                            stations + "\"later\"\n}\n}\n}";
  TestSetup setup(twice);
  // What is read later counts, and no station is read twice.
  EXPECT_EQ(setup.Written("Climate/POTEVAPTRANS/STATION_BASED:NO_TIMESERIES"), "1");
  EXPECT_EQ(setup.Written("Climate/POTEVAPTRANS/TIME_SERIES_1:NAME"), "\"later\"");
  EXPECT_EQ(dynamic_cast<CEvapotransKvf&>(*setup.Root().GetImportantNode("Evapotrans")).ETLayer, 1);
  // A new setup has no such section either.
  EXPECT_EQ(test::SavedText(CFlowModelDoc()).find("Evapotrans {"), std::string::npos);

  const std::string snow = "section SNOWMELTCONST {\nThreshold = 1.5f\nDegreeDayFactor = 3f\nThermalMelt = 1\n}\n}";
  const struct {
    int version;
    const char *section, *threshold, *factor;
  } cases[] = {{-1, "Precipitation", "1.5f", "3f"}, {10, "Precipitation", "1.5f", "3f"}, {11, "Climate", "0f", "2f"}};
  for (const auto& c : cases) {
    TestSetup old(std::string("section ") + c.section + " {\n" + snow, c.version);
    EXPECT_EQ(old.Written("Climate/SNOWMELTCONST/ThreshMeltTemp:FixedValue"), c.threshold);
    EXPECT_EQ(old.Written("Climate/SNOWMELTCONST/ThreshMeltTemp:Type"), "0");
    EXPECT_EQ(old.Written("Climate/SNOWMELTCONST/DegreeDayFactor/GLOBAL:FIXED_VALUE"), c.factor);
    EXPECT_EQ(old.WrittenKeys("Climate/SNOWMELTCONST"), "ThermalMelt=1 MeltCoefficient=0.5f SublimationRate=0f");
  }
}

}  // namespace
}  // namespace tervane::climate_test
