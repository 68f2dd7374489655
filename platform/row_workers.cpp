// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/row_workers.h"

#include <algorithm>
#include <atomic>
#include <exception>
#include <mutex>
#include <system_error>
#include <thread>
#include <vector>

namespace tervane {

void ForRows(int rows, int rowsAtOnce, int threads, ProgressPart progress,
             const std::function<void(int begin, int end)>& work) {
  const int blocks = rows / rowsAtOnce + (rows % rowsAtOnce != 0);
  std::atomic<int> next{0}, done{0};
  std::atomic<bool> isBroken{false};
  std::mutex mutex;
  std::exception_ptr thrown;
  const auto run = [&] {
    try {
      for (int block = next++; block < blocks && !isBroken; block = next++) {
        if (progress.IsCancelled()) return;
        const int begin = block * rowsAtOnce;
        work(begin, begin + std::min(rowsAtOnce, rows - begin));
        progress.Report(static_cast<double>(++done) / blocks);
      }
    } catch (...) {
      const std::lock_guard lock(mutex);
      if (!thrown) thrown = std::current_exception();
      isBroken = true;
    }
  };
  std::vector<std::jthread> others;
  try {
    for (int i = 1; i < std::min(threads, blocks); ++i) others.emplace_back(run);
  } catch (const std::system_error&) {
    // The system gives no more threads: those that run do the work.
  }
  run();
  others.clear();
  if (thrown) std::rethrow_exception(thrown);
  // Also what `work` left off because of it is no result.
  progress.ThrowIfCancelled();
}

}  // namespace tervane
