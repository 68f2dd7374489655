// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/editors/grid_editor.h"

#include <QComboBox>
#include <QPushButton>
#include <QTabWidget>

#include <gmock/gmock.h>

#include "shell/editors/data_viewer.h"
#include "shell/editors/edit_panel.h"
#include "shell/editors/edit_table.h"
#include "shell/maps/map_canvas.h"
#include "shell/maps/map_view.h"
#include "spatial/data2d.h"
#include "spatial/domain.h"
#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"
#include "tests/support/data_files.h"

namespace tervane::grid_editor_test {
namespace {

using test::NextAnswer;
using testing::HasSubstr;

/// A setup whose ground is a file of 40 x 30 cells, which was opened by "Edit..." of its page.
class GridEditorTest : public testing::Test {
 public:
  GridEditorTest() {
    std::vector<float> values;
    for (int j = 0; j < 30; ++j)
      for (int i = 0; i < 40; ++i) values.push_back(static_cast<float>(100 + i + j));
    test::WriteGrid(path_, {40, 30, 50, 0, 0, 0, {}}, values, quantity::kElevation);
    test::WriteCodes(setup_.Folder().File("domain.nds2"), {1, 2});
    auto& root = setup_.Session().Document().Root();
    root.Important(kDomain)->GridFile().Choose(FileName("domain.nds2", setup_.Folder().Path()));
    auto* topography = root.Important(kTopography);
    topography->Type = CData2DKvf::kGridFile;
    topography->GridFile().Choose(FileName(path_, {}));
    setup_.GoTo("Topography");
    for (QPushButton* button : setup_.Frame().findChildren<QPushButton*>())
      if (button->isVisible() && button->text() == "Edit...") button->click();
    editor_ = qobject_cast<GridEditor*>(Tabs().currentWidget());
  }
  void SetUp() override { ASSERT_TRUE(editor_); }
  void TearDown() override {
    if (!editor_ || !editor_->File().IsModified()) return;
    const NextAnswer discard("Discard");
    setup_.Window().CloseTab(editor_);
  }

  QTabWidget& Tabs() { return *setup_.Window().findChild<QTabWidget*>(); }
  MapCanvas& Canvas() { return *editor_->findChild<MapCanvas*>(); }
  EditPanel& Panel() { return *editor_->findChild<EditPanel*>(); }
  EditTable& Table() { return *editor_->findChild<EditTable*>(); }
  QPoint At(int i, int j) { return Canvas().Window().ToScreen(editor_->Grid().Grid()->CellCentre(i, j)).toPoint(); }
  float ValueAt(int i, int j) { return editor_->Grid().ValueOf(i, j); }
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
  /// The colour in which the map shows a cell.
  QColor ColourAt(int i, int j) { return Canvas().grab().toImage().pixelColor(At(i, j)); }

