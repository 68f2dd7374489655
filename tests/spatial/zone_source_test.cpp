// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "spatial/zone_source.h"

#include <fmt/ranges.h>
#include <gmock/gmock.h>

#include "spatial/pages.h"
#include "spatial/station_owner.h"
#include "spatial/zones.h"
#include "tests/core/node_tree.h"
#include "tests/support/data_files.h"
#include "tests/support/temp_folder.h"

namespace tervane::zone_source_test {
namespace {

using testing::ElementsAre;

constexpr ZoneKey kNameInFront[] = {
    {ZonePart::Name, "AreaName"}, {ZonePart::Id, "AreaCodeID"}, {ZonePart::Code, "AreaCode"}};
constexpr ZoneKey kNameBehind[] = {
    {ZonePart::Number, "ProfileSecNumber"}, {ZonePart::Id, "GridCode"}, {ZonePart::Name, "Profile_ID"}};

/// A zone with one value of its own.
template <const auto& zoneKeys>
class Zone : public CodedZoneProp {
 public:
  explicit Zone(CYbSEKvfBase* parent) : CodedZoneProp(zoneKeys, "Zone", "Zone", parent) {}

  float Depth = 1;

 protected:
  void ExchangeKeys(KeyExchange& keys) override {
    CodedZoneProp::ExchangeKeys(keys);
    keys("Depth", Depth);
  }
};

constexpr KeyChoice kWithNone[] = {{-1, "None"}, {0, "Grid codes (.nds2)"}, {1, "Polygons (.shp)"}};

constexpr CodedZonesKind kWithoutGapFill{.className = "Areas",
                                         .title = "Areas",
                                         .section = "Areas",
                                         .source = {.hasGapFill = false, .countKey = "NO_AREAS"},
                                         .makeZone = MakeZone<Zone<kNameInFront>>,
                                         .page = &kSubcatchmentPage};
constexpr CodedZonesKind kFirstUniform{
    .className = "Profiles",
    .title = "Profiles",
    .section = "Profiles",
    .source = {.countKey = "NO_PROFILES", .noValues = "Could not find any values in grid file."},
    .distribution = 0,
    .makeZone = MakeZone<Zone<kNameBehind>>,
    .page = &kSubcatchmentPage};
constexpr CodedZonesKind kAlwaysDistributed{
    .className = "Boundaries",
    .title = "Boundaries",
    .section = "Boundaries",
    .source = {.types = kWithNone, .type = ZoneSource::kNone, .hasGapFill = false, .countKey = "NoBoundaries"},
    .distribution = std::nullopt,
    .makeZone = MakeZone<Zone<kZoneKeys>>,
    .page = &kSubcatchmentPage};
constexpr CodedZonesKind kMapOnly{.className = "Priorities",
                                  .title = "Priorities",
                                  .section = "Priorities",
                                  .source = {.hasGapFill = false},
                                  .makeZone = nullptr,
                                  .page = &kSubcatchmentPage};

class ZoneSources : public testing::Test {
 protected:
  CodedZonesKvf& Make(const CodedZonesKind& kind) { return *root.NewChild<CodedZonesKvf>(kind); }
  void UseCodes(ZoneSource& source, std::vector<float> codes) {
    test::WriteCodes(folder.File("codes.nds2"), std::move(codes));
    source.Type = ZoneSource::kGridCodes;
    source.GridFile().Choose(FileName("codes.nds2", folder.Path()));
  }

