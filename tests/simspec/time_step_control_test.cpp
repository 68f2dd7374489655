// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/time_step_control.h"

#include <gmock/gmock.h>

#include "tests/simspec/test_setup.h"

namespace tervane {
namespace {

using test::kNoVersion;
using test::TestSetup;
using testing::IsEmpty;

constexpr const char* kTimeStep = "SimSpec/CompControlParaTimeStep";

TEST(TimeStepControl, ANewSetupHasTheDefaultsInTheOrderOfTheFile) {
  TestSetup setup;
  EXPECT_EQ(setup.WrittenKeys(kTimeStep),
            "InitialTimeStep=6f MaxAllowedOLTimeStep=0.5f MaxAllowedUZTimeStep=2f MaxAllowedSZTimeStep=24f "
            "IncrementRate=0.05f MaxPrecDepthPerTimeStep=10f MaxInfiltDepthPerTimeStep =10f PrecThresholdRate=0.1f");
  EXPECT_EQ(setup.WrittenKeys("ModelCompWQ/WQTSC"),
            "MaxSimTimeStepSZ=1e9 MaxSimTimeStepUZ=1e9 MaxSimTimeStepOL=1e9 "
            "MaxAdvectiveCourantSZ=0.8 MaxAdvectiveCourantUZ=0.8 MaxAdvectiveCourantOL=0.8 "
            "MaxDispersiveCourantSZ=0.5 MaxDispersiveCourantUZ=0.5 MaxDispersiveCourantOL=0.5 "
            "MaxTransLimitSZ=0.95 MaxTransLimitUZ=0.95 MaxTransLimitOL=0.95 MaxCourantMP=0.8");
  EXPECT_EQ(setup.WrittenKeys("ModelCompPT/PTControl"),
            "ApplyVerticalCorrection=1 IgnoreVerticalCourant=0 MaxSimTimeStepSZ=1e9 MaxAdvectiveCourantSZ=0.8 "
            "MaxDispersiveCourantSZ=0.5");
}

TEST(TimeStepControl, EachVersionReadsItsOwnKeys) {
  const char* all =
      "InitialTimeStep = 1f\nMaxAllowedTimeStep = 3f\nMaxAllowedOLTimeStep = 4f\nMaxAllowedUZTimeStep = 5f\n"
      "MaxAllowedSZTimeStep = 6f\nIncrementRate = 7f\nMaxPrecDepthPerTimeStep = 8f\n"
      "\"MaxInfiltDepthPerTimeStep \" = 9f\nPrecThresholdRate = 2f\n";
  const char* none = "";
  struct Case {
    int version;
    const char* keys;
    float ol, uz, infiltration;
  };
  for (const Case& c : {Case{kNoVersion, all, 3, 3, 8},
                        {6, all, 3, 3, 8},
                        {7, all, 3, 3, 9},
                        {9, all, 3, 3, 9},
                        {10, all, 4, 5, 9},
                        {14, all, 4, 5, 9},
                        {15, all, 4, 5, 9},
                        {kNoVersion, none, 0.5f, 2, 10},
                        {9, none, 0.5f, 2, 10},
                        {6, "MaxPrecDepthPerTimeStep = 5f", 0.5f, 2, 5},
                        {9, "MaxPrecDepthPerTimeStep = 5f", 0.5f, 2, 10},
                        {14, "MaxInfiltDepthPerTimeStep = 5f", 0.5f, 2, 5},  // Without the blank.
                        {14, "MaxAllowedTimeStep = 3f", 0.5f, 2, 10}}) {
    TestSetup setup(std::string("section SimSpec {\nsection CompControlParaTimeStep {\n") + c.keys + "\n}\n}",
                    c.version);
    const auto& node = setup.At<CCompControlParaTimeStepKvf>(kTimeStep);
    EXPECT_EQ(node.MaxAllowedOLTimeStep, c.ol) << c.version;
    EXPECT_EQ(node.MaxAllowedUZTimeStep, c.uz) << c.version;
    EXPECT_EQ(node.MaxInfiltDepthPerTimeStep, c.infiltration) << c.version;
    if (c.keys == all) {
      EXPECT_EQ(node.InitialTimeStep, 1);
      EXPECT_EQ(node.MaxAllowedSZTimeStep, 6);
      EXPECT_EQ(node.IncrementRate, 7);
      EXPECT_EQ(node.MaxPrecDepthPerTimeStep, 8);
      EXPECT_EQ(node.PrecThresholdRate, 2);
    }
    EXPECT_THAT(setup.Report().entries, IsEmpty()) << c.version;
    EXPECT_EQ(setup.Written(std::string(kTimeStep) + ":MaxAllowedTimeStep"), "");
  }
}

TEST(TimeStepControl, WhatIsWrittenReadsBack) {
  TestSetup setup;
  auto& node = setup.At<CCompControlParaTimeStepKvf>(kTimeStep);
  node.MaxInfiltDepthPerTimeStep = 3;
  setup.At<CCompControlParaTimeStepWQKvf>("ModelCompWQ/WQTSC").UZ.MaxTransLimit = 0.25;
  std::string text, error;
  ASSERT_TRUE(setup.BuildText("/setups", text, error)) << error;
  CFlowModelDoc read;
  ASSERT_TRUE(read.OpenText(text, "/setups/x.tvd")) << read.Error();
  EXPECT_TRUE(read.Report().IsEmpty());
  std::string again;
  ASSERT_TRUE(read.BuildText("/setups", again, error)) << error;
  EXPECT_EQ(again, text);
  EXPECT_EQ(setup.Written("ModelCompWQ/WQTSC:MaxTransLimitUZ"), "0.25");
}

}  // namespace
}  // namespace tervane
