// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/grid_series.h"

#include <functional>

#include <gmock/gmock.h>

#include "document/edit_session.h"
#include "results/storing.h"
#include "simspec/control_parameters.h"
#include "simspec/model_components.h"
#include "subsurface/saturated_zone.h"
#include "subsurface/unsaturated_zone.h"
#include "surface/climate.h"
#include "surface/land_use.h"
#include "surface/overland.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::grid_series_test {
namespace {

using test::TempFolder;
using test::TestSetup;
using testing::ElementsAre;

struct Choice {
  TestSetup setup;
  CStoringResultsKvf& storing = setup.At<CStoringResultsKvf>("StoringOfResults");
  COutputGridSeriesListKvf& list = storing.GridSeries();
  CModelCompKvf& own = setup.At<CModelCompKvf>("SimSpec/ModelComp");
  CModelCompWQKvf& quality = setup.At<CModelCompWQKvf>("ModelCompWQ");
  COverlandKvf& overland = setup.At<COverlandKvf>("Overland");
  CUnsatzoneKvf& soil = setup.At<CUnsatzoneKvf>("Unsatzone");
  CSatZoneKvf& ground = setup.At<CSatZoneKvf>("SaturatedZone");

  const char* RequiredFor(int code) {
    static std::string text;
    for (const GridSeriesRow& row : list.Rows())
      if (row.type->newDataType == code) return (text = row.requiredFor).c_str();
    return "no row";
  }
};

TEST(GridSeries, TheSetupHasItsFeatures) {
  struct Case {
    const char* what;
    std::function<void(Choice&)> set;
    const char* features;
  };
  const auto nothing = [](Choice& c) { c.own.ET = c.own.OL = c.own.SZ = c.own.UZ = c.own.River = 0; };
  const Case cases[] = {
      {"nothing", nothing, "WM simulation"},
      {"climate and crops",
       [&](Choice& c) {
         nothing(c);
         c.own.ET = 1;
         c.setup.At<CPrecipitationRelatedKvf>("Climate").SM = 1;
         c.setup.At<CLandUseKvf>("LandUse").Irrigation = 1;
       },
       "SM+ET+Irrigation+WM simulation"},
      {"overland flow", [&](Choice& c) { nothing(c), c.own.OL = 1; }, "OC+OLPipraCoup+WM simulation+OpenMI"},
      {"its drainage and cells",
       [&](Choice& c) {
         nothing(c);
         c.own.OL = c.overland.Drainage = 1;
         auto& control = c.setup.At<CCompControlParaOLKvf>("SimSpec/CompControlParaOL");
         control.SolverOption = control.Multicell = 1;
       },
       "OC+OLPipraCoup+WM simulation+OpenMI+Multi-Cell+OL-Drainage+DrainageRoute"},
      {"simple overland flow",
       [&](Choice& c) {
         nothing(c);
         c.own.OL = c.own.OL_ModelType = c.overland.Drainage = 1;
       },
       "SimpleOL+WM simulation"},
      {"rivers", [&](Choice& c) { nothing(c), c.own.River = 1; }, "River+Inundation+WM simulation"},
      {"soil with bypass",
       [&](Choice& c) {
         nothing(c);
         c.own.UZ = c.soil.Bypass = 1;
         c.own.UZ_ModelType = kGravityFlow;
       },
       "UZ+Bypass+WM simulation+OpenMI"},
      {"two layers, with macropores",
       [&](Choice& c) {
         nothing(c);
         c.own.UZ = 1;
         c.own.UZ_ModelType = c.soil.Bypass = 2;
       },
       "Macropores+2-Layer UZ+WM simulation"},
      {"ground with drains, no soil",
       [&](Choice& c) {
         nothing(c);
         c.own.SZ = c.ground.Drainage = 1;
       },
       "SZ+SZ-Drainage+Extraction+NegPrec+GHB+SZPipraCoup+WM simulation+OpenMI+DrainageRoute"},
      {"reservoirs, no soil",
       [&](Choice& c) {
         nothing(c);
         c.own.SZ = c.own.SZ_ModelType = c.ground.Drainage = 1;
       },
       "LR+NegPrec+WM simulation"},
      {"reservoirs with soil",
       [&](Choice& c) {
         nothing(c);
         c.own.SZ = c.own.SZ_ModelType = c.own.UZ = 1;
       },
       "2-Layer UZ+LR+WM simulation"},
  };
  for (const Case& one : cases) {
    Choice choice;
    one.set(choice);
    const RequirementMask mask = choice.list.BuildResultMask(false);
    EXPECT_EQ(mask.Text(), one.features) << one.what;
    EXPECT_EQ(choice.list.BuildResultMask(true), mask | feature::kSeriesOnly) << one.what;
  }
}

TEST(GridSeries, TypesAreRequiredForBalanceAndLaterRuns) {
  // 61: balance and input, depends on groundwater; 58: the same, of overland flow alone; 241: neither.
  struct Case {
    const char* what;
    std::function<void(Choice&)> set;
    const char *level, *flow;
  };
  const auto quality = [](Choice& c) { c.own.WQ = 1, c.storing.WaterBalance = 0; };
  const Case cases[] = {
      {"balance alone", [](Choice&) {}, "Water Balance", "Water Balance"},
      {"input of the ground", [](Choice& c) { c.storing.ADInputData = 1; }, "Water Balance, WQ Input", "Water Balance"},
      {"all input",
       [](Choice& c) {
         c.storing.ADInputData = c.storing.AdRadio = 1;
         c.storing.WaterBalance = 0;
       },
       "WQ Input", "WQ Input"},
      {"quality of another run", [&](Choice& c) { quality(c), c.own.UseCurrentWmSimulation = 0; }, "", ""},
      {"input is not asked with quality",
       [&](Choice& c) {
         quality(c);
         c.storing.ADInputData = c.storing.AdRadio = 1;
         c.own.UseCurrentWmSimulation = 0;
       },
       "", ""},
      {"quality of the ground alone", [&](Choice& c) { quality(c), c.quality.SZ = 1; }, "WQ Input", ""},
      {"quality of the soil, too", [&](Choice& c) { quality(c), c.quality.SZ = c.quality.UZ = 1; }, "WQ Input",
       "WQ Input"},
      {"quality of overland flow", [&](Choice& c) { quality(c), c.quality.OL = 1; }, "WQ Input", "WQ Input"},
      {"quality without a compartment", quality, "", ""},
      {"particles", [&](Choice& c) { quality(c), c.own.ADPTRadio = c.quality.OL = 1; }, "WQ Input", ""},
  };
  for (const Case& one : cases) {
    Choice choice;
    one.set(choice);
    EXPECT_STREQ(choice.RequiredFor(61), one.level) << one.what;
    EXPECT_STREQ(choice.RequiredFor(58), one.flow) << one.what;
    EXPECT_STREQ(choice.RequiredFor(241), "") << one.what;
  }
}

TEST(GridSeries, TicksAreWrittenInOrderWithoutGaps) {
  Choice choice;
  for (const int code : {61, 10, 61}) choice.list.SetTicked(code, true);
  EXPECT_EQ(choice.setup.WrittenKeys("StoringOfResults/GridSeriesOutput"), "YbSEKvfListItemCount=2 NumberOfItems=2");
  EXPECT_EQ(choice.setup.Written("StoringOfResults/GridSeriesOutput/Item_1:DataType"), "10");
  EXPECT_EQ(choice.setup.Written("StoringOfResults/GridSeriesOutput/Item_2:DataType"), "61");
  choice.list.SetTicked(10, false);
  EXPECT_EQ(choice.setup.Written("StoringOfResults/GridSeriesOutput/Item_1:DataType"), "61");
  EXPECT_EQ(choice.setup.Written("StoringOfResults/GridSeriesOutput/Item_2:DataType"), "");
}

TEST(GridSeries, LookingAtASetupDropsNoTick) {
  Choice choice;
  choice.list.SetTicked(61, true);
  choice.own.OL = choice.own.SZ = 0;
  EXPECT_EQ(choice.setup.Written("StoringOfResults/GridSeriesOutput:NumberOfItems"), "0");
  EXPECT_TRUE(choice.list.IsTicked(61)) << "what a save would write was only looked at";
  choice.own.OL = 1;
  EXPECT_EQ(choice.setup.Written("StoringOfResults/GridSeriesOutput:NumberOfItems"), "1");

  choice.own.OL = 0;
  EXPECT_TRUE(choice.list.RefreshItems());
  EXPECT_FALSE(choice.list.RefreshItems());
  choice.own.OL = 1;
  EXPECT_FALSE(choice.list.IsTicked(61)) << "what was gone in between comes back without its tick";
}

TEST(GridSeries, FilesAreThoseOfARunThatIsThere) {
  TempFolder folder;
  Choice choice;
  choice.list.SetIndexPath(folder.File("Run1.fif"));
  EXPECT_EQ(choice.list.Rows().front().fileName, "");
  folder.Write("Run1.fif", "");
  const GridSeriesRow first = choice.list.Rows().front();
  EXPECT_EQ(first.type->newDataType, 10);
  EXPECT_THAT(first.fileName, testing::EndsWith(R"(\Run1_ET_AllCells.nds2)"));
}

TEST(GridSeries, SeriesHaveTypesThatGridsHaveNot) {
  Choice choice;
  const std::string text = choice.list.GetChoiceText();
  EXPECT_THAT(text, testing::StartsWith("145\tSimStatus: Basic time step length\n"));
  EXPECT_THAT(text, testing::HasSubstr("\n61\tdepth of overland water\n"));
  for (const GridSeriesRow& row : choice.list.Rows()) EXPECT_NE(row.type->newDataType, 145);
  choice.own.OL = choice.own.SZ = 0;
  EXPECT_THAT(choice.list.GetChoiceText(), testing::Not(testing::HasSubstr("\n61\t")));
}

TEST(GridSeries, TicksThatGoBelongToTheStepThatTookTheirType) {
  TempFolder folder;
  const std::string path = folder.Write("a.tvd", test::SetupText(14, ""));
  std::string error;
  const auto session = EditSession::Open(path, folder.File("kept"), error);
  ASSERT_TRUE(session) << error;
  auto& list = *session->Document().Root().Important(kOutputGridSeries);
  auto& own = *session->Document().Root().Important(kModelComponents);
  list.SetTicked(61, true);
  session->UpdateDoc(list, 1, "Tick");
  own.OL = own.SZ = 0;
  session->UpdateDoc(own, 1, "Switch Off");
  // The page of the list is shown.
  ASSERT_TRUE(list.RefreshItems());
  session->UpdateDoc(list, 1 | kFollowsFromStep, {});
  ASSERT_TRUE(session->Undo());
  EXPECT_TRUE(own.OL && list.IsTicked(61));
  ASSERT_TRUE(session->Redo());
  EXPECT_FALSE(own.OL || list.IsTicked(61));

  // A save does the same, and is no step.
  ASSERT_TRUE(session->Undo());
  own.OL = own.SZ = 0;
  session->UpdateDoc(own, 1, "Switch Off");
  ASSERT_TRUE(session->Save()) << session->Error();
  EXPECT_FALSE(list.IsTicked(61) || session->IsModified());
  ASSERT_TRUE(session->Undo());
  EXPECT_TRUE(own.OL && list.IsTicked(61) && session->IsModified());
}

TEST(GridSeries, WhatWasGoneWhenASetupWasOpenedIsNoChangeOfTheUser) {
  TempFolder folder;
  const std::string path = folder.Write("a.tvd", test::SetupText(14, R"(section StoringOfResults {
    section GridSeriesOutput {
      NumberOfItems = 1
      section Item_1 {
        DataType = 220
      }
    }
  })"));
  std::string error;
  const auto session = EditSession::Open(path, folder.File("kept"), error);
  ASSERT_TRUE(session) << error;
  auto& list = *session->Document().Root().Important(kOutputGridSeries);
  ASSERT_TRUE(list.RefreshItems());
  session->UpdateDoc(list, 1 | kFollowsFromStep, {});
  EXPECT_FALSE(session->IsModified());
  EXPECT_FALSE(session->Steps().CanUndo());
}

}  // namespace
}  // namespace tervane::grid_series_test
