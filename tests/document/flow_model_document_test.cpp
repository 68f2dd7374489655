// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/flow_model_document.h"

#include <filesystem>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "simspec/model_components.h"
#include "simspec/river_files.h"
#include "surface/rivers.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::flow_model_document_test {
namespace {

using test::ReadFile;
using test::SavedText;
using test::SetupText;
using test::TempFolder;
using test::ValueOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

/// A program that notes what it is asked to start.
class NotingShell : public EngineShell, public NobodyToAsk {
 public:
  bool hasChanges = false, canSave = true, isShiftHeld = false;
  std::vector<std::string> notes;

  Host& Outside() override { return *this; }
  Answer Ask(const std::string& text, Icon /*icon*/, Buttons /*buttons*/) override {
    notes.push_back("told: " + text);
    return Answer::Ok;
  }
  bool HasChanges() const override { return hasChanges; }
  bool DoFileSave() override {
    notes.push_back("save");
    return canSave;
  }
  bool IsShiftHeld() const override { return isShiftHeld; }
  void Start(const CYbSimpleLaunch& launch, bool showsProgress) override {
    notes.push_back(fmt::format("{} {} [{}] log [{}] report [{}]{}", launch.Engine, launch.Input, launch.Options,
                                launch.ExtraLog, launch.Report, showsProgress ? "" : " hidden"));
  }
  bool IsExecuting() const override { return !notes.empty(); }
};

class FlowModelDocument : public testing::Test {
 public:
  TempFolder folder;
  std::string path = folder.File("a.tvd");
  CFlowModelDoc document;

