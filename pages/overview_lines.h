// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <optional>
#include <string>
#include <vector>

#include "core/document.h"
#include "forms/page_form.h"

namespace tervane {

/// The values of a setup as its pages show them, in base units: for each page that takes part a line for each value,
/// "Initial time step: 6 hours".
std::vector<OverviewLine> OverviewInWords(CYbSEDocument& document);

/// What a control says to people who read: "6 hours", "on", the text of a choice. Empty for no value; nothing for a
/// control that shows none.
std::optional<std::string> ValueInWords(const Control& control);

}  // namespace tervane
