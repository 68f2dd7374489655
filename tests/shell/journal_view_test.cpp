// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/journal_view.h"

#include <QTabWidget>
#include <QTreeWidget>
#include <filesystem>

#include <gmock/gmock.h>

#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"

namespace tervane::journal_view_test {
namespace {

using test::OpenedSetup;
using testing::HasSubstr;

class JournalledSetup : public OpenedSetup {
 public:
  JournalledSetup() : OpenedSetup("section SimSpec {\nsection SimTitle {\nTitle = \"old\"\n}\n}") {
    for (QTabWidget* tabs : Frame().findChildren<QTabWidget*>())
      if (tabs->indexOf(&View()) >= 0) tabs->setCurrentWidget(&View());
  }
  JournalView& View() { return *Frame().findChild<JournalView*>(); }
  QTreeWidget& List() { return *View().findChild<QTreeWidget*>(); }
  int Rows() { return List().topLevelItemCount(); }
  std::string Row(int row) {
    const QTreeWidgetItem* item = List().topLevelItem(row);
    QStringList cells;
    for (int column = 2; item && column < 6; ++column) cells << item->text(column);
    return FromQt(cells.join(" | "));
  }
  /// Types into the field of the title's page.
  void SetTitle(const QString& text) {
    GoTo("SimSpec/SimTitle:Title");
    Type(text);
    Press(Qt::Key_Return);
    QApplication::processEvents();
  }
};

TEST(JournalView, StepsAreListedOnceAJournalIsKept) {
  JournalledSetup setup;
  setup.SetTitle("first");
  EXPECT_EQ(setup.Rows(), 0);
  EXPECT_FALSE(std::filesystem::exists(setup.Path() + ".journal"));
  setup.View().Choose(JournalView::Keep::OfThis);
  setup.SetTitle("second");
  setup.SetTitle("third");
  ASSERT_EQ(setup.Rows(), 2);
  EXPECT_THAT(setup.Row(0), testing::EndsWith("Simulation Title | \"second\" | \"third\""));
  setup.Command("Save");
  EXPECT_THAT(setup.Row(0), testing::StartsWith("Save"));
  setup.View().Filter("first");
  ASSERT_EQ(setup.Rows(), 1);
  EXPECT_THAT(setup.Row(0), HasSubstr("\"first\" | \"second\""));
  setup.View().ExportTo(setup.Folder().File("journal.csv"));
  EXPECT_EQ(test::ReadFile(setup.Folder().File("journal.csv")),
            JournalCsv({ReadJournal(setup.Path() + ".journal").steps.front()}));
  setup.View().Choose(JournalView::Keep::No);
  setup.View().Filter("");
  setup.SetTitle("fourth");
  EXPECT_EQ(setup.Rows(), 3);
}

TEST(JournalView, AStepIsTakenBackOrToldWhyNot) {
  JournalledSetup setup;
  setup.View().Choose(JournalView::Keep::OfThis);
  setup.SetTitle("first");
  setup.SetTitle("second");
  setup.List().setCurrentItem(setup.List().topLevelItem(1));
  {
    const test::NextAnswer answer("OK");
    setup.View().TakeBack();
    EXPECT_THAT(answer.Text(), HasSubstr("Title holds \"second\" now, and no more \"first\""));
  }
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "second");
  setup.List().setCurrentItem(setup.List().topLevelItem(0));
  setup.View().TakeBack();
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "first");
  EXPECT_EQ(setup.Rows(), 3);
  setup.GoTo("SimSpec/SimTitle:Title");
  EXPECT_EQ(setup.Focused<QLineEdit>()->text(), "first");
  setup.Frame().Undo();
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "second");
}

TEST(JournalView, AJournalThatCannotBeWrittenIsToldAndTheWorkGoesOn) {
  JournalledSetup setup;
  std::filesystem::create_directory(setup.Path() + ".journal");
  setup.View().Choose(JournalView::Keep::OfThis);
  setup.SetTitle("first");
  EXPECT_TRUE(setup.Shows("The journal is not kept: cannot write"));
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "first");
}

TEST(JournalView, TheChoiceIsKeptForTheSetupOrForAll) {
  JournalledSetup setup;
  setup.View().Choose(JournalView::Keep::OfThis);
  EXPECT_TRUE(setup.Session().KeepsJournal());
  std::string error;
  const auto other = EditSession::New(setup.Folder().File("recovery"));
  NobodyToAsk host;
  JournalView view(*other, host, setup.Program(), [] {});
  EXPECT_EQ(view.Chosen(), JournalView::Keep::No);
  setup.View().Choose(JournalView::Keep::OfAll);
  view.Sync();
  EXPECT_TRUE(other->KeepsJournal());
  view.Choose(JournalView::Keep::OfThis);
  ASSERT_TRUE(other->SaveAs(setup.Folder().File("new.tvd")));
  view.Sync();
  EXPECT_EQ(view.Chosen(), JournalView::Keep::OfThis) << "chosen while it had no file";
  setup.View().Sync();
  EXPECT_EQ(setup.View().Chosen(), JournalView::Keep::No) << "it was chosen for all";
}

}  // namespace
}  // namespace tervane::journal_view_test
