// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "cli/command_line.h"

#include <filesystem>
#include <sstream>

#include <fmt/format.h>
#include <gmock/gmock.h>
#include <rapidjson/document.h>
#include <sys/stat.h>
#include <unistd.h>

#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane {
namespace {

using test::ReadFile;
using test::SetupText;
using test::TempFolder;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::StartsWith;

struct Outcome {
  int status;
  std::string out, err;
};

Outcome Tervane(const std::vector<std::string>& arguments) {
  std::ostringstream out, err;
  const int status = RunCommandLine(arguments, out, err);
  return {status, out.str(), err.str()};
}

rapidjson::Document Json(const Outcome& outcome) {
  rapidjson::Document json;
  json.Parse(outcome.out.c_str());
  EXPECT_FALSE(json.HasParseError()) << outcome.out;
  return json;
}

constexpr const char* kFaulty = R"(section SimSpec {
  Foo = 1
  section ModelComp {
    WQ = 1
  }
}
section ModelCompWQ {
  UZ = 1
  OL = "yes"
})";

TEST(CommandLine, CheckTellsFindingsNotesAndWhatNothingReads) {
  const TempFolder folder;
  const std::string file = folder.Write("a.tvd", SetupText(14, kFaulty));
  const Outcome text = Tervane({"check", file});
  EXPECT_EQ(text.status, kFindings);
  EXPECT_THAT(text.out, HasSubstr(file + ": error: ModelCompWQ:UZ: UZ Water Quality is only allowed"));
  EXPECT_THAT(text.out,
              HasSubstr(file + ":13: note: ModelCompWQ:OL: \"yes\" stands where a whole number was expected"));
  EXPECT_THAT(text.out, HasSubstr(file + ":6: unread: SimSpec:Foo: "));

  const Outcome outcome = Tervane({"check", file, "--json"});
  EXPECT_EQ(outcome.status, kFindings);
  const rapidjson::Document json = Json(outcome);
  ASSERT_EQ(json["findings"].Size(), 2u);
  EXPECT_STREQ(json["findings"][0]["severity"].GetString(), "note");
  EXPECT_STREQ(json["findings"][1]["path"].GetString(), "ModelCompWQ");
  EXPECT_STREQ(json["findings"][1]["severity"].GetString(), "error");
  EXPECT_STREQ(json["findings"][1]["key"].GetString(), "UZ");
  EXPECT_FALSE(json["findings"][1].HasMember("detail"));
  ASSERT_EQ(json["unread"].Size(), 1u);
  EXPECT_STREQ(json["unread"][0]["path"].GetString(), "SimSpec:Foo");
}

TEST(CommandLine, ANewSetupHasNoFindings) {
  const TempFolder folder;
  const std::string file = folder.File("a.tvd");
  EXPECT_EQ(Tervane({"new", file}).status, kDone);
  EXPECT_EQ(Tervane({"check", file}).status, kDone);
  EXPECT_EQ(Tervane({"check", file, "--json"}).out, "{\"findings\": [], \"unread\": []}\n");
  // A file that exists is not replaced in passing.
  folder.Write("a.tvd", "mine");
  EXPECT_EQ(Tervane({"new", file}).status, kCouldNot);
  EXPECT_EQ(ReadFile(file), "mine");
  EXPECT_EQ(Tervane({"new", file, "--force"}).status, kDone);
}

TEST(CommandLine, TreeListsTheNodesThatTakePartOrAll) {
  const TempFolder folder;
  const std::string file = folder.File("a.tvd");
  Tervane({"new", file});
  const rapidjson::Document used = Json(Tervane({"tree", file, "--json"}));
  const rapidjson::Document all = Json(Tervane({"tree", file, "--all", "--json"}));
  EXPECT_GT(all["nodes"].Size(), used["nodes"].Size());
  for (const auto& node : used["nodes"].GetArray()) EXPECT_TRUE(node["used"].GetBool());
  const auto find = [&](std::string_view path) -> const rapidjson::Value* {
    for (const auto& node : all["nodes"].GetArray())
      if (path == node["path"].GetString()) return &node;
    return nullptr;
  };
  const rapidjson::Value* modflow = find("SimSpec/ModModelComp");
  ASSERT_TRUE(modflow);
  EXPECT_STREQ((*modflow)["class"].GetString(), "CModModelCompKvf");
  EXPECT_STREQ((*modflow)["title"].GetString(), "Model Components");
  EXPECT_FALSE((*modflow)["used"].GetBool());
  // Its own answer is yes, but its parent takes no part.
  ASSERT_TRUE(find("ModelCompWQ/WQTSC"));
  EXPECT_FALSE((*find("ModelCompWQ/WQTSC"))["used"].GetBool());
  EXPECT_TRUE(find("CIntroductionKvf"));
  EXPECT_THAT(Tervane({"tree", file, "--paths"}).out, HasSubstr("\nSimSpec/SimTitle\n"));
}

