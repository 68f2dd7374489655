// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>

#include "core/kvf.h"

namespace tervane {

struct CloseKvf {
  void operator()(KvfFile* file) const { kvfClose(&file); }
};
/// A parameter file that is closed when it is no longer needed.
using OpenKvf = std::unique_ptr<KvfFile, CloseKvf>;

}  // namespace tervane
