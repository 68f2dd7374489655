// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later

// Why something is as it is, in the words of the pages: why a node takes part or not, why a control is grey, and what
// would bring what is missing.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "core/document.h"
#include "forms/page_form.h"

namespace tervane {

/// One reason, with the control that decides it.
struct Reason {
  bool holds = false;
  std::string text;            ///< "Overland Flow (OL) is on", "or Numeric Engine must be Tervane".
  std::string page;            ///< Title of the page that has the control; empty for what no control decides.
  std::uint64_t serial = 0;    ///< Of the node of that page; 0 where there is none.
  std::string path, key;       ///< Of the value that decides; may be empty.
  bool isAlternative = false;  ///< This would do instead of the reasons in front of it.
};

struct Explanation {
  std::string subject;  ///< "Air Temperature".
  bool holds = false;
  std::vector<Reason> reasons;

  /// "Air Temperature takes part:" or "... takes no part:", and a line for each reason. `verb` is "takes part".
  std::string Text(std::string_view yes, std::string_view no) const;
};

/// Why a node takes part: by its own rule and those of the nodes above it. Of one that takes no part, what is missing.
Explanation WhyTakesPart(CYbSEDocument& document, CYbSEKvfBase& node);
/// Why a control of a page can be changed or not.
Explanation WhyEnabled(CYbSEDocument& document, PageForm& form, const Control& control);

/// The nodes with pages that take no part though those above them do, with what would bring them. In the order of the
/// tree.
struct MissingNode {
  std::string path;
  std::uint64_t serial = 0;
  Explanation why;
};
std::vector<MissingNode> WhatIsMissing(CYbSEDocument& document);

}  // namespace tervane
