// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Every tab, window and dialog of the program, one after the other, for tests that look at all of them.
#pragma once

#include <QDialog>
#include <QTabWidget>
#include <QTimer>
#include <functional>
#include <string>

#include <gtest/gtest.h>

#include "libraries/vegetations.h"
#include "shell/findings_view.h"
#include "shell/item_dialog.h"
#include "shell/library_dialog.h"
#include "shell/relief/relief_window.h"
#include "shell/run_comparison_view.h"
#include "shell/why_dialog.h"
#include "tests/shell/opened_setup.h"

namespace tervane::test {

using LookAtWindow = std::function<void(const std::string& name, QWidget& window)>;

/// Looks at the dialog that something opens, and gives it up.
inline void LookAtDialog(const std::string& name, const LookAtWindow& look, const std::function<void()>& open) {
  bool isSeen = false;
  QTimer timer;
  timer.setInterval(2);
  QObject::connect(&timer, &QTimer::timeout, [&] {
    auto* dialog = qobject_cast<QDialog*>(QApplication::activeModalWidget());
    if (!dialog) return;
    timer.stop();
    isSeen = true;
    look(name, *dialog);
    dialog->reject();
  });
  timer.start();
  open();
  EXPECT_TRUE(isSeen) << name;
}

inline void LookAtAllWindows(const LookAtWindow& look) {
  OpenedSetup setup(Example{"rhone", "rhone_faults.tvd"});
  MainWindow& window = setup.Window();
  DocumentFrame& frame = setup.Frame();
  const auto file = [&](const char* name) { return setup.Folder().File(name); };
  setup.GoTo("Topography");
  look("a map", window);
  setup.GoTo("Climate/PrecipitationRate");
  look("a page of stations", window);
  frame.StartFind();
  QTest::keyClicks(window.focusWidget(), "depth");
  look("places found", window);
  setup.Press(Qt::Key_Escape);
  for (QTabWidget* tabs : frame.findChildren<QTabWidget*>()) {
    if (tabs->indexOf(frame.findChild<FindingsView*>()) < 0) continue;
    for (int tab = 0; tab < tabs->count(); ++tab) {
      tabs->setCurrentIndex(tab);
      look(FromQt(tabs->tabText(tab)), window);
    }
  }
  frame.ShowText(true);
  look("the text", window);
  frame.StartFind();
  look("finding in the text", window);
  frame.ShowText(false);

  setup.GoTo("SimSpec/SimTitle:Title");
  setup.Type("Rhone");
  for (const QString& command :
       {MainWindow::tr("&What will be saved…"), MainWindow::tr("What Is &Missing?"), MainWindow::tr("&Keys"),
        MainWindow::tr("&About Quarzel"), MainWindow::tr("Add &Note…")})
    LookAtDialog(FromQt(command), look, [&] { setup.Command(QString(command).remove('&')); });
  setup.GoTo("Climate/AirTemperature");
  LookAtDialog("a form", look, [&] { EXPECT_TRUE(frame.PressButton("Create...")); });
  const Explanation why{"Snow Melt", false, {{false, "Include snow melt must be on", "Climate", 7, "Climate", "SM"}}};
  WhyDialog because("Why Is This Here?", {why}, "takes part, since", "takes no part, since", nullptr);
  because.show();
  look("why", because);
  ItemDialog items(
      {"Choose an item", file("dem.nds2"), {"Item", "Quantity"}, {{{"dem", "Elevation"}, "it is too late"}}}, nullptr);
  items.show();
  look("items", items);
  NobodyToAsk host;
  LibraryDialog library({kVegetationLibrary, file("crops.etv"), "Maize"}, host, nullptr);
  library.show();
  look("a library's entries", library);

  EXPECT_TRUE(window.CompareWith(frame, file("rhone_quality.tvd")));
  look("a comparison", window);
  EXPECT_TRUE(window.MergeWith(frame, file("rhone.tvd"), file("rhone.tvd")));
  look("a merge", window);
  RunComparison runs;
  runs.firstTitle = "rhone.tvd, 2026-11-25 10:00:00 UTC";
  runs.secondTitle = "rhone.tvd, 2026-11-26 10:00:00 UTC";
  runs.points = {{"Mill", "Discharge", "m³/s", 0, RunStatistics{}, RunStatistics{}}};
  RunComparisonView compared(runs);
  compared.setWindowTitle(compared.Title());
  compared.resize(1280, 800);
  compared.show();
  look("two runs", compared);
  const std::string processes = setup.Folder().Write(
      "a.kinetra",
      "target KINETRA_SETUP {\nsection STATE_VARIABLES {\nsection STATE_VARIABLE_1 {\nSYMBOL = \"A\"\n}\n}\n}\n");
  EXPECT_TRUE(window.ShowTemplate(ToQt(processes)));
  look("a template", window);
  for (const char* name : {"precipitation.nds0", "dem.nds2", "crops.etv"}) {
    EXPECT_TRUE(window.OpenFile(ToQt(file(name))));
    look(name, window);
    if (std::string_view(name).ends_with("etv")) continue;
    EXPECT_TRUE(window.EditDataFile(ToQt(file(name))));
    look(std::string(name) + " edited", window);
  }
  ReliefWindow* ground = window.ShowGround(frame);
  ASSERT_TRUE(ground);
  look("the ground", *ground);
  ground->close();
}

}  // namespace tervane::test
