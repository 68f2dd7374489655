// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/stations.h"

#include <filesystem>
#include <functional>

#include <fmt/ranges.h>
#include <gmock/gmock.h>

#include "platform/item_types.h"
#include "spatial/domain.h"
#include "surface/climate.h"
#include "tests/support/data_files.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::stations_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;

class Stations : public testing::Test {
 protected:
  using Forcing = C2DStationBasedDataKvf;
  using Station = C2DStationBasedDataTimeSeriesKvf;

  void UseCodes(std::vector<float> codes) {
    test::WriteCodes(folder.File("codes.nds2"), std::move(codes));
    forcing.DistributionType = Forcing::kStationBased;
    forcing.Stations().TYPE = CStationBasedKvf::kGridCodes;
    forcing.Stations().GridFile().Choose(FileName("codes.nds2", folder.Path()));
  }
  void UsePolygons(AttributeKind kind, const std::vector<ShapeValue>& values) {
    test::WriteShapes(folder.File("areas.shp"), ShapeKind::Polygon, kind, values);
    forcing.DistributionType = Forcing::kStationBased;
    forcing.Stations().TYPE = CStationBasedKvf::kPolygons;
    forcing.Stations().ShapeFile().Choose(FileName("areas.shp", folder.Path()), "CODE");
  }
  Station& At(const std::string& id) {
    auto* station = dynamic_cast<Station*>(forcing.SelectStationByName(id));
    if (!station) throw std::runtime_error("there is no station " + id);
    return *station;
  }
  std::string Ids() {
    std::vector<std::string> ids;
    for (const CFMSEKvfGroupBase* station : ZoneItems(forcing)) ids.push_back(station->GetStationId());
    return fmt::format("{}", fmt::join(ids, " "));
  }

  test::TempFolder folder;
  CFlowModelDoc document;
  Forcing& forcing = *document.Root().Important(kPrecipitation);
};

TEST_F(Stations, FollowTheCodesOfTheGridOrTheValuesOfThePolygons) {
  using I = std::int64_t;
  const float empty = kUsualDeleteValue;
  const struct {
    const char* what;
    std::function<void()> change;
    SyncResult result;
    const char* ids;
  } steps[] = {
      {"a first grid",
       [&] {
         UseCodes({7, 3, 7, empty, 12});
       },
       kAdded, "3 7 12"},
      {"the same", [] {}, kNothing, "3 7 12"},
      {"others",
       [&] {
         UseCodes({12, 5});
       },
       kAddedAndRemoved, "5 12"},
      {"fewer", [&] { UseCodes({12}); }, kRemoved, "12"},
      {"no code", [&] { UseCodes({empty}); }, kNothing, "12"},
      {"no data file", [&] { folder.Write("codes.nds2", "no data file"); }, kNothing, "12"},
      {"whole numbers",
       [&] {
         UsePolygons(AttributeKind::Whole, {I{12}, I{9}, I{110}, I{9}});
       },
       kAdded, "9 12 110"},
      {"numbers",
       [&] {
         UsePolygons(AttributeKind::Real, {20.5, 3.0});
       },
       kAddedAndRemoved, "3.000000 20.500000"},
      {"texts",
       [&] {
         UsePolygons(AttributeKind::Text, {"b10", "b9", ""});
       },
       kAddedAndRemoved, "  b10 b9"},
      {"no table", [&] { folder.Write("areas.dbf", ""); }, kNothing, "  b10 b9"},
      {"one series for all", [&] { forcing.DistributionType = Forcing::kUniform; }, kRemoved, ""},
      {"nothing to do", [] {}, kNothing, ""},
      {"without a file",
       [&] {
         UsePolygons(AttributeKind::Text, {"a"});
         forcing.SyncStations();
         forcing.Stations().ShapeFile().Choose({}, "");
       },
       kRemoved, ""},
  };
  for (const auto& step : steps) {
    SCOPED_TRACE(step.what);
    step.change();
    EXPECT_EQ(forcing.SyncStations(), step.result);
    EXPECT_EQ(Ids(), step.ids);
  }
}