  test::OpenedSetup setup_;
  const std::string path_ = setup_.Folder().File("dem.nds2");
  GridEditor* editor_ = nullptr;
};

TEST_F(GridEditorTest, ABrushPaintsUndoesAndSaves) {
  EXPECT_TRUE(QTest::qWaitFor([&] { return Canvas().Content().domain != nullptr; })) << "where the model lies";
  EXPECT_FALSE(setup_.Action("Undo")->isEnabled());
  Named<QLineEdit>("Value")->setText("120");
  editor_->SetTool(GridEditor::Tool::Brush);
  const QColor before = ColourAt(10, 10);
  QTest::mousePress(&Canvas(), Qt::LeftButton, {}, At(10, 10));
  QTest::mouseMove(&Canvas(), At(20, 10));
  QTest::mouseRelease(&Canvas(), Qt::LeftButton, {}, At(20, 10));
  for (int i = 10; i <= 20; ++i) EXPECT_EQ(ValueAt(i, 10), 120) << i;
  EXPECT_EQ(ValueAt(9, 10), 119);
  EXPECT_EQ(ValueAt(15, 11), 126);
  EXPECT_EQ(FromQt(Table().model()->index(19, 10).data().toString()), "120");
  EXPECT_EQ(Tabs().tabText(1), "dem.nds2*");
  // What was drawn piece by piece looks as what is drawn at once.
  const QImage piecewise = Canvas().grab().toImage();
  setup_.Command("Undo Paint");
  EXPECT_EQ(ValueAt(15, 10), 125);
  EXPECT_EQ(ColourAt(10, 10), before);
  setup_.Command("Redo Paint");
  editor_->Redraw();
  Canvas().Fit();
  EXPECT_EQ(Canvas().grab().toImage(), piecewise);
  setup_.Command("Save");
  EXPECT_EQ(Tabs().tabText(1), "dem.nds2");
  GridEdit saved(path_);
  EXPECT_EQ(saved.ValueOf(15, 10), 120);

  // Esc ends a stroke that goes on; what it has painted is a step.
  QTest::mousePress(&Canvas(), Qt::LeftButton, {}, At(3, 3));
  QTest::keyClick(&Canvas(), Qt::Key_Escape);
  QTest::mouseMove(&Canvas(), At(8, 3));
  EXPECT_EQ(ValueAt(8, 3), 111);
  EXPECT_EQ(editor_->File().UndoName(), "Paint");
  Named<QLineEdit>("Value")->setText("x");
  QTest::mouseClick(&Canvas(), Qt::LeftButton, {}, At(1, 1));
  EXPECT_THAT(FromQt(Panel().Told()), HasSubstr("number was expected"));
}

TEST_F(GridEditorTest, ValuesBeyondTheColoursGetTheirOwn) {
  Named<QLineEdit>("Value")->setText("900");
  editor_->SetTool(GridEditor::Tool::Brush);
  QTest::mouseClick(&Canvas(), Qt::LeftButton, {}, At(20, 20));
  EXPECT_EQ(Canvas().Content().grids[0].range->second, 900);
  EXPECT_NE(ColourAt(20, 20), ColourAt(25, 20));
  Named<QLineEdit>("Value")->clear();
  QTest::mouseClick(&Canvas(), Qt::LeftButton, {}, At(20, 20));
  EXPECT_EQ(ValueAt(20, 20), kDeleteValue);
  EXPECT_EQ(FromQt(Table().model()->index(9, 20).data().toString()), "");
}

TEST_F(GridEditorTest, ClicksDrawLinesAndAreasAndFill) {
  Named<QLineEdit>("Value")->setText("100");
  editor_->SetTool(GridEditor::Tool::Line);
  QTest::mouseClick(&Canvas(), Qt::LeftButton, {}, At(2, 5));
  QTest::mouseClick(&Canvas(), Qt::LeftButton, {}, At(12, 5));
  QTest::keyClick(&Canvas(), Qt::Key_Return);
  EXPECT_EQ(ValueAt(7, 5), 100);
  EXPECT_TRUE(Canvas().IsAsking()) << "for the next line";
  editor_->SetTool(GridEditor::Tool::Polygon);
  for (const auto& [i, j] : {std::pair(20, 10), {30, 10}, {30, 20}, {20, 20}})
    QTest::mouseClick(&Canvas(), Qt::LeftButton, {}, At(i, j));
  QTest::keyClick(&Canvas(), Qt::Key_Return);
  EXPECT_EQ(ValueAt(25, 15), 100);
  Named<QLineEdit>("Value")->setText("110");
  editor_->SetTool(GridEditor::Tool::Fill);
  QTest::mouseClick(&Canvas(), Qt::LeftButton, {}, At(25, 15));
  EXPECT_EQ(ValueAt(22, 12), 110);
  EXPECT_EQ(ValueAt(7, 5), 100);
  QTest::keyClick(&Canvas(), Qt::Key_Escape);
  EXPECT_FALSE(Canvas().IsAsking());
  EXPECT_EQ(editor_->File().UndoName(), "Fill");
}

TEST_F(GridEditorTest, ASelectionIsShownCountedAndChanged) {
  editor_->SetTool(GridEditor::Tool::SelectRectangle);
  QTest::mousePress(&Canvas(), Qt::LeftButton, {}, At(5, 5));
  QTest::mouseMove(&Canvas(), At(8, 9));
  QTest::mouseRelease(&Canvas(), Qt::LeftButton, {}, At(8, 9));
  EXPECT_EQ(editor_->Grid().Selection().Count(), 20u);
  EXPECT_EQ(Canvas().Content().grids.size(), 2u);
  Named<QLineEdit>("Number:")->setText("5");
  Named<QComboBox>("Do:")->setCurrentIndex(1);
  Click("Apply");
  EXPECT_EQ(ValueAt(5, 5), 115);
  EXPECT_EQ(ValueAt(4, 5), 109);
  EXPECT_TRUE(QTest::qWaitFor([&] { return setup_.Shows("20 selected"); }));
  Named<QComboBox>("How:")->setCurrentIndex(1);
  Named<QLineEdit>("From:")->setText("165");
  Click("Values");
  EXPECT_EQ(editor_->Grid().Selection().Count(), 30u);
  Click("Delete Values");
  EXPECT_EQ(ValueAt(39, 29), kDeleteValue);
  Named<QLineEdit>("Replace:")->clear();
  Named<QLineEdit>("By:")->setText("7");
  Click("None");
  Click("Replace");
  EXPECT_EQ(ValueAt(39, 29), 7);
  Named<QLineEdit>("Number:")->setText("five");
  Click("Apply");
  EXPECT_THAT(FromQt(Panel().Told()), HasSubstr("number was expected"));
  EXPECT_EQ(Canvas().Content().grids.size(), 1u);
}

TEST_F(GridEditorTest, TheTableTakesWhatIsTypedAndPasted) {
  Table().GoTo(29, 0);
  EXPECT_TRUE(Table().model()->setData(Table().model()->index(29, 0), "77,5"));
  EXPECT_FLOAT_EQ(ValueAt(0, 0), 77.5F);
  EXPECT_TRUE(Table().model()->setData(Table().model()->index(29, 0), "much"));
  EXPECT_THAT(FromQt(Panel().Told()), HasSubstr("number was expected"));
  QApplication::clipboard()->setText("1\t2\n\t4\n");
  Table().GoTo(28, 3);
  Table().paste();
  EXPECT_EQ(ValueAt(4, 1), 2);
  EXPECT_EQ(ValueAt(3, 0), kDeleteValue);
  EXPECT_EQ(ValueAt(4, 0), 4);
  Table().selectAll();
  Table().copy();
  EXPECT_EQ(QApplication::clipboard()->text().count('\n'), 30);
  Table().Clear();
  EXPECT_EQ(editor_->Grid().Statistics().count, 0u);
  setup_.Command("Undo Delete Values");
  EXPECT_EQ(ValueAt(4, 0), 4);
}

TEST_F(GridEditorTest, AChangeOfAnotherProgramIsAskedAboutAndFollowed) {
  const auto write = [&](float value) {
    test::WriteGrid(path_, {40, 30, 50, 0, 0, 0, {}}, std::vector<float>(1200, value), quantity::kElevation);
  };
  write(1);
  editor_->CheckDisk();
  EXPECT_EQ(ValueAt(5, 5), 1) << "without changes it is followed";
  ASSERT_EQ(editor_->Grid().Fill(0, 0, 2), "");
  write(3);
  editor_->CheckDisk();
  EXPECT_EQ(ValueAt(5, 5), 2);
  EXPECT_TRUE(QTest::qWaitFor([&] { return setup_.Shows("Another program has changed the file"); }));
  {
    const NextAnswer cancel("Cancel");
    EXPECT_FALSE(setup_.Window().SaveEditor());
    EXPECT_THAT(cancel.Text(), HasSubstr("dem.nds2"));
  }
  for (QAbstractButton* button : editor_->findChildren<QAbstractButton*>())
    if (QString(button->text()).remove('&') == "Keep Mine") {
      button->click();
      break;
    }
  EXPECT_TRUE(setup_.Window().SaveEditor());
  EXPECT_EQ(GridEdit(path_).ValueOf(5, 5), 2);
}

TEST_F(GridEditorTest, TheSetupFollowsASave) {
  const EditSession& session = setup_.Window().findChild<DocumentFrame*>()->Session();
  auto* topography = session.Document().Root().Important(kTopography);
  ASSERT_EQ(topography->GetGridData()->Value(0, 0), 100);
  ASSERT_EQ(editor_->Grid().Apply(CellOperation::Add, 50), "");
  EXPECT_TRUE(setup_.Window().SaveEditor());
  EXPECT_EQ(topography->GetGridData()->Value(0, 0), 150);
  EXPECT_FALSE(session.IsModified() && session.Steps().UndoName() == "Refresh");
}

TEST_F(GridEditorTest, TheSetupIsAskedOnceForWhatLiesAround) {
  const auto titles = [](GridEditor& editor) {
    std::vector<std::string> found;
    const MapContent& content = editor.findChild<MapCanvas*>()->Content();
    for (const auto* layers : {&content.below, &content.above})
      for (const BackdropLayer& layer : *layers) found.push_back(layer.title);
    return found;
  };
  EXPECT_THAT(titles(*editor_), testing::IsEmpty()) << "its page offers nothing";
  setup_.Window().CloseTab(editor_);
  editor_ = nullptr;
  setup_.GoTo("Catchment");
  // As the pages do whose files are edited with the geology in sight.
  setup_.Session().Document().Global().Requests.layers = true;
  for (QPushButton* button : setup_.Frame().findChildren<QPushButton*>())
    if (button->isVisible() && button->text() == "Edit...") button->click();
  auto* domain = qobject_cast<GridEditor*>(Tabs().currentWidget());
  ASSERT_TRUE(domain);
  EXPECT_EQ(domain->Title(), "domain.nds2");
  const auto& requests = setup_.Window().findChild<DocumentFrame*>()->Session().Document().Global().Requests;
  EXPECT_FALSE(requests.domain || requests.layers);
  EXPECT_THAT(titles(*domain), testing::ElementsAre("Model Grid")) << "the levels are not seen at first";
  EXPECT_THAT(domain->findChild<MapView*>()->LayerTitles(), testing::ElementsAre("Model Grid", "Topography"));
  // What was answered stays, whatever becomes of the setup.
  domain->Redraw();
  ASSERT_EQ(domain->Grid().Apply(CellOperation::Set, 5), "");
  EXPECT_TRUE(setup_.Window().SaveEditor());
  EXPECT_THAT(titles(*domain), testing::ElementsAre("Model Grid"));
}

TEST_F(GridEditorTest, AFileThatIsOpenElsewhereIsSavedUnderAnotherName) {
  EXPECT_TRUE(HolderOf(path_)) << "others see that it is edited";
  const std::string other = setup_.Folder().File("other.nds2");
  test::WriteCodes(other, {1, 2, 3});
  SetupLock lock;
  ASSERT_EQ(lock.Take(other), SetupLock::Outcome::Taken);
  ASSERT_TRUE(setup_.Window().EditDataFile(ToQt(other)));
  auto* held = qobject_cast<GridEditor*>(Tabs().currentWidget());
  ASSERT_TRUE(held);
  EXPECT_THAT(held->File().WhyReadOnly(), HasSubstr("open"));
  EXPECT_TRUE(QTest::qWaitFor([&] { return setup_.Shows("Read-only: "); }));
  ASSERT_EQ(held->Grid().Apply(CellOperation::Set, 5), "");
  {
    const NextAnswer ok("OK");
    EXPECT_FALSE(held->Save(other));
    EXPECT_THAT(ok.Text(), HasSubstr("under another name"));
  }
  EXPECT_TRUE(held->Save(setup_.Folder().File("mine.nds2")));
  EXPECT_EQ(held->File().WhyReadOnly(), "");
  EXPECT_FALSE(setup_.Shows("Read-only: "));
  EXPECT_EQ(GridEdit(other).ValueOf(0, 0), 1);
  EXPECT_TRUE(HolderOf(setup_.Folder().File("mine.nds2")));
  setup_.Window().CloseTab(held);
  EXPECT_FALSE(HolderOf(setup_.Folder().File("mine.nds2")));
}

TEST_F(GridEditorTest, AShownFileIsEditedByItsCommand) {
  const std::string other = setup_.Folder().File("other.nds2");
  test::WriteCodes(other, {1, 2, 3});
  EXPECT_TRUE(setup_.Window().OpenFile(ToQt(other)));
  EXPECT_TRUE(qobject_cast<DataViewer*>(Tabs().currentWidget()));
  setup_.Command("Edit Values");
  auto* codes = qobject_cast<GridEditor*>(Tabs().currentWidget());
  ASSERT_TRUE(codes);
  EXPECT_EQ(codes->Title(), "other.nds2");
  EXPECT_TRUE(codes->Grid().IsCodes());
  // What a run has stored is shown, opened by its command too.
  const std::string result = setup_.Folder().Write("karup_results/codes.nds2", test::ReadFile(other));
  EXPECT_TRUE(setup_.Window().EditDataFile(ToQt(result)));
  ASSERT_TRUE(qobject_cast<DataViewer*>(Tabs().currentWidget()));
  setup_.Command("Edit Values");
  EXPECT_TRUE(qobject_cast<DataViewer*>(Tabs().currentWidget()));
  // What cannot be edited is shown as before.
  const std::string raster =
      setup_.Folder().Write("r.asc", "ncols 2\nnrows 1\nxllcorner 0\nyllcorner 0\ncellsize 1\n5 6\n");
  EXPECT_TRUE(setup_.Window().EditDataFile(ToQt(raster)));
  EXPECT_TRUE(qobject_cast<DataViewer*>(Tabs().currentWidget()));
}

}  // namespace
}  // namespace tervane::grid_editor_test
