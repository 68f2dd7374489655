// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/edit_session.h"

#include <csignal>
#include <filesystem>

#include <gmock/gmock.h>
#include <sys/resource.h>
#include <unistd.h>

#include "platform/os.h"
#include "simspec/periods.h"
#include "simspec/titles.h"
#include "tests/support/setup.h"
#include "tests/support/temp_folder.h"

namespace tervane::edit_session_test {
namespace {

namespace fs = std::filesystem;
using test::ReadFile;
using test::SetupText;
using test::TempFolder;
using test::ValueOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using Session = std::unique_ptr<EditSession>;
using OnDisk = EditSession::OnDisk;

constexpr const char* kTitle = "SimSpec/SimTitle:Title";

class EditSessionTest : public testing::Test {
 public:
  TempFolder folder;
  std::string path = folder.Write("a.tvd", SetupText(14, ""));
  std::string kept = folder.File("kept");
  std::string error;

  Session Open(const std::string& of) {
    Session session = EditSession::Open(of, kept, error);
    EXPECT_TRUE(session) << error;
    return session;
  }
  Session Open() { return Open(path); }
  Session Recovered(const Recovery& recovery) {
    Session session = EditSession::Recover(recovery, kept, error);
    EXPECT_TRUE(session) << error;
    return session;
  }

  static void SetTitle(EditSession& session, const std::string& title) {
    auto& node =
        dynamic_cast<CSimTitleKvf&>(*FindNode(session.Document().Root(), ParseSetupPath("SimSpec/SimTitle").steps));
    node.Title = title;
    session.UpdateDoc(node, 1, "Change Title");
  }
  static std::string TitleOf(const EditSession& session) { return ValueOf(session.Document(), kTitle); }

  static void KeepTitle(EditSession& session, const std::string& title) {
    SetTitle(session, title);
    EXPECT_EQ(session.Autosave(), "");
  }