  test::TempFolder folder;
  test::Root root;
};

/// What was saved without the sections of the two files, of which nothing is told here, and without state of the tree.
std::string KeysOf(const std::string& saved) {
  std::string keys;
  int skipped = 0;
  for (std::size_t start = 0; start < saved.size();) {
    const std::size_t end = std::min(saved.find_first_of(";{}", start), saved.size() - 1) + 1;
    const std::string part(Trimmed(std::string_view(saved).substr(start, end - start)));
    start = end;
    if (skipped > 0 || part.starts_with("section NDS_2D") || part.starts_with("section SHAPE_FILE"))
      skipped += part.back() == '{' ? 1 : part == "}" ? -1 : 0;
    else if (!part.starts_with("Touched"))
      keys += (keys.empty() ? "" : " ") + part;
  }
  return keys;
}

TEST_F(ZoneSources, EachKindOfZonesIsReadAndWrittenByItsRow) {
  const struct {
    const CodedZonesKind* kind;
    const char *fresh, *full;
  } cases[] = {
      {&kWithoutGapFill, "section Areas { DistributionType = 1; Type = 1; ShapeAxisUnit = 1000; NO_AREAS = 0; }",
       "section Areas { DistributionType = 0; Type = 2; ShapeAxisUnit = 1001; NO_AREAS = 2; "
       "section Zone { AreaName = \"north\"; AreaCodeID = \"7\"; AreaCode = 7; Depth = 2.5f; } "
       "section Zone { AreaName = \"\"; AreaCodeID = \"b\"; AreaCode = 0; Depth = 1f; } }"},
      {&kFirstUniform,
       "section Profiles { DistributionType = 0; Type = 1; ShapeAxisUnit = 1000; ShapeGapFillName = \"\"; "
       "NO_PROFILES = 0; }",
       "section Profiles { DistributionType = 1; Type = 1; ShapeAxisUnit = 1000; ShapeGapFillName = \"sand\"; "
       "NO_PROFILES = 1; section Zone { ProfileSecNumber = 1; GridCode = \"3\"; Profile_ID = \"sand\"; "
       "Depth = 0.5f; } }"},
      {&kAlwaysDistributed, "section Boundaries { Type = 0; ShapeAxisUnit = 1000; NoBoundaries = 0; }",
       "section Boundaries { Type = 1; ShapeAxisUnit = 1000; NoBoundaries = 1; "
       "section Zone { ProfileSecNumber = 1; GRIDCODEID = \"4\"; GRIDCODE = 4; Name = \"dam\"; Depth = 3f; } }"},
      {&kMapOnly, "section Priorities { DistributionType = 1; Type = 1; ShapeAxisUnit = 1000; }",
       "section Priorities { DistributionType = 0; Type = 2; ShapeAxisUnit = 1001; }"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.kind->section);
    test::Root tree;
    const auto& zones = *tree.NewChild<CodedZonesKvf>(*c.kind);
    EXPECT_EQ(ClassNameOf(zones), c.kind->className);
    EXPECT_EQ(KeysOf(test::Saved(tree)), c.fresh);
    EXPECT_THAT(test::LoadText(tree, c.full), ElementsAre());
    EXPECT_EQ(KeysOf(test::Saved(tree)), c.full);
    for (const CFMSEKvfGroupBase* zone : ZoneItems(zones))
      EXPECT_EQ(zone->GetAbbreviatedTitle(), zone->GetStationName());
    // What is read once more stands in the place of what was there.
    test::LoadText(tree, c.full);
    EXPECT_EQ(KeysOf(test::Saved(tree)), c.full);
  }
}

TEST_F(ZoneSources, ACountThatMakesNoSenseIsToldOfItsKey) {
  Make(kAlwaysDistributed);
  EXPECT_THAT(test::LoadText(root, "section Boundaries { NoBoundaries = -3; }"),
              ElementsAre("Boundaries:NoBoundaries: a count of -3 reads as 0"));
}

TEST_F(ZoneSources, EachKindFollowsItsSourceByItsRow) {
  const struct {
    const CodedZonesKind* kind;
    SyncResult fromCodes, withoutForce;
    const char *codes, *names, *namesWithoutForce;
  } cases[] = {
      {&kWithoutGapFill, kAdded, kAddedAndRemoved, "2 5", "Grid code = 2, Grid code = 5", "Global"},
      {&kFirstUniform, kAdded, kAddedAndRemoved, "2 5", "Grid code = 2, Grid code = 5", "Global"},
      {&kAlwaysDistributed, kAdded, kRemoved, "2 5", "Grid code = 2, Grid code = 5", ""},
      {&kMapOnly, kNothing, kNothing, "2 5", "", ""},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.kind->section);
    CodedZonesKvf& zones = Make(*c.kind);
    zones.DistributionType = CodedZonesKvf::kDistributed;
    UseCodes(zones, {5, 2});
    EXPECT_EQ(fmt::format("{}", fmt::join(zones.FindZones().ids, " ")), c.codes);
    EXPECT_EQ(zones.SyncZones(), c.fromCodes);
    EXPECT_EQ(fmt::format("{}", fmt::join(zones.GetZoneTitles(), ", ")), c.names);
    EXPECT_EQ(zones.CurrentSource().file, folder.File("codes.nds2"));
    EXPECT_TRUE(zones.GridFile().IsFileUsed());
    UseCodes(zones, {kUsualDeleteValue});
    EXPECT_EQ(zones.FindZones().message, c.kind->source.noValues);
    // Where the kind knows no uniform zones, none are there without a source.
    c.kind->distribution ? zones.DistributionType = CodedZonesKvf::kUniform : zones.Type = ZoneSource::kNone;
    EXPECT_EQ(zones.SyncZones(), c.withoutForce);
    EXPECT_EQ(fmt::format("{}", fmt::join(zones.GetZoneTitles(), ", ")), c.namesWithoutForce);
    EXPECT_EQ(zones.CurrentSource(), GridSource());
    EXPECT_FALSE(zones.GridFile().IsFileUsed());
  }
}

// ---- Stations of two quantities

class CropStation : public StationKvf {
 public:
  explicit CropStation(CYbSEKvfBase* parent) : StationKvf("Crop", parent) {}

