// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include <QShortcut>
#include <QTextBrowser>
#include <filesystem>
#include <map>
#include <set>

#include <gmock/gmock.h>

#include "execution/engine_search.h"
#include "shell/charts/series_plot.h"
#include "shell/findings_view.h"
#include "shell/maps/map_canvas.h"
#include "shell/maps/map_view.h"
#include "shell/relief/relief_canvas.h"
#include "shell/relief/relief_window.h"
#include "shell/run/document_run.h"
#include "shell/run/log_view.h"
#include "shell/widgets/keys_dialog.h"
#include "tests/shell/opened_setup.h"
#include "tests/shell/typist.h"

namespace tervane::main_menus_test {
namespace {

using test::Typist;

/// An empty window, as a user meets it, with copies of examples.
class Tutorial : public testing::Test {
 protected:
  void SetUp() override {
    const std::string examples = std::string(TERVANE_SOURCE_DIR) + "/examples";
    std::filesystem::copy(examples + "/rhone", folder_.Path(), std::filesystem::copy_options::recursive);
    std::filesystem::copy(examples + "/water_quality.tvd", folder_.Path());
    program_.Settings().setValue(kEnginePathSetting, TERVANE_BIN_DIR "/engines");
    window_.resize(1280, 800);
    window_.show();
    window_.activateWindow();
    ASSERT_TRUE(QTest::qWaitForWindowActive(&window_));
  }
  QString File(const char* name) { return ToQt(folder_.File(name)); }
  std::string Path() { return window_.Frame() ? window_.Frame()->CurrentPath() : std::string(); }
  std::string Value(std::string_view path) { return test::ValueOf(window_.Frame()->Session().Document(), path); }
  int Findings() { return window_.Frame()->findChild<FindingsView*>()->Count(); }
  std::function<bool()> IsAt(const char* path) {
    return [this, path] { return Path() == path; };
  }
  std::function<bool()> HasFindings(int count) {
    return [this, count] { return Findings() == count; };
  }

