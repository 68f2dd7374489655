// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/document_frame.h"

#include <QCheckBox>
#include <QDialog>
#include <QDir>
#include <QFile>
#include <QMenu>
#include <QPlainTextEdit>
#include <QScrollArea>
#include <QTextBrowser>
#include <QTreeWidget>
#include <algorithm>
#include <filesystem>
#include <fstream>

#include <gmock/gmock.h>

#include "shell/charts/section_view.h"
#include "shell/charts/series_plot.h"
#include "shell/find_panel.h"
#include "shell/findings_view.h"
#include "shell/maps/map_canvas.h"
#include "shell/node_tree.h"
#include "shell/run/document_run.h"
#include "shell/widgets/flash_mark.h"
#include "tests/shell/next_answer.h"
#include "tests/shell/opened_setup.h"
#include "tests/support/preprocessed_run.h"

namespace tervane::document_frame_test {
namespace {

using test::OpenedSetup;

constexpr const char* kWaterQualityTooEarly =
    "section SimSpec {\nsection ModelComp {\nWQ = 1\n}\n}\n"
    "section ModelCompWQ {\nsection SimulationPeriodWQ {\nSimStart = 1999, 12, 31, 0, 0\n}\n}";

TEST(DocumentFrame, AFindingLeadsToTheControlThatItSpeaksOf) {
  OpenedSetup setup(kWaterQualityTooEarly);
  auto* findings = setup.Frame().findChild<FindingsView*>();
  ASSERT_EQ(findings->Count(), 2);  // the other one is the domain, which has no file
  setup.Command("Next Finding");
  EXPECT_EQ(setup.Frame().CurrentPath(), "ModelCompWQ/SimulationPeriodWQ");
  EXPECT_EQ(setup.Focused<QLineEdit>()->text(), "1999/12/31  00:00");
  setup.Type("2000/01/01");
  setup.Press(Qt::Key_Return);
  EXPECT_EQ(findings->Count(), 1);
  setup.Command("Undo Change Start Date");
  EXPECT_EQ(findings->Count(), 2);
}

TEST(DocumentFrame, AFindingOffersWhatMendsItAsOneStep) {
  OpenedSetup setup(
      "section SimSpec {\nsection ModelComp {\nWQ = 1\n}\n}\nsection Species {\nNumberOfSpecies = 1\n}\n"
      "section Sources {\nNumberOfSources = 1\nsection Source_1 {\nSpecies = \"gone\"\nExtentType = 0\n}\n}\n");
  auto* findings = setup.Frame().findChild<FindingsView*>();
  const auto found = findings->findItems("names a species that the setup does not have", Qt::MatchContains, 2);
  ASSERT_EQ(found.size(), 1);
  QMenu menu;
  findings->FillMenu(menu, found.front());
  QAction* mend = nullptr;
  for (QAction* action : menu.actions())
    if (action->text() == "Change Species to Species_1") mend = action;
  ASSERT_TRUE(mend);
  const int before = findings->Count();
  mend->trigger();
  EXPECT_EQ(setup.Value("Sources/Source_1:Species"), "Species_1");
  EXPECT_EQ(findings->Count(), before - 1);
  setup.Command("Undo Change Species to Species_1");
  EXPECT_EQ(findings->Count(), before);
}

QAction* ActionOf(const QMenu& menu, const QString& text) {
  for (QAction* action : menu.actions())
    if (QString(action->text()).remove('&') == text) return action;
  ADD_FAILURE() << "no command " << FromQt(text);
  return nullptr;
}

TEST(DocumentFrame, MovedFilesAreFoundTogetherAsOneStep) {
  OpenedSetup setup(test::Example{"rhone", "rhone.tvd"});
  const QString folder = ToQt(setup.Frame().Session().Document().Root().SetupFolder());
  ASSERT_TRUE(QDir(folder).mkdir("moved"));
  for (const char* name : {"manning.nds2", "precipitation_gauges.nds0"})
    ASSERT_TRUE(QFile::rename(folder + "/" + name, folder + "/moved/" + name));
  setup.Frame().Session().UpdateDoc(setup.Frame().Session().Document().Root(), kDataChanged, "Look Again");
  auto* findings = setup.Frame().findChild<FindingsView*>();
  const auto lines = findings->findItems("File is not valid", Qt::MatchContains, 2);
  ASSERT_EQ(lines.size(), 2);
  QMenu menu;
  findings->FillMenu(menu, lines.front());
  EXPECT_TRUE(ActionOf(menu, "Find the File by Its Name at 50 Places"));
  test::NextAnswer answer("Change");
  ActionOf(menu, "Fix All 51 of This Kind")->trigger();
  EXPECT_EQ(answer.Text(), "Change 51 values?");
  EXPECT_EQ(setup.Value("Overland/Manning/NDS_2D_DATA_FILE:FILE_NAME"), "moved/manning.nds2");
  EXPECT_TRUE(findings->findItems("File is not valid", Qt::MatchContains, 2).isEmpty());
  setup.Command("Undo Find the File by Its Name");
  EXPECT_EQ(setup.Value("Overland/Manning/NDS_2D_DATA_FILE:FILE_NAME"), "manning.nds2");
  EXPECT_EQ(findings->findItems("File is not valid", Qt::MatchContains, 2).size(), 2);
}

TEST(DocumentFrame, AFindingAtTheFootOfAPageHasItsFixBehindIt) {
  OpenedSetup setup(kWaterQualityTooEarly);
  setup.GoTo("ModelCompWQ/SimulationPeriodWQ");
  QLabel* foot = nullptr;
  for (QLabel* label : setup.Frame().findChildren<QLabel*>())
    if (label->text().contains("Set the Date Within the Simulation of Flow")) foot = label;
  ASSERT_TRUE(foot);
  emit foot->linkActivated("0");
  EXPECT_EQ(setup.Value("ModelCompWQ/SimulationPeriodWQ:SimStart"), "2000, 1, 1, 0, 0");
  EXPECT_FALSE(foot->isVisible());
  setup.Command("Undo Set the Date Within the Simulation of Flow");
  EXPECT_NE(setup.Value("ModelCompWQ/SimulationPeriodWQ:SimStart"), "2000, 1, 1, 0, 0");
}

TEST(DocumentFrame, ANodeThatLeavesTheSetupGivesItsPlaceToTheNearestAbove) {
  OpenedSetup setup(kWaterQualityTooEarly);
  setup.GoTo("SimSpec:WQ");
  setup.Focused<QCheckBox>()->click();
  EXPECT_EQ(setup.Value("SimSpec/ModelComp:WQ"), "0");
  EXPECT_FALSE(setup.Frame()
                   .findChild<NodeTree*>()
                   ->findItems("Water Quality Simulation Period", Qt::MatchExactly | Qt::MatchRecursive)
                   .size());
  setup.Frame().Undo();
  setup.GoTo("ModelCompWQ/SimulationPeriodWQ");
  setup.Frame().Redo();
  EXPECT_NE(setup.Frame().CurrentPath(), "ModelCompWQ/SimulationPeriodWQ");
  EXPECT_FALSE(setup.Frame().CurrentPath().empty());
}

TEST(DocumentFrame, AQuestionOnTheMapIsAnsweredWithoutAClick) {
  OpenedSetup setup(test::Example{"rhone", "rhone.tvd"});
  setup.GoTo("SaturatedZone");
  for (const char* refused :
       {"Draw Section", "Draw Section=1,2", "Draw Section=1;2 3,4", "Draw=1,2 3,4", "Map:=1,2 3,4"})
    EXPECT_FALSE(setup.Frame().AnswerOnMap(refused)) << refused;
  EXPECT_TRUE(setup.Frame().AnswerOnMap("Draw Section=367500,5122700 371300,5117000"));
  const auto* section = setup.Frame().findChild<SectionView*>();
  ASSERT_TRUE(section);
  EXPECT_TRUE(QTest::qWaitFor([&] { return section->LayersAt(3000).contains("Moraine"); }));
}

TEST(DocumentFrame, FindListsPlacesLabelsAndKeysAndLeadsThere) {
  OpenedSetup setup;
  setup.Command("Find…");
  setup.Type("increment");
  setup.Press(Qt::Key_Return);
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/CompControlParaTimeStep");
  EXPECT_EQ(setup.Focused<QLineEdit>()->text(), "0.05");
  setup.Command("Find…");
  setup.Type("nothing like this");
  EXPECT_TRUE(setup.Shows("Nothing found"));
  setup.Press(Qt::Key_Escape);
  EXPECT_FALSE(setup.Shows("Nothing found"));
}

TEST(DocumentFrame, BackAndForwardGoAmongTheVisitedNodes) {
  OpenedSetup setup;
  for (const char* path : {"SimSpec", "SimSpec/SimTitle", "ExtraParams"}) setup.GoTo(path);
  setup.Command("Back");
  setup.Command("Back");
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec");
  setup.Command("Forward");
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/SimTitle");
  setup.GoTo("Overlays");
  EXPECT_FALSE(setup.Frame().CanGo(1));
  setup.Command("Copy Path");
  EXPECT_EQ(QApplication::clipboard()->text(), "Overlays");
}

TEST(DocumentFrame, UndoTakesBackWhatAnyPageChangedAndTheTitleTells) {
  OpenedSetup setup;
  setup.GoTo("SimSpec/SimTitle:Title");
  setup.Type("Karup");
  setup.Press(Qt::Key_Return);
  EXPECT_EQ(setup.Frame().Title(), "karup.tvd *");
  // The field has the keyboard, and nothing is left in it that it could take back itself.
  setup.Press(Qt::Key_Z, Qt::ControlModifier);
  EXPECT_EQ(setup.Value("SimSpec/SimTitle:Title"), "");
  EXPECT_EQ(setup.Frame().Title(), "karup.tvd");
  EXPECT_EQ(setup.Focused<QLineEdit>()->text(), "");
}

NodeTree* ShownTree(OpenedSetup& setup) {
  for (auto* tree : setup.Frame().findChildren<NodeTree*>())
    if (tree->isVisible()) return tree;
  return nullptr;
}

TEST(DocumentFrame, UndoGoesToWhatItChangesAndDropsTextsThatWereNotTaken) {
  OpenedSetup setup;
  QStringList told;
  QObject::connect(&setup.Frame(), &DocumentFrame::Told, [&](const QString& text) { told << text; });
  const char* increment = "SimSpec/CompControlParaTimeStep:IncrementRate";
  setup.GoTo("SimSpec/CompControlParaTimeStep:IncrementRate");
  const QString before = setup.Focused<QLineEdit>()->text();
  setup.Type("0.07");
  setup.Press(Qt::Key_Return);
  ASSERT_EQ(setup.Value(increment), "0.07");
  setup.GoTo("SimSpec/SimulationPeriod:SIMSTART");
  auto* start = setup.Focused<QLineEdit>();
  const QString date = start->text();
  setup.Type("no date");
  setup.Press(Qt::Key_Return);
  EXPECT_TRUE(setup.Shows("Not taken"));
  const std::string step = setup.Session().Steps().UndoName();
  setup.Command(ToQt("Undo " + step));
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/CompControlParaTimeStep");
  EXPECT_EQ(setup.Focused<QLineEdit>()->text(), before);
  EXPECT_THAT(setup.Focused<QLineEdit>()->parentWidget()->findChildren<FlashMark*>(), testing::SizeIs(1));
  EXPECT_THAT(told, testing::ElementsAre(ToQt("Undone: " + step)));
  setup.GoTo("SimSpec/SimulationPeriod:SIMSTART");
  EXPECT_EQ(setup.Focused<QLineEdit>()->text(), date);
  EXPECT_FALSE(setup.Shows("Not taken"));
  setup.Frame().Redo();
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/CompControlParaTimeStep");
  EXPECT_EQ(setup.Focused<QLineEdit>()->text(), "0.07");
}

TEST(DocumentFrame, ALongBranchBeginsClosedWithItsNumberAndStaysAsItWasLeft) {
  OpenedSetup setup(test::Example{"rhone", "rhone.tvd"});
  const auto branch = [&] {
    const auto found = ShownTree(setup)->findItems("Precipitation Rate (50)", Qt::MatchExactly | Qt::MatchRecursive);
    EXPECT_EQ(found.size(), 1);
    return found.value(0);
  };
  ASSERT_TRUE(branch());
  EXPECT_FALSE(branch()->isExpanded());
  // The warning of the gauge without a cell is marked on it, and a finding inside opens it.
  setup.GoTo("Climate/PrecipitationRate/TIME_SERIES_7:FILE_NAME");
  EXPECT_TRUE(branch()->isExpanded());
  setup.Type("missing.nds0");
  setup.Press(Qt::Key_Return);
  EXPECT_TRUE(branch()->icon(0).isNull());
  branch()->setExpanded(false);
  EXPECT_FALSE(branch()->icon(0).isNull());
  branch()->setExpanded(true);
  setup.Command("Zoom In");
  QApplication::processEvents();  // The panes are made anew, and shown with the next events.
  EXPECT_TRUE(branch()->isExpanded());
  setup.Command("Actual Size");
  const test::NextAnswer discard("Discard");
  ASSERT_TRUE(setup.Window().CloseDocument(&setup.Frame()));
  ASSERT_TRUE(setup.Window().OpenDocument(ToQt(setup.Path())));
  EXPECT_TRUE(branch()->isExpanded());
}

TEST(DocumentFrame, TabGoesFromTheTreeToThePageAndFromFieldToField) {
  OpenedSetup setup;
  setup.GoTo("SimSpec/SimulationPeriod");
  auto* tree = ShownTree(setup);
  tree->setFocus();
  const QColor strong = tree->palette().color(QPalette::Highlight);
  std::vector<const QWidget*> stops;
  for (int i = 0; i < 6; ++i) {
    setup.Press(Qt::Key_Tab);
    const QWidget* stop = setup.Window().focusWidget();
    EXPECT_FALSE(qobject_cast<const QScrollArea*>(stop));
    EXPECT_TRUE(stop->isVisible() && stop->visibleRegion().boundingRect().isValid());
    stops.push_back(stop);
  }
  const auto pages = setup.Frame().findChildren<PageView*>();
  EXPECT_TRUE(std::ranges::any_of(pages, [&](auto* page) { return page->isAncestorOf(stops.front()); }));
  // Where the keyboard is can be seen.
  EXPECT_NE(tree->palette().color(QPalette::Highlight), strong);
}

// ---- Processed data

/// A setup with what the preprocessor left of it.
class PreprocessedSetup : public OpenedSetup {
 public:
  PreprocessedSetup() {
    test::WritePreprocessedRun(Folder().File("karup_results"), "karup");
    Rebuild();
  }
  void Rebuild() {
    Frame().RebuildProcessedData();
    QApplication::processEvents();
  }
  std::string ReportPath() const { return Folder().File("karup_results/karup_PreProcessed.kvf"); }
  void GoToPage(const std::string& path) { GoTo("ProcData/Preprocessed data/" + path); }
  std::string Log() {
    std::string text;
    const LogTail& log = Frame().Run().Log();
    for (std::size_t i = 0; i < log.Count(); ++i) text += std::string(log.Line(i)) + "\n";
    return text;
  }
  /// The widget of that class that the page shows.
  template <class Widget>
  Widget* Shown() {
    // Pages that were left may not be deleted yet.
    for (auto* page : Frame().findChildren<PageView*>())
      for (auto* widget : page->findChildren<Widget*>())
        if (widget->isVisible()) return widget;
    return nullptr;
  }
};

TEST(DocumentFrame, EveryKindOfPageOfProcessedDataIsShown) {
  PreprocessedSetup setup;
  const auto map = [&] {
    auto* canvas = setup.Shown<MapCanvas>();
    if (!canvas) return std::string("no map");
    canvas->WaitUntilReady();
    return Summary(canvas->Content());
  };
  const auto text = [&] {
    const auto* view = setup.Shown<QPlainTextEdit>();
    return view ? FromQt(view->toPlainText()) : std::string("no text");
  };
  using testing::HasSubstr;
  const NodeTree& tree = *setup.Frame().findChildren<NodeTree*>()[1];
  setup.GoTo("ProcData");
  EXPECT_TRUE(setup.Shows("14 pages"));
  setup.GoToPage("Climate");
  EXPECT_EQ(map(), "no map");
  EXPECT_EQ(tree.currentItem()->text(0), "Climate");
  setup.GoToPage("Climate/Precipitation");
  ASSERT_TRUE(setup.Shown<SeriesPlot>());
  EXPECT_THAT(FromQt(setup.Shown<SeriesPlot>()->ValuesAsText()), HasSubstr("Precipitation"));
  setup.GoToPage("River bed");
  EXPECT_THAT(FromQt(setup.Shown<QLineEdit>()->text()), HasSubstr("karup_1d.nds1"));
  EXPECT_TRUE(setup.Shown<QLineEdit>()->isReadOnly());
  setup.GoToPage("Topography");
  EXPECT_EQ(map(), "grid 48x36, 53 shapes");
  setup.GoToPage("Topography/River links");  // has no page of its own
  EXPECT_EQ(setup.Frame().CurrentPath(), "ProcData/Preprocessed data/Topography");
  setup.GoToPage("Saturated Zone/Lower level of layers");
  EXPECT_EQ(map(), "grid 48x36");
  setup.GoToPage("Summary");
  EXPECT_EQ(text(), "Cells of the model domain: 1206\nCells with a river link: 97\n\nNo cell had to be filled.");
  setup.GoToPage("Log");
  EXPECT_THAT(text(), HasSubstr("  40  reading and interpolating item 280 ... done\n"));
  setup.GoToPage("CPreprocessedHTML");
  EXPECT_THAT(FromQt(setup.Shown<QTextBrowser>()->toPlainText()), HasSubstr("455 mm"));
  setup.GoToPage("Model Domain and Grid/Sub-basins");
  EXPECT_EQ(map(), "3 shapes");
  EXPECT_FALSE(setup.Session().IsModified());
}

TEST(DocumentFrame, RiverLinksAreDrawnInDarkBlueWhereTheyLie) {
  PreprocessedSetup setup;
  setup.GoToPage("Topography");
  auto* canvas = setup.Shown<MapCanvas>();
  ASSERT_TRUE(canvas);
  canvas->WaitUntilReady();
  canvas->Zoom(4);
  const Shape& link = canvas->Content().shapes.front().shapes->GetData().front();
  canvas->Pan(canvas->Window().rect.center() - canvas->Window().ToScreen(link.points[0]));
  const QImage picture = canvas->grab().toImage();
  // The network itself crosses the link somewhere.
  int blue = 0;
  for (double part = 0; part <= 1; part += 0.05) {
    const MapPoint place{link.points[0].x + part * (link.points[1].x - link.points[0].x),
                         link.points[0].y + part * (link.points[1].y - link.points[0].y)};
    blue += picture.pixelColor(canvas->Window().ToScreen(place).toPoint()) == QColor(0, 0, 0x9a);
  }
  EXPECT_GE(blue, 3);
}

TEST(DocumentFrame, ARebuildKeepsThePageThatIsShownAndFindsALostOneAgain) {
  PreprocessedSetup setup;
  const std::string page = "ProcData/Preprocessed data/Saturated Zone/Second layer";
  setup.GoTo(page);
  setup.Rebuild();
  EXPECT_EQ(setup.Frame().CurrentPath(), page);
  EXPECT_TRUE(setup.Shown<MapCanvas>());
  // Half written: the report has no pages, and the log says why, once.
  const std::string report = test::ReadFile(setup.ReportPath());
  for (const std::size_t size : {report.size() / 3, report.size() / 2}) {
    std::ofstream(setup.ReportPath()) << report.substr(0, size);
    setup.Rebuild();
    setup.Rebuild();
    EXPECT_EQ(setup.Frame().CurrentPath(), "ProcData");
    EXPECT_TRUE(setup.Shows("karup_PreProcessed.kvf:"));
  }
  EXPECT_EQ(QString::fromStdString(setup.Log()).count(ToQt(setup.ReportPath() + ":")), 2);
  std::ofstream(setup.ReportPath()) << report;
  setup.Rebuild();
  EXPECT_EQ(setup.Frame().CurrentPath(), page);
  // A page of the setup is left alone, and one that the user left is not forced on him.
  setup.GoTo("SimSpec/SimTitle:Title");
  setup.Type("being typed");
  setup.Rebuild();
  EXPECT_EQ(setup.Frame().CurrentPath(), "SimSpec/SimTitle");
  EXPECT_EQ(setup.Focused<QLineEdit>()->text(), "being typed");
  EXPECT_FALSE(setup.Session().IsModified());
}

TEST(DocumentFrame, AReportThatChangesOnDiskIsNoticedExceptUnderADialog) {
  OpenedSetup setup;
  const NodeTree& tree = *setup.Frame().findChildren<NodeTree*>()[1];
  const auto pages = [&] { return tree.findItems("Topography", Qt::MatchExactly | Qt::MatchRecursive).size(); };
  EXPECT_EQ(pages(), 0);
  QDialog dialog(&setup.Window());
  dialog.setModal(true);
  dialog.show();
  test::WritePreprocessedRun(setup.Folder().File("karup_results"), "karup");
  QTest::qWait(1300);
  EXPECT_EQ(pages(), 0);
  dialog.hide();
  EXPECT_TRUE(QTest::qWaitFor([&] { return pages() == 1; }, 5000));
  // Deleted, its pages stay until there is a new one.
  setup.GoTo("ProcData");
  std::filesystem::remove(setup.Folder().File("karup_results/karup_PreProcessed.kvf"));
  EXPECT_TRUE(QTest::qWaitFor([&] { return setup.Shows("no more on disk"); }, 5000));
  EXPECT_EQ(pages(), 1);
}

}  // namespace
}  // namespace tervane::document_frame_test
