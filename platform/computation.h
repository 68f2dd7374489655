// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Results that take time to make, and that somebody may wait for while others work on.
#pragma once

#include <atomic>
#include <functional>
#include <memory>
#include <mutex>
#include <new>
#include <string>

#include "platform/files.h"
#include "platform/progress.h"

namespace tervane {

/// Something that is made once, in whatever thread runs it; it holds copies of all that it needs.
class Computation {
 public:
  explicit Computation(std::string title) : title_(std::move(title)) {}
  virtual ~Computation() = default;
  Computation(const Computation&) = delete;
  Computation& operator=(const Computation&) = delete;

  /// What is done, to be shown to the waiting user: "Reading dem.nds2".
  const std::string& Title() const { return title_; }
  /// True when the result is there, or why there is none; both then stay as they are.
  bool IsDone() const { return isDone_.load(std::memory_order_acquire); }
  /// Makes the result unless it is there; a caller that comes while another thread makes it waits. False when it was
  /// cancelled: then it is as if it had never run.
  bool Run(ProgressPart progress = {}) {
    const std::lock_guard lock(mutex_);
    if (!IsDone() && Make(progress)) isDone_.store(true, std::memory_order_release);
    return IsDone();
  }

 protected:
  /// False when it was cancelled.
  virtual bool Make(ProgressPart progress) = 0;

 private:
  std::string title_;
  std::mutex mutex_;
  std::atomic<bool> isDone_{false};
};

/// The making of data.
template <class Data>
class Computed : public Computation {
 public:
  /// Fills the data or tells why not.
  using Maker = std::function<FileResult(Data& data, ProgressPart progress)>;

  Computed(std::string title, Maker maker) : Computation(std::move(title)), maker_(std::move(maker)) {}

  // To be asked once it is done.

  /// Null when the data could not be made.
  const std::shared_ptr<const Data>& Result() const { return data_; }
  /// Why not; empty when they are there.
  const std::string& Problem() const { return problem_; }

 protected:
  bool Make(ProgressPart progress) override {
    try {
      auto data = std::make_shared<Data>();
      FileResult result = maker_(*data, progress);
      if (!result.Ok() && progress.IsCancelled()) return false;
      problem_ = std::move(result.error);
      if (problem_.empty()) data_ = std::move(data);
    } catch (const std::bad_alloc&) {
      problem_ = "there is no memory for it";
    }
    return true;
  }

 private:
  Maker maker_;
  std::shared_ptr<const Data> data_;
  std::string problem_;
};

}  // namespace tervane