  test::TempFolder folder_;
  Program program_{ToQt(folder_.File("settings/quarzel.ini"))};
  MainWindow window_{program_};
};

TEST_F(Tutorial, TheFirstStepsNeedNoMouse) {
  Typist user;
  user.Press("Ctrl+N")
      .Until("a new setup", [this] { return window_.Frame() != nullptr; })
      .Press("Ctrl+W")
      .Until("it is closed", [this] { return window_.Frame() == nullptr; })
      .Press("Ctrl+O")
      .At("File name")
      .Type(File("water_quality.tvd"))
      .Press("Return")
      .Until("the setup is open", [this] { return window_.Frame() != nullptr; })
      .Check([this] { EXPECT_EQ(Findings(), 3); })
      .Press("F8")
      .Press("F8")
      .At("Start Date")
      .Type("2001-04-01")
      .Press("Return")
      .Until("the finding is gone", HasFindings(2))
      .Press("Ctrl+Z")
      .Until("the finding is back", HasFindings(3))
      .Press("Ctrl+Shift+Z")
      .Until("the finding is gone", HasFindings(2))
      .Press("Alt+F, W")
      .Until("the changes are shown", [] { return QApplication::activeModalWidget() != nullptr; })
      .Press("Alt+S")
      .Until("it is saved", [this] { return !window_.Frame()->Session().IsModified(); })
      .Run();
  EXPECT_THAT(test::ReadFile(folder_.File("water_quality.tvd")), testing::HasSubstr("2001, 4, 1"));
}

TEST_F(Tutorial, TheFirstRunNeedsNoMouse) {
  Typist user;
  const auto hasEnded = [this] { return !window_.Frame()->Run().IsExecuting(); };
  const auto told = [this](const char* text) {
    return [this, text] {
      for (const QLabel* label : window_.findChildren<QLabel*>())
        if (label->isVisible() && label->text().contains(text)) return true;
      return false;
    };
  };
  int findings = 0;
  user.Press("Ctrl+O")
      .At("File name")
      .Type(File("rhone.tvd"))
      .Press("Return")
      .Until("the setup is open", [this] { return window_.Frame() != nullptr; })
      // 1. A place in the tree, and a polygon of its map.
      .To("Climate", "Down")
      .Press("Right")
      .To("Precipitation Rate (50)", "Down")
      .Until("its page", IsAt("Climate/PrecipitationRate"))
      .To("Map", "F6")
      .Until("it is drawn", [] { return Typist::Told(QAccessible::Description).contains("Shapes: 50"); })
      .Check([] {
        const auto* ring = QApplication::focusWidget()->findChild<QWidget*>("FocusRing");
        EXPECT_TRUE(ring && ring->isVisible()) << "who has come by keys sees where he is";
      })
      .Press("Ctrl+Right")
      .Until("a polygon is told", [] { return Typist::Told(QAccessible::Description).contains("shape"); })
      .Press("+")
      .Press("Home")
      .Press("Return")
      .Until("its gauge", [this] { return Path().starts_with("Climate/PrecipitationRate/TIME_SERIES_"); })
      .Press("Alt+Left")
      .Until("back", IsAt("Climate/PrecipitationRate"))
      // 2. A wrong file, by the dialog and typed.
      .Press("Ctrl+F")
      .Type("Air Temperature")
      .Press("Return")
      .Until("the page of temperature", IsAt("Climate/AirTemperature"))
      .To("Time Series File")
      .Check([&] { findings = Findings(); })
      .Press("Tab")
      .Press("Space")
      .At("File name")
      .Type(File("precipitation.nds0"))
      .Press("Return")
      .Until("the file is refused",
             [] { return Typist::Told(QAccessible::Description).startsWith("It cannot be chosen"); })
      .Press("Escape")
      .To("Time Series File", "Shift+Tab")
      .Type("precipitation.nds0")
      .Press("Return")
      .Until("a finding", [&] { return Findings() > findings; })
      .Press("Ctrl+Z")
      .Until("the finding is gone", [&] { return Findings() == findings; })
      // 3. A run.
      .Press("Alt+R, X")
      .Until("the run is done", [&] { return hasEnded() && told("The run is done after")(); })
      // 4. What it made.
      .Press("Ctrl+F")
      .Press("Escape")
      .At("Air Temperature")
      .To("Setup Data", "Shift+Tab")
      .Press("Right")
      .Until("the summary", [this] { return Path().starts_with("ProcData"); })
      .Press("Tab")
      .To("Topography", "Down")
      .To("Map", "F6")
      .Press("Ctrl+Left")
      .Until("a value is told", [] { return Typist::Told(QAccessible::Description).contains(" m"); })
      // 5. A run that fails.
      .Press("Ctrl+F")
      .Type("Simulation period")
      .Press("Return")
      .Until("the page of the period", IsAt("SimSpec/SimulationPeriod"))
      .To("End Date")
      .Type("2016-06-30")
      .Press("Return")
      .Until("warnings", [&] { return Findings() > findings; })
      .Press("F9")
      .Until("the run fails", [&] { return hasEnded() && told("The engine failed after")(); })
      .Press("Ctrl+Z")
      .Until("the warnings are gone", [&] { return Findings() == findings; })
      .Press("Ctrl+S")
      .Until("it is saved", [this] { return !window_.Frame()->Session().IsModified(); })
      .Press("Ctrl+W")
      .Until("it is closed", [this] { return window_.Frame() == nullptr; })
      .Run();
}

// ---- The table of keys

/// The tables of the manual's page by their headings, without its marks.
std::vector<KeyGroup> KeysOfManual() {
  std::vector<KeyGroup> groups;
  const QString page = ToQt(test::ReadFile(std::string(TERVANE_SOURCE_DIR) + "/docs/manual/keys.md"));
  for (const QString& line : page.split('\n')) {
    if (line.startsWith("## ")) groups.push_back({line.mid(3), {}});
    if (groups.empty() || !line.startsWith("| ") || line.startsWith("| Key |")) continue;
    const QStringList cells = line.split('|');
    groups.back().rows.push_back({QString(cells[1]).remove('`').trimmed(), cells[2].trimmed()});
  }
  return groups;
}

/// "Alt+Left" for each key of "Alt+Left, Alt+Right".
std::set<std::string> EachKey(const QString& keys) {
  std::set<std::string> each;
  for (const QString& key : QString(keys).replace(" or ", ", ").split(", "))
    each.insert(FromQt(QKeySequence::fromString(QString(key).replace("Page ", "Pg")).toString()));
  return each;
}

TEST(Keys, TheManualTellsThoseOfTheProgram) {
  std::vector<KeyGroup> manual = KeysOfManual();
  ASSERT_GT(manual.size(), 5U);
  EXPECT_EQ(manual.back().rows.size(), 0U) << "it ends with prose";
  manual.pop_back();
  const std::vector<KeyGroup> parts = KeysOfParts();
  ASSERT_EQ(manual.size(), parts.size() + 1);
  for (std::size_t group = 0; group < parts.size(); ++group) {
    SCOPED_TRACE(FromQt(parts[group].place));
    EXPECT_EQ(manual[group + 1].place, parts[group].place);
    ASSERT_EQ(manual[group + 1].rows.size(), parts[group].rows.size());
    for (std::size_t row = 0; row < parts[group].rows.size(); ++row) {
      EXPECT_EQ(manual[group + 1].rows[row].keys, parts[group].rows[row].keys);
      EXPECT_EQ(manual[group + 1].rows[row].what, parts[group].rows[row].what);
    }
  }
  // What works everywhere are the commands of the window.
  test::OpenedSetup setup;
  std::set<std::string> commands, told;
  for (const QAction* action : setup.Window().findChildren<QAction*>()) {
    if (action->shortcutContext() == Qt::WindowShortcut)
      for (const QKeySequence& key : action->shortcuts()) commands.insert(FromQt(key.toString()));
    // Those that a widget has itself are told in the menu alone; of tables they are told there.
    if (const QString key = action->text().section('\t', 1); !key.isEmpty() && key != "Ctrl+D")
      commands.insert(FromQt(key));
  }
  for (const KeyRow& row : manual.front().rows) told.merge(EachKey(row.keys));
  EXPECT_EQ(commands, told);
}

TEST(Keys, EveryShortcutOfAPartIsTold) {
  std::set<std::string> told;
  for (const KeyGroup& group : KeysOfManual())
    for (const KeyRow& row : group.rows) told.merge(EachKey(row.keys));
  test::OpenedSetup setup(test::Example{"rhone", "rhone.tvd"});
  MainWindow& window = setup.Window();
  int count = 0;
  const auto look = [&](const QString& key) {
    if (key.isEmpty()) return;
    ++count;
    EXPECT_TRUE(told.contains(FromQt(key))) << FromQt(key);
  };
  const auto lookAtAll = [&] {
    for (const QAction* action : window.findChildren<QAction*>())
      if (action->shortcutContext() != Qt::WindowShortcut)
        for (const QKeySequence& key : action->shortcuts()) look(key.toString());
    for (const QShortcut* shortcut : window.findChildren<QShortcut*>())
      for (const QKeySequence& key : shortcut->keys()) look(key.toString());
  };
  for (const char* path : {"Climate/PrecipitationRate", "SZ/GeoLayers", "LandUse/Vegetation"})
    if (setup.Frame().GoToPath(path)) lookAtAll();
  setup.Frame().ShowText(true);
  lookAtAll();
  for (const char* file : {"dem.nds2", "temperature.nds0"}) {
    EXPECT_TRUE(window.EditDataFile(ToQt(setup.Folder().File(file))));
    lookAtAll();
  }
  EXPECT_TRUE(window.OpenFile(ToQt(setup.Folder().File("crops.etv"))));
  lookAtAll();
  EXPECT_GT(count, 15);
}

/// The keys of a row as they are pressed.
QStringList Pressed(const QString& keys) {
  QStringList pressed;
  for (const QString& key : keys.split(", ")) {
    const QString with = key == "Ctrl with arrows" ? "Ctrl+" : "";
    if (key == "Arrows" || !with.isEmpty())
      for (const char* arrow : {"Left", "Right", "Up", "Down"}) pressed << with + arrow;
    else
      pressed << QString(key).replace("Page ", "Pg");
  }
  return pressed;
}

TEST(Keys, MapsChartsAndOtherPartsTakeThoseThatAreTold) {
  test::OpenedSetup setup(test::Example{"rhone", "rhone.tvd"});
  NobodyToAsk host;
  MapView map(host);
  MapContent content;
  content.points = {{{{0, 0}, {100, 100}}}};
  content.request = MapRequest{MapRequest::Kind::Line, "Draw.", {}};
  map.Show(content, nullptr);
  SeriesPlot chart(host);
  SeriesContent curves;
  curves.request = DateRequest{"Click.", {}};
  for (int panel = 0; panel < 40; ++panel) {
    curves.series.push_back({"Level", "m", {CYbDateTime(2000, 1, 1), CYbDateTime(2000, 1, 2)}, {1, 2}});
    curves.series.back().panel = panel;
  }
  chart.resize(600, 400);
  chart.show();
  chart.Show(curves);
  ReliefWindow* ground = setup.Window().ShowGround(setup.Frame());
  ASSERT_TRUE(ground);
  const std::map<QString, QWidget*> parts = {{"On a map", &map.Canvas()},
                                             {"On a chart or a section", chart.FocusTarget()},
                                             {"In the 3D view", ground->findChild<ReliefCanvas*>()},
                                             {"In a log", setup.Frame().findChild<LogView*>()}};
  std::size_t found = 0;
  for (const KeyGroup& group : KeysOfParts()) {
    const auto part = parts.find(group.place);
    if (part == parts.end()) continue;
    ++found;
    for (const KeyRow& row : group.rows) {
      for (const QString& key : Pressed(row.keys)) {
        SCOPED_TRACE(FromQt(group.place + ": " + key));
        const QKeySequence keys = QKeySequence::fromString(key);
        ASSERT_EQ(keys.count(), 1);
        QKeyEvent event(QEvent::KeyPress, keys[0].key(), keys[0].keyboardModifiers());
        QApplication::sendEvent(part->second, &event);
        EXPECT_TRUE(event.isAccepted());
      }
    }
  }
  EXPECT_EQ(found, parts.size());
  ground->close();
}

TEST(Keys, TheDialogListsCommandsAndParts) {
  test::OpenedSetup setup;
  QString shown;
  QTimer::singleShot(0, [&shown] {
    if (const auto* dialog = qobject_cast<KeysDialog*>(QApplication::activeModalWidget()))
      shown = dialog->findChild<QTextBrowser*>()->toPlainText();
    QTest::keyClick(QApplication::activeModalWidget(), Qt::Key_Escape);
  });
  setup.Command("Keys");
  for (const char* told : {"Ctrl+S", "Next Pane", "Move the reading mark"}) EXPECT_TRUE(shown.contains(told)) << told;
}

}  // namespace
}  // namespace tervane::main_menus_test
