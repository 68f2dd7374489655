// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Work on the rows of a grid, shared among threads.
#pragma once

#include <functional>

#include "platform/progress.h"

namespace tervane {

/// Calls `work(begin, end)` for blocks of `rowsAtOnce` rows until all of [0, rows) are done, in as many threads as told
/// (the calling one is one of them). Throws `Cancelled` when it was to stop meanwhile, and what `work` throws, once all
/// threads have ended.
void ForRows(int rows, int rowsAtOnce, int threads, ProgressPart progress,
             const std::function<void(int begin, int end)>& work);

}  // namespace tervane
