// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/zone_area_table.h"

#include <gmock/gmock.h>

#include "forms/plots.h"
#include "platform/item_types.h"
#include "spatial/domain.h"
#include "surface/overland.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane {
namespace {

using testing::HasSubstr;
using testing::Not;

class ZoneAreas : public testing::Test {
 protected:
  ZoneAreas() {
    // Seven cells of a square kilometre lie inside.
    test::WriteGrid(folder.File("domain.nds2"), {4, 2, 1000, 0, 0, 0, {}}, {1, 1, 1, 1, 1, 1, 1, kUsualDeleteValue},
                    quantity::kCode);
    // Codes of finer cells that do not reach the last column.
    std::vector<float> codes(6 * 4, 5);
    for (std::size_t row = 0; row < 4; ++row) codes[row * 6] = codes[row * 6 + 1] = 9;
    test::WriteGrid(folder.File("codes.nds2"), {6, 4, 500, 0, 0, 0, {}}, codes, quantity::kCode);
    document.Root().Important(kDomain)->GridFile().Choose(FileName("domain.nds2", folder.Path()));
    zones.GridFile().Choose(FileName("codes.nds2", folder.Path()));
    zones.SyncZones();
  }
  /// The page's text when all is computed.
  std::string Text() {
    page.Page().Form().ForEach([](const Control& control) {
      if (control.kind == ControlKind::Map) Finished(control.map);
    });
    return page.Text();
  }

  test::TempFolder folder;
  CFlowModelDoc document;
  CTopographicalRoutingKvf& zones = *document.Root().Important(kOverlandZones);
  test::PageDriver page{document, "OverlandSubcatchment"};
};

TEST_F(ZoneAreas, AreCountedInTheCellsOfTheDomain) {
  EXPECT_THAT(Text(), HasSubstr("Grid code = 5 | 5 | 4 | 57.14\n"));
  EXPECT_THAT(Text(), HasSubstr("Grid code = 9 | 9 | 2 | 28.57\n"));
  EXPECT_THAT(Text(), HasSubstr("1 of 7 cells of the model domain belong to no zone."));
}

TEST_F(ZoneAreas, FollowNamesAndFiles) {
  zones.SelectZoneByCode(9)->SetStationName("Vineyards");
  EXPECT_THAT(Text(), HasSubstr("Vineyards | 9 | 2 | 28.57\n"));
  folder.Write("codes.nds2", "no data file");
  EXPECT_THAT(Text(), Not(HasSubstr("Vineyards | 9")));
  EXPECT_THAT(Text(), HasSubstr("notice \"\" = cannot read"));
  zones.DistributionType = CodedZonesKvf::kUniform;
  EXPECT_THAT(Text(), Not(HasSubstr("notice \"\" = cannot read")));
  document.Root().Important(kDomain)->GridFile().Choose({});
  zones.DistributionType = CodedZonesKvf::kDistributed;
  EXPECT_THAT(Text(), HasSubstr("table \"\" hidden"));
}

}  // namespace
}  // namespace tervane
