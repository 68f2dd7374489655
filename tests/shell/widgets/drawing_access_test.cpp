// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/drawing_access.h"

#include <QAbstractButton>
#include <QAccessible>
#include <QLineEdit>
#include <QMenu>
#include <QMenuBar>
#include <QStatusBar>
#include <QTabBar>
#include <algorithm>
#include <map>
#include <set>

#include <gmock/gmock.h>

#include "shell/maps/map_canvas.h"
#include "shell/maps/map_view.h"
#include "shell/widgets/banner.h"
#include "tests/shell/all_windows.h"
#include "tests/shell/rich_setups.h"
#include "tests/support/preprocessed_run.h"

namespace tervane::drawing_access_test {
namespace {

using test::OpenedSetup;

bool IsCell(QAccessible::Role role) {
  return role == QAccessible::Cell || role == QAccessible::ListItem || role == QAccessible::TreeItem ||
         role == QAccessible::ColumnHeader || role == QAccessible::RowHeader;
}

/// What the user works with, so that a name must tell it.
bool IsWorkedWith(const QAccessibleInterface& shown) {
  switch (shown.role()) {
    case QAccessible::PushButton:
    case QAccessible::CheckBox:
    case QAccessible::RadioButton:
    case QAccessible::ComboBox:
    case QAccessible::EditableText:
    case QAccessible::SpinBox:
    case QAccessible::Slider:
    case QAccessible::Table:
    case QAccessible::Tree:
    case QAccessible::List:
    case QAccessible::Graphic:
    case QAccessible::ButtonMenu:
    case QAccessible::PageTab:
      return true;
    default:
      return shown.state().focusable;
  }
}

/// Parts of the toolkit's own widgets, which are worked through these.
bool IsPartOfAnother(const QWidget& widget) {
  return widget.objectName().startsWith("qt_") || qobject_cast<const QLineEdit*>(widget.parentWidget()) ||
         qobject_cast<const QTabBar*>(widget.parentWidget()) || widget.parentWidget()->inherits("QComboBox") ||
         widget.parentWidget()->inherits("QAbstractSpinBox") || widget.inherits("QToolBarExtension") ||
         widget.inherits("QTableCornerButton") || widget.parentWidget()->inherits("QTableView");
}

/// A button that the keyboard never comes to does what a command of a menu does too.
bool IsReached(const QAbstractButton& button) {
  return (button.focusPolicy() & Qt::TabFocus) || !button.actions().isEmpty() || !button.shortcut().isEmpty();
}

/// All that a screen reader is not told of what is shown in a window.
class Reading {
 public:
  explicit Reading(QWidget& window) { Read(QAccessible::queryAccessibleInterface(&window)); }

  const std::set<std::string>& Faults() const { return faults_; }
  int Count() const { return count_; }

 private:
  void Read(QAccessibleInterface* shown) {
    constexpr int kMostCells = 150;  ///< Of one table or tree.
    if (!shown || !shown->isValid() || shown->state().invisible) return;
    Check(*shown);
    const bool holdsCells = shown->tableInterface() || shown->role() == QAccessible::List;
    const int most = holdsCells ? std::min(shown->childCount(), kMostCells) : shown->childCount();
    for (int i = 0; i < most; ++i) Read(shown->child(i));
  }

  void Check(const QAccessibleInterface& shown) {
    const auto* widget = qobject_cast<const QWidget*>(shown.object());
    if (widget && !widget->isWindow() && IsPartOfAnother(*widget)) return;
    ++count_;
    const QString name = shown.text(QAccessible::Name);
    const QAccessible::State state = shown.state();
    if (IsCell(shown.role())) {
      // An empty cell says so; a mark in it says nothing without a name.
      if (state.checkable && name.isEmpty()) Tell(shown, "a mark without a name");
      return;
    }
    // The keyboard goes to the proxy, which is read itself.
    if (widget && (widget->isWindow() || widget->focusProxy())) return;
    if (IsWorkedWith(shown) && name.isEmpty()) Tell(shown, "no name");
    if (state.focusable && shown.role() == QAccessible::Client) Tell(shown, "no role");
    if (const auto* button = qobject_cast<const QAbstractButton*>(widget); button && !IsReached(*button))
      Tell(shown, "no key comes to it");
  }

  void Tell(const QAccessibleInterface& shown, const char* what) {
    std::string place;
    for (const QObject* at = shown.object(); at; at = at->parent()) {
      if (const QString name(at->metaObject()->className()); name != "QWidget") place += " < " + FromQt(name);
      if (place.size() > 120) break;
    }
    faults_.insert(std::string(what) + ": " + FromQt(shown.text(QAccessible::Name)) + " role " +
                   std::to_string(shown.role()) + place);
  }

