// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include "core/file_name.h"

namespace tervane {

/// What the node "River" is asked for by who does not know rivers.
class RiverFiles {
 public:
  virtual ~RiverFiles() = default;
  /// The river simulation file.
  virtual const FileName& GetFilename() const = 0;
};
inline constexpr ImportantName<RiverFiles> kRiver{"River"};

}  // namespace tervane
