// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/extra_params.h"

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "simspec/basic_parameters.h"
#include "tests/simspec/test_setup.h"

namespace tervane::extra_params_test {
namespace {

using test::TestSetup;
using testing::SizeIs;

std::string OneParam(const std::string& keys) {
  return "section ExtraParams {\nNoOfParams = 1\nsection ExtraParam_1 {\n" + keys + "\n}\n}";
}

TEST(ExtraParams, TheValueIsReadAndWrittenByItsKind) {
  struct Case {
    const char *type, *value, *written;
    std::size_t notes;
  };
  const Case cases[] = {{"0", "1.5", "1.5", 0},
                        {"0", "3", "3.0", 0},
                        {"1", "3", "3", 0},
                        {"2", "1", "1", 0},
                        {"3", "\"a \\\"b\\\"\"", "\"a \\\"b\\\"\"", 0},
                        {"4", "file \"a/b.txt\"", "file \"a/b.txt\"", 0},
                        {"4", "file \"a\\\\b\\\\\"", "file \"\"", 1},  // A folder is no file.
                        {"0", "\"text\"", "0.0", 1},
                        {"1", "1.5", "0", 1},
                        {"2", "true", "0", 1},
                        {"3", "1", "\"\"", 1},
                        {"4", "\"a\"", "file \"\"", 1},
                        {"5", "1", nullptr, 0}};  // An unknown kind has no value.
  for (const Case& c : cases) {
    TestSetup setup(OneParam(std::string("Name = \"n\"\nType = ") + c.type + "\nValue = " + c.value));
    EXPECT_EQ(setup.WrittenKeys("ExtraParams/ExtraParam_1"),
              fmt::format("Name=\"n\" Type={}{}{}", c.type, c.written ? " Value=" : "", c.written ? c.written : ""));
    EXPECT_THAT(setup.Report().entries, SizeIs(c.notes)) << c.type << ' ' << c.value;
    EXPECT_THAT(setup.Report().unread, SizeIs(c.written ? 0 : 1));
  }
}

TEST(ExtraParams, AChangeOfTheKindAndBackLosesNothing) {
  TestSetup setup(OneParam("Type = 1\nValue = 7"));
  auto& item = setup.At<CExtraParamsItemKvf>("ExtraParams/ExtraParam_1");
  for (const auto& [type, written] : {std::pair{0, "0.0"}, {2, "0"}, {3, "\"\""}, {4, "file \"\""}, {1, "7"}}) {
    item.Type = type;
    EXPECT_EQ(setup.Written("ExtraParams/ExtraParam_1:Value"), written);
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

}  // namespace
}  // namespace tervane::extra_params_test
