// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <filesystem>

#include <gmock/gmock.h>

#include "pages/report/png.h"
#include "pages/report/report_pictures.h"
#include "tests/support/command_outcome.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::report_command_test {
namespace {

using test::ReadFile;
using test::Tervane;
using testing::AllOf;
using testing::HasSubstr;
using testing::Not;

const std::string kRhone = TERVANE_SOURCE_DIR "/examples/rhone/rhone.tvd";

class ReportCommand : public testing::Test {
 public:
  std::string Report(std::vector<std::string> arguments) const {
    arguments.insert(arguments.begin(), "report");
    arguments.insert(arguments.end(), {"-o", out, "--force"});
    const test::CommandOutcome outcome = Tervane(arguments);
    EXPECT_EQ(outcome.status, kDone) << outcome.err;
    return ReadFile(out);
  }

  test::TempFolder folder;
  std::string out = folder.File("report.html");
};

TEST_F(ReportCommand, TellsTheRhoneInOnePageThatNeedsNoOtherFile) {
  const std::string page = Report({kRhone, "--dates", "de"});
  EXPECT_THAT(page, AllOf(HasSubstr("<h2 id=\"model\">What is simulated</h2>"), HasSubstr("1. Januar 20"),
                          HasSubstr("<h2 id=\"inputs\">"), HasSubstr("data:image/png;base64,"),
                          HasSubstr("48 more of this kind are not shown."), HasSubstr("It gets no cell of the model")));
  EXPECT_THAT(page, AllOf(Not(HasSubstr("src=\"/")), Not(HasSubstr("href=\"http")), Not(HasSubstr("nan"))));
}

TEST_F(ReportCommand, ValuesThatDifferStandWithUnitAndDefaultAndOthersDoNot) {
  const std::string setup = folder.Write(
      "a.tvd", test::SetupText(14,
                               "section SimSpec {\nsection CompControlParaTimeStep {\nInitialTimeStep = 3.0f\n}\n"
                               "section SimTitle {\nTitle = \"A & B <c>\"\n}\n}"));
  const std::string page = Report({setup, "--sections", "values"});
  EXPECT_THAT(page, AllOf(HasSubstr("<h1>A &amp; B &lt;c&gt;</h1>"), HasSubstr("<td>3 hours</td><td>6 hours</td>"),
                          Not(HasSubstr("<h2 id=\"model\">")), Not(HasSubstr("<c>"))));
}

TEST_F(ReportCommand, NamesOfFilesAreNoDates) {
  const std::string setup =
      folder.Write("a.tvd", test::SetupText(14,
                                            "section Topography {\nType = 1\nsection NDS_2D_DATA_FILE {\n"
                                            "FILE_NAME = file \"dem of 2000-01-31.nds2\"\n}\n}\nsection SimSpec {\n"
                                            "section SimTitle {\nDescription = \"Since 2000-01-31\"\n}\n}"));
  const std::string page = Report({setup, "--sections", "values", "--dates", "de"});
  EXPECT_THAT(page, AllOf(HasSubstr("dem of 2000-01-31.nds2"), HasSubstr("Since 31. Januar 2000")));
}

TEST_F(ReportCommand, SpeaksTheLanguageOfTheClient) {
  const std::string page = Report({kRhone, "--language", "de", "--dates", "de"});
  EXPECT_THAT(page, AllOf(HasSubstr("<html lang=\"de\">"), HasSubstr("Was simuliert wird</h2>"),
                          HasSubstr("<th>Vorgabe</th>"), HasSubstr("1. Januar 2012 bis 31. Dezember 2015 (1460 Tage)"),
                          HasSubstr("Es bekommt keine Zelle des Modells"), HasSubstr("Rhone at Porte du Scex")));
  EXPECT_THAT(page, Not(HasSubstr("What is simulated")));
  EXPECT_EQ(Tervane({"report", kRhone, "-o", folder.File("other.html"), "--language", "tlh"}).err,
            "--language: tlh is none of the languages: en or de\nRun with --help for more information.\n");
}

TEST_F(ReportCommand, RefusesWhatItCannotWriteAndLeavesTheFile) {
  folder.Write("report.html", "mine");
  folder.Write("logo.bmp", "x");
  const struct {
    std::vector<std::string> arguments;
    const char* told;
  } rows[] = {
      {{"report", kRhone, "-o", out}, "report.html"},
      {{"report", kRhone, "-o", folder.File("report.doc")}, "a report is an .html or a .pdf"},
      {{"report", kRhone, "-o", out, "--force", "--sections", "modle"},
       "a report has no section modle; did you mean model?"},
      {{"report", kRhone, "-o", out, "--force", "--dates", "pl"}, "pl is none of iso, en, de and fr"},
      {{"report", kRhone, "-o", out, "--force", "--logo", folder.File("logo.bmp")},
       "a logo is a .png, .jpg, .gif or .svg"},
      {{"report", kRhone, "-o", out, "--force", "--logo", folder.File("none.png")}, "none.png"},
      {{"report", folder.File("none.tvd"), "-o", out, "--force"}, "none.tvd"},
  };
  for (const auto& row : rows) {
    const test::CommandOutcome outcome = Tervane(row.arguments);
    EXPECT_EQ(outcome.status, kCouldNot);
    EXPECT_THAT(outcome.err, HasSubstr(row.told));
    EXPECT_EQ(ReadFile(out), "mine");
  }
}

TEST(Report, DatesAreWrittenInTheStyleOfTheReaderButForThoseOfNames) {
  using Style = ReportDates::Style;
  const struct {
    Style style;
    const char *text, *told;
  } rows[] = {
      {Style::English, "2000-01-31 to 2001-12-01 (669 days)", "31 January 2000 to 1 December 2001 (669 days)"},
      {Style::German, "ends 2000-03-01 06:30.", "ends 1. März 2000, 06:30."},
      {Style::French, "2000/08/01  00:00", "1er août 2000"},
      {Style::Iso, "2000/08/01  12:00", "2000-08-01 12:00"},
      {Style::German, "rain_2000-01-31.csv a/2000-01-31/b 2000-01-31.nds0 12000-01-31",
       "rain_2000-01-31.csv a/2000-01-31/b 2000-01-31.nds0 12000-01-31"},
      {Style::German, "2000-13-31 2000-01", "2000-13-31 2000-01"},
  };
  for (const auto& row : rows) EXPECT_EQ(ReportDates{row.style}.In(row.text), row.told);
}

TEST(Report, ScalesHaveBordersThatPeopleLike) {
  EXPECT_EQ(NiceBorders(372, 4200).front(), 0);
  EXPECT_THAT(NiceBorders(0.013, 0.019, 5),
              testing::Pointwise(testing::DoubleNear(1e-12), {0.012, 0.014, 0.016, 0.018, 0.02}));
  EXPECT_EQ(NiceBorders(3, 3), std::vector<double>{3});
  EXPECT_EQ(NumberAt(0.30000000000000004, 0.1), "0.3");
  EXPECT_EQ(NumberAt(-0.0001, 1), "0");
  EXPECT_EQ(Base64("ab"), "YWI=");
}

TEST(Report, AMapOrChartOfNothingIsNoPicture) {
  EXPECT_FALSE(DrawMap({}));
  EXPECT_FALSE(DrawChart({}));
  SeriesContent one;
  one.series.push_back({"flow", "m³/s", std::vector<CYbDateTime>{{2000, 1, 1}}, std::vector<double>{5}});
  ASSERT_TRUE(DrawChart(one));
  EXPECT_THAT(DrawChart(one)->svg, AllOf(HasSubstr("m³/s"), Not(HasSubstr("nan")), Not(HasSubstr("inf"))));
}

}  // namespace
}  // namespace tervane::report_command_test
