// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "core/kvf_parser.h"

#include <algorithm>
#include <vector>

#include <gmock/gmock.h>

#include "core/kvf_writer.h"
#include "tests/core/parsed.h"
#include "tests/support/split_at_arrow.h"

namespace tervane::kvf_parser_test {
namespace {

using test::Parsed;
using test::SplitAtArrow;
using testing::HasSubstr;
using testing::StartsWith;

std::string Repeated(std::string_view text, std::size_t times) {
  std::string result;
  while (times-- > 0) result += text;
  return result;
}

/// A file with that text as the values of the keyword `k`.
std::string WithValues(std::string_view values) { return "target T {\nk = " + std::string(values) + "\n}"; }

TEST(KvfParser, AValueHasItsTypeByItsForm) {
  struct Case {
    KvfType type;
    std::vector<const char*> forms;  // Behind `=>` as it is written.
  };
  const Case cases[] = {
      {KvfType::Int, {"12", "-12", "-0 => 0", "007 => 7", "2147483647", "-2147483648"}},
      {KvfType::Double,
       {"2.0", "2. => 2.0", ".5 => 0.5", "-.5e1 => -5.0", "1e9", "1E+5 => 100000.0", "1.e-05 => 1e-5", "-0.0",
        "0e9999 => 0.0", "5e-324", "9007199254740993.0 => 9007199254740992.0", "1.7976931348623157e308", "inf", "-inf",
        "nan", "-nan => nan"}},
      {KvfType::Float, {"6f", "6.25f", "-1e-35f", "-0f", "1e-45f", "3.4028235e38f", "inff", "-inff", "nanf"}},
      {KvfType::Bool, {"true", "false"}},
      {KvfType::String, {R"("")", R"("a # { } = , 'b'")", R"("a \"b\"\\ \n\r\t\u{1}\u{7f} ä€")"}},
      {KvfType::Filename, {R"(file "")", "file\t\"x\" => file \"x\"", R"(file"C:\\x" => file "C:\\x")"}},
  };
  for (const Case& c : cases) {
    for (const char* form : c.forms) {
      const auto [source, written] = SplitAtArrow(form);
      const Parsed parsed(WithValues(source));
      ASSERT_EQ(parsed.Message(), "") << form;
      const KvfParam* param = kvfParamByNum(kvfKeywordByNum(parsed.Target(), 1), 1);
      ASSERT_TRUE(param) << form;
      EXPECT_EQ(param->type, c.type) << form;
      EXPECT_EQ(KvfValueText(*param), written.empty() ? source : written);
    }
  }
}

TEST(KvfParser, ATextIsReadWithItsEscapes) {
  const std::pair<const char*, std::string> cases[] = {
      {R"(plain ä)", "plain ä"},
      {R"(\"\\\n\r\t)", "\"\\\n\r\t"},
      {R"(\u{41}\u{e4}\u{20AC}\u{1F30A}\u{10FFFF})", "Aä€\U0001F30A\U0010FFFF"},
      {R"(\u{1}\u{7f}\u{0000005A})", "\x01\x7FZ"},
      {R"(C:\\maps\\new\\)", "C:\\maps\\new\\"}};
  for (const auto& [source, expected] : cases) {
    const Parsed parsed(WithValues("\"" + std::string(source) + "\""));
    std::string text;
    ASSERT_EQ(parsed.Message(), "") << source;
    EXPECT_TRUE(kvfGetParam(parsed.Target(), "k", &text, 1, 1));
    EXPECT_EQ(text, expected);
  }
}

TEST(KvfParser, TheLayoutIsFree) {
  const std::pair<std::string, std::string> cases[] = {
      {"target T {}", "target T {\n}\n"},
      {"\n\n\ttarget\tT\n\n{\r\n}  ", "target T {\n}\n"},
      {"target T{a=1\n}target T{}", "target T {\n  a = 1\n}\ntarget T {\n}\n"},
      {"target T {\r\na = 1\nb = 2\r\n}\r\n", "target T {\n  a = 1\n  b = 2\n}\n"},
      {"\xEF\xBB\xBFtarget T {}", "target T {\n}\n"},
      {"# one\n  # zwei ä\n\ntarget T {} # behind", "# one\n  # zwei ä\ntarget T {\n}\n"},
      {"target T # 1\n{ # 2\na = 1 # 3\nb = # 4\n} # 5", "target T {\n  a = 1\n  b =\n}\n"},
      {"target T {\na = 1, # why\n\n # more\n  2,3\n}", "target T {\n  a = 1, 2, 3\n}\n"},
      {"target T {\na =\nb =\t\r\n}", "target T {\n  a =\n  b =\n}\n"},
      {"target T { section A { section B {} section B {} } a = 1\n}",
       "target T {\n  section A {\n    section B {\n    }\n    section B {\n    }\n  }\n  a = 1\n}\n"},
      {"target target {\nsection = 1\ntarget = 2\nsection section {}\nsection target {}\n}",
       "target target {\n  section = 1\n  target = 2\n  section section {\n  }\n  section target {\n  }\n}\n"},
      {"target T {\n\"section\" = 1\n\"a\" = 2\n_.%-9 = 3\n}", "target T {\n  section = 1\n  a = 2\n  _.%-9 = 3\n}\n"},
      {"target \" T T \" {\n\"  k \" = 1\nsection \"ä\\\"\" {}\n}",
       "target \" T T \" {\n  \"  k \" = 1\n  section \"ä\\\"\" {\n  }\n}\n"},
      {"target T {\n\"%x\" = 1\n\"1x\" = 1\n\"a b\" = 1\n\"\\tk\" = 1\n}",
       "target T {\n  \"%x\" = 1\n  \"1x\" = 1\n  \"a b\" = 1\n  \"\\tk\" = 1\n}\n"},
  };
  for (const auto& [source, written] : cases) {
    const Parsed parsed(source);
    EXPECT_EQ(parsed.Message(), "") << source;
    EXPECT_EQ(parsed.Written(), written);
  }
}

/// Expects each text to be refused in these words at the place of the `^` in it; `@` stands for a NUL byte.
void ExpectRefused(const std::string& words, const std::vector<std::string>& texts) {
  for (std::string text : texts) {
    const std::size_t place = text.find('^');
    text.erase(place, 1);
    std::replace(text.begin(), text.end(), '@', '\0');
    const Parsed parsed(text);
    EXPECT_FALSE(parsed.Ok()) << text;
    const std::string_view before = std::string_view(text).substr(0, place);
    const auto line = 1 + std::count(before.begin(), before.end(), '\n');
    std::string_view inLine = before.substr(before.rfind('\n') + 1);
    if (inLine.starts_with("\xEF\xBB\xBF") && line == 1) inLine.remove_prefix(3);
    const auto column = 1 + std::count_if(inLine.begin(), inLine.end(), [](char c) { return (c & 0xC0) != 0x80; });
    const KvfSyntaxError& error = parsed.File()->syntaxError;
    EXPECT_EQ(error.line, line) << text;
    EXPECT_EQ(error.column, column) << text;
    EXPECT_THAT(error.message, StartsWith(std::to_string(line) + ":" + std::to_string(column) + ": ")) << text;
    EXPECT_THAT(error.message, HasSubstr(words)) << text;
  }
}

void ExpectValuesRefused(const std::string& words, const std::vector<std::string>& values) {
  std::vector<std::string> texts;
  for (const std::string& value : values) texts.push_back(WithValues(value));
  ExpectRefused(words, texts);
}

TEST(KvfParser, WhatIsNoParameterFileIsRefusedWithItsPlace) {
  ExpectRefused("the file is empty: target NAME { was expected", {"^", "# a comment\n^", " \n\t^"});
  ExpectRefused(": target NAME { was expected",
                {"^a = 1\n", "^{", "^targets T {}", "^=", "target T {}\n^x", "^ä", "^\"T\" {}", "^12"});
  ExpectRefused("the name of the target was expected", {"target ^{}", "target^\nT {}", "target ^1T {}", "target^"});
  ExpectRefused("{ was expected behind the name T", {"target T\n  ^x", "target T^", "target T ^= 1"});
  ExpectRefused("a name was expected between the quotes", {"target ^\"\" {}", "target T {\n^\" \\t\" = 1\n}"});
  ExpectRefused("at most 255 blanks around it", {"target ^\"" + std::string(256, ' ') + "T\" {}"});
  ExpectRefused("a } without its {", {"^}", "target T {}\n^}"});
  ExpectRefused("the file ends here: the } that ends T was expected",
                {"target T {^", "target T {\n section S {\n}\n^"});
  ExpectRefused("the } that ends S was expected before a target", {"target T {\nsection S {\n^target U {\n}\n}\n}"});
  ExpectRefused("the name of the section was expected", {"target T {\nsection ^{\n}\n}", "target T { section ^1 {} }"});
  ExpectRefused("{ was expected behind the name S",
                {"target T {\nsection S\n^= 1\n}", "target T { section S ^section"});
  ExpectRefused("section NAME {, NAME = or } was expected",
                {"target T {\n^{\n}", "target T {\n^1 = 2\n}", "target T {\n^ä = 1\n}", "target T {\n^\xEF\xBB\xBF}"});
  ExpectRefused("= was expected behind the name name",
                {"target T {\nname ^1\n}", "target T {\nname^\n= 1\n}", "target T {\n\"name\" ^{\n}"});
  // Bytes that are no text.
  ExpectRefused("the file is UTF-16 text: UTF-8 was expected; save it as UTF-8", {"^\xFF\xFEt@", "^\xFE\xFF@t"});
  ExpectRefused("a NUL byte: the file is no text or damaged",
                {WithValues("1^@"), WithValues("\"x^@y\""), WithValues("^@"), "# x^@\ntarget T {}", "target T {\n^@}",
                 "^@target T {}", "target T {}^@"});
  ExpectRefused("this byte is no UTF-8 text; save the file as UTF-8",
                {WithValues("\"ä^\xE4\""), WithValues("^\xE4"), WithValues("1 # ^\xC3"), "# ä ^\xE4\ntarget T {}",
                 "target T {\n\"^\xE4\" = 1\n}", "target T {\n^\xE4 = 1\n}", "target T {}\n^\xE4"});
  ExpectRefused("a control character (\\x0D) is not allowed",
                {"target T {^\ra = 1\n}", WithValues("1^\rb = 2"), WithValues("^\r1"), "# x^\ry\ntarget T {}"});
  ExpectRefused("a control character (\\x09)", {WithValues("\"x^\ty\"")});
  ExpectRefused("a control character (\\x7F)", {WithValues("\"x^\x7Fy\""), "# ^\x7F", "target T { ^\x7F }"});
  ExpectRefused("# ä\\x1By: a control character (\\x1B)", {"# ä^\x1By\ntarget T {}", "\xEF\xBB\xBF# ä^\x1By"});
}

TEST(KvfParser, WhatIsNoValueIsRefusedWithItsPlace) {
  ExpectValuesRefused("a value was expected: a number, true, false, \"text\" or file \"name\"",
                      {"^, 1", "1,^, 1", "^True", "^truely", "^true\"x\"", "^inf7", "^x", "^ä", "1.5f,^x", "^{"});
  ExpectValuesRefused("a value was expected behind the comma", {"1,\n^}", "1, # why\n^}"});
  ExpectValuesRefused("a comma or the end of the line was expected", {"1 ^2", "1 ^}", "\"x\"^\"y\"", "true, 1f ^x"});
  ExpectValuesRefused("a file name in double quotes was expected behind file", {"file ^x", "file^", "file^, 1"});
  ExpectValuesRefused("a number was expected", {"^12x", "^1}", "^+1", "^-", "^.", "^-infinity", "^0x10", "^1.2.3",
                                                "^1ff", "^1'000", "1, ^1_0", "^-nanx", "^.e1"});
  ExpectValuesRefused("k = 12x: a number was expected", {"^12x"});
  ExpectValuesRefused("a number was expected: its exponent is missing", {"^1e", "^1e+f", "^1.5E-"});
  ExpectValuesRefused("a whole number from -2147483648 to 2147483647 was expected",
                      {"^2147483648", "^-2147483649", "^18446744073709551617", "^99999999999999999999999"});
  ExpectValuesRefused("a number that fits a double was expected", {"^1e309", "^-1e309", "^1e-400"});
  ExpectValuesRefused("a number that fits a float was expected", {"^3.5e38f", "^1e-60f"});
  ExpectValuesRefused("the closing \" of a text was expected on the same line",
                      {"^\"abc", "^\"abc\\\"", "^\"abc\\", "^\"abc\r\n\"", "1, ^\"\\\\\\\""});
  ExpectValuesRefused("an unknown escape: \\\" \\\\ \\n \\r \\t or \\u{hex} was expected",
                      {"\"ä^\\x\"", "\"^\\u41\"", "\"^\\u{}\"", "\"^\\u{41\"", "\"^\\u{-1}\"", "\"^\\u{000000041}\""});
  ExpectValuesRefused("\\u{...} with the number of a character (not 0) was expected",
                      {"\"^\\u{0}\"", "\"^\\u{D800}\"", "\"^\\u{dfff}\"", "\"^\\u{110000}\""});
}

TEST(KvfParser, AMessageShowsTheLineAroundTheFault) {
  const Parsed parsed("target T {\na = \"" + Repeated("ä", 200) + "\", xy, \"" + Repeated("ö", 200) + "\"\n}");
  EXPECT_THAT(parsed.Message(),
              StartsWith("2:209: ..." + Repeated("ä", 28) + "\", xy, \"" + Repeated("ö", 8) + "...: "));
}

TEST(KvfParser, AFileThatIsCutAnywhereIsRefused) {
  const std::string whole =
      "# \xC3\xA4\ntarget T {\r\n  a = -1, 2.5, 1e9f, true, \"x\\\"\\u{e4}\", file \"y\" # c\n  e =\n"
      "  section \"S \xC3\xB6\" {\n    b = 1,\n      inf\n  }\n}\n\n";
  const std::size_t end = whole.rfind('}') + 1;
  for (std::size_t size = 0; size <= whole.size(); ++size)
    EXPECT_EQ(Parsed(whole.substr(0, size)).Ok(), size >= end) << whole.substr(0, size);
}

TEST(KvfParser, SectionsNestUpToTheLimit) {
  const auto nested = [](std::size_t levels) {
    return "target T {" + Repeated("section S {", levels - 1) + Repeated("}", levels);
  };
  EXPECT_EQ(Parsed(nested(200)).Message(), "");
  for (const std::size_t levels : {201, 100'000})
    EXPECT_THAT(Parsed(nested(levels)).Message(), HasSubstr("sections nested deeper than 200 are not read"));
}

TEST(KvfParser, LargePartsAreReadInOneStep) {
  const std::string large(1'000'000, 'c');
  const Parsed parsed("# " + large + "\ntarget T {\n" + large + " = \"" + large + "\" # " + large + "\n}");
  ASSERT_EQ(parsed.Message(), "");
  EXPECT_EQ(parsed.File()->header.size(), large.size() + 3);
  std::string text;
  EXPECT_TRUE(kvfGetParam(parsed.Target(), large, &text, 1, 1));
  EXPECT_EQ(text, large);
}

TEST(KvfParser, ManyTextsWithEscapesInOneKeywordTakeMemoryInProportion) {
  constexpr std::size_t count = 100'000;  // with a place of its own for each growth this would take 80 GB
  const Parsed parsed("target T {\nk = 0" + Repeated(", \"\\n\"", count) + "\n}");
  ASSERT_EQ(parsed.Message(), "");
  const KvfNode* keyword = kvfKeywordByNameNum(parsed.Target(), "k", 1);
  ASSERT_EQ(keyword->count, count + 1);
  EXPECT_EQ(keyword->params[0].asInt, 0);
  for (std::size_t i = 1; i <= count; ++i) ASSERT_EQ(keyword->params[i].Text(), "\n") << i;
}

}  // namespace
}  // namespace tervane::kvf_parser_test
