// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>
#include <rapidjson/document.h>

#include "document/setup_lock.h"
#include "tests/support/command_outcome.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::notes_command_test {
namespace {

using test::ReadFile;
using test::Tervane;
using testing::HasSubstr;
using testing::MatchesRegex;
using testing::Not;

TEST(NotesCommand, NotesAreAddedAnsweredClosedAndRemoved) {
  test::TempFolder folder;
  const std::string setup = folder.Write("a.tvd", test::SetupText(14, ""));
  const auto added = Tervane({"notes", "add", setup, "Climate:SM", "Does it snow?", "--author", "Anna"});
  ASSERT_EQ(added.status, 0) << added.err;
  ASSERT_THAT(added.out, MatchesRegex("[0-9a-f]{6}\n"));
  const std::string number = added.out.substr(0, 6);
  EXPECT_EQ(Tervane({"notes", "add", setup, "", "A good setup", "--author", "Anna"}).status, 0);
  EXPECT_EQ(Tervane({"notes", "answer", setup, number, "In January", "--author", "Bo"}).status, 0);

  EXPECT_THAT(Tervane({"notes", "list", setup}).out,
              testing::AllOf(HasSubstr(number + ": answered: Climate:SM: Does it snow? (Anna, 20"),
                             HasSubstr("\n  In January (Bo, 20"), HasSubstr(": open: the whole setup: A good setup")));
  EXPECT_THAT(Tervane({"notes", "list", setup, "--state", "open"}).out, Not(HasSubstr("snow")));
  rapidjson::Document json;
  json.Parse(Tervane({"notes", "list", setup, "--json"}).out.c_str());
  ASSERT_TRUE(json.IsArray());
  EXPECT_STREQ(json[0]["answers"][0]["text"].GetString(), "In January");
  EXPECT_TRUE(json[0]["isThere"].GetBool());
  EXPECT_THAT(Tervane({"notes", "list", setup, "--csv"}).out, HasSubstr(",Climate:SM,answered,Anna,"));
  const auto report = Tervane({"report", setup, "-o", folder.File("r.html"), "--sections", "notes,values"});
  EXPECT_EQ(report.status, 0) << report.err;
  EXPECT_THAT(ReadFile(folder.File("r.html")),
              testing::AllOf(HasSubstr("Does it snow?"), HasSubstr("In January"), Not(HasSubstr("Review note "))));

  EXPECT_EQ(Tervane({"notes", "state", setup, number, "done"}).status, 0);
  EXPECT_THAT(Tervane({"notes", "list", setup}).out, HasSubstr(number + ": done"));
  EXPECT_EQ(Tervane({"notes", "remove", setup, number}).status, 0);
  EXPECT_THAT(Tervane({"notes", "list", setup}).out, Not(HasSubstr("snow")));
}

TEST(NotesCommand, WhatCannotBeDoneIsToldAndNothingIsWritten) {
  test::TempFolder folder;
  const std::string setup = folder.Write("a.tvd", test::SetupText(14, ""));
  const std::string before = ReadFile(setup);
  const struct {
    std::vector<std::string> words;
    const char* told;
  } cases[] = {
      {{"notes", "add", setup, "Climat:SM", "?"}, "Climat"},
      {{"notes", "answer", setup, "123456", "?"}, "the setup has no note 123456"},
      {{"notes", "state", setup, "123456", "lost"}, "lost is none of open, answered and done"},
      {{"notes", "remove", setup, ""}, "the setup has no note"},
  };
  for (const auto& c : cases) {
    const auto outcome = Tervane(c.words);
    EXPECT_NE(outcome.status, 0);
    EXPECT_THAT(outcome.err, HasSubstr(c.told));
    EXPECT_EQ(ReadFile(setup), before);
  }
}

}  // namespace
}  // namespace tervane::notes_command_test
