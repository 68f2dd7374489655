// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/results/viewer_pages.h"

#include <gmock/gmock.h>

#include "execution/run_passport.h"
#include "results/result_nodes.h"
#include "tests/support/page_driver.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::viewer_pages_test {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

std::string CatalogueOf(const char* version, const char* items) {
  return std::string("target TVDRES {\nsection general {\nsection version {\nVersionNumber = ") + version +
         "\n}\n}\nsection Items {\nNrofItems = 3\n" + items + "}\n}\n";
}
constexpr const char* kFlow =
    "section Item {\nName = \"depth/of water\"\nFilename = file \"a.nds2\"\nItemno = 1\nDataType = 61\n}\n"
    "section Item {\nName = \"x\"\nFilename = file \"a.nds3\"\nItemno = 1\nDataType = 102\n}\n"
    "section Item {\nName = \"y\"\nFilename = file \"a.nds3\"\nItemno = 2\nDataType = 103\n}\n";

struct ViewerPage : testing::Test {
  test::TempFolder folder;
  CFlowModelDoc document;
  test::ScriptedHost host;
  std::unique_ptr<CYbSEDlgBase> page;

  void Open() {
    const std::string setup = folder.Write("karup.tvd", test::SetupText(14, ""));
    ASSERT_TRUE(document.OnOpenDocument(setup));
    CYbSEKvfBase& node = *document.Root().Important(kResult)->Child<CResultViewerKvf>();
    PageContext context{document, host, [](int, const std::string&, const void*) {}};
    page = MakePage(kResultViewerPage, node, context);
  }
  TableForm& Table() {
    for (const auto& control : page->Form().Controls())
      if (control->table) return *control->table;
    throw std::logic_error("no table");
  }
};

TEST_F(ViewerPage, ShowsTheItemsAndHandsThemToTheViewer) {
  folder.Write("karup_results/karup.tvdres", CatalogueOf("1001", kFlow));
  Open();
  TableForm& table = Table();
  ASSERT_EQ(table.RowCount(), 3);
  EXPECT_EQ(table.Head(2), "Add XY-flow\nvectors");
  EXPECT_EQ(table.ShownCell(1, 1), "depth/of water");
  EXPECT_EQ(table.ShownCell(2, 4), folder.File("karup_results/a.nds3"));
  EXPECT_TRUE(table.IsReadOnly(1, 1));
  EXPECT_TRUE(table.IsReadOnly(1, 2));  // never with vectors
  EXPECT_FALSE(table.IsReadOnly(2, 2));
  EXPECT_EQ(table.Enter(2, 2, "1"), "");
  page->SetData();
  EXPECT_EQ(table.Cell(2, 2), "1");  // kept when the catalogue is read anew

  EXPECT_TRUE(table.Press(1, 3));
  const std::string path = folder.File("karup_results/depthof water.REV");
  EXPECT_THAT(test::ReadFile(path), HasSubstr("target QUARZEL_RESULT_VIEWER"));
  EXPECT_THAT(host.Opened(), ElementsAre(path));

  // One that is there is overwritten when the user wants that.
  folder.Write("karup_results/depthof water.REV", "mine");
  const std::string question =
      "Do you want to overwrite the existing Results Viewer setup file for this item?\n" + path;
  host.Expect(question, Host::Answer::Cancel);
  table.Press(1, 3);
  EXPECT_EQ(host.Opened().size(), 1U);
  host.Expect(question, Host::Answer::No);
  table.Press(1, 3);
  EXPECT_EQ(host.Opened().size(), 2U);
  EXPECT_EQ(test::ReadFile(path), "mine");
  host.Expect(question, Host::Answer::Yes);
  table.Press(1, 3);
  EXPECT_EQ(host.Opened().size(), 3U);
  EXPECT_NE(test::ReadFile(path), "mine");
  EXPECT_TRUE(host.IsDone());
}

TEST_F(ViewerPage, ACatalogueThatCannotBeUsedIsToldOnce) {
  folder.Write("karup_results/karup.tvdres", CatalogueOf("1000", ""));
  host.Expect("is from a simulation with Tervane version 2002", Host::Answer::Ok);
  Open();
  page->SetData();
  EXPECT_THAT(FormText(page->Form()), HasSubstr("requires Tervane version 2003 or newer."));
  folder.Write("karup_results/karup.tvdres", CatalogueOf("0", "section Item {\n}\n"));
  host.Expect("Error when reading version info", Host::Answer::Ok);
  page->OnRefresh();
  EXPECT_TRUE(host.IsDone());
  EXPECT_EQ(Table().RowCount(), 0);
}

TEST_F(ViewerPage, WhatCannotBeWrittenIsTold) {
  folder.Write("karup_results/karup.tvdres", CatalogueOf("1001", kFlow));
  folder.Write("karup_results/x.REV/in the way", "");
  Open();
  host.Expect("Do you want to overwrite", Host::Answer::Yes);
  host.Expect("Could not create result viewer input file:\n" + folder.File("karup_results/x.REV") + "\n\nError while",
              Host::Answer::Ok);
  Table().Press(2, 3);
  EXPECT_TRUE(host.IsDone());
  EXPECT_THAT(host.Opened(), IsEmpty());
}

TEST_F(ViewerPage, TellsTheRunAndWhatWasWrittenSince) {
  folder.Write("karup_results/karup.tvdres", CatalogueOf("1001", kFlow));
  folder.Write("rain.nds0", "wet");
  Open();
  const auto text = [this] { return FormText(page->Form()); };
  EXPECT_THAT(text(), HasSubstr("button \"Open the Setup That Made This\" hidden"));
  RunState run;
  run.setup = folder.File("karup.tvd");
  run.starter.user = "jane";
  run.begun = 1000;
  const PassportFiles files = PassportFilesOf(folder.File("karup_results"), run.setup);
  RunPassport passport = PassportOf(run, {run.setup, folder.File("rain.nds0")});
  passport.outcome = "The run is done.";
  ASSERT_EQ(WritePassport(passport, files.passport).error, "");
  EXPECT_THAT(text(), HasSubstr("Of the run that jane began on , 1970-01-01 00:00:01 UTC. The run is done.\n"));
  folder.Write("rain.nds0", "very wet");
  folder.Write("karup.tvd", test::SetupText(14, "# another\n"));
  EXPECT_THAT(text(), HasSubstr("Written anew or gone since then: the setup and rain.nds0."));
  folder.Write("karup_results/karup_Passport.tvd", test::SetupText(14, ""));
  page->Form().ForEach([&](Control& control) {
    if (control.label == "Open the Setup That Made This") page->Press(control);
  });
  EXPECT_THAT(host.Opened(), ElementsAre(files.setup));
  // The program shows both runs when it is handed the other one's passport.
  host.Expect("Compare With Another Run", folder.File("earlier/karup_Passport.kvf"));
  page->Form().ForEach([&](Control& control) {
    if (control.label == "Compare With Another Run...") page->Press(control);
  });
  EXPECT_EQ(host.Opened().back(), folder.File("earlier/karup_Passport.kvf"));
}

}  // namespace
}  // namespace tervane::viewer_pages_test
