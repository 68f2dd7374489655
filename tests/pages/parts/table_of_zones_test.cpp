// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/parts/table_of_zones.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "platform/item_types.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "surface/climate.h"
#include "surface/overland.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::table_of_zones_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

/// Seven cells of a square kilometre lie inside; codes of finer cells do not reach the last column.
class TableOfZonesPage : public testing::Test {
 protected:
  TableOfZonesPage() {
    test::WriteGrid(folder.File("domain.nds2"), {4, 2, 1000, 0, 0, 0, {}}, {1, 1, 1, 1, 1, 1, 1, kUsualDeleteValue},
                    quantity::kCode);
    std::vector<float> codes(6 * 4, 5);
    for (std::size_t row = 0; row < 4; ++row) codes[row * 6] = codes[row * 6 + 1] = 9;
    codes[11] = 10;
    test::WriteGrid(folder.File("codes.nds2"), {6, 4, 500, 0, 0, 0, {}}, codes, quantity::kCode);
    document.Root().Important(kDomain)->GridFile().Choose(FileName("domain.nds2", folder.Path()));
  }
  /// The page's text when all is computed.
  static std::string TextOf(test::PageDriver& page) {
    page.Page().Form().ForEach([](const Control& control) {
      if (control.kind == ControlKind::Map && control.IsShown()) Finished(control.map);
    });
    return page.Text();
  }
  static Control& TableOn(test::PageDriver& page) {
    Control* found = nullptr;
    page.Page().Form().ForEach([&found](Control& control) {
      if (control.kind == ControlKind::Table && control.table->CanArrange()) found = &control;
    });
    EXPECT_TRUE(found);
    found->table->Follow();
    return *found;
  }
  static std::vector<std::string> Column(const TableForm& table, int column) {
    std::vector<std::string> cells;
    for (int row = 1; row <= table.RowCount(); ++row) cells.push_back(table.ShownCell(row, column));
    return cells;
  }

  test::TempFolder folder;
  CFlowModelDoc document;
};

class ZonesInTable : public TableOfZonesPage {
 protected:
  ZonesInTable() {
    zones.GridFile().Choose(FileName("codes.nds2", folder.Path()));
    zones.SyncZones();
  }
  std::string Text() { return TextOf(page); }

  CTopographicalRoutingKvf& zones = *document.Root().Important(kOverlandZones);
  test::PageDriver page{document, "OverlandSubcatchment"};
};

TEST_F(ZonesInTable, HaveTheirAreaInTheCellsOfTheDomainAndTheGroundInIt) {
  test::WriteGrid(folder.File("dem.nds2"), {4, 2, 1000, 0, 0, 0, {}}, {1, 2, 3, 4, 5, 6, 7, 8}, quantity::kElevation);
  auto& ground = *document.Root().Important(kTopography);
  EXPECT_THAT(Text(), HasSubstr("Grid code = 5 | 5 | 3 | 3.00 | 42.86 | \n")) << "nothing is known of the ground";
  ground.Type = CData2DKvf::kGridFile;
  ground.GridFile().Choose(FileName("dem.nds2", folder.Path()));
  EXPECT_THAT(Text(), HasSubstr("Grid code = 5 | 5 | 3 | 3.00 | 42.86 | 5.0\n"));
  EXPECT_THAT(Text(), HasSubstr("Grid code = 9 | 9 | 2 | 2.00 | 28.57 | 3.0\n"));
  EXPECT_THAT(Text(), HasSubstr("1 of 7 cells of the model domain belong to no zone."));
}

TEST_F(ZonesInTable, FollowNamesAndFiles) {
  zones.SelectZoneByCode(9)->SetStationName("Vineyards");
  EXPECT_THAT(Text(), HasSubstr("Vineyards | 9 | 2 | 2.00 | 28.57"));
  folder.Write("codes.nds2", "no data file");
  EXPECT_THAT(Text(), HasSubstr("Vineyards | 9 |  |  |  | \n"));
  EXPECT_THAT(Text(), HasSubstr("notice \"\" = cannot read"));
  zones.DistributionType = CodedZonesKvf::kUniform;
  EXPECT_THAT(Text(), testing::ContainsRegex("notice \"\" = cannot read[^\n]* hidden\n"));
  EXPECT_THAT(Text(), HasSubstr("table \"\" hidden"));
}