  float Leaves = 0, Roots = 0;

 protected:
  void ExchangeKeys(KeyExchange& keys) override {
    StationKvf::ExchangeKeys(keys);
    keys("Leaves", Leaves);
    keys("Roots", Roots);
  }
};

class CropOwner : public StationOwnerKvf {
 public:
  explicit CropOwner(CYbSEKvfBase* parent) : StationOwnerKvf("Crops", "Crops", parent) { NewStations(); }

  std::shared_ptr<CFMSEKvfGroupBase> CreateStationItem() override { return std::make_shared<CropStation>(this); }
};

TEST_F(ZoneSources, AnOwnerOfStationsNeedsToKnowOnlyWhatItsStationsHold) {
  auto& crops = *root.NewChild<CropOwner>();
  const std::string text =
      "section Crops { DistributionType = 2; section STATION_BASED { NO_TIMESERIES = 1; TYPE = 1; "
      "ShapeAxisUnit = 1000; ShapeGapFillName = \"\"; } section TIME_SERIES_1 { NAME = \"maize\"; "
      "GRIDCODEID = \"8\"; GRIDCODE = 8; Leaves = 5f; Roots = 1.5f; } }";
  EXPECT_THAT(test::LoadText(root, text), ElementsAre());
  EXPECT_EQ(KeysOf(test::Saved(root)), text);

  UseCodes(crops.Stations(), {8, 9});
  EXPECT_EQ(crops.SyncStations(), kAdded);
  EXPECT_THAT(crops.GetStationNames(), ElementsAre("maize", "Grid code = 9"));
  EXPECT_EQ(ZoneItems(crops).front()->GetTitle(), "Crop");
  EXPECT_EQ(ZoneItems(crops).back()->GetTitle(), "Crops");  // of its owner, since it was found
  EXPECT_TRUE(ZoneItems(crops).front()->IsDlgUsedInSetup());
  crops.DistributionType = StationOwnerKvf::kUniform;
  EXPECT_FALSE(ZoneItems(crops).front()->IsDlgUsedInSetup());
  EXPECT_EQ(crops.SyncStations(), kRemoved);
}

}  // namespace
}  // namespace tervane::zone_source_test
