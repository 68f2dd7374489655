// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/kvf.h"

#include <limits>
#include <string>
#include <vector>

#include <gmock/gmock.h>

#include "tests/core/parsed.h"
#include "tests/support/temp_folder.h"

namespace tervane {
namespace {

using test::Parsed;
using test::ReadFile;
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
std::pair<int, Value> ReadAs(KvfNode* section, Value before) {
  const int found = kvfGetParam(section, "k", &before, 1, 1);
  return {found, before};
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
  for (const KvfNode* found :
       {kvfTargetByNum(file, 1), kvfTargetByNameNum(file, "T", 1), kvfSectionByNameNum(node, "S", 1),
        kvfKeywordByNameNum(node, "k", 1), kvfKeywordByNum(node, 1), kvfNodeByNum(node, 1)})
    EXPECT_FALSE(found);
  EXPECT_FALSE(kvfGetName(node));
  EXPECT_FALSE(kvfParamByNum(node, 1));
  for (const auto is : {kvfIsInt, kvfIsFloat, kvfIsDouble, kvfIsBool, kvfIsString, kvfIsFilename})
    EXPECT_FALSE(is(param));
  EXPECT_EQ(kvfGetInt(param), 0);
  EXPECT_EQ(kvfGetFloat(param), 0);
  EXPECT_EQ(kvfGetDouble(param), 0);
  EXPECT_FALSE(kvfGetBool(param));
  EXPECT_STREQ(kvfGetString(param), "");
  EXPECT_STREQ(kvfGetFilename(param), "");
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
  EXPECT_FALSE(kvfGetProjectResultRoot(file));
  EXPECT_FALSE(kvfGetCustomResultFolder(file, &number, &text));
  EXPECT_FALSE(kvfGetResultFilename(param));
  kvfGetResultFilenamePath(param, buffer);
  EXPECT_STREQ(buffer, "");
  kvfGetResultFolderPath(param, buffer);
  EXPECT_STREQ(buffer, "");
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
  EXPECT_TRUE(kvfPutParam(file, "text", "literal") && kvfPutParam(file, "view", std::string("text")) &&
              kvfPutParam(file, "flag", true) && kvfPutParam(file, "int", 1) && kvfPutParam(file, "float", 1.5f) &&
              kvfPutParam(file, "double", 1.5) && kvfPutParamFilename(file, "file", "x") &&
              kvfPutListParam(file, "list", "sii", "a", 1, 2) && kvfPutListParam(file, "nothing", ""));
  EXPECT_TRUE(kvfAddSection(file, "S") && kvfPutParam(file, "k", 1) && kvfEndSection(file));
  EXPECT_FALSE(kvfAddInt(file, 2));
  EXPECT_TRUE(kvfEndSection(file));
  EXPECT_FALSE(kvfEndSection(file));
  EXPECT_EQ(built.Written(), R"(target T {
  text = "literal"
  view = "text"
  flag = true
  int = 1
  float = 1.5f
  double = 1.5
  file = file "x"
  list = "a", 1, 2
  nothing =
  section S {
    k = 1
  }
}
)");
}

TEST(Kvf, NodesAreFoundByNumberAndByNameInSmallAndInLargeSections) {
  for (const int count : {1, 11, 12, 13, 16, 17, 500}) {  // four nodes each: an index is made above 48
    std::string text = "target T {\n";
    for (int i = 1; i <= count; ++i) {
      const std::string number = std::to_string(i);
      text += "Item = " + number + "\nsection Item {\nid = " + number + "\n}\nk" + number + " = 0\nsection \"S " +
              number + " \" {\n}\n";
    }
    const Parsed parsed(text + "}");
    ASSERT_EQ(parsed.Message(), "");
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
      EXPECT_TRUE(kvfIsSection(item) && !kvfIsKeyword(item));
      KvfNode* key = kvfKeywordByNum(target, 2 * i);
      EXPECT_STREQ(kvfGetName(key), ("k" + number).c_str());
      EXPECT_TRUE(kvfIsKeyword(key) && !kvfIsSection(key));
      EXPECT_EQ(kvfNodeByNum(target, 4 * i - 1), key);
      EXPECT_EQ(kvfKeywordByNameNum(target, " k" + number + "\t", 1), key);  // blanks are no part of a name
      EXPECT_EQ(kvfSectionByNameNum(target, "S " + number, 1), kvfNodeByNum(target, 4 * i));
      EXPECT_STREQ(kvfGetName(kvfNodeByNum(target, 4 * i)), ("S " + number).c_str());
    }
    for (const int i : {-1, 0, count + 1}) {
      EXPECT_FALSE(kvfSectionByNameNum(target, "Item", i) || kvfKeywordByNameNum(target, "Item", i));
      EXPECT_FALSE(kvfNodeByNum(target, i < 1 ? i : 4 * i) || kvfKeywordByNum(target, i < 1 ? i : 2 * i));
    }
    EXPECT_FALSE(kvfKeywordByNameNum(target, "item", 1) || kvfSectionByNameNum(target, "k1", 1));
    EXPECT_FALSE(kvfKeywordByNameNum(kvfNodeByNum(target, 1), "Item", 1));  // a keyword holds no nodes
  }
}

