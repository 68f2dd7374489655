// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/subsurface/outer_boundary_pages.h"

#include <tuple>

#include <gmock/gmock.h>

#include "data/datafile_facts.h"
#include "forms/plots.h"
#include "pages/tree_entries.h"
#include "platform/item_types.h"
#include "spatial/domain.h"
#include "subsurface/computational_layers.h"
#include "subsurface/saturated_zone.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::outer_boundary_pages_test {
namespace {

constexpr const char* kList = "SaturatedZone/CompLayersGeoSZ/Layer_1/OuterBoundary";

/// A domain of 4 by 4 cells of 100 m without its corners, with two segments.
class OuterBoundaryPages : public testing::Test {
 public:
  test::TempFolder folder;
  CFlowModelDoc document;
  CGeoDataBoundCondListKvf& boundary =
      document.Root().Important(kSaturatedZone)->LayersOfGeology().GetItem(1)->OuterBoundary();

  OuterBoundaryPages() {
    constexpr float kOut = kUsualDeleteValue;
    const std::string path = folder.File("domain.nds2");
    test::WriteGrid(path, {4, 4, 100, 0, 0, 0, "NON-UTM"}, {kOut, 2, 2, kOut, 2, 1, 1, 2, 2, 1, 1, 2, kOut, 2, 2, kOut},
                    quantity::kCode);
    document.Root().Important(kDomain)->GridFile().Choose(FileName(path, folder.Path()));
    Add("North", 150, 350);
    Add("South", 250, 50);
  }
  void Add(const char* name, double x, double y) {
    auto& segment = *boundary.AddItem();
    segment.Name = name;
    segment.X = x;
    segment.Y = y;
    segment.BoundaryType = CGeoDataBoundCondItemKvf::kFixedHead;
  }
  std::string Names() const {
    std::string names;
    for (int number = 1; number <= boundary.GetItemCount(); ++number) names += boundary.GetItem(number)->Name + " ";
    return names;
  }
  static MapContent MapOf(test::PageDriver& page) {
    MapContent map;
    page.Page().Form().ForEach([&](Control& control) {
      if (control.kind == ControlKind::Map) map = Finished<MapContent>(control.map);
    });
    return map;
  }
};

TEST_F(OuterBoundaryPages, SegmentsAreSortedWithTheActionThatMovedOne) {
  test::PageDriver page(document, kList);
  EXPECT_THAT(page.Changes(), testing::IsEmpty());  // they were sorted
  Control& table = page.Find("");
  EXPECT_EQ(page.Page().EnterCell(table, 1, 4, "50"), "");
  EXPECT_EQ(page.Page().EnterCell(table, 1, 5, "150"), "");
  EXPECT_EQ(Names(), "South North ");
  EXPECT_EQ(page.Changes().size(), 2U);
  EXPECT_FALSE(table.table->Allows(RowAction::MoveUp));
  // Two columns at once land in their rows, and the order follows.
  page.Page().Paste(table, {1, 4, 2, 5}, "150\t50\n350\t250\n");
  EXPECT_EQ(boundary.GetItem(1)->Name, "North");
  EXPECT_EQ(boundary.GetItem(1)->X, 350);
  EXPECT_EQ(boundary.GetItem(2)->X, 150);
}

TEST_F(OuterBoundaryPages, UnsortedSegmentsAreSortedWhenTheyAreShown) {
  boundary.MoveItemUp(2, 1);
  test::PageDriver page(document, kList);
  EXPECT_EQ(Names(), "North South ");
  EXPECT_THAT(page.Changes(), testing::ElementsAre(testing::HasSubstr("Sort Segments")));
}

TEST_F(OuterBoundaryPages, MapsPaintTypesAndTheSegmentOfThePage) {
  test::PageDriver list(document, kList);
  const MapContent map = MapOf(list);
  ASSERT_EQ(map.grids.size(), 1U) << map.message;
  EXPECT_EQ(map.grids[0].classes.size(), 6U);
  EXPECT_EQ(map.grids[0].grid->Value(1, 3), 1);  // a fixed head
  EXPECT_EQ(map.grids[0].grid->Value(1, 1), -2);
  ASSERT_EQ(map.points.size(), 1U);
  EXPECT_EQ(map.points[0].points.size(), 2U);
  EXPECT_EQ(list.Find("").table->ToolTip(1, 1), "483 m along the boundary, 50.0 % of it");

  test::PageDriver segment(document, std::string(kList) + "/OuterBoundaryProp_2");
  const MapContent own = MapOf(segment);
  ASSERT_EQ(own.grids.size(), 1U);
  EXPECT_EQ(own.grids[0].highlighted.code, 2.0F);
  EXPECT_EQ(own.grids[0].grid->Value(2, 0), 2);
}

TEST_F(OuterBoundaryPages, APointIsTakenFromTheMap) {
  Add("West", CGeoDataBoundCondItemKvf::GetUndefinedValue(), 0);
  test::PageDriver page(document, kList);
  const auto& table = *page.Find("").table;
  EXPECT_EQ(table.ShownCell(3, 4), "");
  ASSERT_TRUE(table.Press(3, 3));
  MapContent map = MapOf(page);
  ASSERT_TRUE(map.request);
  map.request->taken({{50, 250}});
  EXPECT_EQ(Names(), "North South West ");
  EXPECT_EQ(boundary.GetItem(3)->Y, 250);
  EXPECT_FALSE(MapOf(page).request);
}

TEST_F(OuterBoundaryPages, ANewSeriesHasTheQuantityOfTheKindThatHoldsAtTheClick) {
  using Segment = CGeoDataBoundCondItemKvf;
  ASSERT_TRUE(document.OnSaveDocument(folder.File("setup.tvd")));
  Segment& segment = *boundary.GetItem(1);
  segment.Type = Segment::kSeries;
  test::ScriptedHost host;
  std::string offered;
  PageContext context{document, host, [](int, const std::string&, const void*) {}};
  context.runDialog = [&](const std::string&, CYbSEDlgBase& dialog, const std::function<std::string()>& accept) {
    dialog.Form().ForEach([&](Control& control) {
      if (control.label == "Quantity:") offered = control.Options().at(0);
    });
    return accept().empty();
  };
  const auto page = MakePage(*PageClassOf(segment), segment, context);
  const auto press = [&] {
    page->Form().ForEach([&](Control& control) {
      if (control.label == "Create..." && control.IsShown()) page->Press(control);
    });
  };
  const std::tuple<int, const char*, int> kinds[] = {{Segment::kFixedHead, "Elevation", quantity::kElevation},
                                                     {Segment::kFlux, "Discharge", quantity::kDischarge},
                                                     {Segment::kGradient, "Head Gradient", quantity::kHeadGradient},
                                                     {Segment::kFixedHead, "Elevation", quantity::kElevation}};
  for (const auto& [kind, name, itemType] : kinds) {
    segment.SetBoundaryType(kind);
    if (!offered.empty()) host.Expect("does already exist", Host::Answer::Yes);
    press();
    EXPECT_EQ(offered, name);
    const auto facts = DataFileFactsOf(segment.SeriesFile().File.Absolute());
    ASSERT_EQ(facts->error, "");
    EXPECT_EQ(facts->items.at(0).itemType, itemType);
  }
}

TEST_F(OuterBoundaryPages, ADomainWithoutAClosedBoundaryTellsSoInThePlaceOfTheMap) {
  const std::string path = folder.File("open.nds2");
  test::WriteGrid(path, {2, 2, 100, 0, 0, 0, "NON-UTM"}, {1, 1, 1, 1}, quantity::kCode);
  document.Root().Important(kDomain)->GridFile().Choose(FileName(path, folder.Path()));
  test::PageDriver page(document, kList);
  EXPECT_EQ(MapOf(page).message, "Invalid value found at catchment boundary");
}

}  // namespace
}  // namespace tervane::outer_boundary_pages_test
