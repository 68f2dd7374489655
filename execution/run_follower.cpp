// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "execution/run_follower.h"

#include <chrono>
#include <utility>

#include "platform/files.h"

namespace tervane {

namespace {

using namespace std::chrono_literals;

constexpr auto kInterval = 50ms;
constexpr std::size_t kBlock = 256u << 10;
/// How much is read before the state is looked at again.
constexpr std::size_t kMostAtOnce = 16u << 20;

/// The file's time is the one that the file system keeps, which may count in steps of 2 s.
bool IsOfRun(const std::string& path, const RunState& state) {
  const FileStamp stamp = StampOf(path);
  if (!stamp.exists) return false;
  const auto time = std::chrono::file_clock::to_sys(stamp.time).time_since_epoch();
  return std::chrono::duration_cast<std::chrono::milliseconds>(time).count() >= state.begun - 2000;
}

}  // namespace

RunFollower::RunFollower(SetupRun run) : run_(std::move(run)), log_(run_.Files().log) {
  news_.state = run_.State();
  thread_ = std::thread([this] { Follow(); });
}

RunFollower::~RunFollower() {
  {
    const std::lock_guard lock(mutex_);
    isLeft_ = true;
  }
  changed_.notify_all();
  thread_.join();
}

RunNews RunFollower::Take() {
  const std::lock_guard lock(mutex_);
  RunNews news;
  news.state = news_.state;
  news.outcome = news_.outcome;
  std::swap(news, news_);
  isEndTaken_ = news.outcome != RunOutcome::GoingOn;
  if (isEndTaken_) changed_.notify_all();
  return news;
}

void RunFollower::Stop() {
  {
    const std::lock_guard lock(mutex_);
    ++stops_;
  }
  changed_.notify_all();
}

void RunFollower::WaitForFirstLook(std::chrono::milliseconds most) {
  std::unique_lock lock(mutex_);
  changed_.wait_for(lock, most, [this] { return hasLooked_; });
}

void RunFollower::Follow() {
  std::unique_lock lock(mutex_);
  while (!isLeft_) {
    const int stops = std::exchange(stops_, 0);
    lock.unlock();
    std::string trouble;
    for (int i = 0; i < stops; ++i) trouble = run_.Stop();
    const bool isOver = !run_.Look();
    const bool hasMore = ReadLog() | ReadExtraLog();
    lock.lock();
    news_.state = run_.State();
    if (!trouble.empty()) news_.trouble = trouble;
    hasLooked_ = true;
    changed_.notify_all();
    if (isOver && !hasMore) break;
    if (!hasMore) changed_.wait_for(lock, kInterval, [this] { return isLeft_ || stops_ > 0; });
  }
  news_.log.Add(Understand(lines_.Rest()));
  news_.extraLog.Add(extraLines_.Rest());
  news_.outcome = run_.Outcome();
  changed_.wait(lock, [this] { return isLeft_ || isEndTaken_; });
  if (!isEndTaken_) return;
  lock.unlock();
  run_.MarkReported();
}

bool RunFollower::ReadLog() {
  // Before the engine was started, the log is that of an earlier run.
  if (!run_.State().program) return false;
  for (std::size_t done = 0; done < kMostAtOnce;) {
    const std::string bytes = log_.Read(kBlock);
    if (bytes.empty()) return false;
    done += bytes.size();
    LogPiece lines = lines_.Cut(bytes);
    const std::lock_guard lock(mutex_);
    if (isLeft_) return false;
    news_.log.Add(Understand(std::move(lines)));
  }
  return true;
}

bool RunFollower::ReadExtraLog() {
  const RunState& state = run_.State();
  if (!extraLog_ && !state.extraLog.empty() && IsOfRun(state.extraLog, state)) extraLog_.emplace(state.extraLog);
  if (!extraLog_) return false;
  for (std::size_t done = 0; done < kMostAtOnce;) {
    const std::string bytes = extraLog_->Read(kBlock);
    if (bytes.empty()) return false;
    done += bytes.size();
    LogPiece lines = extraLines_.Cut(bytes);
    const std::lock_guard lock(mutex_);
    if (isLeft_) return false;
    news_.extraLog.Add(std::move(lines));
  }
  return true;
}

LogPiece RunFollower::Understand(LogPiece lines) {
  std::vector<bool> isProgress(lines.Count());
  bool hasProgress = false;
  for (std::size_t i = 0; i < lines.Count(); ++i) {
    const std::string_view line = lines.Line(i);
    if (std::optional<EngineProgress> progress = EngineProgressOf(line)) {
      news_.progress = std::move(progress);
      isProgress[i] = hasProgress = true;
    } else if (messages_ < kMostMessages) {
      if (std::optional<EngineMessage> message = EngineMessageOf(line)) {
        ++messages_;
        news_.messages.push_back(std::move(*message));
      }
    }
  }
  if (!hasProgress) return lines;
  LogPiece others;
  for (std::size_t i = 0; i < lines.Count(); ++i) {
    if (isProgress[i]) continue;
    others.Append(lines.Line(i));
    others.EndLine();
  }
  return others;
}

}  // namespace tervane
