// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string_view>

namespace tervane {

/// Who hears of a long work on a setup while it is done.
class WorkLog {
 public:
  virtual ~WorkLog() = default;

  /// `percent` of the whole work.
  virtual void Progress(int percent, std::string_view doing) = 0;
  /// `place` is the path of a node, with ":Key" behind it where one key is meant; empty for the setup as a whole.
  virtual void Error(std::string_view place, std::string_view text) = 0;
  virtual void Warning(std::string_view place, std::string_view text) = 0;
  /// True when the work is no longer wanted; it then ends soon, and leaves what stood before.
  virtual bool IsCancelled() const { return false; }
};

}  // namespace tervane
