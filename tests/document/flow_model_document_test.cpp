// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/flow_model_document.h"

#include <filesystem>

#include <gmock/gmock.h>

#include "document/module.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane {
namespace {

using test::ReadFile;
using test::SavedText;
using test::SetupText;
using test::TempFolder;
using test::ValueOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;

TEST(ResultFileName, JoinsFolderStemAndExtensionWithOneSeparatorAndOneDot) {
  struct Case {
    const char *folder, *stem, *extension, *name;
  };
  const Case cases[] = {
      {"C:/x/results", "run_PreProcessed", ".kvf", "C:\\x\\results\\run_PreProcessed.kvf"},
      {"C:\\x\\results\\", "run", "tvdres", "C:\\x\\results\\run.tvdres"},
      {"  /data/out/  ", "run", "", "\\data\\out\\run"},
      {"", "run", ".fif", "\\run.fif"},
  };
  for (const Case& c : cases) EXPECT_EQ(ResultFileName(c.folder, c.stem, c.extension), c.name);
}

TEST(FlowModelDocument, NamesTheFilesThatLieInTheResultFolder) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(SetupText(14, ""), "/data/karup.v2.tvd"));
  EXPECT_EQ(document.getResultFolder(), "/data/karup.v2_results");
  EXPECT_EQ(document.PreprocessorReport(), "\\data\\karup.v2_results\\karup.v2_PreProcessed.kvf");
  EXPECT_EQ(document.PreprocessedRiverData(), "\\data\\karup.v2_results\\karup.v2_PreProcessed_River.bin");
  EXPECT_EQ(document.SimulationCatalogue(), "\\data\\karup.v2_results\\karup.v2.tvdres");
  EXPECT_EQ(document.WaterQualityCatalogue(), "\\data\\karup.v2_results\\karup.v2.TvdWQres");
  EXPECT_EQ(document.GridSeriesIndex(), "\\data\\karup.v2_results\\karup.v2.fif");
  EXPECT_EQ(document.DetailedTimeSeriesPage(), "\\data\\karup.v2_results\\karup.v2DetailedTS.HTML");
  EXPECT_EQ(document.DetailedRiverTimeSeriesPage(), "\\data\\karup.v2_results\\karup.v2DetailedFvrTS.HTML");
}

TEST(FlowModelDocument, KeepsTheCustomResultFolderInTheFile) {
  const TempFolder folder;
  const std::string path = folder.File("a.tvd");
  CFlowModelDoc document;
  document.UseCustomResultFolder = true;
  document.CustomResultFolder = FileName("out/run1", folder.Path());
  ASSERT_TRUE(document.OnSaveDocument(path)) << document.Error();

  CFlowModelDoc reopened;
  ASSERT_TRUE(reopened.OnOpenDocument(path)) << reopened.Error();
  EXPECT_TRUE(reopened.Report().IsEmpty());
  EXPECT_EQ(reopened.getResultFolder(), folder.Path() + "/out/run1");

  // What other programs stored beside it stays.
  const std::string root = "target SYSTEM {\n  ProjectResultRoot = file \"D:\\\\runs\"\n}\n";
  CFlowModelDoc withRoot;
  ASSERT_TRUE(withRoot.OpenText(SetupText(14, "") + root, path));
  EXPECT_THAT(SavedText(withRoot), testing::EndsWith(root));

  reopened.UseCustomResultFolder = false;
  EXPECT_EQ(reopened.getResultFolder(), folder.Path() + "/a_results");
}

TEST(FlowModelDocument, SavedElsewhereItsFileNamesStillMeanTheSameFiles) {
  const TempFolder folder;
  std::filesystem::create_directories(folder.File("b/c"));
  const std::string text = SetupText(14, R"(section SimSpec {
    section ModelComp {
      FilenameTvdRes = file "results\\flow.tvdres"
    }
    section SimulationPeriod {
      HotStartResultFile = file "D:\\old\\run.tvdres"
    }
  })");
  CFlowModelDoc document;
  ASSERT_TRUE(document.OnOpenDocument(folder.Write("b/a.tvd", text))) << document.Error();
  const struct {
    const char *to, *flow;
  } cases[] = {{"b/a.tvd", "results\\flow.tvdres"},  // stays in its folder: not a byte changes
               {"b/c/a.tvd", "../results/flow.tvdres"},
               {"a.tvd", "b/results/flow.tvdres"}};
  for (const auto& c : cases) {
    ASSERT_TRUE(document.OnSaveDocument(folder.File(c.to))) << document.Error();
    EXPECT_EQ(ValueOf(document, "SimSpec/ModelComp:FilenameTvdRes"), c.flow);
    EXPECT_EQ(ValueOf(document, "SimSpec/SimulationPeriod:HotStartResultFile"), "D:\\old\\run.tvdres");
  }
}

