// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/library_tab.h"

#include <QListWidget>
#include <QTabWidget>
#include <QToolButton>

#include <gmock/gmock.h>

#include "shell/page/table_view.h"
#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"

namespace tervane::library_tab_test {
namespace {

using test::NextAnswer;
using testing::HasSubstr;
using testing::Not;

constexpr const char* kCrops =
    "target TERVANE_VEGETATION {\n"
    "  Version = 1\n"
    "  section Vegetation_1 {\n"
    "    Name = \"Grass\"\n"
    "    Stage = 0, 2.0, 0.5, 1.0  # all the year\n"
    "    Stage = 365, 2.0, 0.5, 1.0\n"
    "  }\n"
    "}\n";

/// A window with one setup and one library, which is shown.
class LibraryInWindow : public testing::Test {
 protected:
  LibraryInWindow() : path_(setup_.Folder().Write("crops.etv", kCrops)) {
    EXPECT_TRUE(setup_.Window().OpenFile(ToQt(path_)));
  }
  QTabWidget& Tabs() { return *setup_.Window().findChild<QTabWidget*>(); }
  LibraryTab& Tab() { return *setup_.Window().findChild<LibraryTab*>(); }
  QListWidget& List() { return *Tab().findChild<QListWidget*>(); }
  QTableView& Table() { return *Tab().findChild<TableView*>()->findChild<QTableView*>(); }
  void Click(const QString& text) {
    for (QToolButton* button : Tab().findChildren<QToolButton*>())
      if (button->text() == text && !Tab().findChild<TableView*>()->isAncestorOf(button)) return button->click();
    ADD_FAILURE() << FromQt(text);
  }
  void TypeCell(int row, int column, const char* text) {
    ASSERT_TRUE(Table().model()->setData(Table().model()->index(row - 1, column - 1), text));
  }
  QString Name(int row) { return List().item(row - 1)->text(); }

