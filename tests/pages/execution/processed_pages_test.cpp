// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/execution/processed_pages.h"

#include <filesystem>
#include <fstream>
#include <stdexcept>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "document/edit_session.h"
#include "execution/run_passport.h"
#include "forms/plots.h"
#include "pages/tree_entries.h"
#include "platform/text.h"
#include "tests/support/page_driver.h"
#include "tests/support/preprocessed_run.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::processed_pages_test {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::HasSubstr;

/// What the user was told.
class Listener : public NobodyToAsk {
 public:
  Answer Ask(const std::string& text, Icon, Buttons) override {
    told.push_back(text);
    return Answer::Yes;
  }
  bool Send(const Message& message) override {
    opened.push_back(std::get<std::string>(message.lParam));
    return true;
  }
  std::vector<std::string> told, opened;
};

/// A setup with all that the preprocessor left of it.
class RunSetup {
 public:
  RunSetup() {
    std::string error;
    session_ = EditSession::Open(folder_.Write("karup.tvd", test::SetupText(14, "")), folder_.Path(), error);
    test::WritePreprocessedRun(folder_.File("karup_results"), "karup");
    session_->Document().AttachPreprocessorReport()->Load();
  }
  std::string Result(const std::string& name) const { return folder_.File("karup_results/" + name); }
  EditSession& Session() { return *session_; }
  Listener& Host() { return host_; }
  std::vector<std::string>& Opened() { return host_.opened; }

  std::unique_ptr<CYbSEDlgBase> Page(const std::string& path, bool isReplacement = false) {
    CYbSEKvfBase* node =
        FindNode(session_->Document().Root(), ParseSetupPath("ProcData/Preprocessed data/" + path).steps);
    if (!node) return nullptr;
    PageContext context{session_->Document(), host_,
                        [this, node](int hint, const std::string& action, const void* source) {
                          session_->UpdateDoc(*node, hint, action, source);
                        }};
    context.isReplacement = isReplacement;
    return MakePage(*PageClassOf(*node), *node, context);
  }
  /// The page as text, without the folder.
  std::string Text(const std::string& path, bool isReplacement = false) {
    const auto page = Page(path, isReplacement);
    return page ? Replaced(FormText(page->Form()), folder_.Path(), "FOLDER") : "no page";
  }
  std::string AllPages() {
    std::string text;
    for (const TreeEntry& entry : TreeEntries(session_->Document().Root(), kProcessedDataTree)) {
      if (entry.page->name == "CTvnHelpView" && !entry.path.starts_with("ProcData")) continue;
      const auto page = MakePage(*entry.page, *entry.node, {session_->Document(), host_, {}});
      text += fmt::format("== {} ({})\n{}", entry.path, entry.page->name, FormText(page->Form()));
    }
    return Replaced(text, folder_.Path(), "FOLDER");
  }

 private:
  test::TempFolder folder_;
  Listener host_;
  std::unique_ptr<EditSession> session_;
};

TEST(ProcessedPages, EveryPageShowsWhatItsStoredTextShows) {
  RunSetup run;
  const std::string text = run.AllPages();
  const fs::path stored = fs::path(TERVANE_SOURCE_DIR) / "tests/pages/execution/processed_data.txt";
  if (std::getenv("TERVANE_STORE_PAGES")) std::ofstream(stored, std::ios::binary) << text;
  EXPECT_EQ(test::ReadFile(stored.string()), text);
  EXPECT_THAT(run.Host().told, ElementsAre());
  EXPECT_FALSE(run.Session().IsModified());
}

TEST(ProcessedPages, WhatWasWrittenSinceTheRunIsToldUntilThePreprocessorRunsAnew) {
  RunSetup run;
  RunPassport passport;
  passport.setup = run.Session().Path();
  passport.begun = "2026-01-01 10:00:00";
  passport.ended = "2099-01-01 10:00:00";
  passport.inputs = {{run.Session().Path(), "1", "2026-01-01 09:00:00.000000000", {}, {}}};
  const auto notice = [&] {
    EXPECT_EQ(WritePassport(passport, run.Result("karup_Passport.kvf")).error, "");
    return run.Text("Topography");
  };
  EXPECT_THAT(notice(),
              HasSubstr("This was made on 2026-01-01 10:00:00 UTC. Written anew or gone since then: the setup."));
  passport.ended = "2026-01-01 10:00:01";  // the report is younger
  EXPECT_THAT(notice(), testing::Not(HasSubstr("Written anew")));
  passport.ended.clear();
  passport.inputs.clear();
  EXPECT_THAT(notice(), testing::Not(HasSubstr("Written anew")));
}

