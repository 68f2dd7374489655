// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <gmock/gmock.h>
#include <rapidjson/document.h>

#include "document/journal.h"
#include "tests/support/command_outcome.h"
#include "tests/support/temp_folder.h"

namespace tervane::journal_command_test {
namespace {

using test::Tervane;
using testing::AllOf;
using testing::HasSubstr;
using testing::Not;

TEST(JournalCommand, StepsAreListedAndSought) {
  const test::TempFolder folder;
  const std::string setup = folder.File("a.tvd");
  const JournalStep title{"2026-11-27 08:30:15",
                          "ann",
                          "Change Title",
                          "SimSpec/SimTitle",
                          {{SetupDifference::Kind::Changed, "SimSpec/SimTitle", "Title", "\"a\"", "\"b\""}}};
  const JournalStep zone{"2026-11-27 08:31:15",
                         "bo",
                         "Insert",
                         "Subcatchments",
                         {{SetupDifference::Kind::Added, "Subcatchments/Subcatchment", {}, {}, {}}}};
  folder.Write("a.tvd.journal", WriteJournalLine(title) + "cut off\n" + WriteJournalLine(zone));

  const test::CommandOutcome all = Tervane({"journal", setup});
  EXPECT_EQ(all.status, kDone);
  EXPECT_EQ(all.out,
            "2026-11-27 08:30:15  ann  Change Title  SimSpec/SimTitle\n    SimSpec/SimTitle:Title: \"a\" -> \"b\"\n"
            "2026-11-27 08:31:15  bo  Insert  Subcatchments\n    Subcatchments/Subcatchment: added\n");
  EXPECT_THAT(all.err, HasSubstr("a.tvd.journal:2: it is no JSON"));
  EXPECT_THAT(Tervane({"journal", setup, "--search", "TITLE"}).out, AllOf(HasSubstr("ann"), Not(HasSubstr("bo"))));
  EXPECT_EQ(Tervane({"journal", setup, "--csv", "--search", "insert"}).out, JournalCsv({zone}));
  rapidjson::Document json;
  json.Parse(Tervane({"journal", setup, "--json"}).out.c_str());
  ASSERT_FALSE(json.HasParseError());
  ASSERT_EQ(json["steps"].Size(), 2u);
  EXPECT_STREQ(json["steps"][0]["changes"][0]["to"].GetString(), "\"b\"");
}

TEST(JournalCommand, WhereThereIsNoneItIsTold) {
  const test::TempFolder folder;
  const test::CommandOutcome outcome = Tervane({"journal", folder.File("a.tvd")});
  EXPECT_EQ(outcome.status, kCouldNot);
  EXPECT_THAT(outcome.err, HasSubstr("there is no journal beside this setup"));
}

TEST(JournalCommand, CommandsThatChangeASetupWithAJournalAddTheirSteps) {
  const test::TempFolder folder;
  const std::string setup = folder.File("a.tvd");
  ASSERT_EQ(Tervane({"new", setup}).status, kDone);
  ASSERT_EQ(Tervane({"set", setup, "SimSpec/SimTitle:Title", "first"}).status, kDone);
  EXPECT_FALSE(FileExists(JournalBeside(setup))) << "nobody has asked for one";
  folder.Write("a.tvd.journal", "");
  ASSERT_EQ(Tervane({"set", setup, "SimSpec/SimTitle:Title", "second"}).status, kDone);
  ASSERT_EQ(Tervane({"notes", "add", setup, "", "why?", "--author", "ann"}).status, kDone);
  const Journal journal = ReadJournal(JournalBeside(setup));
  ASSERT_EQ(journal.steps.size(), 2U);
  EXPECT_EQ(journal.steps[0].action, "tervane set");
  ASSERT_EQ(journal.steps[0].changes.size(), 1U);
  EXPECT_EQ(journal.steps[0].changes[0],
            (JournalChange{SetupDifference::Kind::Changed, "SimSpec/SimTitle", "Title", "\"first\"", "\"second\""}));
  EXPECT_EQ(journal.steps[1].action, "tervane notes");
  EXPECT_FALSE(journal.steps[1].changes.empty());
}

}  // namespace
}  // namespace tervane::journal_command_test
