// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What code that does not know the classes of rivers asks of them.
#pragma once

#include "core/file_name.h"
#include "core/node.h"

namespace tervane {

/// The node "River", with the own engine.
class RiverFiles {
 public:
  virtual ~RiverFiles() = default;
  /// The river simulation file.
  virtual const FileName& GetFilename() const = 0;
  /// The same for water quality.
  virtual const FileName& GetFilenameWQ() const = 0;
};
inline constexpr ImportantName<RiverFiles> kRiver{"River"};

/// The node "RiverMF", with a Modflow engine.
class RiverNetworkFile {
 public:
  virtual ~RiverNetworkFile() = default;
  /// The river network file.
  virtual const FileName& GetFilename() const = 0;
};
inline constexpr ImportantName<RiverNetworkFile> kModflowRiver{"RiverMF"};

/// A list of map layers, of which some draw the setup's rivers.
class RiverFollowers {
 public:
  virtual ~RiverFollowers() = default;
  /// What draws the setup's rivers goes on drawing those that are the setup's now.
  virtual void StayWithRivers() = 0;
};
inline constexpr ImportantName<RiverFollowers> kRiversInForeground{"FOREGROUND_OVERLAY_DATA"};
inline constexpr ImportantName<RiverFollowers> kRiversInBackground{"BACKGROUND_OVERLAY_DATA"};

/// The file that leads to the network of the node's setup: the river network file with a Modflow engine, else the river
/// simulation file.
FileName RiverFileOfSetup(const CYbSEKvfBase& node);

}  // namespace tervane
