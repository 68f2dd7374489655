// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// How far a long computation is, and whether it is to stop, shared by the code that waits for it and the
// code that does it, which may be in different threads.
#pragma once

#include <atomic>

namespace tervane {

/// What a computation that was stopped gives as its error, behind the name of what it worked on.
inline constexpr const char* kCancelled = "cancelled";

/// Thrown inside a computation that is to stop. No public operation lets it out.
struct Cancelled {};

/// The side of the code that waits.
class Progress {
 public:
  /// From 0 to 1; it never falls.
  double Done() const { return done_.load(std::memory_order_relaxed); }
  /// The computation ends soon and gives an error, unless it is done already.
  void Cancel() { isCancelled_.store(true, std::memory_order_relaxed); }
  bool IsCancelled() const { return isCancelled_.load(std::memory_order_relaxed); }

 private:
  friend class ProgressPart;

  void Report(double done) {
    double before = done_.load(std::memory_order_relaxed);
    while (before < done && !done_.compare_exchange_weak(before, done, std::memory_order_relaxed)) {
    }
  }

  std::atomic<double> done_{0};
  std::atomic<bool> isCancelled_{false};
};

/// The side of the code that does the work: a part of the whole. Without a whole, reports go nowhere.
class ProgressPart {
 public:
  ProgressPart() = default;
  ProgressPart(Progress& whole) : whole_(&whole) {}  // NOLINT(google-explicit-constructor): the whole is a part too

  /// A part of this part; both ends from 0 to 1.
  ProgressPart Part(double from, double to) const {
    ProgressPart part = *this;
    part.from_ = from_ + from * length_;
    part.length_ = (to - from) * length_;
    return part;
  }
  /// How far this part is, from 0 to 1.
  void Report(double done) const {
    if (whole_) whole_->Report(from_ + done * length_);
  }
  bool IsCancelled() const { return whole_ && whole_->IsCancelled(); }
  void ThrowIfCancelled() const {
    if (IsCancelled()) throw Cancelled();
  }

 private:
  Progress* whole_ = nullptr;
  double from_ = 0, length_ = 1;
};

}  // namespace tervane
