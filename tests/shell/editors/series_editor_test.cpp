// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/series_editor.h"

#include <QComboBox>
#include <QListWidget>
#include <QPushButton>
#include <QTabWidget>

#include <gmock/gmock.h>

#include "data/datafile_writer.h"
#include "document/setup_lock.h"
#include "shell/charts/series_plot.h"
#include "shell/editors/edit_panel.h"
#include "shell/editors/edit_table.h"
#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"
#include "tests/support/data_files.h"

namespace tervane::series_editor_test {
namespace {

using test::NextAnswer;
using testing::HasSubstr;

/// Rain and a level of 30 days from 2000-01-01 on; the level lacks its days 5 to 7.
class SeriesEditorTest : public testing::Test {
 public:
  SeriesEditorTest() {
    NewDataFile content;
    content.dimensions = 0;
    content.items = {{"Rain", quantity::kRainfall, 1002, ValueType::StepAccumulated},
                     {"Level", quantity::kElevation, 1000, {}}};
    DataFileWriter writer;
    test::Require(writer.Create(path_, content));
    for (int day = 1; day <= 30; ++day) {
      test::Require(writer.AddStep(CYbDateTime(2000, 1, day)));
      const float rain = static_cast<float>(day % 4),
                  level = day >= 5 && day <= 7 ? kDeleteValue : static_cast<float>(day);
      test::Require(writer.Put(1, {&rain, 1}));
      test::Require(writer.Put(2, {&level, 1}));
    }
    test::Require(writer.Finish().error);
    EXPECT_TRUE(setup_.Window().EditDataFile(ToQt(path_)));
    editor_ = qobject_cast<SeriesEditor*>(setup_.Window().findChild<QTabWidget*>()->currentWidget());
  }
  void SetUp() override { ASSERT_TRUE(editor_); }
  void TearDown() override {
    if (!editor_ || !editor_->File().IsModified()) return;
    const NextAnswer discard("Discard");
    setup_.Window().CloseTab(editor_);
  }

  SeriesEdit& Edit() { return editor_->Edited(); }
  EditPanel& Panel() { return *editor_->findChild<EditPanel*>(); }
  EditTable& Table() { return *editor_->findChild<EditTable*>(); }
  QListWidget& List() { return *editor_->findChild<QListWidget*>(); }
  template <class Widget>
  Widget* Named(const QString& name) {
    for (Widget* widget : editor_->findChildren<Widget*>())
      if (widget->accessibleName() == name) return widget;
    ADD_FAILURE() << FromQt(name);
    return nullptr;
  }
  void Click(const QString& text) {
    for (QPushButton* button : Panel().findChildren<QPushButton*>())
      if (button->text() == text) return button->click();
    ADD_FAILURE() << FromQt(text);
  }
  void Select(int top, int left, int bottom, int right) {
    const QAbstractItemModel& model = *Table().model();
    Table().selectionModel()->select({model.index(top, left), model.index(bottom, right)},
                                     QItemSelectionModel::ClearAndSelect);
  }

