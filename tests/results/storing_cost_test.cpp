// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "results/storing_cost.h"

#include <gmock/gmock.h>

#include "results/storing.h"
#include "results/tick_presets.h"
#include "simspec/periods.h"
#include "spatial/domain.h"
#include "subsurface/soil_profiles.h"
#include "subsurface/unsaturated_zone.h"
#include "tests/simspec/test_setup.h"

namespace tervane::storing_cost_test {
namespace {

using test::TestSetup;

/// 40 x 30 cells, three computational layers, 10 days.
struct Model {
  TestSetup setup{R"(section Catchment {
    type = 2
    nxShp = 40
    nyShp = 30
    section SHAPE_FILE {
      FILE_NAME = file "domain.shp"
    }
  }
  section SaturatedZone {
    TypeOfVerDiscr = 2
    section CompLayersSZ {
      NumberOfLayers = 3
    }
  })"};
  CStoringResultsKvf& storing = setup.At<CStoringResultsKvf>("StoringOfResults");

  Model() {
    auto& period = setup.At<CSimPeriodKvf>("SimSpec/SimulationPeriod");
    period.SIMSTART = {2000, 1, 1};
    period.SIMEND = {2000, 1, 11};
    storing.WaterBalance = 0;
  }
  StoringCost Cost() { return ForecastCost(storing, storing.GridSeries().Rows()); }
};

TEST(StoringCost, EachTypeTakesItsCellsLayersAndSteps) {
  Model model;
  ASSERT_EQ(model.storing.Important(kDomain)->GetModelGeometry().CellCount(), 1200u);
  EXPECT_EQ(model.Cost().Text(), "Nothing is stored.");
  model.storing.WM_OverlandFrequency = 6;
  model.storing.WM_FHeadsFrequency = 48;
  for (const int code : {61, 101}) model.storing.GridSeries().SetTicked(code, true);
  const StoringCost cost = model.Cost();
  ASSERT_EQ(cost.types.size(), 2u);
  EXPECT_EQ(cost.types[0].type->newDataType, 61);
  EXPECT_EQ(cost.types[0].Bytes(), 1200 * 40 * 4);
  EXPECT_EQ(cost.types[1].valuesOfStep, 3600);
  EXPECT_EQ(cost.types[1].steps, 5);
  ASSERT_EQ(cost.files.size(), 2u);
  EXPECT_EQ(cost.files[0].file->suffix, "overland");
  EXPECT_EQ(cost.bytes, 1200 * 40 * 4 + 3600 * 5 * 4);
  EXPECT_EQ(cost.Text(), "258 KB in 2 files");

  // What is required is stored, too.
  model.storing.WaterBalance = 1;
  EXPECT_GT(model.Cost().types.size(), 10u);
  EXPECT_GT(model.Cost().bytes, cost.bytes);
}

TEST(StoringCost, WhatIsNotKnownIsSaid) {
  Model model;
  const ResultCatalogue& catalogue = ResultCatalogue::Own();
  const std::vector<GridSeriesRow> rows{
      {catalogue.Find(61), true}, {catalogue.Find(92), true}, {catalogue.Find(15), false}, {catalogue.Find(240), true}};
  StoringCost cost = ForecastCost(model.storing, rows);
  ASSERT_EQ(cost.types.size(), 2u) << "what is not stored, and what has no file, costs nothing";
  EXPECT_EQ(cost.types[1].unknown, "the number of river points is not known");
  EXPECT_EQ(cost.Text(), "47 KB in 2 files, and 1 type whose size is not known");
  EXPECT_EQ(cost.files[1].unknownTypes, 1);
  EXPECT_EQ(cost.bytes, cost.files[0].bytes);

  model.storing.WM_OverlandFrequency = 0;
  EXPECT_EQ(ForecastCost(model.storing, rows).types[0].unknown, "the period or the storing interval is none");
  const TestSetup empty;
  EXPECT_EQ(CostOfTypes(*empty.Root().Important(kStoringResults)).Of(*catalogue.Find(61)).unknown,
            "the number of cells is not known");
}

TEST(StoringCost, SoilHasTheNodesOfItsDeepestProfile) {
  Model model;
  auto& profile = *model.setup.Root().Important(kUnsaturatedZone)->Child<CUZSoilProfileKvf>();
  CUZSoilProfilePropKvf* deepest = nullptr;
  for (CYbSEKvfBase* child = profile.GetFirstChild(); child && !deepest; child = profile.GetNextChild(child))
    deepest = dynamic_cast<CUZSoilProfilePropKvf*>(child);
  ASSERT_TRUE(deepest);
  deepest->Cells().SetItemCount(2, 1);
  deepest->Cells().GetItem(1)->NoCells = 20;
  deepest->Cells().GetItem(2)->NoCells = 7;
  EXPECT_EQ(CostOfTypes(model.storing).Of(*ResultCatalogue::Own().Find(117)).valuesOfStep, 1200 * 27);
}

TEST(StoringCost, SizesAreReadable) {
  struct Case {
    double bytes;
    const char* text;
  };
  const Case cases[] = {{0, "0 bytes"},         {1023, "1023 bytes"},          {1024, "1.0 KB"}, {1536, "1.5 KB"},
                        {20.0 * 1024, "20 KB"}, {3.2 * 1024 * 1024, "3.2 MB"}, {1e15, "909 TB"}};
  for (const Case& one : cases) EXPECT_EQ(SizeInWords(one.bytes), one.text);
  EXPECT_GT(FreeBytesAt("/tmp/a folder/that is/not there").value_or(0), 0);
}

TEST(TickPresets, EachTicksItsTypesAtOnce) {
  Model model;
  COutputGridSeriesListKvf& list = model.storing.GridSeries();
  list.SetTicked(241, true);
  const auto take = [&](std::size_t place) { return TakePreset(list, TickPresets()[place]); };
  EXPECT_TRUE(take(0));
  EXPECT_FALSE(take(0));
  for (const GridSeriesRow& row : list.Rows())
    EXPECT_EQ(row.isTicked, row.type->isWaterBalance || row.type->newDataType == 241) << row.type->name;
  EXPECT_TRUE(take(2));
  EXPECT_EQ(list.GetItemCount(), 1);
  EXPECT_TRUE(list.IsTicked(101));
  EXPECT_TRUE(take(3));
  EXPECT_EQ(list.GetItemCount(), 0);
}

}  // namespace
}  // namespace tervane::storing_cost_test
