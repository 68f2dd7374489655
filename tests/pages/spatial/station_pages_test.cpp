// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/spatial/station_pages.h"

#include <algorithm>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "forms/plots.h"
#include "surface/climate.h"
#include "tests/support/data_files.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::station_pages_test {
namespace {

using testing::ElementsAre;

/// Stations for the polygons of a shape file.
void ChooseAreas(test::PageDriver& page, const std::string& shapeFile) {
  page.Enter("Spatial Distribution:", "1");
  page.Enter("Data Type:", "1");
  page.Enter("Shape File:", shapeFile);
}

TEST(StationPage, AFileOfAreasMakesTheStationsAndTheNameThatFillsGapsIsOneOfThem) {
  test::TempFolder folder;
  test::WriteShapes(folder.File("areas.shp"), ShapeKind::Polygon, AttributeKind::Text, {"Sion", "Brig"});
  test::WriteCodes(folder.File("codes.nds2"), {4, 2});
  CFlowModelDoc document;
  auto& forcing = *document.Root().Important(kPrecipitation);
  test::PageDriver page(document, "Climate/PrecipitationRate");
  ChooseAreas(page, folder.File("areas.shp"));
  EXPECT_EQ(forcing.Stations().ShapeFile().Attribute(), "CODE");  // the only one that there is
  EXPECT_THAT(forcing.GetStationNames(), ElementsAre("Brig", "Sion"));
  EXPECT_THAT(page.Find("Fill Gaps with:").Options(), ElementsAre("Brig", "Sion"));
  EXPECT_EQ(page.Find("Fill Gaps with:").Text(), "0");
  EXPECT_EQ(page.Changes().back(), "19 Change Shape File");

  // A name that no station bears any more stays to be seen until another is chosen.
  forcing.Stations().ShapeGapFillName = "Visp";
  EXPECT_THAT(page.Find("Fill Gaps with:").Options(), ElementsAre("Brig", "Sion", "Visp (not in the list)"));
  page.Enter("Fill Gaps with:", "1");
  EXPECT_EQ(forcing.Stations().ShapeGapFillName, "Sion");

  // Other codes: the stations go without a question, since nobody worked on them.
  page.Enter("Data Type:", "0");
  page.Enter("Station Based Distribution File:", folder.File("codes.nds2"));
  EXPECT_THAT(forcing.GetStationNames(), ElementsAre("Grid code = 2", "Grid code = 4"));
}

/// Two days of rain at each of these places.
void WriteRain(const std::string& path, const std::vector<std::string>& places) {
  NewDataFile content;
  content.dimensions = 0;
  for (const std::string& place : places) content.items.push_back({place, 100431, 2004, ValueType::MeanStep});
  DataFileWriter writer;
  ASSERT_EQ(writer.Create(path, content), "");
  for (int day = 1; day <= 2; ++day) {
    ASSERT_EQ(writer.AddStep(CYbDateTime(2000, 1, day)), "");
    for (int item = 1; item <= static_cast<int>(places.size()); ++item) {
      const float value = static_cast<float>(10 * item + day);
      ASSERT_EQ(writer.Put(item, {&value, 1}), "");
    }
  }
  ASSERT_EQ(writer.Finish().error, "");
}

TEST(StationPage, SeriesOfOtherStationsAndFilesAreLaidOverTheChart) {
  test::TempFolder folder;
  test::WriteShapes(folder.File("areas.shp"), ShapeKind::Polygon, AttributeKind::Text, {"Brig", "Sion", "Visp"});
  WriteRain(folder.File("rain.nds0"), {"first", "second", "third"});
  WriteRain(folder.File("more.nds0"), {"Zermatt"});
  CFlowModelDoc document;
  auto& forcing = *document.Root().Important(kPrecipitation);
  {
    test::PageDriver page(document, "Climate/PrecipitationRate");
    ChooseAreas(page, folder.File("areas.shp"));
  }
  const auto choose = [&](const char* name, const char* file, int item) {
    auto* station = dynamic_cast<C2DStationBasedDataTimeSeriesKvf*>(forcing.SelectStationByName(name));
    station->SeriesFile().File = FileName(file, folder.Path());
    station->SeriesFile().Items = {item};
  };
  choose("Brig", "rain.nds0", 1);
  choose("Sion", "rain.nds0", 2);
  choose("Visp", "gone.nds0", 1);

  test::PageDriver page(document, "Climate/PrecipitationRate/TIME_SERIES_1");
  const auto& controls = page.Page().Form().Controls();
  const auto chart =
      std::ranges::find_if(controls, [](const auto& control) { return control->kind == ControlKind::Chart; });
  ASSERT_NE(chart, controls.end());
  const auto shown = [&] {
    std::vector<std::string> names;
    const SeriesContent content = Finished<SeriesContent>((*chart)->chart);
    for (std::size_t i = 0; i < content.series.size(); ++i)
      names.push_back(fmt::format("{} {}", content.series[i].color.value_or(i), content.series[i].name));
    return names;
  };
  EXPECT_THAT(shown(), ElementsAre("0 first"));
  const SeriesChoice choice = *(*chart)->chart().choice;
  const std::vector<SeriesOffer> offers = choice.offers();
  std::vector<std::string> offered;
  for (const SeriesOffer& offer : offers) offered.push_back(offer.group + ": " + offer.name);
  // The item that another station uses goes by that station's name.
  EXPECT_THAT(offered, ElementsAre("Other stations: Sion", "Other stations: Visp", "In the same file: third"));
  for (const SeriesOffer& offer : offers) choice.show(offer, true);
  EXPECT_THAT(shown(), ElementsAre("0 first", "1 Sion", "2 Visp (cannot be read)", "3 third"));
  EXPECT_EQ((*chart)->chart().series[3].values, (std::vector<double>{31, 32}));
  choice.show(offers[0], false);
  EXPECT_FALSE(choice.isShown(offers[0]));
  EXPECT_THAT(shown(), ElementsAre("0 first", "2 Visp (cannot be read)", "3 third")) << "colours stay";

  page.Outside().Expect("Add a Series", std::optional<std::string>());
  EXPECT_FALSE(choice.addFile(page.Outside()));
  page.Outside().Expect("Add a Series", std::optional<std::string>(folder.File("more.nds0")));
  page.Outside().Expect("Choose an item", std::optional<int>(0));
  EXPECT_TRUE(choice.addFile(page.Outside()));
  EXPECT_THAT(shown(), ElementsAre("0 first", "2 Visp (cannot be read)", "3 third", "1 Zermatt"));
  EXPECT_EQ(choice.offers().back().group, "more.nds0");
  EXPECT_THAT(page.Changes(), testing::IsEmpty()) << "nothing of it belongs to the setup";
}

}  // namespace
}  // namespace tervane::station_pages_test
