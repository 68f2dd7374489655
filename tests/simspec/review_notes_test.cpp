// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/review_notes.h"

#include <gmock/gmock.h>

#include "core/kvf_parser.h"
#include "core/kvf_writer.h"
#include "document/flow_model_document.h"
#include "document/three_way_merge.h"
#include "tests/support/setup.h"

namespace tervane::review_notes_test {
namespace {

using test::SavedText;
using test::SetupText;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

CExtraParamsKvf& ListOf(const CFlowModelDoc& document) { return *document.Root().Child<CExtraParamsKvf>(); }

ReviewNote NoteAt(const CFlowModelDoc& document, const std::string& place, const std::string& text) {
  const SetupPath path = ParseSetupPath(place);
  ReviewNote note = NewReviewNoteAt(*FindNode(document.Root(), path.steps), path.key.name);
  note.author = "Anna \"A\" \\ K";
  note.date = "2026-11-27 14:05";
  note.text = text;
  return note;
}

TEST(ReviewNotes, AreKeptByASaveWithAllThatTheySay) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(SetupText(14, ""), "/a/a.tvd"));
  ReviewNote note = NoteAt(document, "Climate:SM", "Why?\nSnow \"melts\"\tat 0 °C\\");
  note.name = PutReviewNote(ListOf(document), note);
  EXPECT_THAT(note.name, testing::StartsWith("Review note "));
  note.answers.push_back({"Bo", "2026-11-28 09:00", "It does.\n\n"});
  note.state = ReviewState::Answered;
  EXPECT_EQ(PutReviewNote(ListOf(document), note), note.name);
  const std::string second = PutReviewNote(ListOf(document), NoteAt(document, "Climate", "Look at the gauges"));
  EXPECT_NE(second, note.name);

  CFlowModelDoc again;
  ASSERT_TRUE(again.OpenText(SavedText(document), "/a/a.tvd"));
  const std::vector<ReviewNote> read = ReviewNotesOf(ListOf(again));
  ASSERT_EQ(read.size(), 2U);
  EXPECT_EQ(read[0], note);
  EXPECT_EQ(read[1].text, "Look at the gauges");
  EXPECT_EQ(SavedText(again), SavedText(document));
  EXPECT_TRUE(RemoveReviewNote(ListOf(again), note.name));
  EXPECT_FALSE(RemoveReviewNote(ListOf(again), note.name));
  EXPECT_EQ(ReviewNotesOf(ListOf(again)).size(), 1U);
}

TEST(ReviewNotes, OneThatCannotBeReadIsToldAndKept) {
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(
      SetupText(14,
                "section ExtraParams {\nYbSEKvfListItemCount = 3\nNoOfParams = 3\n"
                "section ExtraParam_1 {\nName = \"Review note 00beef\"\nType = 3\nValue = \"Place = \\\"\"\n}\n"
                "section ExtraParam_2 {\nName = \"Review note 00beee\"\nType = 3\nValue = \"State = \\\"lost\\\"\"\n}\n"
                "section ExtraParam_3 {\nName = \"Review notes\"\nType = 1\nValue = 4\n}\n}"),
      "/a/a.tvd"));
  const std::string before = SavedText(document);
  document.Root().Validate();
  const std::vector<Finding>& findings = ListOf(document).Findings();
  ASSERT_EQ(findings.size(), 2U);
  EXPECT_EQ(findings[0].text, "Review note 00beef cannot be read, and is kept as it is");
  EXPECT_THAT(findings[1].detail, HasSubstr("'lost' is no state of a note"));
  EXPECT_THAT(ReviewNotesOf(ListOf(document)), IsEmpty());
  EXPECT_EQ(SavedText(document), before);
}

