// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/text_taking.h"

#include <gmock/gmock.h>

#include "document/edit_session.h"
#include "document/text_outline.h"
#include "platform/text.h"
#include "tests/support/setup.h"

namespace tervane::text_taking_test {
namespace {

using test::SavedText;
using test::SetupText;
using test::ValueOf;
using testing::HasSubstr;
using testing::IsEmpty;

const std::string kZones =
    "section Subcatchments {\nDistributionType = 1\nNO_ZONES = 2\n"
    "section Subcatchment {\nName = \"upper\"\nGRIDCODEID = \"1\"\n}\n"
    "section Subcatchment {\nName = \"lower\"\nGRIDCODEID = \"2\"\n}\n}";

/// A setup whose text is edited.
class EditedSetup {
 public:
  CFlowModelDoc document;
  TextOutline outline;

  explicit EditedSetup(const std::string& sections) {
    EXPECT_TRUE(document.OpenText(SetupText(14, sections), "/a/a.tvd")) << document.Error();
    outline = TextOutline(SavedText(document));
  }
  std::string Value(const std::string& path) const { return ValueOf(document, path); }
  CYbSEKvfBase* Node(const std::string& path) const {
    return OwnerOfSection(document.Root(), ParseSetupPath(path).steps);
  }
  /// The text of a section.
  std::string Section(const std::string& path) const {
    const int section = outline.Find(ParseSetupPath(path).steps);
    if (section == TextOutline::kNone) throw std::runtime_error("no section " + path);
    const TextOutline::Section& lines = outline.Sections()[static_cast<std::size_t>(section)];
    return std::string(outline.Lines(lines.begin, lines.end));
  }
  void ShowAnew() { outline = TextOutline(SavedText(document)); }