  std::set<std::string> faults_;
  int count_ = 0;
};

void ExpectRead(QWidget& window) {
  for (int i = 0; i < 3; ++i) QApplication::processEvents();
  const Reading reading(window);
  EXPECT_THAT(reading.Faults(), testing::IsEmpty());
  EXPECT_GT(reading.Count(), 1);
}

TEST(Accessibility, EveryPageTellsWhatItShows) {
  for (const char* sections : test::kRichSetups) {
    OpenedSetup setup(sections);
    test::WritePreprocessedRun(setup.Folder().File("karup_results"), "karup");
    setup.Frame().RebuildProcessedData();
    for (const int tree : {kSetupDataTree, kProcessedDataTree, kResultsTree}) {
      for (const std::string& path : test::PagesOf(setup, tree)) {
        SCOPED_TRACE(path);
        setup.GoTo(path);
        ExpectRead(setup.Window());
      }
    }
  }
}

/// Letters that lead to several things of a window, or of one of its menus.
std::string SharedLetters(const QWidget& window) {
  std::string shared;
  std::map<QString, QString> letters;
  const auto add = [&](const QString& text, std::map<QString, QString>& known) {
    const QString letter = QKeySequence::mnemonic(text).toString();
    if (letter.isEmpty()) return;
    const auto [place, isNew] = known.emplace(letter, text);
    if (!isNew) shared += FromQt(place->second + " and " + text + "\n");
  };
  if (const auto* main = qobject_cast<const QMainWindow*>(&window))
    for (const QAction* menu : main->menuBar()->actions()) add(menu->text(), letters);
  for (const QWidget* widget : window.findChildren<QWidget*>()) {
    if (const auto* menu = qobject_cast<const QMenu*>(widget)) {
      std::map<QString, QString> own;
      for (const QAction* action : menu->actions()) add(action->text(), own);
    }
    if (!widget->isVisible() || widget->window() != &window) continue;
    if (const auto* button = qobject_cast<const QAbstractButton*>(widget)) add(button->text(), letters);
    if (const auto* label = qobject_cast<const QLabel*>(widget); label && label->buddy()) add(label->text(), letters);
  }
  return shared;
}

TEST(Accessibility, EveryTabWindowAndDialogTellsWhatItShows) {
  int count = 0;
  test::LookAtAllWindows([&count](const std::string& name, QWidget& window) {
    SCOPED_TRACE(name);
    ++count;
    ExpectRead(window);
    EXPECT_EQ(SharedLetters(window), "");
  });
  EXPECT_GT(count, 25);
}

TEST(Accessibility, AWindowWithoutADocumentTellsWhatItShows) {
  const test::TempFolder folder;
  Program program(ToQt(folder.File("quarzel.ini")));
  MainWindow window(program);
  window.show();
  ExpectRead(window);
}

TEST(Accessibility, AFieldTellsItsUnitAndWhatIsWrongWithIt) {
  OpenedSetup setup;
  setup.GoTo("SimSpec/CompControlParaTimeStep:InitialTimeStep");
  const auto read = [field = setup.Focused<QLineEdit>()](QAccessible::Text kind) {
    return FromQt(QAccessible::queryAccessibleInterface(field)->text(kind));
  };
  EXPECT_EQ(read(QAccessible::Name), "Initial time step");
  EXPECT_THAT(read(QAccessible::Description), testing::HasSubstr("hours"));
  setup.Type("abc");
  setup.Press(Qt::Key_Return);
  EXPECT_THAT(read(QAccessible::Description), testing::HasSubstr("Not taken"));
  setup.Press(Qt::Key_Escape);
  EXPECT_THAT(read(QAccessible::Description), testing::Not(testing::HasSubstr("Not taken")));
}

TEST(Accessibility, FindingsSavesAndBarsAreTold) {
  OpenedSetup setup(
      "section SimSpec {\nsection ModelComp {\nWQ = 1\nUseCurrentWmSimulation = 0\n}\n}\n"
      "section ModelCompWQ {\nsection SimulationPeriodWQ {\nSimStart = 2000, 1, 1, 0, 0\n}\n}");
  const auto findings = [&] { return FromQt(setup.Frame().findChild<FindingsView*>()->accessibleName()); };
  const std::string before = findings();
  EXPECT_THAT(before, testing::HasSubstr("Findings ("));
  setup.GoTo("SimSpec/SimulationPeriod:SIMSTART");
  setup.Type("2000-01-20");
  setup.Press(Qt::Key_Return);
  EXPECT_NE(findings(), before) << "another number of findings";
  setup.Command("Save");
  EXPECT_THAT(FromQt(setup.Window().statusBar()->accessibleName()), testing::HasSubstr("Saved as "));
  setup.Folder().Write("karup.tvd", test::SetupText(14, {}));
  setup.Frame().CheckDisk();
  std::vector<std::string> bars;
  for (const Banner* bar : setup.Frame().findChildren<Banner*>()) bars.push_back(FromQt(bar->accessibleName()));
  EXPECT_THAT(bars, testing::Contains(testing::HasSubstr("Another program has changed the file")));
}

TEST(Accessibility, AMapIsADrawingThatTellsWhatIsPointedAt) {
  OpenedSetup setup(test::Example{"rhone", "rhone.tvd"});
  setup.GoTo("Topography");
  // The first page has a map too, and may not be gone yet.
  const auto maps = setup.Window().findChildren<MapView*>();
  const auto shown = std::ranges::find_if(maps, &MapView::isVisible);
  ASSERT_NE(shown, maps.end());
  MapView* map = *shown;
  const QAccessibleInterface* read = QAccessible::queryAccessibleInterface(&map->Canvas());
  EXPECT_EQ(read->role(), QAccessible::Graphic);
  EXPECT_EQ(FromQt(read->text(QAccessible::Name)), "Map");
  ASSERT_TRUE(QTest::qWaitFor([map] { return !map->IsBusy(); }));
  // Without a pointer it tells what is drawn, then what is pointed at.
  EXPECT_THAT(FromQt(read->text(QAccessible::Description)), testing::HasSubstr("cells of"));
  EXPECT_THAT(FromQt(read->text(QAccessible::Description)), testing::HasSubstr("dem [m]: 4000"));
  for (const Qt::Key key : {Qt::Key_Up, Qt::Key_Left}) {
    QTest::keyClick(&map->Canvas(), key, Qt::ControlModifier);
    EXPECT_EQ(read->text(QAccessible::Description), map->Canvas().TextAt(*map->Canvas().ReadingMark()));
  }
}

}  // namespace
}  // namespace tervane::drawing_access_test
