// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "core/path.h"
#include "document/flow_model_document.h"

namespace tervane {

/// A section of a setup's text that was edited.
struct EditedSection {
  std::vector<PathStep> steps;  ///< To the section, below the target; none for the target.
  std::string_view before;      ///< The text of the whole section as it was shown, from its name to its brace.
  std::string_view after;       ///< As it was edited.
  /// The number of its first line, and of the lines of `after` that were edited; problems count as these do.
  int firstLine = 1, firstEdited = 1, lastEdited = 1;
};

struct TextProblem {
  int line;
  std::string text;
};

struct TakenText {
  /// What has taken something, to be told to the document; null where nothing was to be taken.
  CYbSEKvfBase* node = nullptr;
  bool isParsed = false;  ///< False: the only problem is the first fault of its form, and nothing was taken.
  /// Edited lines that the setup does not hold as they stand, with the reason, in the order of the text.
  std::vector<TextProblem> problems;
};

/// Where a text is no section, as of `TakeText`; none where it is one.
std::vector<TextProblem> FaultsOf(const EditedSection& edited);

/// Gives the setup what was edited in its text. Keys and items that the edit has not changed stay as they are, also
/// where they are others by now. A key that was taken out gets its default; a section that every setup has stays.
TakenText TakeText(CFlowModelDoc& document, const EditedSection& edited);

/// The steps to the section in the file in which a node stands: what has no section of its own works in that of a node
/// above it.
std::vector<PathStep> SectionOf(const CYbSEKvfBase& node);
/// The node that owns the section of the file, or null.
CYbSEKvfBase* OwnerOfSection(CYbSEKvfBase& root, const std::vector<PathStep>& steps);

}  // namespace tervane
