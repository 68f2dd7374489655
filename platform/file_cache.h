// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What was read from files, so that asking after every change of a setup reads each file once.
#pragma once

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <functional>
#include <list>
#include <memory>
#include <mutex>
#include <string>
#include <unordered_map>
#include <vector>

#include "platform/files.h"

namespace tervane {

/// A file, or the files of one shape, as they are now: where two of these are equal, nothing was changed between.
using FileStamps = std::vector<FileStamp>;

/// The stamps of one file. Neither size nor time tell of a right to read that was given or taken, so that this is
/// asked.
inline FileStamps StampsOf(const std::string& path) {
  FileStamp mayBeRead;
  mayBeRead.exists = WhyNotReadable(path).empty();
  return {StampOf(path), mayBeRead};
}

/// Answers about files, kept while size and time of the files stay the same. Any thread may ask; the least
/// recently used answer is dropped first. An answer lives as long as anybody holds it.
template <class Answer>
class FileCache {
 public:
  explicit FileCache(std::size_t most) : most_(most) {}

  /// The answer of `read`, which is called only when it is not at hand. `question` names what is asked of that path;
  /// the stamps are taken before the reading, so that a change meanwhile is noticed the next time.
  std::shared_ptr<const Answer> Get(const std::string& path, const std::string& question, const FileStamps& stamps,
                                    const std::function<Answer()>& read) {
    const std::string key = path + '\0' + question;
    {
      const std::lock_guard lock(mutex_);
      if (const auto found = places_.find(key); found != places_.end() && found->second->stamps == stamps) {
        entries_.splice(entries_.begin(), entries_, found->second);
        return entries_.front().answer;
      }
    }
    // Asked before the reading; a file that was written just now may be written again within one tick of its clock.
    const bool mayBeKept = std::ranges::all_of(stamps, IsSettled);
    // Without the lock: callers that ask about another file do not wait.
    auto answer = std::make_shared<const Answer>(read());
    if (!mayBeKept) return answer;
    const std::lock_guard lock(mutex_);
    if (const auto found = places_.find(key); found != places_.end()) entries_.erase(found->second);
    entries_.push_front({key, stamps, answer});
    places_[key] = entries_.begin();
    if (entries_.size() > most_) {
      places_.erase(entries_.back().key);
      entries_.pop_back();
    }
    return answer;
  }
  /// The same of a single file.
  std::shared_ptr<const Answer> Get(const std::string& path, const std::string& question,
                                    const std::function<Answer()>& read) {
    return Get(path, question, StampsOf(path), read);
  }

 private:
  static bool IsSettled(const FileStamp& stamp) {
    constexpr std::chrono::milliseconds kTick(100);
    const auto age = std::filesystem::file_time_type::clock::now() - stamp.time;
    return !stamp.exists || stamp.time == FileStamp().time || age > kTick || age < -kTick;
  }

  struct Entry {
    std::string key;
    FileStamps stamps;
    std::shared_ptr<const Answer> answer;
  };

  const std::size_t most_;
  std::mutex mutex_;
  std::list<Entry> entries_;  ///< The latest that was asked for in front.
  std::unordered_map<std::string, typename std::list<Entry>::iterator> places_;
};

/// How many facts of one kind are kept: more than a large setup names files.
inline constexpr std::size_t kMostFacts = 20'000;

}  // namespace tervane
