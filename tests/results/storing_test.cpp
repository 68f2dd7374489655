// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/storing.h"

#include <functional>
#include <limits>

#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "surface/climate.h"
#include "tests/simspec/test_setup.h"

namespace tervane::storing_test {
namespace {

using test::TestSetup;

/// A setup with what decides.
struct Choice {
  TestSetup setup;
  CStoringResultsKvf& storing = setup.At<CStoringResultsKvf>("StoringOfResults");
  CModelCompKvf& own = setup.At<CModelCompKvf>("SimSpec/ModelComp");
  CModelCompWQKvf& quality = setup.At<CModelCompWQKvf>("ModelCompWQ");

  std::vector<std::string> Errors() {
    storing.Validate();
    std::vector<std::string> errors;
    for (const Finding& finding : storing.Findings())
      if (finding.severity == Severity::Error) errors.push_back(finding.text);
    return errors;
  }
};

TEST(Storing, IntervalsAreComparedInSinglePrecision) {
  const float huge = std::numeric_limits<float>::max(), nan = std::numeric_limits<float>::quiet_NaN();
  struct Case {
    float interval, of;
    bool isMultiple;
  };
  const Case cases[] = {{12, 6, true},         {6, 12, false},  {13, 6, false},     {12.0006f, 6, true},
                        {12.01f, 6, false},    {0, 6, false},   {6, 0, false},      {0, 0, false},
                        {-12, 6, true},        {12, -6, true},  {0.3f, 0.1f, true}, {24, 0.0007f, true},
                        {huge, 1e-30f, false}, {huge, 1, true}, {nan, 6, false},    {6, nan, false}};
  for (const Case& one : cases) EXPECT_EQ(IsMultiple(one.interval, one.of), one.isMultiple) << one.interval;
  EXPECT_TRUE(IsEqual(24, 24.001f));
  EXPECT_FALSE(IsEqual(24, 24.01f));
  EXPECT_FALSE(IsEqual(0, 0));
  EXPECT_FALSE(IsEqual(-24, 24));
}

constexpr const char* kPrec =
    "The storing interval for Prec must be an integer multiple of the OL interval (e.g. if the OL interval is 6 hrs, "
    "then the Prec interval must be 6, 12, 18, etc.)";
constexpr const char* kHeads =
    "The storing interval for SZ Heads must be an integer multiple of the Prec interval (e.g. if the Prec interval is "
    "12 hrs, then the SZ Heads interval must be 12, 24, 36, etc.)";
constexpr const char* kFluxes =
    "The storing interval for SZ Fluxes must be an integer multiple of the SZ Heads interval (e.g. if the SZ Heads "
    "interval is 24 hrs, then the Prec interval must be 24, 48, 72, etc.)";
constexpr const char* kSoil =
    "The storing interval for WQ UZ must be an integer multiple of the WQ OL interval (e.g. if the WQ OL interval is "
    "24 hrs, then the WQ UZ interval must be 24, 48, 72, etc.)";
constexpr const char* kGround =
    "The storing interval for WQ SZ must be an integer multiple of the WQ UZ interval (e.g. if the WQ UZ interval is "
    "24 hrs, then the WQ SZ interval must be 24, 48, 72, etc.)";
constexpr const char* kEqual =
    "When Water quality is enabled, the storing interval for SZ Heads must equal the storing interval for SZ Fluxes";

TEST(Storing, SixRulesHoldTheIntervalsTogether) {
  struct Case {
    const char* what;
    std::function<void(Choice&)> set;
    std::vector<std::string> errors;
  };
  const auto intervals = [](float overland, float prec, float heads, float fluxes) {
    return [=](Choice& c) {
      c.storing.WM_OverlandFrequency = overland;
      c.storing.WM_PrecFrequency = prec;
      c.storing.WM_FHeadsFrequency = heads;
      c.storing.WM_FluxesFrequency = fluxes;
    };
  };
  const auto allQuality = [](Choice& c) {
    c.own.WQ = c.quality.OL = c.quality.UZ = c.quality.SZ = 1;
    c.storing.WQ_OverlandFrequency = 5;
    c.storing.WQ_UnsaturatedZoneFrequency = 12;
    c.storing.WQ_SaturatedZoneFrequency = 13;
    c.storing.WM_FluxesFrequency = 48;
  };
  const Case cases[] = {
      {"a new setup", [](Choice&) {}, {}},
      {"all fit", intervals(6, 12, 24, 24), {}},
      {"precipitation fits neither", intervals(6, 13, 24, 24), {kPrec, kHeads}},
      {"fluxes", intervals(6, 12, 24, 36), {kFluxes}},
      {"zero", intervals(0, 12, 24, 24), {kPrec}},
      {"without overland flow", [&](Choice& c) { intervals(5, 12, 24, 24)(c), c.own.OL = 0; }, {}},
      {"without the saturated zone", [&](Choice& c) { intervals(6, 12, 25, 26)(c), c.own.SZ = 0; }, {}},
      {"water quality", allQuality, {kSoil, kGround, kEqual}},
      {"water quality off", [&](Choice& c) { allQuality(c), c.own.WQ = 0; }, {}},
      {"no groundwater ends early", [&](Choice& c) { allQuality(c), c.own.SZ = 0; }, {kSoil}},
      {"no soil", [&](Choice& c) { allQuality(c), c.own.UZ = 0; }, {kEqual}},
      {"no quality in the soil", [&](Choice& c) { allQuality(c), c.quality.UZ = 0; }, {kEqual}},
      {"no quality in the ground", [&](Choice& c) { allQuality(c), c.quality.SZ = 0; }, {kSoil}},
      {"another engine",
       [&](Choice& c) {
         allQuality(c);
         c.setup.At<CBasicParaKvf>("SimSpec").ModelType = kEngineModflow2000;
       },
       {}},
  };
  for (const Case& one : cases) {
    Choice choice;
    one.set(choice);
    EXPECT_EQ(choice.Errors(), one.errors) << one.what;
  }
}

TEST(Storing, EachRuleOffersTheNextInterval) {
  Choice choice;
  choice.storing.WM_OverlandFrequency = 5;
  choice.storing.WM_PrecFrequency = 13;
  choice.storing.WM_FHeadsFrequency = 4;
  // One mend after the other, until nothing is left: the next heads follow the new precipitation.
  std::vector<std::string> done;
  while (!choice.Errors().empty() && done.size() < 9) {
    const std::vector<Mend> mends = choice.storing.MendsOf(choice.storing.Findings().front());
    ASSERT_EQ(mends.size(), 1u);
    choice.storing.TakeMend(mends.front());
    done.push_back(mends.front().text);
  }
  EXPECT_THAT(done, testing::ElementsAre("Change the storing interval for Prec to 15 hours",
                                         "Change the storing interval for SZ Heads to 15 hours",
                                         "Change the storing interval for SZ Fluxes to 30 hours"));
  choice.own.WQ = choice.quality.SZ = 1;
  choice.Errors();
  ASSERT_EQ(choice.storing.Findings().front().text, kEqual);
  choice.storing.TakeMend(choice.storing.MendsOf(choice.storing.Findings().front()).front());
  EXPECT_EQ(choice.storing.WM_FluxesFrequency, 15);

  choice.storing.WM_OverlandFrequency = 0;
  choice.Errors();
  EXPECT_TRUE(choice.storing.MendsOf(choice.storing.Findings().front()).empty()) << "there is no multiple of 0";
}

TEST(Storing, TheLabelNamesWhatTheIntervalServes) {
  Choice choice;
  EXPECT_EQ(choice.storing.GetWaterMovementLabel(), "Prec, ET, UZ");
  choice.setup.At<CPrecipitationRelatedKvf>("Climate").SM = 1;
  choice.own.ET = 0;
  EXPECT_EQ(choice.storing.GetWaterMovementLabel(), "Prec, SM, UZ");
  choice.setup.At<CPrecipitationRelatedKvf>("Climate").SM = choice.own.UZ = 0;
  EXPECT_EQ(choice.storing.GetWaterMovementLabel(), "Prec");
  choice.setup.At<CBasicParaKvf>("SimSpec").ModelType = kEngineModflow96;
  EXPECT_EQ(choice.storing.GetWaterMovementLabel(), "");
}

}  // namespace
}  // namespace tervane::storing_test
