// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/kvf.h"

#include <cmath>
#include <cstdlib>
#include <string>
#include <vector>

#include <gmock/gmock.h>

#include "platform/text.h"
#include "tests/core/parsed.h"
#include "tests/support/split_at_arrow.h"
#include "tests/support/temp_folder.h"

namespace tervane::kvf_test {
namespace {

using test::Parsed;
using test::ReadFile;
using test::SplitAtArrow;
using test::TempFolder;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

/// "line path:key text" of the notes, and of what is unread.
std::vector<std::string> Notes(const Parsed& parsed) {
  std::vector<std::string> notes;
  for (const KvfPlacedNote& note : CollectNotes(*parsed.File()))
    notes.push_back(std::to_string(note.line) + " " + note.path + ":" + note.key + " " + note.text);
  return notes;
}
std::vector<std::string> Unread(const Parsed& parsed) {
  std::vector<std::string> lines;
  for (const KvfUnread& unread : CollectUnread(*parsed.File()))
    lines.push_back(std::to_string(unread.line) + " " + unread.path + " " + unread.text);
  return lines;
}

/// What reading `k` as a value of that type gives.
template <class Value>
Value ReadAs(KvfNode* section, Value value) {
  const Value before = value;
  const bool isRead = kvfGetParam(section, "k", &value, 1, 1) != 0;
  EXPECT_EQ(isRead, value != before);
  return value;
}

TEST(Kvf, ANullHandleGivesNullZeroOrNothing) {
  int number = 7, line = 7;
  float single = 7;
  double real = 7;
  bool flag = true;
  std::string text = "kept";
  const char* message = nullptr;
  char buffer[kKvfPathBuffer] = "x";
  KvfFile* file = nullptr;
  KvfNode* node = nullptr;
  KvfParam* param = nullptr;

  kvfClose(nullptr);
  kvfClose(&file);
  kvfWrite(file, "/nowhere");
  kvfCopy(node, node);
  kvfGetSyntaxErr(file, &number, &line, &message);
  EXPECT_EQ(number + line, 0);
  EXPECT_STREQ(message, "");
  EXPECT_EQ(kvfGetNoTargets(file) + kvfGetNoNodes(node) + kvfIsSection(node) + kvfIsKeyword(node), 0);
  EXPECT_FALSE(kvfTargetByNum(file, 1) || kvfTargetByNameNum(file, "T", 1) || kvfSectionByNameNum(node, "S", 1) ||
               kvfKeywordByNameNum(node, "k", 1) || kvfKeywordByNum(node, 1) || kvfNodeByNum(node, 1) ||
               kvfGetName(node) || kvfParamByNum(node, 1));
  for (const auto is : {kvfIsInt, kvfIsFloat, kvfIsDouble, kvfIsBool, kvfIsString, kvfIsFilename})
    EXPECT_FALSE(is(param));
  EXPECT_TRUE(kvfGetInt(param) == 0 && kvfGetFloat(param) == 0 && kvfGetDouble(param) == 0 && !kvfGetBool(param));
  EXPECT_EQ(std::string(kvfGetString(param)) + kvfGetFilename(param), "");
  EXPECT_FALSE(kvfGetParam(node, "k", &number, 1, 1) || kvfGetParam(node, "k", &single, 1, 1) ||
               kvfGetParam(node, "k", &real, 1, 1) || kvfGetParam(node, "k", &flag, 1, 1) ||
               kvfGetParam(node, "k", &text, 1, 1) || kvfGetParamFilename(node, "k", &text, 1, 1) ||
               kvfGetListParam(node, "k", 1, "is", &number, &text));
  EXPECT_TRUE(number == 0 && single == 7 && real == 7 && flag && text == "kept");
  EXPECT_FALSE(kvfAddTarget(file, "T") || kvfAddSection(file, "S") || kvfEndSection(file) || kvfAddKeyword(file, "k") ||
               kvfAddInt(file, 1) || kvfAddFloat(file, 1) || kvfAddDouble(file, 1) || kvfAddBool(file, true) ||
               kvfAddString(file, "") || kvfAddFilename(file, "") || kvfPutParam(file, "k", 1) ||
               kvfPutParam(file, "k", 1.0f) || kvfPutParam(file, "k", 1.0) || kvfPutParam(file, "k", true) ||
               kvfPutParam(file, "k", "x") || kvfPutParamFilename(file, "k", "x") ||
               kvfPutListParam(file, "k", "i", 1));
  kvfSetProjectResultRoot(file, "x");
  kvfSetCustomResultFolder(file, 1, "x");
  EXPECT_FALSE(kvfGetProjectResultRoot(file) || kvfGetCustomResultFolder(file, &number, &text) ||
               kvfGetResultFilename(param));
  for (const auto get : {kvfGetResultFilenamePath, kvfGetResultFolderPath}) {
    buffer[0] = 'x';
    get(param, buffer);
    EXPECT_STREQ(buffer, "");
  }
  kvfMarkKnown(node, "k");
  kvfAddNote(node, "k", "text");
  EXPECT_EQ(kvfFolderOf(node), "");
  EXPECT_EQ(kvfPeekErrorGlb(), kKvfNoError);
}

TEST(Kvf, AFileIsBuiltAtItsCursorOnly) {
  const Parsed built;
  KvfFile* file = built.File();
  EXPECT_FALSE(kvfAddSection(file, "S") || kvfAddKeyword(file, "k") || kvfEndSection(file) || kvfAddTarget(file, " "));
  EXPECT_TRUE(kvfAddTarget(file, "T"));
  EXPECT_FALSE(kvfAddTarget(file, "U") || kvfAddInt(file, 1) || kvfAddString(file, "x") || kvfAddSection(file, "") ||
               kvfPutParam(file, "\t", 1));
  EXPECT_TRUE(kvfPutParam(file, "literal", "a") && kvfPutListParam(file, "list", "sii", "a", 1, 2) &&
              kvfPutListParam(file, "nothing", "") && kvfAddSection(file, "S") && kvfPutParam(file, "k", 1) &&
              kvfEndSection(file));
  EXPECT_FALSE(kvfAddInt(file, 2));
  EXPECT_TRUE(kvfEndSection(file));
  EXPECT_FALSE(kvfEndSection(file));
  EXPECT_EQ(built.Written(),
            "target T {\n  literal = \"a\"\n  list = \"a\", 1, 2\n  nothing =\n  section S {\n    k = 1\n  }\n}\n");
}

TEST(Kvf, NodesAreFoundByNumberAndByNameInSmallAndInLargeSections) {
  for (const int count : {1, 11, 12, 13, 16, 17, 500}) {  // Four nodes each: an index is made above 48.
    std::string text = "target T {\n";
    for (int i = 1; i <= count; ++i)
      text += Replaced("Item = #\nsection Item {\nid = #\n}\nk# = 0\nsection \"S # \" {\n}\n", "#", std::to_string(i));
    const Parsed parsed(text + "}");
    KvfNode* target = parsed.Target();
    EXPECT_EQ(kvfGetNoNodes(target), 4 * count);
    for (const int i : {1, count / 2 + 1, count}) {
      const std::string number = std::to_string(i);
      int value = 0;
      EXPECT_TRUE(kvfGetParam(target, "Item", &value, i, 1));
      EXPECT_EQ(value, i);
      KvfNode* item = kvfSectionByNameNum(target, "Item", i);
      EXPECT_TRUE(kvfGetParam(item, "id", &value, 1, 1));
      EXPECT_EQ(value, i);
      EXPECT_EQ(kvfNodeByNum(target, 4 * i - 2), item);
      KvfNode* key = kvfKeywordByNum(target, 2 * i);
      EXPECT_EQ(kvfNodeByNum(target, 4 * i - 1), key);
      EXPECT_EQ(kvfKeywordByNameNum(target, " k" + number + "\t", 1), key);  // Blanks are no part of a name.
      EXPECT_TRUE(kvfIsSection(item) && !kvfIsKeyword(item) && kvfIsKeyword(key) && !kvfIsSection(key));
      EXPECT_EQ(kvfSectionByNameNum(target, "S " + number, 1), kvfNodeByNum(target, 4 * i));
      EXPECT_STREQ(kvfGetName(kvfNodeByNum(target, 4 * i)), ("S " + number).c_str());
    }
    for (const int i : {-1, 0, count + 1})
      EXPECT_FALSE(kvfSectionByNameNum(target, "Item", i) || kvfKeywordByNameNum(target, "Item", i) ||
                   kvfNodeByNum(target, i < 1 ? i : 4 * i) || kvfKeywordByNum(target, i < 1 ? i : 2 * i));
    EXPECT_FALSE(kvfKeywordByNameNum(target, "item", 1) || kvfSectionByNameNum(target, "k1", 1));
    EXPECT_FALSE(kvfKeywordByNameNum(kvfNodeByNum(target, 1), "Item", 1));  // A keyword holds no nodes.
  }
  const Parsed parsed("target A {\nk = 1\n}\ntarget B {\n}\ntarget A {\nk = 2\n}");
  EXPECT_EQ(kvfGetNoTargets(parsed.File()), 3);
  EXPECT_EQ(ReadAs(kvfTargetByNameNum(parsed.File(), "A", 2), 0), 2);
  EXPECT_FALSE(kvfTargetByNameNum(parsed.File(), "A", 3) || kvfTargetByNameNum(parsed.File(), "a", 1) ||
               parsed.Target(0) || parsed.Target(4));
}

TEST(Kvf, NamesThatAreAlikeStayApart) {
  std::vector<std::string> names = {
      " a", "a ", " a ", "a b", "1", "ä", " aaaab", " aaab", "first-8-1-last--8", "first-8-2-last--8"};
  for (std::size_t length = 1; length <= 40; ++length)
    for (const std::size_t place : {std::size_t{0}, length / 2, length - 1}) {
      names.emplace_back(length, 'a');
      names.push_back(names.back());
      names.back()[place] = 'b';
    }
  std::string text = "target T {\n";
  for (const std::string& name : names) text += "section \"" + name + "\" {\n}\n\"" + name + "\" =\n";
  const Parsed parsed(text + "}");
  int number = 0;
  for (const std::string& name : names)
    for (int kind = 0; kind < 2; ++kind) {
      KvfNode* node = kvfNodeByNum(parsed.Target(), ++number);
      ASSERT_STREQ(kvfGetName(node), std::string(Trimmed(name)).c_str());
      ASSERT_EQ(node->WrittenName(), name);
    }
}

TEST(Kvf, ANumberIsTakenInAnotherFormWhereNothingIsLost) {
  // What takes it: `i`nt, `f`loat, `d`ouble.
  for (const char* row :
       {"6 => ifd", "6.0 => ifd", "6f => ifd", "6.5 => fd", "6.5f => fd", "inf => fd", "-inff => fd", "0.1 => fd",
        "0.1f => fd", "16777217 => id", "1e300 => d", "1e-50 => d", "0.123456789 => d", "-2147483648.0 => ifd",
        "2147483648.0 => fd", "2147483648f => fd", "true => ", "\"6\" => ", " => "}) {
    const auto [source, takes] = SplitAtArrow(row);
    SCOPED_TRACE(source);
    const Parsed parsed("target T {\nk = " + source + "\n}");
    const float single = std::strtof(source.c_str(), nullptr);
    const double real = source.ends_with('f') ? single : std::strtod(source.c_str(), nullptr);
    EXPECT_EQ(ReadAs(parsed.Target(), 7), takes.starts_with('i') ? static_cast<int>(real) : 7);
    EXPECT_EQ(ReadAs(parsed.Target(), 7.0f), takes.find('f') != std::string::npos ? single : 7.0f);
    EXPECT_EQ(ReadAs(parsed.Target(), 7.0), takes.ends_with('d') ? real : 7.0);
    EXPECT_EQ(Notes(parsed).size(), 3 - takes.size());
  }
  for (const char* source : {"nan", "nanf"}) {
    const Parsed parsed(std::string("target T {\nk = ") + source + "\n}");
    EXPECT_TRUE(std::isnan(ReadAs(parsed.Target(), 7.0f)) && std::isnan(ReadAs(parsed.Target(), 7.0)));
    EXPECT_EQ(ReadAs(parsed.Target(), 7), 7);
  }
}

TEST(Kvf, AnotherTypeIsNotedWithItsPlaceAndTheDefaultStays) {
  const Parsed parsed(
      "target T {\nsection A {\n}\nsection A {\ni = \"x\"\nb = 1\ns = file \"f\"\nf =\n}\nn = 1, 2\n"
      "list = \"a\", 1, 2.0\n}");
  KvfNode *target = parsed.Target(), *section = kvfSectionByNameNum(target, "A", 2);
  int a = 7, b = 7, c = 7;
  bool flag = true;
  std::string text = "kept";
  kvfAddNote(target, "n", "odd");
  kvfAddNote(section, "none", "of the section");
  EXPECT_FALSE(kvfGetParam(section, "b", &flag, 1, 1) || kvfGetParam(section, "i", &a, 1, 1) ||
               kvfGetParam(section, "s", &text, 1, 1) || kvfGetParamFilename(section, "f", &text, 1, 1) ||
               kvfGetListParam(target, "n", 1, "iii", &a, &b, &c) ||
               kvfGetListParam(target, "list", 1, "iii", &a, &b, &c) ||
               kvfGetListParam(target, "list", 2, "sii", &text, &a, &b));
  EXPECT_TRUE(flag && a == 7 && b == 7 && c == 7 && text == "kept");  // A list is read whole or not at all.
  const std::string stays = " was expected: the value that held before stays";
  EXPECT_THAT(Notes(parsed), ElementsAre("4 A#2: of the section", "5 A#2:i \"x\" stands where a whole number" + stays,
                                         "6 A#2:b 1 stands where true or false" + stays,
                                         "7 A#2:s file \"f\" stands where a text in quotes" + stays,
                                         "8 A#2:f nothing stands where a file name (file \"...\")" + stays, "10 :n odd",
                                         "10 :n nothing stands where a whole number" + stays,
                                         "11 :list \"a\" stands where a whole number" + stays));
  EXPECT_TRUE(kvfGetListParam(target, "list", 1, "sii", &text, &a, &b));
  EXPECT_TRUE(text == "a" && a == 1 && b == 2);
}

TEST(Kvf, ParametersHaveTheirTypeAndNoOtherValue) {
  const Parsed parsed("target T {\nk = 1, 1.5f, 2.5, true, \"a\\nb\", file \"C:\\\\x\"\n}");
  KvfNode* keyword = kvfKeywordByNum(parsed.Target(), 1);
  for (int position = 1; position <= 6; ++position) {
    KvfParam* param = kvfParamByNum(keyword, position);
    const std::vector is = {kvfIsInt(param),  kvfIsFloat(param),  kvfIsDouble(param),
                            kvfIsBool(param), kvfIsString(param), kvfIsFilename(param)};
    for (int type = 1; type <= 6; ++type) EXPECT_EQ(is[static_cast<std::size_t>(type) - 1] != 0, type == position);
    EXPECT_EQ(kvfGetInt(param), position == 1 ? 1 : 0);
    EXPECT_EQ(kvfGetFloat(param), position == 2 ? 1.5f : 0.0f);
    EXPECT_EQ(kvfGetDouble(param), position == 3 ? 2.5 : 0.0);
    EXPECT_EQ(kvfGetBool(param), position == 4);
    EXPECT_STREQ(kvfGetString(param), position == 5 ? "a\nb" : "");
    EXPECT_STREQ(kvfGetFilename(param), position == 6 ? "C:\\x" : "");
  }
  EXPECT_FALSE(kvfParamByNum(keyword, 0) || kvfParamByNum(keyword, 7) || kvfParamByNum(parsed.Target(), 1));
}

TEST(Kvf, WhatNothingLookedUpIsUnread) {
  const Parsed parsed(
      "# header\ntarget T {\n# lost\n  k = 1, 2\n  k = 3\n  typo = 1\n  section S {\n    a = 1\n    b = 1 # too\n  }\n"
      "  section S {\n    a = 1\n  }\n  section Unknown {\n    section In {}\n  }\n  known = 1, 2\n}\ntarget T {\n}\n"
      "target U {\n}\n");
  int value = 0;
  KvfNode* target = parsed.Target();
  KvfNode* section = kvfSectionByNameNum(target, "S", 1);
  kvfMarkKnown(target, "known");
  kvfGetParam(section, "a", &value, 1, 1);
  kvfGetParam(target, "k", &value, 1, 1);
  EXPECT_THAT(
      Unread(parsed),
      ElementsAre("4 :k key k: it has 2 values, and nothing reads all of them",
                  "5 :k#2 key k: a repetition that nothing reads", "6 :typo key typo: nothing reads it",
                  "9 S:b key b: nothing reads it", "11 S#2 section S: a repetition that nothing reads",
                  "14 Unknown section Unknown: nothing reads it", "19 T#2 another target T#2: nothing reads it",
                  "21 U target U: nothing reads it", "3  comment # lost: comments behind the first target are not kept",
                  "9  comment # too: comments behind the first target are not kept"));

  const Parsed whole("# header\n\n# too\ntarget T {\n  k = 1, 2\n  none =\n  section S {\n  }\n}\n");
  EXPECT_EQ(Unread(whole).size(), 1u);
  EXPECT_TRUE(kvfGetListParam(whole.Target(), "k", 1, "ii", &value, &value) &&
              kvfKeywordByNameNum(whole.Target(), "none", 1) && kvfSectionByNameNum(whole.Target(), "S", 1));
  EXPECT_THAT(Unread(whole), IsEmpty());
  EXPECT_THAT(parsed.Written(), testing::StartsWith("# header\ntarget T {\n  k = 1, 2\n"));
}

TEST(Kvf, ACopyKeepsOrderKindsAndNamesAndIsMadeOnce) {
  const std::string nodes =
      "  k = 1, 1.5f, 2.0, true, \"a\\n\", file \"x\"\n  k =\n  \" padded \" = 1\n  section S {\n    section S {\n"
      "      k = 1\n    }\n  }\n  k = 2\n  section \"S \" {\n  }\n";
  const Parsed built;
  {
    const Parsed source("target A {\n" + nodes + "}");
    kvfAddTarget(built.File(), "B");
    kvfPutParam(built.File(), "first", 1);
    kvfEndSection(built.File());
    kvfCopy(source.Target(), built.Target());
  }
  EXPECT_EQ(built.Written(), "target B {\n  first = 1\n" + nodes + "}\n");
  // Also of a target into itself.
  const Parsed parsed("target T {\na = 1\nsection S {\nb = 2\n}\n}");
  KvfNode* section = kvfSectionByNameNum(parsed.Target(), "S", 1);
  kvfCopy(section, section);
  kvfCopy(parsed.Target(), section);
  EXPECT_EQ(parsed.Written(),
            "target T {\n  a = 1\n  section S {\n    b = 2\n    b = 2\n    a = 1\n    section S {\n      b = 2\n"
            "      b = 2\n      a = 1\n    }\n  }\n}\n");
}

TEST(Kvf, AnErrorStaysPendingUntilItIsTaken) {
  const TempFolder folder;
  const std::string path = folder.Write("x.tvd", "target T {\n  a = 12x\n}\n");
  KvfFile* file = kvfLoadFile(path, 0);
  ASSERT_TRUE(file);
  EXPECT_EQ(kvfPeekErrorGlb(), 1003);
  EXPECT_EQ(kvfGetErrorGlb(), 1003);
  EXPECT_EQ(kvfGetErrorGlb(), 0);
  int line = 0, column = 0;
  const char* message = nullptr;
  kvfGetSyntaxErr(file, &line, &column, &message);
  EXPECT_TRUE(line == 2 && column == 7);
  EXPECT_STREQ(message, "2:7: a = 12x: a number was expected");
  EXPECT_EQ(kvfErrorText(), path + ":" + message);
  EXPECT_EQ(kvfGetNoTargets(file), 0);
  kvfClose(&file);
  EXPECT_FALSE(file);
  // What cannot be read gives no handle, and what cannot be written leaves the old file.
  EXPECT_FALSE(kvfLoadFile(folder.File("none"), 1));
  EXPECT_EQ(kvfGetErrorGlb(), kKvfCannotRead);
  EXPECT_THAT(kvfErrorText(), HasSubstr("cannot read " + folder.File("none")));
  const Parsed built;
  kvfAddTarget(built.File(), "T");
  kvfPutParam(built.File(), "Title", "\xE4");
  kvfWrite(built.File(), path);
  EXPECT_EQ(kvfGetErrorGlb(), kKvfCannotWrite);
  EXPECT_EQ(kvfErrorText(), "cannot write " + path + ": Title in T is no UTF-8 text");
  EXPECT_EQ(ReadFile(path), "target T {\n  a = 12x\n}\n");
}

TEST(Kvf, ResultsLieInTheCustomFolderElseBelowTheRootElseBesideTheFile) {
  const std::pair<std::string, const char*> cases[] = {
      {"", "/setups/x_results"},
      {"ProjectResultRoot = file \"\"", "/setups/x_results"},
      {"ProjectResultRoot = file \"/\"", "/x_results"},
      {"ProjectResultRoot = file \"D:\\\\runs\"", "D:/runs/x_results"},
      {"UseCustomResultFolder = 0\nCustomResultFolder = file \"c\"", "/setups/x_results"},
      {"UseCustomResultFolder = 1\nCustomResultFolder = file \"\"", "/setups/x_results"},
      {"UseCustomResultFolder = 1\nCustomResultFolder = file \"../c\"", "/c"}};
  char buffer[kKvfPathBuffer];
  const auto pathOf = [&](KvfParam* param) { return kvfGetResultFilenamePath(param, buffer), std::string(buffer); };
  for (const auto& [settings, folder] : cases) {
    const Parsed parsed(
        "target T {\nk = file \"in\\\\a.fif\", file \"\", file \"in/\", file \"C:\", 1\n}\n"
        "target SYSTEM {\n" +
        settings + "\n}");
    KvfNode* keyword = kvfKeywordByNum(parsed.Target(), 1);
    EXPECT_STREQ(kvfGetResultFilename(kvfParamByNum(keyword, 1)), "a.fif");
    EXPECT_EQ(pathOf(kvfParamByNum(keyword, 1)), std::string(folder) + "/a.fif");
    kvfGetResultFolderPath(kvfParamByNum(keyword, 1), buffer);
    EXPECT_STREQ(buffer, folder);
    for (int position = 2; position <= 5; ++position) {
      EXPECT_FALSE(kvfGetResultFilename(kvfParamByNum(keyword, position)));
      EXPECT_EQ(pathOf(kvfParamByNum(keyword, position)), "");
    }
  }
  for (const std::size_t length : {2000, 2040}) {  // What does not fit the buffer is empty.
    const Parsed parsed("target T {\nk = file \"" + std::string(length, 'n') + "\"\n}");
    EXPECT_EQ(pathOf(kvfParamByNum(kvfKeywordByNum(parsed.Target(), 1), 1)).size(), length == 2000 ? 2018 : 0);
  }
}

}  // namespace
}  // namespace tervane::kvf_test
