// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/processed_data.h"

#include <chrono>
#include <filesystem>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "core/undo.h"
#include "execution/processed_pages.h"
#include "tests/support/preprocessed_run.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::processed_data_test {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::HasSubstr;
using OnDisk = CPreprocessedDataManager::OnDisk;

/// A setup with a place for its report.
class ReportedSetup {
 public:
  explicit ReportedSetup(std::string_view report = {}) {
    EXPECT_TRUE(document_.OnOpenDocument(folder_.Write("karup.tvd", test::SetupText(14, ""))));
    if (!report.empty()) Write(report);
  }
  void Write(std::string_view report) { folder_.Write("karup_results/karup_PreProcessed.kvf", report); }
  CPreprocessedDataManager& Manager() { return *document_.AttachPreprocessorReport(); }
  CFlowModelDoc& Document() { return document_; }
  CYbSEKvfBase& Root() { return *document_.Root().GetImportantNode("PROCESSED_DATA"); }
  /// A line for each page: depth, class, title.
  std::vector<std::string> Pages() {
    std::vector<std::string> lines;
    WalkNodes(Root(), [&](const NodePlace& place) {
      lines.push_back(fmt::format("{} {} {}", place.depth, ClassNameOf(place.node), place.node.GetTitle()));
    });
    return lines;
  }
  const CPreprocessedDataEntity& FirstPage() { return dynamic_cast<CPreprocessedDataEntity&>(*Root().GetFirstChild()); }

 private:
  test::TempFolder folder_;
  CFlowModelDoc document_;
};

std::string Report(std::string_view page) {
  return fmt::format("target PreProcessed_Data {{\nsection PAGE {{\n{}\n}}\n}}\n", page);
}

TEST(ProcessedData, TheStoredReportGivesANodeOfEveryKindAtItsPlace) {
  ReportedSetup setup(test::ReadFile(TERVANE_SOURCE_DIR "/tests/execution/karup_PreProcessed.kvf"));
  setup.Manager().Load();
  EXPECT_EQ(setup.Manager().Problem(), "");
  EXPECT_EQ(setup.Manager().PageCount(), 14);
  EXPECT_THAT(
      setup.Pages(),
      ElementsAre("1 CPreprocessedBlankKvf Preprocessed data", "2 CPreprocessedNDS2_PLOTkvf Model Domain and Grid",
                  "3 CPreprocessedSHAPE_PLOTkvf Sub-basins", "2 CPreprocessedNDS2_PLOTkvf Topography",
                  "3 CPreprocessedRIVER_LINKS_PLOTkvf River links", "2 CPreprocessedBlankKvf Climate",
                  "3 CPreprocessedNDS0_PLOTkvf Precipitation", "2 CPreprocessedNDS1_PLOTkvf River bed",
                  "2 CPreprocessedBlankKvf Saturated Zone", "3 CPreprocessedNDS3_PLOTkvf Lower level of layers",
                  "3 CPreprocessedNDS3_PLOTkvf Second layer", "2 CPreprocessedTEXTkvf Summary",
                  "2 CPreprocessedTXT_FILEkvf Log", "2 CPreprocessedHTML Water balance"));
  EXPECT_EQ(setup.Root().GetFirstChild()->GetFirstChild()->GetAbbreviatedTitle(), "Domain");
}

TEST(ProcessedData, ValuesArePassedOnAsText) {
  ReportedSetup setup(
      Report("TITLE = \"a\"\nsection NDS2_PLOT {\n"
             "A = 1, 2, 3\nB = true, false\nC = 0.5f\nD = 1e9, 0.25\nE = \"x\", file \"maps/y\"\n"
             "Twice = 1\nTwice = 2\nItemNo = \"7 of 9\"\nFilename = file \"../maps/dem.nds2\"\n}\n"
             "section TEXT {\nText = \"later kinds are not asked\"\n}"));
  setup.Manager().Load();
  const CPreprocessedDataEntity& page = setup.FirstPage();
  const struct {
    const char *key, *text;
  } cases[] = {{"A", "1,2,3"},    {"B", "1,0"},   {"C", "0.500000"}, {"D", "1e+09,0.25"},
               {"E", "x,maps/y"}, {"Twice", "2"}, {"Text", ""},      {"Filename", "../maps/dem.nds2"}};
  for (const auto& c : cases) EXPECT_EQ(page.GetValue(c.key), c.text) << c.key;
  EXPECT_EQ(page.GetNumber("ItemNo"), 7);
  EXPECT_EQ(page.GetNumber("nothing"), 0);
  EXPECT_EQ(page.GetFile(),
            fs::path(setup.Manager().Path()).parent_path().parent_path().generic_string() + "/maps/dem.nds2");
}

