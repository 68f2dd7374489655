// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "core/document.h"
#include "core/mends.h"
#include "execution/engine_line.h"

namespace tervane {

/// Something wrong in a setup, of any origin: met while the file was read, found by validation, or never read.
struct SetupFinding {
  enum class Kind { Error, Warning, Note, Unread };

  Kind kind;
  std::string path;
  std::string text;
  std::string key;           ///< May be empty.
  std::string detail;        ///< The reason behind a fixed text; may be empty.
  int line = 0;              ///< Of the file that was read; 0 when it speaks of no line.
  std::uint64_t serial = 0;  ///< Of the node at the path, or of the nearest above it; 0 when there is none.
  KvfUnread::Kind unread{};  ///< What was not read.
  bool isPast = false;       ///< An engine said it of the setup as it was.
};

/// "error", "warning", "note", "unread".
std::string_view KindName(SetupFinding::Kind kind);

/// False for a note of a node, which only tells.
inline bool NeedsAttention(const SetupFinding& finding) {
  return finding.kind != SetupFinding::Kind::Note || finding.line > 0;
}

/// What reading the file met, then the findings of the latest validation of all nodes, then what was not read.
std::vector<SetupFinding> FindingsOf(const CYbSEDocument& document);

/// What an engine said of the setup. Where the setup has no such place, the text stands alone.
SetupFinding FindingOf(const CYbSEDocument& document, const EngineMessage& message);
/// Adds what an engine said; what it said of a key that has a finding joins that one. `whyPast` is empty, or tells why
/// all that may hold no more.
void AddEngineMessages(const CYbSEDocument& document, const std::vector<EngineMessage>& messages,
                       const std::string& whyPast, std::vector<SetupFinding>& findings);

/// What the node of a finding offers to mend it. Most offer nothing.
std::vector<Mend> MendsOf(const CYbSEKvfBase& node, const SetupFinding& finding);

/// Findings of one cause: the same is said of the same key at several like places.
struct FindingGroup {
  std::vector<SetupFinding> findings;  ///< At least one.

  const SetupFinding& First() const { return findings.front(); }
  bool IsOne() const { return findings.size() == 1; }
  /// What is found, with the reason and, of several, with their number: "... does not cover the simulation: 50 places".
  std::string Text() const;
  /// The path and key; of several the path that they have in common.
  std::string Place() const;
};
/// In the order of the first of each.
std::vector<FindingGroup> GroupFindings(std::vector<SetupFinding> findings);

}  // namespace tervane
