// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/climate_change.h"

#include <gmock/gmock.h>

#include "access/ole_date.h"
#include "platform/files.h"
#include "spatial/domain.h"
#include "surface/climate.h"
#include "tests/support/temp_folder.h"

namespace tervane::climate_change_test {
namespace {

TEST(OleDates, CountDaysForwardAndBackward) {
  const struct {
    CYbDateTime date;
    double days;
  } cases[] = {
      {{1899, 12, 30}, 0},        {{1900, 1, 1}, 2},    {{2000, 1, 1, 12}, 36526.5},
      {{1899, 12, 29, 6}, -1.25}, {{1899, 12, 29}, -1}, {{2010, 7, 14, 23, 59, 59}, 40373.99998842593},
  };
  for (const auto& row : cases) {
    EXPECT_NEAR(OleDateOf(row.date), row.days, 1e-9);
    EXPECT_EQ(FromOleDate(row.days), row.date) << row.days;
  }
  for (const double none : {std::nan(""), 1e300, -1e300}) EXPECT_FALSE(FromOleDate(none).IsValid());
}

/// Precipitation by five stations: constant, series, constant, series without a file, constant. Evapotranspiration by a
/// series for the whole model, temperature by grids.
class Climate : public testing::Test {
 protected:
  Climate() {
    CFlowModelDoc document;
    auto& rain = *document.Root().Important(kPrecipitation);
    rain.DistributionType = StationOwnerKvf::kStationBased;
    for (int number = 1; number <= 5; ++number) {
      auto made = rain.CreateStationItem();
      auto& station = dynamic_cast<C2DStationBasedDataTimeSeriesKvf&>(*made);
      station.SetSectionNumber(number);
      station.TYPE = number % 2 == 1 ? C2DStationBasedDataTimeSeriesKvf::kConstant
                                     : C2DStationBasedDataTimeSeriesKvf::kTimeVarying;
      station.FIXED_VALUE = static_cast<float>(number);
      if (number == 2) station.SeriesFile().Choose(FileName("rain.nds0", ""));
      rain.AddChild(std::move(made));
    }
    auto& evaporation = *document.Root().Important(kReferenceEvapotranspiration);
    evaporation.DistributionType = StationOwnerKvf::kUniform;
    evaporation.Global().TYPE = CGlobalKvf::kTimeVarying;
    evaporation.Global().SeriesFile().Choose(FileName("pet.nds0", ""));
    evaporation.Global().SeriesFile().Items = {3};
    auto& temperature = *document.Root().Important(kAirTemperature);
    temperature.DistributionType = StationOwnerKvf::kFullyDistributed;
    temperature.FullyDistributed().GridFile().Choose(FileName("t.nds2", ""));
    if (!document.OnSaveDocument(setup)) throw std::runtime_error(document.Error());
  }

