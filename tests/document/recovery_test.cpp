// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/recovery.h"

#include <filesystem>

#include <gmock/gmock.h>

#include "document/flow_model_document.h"
#include "platform/os.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::recovery_test {
namespace {

namespace fs = std::filesystem;
using test::ReadFile;
using test::SavedText;
using test::SetupText;
using test::TempFolder;

/// Of this host, and ended before this process began.
RunningProcess Ended() {
  RunningProcess process = RunningProcess::This();
  process.started = "an earlier start";
  return process;
}

class RecoveryTest : public testing::Test {
 public:
  TempFolder folder;
  std::string setup = folder.Write("a.tvd", SetupText(14, ""));
  std::string kept = folder.File("kept");
  RecoveryTest() { fs::create_directory(kept); }

  void Keep(const std::string& path, const std::string& of, const RunningProcess& by,
            const std::string& text = "changed") {
    EXPECT_EQ(WriteAutosave(path, {of, "", by, text}).error, "");
  }
};

TEST_F(RecoveryTest, AnAutosaveIsReadBackAsItWasWritten) {
  const std::string text = "# mine\n# ----\n" + SetupText(14, "");
  for (const char* of : {"", "/data/a # b.tvd", "/d%41/a\n# ----\n.tvd", "/x/# ----", "/Gewässer/ä.tvd"}) {
    const std::string path = folder.File("a.tvd~");
    ASSERT_EQ(WriteAutosave(path, {of, "00ff", Ended(), text}).error, "");
    AutosaveContent content;
    std::string error;
    ASSERT_TRUE(ReadAutosave(path, content, error)) << error;
    EXPECT_EQ(content.setup, of);
    EXPECT_EQ(content.basedOn, "00ff");
    EXPECT_EQ(content.process.started, Ended().started);
    EXPECT_EQ(content.text, text);
    // It may hold what others must not read, and is a setup that can be opened by hand.
    EXPECT_EQ(fs::status(path).permissions(), fs::perms::owner_read | fs::perms::owner_write);
    CFlowModelDoc document;
    EXPECT_TRUE(document.OnOpenDocument(path)) << document.Error();
  }
}

TEST_F(RecoveryTest, OnlyWhatNoFileHoldsAndNoEditorIsWorkingOnIsOffered) {
  CFlowModelDoc document;
  const std::string old = folder.Write("old.tvd", ReadFile(TERVANE_SOURCE_DIR "/examples/old/version_10.tvd"));
  ASSERT_TRUE(document.OnOpenDocument(old));
  RunningProcess elsewhere = Ended();
  elsewhere.host = "gauss.x";
  struct Case {
    const char* what;
    std::string setup;
    RunningProcess by;
    std::string text;
    bool isOffered;
  };
  const Case cases[] = {
      {"changes of an editor that ended", setup, Ended(), "changed", true},
      {"a living editor's", setup, RunningProcess::This(), "changed", false},
      {"the file as it is", setup, Ended(), SetupText(14, ""), false},
      {"the file as a save would write it", old, Ended(), SavedText(document), false},
      {"no setup of its own any more", folder.File("gone.tvd"), Ended(), SavedText(document), true},
      // There the setup's lock, which stays where an editor crashed, tells whether it runs.
      {"another host's", setup, elsewhere, "changed", true},
  };
  for (const Case& c : cases) {
    SCOPED_TRACE(c.what);
    Keep(AutosaveBeside(c.setup), c.setup, c.by, c.text);
    const std::optional<Recovery> found = FindRecovery(c.setup, kept);
    EXPECT_EQ(found.has_value(), c.isOffered);
    EXPECT_EQ(found ? found->setup : c.setup, c.setup);
    // What is offered waits for its user; what may be in use is its editor's.
    EXPECT_EQ(MayReplaceAutosave(AutosaveBeside(c.setup), c.setup),
              !c.isOffered && c.by.started != RunningProcess::This().started);
    fs::remove(AutosaveBeside(c.setup));
  }
  Keep(AutosaveBeside(setup), setup, elsewhere);
  folder.Write(".a.tvd.lock", ProcessLines(elsewhere));
  EXPECT_FALSE(FindRecovery(setup, kept));
}

TEST_F(RecoveryTest, ACopyThatAnotherProgramMadeIsLeftAlone) {
  const std::string path = folder.Write("a.tvd~", "target TERVANE_FLOWMODEL {\n}\n");
  EXPECT_FALSE(FindRecovery(setup, kept));
  EXPECT_FALSE(MayReplaceAutosave(path, setup));
  folder.Write("a.tvd~", "");  // A crash between making and filling it.
  EXPECT_FALSE(FindRecovery(setup, kept));
  EXPECT_TRUE(MayReplaceAutosave(path, setup));
}

TEST_F(RecoveryTest, ALinkInItsPlaceIsNotWrittenThrough) {
  const std::string elsewhere = folder.Write("elsewhere", ""), path = folder.File("a.tvd~");
  std::filesystem::create_symlink(elsewhere, path);
  EXPECT_FALSE(MayReplaceAutosave(path, setup));
  EXPECT_THAT(WriteAutosave(path, {setup, "", RunningProcess::This(), "text"}).error,
              testing::HasSubstr("it is a symbolic link"));
  EXPECT_EQ(test::ReadFile(elsewhere), "");
}

TEST_F(RecoveryTest, TheFolderIsSearchedAndTheNewestComesFirst) {
  EXPECT_TRUE(FindRecoveries(folder.File("missing")).empty());
  const std::string names[] = {NewAutosaveName("", kept), NewAutosaveName(setup, kept), AutosaveBeside(setup)};
  const std::string setups[] = {"", setup, setup};
  for (int i = 0; i < 3; ++i) {
    Keep(names[i], setups[i], Ended());
    fs::last_write_time(names[i], fs::file_time_type::clock::now() - std::chrono::hours(3 - i));
  }
  const std::string second = NewAutosaveName("", kept);
  Keep(second, "", RunningProcess::This());
  CFlowModelDoc untouched;
  Keep(NewAutosaveName("", kept), "", Ended(), SavedText(untouched));
  folder.Write("kept/notes.tvd~", "mine");

  std::vector<Recovery> found = FindRecoveries(kept);
  ASSERT_EQ(found.size(), 2u);
  EXPECT_EQ(found[0].autosave, names[1]);
  EXPECT_EQ(found[0].setup, setup);
  EXPECT_EQ(found[1].autosave, names[0]);
  EXPECT_NEAR(std::chrono::duration<double>(found[0].time - found[1].time).count(), 3600, 60);

  std::string error;
  ASSERT_EQ(FindRecovery(setup, kept)->autosave, names[2]);
  EXPECT_TRUE(DiscardRecovery(*FindRecovery(setup, kept), error)) << error;
  EXPECT_EQ(FindRecovery(setup, kept)->autosave, names[1]);
}

}  // namespace
}  // namespace tervane::recovery_test
