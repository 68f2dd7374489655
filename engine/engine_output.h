// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <ostream>
#include <string>
#include <string_view>
#include <vector>

#include "modelcells/work_log.h"

namespace tervane {

/// What an engine prints, a line at a time, each passed on at once. Whoever started it makes findings of its errors and
/// warnings, and moves a bar by its progress.
class EngineOutput : public WorkLog {
 public:
  explicit EngineOutput(std::ostream& out) : out_(out) {}

  void Line(std::string_view text);
  void Progress(int percent, std::string_view doing) override;
  void Error(std::string_view place, std::string_view text) override;
  void Warning(std::string_view place, std::string_view text) override;

  int Errors() const { return errors_; }
  /// All warnings, as they were printed.
  const std::vector<std::string>& Warnings() const { return warnings_; }

 private:
  std::ostream& out_;
  int errors_ = 0;
  std::vector<std::string> warnings_;
};

}  // namespace tervane
