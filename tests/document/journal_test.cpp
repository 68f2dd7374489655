// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/journal.h"

#include <filesystem>

#include <gmock/gmock.h>

#include "document/edit_session.h"
#include "simspec/basic_parameters.h"
#include "simspec/extra_params.h"
#include "simspec/titles.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::journal_test {
namespace {

using test::SetupText;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::SizeIs;

using Kind = SetupDifference::Kind;

JournalStep AStep() {
  return {"2026-11-27 08:30:15",
          "ann",
          "Change \"Title\"",
          "SimSpec/SimTitle",
          {{Kind::Changed, "SimSpec/SimTitle", "Title", "\"a\\nb\"", "\"ä, 1\""},
           {Kind::Added, "ExtraParams/ExtraParam_1", {}, {}, {}}}};
}

/// A setup in a file that is edited with a journal.
class Journalled : public testing::Test {
 public:
  Journalled() {
    folder.Write("a.tvd", SetupText(14,
                                    "section ExtraParams {\nNoOfParams = 1\n"
                                    "section ExtraParam_1 {\nName = \"a\"\nType = 1\nValue = 4\n}\n}"));
    Open();
    session->KeepJournal(true);
  }
  void Open() {
    session.reset();
    std::string error;
    session = EditSession::Open(file, folder.File("recovery"), error);
    if (!session) throw std::runtime_error(error);
  }
  CSimTitleKvf& Title() const { return *session->Document().Root().Important(kBasicParameters)->Child<CSimTitleKvf>(); }
  CExtraParamsKvf& Parameters() const { return *session->Document().Root().Child<CExtraParamsKvf>(); }
  void SetTitle(const std::string& text) const {
    Title().Title = text;
    session->UpdateDoc(Title(), 1, "Change Title");
  }
  std::vector<JournalStep> Steps() const {
    const Journal journal = ReadJournal(file + ".journal");
    EXPECT_EQ(journal.error, "");
    EXPECT_THAT(journal.problems, IsEmpty());
    return journal.steps;
  }

