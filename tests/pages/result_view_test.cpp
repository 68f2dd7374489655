// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/result_view.h"

#include <cmath>
#include <filesystem>

#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"

namespace tervane::result_view_test {
namespace {

using test::TempFolder;
using testing::ElementsAre;
using testing::HasSubstr;

/// Keeps settings, and is asked for nothing else.
struct Settings : NobodyToAsk {
  std::map<std::string, std::string> kept;

  std::string Setting(const std::string& name) const override {
    const auto found = kept.find(name);
    return found == kept.end() ? std::string() : found->second;
  }
  void SetSetting(const std::string& name, const std::string& value) override { kept[name] = value; }
};

struct Written {
  int nx = 3, ny = 2, layers = 2, steps = 4;
  float factor = 1;  ///< Of each value.
  int firstDay = 1;  ///< Of January.
  int itemType = quantity::kElevation;
  const char* item = "Head";
};

/// Items "Head", "Flow in x-direction" and "Flow in y-direction": 100 times the step, 10 times the layer, and the cell.
void Write(const std::string& path, const Written& written = {}) {
  NewDataFile content;
  content.dimensions = written.layers > 1 ? 3 : 2;
  content.geometry = FileGeometryOf({written.nx, written.ny, 50, 1000, 2000, 0, "NON-UTM"});
  content.geometry.nz = written.layers;
  content.items = {{written.item, written.itemType, BaseUnit(*FindItemType(written.itemType)).key, {}},
                   {"Flow in x-direction", quantity::kDischarge, 4100, {}},
                   {"Flow in y-direction", quantity::kDischarge, 4100, {}}};
  for (std::size_t i = 1; i < 3; ++i) content.items[i].unitKey = BaseUnit(*FindItemType(quantity::kDischarge)).key;
  DataFileWriter writer;
  test::Require(writer.Create(path, content));
  const int cells = written.nx * written.ny;
  for (int step = 0; step < written.steps; ++step) {
    test::Require(writer.AddStep(CYbDateTime(2000, 1, written.firstDay + step)));
    std::vector<float> values;
    for (int i = 0; i < cells * written.layers; ++i)
      values.push_back(written.factor * static_cast<float>(100 * step + 10 * (i / cells) + i % cells));
    values[1] = kDeleteValue;
    test::Require(writer.Put(1, values));
    test::Require(writer.Put(2, std::vector<float>(values.size(), 0.5F)));
    test::Require(writer.Put(3, std::vector<float>(values.size(), step == 2 ? -4.0F : 1.0F)));
  }
  test::Require(writer.Finish().error);
}

struct Results : testing::Test {
  TempFolder folder;
  Settings host;
  DisplayUnits units;
  std::string path = folder.File("heads.nds3");

