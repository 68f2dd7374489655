// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/zone_pages.h"

#include <gmock/gmock.h>

#include "platform/item_types.h"
#include "simspec/model_components.h"
#include "spatial/zones.h"
#include "surface/rivers.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::zone_pages_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

using Path = std::optional<std::string>;
using Row = std::optional<int>;

class ZonePage : public testing::Test {
 protected:
  void WriteGrid(const std::string& name, std::vector<float> values, int itemType) {
    test::WriteGrid(folder.File(name), {2, 1, 100, 0, 0, 0, {}}, std::move(values), itemType);
  }
  std::vector<std::string> Titles() { return zones.GetZoneTitles(); }

  test::TempFolder folder;
  CFlowModelDoc document;
  CSubcatchmentKvf& zones = *document.Root().Important(kSubcatchments);
};

TEST_F(ZonePage, ASelectorTakesCodesAndRefusesOtherQuantitiesWithTheReason) {
  WriteGrid("codes.nds2", {1, 2}, quantity::kCode);
  WriteGrid("dem.nds2", {1, 2}, 100180);
  test::PageDriver page(document, "Subcatchments");
  page.Outside().Expect("", Path(folder.File("dem.nds2")));
  page.Outside().Expect("Choose an item", Row());
  page.Page().Browse(page.Find("Grid Distribution File:"));
  ASSERT_EQ(page.Outside().Items().rows.size(), 1U);
  EXPECT_THAT(page.Outside().Items().rows[0].refusal, HasSubstr("is Elevation"));
  EXPECT_EQ(page.Outside().Items().current, -1);
  EXPECT_TRUE(zones.GridFile().File.IsEmpty());

  page.Outside().Expect("", Path(folder.File("codes.nds2")));
  page.Outside().Expect("Choose an item", Row(0));
  page.Page().Browse(page.Find("Grid Distribution File:"));
  EXPECT_EQ(page.Outside().Items().rows[0].refusal, "");
  EXPECT_THAT(Titles(), ElementsAre("Grid code = 1", "Grid code = 2"));

  page.Outside().Expect("", Path(folder.Write("text.nds2", "no data file")));
  page.Outside().Expect("text.nds2", Host::Answer::Ok);
  page.Page().Browse(page.Find("Grid Distribution File:"));
  EXPECT_TRUE(page.Outside().IsDone());
}

TEST_F(ZonePage, ZonesThatHoldWorkGoOnlyWhenTheUserSaysSo) {
  WriteGrid("codes.nds2", {1, 2}, quantity::kCode);
  WriteGrid("others.nds2", {2, 3}, quantity::kCode);
  test::PageDriver page(document, "Subcatchments");
  ASSERT_EQ(page.Enter("Grid Distribution File:", folder.File("codes.nds2")), "");
  zones.SelectZoneByCode(1)->SetStationName("Upper valley");

  page.Outside().Expect("would be removed:\n\nUpper valley\n", Host::Answer::No);
  page.Enter("Grid Distribution File:", folder.File("others.nds2"));
  EXPECT_THAT(Titles(), ElementsAre("Upper valley", "Grid code = 2"));

  page.Outside().Expect("The zones stay as they are.", Host::Answer::Ok);
  page.Enter("Grid Distribution File:", folder.File("away.nds2"));
  EXPECT_THAT(Titles(), ElementsAre("Upper valley", "Grid code = 2"));

  page.Outside().Expect("would be removed:", Host::Answer::Yes);
  page.Enter("Grid Distribution File:", folder.File("others.nds2"));
  EXPECT_THAT(Titles(), ElementsAre("Grid code = 2", "Grid code = 3"));
  EXPECT_TRUE(page.Outside().IsDone());
}

TEST_F(ZonePage, LinksAreTakenFromTheBranchesThatCrossTheZone) {
  WriteGrid("codes.nds2", {1, 2}, quantity::kCode);
  test::PageDriver parent(document, "Subcatchments");
  ASSERT_EQ(parent.Enter("Grid Distribution File:", folder.File("codes.nds2")), "");
  test::PageDriver page(document, "Subcatchments/Subcatchment#2/Riverlinks");
  const auto hasNetwork = [&] { return page.Find("Links from Network").IsEnabled(); };
  EXPECT_FALSE(hasNetwork());
  document.Root().Important(kModelComponents)->SZ_ModelType = kLinearReservoir;
  dynamic_cast<CSubcatchmentPropKvf&>(*page.Page().Node().GetParent()).DefaultRiverLinks = false;
  folder.Write("net.fvnwk",
               "target FLUVANE_Network_editor {\n  section POINTS {\n    Point = 1, -50, 50, 1000\n"
               "    Point = 2, 250, 50, 1300\n  }\n  section BRANCHES {\n    section Branch_1 {\n"
               "      Name = \"Rhone\"\n      Points = 1, 2\n    }\n  }\n}\n");
  const std::string simulation =
      folder.Write("run.fvsim", "target FvRun {\n  section input {\n    nwk = \"net.fvnwk\"\n  }\n}\n");
  dynamic_cast<CRiverKvf&>(*document.Root().Important(kRiver)).SetRiverFile(FileName(simulation, ""));
  EXPECT_TRUE(hasNetwork());
  page.Page().Press(page.Find("Links from Network"));
  auto& links = dynamic_cast<CSubcatchmentRiverlinksListKvf&>(page.Page().Node());
  ASSERT_EQ(links.GetItemCount(), 1);
  auto& link = *links.GetItem(1);
  EXPECT_EQ(link.Branchname, "Rhone");
  EXPECT_EQ(link.Upstream, 1150);
  EXPECT_EQ(link.Downstream, 1250);
  EXPECT_THAT(page.Changes(), ElementsAre("15 Links from Network"));
  // Its branches are offered; another name stays, with a warning.
  TableForm& table = *page.Page().Form().Controls().front()->table;
  EXPECT_THAT(table.Offers(1, 1), ElementsAre("Rhone"));
  EXPECT_EQ(page.Page().EnterCell(*page.Page().Form().Controls().front(), 1, 1, "Danube"), "");
  link.Validate();
  ASSERT_EQ(link.Findings().size(), 1U);
  EXPECT_EQ(link.Findings()[0].severity, Severity::Warning);
  link.Branchname = "Rhone";
  link.Downstream = 1301;
  link.Validate();
  ASSERT_EQ(link.Findings().size(), 1U);
  EXPECT_EQ(link.Findings()[0].key, "Downstream");
}

}  // namespace
}  // namespace tervane::zone_pages_test