  void Open(const std::string& text) {
    folder.Write("a.tvd", text);
    ASSERT_TRUE(document.OnOpenDocument(path)) << document.Error();
  }
};

TEST_F(FlowModelDocument, NamesTheFilesThatLieInTheResultFolder) {
  ASSERT_TRUE(document.OpenText(SetupText(14, ""), "/data/karup.v2.tvd"));
  EXPECT_EQ(document.getResultFolder(), "/data/karup.v2_results");
  const std::pair<std::string, const char*> names[] = {{document.PreprocessorReport(), "_PreProcessed.kvf"},
                                                       {document.PreprocessedRiverData(), "_PreProcessed_River.bin"},
                                                       {document.SimulationCatalogue(), ".tvdres"},
                                                       {document.WaterQualityCatalogue(), ".TvdWQres"},
                                                       {document.GridSeriesIndex(), ".fif"},
                                                       {document.DetailedTimeSeriesPage(), "DetailedTS.HTML"},
                                                       {document.DetailedRiverTimeSeriesPage(), "DetailedFvrTS.HTML"}};
  for (const auto& [name, end] : names) EXPECT_EQ(name, std::string("\\data\\karup.v2_results\\karup.v2") + end);
  // One separator, one dot.
  EXPECT_EQ(ResultFileName("C:\\x\\results\\", "run", "tvdres"), "C:\\x\\results\\run.tvdres");
  EXPECT_EQ(ResultFileName("  /data/out/  ", "run", ""), "\\data\\out\\run");
  EXPECT_EQ(ResultFileName("", "run", ".fif"), "\\run.fif");
}

TEST_F(FlowModelDocument, RunsTheEngineOnTheSavedFile) {
  ASSERT_TRUE(
      document.OpenText(SetupText(14, "section SimSpec {\nsection ModelComp {\nRiver = 1\n}\n}"), "/data/karup.tvd"));
  document.RunEngine("");  // nobody there
  EXPECT_EQ(document.IsExecuting(), 0);
  NotingShell shell;
  document.SetEngineShell(&shell);
  document.RunEngine("/WM");
  EXPECT_NE(document.IsExecuting(), 0);
  auto& river = dynamic_cast<CRiverKvf&>(*document.Root().Important(kRiver));
  river.SetRiverFile(FileName("rivers/karup.fvsim", "/data"));
  shell.isShiftHeld = true;
  shell.hasChanges = true;
  document.RunEngine("");
  shell.isShiftHeld = false;
  // The log of an earlier start stays.
  river.SetRiverFile(FileName("other.fvsim", "/data"));
  document.Root().Important(kModelComponents)->River = 0;
  document.RunEngine("/PP");
  document.RunExtraction(1, -1);
  shell.canSave = false;
  document.RunEngine("");
  EXPECT_THAT(shell.notes,
              ElementsAre("Tvn_Simulation.exe /data/karup.tvd [/WM] log [] report []", "save",
                          "Tvn_Simulation.exe /data/karup.tvd [] log [/data/rivers/karupFvrProgress.log] report "
                          "[/data/karup_results/karup_PreProcessed.kvf] hidden",
                          "save",
                          "Tvn_Simulation.exe /data/karup.tvd [/PP] log [/data/rivers/karupFvrProgress.log] report "
                          "[/data/karup_results/karup_PreProcessed.kvf]",
                          "save",
                          "PTRetrieval_Launch.exe /data/karup.tvd [/Engine 1 /SelPostProc -1] log "
                          "[/data/rivers/karupFvrProgress.log] report []",
                          "save", "told: Unable to run setup: Failed to save specification file."));
}

TEST_F(FlowModelDocument, GivesTheRiverSimulationItsResultFolderAtEachSave) {
  const std::string river = folder.Write("rivers/a.fvsim", "target FvRun {\n}\ntarget System {\n}\n");
  const std::string quality = folder.Write("rivers/wq.fvsim", "target FvRun {\n}\n");
  const std::string unchanged = ReadFile(quality);
  Open(SetupText(14,
                 "section SimSpec {\nsection ModelComp {\nRiver = 1\n}\n}\n"
                 "section River {\nFilename = file \"rivers/a.fvsim\"\nFilenameWQ = file \"rivers/wq.fvsim\"\n}"));
  document.UseCustomResultFolder = true;
  document.CustomResultFolder = FileName("out", folder.Path());
  ASSERT_TRUE(document.OnSaveDocument(path)) << document.Error();
  const auto told = [](const std::string& name) { return HasSubstr("CustomResultFolder = file \"" + name + "\""); };
  // The same folder, seen from where the river file lies.
  EXPECT_THAT(ReadFile(river), told("../out"));
  EXPECT_EQ(ReadFile(quality), unchanged);
  document.Root().Important(kModelComponents)->WQ = 1;
  document.Root().Important(kWaterQualityComponents)->River = 1;
  // With another engine the component still decides.
  document.Root().Important(kBasicParameters)->ModelType = kEngineModflow2000;
  ASSERT_TRUE(document.OnSaveDocument(path));
  EXPECT_THAT(ReadFile(quality), told("../out"));
  EXPECT_THAT(document.SaveNotes(), IsEmpty());
  // What cannot be written is told, and the setup is saved all the same.
  const std::string cut = "target FvRun {";
  folder.Write("rivers/a.fvsim", cut);
  document.CustomResultFolder = FileName("out2", folder.Path());
  ASSERT_TRUE(document.OnSaveDocument(path));
  EXPECT_THAT(document.SaveNotes(), ElementsAre(HasSubstr("a.fvsim:1:")));
  EXPECT_EQ(ReadFile(river), cut);
  EXPECT_THAT(ReadFile(path), told("out2"));
  document.Root().Important(kModelComponents)->River = 0;
  ASSERT_TRUE(document.OnSaveDocument(path));
  EXPECT_THAT(document.SaveNotes(), IsEmpty());
}

TEST_F(FlowModelDocument, KeepsTheCustomResultFolderInTheFile) {
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

  // What engines ask finds the same folder.
  for (const char* settings : {"", "ProjectResultRoot = file \"runs\"\n",
                               "ProjectResultRoot = file \"runs\"\nUseCustomResultFolder = 0\n"
                               "CustomResultFolder = file \"own\"\n",
                               "UseCustomResultFolder = 1\nCustomResultFolder = file \"own\"\n"}) {
    folder.Write("a.tvd", SetupText(14, "Flow = file \"flow.nds2\"") + "target SYSTEM {\n" + settings + "}\n");
    CFlowModelDoc opened;
    ASSERT_TRUE(opened.OnOpenDocument(path)) << opened.Error();
    KvfFile* file = kvfLoadFile(path, 0);
    char asked[kKvfPathBuffer] = {};
    kvfGetResultFolderPath(kvfParamByNum(kvfKeywordByNum(kvfTargetByNum(file, 1), 1), 1), asked);
    kvfClose(&file);
    EXPECT_EQ(opened.getResultFolder(), asked) << settings;
  }

  reopened.UseCustomResultFolder = false;
  EXPECT_EQ(reopened.getResultFolder(), folder.Path() + "/a_results");
}

TEST_F(FlowModelDocument, SavedElsewhereItsFileNamesStillMeanTheSameFiles) {
  std::filesystem::create_directories(folder.File("b/c"));
  folder.Write("b/a.tvd", SetupText(14, R"(section SimSpec {
    section ModelComp {
      FilenameTvdRes = file "results\\flow.tvdres"
    }
    section SimulationPeriod {
      HotStartResultFile = file "D:\\old\\run.tvdres"
    }
  })"));
  ASSERT_TRUE(document.OnOpenDocument(folder.File("b/a.tvd"))) << document.Error();
  const std::pair<const char*, const char*> cases[] = {{"b/a.tvd", "results\\flow.tvdres"},  // Not a byte changes.
                                                       {"b/c/a.tvd", "../results/flow.tvdres"},
                                                       {"a.tvd", "b/results/flow.tvdres"}};
  for (const auto& [to, flow] : cases) {
    ASSERT_TRUE(document.OnSaveDocument(folder.File(to))) << document.Error();
    EXPECT_EQ(ValueOf(document, "SimSpec/ModelComp:FilenameTvdRes"), flow);
    EXPECT_EQ(ValueOf(document, "SimSpec/SimulationPeriod:HotStartResultFile"), "D:\\old\\run.tvdres");
  }
}

TEST_F(FlowModelDocument, KeepsTheOriginalAtTheFirstSaveOverWhatItWouldLose) {
  const std::pair<std::string, std::string> cases[] = {
      {SetupText(9, ""), "a.v9"},
      {SetupText(-1, ""), "a.vnone"},
      {SetupText(14, "section SimSpec {\nModleType = 1\n}"), "a.v14"},  // Nothing reads it.
      {SetupText(14, "# mine"), "a.v14"},                               // A comment behind the first target.
      {SetupText(14, "section SimSpec {\nModelType = \"one\"\n}"), "a.v14"}};
  for (const auto& [text, kept] : cases) {
    CFlowModelDoc old;
    ASSERT_TRUE(old.OnOpenDocument(folder.Write("a.tvd", text))) << old.Error();
    folder.Write(kept + ".tvd", "taken");
    const std::string numbered = folder.File(kept + ".2.tvd");
    ASSERT_TRUE(old.OnSaveDocument(path)) << old.Error();
    EXPECT_EQ(ReadFile(numbered), text);
    EXPECT_EQ(ReadFile(folder.File(kept + ".tvd")), "taken");
    EXPECT_THAT(old.SaveNotes(), ElementsAre(HasSubstr(numbered)));
    ASSERT_TRUE(old.OnSaveDocument(path));
    EXPECT_THAT(old.SaveNotes(), IsEmpty());
    std::filesystem::remove(numbered);
  }
}

TEST_F(FlowModelDocument, AFileOfTheWrittenVersionIsSavedWithoutACopy) {
  const std::string header = "# Karup, calibrated 2024\n# by the water board\n";
  Open(header + SetupText(14, "section SimSpec {\nModelType = 2\n}"));
  ASSERT_TRUE(document.OnSaveDocument(path));
  EXPECT_THAT(document.SaveNotes(), IsEmpty());
  EXPECT_THAT(ReadFile(path), testing::StartsWith(header + "target TERVANE_FLOWMODEL {\n"));
  EXPECT_EQ(std::distance(std::filesystem::directory_iterator(folder.Path()), {}), 1);
}

TEST_F(FlowModelDocument, ReportsWhatItReadAllTheSame) {
  Open(SetupText(14, R"(section SimSpec {
      ModelType = "one"
      section SimulationPeriod {
        SIMSTART = 2000, 13, 1, 0, 0
      }
    }
    section ExtraParams {
      NoOfParams = -1
    })"));
  std::vector<std::string> places;
  for (const auto& entry : document.Report().entries)
    places.push_back(std::to_string(entry.line) + " " + entry.path + ":" + entry.key);
  EXPECT_THAT(places,
              ElementsAre("6 SimSpec:ModelType", "8 SimSpec/SimulationPeriod:SIMSTART", "12 ExtraParams:NoOfParams"));
  // The file's words survive, also where they name no date.
  EXPECT_EQ(ValueOf(document, "SimSpec/SimulationPeriod:SIMSTART"), "2000, 13, 1, 0, 0");
}

TEST_F(FlowModelDocument, AFailedSaveLeavesTheFileAndTheDocumentAsTheyWere) {
  Open(SetupText(14, ""));
  document.SetModified(true);
  EXPECT_FALSE(document.OnSaveDocument(folder.File("no/such/folder/a.tvd")));
  EXPECT_THAT(document.Error(), HasSubstr("no/such/folder"));
  EXPECT_EQ(document.PathName(), path);
  EXPECT_TRUE(document.IsModified());
  EXPECT_EQ(ReadFile(path), SetupText(14, ""));
}

}  // namespace
}  // namespace tervane::flow_model_document_test
