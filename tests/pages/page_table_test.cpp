// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <filesystem>
#include <fstream>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane {
namespace {

namespace fs = std::filesystem;

/// A setup in which every component and option that shows a control is on.
std::string FullSetup() {
  return test::SetupText(14, R"(section SimSpec {
  section ModelComp {
    WQ = 1
    River = 1
    UZ_ModelType = 0
    UseCurrentWmSimulation = 0
    FilenameTvdRes = file "results/flow.tvdres"
  }
  section SimTitle {
    Title = "Karup"
    Description = "first\nsecond"
  }
  section SimulationPeriod {
    HotStart = 1
    HotStartResultFile = file "missing.tvdres"
  }
  section CompControlParaOL {
    SolverOption = 1
    Multicell = 1
    OLRiverExchangeOption = 1
  }
}
section ModelCompWQ {
  OL = 1
  SZ = 1
  IncludeProcesses = 1
  ProcessType = 2
}
section ModelCompPT {
  InitLocationRadio = 1
}
section Climate {
  SM = 1
  CorrectPrecipitation = 1
  CorrectAirTemperature = 1
  IncludeSolarRadiation = 1
  section PrecipitationRate {
    DistributionType = 2
    section STATION_BASED {
      NO_TIMESERIES = 1
      TYPE = 2
    }
    section TIME_SERIES_1 {
      NAME = "Sion"
      GRIDCODEID = "131"
      TYPE = 1
      FIXED_VALUE = 1.5f
      Elevation = 482f
    }
  }
  section POTEVAPTRANS {
    DistributionType = 3
  }
  section AirTemperature {
    section GLOBAL {
      TYPE = 2
    }
  }
  section SNOWMELTCONST {
    ThermalMelt = 1
  }
}
section ExtraParams {
  NoOfParams = 2
  section ExtraParam_1 {
    Name = "n"
    Type = 1
    Value = 20
  }
  section ExtraParam_2 {
    Name = "restart"
    Type = 4
    Value = file "restart/day30.bin"
  }
})");
}

/// The pages of all nodes as text, each under the path of its node.
std::string AllPages(CFlowModelDoc& document) {
  std::string text;
  test::ScriptedHost host;
  WalkNodes(document.Root(), [&](const NodePlace& place) {
    const PageClass* pageClass = place.node.GetDlgRuntimeClass(kSetupDataTree);
    // Help pages are texts of their own.
    if (!pageClass || pageClass->name == "CTvnHelpView") return;
    const auto page = MakePage(*pageClass, place.node, {document, host, {}});
    ASSERT_TRUE(page) << place.path << " names a page that nobody makes";
    text += fmt::format("== {} ({}, {})\n{}", place.path, pageClass->name, pageClass->resource, FormText(page->Form()));
  });
  return text;
}

TEST(PageTable, EveryPageShowsWhatItsStoredTextShows) {
  const struct {
    const char* file;
    std::string setup;
  } cases[] = {{"new_setup.txt", test::SetupText(14, "")}, {"full_setup.txt", FullSetup()}};
  for (const auto& c : cases) {
    SCOPED_TRACE(c.file);
    CFlowModelDoc document;
    ASSERT_TRUE(document.OpenText(c.setup, "/data/a.tvd")) << document.Error();
    ASSERT_TRUE(document.Report().IsEmpty());
    const std::string text = AllPages(document);
    const fs::path stored = fs::path(TERVANE_SOURCE_DIR) / "tests/pages" / c.file;
    // TERVANE_STORE_PAGES=1 stores the texts anew, when a page was changed on purpose: look at the difference.
    if (std::getenv("TERVANE_STORE_PAGES")) std::ofstream(stored, std::ios::binary) << text;
    EXPECT_EQ(test::ReadFile(stored.string()), text);
  }
}

TEST(PageTable, ShowingAPageChangesNothing) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(FullSetup(), "/data/a.tvd"));
  const std::string before = test::SavedText(document);
  AllPages(document);
  EXPECT_EQ(test::SavedText(document), before);
}

TEST(PageTable, EveryControlTakesItsOwnText) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(FullSetup(), "/data/a.tvd"));
  const std::string before = test::SavedText(document);
  test::ScriptedHost host;
  int controls = 0;
  WalkNodes(document.Root(), [&](const NodePlace& place) {
    const PageClass* pageClass = place.node.GetDlgRuntimeClass(kSetupDataTree);
    const auto page = pageClass ? MakePage(*pageClass, place.node, {document, host, {}}) : nullptr;
    if (!page) return;
    page->Form().ForEach([&](Control& control) {
      // A date list without dates shows none of its options.
      if (!control.enter || !control.IsEnabled() || control.Text() == "-1" || control.Text() == "Invalid DateTime.")
        return;
      EXPECT_EQ(control.enter(control.Text()), "") << place.path << " " << control.label;
      ++controls;
    });
  });
  EXPECT_GT(controls, 90);
  EXPECT_EQ(test::SavedText(document), before);
}

}  // namespace
}  // namespace tervane