  /// What the map shows when all is read.
  static MapContent MapOf(ResultView& view) {
    return Finished<MapContent>([&view] { return view.Map(); });
  }
  /// The values of the map's grid.
  static std::vector<float> ValuesOf(ResultView& view) {
    const MapContent map = MapOf(view);
    return map.grids.empty() ? std::vector<float>() : map.grids.front().grid->Values();
  }
};

TEST_F(Results, AColourMeansTheSameAtAllTimesAndInAllLayers) {
  Write(path);
  DataFileView file(path, &units);
  ResultView view(file, &units, host);
  file.ChooseSlice({2, 1});
  EXPECT_THAT(ValuesOf(view), ElementsAre(210, 211, 212, 213, 214, 215));
  EXPECT_EQ(MapOf(view).grids.front().range, std::pair(0.0F, 315.0F));
  EXPECT_EQ(file.Cell(0, 0), "213");
  file.ChooseSlice({0, 0});
  EXPECT_THAT(ValuesOf(view), ElementsAre(0, kUsualDeleteValue, 2, 3, 4, 5));
  EXPECT_EQ(MapOf(view).grids.front().range, std::pair(0.0F, 315.0F));
  // The step is read once while it is asked for.
  EXPECT_EQ(view.Frame(0), view.Frame(0));
  EXPECT_NE(view.Frame(0), view.Frame(1));
}

TEST_F(Results, ColoursAreRememberedForTheirQuantity) {
  Write(path);
  DataFileView file(path, &units);
  ResultView view(file, &units, host);
  EXPECT_EQ(view.Palette(), 0U);
  view.ChoosePalette(1);
  EXPECT_EQ(MapOf(view).grids.front().ramp, Ramp::VioletToYellow);
  file.Choose({2});
  EXPECT_EQ(view.Palette(), 0U) << "discharge is another quantity";
  DataFileView again(path, &units);
  EXPECT_EQ(ResultView(again, &units, host).Palette(), 1U);

  // That of the result viewer has sixteen classes at easy numbers of the user's unit.
  file.Choose({1});
  ASSERT_TRUE(units.Choose(quantity::kElevation, 1003));
  view.ChoosePalette(4);
  const auto scale = MapOf(view).grids.front().scale;
  ASSERT_EQ(scale.size(), 16U);
  EXPECT_EQ(scale.front().color, 0x800080U);
  EXPECT_NEAR((scale[1].upTo - scale[0].upTo) / 0.3048, 80, 1e-3);
  EXPECT_GE(scale.back().upTo, 315);
}

TEST_F(Results, DifferencesHaveOneScaleOnBothSidesOfNought) {
  Write(path);
  Write(folder.File("other.nds3"), {.factor = 2, .firstDay = 2});
  DataFileView file(path, &units);
  ResultView view(file, &units, host);
  file.ChooseSlice({2, 0});
  view.SubtractStep(3);
  EXPECT_EQ(view.DifferenceText(), "Minus 2000-01-04 00:00");
  EXPECT_THAT(ValuesOf(view), ElementsAre(-100, kUsualDeleteValue, -100, -100, -100, -100));
  EXPECT_EQ(MapOf(view).grids.front().range, std::pair(-300.0F, 300.0F));
  EXPECT_EQ(MapOf(view).grids.front().ramp, Ramp::Difference);

  // Of another run, at the same time: its first step is our second one.
  ASSERT_EQ(view.SubtractFile(folder.File("other.nds3")), "");
  EXPECT_EQ(view.DifferenceText(), "Minus other.nds3");
  EXPECT_THAT(ValuesOf(view), ElementsAre(0, kUsualDeleteValue, -2, -3, -4, -5));
  EXPECT_EQ(MapOf(view).grids.front().range, std::pair(-105.0F, 105.0F));
  file.ChooseSlice({0, 0});
  EXPECT_THAT(MapOf(view).message, HasSubstr("other.nds3 has no values at 2000-01-01 00:00"));
  view.SubtractNothing();
  EXPECT_EQ(MapOf(view).message, "");
}

TEST_F(Results, WhatCannotBeSubtractedIsTold) {
  Write(path);
  DataFileView file(path, &units);
  ResultView view(file, &units, host);
  struct Row {
    Written written;
    const char* expected;
  };
  const Row rows[] = {{{.nx = 4}, "3 × 2 of 50 m at 1000, 2000 were expected"},
                      {{.itemType = quantity::kWaterDepth}, "another quantity than Head"},
                      {{.firstDay = 9}, "no step at the time of one of heads.nds3"},
                      {{.layers = 1}, "were expected"}};
  for (const Row& row : rows) {
    Write(folder.File("other.nds3"), row.written);
    EXPECT_THAT(view.SubtractFile(folder.File("other.nds3")), HasSubstr(row.expected));
    EXPECT_FALSE(view.IsDifference());
    std::filesystem::remove(folder.File("other.nds3"));
  }
  EXPECT_THAT(view.SubtractFile(folder.File("gone.nds3")), HasSubstr("gone.nds3"));
  folder.Write("text.nds3", "no grid");
  EXPECT_THAT(view.SubtractFile(folder.File("text.nds3")), HasSubstr("text.nds3"));
}

TEST_F(Results, ADifferenceOfDegreesIsNotShownWithTheOffsetOfTheirScale) {
  Write(path, {.itemType = quantity::kTemperature, .item = "Temperature"});
  ASSERT_TRUE(units.Choose(quantity::kTemperature, 2801));
  DataFileView file(path, &units);
  ResultView view(file, &units, host);
  EXPECT_NE(file.TableText(), "Temperature [°C]");
  view.SubtractStep(0);
  file.ChooseSlice({1, 0});
  EXPECT_EQ(MapOf(view).grids.front().grid->ItemType(), quantity::kUndefined);
  EXPECT_EQ(file.Cell(1, 0), "100");
  EXPECT_EQ(file.TableText(), "Temperature [°C]");
}

TEST_F(Results, FlowFollowsTheStepAndItsLongestArrowDoesNot) {
  Write(path);
  DataFileView file(path, &units);
  ResultView view(file, &units, host);
  MapOf(view);
  view.Forget();
  ASSERT_THAT(view.Flows(), ElementsAre("Flow in x-direction"));
  EXPECT_FALSE(MapOf(view).arrows);
  view.ShowFlow(0);
  for (const std::size_t step : {0U, 2U}) {
    file.ChooseSlice({step, 1});
    const auto arrows = MapOf(view).arrows;
    ASSERT_TRUE(arrows);
    EXPECT_EQ(arrows->strongest, 4);
    EXPECT_EQ(arrows->x->Value(0, 0), 0.5F);
    EXPECT_EQ(arrows->y->Value(0, 0), step == 2 ? -4 : 1);
  }
}

TEST_F(Results, CellsOverTimeAndValuesAlongALine) {
  Write(path);
  DataFileView file(path, &units);
  ResultView view(file, &units, host);
  file.ChooseSlice({1, 1});
  const auto series = [&view] { return Finished<SeriesContent>([&view] { return view.CellSeries(); }); };
  EXPECT_THAT(series().message, HasSubstr("Click a cell"));
  view.PickCell(2, 1);
  ASSERT_EQ(series().series.size(), 1U);
  EXPECT_THAT(series().series[0].values, ElementsAre(15, 115, 215, 315));
  EXPECT_EQ(series().series[0].name, "Cell 2, 1");
  EXPECT_EQ(series().markers.front().time, CYbDateTime(2000, 1, 2));
  EXPECT_EQ(MapOf(view).points.front().points.front(), (MapPoint{1125, 2075}));
  view.PickCell(0, 0);
  EXPECT_EQ(series().series.size(), 1U) << "the next one takes its place";
  view.KeepCells(true);
  view.PickCell(1, 0);
  view.PickCell(1, 0);
  ASSERT_EQ(series().series.size(), 2U);
  file.ChooseSlice({1, 0});
  MapOf(view);
  EXPECT_TRUE(std::isnan(series().series[1].values[0])) << "another layer, where the value is missing";
  view.SubtractStep(0);
  MapOf(view);
  EXPECT_THAT(series().series[0].values, ElementsAre(0, 100, 200, 300));
  view.SubtractNothing();

  const auto profile = [&view] { return Finished<SeriesContent>([&view] { return view.Profile(); }); };
  EXPECT_THAT(profile().message, HasSubstr("Draw a line"));
  view.TakeLine({{1000, 2025}, {1149, 2025}});
  const Series along = profile().series.front();
  EXPECT_EQ(along.positions.back(), 149);
  EXPECT_EQ(along.values.front(), 100);
  EXPECT_EQ(along.values.back(), 102);
  EXPECT_TRUE(std::isnan(along.values[along.values.size() / 2]));
  file.ChooseSlice({3, 0});
  EXPECT_EQ(profile().series.front().values.front(), 300);
}

TEST_F(Results, ASetupOfTheViewerBringsItsPaletteFlowAndLayers) {
  Write(path);
  ViewedSetup setup;
  setup.result = {path, 1, 1, 0.25, "Head [foot]", {{{1, 2, 3}, 100}, {{4, 5, 6}, 2000}}};
  setup.flow = ViewedFlow{path, 2, 3, 1, true};
  setup.overlays.push_back({ViewedOverlay::Kind::Shape, folder.File("gone.shp"), {}, 1000, true, 0, {}, true});
  test::WriteShapes(folder.File("lakes.shp"), ShapeKind::Polygon, AttributeKind::Text, {std::string("Loch")});
  setup.overlays.push_back({ViewedOverlay::Kind::Shape, folder.File("lakes.shp"), {}, 1000, true, 0x010203, {}});
  setup.overlays.push_back({ViewedOverlay::Kind::Shape, folder.File("lakes.shp"), {}, 1000, false, 0, {}});
  setup.overlays.push_back(
      {ViewedOverlay::Kind::Image, folder.Write("map.png", ""), {}, 0, true, 0, {1, 2, 3, 4}, true});
  DataFileView file(path, &units);
  ResultView view(file, &units, host);
  view.TakeSetup(setup);
  const MapContent map = MapOf(view);
  ASSERT_EQ(map.grids.size(), 1U);
  EXPECT_EQ(map.grids.front().transparency, 0.25);
  ASSERT_EQ(map.grids.front().scale.size(), 2U);
  // In the unit that its title names, whatever the user's is.
  EXPECT_NEAR(map.grids.front().scale[0].upTo, 30.48, 1e-9);
  EXPECT_EQ(map.grids.front().scale[1].color, 0x040506U);
  EXPECT_TRUE(map.arrows);
  // What is hidden or gone is left out.
  ASSERT_EQ(map.below.size(), 1U);
  EXPECT_EQ(std::get<ShapeLayer>(map.below.front().drawn).lineColor, 0x010203U);
  ASSERT_EQ(map.above.size(), 1U);
  EXPECT_EQ(std::get<ImageLayer>(map.above.front().drawn).top, 4);
  view.ChoosePalette(0);
  EXPECT_THAT(MapOf(view).grids.front().scale, testing::IsEmpty());
}

TEST_F(Results, ValuesThatAreMissingOrEnormousAreNoTrouble) {
  struct Row {
    std::vector<float> values;
    bool hasRange;
  };
  for (const Row& row : {Row{{kDeleteValue, kDeleteValue}, false}, Row{{NAN, INFINITY}, false},
                         Row{{3e38F, -3e38F}, true}, Row{{1e38F, kDeleteValue}, true}}) {
    NewDataFile content;
    content.geometry = FileGeometryOf({2, 1, 50, 0, 0, 0, "NON-UTM"});
    content.items = {{"Head", quantity::kElevation, 1000, {}}};
    DataFileWriter writer;
    test::Require(writer.Create(folder.File("odd.nds2"), content));
    for (int step = 0; step < 2; ++step) {
      test::Require(writer.AddStep(CYbDateTime(2000, 1, 1 + step)));
      std::vector<float> values = row.values;
      if (step == 1) std::swap(values[0], values[1]);
      test::Require(writer.Put(1, values));
    }
    test::Require(writer.Finish().error);
    DataFileView file(folder.File("odd.nds2"), &units);
    ResultView view(file, &units, host);
    for (std::size_t palette = 0; palette < view.Palettes().size(); ++palette) {
      view.ChoosePalette(palette);
      const MapContent map = MapOf(view);
      ASSERT_EQ(map.grids.size(), 1U);
      EXPECT_EQ(map.grids.front().range.has_value(), row.hasRange);
    }
    view.SubtractStep(1);
    EXPECT_EQ(MapOf(view).grids.size(), 1U);
    view.PickCell(0, 0);
    EXPECT_EQ(Finished<SeriesContent>([&view] { return view.CellSeries(); }).series.size(), 1U);
  }
}

}  // namespace
}  // namespace tervane::result_view_test
