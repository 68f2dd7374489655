// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "access/setup_keys.h"
#include "core/fixes.h"
#include "fixes/key_fixes.h"
#include "pages/findings.h"
#include "platform/computation.h"
#include "platform/file_search.h"

namespace tervane {

/// The kinds of fixes for a setup, their plans, and the doing.
class QuickFixes {
 public:
  /// The document outlives this object, and its plans are used before it is changed by others.
  explicit QuickFixes(CFlowModelDoc& document);
  ~QuickFixes();
  QuickFixes(const QuickFixes&) = delete;
  QuickFixes& operator=(const QuickFixes&) = delete;

  /// In the order in which they are tried: a file that is found is looked into by those behind.
  const std::vector<FixKind>& Kinds() const { return kinds_; }
  /// The name of the kind that takes what a node offers.
  static constexpr std::string_view kOffer = kSoleOffer;
  /// Null for a name that none has.
  const FixKind* KindOf(std::string_view name) const;
  /// Whether files are searched before such a plan is made.
  static bool NeedsFiles(const FixKind& kind);

  /// The kinds for a finding at its node.
  std::vector<const FixKind*> KindsFor(CYbSEKvfBase& node, const SetupFinding& finding) const;
  /// The findings among these that a kind is for; nodes that are gone have none.
  std::vector<FoundAt> FoundFor(const FixKind& kind, const std::vector<SetupFinding>& findings) const;
  /// All of the setup that a kind is for: what is found, and for moved files also nodes that miss a file of which
  /// nothing is found.
  std::vector<FoundAt> AllFoundFor(const FixKind& kind) const;

  /// The search for the files that findings miss. It asks no node.
  static std::shared_ptr<Computed<FilesByName>> SearchFor(const std::vector<FoundAt>& found, const std::string& folder);

  /// What is to be done before a plan can be, in any thread.
  static std::vector<std::shared_ptr<Computation>> PreparationsOf(const FixPlan& plan);
  /// Does what was planned and is prepared. What could not be done is left as it was, and added to what the plan
  /// leaves.
  static void Apply(FixPlan& plan);

 private:
  SetupKeys keys_;
  CFlowModelDoc& document_;
  std::vector<FixKind> kinds_;
};

/// What was done, or would be, by one kind.
struct FixRound {
  const FixKind* kind;
  FixPlan plan;
};

/// Tries the kinds one behind the other (all, or the one of that name), validates behind each that changed something,
/// and tells what was done. Files are searched at and below `folder`. The document is changed; it is not saved. A trial
/// makes no files: what would need one is told and not done. The error tells why nothing could be searched; what needs
/// no search is done all the same.
std::vector<FixRound> FixAll(CFlowModelDoc& document, QuickFixes& fixes, const FixKind* only, const std::string& folder,
                             bool isTrial, std::string& error);

}  // namespace tervane