TEST_F(ZonesInTable, AreRenamedSortedFilteredAndPastedInTheOrderThatIsSeen) {
  Text();
  Control& control = TableOn(page);
  TableForm& table = *control.table;
  EXPECT_THAT(Column(table, 3), ElementsAre("5", "9", "10"));
  EXPECT_EQ(page.Page().EnterCell(control, 1, 2, "Forest"), "");
  EXPECT_EQ(zones.SelectZoneByCode(5)->GetStationName(), "Forest");
  EXPECT_EQ(zones.SelectZoneByCode(5)->GetTitle(), zones.SelectZoneByCode(9)->GetTitle()) << "that of its kind";
  // Who a zone is must be its own.
  for (const char* refused : {"9", "0", "x", ""})
    EXPECT_NE(page.Page().EnterCell(control, 1, 3, refused), "") << refused;
  EXPECT_EQ(page.Page().EnterCell(control, 1, 3, "7"), "");
  EXPECT_EQ(page.Page().EnterCell(control, 2, 3, "5"), "");
  EXPECT_EQ(page.Page().EnterCell(control, 2, 3, "9"), "");
  EXPECT_EQ(page.Page().EnterCell(control, 1, 3, "5"), "");
  EXPECT_NE(page.Page().EnterCell(control, 1, 5, "12"), "") << "what is counted";

  table.SortBy(2);
  EXPECT_THAT(Column(table, 2), ElementsAre("Forest", "Grid code = 9", "Grid code = 10")) << "numbers by their value";
  table.SortBy(2);
  EXPECT_TRUE(table.IsDescending());
  EXPECT_THAT(Column(table, 2), ElementsAre("Grid code = 10", "Grid code = 9", "Forest"));
  table.SortBy(4);
  EXPECT_THAT(Column(table, 4), ElementsAre("1", "2", "3"));
  EXPECT_EQ(page.Page().Paste(control, {1, 2, 1, 2}, "Tiny\nSmall\nLarge\nNone").taken, 3) << "no row is added";
  EXPECT_EQ(zones.SelectZoneByCode(10)->GetStationName(), "Tiny");
  EXPECT_EQ(zones.SelectZoneByCode(5)->GetStationName(), "Large");
  table.Filter("MALL");
  EXPECT_THAT(Column(table, 2), ElementsAre("Small"));
  EXPECT_EQ(table.AllRows(), 3);
  table.Filter("");
  table.SortBy(4);
  table.SortBy(4);
  EXPECT_EQ(table.SortedColumn(), 0);
  EXPECT_THAT(Column(table, 2), ElementsAre("Large", "Small", "Tiny")) << "their own order";
  EXPECT_EQ(zones.GetZoneTitles().size(), 3U);
}

TEST_F(TableOfZonesPage, StationsHaveTheirSeriesWithItsMean) {
  NewDataFile content;
  content.dimensions = 0;
  for (const char* name : {"Sion", "Brig"}) content.items.push_back({name, 100431, 2004, ValueType::MeanStep});
  DataFileWriter writer;
  ASSERT_EQ(writer.Create(folder.File("rain.nds0"), content), "");
  for (int day = 1; day <= 32; ++day) {
    ASSERT_EQ(writer.AddStep(CYbDateTime(2000, 1, 1) + CYbDateTimeSpan::Days(day - 1)), "");
    for (const int item : {1, 2}) {
      const float value = static_cast<float>(item * (day % 2));
      ASSERT_EQ(writer.Put(item, {&value, 1}), "");
    }
  }
  ASSERT_EQ(writer.Finish().error, "");
  auto& forcing = *document.Root().Important(kPrecipitation);
  forcing.DistributionType = StationOwnerKvf::kStationBased;
  forcing.Stations().Type = ZoneSource::kGridCodes;
  forcing.Stations().GridFile().Choose(FileName("codes.nds2", folder.Path()));
  forcing.SyncStations();
  test::PageDriver page(document, "Climate/PrecipitationRate");
  Control& control = TableOn(page);
  // Name, code, file, item, mean, cells, share and ground stand behind the button that opens a station.
  const std::string rain = folder.File("rain.nds0");
  EXPECT_EQ(page.Page().Paste(control, {1, 4, 1, 4}, rain + "\tSion\n" + rain + "\tbrig").refused, 0);
  EXPECT_EQ(page.Page().EnterCell(control, 3, 4, folder.File("gone.nds0")), "");
  TextOf(page);
  EXPECT_THAT(Column(*control.table, 5), ElementsAre("Sion", "Brig", "1"));
  EXPECT_THAT(Column(*control.table, 6), ElementsAre("0.48", "0.97", "")) << "15 of 31 days";
  EXPECT_THAT(Column(*control.table, 7), ElementsAre("3", "2", "1"));
  auto* first = dynamic_cast<C2DStationBasedDataTimeSeriesKvf*>(forcing.SelectStationByName("5"));
  first->TYPE = C2DStationBasedDataTimeSeriesKvf::kConstant;
  EXPECT_TRUE(control.table->IsGrey(1, 4));
  EXPECT_EQ(control.table->ShownCell(1, 4), "");
  EXPECT_NE(page.Page().EnterCell(control, 1, 4, rain), "");
  EXPECT_EQ(first->SeriesFile().SelectedItem(), 1);
}

}  // namespace
}  // namespace tervane::table_of_zones_test