  /// Puts `to` in the place of `from` in the section at that path.
  TakenText Edit(const std::string& path, const std::string& from, const std::string& to) {
    const int section = outline.Find(ParseSetupPath(path).steps);
    const std::string before = Section(path);
    const std::size_t place = before.find(from);
    if (place == std::string::npos) throw std::runtime_error(from + " is not in " + before);
    std::string after = before;
    after.replace(place, from.size(), to);
    EditedSection edited;
    edited.steps = outline.StepsTo(section);
    edited.before = before;
    edited.after = after;
    edited.firstLine = outline.Sections()[static_cast<std::size_t>(section)].begin + 1;
    edited.firstEdited = edited.firstLine;
    edited.lastEdited = edited.firstLine + static_cast<int>(std::count(after.begin(), after.end(), '\n'));
    const TakenText taken = TakeText(document, edited);
    if (taken.node) document.Root().Validate();
    return taken;
  }
};

std::vector<std::string> Texts(const TakenText& taken) {
  std::vector<std::string> texts;
  for (const TextProblem& problem : taken.problems) texts.push_back(problem.text);
  return texts;
}

TEST(TextTaking, TheOutlineFindsSectionsAndKeysByTheirLines) {
  const TextOutline outline = EditedSetup(kZones).outline;
  const int lower = outline.Find(ParseSetupPath("Subcatchments/Subcatchment#2").steps);
  ASSERT_NE(lower, TextOutline::kNone);
  const int line = outline.LineOf(lower, "Name");
  EXPECT_THAT(std::string(outline.Line(line)), HasSubstr("\"lower\""));
  EXPECT_EQ(outline.SectionAround(line, line), lower);
  const int begin = outline.Sections()[static_cast<std::size_t>(lower)].begin;
  EXPECT_EQ(outline.SectionAround(begin, line), outline.Find(ParseSetupPath("Subcatchments").steps))
      << "an edit of its first line is one of the section around it";
  EXPECT_EQ(outline.Find(ParseSetupPath("Subcatchments/Subcatchment#3").steps), TextOutline::kNone);
  for (std::size_t i = 1; i < outline.Sections().size(); ++i)
    EXPECT_EQ(outline.Find(outline.StepsTo(static_cast<int>(i))), static_cast<int>(i));
}

TEST(TextTaking, EachNodeIsFoundByItsSection) {
  EditedSetup setup(kZones);
  int found = 0;
  WalkNodes(setup.document.Root(), [&](const NodePlace& place) {
    if (!place.node.HoldsSetup() || !place.node.GetSectionUsed() || place.node.GetSectionName().empty()) return;
    const std::vector<PathStep> steps = SectionOf(place.node);
    EXPECT_EQ(OwnerOfSection(setup.document.Root(), steps), &place.node) << place.path;
    EXPECT_NE(setup.outline.Find(steps), TextOutline::kNone) << place.path;
    ++found;
  });
  EXPECT_GT(found, 200);
}

TEST(TextTaking, ValuesAreTakenAndWhatTheSetupDoesNotTakeIsTold) {
  const struct {
    const char *from, *to, *key, *value, *problem;
  } cases[] = {
      {"\"old\"", "\"new\"", "Title", "new", ""},
      {"\"old\"", "\"\\u{e9}t\\u{e9} \\\"1\\\"\"", "Title", "été \"1\"", ""},
      {"Description = \"kept\"", "", "Description", "", ""},
      {"Title = \"old\"", "Title = \"new\"\nSubtitle = 3", "Title", "new", "the setup has no key Subtitle here"},
      {"Title = \"old\"", "Title = \"new\" # why", "Title", "new", "a saved setup keeps no comment here"},
      {"Title = \"old\"", "Title = \"new\"\nsection Sub {\n}", "Title", "new", "the setup takes no section Sub here"},
      {"Title = \"old\"", "Title = 7", "Title", "old", "Title stays \"old\": the setup does not take 7 here"},
      {"IsDataUsedInSetup = 1", "IsDataUsedInSetup = 0", "IsDataUsedInSetup", "1",
       "IsDataUsedInSetup stays 1: the setup does not take 0 here"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.to);
    EditedSetup setup("section SimSpec {\nsection SimTitle {\nTitle = \"old\"\nDescription = \"kept\"\n}\n}");
    const TakenText taken = setup.Edit("SimSpec/SimTitle", c.from, c.to);
    EXPECT_TRUE(taken.isParsed);
    EXPECT_EQ(Texts(taken), *c.problem ? std::vector<std::string>{c.problem} : std::vector<std::string>{});
    EXPECT_EQ(setup.Value(std::string("SimSpec/SimTitle:") + c.key), c.value);
  }
}

TEST(TextTaking, ATextThatIsNoneChangesNothingAndSaysWhere) {
  EditedSetup setup("section SimSpec {\nsection SimTitle {\nTitle = \"old\"\n}\n}");
  const std::string before = SavedText(setup.document);
  const struct {
    const char *to, *problem;
  } cases[] = {
      {"\"old", "the closing \" of a text was expected"},
      {"12x", "number was expected"},
      {"\"a\"\n}\nsection B {", "the braces of a section do not match"},
      {"\"a\"\nsection B {", "the } that ends"},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.to);
    const TakenText taken = setup.Edit("SimSpec/SimTitle", "\"old\"", c.to);
    EXPECT_FALSE(taken.isParsed);
    EXPECT_EQ(taken.node, nullptr);
    ASSERT_EQ(taken.problems.size(), 1U);
    EXPECT_THAT(taken.problems[0].text, HasSubstr(c.problem));
    EXPECT_EQ(SavedText(setup.document), before);
  }
  const TakenText taken = setup.Edit("SimSpec/SimTitle", "\"old\"", "12x");
  EXPECT_THAT(std::string(setup.outline.Line(taken.problems[0].line - 1)), HasSubstr("Title ="));
}

TEST(TextTaking, ItemsComeGoAndChangeAndTheOthersStay) {
  EditedSetup setup(kZones);
  const CYbSEKvfBase* lower = setup.Node("Subcatchments/Subcatchment#2");
  EXPECT_THAT(Texts(setup.Edit("Subcatchments", "\"upper\"", "\"above\"")), IsEmpty());
  EXPECT_EQ(setup.Value("Subcatchments/Subcatchment:Name"), "above");
  EXPECT_EQ(setup.Node("Subcatchments/Subcatchment#2"), lower);

  setup.ShowAnew();
  EXPECT_THAT(Texts(setup.Edit("Subcatchments", setup.Section("Subcatchments/Subcatchment"), "")), IsEmpty());
  EXPECT_EQ(setup.Node("Subcatchments/Subcatchment"), lower);

  setup.ShowAnew();
  const std::string own = setup.Section("Subcatchments/Subcatchment");
  const std::string another = "section Subcatchment {\nName = \"third\"\nGRIDCODEID = \"3\"\n}\n";
  setup.Edit("Subcatchments", own, own + another);
  EXPECT_EQ(setup.Value("Subcatchments/Subcatchment#2:Name"), "third");
  EXPECT_EQ(setup.Node("Subcatchments/Subcatchment"), lower);
}

TEST(TextTaking, WhatAPageHasChangedMeanwhileStays) {
  EditedSetup setup("section SimSpec {\nsection SimTitle {\nTitle = \"old\"\nDescription = \"old\"\n}\n}");
  setup.Edit("SimSpec/SimTitle", "Title = \"old\"", "Title = \"of the page\"");
  EXPECT_THAT(Texts(setup.Edit("SimSpec/SimTitle", "Description = \"old\"", "Description = \"typed\"")), IsEmpty());
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "of the page");
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Description"), "typed");
}

/// From one setup to another through the text alone, as one step that is undone.
TEST(TextTaking, TheTextOfAnotherSetupGivesThatSetup) {
  for (const char* name : {"rhone/rhone.tvd", "water_quality.tvd", "iceland/iceland.tvd"}) {
    SCOPED_TRACE(name);
    const std::string folder = TERVANE_SOURCE_DIR "/examples/";
    std::string error;
    CFlowModelDoc wanted;
    ASSERT_TRUE(wanted.OnOpenDocument(folder + name)) << wanted.Error();
    CFlowModelDoc document;
    ASSERT_TRUE(document.OpenText(SetupText(14, ""), folder + name));
    UndoStack steps(document.Root());
    const std::string before = SavedText(document), after = SavedText(wanted);
    EditedSection edited;
    edited.before = before;
    edited.after = after;
    edited.lastEdited = 1'000'000;
    const TakenText taken = TakeText(document, edited);
    ASSERT_TRUE(taken.isParsed);
    document.Root().Validate();
    EXPECT_TRUE(steps.Commit("Edit Text"));
    std::vector<std::string> differences;
    for (const SetupDifference& difference : CompareDocuments(wanted, document))
      differences.push_back(difference.path + ":" + difference.key + " " + difference.from + " -> " + difference.to);
    EXPECT_THAT(differences, IsEmpty());
    steps.Undo();
    EXPECT_EQ(SavedText(document), before);
  }
}

}  // namespace
}  // namespace tervane::text_taking_test
