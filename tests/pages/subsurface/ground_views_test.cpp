// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/ground_views.h"

#include <stdexcept>

#include <gmock/gmock.h>

#include "forms/plots.h"
#include "forms/section_profile.h"
#include "forms/table_form.h"
#include "subsurface/geology.h"
#include "subsurface/saturated_zone.h"
#include "tests/support/page_driver.h"

namespace tervane {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

/// Two layers and a lens below a level ground of 100 m.
class GroundViewsTest : public testing::Test {
 public:
  CFlowModelDoc document;
  CSatZoneKvf& zone = *document.Root().Important(kSaturatedZone);
  CGeoLayerSZKvf& layers = *document.Root().Important(kGeologicalLayers);

  GroundViewsTest() {
    document.Root().Important(kTopography)->FixedValue = 100;
    layers.SetItemCount(2, 1);
    Put(*layers.GetItem(1), "Sand", "LowerLevel", -20, true);
    Put(*layers.GetItem(2), "Clay", "LowerLevel", 50, false);
    CGeoLenseSZItemKvf& lense = *document.Root().Important(kGeologicalLenses)->AddItem();
    Put(lense, "Peat", "UpperLevel", 95, false);
    Put(lense, "Peat", "LowerLevel", 90, false);
    PropertyOf(lense, "HorBoundary")->FixedValue = 1;
  }
  static void Put(NamedItemKvf& item, const char* name, const char* level, float value, bool isRelative) {
    item.Name = name;
    CData2DKvf& quantity = *PropertyOf(item, level);
    quantity.FixedValue = value;
    quantity.RelativeToGround = isRelative ? 1 : 0;
  }
};

/// What a page shows of that kind.
Control& The(test::PageDriver& page, ControlKind kind) {
  Control* found = nullptr;
  page.Page().Form().ForEach([&](Control& control) {
    if (control.kind == kind && control.label.empty()) found = &control;
  });
  if (!found) throw std::runtime_error("there is no such control");
  return *found;
}

TEST_F(GroundViewsTest, AColumnHasAllThatLiesBelowAPlace) {
  Put(*layers.GetItem(2), "Clay", "LowerLevel", 90, false);
  test::PageDriver page(document, "SaturatedZone");
  TableForm& table = *The(page, ControlKind::Table).table;
  page.Find("Show Column").press();
  The(page, ControlKind::Map).map().request->taken({{5, 5}});
  table.Follow();
  EXPECT_THAT(page.Text(), HasSubstr("At 5, 5: ground 100 m"));
  const auto row = [&](int number) {
    std::string cells;
    for (int column = 1; column <= 7; ++column) cells += (column > 1 ? " " : "") + table.ShownCell(number, column);
    return cells + " " + table.ShownCell(number, table.ColumnCount());
  };
  EXPECT_EQ(row(1), "Layer Sand 100 80 20 0.0001 0.0001 ");
  EXPECT_EQ(row(2), "Layer Clay 80 90 -10 0.0001 0.0001 Its level lies above the one above it. ");
  EXPECT_EQ(row(3), "Lens Peat 95 90 5 0.0001 0.0001 ");

  // With units the parameters are theirs.
  zone.ParameterDistribution = CSatZoneKvf::kByUnits;
  PropertyOf(*layers.GetItem(1), "GeoUnit")->FixedValue = 7;
  auto* unit = zone.Child<CGeoUnitsSZListKvf>()->AddItem();
  unit->SoilCode = 7;
  unit->HorConduc = 0.5f;
  page.Find("Show Column").press();
  The(page, ControlKind::Map).map().request->taken({{5, 5}});
  table.Follow();
  EXPECT_EQ(table.ShownCell(1, 6), "0.5");
  EXPECT_EQ(table.ShownCell(2, table.ColumnCount()), "No unit has this code. Its level lies above the one above it. ");
}

TEST_F(GroundViewsTest, ASectionShowsLayersLensesAndWhereLevelsCross) {
  test::PageDriver page(document, "SaturatedZone");
  const Control& section = The(page, ControlKind::Section);
  EXPECT_FALSE(section.IsShown());
  page.Find("Draw Section").press();
  The(page, ControlKind::Map).map().request->taken({{0, 0}, {1000, 0}});
  ASSERT_TRUE(section.IsShown());
  const auto profile = [&] { return ProfileOf(Finished(section.section), 500); };
  const SectionProfile whole = profile();
  EXPECT_THAT(whole.ground, ElementsAre(100, 100, 100));
  EXPECT_THAT(whole.bands[0].bottom, ElementsAre(80, 80, 80));
  EXPECT_THAT(whole.bands[1].bottom, ElementsAre(50, 50, 50));
  EXPECT_THAT(whole.lenses.at(0).top, ElementsAre(95, 95, 95));
  EXPECT_THAT(whole.bands[1].crossing, testing::Each(testing::IsNan()));
  Put(*layers.GetItem(2), "Clay", "LowerLevel", 90, false);
  EXPECT_THAT(profile().bands[1].crossing, ElementsAre(80, 80, 80));
  Put(*layers.GetItem(2), "Clay", "LowerLevel", 79.9f, false);
  EXPECT_THAT(profile().bands[1].thin, testing::Each(testing::DoubleNear(79.9, 0.001)));
}

}  // namespace
}  // namespace tervane