TEST(FlowModelDocument, KeepsTheOriginalAtTheFirstSaveOverWhatItWouldLose) {
  const struct {
    const char* what;
    std::string text;
    const char* kept;
  } cases[] = {
      {"an older version", SetupText(9, ""), "a.v9.tvd"},
      {"no version", SetupText(-1, ""), "a.vnone.tvd"},
      {"a key that nothing reads", SetupText(14, "section SimSpec {\nModleType = 1\n}"), "a.v14.tvd"},
      {"a comment behind the first target", SetupText(14, "# mine"), "a.v14.tvd"},
      {"a value of another type", SetupText(14, "section SimSpec {\nModelType = \"one\"\n}"), "a.v14.tvd"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    const TempFolder folder;
    const std::string path = folder.Write("a.tvd", c.text);
    folder.Write(std::string(c.kept), "taken");
    std::string numbered = folder.File(c.kept);
    numbered.insert(numbered.size() - 4, ".2");

    CFlowModelDoc document;
    ASSERT_TRUE(document.OnOpenDocument(path)) << document.Error();
    ASSERT_TRUE(document.OnSaveDocument(path)) << document.Error();
    EXPECT_EQ(ReadFile(numbered), c.text);
    EXPECT_EQ(ReadFile(folder.File(c.kept)), "taken");
    EXPECT_THAT(document.SaveNotes(), ElementsAre(HasSubstr(numbered)));
    ASSERT_TRUE(document.OnSaveDocument(path));
    EXPECT_THAT(document.SaveNotes(), IsEmpty());
  }
}

TEST(FlowModelDocument, AFileOfTheWrittenVersionIsSavedWithoutACopy) {
  const TempFolder folder;
  const std::string header = "# Karup, calibrated 2024\n# by the water board\n";
  const std::string path = folder.Write("a.tvd", header + SetupText(14, "section SimSpec {\nModelType = 2\n}"));
  CFlowModelDoc document;
  ASSERT_TRUE(document.OnOpenDocument(path));
  ASSERT_TRUE(document.OnSaveDocument(path));
  EXPECT_THAT(document.SaveNotes(), IsEmpty());
  EXPECT_THAT(ReadFile(path), testing::StartsWith(header + "target TERVANE_FLOWMODEL {\n"));
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(folder.Path()), {}), 1);
}

TEST(FlowModelDocument, RefusesWhatIsNoSetupAndSaysWhy) {
  const TempFolder folder;
  const struct {
    const char *text, *error;
  } cases[] = {
      {"", "a.tvd:1:1: the file is empty"},
      {"# only a comment\n", "target NAME { was expected"},
      {"\ntarget TVDRES {\n}\n", "a.tvd:2:1: target TERVANE_FLOWMODEL was expected"},
      {"target TERVANE_FLOWMODEL {\n  section SimSpec {\n    SearchRadius = 12x\n",
       "a.tvd:3:20: SearchRadius = 12x: a number"},
  };
  for (const auto& c : cases) {
    CFlowModelDoc document;
    EXPECT_FALSE(document.OnOpenDocument(folder.Write("a.tvd", c.text)));
    EXPECT_THAT(document.Error(), HasSubstr(c.error));
  }
  CFlowModelDoc document;
  EXPECT_FALSE(document.OnOpenDocument(folder.File("missing.tvd")));
  EXPECT_THAT(document.Error(), HasSubstr("does not exist"));
}

TEST(FlowModelDocument, ReportsWhatItReadAllTheSame) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(SetupText(14, R"(section SimSpec {
      ModelType = "one"
      section SimulationPeriod {
        SIMSTART = 2000, 13, 1, 0, 0
      }
    }
    section ExtraParams {
      NoOfParams = -1
    })"),
                                "a.tvd"));
  ASSERT_THAT(document.Report().entries, SizeIs(3));
  const auto& entries = document.Report().entries;
  EXPECT_EQ(entries[0].path + ":" + entries[0].key, "SimSpec:ModelType");
  EXPECT_EQ(entries[0].line, 6);
  EXPECT_EQ(entries[1].path + ":" + entries[1].key, "SimSpec/SimulationPeriod:SIMSTART");
  EXPECT_EQ(entries[2].path + ":" + entries[2].key, "ExtraParams:NoOfParams");
  // The file's words survive, also where they name no date.
  EXPECT_EQ(ValueOf(document, "SimSpec/SimulationPeriod:SIMSTART"), "2000, 13, 1, 0, 0");
}

TEST(FlowModelDocument, AFailedSaveLeavesTheFileAndTheDocumentAsTheyWere) {
  const TempFolder folder;
  const std::string path = folder.Write("a.tvd", SetupText(14, ""));
  CFlowModelDoc document;
  ASSERT_TRUE(document.OnOpenDocument(path));
  document.SetModified(true);
  EXPECT_FALSE(document.OnSaveDocument(folder.File("no/such/folder/a.tvd")));
  EXPECT_THAT(document.Error(), HasSubstr("no/such/folder"));
  EXPECT_EQ(document.PathName(), path);
  EXPECT_TRUE(document.IsModified());
  EXPECT_EQ(ReadFile(path), SetupText(14, ""));
}

TEST(Module, AnswersTheShellsQuestions) {
  std::string text;
  EXPECT_EQ(YbGetNumDocTemplates(), 1);
  EXPECT_EQ(YbGetEditorString(&text), 1);
  EXPECT_EQ(text, "Flow Model");
  EXPECT_EQ(YbGetEditorString(nullptr), 0);
  EXPECT_EQ(YbGetToolbarString(&text, 0), 1);
  EXPECT_EQ(text, "TERVANE Flowmodel Toolbar");
  EXPECT_EQ(YbGetToolbarString(&text, 1), 0);
  EXPECT_EQ(YbGetNumToolbars(), 1);
  EXPECT_EQ(YbGetBitmapId(), 0);
}

}  // namespace
}  // namespace tervane