TEST(CommandLine, GetAndShowTellValuesAsTheyWouldBeSaved) {
  const TempFolder folder;
  const std::string file = folder.Write("a.tvd", SetupText(9, R"(section SimSpec {
      section SimTitle {
        Title = "a \"b\""
      }
      section CompControlParaTimeStep {
        MaxAllowedTimeStep = 3f
      }
    }
    section ExtraParams {
      NoOfParams = 1
      section ExtraParam_1 {
        Name = "n"
      }
    })"));
  const struct {
    const char *path, *value;
  } cases[] = {{"SimSpec/SimTitle:Title", "a \"b\""},
               {"SimSpec/SimulationPeriod:SIMSTART", "2000, 1, 1, 0, 0"},
               {"SimSpec/CompControlParaTimeStep:MaxAllowedOLTimeStep", "3"},
               {"SimSpec/CompControlParaTimeStep:MaxInfiltDepthPerTimeStep", "10"},
               {"\"SimSpec\"#1/ModelComp:FilenameTvdRes", ""},
               {"ExtraParams/ExtraParam_1:Name", "n"}};
  for (const auto& c : cases) {
    const Outcome outcome = Tervane({"get", file, c.path});
    EXPECT_EQ(outcome.status, kDone) << outcome.err;
    EXPECT_EQ(outcome.out, std::string(c.value) + "\n") << c.path;
  }
  const Outcome show = Tervane({"show", file, "SimSpec/CompControlParaTimeStep"});
  EXPECT_THAT(show.out, HasSubstr("MaxAllowedOLTimeStep = 3f  (default 0.5f)\n"));
  EXPECT_THAT(show.out, HasSubstr("InitialTimeStep = 6f\n"));
  EXPECT_THAT(show.out, Not(HasSubstr("SimTitle")));
  EXPECT_THAT(Tervane({"show", file}).out, HasSubstr("SimTitle"));
}

TEST(CommandLine, PageShowsTheControlsOfANode) {
  const TempFolder folder;
  const std::string file = folder.File("a.tvd");
  Tervane({"new", file});
  const Outcome outcome = Tervane({"page", file, "SimSpec/SimTitle"});
  EXPECT_EQ(outcome.status, kDone);
  EXPECT_EQ(outcome.out, "text \"Simulation Title:\" = \nlong text \"Simulation Description:\" = \n");
  EXPECT_THAT(Tervane({"page", file, "CIntroductionKvf"}).out, HasSubstr("<h1>Tervane</h1>"));
  EXPECT_EQ(Tervane({"page", file, "FlowModelDocVersion"}).status, kCouldNot);
}

TEST(CommandLine, APlaceThatIsNotThereIsToldWithWhatComesNear) {
  const TempFolder folder;
  const std::string file = folder.File("a.tvd");
  Tervane({"new", file});
  const struct {
    const char *path, *message;
  } cases[] = {
      {"SimSpec/ModelCmp:ET", "did you mean ModelComp?"},    {"simspec:ModelType", "did you mean SimSpec?"},
      {"SimSpec:ModelTyp", "did you mean ModelType?"},       {"SimSpec", "a key was expected"},
      {"SimSpec#2:ModelType", "there is no SimSpec#2 here"}, {"SimSpec/", "a name was expected"},
      {"SimSpec:A:B", "':' was not expected at place 10"},   {"\"SimSpec", "the closing \" of a name is missing"}};
  for (const auto& c : cases) {
    const Outcome outcome = Tervane({"get", file, c.path});
    EXPECT_EQ(outcome.status, kCouldNot);
    EXPECT_THAT(outcome.out, IsEmpty());
    EXPECT_THAT(outcome.err, HasSubstr(c.message));
  }
}

