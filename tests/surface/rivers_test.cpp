// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "surface/rivers.h"

#include <gmock/gmock.h>

#include "libraries/river_network.h"
#include "overlays/overlays.h"
#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "tests/simspec/test_setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::rivers_test {
namespace {

using test::ReadFile;
using test::TempFolder;
using test::TestSetup;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

class Rivers : public testing::Test {
 public:
  TempFolder folder;
  TestSetup setup;
  CRiverKvf& river = setup.At<CRiverKvf>("River");
  CRiverMFKvf& modflow = setup.At<CRiverMFKvf>("RiverMF");
  int& engine = setup.At<CBasicParaKvf>("SimSpec").ModelType;
  int& component = setup.At<CModelCompKvf>("SimSpec/ModelComp").River;
  int& modflowComponent = setup.At<CModModelCompKvf>("SimSpec/ModModelComp").River;

  FileName Written(const std::string& name, const std::string& text) const {
    return FileName(folder.Write(name, text), "");
  }
  FileName Simulation(const std::string& name, const std::string& network) const {
    return Written(name, "target FvRun {\n  section input {\n    nwk = \"" + network + "\"\n  }\n}\n");
  }
  COverlayRiverKvf& AddOverlay(const char* list, int source, const char* own) {
    auto* item = setup.At<COverlayListKvf>(list).AddItem();
    item->Type = COverlayItemKvf::kRiver;
    auto& overlay = dynamic_cast<COverlayRiverKvf&>(*item->Layer());
    overlay.SourceFvrNwkType = source;
    overlay.FvrNwkFilename_Specified = FileName(own, "");
    return overlay;
  }
};

TEST_F(Rivers, EngineAndComponentDecideWhichNodeTakesPart) {
  river.FloodCodes = 1;
  const struct {
    int engine, component, modflowComponent;
    std::vector<std::string> used;
  } kCases[] = {{kEngineTervane, 0, 1, {}},
                {kEngineTervane, 1, 0, {"River", "River/FloodCodes"}},
                {kEngineModflow96, 1, 0, {}},
                {kEngineModflowSurfact, 0, 1, {"RiverMF"}},
                {kEngineModflow2000, 1, 1, {"RiverMF"}}};
  for (const auto& row : kCases) {
    engine = row.engine;
    component = row.component;
    modflowComponent = row.modflowComponent;
    std::vector<std::string> used;
    for (const char* path : {"River", "River/FloodCodes", "River/Bathymetry", "RiverMF"})
      if (setup.At<CYbSEKvfBase>(path).IsDataUsedInSetup()) used.emplace_back(path);
    EXPECT_EQ(used, row.used);
  }
}

TEST_F(Rivers, KeysAndChildrenOfOneNameAreReadAndWrittenInTheirOrder) {
  TestSetup read(
      "section River {\nFilename = file \"a.fvsim\"\nFilenameWQ = file \"b.fvsim\"\nBathymetry = 1\nFloodCodes = 0\n"
      "section FloodCodes {\nFixedValue = 3f\n}\nsection Bathymetry {\nRelativeToGround = 1\n}\n}\n"
      "section RiverMF {\nFilename = file \"c.FVNWK\"\nIncludeMap = 1\n}");
  EXPECT_TRUE(read.Report().IsEmpty());
  EXPECT_EQ(read.WrittenKeys("River"),
            "Filename=file \"a.fvsim\" FilenameWQ=file \"b.fvsim\" Bathymetry=1 FloodCodes=0");
  EXPECT_EQ(read.WrittenKeys("RiverMF"), "Filename=file \"c.FVNWK\" IncludeMap=1");
  EXPECT_EQ(read.Written("River/FloodCodes:FixedValue"), "3f");
  EXPECT_EQ(read.Written("River/Bathymetry:RelativeToGround"), "1");
  EXPECT_EQ(setup.Written("River/Bathymetry:RelativeToGround"), "0");
  EXPECT_EQ(setup.Written("River/FloodCodes:RelativeToGround"), "");
}

TEST_F(Rivers, AFileThatIsMissingIsAnError) {
  const auto errors = [](CYbSEKvfBase& node) {
    node.Validate();
    std::vector<std::string> texts;
    for (const Finding& finding : node.Findings()) texts.push_back(finding.key + ": " + finding.text);
    return texts;
  };
  component = modflowComponent = 1;
  const char* missing = "Filename: Fvr simulation file (*.FVSIM) is missing";
  EXPECT_THAT(errors(river), ElementsAre(missing));
  river.SetRiverFile(FileName(folder.File("none.fvsim"), ""));
  EXPECT_THAT(errors(river), ElementsAre(missing));
  EXPECT_THAT(river.Findings()[0].detail, HasSubstr("none.fvsim"));
  // What is in the file is the river model's.
  river.SetRiverFile(Written("a.fvsim", "12x"));
  EXPECT_THAT(errors(river), IsEmpty());
  EXPECT_THAT(errors(modflow), IsEmpty());
  engine = kEngineModflow96;
  EXPECT_THAT(errors(modflow), ElementsAre("Filename: The Fluvane River network file (fvnwk) is missing."));
}

TEST_F(Rivers, OverlaysKeepTheNetworkOfTheSimulationThatAProjectReplaces) {
  const FileName simulation = Simulation("old.FvSim", "net.fvnwk");
  const std::string network = folder.File("net.fvnwk");
  const struct {
    const char* what;
    FileName before, after;
    int engine, source;
    int sourceAfter;
    std::string own;
  } kCases[] = {
      {"it follows", simulation, FileName("/new.FVProj", ""), 0, 0, 1, network},
      {"it has a file of its own", simulation, FileName("/new.fvproj", ""), 0, 1, 1, "/own.fvnwk"},
      {"from simulation to simulation", simulation, FileName("/new.fvsim", ""), 0, 0, 0, "/own.fvnwk"},
      {"from project to simulation", FileName("/old.fvproj", ""), simulation, 0, 0, 0, "/own.fvnwk"},
      {"the simulation cannot be read", Written("bad.fvsim", "12x"), FileName("/new.fvproj", ""), 0, 0, 1, ""},
      {"with Modflow it is the network's", simulation, FileName("/new.fvproj", ""), 3, 0, 1, "/mf.fvnwk"},
  };
  modflow.SetFilename(FileName("/mf.fvnwk", ""));
  for (const auto& row : kCases) {
    SCOPED_TRACE(row.what);
    engine = row.engine;
    river.SetRiverFile(row.before);
    for (const char* list : {"Overlays/Foreground", "Overlays/Background"}) {
      setup.At<COverlayListKvf>(list).SetItemCount(0, 1);
      AddOverlay(list, row.source, "/own.fvnwk");
    }
    river.SetRiverFile(row.after);
    EXPECT_EQ(river.GetFilename(), row.after);
    for (const char* list : {"Overlays/Foreground", "Overlays/Background"}) {
      const auto& overlay = dynamic_cast<COverlayRiverKvf&>(*setup.At<COverlayListKvf>(list).GetItem(1)->Layer());
      EXPECT_EQ(overlay.SourceFvrNwkType, row.sourceAfter);
      EXPECT_EQ(overlay.FvrNwkFilename_Specified.Text(), row.own);
    }
  }
}

TEST_F(Rivers, LookingAtAnOverlayChangesNothing) {
  const FileName simulation = Simulation("a.fvsim", "net.fvnwk"), project("/a.fvproj", "");
  COverlayRiverKvf& overlay = AddOverlay("Overlays/Foreground", COverlayRiverKvf::kOfSetup, "");
  for (const FileName& file : {project, simulation}) {
    river.SetRiverFile(file);
    EXPECT_EQ(overlay.DrawnFile(), file);
    EXPECT_EQ(overlay.SourceFvrNwkType, COverlayRiverKvf::kOfSetup);
  }
}

TEST_F(Rivers, ANewNetworkHasTheAreaOfTheDomain) {
  auto& domain = setup.At<CCatchmentKvf>("Catchment");
  domain.Type = CCatchmentKvf::kShapeFile;
  domain.x0Shp = 100.9;
  domain.y0Shp = -20.5;
  domain.nxShp = domain.nyShp = 10;
  domain.sizeShp = 1.5;
  const std::string path = folder.File("new.fvnwk");
  ASSERT_TRUE(modflow.CreateNetworkFile(path).Ok());
  EXPECT_THAT(ReadFile(path), HasSubstr("    x0 = 100\n    y0 = -20\n    x1 = 115\n    y1 = -5\n"));
  EXPECT_FALSE(modflow.CreateNetworkFile(folder.File("none/new.fvnwk")).Ok());
  EXPECT_EQ(ReadRiverOnce(path)->problem, "");
}

}  // namespace
}  // namespace tervane::rivers_test
