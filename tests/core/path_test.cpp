// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/path.h"

#include <gmock/gmock.h>

namespace tervane::path_test {
namespace {

using testing::HasSubstr;
using testing::IsEmpty;

TEST(Path, ANameIsQuotedWhereItHoldsASignOfThePath) {
  for (const char* bare : {"Climate", "a name", "ä\\b", ".", "%"}) EXPECT_EQ(PathName(bare), bare);
  EXPECT_EQ(PathName("Item", 3), "Item#3");
  EXPECT_EQ(PathName("a/b"), R"("a/b")");
  EXPECT_EQ(PathName("a#2", 2), R"("a#2"#2)");
  EXPECT_EQ(PathName(R"(say "\")"), R"("say \"\\\"")");
  EXPECT_EQ(PathName(""), R"("")");
  EXPECT_EQ(JoinPath("", "a"), "a");
  EXPECT_EQ(JoinPath("a", "b#2"), "a/b#2");
}

TEST(Path, WhatIsWrittenIsRead) {
  for (const std::string name : {"Climate", "a b", "a/b", "a#2", "k:v", "\"", "\\", "a\\\"/b", "ä#", ""}) {
    for (const int instance : {1, 2, 2147483647}) {
      const SetupPath path =
          ParseSetupPath(JoinPath("Top", PathName(name, instance)) + ":" + PathName("Key", instance));
      EXPECT_EQ(path.error, "");
      ASSERT_EQ(path.steps.size(), 2u) << name;
      EXPECT_EQ(path.steps[0].name, "Top");
      EXPECT_EQ(path.steps[0].instance, 1);
      EXPECT_EQ(path.steps[1].name, name);
      EXPECT_EQ(path.steps[1].instance, instance);
      EXPECT_EQ(path.key.name, "Key");
      EXPECT_EQ(path.key.instance, instance);
    }
  }
}

TEST(Path, APathMayNameNoSectionOrNoKey) {
  EXPECT_EQ(ParseSetupPath(":Key").key.name, "Key");
  EXPECT_THAT(ParseSetupPath(":Key").steps, IsEmpty());
  EXPECT_THAT(ParseSetupPath("").steps, IsEmpty());
  EXPECT_EQ(ParseSetupPath("").error, "");
  EXPECT_EQ(ParseSetupPath("a/b").key.name, "");
  EXPECT_EQ(ParseSetupPath("a/b").error, "");
}

TEST(Path, WhatIsNoPathIsToldWhy) {
  constexpr const char* cases[][2] = {
      {"/a", "a name was expected at place 1"},
      {"a//b", "a name was expected at place 3"},
      {"a/", "a name was expected behind the last /"},
      {"a:", "a name was expected at place 3"},
      {":", "a name was expected at place 2"},
      {"#2", "a name was expected at place 1"},
      {"a#", "a number from 1 was expected behind #"},
      {"a#0", "a number from 1 was expected behind #"},
      {"a#-1", "a number from 1 was expected behind #"},
      {"a#x", "a number from 1 was expected behind #"},
      {"a#99999999999", "a number from 1 was expected behind #"},
      {"a#2x", "'x' was not expected at place 4"},
      {"\"a\"ä", "'ä' was not expected at place 4"},
      {"a#2#3", "'#' was not expected at place 4"},
      {"a\"b\"", "'\"' was not expected at place 2"},
      {"a:b:c", "':' was not expected at place 4"},
      {"a:b/c", "'/' was not expected at place 4"},
      {"\"a", "the closing \" of a name is missing"},
      {"\"a\\\"", "the closing \" of a name is missing"},
      {"a/\"\\", "the closing \" of a name is missing"},
  };
  for (const auto& [text, error] : cases) EXPECT_THAT(ParseSetupPath(text).error, HasSubstr(error)) << text;
}

}  // namespace
}  // namespace tervane::path_test