TEST(ReviewNotes, AreFoundAtTheirNodeWhereOthersWereTakenOut) {
  const std::string zones =
      "section Subcatchments {\nDistributionType = 1\nNO_ZONES = 2\n"
      "section Subcatchment {\nName = \"upper\"\nGRIDCODEID = \"1\"\n}\n"
      "section Subcatchment {\nName = \"lower\"\nGRIDCODEID = \"2\"\n}\n}";
  CFlowModelDoc document;
  ASSERT_TRUE(document.OpenText(SetupText(14, zones), "/a/a.tvd"));
  const ReviewNote note = NoteAt(document, "Subcatchments/Subcatchment#2:Name", "which?");
  CYbSEKvfBase* lower = NodeOfReviewNote(document.Root(), note);
  ASSERT_TRUE(lower);
  EXPECT_EQ(note.title, "lower");
  CYbSEKvfBase* upper = FindNode(document.Root(), ParseSetupPath("Subcatchments/Subcatchment").steps);
  const auto kept = upper->GetParent()->RemoveChild(upper);
  EXPECT_EQ(NodeOfReviewNote(document.Root(), note), lower);
  EXPECT_EQ(NodeOfReviewNote(document.Root(), NoteAt(document, "Subcatchments/Subcatchment", "")), lower);
  ReviewNote ofUpper = note;
  ofUpper.place = "Subcatchments/Subcatchment:Name";
  ofUpper.title = "upper";
  EXPECT_EQ(NodeOfReviewNote(document.Root(), ofUpper), nullptr) << "another stands in its place now";
  ReviewNote followed = note;
  EXPECT_TRUE(FollowNode(followed, *lower));
  EXPECT_EQ(followed.place, "Subcatchments/Subcatchment:Name");
  EXPECT_FALSE(FollowNode(followed, *lower));
  const auto alsoKept = lower->GetParent()->RemoveChild(lower);
  EXPECT_EQ(NodeOfReviewNote(document.Root(), note), nullptr);
}

TEST(ReviewNotes, OfBothSidesAreThereWhenSetupsAreMerged) {
  CFlowModelDoc base, mine, theirs;
  for (CFlowModelDoc* document : {&base, &mine, &theirs})
    ASSERT_TRUE(document->OpenText(SetupText(14, ""), "/a/a.tvd"));
  PutReviewNote(ListOf(mine), NoteAt(mine, "Climate", "of mine"));
  PutReviewNote(ListOf(theirs), NoteAt(theirs, "Climate", "of theirs"));
  KvfFile files[3], merged;
  const CFlowModelDoc* const documents[] = {&base, &mine, &theirs};
  for (int i = 0; i < 3; ++i) ASSERT_TRUE(ParseKvf(FileContent::Of(SavedText(*documents[i])), files[i]));
  const MergeResult result = MergeSetups(files[0], files[1], files[2], merged);
  for (const MergeConflict& conflict : result.conflicts) ADD_FAILURE() << conflict.Sentence();
  CFlowModelDoc together;
  std::string text = "target TERVANE_FLOWMODEL {\n";
  AppendKvfNodes(*AsSection(merged.top.firstChild), 0, text);
  ASSERT_TRUE(together.OpenText(text + "}\n", "/a/a.tvd")) << together.Error();
  std::vector<std::string> texts;
  for (const ReviewNote& note : ReviewNotesOf(ListOf(together))) texts.push_back(note.text);
  EXPECT_THAT(texts, testing::UnorderedElementsAre("of mine", "of theirs"));
}

TEST(ReviewNotes, AreATableForOtherPrograms) {
  ReviewNote note{"Review note 1", "Climate:SM", "Climate", "Anna", "2026-11-27 14:05", "say \"yes\"", {}, {}};
  note.answers.push_back({"Bo", "2026-11-28 09:00", "yes"});
  EXPECT_EQ(ReviewNotesAsCsv({note}),
            "Note,Place,State,Author,Date,Text\r\n"
            "Review note 1,Climate:SM,open,Anna,2026-11-27 14:05,\"say \"\"yes\"\"\"\r\n"
            "Review note 1,Climate:SM,answer,Bo,2026-11-28 09:00,yes\r\n");
}

}  // namespace
}  // namespace tervane::review_notes_test