TEST(Kvf, TargetsAreFoundByNumberAndByNameAndStandForSections) {
  const Parsed parsed("target A {\nk = 1\n}\ntarget B {\n}\ntarget A {\nk = 2\n}");
  EXPECT_EQ(kvfGetNoTargets(parsed.File()), 3);
  EXPECT_STREQ(kvfGetName(parsed.Target(2)), "B");
  EXPECT_EQ(ReadAs(kvfTargetByNameNum(parsed.File(), "A", 2), 0), std::pair(1, 2));
  EXPECT_FALSE(kvfTargetByNameNum(parsed.File(), "A", 3) || kvfTargetByNameNum(parsed.File(), "a", 1) ||
               parsed.Target(0) || parsed.Target(4));
}

TEST(Kvf, AnAbsentKeyLeavesTheVariableAlone) {
  const Parsed parsed("target T {\nk = \"a\"\nk = \"b\"\n}");
  std::string text = "kept";
  EXPECT_FALSE(kvfGetParam(parsed.Target(), "k", &text, 3, 1) || kvfGetParam(parsed.Target(), "none", &text, 1, 1));
  EXPECT_EQ(text, "kept");
  std::string all;
  for (int n = 1; kvfGetParam(parsed.Target(), "k", &text, n, 1); ++n) all += text;
  EXPECT_EQ(all, "ab");
  EXPECT_THAT(Notes(parsed), IsEmpty());
}

