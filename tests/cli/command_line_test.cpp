// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/command_line.h"

#include <algorithm>
#include <filesystem>
#include <map>

#include <fmt/format.h>
#include <gmock/gmock.h>
#include <rapidjson/document.h>
#include <sys/stat.h>

#include "document/setup_lock.h"
#include "tests/support/command_outcome.h"
#include "tests/support/preprocessed_run.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::command_line_test {
namespace {

using test::ReadFile;
using test::SetupText;
using test::TempFolder;
using test::Tervane;
using Outcome = test::CommandOutcome;
using testing::AllOf;
using testing::EndsWith;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::StartsWith;

using Arguments = std::vector<std::string>;

rapidjson::Document Json(const Outcome& outcome) {
  rapidjson::Document json;
  json.Parse(outcome.out.c_str());
  EXPECT_FALSE(json.HasParseError()) << outcome.out;
  return json;
}

class CommandLine : public testing::Test {
 public:
  TempFolder folder;
  std::string file = folder.File("a.tvd");
};

/// The one finding of a setup at its defaults.
constexpr const char* kNoDomain =
    ": error: Catchment/NDS_2D_DATA_FILE:FILE_NAME: File is not valid (no file is chosen)\n";

TEST_F(CommandLine, CheckTellsFindingsNotesAndWhatNothingReads) {
  folder.Write("a.tvd", SetupText(14, R"(section SimSpec {
  Foo = 1
  section ModelComp {
    WQ = 1
  }
}
section ModelCompWQ {
  UZ = 1
  OL = "yes"
})"));
  const Outcome text = Tervane({"check", file});
  EXPECT_EQ(text.status, kFindings);
  EXPECT_THAT(text.out, HasSubstr(file + ": error: ModelCompWQ:UZ: UZ Water Quality is only allowed"));
  EXPECT_THAT(text.out,
              HasSubstr(file + ":13: note: ModelCompWQ:OL: \"yes\" stands where a whole number was expected"));
  EXPECT_THAT(text.out, HasSubstr(file + ":6: unread: SimSpec:Foo: "));

  const Outcome outcome = Tervane({"check", file, "--json"});
  EXPECT_EQ(outcome.status, kFindings);
  const rapidjson::Document json = Json(outcome);
  ASSERT_EQ(json["findings"].Size(), 3u);
  EXPECT_STREQ(json["findings"][0]["severity"].GetString(), "note");
  const auto& error = json["findings"][1];
  EXPECT_STREQ(error["severity"].GetString(), "error");
  EXPECT_EQ(std::string(error["path"].GetString()) + ":" + error["key"].GetString(), "ModelCompWQ:UZ");
  EXPECT_FALSE(error.HasMember("detail"));
  ASSERT_EQ(json["unread"].Size(), 1u);
  EXPECT_STREQ(json["unread"][0]["path"].GetString(), "SimSpec:Foo");
}

TEST_F(CommandLine, ANewSetupLacksItsDomainAloneAndReplacesNoFileInPassing) {
  EXPECT_EQ(Tervane({"new", file}).status, kDone);
  EXPECT_EQ(Tervane({"check", file}).out, file + kNoDomain);
  folder.Write("a.tvd", "mine");
  EXPECT_EQ(Tervane({"new", file}).status, kCouldNot);
  EXPECT_EQ(ReadFile(file), "mine");
  EXPECT_EQ(Tervane({"new", file, "--force"}).status, kDone);
}

TEST_F(CommandLine, TreeListsTheNodesThatTakePartOrAll) {
  Tervane({"new", file});
  const rapidjson::Document used = Json(Tervane({"tree", file, "--json"}));
  const rapidjson::Document all = Json(Tervane({"tree", file, "--all", "--json"}));
  EXPECT_GT(all["nodes"].Size(), used["nodes"].Size());
  for (const auto& node : used["nodes"].GetArray()) EXPECT_TRUE(node["used"].GetBool());
  std::map<std::string, std::string> nodes;
  for (const auto& node : all["nodes"].GetArray())
    nodes[node["path"].GetString()] = fmt::format("{} <{}> {}", node["class"].GetString(), node["title"].GetString(),
                                                  node["used"].GetBool() ? "used" : "unused");
  EXPECT_EQ(nodes["SimSpec/ModModelComp"], "CModModelCompKvf <Model Components> unused");
  EXPECT_THAT(nodes["ModelCompWQ/WQTSC"], EndsWith("unused"));  // Of its parent.
  EXPECT_THAT(nodes["CIntroductionKvf"], EndsWith(" used"));
  EXPECT_THAT(Tervane({"tree", file, "--paths"}).out, HasSubstr("\nSimSpec/SimTitle\n"));
}

TEST_F(CommandLine, CountsThatNoSectionsStandForAskForLittleMemory) {
  folder.Write("a.tvd", SetupText(14, R"(section ExtraParams {
  YbSEKvfListItemCount = 1000000000
  NoOfParams = 1000000000
}
section Subcatchments {
  NO_ZONES = 1000000000
}
section Climate {
  section PrecipitationRate {
    section STATION_BASED {
      NO_TIMESERIES = 1000000000
    }
  }
}
section Overlays {
  section Background {
    YbSEKvfListItemCount = 1000000000
  }
})"));
  const Outcome check = Tervane({"check", file});
  EXPECT_EQ(check.status, kFindings);
  for (const char* key : {"ExtraParams:YbSEKvfListItemCount", "ExtraParams:NoOfParams", "Subcatchments:NO_ZONES",
                          "Climate/PrecipitationRate/STATION_BASED:NO_TIMESERIES", "Background:YbSEKvfListItemCount"})
    EXPECT_THAT(check.out, HasSubstr(std::string(key) + ": a count of 1000000000 is cut to 100"));
}

TEST_F(CommandLine, TitlesReachTheTerminalWithoutWhatItWouldObey) {
  Tervane({"new", file});
  Tervane({"set", file, "ExtraParams:NoOfParams", "1", "ExtraParams/ExtraParam_1:Name", "a\x1b[31m\xc2\x9b\nb"});
  EXPECT_EQ(Tervane({"get", file, "ExtraParams/ExtraParam_1:Name"}).out, "a\\u{1b}[31m\\u{9b}\nb\n");
  EXPECT_STREQ(Json(Tervane({"get", file, "ExtraParams/ExtraParam_1:Name", "--json"}))["values"][0].GetString(),
               "a\x1b[31m\xc2\x9b\nb");
  EXPECT_THAT(Tervane({"check", "no\x1b[2J\xff"}).err, HasSubstr("no\\u{1b}[2J\\xff"));
  // A finding stays one line.
  folder.Write("a.tvd", SetupText(14, "section \"a\\nb\" {\n}"));
  const std::string found = Tervane({"check", file}).out;
  EXPECT_THAT(found, HasSubstr("a\\nb"));
  EXPECT_EQ(std::ranges::count(found, '\n'), 2) << found;
}

TEST_F(CommandLine, WhatIsUnlikelyIsAWarningAtItsKey) {
  const struct {
    Arguments changes;
    const char* finding;
  } cases[] = {
      {{"SimSpec/SimulationPeriod:SIMEND", "1999-12-31"},
       "error: SimSpec/SimulationPeriod:SIMEND: The simulation ends before it begins (it begins at 2000-01-01 00:00"},
      {{"SimSpec/CompControlParaTimeStep:InitialTimeStep", "0"},
       "warning: SimSpec/CompControlParaTimeStep:InitialTimeStep: The value 0 is outside its range: above 0"},
      {{"SimSpec/CompControlParaTimeStep:MaxAllowedSZTimeStep", "-1"}, "outside its range: above 0"},
      {{"SimSpec/CompControlParaTimeStep:IncrementRate", "2"}, "outside its range: 0 to 1"},
      {{"SimSpec/ModelComp:SZ", "1", "SimSpec/CompControlParaTimeStep:InitialTimeStep", "2 days"},
       "InitialTimeStep: The initial time step is longer than any that is allowed (48 hours, and at most 24)"},
      {{"SimSpec:ModelType", "7"}, "warning: SimSpec:ModelType: The value 7 is none of its choices"},
      {{"Catchment:type", "2", "Catchment:sizeShp", "-5"},
       "Catchment:sizeShp: The grid of the model cannot be made (the cell size is -5, not above 0)"}};
  for (const auto& c : cases) {
    Tervane({"new", file, "--force"});
    Arguments set{"set", file};
    set.insert(set.end(), c.changes.begin(), c.changes.end());
    const Outcome outcome = Tervane(set);
    EXPECT_EQ(outcome.status, kDone) << outcome.err;
    EXPECT_THAT(Tervane({"check", file}).out, HasSubstr(c.finding));
    // Who sets it is told at once.
    EXPECT_THAT(outcome.err, Not(IsEmpty())) << c.finding;
  }
}

TEST_F(CommandLine, FindingsOfOneCauseAreOneLineUnlessEachIsAskedFor) {
  std::string stations;
  for (int number = 1; number <= 5; ++number)
    stations += fmt::format("section TIME_SERIES_{} {{\nTYPE = 2\n}}\n", number);
  folder.Write("a.tvd", SetupText(14,
                                  "section Climate {\nsection PrecipitationRate {\nDistributionType = 2\n"
                                  "section STATION_BASED {\nNO_TIMESERIES = 5\n}\n" +
                                      stations + "}\n}"));
  const std::string place = "error: Climate/PrecipitationRate/TIME_SERIES_";
  const std::string grouped = Tervane({"check", file}).out;
  EXPECT_THAT(grouped,
              HasSubstr(place + "*/TIME_SERIES_FILE:FILE_NAME: File is not valid (no file is chosen): 5 places"));
  EXPECT_THAT(grouped, Not(HasSubstr("TIME_SERIES_2")));
  EXPECT_THAT(Tervane({"check", file, "--each"}).out, HasSubstr(place + "2/TIME_SERIES_FILE:FILE_NAME: File is not"));
  EXPECT_GT(Json(Tervane({"check", file, "--json"}))["findings"].Size(), 5U);
}

TEST_F(CommandLine, GetAndShowTellValuesAsTheyWouldBeSaved) {
  folder.Write("a.tvd", SetupText(9, R"(section SimSpec {
      section CompControlParaTimeStep {
        MaxAllowedTimeStep = 3f
      }
    }
    section ExtraParams {
      NoOfParams = 1
      section ExtraParam_1 {
        Name = "a \"b\""
      }
    })"));
  const std::pair<const char*, const char*> cases[] = {{"SimSpec/SimulationPeriod:SIMSTART", "2000, 1, 1, 0, 0"},
                                                       {"SimSpec/CompControlParaTimeStep:MaxAllowedOLTimeStep", "3"},
                                                       {"\"SimSpec\"#1/ModelComp:FilenameTvdRes", ""},
                                                       {"ExtraParams/ExtraParam_1:Name", "a \"b\""}};
  for (const auto& [path, value] : cases) EXPECT_EQ(Tervane({"get", file, path}).out, value + std::string("\n"));
  const std::string show = Tervane({"show", file, "SimSpec/CompControlParaTimeStep"}).out;
  EXPECT_THAT(show, HasSubstr("MaxAllowedOLTimeStep = 3f  [hours]  (default 0.5f)\n"));
  EXPECT_THAT(show, HasSubstr("InitialTimeStep = 6f  [hours]\n"));
  EXPECT_THAT(show, Not(HasSubstr("SimTitle")));
  EXPECT_THAT(Tervane({"show", file}).out, HasSubstr("SimTitle"));
}

TEST_F(CommandLine, PageShowsTheControlsOfANode) {
  Tervane({"new", file});
  EXPECT_EQ(Tervane({"page", file, "SimSpec/SimTitle"}).out,
            "text \"Simulation Title:\" = \nlong text \"Simulation Description:\" = \n");
  EXPECT_THAT(Tervane({"page", file, "CIntroductionKvf"}).out, HasSubstr("browser \"\"\n  Tervane\n  This editor"));
  EXPECT_EQ(Tervane({"page", file, "FlowModelDocVersion"}).status, kCouldNot);
  // Lists that only old files have.
  const std::string old =
      folder.Write("old.tvd", test::SetupText(10,
                                              "section SimSpec {\nModelType = 1\n}\nsection Evapotrans {\nsection "
                                              "ETExtinctionDepth {\nYbSEKvfListItemCount = 2\n}\n}"));
  EXPECT_THAT(Tervane({"page", old, "Evapotrans/ETExtinctionDepth"}).out, HasSubstr("table "));
  EXPECT_EQ(Tervane({"page", old, "Evapotrans/None"}).status, kCouldNot);
}

TEST_F(CommandLine, APlaceThatIsNotThereIsToldWithWhatComesNear) {
  Tervane({"new", file});
  const std::pair<const char*, const char*> cases[] = {
      {"SimSpec/ModelCmp:ET", "did you mean ModelComp?"},    {"simspec:ModelType", "did you mean SimSpec?"},
      {"SimSpec:ModelTyp", "did you mean ModelType?"},       {"SimSpec", "a key was expected"},
      {"SimSpec#2:ModelType", "there is no SimSpec#2 here"}, {"SimSpec/", "a name was expected"}};
  for (const auto& [path, message] : cases) {
    const Outcome outcome = Tervane({"get", file, path});
    EXPECT_EQ(outcome.status, kCouldNot);
    EXPECT_THAT(outcome.out, IsEmpty());
    EXPECT_THAT(outcome.err, HasSubstr(message));
  }
}

TEST_F(CommandLine, SetChangesOneValueAndNothingElse) {
  const std::string before = folder.File("before.tvd");
  struct Case {
    const char *path, *value, *saved;
  };
  const Case cases[] = {
      {"SimSpec:ModelType", "3", "0 [Tervane] (default) -> 3 [MODFLOW 2000]"},
      {"SimSpec/SimTitle:Title", "a \"quoted\" title, with", "\"\" (default) -> \"a \\\"quoted\\\" title, with\""},
      {"SimSpec/SimulationPeriod:SIMEND", "2001-12-31 06:30", "2000, 2, 1, 0, 0 (default) -> 2001, 12, 31, 6, 30"},
      {"SimSpec/SimulationPeriod:SIMEND", "2001,12,31,6,30", "2000, 2, 1, 0, 0 (default) -> 2001, 12, 31, 6, 30"},
      {"SimSpec/CompControlParaOL:RelaxFactor", "0.75", "0.9f (default) -> 0.75f"},
      {"ModelCompWQ/WQTSC:MaxSimTimeStepSZ", "1e7", "1e9 [hours] (default) -> 10000000.0 [hours]"},
      {"SimSpec/ModelComp:FilenameTvdRes", "run/x.tvdres", "file \"\" (default) -> file \"run/x.tvdres\""}};
  Tervane({"new", before});
  for (const Case& c : cases) {
    Tervane({"new", file, "--force"});
    const Outcome outcome = Tervane({"set", file, c.path, c.value});
    EXPECT_EQ(outcome.status, kDone) << outcome.err;
    EXPECT_EQ(Tervane({"diff", before, file}).out, fmt::format("{}: {}\n", c.path, c.saved));
    EXPECT_EQ(Tervane({"check", file}).out, file + kNoDomain);
  }
  Tervane({"set", file, "SimSpec/SimTitle:Touched", "1"});
  EXPECT_EQ(Tervane({"get", file, "SimSpec/SimTitle:Touched"}).out, "1\n");
  EXPECT_EQ(Tervane({"new", folder.File("setup.txt")}).status, kCouldNot);
  Tervane({"set", file, "ExtraParams:NoOfParams", "2"});
  EXPECT_EQ(Tervane({"get", file, "ExtraParams/ExtraParam_2:Type"}).out, "0\n");
}

TEST_F(CommandLine, SetTakesWhatAPageTakesAndSeveralKeysOrNone) {
  const struct {
    const char *path, *typed, *value;
  } cases[] = {
      {"SimSpec/ModelComp:UZ_ModelType", "richards equation", "0"},
      {"SimSpec:ModelType", "MODFLOW 96", "2"},
      {"Climate/PrecipitationRate:DistributionType", "Station based", "2"},  // Counted from 1.
      {"SimSpec/CompControlParaTimeStep:MaxAllowedSZTimeStep", "2 days", "48"},
      {"SimSpec/CompControlParaTimeStep:MaxAllowedSZTimeStep", "36", "36"},
      {"Topography:SearchRadius", "1.5 km", "1500"},
      {"SimSpec/SimulationPeriod:SIMEND", "2011-01-01", "2011, 1, 1, 0, 0"},
      {"Topography/NDS_2D_DATA_FILE:ITEM_NUMBERS", "3, 4", "3, 4"},
      {"Topography/SHAPE_FILE:ITEM_NUMBERS", "CODE", "CODE"},
      {"KinetraTemplateSpecification:TemplateFile_OL", "none.kinetra", "none.kinetra, -1, -1, -1, -1, -1, -1"}};
  for (const auto& c : cases) {
    Tervane({"new", file, "--force"});
    const Outcome outcome = Tervane({"set", file, c.path, c.typed});
    EXPECT_EQ(outcome.status, kDone) << outcome.err;
    EXPECT_EQ(Tervane({"get", file, c.path}).out, c.value + std::string("\n")) << c.typed;
  }
  const std::string before = ReadFile(file);
  const Outcome refused = Tervane({"set", file, "SimSpec/SimTitle:Title", "x", "SimSpec:ModelType", "Modflow"});
  EXPECT_EQ(refused.status, kCouldNot);
  EXPECT_THAT(refused.err, HasSubstr("one of 0 (Tervane), 1 (MODFLOW Surfact)"));
  EXPECT_EQ(Tervane({"set", file, "SimSpec/SimTitle:Title", "x", "SimSpec:ModelType"}).status, kCouldNot);
  EXPECT_EQ(ReadFile(file), before);
}

TEST_F(CommandLine, SetFillsValuesThatStandInASectionOfTheirOwn) {
  folder.Write("a.tvd",
               SetupText(14,
                         "section Results_Post_Processing {\nsection PT_Reg_Extraction {\nYbSEKvfListItemCount = "
                         "1\n}\nsection PT_Pathline_Extraction {\nYbSEKvfListItemCount = 1\n}\n}\n"));
  const std::string job = "Results_Post_Processing/PT_Reg_Extraction/Extraction_1/";
  const struct {
    std::string path;
    const char *typed, *got;
  } cases[] = {{job + "WellNames:wellname", "North 3, 17", "\"North 3\", \"17\""},
               {job + "WellNames:wellname", "17", "\"17\""},
               {job + "SinkCodes:sinkcode", "0, 3", "0, 3"},
               {"Results_Post_Processing/PT_Pathline_Extraction/Extraction_1/Particle_IDs:id", "17", "17"},
               {job + "WellNames:wellname", "", ""}};
  for (const auto& c : cases) {
    const Outcome outcome = Tervane({"set", file, c.path, c.typed});
    EXPECT_EQ(outcome.status, kDone) << outcome.err;
    EXPECT_EQ(Tervane({"get", file, c.path}).out, c.got + std::string("\n"));
  }
  EXPECT_EQ(Json(Tervane({"get", file, job + "SinkCodes:sinkcode", "--json"}))["values"][1].GetInt(), 3);
  const std::string before = ReadFile(file);
  EXPECT_THAT(Tervane({"set", file, job + "SinkCodes:sinkcode", "0, River"}).err, HasSubstr("whole numbers"));
  EXPECT_THAT(Tervane({"set", file, job + "SinkCode:sinkcode", "0"}).err, HasSubstr("there is no SinkCode here"));
  EXPECT_EQ(ReadFile(file), before);
}

TEST_F(CommandLine, SetBindsWhatATemplateTakesFromTheModel) {
  folder.Write("b.kinetra",
               "target KINETRA_SETUP {\nsection FORCINGS {\nsection FORCING_1 {\nSYMBOL = \"light\"\n}\nsection "
               "FORCING_2 {\nSYMBOL = \"temp\"\nBUILT_IN_ID = 55\n}\n}\n}\n");
  Tervane({"new", file});
  const std::string templates = "KinetraTemplateSpecification";
  ASSERT_EQ(Tervane({"set", file, templates + ":TemplateFile_OL", "b.kinetra"}).status, kDone);
  const std::string place = templates + "/OL_Forcings:Forcing#2";
  const Outcome outcome = Tervane({"set", file, place, "temp, 2020, 2800"});
  EXPECT_EQ(outcome.status, kDone) << outcome.err;
  EXPECT_EQ(Tervane({"get", file, place}).out, "temp, 2020, 2800\n");
  EXPECT_EQ(Tervane({"set", file, place, "unknown, 2020, 2800"}).status, kCouldNot);
}

TEST_F(CommandLine, CheckTellsWhatMendsAFinding) {
  folder.Write("a.tvd", SetupText(14,
                                  "section SimSpec {\nsection ModelComp {\nWQ = 1\n}\n}\nsection Species {\n"
                                  "NumberOfSpecies = 1\n}\nsection Sources {\nNumberOfSources = 1\nsection Source_1 {\n"
                                  "Species = \"gone\"\n}\n}\n"));
  const rapidjson::Document json = Json(Tervane({"check", file, "--json"}));
  for (const auto& finding : json["findings"].GetArray()) {
    if (!finding.HasMember("mends")) continue;
    const auto& mend = finding["mends"][0];
    EXPECT_STREQ(mend["text"].GetString(), "Change Species to Species_1");
    // They are made for `set`.
    EXPECT_EQ(Tervane({"set", file, mend["path"].GetString(), mend["value"].GetString()}).status, kDone);
    EXPECT_THAT(Tervane({"check", file}).out, Not(HasSubstr("names a species")));
    return;
  }
  FAIL() << "no mends";
}

TEST_F(CommandLine, JsonTellsKeysAndPages) {
  Tervane({"new", file});
  const rapidjson::Document get = Json(Tervane({"get", file, "SimSpec:ModelType", "--json"}));
  EXPECT_EQ(get["values"][0].GetInt(), 0);
  EXPECT_STREQ(get["text"].GetString(), "Tervane");
  const rapidjson::Document show = Json(Tervane({"show", file, "SimSpec/SimulationPeriod", "--json"}));
  ASSERT_EQ(show["nodes"].Size(), 1U);
  EXPECT_STREQ(show["nodes"][0]["path"].GetString(), "SimSpec/SimulationPeriod");
  EXPECT_GT(show["nodes"][0]["keys"].Size(), 5U);
  const rapidjson::Document page = Json(Tervane({"page", file, "SimSpec/SimulationPeriod", "--json"}));
  EXPECT_STREQ(page["controls"][0]["label"].GetString(), "Start Date:");
  EXPECT_TRUE(page["controls"][0]["enabled"].GetBool());
  bool isFound = false;
  const rapidjson::Document keys = Json(Tervane({"keys", "--json"}));
  for (const auto& key : keys["keys"].GetArray())
    if (key["path"] == "SimSpec" && key["key"] == "ModelType") {
      isFound = true;
      EXPECT_STREQ(key["choices"][2]["text"].GetString(), "MODFLOW 96");
    }
  EXPECT_TRUE(isFound);
}

TEST_F(CommandLine, WhatAnEditorHasOpenIsNotWrittenUnlessForced) {
  Tervane({"new", file});
  const std::string before = ReadFile(file);
  SetupLock lock;
  ASSERT_EQ(lock.Take(file), SetupLock::Outcome::Taken);
  const std::string other = folder.Write("other.tvd", SetupText(14, ""));
  for (Arguments arguments : {Arguments{"set", file, "SimSpec/SimTitle:Title", "x"}, Arguments{"convert", file, file},
                              Arguments{"convert", other, file}, Arguments{"new", file}}) {
    folder.Write("a.tvd", before);
    const Outcome outcome = Tervane(arguments);
    EXPECT_EQ(outcome.status, kCouldNot);
    EXPECT_THAT(outcome.err, AllOf(HasSubstr(file + ": it is open"), HasSubstr("--force")));
    EXPECT_EQ(ReadFile(file), before);
    arguments.push_back("--force");
    EXPECT_EQ(Tervane(arguments).status, kDone);
  }
}

TEST_F(CommandLine, SetRefusesWhatTheKeyDoesNotTakeAndWritesNothing) {
  Tervane({"new", file});
  Tervane({"set", file, "SimSpec:ModelType", "2"});
  const std::string before = ReadFile(file);
  struct Case {
    const char *path, *value, *message;
  };
  const Case cases[] = {{"SimSpec:ModelType", "three", "one of 0 (Tervane), 1 (MODFLOW Surfact), "},
                        {"SimSpec:ModelType", "2147483648", "was expected"},
                        {"SimSpec/CompControlParaOL:RelaxFactor", "1e39", "a number that fits a float was expected"},
                        {"SimSpec/SimulationPeriod:SIMEND", "2001", "a date as 2000-01-31 12:00, or its numbers"},
                        {"SimSpec/SimTitle:Title", "\xFF", "UTF-8"},
                        // Computed at every save; this engine knows one kind of recharge.
                        {"SimSpec:IsDataUsedInSetup", "0", "does not take this value: it would be saved as 1"},
                        {"SimSpec/ModModelComp:Recharge_ModelType", "1", "it would be saved as 0"}};
  for (const Case& c : cases) {
    const Outcome outcome = Tervane({"set", file, c.path, c.value});
    EXPECT_EQ(outcome.status, kCouldNot) << c.path;
    EXPECT_THAT(outcome.err, HasSubstr(c.message));
    EXPECT_EQ(ReadFile(file), before);
  }
}

TEST_F(CommandLine, SetAndConvertInPlaceKeepTheOriginalOfAnOldFile) {
  const std::string text = SetupText(6, ""), kept = folder.File("a.v6.tvd");
  for (const auto& command : std::vector<Arguments>{{"set", file, "SimSpec:ModelType", "1"}, {"convert", file, file}}) {
    folder.Write("a.tvd", text);
    EXPECT_THAT(Tervane(command).err, HasSubstr("a.v6.tvd"));
    EXPECT_EQ(ReadFile(kept), text);
    EXPECT_EQ(Tervane({"get", file, "FlowModelDocVersion:Version"}).out, "14\n");
    std::filesystem::remove(kept);
  }
}

TEST_F(CommandLine, ConvertLeavesTheFileItReadsAndOtherFilesAlone) {
  const std::string text = SetupText(9, "section Unknown {\n}");
  folder.Write("a.tvd", text);
  const std::string out = folder.Write("out.tvd", "mine");
  EXPECT_EQ(Tervane({"convert", file, out}).status, kCouldNot);
  EXPECT_EQ(ReadFile(out), "mine");
  const Outcome outcome = Tervane({"convert", file, out, "--force"});
  EXPECT_EQ(outcome.status, kDone);
  EXPECT_THAT(outcome.err, HasSubstr("section Unknown"));  // What the new file does not hold is told.
  EXPECT_EQ(ReadFile(file), text);
  EXPECT_EQ(Tervane({"check", out}).out, out + kNoDomain);
}

TEST_F(CommandLine, DiffComparesBySectionAndKey) {
  folder.Write("a.tvd", SetupText(14, "section SimSpec {\nModelType = 1\n}"));
  const std::string other = folder.Write("b.tvd", SetupText(14, ""));
  EXPECT_EQ(Tervane({"diff", file, file}).status, kDone);
  EXPECT_EQ(Tervane({"diff", file, file, "--json"}).out, "{\"differences\": []}\n");
  const Outcome outcome = Tervane({"diff", file, other});
  EXPECT_EQ(outcome.status, kFindings);
  EXPECT_EQ(outcome.out, "SimSpec:ModelType: 1 [MODFLOW Surfact] -> 0 [Tervane] (default)\n");
  const rapidjson::Document json = Json(Tervane({"diff", file, other, "--json"}));
  ASSERT_EQ(json["differences"].Size(), 1u);
  EXPECT_STREQ(json["differences"][0]["from"].GetString(), "1");
  EXPECT_TRUE(json["differences"][0]["toDefault"].GetBool());
}

TEST_F(CommandLine, KeysListsEveryKeyWithTypeAndDefault) {
  const std::string text = Tervane({"keys"}).out;
  EXPECT_THAT(
      text,
      HasSubstr("\nSimSpec/ModelComp:UZ_ModelType\tint\t2\t\t0 Richards equation; 1 Gravity Flow; 2 2 Layer UZ\n"));
  EXPECT_THAT(text, HasSubstr("\nSimSpec/CompControlParaOL:IterStopCriteria\tfloat\t\tup to version 9, read only\t\n"));
  const std::string markdown = Tervane({"keys", "--markdown"}).out;
  EXPECT_THAT(markdown, StartsWith("# Keys of a setup\n"));
  EXPECT_THAT(markdown, HasSubstr("| `MaxInfiltDepthPerTimeStep ` | float | `10f` | from version 7 | mm; above 0 |\n"));
}

TEST_F(CommandLine, WhatIsNoSetupIsRefusedWithoutATrace) {
  std::string deep = "target TERVANE_FLOWMODEL {\n";
  for (int i = 0; i < 100'000; ++i) deep += "section A {\n";
  const std::pair<std::string, const char*> cases[] = {
      {"", ":1:1: "},
      {std::string("target TERVANE_FLOWMODEL {\n\0\0\n}\n", 32), ":2:1: "},
      {deep, "nested deeper than 200"},
      {"target TVDRES {\n}\n", "target TERVANE_FLOWMODEL was expected"}};
  const std::string out = folder.File("out.tvd");
  for (const auto& [text, message] : cases) {
    folder.Write("a.tvd", text);
    const Outcome check = Tervane({"check", file});
    EXPECT_EQ(check.status, kCouldNot) << message;
    EXPECT_THAT(check.out, IsEmpty());
    EXPECT_THAT(check.err, HasSubstr(message));
    EXPECT_THAT(check.err, StartsWith(file + ":"));
    for (const auto& command : std::vector<Arguments>{
             {"convert", file, out}, {"convert", file, file}, {"set", file, "SimSpec:ModelType", "1"}})
      EXPECT_EQ(Tervane(command).status, kCouldNot);
    EXPECT_EQ(ReadFile(file), text);
    EXPECT_FALSE(std::filesystem::exists(out));
  }
  const std::string fifo = folder.File("fifo.tvd");
  ASSERT_EQ(mkfifo(fifo.c_str(), 0600), 0);
  for (const std::string& path : {fifo, folder.Path(), folder.File("missing.tvd")}) {
    const Outcome outcome = Tervane({"check", path});
    EXPECT_EQ(outcome.status, kCouldNot);
    EXPECT_THAT(outcome.err, HasSubstr(path));
  }
}

TEST_F(CommandLine, WhatIsOddButReadableGetsANote) {
  const std::pair<const char*, const char*> cases[] = {
      {"section ExtraParams {\nYbSEKvfListItemCount = 3\n}", "3 of 3 items have no section"},
      {"section SimSpec {\nModelType = 1\nModelType = 2\n}", "SimSpec:ModelType#2"},
      {"section SimSpec {\n}\nsection SimSpec {\n}", "SimSpec#2"},
      {"section Nobody {\n}", "section Nobody"},
      {"Nothing = 1", "key Nothing"}};
  for (const auto& [sections, message] : cases) {
    folder.Write("a.tvd", SetupText(14, sections));
    const Outcome outcome = Tervane({"check", file});
    EXPECT_EQ(outcome.status, kFindings) << sections;
    EXPECT_THAT(outcome.out, HasSubstr(message));
  }
}

TEST_F(CommandLine, AnUnknownCommandOrAMissingArgumentIsTold) {
  for (const auto& arguments :
       std::vector<Arguments>{{}, {"chek", "a"}, {"check"}, {"get", file}, {"tree", "a", "--al"}}) {
    const Outcome outcome = Tervane(arguments);
    EXPECT_EQ(outcome.status, kCouldNot);
    EXPECT_THAT(outcome.err, Not(IsEmpty()));
  }
  EXPECT_THAT(Tervane({"chek", "a"}).err, HasSubstr("there is no command chek; did you mean check?"));
  EXPECT_THAT(Tervane({"data", "stat"}).err, HasSubstr("there is no command data stat; did you mean stats?"));
  for (const char* command :
       {"new", "check", "tree", "show", "page", "get", "set", "convert", "diff", "keys", "completion"})
    EXPECT_THAT(Tervane({command, "--help"}).out, HasSubstr("Usage: tervane " + std::string(command)));
}

TEST_F(CommandLine, TreeAndPageShowWhatThePreprocessorLeft) {
  folder.Write("a.tvd", SetupText(14, ""));
  test::WritePreprocessedRun(folder.File("a_results"), "a");
  const std::string page = "ProcData/Preprocessed data/Topography";
  EXPECT_THAT(Tervane({"tree", "--paths", file}).out, HasSubstr("\n" + page + "\n"));
  EXPECT_THAT(Tervane({"page", file, page}).out, HasSubstr("map \"\" = grid 48x36, 53 shapes"));
  folder.Write("a_results/a_PreProcessed.kvf", "target T {\nsection PAGE {\n");
  const Outcome broken = Tervane({"page", file, page});
  EXPECT_EQ(broken.status, 2);
  EXPECT_THAT(broken.err, AllOf(HasSubstr("a_PreProcessed.kvf:3:1"), HasSubstr("there is no Preprocessed data here")));
}

}  // namespace
}  // namespace tervane::command_line_test