  test::OpenedSetup setup_;
  const std::string path_ = setup_.Folder().File("rain.nds0");
  SeriesEditor* editor_ = nullptr;
};

TEST_F(SeriesEditorTest, WhatIsSelectedIsFilledAndScaledUndoneAndSaved) {
  EXPECT_TRUE(QTest::qWaitFor([&] { return setup_.Shows("30 of 30 rows, every 1 d"); }));
  Select(4, 2, 5, 2);
  Click("Fill Gaps");
  EXPECT_EQ(Edit().ValueOf(1, 4), 5);
  EXPECT_EQ(Edit().ValueOf(1, 5), 6);
  EXPECT_EQ(Edit().ValueOf(1, 6), kDeleteValue) << "which was not selected";
  Table().clearSelection();
  Named<QLineEdit>("Times:")->setText("2");
  Click("Scale");
  EXPECT_EQ(Edit().ValueOf(0, 0), 2);
  EXPECT_EQ(Edit().ValueOf(1, 0), 1) << "which the list does not show";
  setup_.Command("Undo Scale");
  EXPECT_EQ(Edit().ValueOf(0, 0), 1);
  setup_.Command("Save");
  EXPECT_EQ(SeriesEdit(path_).ValueOf(1, 5), 6);
  List().item(1)->setSelected(true);
  EXPECT_TRUE(QTest::qWaitFor([&] { return setup_.Shows("Level"); }));
  Named<QLineEdit>("Times:")->setText("two");
  Click("Scale");
  EXPECT_THAT(FromQt(Panel().Told()), HasSubstr("number was expected"));
}

TEST_F(SeriesEditorTest, RowsComeGoAndGetOtherTimes) {
  Table().GoTo(1, 1);
  Click("Insert");
  EXPECT_EQ(Table().model()->rowCount(), 31);
  EXPECT_EQ(FromQt(Table().model()->index(1, 0).data().toString()), "2000-01-01 12:00");
  EXPECT_TRUE(Table().model()->setData(Table().model()->index(1, 0), "2000-01-01 06:00"));
  EXPECT_EQ(Edit().TimeOf(1), CYbDateTime(2000, 1, 1, 6));
  EXPECT_TRUE(Table().model()->setData(Table().model()->index(1, 0), "2000-01-09"));
  EXPECT_THAT(FromQt(Panel().Told()), HasSubstr("next row"));
  Select(1, 0, 1, 2);
  Click("Delete");
  EXPECT_EQ(Edit().Rows(), 30u);
  Click("Append");
  EXPECT_EQ(Edit().TimeOf(30), CYbDateTime(2000, 1, 31));
  Named<QLineEdit>("From:")->setText("2000-01-03");
  Named<QLineEdit>("To:")->setText("2000-01-06 12:00");
  Click("Cut to Period");
  EXPECT_EQ(Table().model()->rowCount(), 4);
  Named<QLineEdit>("Number:")->setText("1");
  Named<QComboBox>("Of:")->setCurrentIndex(4);
  Click("Shift");
  EXPECT_EQ(Edit().TimeOf(0), CYbDateTime(2000, 2, 3));
  Named<QLineEdit>("Number:")->setText("2");
  Named<QComboBox>("Of:")->setCurrentIndex(3);
  Click("Resample");
  EXPECT_EQ(Edit().Rows(), 2u);
  Named<QLineEdit>("From:")->setText("soon");
  Click("Cut to Period");
  EXPECT_THAT(FromQt(Panel().Told()), HasSubstr("From: a date"));
  while (Edit().CanUndo()) editor_->Undo();
  EXPECT_EQ(Table().model()->rowCount(), 30);
  EXPECT_FALSE(editor_->File().IsModified());
}

TEST_F(SeriesEditorTest, PastedTimesMakeRows) {
  QApplication::clipboard()->setText("2000-01-02\t22\n2000-02-01 06:00\t11\n");
  Table().GoTo(0, 1);
  Table().paste();
  EXPECT_EQ(Edit().ValueOf(0, 1), 22);
  EXPECT_EQ(Table().model()->rowCount(), 31);
  EXPECT_THAT(FromQt(Panel().Told()), HasSubstr("1 rows were added"));
  Select(0, 1, 1, 1);
  Table().Clear();
  EXPECT_EQ(Edit().ValueOf(0, 0), kDeleteValue);
  QApplication::clipboard()->setText("many\nwords");
  Table().paste();
  EXPECT_THAT(FromQt(Panel().Told()), HasSubstr("words is no number"));
  QTest::qWait(200);
}

TEST_F(SeriesEditorTest, AFileWithOtherSeriesIsShownAsItIs) {
  const std::string other = setup_.Folder().File("other.nds0");
  NewDataFile content;
  content.dimensions = 0;
  for (const char* name : {"Rain", "Level", "Flow", "Snow"})
    content.items.push_back({name, quantity::kElevation, 1000, {}});
  DataFileWriter writer;
  test::Require(writer.Create(other, content));
  for (int day = 1; day <= 3; ++day) {
    test::Require(writer.AddStep(CYbDateTime(2001, 1, day)));
    const float value = static_cast<float>(day);
    for (int item = 1; item <= 4; ++item) test::Require(writer.Put(item, {&value, 1}));
  }
  test::Require(writer.Finish().error);
  std::filesystem::rename(other, path_);
  editor_->Reload();
  EXPECT_EQ(List().count(), 4);
  EXPECT_EQ(Table().model()->columnCount(), 5);
  EXPECT_EQ(Table().model()->rowCount(), 3);
  List().setCurrentRow(3);
  QTest::qWait(100);
  EXPECT_EQ(Edit().ValueOf(3, 2), 3);
}

TEST_F(SeriesEditorTest, WhatStandsInAnOpenCellIsSaved) {
  Table().GoTo(0, 1);
  Table().edit(Table().currentIndex());
  auto* typed = qobject_cast<QLineEdit*>(Table().indexWidget(Table().currentIndex()));
  ASSERT_TRUE(typed);
  typed->setText("7.5");
  EXPECT_FALSE(editor_->File().IsModified());
  ASSERT_TRUE(editor_->Save(path_));
  EXPECT_EQ(Edit().ValueOf(0, 0), 7.5F);
  EXPECT_FALSE(editor_->File().IsModified());
}

TEST_F(SeriesEditorTest, AFileThatAnotherEditorHoldsIsNotSavedOver) {
  const std::string held = setup_.Folder().Write("held.nds0", "of another");
  SetupLock lock;
  ASSERT_EQ(lock.Take(held), SetupLock::Outcome::Taken);
  const NextAnswer told("OK");
  EXPECT_FALSE(editor_->Save(held));
  EXPECT_EQ(test::ReadFile(held), "of another");
  EXPECT_EQ(editor_->Path(), path_);
}

}  // namespace
}  // namespace tervane::series_editor_test