TEST(ProcessedData, AReportThatIsNoneIsToldWithItsPlaceAndLeavesNoPages) {
  const std::string good = Report("TITLE = \"a\"\nsection PAGE {\nTITLE = \"b\"\n}");
  const struct {
    std::string report;
    const char* problem;
  } cases[] = {
      {good.substr(0, good.size() / 2), "karup_PreProcessed.kvf:"},
      {good.substr(0, good.size() - 2), "karup_PreProcessed.kvf:"},
      {"target PreProcessed_Data {\nsection PAGE {\nTITLE = 12x\n}\n}", "karup_PreProcessed.kvf:3:9: TITLE = 12x"},
      {"\n", "karup_PreProcessed.kvf:2:1: the file is empty"},
      {"target PreProcessed_Data {\n}\ntarget Other {\nsection PAGE {\n}\n}", "a section PAGE was expected"},
      {"target A {\nPAGE = 1\n}", "a section PAGE was expected"},
      {"<html>no report</html>", "karup_PreProcessed.kvf:1:1"},
      {std::string(64, '\0'), "karup_PreProcessed.kvf:1:1"},
  };
  ReportedSetup setup(good);
  setup.Manager().Load();
  for (const auto& c : cases) {
    SCOPED_TRACE(c.report);
    setup.Write(c.report);
    setup.Manager().Load();
    EXPECT_THAT(setup.Manager().Problem(), HasSubstr(c.problem));
    EXPECT_EQ(setup.Manager().StateText(), setup.Manager().Problem());
    EXPECT_THAT(setup.Pages(), ElementsAre());
    EXPECT_EQ(setup.Manager().PageCount(), 0);
    setup.Write(good);
    setup.Manager().Load();
    EXPECT_EQ(setup.Manager().Problem(), "");
    EXPECT_EQ(setup.Pages().size(), 2U);
  }
}

TEST(ProcessedData, AReportIsReadAgainWhenItComesChangesOrIsTouched) {
  ReportedSetup setup;
  CPreprocessedDataManager& manager = setup.Manager();
  EXPECT_EQ(manager.CheckDisk(), OnDisk::Changed);  // never read
  manager.Load();
  EXPECT_EQ(manager.CheckDisk(), OnDisk::AsRead);
  EXPECT_THAT(manager.StateText(), HasSubstr("no report yet"));
  setup.Write(Report("TITLE = \"a\""));
  EXPECT_EQ(manager.CheckDisk(), OnDisk::Changed);
  manager.Load();
  EXPECT_EQ(manager.CheckDisk(), OnDisk::AsRead);
  fs::last_write_time(manager.Path(), fs::last_write_time(manager.Path()) + std::chrono::seconds(2));
  EXPECT_EQ(manager.CheckDisk(), OnDisk::Changed);
  manager.Load();
  fs::remove(manager.Path());
  EXPECT_EQ(manager.CheckDisk(), OnDisk::Gone);
  EXPECT_EQ(setup.Pages().size(), 1U);  // what it said is still to be seen
  EXPECT_THAT(manager.StateText(), HasSubstr("no more on disk"));
  ASSERT_TRUE(setup.Document().OnSaveDocument(setup.Document().PathName() + "2.tvd"));
  EXPECT_EQ(setup.Manager().CheckDisk(), OnDisk::Changed);  // another setup, another report
  manager.Load();
  EXPECT_THAT(setup.Pages(), ElementsAre());
}

TEST(ProcessedData, NothingOfItIsSavedUndoneOrValidated) {
  ReportedSetup setup(test::ReadFile(TERVANE_SOURCE_DIR "/tests/execution/karup_PreProcessed.kvf"));
  CFlowModelDoc& document = setup.Document();
  const std::string saved = test::SavedText(document);
  UndoStack undo(document.Root());
  setup.Manager().Load();
  EXPECT_FALSE(undo.Commit("Rebuild"));
  setup.Manager().Load();
  EXPECT_FALSE(undo.Commit("Rebuild"));
  EXPECT_EQ(test::SavedText(document), saved);
  std::vector<OverviewLine> lines;
  ASSERT_TRUE(GenerateOverview(document.Root(), lines));
  EXPECT_THAT(OverviewText(lines), testing::Not(HasSubstr("Topography.nds2")));
  EXPECT_FALSE(CFlowModelDoc().AttachPreprocessorReport());  // nothing lies beside a setup without a name
}

TEST(ProcessedData, AHundredThousandPagesAreBuilt) {
  std::string pages;
  for (int page = 0; page < 100'000; ++page) pages += "section PAGE {\nTITLE = \"same\"\n}\n";
  ReportedSetup setup(Report(pages));
  setup.Manager().Load();
  EXPECT_EQ(setup.Manager().PageCount(), 100'001);
  const struct {
    int levels, pages;
    const char* problem;
  } nested[] = {{190, 191, ""}, {100'000, 0, "nested deeper than"}};
  for (const auto& c : nested) {
    std::string below;
    for (int level = 0; level < c.levels; ++level) below += "section PAGE {\n";
    for (int level = 0; level < c.levels; ++level) below += "}\n";
    setup.Write(Report(below));
    setup.Manager().Load();
    EXPECT_EQ(setup.Manager().PageCount(), c.pages);
    EXPECT_THAT(setup.Manager().Problem(), HasSubstr(c.problem));
  }
}

}  // namespace
}  // namespace tervane::processed_data_test