TEST_F(Stations, KeepWhatTheyHoldWhileTheirCodeIsThere) {
  UseCodes({2, 4});
  forcing.SyncStations();
  EXPECT_EQ(At("2").GetStationName(), "Grid code = 2");
  EXPECT_EQ(At("2").GetTitle(), "Precipitation Rate");
  At("4").FIXED_VALUE = 1.5F;
  At("4").SetStationName("Sion");
  UseCodes({1, 4});
  forcing.SyncStations();
  EXPECT_EQ(At("4").FIXED_VALUE, 1.5F);
  EXPECT_THAT(forcing.GetStationNames(), ElementsAre("Grid code = 1", "Sion"));
  EXPECT_EQ(At("4").GetNumberWhatAmI(), 2);  // among the stations alone
}

TEST_F(Stations, OnlyThoseThatAUserWorkedOnAreNamedBeforeTheyGo) {
  const std::pair<const char*, std::function<void(Station&)>> edits[] = {
      {"name", [](Station& s) { s.SetStationName("Sion"); }},
      {"value", [](Station& s) { s.FIXED_VALUE = 1; }},
      {"constant", [](Station& s) { s.TYPE = Station::kConstant; }},
      {"elevation", [](Station& s) { s.Elevation = 482; }},
      {"series", [](Station& s) { s.SeriesFile().Choose(FileName("rain.nds0", "")); }},
  };
  for (const auto& [what, edit] : edits) {
    SCOPED_TRACE(what);
    UseCodes({1, 2, 3});
    forcing.SyncStations();
    edit(At("2"));
    edit(At("3"));
    UseCodes({3});
    const SyncPlan plan = forcing.PlanStations(forcing.FindStations());
    EXPECT_EQ(plan.removed.size(), 2U);
    EXPECT_THAT(plan.editedRemoved, ElementsAre(&At("2")));
    UseCodes({9});
    forcing.SyncStations();
  }
}

TEST_F(Stations, AreWrittenWithTheirCodesAndReadInTheirOrder) {
  using S = std::string;
  UsePolygons(AttributeKind::Text, {S("11 b"), S("none")});
  forcing.SyncStations();
  const std::string text = test::SavedText(document);
  EXPECT_THAT(text, HasSubstr("NO_TIMESERIES = 2"));
  CFlowModelDoc reopened;
  ASSERT_TRUE(reopened.OpenText(text, folder.File("a.tvd")));
  EXPECT_EQ(test::SavedText(reopened), text);
  const std::pair<const char*, const char*> values[] = {
      {"TIME_SERIES_1:GRIDCODEID", "11 b"}, {"TIME_SERIES_1:GRIDCODE", "11"}, {"TIME_SERIES_2:GRIDCODE", "0"},
      {"TIME_SERIES_2:NAME", "none"},       {"TIME_SERIES_2:TYPE", "2"},      {"STATION_BASED:TYPE", "2"}};
  for (const auto& [key, value] : values)
    EXPECT_EQ(test::ValueOf(reopened, std::string("Climate/PrecipitationRate/") + key), value) << key;
}

TEST_F(Stations, OfACountThatTheFileDoesNotHoldAreAtTheirDefaults) {
  const struct {
    const char* count;
    std::size_t stations, notes;
  } cases[] = {
      {"3", 3, 0}, {"0", 0, 0}, {"-1", 0, 1}, {"2147483647", 1001, 1}};  // One section stands there, of another kind.
  for (const auto& c : cases) {
    CFlowModelDoc opened;
    ASSERT_TRUE(opened.OpenText(
        test::SetupText(14, std::string("section Climate {\nsection PrecipitationRate {\nDistributionType = 2\n"
                                        "section STATION_BASED {\nNO_TIMESERIES = ") +
                                c.count + "\n}\n}\n}"),
        "a.tvd"));
    const auto& read = *opened.Root().Important(kPrecipitation);
    EXPECT_EQ(ZoneItems(read).size(), c.stations);
    EXPECT_EQ(opened.Report().entries.size(), c.notes);
    for (const CFMSEKvfGroupBase* station : ZoneItems(read)) EXPECT_EQ(station->GetStationName(), "Undefined");
  }
}

