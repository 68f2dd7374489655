// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "core/node.h"
#include "libraries/river_network.h"

namespace tervane {

/// The branches of a setup's river network, for what names branches and chainages. A setup without a network that can
/// be read has none, and then nothing is odd about any name.
class RiverBranches {
 public:
  /// Those of the setup in which the node stands; asked anew for each use.
  static RiverBranches Of(const CYbSEKvfBase& node);

  bool AreKnown() const { return reading_->HasBranches(); }
  const RiverReading& Reading() const { return *reading_; }
  /// In the order of the network.
  std::vector<std::string> Names() const;

  // What is odd, as a sentence for a warning; empty when nothing is.

  /// There is no branch of that name.
  std::string WhyNoBranch(const std::string& name) const;
  /// The chainage, in metres, lies outside the branch.
  std::string WhyOutside(const std::string& name, double chainage) const;

 private:
  explicit RiverBranches(std::shared_ptr<const RiverReading> reading) : reading_(std::move(reading)) {}

  std::shared_ptr<const RiverReading> reading_;
};

}  // namespace tervane
