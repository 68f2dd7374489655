// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/setup_diff.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "tests/support/setup.h"

namespace tervane::setup_diff_test {
namespace {

using test::SetupText;

std::string Items(const std::vector<std::string>& names) {
  std::string text = fmt::format("section ExtraParams {{\nNoOfParams = {}\n", names.size());
  for (std::size_t i = 0; i < names.size(); ++i)
    text += fmt::format("section ExtraParam_{} {{\nName = \"{}\"\nType = 1\nValue = {}\n}}\n", i + 1,
                        names[i].substr(0, names[i].find('=')),
                        names[i].find('=') == std::string::npos ? "0" : names[i].substr(names[i].find('=') + 1));
  return text + "}\n";
}

/// The differences of two setups, one short text each.
std::vector<std::string> Differences(const std::string& from, const std::string& to) {
  CFlowModelDoc a, b;
  EXPECT_TRUE(a.OpenText(SetupText(14, from), "a.tvd"));
  EXPECT_TRUE(b.OpenText(SetupText(14, to), "b.tvd"));
  KvfFile* fileA = a.BuildFile("");
  KvfFile* fileB = b.BuildFile("");
  std::vector<std::string> texts;
  for (const SetupDifference& d :
       CompareSetups(*AsSection(fileA->top.firstChild), *AsSection(fileB->top.firstChild), KeyReference())) {
    constexpr const char* kinds[] = {"~", "+", "-", ">"};
    texts.push_back(fmt::format("{}{}{}{} {}{}|{}{}", kinds[static_cast<int>(d.kind)], d.path, d.key.empty() ? "" : ":",
                                d.key, d.from, d.fromDefault ? "*" : "", d.to, d.toDefault ? "*" : ""));
  }
  kvfClose(&fileA);
  kvfClose(&fileB);
  return texts;
}

TEST(SetupDiff, TellsKeysWithOldAndNewValueAndMarksDefaults) {
  const auto differences = Differences("section SimSpec {\nModelType = 1\nsection SimTitle {\nTouched = 1\n}\n}",
                                       "section SimSpec {\nsection SimTitle {\nTitle = \"x\"\n}\n}");
  EXPECT_THAT(differences, testing::ElementsAre("~SimSpec:ModelType 1|0*", "~SimSpec/SimTitle:Title \"\"*|\"x\""));
}

TEST(SetupDiff, FollowsTheItemsOfAList) {
  struct Case {
    const char* what;
    std::vector<std::string> from, to, differences;
  };
  const Case cases[] = {
      {"nothing", {"a", "b"}, {"a", "b"}, {}},
      {"one moved down", {"a", "b", "c"}, {"b", "c", "a"}, {">ExtraParams/ExtraParam_3 ExtraParam_1|ExtraParam_3"}},
      {"one inserted in front", {"a", "b"}, {"x", "a", "b"}, {"+ExtraParams/ExtraParam_1 |"}},
      {"one deleted in front", {"a", "b", "c"}, {"b", "c"}, {"-ExtraParams/ExtraParam_1 |"}},
      {"one changed and moved",
       {"a=1", "b", "c"},
       {"b", "c", "a=2"},
       {">ExtraParams/ExtraParam_3 ExtraParam_1|ExtraParam_3", "~ExtraParams/ExtraParam_3:Value 1|2"}},
      {"one renamed", {"a=1", "b"}, {"z=1", "b"}, {"~ExtraParams/ExtraParam_1:Name \"a\"|\"z\""}},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.what);
    std::vector<std::string> found = Differences(Items(c.from), Items(c.to));
    std::vector<std::string> expected = c.differences;
    // The list's own count is told apart: it follows from the items.
    const auto isCount = [](const std::string& text) { return text.starts_with("~ExtraParams:NoOfParams"); };
    std::erase_if(found, isCount);
    std::erase_if(expected, isCount);
    EXPECT_THAT(found, testing::ElementsAreArray(expected));
  }
}

}  // namespace
}  // namespace tervane::setup_diff_test
