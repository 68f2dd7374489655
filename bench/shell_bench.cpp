// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What a user waits for at the desktop: the start, a page, a change, an undo. Run it with QT_QPA_PLATFORM=offscreen.
// The peer of the start is a bare window of the toolkit in a process of its own, in the same run; the peer of a page is
// a form of plain widgets of the toolkit.
#include <QApplication>
#include <QFormLayout>
#include <QLineEdit>
#include <QMainWindow>
#include <QProcess>
#include <QScrollArea>
#include <QTemporaryDir>
#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <vector>

#include <fmt/format.h>

#include "bench/desktop_figures.h"
#include "document/edit_session.h"
#include "pages/tree_entries.h"
#include "platform/files.h"
#include "platform/os.h"
#include "shell/document_frame.h"
#include "shell/main_window.h"
#include "shell/program.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"
#include "simspec/basic_parameters.h"
#include "simspec/extra_params.h"
#include "simspec/titles.h"
#include "spatial/zones.h"

namespace tervane::bench {

namespace {

/// Layouts and drawing are part of what a user waits for.
void Settle(QWidget& window) {
  QApplication::processEvents();
  // Pages that were replaced die when the event loop goes on, which it does not do here by itself.
  QApplication::sendPostedEvents(nullptr, QEvent::DeferredDelete);
  window.grab();
}

std::string SetupWithItems(int count) {
  CFlowModelDoc setup;
  std::string text, error;
  if (count > 0) setup.Root().Child<CExtraParamsKvf>()->SetItemCount(count, 1);
  if (!setup.BuildText("/setups", text, error)) fmt::print("not saved: {}\n", error);
  return text;
}

/// As many zones as a river basin has subcatchments in fine grain; the file that they come from is not there.
std::string SetupWithZones(int count) {
  CFlowModelDoc setup;
  auto& zones = *setup.Root().Important(kSubcatchments);
  zones.DistributionType = CSubcatchmentKvf::kDistributed;
  for (int code = 1; code <= count; ++code) {
    const auto zone = zones.CreateStationItem();
    zone->SetStationId(std::to_string(code));
    zone->SetStationName(fmt::format("Zone {}", code));
    zones.AddChild(zone);
  }
  std::string text, error;
  if (!setup.BuildText("/setups", text, error)) fmt::print("not saved: {}\n", error);
  return text;
}

// ---- Starts

int ShowBareWindow(int argc, char** argv) {
  QApplication application(argc, argv);
  QMainWindow window;
  window.resize(1280, 800);
  window.show();
  QApplication::processEvents();
  return window.grab().save(argv[2]) ? 0 : 1;
}

double StartOf(const QString& program, const QStringList& arguments) {
  return MedianOf([&] {
    QProcess process;
    process.setStandardErrorFile(QProcess::nullDevice());
    process.start(program, arguments);
    process.waitForFinished();
    if (process.exitCode() != 0) fmt::print("{} failed\n", FromQt(program));
  });
}

// ---- Pages and changes

/// A page of plain widgets, as many as the longest of ours.
void ShowPlainForm(QMainWindow& window) {
  auto* scroll = new QScrollArea;
  auto* content = new QWidget;
  auto* form = new QFormLayout(content);
  for (int i = 0; i < 20; ++i)
    form->addRow(QString("Maximum head change per iteration %1").arg(i), new QLineEdit("0.005"));
  scroll->setWidget(content);
  scroll->setWidgetResizable(true);
  window.setCentralWidget(scroll);
  Settle(window);
}

void MeasurePages(MainWindow& window) {
  DocumentFrame& frame = *window.Frame();
  std::vector<double> times;
  for (const TreeEntry& entry : TreeEntries(frame.Session().Document().Root(), kSetupDataTree)) {
    std::vector<double> ofPage;
    for (int i = 0; i < kRepetitions; ++i) {
      frame.GoToPath(i % 2 == 0 ? "SimSpec/SimTitle" : "ExtraParams");
      Settle(window);
      ofPage.push_back(Milliseconds([&] {
        frame.GoTo(entry.node->Serial());
        Settle(window);
      }));
    }
    times.push_back(Median(ofPage));
  }
  Report("select a node until its page is drawn, median of all pages", Median(times), 30, "ms");
  Report("the same, slowest page", *std::ranges::max_element(times), 100, "ms");
  QMainWindow plain;
  plain.resize(window.size());
  plain.show();
  ReportPeer("  peer: a form of 20 plain fields", MedianOf([&] { ShowPlainForm(plain); }), "ms");
}

void MeasureChanges(MainWindow& window, const std::string& setup, double limit) {
  DocumentFrame& frame = *window.Frame();
  frame.GoToPath("SimSpec/SimTitle");
  Settle(window);
  auto& title = *frame.Session().Document().Root().Important(kBasicParameters)->Child<CSimTitleKvf>();
  int number = 0;
  const auto change = [&] {
    title.Title = std::to_string(++number);
    frame.Change(title, 1, QString("Change %1").arg(number));
    Settle(window);
  };
  change();
  Report(fmt::format("change a value until all views show it, {}", setup), MedianOf(change), limit, "ms");
  Report(fmt::format("undo of one change, {}", setup), MedianOf([&] {
           frame.Undo();
           Settle(window);
         }),
         std::max(30.0, limit), "ms");
}

// ---- Processed data

/// A report as preprocessors write them: groups of ten pages, grids with few keys.
std::string ReportWithPages(int count) {
  std::string text = "target PreProcessed_Data {\nsection PAGE {\nTITLE = \"Preprocessed data\"\n";
  for (int page = 1; page < count; ++page) {
    if (page % 10 == 1) text += fmt::format("section PAGE {{\nTITLE = \"Group {}\"\nsection BLANK {{\n}}\n", page / 10);
    if (page % 10 != 1)
      text += fmt::format(
          "section PAGE {{\nTITLE = \"Quantity {}\"\nAbbrev = \"Q{}\"\nsection NDS2_PLOT {{\nFilename = file "
          "\"maps_{}.nds2\"\nItemNo = {}\n}}\n}}\n",
          page, page, page, page % 7 + 1);
    if (page % 10 == 0 || page == count - 1) text += "}\n";
  }
  return text + "}\n}\n";
}

void MeasureProcessedData(MainWindow& window, int pages, double limit) {
  DocumentFrame& frame = *window.Frame();
  const CPreprocessedDataManager& manager = *frame.Session().Document().AttachPreprocessorReport();
  std::filesystem::create_directories(std::filesystem::path(manager.Path()).parent_path());
  WriteFileAtomically(manager.Path(), ReportWithPages(pages));
  frame.RebuildProcessedData();
  frame.GoToPath("ProcData/Preprocessed data/Group 0/Quantity 2");
  Settle(window);
  Report(fmt::format("rebuild {} pages of processed data until they are drawn", manager.PageCount()), MedianOf([&] {
           frame.RebuildProcessedData();
           Settle(window);
         }),
         limit, "ms");
}

void Measure(const QString& self) {
  const QTemporaryDir folder;
  Program program(folder.filePath("settings.ini"));
  const QString few = folder.filePath("default.tvd"), many = folder.filePath("many.tvd");
  WriteFileAtomically(FromQt(few), SetupWithItems(0));
  WriteFileAtomically(FromQt(many), SetupWithItems(10'000));
  const QString picture = folder.filePath("picture.png");

  const QString quarzel = QString::fromUtf8(TERVANE_BIN_DIR "/quarzel");
  StartOf(quarzel, {few, "--screenshot", picture});  // warm
  Report("start of the process until the picture of its window is saved",
         StartOf(quarzel, {few, "--screenshot", picture}), 400, "ms");
  ReportPeer("  peer: a bare window of the toolkit", StartOf(self, {"--bare-window", picture}), "ms");
  {
    MainWindow window(program);
    window.resize(1280, 800);
    window.show();
    window.OpenDocument(few);
    Settle(window);
    Report("resident memory with one default setup", static_cast<double>(os::ResidentMemory()) / (1 << 20), 120, "MB");
    MeasurePages(window);
    MeasureChanges(window, "default setup", 16);
    MeasureProcessedData(window, 1000, 200);
    MeasureChanges(window, "1,000 processed pages", 16);
    MeasureProcessedData(window, 100'000, 5000);
    std::filesystem::remove_all(std::filesystem::path(FromQt(few)).replace_extension() += "_results");
  }
  {
    const QString zones = folder.filePath("zones.tvd");
    WriteFileAtomically(FromQt(zones), SetupWithZones(10'000));
    MainWindow window(program);
    window.resize(1280, 800);
    window.show();
    window.OpenDocument(zones);
    MeasureChanges(window, "10,000 zones", 50);
  }
  MainWindow window(program);
  window.resize(1280, 800);
  window.show();
  window.OpenDocument(many);
  MeasureChanges(window, "10,000 items", 50);
  window.Frame()->GoToPath("ExtraParams");
  Settle(window);
  ReportPeer("select the page of 10,000 rows", MedianOf([&] {
               window.Frame()->GoToPath("SimSpec/SimTitle");
               window.Frame()->GoToPath("ExtraParams");
               Settle(window);
             }),
             "ms");
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) {
  if (argc == 3 && std::string(argv[1]) == "--bare-window") return tervane::bench::ShowBareWindow(argc, argv);
  QApplication application(argc, argv);
  const tervane::Theme theme;
  tervane::bench::Measure(QString::fromLocal8Bit(argv[0]));
}
