// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/file_name.h"

namespace tervane {

/// What code that does not know the class of the node "River" asks of it.
class RiverFiles {
 public:
  virtual ~RiverFiles() = default;
  /// The river simulation file.
  virtual const FileName& GetFilename() const = 0;
};
inline constexpr ImportantName<RiverFiles> kRiver{"River"};

}  // namespace tervane
