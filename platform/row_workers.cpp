// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "platform/row_workers.h"

#include <algorithm>
#include <exception>
#include <mutex>
#include <system_error>
#include <thread>
#include <vector>

namespace tervane {

bool ForRows(int rows, int rowsAtOnce, int threads, const std::function<void(double)>& progress,
             const std::atomic<bool>* cancel, const std::function<void(int begin, int end)>& work) {
  const int blocks = rows / rowsAtOnce + (rows % rowsAtOnce != 0);
  std::atomic<int> next{0}, done{0};
  std::atomic<bool> isCancelled{false}, isBroken{false};
  std::mutex mutex;
  std::exception_ptr thrown;
  const auto run = [&](bool isCaller) {
    try {
      for (int block = next++; block < blocks && !isBroken; block = next++) {
        if (cancel && cancel->load(std::memory_order_relaxed)) isCancelled = true;
        if (isCancelled) return;
        const int begin = block * rowsAtOnce;
        work(begin, begin + std::min(rowsAtOnce, rows - begin));
        ++done;
        if (isCaller && progress) progress(static_cast<double>(done) / blocks);
      }
    } catch (...) {
      const std::lock_guard lock(mutex);
      if (!thrown) thrown = std::current_exception();
      isBroken = true;
    }
  };
  std::vector<std::jthread> others;
  try {
    for (int i = 1; i < std::min(threads, blocks); ++i) others.emplace_back(run, false);
  } catch (const std::system_error&) {
    // The system gives no more threads: those that run do the work.
  }
  run(true);
  others.clear();
  if (thrown) std::rethrow_exception(thrown);
  if (!isCancelled && progress) progress(1);
  return !isCancelled;
}

}  // namespace tervane