TEST(Kvf, ANumberIsTakenInAnotherFormWhereNothingIsLost) {
  struct Case {
    const char* source;
    std::pair<int, int> asInt;
    std::pair<int, float> asFloat;
    std::pair<int, double> asDouble;
  };
  constexpr float kInfinity = std::numeric_limits<float>::infinity();
  constexpr Case cases[] = {
      {"6", {1, 6}, {1, 6.0f}, {1, 6.0}},
      {"6.0", {1, 6}, {1, 6.0f}, {1, 6.0}},
      {"6f", {1, 6}, {1, 6.0f}, {1, 6.0}},
      {"6.5", {0, 7}, {1, 6.5f}, {1, 6.5}},
      {"6.5f", {0, 7}, {1, 6.5f}, {1, 6.5}},
      {"-2147483648.0", {1, std::numeric_limits<int>::min()}, {1, -2147483648.0f}, {1, -2147483648.0}},
      {"2147483648.0", {0, 7}, {1, 2147483648.0f}, {1, 2147483648.0}},
      {"2147483648f", {0, 7}, {1, 2147483648.0f}, {1, 2147483648.0}},
      {"0.1", {0, 7}, {1, 0.1f}, {1, 0.1}},
      {"0.1f", {0, 7}, {1, 0.1f}, {1, static_cast<double>(0.1f)}},
      {"0.123456789", {0, 7}, {0, 7.0f}, {1, 0.123456789}},
      {"16777217", {1, 16777217}, {0, 7.0f}, {1, 16777217.0}},
      {"1e300", {0, 7}, {0, 7.0f}, {1, 1e300}},
      {"1e-50", {0, 7}, {0, 7.0f}, {1, 1e-50}},
      {"inf", {0, 7}, {1, kInfinity}, {1, std::numeric_limits<double>::infinity()}},
      {"-inff", {0, 7}, {1, -kInfinity}, {1, -std::numeric_limits<double>::infinity()}},
      {"true", {0, 7}, {0, 7.0f}, {0, 7.0}},
      {"\"6\"", {0, 7}, {0, 7.0f}, {0, 7.0}},
      {"", {0, 7}, {0, 7.0f}, {0, 7.0}},
  };
  for (const Case& c : cases) {
    const Parsed parsed(std::string("target T {\nk = ") + c.source + "\n}");
    EXPECT_EQ(ReadAs(parsed.Target(), 7), c.asInt) << c.source;
    EXPECT_EQ(ReadAs(parsed.Target(), 7.0f), c.asFloat) << c.source;
    EXPECT_EQ(ReadAs(parsed.Target(), 7.0), c.asDouble) << c.source;
    const int refused = 3 - c.asInt.first - c.asFloat.first - c.asDouble.first;
    EXPECT_EQ(Notes(parsed).size(), static_cast<std::size_t>(refused)) << c.source;
  }
  for (const char* source : {"nan", "nanf"}) {
    const Parsed parsed(std::string("target T {\nk = ") + source + "\n}");
    EXPECT_TRUE(ReadAs(parsed.Target(), 7.0f).first && ReadAs(parsed.Target(), 7.0).first);
    EXPECT_EQ(ReadAs(parsed.Target(), 7), std::pair(0, 7));
  }
}

TEST(Kvf, AnotherTypeIsNotedWithItsPlaceAndTheDefaultStays) {
  const Parsed parsed("target T {\nsection A {\n}\nsection A {\ni = \"x\"\nb = 1\ns = file \"f\"\nf =\n}\nn = 1, 2\n}");
  KvfNode* section = kvfSectionByNameNum(parsed.Target(), "A", 2);
  int number = 7;
  bool flag = true;
  std::string text = "kept";
  kvfAddNote(parsed.Target(), "n", "odd");
  kvfAddNote(section, "none", "of the section");
  EXPECT_FALSE(kvfGetParam(section, "b", &flag, 1, 1) || kvfGetParam(section, "i", &number, 1, 1) ||
               kvfGetParam(section, "s", &text, 1, 1) || kvfGetParamFilename(section, "f", &text, 1, 1) ||
               kvfGetParam(parsed.Target(), "n", &number, 1, 3));
  EXPECT_TRUE(flag && number == 7 && text == "kept");
  constexpr const char* kStays = " was expected: the value that held before stays";
  EXPECT_THAT(Notes(parsed),
              ElementsAre("4 A#2: of the section", std::string("5 A#2:i \"x\" stands where a whole number") + kStays,
                          std::string("6 A#2:b 1 stands where true or false") + kStays,
                          std::string("7 A#2:s file \"f\" stands where a text in quotes") + kStays,
                          std::string("8 A#2:f nothing stands where a file name (file \"...\")") + kStays, "10 :n odd",
                          std::string("10 :n nothing stands where a whole number") + kStays));
}

TEST(Kvf, AListIsReadWholeOrNotAtAll) {
  const Parsed parsed("target T {\ndate = 2000, 2.0, 29f\nsii = \"a\", 1, 2\nbad = 1, \"x\", 3\nshort = 1, 2\n}");
  KvfNode* target = parsed.Target();
  int a = 7, b = 7, c = 7;
  std::string text = "kept";
  EXPECT_FALSE(kvfGetListParam(target, "bad", 1, "iii", &a, &b, &c) ||
               kvfGetListParam(target, "short", 1, "iii", &a, &b, &c) ||
               kvfGetListParam(target, "date", 1, "sii", &text, &a, &b) ||
               kvfGetListParam(target, "date", 2, "iii", &a, &b, &c));
  EXPECT_TRUE(a == 7 && b == 7 && c == 7 && text == "kept");
  EXPECT_EQ(Notes(parsed).size(), 3u);
  EXPECT_TRUE(kvfGetListParam(target, "date", 1, "iii", &a, &b, &c));
  EXPECT_TRUE(a == 2000 && b == 2 && c == 29);
  EXPECT_TRUE(kvfGetListParam(target, "sii", 1, "sii", &text, &a, &b));
  EXPECT_TRUE(text == "a" && a == 1 && b == 2);
}

