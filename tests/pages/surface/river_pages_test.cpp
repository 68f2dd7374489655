// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/surface/river_pages.h"

#include <gmock/gmock.h>

#include "forms/plots.h"
#include "libraries/river_network.h"
#include "overlays/overlays.h"
#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "spatial/domain.h"
#include "surface/rivers.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::river_pages_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using Path = std::optional<std::string>;

constexpr const char* kNetwork =
    "target FLUVANE_Network_editor {\n  section POINTS {\n    Point = 1, 0, 0, 0\n    Point = 2, 900, 0, 900\n  }\n"
    "  section BRANCHES {\n    section Branch_1 {\n      Name = \"Rhone\"\n      Points = 1, 2\n    }\n  }\n}\n";

class RiverPage : public testing::Test {
 public:
  test::TempFolder folder;
  CFlowModelDoc document;
  CRiverKvf& river = dynamic_cast<CRiverKvf&>(*document.Root().Important(kRiver));
  CRiverMFKvf& modflow = dynamic_cast<CRiverMFKvf&>(*document.Root().Important(kModflowRiver));
};

TEST_F(RiverPage, AnotherMainFileFixesTheOverlaysInTheSameStep) {
  auto* item = document.Root().Important(kForegroundOverlays)->AddItem();
  item->Type = COverlayItemKvf::kRiver;
  auto& overlay = dynamic_cast<COverlayRiverKvf&>(*item->Layer());
  overlay.SourceFvrNwkType = COverlayRiverKvf::kOfSetup;
  test::PageDriver page(document, "River");
  const std::string simulation =
      folder.Write("a.fvsim", "target FvRun {\n  section input {\n    nwk = file \"net.fvnwk\"\n  }\n}\n");
  EXPECT_EQ(page.Enter("River Simulation File:", simulation), "");
  EXPECT_EQ(overlay.SourceFvrNwkType, COverlayRiverKvf::kOfSetup);
  EXPECT_EQ(page.Enter("River Simulation File:", folder.File("b.fvproj")), "");
  EXPECT_EQ(river.GetFilename().Absolute(), folder.File("b.fvproj"));
  EXPECT_EQ(overlay.FvrNwkFilename_Specified.Absolute(), folder.File("net.fvnwk"));
  // The tree follows, since titles of overlays do.
  EXPECT_THAT(page.Changes(), ElementsAre(testing::StartsWith("9 "), testing::StartsWith("9 ")));
}

TEST_F(RiverPage, TheFileForWaterQualityShowsWhenRiversTakePartInIt) {
  test::PageDriver page(document, "River");
  Control& file = page.Find("River Simulation File for Water Quality:");
  int& quality = document.Root().Important(kModelComponents)->WQ;
  int& ofRivers = document.Root().Important(kWaterQualityComponents)->River;
  for (const auto& [wq, rivers] : {std::pair(0, 0), std::pair(1, 0), std::pair(0, 1), std::pair(1, 1)}) {
    quality = wq;
    ofRivers = rivers;
    EXPECT_EQ(file.IsShown(), wq && rivers);
  }
}

TEST_F(RiverPage, TheMapShowsTheNetworkOnTheDomainAndFollowsTheFile) {
  document.Root().Important(kBasicParameters)->ModelType = kEngineModflow96;
  test::PageDriver page(document, "RiverMF");
  Control& map = page.Find("Rivers and Lakes");
  EXPECT_FALSE(map.IsShown());
  EXPECT_EQ(page.Enter("Show Rivers map", "1"), "");
  EXPECT_TRUE(map.IsShown());
  EXPECT_TRUE(map.map().lines.empty());
  EXPECT_EQ(page.Enter("River Network File (*.FVNWK)", folder.Write("a.fvnwk", kNetwork)), "");
  ASSERT_EQ(map.map().lines.size(), 1U);
  EXPECT_EQ(map.map().lines[0].lines->front().name, "Rhone");
  // A network that cannot be read leaves the map without it; what is wrong stands on the page.
  folder.Write("a.fvnwk", "target FLUVANE_Network_editor {\n  12x\n");
  EXPECT_TRUE(map.map().lines.empty());
  EXPECT_THAT(page.Text(), HasSubstr("a.fvnwk:2:"));
}

TEST_F(RiverPage, ANewNetworkIsWrittenAndChosen) {
  test::PageDriver page(document, "RiverMF");
  page.Outside().Expect("Create River Network File", Path());
  page.Page().Press(page.Find("Create..."));
  EXPECT_TRUE(modflow.Filename.IsEmpty());
  page.Outside().Expect("Create River Network File", Path(folder.File("no/such.fvnwk")));
  page.Outside().Expect("such.fvnwk", Host::Answer::Ok);
  page.Page().Press(page.Find("Create..."));
  EXPECT_TRUE(modflow.Filename.IsEmpty());
  page.Outside().Expect("Create River Network File", Path(folder.File("new.fvnwk")));
  page.Page().Press(page.Find("Create..."));
  EXPECT_EQ(modflow.Filename.Absolute(), folder.File("new.fvnwk"));
  EXPECT_TRUE(CYbSimpleRiverData().ReadNetworkFile(folder.File("new.fvnwk")).Ok());
  EXPECT_THAT(page.Changes(), ElementsAre("9 Create River Network File"));
}

}  // namespace
}  // namespace tervane::river_pages_test
