// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How long an event waits in the desktop while an engine prints: 100,000 lines a second, 1 GB as fast as it can, and
// messages that become findings. A thread posts an event each millisecond and the window's thread notes how late it
// comes. Run it with QT_QPA_PLATFORM=offscreen. The engine is this program again.
#include <QApplication>
#include <QCoreApplication>
#include <QElapsedTimer>
#include <QTemporaryDir>
#include <atomic>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <thread>
#include <vector>

#include <fmt/format.h>

#include "bench/desktop_figures.h"
#include "document/flow_model_document.h"
#include "execution/engine_search.h"
#include "platform/files.h"
#include "platform/os.h"
#include "shell/document_frame.h"
#include "shell/main_window.h"
#include "shell/program.h"
#include "shell/run/document_run.h"
#include "shell/widgets/qt_text.h"
#include "shell/widgets/theme.h"

namespace tervane::bench {

namespace {

using Clock = std::chrono::steady_clock;

double MillisecondsSince(Clock::time_point begin) {
  return std::chrono::duration<double, std::milli>(Clock::now() - begin).count();
}

// ---- The engine

/// Prints so many lines a second for a while.
int PrintLines(int perSecond, int seconds) {
  const auto begin = Clock::now();
  long long printed = 0;
  for (double now = 0; now < seconds * 1000.0; now = MillisecondsSince(begin)) {
    for (; printed < static_cast<long long>(now * perSecond / 1000); ++printed)
      fmt::print("progress {:.2f} time step {}, water balance error 1.2e-05 mm\n", now / (seconds * 10.0), printed);
    std::fflush(stdout);
    std::this_thread::sleep_for(std::chrono::milliseconds(1));
  }
  return 0;
}

int PrintGigabyte() {
  const std::string line = "time step 4711, water balance error 1.2e-05 mm, 3 iterations\n";
  for (std::size_t done = 0; done < 1'000'000'000; done += line.size()) fmt::print("{}", line);
  return 0;
}

int PrintMessages() {
  for (int i = 0; i < 1000; ++i) {
    fmt::print("error: SimSpec/SimTitle:Title: problem {} of many\n", i);
    std::fflush(stdout);
    std::this_thread::sleep_for(std::chrono::milliseconds(5));
  }
  return 0;
}

// ---- The measurement

class Stamped : public QEvent {
 public:
  Stamped() : QEvent(QEvent::User), begin(Clock::now()) {}
  Clock::time_point begin;
};

/// Posts an event to itself each millisecond, from another thread.
class Probe : public QObject {
 public:
  Probe() {
    thread_ = std::thread([this] {
      while (!isOver_) {
        QCoreApplication::postEvent(this, new Stamped);
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
      }
    });
  }
  ~Probe() override {
    isOver_ = true;
    thread_.join();
    QCoreApplication::removePostedEvents(this);
  }
  std::vector<double> delays;

 protected:
  bool event(QEvent* event) override {
    if (event->type() != QEvent::User) return QObject::event(event);
    delays.push_back(MillisecondsSince(static_cast<Stamped*>(event)->begin));
    return true;
  }

 private:
  std::atomic<bool> isOver_{false};
  std::thread thread_;
};

void ReportDelays(const std::string& while_, std::vector<double> delays) {
  std::ranges::sort(delays);
  ReportPeer(fmt::format("99.9 % of {} events wait, {}", delays.size(), while_), delays[delays.size() * 999 / 1000],
             "ms");
  Report("the longest wait, " + while_, delays.back(), 50, "ms");
}

void MeasureIdle(int seconds) {
  Probe probe;
  QElapsedTimer timer;
  timer.start();
  while (timer.elapsed() < seconds * 1000) QApplication::processEvents(QEventLoop::WaitForMoreEvents);
  ReportDelays("nothing runs", probe.delays);
}

/// Runs an engine that does what the arguments say.
void MeasureRun(MainWindow& window, const std::string& engine, const std::string& arguments, const std::string& what) {
  const std::string script = fmt::format("#!/bin/sh\nexec '{}' {}\n", os::ProgramPath(), arguments);
  WriteFileAtomically(engine, script);
  std::filesystem::permissions(engine, std::filesystem::perms::owner_all);
  DocumentRun& run = window.Frame()->Run();
  std::vector<double> delays;
  {
    Probe probe;
    window.Frame()->Session().Document().RunEngine("/WM");
    while (run.IsExecuting()) QApplication::processEvents(QEventLoop::WaitForMoreEvents);
    delays = probe.delays;
  }
  fmt::print("{}: {}\n", what, FromQt(run.Sentence()));
  ReportDelays(what, delays);
  const std::uint64_t lines = run.Log().Dropped() + run.Log().Count();
  ReportPeer("lines that came", static_cast<double>(lines), "");
  ReportPeer("lines on screen", static_cast<double>(run.Log().Count()), "");
  ReportPeer("memory", static_cast<double>(os::ResidentMemory()) / (1 << 20), "MB");
}

void Measure() {
  const QTemporaryDir folder;
  const std::string setup = FromQt(folder.filePath("karup.tvd"));
  Program program(folder.filePath("settings.ini"));
  program.Settings().setValue(kEnginePathSetting, folder.path());
  const std::string engine = FromQt(folder.filePath("Tvn_Simulation"));
  CFlowModelDoc().OnSaveDocument(setup);
  MainWindow window(program);
  window.resize(1280, 800);
  window.show();
  window.OpenDocument(ToQt(setup));
  QApplication::processEvents();
  MeasureIdle(3);
  MeasureRun(window, engine, "--lines 100000 10", "100,000 lines a second");
  MeasureRun(window, engine, "--gigabyte", "1 GB at once");
  MeasureRun(window, engine, "--messages", "1,000 messages");
}

}  // namespace

}  // namespace tervane::bench

int main(int argc, char** argv) {
  using namespace tervane::bench;
  const std::string mode = argc > 1 ? argv[1] : "";
  // Behind them the runner puts the setup and its options.
  if (mode == "--lines" && argc > 3) return PrintLines(std::atoi(argv[2]), std::atoi(argv[3]));
  if (mode == "--gigabyte") return PrintGigabyte();
  if (mode == "--messages") return PrintMessages();
  QApplication application(argc, argv);
  const tervane::Theme theme;
  Measure();
}