  test::TempFolder folder;
  std::string file = folder.File("a.tvd");
  std::unique_ptr<EditSession> session;
};

TEST(Journal, AStepIsReadAsItWasWritten) {
  JournalStep save;
  save.action = "Save";
  for (const JournalStep& step : {AStep(), save, JournalStep()}) {
    const std::string line = WriteJournalLine(step);
    EXPECT_EQ(line.find('\n'), line.size() - 1);
    std::string problem;
    const auto read = ReadJournalLine(line, problem);
    ASSERT_TRUE(read) << problem;
    EXPECT_EQ(*read, step);
  }
}

TEST(Journal, LinesThatAreNoStepsAreToldWithTheirNumbersAndKept) {
  const test::TempFolder folder;
  const std::string good = WriteJournalLine(AStep());
  const std::string bad[] = {"{\"time\": 1, \"changes\": []}",
                             "[]",
                             "{}",
                             "{\"changes\": [1]}",
                             "{\"changes\": [{\"kind\": \"lost\"}]}",
                             "{\"time\": \"2026",
                             "no"};
  std::string text = good;
  for (const std::string& line : bad) text += line + "\n";
  const std::string path = folder.Write("a.tvd.journal", text + "\n" + good.substr(0, 20));
  // What a crash has cut off spoils no line behind it.
  EXPECT_EQ(AppendToJournal(path, good), "");
  const Journal journal = ReadJournal(path);
  EXPECT_THAT(journal.steps, ElementsAre(AStep(), AStep()));
  ASSERT_THAT(journal.problems, SizeIs(std::size(bad) + 1));
  EXPECT_THAT(journal.problems[0], HasSubstr("a.tvd.journal:2: it is no step"));
  EXPECT_THAT(journal.problems[6], HasSubstr("a.tvd.journal:8: it is no JSON"));
  EXPECT_THAT(journal.problems[7], HasSubstr("a.tvd.journal:10: it is no JSON"));
  EXPECT_THAT(test::ReadFile(path), testing::StartsWith(text));
}

TEST_F(Journalled, EachStepStandsWithItsKeysBeforeAndAfter) {
  SetTitle("first");
  session->UpdateDoc(Title(), 1, "Change Nothing");
  Parameters().AddItem();
  session->UpdateDoc(Parameters(), 1, "Add Parameter");
  ASSERT_TRUE(session->Undo());
  ASSERT_TRUE(session->Undo());
  ASSERT_TRUE(session->Redo());
  ASSERT_TRUE(session->Save());
  const std::vector<JournalStep> steps = Steps();
  std::vector<std::string> told;
  for (const JournalStep& step : steps) {
    EXPECT_NE(step.time, "");
    std::string text = step.action + "|" + step.page + "|";
    for (const JournalChange& change : step.changes)
      if (change.key != "NoOfParams")
        text += std::string(NameOf(change.kind)) + " " + change.path + ":" + change.key + " " +
                (change.key.empty() ? std::string(">") : change.from + ">" + change.to);
    told.push_back(text);
  }
  EXPECT_THAT(told, ElementsAre("Change Title|SimSpec/SimTitle|changed SimSpec/SimTitle:Title \"\">\"first\"",
                                "Add Parameter|ExtraParams|added ExtraParams/ExtraParam_2: >",
                                "Undo Add Parameter||removed ExtraParams/ExtraParam_2: >",
                                "Undo Change Title||changed SimSpec/SimTitle:Title \"first\">\"\"",
                                "Redo Change Title||changed SimSpec/SimTitle:Title \"\">\"first\"", "Save||"));
}

TEST_F(Journalled, WhatWasNotSavedIsToldAtTheEnd) {
  SetTitle("first");
  ASSERT_TRUE(session->Save());
  Open();
  EXPECT_EQ(Steps().back().action, "Save");
  session->KeepJournal(true);
  SetTitle("second");
  Open();
  EXPECT_EQ(Steps().back().action, "Close Without Saving");
  EXPECT_EQ(Title().Title, "first");
}

TEST_F(Journalled, NothingIsWrittenUnlessTheUserWishes) {
  session->KeepJournal(false);
  SetTitle("first");
  EXPECT_FALSE(std::filesystem::exists(file + ".journal"));
  session->KeepJournal(true);
  SetTitle("second");
  ASSERT_THAT(Steps(), SizeIs(1));
  EXPECT_EQ(Steps()[0].changes[0].from, "\"first\"");
}

TEST_F(Journalled, ASetupWithoutAFileWritesItsStepsWithTheFirstSave) {
  session = EditSession::New(folder.File("recovery"));
  session->KeepJournal(true);
  SetTitle("first");
  SetTitle("second");
  EXPECT_EQ(session->TakeJournalTrouble(), "");
  ASSERT_TRUE(session->SaveAs(folder.File("b.tvd")));
  std::vector<std::string> actions;
  for (const JournalStep& step : ReadJournal(folder.File("b.tvd.journal")).steps) actions.push_back(step.action);
  EXPECT_THAT(actions, ElementsAre("Change Title", "Change Title", "Save"));
}

TEST_F(Journalled, AJournalThatCannotBeWrittenIsToldOnceAndCaughtUp) {
  std::filesystem::create_directory(file + ".journal");
  SetTitle("first");
  EXPECT_THAT(session->TakeJournalTrouble(), HasSubstr("cannot write " + file + ".journal: "));
  SetTitle("second");
  EXPECT_EQ(session->TakeJournalTrouble(), "");
  EXPECT_EQ(Title().Title, "second");
  std::filesystem::remove(file + ".journal");
  SetTitle("third");
  EXPECT_THAT(Steps(), SizeIs(3));
  // Told again when it comes again; a link leads to no other file.
  std::filesystem::remove(file + ".journal");
  std::filesystem::create_symlink(folder.Write("other", "kept"), file + ".journal");
  SetTitle("fourth");
  EXPECT_THAT(session->TakeJournalTrouble(), HasSubstr("symbolic link"));
  EXPECT_EQ(test::ReadFile(folder.File("other")), "kept");
}

TEST_F(Journalled, AStepIsTakenBackWhereItsValuesStillStand) {
  SetTitle("first");
  Title().Description = "said \"so\"\nand so";
  session->UpdateDoc(Title(), 1, "Change Description");
  Parameters().GetItem(1)->IntegerValue = 7;
  session->UpdateDoc(Parameters(), 1, "Change Value");
  const std::string before = test::SavedText(session->Document());
  const std::vector<JournalStep> steps = Steps();
  ASSERT_THAT(steps, SizeIs(3));
  EXPECT_EQ(session->TakeBack(steps[0]), "");
  EXPECT_EQ(Title().Title, "");
  EXPECT_EQ(session->TakeBack(steps[2]), "");
  EXPECT_EQ(Parameters().GetItem(1)->IntegerValue, 4);
  EXPECT_EQ(Title().Description, "said \"so\"\nand so");
  EXPECT_EQ(Steps().back().action, "Take Back Change Value");
  EXPECT_EQ(session->TakeBack(steps[1]), "");
  EXPECT_EQ(Title().Description, "");
  // Each is a step of undo.
  for (int step = 0; step < 3; ++step) ASSERT_TRUE(session->Undo());
  EXPECT_EQ(test::SavedText(session->Document()), before);
}

TEST_F(Journalled, ItemsOfAStepGoAndComeAgain) {
  for (int number = 2; number <= 4; ++number) {
    Parameters().AddItem()->Name = "added " + std::to_string(number);
    session->UpdateDoc(Parameters(), 1, "Add Parameter");
  }
  Parameters().GetItem(4)->Type = 1;
  Parameters().GetItem(4)->IntegerValue = 44;
  session->UpdateDoc(Parameters(), 1, "Change Value");
  Parameters().DeleteItem(2, 1);
  session->UpdateDoc(Parameters(), 1, "Delete Parameter");
  SetTitle("later");
  const auto names = [&] {
    std::vector<std::string> all;
    for (int number = 1; number <= Parameters().GetItemCount(); ++number)
      all.push_back(Parameters().GetItem(number)->Name);
    return all;
  };
  const std::string first = Parameters().GetItem(1)->Name;
  const std::string before = test::SavedText(session->Document());
  const std::vector<JournalStep> steps = Steps();
  std::vector<std::string> actions;
  for (const JournalStep& step : steps) actions.push_back(step.action);
  ASSERT_THAT(actions, ElementsAre("Add Parameter", "Add Parameter", "Add Parameter", "Change Value",
                                   "Delete Parameter", "Change Title"));
  EXPECT_EQ(session->TakeBack(steps[4]), "") << "the one that was deleted comes to its place";
  EXPECT_THAT(names(), ElementsAre(first, "added 2", "added 3", "added 4"));
  EXPECT_EQ(session->TakeBack(steps[1]), "");
  EXPECT_THAT(names(), ElementsAre(first, "added 2", "added 4"));
  EXPECT_EQ(Parameters().GetItem(3)->IntegerValue, 44);
  EXPECT_EQ(Title().Title, "later");
  // The last one stands at another place by now, and has another value.
  EXPECT_EQ(session->TakeBack(steps[2]), "ExtraParams/ExtraParam_4 is no more in the setup");
  ASSERT_TRUE(session->Undo());
  EXPECT_EQ(session->TakeBack(steps[2]), "ExtraParams/ExtraParam_4 is no more as it was added");
  ASSERT_TRUE(session->Undo());
  EXPECT_EQ(test::SavedText(session->Document()), before);
}

TEST_F(Journalled, WhatCannotBeTakenBackIsToldAndChangesNothing) {
  SetTitle("first");
  SetTitle("second");
  Parameters().AddItem();
  session->UpdateDoc(Parameters(), 1, "Add Parameter");
  const std::vector<JournalStep> steps = Steps();
  ASSERT_GE(steps.size(), 3u);
  const std::string before = test::SavedText(session->Document());
  EXPECT_EQ(session->TakeBack(steps[0]),
            "SimSpec/SimTitle:Title holds \"second\" now, and no more \"first\", which the step gave it");
  JournalStep moved{{}, {}, {}, {}, {{Kind::Moved, "ExtraParams/ExtraParam_1", {}, "ExtraParam_2", "ExtraParam_1"}}};
  EXPECT_EQ(session->TakeBack(moved), "ExtraParams/ExtraParam_1 was moved: that goes back by undo alone");
  JournalStep made{{}, {}, {}, {}, {{Kind::Changed, "Nowhere", "Key", "1", "2"}}};
  EXPECT_EQ(session->TakeBack(made), "Nowhere is no more in the setup");
  made.changes = {{Kind::Changed, "SimSpec/SimTitle", "Key", "1", "2"}};
  EXPECT_EQ(session->TakeBack(made), "SimSpec/SimTitle:Key is no more in the setup");
  made.changes = {{Kind::Changed, "SimSpec/SimTitle", "Title", "{ 1", "\"second\""}};
  EXPECT_NE(session->TakeBack(made), "");
  made.changes.clear();
  EXPECT_EQ(session->TakeBack(made), "the step has changed nothing");
  EXPECT_EQ(test::SavedText(session->Document()), before);
}

TEST_F(Journalled, AStepOnWhichOthersDependStays) {
  JournalStep step{{}, {}, {}, {}, {{Kind::Changed, "ExtraParams/ExtraParam_1", "Type", "0", "1"}}};
  const std::string before = test::SavedText(session->Document());
  EXPECT_THAT(session->TakeBack(step), HasSubstr("ExtraParams/ExtraParam_1:Value depends on it"));
  EXPECT_EQ(test::SavedText(session->Document()), before);
}

TEST(Journal, TheTableHasARowForEachChange) {
  JournalStep save;
  save.action = "Save";
  EXPECT_EQ(JournalCsv({AStep(), save}),
            "time,user,action,page,kind,path,key,from,to\n"
            "2026-11-27 08:30:15,ann,\"Change \"\"Title\"\"\",SimSpec/SimTitle,changed,SimSpec/SimTitle,Title,"
            "\"\"\"a\\nb\"\"\",\"\"\"ä, 1\"\"\"\n"
            "2026-11-27 08:30:15,ann,\"Change \"\"Title\"\"\",SimSpec/SimTitle,added,ExtraParams/ExtraParam_1,,,\n"
            ",,Save,,,,,,\n");
  EXPECT_TRUE(IsInJournalStep(AStep(), "extraparam_1"));
  EXPECT_TRUE(IsInJournalStep(save, ""));
  EXPECT_FALSE(IsInJournalStep(save, "title"));
}

}  // namespace
}  // namespace tervane::journal_test
