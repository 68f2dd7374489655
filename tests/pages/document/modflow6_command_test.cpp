// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "pages/document/modflow6_command.h"

#include <gmock/gmock.h>

#include "platform/files.h"
#include "tests/support/page_driver.h"
#include "tests/support/temp_folder.h"

namespace tervane::modflow6_command_test {
namespace {

using testing::HasSubstr;

/// Gives the answers that a test sets.
class AnsweringHost : public NobodyToAsk {
 public:
  Answer Ask(const std::string& text, Icon /*icon*/, Buttons buttons) override {
    told = text;
    return buttons == Buttons::YesNo ? Answer::Yes : Answer::Ok;
  }
  std::optional<std::string> AskFileToSave(const FileQuestion& /*question*/) override { return file; }
  void OpenBrowser(const std::string& address) override { opened = address; }

  std::optional<std::string> file;
  std::string told, opened;
};

TEST(Modflow6Command, WritesWhatIsShownAndOffersTheAccount) {
  CFlowModelDoc setup;
  ASSERT_TRUE(setup.OnOpenDocument(TERVANE_SOURCE_DIR "/examples/rhone/rhone_modflow.tvd")) << setup.Error();
  const test::TempFolder folder;
  AnsweringHost host;
  ExportToModflow6(setup, host);
  EXPECT_EQ(host.told, "");

  host.file = folder.File("rhone/mfsim.nam");
  ExportToModflow6(setup, host);
  EXPECT_THAT(host.told, HasSubstr("carried over"));
  EXPECT_EQ(host.opened, "file://" + folder.File("rhone/export-report.txt"));
  EXPECT_TRUE(FileExists(*host.file));
  // The files that are there were agreed to be replaced.
  ExportToModflow6(setup, host);
  EXPECT_THAT(host.told, HasSubstr("carried over"));

  CFlowModelDoc unsuited;
  ExportToModflow6(unsuited, host);
  EXPECT_THAT(host.told, HasSubstr("choose a Modflow engine"));
}

}  // namespace
}  // namespace tervane::modflow6_command_test