  test::TempFolder folder;
  const std::string setup = folder.File("karup.tvd");
};

TEST_F(Climate, IsCountedReadAndChangedByNumber) {
  CClimateChange_TVN climate;
  ASSERT_EQ(climate.OpenFile(setup), 1) << climate.Error();
  EXPECT_EQ(climate.GetNoPrecValues(), 3);
  EXPECT_EQ(climate.GetNoPrecTimeSeries(), 1);
  EXPECT_EQ(climate.GetNoPrecGridSeries(), 0);
  float value = -1;
  EXPECT_EQ(climate.GetPrecValues(3, value), 1);
  EXPECT_EQ(value, 5);
  EXPECT_EQ(climate.SetPrecValues(3, 50), 1);
  for (const int none : {0, 4, -1}) EXPECT_EQ(climate.SetPrecValues(none, 1), 0);

  std::string file = "as it was";
  int item = -1;
  EXPECT_EQ(climate.GetPrecFileItem(2, file, item), 0);  // it names no file
  EXPECT_EQ(file, "as it was");
  EXPECT_EQ(climate.SetPrecFile(2, folder.File("other.nds0")), 1);
  EXPECT_EQ(climate.GetPrecFileItem(2, file, item), 1);
  EXPECT_EQ(file, folder.File("other.nds0"));
  EXPECT_EQ(climate.GetEvapFileItem(1, file, item), 1);
  EXPECT_EQ(item, 3);
  EXPECT_EQ(climate.SetEvapFile(1, folder.File("drier.nds0")), 1);
  EXPECT_EQ(climate.GetTempGridFileItem(1, file, item), 1);
  EXPECT_EQ(climate.GetTempGridFileItem(2, file, item), 0);
  EXPECT_EQ(climate.SetTempGridFile(2, "x.nds2"), 0);

  EXPECT_EQ(climate.SaveFile(folder.File("warmer.tvd")), 1);
  EXPECT_EQ(climate.Error(), "");
  const std::string saved = test::ReadFile(folder.File("warmer.tvd"));
  for (const char* part : {"FIXED_VALUE = 50f\n", "FILE_NAME = file \"drier.nds0\"\n          ITEM_COUNT = 1\n"})
    EXPECT_NE(saved.find(part), std::string::npos) << part;
}

TEST_F(Climate, ADefinitionTellsWhereValuesStandAndIsWrittenOnce) {
  const std::string path = folder.File("CCDefinition_TVN.def");
  {
    CClimateChange_TVN climate;
    ASSERT_EQ(climate.OpenFile(setup), 1);
    const CClimateChange_TVN copy = climate;
    climate.GetNoPrecValues();
    climate.GetNoPrecTimeSeries();
    climate.GetNoPrecGridSeries();
    climate.GetNoEvapValues();
    climate.GetNoEvapTimeSeries();
    climate.GetNoEvapGridSeries();
    climate.GetNoTempValues();
    climate.GetNoTempTimeSeries();
    climate.GetNoTempGridSeries();
    climate = CClimateChange_TVN();
    EXPECT_FALSE(FileExists(path));
  }
  EXPECT_EQ(test::ReadFile(path),
            "target CCCompare {\n"
            "  section Precipitation {\n"
            "    Section_ConstValue = \"Climate\", 1, \"PrecipitationRate\", 1, \"TIME_SERIES_1\", 1\n"
            "    Para = \"FIXED_VALUE\"\n"
            "    Section_ConstValue = \"Climate\", 1, \"PrecipitationRate\", 1, \"TIME_SERIES_3\", 1\n"
            "    Para = \"FIXED_VALUE\"\n"
            "    Section_ConstValue = \"Climate\", 1, \"PrecipitationRate\", 1, \"TIME_SERIES_5\", 1\n"
            "    Para = \"FIXED_VALUE\"\n"
            "    Section_TimeSeries = \"Climate\", 1, \"PrecipitationRate\", 1, \"TIME_SERIES_2\", 1, "
            "\"TIME_SERIES_FILE\", 1\n"
            "    Para = \"FILE_NAME\", \"ITEM_NUMBERS\"\n"
            "  }\n"
            "  section Evaporation {\n"
            "    Section_TimeSeries = \"Climate\", 1, \"POTEVAPTRANS\", 1, \"GLOBAL\", 1, \"TIME_SERIES_FILE\", 1\n"
            "    Para = \"FILE_NAME\", \"ITEM_NUMBERS\"\n"
            "  }\n"
            "  section Temperature {\n"
            "    Section_GridTimeSeries = \"Climate\", 1, \"AirTemperature\", 1, \"FULLY_DISTRIBUTED\", 1, "
            "\"NDS_2D_DATA_FILE\", 1\n"
            "    Para = \"FILE_NAME\", \"ITEM_NUMBERS\"\n"
            "  }\n"
            "}\n");
}

/// A program with a setting.
class Settings : public NobodyToAsk {
 public:
  explicit Settings(std::string path) : path_(std::move(path)) {}
  std::string Setting(const std::string& name) const override { return name == kDefinitionSetting ? path_ : ""; }

 private:
  std::string path_;
};

TEST_F(Climate, ThePlaceOfADefinitionIsASettingAndTheOriginHasOneOnlyOnEarth) {
  Settings host(folder.File("told.def"));
  CClimateChange_TVN climate(&host);
  ASSERT_EQ(climate.OpenFile(setup), 1);
  double longitude = 1, latitude = 1;
  EXPECT_EQ(climate.GetLongLat(longitude, latitude), 0);
  EXPECT_EQ(longitude, 0);
  auto& domain = *climate.Root().Important(kDomain);
  domain.Type = CCatchmentKvf::kShapeFile;
  domain.MapProjShp = "EPSG:32632";
  domain.x0Shp = 500000;
  domain.y0Shp = 6200000;
  EXPECT_EQ(climate.GetLongLat(longitude, latitude), 1);
  EXPECT_NEAR(longitude, 9, 1e-6);
  EXPECT_NEAR(latitude, 55.944, 1e-2);
  climate = CClimateChange_TVN();
  EXPECT_EQ(test::ReadFile(folder.File("told.def")), "target CCCompare {\n}\n");
}

}  // namespace
}  // namespace tervane::climate_change_test