TEST_F(Stations, APolygonFileNeedsTheAttributeThatTellsTheStationsApart) {
  UsePolygons(AttributeKind::Text, {"A", "B"});
  CData2DShpFile& file = forcing.Stations().ShapeFile();
  const auto why = [&](const char* attribute) {
    file.Choose(FileName("areas.shp", folder.Path()), attribute);
    document.Root().Validate();
    return file.Findings().empty() ? std::string()
                                   : file.Findings().front().text + ": " + file.Findings().front().detail;
  };
  EXPECT_EQ(why("CODE"), "");
  EXPECT_THAT(why(""), HasSubstr("File is not valid: " + folder.File("areas.shp") + ": no attribute is selected"));
  EXPECT_THAT(why("NOWHERE"), HasSubstr("NOWHERE"));
  std::filesystem::remove(folder.File("areas.dbf"));
  EXPECT_THAT(why("CODE"), HasSubstr("does not exist beside it"));
}

TEST_F(Stations, WithoutACellOfTheModelAreWarnedOf) {
  test::WriteGrid(folder.File("domain.nds2"), {3, 1, 100, 0, 0, 0, {}}, {2, 1, kUsualDeleteValue}, quantity::kCode);
  document.Root().Important(kDomain)->GridFile().Choose(FileName("domain.nds2", folder.Path()));
  test::WriteGrid(folder.File("codes.nds2"), {3, 1, 100, 0, 0, 0, {}}, {4, 7, 9}, quantity::kCode);
  forcing.DistributionType = Forcing::kStationBased;
  forcing.Stations().TYPE = CStationBasedKvf::kGridCodes;
  forcing.Stations().GridFile().Choose(FileName("codes.nds2", folder.Path()));
  forcing.SyncStations();
  ASSERT_EQ(Ids(), "4 7 9");
  const auto warned = [&] {
    document.Root().Validate();
    std::string ids;
    for (const CFMSEKvfGroupBase* station : ZoneItems(forcing))
      for (const Finding& finding : station->Findings())
        if (finding.text.starts_with("It gets no cell")) ids += station->GetStationId() + " ";
    return ids;
  };
  EXPECT_EQ(warned(), "9 ");  // Outside the domain.
  At("7").SetStationId("007");
  At("4").SetStationId("5");
  EXPECT_EQ(warned(), "5 9 ");
  // Where the areas are not known, nothing is said of them.
  forcing.Stations().GridFile().Choose(FileName("gone.nds2", folder.Path()));
  EXPECT_EQ(warned(), "");
}

TEST_F(Stations, OnlyTheFileOfTheStateInForceIsChecked) {
  UseCodes({1});
  forcing.SyncStations();
  At("1").SeriesFile().Choose({});
  forcing.Stations().GridFile().Choose({});
  const auto faults = [&] {
    forcing.Validate();
    std::string found;
    const std::pair<const char*, const CYbSEKvfBase*> files[] = {
        {"series ", &forcing.Global().SeriesFile()},
        {"codes ", &forcing.Stations().GridFile()},
        {"polygons ", &forcing.Stations().ShapeFile()},
        {"grids ", &forcing.FullyDistributed().GridFile()},
        {"station", ZoneItems(forcing).front()->GetFirstChild()}};
    for (const auto& [name, file] : files) found += file->Findings().empty() ? "" : name;
    return found;
  };
  const struct {
    int distribution, globalType, stationsType, stationType;
    const char* faults;
  } cases[] = {{0, 0, 0, 1, ""},       {0, 1, 1, 1, "series "},          {1, 1, 0, 1, "codes station"},
               {1, 1, 0, 0, "codes "}, {1, 0, 1, 1, "polygons station"}, {2, 1, 1, 1, "grids "}};
  for (const auto& c : cases) {
    forcing.DistributionType = c.distribution;
    forcing.Global().TYPE = c.globalType;
    forcing.Stations().TYPE = c.stationsType;
    At("1").TYPE = c.stationType;
    EXPECT_EQ(faults(), c.faults) << c.distribution << c.globalType << c.stationsType << c.stationType;
    // They stay in the tree whatever is in force.
    EXPECT_EQ(At("1").IsDataUsedInSetup(), c.distribution == 1);
  }
}

}  // namespace
}  // namespace tervane::stations_test
