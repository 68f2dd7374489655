// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "shell/widgets/background.h"

#include <QDeadlineTimer>
#include <QPromise>
#include <QSemaphore>
#include <QThreadPool>
#include <algorithm>
#include <unordered_map>

#include "shell/widgets/qt_text.h"

namespace tervane {

namespace {

/// Apart from the toolkit's own, so that a drive that does not answer keeps no picture from being drawn.
QThreadPool& Threads() {
  static QThreadPool pool;
  // What was cancelled takes some milliseconds to end, and must not keep what follows it waiting.
  pool.setMaxThreadCount(4);
  return pool;
}

}  // namespace

struct Background::Run {
  /// What the thread and the waiting callers share; the thread holds all that it works on.
  struct Shared {
    std::shared_ptr<Computation> computation;
    Progress progress;
    QSemaphore ended;
  };
  std::shared_ptr<Shared> shared = std::make_shared<Shared>();
  QFuture<void> future;

  /// The run of a computation that somebody waits for already, or a new one.
  static std::shared_ptr<Run> Of(const std::shared_ptr<Computation>& computation) {
    static std::unordered_map<const Computation*, std::weak_ptr<Run>> running;
    std::erase_if(running, [](const auto& entry) { return entry.second.expired(); });
    std::weak_ptr<Run>& known = running[computation.get()];
    if (auto run = known.lock(); run && !run->shared->progress.IsCancelled()) return run;
    auto run = std::make_shared<Run>();
    run->shared->computation = computation;
    auto promise = std::make_shared<QPromise<void>>();
    run->future = promise->future();
    promise->start();
    Threads().start([promise, shared = run->shared] {
      shared->computation->Run(shared->progress);
      shared->ended.release();
      promise->finish();
    });
    known = run;
    return run;
  }
  ~Run() { shared->progress.Cancel(); }
};

struct Background::Wait {
  std::shared_ptr<Run> run;
  QFutureWatcher<void> watcher;
};

Background::Background(QObject* parent) : QObject(parent) {}
Background::~Background() = default;

bool Background::Await(const Awaited& computations) {
  if (computations == awaited_ && (IsWaiting() || isCancelled_ || computations.empty())) return false;
  awaited_ = computations;
  isCancelled_ = false;
  Start();
  return true;
}

void Background::Start() {
  // What goes on is taken over before it is let go.
  const std::vector<std::unique_ptr<Wait>> before = std::move(runs_);
  runs_.clear();
  for (const auto& computation : awaited_) {
    Wait& wait = *runs_.emplace_back(std::make_unique<Wait>());
    wait.run = Run::Of(computation);
    connect(
        &wait.watcher, &QFutureWatcher<void>::finished, this,
        [this] {
          // Also what is waited for no more may tell of its end.
          if (runs_.empty()) return;
          if (!std::ranges::all_of(runs_, [](const auto& each) { return each->run->future.isFinished(); })) return;
          isCancelled_ = std::ranges::any_of(awaited_, [](const auto& each) { return !each->IsDone(); });
          runs_.clear();
          emit Ended();
        },
        Qt::QueuedConnection);
    wait.watcher.setFuture(wait.run->future);
  }
}

bool Background::IsDoneWithin(int milliseconds) const {
  QDeadlineTimer deadline(milliseconds);
  for (const auto& wait : runs_) {
    QSemaphore& ended = wait->run->shared->ended;
    if (!ended.tryAcquire(1, static_cast<int>(deadline.remainingTime()))) return false;
    ended.release();
  }
  return std::ranges::all_of(awaited_, [](const auto& each) { return each->IsDone(); });
}

double Background::Done() const {
  double done = 0;
  for (const auto& computation : awaited_) done += computation->IsDone() ? 1 : 0;
  for (const auto& wait : runs_)
    if (!wait->run->shared->computation->IsDone()) done += wait->run->shared->progress.Done();
  return awaited_.empty() ? 1 : done / static_cast<double>(awaited_.size());
}

QString Background::Title() const {
  const auto open = std::ranges::find_if(awaited_, [](const auto& each) { return !each->IsDone(); });
  return open == awaited_.end() ? QString() : Translated((*open)->Title());
}

void Background::Cancel() {
  isCancelled_ = true;
  for (const auto& wait : runs_) wait->run->shared->progress.Cancel();
  runs_.clear();
}

void Background::StartAgain() {
  isCancelled_ = false;
  Start();
}

}  // namespace tervane
