// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/report_pdf.h"

#include <QByteArray>

#include <fmt/format.h>
#include <gmock/gmock.h>

#include "pages/report/report_pictures.h"
#include "tests/support/temp_folder.h"

namespace tervane::report_pdf_test {
namespace {

using test::ReadFile;

Report ReportOf(std::vector<ReportBlock> blocks) {
  Report report;
  report.title = "A & B";
  report.sections.push_back({"values", "Values", std::move(blocks)});
  return report;
}

qsizetype PagesOf(const std::string& pdf) { return QByteArray::fromStdString(pdf).count("/Type /Page\n"); }

TEST(ReportPdf, LongTablesGoOnOverPagesAndPicturesAreWhole) {
  test::TempFolder folder;
  const std::string path = folder.File("a.pdf");
  ASSERT_EQ(WriteReportPdf(path, ReportOf({ReportText{"short"}})).error, "");
  EXPECT_EQ(ReadFile(path).substr(0, 5), "%PDF-");
  EXPECT_EQ(PagesOf(ReadFile(path)), 1);

  ReportTable table{{"Name", "Value"}, {}};
  for (int row = 0; row < 200; ++row) table.rows.push_back({fmt::format("row {}", row), "5"});
  ASSERT_EQ(WriteReportPdf(path, ReportOf({ReportHeading{"All"}, table})).error, "");
  const auto pages = PagesOf(ReadFile(path));
  EXPECT_GT(pages, 2);
  EXPECT_LT(pages, 12);

  // A row that is higher than a page, and a picture that is wider than one, end nevertheless.
  ReportTable high{{"Name"}, {{std::string(20'000, 'x')}, {"behind"}}};
  ReportPicture wide{"wide", "<svg xmlns=\"http://www.w3.org/2000/svg\" width=\"3000\" height=\"900\"/>", 3000, 900};
  ASSERT_EQ(WriteReportPdf(path, ReportOf({high, wide, wide, wide, wide})).error, "");
  EXPECT_LT(PagesOf(ReadFile(path)), 12);
}

TEST(ReportPdf, ALogoThatIsNoPictureLeavesTheOldFile) {
  test::TempFolder folder;
  const std::string path = folder.Write("a.pdf", "mine");
  Report report = ReportOf({ReportText{"short"}});
  report.logo = folder.Write("logo.png", "no picture");
  EXPECT_THAT(WriteReportPdf(path, report).error, testing::HasSubstr("this is no picture that can be read"));
  EXPECT_EQ(ReadFile(path), "mine");
}

}  // namespace
}  // namespace tervane::report_pdf_test
