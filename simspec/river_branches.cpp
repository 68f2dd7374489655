// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#include "simspec/river_branches.h"

#include <algorithm>
#include <cmath>

#include <fmt/format.h>

#include "platform/paths.h"
#include "platform/text.h"
#include "simspec/model_components.h"
#include "simspec/river_files.h"

namespace tervane {

FileName RiverFileOfSetup(const CYbSEKvfBase& node) {
  if (EngineOf(node) != kEngineTervane) {
    const auto* network = node.Important(kModflowRiver);
    return network ? network->GetFilename() : FileName();
  }
  const auto* river = node.Important(kRiver);
  return river ? river->GetFilename() : FileName();
}

RiverBranches RiverBranches::Of(const CYbSEKvfBase& node) {
  return RiverBranches(ReadRiverOnce(RiverFileOfSetup(node).Absolute()));
}

std::vector<std::string> RiverBranches::Names() const {
  std::vector<std::string> names;
  for (const RiverBranch& branch : reading_->network.branches) names.push_back(branch.name);
  return names;
}

std::string RiverBranches::WhyNoBranch(const std::string& name) const {
  if (!AreKnown() || reading_->Find(name)) return {};
  std::string text =
      name.empty() ? "no branch of the river network is named"
                   : fmt::format("the river network {} has no branch {}", FileNameOf(reading_->network.Path()), name);
  // The name as it is meant: in another case, or with a slip of the finger.
  const RiverBranch* meant = nullptr;
  std::size_t least = 3;
  for (const RiverBranch& branch : reading_->network.branches) {
    const std::size_t distance = EditDistance(LowerCase(branch.name), LowerCase(name));
    if (distance < std::min(least, branch.name.size())) least = distance, meant = &branch;
  }
  return meant ? fmt::format("{}; {} is one", text, meant->name) : text;
}

std::string RiverBranches::WhyOutside(const std::string& name, double chainage) const {
  const RiverBranch* branch = reading_->Find(name);
  const auto range = branch ? branch->Chainages() : std::nullopt;
  if (!range) return {};
  // A setup holds chainages in single precision.
  const double slack = 1e-6 * std::max(std::abs(range->first), std::abs(range->second));
  if (chainage >= range->first - slack && chainage <= range->second + slack) return {};
  return fmt::format("the chainage {} m lies outside the branch {}, which goes from {} to {} m",
                     ShortestNumber(chainage), name, ShortestNumber(range->first), ShortestNumber(range->second));
}

}  // namespace tervane
