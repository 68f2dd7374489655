// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/climate_pages.h"

#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "surface/climate.h"
#include "tests/support/page_driver.h"

namespace tervane::climate_pages_test {
namespace {

class ClimatePages : public testing::Test {
 protected:
  /// Whether a control is shown, by its label or key.
  static bool IsShown(test::PageDriver& page, const char* label) { return page.Find(label).IsShown(); }

  CFlowModelDoc document;
  CPrecipitationRelatedKvf& climate = *document.Root().Important(kClimate);
};

TEST_F(ClimatePages, ASwitchThatGoesOffTakesThoseWithItThatDependOnIt) {
  constexpr const char *kTemperature = "Correct air temperature for elevation",
                       *kWet = "Use both wet and dry lapse rates for temperature correction",
                       *kSun = "Include melting due to short wave solar radiation";
  test::PageDriver page(document, "Climate");
  const auto enabled = [&] {
    std::string text;
    for (const char* label : {kTemperature, kWet, kSun}) text += page.IsEnabled(label) ? '1' : '0';
    return text;
  };
  EXPECT_EQ(enabled(), "000");
  page.Enter("Include snow melt", "1");
  EXPECT_EQ(enabled(), "101");
  page.Enter(kTemperature, "1");
  EXPECT_EQ(enabled(), "111");
  page.Enter(kWet, "1");
  page.Enter(kSun, "1");
  page.Enter(kTemperature, "0");
  EXPECT_EQ(climate.UseWetDryLapseRate, 0);
  EXPECT_EQ(enabled(), "101");
  page.Enter("Include snow melt", "0");
  EXPECT_EQ(climate.IncludeSolarRadiation, 0);
  EXPECT_EQ(enabled(), "000");
}

TEST_F(ClimatePages, TheEngineDecidesWhichGroupsAreThere) {
  auto& engine = document.Root().Important(kBasicParameters)->ModelType;
  auto& recharge = document.Root().Important(kModflowComponents)->Recharge_ModelType;
  for (const auto& [model, type, snow, rechargeOptions, ponding] : {std::tuple{0, 0, true, false, false},
                                                                    {1, 0, false, true, false},
                                                                    {1, 1, false, true, true},
                                                                    {2, 1, false, true, false},
                                                                    {3, 1, false, true, false},
                                                                    {0, 1, true, false, true}}) {
    engine = model;
    recharge = type;
    test::PageDriver page(document, "Climate");
    EXPECT_EQ(page.Text().find("Include snow melt") != std::string::npos, snow) << model << type;
    EXPECT_NE(page.Text().find("Correct precipitation for elevation"), std::string::npos);
    EXPECT_EQ(IsShown(page, "Recharge options"), rechargeOptions) << model << type;
    EXPECT_EQ(IsShown(page, "Ponding water"), ponding) << model << type;
  }
}

TEST_F(ClimatePages, ElevationsAreAskedForWhereTheyAreUsed) {
  const struct {
    const char* section;
    int CPrecipitationRelatedKvf::*correction;
    const char* warning;  ///< Empty: without elevations.
  } cases[] = {
      {"PrecipitationRate", &CPrecipitationRelatedKvf::CorrectPrecipitation,
       "Warning: Fully distributed precipitation cannot be corrected for elevation."},
      {"AirTemperature", &CPrecipitationRelatedKvf::CorrectAirTemperature,
       "Warning: Fully distributed air temperature cannot be corrected for elevation."},
      {"POTEVAPTRANS", &CPrecipitationRelatedKvf::CorrectPrecipitation, ""},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.section);
    const std::string path = std::string("Climate/") + c.section;
    auto& forcing = dynamic_cast<C2DStationBasedDataKvf&>(*FindNode(document.Root(), ParseSetupPath(path).steps));
    forcing.AddChild(forcing.CreateStationItem());
    test::PageDriver page(document, path), station(document, path + "/TIME_SERIES_1");
    if (!*c.warning) {
      EXPECT_THROW(page.Find("Elevation:"), std::runtime_error);
      EXPECT_THROW(station.Find("Elevation:"), std::runtime_error);
      continue;
    }
    climate.*c.correction = 0;
    EXPECT_FALSE(IsShown(page, "Elevation:") || IsShown(station, "Elevation:"));
    EXPECT_EQ(page.Enter("Spatial Distribution:", "2"), "");  // without a warning
    page.Enter("Spatial Distribution:", "0");
    climate.*c.correction = 1;
    EXPECT_TRUE(IsShown(page, "Elevation:") && IsShown(station, "Elevation:"));
    page.Enter("Spatial Distribution:", "1");
    EXPECT_FALSE(IsShown(page, "Elevation:"));
    page.Outside().Expect(c.warning, Host::Answer::Ok);
    page.Enter("Spatial Distribution:", "2");
    EXPECT_TRUE(page.Outside().IsDone());
    EXPECT_EQ(forcing.DistributionType, 2);  // stored all the same
  }
}

}  // namespace
}  // namespace tervane::climate_pages_test
