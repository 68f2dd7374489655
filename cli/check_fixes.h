// Copyright (C) 2026 the Tervane developers
// SPDX-License-Identifier: GPL-3.0-or-later
#pragma once

#include <string>

#include "cli/parts/outcome.h"
#include "document/flow_model_document.h"

namespace tervane {

struct FixOptions {
  std::string only;    ///< The name of a kind; empty for all.
  std::string folder;  ///< Below which moved files are searched; empty for the setup's.
  bool isDry = false;  ///< Nothing is written.
  bool force = false;
  bool each = false;  ///< A line for each value, also where many change alike.
};

/// Fixes what can be fixed, tells it (as JSON into `json` where it is given, else as text) and saves the setup under
/// that path where something changed. The document holds the changes also where nothing is written. False when that
/// failed, with the reason on the error stream.
bool FixAndSave(CFlowModelDoc& document, const std::string& file, const FixOptions& options, std::string* json,
                Streams streams);

extern const char* const kFixesFooter;

}  // namespace tervane
