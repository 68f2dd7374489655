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

}  // namespace
}  // namespace tervane::journal_command_test
