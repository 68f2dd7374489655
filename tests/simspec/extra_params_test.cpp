// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/extra_params.h"

#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "tests/simspec/test_setup.h"

namespace tervane {
namespace {

using test::TestSetup;
using testing::IsEmpty;
using testing::SizeIs;

std::string OneParam(const std::string& keys) {
  return "section ExtraParams {\nNoOfParams = 1\nsection ExtraParam_1 {\n" + keys + "\n}\n}";
}

TEST(ExtraParams, TheValueIsReadAndWrittenByItsKind) {
  struct Case {
    const char* type;
    const char* value;
    const char* written;
    std::size_t notes = 0;
  };
  for (const Case& c : {Case{"0", "1.5", "1.5"},
                        {"0", "3", "3.0"},
                        {"1", "3", "3"},
                        {"2", "1", "1"},
                        {"3", "\"a \\\"b\\\"\"", "\"a \\\"b\\\"\""},
                        {"4", "file \"a/b.txt\"", "file \"a/b.txt\""},
                        {"4", "file \"a\\\\b\\\\\"", "file \"\"", 1},  // A folder is no file.
                        {"0", "\"text\"", "0.0", 1},
                        {"1", "1.5", "0", 1},
                        {"2", "true", "0", 1},
                        {"3", "1", "\"\"", 1},
                        {"4", "\"a\"", "file \"\"", 1}}) {
    TestSetup setup(OneParam(std::string("Name = \"n\"\nType = ") + c.type + "\nValue = " + c.value));
    EXPECT_EQ(setup.WrittenKeys("ExtraParams/ExtraParam_1"),
              std::string("Name=\"n\" Type=") + c.type + " Value=" + c.written);
    EXPECT_THAT(setup.Report().entries, SizeIs(c.notes)) << c.type << ' ' << c.value;
    EXPECT_THAT(setup.Report().unread, IsEmpty());
  }
}

TEST(ExtraParams, AnUnknownKindHasNoValueAndIsTold) {
  TestSetup setup(OneParam("Name = \"n\"\nType = 5\nValue = 1"));
  EXPECT_EQ(setup.WrittenKeys("ExtraParams/ExtraParam_1"), "Name=\"n\" Type=5");
  EXPECT_THAT(setup.Report().unread, SizeIs(1));
}

TEST(ExtraParams, AChangeOfTheKindAndBackLosesNothing) {
  TestSetup setup(OneParam("Type = 1\nValue = 7"));
  auto& item = setup.At<CExtraParamsItemKvf>("ExtraParams/ExtraParam_1");
  for (const auto& [type, written] : {std::pair{0, "0.0"}, {2, "0"}, {3, "\"\""}, {4, "file \"\""}, {1, "7"}}) {
    item.Type = type;
    EXPECT_EQ(setup.Written("ExtraParams/ExtraParam_1:Value"), written);
  }
}

TEST(ExtraParams, EitherCountIsEnoughAndTheOwnOneWins) {
  struct Case {
    const char* counts;
    int count;
  };
  for (const Case& c : {Case{"", 0},
                        {"NoOfParams = 2", 2},
                        {"YbSEKvfListItemCount = 2", 2},
                        {"YbSEKvfListItemCount = 1\nNoOfParams = 3", 3},
                        {"YbSEKvfListItemCount = 3\nNoOfParams = 0", 0}}) {
    TestSetup setup(std::string("section ExtraParams {\n") + c.counts + "\n}");
    EXPECT_EQ(setup.At<CExtraParamsKvf>("ExtraParams").GetItemCount(), c.count) << c.counts;
    EXPECT_EQ(setup.WrittenKeys("ExtraParams"),
              "YbSEKvfListItemCount=" + std::to_string(c.count) + " NoOfParams=" + std::to_string(c.count));
  }
}

TEST(ExtraParams, TheSectionIsUsedAsTheBasicParametersSay) {
  TestSetup setup(OneParam("Name = \"n\""));
  EXPECT_EQ(setup.At<CExtraParamsKvf>("ExtraParams").GetItemName(1), "n");
  EXPECT_EQ(setup.At<CExtraParamsKvf>("ExtraParams").GetItemName(2), "");
  EXPECT_EQ(setup.Written("ExtraParams:NoOfParams"), "1");
  setup.At<CBasicParaKvf>("SimSpec").UsesExtraParams = 0;
  EXPECT_EQ(setup.Written("ExtraParams:NoOfParams"), "");
}

TEST(ExtraParams, TheOverviewShowsTheValueOfTheKindAlone) {
  TestSetup setup(OneParam("Name = \"n\"\nType = 2\nValue = 1"));
  std::vector<OverviewLine> lines;
  setup.At<CYbSEKvfBase>("ExtraParams/ExtraParam_1").AddToOverview(lines, 0);
  EXPECT_EQ(OverviewText(lines), "PAGE: ExtraParam\r\n      Name = \"n\"\r\n      Type = 2\r\n      Value = 1\r\n");
}

}  // namespace
}  // namespace tervane
