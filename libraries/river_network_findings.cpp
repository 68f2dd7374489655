// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// What is wrong with a network.
#include <algorithm>
#include <unordered_map>
#include <unordered_set>

#include <fmt/format.h>

#include "libraries/river_network.h"
#include "platform/text.h"

namespace tervane {

namespace {

class Inspector {
 public:
  Inspector(const CYbSimpleRiverData& network, std::vector<RiverFinding>& findings)
      : network_(network), findings_(findings) {
    for (const RiverBranch& branch : network.branches) byName_.try_emplace(branch.name, &branch);
  }

  void Inspect() {
    for (const RiverBranch& branch : network_.branches) {
      InspectName(branch);
      InspectPoints(branch);
      if (branch.direction != RiverBranch::kToHigherChainages && branch.direction != RiverBranch::kToLowerChainages)
        Add(Severity::Error, branch, fmt::format("direction {}: 0 or 1 was expected", branch.direction));
      InspectJunction(branch, branch.upstream, "upstream");
      InspectJunction(branch, branch.downstream, "downstream");
    }
    for (const RiverPoint& point : network_.loosePoints)
      findings_.push_back({Severity::Warning, point.line, fmt::format("point {} belongs to no branch", point.number)});
    InspectLoops();
  }

 private:
  void Add(Severity severity, const RiverBranch& branch, const std::string& text, int line = 0) {
    findings_.push_back({severity, line > 0 ? line : branch.line, fmt::format("branch {}: {}", branch.name, text)});
  }

  void InspectName(const RiverBranch& branch) {
    if (branch.name.empty()) {
      findings_.push_back({Severity::Error, branch.line, "a branch without a name"});
      return;
    }
    if (const RiverBranch* first = byName_.at(branch.name); first != &branch)
      Add(Severity::Error, branch, fmt::format("another branch has that name, at line {}", first->line));
  }

  void InspectPoints(const RiverBranch& branch) {
    if (branch.points.size() < 2) {
      Add(Severity::Error, branch,
          fmt::format("it has {}, two or more were expected", branch.points.empty() ? "no points" : "one point"));
      return;
    }
    std::unordered_set<int> numbers;
    bool isRisingKnown = false, isLoopKnown = false;
    for (std::size_t i = 0; i < branch.points.size(); ++i) {
      const RiverPoint& point = branch.points[i];
      if (!numbers.insert(point.number).second && !isLoopKnown) {
        isLoopKnown = true;
        Add(Severity::Error, branch, fmt::format("it comes to point {} twice", point.number));
      }
      if (i == 0 || isRisingKnown || point.chainage > branch.points[i - 1].chainage) continue;
      // One place says that the whole is to be looked at.
      isRisingKnown = true;
      Add(Severity::Error, branch,
          fmt::format("the chainage {} from {} to {} at point {}",
                      point.chainage == branch.points[i - 1].chainage ? "does not rise" : "falls",
                      ShortestNumber(branch.points[i - 1].chainage), ShortestNumber(point.chainage), point.number),
          point.line);
    }
    if (!isLoopKnown && branch.points.front().place == branch.points.back().place)
      Add(Severity::Warning, branch, "it ends where it begins");
  }

  void InspectJunction(const RiverBranch& branch, const RiverJunction& junction, std::string_view end) {
    if (junction.IsNone()) return;
    const auto found = byName_.find(junction.branch);
    if (found == byName_.end()) {
      Add(Severity::Error, branch, fmt::format("its {} end is joined to {}, which is no branch", end, junction.branch));
    } else if (found->second == &branch) {
      Add(Severity::Error, branch, fmt::format("its {} end is joined to itself", end));
    } else if (const auto range = found->second->Chainages();
               range && (junction.chainage < range->first || junction.chainage > range->second)) {
      Add(Severity::Warning, branch,
          fmt::format("its {} end is joined to {} at {}, which goes from {} to {}", end, junction.branch,
                      ShortestNumber(junction.chainage), ShortestNumber(range->first), ShortestNumber(range->second)));
    }
  }

  /// Branches whose water comes back to where it was.
  void InspectLoops() {
    enum Mark : char { kNew, kOnWay, kDone };
    std::unordered_map<const RiverBranch*, Mark> marks;
    for (const RiverBranch& start : network_.branches) {
      std::vector<const RiverBranch*> way;
      const RiverBranch* branch = &start;
      while (branch && marks[branch] == kNew) {
        marks[branch] = kOnWay;
        way.push_back(branch);
        const auto next = byName_.find(branch->downstream.branch);
        branch =
            branch->downstream.IsNone() || next == byName_.end() || next->second == branch ? nullptr : next->second;
      }
      if (branch && marks[branch] == kOnWay) {
        std::string names;
        for (auto i = std::ranges::find(way, branch); i != way.end(); ++i) names += (*i)->name + ", ";
        Add(Severity::Warning, *branch, fmt::format("its water comes back to it: {}{}", names, branch->name));
      }
      for (const RiverBranch* passed : way) marks[passed] = kDone;
    }
  }

  const CYbSimpleRiverData& network_;
  std::vector<RiverFinding>& findings_;
  std::unordered_map<std::string_view, const RiverBranch*> byName_;
};

}  // namespace

std::vector<RiverFinding> CYbSimpleRiverData::Findings() const {
  std::vector<RiverFinding> findings = refused_;
  Inspector(*this, findings).Inspect();
  std::ranges::stable_sort(findings, {}, &RiverFinding::line);
  return findings;
}

}  // namespace tervane
