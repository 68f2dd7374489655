// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/zones.h"

#include <gmock/gmock.h>

#include "data/grid_files.h"
#include "platform/item_types.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::zones_test {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;

class Zones : public testing::Test {
 protected:
  void WriteCodes(std::vector<float> codes) {
    CTvn2DOrthoRotatedGridData grid;
    const int nx = static_cast<int>(codes.size());
    ASSERT_EQ(grid.TakeValues({nx, 1, 100, 0, 0, 0, {}}, std::move(codes), kUsualDeleteValue, 0, quantity::kCode), "");
    const FileResult result = WriteGridData(folder.File("codes.nds2"), grid);
    ASSERT_TRUE(result.Ok()) << result.error;
    zones.GridFile().Choose(FileName("codes.nds2", folder.Path()));
  }
  std::vector<std::string> Ids() {
    std::vector<std::string> ids;
    for (const CFMSEKvfGroupBase* zone : ZoneItems(zones)) ids.push_back(zone->GetStationId());
    return ids;
  }

  test::TempFolder folder;
  CFlowModelDoc document;
  CSubcatchmentKvf& zones = *document.Root().Important(kSubcatchments);
};

TEST_F(Zones, FollowTheCodesOfTheirFileAndKeepWhatTheyHold) {
  WriteCodes({7, 3, 7, kUsualDeleteValue, 12});
  EXPECT_EQ(zones.SyncZones(), kAdded);
  EXPECT_THAT(Ids(), ElementsAre("3", "7", "12"));
  EXPECT_THAT(zones.GetZoneTitles(), ElementsAre("Grid code = 3", "Grid code = 7", "Grid code = 12"));
  EXPECT_EQ(zones.SyncZones(), kNothing);
  zones.SelectZoneByCode(7)->SetStationName("Upper valley");

  WriteCodes({5, 7});
  const SyncPlan plan = zones.PlanZones(zones.FindZones());
  EXPECT_THAT(plan.editedRemoved, IsEmpty());  // only what a user worked on is asked for
  EXPECT_EQ(zones.SyncZones(), kAddedAndRemoved);
  EXPECT_THAT(Ids(), ElementsAre("5", "7"));
  EXPECT_EQ(zones.SelectZoneByCode(7)->GetStationName(), "Upper valley");

  WriteCodes({5});
  EXPECT_EQ(zones.PlanZones(zones.FindZones()).editedRemoved.size(), 1U);
}

TEST_F(Zones, AFileThatCannotBeReadRemovesNothing) {
  WriteCodes({1, 2});
  zones.SyncZones();
  for (const char* content : {"no data file", ""}) {
    folder.Write("codes.nds2", content);
    EXPECT_THAT(zones.FindZones().unreadable, Not(IsEmpty()));
    EXPECT_EQ(zones.SyncZones(), kNothing);
    EXPECT_THAT(Ids(), ElementsAre("1", "2"));
  }
  zones.GridFile().Choose({});
  EXPECT_EQ(zones.SyncZones(), kRemoved);
  zones.DistributionType = CodedZonesKvf::kUniform;
  EXPECT_EQ(zones.SyncZones(), kAdded);
  EXPECT_THAT(Ids(), ElementsAre("Global"));
}

TEST_F(Zones, AreWrittenWithTheirNumbersAndReadInTheirOrder) {
  WriteCodes({30, 4});
  zones.SyncZones();
  const std::string text = test::SavedText(document);
  EXPECT_THAT(text, testing::HasSubstr("NO_ZONES = 2"));
  EXPECT_THAT(text, testing::HasSubstr("ProfileSecNumber = 2\n      GRIDCODEID = \"30\"\n      GRIDCODE = 30"));
  CFlowModelDoc reopened;
  ASSERT_TRUE(reopened.OpenText(text, folder.File("a.tvd")));
  EXPECT_EQ(test::SavedText(reopened), text);
}

}  // namespace
}  // namespace tervane::zones_test
