// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Work on the rows of a grid, shared among threads.
#pragma once

#include <atomic>
#include <functional>

namespace tervane {

/// Calls `work(begin, end)` for blocks of `rowsAtOnce` rows until all of [0, rows) are done, in as many threads as told
/// (the calling one is one of them). Progress is told by the calling thread. False when `cancel` was set meanwhile.
/// What `work` throws is thrown here once all threads have ended.
bool ForRows(int rows, int rowsAtOnce, int threads, const std::function<void(double)>& progress,
             const std::atomic<bool>* cancel, const std::function<void(int begin, int end)>& work);

}  // namespace tervane