TEST(ProcessedPages, AFileThatCannotBeShownIsToldOnItsPage) {
  const struct {
    const char *file, *page, *message;
    bool isRemoved;
  } cases[] = {
      {"karup_2d.nds2", "Topography", "FOLDER/karup_results/karup_2d.nds2", true},
      {"karup_2d.nds2", "Topography", "FOLDER/karup_results/karup_2d.nds2", false},
      {"karup_3d.nds3", "Saturated Zone/Second layer", "FOLDER/karup_results/karup_3d.nds3", true},
      {"karup_3d.nds3", "Saturated Zone/Lower level of layers", "FOLDER/karup_results/karup_3d.nds3", false},
      {"karup_0d.nds0", "Climate/Precipitation", "FOLDER/karup_results/karup_0d.nds0", true},
      {"karup_0d.nds0", "Climate/Precipitation", "FOLDER/karup_results/karup_0d.nds0", false},
      {"basins.shp", "Model Domain and Grid/Sub-basins", "FOLDER/karup_results/basins.shp", false},
      {"balance.htm", "CPreprocessedHTML", "FOLDER/karup_results/balance.htm", true},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.page);
    RunSetup run;
    const std::string path = run.Result(c.file), before = test::ReadFile(path);
    fs::remove(path);
    // Cut off in the middle of the values, as a full disk leaves it.
    if (!c.isRemoved) std::ofstream(path, std::ios::binary) << before.substr(0, before.size() * 2 / 3);
    const std::string text = run.Text(c.page);
    // The first line names the file on most pages anyway.
    const bool isHtml = std::string_view(c.page) == "CPreprocessedHTML";
    EXPECT_THAT(isHtml ? text : text.substr(text.find('\n')), HasSubstr(c.message)) << text;
    EXPECT_THAT(run.Host().told, ElementsAre());
  }
}

TEST(ProcessedPages, ARiverFileThatCannotBeReadLeavesTheGridAndIsToldOnce) {
  RunSetup run;
  fs::remove(run.Result("karup_PreProcessed_River.bin"));
  EXPECT_THAT(run.Text("Topography"), HasSubstr("map \"\" = grid 48x36\n"));
  EXPECT_THAT(run.Host().told, ElementsAre(HasSubstr("Could not load binary preprocessed River file: \n" +
                                                     run.Result("karup_PreProcessed_River.bin"))));
  // A page that follows another one in a rebuild says it on the page alone.
  EXPECT_THAT(run.Text("Topography", true), HasSubstr("notice \"\" = Could not load binary preprocessed River file"));
  EXPECT_EQ(run.Host().told.size(), 1U);
  // Where the report asks for no river, none is read.
  EXPECT_THAT(run.Text("Model Domain and Grid"), HasSubstr("notice \"\" = \n"));
}

TEST(ProcessedPages, ALayerIsChosenFromTheTopAndChangesNothingOfTheSetup) {
  RunSetup run;
  const auto page = run.Page("Saturated Zone/Lower level of layers");
  const auto control = [&](ControlKind kind) {
    for (const auto& each : page->Form().Controls())
      if (each->kind == kind) return each.get();
    return static_cast<Control*>(nullptr);
  };
  Control& layer = *control(ControlKind::Choice);
  const auto middle = [&] { return Finished(control(ControlKind::Map)->map).grids.front().grid->Value(24, 18); };
  EXPECT_THAT(layer.Options(), ElementsAre("Computational Layer 1", "Computational Layer 2", "Computational Layer 3"));
  EXPECT_NEAR(middle(), -30, 1);
  int hints = -1;
  run.Session().Listen([&](int hint) { hints = hint; });
  EXPECT_EQ(page->Enter(layer, "2"), "");
  EXPECT_NEAR(middle(), -90, 1);
  EXPECT_EQ(hints, kViewOnly);
  EXPECT_FALSE(run.Session().IsModified());
  EXPECT_FALSE(run.Session().NeedsAutosave());
}