TEST(CommandLine, SetChangesOneValueAndNothingElse) {
  const TempFolder folder;
  const std::string file = folder.File("a.tvd");
  const std::string before = folder.File("before.tvd");
  const struct {
    const char *path, *value, *got;
  } cases[] = {{"SimSpec:ModelType", "3", "3"},
               {"SimSpec/SimTitle:Title", "a \"quoted\" title, with a comma", "a \"quoted\" title, with a comma"},
               {"SimSpec/SimulationPeriod:SIMEND", "2001-12-31 06:30", "2001, 12, 31, 6, 30"},
               {"SimSpec/SimulationPeriod:SIMEND", "2001,12,31,6,30", "2001, 12, 31, 6, 30"},
               {"SimSpec/CompControlParaOL:RelaxFactor", "0.75", "0.75"},
               {"ModelCompWQ/WQTSC:MaxSimTimeStepSZ", "1e7", "10000000"},
               {"SimSpec/ModelComp:FilenameTvdRes", "results/flow.tvdres", "results/flow.tvdres"},
               {"SimSpec/SimTitle:Touched", "1", "1"},
               {"ExtraParams:NoOfParams", "2", "2"}};
  for (const auto& c : cases) {
    Tervane({"new", file, "--force"});
    Tervane({"new", before, "--force"});
    const Outcome outcome = Tervane({"set", file, c.path, c.value});
    EXPECT_EQ(outcome.status, kDone) << outcome.err;
    EXPECT_EQ(Tervane({"get", file, c.path}).out, std::string(c.got) + "\n");
    EXPECT_EQ(Tervane({"check", file}).status, kDone);
  }
  Tervane({"new", file, "--force"});
  Tervane({"set", file, "SimSpec/SimTitle:Title", "x"});
  EXPECT_EQ(Tervane({"diff", before, file}).out, "SimSpec/SimTitle:Title: \"\" (default) -> \"x\"\n");
}

TEST(CommandLine, SetRefusesWhatTheKeyDoesNotTakeAndWritesNothing) {
  const TempFolder folder;
  const std::string file = folder.File("a.tvd");
  Tervane({"new", file});
  Tervane({"set", file, "SimSpec:ModelType", "2"});
  const std::string before = ReadFile(file);
  const struct {
    const char *path, *value, *message;
  } cases[] = {{"SimSpec:ModelType", "three", "a whole number from -2147483648 to 2147483647 was expected"},
               {"SimSpec:ModelType", "2147483648", "was expected"},
               {"SimSpec/CompControlParaOL:RelaxFactor", "1e39", "a number that fits a float was expected"},
               {"SimSpec/SimulationPeriod:SIMEND", "2001", "5 values separated by commas was expected"},
               {"SimSpec/SimTitle:Title", "\xFF", "UTF-8"},
               // Computed at every save.
               {"SimSpec:IsDataUsedInSetup", "0", "does not take this value: it would be saved as 1"},
               {"FlowModelDocVersion:Version", "9", "it would be saved as 14"},
               // This engine knows one kind of recharge.
               {"SimSpec/ModModelComp:Recharge_ModelType", "1", "it would be saved as 0"}};
  for (const auto& c : cases) {
    const Outcome outcome = Tervane({"set", file, c.path, c.value});
    EXPECT_EQ(outcome.status, kCouldNot) << c.path;
    EXPECT_THAT(outcome.err, HasSubstr(c.message));
    EXPECT_EQ(ReadFile(file), before);
  }
}

TEST(CommandLine, SetAndConvertInPlaceKeepTheOriginalOfAnOldFile) {
  for (const auto& command : std::vector<std::vector<std::string>>{{"set", "a.tvd", "SimSpec:ModelType", "1"},
                                                                   {"convert", "a.tvd", "a.tvd"}}) {
    const TempFolder folder;
    const std::string text = SetupText(6, "");
    const std::string file = folder.Write("a.tvd", text);
    std::vector<std::string> arguments = command;
    for (std::string& argument : arguments)
      if (argument == "a.tvd") argument = file;
    const Outcome outcome = Tervane(arguments);
    EXPECT_EQ(outcome.status, kDone) << outcome.err;
    EXPECT_THAT(outcome.err, HasSubstr("a.v6.tvd"));
    EXPECT_EQ(ReadFile(folder.File("a.v6.tvd")), text);
    EXPECT_EQ(Tervane({"get", file, "FlowModelDocVersion:Version"}).out, "14\n");
  }
}