  /// Does something with a session in another process, which is killed before any destructor runs.
  template <class Work>
  static void Crash(Work work) {
    const auto die = [&] {
      const Session session = work();
      if (HasFailure()) _exit(1);
      raise(SIGKILL);
    };
    EXPECT_EXIT(die(), testing::KilledBySignal(SIGKILL), "");
  }
  std::vector<std::string> Names(const std::string& below = ".") const {
    std::vector<std::string> names;
    for (const fs::directory_entry& entry : fs::directory_iterator(folder.File(below)))
      if (!entry.is_directory()) names.push_back(entry.path().filename());
    std::sort(names.begin(), names.end());
    return names;
  }
};

TEST_F(EditSessionTest, OpensEveryOldVersionTellsWhatASaveChangesAndKeepsTheOriginal) {
  int count = 0;
  for (const auto& entry : fs::directory_iterator(TERVANE_SOURCE_DIR "/examples/old")) {
    if (entry.path().extension() != ".tvd") continue;
    SCOPED_TRACE(entry.path());
    ++count;
    const std::string content = ReadFile(entry.path());
    folder.Write("a.tvd", content);
    Session session = Open();
    EXPECT_FALSE(session->IsModified());
    std::vector<std::string> places;
    for (const SetupDifference& difference : session->WhatWillBeSaved(error))
      places.push_back(difference.path + ":" + difference.key + " " + difference.to);
    EXPECT_THAT(places, testing::Contains(testing::StartsWith("FlowModelDocVersion:")));
    ASSERT_TRUE(session->Save()) << session->Error();
    EXPECT_THAT(session->Document().SaveNotes(), ElementsAre(HasSubstr("kept as")));
    EXPECT_THAT(session->WhatWillBeSaved(error), IsEmpty());
    const std::string copy = session->Document().SaveNotes()[0];
    EXPECT_EQ(ReadFile(copy.substr(copy.find('/'))), content);
    session.reset();
    fs::remove(copy.substr(copy.find('/')));
  }
  EXPECT_GE(count, 6);
}

TEST_F(EditSessionTest, AnOriginalThatWasSavedElsewhereIsStillKeptWhenItIsOverwritten) {
  folder.Write("a.tvd", SetupText(9, ""));
  Session session = Open();
  ASSERT_TRUE(session->SaveAs(folder.File("b.tvd")));
  ASSERT_TRUE(session->Save());
  EXPECT_THAT(Names(), ElementsAre(".b.tvd.lock", "a.tvd", "b.tvd"));
  ASSERT_TRUE(session->SaveAs(path));
  EXPECT_EQ(ReadFile(folder.File("a.v9.tvd")), SetupText(9, ""));
  // Where it is gone there is nothing to keep, and nothing in the way of a save.
  folder.Write("c.tvd", SetupText(9, ""));
  session = Open(folder.File("c.tvd"));
  fs::remove(folder.File("c.tvd"));
  EXPECT_TRUE(session->Save()) << session->Error();
}

TEST_F(EditSessionTest, ChangesAreUndoneAndViewsAreTold) {
  Session session = Open();
  std::vector<int> hints;
  session->Listen([&](int hint) { hints.push_back(hint); });
  SetTitle(*session, "Karup");
  EXPECT_TRUE(session->IsModified());
  EXPECT_EQ(session->Steps().UndoName(), "Change Title");
  EXPECT_TRUE(session->Undo());
  EXPECT_FALSE(session->IsModified());
  EXPECT_EQ(TitleOf(*session), "");
  EXPECT_TRUE(session->Redo());
  EXPECT_FALSE(session->Redo());
  EXPECT_EQ(TitleOf(*session), "Karup");
  EXPECT_THAT(hints, ElementsAre(1, 31, 31));
  ASSERT_TRUE(session->Save());
  EXPECT_FALSE(session->IsModified());
  EXPECT_TRUE(session->Undo());
  EXPECT_TRUE(session->IsModified());

  // What undo does not know of.
  ASSERT_TRUE(session->Save());
  session->Document().UseCustomResultFolder = true;
  session->UpdateDoc(session->Document().Root(), 64, "Result folder");
  EXPECT_TRUE(session->IsModified());
  const std::vector<SetupDifference> differences = session->WhatWillBeSaved(error);
  EXPECT_THAT(differences, Not(IsEmpty()));
  ASSERT_TRUE(session->Save());
  EXPECT_FALSE(session->IsModified());
  EXPECT_THAT(Session(Open(path))->Document().UseCustomResultFolder, true);
}

TEST_F(EditSessionTest, OnlyWhatASaveWouldChangeInTheFileIsToBeSaved) {
  Session session = Open();
  const auto refresh = [&] { session->UpdateDoc(session->Document().Root(), 64, "Refresh"); };
  refresh();
  EXPECT_TRUE(session->IsModified());
  EXPECT_FALSE(session->HasChangesToSave());
  SetTitle(*session, "Karup");
  EXPECT_TRUE(session->HasChangesToSave());
  SetTitle(*session, "");  // as it was, by a step of its own
  EXPECT_TRUE(session->IsModified());
  EXPECT_FALSE(session->HasChangesToSave());
  SetTitle(*session, "Karup");
  ASSERT_TRUE(session->Save());
  session->Undo();
  EXPECT_TRUE(session->HasChangesToSave());
  // Nothing may be lost where the file cannot be looked at.
  session->Redo();
  refresh();
  EXPECT_FALSE(session->HasChangesToSave());
  folder.Write("a.tvd", "no setup {");
  EXPECT_TRUE(session->HasChangesToSave());
  std::filesystem::remove(path);
  EXPECT_TRUE(session->HasChangesToSave());

  Session fresh = EditSession::New(kept);
  fresh->UpdateDoc(fresh->Document().Root(), 64, "Refresh");
  EXPECT_FALSE(fresh->HasChangesToSave());
  SetTitle(*fresh, "Karup");
  EXPECT_TRUE(fresh->HasChangesToSave());
}

TEST_F(EditSessionTest, FindingsFollowChangesOfTheNodeOrOfAllWhereThatWasAskedFor) {
  folder.Write("a.tvd", ReadFile(TERVANE_SOURCE_DIR "/examples/water_quality.tvd"));
  Session session = Open();
  CGlobal& root = session->Document().Global();
  // The water quality begins before the water movement.
  CYbSEKvfBase& dates = *FindNode(root, ParseSetupPath("ModelCompWQ/SimulationPeriodWQ").steps);
  EXPECT_THAT(dates.Findings(), Not(IsEmpty()));
  auto& period = *root.Important(kSimulationPeriod);
  period.SIMSTART = CYbDateTime{1990, 1, 1};
  session->UpdateDoc(period, 1, "Change Start Date");
  EXPECT_THAT(dates.Findings(), Not(IsEmpty()));
  period.SetRevalidateAll();
  SetTitle(*session, "x");
  EXPECT_THAT(dates.Findings(), IsEmpty());
  session->Undo();
  session->Undo();
  EXPECT_THAT(dates.Findings(), Not(IsEmpty()));
}

TEST_F(EditSessionTest, ASecondWindowOnASetupIsReadOnlyUntilItSavesElsewhere) {
  const std::string other = folder.Write("b.tvd", SetupText(14, ""));
  Session first = Open(), second = Open(), third = Open(other);
  EXPECT_FALSE(first->IsReadOnly());
  ASSERT_TRUE(second->IsReadOnly());
  SetTitle(*second, "second");
  const std::string before = ReadFile(path);
  EXPECT_FALSE(second->Save());
  EXPECT_THAT(second->Error(), HasSubstr("another window"));
  EXPECT_FALSE(second->SaveAs(other));
  EXPECT_THAT(second->Error(), HasSubstr("b.tvd is not written: it is open"));
  EXPECT_FALSE(second->SaveAs(folder.File("missing/c.tvd")));
  EXPECT_TRUE(second->IsModified());
  EXPECT_EQ(ReadFile(path), before);
  // Its autosave is not in the way of the first one's.
  EXPECT_EQ(second->Autosave(), "");
  EXPECT_EQ(Names("kept").size(), 1u);

  ASSERT_TRUE(second->SaveAs(folder.File("c.tvd"))) << second->Error();
  EXPECT_FALSE(second->IsReadOnly());
  EXPECT_THAT(Names("kept"), IsEmpty());
  EXPECT_THAT(Names(), ElementsAre(".a.tvd.lock", ".b.tvd.lock", ".c.tvd.lock", "a.tvd", "b.tvd", "c.tvd"));
  // Saving elsewhere gives the old place free.
  ASSERT_TRUE(first->SaveAs(folder.File("d.tvd")));
  EXPECT_FALSE(Open()->IsReadOnly());
}

TEST_F(EditSessionTest, ANewSetupIsSavedUnderAName) {
  Session session = EditSession::New(kept);
  EXPECT_FALSE(session->IsModified());
  EXPECT_THAT(session->WhatWillBeSaved(error), IsEmpty());
  SetTitle(*session, "new");
  ASSERT_EQ(session->WhatWillBeSaved(error).size(), 1u);
  EXPECT_EQ(session->CheckDisk(), OnDisk::AsKnown);
  EXPECT_FALSE(session->Save());
  EXPECT_THAT(session->Error(), HasSubstr("choose a name"));
  ASSERT_TRUE(session->SaveAs(folder.File("new.tvd"))) << session->Error();
  EXPECT_TRUE(session->Save());
  EXPECT_EQ(TitleOf(*Open(folder.File("new.tvd"))), "new");
}

TEST_F(EditSessionTest, WhatCannotBeReadIsNotOpened) {
  folder.Write("b.tvd", "target {");
  for (const char* name : {"b.tvd", "missing.tvd", "."}) {
    EXPECT_FALSE(EditSession::Open(folder.File(name), kept, error));
    EXPECT_THAT(error, HasSubstr(folder.Path()));
  }
  EXPECT_THAT(Names(), ElementsAre("a.tvd", "b.tvd"));
}

TEST_F(EditSessionTest, AChangeOnDiskIsSeenByItsContentAndNotOverwrittenUnasked) {
  Session session = Open();
  SetTitle(*session, "mine");
  const auto touch = [&](const std::string& content) {
    folder.Write("a.tvd", content);
    fs::last_write_time(path, fs::last_write_time(path) + std::chrono::hours(1));
  };
  EXPECT_EQ(session->CheckDisk(), OnDisk::AsKnown);
  touch(SetupText(14, ""));
  EXPECT_EQ(session->CheckDisk(), OnDisk::AsKnown);
  touch(SetupText(14, "# theirs"));
  EXPECT_EQ(session->CheckDisk(), OnDisk::Changed);
  EXPECT_FALSE(session->Save());
  EXPECT_THAT(session->Error(), HasSubstr("another program has changed it"));
  EXPECT_EQ(ReadFile(path), SetupText(14, "# theirs"));
  session->AcceptDisk();
  EXPECT_EQ(session->CheckDisk(), OnDisk::AsKnown);
  ASSERT_TRUE(session->Save());
  EXPECT_EQ(session->CheckDisk(), OnDisk::AsKnown);
  fs::remove(path);
  EXPECT_EQ(session->CheckDisk(), OnDisk::Gone);
  session->AcceptDisk();
  EXPECT_EQ(session->CheckDisk(), OnDisk::AsKnown);
  touch("theirs");
  EXPECT_EQ(session->CheckDisk(), OnDisk::Changed);
  fs::remove(path);
  EXPECT_TRUE(session->Save());
  EXPECT_TRUE(FileExists(path));
}

TEST_F(EditSessionTest, AutosavesOnlyWhatWasChangedAndRemovesItAfterASaveAndAtTheEnd) {
  Session session = Open();
  EXPECT_FALSE(session->NeedsAutosave());
  SetTitle(*session, "one");
  EXPECT_TRUE(session->NeedsAutosave());
  EXPECT_EQ(session->Autosave(), "");
  EXPECT_FALSE(session->NeedsAutosave());
  EXPECT_THAT(ReadFile(path + "~"), HasSubstr("\"one\""));
  EXPECT_FALSE(FindRecovery(path, kept)) << "of a living editor";
  session->Undo();
  EXPECT_TRUE(session->NeedsAutosave());
  EXPECT_EQ(session->Autosave(), "");
  EXPECT_FALSE(FileExists(path + "~"));
  for (const bool isSaved : {true, false}) {
    SetTitle(*session, isSaved ? "two" : "three");
    EXPECT_EQ(session->Autosave(), "");
    EXPECT_TRUE(FileExists(path + "~"));
    if (isSaved)
      EXPECT_TRUE(session->Save());
    else
      session.reset();
    EXPECT_FALSE(FileExists(path + "~"));
  }
  EXPECT_THAT(Names(), ElementsAre("a.tvd"));
}

TEST_F(EditSessionTest, AnAutosaveGivesWayToWhatStandsInItsPlace) {
  fs::create_directory(path + "~");
  const std::string other = folder.Write("b.tvd", SetupText(14, ""));
  folder.Write("b.tvd~", "a copy of another program");
  for (const std::string& of : {path, other}) {
    Session session = Open(of);
    SetTitle(*session, "one");
    EXPECT_EQ(session->Autosave(), "");
    SetTitle(*session, "two");
    EXPECT_EQ(session->Autosave(), "");
    ASSERT_EQ(Names("kept").size(), 1u);
    EXPECT_THAT(ReadFile(kept + "/" + Names("kept")[0]), HasSubstr("\"two\""));
    session.reset();
    EXPECT_THAT(Names("kept"), IsEmpty());
  }
  EXPECT_EQ(ReadFile(folder.File("b.tvd~")), "a copy of another program");
}

TEST_F(EditSessionTest, AFullDiskLeavesTheOlderAutosaveAndIsToldOnce) {
  Crash([&] {
    os::PrepareProcess();
    Session session = Open();
    KeepTitle(*session, "older");
    const rlimit limit{4096, 4096};
    setrlimit(RLIMIT_FSIZE, &limit);
    for (int i = 0; i < 2; ++i) {
      SetTitle(*session, std::string(100'000, 'x') + std::to_string(i));
      const std::string told = session->Autosave();
      EXPECT_EQ(told.find("cannot be kept") != std::string::npos, i == 0) << told;
      EXPECT_TRUE(session->NeedsAutosave());
    }
    EXPECT_FALSE(session->Save());
    EXPECT_TRUE(session->IsModified());
    return session;
  });
  EXPECT_EQ(ReadFile(path), SetupText(14, ""));
  EXPECT_EQ(TitleOf(*Recovered(*FindRecovery(path, kept))), "older");
}

TEST_F(EditSessionTest, ChangesOfAKilledEditorAreRecoveredAndTheirOldFileIsKept) {
  const std::string content = "# mine\n" + SetupText(10, "");
  folder.Write("a.tvd", content);
  Crash([&] {
    Session session = Open();
    KeepTitle(*session, "lost");
    return session;
  });
  const std::optional<Recovery> recovery = FindRecovery(path, kept);
  ASSERT_TRUE(recovery);
  Session session = Recovered(*recovery);
  EXPECT_EQ(TitleOf(*session), "lost");
  EXPECT_EQ(session->Path(), path);
  EXPECT_FALSE(session->IsReadOnly()) << session->ReadOnlyReason();
  EXPECT_TRUE(session->IsModified());
  EXPECT_EQ(session->CheckDisk(), OnDisk::AsKnown);
  // Nobody else gets it, and a second crash does not lose it.
  EXPECT_FALSE(FindRecovery(path, kept));
  EXPECT_FALSE(EditSession::Recover(*recovery, kept, error));
  EXPECT_TRUE(FileExists(recovery->autosave));
  ASSERT_TRUE(session->Save()) << session->Error();
  EXPECT_FALSE(session->IsModified());
  EXPECT_THAT(ReadFile(path), testing::AllOf(testing::StartsWith("# mine\ntarget"), HasSubstr("\"lost\"")));
  EXPECT_EQ(ReadFile(folder.File("a.v10.tvd")), content);
  session.reset();
  EXPECT_THAT(Names(), ElementsAre("a.tvd", "a.v10.tvd"));
}

TEST_F(EditSessionTest, ARecoveredSetupTellsThatItsFileChangedSince) {
  Crash([&] {
    Session session = Open();
    KeepTitle(*session, "mine");
    return session;
  });
  folder.Write("a.tvd", SetupText(14, "section SimSpec {\nModelType = 1\n}"));
  Session session = Recovered(*FindRecovery(path, kept));
  EXPECT_EQ(session->CheckDisk(), OnDisk::Changed);
  EXPECT_FALSE(session->Save());
}

TEST_F(EditSessionTest, ChangesThatNoFileStandsForAreRecoveredAsANewSetup) {
  Crash([&] {
    Session session = EditSession::New(kept);
    KeepTitle(*session, "untitled");
    return session;
  });
  fs::create_directory(folder.File("b"));
  const std::string gone = folder.Write("b/gone.tvd", "# mine\n" + SetupText(14, R"(section SimSpec {
    section SimulationPeriod {
      HotStartResultFile = file "results/run.tvdres"
    }
  })"));
  Crash([&] {
    Session session = Open(gone);
    KeepTitle(*session, "gone");
    return session;
  });
  fs::remove(gone);
  const std::vector<Recovery> found = FindRecoveries(kept);
  ASSERT_EQ(found.size(), 1u);
  for (const auto& [recovery, title] :
       {std::pair(found[0], "untitled"), std::pair(*FindRecovery(gone, kept), "gone")}) {
    SCOPED_TRACE(title);
    // Recovered, and lost once more.
    Crash([&, &from = recovery] { return Recovered(from); });
    const bool wasSaved = !recovery.setup.empty();
    const Recovery again = wasSaved ? *FindRecovery(gone, kept) : FindRecoveries(kept).at(0);
    Session session = Recovered(again);
    EXPECT_EQ(session->Path(), "");
    EXPECT_EQ(TitleOf(*session), title);
    EXPECT_TRUE(session->IsModified());
    ASSERT_TRUE(session->SaveAs(folder.File(std::string(title) + ".tvd"))) << session->Error();
    if (wasSaved) {
      // The names of files mean what they meant.
      EXPECT_EQ(ValueOf(session->Document(), "SimSpec/SimulationPeriod:HotStartResultFile"), "b/results/run.tvdres");
      EXPECT_THAT(ReadFile(session->Path()), testing::StartsWith("# mine\n"));
    }
  }
  EXPECT_THAT(Names("kept"), IsEmpty());
  EXPECT_FALSE(FileExists(gone + "~"));
}

}  // namespace
}  // namespace tervane::edit_session_test
