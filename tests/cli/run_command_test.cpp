// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <chrono>
#include <filesystem>
#include <optional>
#include <sstream>
#include <thread>

#include <gmock/gmock.h>
#include <rapidjson/document.h>

#include "cli/command_line.h"
#include "execution/run_passport.h"
#include "tests/support/engine_script.h"
#include "tests/support/setup.h"

namespace tervane::run_command_test {
namespace {

using testing::HasSubstr;

class RunCommand : public testing::Test {
 protected:
  /// Runs the setup with an engine that does these commands.
  int Tervane(const std::string& commands, std::vector<std::string> options = {}) {
    test::WriteEngine(folder, "engines/Tvn_Simulation.exe", commands);
    options.insert(options.begin(), {"run", file, "--engines", folder.File("engines")});
    out.str({});
    err.str({});
    return RunCommandLine(options, out, err);
  }
  rapidjson::Document Json() {
    rapidjson::Document json;
    json.Parse(out.str().c_str());
    EXPECT_FALSE(json.HasParseError()) << out.str();
    return json;
  }

  test::TempFolder folder;
  std::string file = folder.Write("karup.tvd", test::SetupText(14, ""));
  std::ostringstream out, err;
};

TEST_F(RunCommand, PassesTheEnginesWordsOnAndTellsHowItEnded) {
  EXPECT_EQ(Tervane("echo \"got $2\"; echo progress 50 half; printf last", {"--wm"}), kDone);
  EXPECT_EQ(out.str(), "got /WM\nlast\n");
  EXPECT_THAT(err.str(), testing::MatchesRegex("progress 50 half\n.*karup.tvd: The run is done after .* s\\.\n"));
  EXPECT_EQ(Tervane("exit 7", {"--pp"}), kFindings);
  EXPECT_THAT(err.str(), HasSubstr("exit status 7"));
  // What the setup asks for, the preprocessor, should have left its report.
  EXPECT_EQ(Tervane("true"), kFindings);
  EXPECT_THAT(err.str(), HasSubstr("karup_results/karup_PreProcessed.kvf"));
  EXPECT_EQ(Tervane("echo report >karup_results/karup_PreProcessed.kvf"), kDone);
}

TEST_F(RunCommand, TellsTheSameAsJson) {
  EXPECT_EQ(Tervane("echo 'error: A/B:Key: \"bad\"'; echo 'warning: odd'; exit 7", {"--wq", "--json"}), kFindings);
  const rapidjson::Document json = Json();
  EXPECT_STREQ(json["outcome"].GetString(), "failed");
  EXPECT_EQ(json["exitStatus"].GetInt(), 7);
  EXPECT_STREQ(json["options"].GetString(), "/WQ");
  EXPECT_STREQ(json["log"].GetString(), folder.File("karup_results/karup_Run.log").c_str());
  EXPECT_GE(json["seconds"].GetDouble(), 0);
  ASSERT_EQ(json["findings"].Size(), 2u);
  EXPECT_STREQ(json["findings"][0]["place"].GetString(), "A/B:Key");
  EXPECT_STREQ(json["findings"][0]["text"].GetString(), "\"bad\"");
  EXPECT_FALSE(json["findings"][1].HasMember("place"));
  EXPECT_THAT(err.str(), HasSubstr("warning: odd"));
}

TEST_F(RunCommand, ItsPassportTellsWhatHasChangedSince) {
  const auto rain = [](const std::string& more) {
    return test::SetupText(14,
                           more +
                               "section Climate {\nsection PrecipitationRate {\nsection GLOBAL {\nTYPE = 2\nsection "
                               "TIME_SERIES_FILE {\nFILE_NAME = file \"rain.nds0\"\n}\n}\n}\n}");
  };
  const auto verify = [&] {
    out.str({});
    err.str({});
    return RunCommandLine({"run", file, "--verify"}, out, err);
  };
  EXPECT_EQ(verify(), kCouldNot);
  EXPECT_THAT(err.str(), HasSubstr("no results of a run that left a passport"));
  folder.Write("karup.tvd", rain({}));
  folder.Write("rain.nds0", "wet");
  // What only preprocesses makes no results.
  Tervane("true", {"--pp"});
  EXPECT_EQ(verify(), kCouldNot);
  ASSERT_EQ(Tervane("true", {"--wm"}), kDone) << err.str();
  // The files are read beside the run, and to their end behind it.
  const std::string path = PassportFilesOf(folder.File("karup_results"), file).passport;
  std::string problem;
  std::optional<RunPassport> passport;
  for (int i = 0; i < 500 && !(passport && passport->HasAllHashes() && !passport->outcome.empty()); ++i) {
    passport = ReadPassport(path, problem);
    std::this_thread::sleep_for(std::chrono::milliseconds(10));
  }
  ASSERT_TRUE(passport && passport->HasAllHashes()) << problem;
  ASSERT_EQ(passport->inputs.size(), 2U);
  EXPECT_EQ(passport->inputs[0].path, file);
  EXPECT_EQ(passport->inputs[1].size, "3");
  EXPECT_THAT(passport->outcome, HasSubstr("The run is done"));
  EXPECT_EQ(passport->options, "/WM");
  EXPECT_EQ(verify(), kDone) << out.str();

  const auto ofLater = [&](const char* content) {
    folder.Write("rain.nds0", content);
    const auto later = std::filesystem::last_write_time(folder.File("rain.nds0")) + std::chrono::hours(1);
    std::filesystem::last_write_time(folder.File("rain.nds0"), later);
    return verify();
  };
  EXPECT_EQ(ofLater("wet"), kDone) << out.str();
  EXPECT_EQ(ofLater("dry"), kFindings);
  EXPECT_EQ(out.str(), folder.File("rain.nds0") + ": has changed\n");
  std::filesystem::remove(folder.File("rain.nds0"));
  EXPECT_EQ(verify(), kFindings);
  EXPECT_THAT(out.str(), HasSubstr("rain.nds0: is gone"));
  folder.Write("karup.tvd", rain("section SimSpec {\nsection SimTitle {\nTitle = \"Dry\"\n}\n}\n"));
  EXPECT_EQ(verify(), kFindings);
  EXPECT_THAT(out.str(), HasSubstr("SimSpec/SimTitle:Title: \"\" (default) -> \"Dry\"\n"));
}

TEST_F(RunCommand, ARunThatDidNotBeginCouldNotBeDone) {
  EXPECT_EQ(RunCommandLine({"run", file, "--engines", folder.File("none"), "--json"}, out, err), kCouldNot);
  EXPECT_THAT(err.str(), HasSubstr("the engine Tvn_Simulation was not found in " + folder.File("none")));
  EXPECT_STREQ(Json()["outcome"].GetString(), "not started");
  EXPECT_EQ(RunCommandLine({"run", folder.File("none.tvd")}, out, err), kCouldNot);
  EXPECT_EQ(Tervane("true", {"--pp", "--wm"}), kCouldNot);
  test::WriteProgram(folder, "engines/Tvn_Simulation", "no program");
  EXPECT_EQ(Tervane("true"), kCouldNot);
  EXPECT_THAT(err.str(), HasSubstr("engines/Tvn_Simulation cannot be started"));
}

}  // namespace
}  // namespace tervane::run_command_test
