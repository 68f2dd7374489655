// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "access/climate_scenario.h"

#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "document/flow_model_document.h"
#include "surface/climate.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"

namespace tervane::climate_scenario_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::SizeIs;

class Scenario : public testing::Test {
 protected:
  /// A series with a value at the end of January, of February and of March.
  std::string Series(const char* name, int itemType, int unit, ValueType type, std::vector<float> values) {
    NewDataFile content;
    content.dimensions = 0;
    content.items = {{"other", itemType, unit, type}, {"meant", itemType, unit, type}};
    content.begin = CYbDateTime(2001, 1, 1);
    DataFileWriter writer;
    test::Require(writer.Create(folder.File(name), content));
    int month = 1;
    for (const float value : values) {
      test::Require(writer.AddStep({2001, ++month, 1}));
      test::Require(writer.Put(1, std::vector<float>{-1}));
      test::Require(writer.Put(2, std::vector<float>{value}));
    }
    test::Require(writer.Finish().error);
    return folder.File(name);
  }
  static std::vector<float> ValuesOf(const std::string& path) {
    DataFile file;
    test::Require(file.Open(path));
    std::vector<float> values(file.Time().steps);
    test::Require(file.Read({1, 0, values.size(), {}}, values));
    return values;
  }

  test::TempFolder folder;
};

TEST_F(Scenario, MeansBelongToTheMonthOfTheirIntervalAndValuesToThatOfTheirDate) {
  ClimateRule rule;
  rule.factor[0] = 2;
  rule.factor[1] = 3;
  const int rain = 100431, unit = BaseUnit(*FindItemType(rain)).key;
  const struct {
    ValueType type;
    std::vector<float> expected;
  } cases[] = {{ValueType::MeanStep, {20, kDeleteValue, 30}}, {ValueType::Instantaneous, {30, kDeleteValue, 30}}};
  for (const auto& row : cases) {
    const std::string from = Series("rain.nds0", rain, unit, row.type, {10, kDeleteValue, 30});
    ASSERT_TRUE(WriteChangedClimate(from, 2, rule, rain, folder.File("new.nds0")).Ok());
    EXPECT_EQ(ValuesOf(folder.File("new.nds0")), row.expected);
  }
  const std::string sums = Series("sums.nds0", rain, unit, ValueType::Accumulated, {10, 20, 30});
  EXPECT_THAT(WriteChangedClimate(sums, 2, rule, rain, folder.File("no.nds0")).error, HasSubstr("month by month"));
  EXPECT_FALSE(FileExists(folder.File("no.nds0")));
  EXPECT_THAT(WriteChangedClimate(sums, 3, rule, rain, folder.File("no.nds0")).error, HasSubstr("there is no item 3"));
}

TEST_F(Scenario, ChangesConstantsInPlaceAndCopiesOfFiles) {
  CFlowModelDoc document;
  const CGlobal& root = document.Global();
  auto& rain = *root.Important(kPrecipitation);
  rain.DistributionType = StationOwnerKvf::kUniform;
  rain.Global().FIXED_VALUE = 4;
  auto& temperature = *root.Important(kAirTemperature);
  temperature.DistributionType = StationOwnerKvf::kUniform;
  temperature.Global().TYPE = CGlobalKvf::kTimeVarying;
  const int degrees = temperature.GetItemType();
  const std::string file =
      Series("t.nds0", degrees, BaseUnit(*FindItemType(degrees)).key, ValueType::Instantaneous, {1, 2, 3});
  temperature.Global().SeriesFile().Choose(FileName(file, ""));
  temperature.Global().SeriesFile().Items = {2};

  ClimateScenario scenario;
  scenario[0].factor.fill(1.5);
  scenario[2].shift.fill(2);
  std::vector<std::string> changes;
  EXPECT_EQ(ApplyClimateScenario(root, scenario, folder.File("warm"), changes), "");
  EXPECT_EQ(rain.Global().FIXED_VALUE, 6);
  EXPECT_EQ(temperature.Global().SeriesFile().File.Absolute(), folder.File("warm/t.nds0"));
  EXPECT_EQ(temperature.Global().SeriesFile().SelectedItem(), 1);
  EXPECT_THAT(ValuesOf(folder.File("warm/t.nds0")), ElementsAre(3, 4, 5));
  EXPECT_THAT(ValuesOf(file), ElementsAre(-1, -1, -1));
  EXPECT_THAT(changes, SizeIs(2));

  // A second one beside the first; months need a series.
  EXPECT_EQ(ApplyClimateScenario(root, scenario, folder.File("warm"), changes), "");
  EXPECT_THAT(ValuesOf(folder.File("warm/t_2.nds0")), ElementsAre(5, 6, 7));
  // A file that cannot be read leaves nothing of those before it.
  auto& evaporation = *root.Important(kReferenceEvapotranspiration);
  evaporation.DistributionType = StationOwnerKvf::kUniform;
  evaporation.Global().TYPE = CGlobalKvf::kTimeVarying;
  evaporation.Global().SeriesFile().Choose(FileName(file, ""));
  temperature.Global().SeriesFile().Choose(FileName(folder.File("gone.nds0"), ""));
  scenario[1].factor.fill(2);
  EXPECT_THAT(ApplyClimateScenario(root, scenario, folder.File("half"), changes), HasSubstr("gone.nds0"));
  EXPECT_FALSE(FileExists(folder.File("half/t.nds0")));
  scenario[0].factor[3] = 9;
  EXPECT_THAT(ApplyClimateScenario(root, scenario, folder.File("warm"), changes), HasSubstr("a constant cannot"));
}

}  // namespace
}  // namespace tervane::climate_scenario_test