TEST(CommandLine, ConvertLeavesTheFileItReadsAndOtherFilesAlone) {
  const TempFolder folder;
  const std::string text = SetupText(9, "section Unknown {\n}");
  const std::string in = folder.Write("in.tvd", text);
  const std::string out = folder.Write("out.tvd", "mine");
  EXPECT_EQ(Tervane({"convert", in, out}).status, kCouldNot);
  EXPECT_EQ(ReadFile(out), "mine");
  const Outcome outcome = Tervane({"convert", in, out, "--force"});
  EXPECT_EQ(outcome.status, kDone);
  // What the new file does not hold is told.
  EXPECT_THAT(outcome.err, HasSubstr("section Unknown"));
  EXPECT_EQ(ReadFile(in), text);
  EXPECT_EQ(Tervane({"check", out}).status, kDone);
}

TEST(CommandLine, DiffComparesBySectionAndKey) {
  const TempFolder folder;
  const std::string a = folder.Write("a.tvd", SetupText(14, "section SimSpec {\nModelType = 1\n}"));
  const std::string b = folder.Write("b.tvd", SetupText(9, ""));
  EXPECT_EQ(Tervane({"diff", a, a}).status, kDone);
  EXPECT_EQ(Tervane({"diff", a, a, "--json"}).out, "{\"differences\": []}\n");
  const Outcome outcome = Tervane({"diff", a, b});
  EXPECT_EQ(outcome.status, kFindings);
  EXPECT_EQ(outcome.out, "SimSpec:ModelType: 1 -> 0 (default)\n");
  const rapidjson::Document json = Json(Tervane({"diff", a, b, "--json"}));
  ASSERT_EQ(json["differences"].Size(), 1u);
  EXPECT_STREQ(json["differences"][0]["from"].GetString(), "1");
  EXPECT_TRUE(json["differences"][0]["toDefault"].GetBool());
}

TEST(CommandLine, KeysListsEveryKeyWithTypeAndDefault) {
  const std::string text = Tervane({"keys"}).out;
  EXPECT_THAT(text, HasSubstr("\nSimSpec/ModelComp:UZ_ModelType\tint\t2\t\n"));
  EXPECT_THAT(text, HasSubstr("\nSimSpec/CompControlParaOL:IterStopCriteria\tfloat\t\tup to version 9, read only\n"));
  const std::string markdown = Tervane({"keys", "--markdown"}).out;
  EXPECT_THAT(markdown, StartsWith("# Keys of a setup\n"));
  EXPECT_THAT(markdown, HasSubstr("| `MaxInfiltDepthPerTimeStep ` | float | `10f` | from version 7 |\n"));
}