TEST(Kvf, ParametersHaveTheirTypeAndNoOtherValue) {
  const Parsed parsed("target T {\nk = 1, 1.5f, 2.5, true, \"a\\nb\", file \"C:\\\\x\"\n}");
  KvfNode* keyword = kvfKeywordByNum(parsed.Target(), 1);
  using Is = int (*)(const KvfParam*);
  constexpr Is is[] = {kvfIsInt, kvfIsFloat, kvfIsDouble, kvfIsBool, kvfIsString, kvfIsFilename};
  for (int position = 1; position <= 6; ++position) {
    KvfParam* param = kvfParamByNum(keyword, position);
    for (int type = 1; type <= 6; ++type) EXPECT_EQ(is[type - 1](param) != 0, type == position);
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

  EXPECT_THAT(parsed.Written(), testing::StartsWith("# header\ntarget T {\n  k = 1, 2\n"));
}

TEST(Kvf, AFileOfWhichAllIsLookedUpHasNothingUnread) {
  const Parsed parsed("# header\n\n# too\ntarget T {\n  k = 1, 2\n  none =\n  section S {\n  }\n}\n");
  EXPECT_EQ(Unread(parsed).size(), 1u);
  int a = 0, b = 0;
  EXPECT_TRUE(kvfGetListParam(parsed.Target(), "k", 1, "ii", &a, &b));
  EXPECT_TRUE(kvfKeywordByNameNum(parsed.Target(), "none", 1) && kvfSectionByNameNum(parsed.Target(), "S", 1));
  EXPECT_THAT(Unread(parsed), IsEmpty());
}

TEST(Kvf, ACopyAcrossFilesKeepsOrderKindsAndNames) {
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
}

TEST(Kvf, ACopyOfATargetIntoItselfIsMadeOnce) {
  const Parsed parsed("target T {\na = 1\nsection S {\nb = 2\n}\n}");
  KvfNode* section = kvfSectionByNameNum(parsed.Target(), "S", 1);
  kvfCopy(section, section);
  kvfCopy(parsed.Target(), section);
  EXPECT_EQ(parsed.Written(),
            "target T {\n  a = 1\n  section S {\n    b = 2\n    b = 2\n    a = 1\n    section S {\n      b = 2\n"
            "      b = 2\n      a = 1\n    }\n  }\n}\n");
}

TEST(Kvf, ASyntaxErrorStaysPendingUntilItIsTaken) {
  const TempFolder folder;
  const std::string path = folder.Write("x.tvd", "target T {\n  a = 12x\n}\n");
  KvfFile* file = kvfLoadFile(path, 0);
  ASSERT_TRUE(file);
  EXPECT_EQ(kvfPeekErrorGlb(), 1003);
  EXPECT_EQ(kvfPeekErrorGlb(), 1003);
  EXPECT_EQ(kvfGetErrorGlb(), 1003);
  EXPECT_EQ(kvfGetErrorGlb(), 0);
  int line = 0, column = 0;
  const char* message = nullptr;
  kvfGetSyntaxErr(file, &line, &column, &message);
  EXPECT_EQ(line, 2);
  EXPECT_EQ(column, 7);
  EXPECT_STREQ(message, "2:7: a = 12x: a number was expected");
  EXPECT_EQ(kvfErrorText(), path + ":" + message);
  EXPECT_EQ(kvfGetNoTargets(file), 0);
  kvfClose(&file);
  EXPECT_FALSE(file);
  EXPECT_EQ(kvfPeekErrorGlb(), 0);
}

TEST(Kvf, AFileThatCannotBeReadGivesNoHandleAndAnotherCode) {
  const TempFolder folder;
  for (const std::string& path : {folder.File("none.tvd"), folder.Path(), std::string()}) {
    EXPECT_FALSE(kvfLoadFile(path, 1)) << path;
    EXPECT_EQ(kvfGetErrorGlb(), kKvfCannotRead);
    EXPECT_THAT(kvfErrorText(), HasSubstr("cannot read " + path));
  }
}

TEST(Kvf, AFileIsReadFromDiskAndWrittenBack) {
  const TempFolder folder;
  const std::string text = "# kept\ntarget T {\n  a = 1\n  n = file \"maps/x\"\n}\n";
  const std::string path = folder.Write("x.tvd", text);
  KvfFile* file = kvfLoadFile(path, 0);
  ASSERT_EQ(kvfPeekErrorGlb(), 0) << kvfErrorText();
  std::string name;
  EXPECT_TRUE(kvfGetParamFilename(kvfTargetByNum(file, 1), "n", &name, 1, 1));
  EXPECT_EQ(name, folder.File("maps/x"));
  EXPECT_EQ(kvfFolderOf(kvfTargetByNum(file, 1)), folder.Path());
  kvfWrite(file, folder.File("y.tvd"));
  kvfClose(&file);
  EXPECT_EQ(kvfGetErrorGlb(), 0);
  EXPECT_EQ(ReadFile(folder.File("y.tvd")), text);
}

TEST(Kvf, AFailedWriteLeavesTheOldFile) {
  const TempFolder folder;
  const std::string path = folder.Write("x.tvd", "old");
  const Parsed built;
  kvfAddTarget(built.File(), "T");
  kvfWrite(built.File(), folder.File("none/x.tvd"));
  EXPECT_EQ(kvfGetErrorGlb(), kKvfCannotWrite);
  EXPECT_THAT(kvfErrorText(), HasSubstr(folder.File("none")));
  kvfPutParam(built.File(), "Title", "\xE4");
  kvfWrite(built.File(), path);
  EXPECT_EQ(kvfGetErrorGlb(), kKvfCannotWrite);
  EXPECT_EQ(kvfErrorText(), "cannot write " + path + ": Title in T is no UTF-8 text");
  EXPECT_EQ(ReadFile(path), "old");
}

TEST(Kvf, AFilenameIsGivenAbsoluteAndAsStored) {
  constexpr const char* cases[][2] = {
      {"", ""},
      {"x.nds2", "/setups/x.nds2"},
      {"maps\\x.nds2", "/setups/maps/x.nds2"},
      {"../x", "/x"},
      {"./maps/", "/setups/maps/"},
      {"/data/x", "/data/x"},
      {"C:\\data\\x", "C:/data/x"},
      {"d:/x", "d:/x"},
      {"\\\\server\\share\\x", "//server/share/x"},
  };
  for (const auto& [stored, absolute] : cases) {
    const Parsed built;
    built.File()->folder = "/setups";
    kvfAddTarget(built.File(), "T");
    kvfPutParamFilename(built.File(), "k", stored);
    std::string name = "before";
    EXPECT_TRUE(kvfGetParamFilename(built.Target(), "k", &name, 1, 1));
    EXPECT_EQ(name, absolute);
    EXPECT_STREQ(kvfGetFilename(kvfParamByNum(kvfKeywordByNum(built.Target(), 1), 1)), stored);
  }
}

TEST(Kvf, ResultsLieInTheCustomFolderElseBelowTheRootElseBesideTheFile) {
  struct Case {
    const char *settings, *folder;
  };
  constexpr Case cases[] = {
      {"", "/setups/x_results"},
      {"target SYSTEM {}", "/setups/x_results"},
      {"target SYSTEM {\nProjectResultRoot = file \"\"\n}", "/setups/x_results"},
      {"target SYSTEM {\nProjectResultRoot = file \"/\"\n}", "/x_results"},
      {"target SYSTEM {\nProjectResultRoot = file \"D:\\\\runs\"\n}", "D:/runs/x_results"},
      {"target SYSTEM {\nUseCustomResultFolder = 0\nCustomResultFolder = file \"c\"\n}", "/setups/x_results"},
      {"target SYSTEM {\nUseCustomResultFolder = 1\nCustomResultFolder = file \"\"\n}", "/setups/x_results"},
      {"target SYSTEM {\nUseCustomResultFolder = 1\nCustomResultFolder = file \"../c\"\n}", "/c"},
  };
  for (const Case& c : cases) {
    const Parsed parsed("target T {\nk = file \"in\\\\a.fif\", file \"\", file \"in/\", file \"C:\", 1\n}\n" +
                        std::string(c.settings));
    ASSERT_EQ(parsed.Message(), "");
    KvfNode* keyword = kvfKeywordByNum(parsed.Target(), 1);
    char buffer[kKvfPathBuffer];
    KvfParam* param = kvfParamByNum(keyword, 1);
    EXPECT_STREQ(kvfGetResultFilename(param), "a.fif");
    kvfGetResultFolderPath(param, buffer);
    EXPECT_STREQ(buffer, c.folder);
    kvfGetResultFilenamePath(param, buffer);
    EXPECT_EQ(buffer, std::string(c.folder) + "/a.fif");
    for (int position = 2; position <= 5; ++position) {
      EXPECT_FALSE(kvfGetResultFilename(kvfParamByNum(keyword, position)));
      kvfGetResultFilenamePath(kvfParamByNum(keyword, position), buffer);
      EXPECT_STREQ(buffer, "");
    }
  }
}

TEST(Kvf, APathThatDoesNotFitItsBufferIsEmpty) {
  for (const std::size_t length : {2000, 2040}) {
    const Parsed parsed("target T {\nk = file \"" + std::string(length, 'n') + "\"\n}");
    char buffer[kKvfPathBuffer];
    kvfGetResultFilenamePath(kvfParamByNum(kvfKeywordByNum(parsed.Target(), 1), 1), buffer);
    EXPECT_EQ(std::string_view(buffer).size(), length == 2000 ? length + std::size("/setups/x_results/") - 1 : 0);
  }
}

TEST(Kvf, ResultSettingsAreStoredOnceInATargetOfTheirOwn) {
  const Parsed built;
  EXPECT_FALSE(kvfGetProjectResultRoot(built.File()));
  kvfAddTarget(built.File(), "T");
  kvfSetProjectResultRoot(built.File(), "old");
  kvfSetCustomResultFolder(built.File(), 0, "");
  kvfPutParam(built.File(), "k", 1);  // the cursor stands where it stood
  kvfSetProjectResultRoot(built.File(), "/runs");
  kvfSetCustomResultFolder(built.File(), 1, "c");
  EXPECT_STREQ(kvfGetProjectResultRoot(built.File()), "/runs");
  int useCustom = 0;
  std::string folder;
  EXPECT_TRUE(kvfGetCustomResultFolder(built.File(), &useCustom, &folder));
  EXPECT_EQ(useCustom, 1);
  EXPECT_EQ(folder, "c");
  EXPECT_EQ(built.Written(),
            "target T {\n  k = 1\n}\ntarget SYSTEM {\n  ProjectResultRoot = file \"/runs\"\n"
            "  UseCustomResultFolder = 1\n  CustomResultFolder = file \"c\"\n}\n");
}

TEST(Kvf, ResultSettingsOfAnotherTypeAreNoted) {
  const Parsed parsed(
      "target SYSTEM {\nProjectResultRoot = \"r\"\nUseCustomResultFolder = true\n"
      "CustomResultFolder = \"c\"\n}");
  int useCustom = 7;
  std::string folder = "kept";
  EXPECT_FALSE(kvfGetCustomResultFolder(parsed.File(), &useCustom, &folder));
  EXPECT_TRUE(useCustom == 7 && folder == "kept");
  EXPECT_FALSE(kvfGetProjectResultRoot(parsed.File()));
  EXPECT_THAT(Notes(parsed), ElementsAre(HasSubstr("2 :ProjectResultRoot \"r\" stands where"),
                                         HasSubstr("3 :UseCustomResultFolder true stands where"),
                                         HasSubstr("4 :CustomResultFolder \"c\" stands where")));
}

}  // namespace
}  // namespace tervane