TEST(ProcessedPages, ALineOnTheMapShowsTheLayersBelowTheTopographyOfTheReport) {
  RunSetup run;
  const auto page = run.Page("Saturated Zone/Lower level of layers");
  const auto control = [&](ControlKind kind, std::string_view label = {}) -> Control& {
    for (const auto& each : page->Form().Controls())
      if (each->kind == kind && each->label == label) return *each;
    throw std::logic_error("no such control");
  };
  const auto map = [&] { return Finished(control(ControlKind::Map).map); };
  Control& section = control(ControlKind::Section);
  EXPECT_FALSE(section.IsShown());
  EXPECT_FALSE(control(ControlKind::Button, "Remove Section").IsEnabled());
  page->Press(control(ControlKind::Button, "Draw Section"));
  const MapContent asking = map();
  ASSERT_TRUE(asking.request.has_value());
  EXPECT_THAT(Summary(asking), HasSubstr("asks \"Click the points of the section."));
  const auto& grid = *asking.grids.front().grid;
  asking.request->taken({grid.CellCentre(10, 18), grid.CellCentre(30, 18)});
  EXPECT_FALSE(map().request.has_value());
  EXPECT_THAT(Summary(map()), HasSubstr("1 lines of 2 points, 2 points"));
  ASSERT_TRUE(section.IsShown());
  const SectionContent content = Finished(section.section);
  EXPECT_EQ(Summary(content),
            "section of 10000 m: ground, Computational Layer 1, Computational Layer 2, Computational Layer 3");
  // From the top down, as the pages count them.
  EXPECT_NEAR(content.ground->grid->Value(24, 18), 42, 3);
  EXPECT_NEAR(content.surfaces[0].bottom.grid->Value(24, 18), -30, 1);
  EXPECT_NEAR(content.surfaces[2].bottom.grid->Value(24, 18), -90, 1);
  page->Press(control(ControlKind::Button, "Remove Section"));
  EXPECT_FALSE(section.IsShown());
  EXPECT_TRUE(map().lines.empty());
  EXPECT_FALSE(run.Session().IsModified());
}

TEST(ProcessedPages, WhatTheReportSaysOfALayerAndAPeriodMayBeWrong) {
  const struct {
    const char *content, *shown;
  } cases[] = {
      {"NDS3_PLOT {\nFilename = file \"karup_3d.nds3\"\nItemNo = 1\nLayerNo = 0", "Computational Layer 1 of"},
      {"NDS3_PLOT {\nFilename = file \"karup_3d.nds3\"\nItemNo = 1\nLayerNo = 99", "Computational Layer 3 of"},
      {"NDS3_PLOT {\nFilename = file \"karup_2d.nds2\"\nItemNo = 1", "karup_2d.nds2: item 1 has no layers"},
      {"NDS3_PLOT {\nFilename = file \"karup_3d.nds3\"\nItemNo = -1", "there is no item -1: the file has 1"},
      {"NDS2_PLOT {\nFilename = file \"karup_2d.nds2\"", "there is no item 0"},
      {"NDS2_PLOT {", "The report names no file here."},
      {"NDS3_PLOT {", "The report names no file here."},
      {"SHAPE_PLOT {", "The report names no file here."},
      {"SHAPE_PLOT {\nFilename = file \"basins.shp\"\nenuAxisUnit = 99", "unit 99"},
      {"SHAPE_PLOT {\nFilename = file \"basins.shp\"", "3 shapes"},
      {"NDS0_PLOT {", "The report names no file here."},
      {"NDS0_PLOT {\nFilename = file \"karup_0d.nds0\"\nItemNo = 1\nStartDate = 2001, 13\nEndDate = 2002, 1, 1",
       "StartDate = 2001,13 in the report is no date"},
      {"NDS0_PLOT {\nFilename = file \"karup_0d.nds0\"\nItemNo = 1\nStartDate = 2001, 1, 1", "notice \"\" = \n"},
      {"HTML {\nHtml = \"../../etc/nothing.htm\"", "cannot read"},
      {"TEXT {\nText = \"a\\\\nb\\\\rc\"", "\n  a\n  b\rc\n"},
  };
  RunSetup run;
  for (const auto& c : cases) {
    SCOPED_TRACE(c.content);
    std::ofstream(run.Result("karup_PreProcessed.kvf"))
        << "target T {\nsection PAGE {\nTITLE = \"Preprocessed data\"\nsection PAGE {\nTITLE = \"x\"\nsection "
        << c.content << "\n}\n}\n}\n}\n";
    run.Session().Document().AttachPreprocessorReport()->Load();
    const bool isHtml = std::string_view(c.content).starts_with("HTML");
    EXPECT_THAT(run.Text(isHtml ? "CPreprocessedHTML" : "x"), HasSubstr(c.shown));
  }
}

TEST(ProcessedPages, EditHandsTheFileToItsViewerWithTheBackdropOfItsItem) {
  RunSetup run;
  for (const char* path : {"Climate/Precipitation", "Topography", "Saturated Zone/Second layer"}) {
    const auto page = run.Page(path);
    for (const auto& control : page->Form().Controls())
      if (control->kind == ControlKind::Button) page->Press(*control);
  }
  EXPECT_THAT(run.Opened(),
              ElementsAre(run.Result("karup_0d.nds0"), run.Result("karup_2d.nds2"), run.Result("karup_3d.nds3")));
  EXPECT_THAT(test::ReadFile(run.Result("karup_2d.gsf")), HasSubstr("itemNo = 2"));
}

}  // namespace
}  // namespace tervane::processed_pages_test