  test::OpenedSetup setup_;
  const std::string path_;
};

TEST_F(LibraryInWindow, IsEditedUndoneAndSaved) {
  EXPECT_EQ(setup_.Window().Frame(), nullptr);
  EXPECT_EQ(Tab().Title(), "crops.etv");
  Click("Add");
  EXPECT_EQ(Name(2), "New vegetation");
  EXPECT_FALSE(List().item(1)->icon().isNull());  // it has no stages
  setup_.Type("Maize");                           // a new entry is named first
  setup_.Press(Qt::Key_Return);
  Tab().findChild<TableView*>()->ChangeRows(RowAction::Insert);
  EXPECT_EQ(Name(2), "Maize");
  TypeCell(1, 2, "4.5");
  Tab().findChild<TableView*>()->ChangeRows(RowAction::Insert);
  TypeCell(2, 1, "150");
  EXPECT_TRUE(List().item(1)->icon().isNull());
  EXPECT_EQ(Tab().Title(), "crops.etv*");

  TypeCell(2, 4, "1.2");
  setup_.Command("Undo Change Kc");
  EXPECT_EQ(Tab().Editor().Content().entries[1].rows[1].values[3], 0);
  setup_.Command("Redo Change Kc");
  EXPECT_EQ(Tab().Editor().Content().entries[1].rows[1].values[3], 1.2);
  setup_.Command("Save");
  EXPECT_EQ(Tab().Title(), "crops.etv");
  std::string expected = kCrops;
  expected.insert(expected.size() - 2,
                  "  section Vegetation_2 {\n    Name = \"Maize\"\n    Stage = 0, 4.5, 0.0, 0.0\n"
                  "    Stage = 150, 4.5, 0.0, 1.2\n  }\n");
  EXPECT_EQ(test::ReadFile(path_), expected);

  while (Tab().Editor().CanUndo()) Tab().Undo();
  EXPECT_EQ(List().count(), 1);
  EXPECT_EQ(Tab().Title(), "crops.etv*");
  setup_.Command("Save");
  EXPECT_EQ(test::ReadFile(path_), kCrops);
}

TEST_F(LibraryInWindow, TableTakesWhatASpreadsheetGivesAndRefusesStrayValues) {
  auto* table = Tab().findChild<TableView*>();
  table->SelectCell(2, 1);
  QApplication::clipboard()->setText("100\t1\t0.5\t1\n200\t2\t0.6\t1.1\n");
  table->Paste();
  ASSERT_EQ(Table().model()->rowCount(), 3);
  EXPECT_EQ(Tab().Editor().Content().entries[0].rows[2].values[2], 0.6);
  EXPECT_EQ(Tab().Editor().UndoName(), "Paste");
  {
    const NextAnswer ok("OK");
    QApplication::clipboard()->setText("1.5\t30");
    table->SelectCell(1, 1);
    table->Paste();
    EXPECT_THAT(ok.Text(), HasSubstr("Day is 1.5, a whole number from 0 to 36500 was expected"));
    EXPECT_THAT(ok.Text(), HasSubstr("LAI is 30, a number from 0 to 20 was expected"));
  }
  EXPECT_EQ(Tab().Editor().Content().entries[0].rows[0].values[0], 0);
  const NextAnswer discard("Discard");
  setup_.Window().CloseTab(&Tab());
}

TEST_F(LibraryInWindow, CopiesAndDeletesItsEntries) {
  Click("Copy");
  EXPECT_EQ(Name(2), "Grass 2");
  List().setCurrentRow(0);
  Click("Delete");
  EXPECT_EQ(List().count(), 1);
  EXPECT_EQ(Name(1), "Grass 2");
  Click("Delete");
  Tab().Undo();
  EXPECT_EQ(Name(1), "Grass 2");
  const NextAnswer discard("Discard");
  setup_.Window().CloseTab(&Tab());
}

TEST_F(LibraryInWindow, ClosingAsksForChangesAndLosesNoneUnasked) {
  Click("Copy");
  {
    const NextAnswer cancel("Cancel");
    EXPECT_FALSE(setup_.Window().CloseTab(&Tab()));
    EXPECT_THAT(cancel.Text(), HasSubstr("crops.etv"));
  }
  const NextAnswer save("Save");
  EXPECT_TRUE(setup_.Window().CloseTab(&Tab()));
  EXPECT_THAT(test::ReadFile(path_), HasSubstr("Grass 2"));
  EXPECT_EQ(Tabs().count(), 1);
}

TEST_F(LibraryInWindow, FollowsTheDiskUnlessThereAreChanges) {
  const std::string other = std::string(kCrops).replace(std::string(kCrops).find("Grass"), 5, "Meadow");
  setup_.Folder().Write("crops.etv", other);
  Tab().CheckDisk();
  EXPECT_EQ(Name(1), "Meadow");
  Click("Copy");
  setup_.Folder().Write("crops.etv", kCrops + std::string("# more\n"));
  Tab().CheckDisk();
  EXPECT_EQ(Name(2), "Meadow 2");
  {
    const NextAnswer no("Cancel");
    EXPECT_FALSE(setup_.Window().SaveEditor());
    EXPECT_THAT(no.Text(), HasSubstr("Another program has changed crops.etv"));
  }
  EXPECT_THAT(test::ReadFile(path_), Not(HasSubstr("Meadow")));
  const NextAnswer discard("Discard");
  setup_.Window().CloseTab(&Tab());
}

TEST_F(LibraryInWindow, IsOpenedOnceAndRefusedWithItsReason) {
  Tabs().setCurrentIndex(0);
  EXPECT_TRUE(setup_.Window().ShowDataFile(ToQt(path_)));
  EXPECT_EQ(Tabs().count(), 2);
  EXPECT_EQ(Tabs().currentWidget(), &Tab());
  const NextAnswer ok("OK");
  const std::string wrong =
      setup_.Folder().Write("wrong.etv", "target TERVANE_VEGETATION {\n  section Vegetation_1 {\n");
  EXPECT_FALSE(setup_.Window().OpenFile(ToQt(wrong)));
  EXPECT_THAT(ok.Text(), HasSubstr("wrong.etv:"));
  EXPECT_EQ(Tabs().count(), 2);
}

}  // namespace
}  // namespace tervane::library_tab_test
