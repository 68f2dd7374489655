// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "forms/report_file.h"

#include <gmock/gmock.h>

#include "tests/support/temp_folder.h"

namespace tervane::report_file_test {
namespace {

using testing::HasSubstr;
using testing::IsEmpty;

TEST(ReportFile, WhatCannotBeShownIsToldInWords) {
  const test::TempFolder folder;
  const struct {
    const char* what;
    std::string path, message, remark;
    bool mayBeOpened;
  } cases[] = {
      {"none chosen", "", "There is no report yet.", "", false},
      {"missing", folder.File("gone.html"), "There is no file gone.html in " + folder.Path(), "", false},
      {"a folder", folder.Path(), folder.Path(), "", false},
      {"still empty", folder.Write("empty.html", ""), "empty.html is empty", "", true},
      {"too large", folder.Write("large.html", std::string(9'000'000, ' ')), "too large", "", true},
      {"plain", folder.Write("plain.html", "<html><img src=\"a.png\"></html>"), "", "", true},
      {"scripts and drawings", folder.Write("rich.html", "<SCRIPT>1</SCRIPT><svg/><canvas/>"), "",
       "(scripts, drawings are missing)", true},
  };
  for (const auto& c : cases) {
    SCOPED_TRACE(c.what);
    const ReportFile report = ReadReport(c.path);
    EXPECT_THAT(report.message, c.message.empty() ? testing::Matcher<std::string>(IsEmpty()) : HasSubstr(c.message));
    EXPECT_THAT(report.remark, c.remark.empty() ? testing::Matcher<std::string>(IsEmpty()) : HasSubstr(c.remark));
    EXPECT_EQ(report.MayBeOpened(), c.mayBeOpened);
    EXPECT_EQ(report.html.empty(), !c.message.empty());
  }
  EXPECT_EQ(Summary(ReadReport(folder.File("plain.html"))), "plain.html, 30 bytes");
}

}  // namespace
}  // namespace tervane::report_file_test