TEST(CommandLine, WhatIsNoSetupIsRefusedWithoutATrace) {
  const TempFolder folder;
  const std::string good = SetupText(14, "section SimSpec {\nsection SimTitle {\nTitle = \"x\"\n}\n}");
  struct Case {
    const char* what;
    std::string text, message;
  };
  const Case cases[] = {
      {"empty", "", ":1:1: "},
      {"NUL bytes", std::string("target TERVANE_FLOWMODEL {\n\0\0\n}\n", 32), ":2:1: "},
      {"cut", good.substr(0, good.size() / 2), ": "},
      {"UTF-16", std::string("\xFF\xFEt\0a\0", 6), "UTF-16"},
      {"invalid UTF-8", "target TERVANE_FLOWMODEL {\n  A = \"\xC3\"\n}\n", ":2:8: "},
      {"deep",
       [] {
         std::string deep = "target TERVANE_FLOWMODEL {\n";
         for (int i = 0; i < 100'000; ++i) deep += "section A {\n";
         return deep;
       }(),
       "nested deeper than 200"},
      {"overflow", "target TERVANE_FLOWMODEL {\n  A = 2147483648\n}\n", ":2:7: "},
      {"unknown escape", "target TERVANE_FLOWMODEL {\n  A = \"\\q\"\n}\n", "unknown escape"},
      {"no target of ours", "target TVDRES {\n}\n", "target TERVANE_FLOWMODEL was expected"},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.what);
    const std::string file = folder.Write("bad.tvd", c.text);
    const std::string out = folder.File("out.tvd");
    const Outcome check = Tervane({"check", file});
    EXPECT_EQ(check.status, kCouldNot);
    EXPECT_THAT(check.out, IsEmpty());
    EXPECT_THAT(check.err, HasSubstr(c.message));
    EXPECT_THAT(check.err, StartsWith(file + ":"));
    for (const auto& command : std::vector<std::vector<std::string>>{
             {"convert", file, out}, {"convert", file, file}, {"set", file, "SimSpec:ModelType", "1"}})
      EXPECT_EQ(Tervane(command).status, kCouldNot);
    EXPECT_EQ(ReadFile(file), c.text);
    EXPECT_FALSE(std::filesystem::exists(out));
  }

  const std::string fifo = folder.File("fifo.tvd");
  ASSERT_EQ(mkfifo(fifo.c_str(), 0600), 0);
  for (const std::string& file : {fifo, folder.Path(), folder.File("missing.tvd")}) {
    const Outcome outcome = Tervane({"check", file});
    EXPECT_EQ(outcome.status, kCouldNot);
    EXPECT_THAT(outcome.err, HasSubstr(file));
  }
  const std::string locked = folder.Write("locked.tvd", good);
  ASSERT_EQ(chmod(locked.c_str(), 0), 0);
  if (geteuid() == 0)
    std::cout << "skipped: the superuser may read every file\n";
  else
    EXPECT_EQ(Tervane({"check", locked}).status, kCouldNot);
}

TEST(CommandLine, WhatIsOddButReadableGetsANote) {
  const TempFolder folder;
  const auto list = [](std::string_view count) {
    return fmt::format("section ExtraParams {{\nYbSEKvfListItemCount = {}\n}}", count);
  };
  const struct {
    std::string sections;
    const char* message;
  } cases[] = {
      {list("-1"), "a count of -1 reads as 0"},
      {list("\"many\""), "a whole number was expected"},
      {list("3"), "3 of 3 items have no section"},
      {"section SimSpec {\nModelType = true\n}", "a whole number was expected"},
      {"section SimSpec {\nModelType = 1\nModelType = 2\n}", "SimSpec:ModelType#2"},
      {"section SimSpec {\n}\nsection SimSpec {\n}", "SimSpec#2"},
      {"section Nobody {\n}", "section Nobody"},
      {"Nothing = 1", "key Nothing"},
  };
  for (const auto& c : cases) {
    const Outcome outcome = Tervane({"check", folder.Write("a.tvd", SetupText(14, c.sections))});
    EXPECT_EQ(outcome.status, kFindings) << c.sections;
    EXPECT_THAT(outcome.out, HasSubstr(c.message));
  }
}

TEST(CommandLine, WhatIsOrdinaryIsReadWithoutAWord) {
  const TempFolder folder;
  const std::string sections =
      "section SimSpec {\r\nModelType = 1\nsection CompControlParaOL {\r\nRelaxFactor = nanf\nMaxHeadChange = "
      "inff\r\n}\n}";
  for (const std::string& text : {SetupText(14, sections), "\xEF\xBB\xBF" + SetupText(14, sections),
                                  "# " + std::string(5'000'000, 'x') + "\n" + SetupText(14, sections)}) {
    const Outcome outcome = Tervane({"check", folder.Write("a.tvd", text)});
    EXPECT_EQ(outcome.status, kDone) << outcome.out.substr(0, 500) << outcome.err.substr(0, 500);
  }
}

TEST(CommandLine, AnUnknownCommandOrAMissingArgumentIsTold) {
  for (const auto& arguments :
       std::vector<std::vector<std::string>>{{}, {"chek", "a"}, {"check"}, {"get", "a.tvd"}, {"tree", "a", "--al"}}) {
    const Outcome outcome = Tervane(arguments);
    EXPECT_EQ(outcome.status, kCouldNot);
    EXPECT_THAT(outcome.err, Not(IsEmpty()));
  }
  for (const char* command :
       {"new", "check", "tree", "show", "page", "get", "set", "convert", "diff", "keys", "completion"})
    EXPECT_THAT(Tervane({command, "--help"}).out, HasSubstr("Usage: tervane " + std::string(command)));
}

}  // namespace
}  // namespace tervane
