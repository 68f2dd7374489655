// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/summary.h"

#include <filesystem>

#include <gmock/gmock.h>

#include "execution/run_state.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::summary_test {
namespace {

using test::PageDriver;
using testing::HasSubstr;

std::string Shown(CFlowModelDoc& document, const char* label) {
  PageDriver page(document, "CIntroductionKvf");
  return page.Find(label).Text();
}

TEST(Summary, TellsWhatTheSetupIsAboutAndWhatComesNext) {
  test::TempFolder folder;
  std::filesystem::copy(TERVANE_SOURCE_DIR "/examples/rhone", folder.Path(), std::filesystem::copy_options::recursive);
  CFlowModelDoc document;
  ASSERT_TRUE(document.OnOpenDocument(folder.File("rhone.tvd")));
  EXPECT_EQ(Shown(document, "Title:"), "Rhone at Porte du Scex");
  EXPECT_EQ(Shown(document, "Simulation:"), "2012-01-01 to 2015-12-31 (1460 days)");
  EXPECT_EQ(Shown(document, "Model domain:"), "142 x 97 cells of 1000 m, WGS 84 / UTM zone 32N");
  EXPECT_THAT(Shown(document, "Switched on:"), HasSubstr("Overland Flow (OL): Finite Difference"));
  EXPECT_THAT(Shown(document, "Switched on:"), HasSubstr("Rivers and Lakes (OC)"));
  EXPECT_THAT(Shown(document, "Switched on:"), testing::Not(HasSubstr("Water Quality")));
  EXPECT_EQ(Shown(document, "Findings:"), "1 warning");
  EXPECT_EQ(Shown(document, "Last run:"), "none yet");
  EXPECT_THAT(Shown(document, "Next step:"), HasSubstr("Run the preprocessor"));

  // What ran is read from its files, whoever started it.
  const RunFiles files = RunFilesOf(document.getResultFolder(), document.PathName());
  std::filesystem::create_directories(std::filesystem::path(files.state).parent_path());
  RunState run;
  run.id = "1";
  run.setup = document.PathName();
  run.program = RunningProcess::This();
  run.begun = NowInMilliseconds();
  run.ended = run.begun + 3000;
  std::string problem;
  {
    HeldRunState held;
    ASSERT_EQ(held.Hold(files.state, std::chrono::milliseconds(0), problem), HeldRunState::Outcome::Held) << problem;
    ASSERT_TRUE(held.Write(run, problem)) << problem;
  }
  EXPECT_THAT(Shown(document, "Last run:"), HasSubstr("The run is done after 3.0 s"));
  EXPECT_EQ(Shown(document, "Next step:"), "Look at the processed data.");
  std::filesystem::last_write_time(folder.File("rhone.tvd"),
                                   std::filesystem::file_time_type::clock::now() + std::chrono::seconds(10));
  EXPECT_THAT(Shown(document, "Last run:"), HasSubstr("saved since"));
  EXPECT_THAT(Shown(document, "Next step:"), HasSubstr("Run it again"));
}

TEST(Summary, OfAnEmptyOrFaultySetupSaysSo) {
  CFlowModelDoc fresh;
  EXPECT_EQ(Shown(fresh, "Title:"), "none");
  EXPECT_EQ(Shown(fresh, "Model domain:"), "no file that can be read tells it yet");
  EXPECT_EQ(Shown(fresh, "Findings:"), "1 error");
  EXPECT_THAT(Shown(fresh, "Next step:"), HasSubstr("Mend the first error. Model Domain and Grid > Filename: "));

  CFlowModelDoc odd;
  ASSERT_TRUE(
      odd.OpenText(test::SetupText(14,
                                   "section SimSpec {\nsection SimulationPeriod {\nSIMSTART = 2001, 1, 1, 0, 0\n"
                                   "SIMEND = 2000, 13, 1, 0, 0\n}\n}"),
                   "a.tvd"));
  EXPECT_EQ(Shown(odd, "Simulation:"), "its start or end is no date");
}

}  // namespace
}  // namespace tervane::summary_test
