// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "document/setup_lock.h"

#include <atomic>
#include <chrono>
#include <filesystem>
#include <thread>
#include <utility>

#include <fmt/format.h>

#include "platform/files.h"
#include "platform/os.h"
#include "platform/paths.h"
#include "platform/text.h"

namespace tervane {

namespace {

/// More than any lock holds.
constexpr std::size_t kMostBytes = 4096;
constexpr std::string_view kOneChange = "one change";
/// How long one change of another process is waited for.
constexpr std::chrono::seconds kPatience{10};

std::string LockFileOf(const std::string& setup) {
  const std::string real = RealPath(setup);
  std::string name(FileNameOf(real));
  // A name has at most 255 bytes.
  constexpr std::size_t kLongest = 180;
  if (name.size() > kLongest) name = fmt::format("{:016x}", HashOf(name));
  return fmt::format("{}/.{}.lock", FolderOf(real) == "/" ? "" : FolderOf(real), name);
}

struct Lock {
  enum class State { Missing, Stale, Held };
  State state = State::Missing;
  LockHolder holder;
  std::string content;
  os::File file;
  os::File::Status status;
};

/// Locks come into being with their content, so that one without any belongs to nobody: a power cut left it. What holds
/// something else was written by something that may be alive, and may not even be a lock: it counts as held, and the
/// user is told its name.
Lock ReadLock(const std::string& path) {
  Lock lock;
  lock.holder.file = path;
  std::error_code error;
  lock.file = os::File::OpenForReading(path, error, os::File::Links::Refuse);
  if (error == std::errc::no_such_file_or_directory || error == std::errc::not_a_directory) return lock;
  lock.state = Lock::State::Held;
  if (!error) lock.status = lock.file.GetStatus(error);
  if (!error && lock.status.isRegular) {
    lock.content.resize(kMostBytes + 1);
    std::size_t size = 0;
    while (!error && size <= kMostBytes) {
      const std::size_t read = lock.file.Read(&lock.content[size], lock.content.size() - size, error);
      if (read == 0) break;
      size += read;
    }
    lock.content.resize(size);
  }
  if (error) {
    lock.holder.whyUnknown = error.message();
  } else if (lock.status.isRegular && lock.content.empty()) {
    lock.state = Lock::State::Stale;
  } else if (lock.content.size() <= kMostBytes && !FirstInvalidUtf8(lock.content)) {
    lock.holder.process = ProcessOfLines(lock.content);
    lock.holder.isForOneChange = NamedValue(lock.content, "for") == kOneChange;
    if (lock.holder.process && !lock.holder.process->MayRun()) lock.state = Lock::State::Stale;
  }
  if (lock.state == Lock::State::Held && !lock.holder.process && lock.holder.whyUnknown.empty())
    lock.holder.whyUnknown = "it does not tell whose it is";
  return lock;
}

/// Removes a stale lock. Two processes that find the same one are kept apart by locking the file itself: the second
/// finds that the name leads to another file by now.
void RemoveStale(Lock lock) {
  std::error_code error;
  if (!lock.file.TryLock(error) && !error) return;
  const Lock now = ReadLock(lock.holder.file);
  const bool isSame = now.status.volume == lock.status.volume && now.status.number == lock.status.number;
  if (now.state == Lock::State::Stale && isSame && now.content == lock.content)
    std::filesystem::remove(NativePath(lock.holder.file), error);
}

}  // namespace

std::string HolderSentence(const LockHolder& holder) {
  if (!holder.process)
    return fmt::format("somebody may have it open: {} cannot be understood ({}); remove that file when nobody has",
                       holder.file, holder.whyUnknown);
  const RunningProcess& process = *holder.process;
  if (process.IsThis()) return "it is open in another window already";
  std::string sentence =
      fmt::format("{} {} on host {} (process {})", process.user.empty() ? "somebody" : process.user,
                  holder.isForOneChange ? "is changing it" : "has it open", process.host, process.process);
  if (!process.IsOnThisHost()) sentence += fmt::format("; remove {} when that process runs no more", holder.file);
  return sentence;
}

std::optional<LockHolder> HolderOf(const std::string& setup) {
  Lock lock = ReadLock(LockFileOf(setup));
  if (lock.state != Lock::State::Held) return std::nullopt;
  return std::move(lock.holder);
}

SetupLock& SetupLock::operator=(SetupLock&& other) noexcept {
  std::swap(file_, other.file_);
  std::swap(content_, other.content_);
  std::swap(reason_, other.reason_);
  return *this;
}

SetupLock::Outcome SetupLock::Take(const std::string& setup, Purpose purpose) {
  Release();
  reason_.clear();
  static std::atomic<unsigned> counter{0};
  const std::string path = LockFileOf(setup);
  // The number tells one lock of this process from another.
  std::string content = ProcessLines(RunningProcess::This()) + NamedLine("session", std::to_string(++counter));
  if (purpose == Purpose::OneChange) content += NamedLine("for", std::string(kOneChange));
  const auto end = std::chrono::steady_clock::now() + kPatience;
  // Again and again only while others take over the same stale lock at this moment.
  constexpr int kAttempts = 200;
  std::error_code error;
  for (int i = 0; i < kAttempts; ++i) {
    Lock lock = ReadLock(path);
    while (lock.state == Lock::State::Held && lock.holder.isForOneChange && std::chrono::steady_clock::now() < end) {
      std::this_thread::sleep_for(std::chrono::milliseconds(2));
      lock = ReadLock(path);
      i = 0;
    }
    if (lock.state == Lock::State::Held) {
      reason_ = HolderSentence(lock.holder);
      return Outcome::Held;
    }
    if (lock.state == Lock::State::Stale) {
      if (i > 0) std::this_thread::sleep_for(std::chrono::milliseconds(1));
      RemoveStale(std::move(lock));
    }
    CreateWholeFile(path, content, error);
    if (!error) {
      if (ReadLock(path).content != content) continue;
      file_ = path;
      content_ = content;
      return Outcome::Taken;
    }
    if (error != std::errc::file_exists) break;
  }
  reason_ = error == std::errc::file_exists
                ? fmt::format("{} is left of an editor that runs no more, and cannot be removed", path)
                : fmt::format("its lock {} cannot be written: {}", path, error.message());
  return Outcome::CannotWrite;
}

void SetupLock::Release() {
  if (file_.empty()) return;
  // Where the user removed the lock by hand, another may stand there by now.
  std::error_code ignored;
  if (ReadLock(file_).content == content_) std::filesystem::remove(NativePath(file_), ignored);
  file_.clear();
}

}  // namespace tervane
