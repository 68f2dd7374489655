// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "subsurface/soil_profiles.h"

#include <gmock/gmock.h>

#include "simspec/model_components.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::soil_profiles_test {
namespace {

using test::TestSetup;
using testing::HasSubstr;
using testing::IsEmpty;

const std::string kZones = "Unsatzone/UZSoilProfiles";
const std::string kZone = kZones + "/UZSoilProfileProp";

std::string Profiles(const std::string& keys) {
  return "section Unsatzone {\nsection UZSoilProfiles {\n" + keys + "}\n}";
}

TEST(SoilProfiles, ANewSetupHasOneForTheWholeArea) {
  TestSetup setup;
  EXPECT_EQ(setup.WrittenKeys(kZones),
            "DistributionType=0 Type=1 ShapeAxisUnit=1000 ShapeGapFillName=\"\" NO_SOIL_PROFILES=1");
  EXPECT_EQ(setup.WrittenKeys(kZone),
            "ProfileSecNumber=1 GridCode=\"Global\" SoilProfile_ID=\"Global\" BYP=0.25f THR1=0.15f THR2=0.05f");
  EXPECT_EQ(setup.Written(kZone + "/CUZSoilProfilePropLayerListKvf/UZSoilProfilePropLayerItem1:DataBase"), "file \"\"");
  EXPECT_EQ(setup.Written(kZone + "/CUZSoilProfilePropDiscrListKvf/UZSoilProfilePropDiscr1:NoCells"), "5");
}

TEST(SoilProfiles, AFileThatCountsThemHasNoOther) {
  const std::string zone =
      "section UZSoilProfileProp {\nProfileSecNumber = 7\nGridCode = \"3\"\nSoilProfile_ID = \"x\"\n}\n";
  const struct {
    std::string keys;
    std::vector<std::string> titles;
  } cases[] = {
      {"NO_SOIL_PROFILES = 1\n" + zone, {"x"}},
      {"NO_SOIL_PROFILES = 2\n" + zone + zone, {"x", "x"}},
      {"NO_SOIL_PROFILES = 0\n", {}},
      {"DistributionType = 0\n", {"Global"}},
  };
  for (const auto& [keys, titles] : cases) {
    TestSetup setup(Profiles(keys));
    EXPECT_EQ(ZoneItemTitles(setup.At<CUZSoilProfileKvf>(kZones)), titles);
    // Once more over the same nodes.
    ASSERT_TRUE(setup.OpenText(test::SetupText(14, Profiles(keys)), "/setups/x.tvd"));
    EXPECT_EQ(ZoneItemTitles(setup.At<CUZSoilProfileKvf>(kZones)), titles);
    EXPECT_EQ(setup.Written(kZone + ":ProfileSecNumber"), titles.empty() ? "" : "1");
  }
}

class Profile : public testing::Test {
 protected:
  test::TempFolder folder_;
  TestSetup setup_;
  CUZSoilProfilePropKvf& profile_ = setup_.At<CUZSoilProfilePropKvf>(kZone);
  CUZSoilProfilePropLayerItemKvf& layer_ = *profile_.Soils().GetItem(1);

  Profile() { WithColumns(setup_); }
  static void WithColumns(TestSetup& setup) {
    setup.At<CModelCompKvf>("SimSpec/ModelComp").UZ_ModelType = kRichardsEquation;
  }
};

TEST_F(Profile, SoilsAreThoseOfALibrary) {
  const std::string path = folder_.Write("a.uzs", "target TERVANE_SOILS {\nsection Soil_1 {\nName = \"Loam\"\n}\n}\n");
  const struct {
    std::string file, soil;
    const char *finding, *detail;
    bool isValid;
  } cases[] = {
      {"", "Loam", "No filename and/or layername selected", "", false},
      {path, "", "No filename and/or layername selected", "", false},
      {folder_.File("b.uzs"), "Loam", "Filename and/or layername not found", "b.uzs", false},
      {path, "Clay", "Filename and/or layername not found", "it has Loam", false},
      {path, "Loam", "The soil cannot be used as its library has it", "Retention is missing", true},
  };
  for (const auto& c : cases) {
    layer_.DataBase = FileName(c.file, "");
    layer_.SoilID = c.soil;
    EXPECT_EQ(layer_.Validate() != 0, c.isValid);
    ASSERT_EQ(layer_.Findings().size(), 1u) << c.finding;
    EXPECT_EQ(layer_.Findings()[0].text, c.finding);
    EXPECT_THAT(layer_.Findings()[0].detail, HasSubstr(c.detail));
  }
}

TEST_F(Profile, AFolderIsNoLibrary) {
  TestSetup read(
      Profiles("NO_SOIL_PROFILES = 1\nsection UZSoilProfileProp {\nsection CUZSoilProfilePropLayerListKvf {\n"
               "NumberOfLayers = 1\nsection UZSoilProfilePropLayerItem1 {\nSoilID = \"Loam\"\n"
               "DataBase = file \"C:\\\\soils\\\\\"\n}\n}\n}\n"));
  WithColumns(read);
  auto& layer = *read.At<CUZSoilProfilePropKvf>(kZone).Soils().GetItem(1);
  EXPECT_TRUE(layer.DataBase.IsEmpty()) << layer.DataBase.Text();
  EXPECT_EQ(layer.Validate(), 0);
  ASSERT_EQ(layer.Findings().size(), 1u);
  EXPECT_EQ(layer.Findings()[0].text, "No filename and/or layername selected");
}

TEST_F(Profile, NotesWhereSoilsAndCellsEndApart) {
  EXPECT_EQ(profile_.WhyEndsDiffer(), "");
  auto& cells = profile_.Cells();
  cells.SetItemCount(3, 1);
  const std::pair<int, float> values[] = {{5, 0.2f}, {10, 0.5f}, {1, 2.0f}};
  for (int i = 0; i < 3; ++i) {
    cells.GetItem(i + 1)->NoCells = values[i].first;
    cells.GetItem(i + 1)->CellHeight = values[i].second;
  }
  EXPECT_EQ(profile_.WhyEndsDiffer(), "the soils end 1 m and the cells 8 m below ground");
  profile_.ValidateData();
  ASSERT_EQ(profile_.Findings().size(), 1u);
  EXPECT_EQ(profile_.Findings()[0].severity, Severity::Note);
  layer_.Depth = 8;
  EXPECT_EQ(profile_.WhyEndsDiffer(), "");
}

TEST_F(Profile, DispersivityIsNotNegative) {
  auto& cells = *profile_.Cells().GetItem(1);
  EXPECT_EQ(cells.Validate(), 1);
  cells.Dispersivity = -1;
  EXPECT_EQ(cells.Validate(), 0);
  ASSERT_EQ(cells.Findings().size(), 1u);
  EXPECT_EQ(cells.Findings()[0].text, "Dispersivity must be greater than 0.");
}

}  // namespace
}  // namespace tervane::soil_profiles_test
